#include "ResourcePoolManagerPool.h"

#include <algorithm>
#include <cstdint>
#include <string_view>
#include <utility>

#include "CmpiData.h"
#include "CmpiInstance.h"
#include "Exception.h"
#include "ListedProperties.h"
#include "NumberText.h"
#include "QyallocCmdCaller.h"
#include "ResourcePoolManagerRows.h"
#include "VirtualSystemRep.h"
#include "VirtualSystemVisitorReaders.h"

namespace {

constexpr int kNames = 0;
constexpr int kEverything = 1;

/// What pools carry in other modes; where the table has none, allocation capabilities.
enum Carried { CARRIED_ALLOCATION, CARRIED_SETTINGS, CARRIED_CONFIGURATION, CARRIED_SERVICE };

constexpr struct {
    int mode;
    Carried carried;
} kModes[] = {
    {VISITOR_TYPE_RASD_INIT, CARRIED_SETTINGS},
    {VISITOR_TYPE_RASD_INIT_NI, CARRIED_SETTINGS},
    {VISITOR_TYPE_CONF_CAP_INIT, CARRIED_CONFIGURATION},
    {VISITOR_TYPE_CONF_CAP_INIT_NI, CARRIED_CONFIGURATION},
    {VISITOR_TYPE_CONF_SERV_INIT, CARRIED_SERVICE},
    {VISITOR_TYPE_CONF_SERV_INIT_NI, CARRIED_SERVICE},
};

Carried carriedIn(int mode) {
    for (const auto& row : kModes) {
        if (row.mode == mode) {
            return row.carried;
        }
    }
    return CARRIED_ALLOCATION;
}

/// What stands around the pools of one kind.
struct Makers {
    std::unique_ptr<zemPoolCapability> (*dedicated)();
    std::unique_ptr<zemPoolCapability> (*shared)();
    std::unique_ptr<zemResourceAllocationCapabilities> (*allocation)();
    std::unique_ptr<zemResourcePoolConfigurationCapabilities> (*configuration)();
    std::unique_ptr<zemResourcePoolConfigurationService> (*service)();
};

template <class Base, class Made>
std::unique_ptr<Base> make() {
    return std::make_unique<Made>();
}

template <const zemRASDKind& kind, zemPoolSharing ofPrimordial>
constexpr Makers makersOf() {
    return {
        make<zemPoolCapability, zemPoolCapabilitiesOf<kind, ofPrimordial>>,
        make<zemPoolCapability, zemPoolCapabilitiesOf<kind, SHARING_SHARED>>,
        make<zemResourceAllocationCapabilities, zemAllocationCapabilitiesOf<kind>>,
        make<zemResourcePoolConfigurationCapabilities, zemPoolConfigurationCapabilitiesOf<kind>>,
        make<zemResourcePoolConfigurationService, zemPoolConfigurationServiceOf<kind>>};
}

const Makers& makersFor(const zemRASDKind& kind) {
    static constexpr struct {
        const zemRASDKind& kind;
        Makers makers;
    } kMakers[] = {
        {zemRASDKinds::processor, makersOf<zemRASDKinds::processor, SHARING_DEDICATED>()},
        {zemRASDKinds::memory, makersOf<zemRASDKinds::memory, SHARING_DEDICATED>()},
        {zemRASDKinds::ethernet, makersOf<zemRASDKinds::ethernet, SHARING_SHARED>()},
        {zemRASDKinds::serial, makersOf<zemRASDKinds::serial, SHARING_SHARED>()},
        {zemRASDKinds::scsi, makersOf<zemRASDKinds::scsi, SHARING_SHARED>()},
        {zemRASDKinds::ioSlot, makersOf<zemRASDKinds::ioSlot, SHARING_SHARED>()},
    };
    const auto* const found =
        std::find_if(std::begin(kMakers), std::end(kMakers) - 1,
                     [&](const auto& row) { return row.kind.resourceType == kind.resourceType; });
    return found->makers;
}

/// Calls @p take for each of the host's partitions.
template <class Take>
void eachPartition(zemCEC& cec, Take take) {
    zemDynamicArray<zemLPAR>& lpars = cec.getLPARs();
    for (int i = 0; i < lpars.size(); ++i) {
        if (zemLPAR* const lpar = lpars.getElementAt(i)) {
            take(*lpar);
        }
    }
}

/// A limit of the host; -1: the host has not been read.
int mostOf(const zemString& limit) { return limit.isEmpty() ? -1 : zemNumberOf(limit); }

// --- Processors

float unitsOf(const zemString& text) {
    constexpr double kMost = 1e12;  // of which a host's partitions can be summed
    return static_cast<float>(std::clamp(zemRealOf(std::string_view(text)), -kMost, kMost));
}

/// Hundredths in single precision: what is lost there is lost to all users of the appliance alike.
float hundredthsOf(float units) {
    constexpr float kHundredths = 100.0F;
    return units * kHundredths;
}

std::int64_t roundedHundredths(float units) {
    constexpr double kHalf = 0.5;
    return static_cast<std::int64_t>(static_cast<double>(hundredthsOf(units)) + kHalf);
}

CMPIUint64 natural(std::int64_t value) {
    return static_cast<CMPIUint64>(std::max<std::int64_t>(value, 0));
}

CMPIUint64 capacityOf(float units) {
    return natural(static_cast<std::int64_t>(hundredthsOf(units)));
}

float heldUnits(const zemPartitionProcessorResource& record) {
    return std::max(unitsOf(record.getCurrProcUnits()), unitsOf(record.getPendProcUnits()));
}

/// What a shared pool can hold. The first pool, which takes what no other has, tells no limit.
float unitsOfPool(const zemProcessorPoolResource& pool, const zemCEC& cec) {
    const float units =
        std::max(unitsOf(pool.getMaxPoolProcUnits()), unitsOf(pool.getMaxPoolCapacity()));
    return units > 0 ? units : unitsOf(cec.getPoolProcessor().getConfigurablePoolProcUnits());
}

// --- Memory

CMPIUint64 kilobytesOf(std::int64_t megabytes) {
    constexpr unsigned kToKilobytes = 10;
    return natural(megabytes) << kToKilobytes;
}

std::int64_t megabytesOf(const zemString& text) { return zemNumberOf(text); }

std::int64_t heldMegabytes(const zemPartitionMemoryResource& record) {
    return std::max(megabytesOf(record.getCurrMem()), megabytesOf(record.getPendMem()));
}

// --- Slots and adapters

template <const zemRASDKind& kind>
int heldPieces(zemLPAR& lpar) {
    switch (kind.resourceType) {
        case zemRASDKinds::ioSlot.resourceType:
            return lpar.getLparIOSlots().size();
        case zemRASDKinds::ethernet.resourceType:
            return lpar.getLparEthernetAdapters().size();
        case zemRASDKinds::serial.resourceType:
            return lpar.getLparSerialAdapters().size();
        default:
            return lpar.getLparSCSIAdapters().size();
    }
}

// --- All

zemString primordialText(const zemPoolCommData& data, const zemString& mtms) {
    return zemString("Host Primordial ") + zemPoolRowOf(data.m_ResourceType).noun +
           " Pool of system " + mtms;
}

zemString shareText(const char* what, const zemString& poolID, const zemString& mtms) {
    return what + poolID + " of system " + mtms;
}

template <class Data>
void addTexts(const zemListedProperties& listed, const Data& data) {
    listed.add("Caption", data.m_Caption);
    listed.add("Description", data.m_Description);
}

}  // namespace

zemResourcePool::zemResourcePool(zemPoolCommData* data, const zemRASDKind& kind)
    : m_Data(data), m_kind(kind) {}

zemResourcePool::~zemResourcePool() = default;

int zemResourcePool::getIndexFromClassName(const zemString& className, bool isAll) {
    return isAll ? zemFindPoolRow(className, POOL_CLASS_POOL, POOL_CLASS_SETTING)
                 : zemFindPoolRow(className, POOL_CLASS_DEVICE, POOL_CLASS_DEVICE);
}

bool zemResourcePool::isQuantified(int mode) {
    return mode == kEverything || mode == VISITOR_TYPE_RASD_INIT;
}

int zemResourcePool::initialize(zemCEC* cec, const zemString& userName, int mode) {
    drop();
    const int pools = getPoolNum(cec, userName);
    if (pools == -1) {
        return -1;
    }
    const initializeLevel level = isQuantified(mode) ? LEVEL_EI : LEVEL_NI;
    initializePrimordial(cec, level);
    if (pools > 1) {
        initializeAllShare(cec, level);
    }
    if (mode != kNames && mode != kEverything) {
        carry(*cec, userName, mode);
    }
    return 0;
}

int zemResourcePool::initializeAllShare(zemCEC* cec, initializeLevel level) {
    for (const zemHardwareResource* const share : shares(*cec)) {
        initializeShare(cec, share, level);
    }
    return 0;
}

int zemResourcePool::initializeShare(zemCEC*, const zemHardwareResource* resource,
                                     initializeLevel) {
    return resource == nullptr ? -1 : 0;
}

zemPoolCapability* zemResourcePool::getCapability() { return m_Capability; }

zemResourceAllocationCapabilities* zemResourcePool::getAlloCapShared() {
    return m_AllocationCapabilitiesShared.get();
}

zemResourceAllocationCapabilities* zemResourcePool::getAlloCapDedicated() {
    return m_AllocationCapabilitiesDedicated.get();
}

zemResourcePoolConfigurationCapabilities* zemResourcePool::getPoolConfCap() {
    return m_PoolConfigurationCapabilities.get();
}

zemResourcePoolConfigurationService* zemResourcePool::getPoolConfService() {
    return m_PoolConfigurationService.get();
}

zemDynamicArray<zemPoolCapability>& zemResourcePool::getPoolCapability() {
    return m_PoolCapabilities;
}

bool zemResourcePool::isPrimordial() const { return m_Data->m_PoolID == zemPrimordialPoolID; }

zemString zemResourcePool::formInstanceID(const char* prefix, const zemString& mtms) const {
    return prefix + zemString(m_kind.resourceType) + "-" + m_Data->m_PoolID + "*" + mtms;
}

void zemResourcePool::tellKey(const zemString& poolID, const zemString& mtms,
                              initializeLevel level) {
    m_Data->m_ResourceType = static_cast<CMPIUint16>(m_kind.resourceType);
    m_Data->m_PoolID = poolID;
    m_Data->m_InstanceID = formInstanceID("ORX:", mtms);
    if (level == LEVEL_EI) {
        m_Data->m_Primordial = isPrimordial();
        m_Data->m_AllocationUnits = m_kind.units;
    }
}

std::vector<const zemHardwareResource*> zemResourcePool::shares(zemCEC&) const { return {}; }

void zemResourcePool::drop() {
    m_Pools.clear();
    m_Capability = nullptr;
    m_AllocationCapabilitiesShared.reset();
    m_AllocationCapabilitiesDedicated.reset();
    m_PoolConfigurationCapabilities.reset();
    m_PoolConfigurationService.reset();
    m_PoolCapabilities.clear();
}

void zemResourcePool::carry(zemCEC& cec, const zemString& userName, int mode) {
    const Makers& makers = makersFor(m_kind);
    const Carried carried = carriedIn(mode);
    if (carried == CARRIED_SETTINGS) {
        auto capability = isPrimordial() ? makers.dedicated() : makers.shared();
        if (capability->initialize(this, &cec, userName, mode) == -1) {
            capability.reset();
        }
        m_Capability = capability.get();
        m_PoolCapabilities.addElement(std::move(capability));
    } else if (!isPrimordial()) {
        m_AllocationCapabilitiesShared = makers.allocation();
        m_AllocationCapabilitiesShared->initialize(this, &cec, userName);
    } else if (carried == CARRIED_CONFIGURATION) {
        m_PoolConfigurationCapabilities = makers.configuration();
        m_PoolConfigurationCapabilities->initialize(this, &cec, userName, mode);
    } else if (carried == CARRIED_SERVICE) {
        m_PoolConfigurationService = makers.service();
        m_PoolConfigurationService->initialize(this, &cec, userName, mode);
    } else {
        m_AllocationCapabilitiesDedicated = makers.allocation();
        m_AllocationCapabilitiesDedicated->initialize(this, &cec, userName);
    }
    for (int i = 0; i < m_Pools.size(); ++i) {
        m_Pools.getElementAt(i)->carry(cec, userName, mode);
    }
}

zemProcessorPool::zemProcessorPool()
    : zemResourcePool(&m_ProcPoolData, zemRASDKinds::processor), infoRASD(m_ownInfo) {}

zemProcessorPool::zemProcessorPool(zemResourceRASettingDataResource& info)
    : zemResourcePool(&m_ProcPoolData, zemRASDKinds::processor), infoRASD(info) {}

zemProcessorPool::~zemProcessorPool() = default;

int zemProcessorPool::getPoolNum(zemCEC* cec, const zemString&) {
    const int most = mostOf(cec->getProcessor().getMaxSharedProcPools());
    return most < 2 ? most : 1 + cec->getProcessorPool().size();
}

std::vector<const zemHardwareResource*> zemProcessorPool::shares(zemCEC& cec) const {
    std::vector<const zemHardwareResource*> all;
    all.reserve(static_cast<std::size_t>(cec.getProcessorPool().size()));
    for (int i = 0; i < cec.getProcessorPool().size(); ++i) {
        all.push_back(cec.getProcessorPool().getElementAt(i));
    }
    return all;
}

int zemProcessorPool::initializePrimordial(zemCEC* cec, initializeLevel level) {
    const zemString& mtms = cec->getMTMS();
    tellKey(zemPrimordialPoolID, mtms, level);
    m_isActiveCounted = false;
    infoRASD = zemResourceRASettingDataResource();
    if (level == LEVEL_NI) {
        return 0;
    }
    const zemSystemProcessorResource& host = cec->getProcessor();
    const float configurable = unitsOf(host.getConfigurableSysProcUnits());
    float inactive = 0;
    eachPartition(*cec, [&](const zemLPAR& lpar) {
        inactive += lpar.isActivated() ? 0 : heldUnits(lpar.getLparProcessor());
    });
    zemProcPoolData& data = m_ProcPoolData;
    zemSetTexts(data, primordialText(data, mtms));
    data.m_ProcCompatModes = cec->getCapability().m_lparProcCompatModes;
    data.m_Capacity = capacityOf(configurable);
    data.m_Reserved = natural(roundedHundredths(configurable) -
                              roundedHundredths(unitsOf(host.getPendAvailSysProcUnits())) -
                              roundedHundredths(inactive));
    data.m_InstalledCapacity = capacityOf(unitsOf(host.getInstalledSysProcUnits()));
    data.m_InstalledCapacityType = 1;
    return 0;
}

int zemProcessorPool::initializeShare(zemCEC* cec, const zemHardwareResource* resource,
                                      initializeLevel level) {
    if (resource == nullptr) {
        return -1;
    }
    const auto& record = static_cast<const zemProcessorPoolResource&>(*resource);
    const zemString& poolID = record.getSharedProcPoolId();
    const zemString& mtms = cec->getMTMS();
    std::unique_ptr<zemProcessorPool> pool(new zemProcessorPool(infoRASD));
    pool->tellKey(poolID, mtms, level);
    if (level == LEVEL_EI) {
        countActive(*cec);
        zemProcPoolData& data = pool->m_ProcPoolData;
        zemSetTexts(data, shareText("Processor Pool ", poolID, mtms));
        data.m_ProcCompatModes = cec->getCapability().m_lparProcCompatModes;
        data.m_Capacity = capacityOf(unitsOfPool(record, *cec));
        const auto active = m_activeLpar.find(static_cast<const char*>(poolID));
        data.m_Reserved =
            natural(active == m_activeLpar.end() ? 0 : roundedHundredths(active->second));
    }
    m_Pools.addElement(std::move(pool));
    return 0;
}

zemString zemProcessorPool::poolIDOf(const zemPartitionProcessorResource& record) {
    static constexpr const char* kAbsent[] = {"null", "none",    "none,",
                                              "255",  "zemNULL", "m_lparID"};
    const zemString& told = record.getPendSharedProcPoolId();
    const zemString id = told.isEmpty() ? record.getCurrSharedProcPoolId() : told;
    const bool isAbsent =
        std::any_of(std::begin(kAbsent), std::end(kAbsent),
                    [&](const char* word) { return zemString::equalsIgnoreCase(id, word); });
    return isAbsent ? zemString() : id;
}

/// One walk over the partitions for all pools.
void zemProcessorPool::countActive(zemCEC& cec) {
    if (std::exchange(m_isActiveCounted, true)) {
        return;
    }
    m_activeLpar.clear();
    for (const zemHardwareResource* const share : shares(cec)) {
        m_activeLpar.emplace(
            static_cast<const zemProcessorPoolResource*>(share)->getSharedProcPoolId(), 0.0F);
    }
    eachPartition(cec, [&](const zemLPAR& lpar) {
        const zemPartitionProcessorResource& record = lpar.getLparProcessor();
        const zemString poolID = poolIDOf(record);
        if (poolID.isEmpty()) {
            return;
        }
        const auto pool = m_activeLpar.find(static_cast<const char*>(poolID));
        if (pool == m_activeLpar.end()) {
            cec.getProcessorPool(poolID);  // which throws in its own words
        } else if (lpar.isActivated()) {
            pool->second += heldUnits(record);
        }
    });
}

void zemProcessorPool::addSpecificProperties(CmpiInstance& instance, const char** properties,
                                             const char*) {
    const zemProcPoolData& data = m_ProcPoolData;
    const zemListedProperties listed(instance, properties);
    listed.add("Reserved", CmpiData(data.m_Reserved));
    if (data.m_InstalledCapacityType != 0) {
        listed.add("InstalledCapacity", CmpiData(data.m_InstalledCapacity));
    }
    addTexts(listed, data);
}

void zemProcessorPool::initRASDInfo(const zemString& userName, const zemString& mtms) {
    using Processors = zemQyallocCmdCaller::ProcessorResourceAttribute;
    using Sys = Processors::SysLevelAttribute;
    if (infoRASD.isInitialized) {
        return;
    }
    try {
        zemQyallocCmdCaller caller(userName, "");
        int least[] = {Sys::ATTR_MIN_PROC_UNITS_PER_VIRTUAL_PROC, Sys::ATTR_END};
        const zemRecordSetsType host = caller.getSystemProcessorResources(least, mtms, 0, nullptr);
        zemString units;
        if (host.size() > 0) {
            host.getElementAt(0)->lookup(Sys::ATTR_MIN_PROC_UNITS_PER_VIRTUAL_PROC, units);
        }
        infoRASD.min_proc_units_per_virtual_proc = unitsOf(units);
        infoRASD.m_results_processor_lpar = zemRecordsOf(
            [&] { return caller.getPartitionProcessorResources(nullptr, mtms, nullptr); });
        infoRASD.m_results_processor_pool = zemRecordsOf(
            [&] { return caller.getSharedProcessorPoolResources(nullptr, mtms, nullptr); });
        infoRASD.isInitialized = true;
    } catch (zemException& failure) {
        failure.setThrowingClass("zemProcessorPool");
        failure.setThrowingMethod("initRASDInfo");
        throw;
    }
}

zemMemoryPool::zemMemoryPool() : zemResourcePool(&m_MemoryPoolData, zemRASDKinds::memory) {}

zemMemoryPool::~zemMemoryPool() = default;

int zemMemoryPool::getPoolNum(zemCEC* cec, const zemString&) {
    const int most = mostOf(cec->getMemoy().getMaxMemPools());
    return most < 1 ? most : 1 + static_cast<int>(shares(*cec).size());
}

std::vector<const zemHardwareResource*> zemMemoryPool::shares(zemCEC& cec) const {
    return cec.getMemoyPool().isSupport()
               ? std::vector<const zemHardwareResource*>{&cec.getMemoyPool()}
               : std::vector<const zemHardwareResource*>{};
}

int zemMemoryPool::initializePrimordial(zemCEC* cec, initializeLevel level) {
    const zemString& mtms = cec->getMTMS();
    tellKey(zemPrimordialPoolID, mtms, level);
    if (level == LEVEL_NI) {
        return 0;
    }
    const zemSystemMemoryResource& host = cec->getMemoy();
    const std::int64_t configurable = megabytesOf(host.getConfigurableSysMem());
    std::int64_t inactive = 0;
    eachPartition(*cec, [&](const zemLPAR& lpar) {
        inactive += lpar.isActivated() ? 0 : heldMegabytes(lpar.getLparMemory());
    });
    zemMemoryPoolData& data = m_MemoryPoolData;
    zemSetTexts(data, primordialText(data, mtms));
    data.m_ElementName = data.m_Caption;
    data.m_Capacity = kilobytesOf(configurable);
    data.m_Reserved = kilobytesOf(configurable - megabytesOf(host.getPendAvailSysMem()) - inactive);
    data.m_InstalledCapacity = kilobytesOf(megabytesOf(host.getInstalledSysMem()));
    m_isReserved = m_isInstallCapacity = true;
    return 0;
}

int zemMemoryPool::initializeShare(zemCEC* cec, const zemHardwareResource* resource,
                                   initializeLevel level) {
    if (resource == nullptr) {
        return -1;
    }
    const auto& record = static_cast<const zemMemoryPoolResource&>(*resource);
    constexpr char kOnlyPool[] = "0";
    const zemString& mtms = cec->getMTMS();
    auto pool = std::make_unique<zemMemoryPool>();
    pool->tellKey(kOnlyPool, mtms, level);
    if (level == LEVEL_EI) {
        pool->m_MemoryPoolResourceData = record;
        zemMemoryPoolData& data = pool->m_MemoryPoolData;
        zemSetTexts(data, shareText("Shared memory pool ", kOnlyPool, mtms));
        data.m_ElementName = data.m_Caption;
        const std::int64_t size = megabytesOf(record.getPendPoolMem());
        data.m_Capacity = kilobytesOf(size);
        data.m_Reserved = kilobytesOf(size - megabytesOf(record.getPendAvailPoolMem()));
        data.m_InstalledCapacity = kilobytesOf(megabytesOf(record.getCurrPoolMem()));
        pool->m_isReserved = pool->m_isInstallCapacity = true;
    }
    m_Pools.addElement(std::move(pool));
    return 0;
}

void zemMemoryPool::addSpecificProperties(CmpiInstance& instance, const char** properties,
                                          const char*) {
    const zemListedProperties listed(instance, properties);
    if (m_isReserved) {
        listed.add("Reserved", CmpiData(m_MemoryPoolData.m_Reserved));
    }
    if (m_isInstallCapacity) {
        listed.add("InstalledCapacity", CmpiData(m_MemoryPoolData.m_InstalledCapacity));
    }
    addTexts(listed, m_MemoryPoolData);
}

template <const zemRASDKind& kind>
zemPlainPool<kind>::zemPlainPool() : zemResourcePool(&m_PoolData, kind) {}

template <const zemRASDKind& kind>
zemPlainPool<kind>::~zemPlainPool() = default;

template <const zemRASDKind& kind>
int zemPlainPool<kind>::getPoolNum(zemCEC*, const zemString&) {
    return 1;
}

template <const zemRASDKind& kind>
int zemPlainPool<kind>::initializePrimordial(zemCEC* cec, initializeLevel level) {
    const zemString& mtms = cec->getMTMS();
    tellKey(zemPrimordialPoolID, mtms, level);
    if (level == LEVEL_NI) {
        return 0;
    }
    std::int64_t held = 0;
    eachPartition(*cec, [&](zemLPAR& lpar) { held += heldPieces<kind>(lpar); });
    const bool isCounted = kind.resourceType == zemRASDKinds::ioSlot.resourceType;
    zemSetTexts(m_PoolData, primordialText(m_PoolData, mtms));
    m_PoolData.m_Capacity =
        natural(isCounted ? std::max<std::int64_t>(cec->getIOSlotCount(), held) : held);
    m_PoolData.m_Reserved = natural(held);
    return 0;
}

template <const zemRASDKind& kind>
void zemPlainPool<kind>::addSpecificProperties(CmpiInstance& instance, const char** properties,
                                               const char*) {
    const zemListedProperties listed(instance, properties);
    listed.add("Reserved", CmpiData(m_PoolData.m_Reserved));
    addTexts(listed, m_PoolData);
}

template class zemPlainPool<zemRASDKinds::ioSlot>;
template class zemPlainPool<zemRASDKinds::ethernet>;
template class zemPlainPool<zemRASDKinds::serial>;
template class zemPlainPool<zemRASDKinds::scsi>;

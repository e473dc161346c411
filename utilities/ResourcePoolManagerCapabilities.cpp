#include "ResourcePoolManagerCapabilities.h"

#include <memory>

#include "ResourcePoolManagerPool.h"
#include "ResourcePoolManagerRows.h"
#include "VirtualSystemRep.h"

namespace {

/// What @p prefix and the kind's own word begin.
zemString textOf(const zemRASDKind& kind, const char* rest) {
    return zemString(zemPoolRowOf(kind.resourceType).noun) + rest;
}

int fillAllocation(zemAllcationCapabilitiesCommData& data, const zemRASDKind& kind,
                   const zemResourcePool& pool, const zemCEC& cec, bool isShared) {
    constexpr CMPIUint16 kAllRequests = 3;
    constexpr CMPIUint16 kAnySharing = 3;
    const zemString& mtms = cec.getMTMS();
    data.m_ResourceType = static_cast<CMPIUint16>(kind.resourceType);
    data.m_RequestTypesSupported = kAllRequests;
    data.m_SharingMode = kAnySharing;
    data.m_InstanceID = pool.formInstanceID(isShared ? "ORX:Shared:" : "ORX:D:", mtms);
    zemString text = textOf(kind, " Pool Allocation Capabilities");
    if (kind.resourceType == zemRASDKinds::processor.resourceType) {
        text = "Allocation Capabilities for Processor Pool " + pool.getData()->m_PoolID +
               " of system " + mtms;
    } else if (kind.resourceType == zemRASDKinds::memory.resourceType) {
        text = (isShared ? "Shared " : "Dedicated ") + text;
    }
    zemSetTexts(data, text);
    data.m_ElementName = text;
    return 0;
}

template <const zemRASDKind& kind, zemPoolSharing sharing>
int fillGroup(zemPoolCapability& group, zemResourcePool* pool, zemCEC* cec,
              const zemString& userName, int mode) {
    std::unique_ptr<zemResourceRASettingData> made[] = {
        std::make_unique<zemRASettingDataOfPool<kind, sharing, ROLE_MIN>>(),
        std::make_unique<zemRASettingDataOfPool<kind, sharing, ROLE_MAX>>(),
        std::make_unique<zemRASettingDataOfPool<kind, sharing, ROLE_DEF>>(),
        std::make_unique<zemRASettingDataOfPool<kind, sharing, ROLE_INC>>()};
    auto* next = made;
    for (zemResourceRASettingData*& each : group.m_SettingData) {
        delete each;
        each = (next++)->release();
        if (each->initialize(pool, cec, userName, mode) == -1) {
            return -1;
        }
    }
    return 0;
}

}  // namespace

int zemResourceAllocationCapabilities::getIndexFromClassName(const zemString& className,
                                                             bool /*isAll*/) {
    return zemFindPoolRow(className, POOL_CLASS_ALLOCATION, POOL_CLASS_ALLOCATION);
}

int zemResourceAllocationCapabilities::initialize(zemResourcePool* pool, zemCEC* cec,
                                                  const zemString& userName) {
    return pool->isPrimordial() ? initializeDedicated(pool, cec, userName)
                                : initializeShare(pool, cec, userName);
}

void zemResourceAllocationCapabilities::addSpecificProperties(CmpiInstance&, const char**,
                                                              const char*) {}

zemResourceAllocationCapabilities::~zemResourceAllocationCapabilities() = default;

template <const zemRASDKind& kind>
zemAllocationCapabilitiesOf<kind>::zemAllocationCapabilitiesOf()
    : zemResourceAllocationCapabilities(&m_AllocationCapabilitiesData) {}

template <const zemRASDKind& kind>
int zemAllocationCapabilitiesOf<kind>::initializeShare(zemResourcePool* pool, zemCEC* cec,
                                                       const zemString&) {
    return fillAllocation(m_AllocationCapabilitiesData, kind, *pool, *cec, true);
}

template <const zemRASDKind& kind>
int zemAllocationCapabilitiesOf<kind>::initializeDedicated(zemResourcePool* pool, zemCEC* cec,
                                                           const zemString&) {
    return fillAllocation(m_AllocationCapabilitiesData, kind, *pool, *cec, false);
}

zemPoolCapability::zemPoolCapability() = default;

zemPoolCapability::~zemPoolCapability() {
    for (const zemResourceRASettingData* const each : m_SettingData) {
        delete each;
    }
}

template <const zemRASDKind& kind, zemPoolSharing sharing>
int zemPoolCapabilitiesOf<kind, sharing>::initialize(zemResourcePool* pool, zemCEC* cec,
                                                     const zemString& userName, int mode) {
    return fillGroup<kind, sharing>(*this, pool, cec, userName, mode);
}

template <const zemRASDKind& kind>
int zemPoolCapabilitiesByPool<kind>::initialize(zemResourcePool* pool, zemCEC* cec,
                                                const zemString& userName, int mode) {
    return pool->isPrimordial()
               ? fillGroup<kind, SHARING_DEDICATED>(*this, pool, cec, userName, mode)
               : fillGroup<kind, SHARING_SHARED>(*this, pool, cec, userName, mode);
}

void zemResourcePoolConfigurationCapabilities::addSpecificProperties(CmpiInstance&, const char**,
                                                                     const char*) {}

zemResourcePoolConfigurationCapabilities::~zemResourcePoolConfigurationCapabilities() = default;

template <const zemRASDKind& kind>
zemPoolConfigurationCapabilitiesOf<kind>::zemPoolConfigurationCapabilitiesOf()
    : zemResourcePoolConfigurationCapabilities(&m_PoolConfigurationCapabilitiesData) {}

template <const zemRASDKind& kind>
int zemPoolConfigurationCapabilitiesOf<kind>::initialize(zemResourcePool* pool, zemCEC* cec,
                                                         const zemString&, int) {
    zemPoolConfigurationCapabilitiesCommData& data = m_PoolConfigurationCapabilitiesData;
    data.m_InstanceID = pool->formInstanceID("ORX:", cec->getMTMS());
    zemSetTexts(data, textOf(kind, " Pool Configuration Capabilities"));
    data.m_ElementName = data.m_Caption;
    return 0;
}

void zemResourcePoolConfigurationService::addSpecificProperties(CmpiInstance&, const char**,
                                                                const char*) {}

zemResourcePoolConfigurationService::~zemResourcePoolConfigurationService() = default;

template <const zemRASDKind& kind>
zemPoolConfigurationServiceOf<kind>::zemPoolConfigurationServiceOf()
    : zemResourcePoolConfigurationService(&m_PoolConfigurationServiceData) {}

template <const zemRASDKind& kind>
int zemPoolConfigurationServiceOf<kind>::initialize(zemResourcePool*, zemCEC* cec, const zemString&,
                                                    int) {
    const zemPoolRow& row = zemPoolRowOf(kind.resourceType);
    const zemString& mtms = cec->getMTMS();
    zemPoolConfigurationServiceCommData& data = m_PoolConfigurationServiceData;
    data.m_Name = row.servicePrefix + mtms;
    data.m_CreationClassName = row.classes[POOL_CLASS_SERVICE];
    data.m_SystemName = mtms;
    data.m_SystemCreationClassName = "ORXC_CEC_CS";
    zemSetTexts(data, textOf(kind, " Pool Configuration Service of system ") + mtms);
    return 0;
}

#define ZEM_OF_KIND(KIND)                                                     \
    template class zemAllocationCapabilitiesOf<zemRASDKinds::KIND>;           \
    template class zemPoolCapabilitiesOf<zemRASDKinds::KIND, SHARING_SHARED>; \
    template class zemPoolConfigurationCapabilitiesOf<zemRASDKinds::KIND>;    \
    template class zemPoolConfigurationServiceOf<zemRASDKinds::KIND>;
ZEM_OF_KIND(processor)
ZEM_OF_KIND(memory)
ZEM_OF_KIND(ioSlot)
ZEM_OF_KIND(ethernet)
ZEM_OF_KIND(serial)
ZEM_OF_KIND(scsi)
#undef ZEM_OF_KIND
template class zemPoolCapabilitiesOf<zemRASDKinds::processor, SHARING_DEDICATED>;
template class zemPoolCapabilitiesOf<zemRASDKinds::memory, SHARING_DEDICATED>;
template class zemPoolCapabilitiesByPool<zemRASDKinds::processor>;
template class zemPoolCapabilitiesByPool<zemRASDKinds::memory>;

// What may be taken from a pool: the leaves' instance IDs and quantities.

#include <algorithm>
#include <iterator>
#include <string>
#include <string_view>
#include <unordered_map>

#include "ListedProperties.h"
#include "NumberText.h"
#include "ResourcePoolManagerPool.h"
#include "ResourcePoolManagerRows.h"
#include "ResourcePoolManagerSettingData.h"
#include "VirtualSystemRepSystem.h"
#include "VirtualSystemVisitorRules.h"

namespace {

using Kinds = zemRASDKinds;
using Members = zemProcessorPoolMembers;

constexpr int kAnyAdapter = 0;

/// A pool, and the host of which it is one.
struct Source {
    zemResourcePool& pool;
    zemCEC& cec;
};

CMPIUint64 unsignedOf(std::int64_t value) {
    return static_cast<CMPIUint64>(std::max<std::int64_t>(value, 0));
}

CMPIUint64 kilobytes(std::int64_t megabytes) {
    constexpr int kKilo = 10;
    return unsignedOf(megabytes) << kKilo;
}

// Processors.

/// Least share of a virtual processor, cut in single precision: other users of the appliance do.
CMPIUint64 share(const Source& source) {
    constexpr float kHundredths = 100;
    constexpr double kMost = 1e7;
    const double units =
        zemRealOf(std::string_view(source.cec.getProcessor().getMinProcUnitsPerVirtualProc()));
    return static_cast<CMPIUint64>(static_cast<float>(std::clamp(units, 0.0, kMost)) * kHundredths);
}

constexpr std::int64_t kMostUnits = 1'000'000'000'000;  ///< hundredths that can be summed

std::int64_t summableHundredths(const zemString& text) {
    return std::clamp<std::int64_t>(zemHundredths(text), 0, kMostUnits);
}

/// Counts what partitions hold in each pool, and under the primordial one what all do.
/// @throws zemInvalidParameterException a partition names a pool that @p cec does not have
void countMembers(zemCEC& cec, std::unordered_map<std::string, Members>& pools) {
    Members all;
    all.most = kMostUnits;
    for (int i = 0; i < cec.getProcessorPool().size(); ++i) {
        const zemProcessorPoolResource& pool = *cec.getProcessorPool().getElementAt(i);
        const zemString most = pool.getMaxPoolCapacity();
        // the first pool, which takes what no other has, tells none
        pools[std::string(pool.getSharedProcPoolId())].most =
            most == "null" ? kMostUnits : summableHundredths(most);
    }
    const bool hasPools = zemNumberOf(cec.getProcessor().getMaxSharedProcPools()) > 1;
    for (int i = 0; i < cec.getLPARs().size(); ++i) {
        const zemLPAR& lpar = *cec.getLPARs().getElementAt(i);
        const zemPartitionProcessorResource& held = lpar.getLparProcessor();
        const std::int64_t now = summableHundredths(held.getCurrProcUnits());
        const std::int64_t then = summableHundredths(held.getPendProcUnits());
        const auto add = [&](Members& members) {
            members.now += now;
            members.then += then;
            if (!lpar.isActivated()) {
                members.mostIdle = std::max({members.mostIdle, now, then});
            }
        };
        add(all);
        const zemString poolID = hasPools ? zemProcessorPool::poolIDOf(held) : zemString();
        if (poolID.isEmpty()) {
            continue;
        }
        const auto pool = pools.find(std::string(poolID));
        if (pool == pools.end()) {
            cec.getProcessorPool(poolID);  // throws in its own words
        } else {
            add(pool->second);
        }
    }
    pools[zemPrimordialPoolID] = all;
}

/// Hundredths that one partition may have: what is free, and what it holds if it does not run, in
/// the pool or outside of it. The appliance gives it nothing of what others hold.
CMPIUint64 freeUnits(const Source& source) {
    std::unordered_map<std::string, Members> own;
    auto* const processors = dynamic_cast<zemProcessorPool*>(&source.pool);
    auto& pools = processors == nullptr ? own : processors->infoRASD.m_members;
    if (pools.empty()) {
        countMembers(source.cec, pools);
    }
    const zemString id = source.pool.getData()->m_PoolID;
    const auto pool = pools.find(std::string(id));
    if (pool == pools.end()) {
        source.cec.getProcessorPool(id);  // throws in its own words
        return 0;
    }
    const Members& members = pool->second;
    const std::int64_t ofHost =
        summableHundredths(source.cec.getProcessor().getPendAvailSysProcUnits());
    const std::int64_t ofPool = members.most - std::max(members.now, members.then);
    return unsignedOf(std::max(std::min(ofHost, ofPool) + members.mostIdle,
                               std::min(ofHost + pools[zemPrimordialPoolID].mostIdle, ofPool)));
}

/// As many virtual processors as these units are shares of.
CMPIUint64 freeProcessors(const Source& source) {
    constexpr CMPIUint64 kWhole = 100;
    return freeUnits(source) / std::max<CMPIUint64>(share(source), 1) * kWhole;
}

// Memory: megabytes are told, and whole regions given.

std::int64_t region(zemCEC& cec) { return zemNumberOf(cec.getMemoy().getMemRegionSize()); }

CMPIUint64 wholeRegions(zemCEC& cec, std::int64_t megabytes) {
    return kilobytes(megabytes - megabytes % std::max<std::int64_t>(region(cec), 1));
}

template <int count>
CMPIUint64 regions(const Source& source) {
    return kilobytes(count * region(source.cec));
}

/// As with processors; a partition that has shared memory holds none of this.
CMPIUint64 freeMemory(const Source& source) {
    std::int64_t mostIdle = 0;
    for (int i = 0; i < source.cec.getLPARs().size(); ++i) {
        const zemLPAR& lpar = *source.cec.getLPARs().getElementAt(i);
        const zemPartitionMemoryResource& held = lpar.getLparMemory();
        if (!lpar.isActivated() && held.getMemMode() != "shared") {
            mostIdle = std::max<std::int64_t>(
                mostIdle, std::max(zemNumberOf(held.getCurrMem()), zemNumberOf(held.getPendMem())));
        }
    }
    return wholeRegions(source.cec,
                        zemNumberOf(source.cec.getMemoy().getPendAvailSysMem()) + mostIdle);
}

/// However much of it others use, a partition sees no more memory than the host has.
CMPIUint64 allMemory(const Source& source) {
    return wholeRegions(source.cec, zemNumberOf(source.cec.getMemoy().getConfigurableSysMem()));
}

CMPIUint64 slots(const Source& source) { return source.pool.getData()->m_Capacity; }

// The table.

using Amount = CMPIUint64 (*)(const Source& source);

template <CMPIUint64 amount>
CMPIUint64 just(const Source&) {
    return amount;
}

constexpr Amount none = nullptr;  ///< the leaf does not hold it

constexpr struct {
    const char* property;
    CMPIUint64 zemPoolRASettingDataCommData::*field;
} kColumns[] = {
    {"VirtualQuantity", &zemPoolRASettingDataCommData::m_VirtualQuantity},
    {"VirtualMinimum", &zemPoolRASettingDataCommData::m_VirtualMinimum},
    {"VirtualMaximum", &zemPoolRASettingDataCommData::m_VirtualMaximum},
    {"Minimum", &zemPoolRASettingDataCommData::m_Minimum},
    {"Reservation", &zemPoolRASettingDataCommData::m_Reservation},
    {"Limit", &zemPoolRASettingDataCommData::m_Limit},
};

struct Leaf {
    int resourceType;
    zemPoolSharing sharing;
    zemPoolRole role;
    Amount amounts[std::size(kColumns)];
};

// clang-format off
constexpr Leaf kLeaves[] = {
    //                                                         VirtualQuantity VirtualMinimum VirtualMaximum Minimum  Reservation Limit
    {Kinds::processor.resourceType, SHARING_DEDICATED, ROLE_MIN, {just<100>,      none,       none,       none,       just<100>,  none}},
    {Kinds::processor.resourceType, SHARING_DEDICATED, ROLE_MAX, {freeUnits,      none,       none,       none,       freeUnits,  none}},
    {Kinds::processor.resourceType, SHARING_DEDICATED, ROLE_DEF, {just<100>,      just<100>,  just<200>,  just<100>,  just<100>,  just<200>}},
    {Kinds::processor.resourceType, SHARING_DEDICATED, ROLE_INC, {just<100>,      none,       none,       none,       just<100>,  none}},
    {Kinds::processor.resourceType, SHARING_SHARED,    ROLE_MIN, {just<100>,      none,       none,       none,       share,      none}},
    {Kinds::processor.resourceType, SHARING_SHARED,    ROLE_MAX, {freeProcessors, none,       none,       none,       freeUnits,  none}},
    {Kinds::processor.resourceType, SHARING_SHARED,    ROLE_DEF, {just<100>,      just<100>,  just<100>,  share,      share,      share}},
    {Kinds::processor.resourceType, SHARING_SHARED,    ROLE_INC, {just<1>,        none,       none,       none,       just<1>,    none}},
    {Kinds::memory.resourceType,    SHARING_DEDICATED, ROLE_MIN, {none,           none,       none,       none,       regions<1>, none}},
    {Kinds::memory.resourceType,    SHARING_DEDICATED, ROLE_MAX, {none,           none,       none,       none,       freeMemory, none}},
    {Kinds::memory.resourceType,    SHARING_DEDICATED, ROLE_DEF, {none,           none,       none,       regions<1>, regions<1>, regions<2>}},
    {Kinds::memory.resourceType,    SHARING_DEDICATED, ROLE_INC, {none,           none,       none,       none,       regions<1>, none}},
    {Kinds::memory.resourceType,    SHARING_SHARED,    ROLE_MIN, {regions<1>,     none,       none,       none,       none,       none}},
    {Kinds::memory.resourceType,    SHARING_SHARED,    ROLE_MAX, {allMemory,      none,       none,       none,       none,       none}},
    {Kinds::memory.resourceType,    SHARING_SHARED,    ROLE_DEF, {regions<1>,     regions<1>, regions<2>, none,       none,       none}},
    {Kinds::memory.resourceType,    SHARING_SHARED,    ROLE_INC, {regions<1>,     none,       none,       none,       none,       none}},
    {Kinds::ioSlot.resourceType,    SHARING_SHARED,    ROLE_MIN, {none,           none,       none,       none,       just<1>,    none}},
    {Kinds::ioSlot.resourceType,    SHARING_SHARED,    ROLE_MAX, {none,           none,       none,       none,       slots,      none}},
    {Kinds::ioSlot.resourceType,    SHARING_SHARED,    ROLE_DEF, {none,           none,       none,       just<1>,    just<1>,    just<1>}},
    {Kinds::ioSlot.resourceType,    SHARING_SHARED,    ROLE_INC, {none,           none,       none,       none,       just<1>,    none}},
    {Kinds::ethernet.resourceType,  SHARING_SHARED,    ROLE_MAX, {just<65534>,    none,       none,       none,       none,       none}},
    {kAnyAdapter,                   SHARING_SHARED,    ROLE_MIN, {just<1>,        none,       none,       none,       none,       none}},
    {kAnyAdapter,                   SHARING_SHARED,    ROLE_MAX, {none,           none,       none,       none,       none,       none}},
    {kAnyAdapter,                   SHARING_SHARED,    ROLE_DEF, {just<1>,        just<1>,    just<1>,    none,       none,       none}},
    {kAnyAdapter,                   SHARING_SHARED,    ROLE_INC, {just<1>,        none,       none,       none,       none,       none}},
};

constexpr const char* kRoles[] = {"MIN", "MAX", "DEF", "INC"};
// clang-format on

constexpr const Leaf& leafOf(const zemRASDKind& kind, zemPoolSharing sharing, zemPoolRole role) {
    const Leaf* leaf = kLeaves;
    while (leaf->sharing != sharing || leaf->role != role ||
           (leaf->resourceType != kind.resourceType && leaf->resourceType != kAnyAdapter)) {
        ++leaf;
    }
    return *leaf;
}

/// Fills @p data for a pool; see zemResourceRASettingData::initialize().
int fill(const zemRASDKind& kind, const Leaf& leaf, zemResourcePool* pool, zemCEC* cec, int mode,
         zemPoolRASettingDataCommData& data) {
    if (pool == nullptr || pool->getData() == nullptr || cec == nullptr) {
        return -1;
    }
    const bool isDivided = leaf.resourceType == Kinds::processor.resourceType ||
                           leaf.resourceType == Kinds::memory.resourceType;
    const char* const sharing = leaf.sharing == SHARING_SHARED && isDivided ? "S" : "D";
    const zemString prefix = zemString("ORX:") + sharing + kRoles[leaf.role] + ":";
    data.m_ResourceType = static_cast<CMPIUint16>(kind.resourceType);
    data.m_InstanceID = pool->formInstanceID(prefix, cec->getMTMS());
    if (mode == VISITOR_TYPE_RASD_INIT_NI) {
        return 0;
    }
    data.m_AllocationUnits = kind.units;
    data.m_PoolID = pool->getData()->m_PoolID;
    for (std::size_t i = 0; i < std::size(kColumns); ++i) {
        data.*kColumns[i].field = leaf.amounts[i] == none ? 0 : leaf.amounts[i]({*pool, *cec});
    }
    return 0;
}

void show(const Leaf& leaf, const zemPoolRASettingDataCommData& data, CmpiInstance& instance,
          const char** properties) {
    zemAddIdentity(instance, properties, data);
    if (data.m_AllocationUnits.isEmpty()) {
        return;  // it has its ID alone
    }
    const zemListedProperties listed(instance, properties);
    listed.add("PoolID", data.m_PoolID);
    for (std::size_t i = 0; i < std::size(kColumns); ++i) {
        if (leaf.amounts[i] != none) {
            listed.add(kColumns[i].property, CmpiData(data.*kColumns[i].field));
        }
    }
}

}  // namespace

template <const zemRASDKind& kind, zemPoolSharing sharing, zemPoolRole role>
int zemRASettingDataOfPool<kind, sharing, role>::initialize(zemResourcePool* pool, zemCEC* cec,
                                                            const zemString&, int mode) {
    return fill(kind, leafOf(kind, sharing, role), pool, cec, mode, *this->block());
}

template <const zemRASDKind& kind, zemPoolSharing sharing, zemPoolRole role>
void zemRASettingDataOfPool<kind, sharing, role>::addSpecificProperties(CmpiInstance& instance,
                                                                        const char** properties,
                                                                        const char*) {
    show(leafOf(kind, sharing, role), *this->block(), instance, properties);
}

#define ZEM_LEAVES(KIND, SHARING)                                                 \
    template class zemRASettingDataOfPool<zemRASDKinds::KIND, SHARING, ROLE_MIN>; \
    template class zemRASettingDataOfPool<zemRASDKinds::KIND, SHARING, ROLE_MAX>; \
    template class zemRASettingDataOfPool<zemRASDKinds::KIND, SHARING, ROLE_DEF>; \
    template class zemRASettingDataOfPool<zemRASDKinds::KIND, SHARING, ROLE_INC>;
ZEM_LEAVES(processor, SHARING_DEDICATED)
ZEM_LEAVES(processor, SHARING_SHARED)
ZEM_LEAVES(memory, SHARING_DEDICATED)
ZEM_LEAVES(memory, SHARING_SHARED)
ZEM_LEAVES(ioSlot, SHARING_SHARED)
ZEM_LEAVES(ethernet, SHARING_SHARED)
ZEM_LEAVES(scsi, SHARING_SHARED)
ZEM_LEAVES(serial, SHARING_SHARED)
#undef ZEM_LEAVES

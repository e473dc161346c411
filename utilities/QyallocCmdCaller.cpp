#include "QyallocCmdCaller.h"

#include <string>

namespace {

using HCA = zemQyallocCmdCaller::HCAResourceAttribute;
using Memory = zemQyallocCmdCaller::MemoryResourceAttribute;
using PhysicalIO = zemQyallocCmdCaller::PhyIOResourceAttribute;
using Processor = zemQyallocCmdCaller::ProcessorResourceAttribute;
using VirtualIO = zemQyallocCmdCaller::VirtualIOResourceAttribute;

constexpr zemQuery kMemoryPools = {"qyalloc -r mempool",
                                   zemQyallocCmdCaller::MemoryPoolAttribute::m_attributeName};
constexpr zemQuery kProcessorPools = {"qyalloc -r procpool",
                                      zemQyallocCmdCaller::ProcessorPoolAttribute::m_attributeName};
constexpr zemQuery kSNIAdapters = {"qyalloc -r sni", {}};

/// What a level or subtype adds to the line, and the attributes that it has.
struct Choice {
    int value;
    const char* text;
    zemAttributeNames attributes = {};
};

constexpr Choice kHCALevels[] = {
    {HCA::LEVEL_LPAR, " --level lpar"},
    {HCA::LEVEL_SYS, " --level sys"},
};

constexpr Choice kMemoryLevels[] = {
    {Memory::LEVEL_LPAR, " --level lpar", Memory::LparLevelAttribute::m_attributeName},
    {Memory::LEVEL_SYS, " --level sys", Memory::SysLevelAttribute::m_attributeName},
};

constexpr Choice kProcessorLevels[] = {
    {Processor::LEVEL_LPAR, " --level lpar", Processor::LparLevelAttribute::m_attributeName},
    {Processor::LEVEL_POOL, " --level pool", Processor::PoolLevelAttribute::m_attributeName},
    {Processor::LEVEL_SYS, " --level sys", Processor::SysLevelAttribute::m_attributeName},
};

constexpr Choice kPhysicalSubTypes[] = {
    {PhysicalIO::SUBTYPE_UNIT, " unit", PhysicalIO::UnitAttribute::m_attributeName},
    {PhysicalIO::SUBTYPE_BUS, " bus", PhysicalIO::BusAttribute::m_attributeName},
    {PhysicalIO::SUBTYPE_SLOT, " slot", PhysicalIO::SlotAttribute::m_attributeName},
    {PhysicalIO::SUBTYPE_IOPOOL, " iopool", PhysicalIO::IOPoolAttribute::m_attributeName},
    {PhysicalIO::SUBTYPE_TAGGEDIO, " taggedio", PhysicalIO::TaggedIOAttribute::m_attributeName},
};

constexpr Choice kPhysicalLevels[] = {
    {PhysicalIO::LEVEL_SYS, " --level sys"},
    {PhysicalIO::LEVEL_POOL, " --level pool"},
};

/// Subtypes with attributes have the same ones at any level; for the others see below.
constexpr Choice kVirtualSubTypes[] = {
    {VirtualIO::SUBTYPE_ETH, " eth"},
    {VirtualIO::SUBTYPE_HSL, " hsl", VirtualIO::HSLAttribute::m_attributeName},
    {VirtualIO::SUBTYPE_VIRTUALOPTI, " virtualopti",
     VirtualIO::VirtualOptiAttribute::m_attributeName},
    {VirtualIO::SUBTYPE_SCSI, " scsi"},
    {VirtualIO::SUBTYPE_SERIAL, " serial"},
    {VirtualIO::SUBTYPE_SLOT, " slot"},
};

constexpr Choice kVirtualLevels[] = {
    {VirtualIO::LEVEL_LPAR, " --level lpar"},
    {VirtualIO::LEVEL_SLOT, " --level slot"},
    {VirtualIO::LEVEL_SYS, " --level sys"},
};

constexpr struct {
    VirtualIO::SubType subType;
    VirtualIO::Level level;
    zemAttributeNames attributes;
} kVirtualAttributes[] = {
    {VirtualIO::SUBTYPE_ETH, VirtualIO::LEVEL_LPAR,
     VirtualIO::EthLparLevelAttribute::m_attributeName},
    {VirtualIO::SUBTYPE_ETH, VirtualIO::LEVEL_SYS,
     VirtualIO::EthSysLevelAttribute::m_attributeName},
    {VirtualIO::SUBTYPE_SCSI, VirtualIO::LEVEL_LPAR,
     VirtualIO::SCSILparLevelAttribute::m_attributeName},
    {VirtualIO::SUBTYPE_SERIAL, VirtualIO::LEVEL_LPAR,
     VirtualIO::SerialLparLevelAttribute::m_attributeName},
    {VirtualIO::SUBTYPE_SLOT, VirtualIO::LEVEL_LPAR,
     VirtualIO::SlotLparLevelAttribute::m_attributeName},
    {VirtualIO::SUBTYPE_SLOT, VirtualIO::LEVEL_SLOT,
     VirtualIO::SlotSlotLevelAttribute::m_attributeName},
};

/// The row of @p value; one that adds nothing if there is none.
template <size_t N>
Choice choose(const Choice (&rows)[N], int value) {
    for (const Choice& row : rows) {
        if (row.value == value) {
            return row;
        }
    }
    return {value, ""};
}

/// An option with its number, which only positive ones bring into the line.
std::string numberOption(const char* option, int number) {
    return number > 0 ? option + std::to_string(number) : std::string();
}

}  // namespace

zemQyallocCmdCaller::zemQyallocCmdCaller(const char* auth, const char* locale)
    : zemCommandCaller(auth, locale) {}

zemRecordSetsType zemQyallocCmdCaller::getMemPoolInfo(int* paramAttr, const char* managedSystem,
                                                      const char* filter) {
    return query(kMemoryPools, paramAttr, managedSystem, filter);
}

zemRecordSetsType zemQyallocCmdCaller::getProcPoolInfo(int* paramAttr, const char* managedSystem,
                                                       const char* filter) {
    return query(kProcessorPools, paramAttr, managedSystem, filter);
}

int zemQyallocCmdCaller::getMemPoolNum(int* paramAttr, const char* managedSystem) {
    return getMemPoolInfo(paramAttr, managedSystem, nullptr).size();
}

int zemQyallocCmdCaller::getProcPoolNum(int* paramAttr, const char* managedSystem) {
    return getProcPoolInfo(paramAttr, managedSystem, nullptr).size();
}

zemRecordSetsType zemQyallocCmdCaller::getSNIAdapterResources(int* paramAttr,
                                                              const char* managedSystem,
                                                              const char* filter) {
    return query(kSNIAdapters, paramAttr, managedSystem, filter);
}

zemRecordSetsType zemQyallocCmdCaller::getHCAResources(int* paramAttr, const char* managedSystem,
                                                       HCAResourceAttribute::Level level,
                                                       const char* filter) {
    const Choice row = choose(kHCALevels, level);
    return query({"qyalloc -r hca", row.attributes}, paramAttr, managedSystem, filter, row.text);
}

zemRecordSetsType zemQyallocCmdCaller::getMemoryResources(int* paramAttr, const char* managedSystem,
                                                          MemoryResourceAttribute::Level level,
                                                          int maxmem, const char* filter) {
    Choice row = choose(kMemoryLevels, level);
    std::string options = row.text;
    if (level == Memory::LEVEL_SYS) {
        options += numberOption(" --maxmem ", maxmem);
        if (maxmem <= 0 && paramAttr == nullptr) {
            // The tool knows the number of pools only for a given amount of memory.
            row.attributes = row.attributes.first(Memory::SysLevelAttribute::ATTR_MAX_MEM_POOLS);
        }
    }
    return query({"qyalloc -r mem", row.attributes}, paramAttr, managedSystem, filter,
                 options.c_str());
}

zemRecordSetsType zemQyallocCmdCaller::getProcessorResources(
    int* paramAttr, const char* managedSystem, ProcessorResourceAttribute::Level level,
    int procunits, const char* filter) {
    const Choice row = choose(kProcessorLevels, level);
    std::string options = row.text;
    if (level == Processor::LEVEL_SYS) {
        options += numberOption(" --procunits ", procunits);
    }
    return query({"qyalloc -r proc", row.attributes}, paramAttr, managedSystem, filter,
                 options.c_str());
}

zemRecordSetsType zemQyallocCmdCaller::getVirtualIOResources(
    int* paramAttr, const char* managedSystem, VirtualIOResourceAttribute::SubType subType,
    VirtualIOResourceAttribute::Level level, const char* filter) {
    Choice row = choose(kVirtualSubTypes, subType);
    for (const auto& choice : kVirtualAttributes) {
        if (choice.subType == subType && choice.level == level) {
            row.attributes = choice.attributes;
        }
    }
    return query({"qyalloc -r virtualio --rsubtype", row.attributes}, paramAttr, managedSystem,
                 filter, row.text, choose(kVirtualLevels, level).text);
}

zemRecordSetsType zemQyallocCmdCaller::getPhysicalIOResources(
    int* paramAttr, const char* managedSystem, PhyIOResourceAttribute::SubType subType,
    PhyIOResourceAttribute::Level level, const char* filter) {
    const Choice row = choose(kPhysicalSubTypes, subType);
    return query({"qyalloc -r io --rsubtype", row.attributes}, paramAttr, managedSystem, filter,
                 row.text, choose(kPhysicalLevels, level).text);
}

/// A query at one subtype and level: its name, the general query, and what that is asked.
#define ZEM_QUERY_AT(NAME, GENERAL, ...)                                                   \
    zemRecordSetsType zemQyallocCmdCaller::NAME(int* paramAttr, const char* managedSystem, \
                                                const char* filter) {                      \
        return GENERAL(paramAttr, managedSystem, __VA_ARGS__, filter);                     \
    }

// clang-format off
ZEM_QUERY_AT(getPhysicalIOBusResources,    getPhysicalIOResources, PhysicalIO::SUBTYPE_BUS,      PhysicalIO::LEVEL_NO_APPLICABLE)
ZEM_QUERY_AT(getIOPoolResources,           getPhysicalIOResources, PhysicalIO::SUBTYPE_IOPOOL,   PhysicalIO::LEVEL_POOL)
ZEM_QUERY_AT(getSystemIOPoolResources,     getPhysicalIOResources, PhysicalIO::SUBTYPE_IOPOOL,   PhysicalIO::LEVEL_POOL)
ZEM_QUERY_AT(getPhysicalIOSlotResources,   getPhysicalIOResources, PhysicalIO::SUBTYPE_SLOT,     PhysicalIO::LEVEL_NO_APPLICABLE)
ZEM_QUERY_AT(getPhysicalIOUnitResources,   getPhysicalIOResources, PhysicalIO::SUBTYPE_UNIT,     PhysicalIO::LEVEL_NO_APPLICABLE)
ZEM_QUERY_AT(getPhysicalTaggedIOResources, getPhysicalIOResources, PhysicalIO::SUBTYPE_TAGGEDIO, PhysicalIO::LEVEL_NO_APPLICABLE)

ZEM_QUERY_AT(getPartitionMemoryResources,     getMemoryResources,    Memory::LEVEL_LPAR,    -1)
ZEM_QUERY_AT(getPartitionProcessorResources,  getProcessorResources, Processor::LEVEL_LPAR, -1)
ZEM_QUERY_AT(getSharedProcessorPoolResources, getProcessorResources, Processor::LEVEL_POOL, -1)

ZEM_QUERY_AT(getPartitionVirtualEthernetResources, getVirtualIOResources, VirtualIO::SUBTYPE_ETH,         VirtualIO::LEVEL_LPAR)
ZEM_QUERY_AT(getSystemVirtualEthernetResources,    getVirtualIOResources, VirtualIO::SUBTYPE_ETH,         VirtualIO::LEVEL_SYS)
ZEM_QUERY_AT(getPartitionVirtualSCSIResources,     getVirtualIOResources, VirtualIO::SUBTYPE_SCSI,        VirtualIO::LEVEL_LPAR)
ZEM_QUERY_AT(getPartitionVirtualSerialResources,   getVirtualIOResources, VirtualIO::SUBTYPE_SERIAL,      VirtualIO::LEVEL_LPAR)
ZEM_QUERY_AT(getPartitionVirtualIOSlotResources,   getVirtualIOResources, VirtualIO::SUBTYPE_SLOT,        VirtualIO::LEVEL_LPAR)
ZEM_QUERY_AT(getVirtualIOSlotResources,            getVirtualIOResources, VirtualIO::SUBTYPE_SLOT,        VirtualIO::LEVEL_SLOT)
ZEM_QUERY_AT(getHSLOptiConnectResources,           getVirtualIOResources, VirtualIO::SUBTYPE_HSL,         VirtualIO::LEVEL_NO_APPLICABLE)
ZEM_QUERY_AT(getVirtualOptiConnectResources,       getVirtualIOResources, VirtualIO::SUBTYPE_VIRTUALOPTI, VirtualIO::LEVEL_NO_APPLICABLE)

ZEM_QUERY_AT(getPartitionHCAResources, getHCAResources, HCA::LEVEL_LPAR)
ZEM_QUERY_AT(getSystemHCAResources,    getHCAResources, HCA::LEVEL_SYS)
// clang-format on

zemRecordSetsType zemQyallocCmdCaller::getSystemMemoryResources(int* paramAttr,
                                                                const char* managedSystem,
                                                                int maxmem, const char* filter) {
    return getMemoryResources(paramAttr, managedSystem, Memory::LEVEL_SYS, maxmem, filter);
}

zemRecordSetsType zemQyallocCmdCaller::getSystemProcessorResources(int* paramAttr,
                                                                   const char* managedSystem,
                                                                   int procunits,
                                                                   const char* filter) {
    return getProcessorResources(paramAttr, managedSystem, Processor::LEVEL_SYS, procunits, filter);
}

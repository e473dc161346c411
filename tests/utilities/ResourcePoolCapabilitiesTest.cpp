#include <gtest/gtest.h>

#include <memory>

#include "FailureText.h"
#include "ResourcePoolManager.h"

namespace {

/// What a pool carries; nothing of what is null.
std::string told(zemPoolCapability* capability) {
    std::string ids;
    for (std::size_t i = 0; capability != nullptr && i <= ROLE_INC; ++i) {
        const zemResourceRASettingData* const leaf = capability->m_SettingData[i];
        const std::string id(leaf->getData()->m_InstanceID);
        ids += i == 0 ? id : ' ' + id.substr(4, 5);
    }
    return ids;
}

template <class Carried>
std::string told(Carried* carried) {
    if (carried == nullptr) {
        return {};
    }
    const auto& data = *carried->getData();
    EXPECT_EQ(data.m_Caption, data.m_Description);
    if constexpr (std::is_same_v<Carried, zemResourcePoolConfigurationService>) {
        return joined(data.m_Name, data.m_CreationClassName, data.m_SystemName,
                      data.m_SystemCreationClassName, data.m_Started, data.m_Caption);
    } else {
        EXPECT_EQ(data.m_Caption, data.m_ElementName);
        return joined(data.m_InstanceID, data.m_Caption);
    }
}

std::string told(zemResourcePool& pool) {
    EXPECT_EQ(pool.getCapability(), pool.getPoolCapability().getElementAt(0));
    return told(pool.getAlloCapDedicated()) + told(pool.getAlloCapShared()) +
           told(pool.getCapability()) + told(pool.getPoolConfCap()) +
           told(pool.getPoolConfService());
}

/// A host with one shared pool of processors and one of memory.
std::unique_ptr<zemCEC> made() {
    auto host = std::make_unique<zemCEC>("1*2", "alpha");
    zemSystemProcessorResource processors;
    processors.setMaxSharedProcPools("2");
    host->setProcessor(processors);
    auto pool = std::make_unique<zemProcessorPoolResource>("1*2");
    pool->setSharedProcPoolId("7");
    host->addProcessorPool(pool.release());
    zemSystemMemoryResource memory;
    memory.setMaxMemPools("1");
    host->setMemory(memory);
    zemMemoryPoolResource memoryPool;
    memoryPool.setSupport(true);
    host->setMemoryPool(memoryPool);
    return host;
}

TEST(ResourcePoolCapabilitiesTest, ModesAndKindsSayWhatPoolsCarry) {
    enum { NOTHING, ALLOCATION, SETTINGS, CONFIGURATION, SERVICE };
    constexpr struct {
        int mode;
        int carried;
    } kModes[] = {{0, NOTHING},        {1, NOTHING},        {34, SETTINGS},  {50, SETTINGS},
                  {36, CONFIGURATION}, {52, CONFIGURATION}, {40, SERVICE},   {56, SERVICE},
                  {33, ALLOCATION},    {99, ALLOCATION},    {-1, ALLOCATION}};
    constexpr struct {
        const char* stem;  ///< of the classes' names
        const char* noun;  ///< in texts
        const char* type;
        const char* allocation;
        const char* service = "ORX";
        const char* shared[2] = {nullptr};  ///< of the shared pool: allocation, setting data
    } kKinds[] = {
        {"Processor",
         "Processor",
         "3",
         "Allocation Capabilities for Processor Pool Primordial of system 1*2",
         "ORXCORAL",
         {"ORX:Shared:3-7*1*2|Allocation Capabilities for Processor Pool 7 of system 1*2|",
          "ORX:SMIN:3-7*1*2 SMAX: SDEF: SINC:"}},
        {"Memory",
         "Memory",
         "4",
         "Dedicated Memory Pool Allocation Capabilities",
         "ORX",
         {"ORX:Shared:4-0*1*2|Shared Memory Pool Allocation Capabilities|",
          "ORX:SMIN:4-0*1*2 SMAX: SDEF: SINC:"}},
        {"IOSlot", "I/O Slot", "12", "I/O Slot Pool Allocation Capabilities"},
        {"EthernetAdapter", "Virtual Ethernet Adapter", "10",
         "Virtual Ethernet Adapter Pool Allocation Capabilities"},
        {"SCSIAdapter", "Virtual SCSI Adapter", "6",
         "Virtual SCSI Adapter Pool Allocation Capabilities"},
        {"SerialAdapter", "Virtual Serial Adapter", "21",
         "Virtual Serial Adapter Pool Allocation Capabilities"},
    };
    const std::unique_ptr<zemCEC> host = made();
    for (const auto& kind : kKinds) {
        const std::string stem = kind.stem, noun = kind.noun;
        const std::string id = std::string(kind.type) + "-Primordial*1*2";
        const std::string expected[] = {
            "", "ORX:D:" + id + "|" + kind.allocation + "|",
            "ORX:DMIN:" + id + " DMAX: DDEF: DINC:",
            "ORX:" + id + "|" + noun + " Pool Configuration Capabilities|",
            kind.service + (":" + stem) + "PoolService:1*2|ORXC_" + stem +
                "PoolConfigurationService|1*2|ORXC_CEC_CS|1|" + noun +
                " Pool Configuration Service of system 1*2|"};
        for (const auto& [mode, carried] : kModes) {
            zemRPVisitor visitor(host.get(), ("ORXC_" + stem + "Pool").c_str());
            ASSERT_EQ(0, visitor.initialize("", mode));
            EXPECT_EQ(expected[carried], told(*visitor.getData(0))) << mode;
            ASSERT_EQ(kind.shared[0] == nullptr ? 1 : 2, visitor.size());
            if (zemResourcePool* const sub = visitor.getData(1)) {
                EXPECT_EQ(carried == NOTHING ? "" : kind.shared[carried == SETTINGS], told(*sub));
            }
        }
    }
}

TEST(ResourcePoolCapabilitiesTest, PoolsDecideHowTheyAreTakenFrom) {
    const std::unique_ptr<zemCEC> host = made();
    zemRPVisitor visitor(host.get(), "ORXC_ProcessorPool");
    ASSERT_EQ(0, visitor.initialize("", 50));
    for (int i = 0; zemResourcePool* const pool = visitor.getData(i); ++i) {
        zemProcessorPoolCapabilities byPool;
        EXPECT_EQ(0, byPool.initialize(pool, host.get(), "", 50));
        zemPoolCapability* const same = &byPool;
        EXPECT_EQ(told(pool->getCapability()), told(same));
    }
    zemIOSlotPoolCapabilities slots;
    EXPECT_EQ(-1, slots.initialize(nullptr, host.get(), "", 34));
    using Capabilities = zemResourceAllocationCapabilities;
    EXPECT_EQ(1, Capabilities::getIndexFromClassName("orxc_memoryallocationcapabilities", true));
    EXPECT_EQ(5, Capabilities::getIndexFromClassName("ORXC_SCSIAdapterAllocationCapabilities", 0));
    EXPECT_EQ(-1, Capabilities::getIndexFromClassName("ORXC_MemoryPool", true));
}

}  // namespace

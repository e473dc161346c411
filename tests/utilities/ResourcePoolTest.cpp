#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <functional>
#include <tuple>

#include "LibrarySpy.h"
#include "NumberText.h"
#include "ProviderHarness.h"
#include "ResourcePoolManager.h"
#include "TestAppliance.h"
#include "VirtualSystemVisitor.h"

namespace {

constexpr char kHost[] = "1*2";
constexpr int kNames = 0;
constexpr int kEverything = 1;

/// What a pool tells, and behind it its sub-pools.
std::string told(zemResourcePool& pool, Harness& harness) {
    CmpiInstance instance = FromServer<CmpiInstance>(harness.disk());
    pool.addSpecificProperties(instance, nullptr, "");
    const auto number = [&](const char* name) {
        const CmpiData value = instance.getProperty(name);
        return value.isNullValue() ? "-" : std::to_string(value.getUint64());
    };
    const zemPoolCommData& data = *pool.getData();
    std::string text =
        joined(data.m_InstanceID, data.m_ResourceType, data.m_PoolID, data.m_Primordial,
               data.m_AllocationUnits, data.m_Capacity, number("Reserved"),
               number("InstalledCapacity"), instance.getProperty("Caption").getString().charPtr());
    EXPECT_STREQ(instance.getProperty("Caption").getString().charPtr(),
                 instance.getProperty("Description").getString().charPtr());
    for (int i = 0; i < pool.getSubPoolSize(); ++i) {
        text += "\n" + told(*pool.getSubPool(i), harness);
    }
    return text;
}

TEST(ResourcePoolTest, ClassesBelongToKinds) {
    constexpr std::tuple<const char*, int, int> kRows[] = {
        {"orxc_memorypool", -1, 1},
        {"ORXC_Memory", 1, -1},
        {"ORXC_SPIPort", 5, -1},
        {"ORXC_IOSlotAdapterRASettingData", -1, 2},
        {"ORXC_EthernetAdapterAllocationCapabilities", -1, 3},
        {"ORXC_SerialAdapterPoolConfigurationService", -1, 4},
        {"orxc_scsiadapterpoolconfigurationcapabilities", -1, 5},
        {"ORXC_ProcessorPools", -1, -1}};
    for (const auto& [name, device, other] : kRows) {
        EXPECT_EQ(device, zemResourcePool::getIndexFromClassName(name, false)) << name;
        EXPECT_EQ(other, zemResourcePool::getIndexFromClassName(name, true)) << name;
    }
}

TEST(ResourcePoolTest, PoolsTellWhatTheirHostHas) {
    const std::string processor = "ORX:3-Primordial*1*2|3|Primordial|";
    const std::string processors = "|Host Primordial Processor Pool of system 1*2|";
    const std::string memory = "ORX:4-Primordial*1*2|4|Primordial|1|byte*2^10|";
    const std::string memories = "|Host Primordial Memory Pool of system 1*2|";
    const auto shared = [](const std::string& id, const std::string& quantities) {
        return "\nORX:3-" + id + "*1*2|3|" + id + "|0|Percent|" + quantities +
               "|-|Processor Pool " + id + " of system 1*2|";
    };
    // Each object of the library is a partition and a shared pool, and the last one the host too.
    const struct {
        std::vector<std::string> objects;
        std::string expected;  ///< of what fails: why
        const char* className = "ORXC_ProcessorPool";
        int mode = kEverything;
    } rows[] = {
        {{"Name=1*1*2;PartitionState=0;CurAllocProcUnits=100;PendAllocProcUnits=200;CurProcMode=9",
          "Name=2*1*2;PartitionState=2;CurAllocProcUnits=300;PendAllocProcUnits=400;"
          "ConfigurableProcUnits=10.00;PendAvailProcUnits=2.50;InstalledProcessors=16;"
          "MaxProcPools=1"},
         processor + "1|Percent|1000|550|1600" + processors},
        // What is told is cut in single precision, what is summed is rounded; nothing is below 0.
        {{"Name=1*1*2;ConfigurableProcUnits=0.53;PendAvailProcUnits=0.29;InstalledProcessors=1.05;"
          "MaxProcPools=1"},
         processor + "1|Percent|52|24|104" + processors},
        {{"Name=1*1*2;ConfigurableProcUnits=-1e30;PendAvailProcUnits=inf;MaxProcPools=1"},
         processor + "1|Percent|0|0|0" + processors},
        {{"Name=1*1*2;SharedProcPoolId=0;MaxPoolCapacity=null;PartitionState=2;CurProcMode=1;"
          "CurAllocProcUnits=100;PendAllocProcUnits=150",
          "Name=2*1*2;SharedProcPoolId=1;MaxPoolCapacity=8.00;PartitionState=0;CurProcMode=1;"
          "CurAllocProcUnits=200",
          "Name=3*1*2;SharedProcPoolId=2;MaxPoolCapacity=0.5;PartitionState=8;CurProcMode=1;"
          "PendProcMode=2;CurAllocProcUnits=50",
          "Name=4*1*2;SharedProcPoolId=3;MaxPoolCapacity=1;PartitionState=2;CurProcMode=255;"
          "CurAllocProcUnits=300;ConfigurableProcUnits=10;PendAvailProcUnits=2;MaxProcPools=64"},
         processor + "1|Percent|1000|600|0" + processors + shared("0", "1000|0") +
             shared("1", "800|150") + shared("2", "50|50") + shared("3", "100|0")},
        {{"Name=1*1*2;SharedProcPoolId=0;PartitionState=0;CurProcMode=7;MaxProcPools=2"},
         "zemCEC/getProcessorPool/Pool ID : 7"},
        {{"Name=1*1*2"}, "-1"},
        {{"Name=1*1*2;MaxProcPools=1"}, "-1", "ORXC_Processor"},
        {{"Name=1*1*2;ConfigurableProcUnits=10.00;MaxProcPools=0"},
         processor + "0||0|0|-||",
         "ORXC_ProcessorPool",
         kNames},
        {{"Name=1*1*2;PartitionState=0;CurAllocMem=256;PendAllocMem=512",
          "Name=2*1*2;PartitionState=2;CurAllocMem=512;PendAllocMem=512;ConfigurableMem=4096;"
          "PendAvailMem=1024;InstalledMemory=8192;MaxMemPools=0;SystemName=1*2"},
         memory + "4194304|2621440|8388608" + memories,
         "ORXC_MemoryPool"},
        {{"Name=1*1*2;ConfigurableMem=1024;PendAvailMem=4096;InstalledMemory=-1;MaxMemPools=1;"
          "SystemName=1*2;curr_pool_mem=1024;pend_pool_mem=2048;pend_avail_pool_mem=512"},
         memory + "1048576|0|0" + memories +
             "\nORX:4-0*1*2|4|0|0|byte*2^10|2097152|1572864|1048576|"
             "Shared memory pool 0 of system 1*2|",
         "ORXC_MemoryPool"},
    };
    Harness harness(cimom::Character::Lean);
    for (const auto& row : rows) {
        zemVirtualizationManager manager;
        manager.m_CECs.addElement(new zemCEC(kHost, "alpha"));
        zemCECVisitor hosts(&manager, "");
        const LibraryAnswer answer(row.objects);
        zemRPVisitor::readHosts(hosts, row.className, row.mode);
        zemRPVisitor visitor(manager.m_CECs[0], row.className);
        std::string text = "-1";
        const std::string failure = failureText(
            [&] {
                if (visitor.initialize("", row.mode) == 0) {
                    text = told(*visitor.getData(0), harness);
                }
            },
            "cmt");
        EXPECT_EQ(text == "-1", visitor.getData(0) == nullptr);
        EXPECT_EQ(row.expected, failure.empty() ? text : failure) << row.objects[0];
    }
}

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

TEST(ResourcePoolTest, ModesAndKindsSayWhatPoolsCarry) {
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
        // clang-format off
        const char* shared[2] = {nullptr};  ///< of the shared pool: allocation, setting data
    } kKinds[] = {
        {"Processor",
         "Processor",
         "3",
         "Allocation Capabilities for Processor Pool Primordial of system 1*2",
         "ORXCORAL",
         {"ORX:Shared:3-7*1*2|Allocation Capabilities for Processor Pool 7 of system 1*2|",
          "ORX:SMIN:3-7*1*2 SMAX: SDEF: SINC:"}},
        {"Memory", "Memory", "4", "Dedicated Memory Pool Allocation Capabilities", "ORX", {"ORX:Shared:4-0*1*2|Shared Memory Pool Allocation Capabilities|", "ORX:SMIN:4-0*1*2 SMAX: SDEF: SINC:"}},
        {"IOSlot", "I/O Slot", "12", "I/O Slot Pool Allocation Capabilities"},
        {"EthernetAdapter", "Virtual Ethernet Adapter", "10", "Virtual Ethernet Adapter Pool Allocation Capabilities"},
        {"SCSIAdapter", "Virtual SCSI Adapter", "6", "Virtual SCSI Adapter Pool Allocation Capabilities"},
        {"SerialAdapter", "Virtual Serial Adapter", "21", "Virtual Serial Adapter Pool Allocation Capabilities"},
    };
    // clang-format on
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

TEST(ResourcePoolTest, PoolsDecideHowTheyAreTakenFrom) {
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

class ResourcePoolOfApplianceTest : public testing::Test {
protected:
    void make(const std::string& command) {
        ASSERT_EQ(0, m_tools.run("appliance " + command).exit);
    }

    /// Makes all pools of a class; gives how many calls of the library that took.
    std::size_t read(const char* className, int mode) {
        m_hosts->initialize("", false, zemCECVisitor::Level_All);
        librarySpy.names.clear();
        zemRPVisitor::readHosts(*m_hosts, className, mode);
        m_pools.reset(m_manager.createRPonCECVisitor(className));
        for (int i = 0; i < m_hosts->size(); ++i) {
            EXPECT_EQ(0, m_pools->initialize(m_hosts->getData(i)->getMTMS(), mode));
        }
        return librarySpy.names.size();
    }

    /// The pool at a place of the row.
    template <class Pool>
    const Pool& pool(int index) {
        return dynamic_cast<const Pool&>(*m_pools->getData(index));
    }

    /// Sum of an attribute over the lines that the tool prints, in hundredths.
    CMPIUint64 sumOf(const std::string& query) {
        long sum = 0;
        for (const std::string& line :
             testing_support::lines(m_tools.run("qyalloc -r " + query).out)) {
            sum += std::lround(100 * zemRealOf(line));
        }
        return static_cast<CMPIUint64>(sum);
    }

    /// Sum over the partitions of the only host, those that run or those that do not.
    CMPIUint64 sumOf(bool isActive, const std::function<double(const zemLPAR&)>& amount) {
        double sum = 0;
        zemDynamicArray<zemLPAR>& lpars = m_hosts->getData(0)->getLPARs();
        for (int i = 0; i < lpars.size(); ++i) {
            sum += lpars[i]->isActivated() == isActive ? amount(*lpars[i]) : 0;
        }
        return static_cast<CMPIUint64>(std::lround(sum));
    }

    testing_support::TestAppliance m_tools{ZEM_PROGRAMS};
    zemVirtualizationManager m_manager;
    std::unique_ptr<zemCECVisitor> m_hosts{m_manager.createCECVisitor()};
    std::unique_ptr<zemRPonCECVisitor> m_pools;
};

TEST_F(ResourcePoolOfApplianceTest, CallsAreAsManyWhateverIsThere) {
    constexpr struct {
        const char* className;
        std::size_t calls[2];  ///< for names, for everything
        int pools;             ///< of the demo's four hosts
    } kRows[] = {{"ORXC_ProcessorPool", {2, 4}, 9},     {"ORXC_MemoryPool", {2, 4}, 5},
                 {"ORXC_IOSlotPool", {0, 2}, 4},        {"ORXC_EthernetAdapterPool", {0, 2}, 4},
                 {"ORXC_SerialAdapterPool", {0, 2}, 4}, {"ORXC_SCSIAdapterPool", {0, 2}, 4}};
    make("init");
    for (const auto& row : kRows) {
        for (const int mode : {kNames, kEverything, 50, 34}) {
            EXPECT_EQ(row.calls[mode == kEverything || mode == 34], read(row.className, mode));
            EXPECT_EQ(row.pools, m_pools->size()) << row.className;
            zemResourcePool* const last = m_pools->getData(row.pools - 1);
            EXPECT_EQ(last, m_pools->getData(zemItemKey(*last)));
            EXPECT_EQ(nullptr, m_pools->getData(row.pools));
        }
    }
    const zemString mtms = m_hosts->getData(0)->getMTMS();
    zemProcessorPool pool;
    pool.initRASDInfo("", mtms);
    EXPECT_EQ("1|0.05|7|2|",
              joined(pool.infoRASD.isInitialized, pool.infoRASD.min_proc_units_per_virtual_proc,
                     pool.infoRASD.m_results_processor_lpar.size(),
                     pool.infoRASD.m_results_processor_pool.size()));
    m_tools.replaceTool("qyalloc", "echo DNXERR01 >&2; exit 1");
    pool.initRASDInfo("", mtms);  // asked once
    EXPECT_EQ("zemProcessorPool/initRASDInfo",
              failureText([&] { zemProcessorPool().initRASDInfo("", mtms); }, "cm"));
}

TEST_F(ResourcePoolOfApplianceTest, SumsAgreeWithTools) {
    const auto units = [](const zemLPAR& lpar) {
        return 100 * zemRealOf(std::string_view(lpar.getLparProcessor().getPendProcUnits()));
    };
    const auto sharedUnits = [&](const zemLPAR& lpar) {
        return lpar.getLparProcessor().getCurrProcMode() == "shared" ? units(lpar) : 0;
    };
    const auto kilobytes = [](const zemLPAR& lpar) {
        return 1024 * zemRealOf(std::string_view(lpar.getLparMemory().getPendMem()));
    };
    for (int seed = 1; seed <= 12; ++seed) {
        make("generate --force --hosts 1 --lpars " + std::to_string(seed * 3) + " --seed " +
             std::to_string(seed));
        read("ORXC_ProcessorPool", kEverything);
        const auto& processors = pool<zemProcessorPool>(0).m_ProcPoolData;
        const auto& shared = pool<zemProcessorPool>(1).m_ProcPoolData;
        EXPECT_EQ(sumOf("proc --level sys -F configurable_sys_proc_units"), processors.m_Capacity);
        EXPECT_EQ(sumOf("proc --level sys -F pend_avail_sys_proc_units"),
                  processors.m_Capacity - processors.m_Reserved - sumOf(false, units));
        EXPECT_EQ(sumOf(true, units), processors.m_Reserved);
        EXPECT_EQ(sumOf("proc --level pool -F configurable_pool_proc_units"), shared.m_Capacity);
        EXPECT_EQ(sumOf(true, sharedUnits), shared.m_Reserved);

        read("ORXC_MemoryPool", kEverything);
        const auto& memory = pool<zemMemoryPool>(0).m_MemoryPoolData;
        EXPECT_EQ(sumOf("mem --level sys -F pend_avail_sys_mem") / 100 * 1024,
                  memory.m_Capacity - memory.m_Reserved - sumOf(false, kilobytes));

        read("ORXC_IOSlotPool", kEverything);
        const auto& slots = pool<zemIOSlotPool>(0).m_PoolData;
        const auto owners =
            testing_support::lines(m_tools.run("qyalloc -r io --rsubtype slot -F lpar_id").out);
        EXPECT_EQ(owners.size(), slots.m_Capacity);
        EXPECT_EQ(std::count(owners.begin(), owners.end(), "null"),
                  static_cast<long>(slots.m_Capacity - slots.m_Reserved));
    }
}

}  // namespace

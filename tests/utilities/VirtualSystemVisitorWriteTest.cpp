#include <gtest/gtest.h>

#include <cstring>
#include <filesystem>
#include <functional>
#include <memory>

#include "ToolFolder.h"
#include "VirtualSystemVisitor.h"

namespace {

constexpr char kHost[] = "1111-AAA*0000001";
using Caller = zemCommandCaller;

/// What a VSSD is made of.
struct Given {
    Given() {
        auto& p = processor.m_Data;
        p.m_ConsumerVisibility = 3;
        p.m_SharingMode = "uncap";
        p.m_Weight = 128;
        p.m_PoolID = "1";
        p.m_VirtualMinimum = 100, p.m_VirtualQuantity = 250, p.m_VirtualMaximum = 400;
        p.m_Minimum = 25, p.m_Reservation = 125, p.m_Limit = 205;
        auto& m = memory.m_Data;
        m.m_ConsumerVisibility = 2;
        m.m_VirtualMinimum = 262144, m.m_VirtualQuantity = 524288, m.m_VirtualMaximum = 786432;
        m.m_Minimum = 1048576, m.m_Reservation = 2097152, m.m_Limit = 4194304;
        host.m_maxMemPools = host.m_maxProcPools = 0;
    }
    /// With RASDs of lists.
    std::unique_ptr<zemVSSD> make() {
        auto vssd = std::make_unique<zemVSSD>(lparID, kHost, type, autoStart, name, profile,
                                              bootMode, monitoring, isDefault, slots, redundant,
                                              keylock, defaultProfile);
        vssd->GenerateInstanceID(isState);
        vssd->setMemoryPoolNum(memoryPools);
        for (int i = 0; i < processors; ++i) {
            vssd->addRASD(processor.clone());
        }
        for (int i = 0; i < memories; ++i) {
            vssd->addRASD(memory.clone());
        }
        for (const auto& [kind, list] : lists) {
            zemVSSDVisitor::createIORASDs(list, kind, vssd.get());
        }
        const auto slotRasds = vssd->getRASD(12);
        for (size_t i = 0; i < tags.size(); ++i) {
            auto& slot = dynamic_cast<zemIOSlotRASD&>(*slotRasds.getElementAt(i < 2 ? 0 : 1));
            slot.m_Data.m_TaggedIOType.append(tags[i]);
        }
        return vssd;
    }

    zemString lparID = "3", name = "web", profile = "normal", type = "tmxlinux";
    zemString bootMode = "norm", keylock, defaultProfile;
    int autoStart = 1, monitoring = 0, isDefault = 1, slots = 16, redundant = 1, memoryPools = 0;
    bool isState = false, isOSQ00 = false;
    zemProcessorRASD processor;
    zemMemoryRASD memory;
    int processors = 1, memories = 1;
    std::vector<std::pair<int, const char*>> lists;
    std::vector<int> tags;  ///< two for the first slot, others for the second
    zemCECCapability host;
};

using Change = void (*)(Given& g);

/// A change of what is given, and of the attributes that follow.
struct Row {
    Change change;
    const char* before;
    const char* after;
};

std::string changed(std::string text, const Row& row) {
    const size_t at = text.find(row.before);
    EXPECT_NE(text.npos, at) << row.before;
    return at == text.npos ? text : text.replace(at, std::strlen(row.before), row.after);
}

class VirtualSystemVisitorWriteTest : public testing::Test {
protected:
    VirtualSystemVisitorWriteTest() {
        for (const char* tool : {"nwplat", "edplat", "dlplat", "edpower", "edalloc"}) {
            m_tools.recorder(tool);
        }
    }
    int create(Given& g, zemVSSD& vssd) {
        m_host.setCapability(&g.host);
        return m_hosts.createLPAR(&m_host, &vssd, g.isOSQ00);
    }
    /// What the tool receives.
    std::string received(const std::function<void()>& operation) {
        std::filesystem::remove(m_tools.file("argv"));
        operation();
        return m_tools.arguments();
    }
    std::string made(Given& g) {
        return received([&] { EXPECT_EQ(0, create(g, *g.make())); });
    }

    ToolFolder m_tools;
    zemVirtualizationManager m_manager;
    zemCEC m_host{kHost, "alpha"};
    zemCECVisitor m_hosts{&m_manager, ""};
    zemVSSDVisitor m_settings{&m_host, ""};
    zemLPARVisitor m_partitions{&m_host, ""};
};

// clang-format off
TEST_F(VirtualSystemVisitorWriteTest, MakesPartitions) {
    const std::string base = R"(-r|lpar|-m|1111-AAA*0000001|-i|"name=web","profile_name=normal","lpar_env=tmxlinux","auto_start=1","boot_mode=norm","max_virtual_slots=16","conn_monitoring=0","redundant_err_path_reporting=1",)"
        R"("proc_mode=shared","sharing_mode=uncap","uncap_weight=128","shared_proc_pool_id=1","min_procs=1","max_procs=4","desired_procs=2","min_proc_units=0.25","max_proc_units=2.05","desired_proc_units=1.25",)"
        R"("min_mem=1024","desired_mem=2048","max_mem=4096")";
    const Row rows[] = {
        {[](Given&) {}, "", ""},
        // The system.
        {[](Given& g) { g.name = "a,\"b\\ $(c)"; }, "\"name=web\"", R"x("name=a,""b\ $(c)")x"},
        {[](Given& g) { g.name = g.profile = g.bootMode = ""; g.lparID = "9"; }, R"("name=web","profile_name=normal","lpar_env=tmxlinux","auto_start=1","boot_mode=norm",)", R"("lpar_env=tmxlinux","auto_start=1",)"},
        {[](Given& g) { g.autoStart = 0; g.monitoring = -1; }, R"(auto_start=1","boot_mode=norm","max_virtual_slots=16","conn_monitoring=0)", R"(auto_start=0","boot_mode=norm","max_virtual_slots=16","conn_monitoring=1)"},
        {[](Given& g) { g.redundant = 0; }, "reporting=1", "reporting=0"},
        {[](Given& g) { g.slots = -1; }, "slots=16", "slots=10"},
        {[](Given& g) { g.slots = 0; g.type = "osq00"; }, R"(tmxlinux","auto_start=1","boot_mode=norm","max_virtual_slots=16)", R"(osq00","auto_start=1","boot_mode=norm","max_virtual_slots=10)"},
        {[](Given& g) { g.slots = -1; g.type = "xbrgserver"; }, R"(tmxlinux","auto_start=1","boot_mode=norm","max_virtual_slots=16)", R"(xbrgserver","auto_start=1","boot_mode=norm","max_virtual_slots=20)"},
        // Processors.
        {[](Given& g) { g.processor.m_Data.m_SharingMode = ""; g.processor.m_Data.m_Weight = -1; }, R"("sharing_mode=uncap","uncap_weight=128",)", ""},
        {[](Given& g) { g.processor.m_Data.m_SharingMode = "cap"; g.processor.m_Data.m_Weight = 0; }, R"(uncap","uncap_weight=128)", R"(cap","uncap_weight=0)"},
        {[](Given& g) { g.processor.m_Data.m_PoolID = "primordial"; g.host.m_maxProcPools = 1; }, "\"shared_proc_pool_id=1\",", ""},
        {[](Given& g) { g.processor.m_Data.m_PoolID = ""; g.host.m_maxProcPools = 64; }, "\"shared_proc_pool_id=1\",", ""},
        {[](Given& g) { g.processor.m_Data.m_PoolID = "0\",\"x=1"; }, "pool_id=1", "pool_id=0\"\",\"\"x=1"},
        {[](Given& g) { g.processor.m_Data.m_ConsumerVisibility = -1; }, "\"shared_proc_pool_id=1\",", ""},
        {[](Given& g) { g.processor.m_Data.m_ConsumerVisibility = 2; g.processor.m_Data.m_PoolID = "Primordial"; g.host.m_maxProcPools = 64; g.processor.m_Data.m_Minimum = 200; g.processor.m_Data.m_Reservation = 300; g.processor.m_Data.m_Limit = 500; },
         R"("proc_mode=shared","sharing_mode=uncap","uncap_weight=128","shared_proc_pool_id=1","min_procs=1","max_procs=4","desired_procs=2","min_proc_units=0.25","max_proc_units=2.05","desired_proc_units=1.25")",
         R"("proc_mode=ded","sharing_mode=share_idle_procs","uncap_weight=128","min_procs=2","max_procs=5","desired_procs=3","min_proc_units=2.00","max_proc_units=5.00","desired_proc_units=3.00")"},
        {[](Given& g) { g.host.m_lparProcCompatModes = "default,CORAL7"; }, R"("min_procs)", R"("lpar_proc_compat_mode=default","min_procs)"},
        {[](Given& g) { g.host.m_lparProcCompatModes = "default,CORAL7"; g.processor.m_Data.m_ProcCompatMode = "CORAL7"; }, R"("min_procs)", R"("lpar_proc_compat_mode=CORAL7","min_procs)"},
        {[](Given& g) { g.processor.m_Data.m_ProcCompatMode = "CORAL7"; }, "", ""},
        {[](Given& g) { g.processor.m_Data.m_VirtualMinimum = g.processor.m_Data.m_VirtualMaximum = -1; g.processor.m_Data.m_Reservation = -1; }, R"("min_procs=1","max_procs=4","desired_procs=2","min_proc_units=0.25","max_proc_units=2.05","desired_proc_units=1.25",)", R"("desired_procs=2","min_proc_units=0.25","max_proc_units=2.05",)"},
        {[](Given& g) { g.processor.m_Data.m_VirtualQuantity = 99; g.processor.m_Data.m_Minimum = 0; }, R"(desired_procs=2","min_proc_units=0.25)", R"(desired_procs=0","min_proc_units=0.00)"},
        // Memory.
        {[](Given& g) { g.host.m_maxMemPools = 1; g.memory.m_Data.m_Weight = 7; }, R"("min_mem)", R"("mem_mode=ded","mem_weight=7","min_mem)"},
        {[](Given& g) { g.host.m_maxMemPools = 1; g.memory.m_Data.m_ConsumerVisibility = 3; }, R"("min_mem=1024","desired_mem=2048","max_mem=4096)", R"("mem_mode=shared","desired_io_entitled_mem=2048","min_mem=256","desired_mem=512","max_mem=768)"},
        {[](Given& g) { g.memory.m_Data.m_ConsumerVisibility = 3; g.memory.m_Data.m_Reservation = 1023; }, R"("min_mem=1024","desired_mem=2048","max_mem=4096)", R"("desired_io_entitled_mem=auto","min_mem=256","desired_mem=512","max_mem=768)"},
        {[](Given& g) { g.memory.m_Data.m_ConsumerVisibility = 3; g.memory.m_Data.m_Reservation = -1; }, R"("min_mem=1024","desired_mem=2048","max_mem=4096)", R"("min_mem=256","desired_mem=512","max_mem=768)"},
        // Lists, and tags of slots.
        {[](Given& g) { g.lists = {{12, "A//1,B//0"}, {10, "2/0/1//0/1,3/1/1/\"5,7\"/0/0"}, {21, "4/server/1/any//any/0"}, {6, "5/client/1//13/1,6/server/any//any/0"}}; g.tags = {1, 2, 4}; },
         R"("max_mem=4096")", R"("max_mem=4096","virtual_scsi_adapters=5/client/1//13/1,6/server/any//any/0","virtual_serial_adapters=4/server//any//any/0","virtual_eth_adapters=2/0/1///1,""3/1/1/5,7//0""","io_slots=A//1,B//0")"},
        {[](Given& g) { g.isOSQ00 = true; }, R"("max_mem=4096")", R"("max_mem=4096","load_source_slot=none","console_slot=dnx")"},
        {[](Given& g) { g.isOSQ00 = true; g.lists = {{12, "A//1,B//0"}}; g.tags = {1, 2, 4, 5, 6, 1, 3}; }, R"("max_mem=4096")",
         R"("max_mem=4096","io_slots=A//1,B//0","load_source_slot=B","alt_restart_device_slot=A","console_slot=B","alt_console_slot=B","op_console_slot=B")"},
    };
    for (const Row& row : rows) {
        Given g;
        row.change(g);
        EXPECT_EQ(changed(base, row), made(g));
    }
}

TEST_F(VirtualSystemVisitorWriteTest, ChangesProfiles) {
    const std::string base = R"(-r|prof|-m|1111-AAA*0000001|-i|"name=normal","lpar_id=3","proc_mode=shared","shared_proc_pool_id=1","sharing_mode=uncap","uncap_weight=128","min_procs=1","desired_procs=2","max_procs=4","min_proc_units=0.25","desired_proc_units=1.25","max_proc_units=2.05",)"
        R"("min_mem=1024","desired_mem=2048","max_mem=4096","load_source_slot=none","console_slot=dnx")";
    const Row rows[] = {
        {[](Given&) {}, "", ""},
        {[](Given& g) { g.profile = "a\"b"; }, "name=normal", "name=a\"\"b"},
        {[](Given& g) { g.processor.m_Data.m_PoolID = "PRIMORDIAL"; }, "\"shared_proc_pool_id=1\",", ""},
        {[](Given& g) { g.processor.m_Data.m_SharingMode = "cap"; }, R"(uncap","uncap_weight=128)", "cap"},
        {[](Given& g) { g.processor.m_Data.m_ProcCompatMode = "CORAL7"; }, "\"min_procs", R"("lpar_proc_compat_mode=CORAL7","min_procs)"},
        {[](Given& g) { g.processor.m_Data.m_ConsumerVisibility = 2; g.processor.m_Data.m_SharingMode = "keep_idle_procs"; g.processor.m_Data.m_PoolID = "Primordial"; }, R"(shared","shared_proc_pool_id=1","sharing_mode=uncap","uncap_weight=128)", R"(ded","sharing_mode=keep_idle_procs)"},
        {[](Given& g) { g.memoryPools = 1; g.memory.m_Data.m_ConsumerVisibility = 3; g.memory.m_Data.m_Weight = 0; }, R"("min_mem=1024","desired_mem=2048","max_mem=4096)", R"("mem_mode=shared","desired_io_entitled_mem=2048","mem_weight=0","min_mem=256","desired_mem=512","max_mem=768)"},
        {[](Given& g) { g.memory.m_Data.m_Minimum = g.memory.m_Data.m_Limit = -1; }, R"("min_mem=1024","desired_mem=2048","max_mem=4096)", R"("desired_mem=2048)"},
        {[](Given& g) { g.memories = 0; g.lists = {{12, "A//1"}}; g.tags = {6, 4}; }, R"("min_mem=1024","desired_mem=2048","max_mem=4096","load_source_slot=none","console_slot=dnx")", R"("io_slots=A//1","load_source_slot=none","console_slot=A","op_console_slot=A")"},
    };
    for (const Row& row : rows) {
        Given g;
        row.change(g);
        EXPECT_EQ(changed(base, row), received([&] { EXPECT_EQ(0, m_settings.ModifyResourcesOfProfile(g.make().get(), Caller::CH_OP_MODIFY)); }));
    }
    Given lists;
    lists.processors = lists.memories = 0;
    lists.lists = {{6, "5/client/any//any/1"}, {10, "3/1/1/5/2/0/v w"}};
    const std::string front = R"(-r|prof|-m|1111-AAA*0000001|-i|"name=normal","lpar_id=3",)";
    EXPECT_EQ(front + R"("virtual_scsi_adapters+=5/client/any//any/1","virtual_eth_adapters+=""3/1/1/5/2/0/v w""","load_source_slot+=none","console_slot+=dnx")", received([&] { m_settings.AddIOResources(lists.make().get()); }));
    EXPECT_EQ(front + R"("virtual_scsi_adapters-=5/client/any//any/1","virtual_eth_adapters-=""3/1/1/5/2/0/v w""","load_source_slot-=none","console_slot-=dnx")", received([&] { m_settings.RemoveIOResources(lists.make().get()); }));
    lists.profile = "day, \"2\"";
    EXPECT_EQ(front + R"("max_virtual_slots=16","auto_start=1","boot_mode=norm","new_name=day, ""2""","conn_monitoring=0","redundant_err_path_reporting=1")", received([&] { m_settings.ModifySystemSetting(lists.make().get(), "normal"); }));
    lists.slots = -1;
    lists.bootMode = lists.profile = "";
    EXPECT_EQ(front + R"("auto_start=1","conn_monitoring=0","redundant_err_path_reporting=1")", received([&] { m_settings.ModifySystemSetting(lists.make().get(), "normal"); }));
}

TEST_F(VirtualSystemVisitorWriteTest, WritesLists) {
    const struct {
        int type;
        const char* list;
        const char* written;
        std::function<void(zemRASD&)> change = {};
    } rows[] = {
        {6, "4/client/2//5/1,3/server/any//any/0", "4/client/2//5/1,3/server/any//any/0"},
        {6, "4/client/any//5/9", "4/client/any//any/0"},
        {6, "4/server/2//any/1", R"(\"\"4/server/2,9\"\"\"\"//any/1\"\")", [](zemRASD& r) { dynamic_cast<zemVSCSIRASD&>(r).m_Data.m_RemoteVirtualSystemID = "2,9\""; }},
        {21, "4/server/1/2//7/0,5/client/0/2//8/1", "4/server//2//7/0,5/client//2//8/1"},
        {10, "2/1/1//0/1,3/0/4//2/0/sw", "2/1/1///1,3/0/4//2/0/sw"},
        {10, "3/1/1/\"5,7\"/2/0/sw", R"(\"\"3/1/1/5,7/2/0/sw\"\")"},
        {10, "3/1/1/5/0/0", R"(\"\"3/1/1/5//0\"\")"},
        {10, "3/1/1//0/0", R"(\"\"3/1/1///0/a,b\\\"\")", [](zemRASD& r) { dynamic_cast<zemVETHRASD&>(r).m_Data.m_vswitch = "a,b\\"; }},
        {12, "30000001/none/1,30000002//0", "30000001//1,30000002//0"},
        {12, "30000001//1", "30000001//0", [](zemRASD& r) { r.setInstanceID("ORX:2*p-30000001*3*1111-AAA*0000001", kHost); r.getData()->m_IsRequired = 2; }},
        {5, "", ""},
    };
    for (const auto& row : rows) {
        zemVSSD vssd;
        zemVSSDVisitor::createIORASDs(row.list, row.type, &vssd);
        if (row.change) {
            row.change(*vssd.getRASDs().getElementAt(0));
        }
        EXPECT_STREQ(row.written, zemVSSDVisitor::getIOSettingString(&vssd, row.type)) << row.list;
        EXPECT_GE(1, vssd.getRASDs().size() == 0 ? 0 : vssd.getRASDs().getElementAt(0)->getData()->m_IsRequired);
    }
}

TEST_F(VirtualSystemVisitorWriteTest, RefusesBeforeAToolRuns) {
    const struct {
        Change change;
        const char* text;
    } rows[] = {
        {[](Given& g) { g.processors = 2; }, "3/zemCECVisitor/createLPAR//Duplicated Processor is specified when creating lpar 3 on 1111-AAA*0000001"},
        {[](Given& g) { g.processors = 0; g.memories = 2; }, "5/zemCECVisitor/createLPAR/Processor/No Processor is specified when creating lpar 3 on 1111-AAA*0000001"},
        {[](Given& g) { g.memories = 2; }, "3/zemCECVisitor/createLPAR//Duplicated Memory is specified when creating lpar 3 on 1111-AAA*0000001"},
        {[](Given& g) { g.memories = 0; }, "5/zemCECVisitor/createLPAR/Memory/No Memory is specified when creating lpar 3 on 1111-AAA*0000001"},
        {[](Given& g) { g.processor.m_Data.m_PoolID = "primordial"; g.host.m_maxProcPools = 2; }, "3/zemCECVisitor/createLPAR//Shared processing units can only be allocated from a shared pool but not \"Primordial\" pool on \"1111-AAA*0000001\"."},
    };
    for (const auto& row : rows) {
        Given g;
        row.change(g);
        EXPECT_EQ("", received([&] { EXPECT_EQ(row.text, failureText([&] { create(g, *g.make()); })); }));
    }
    Given twice;
    twice.memories = 2;
    EXPECT_EQ("", received([&] { EXPECT_EQ("3/zemVSSDVisitor/ModifyResourcesOfProfile//Duplicated Memory is specified when creating lpar 3 on 1111-AAA*0000001", failureText([&] { m_settings.AddIOResources(twice.make().get()); })); }));

    // Dedicated processors stay as they were settled, whoever refuses.
    for (const int memories : {0, 1}) {
        m_tools.script("nwplat", "echo 'WRTL8032 The name \"web\" is taken.' >&2; exit 1");
        Given g;
        g.processor.m_Data.m_ConsumerVisibility = 2;
        g.memories = memories;
        const auto vssd = g.make();
        EXPECT_EQ(memories == 0 ? "5/createLPAR/Memory" : "6/callGenericCommand/WRTL8032", failureText([&] { create(g, *vssd); }, "kmi"));
        const zemRASDCommData& data = *vssd->getRASD("3-Processor")->getData();
        EXPECT_STREQ("share_idle_procs", data.m_SharingMode);
        EXPECT_EQ(25 + 125 * 1000 + 205 * 1000000, data.m_VirtualMinimum + data.m_VirtualQuantity * 1000 + data.m_VirtualMaximum * 1000000);
    }
}

TEST_F(VirtualSystemVisitorWriteTest, ReplacesSettingsOfTheModel) {
    const struct {
        Change change;
        int result;
    } rows[] = {
        {[](Given&) {}, -1},
        {[](Given& g) { g.isDefault = 0; }, -1},
        {[](Given& g) { g.profile = "other"; }, -1},
        {[](Given& g) { g.profile = "NORMAL"; }, 0},
        {[](Given& g) { g.keylock = "manual"; }, 0},
        {[](Given& g) { g.defaultProfile = "x"; }, 0},
        {[](Given& g) { g.type = "osq00"; }, 0},
        {[](Given& g) { g.name = "x"; }, 0},
        {[](Given& g) { g.bootMode = "sms"; }, 0},
        {[](Given& g) { g.monitoring = 1; }, 0},
        {[](Given& g) { g.slots = 17; }, 0},
        {[](Given& g) { g.memoryPools = 1; }, 0},
        {[](Given& g) { g.redundant = -1; }, 0},
        {[](Given& g) { g.autoStart = -1; }, 0},
        {[](Given& g) { g.memories = 0; }, 0},
        {[](Given& g) { g.processor.m_Data.m_Weight = 1; }, 0},
        {[](Given& g) { g.lists = {}; }, 0},
        {[](Given& g) { g.lists = {{10, "3/1/1/5/0/0"}}; }, 0},
        {[](Given& g) { g.lists = {{10, "3/1/1/\"5,7,9\"/0/0"}}; }, 0},
    };
    for (const bool isState : {false, true}) {
        for (const auto& row : rows) {
            Given g;
            g.isState = isState;
            g.lists = {{10, "3/1/1/\"5,7\"/0/0"}};
            zemCEC host(kHost, "alpha");
            host.addLpar(new zemLPAR(kHost, "2"));
            host.addLpar(new zemLPAR(kHost, "3"));
            zemVSSDVisitor visitor(&host, "");
            zemLPAR& lpar = *host.getLPARs().getElementAt(1);
            if (isState) {
                lpar.setStateVSSD(*g.make());
            } else {
                EXPECT_EQ(0, visitor.addData(g.make().release()));
            }
            row.change(g);
            // On the running side, IDs have no profile.
            const int result = isState && g.profile != "normal" ? 0 : row.result;
            zemVSSDAutoRelease data(g.make().release());
            const zemString id = data.get()->getInstanceID();
            testing::internal::CaptureStdout();
            EXPECT_EQ(result, visitor.modifyData(data.get()));
            EXPECT_EQ("zemVSSDVisitor::modifyData-> return " + std::to_string(result) + '\n', testing::internal::GetCapturedStdout());
            ASSERT_EQ(isState ? 0 : 1, lpar.getDefinedVSSDs().size());
            EXPECT_EQ(!isState && result == 0, data.get() == lpar.getDefinedVSSDs().getElementAt(0));
            if (!isState && result == 0) {
                data.release();
            }
            EXPECT_EQ(0, visitor.removeData(id));
            EXPECT_EQ(!isState && g.profile == "other" ? 1 : 0, lpar.getDefinedVSSDs().size());
        }
    }
}

TEST_F(VirtualSystemVisitorWriteTest, TakesIdsAndClassesApart) {
    const struct {
        const char* id;
        int type;
        const char* expected;
    } ids[] = {
        {"ORX:4*3*1111-AAA*0000001", 3, "ORX:4*3*1111-AAA*0000001"},
        {"ORX:2*p-3*1111-AAA*0000001", 4, "ORX:2*p-3*1111-AAA*0000001"},
        {"ORX:4*5*3*1111-AAA*0000001", 10, "ORX:4*3*1111-AAA*0000001"},
        {"ORX:2*my-p*x-5*3*1111-AAA*0000001", 6, "ORX:2*my-p*x-3*1111-AAA*0000001"},
        {"ORX:2*p-30000001*3*1111-AAA*0000001", 12, "ORX:2*p-3*1111-AAA*0000001"},
        {"ORX:2*p-5*3*1111-AAB*0000002", 21, ""},
        {"ORX:2*p-5*3*1111-AAA*0000001 ", 3, ""},
        {"ORX:2*p5*3*1111-AAA*0000001", 12, ""},
        {"ORX:2*p-5*1111-AAA*0000001", 12, ""},
        {"*1111-AAA*0000001", 12, ""},
        {"", 3, ""},
    };
    for (const auto& row : ids) {
        EXPECT_STREQ(row.expected, zemVSSDVisitor::ConstructVSSDInstanceIDFromRASDInstanceID(&m_host, row.id, row.type)) << row.id;
    }
    EXPECT_EQ(3, zemVSSDVisitor::getResourceType("orxc_processorRASettingData"));
    EXPECT_EQ(21, zemVSSDVisitor::getResourceType("ORXC_SerialAdapterRASettingData"));
    EXPECT_EQ("3/zemVSSDVisitor/getResourceType//Not support to such resource class \"ORXC_X\" ", failureText([] { zemVSSDVisitor::getResourceType("ORXC_X"); }));
}

TEST_F(VirtualSystemVisitorWriteTest, ChangesPartitions) {
    zemVSSD none(kHost, "3", ""), all("3", kHost, "", 0, "a\"b", "", "", 0, 0, 0, 0, "manual", "day");
    const auto rasd = [](int type, const char* element) { return std::unique_ptr<zemRASD>(zemVSSDVisitor::createIORASD(element, type)); };
    const auto io = [&](zemRASD* r, Caller::CH_OP_TYPE op, const char* host = kHost) { return m_partitions.ChangeRunningIOResource(host, "3", r, nullptr, nullptr, op); };
    const auto trunk = rasd(10, "5/1/7/\"20,30\"/2/1/s w"), plain = rasd(10, "6/0/1//0/0"), slot = rasd(12, "210//1"), scsi = rasd(6, "3/client/1//13/1"), open = rasd(6, "4/server/any//any/0"), serial = rasd(21, "9/server/1/4//any/0");
    zemVETHRASD bare("10-8");
    zemProcessorRASD processor;
    const struct {
        std::function<int()> change;
        const char* expected;
        int result = 0;
    } rows[] = {
        {[&] { return m_partitions.deleteLpar("a \"b", "3"); }, "-r|lpar|-m|a \"b|--id|3"},
        {[&] { return m_settings.deleteLparProfile(kHost, "3", "d, \"e"); }, "-r|prof|-m|1111-AAA*0000001|--id|3|-n|d, \"e"},
        {[&] { return m_partitions.ChangeKeyLock(&none, "norm"); }, "-r|lpar|-o|chkey|-k|norm|--id|3|-m|1111-AAA*0000001"},
        {[&] { return m_partitions.ModifyLparProperties(&none); }, ""},
        {[&] { return m_partitions.ModifyLparProperties(&all); }, "-r|lpar|-o|chkey|-k|manual|--id|3|-m|1111-AAA*0000001"},
        {[&] { return io(slot.get(), Caller::CH_OP_ADD); }, "-r|io|--rsubtype|slot|-o|a|-m|1111-AAA*0000001|--id|3|-l|210"},
        {[&] { return io(slot.get(), Caller::CH_OP_REMOVE, "a b\" -o x"); }, "-r|io|--rsubtype|slot|-m|a b\" -o x|-o|r|--id|3|-l|210"},
        {[&] { return io(trunk.get(), Caller::CH_OP_ADD); }, R"(-r|virtualio|--rsubtype|eth|-o|a|-m|1111-AAA*0000001|--id|3|-s|5|-a|"ieee_virtual_eth=1","port_vlan_id=7","is_trunk=1","trunk_priority=2","addl_vlan_ids=20,30","vswitch=s w")"},
        {[&] { return io(plain.get(), Caller::CH_OP_ADD); }, R"(-r|virtualio|--rsubtype|eth|-o|a|-m|1111-AAA*0000001|--id|3|-s|6|-a|"ieee_virtual_eth=0","port_vlan_id=1","is_trunk=0")"},
        {[&] { return io(&bare, Caller::CH_OP_ADD); }, "-r|virtualio|--rsubtype|eth|-o|a|-m|1111-AAA*0000001|--id|3|-s|8"},
        {[&] { return io(scsi.get(), Caller::CH_OP_ADD); }, R"(-r|virtualio|--rsubtype|scsi|-o|a|-m|1111-AAA*0000001|--id|3|-s|3|-a|"adapter_type=client","remote_slot_num=13","remote_lpar_id=1")"},
        {[&] { return io(open.get(), Caller::CH_OP_ADD); }, R"(-r|virtualio|--rsubtype|scsi|-o|a|-m|1111-AAA*0000001|--id|3|-s|4|-a|"adapter_type=server","remote_slot_num=any")"},
        {[&] { return io(serial.get(), Caller::CH_OP_ADD); }, R"(-r|virtualio|--rsubtype|serial|-o|a|-m|1111-AAA*0000001|--id|3|-s|9|-a|"adapter_type=server","remote_slot_num=any","remote_lpar_id=4")"},
        {[&] { return io(trunk.get(), Caller::CH_OP_REMOVE); }, "-r|virtualio|--rsubtype|eth|-m|1111-AAA*0000001|-o|r|--id|3|-s|5"},
        {[&] { return io(scsi.get(), Caller::CH_OP_REMOVE); }, "-r|virtualio|--rsubtype|scsi|-m|1111-AAA*0000001|-o|r|--id|3|-s|3"},
        {[&] { return io(serial.get(), Caller::CH_OP_REMOVE); }, "-r|virtualio|--rsubtype|serial|-m|1111-AAA*0000001|-o|r|--id|3|-s|9"},
        {[&] { return io(slot.get(), Caller::CH_OP_MODIFY); }, "", -1},
        {[&] { return io(&processor, Caller::CH_OP_ADD); }, "", -1},
    };
    for (const auto& row : rows) {
        EXPECT_EQ(row.expected, received([&] { EXPECT_EQ(row.result, row.change()); }));
    }
    // The name goes before the keylock; where it fails, the keylock stays.
    m_tools.script("edpower", "exit 0");
    EXPECT_EQ(R"(-r|lpar|-m|1111-AAA*0000001|-i|"lpar_id=3","default_profile=day","new_name=a""b")", received([&] { EXPECT_EQ(0, m_partitions.ModifyLparProperties(&all)); }));
    m_tools.recorder("edpower");
    for (const char* id : {"WRTL8010", "WRTL8011", "WRTL8018", "WRTL8032"}) {
        m_tools.script("edplat", std::string("echo ") + id + " text; exit 1");
        const std::string from = std::strcmp(id, "WRTL8032") == 0 ? "6/zemCommandCaller/callGenericCommand/" : "5/zemVirtualSystem/setDefaultProfile/";
        EXPECT_EQ("", received([&] { EXPECT_EQ(from + id + '/' + id + " text", failureText([&] { m_partitions.ModifyLparProperties(&all); })); }));
    }
}

TEST_F(VirtualSystemVisitorWriteTest, ChangesRunningQuantities) {
    struct Side {
        std::int64_t reservation, quantity;
        int weight = -1;
        const char* sharing = "";
    };
    enum { MEM = 4, PROC = 3, OTHER = 10 };
    constexpr int kMega = 1024;
    const struct {
        int type, visibility;
        Side before, now;
        const char* expected;  ///< behind what all lines have; null: -1
    } rows[] = {
        {MEM, 2, {kMega, 9}, {3 * kMega, 0}, "a|-q|2"},
        {MEM, 2, {3 * kMega, 0}, {kMega, 5}, "r|-q|2"},
        {MEM, 3, {kMega, kMega}, {3 * kMega, 2 * kMega}, "a|--entitled|2|-q|1"},
        {MEM, 3, {kMega, 2 * kMega}, {3 * kMega, kMega}, "a|--entitled|2|-q|1"},
        {MEM, 3, {3 * kMega, kMega}, {kMega, 2 * kMega}, "r|--entitled|2|-q|1"},
        {MEM, 3, {7, 2 * kMega}, {7, kMega}, "r|-q|1"},
        {MEM, 3, {7, kMega}, {-1, 2 * kMega}, "a|-q|1"},
        {MEM, 3, {7, 7, 1}, {7, 7, 2}, "s|-a|mem_weight=2"},
        {MEM, 3, {7, 7, 1}, {-1, -1, 1}, nullptr},
        {MEM, 2, {7, 7, 1}, {7, 9, -1}, nullptr},
        {PROC, 2, {100, 0}, {300, 0}, "a|--procs|2"},
        {PROC, 2, {300, 0}, {100, 0}, "r|--procs|2"},
        {PROC, 3, {50, 100}, {125, 200}, "a|--procs|1|--procunits|0.75"},
        {PROC, 3, {125, 200}, {50, 200}, "r|--procunits|0.75"},
        {PROC, 3, {125, 200}, {125, 400}, "a|--procs|2"},
        {PROC, 3, {-1, -1}, {-1, 200}, "a|--procs|2"},
        {PROC, 3, {5, 5, 1, "cap"}, {5, 5, 9, "uncap"}, "s|-a|sharing_mode=uncap,uncap_weight=9"},
        {PROC, 3, {5, 5, 1, "cap"}, {5, 5, -1, "uncap"}, "s|-a|sharing_mode=uncap"},
        {PROC, 3, {5, 5, 1, "cap"}, {5, 5, 1, ""}, nullptr},
        {PROC, 3, {5, 5, 1, "cap"}, {5, 5, 1, "cap"}, nullptr},
        {OTHER, 3, {5, 5}, {5, 6}, nullptr},
        {PROC, 1, {5, 5}, {5, 6}, ""},
    };
    const auto fill = [](zemRASDCommData& data, const Side& side) {
        data.m_Reservation = side.reservation;
        data.m_VirtualQuantity = side.quantity;
        data.m_Weight = side.weight;
        data.m_SharingMode = side.sharing;
    };
    for (const auto& row : rows) {
        const std::unique_ptr<zemRASD> before(zemVSSD::createRASD(row.type, "")), now(before->clone());
        fill(*before->getData(), row.before);
        fill(*now->getData(), row.now);
        before->getData()->m_ConsumerVisibility = row.visibility;
        const bool runs = row.expected != nullptr && *row.expected != '\0';
        const std::string all = received([&] {
            const auto change = [&] { EXPECT_EQ(runs ? 0 : -1, m_partitions.ChangeRunningMemProcResource(kHost, "3", before.get(), now.get(), nullptr, nullptr)); };
            EXPECT_EQ(row.visibility == 1 ? "6/ConsumerVisibility is not correct, ConsumerVisibility should be 3 when shared mode, ConsumerVisibility should be 2 dedicated mode " : "", failureText(change, "kt"));
        });
        const std::string behind = runs ? row.expected : "";
        EXPECT_EQ(runs ? std::string("-r|") + (row.type == MEM ? "mem" : "proc") + "|-m|1111-AAA*0000001|-o|" + behind.substr(0, 1) + "|--id|3" + behind.substr(1) : "", all);
    }
}
// clang-format on

}  // namespace

// The line of every query of every tool, as it is logged and as the tool receives it.

#include <gtest/gtest.h>

#include <ctime>
#include <tuple>

#include "CommandLine.h"
#include "QyallocCmdCaller.h"
#include "QyfaultCmdCaller.h"
#include "QylinkCmdCaller.h"
#include "QylwhCmdCaller.h"
#include "QymoveCmdCaller.h"
#include "QyplatCmdCaller.h"
#include "QyusageCmdCaller.h"
#include "ToolFolder.h"

namespace {

using Alloc = zemQyallocCmdCaller;
using IO = Alloc::PhyIOResourceAttribute;
using Mem = Alloc::MemoryResourceAttribute;
using Proc = Alloc::ProcessorResourceAttribute;
using Virt = Alloc::VirtualIOResourceAttribute;

struct Row {
    std::string line;  // up to the fields
    long count;        // of the fields, when all are asked for
    std::string last;  // of them
    std::function<zemRecordSetsType()> query;
};

void checkAll(const std::vector<Row>& rows) {
    for (const Row& row : rows) {
        ToolFolder tools;
        const std::string tool = row.line.substr(0, row.line.find(' '));
        tools.recorder(tool, "1\n2\n");
        testing::internal::CaptureStdout();
        const zemRecordSetsType records = row.query();
        const std::string log = testing::internal::GetCapturedStdout();
        const size_t begin = log.find("<zem350Log-prefix>" + row.line + " -F ") + 18;
        ASSERT_GE(begin, 18U) << row.line << '\n' << log;
        const std::string line = log.substr(begin, log.find('\n', begin) - begin);
        std::string logged;
        for (const auto& argument : zemSplitCommandLine(line.c_str()).arguments)
            logged += argument + '|';
        EXPECT_EQ(logged, tool + '|' + tools.arguments() + '|');
        const std::string fields = line.substr(row.line.size() + 4);
        EXPECT_EQ(row.count, fields.empty() ? 0 : std::count(fields.begin(), fields.end(), ',') + 1)
            << line;
        EXPECT_EQ(row.last, fields.substr(fields.rfind(',') + 1)) << line;
        EXPECT_EQ(2, records.size()) << line;
    }
}

// clang-format off
TEST(QueryCallersTest, QyallocLines) {
    Alloc q("", "");
    int* const all = nullptr;
    const std::string m = " -m \"m\"";
    const std::string mf = m + " --filter \"lpar_ids=1\"";
    const std::string mem = "qyalloc -r mem", proc = "qyalloc -r proc", hca = "qyalloc -r hca";
    const std::string io = "qyalloc -r io --rsubtype", vio = "qyalloc -r virtualio --rsubtype";
    const auto at = [&](zemRecordSetsType (Alloc::*get)(int*, const char*, const char*)) {
        return [&q, get] { return (q.*get)(nullptr, "m", "\"lpar_ids=1\""); };
    };
    const auto virt = [&](int subType, int level) {
        return [&q, subType, level] {
            return q.getVirtualIOResources(nullptr, "m", static_cast<Virt::SubType>(subType),
                                           static_cast<Virt::Level>(level), nullptr);
        };
    };
    checkAll({
        {"qyalloc -r mempool" + mf, 8, "psp_ids", at(&Alloc::getMemPoolInfo)},
        {"qyalloc -r procpool" + mf, 7, "lpar_ids", at(&Alloc::getProcPoolInfo)},
        {"qyalloc -r procpool", 7, "lpar_ids", [&] { return q.getProcPoolInfo(all, "", ""); }},
        {"qyalloc -r sni" + mf, 0, "", at(&Alloc::getSNIAdapterResources)},
        {hca + " --level lpar" + mf, 0, "", at(&Alloc::getPartitionHCAResources)},
        {hca + " --level sys" + mf, 0, "", at(&Alloc::getSystemHCAResources)},
        {mem + " --level lpar" + mf, 24, "curr_psp_name", at(&Alloc::getPartitionMemoryResources)},
        {mem + " --level sys" + m, 9, "required_min_mem_osq00",
         [&] { return q.getSystemMemoryResources(all, "m", 0, nullptr); }},
        {mem + " --level sys --maxmem 512" + m, 10, "max_mem_pools",
         [&] { return q.getSystemMemoryResources(all, "m", 512, nullptr); }},
        {mem + " --level lpar", 24, "curr_psp_name",
         [&] { return q.getMemoryResources(all, nullptr, Mem::LEVEL_LPAR, 512, nullptr); }},
        {mem + m, 0, "", [&] { return q.getMemoryResources(all, "m", Mem::LEVEL_NO_APPLICABLE, 1, ""); }},
        {proc + " --level lpar" + mf, 25, "run_uncap_weight", at(&Alloc::getPartitionProcessorResources)},
        {proc + " --level pool" + mf, 4, "pend_avail_pool_proc_units", at(&Alloc::getSharedProcessorPoolResources)},
        {proc + " --level sys" + m, 9, "pend_pool_mem",
         [&] { return q.getSystemProcessorResources(all, "m", 0, nullptr); }},
        {proc + " --level sys --procunits 3" + m, 9, "pend_pool_mem",
         [&] { return q.getSystemProcessorResources(all, "m", 3, ""); }},
        {proc, 0, "", [&] { return q.getProcessorResources(all, "", Proc::LEVEL_NO_APPLICABLE, 3, ""); }},
        {vio + " eth" + mf + " --level lpar", 11, "trunk_priority", at(&Alloc::getPartitionVirtualEthernetResources)},
        {vio + " eth" + mf + " --level sys", 2, "mac_prefix", at(&Alloc::getSystemVirtualEthernetResources)},
        {vio + " scsi" + mf + " --level lpar", 10, "backing_devices", at(&Alloc::getPartitionVirtualSCSIResources)},
        {vio + " serial" + mf + " --level lpar", 11, "remote_slot_num", at(&Alloc::getPartitionVirtualSerialResources)},
        {vio + " slot" + mf + " --level lpar", 4, "pend_max_virtual_slots", at(&Alloc::getPartitionVirtualIOSlotResources)},
        {vio + " slot" + mf + " --level slot", 6, "drc_name", at(&Alloc::getVirtualIOSlotResources)},
        {vio + " hsl" + mf, 3, "lpar_ids", at(&Alloc::getHSLOptiConnectResources)},
        {vio + " virtualopti" + mf, 3, "lpar_ids", at(&Alloc::getVirtualOptiConnectResources)},
        {vio + " hsl" + m + " --level sys", 3, "lpar_ids", virt(1, 2)},
        {vio + " eth" + m + " --level slot", 0, "", virt(0, 1)},
        {vio + " scsi" + m + " --level sys", 0, "", virt(3, 2)},
        {vio + " serial" + m + " --level slot", 0, "", virt(4, 1)},
        {vio + " slot" + m, 0, "", virt(5, -1)},
        {vio + m + " --level lpar", 0, "", virt(9, 0)},
        {io + " bus" + mf, 5, "bus_drc_name", at(&Alloc::getPhysicalIOBusResources)},
        {io + " iopool" + mf + " --level pool", 1, "max_io_pools", at(&Alloc::getIOPoolResources)},
        {io + " iopool" + mf + " --level pool", 1, "max_io_pools", at(&Alloc::getSystemIOPoolResources)},
        {io + " slot" + mf, 18, "drc_name", at(&Alloc::getPhysicalIOSlotResources)},
        {io + " unit" + mf, 1, "unit_phys_loc", at(&Alloc::getPhysicalIOUnitResources)},
        {io + " taggedio" + mf, 8, "op_console_slot", at(&Alloc::getPhysicalTaggedIOResources)},
        {io + " unit --level sys", 1, "unit_phys_loc",
         [&] { return q.getPhysicalIOResources(all, "", IO::SUBTYPE_UNIT, IO::LEVEL_SYS, nullptr); }},
    });
}

TEST(QueryCallersTest, LinesOfTheOtherTools) {
    zemQyplatCmdCaller plat("", "");
    zemQymoveCmdCaller move("", "");
    zemQyfaultCmdCaller fault("", "");
    zemQylinkCmdCaller link("", "");
    zemQyusageCmdCaller usage("", "");
    int* const all = nullptr;
    tm* const open = nullptr;
    const std::string samples = " --filter \"event_types=sample\"";
    const std::string from = " --startyear 2013 --startmonth 1 --startday 2 --starthour 3 ";
    const std::string to = " --endyear 2013 --endmonth 12 --endday 31 --endhour 23 ";
    time_t first = 1357097999;  // a second before four
    time_t last = 1388530800;
    tm begin = *gmtime(&first);
    tm end = *gmtime(&last);
    checkAll({
        {"qyplat -r sys -m \"m\"", 62, "active_mem_sharing_capable", [&] { return plat.getManagedSystemInformation(all, "m"); }},
        {"qyplat -r sys", 62, "active_mem_sharing_capable", [&] { return plat.getManagedSystemInformation(all, ""); }},
        {"qyplat -r lpar -m \"m\" --filter x", 23, "remote_restart_status", [&] { return plat.getPartitionsInformation(all, "m", "x"); }},
        {"qyplat -r prof --filter x", 44, "redundant_err_path_reporting", [&] { return plat.getPartitionsProfileInformation(all, nullptr, "x"); }},
        {"qymove -r manager", 1, "remote_lpar_mobility_capable", [&] { return move.getManagerSystemCapabilities(all); }},
        {"qymove -r sys -m \"m\"", 6, "num_active_migrations_in_progress", [&] { return move.getManagedSystemCapabilities(all, "m"); }},
        {"qymove -r sys", 6, "num_active_migrations_in_progress", [&] { return move.getManagedSystemCapabilities(all, nullptr); }},
        {"qymove -r lpar -m \"\" --filter x", 14, "bytes_remaining", [&] { return move.getPartitionsMigrationState(all, "", "x"); }},
        {"qyfault -r sys -m \"m\"", 2, "refcode", [&] { return fault.getManagedSystemInformation(all, "m"); }},
        {"qyfault -r lpar --filter x", 6, "fru_call_out_loc_codes", [&] { return fault.getPartitionsInformation(all, "", "x"); }},
        {"qylink -r all -m \"m\"", 8, "connection_error_code", [&] { return link.getQylinkInformation(all, "m"); }},
        {"qyusage -r config -m \"m\" -n 1", 3, "sample_rate", [&] { return usage.getConfigurationSettings(all, "m", "-n 1"); }},
        {"qyusage -r config ", 3, "sample_rate", [&] { return usage.getConfigurationSettings(all, nullptr, ""); }},
        {"qyusage -r lpar -m \"\" " + samples + ",lpar_ids=2" + from + to, 16, "mem_mode",
         [&] { return usage.getPartitionsMetrics(all, "", "lpar_ids=2", &begin, &end, ""); }},
        {"qyusage -r lpar -n 1" + samples + to, 16, "mem_mode",
         [&] { return usage.getPartitionsMetrics(all, nullptr, "", -1, static_cast<int>(last), "-n 1"); }},
        {"qyusage -r sys -m \"m\" " + samples, 12, "proc_cycles_per_second",
         [&] { return usage.getManagedSystemMetrics(all, "m", open, open, nullptr); }},
        {"qyusage -r sys -m \"m\" " + samples + from, 12, "proc_cycles_per_second",
         [&] { return usage.getManagedSystemMetrics(all, "m", static_cast<int>(first), -1, ""); }},
    });
}
// clang-format on

TEST(QueryCallersTest, EnumeratorsArePositionsAndKeys) {
    using System = zemQyplatCmdCaller::ManagedSystemAttribute;
    const std::tuple<int, System::Attribute, const char*> rows[] = {
        {0, System::ATTR_NAME, "name"},
        {28, System::ATTR_7460_APPLICATION_CAPABLE, "7460_application_capable"},
        {34, System::ATTR_ASSIGN_7460_WKL_PERCENT, "assign_7460_wkl_percent"},
        {50, System::ATTR_SP_BOTT_MINOR_TYPE, "sp_boot_minor_type"},
        {52, System::ATTR_CURR_MFG_DEFAULT_IPL_SOURCW, "curr_mfg_default_ipl_source"},
        {58, System::ATTR_CORALHV_LPAR_REMOTE_RESTART_CAPABLE,
         "coralhv_lpar_remote_restart_capable"},
        {61, System::ATTR_ACTIVE_MEMORY_SHARING_CAPABLE, "active_mem_sharing_capable"},
    };
    for (const auto& [position, attribute, name] : rows) {
        EXPECT_EQ(position, attribute);
        EXPECT_STREQ(name, System::m_attributeName[attribute]);
    }
    EXPECT_EQ(-1, System::ATTR_END);
    EXPECT_EQ(18, zemQyplatCmdCaller::PartitionAttribute::ATTR_MIGRATION_STATE);
    EXPECT_EQ(43, zemQyplatCmdCaller::PartitionProfileAttribute::ATTR_REDUNDANT_ERR_PATH_REPORTING);

    ToolFolder tools;
    tools.recorder("qyplat", "one,\"two,2\"\n");
    int wanted[] = {System::ATTR_SERIAL_NUM, System::ATTR_NAME, System::ATTR_END};
    zemQyplatCmdCaller caller(nullptr, nullptr);
    const zemRecordSetsType hosts = caller.getManagedSystemInformation(wanted, "m x");
    EXPECT_EQ("-r|sys|-m|m x|-F|serial_num,name", tools.arguments());
    EXPECT_STREQ("two,2", (*hosts.getElementAt(0))[System::ATTR_NAME]);
}

TEST(QueryCallersTest, ListsAndNumbersOfPools) {
    ToolFolder tools;
    tools.recorder("qyalloc", "5\n");
    Alloc caller("", "");
    // A list may name the last row without the option that it belongs to.
    int pools[] = {Mem::SysLevelAttribute::ATTR_MAX_MEM_POOLS, Mem::SysLevelAttribute::ATTR_END};
    const zemRecordSetsType limits = caller.getSystemMemoryResources(pools, "m", 0, nullptr);
    EXPECT_EQ("-r|mem|--level|sys|-m|m|-F|max_mem_pools", tools.arguments());
    EXPECT_STREQ("5", (*limits.getElementAt(0))[pools[0]]);
    int wanted[] = {0, -1};  // of an empty table: nothing to ask for
    EXPECT_EQ(1, caller.getSystemHCAResources(wanted, "m", nullptr).size());
    EXPECT_EQ("-r|hca|--level|sys|-m|m|-F", tools.arguments());

    tools.recorder("qyalloc", "a\nb\nc\n");
    EXPECT_EQ(3, caller.getProcPoolNum(nullptr, "m"));
    EXPECT_EQ(3, caller.getMemPoolNum(wanted, "m"));
    EXPECT_EQ("-r|mempool|-m|m|-F|curr_pool_mem", tools.arguments());
}

TEST(QylwhCmdCallerTest, NamesTheSingleHost) {
    ToolFolder tools;
    zemQylwhCmdCaller caller("");
    tools.script("qylwh", "echo 1111-AAB,0000002,1");
    EXPECT_TRUE(caller.isLWH());
    EXPECT_STREQ("1*1111-AAB*0000002", caller.getLWHName());
    tools.script("qylwh", "echo WRTL1 no >&2; exit 1");
    EXPECT_FALSE(caller.isLWH());
    EXPECT_THROW(caller.getLWHName(), zemOperationFailedException);
    tools.restoreTool("qylwh");
    EXPECT_THROW(caller.isLWH(), zemOperationFailedException);
}

}  // namespace

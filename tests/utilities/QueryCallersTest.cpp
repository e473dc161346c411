// The line of every query of every tool, as it is logged and as the tool receives it.

#include <gtest/gtest.h>

#include <ctime>
#include <tuple>

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
    std::string front;
    std::string takes;  // m: a system that is not empty, M: one that is not null, f: a filter
    std::string back;   // up to the fields
    long count;         // of the fields, when all are asked for
    std::string last;   // of them
    std::function<zemRecordSetsType(const char* system, const char* filter)> query;
};

void check(const Row& row, const char* system, const char* filter) {
    const auto takes = [&row](char what, const char* text) {
        return text != nullptr && row.takes.find(what) != std::string::npos;
    };
    std::string front = row.front;
    if (takes('M', system) || (takes('m', system) && *system != '\0')) {
        front += std::string(" -m \"") + system + '"';
    }
    if (takes('f', filter) && *filter != '\0') {
        front += std::string(" --filter ") + filter;
    }
    front += row.back + " -F ";
    int records = 0;
    const LoggedCall call = logged(row.front.substr(0, row.front.find(' ')), "1\n2\n",
                                   [&] { records = row.query(system, filter).size(); });
    EXPECT_EQ(18U, call.log.find(front)) << front << '\n' << call.log;
    const std::string fields = call.line.substr(front.size());
    EXPECT_EQ(row.count, std::count(fields.begin(), fields.end(), ',') + !fields.empty());
    EXPECT_EQ(row.last, fields.substr(fields.rfind(',') + 1)) << call.line;
    EXPECT_EQ(2, records) << call.line;
}

/// Every field that the appliance's tool is asked for has a value somewhere.
void checkAnswer(const Row& row) {
    zemRecordSetsType records(0, 25, 1);
    EXPECT_EQ("", failureText([&] { records = row.query("", nullptr); })) << row.front;
    std::string without;
    for (int field = 0; field < row.count; ++field) {
        bool found = false;
        for (int i = 0; i < records.size(); ++i) {
            found |= !(*records[i])[field].isEmpty();
        }
        without += found ? "" : std::to_string(field) + ' ';
    }
    EXPECT_EQ("", without) << row.front;
}

void checkAll(const std::vector<Row>& rows) {
    check(rows.front(), nullptr, nullptr);
    for (const Row& row : rows) {
        check(row, "", "");
        check(row, "m", "\"lpar_ids=1\"");
    }
    const testing_support::DemoAppliance appliance(ZEM_PROGRAMS);
    for (const Row& row : rows) {  // there are samples of the last days only
        if (row.count > 0 && row.back.find("year") == std::string::npos) {
            checkAnswer(row);
        }
    }
}

/// A query that takes a list, a system and a filter.
template <class Caller>
auto of(Caller& caller, zemRecordSetsType (Caller::*get)(int*, const char*, const char*)) {
    return [&caller, get](const char* system, const char* filter) {
        return (caller.*get)(nullptr, system, filter);
    };
}

// clang-format off
TEST(QueryCallersTest, PoolsMemoryAndProcessors) {
    Alloc q("", "");
    const auto mem = [&q](auto level, int max) { return [&q, level, max](auto m, auto f) { return q.getMemoryResources(nullptr, m, level, max, f); }; };
    const auto proc = [&q](auto level, int units) { return [&q, level, units](auto m, auto f) { return q.getProcessorResources(nullptr, m, level, units, f); }; };
    checkAll({
        {"qyalloc -r mempool", "mf", "", 8, "psp_ids", of(q, &Alloc::getMemPoolInfo)},
        {"qyalloc -r procpool", "mf", "", 7, "lpar_ids", of(q, &Alloc::getProcPoolInfo)},
        {"qyalloc -r sni", "mf", "", 0, "", of(q, &Alloc::getSNIAdapterResources)},
        {"qyalloc -r hca --level lpar", "mf", "", 0, "", of(q, &Alloc::getPartitionHCAResources)},
        {"qyalloc -r hca --level sys", "mf", "", 0, "", of(q, &Alloc::getSystemHCAResources)},
        {"qyalloc -r hca", "mf", "", 0, "", [&](auto m, auto f) { return q.getHCAResources(nullptr, m, Alloc::HCAResourceAttribute::LEVEL_NO_APPLICABLE, f); }},
        {"qyalloc -r mem --level lpar", "mf", "", 24, "curr_psp_name", of(q, &Alloc::getPartitionMemoryResources)},
        {"qyalloc -r mem --level lpar", "mf", "", 24, "curr_psp_name", mem(Mem::LEVEL_LPAR, 512)},
        {"qyalloc -r mem --level sys", "mf", "", 9, "required_min_mem_osq00", [&](auto m, auto f) { return q.getSystemMemoryResources(nullptr, m, 0, f); }},
        {"qyalloc -r mem --level sys", "mf", "", 9, "required_min_mem_osq00", mem(Mem::LEVEL_SYS, -1)},
        {"qyalloc -r mem --level sys --maxmem 512", "mf", "", 10, "max_mem_pools", [&](auto m, auto f) { return q.getSystemMemoryResources(nullptr, m, 512, f); }},
        {"qyalloc -r mem", "mf", "", 0, "", mem(Mem::LEVEL_NO_APPLICABLE, 1)},
        {"qyalloc -r proc --level lpar", "mf", "", 25, "run_uncap_weight", of(q, &Alloc::getPartitionProcessorResources)},
        {"qyalloc -r proc --level pool", "mf", "", 4, "pend_avail_pool_proc_units", of(q, &Alloc::getSharedProcessorPoolResources)},
        {"qyalloc -r proc --level pool", "mf", "", 4, "pend_avail_pool_proc_units", proc(Proc::LEVEL_POOL, 3)},
        {"qyalloc -r proc --level sys", "mf", "", 9, "pend_pool_mem", [&](auto m, auto f) { return q.getSystemProcessorResources(nullptr, m, 0, f); }},
        {"qyalloc -r proc --level sys --procunits 3", "mf", "", 9, "pend_pool_mem", [&](auto m, auto f) { return q.getSystemProcessorResources(nullptr, m, 3, f); }},
        {"qyalloc -r proc", "mf", "", 0, "", proc(Proc::LEVEL_NO_APPLICABLE, 3)},
    });
}

struct IORow {
    std::string type;
    int level;
    bool everywhere;  // the fields are those of any level
    long count;
    const char* last;
    zemRecordSetsType (Alloc::*wrapper)(int*, const char*, const char*);
};

/// Every subtype at every level, by the general query; those of no row have no fields. The wrappers.
template <class General>
void checkIO(const std::string& front, const std::vector<std::string>& types, const std::vector<std::string>& levels, const std::vector<IORow>& table, General general) {
    Alloc q("", "");
    std::vector<Row> rows;
    for (const IORow& io : table) rows.push_back({front + io.type, "mf", levels[static_cast<size_t>(io.level) + 1], io.count, io.last, of(q, io.wrapper)});
    checkAll(rows);
    for (int type = 0; type < static_cast<int>(types.size()); ++type) {
        for (int level = -1; level + 1 < static_cast<int>(levels.size()); ++level) {
            const std::string& text = types[static_cast<size_t>(type)];
            Row row = {front + text, "mf", levels[static_cast<size_t>(level) + 1], 0, "", [&](auto m, auto f) { return general(q, type, level, m, f); }};
            for (const IORow& io : table)
                if (io.type == text && (io.everywhere || io.level == level)) row.count = io.count, row.last = io.last;
            check(row, "m", "f");
        }
    }
}

TEST(QueryCallersTest, VirtualIO) {
    checkIO("qyalloc -r virtualio --rsubtype", {" eth", " hsl", " virtualopti", " scsi", " serial", " slot", ""}, {"", " --level lpar", " --level slot", " --level sys"}, {
        {" eth", 0, false, 11, "trunk_priority", &Alloc::getPartitionVirtualEthernetResources},
        {" eth", 2, false, 2, "mac_prefix", &Alloc::getSystemVirtualEthernetResources},
        {" scsi", 0, false, 10, "backing_devices", &Alloc::getPartitionVirtualSCSIResources},
        {" serial", 0, false, 11, "remote_slot_num", &Alloc::getPartitionVirtualSerialResources},
        {" slot", 0, false, 4, "pend_max_virtual_slots", &Alloc::getPartitionVirtualIOSlotResources},
        {" slot", 1, false, 6, "drc_name", &Alloc::getVirtualIOSlotResources},
        {" hsl", -1, true, 3, "lpar_ids", &Alloc::getHSLOptiConnectResources},
        {" virtualopti", -1, true, 3, "lpar_ids", &Alloc::getVirtualOptiConnectResources},
    }, [](Alloc& q, int type, int level, auto m, auto f) { return q.getVirtualIOResources(nullptr, m, static_cast<Virt::SubType>(type), static_cast<Virt::Level>(level), f); });
}

TEST(QueryCallersTest, PhysicalIO) {
    checkIO("qyalloc -r io --rsubtype", {" unit", " bus", " slot", " iopool", " taggedio", ""}, {"", " --level sys", " --level pool"}, {
        {" unit", -1, true, 1, "unit_phys_loc", &Alloc::getPhysicalIOUnitResources},
        {" bus", -1, true, 5, "bus_drc_name", &Alloc::getPhysicalIOBusResources},
        {" slot", -1, true, 18, "drc_name", &Alloc::getPhysicalIOSlotResources},
        {" iopool", 1, true, 1, "max_io_pools", &Alloc::getIOPoolResources},
        {" iopool", 1, true, 1, "max_io_pools", &Alloc::getSystemIOPoolResources},
        {" taggedio", -1, true, 8, "op_console_slot", &Alloc::getPhysicalTaggedIOResources},
    }, [](Alloc& q, int type, int level, auto m, auto f) { return q.getPhysicalIOResources(nullptr, m, static_cast<IO::SubType>(type), static_cast<IO::Level>(level), f); });
}

TEST(QueryCallersTest, LinesOfTheOtherTools) {
    zemQyplatCmdCaller plat("", "");
    zemQymoveCmdCaller move("", "");
    zemQyfaultCmdCaller fault("", "");
    zemQylinkCmdCaller link("", "");
    zemQyusageCmdCaller usage("", "");
    setenv("TZ", "XYZ+5", 1);  // seconds are turned into hours of UTC
    tm* const open = nullptr;
    const std::string samples = " --filter \"event_types=sample\"";
    const std::string from = " --startyear 2013 --startmonth 1 --startday 2 --starthour 3 ";
    const std::string early = " --startyear 1969 --startmonth 12 --startday 31 --starthour 23 ";
    const std::string to = " --endyear 2013 --endmonth 12 --endday 31 --endhour 23 ";
    time_t first = 1357097999;  // a second before four
    time_t last = 1388530800;
    tm begin = *gmtime(&first);
    tm end = *gmtime(&last);
    checkAll({
        {"qyplat -r sys", "m", "", 62, "active_mem_sharing_capable", [&](auto m, auto) { return plat.getManagedSystemInformation(nullptr, m); }},
        {"qyplat -r lpar", "mf", "", 23, "remote_restart_status", of(plat, &zemQyplatCmdCaller::getPartitionsInformation)},
        {"qyplat -r prof", "mf", "", 44, "redundant_err_path_reporting", of(plat, &zemQyplatCmdCaller::getPartitionsProfileInformation)},
        {"qymove -r manager", "", "", 1, "remote_lpar_mobility_capable", [&](auto, auto) { return move.getManagerSystemCapabilities(nullptr); }},
        {"qymove -r sys", "M", "", 6, "num_active_migrations_in_progress", [&](auto m, auto) { return move.getManagedSystemCapabilities(nullptr, m); }},
        {"qymove -r lpar", "Mf", "", 14, "bytes_remaining", of(move, &zemQymoveCmdCaller::getPartitionsMigrationState)},
        {"qyfault -r sys", "m", "", 2, "refcode", [&](auto m, auto) { return fault.getManagedSystemInformation(nullptr, m); }},
        {"qyfault -r lpar", "mf", "", 6, "fru_call_out_loc_codes", of(fault, &zemQyfaultCmdCaller::getPartitionsInformation)},
        {"qylink -r all", "m", "", 8, "connection_error_code", [&](auto m, auto) { return link.getQylinkInformation(nullptr, m); }},
        {"qyusage -r config", "M", " -n 1", 3, "sample_rate", [&](auto m, auto) { return usage.getConfigurationSettings(nullptr, m, "-n 1"); }},
        {"qyusage -r config", "M", " ", 3, "sample_rate", [&](auto m, auto) { return usage.getConfigurationSettings(nullptr, m, ""); }},
        {"qyusage -r lpar", "M", " " + samples + ",lpar_ids=2" + from + to, 16, "mem_mode", [&](auto m, auto) { return usage.getPartitionsMetrics(nullptr, m, "lpar_ids=2", &begin, &end, ""); }},
        {"qyusage -r lpar", "M", " -n 1" + samples + to, 16, "mem_mode", [&](auto m, auto) { return usage.getPartitionsMetrics(nullptr, m, "", -1, static_cast<int>(last), "-n 1"); }},
        {"qyusage -r lpar", "M", " " + samples + early, 16, "mem_mode", [&](auto m, auto) { return usage.getPartitionsMetrics(nullptr, m, nullptr, -2, -1, nullptr); }},
        {"qyusage -r lpar", "M", " " + samples, 16, "mem_mode", [&](auto m, auto) { return usage.getPartitionsMetrics(nullptr, m, nullptr, -1, -1, nullptr); }},
        {"qyusage -r sys", "M", " " + samples, 12, "proc_cycles_per_second", [&](auto m, auto) { return usage.getManagedSystemMetrics(nullptr, m, open, open, nullptr); }},
        {"qyusage -r sys", "M", " -n 1" + samples + from + to, 12, "proc_cycles_per_second", [&](auto m, auto) { return usage.getManagedSystemMetrics(nullptr, m, static_cast<int>(first), static_cast<int>(last), "-n 1"); }},
    });
}
// clang-format on

TEST(QueryCallersTest, EnumeratorsArePositions) {
    using System = zemQyplatCmdCaller::ManagedSystemAttribute;
    EXPECT_STREQ("sp_boot_minor_type", System::m_attributeName[System::ATTR_SP_BOTT_MINOR_TYPE]);
    EXPECT_EQ(61, System::ATTR_ACTIVE_MEMORY_SHARING_CAPABLE);
    EXPECT_EQ(18, zemQyplatCmdCaller::PartitionAttribute::ATTR_MIGRATION_STATE);
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
    EXPECT_EQ(3, caller.getProcPoolNum(wanted, "m"));
    EXPECT_EQ("-r|procpool|-m|m|-F|name", tools.arguments());
    EXPECT_EQ(3, caller.getMemPoolNum(wanted, "m"));
    EXPECT_EQ("-r|mempool|-m|m|-F|curr_pool_mem", tools.arguments());
}

TEST(QylwhCmdCallerTest, NamesTheSingleHost) {
    ToolFolder tools;
    zemQylwhCmdCaller caller(geteuid() == 0 ? "nobody" : "");
    tools.script("qylwh", "echo 1111-AAB,0000002,1; [ $(id -u) != 0 ]");
    EXPECT_TRUE(caller.isLWH());
    EXPECT_STREQ("1*1111-AAB*0000002", caller.getLWHName());
    tools.script("qylwh", "echo WRTL1 no >&2; exit 1");
    EXPECT_FALSE(caller.isLWH());
    EXPECT_THROW(caller.getLWHName(), zemOperationFailedException);
    tools.restoreTool("qylwh");
    EXPECT_THROW(caller.isLWH(), zemOperationFailedException);
}

}  // namespace

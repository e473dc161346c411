// The management library: that it and the tools tell one story, and how it refuses.

#include <gtest/gtest.h>

#include <atomic>
#include <chrono>
#include <cstring>
#include <functional>
#include <sstream>
#include <thread>

#include "Failure.h"
#include "Faults.h"
#include "Store.h"
#include "Text.h"
#include "ToolRecords.h"
#include "libapi.h"

namespace {

using appliance::number;
using testing_support::TestAppliance;

using OfAll = apiProp* (*)(const char*, int);
using OfKey = apiProp* (*)(const char*, const char*, int);

/// Owns a result.
class Answer {
public:
    explicit Answer(apiProp* result) : m_result(result) {}
    ~Answer() { freeApi(m_result); }
    Answer(const Answer&) = delete;
    Answer& operator=(const Answer&) = delete;

    int code() const { return getReturnCode(m_result); }
    bool isNull() const { return m_result == nullptr; }
    int size() const { return m_result == nullptr ? 0 : m_result->objCount - 1; }
    /// The first object has the index 0.
    apiProp* record(int index) const { return m_result + 1 + index; }
    std::string value(int index, const std::string& key) const {
        const char* text = getProperty(record(index), key.c_str());
        return text == nullptr ? "absent: " + key : text;
    }

private:
    apiProp* m_result;
};

class ApiTest : public testing::Test {
protected:
    void make(const std::string& command) {
        const auto outcome = m_appliance.run("appliance " + command);
        ASSERT_EQ(0, outcome.exit) << outcome.err;
    }

    TestAppliance m_appliance{ZEM_PROGRAMS};
};

constexpr const char* kHost = "1111-AAA*0000001";
constexpr const char* kLpar = "3*1111-AAA*0000001";

// Agreement of library and tools.

/// What an operation tells and a tool prints about the same objects.
struct Door {
    OfAll all;
    const char* tool;
    /// "<key>:<attribute>|<how>" with semicolons between them; the key alone where both have one
    /// name. Without <how> the values are equal; otherwise it is "%" for units and hundredths, "x"
    /// hexadecimal and decimal, "[" with brackets, "id" the text before an asterisk, "," the text
    /// behind a comma, or words with their codes, "*" for all others.
    const char* pairs;
};

// clang-format off
const Door kDoors[] = {
    {getAllCecs, "qyplat -r sys",
     "UserDefinedName:name;PrimaryFSP_IP:ipaddr;"
     "State:state|Operating=1,Standby=0,Power Off=3,No Connection=254,Error=12;"
     "RuntimeCapability:osq00_capable|1=1073741824;Name:type_model|id"},
    {getAllCecs, "qyalloc -r proc --level sys",
     "ConfigurableProcUnits:configurable_pool_proc_uints;"
     "PendAvailProcUnits:pend_avail_sys_proc_units"},
    {getAllLpars, "qyplat -r lpar",
     "UserDefinedName:name;Lpar_env:lpar_env;RedundantPath:redundant_err_path_reporting;"
     "PowerOnWithHypervisor:auto_start;Name:lpar_id|id;"
     "PartitionState:state|Not Activated=0,Running=2,Open Firmware=8,Suspended=9;"
     "BootMode:boot_mode|norm=1,sms=3;Default_prof:default_profile|,;Curr_prof:curr_profile|,;"
     "Keylock:lpar_keylock|norm=4,manual=2;"
     "ProcCompatMode:desired_lpar_proc_compat_mode|CORAL6+=3,CORAL7=4,default=63;"
     "ActualProcCompatMode:curr_lpar_proc_compat_mode|CORAL6+=3,CORAL7=4,default=63;"
     "MigrationState:migration_state|Not Migrating=9,Migration In Progress=13"},
    {getAllLparProfiles, "qyplat -r prof",
     "UserDefinedName:name;lpar_env;lpar_name;SFPSurveillance:conn_monitoring;"
     "AutoIPLEnabled:auto_start;MaxVirtualSlots:max_virtual_slots;"
     "RedundantPath:redundant_err_path_reporting;UncappedWeight:uncap_weight;"
     "MinimumCPUCount:min_procs;DesiredCPUCount:desired_procs;MaximumCPUCount:max_procs;"
     "SharedProcPoolId:shared_proc_pool_id;MinimumMemory:min_mem;DesiredMemory:desired_mem;"
     "MaximumMemory:max_mem;VRMWeight:mem_weight;AltConsoleDRCIndex:alt_console_slot;"
     "AltLoadSourceDRCIndex:alt_restart_device_slot;ConsoleDRCIndex:console_slot;"
     "LoadSourceDRCIndex:load_source_slot;ECSDRCIndex:op_console_slot;virtual_serial_adapters;"
     "virtual_scsi_adapters;virtual_eth_adapters;io_slots;PartitionName:lpar_id|id;"
     "BootMode:boot_mode|norm=1,sms=3;"
     "ProcessorMode:lpar_proc_compat_mode|CORAL6+=3,CORAL7=4,default=63;"
     "MinProcUnit:min_proc_units|%;DesiredProcUnit:desired_proc_units|%;"
     "MaxProcUnit:max_proc_units|%;MemMode:mem_mode|ded=255,shared=0;"
     "EntMem:desired_io_entitled_mem|auto=0;EntitledMode:desired_io_entitled_mem|auto=1,*=0;"
     "SharingMode:sharing_mode|uncap=1,keep_idle_procs=1,*=0;"
     "DonorMode:sharing_mode|share_idle_procs_always=1,*=0;"
     "ProcMode:shared_proc_pool_id|null=255"},
    {getAllCecMemoryCfg, "qyalloc -r mem --level sys",
     "ConfigurableMem:configurable_sys_mem;InstalledMemory:installed_sys_mem;"
     "MaxMemPools:max_mem_pools;PendAvailMem:pend_avail_sys_mem;LMBSize:mem_region_size"},
    {getAllCecMemoryPoolCfgs, "qyalloc -r mempool",
     "curr_pool_mem;pend_pool_mem;pend_avail_pool_mem"},
    {getAllCecProcessorCfg, "qyalloc -r proc --level sys",
     "ConfigurableProcUnits:configurable_sys_proc_units;"
     "CurAvailProcUnits:curr_avail_sys_proc_units;MaxProcPools:max_shared_proc_pools;"
     "MinProcUnit:min_proc_units_per_virtual_proc;PendAvailProcUnits:pend_avail_sys_proc_units"},
    {getAllCecProcessorPoolCfg, "qyalloc -r procpool",
     "SharedProcPoolId:shared_proc_pool_id;MaxPoolCapacity:max_pool_proc_units;"
     "PendReservedPoolCapacity:pend_reserved_pool_proc_units;lpar_ids"},
    {getAllLparMemoryCfgs, "qyalloc -r mem --level lpar",
     "UserDefinedName:lpar_name;CurAllocMem:curr_mem;CurMaxMem:curr_max_mem;"
     "CurMinMem:curr_min_mem;PendAllocMem:pend_mem;PendMaxMem:pend_max_mem;"
     "PendMinMem:pend_min_mem;RuntimeEntMem:run_io_entitled_mem;RuntimeMem:run_mem;"
     "RuntimeVRMWeight:run_mem_weight;RuntimeMinMem:run_min_mem;EntUsage:auto_io_entitled_mem;"
     "Name:lpar_id|id;CurrMemMode:mem_mode|ded=255,shared=0"},
    {getAllLparProcessorCfgs, "qyalloc -r proc --level lpar",
     "UserDefinedName:lpar_name;CurMaxProcs:curr_max_procs;CurMinProcs:curr_min_procs;"
     "CurAllocProcs:curr_procs;CurUncappedWeight:curr_uncap_weight;"
     "PendMaxProcs:pend_max_procs;PendMinProcs:pend_min_procs;PendAllocProcs:pend_procs;"
     "PendUncappedWeight:pend_uncap_weight;RuntimeProcs:run_procs;"
     "RuntimeUncappedWeight:run_uncap_weight;Name:lpar_id|id;"
     "CurMaxProcUnits:curr_max_proc_units|%;CurMinProcUnits:curr_min_proc_units|%;"
     "CurAllocProcUnits:curr_proc_units|%;PendMaxProcUnits:pend_max_proc_units|%;"
     "PendMinProcUnits:pend_min_proc_units|%;PendAllocProcUnits:pend_proc_units|%;"
     "RuntimeProcUnits:run_proc_units|%;CurProcMode:curr_shared_proc_pool_id|null=255;"
     "PendProcMode:pend_shared_proc_pool_id|null=255;"
     "CurSharingMode:curr_sharing_mode|uncap=1,keep_idle_procs=1,*=0;"
     "PendSharingMode:pend_sharing_mode|uncap=1,keep_idle_procs=1,*=0;"
     "CurDonorMode:curr_sharing_mode|share_idle_procs_always=1,*=0;"
     "PendDonorMode:pend_sharing_mode|share_idle_procs_always=1,*=0"},
    {getAllLparVirtualEthernet, "qyalloc -r virtualio --rsubtype eth --level lpar",
     "lpar_id;lpar_name;mac_addr;slot_num;state;ieee_virtual_eth;port_vlan_id;is_trunk;"
     "trunk_priority;Name:lpar_id|id;addl_vlan_ids|none=;is_required|1=true,0=false"},
    {getAllLparVirtualScsi, "qyalloc -r virtualio --rsubtype scsi --level lpar",
     "lpar_name;slot_num;state;backing_devices;remote_lpar_name;Name:lpar_id|id;"
     "adapter_type|client=0,server=1;remote_lpar_id|any=65535;remote_slot_num|any=65535;"
     "is_required|1=true,0=false"},
    {getAllLparVirtualSerial, "qyalloc -r virtualio --rsubtype serial --level lpar",
     "lpar_name;slot_num;state;remote_lpar_name;supports_dnx;Name:lpar_id|id;"
     "adapter_type|client=0,server=1;connect_status|unavailable=null,active=1;"
     "remote_lpar_id|any=65535;remote_slot_num|any=65535;is_required|1=true,0=false"},
    {getAllIoSlots, "qyalloc -r io --rsubtype slot",
     "bus_grouping;bus_id;description;drc_index;drc_name;unit_phys_loc;lpar_id|null=;"
     "feature_codes|[;iop|1=true,0=false;parent_slot_drc_index|none=null;pci_class|x;"
     "pci_device_id|x;pci_revision_id|x;pci_subs_device_id|x;pci_subs_vendor_id|x;"
     "pci_vendor_id|x;slot_io_pool_id|none=65535"},
};
// clang-format on

struct Pair {
    std::string key, attribute, how;
};

Pair pairOf(const std::string& text) {
    const std::string names = text.substr(0, text.find('|'));
    const std::size_t colon = names.find(':');
    return {names.substr(0, colon), colon == std::string::npos ? names : names.substr(colon + 1),
            names == text ? "" : text.substr(names.size() + 1)};
}

/// The library's form of what a tool printed.
std::string coded(const std::string& word, const std::string& how) {
    if (how == "%") return std::to_string(appliance::hundredths(word));
    if (how == "x") return std::to_string(std::stoul(word, nullptr, 16));
    if (how == "[") return '[' + word + ']';
    for (const std::string& code : fieldsOf(how)) {
        const std::size_t equals = code.find('=');
        if (equals == std::string::npos) break;
        if (code.substr(0, equals) == word || code[0] == '*') return code.substr(equals + 1);
    }
    return word;
}

/// The part of the library's value that a tool prints too.
std::string part(const std::string& value, const std::string& how) {
    if (how == "id") return value.substr(0, value.find('*'));
    if (how == ",") return value.substr(value.find(',') + 1);
    return value;
}

class AgreementTest : public ApiTest, public testing::WithParamInterface<const char*> {};

TEST_P(AgreementTest, LibraryAndToolsTellTheSame) {
    make(GetParam());
    for (const Door& door : kDoors) {
        std::vector<Pair> pairs;
        std::istringstream texts(door.pairs);
        std::string attributes;
        for (std::string text; std::getline(texts, text, ';');) {
            pairs.push_back(pairOf(text));
            attributes += (attributes.empty() ? "" : ",") + pairs.back().attribute;
        }
        const auto printed = m_appliance.run(std::string(door.tool) + " -F " + attributes).out;
        const auto records =
            printed == "No results were found.\n" ? std::vector<Record>() : recordsOf(printed);
        const Answer answer(door.all("", 2));
        ASSERT_EQ(static_cast<int>(records.size()), answer.size()) << door.tool;
        for (int i = 0; i < answer.size(); ++i) {
            for (std::size_t j = 0; j < pairs.size(); ++j) {
                const auto& [key, attribute, how] = pairs[j];
                ASSERT_EQ(coded(records[static_cast<std::size_t>(i)][j], how),
                          part(answer.value(i, key), how))
                    << door.tool << ", record " << i << ", " << key;
            }
        }
    }
}

// The large one has adapter lists that are longer than one entry of a record.
INSTANTIATE_TEST_SUITE_P(Appliances, AgreementTest,
                         testing::Values("init", "generate --hosts 2 --lpars 100"));

TEST_F(ApiTest, NarrowerOperationsGiveTheSameRecords) {
    make("init");
    const struct {
        OfAll all;
        OfKey ofHost, ofLpar;  // null where there is none
    } rows[] = {
        {getAllCecs, getCecObj, nullptr},
        {getAllLpars, getAllLparsFromCec, getLparObj},
        {getAllLparProfiles, getAllLparProfilesFromCec, getAllLparProfilesFromLpar},
        {getAllLparVirtualSerial, getVirtualSerial, getLparVirtualSerial},
        {getAllLparVirtualScsi, getVirtualScsi, getLparVirtualScsi},
        {getAllLparVirtualEthernet, getVirtualEthernet, getLparVirtualEthernet},
        {getAllIoSlots, getIoSlots, getLparIoSlots},
        {getAllCecMemoryCfg, getCecMemoryCfg, nullptr},
        {getAllCecProcessorCfg, getCecProcessorCfg, nullptr},
        {getAllCecMemoryPoolCfgs, getCecMemoryPoolCfg, nullptr},
        {getAllCecProcessorPoolCfg, getCecProcessorPoolCfg, nullptr},
        {getAllLparMemoryCfgs, getAllLparMemoryCfg, getLparMemoryCfg},
        {getAllLparProcessorCfgs, getAllLparProcessorCfg, getLparProcessorCfg},
    };
    const Answer hosts(getAllCecs("", 1)), lpars(getAllLpars("", 1));
    for (const auto& row : rows) {
        for (int level : {1, 2}) {
            const Answer all(row.all("", level));
            int next = 0;
            const auto follow = [&](const Answer& some) {
                ASSERT_EQ(API_SUCCESS, some.code());
                for (int i = 0; i < some.size(); ++i, ++next) {
                    EXPECT_EQ(0, std::memcmp(all.record(next), some.record(i), sizeof(apiProp)));
                }
            };
            for (int i = 0; i < hosts.size(); ++i) {
                follow(Answer(row.ofHost("", hosts.value(i, "Name").c_str(), level)));
            }
            EXPECT_EQ(all.size(), next);
            // Free slots belong to no partition, and stand in front of a host's others.
            if (row.ofLpar == nullptr || row.all == getAllIoSlots) continue;
            next = 0;
            for (int i = 0; i < lpars.size(); ++i) {
                follow(Answer(row.ofLpar("", lpars.value(i, "Name").c_str(), level)));
            }
            EXPECT_EQ(all.size(), next);
        }
    }
    EXPECT_EQ(2, Answer(getLparIoSlots("", "1*1111-AAA*0000001", 1)).size());
}

TEST_F(ApiTest, ShortReadsLeaveTheRestAway) {
    make("init");
    const Answer host(getCecObj("", kHost, 1)), lpar(getLparObj("", kLpar, 1)),
        profile(getLparProfile("", kLpar, "normal", 1));
    // By these readers tell a short read from a full one.
    EXPECT_EQ(nullptr, getProperty(host.record(0), "ProcCompatModesSupported"));
    EXPECT_EQ(nullptr, getProperty(lpar.record(0), "Default_prof"));
    EXPECT_EQ(nullptr, getProperty(profile.record(0), "BootMode"));
    EXPECT_EQ("tmxlinux", lpar.value(0, "Lpar_env"));
    EXPECT_EQ("[104,97,16,0,0,16,0,0]", Answer(getCecObj("", kHost, 2)).value(0, "GlvExCaps"));
    // Never activated: neither resources nor a current profile.
    const Answer idle(getLparObj("", "2*1111-AAC*0000003", 2));
    EXPECT_EQ("2", idle.value(0, "DefinitionState"));
    EXPECT_EQ("null,", idle.value(0, "Curr_prof"));
}

// Refusals.

TEST_F(ApiTest, ReturnCodes) {
    make("init");
    const std::function<apiProp*()> ok[] = {
        [] { return getCecObj("", kHost, 1); },
        [] { return getLparVirtualScsi("anyone", kLpar, 2); },
        [] { return getAllLparsFromCec("", "1111-AAD*0000004", 1); },  // no partitions
    };
    for (const auto& call : ok) EXPECT_EQ(API_SUCCESS, Answer(call()).code());
    EXPECT_EQ(0, Answer(ok[2]()).size());

    const struct {
        int code;
        std::function<apiProp*()> call;
    } rows[] = {
        {API_INVALID_INPUT, [] { return getCecObj(nullptr, kHost, 1); }},
        {API_INVALID_INPUT, [] { return getCecObj("", nullptr, 1); }},
        {API_INVALID_INPUT, [] { return getCecObj("", "", 1); }},
        {API_INVALID_INPUT, [] { return getAllCecs("", 0); }},
        {API_INVALID_INPUT, [] { return getAllCecs("", 3); }},
        {API_INVALID_INPUT, [] { return getLparObj("", "3", 1); }},
        {API_INVALID_INPUT, [] { return getLparObj("", "3*", 1); }},
        {API_INVALID_INPUT, [] { return getLparObj("", "x*1111-AAA*0000001", 1); }},
        {API_INVALID_INPUT, [] { return getLparProfile("", kLpar, "", 1); }},
        {API_UNKNOWN_SYSTEM, [] { return getCecObj("", "alpha", 1); }},
        {API_UNKNOWN_SYSTEM, [] { return getLparObj("", "3*1111-AAA*9999999", 1); }},
        {API_NOT_FOUND, [] { return getLparObj("", "99*1111-AAA*0000001", 1); }},
        {API_NOT_FOUND, [] { return getLparIoSlots("", "0*1111-AAA*0000001", 1); }},
        {API_NOT_FOUND, [] { return getLparProfile("", kLpar, "absent", 1); }},
    };
    for (const auto& row : rows) {
        const Answer answer(row.call());
        EXPECT_EQ(row.code, answer.code()) << &row - rows;
        EXPECT_EQ(0, answer.size());
    }
    EXPECT_EQ(API_FAILED, getReturnCode(nullptr));
    EXPECT_EQ(nullptr, getProperty(nullptr, "Name"));
    EXPECT_EQ(nullptr, getProperty(Answer(getCecObj("", kHost, 1)).record(0), "name"));
}

TEST_F(ApiTest, AnObjectTooLargeForARecordFails) {
    make("init");
    appliance::Store store = appliance::Store::open(appliance::Database::Access::Write);
    appliance::Transaction change = store.write();
    appliance::Object lpar = store.all(appliance::Kind::Lpar).front();
    lpar.set("name", std::string(500'000, 'x'));
    store.put(lpar);
    change.commit();
    EXPECT_EQ(API_FAILED, Answer(getAllLpars("", 1)).code());
}

TEST_F(ApiTest, PlannedFaults) {
    EXPECT_TRUE(Answer(getAllCecs("", 1)).isNull());  // there is no state yet
    make("init");
    const struct {
        const char* plan;
        int code;
        bool isNull;
    } rows[] = {
        {"--code 2", API_INVALID_STATE, false},
        {"--code 4", API_INVALID_BKN, false},
        {"--code 5", API_NOT_SUPPORTED, false},
        {"--code 6", API_ACCESS_DENIED, false},
        {"--code 8", 8, false},
        {"--code -2", -2, false},
        {"--code null --calls 1", API_FAILED, true},
    };
    for (const auto& row : rows) {
        make(std::string("fault getAllCecs ") + row.plan);
        const Answer faulty(getAllCecs("", 1));
        EXPECT_EQ(row.code, faulty.code());
        EXPECT_EQ(row.isNull, faulty.isNull());
        EXPECT_EQ(4, Answer(getAllCecs("", 1)).size()) << row.plan;
    }

    make("fault getCecObj --delay 50 --calls 2");
    make("fault qyplat --code 7 --text \"WRTL9999 No.\" --calls 2");
    EXPECT_EQ(
        "getCecObj: 2 calls, delay 50 ms\n"
        "qyplat: 2 calls, code 7, text \"WRTL9999 No.\"\n",
        m_appliance.run("appliance fault").out);
    const auto start = std::chrono::steady_clock::now();
    EXPECT_EQ(API_SUCCESS, Answer(getCecObj("", kHost, 1)).code());
    EXPECT_LE(std::chrono::milliseconds(50), std::chrono::steady_clock::now() - start);
    for (int i = 0; i < 2; ++i) {
        const auto outcome = m_appliance.run("qyplat -r sys -F name");
        EXPECT_EQ(7, outcome.exit);
        EXPECT_EQ("WRTL9999 No.\n", outcome.err);
    }
    make("fault qyplat --signal 9");
    EXPECT_EQ(128 + 9, m_appliance.run("qyplat -r sys; exit $?").exit);
    EXPECT_EQ(0, m_appliance.run("qyplat -r sys").exit);
    make("fault --clear");
    EXPECT_EQ("", m_appliance.run("appliance fault").out);
}

// Size and threads.

long residentKilobytes() {
    std::ifstream status("/proc/self/status");
    for (std::string line; std::getline(status, line);) {
        if (line.rfind("VmRSS:", 0) == 0) return std::stol(line.substr(6));
    }
    return 0;
}

TEST_F(ApiTest, AThousandPartitionsStaySmall) {
    make("generate --hosts 1 --lpars 1000");
    const long before = residentKilobytes();
    const Answer lpars(getAllLpars("", 2));
    ASSERT_EQ(1000, lpars.size());
    EXPECT_GT(100 * 1024, residentKilobytes() - before);
}

TEST_F(ApiTest, EveryCallIsOnePicture) {
    make("generate --hosts 2 --lpars 20");
    std::atomic<bool> done{false};
    std::atomic<int> mixed{0}, failed{0};
    std::vector<std::thread> readers;
    for (int i = 0; i < 4; ++i) {
        readers.emplace_back([&] {
            while (!done) {
                const Answer lpars(getAllLparMemoryCfgs("", 2));
                if (lpars.size() != 40) ++failed;
                for (int j = 1; j < lpars.size(); ++j) {
                    mixed +=
                        lpars.value(j, "RuntimeVRMWeight") != lpars.value(0, "RuntimeVRMWeight");
                }
            }
        });
    }
    appliance::Store store = appliance::Store::open(appliance::Database::Access::Write);
    for (int value = 1; value <= 30; ++value) {
        appliance::Transaction change = store.write();
        for (appliance::Object& lpar : store.all(appliance::Kind::Lpar)) {
            lpar.set("run_mem_weight", std::to_string(value));
            store.put(lpar);
        }
        change.commit();
    }
    done = true;
    for (std::thread& reader : readers) reader.join();
    EXPECT_EQ(0, mixed);
    EXPECT_EQ(0, failed);
}

}  // namespace

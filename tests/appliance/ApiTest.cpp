// The management library: its keys and the forms of its values, its levels, how it refuses and
// fails, threads and size.

#include <unistd.h>

#include <atomic>
#include <chrono>
#include <cstring>
#include <functional>

#include "../utilities/OnThreads.h"
#include "ApiAnswer.h"
#include "Store.h"
#include "Text.h"

namespace {

constexpr const char* kHost = "1111-AAA*0000001";
constexpr const char* kLpar = "3*1111-AAA*0000001";

TEST_F(ApiTest, ShortReadsLeaveTheRestAway) {
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

/// All that the object at @p index tells, as "key=value" with semicolons behind them.
std::string told(const Answer& answer, int index) {
    std::string text;
    const apiProp& record = *answer.record(index);
    for (int i = 0; i < record.propertyCount; ++i) {
        text += std::string(record.name[i]) + '=' + record.value[i] + ';';
    }
    return text;
}

/// Lets current, pending and running amounts of a partition differ.
void spreadAmounts(const std::string& partition) {
    appliance::Store store = appliance::Store::open(appliance::Database::Access::Write);
    appliance::Transaction change = store.write();
    for (appliance::Object& lpar : store.all(appliance::Kind::Lpar)) {
        if (lpar.get("name") != partition) {
            continue;
        }
        int number = 1;
        for (const std::string& name : appliance::split(
                 "curr_min_mem,curr_mem,curr_max_mem,pend_min_mem,pend_mem,pend_max_mem,"
                 "run_min_mem,run_mem,run_mem_weight,run_io_entitled_mem,curr_min_procs,curr_procs,"
                 "curr_max_procs,pend_min_procs,pend_procs,pend_max_procs,run_procs,"
                 "curr_min_proc_units,curr_proc_units,curr_max_proc_units,pend_min_proc_units,"
                 "pend_proc_units,pend_max_proc_units,run_proc_units,curr_uncap_weight,"
                 "pend_uncap_weight,run_uncap_weight")) {
            lpar.set(name, std::to_string(number++) + lpar.get(name));
        }
        store.put(lpar);
    }
    change.commit();
}

// What each family has in its records, in the library's words and units.
TEST_F(ApiTest, EveryKeyHasItsValue) {
    spreadAmounts("osq dev");
    const char* const db = "4*1111-AAA*0000001";
    const char* const idle = "4*1111-AAB*0000002";
    // clang-format off
    const struct {
        apiProp* result;
        int index;
        const char* told;
    } rows[] = {
        {getCecObj("", kHost, 2), 0, "Name=1111-AAA*0000001;UserDefinedName=alpha;State=1;PrimaryFSP_IP=10.0.0.1;BackupFSP_IP=172.0.0.1;RuntimeCapability=1073741824;ProcCompatModesSupported=[63,2,3,4];Capability=0;GlvExCaps=[104,97,16,0,0,16,0,0];ConfigurableProcUnits=27.00;PendAvailProcUnits=21.50;"},
        {getLparObj("", db, 2), 0, "Name=4*1111-AAA*0000001;UserDefinedName=db,main;DefinitionState=1;PartitionState=2;BootMode=3;MigrationState=9;Lpar_env=tmxlinux;Default_prof=0,normal;Curr_prof=0,normal;Keylock=2;RedundantPath=0;ProcCompatMode=3;ActualProcCompatMode=3;PowerOnWithHypervisor=0;"},
        {getLparProfile("", kLpar, "normal", 2), 0, "Name=0*3*1111-AAA*0000001;PartitionName=3*1111-AAA*0000001;UserDefinedName=normal;DefinitionState=1;SFPSurveillance=1;lpar_env=tmxlinux;lpar_name=web server;AutoIPLEnabled=0;MaxVirtualSlots=10;BootMode=1;RedundantPath=0;ProcMode=1;ProcessorMode=63;SharingMode=1;DonorMode=0;UncappedWeight=128;MinProcUnit=75;DesiredProcUnit=150;MaxProcUnit=300;MinimumCPUCount=1;DesiredCPUCount=2;MaximumCPUCount=4;SharedProcPoolId=1;MinimumMemory=4096;DesiredMemory=8192;MaximumMemory=16384;MemMode=0;VRMWeight=128;EntitledMode=1;EntMem=0;AltConsoleDRCIndex=none;AltLoadSourceDRCIndex=none;ConsoleDRCIndex=none;LoadSourceDRCIndex=none;ECSDRCIndex=none;virtual_serial_adapters=0/server/1/any//any/1,1/server/1/any//any/1;virtual_scsi_adapters=3/client/1/xbrg1/13/1;virtual_eth_adapters=2/0/4//0/0/default;io_slots=none;"},
        {getLparProfile("", "6*1111-AAA*0000001", "normal", 2), 0, "Name=0*6*1111-AAA*0000001;PartitionName=6*1111-AAA*0000001;UserDefinedName=normal;DefinitionState=129;SFPSurveillance=0;lpar_env=osq00;lpar_name=Büro-Prüfstand;AutoIPLEnabled=0;MaxVirtualSlots=10;BootMode=1;RedundantPath=0;ProcMode=255;ProcessorMode=63;SharingMode=0;DonorMode=0;UncappedWeight=0;MinProcUnit=100;DesiredProcUnit=300;MaxProcUnit=600;MinimumCPUCount=1;DesiredCPUCount=3;MaximumCPUCount=6;SharedProcPoolId=null;MinimumMemory=4096;DesiredMemory=8192;MaximumMemory=16384;MemMode=255;VRMWeight=0;EntitledMode=0;EntMem=null;AltConsoleDRCIndex=none;AltLoadSourceDRCIndex=30000005;ConsoleDRCIndex=dnx;LoadSourceDRCIndex=30000005;ECSDRCIndex=none;virtual_serial_adapters=0/server/1/any//any/1,1/server/1/any//any/1;virtual_scsi_adapters=none;virtual_eth_adapters=2/0/3//0/0/default;io_slots=30000005/none/1;"},
        {getCecMemoryCfg("", kHost, 2), 0, "Name=1111-AAA*0000001;ConfigurableMem=131072;InstalledMemory=131072;MaxMemPools=1;PendAvailMem=83968;LMBSize=256;"},
        {getCecMemoryPoolCfg("", kHost, 2), 0, "SystemName=1111-AAA*0000001;curr_pool_mem=8192;pend_pool_mem=8192;pend_avail_pool_mem=7680;"},
        {getCecProcessorCfg("", kHost, 2), 0, "Name=1111-AAA*0000001;ConfigurableProcUnits=32.00;CurAvailProcUnits=21.50;InstalledProcessors=32;MaxProcPools=64;MinProcUnit=0.05;PendAvailProcUnits=21.50;"},
        {getCecProcessorPoolCfg("", kHost, 2), 1, "SystemName=1111-AAA*0000001;SharedProcPoolId=1;MaxPoolCapacity=8.00;PendReservedPoolCapacity=0.0;lpar_ids=3,4;"},
        {getLparMemoryCfg("", idle, 2), 0, "Name=4*1111-AAB*0000002;UserDefinedName=osq dev;CurAllocMem=24096;CurMaxMem=38192;CurMinMem=12048;PendAllocMem=54096;PendMaxMem=68192;PendMinMem=42048;RuntimeEntMem=100;RuntimeMem=80;RuntimeVRMWeight=90;RuntimeMinMem=70;EntUsage=0;CurrMemMode=255;"},
        {getLparProcessorCfg("", idle, 2), 0, "Name=4*1111-AAB*0000002;UserDefinedName=osq dev;CurMaxProcs=132;CurMaxProcUnits=20200;CurMinProcs=111;CurMinProcUnits=18100;CurProcMode=255;CurAllocProcs=121;CurAllocProcUnits=19100;CurDonorMode=1;CurSharingMode=0;CurUncappedWeight=250;PendMaxProcs=162;PendMaxProcUnits=23200;PendMinProcs=141;PendMinProcUnits=21100;PendProcMode=255;PendAllocProcs=151;PendAllocProcUnits=22100;PendDonorMode=1;PendSharingMode=0;PendUncappedWeight=260;RuntimeProcs=170;RuntimeProcUnits=24000;RuntimeUncappedWeight=270;"},
        {getLparVirtualEthernet("", db, 2), 1, "Name=4*1111-AAA*0000001;lpar_id=4;lpar_name=db,main;slot_num=5;state=1;mac_addr=A20001000405;ieee_virtual_eth=1;port_vlan_id=7;addl_vlan_ids=20,30;is_required=false;is_trunk=0;trunk_priority=0;vswitch=storage;"},
        {getLparVirtualScsi("anyone", kLpar, 2), 0, "Name=3*1111-AAA*0000001;lpar_name=web server;slot_num=3;state=1;adapter_type=0;backing_devices=none;remote_lpar_id=1;remote_lpar_name=xbrg1;remote_slot_num=13;is_required=true;"},
        {getLparVirtualSerial("", "2*1111-AAA*0000001", 2), 2, "Name=2*1111-AAA*0000001;lpar_name=xbrg2;slot_num=7;state=1;adapter_type=1;connect_status=1;is_required=false;remote_lpar_id=4;remote_lpar_name=db,main;remote_slot_num=6;supports_dnx=0;"},
        {getIoSlots("", kHost, 2), 2, "SystemName=1111-AAA*0000001;lpar_id=1;lpar_name=xbrg1;drc_index=30000001;drc_name=U2222.001.0000001-P1-C1;bus_grouping=0;bus_id=1;description=Storage controller;feature_codes=[2201,2202];iop=false;parent_slot_drc_index=null;pci_class=260;pci_device_id=257;pci_revision_id=1;pci_subs_device_id=258;pci_subs_vendor_id=4660;pci_vendor_id=4660;slot_io_pool_id=65535;unit_phys_loc=U2222.001.0000001;"},
    };
    // clang-format on
    for (const auto& row : rows) {
        const Answer answer(row.result);
        ASSERT_LT(row.index, answer.size());
        EXPECT_EQ(row.told, told(answer, row.index));
    }
}

TEST_F(ApiTest, NarrowerOperationsGiveTheSameRecords) {
    const Answer hosts(getAllCecs("", 1)), lpars(getAllLpars("", 1));
    const struct {
        OfAll all;
        OfKey ofHost, ofLpar;  // null where there is none
    } rows[] = {
        {getAllCecs, getCecObj, nullptr},
        {getAllLpars, getAllLparsFromCec, getLparObj},
        {getAllLparProfiles, getAllLparProfilesFromCec, getAllLparProfilesFromLpar},
        {getAllCecMemoryCfg, getCecMemoryCfg, nullptr},
        {getAllCecMemoryPoolCfgs, getCecMemoryPoolCfg, nullptr},
        {getAllCecProcessorCfg, getCecProcessorCfg, nullptr},
        {getAllCecProcessorPoolCfg, getCecProcessorPoolCfg, nullptr},
        {getAllLparMemoryCfgs, getAllLparMemoryCfg, getLparMemoryCfg},
        {getAllLparProcessorCfgs, getAllLparProcessorCfg, getLparProcessorCfg},
        {getAllLparVirtualEthernet, getVirtualEthernet, getLparVirtualEthernet},
        {getAllLparVirtualScsi, getVirtualScsi, getLparVirtualScsi},
        {getAllLparVirtualSerial, getVirtualSerial, getLparVirtualSerial},
        {getAllIoSlots, getIoSlots, nullptr},  // free ones belong to no partition
    };
    for (const auto& row : rows) {
        const Answer all(row.all("", 2));
        for (const auto& [of, keys] :
             {std::pair(row.ofHost, &hosts), std::pair(row.ofLpar, &lpars)}) {
            int next = 0;
            for (int key = 0; of != nullptr && key < keys->size(); ++key) {
                const Answer some(of("", keys->value(key, "Name").c_str(), 2));
                ASSERT_EQ(API_SUCCESS, some.code());
                for (int i = 0; i < some.size(); ++i, ++next) {
                    EXPECT_EQ(0, std::memcmp(all.record(next), some.record(i), sizeof(apiProp)));
                }
            }
            EXPECT_EQ(of == nullptr ? 0 : all.size(), next);
        }
    }
    EXPECT_EQ(2, Answer(getLparIoSlots("", "1*1111-AAA*0000001", 1)).size());
}

// Refusals.

TEST_F(ApiTest, ReturnCodes) {
    const struct {
        int code;
        std::function<apiProp*()> call;
    } rows[] = {
        {API_SUCCESS, [] { return getAllLparsFromCec("", "1111-AAD*0000004", 1); }},
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
    appliance::Store store = appliance::Store::open(appliance::Database::Access::Write);
    appliance::Transaction change = store.write();
    appliance::Object lpar = store.all(appliance::Kind::Lpar).front();
    lpar.set("name", std::string(500'000, 'x'));
    store.put(lpar);
    change.commit();
    EXPECT_EQ(API_FAILED, Answer(getAllLpars("", 1)).code());
}

TEST_F(ApiTest, PlannedFaults) {
    {
        const testing_support::ScopedEnvironment none("APPLIANCE_HOME", m_appliance.folder());
        EXPECT_TRUE(Answer(getAllCecs("", 1)).isNull());
    }
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
    const auto refused = m_appliance.run("appliance fault getAllCec --code 1");
    EXPECT_EQ(2, refused.exit);
    for (const char* name :
         {"operation getAllCec;", " getAllCecs ", " getLparProfile ", " xbrgcli"}) {
        EXPECT_NE(std::string::npos, refused.err.find(name)) << name;
    }
    EXPECT_EQ("", m_appliance.run("appliance fault").out);
}

// Size and threads.

TEST_F(ApiTest, AThousandPartitionsStaySmall) {
    make("generate --force --hosts 1 --lpars 1000");
    const auto residentPages = [] {
        long all = 0, resident = 0;
        std::ifstream("/proc/self/statm") >> all >> resident;
        return resident;
    };
    const long before = residentPages();
    const Answer lpars(getAllLpars("", 2));
    ASSERT_EQ(1000, lpars.size());
    EXPECT_LT(0, before);
    EXPECT_GT(100 << 20, (residentPages() - before) * getpagesize());
}

TEST_F(ApiTest, EveryCallIsOnePicture) {
    make("generate --force --hosts 2 --lpars 20");
    std::atomic<bool> done{false};
    std::atomic<int> mixed{0}, failed{0};
    const auto read = [&](int) {
        while (!done) {
            const Answer lpars(getAllLparMemoryCfgs("", 2));
            failed += lpars.size() != 40;
            for (int j = 1; j < lpars.size(); ++j) {
                mixed += lpars.value(j, "RuntimeVRMWeight") != lpars.value(0, "RuntimeVRMWeight");
            }
        }
    };
    onThreads(4, read, [&] {
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
    });
    EXPECT_EQ(0, mixed);
    EXPECT_EQ(0, failed);
}

}  // namespace

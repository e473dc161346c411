#include <gtest/gtest.h>
#include <sched.h>
#include <sys/mount.h>

#include <tuple>

#include "DNXApiCaller.h"
#include "EdallocCmdCaller.h"
#include "EdplatCmdCaller.h"
#include "EdpowerCaller.h"
#include "EdsuspCaller.h"
#include "LibraryFaults.h"
#include "LibrarySpy.h"
#include "NwplatCmdCaller.h"
#include "QyplatCmdCaller.h"
#include "Store.h"
#include "SystemConfig.h"
#include "ToolFolder.h"

namespace {

using Partition = zemVirtualSystem;
using Profile = zemVirtualSystemProfile;

constexpr char kHost[] = "1111-AAA*0000001";

class SystemConfigTest : public testing::Test {
protected:
    SystemConfigTest() { makeObjects("", ""); }
    ~SystemConfigTest() override { EXPECT_EQ(0, librarySpy.held); }
    /// Objects of which only the keys are known.
    void makeObjects(const char* user, const char* locale) {
        m_host = zemHostSystem(kHost, user, locale);
        m_partition = Partition("3", m_host, user, locale);
        m_profile = Profile("normal", m_partition, user, locale);
    }
    ToolFolder m_tools;
    zemHostSystem m_host;
    Partition m_partition;
    Profile m_profile;
};

// Each time in a process of its own, which keeps what it has read, with a folder /opt of its own.
TEST_F(SystemConfigTest, ProductDataIsReadOnce) {
    const auto check = [](const std::string& mtms) {
        const auto write = [](const char* text) {
            std::ofstream("/opt/wrt/data/dnxvpd.properties") << text;
        };
        const auto failure = [] { return failureText([] { zemManagerSystem::getDNXUUID(); }); };
        const std::string end = " : /opt/wrt/data/dnxvpd.properties.";
        const std::string start = "1/zemManagerSystem/getDNXUUID//";
        EXPECT_EQ(start + "open the config file wrong, can not open file" + end, failure());
        if (mtms.empty()) {
            EXPECT_STREQ("", zemManagerSystem::getMTMS(""));
        }
        write("MODELTYPE=1111-AAA\nSERIALNUMBER=0000001\n");
        EXPECT_EQ(start + "there is no UUID infoamation in the config file" + end, failure());
        for (const char* uuids : {"uuid=a=b\nUUID=second\n", "UUID=other\n"}) {
            EXPECT_EQ(mtms, std::string(zemManagerSystem::getMTMS("")));
            write(uuids);
            EXPECT_STREQ("a=b", zemManagerSystem::getDNXUUID());
        }
    };
    for (const char* mtms : {"", kHost}) {
        const pid_t child = fork();
        if (child == 0) {
            const bool alone = unshare(CLONE_NEWNS) == 0 &&
                               mount("none", "/", nullptr, MS_REC | MS_PRIVATE, nullptr) == 0 &&
                               mount("none", "/opt", "tmpfs", 0, nullptr) == 0;
            if (!alone) {
                _exit(77);
            }
            std::filesystem::create_directories("/opt/wrt/data");
            check(mtms);
            _exit(HasFailure() ? 1 : 0);
        }
        int status = 0;
        waitpid(child, &status, 0);
        if (status == 77 << 8) {
            GTEST_SKIP() << "this machine allows no mounts";
        }
        EXPECT_EQ(0, status) << mtms;
    }
}

TEST_F(SystemConfigTest, ProductData) {
    const std::pair<const char*, const char*> rows[] = {
        // a file, and the host of it
        {"modeltype=1111\nSerialNumber=ABC\n", "1111*ABC"},
        {"UUID=u\n\nno value\nSERIALNUMBER=A=B\nMODELTYPE=1111", "1111*A=B"},
        {"MODELTYPE=1\nMODELTYPE=2\n", "2*"},
        {"MODELTYPE=1\nSERIALNUMBER=2\nSERIALNUMBER=3\n", ""},
        {"MODELTYPE=1\n", ""},
    };
    const std::string file = m_tools.file("vpd");
    EXPECT_STREQ("", zemManagerSystem::getMTMSByName(file.c_str()));
    for (const auto& [text, mtms] : rows) {
        std::ofstream(file) << text;
        EXPECT_STREQ(mtms, zemManagerSystem::getMTMSByName(file.c_str())) << text;
    }
}

TEST_F(SystemConfigTest, ReadsWhatTheLibraryGives) {
    m_tools.makeAppliance(ZEM_PROGRAMS);
    const zemDynamicArray<zemHostSystem> hosts = zemManagerSystem::getAllHostSystem("");
    ASSERT_EQ(4, hosts.size());
    EXPECT_STREQ("delta, spare", hosts.getElementAt(3)->getSystemName());
    EXPECT_FALSE(hosts.getElementAt(3)->isConnected());
    EXPECT_STREQ("Operating", zemHostSystem::getStateByID(m_host.getState()));
    EXPECT_EQ(7, m_host.getAllVirtualSystem().size());
    EXPECT_EQ(2, m_host.getAllXBRG().size());
    const auto all = zemManagerSystem::getAllVirtualSystemByHostName("", kHost);
    EXPECT_STREQ("1*1111-AAA*0000001", all.getElementAt(0)->getLparIDAndMTMS());

    Partition partition = m_host.getVirtualSystemById("7");
    EXPECT_STREQ("traveller", partition.getName());
    EXPECT_STREQ("day, night", partition.getDefaultProfile().getName());
    EXPECT_TRUE(m_partition.isLive());
    EXPECT_LE(1, m_partition.getAllVirtualSystemProfiles().size());
    EXPECT_EQ(8192, m_profile.getDesiredMem());

    EXPECT_FALSE(m_host.IsUnusedLparId("3"));
    EXPECT_TRUE(m_host.IsUnusedLparId("99"));
    const std::pair<std::optional<int>, bool> answers[] = {{0, true}, {{}, false}, {5, false}};
    for (const auto& [code, unused] : answers) {
        planAnswer("getAllLparsFromCec", code);
        EXPECT_EQ(unused, m_host.IsUnusedLparId("3"));
    }
    EXPECT_FALSE(zemHostSystem().IsUnusedLparId("3"));  // of no host
}

TEST_F(SystemConfigTest, AnswersOfTheLibraryBecomeFailures) {
    m_tools.makeAppliance(ZEM_PROGRAMS);
    makeObjects("u", "");
    // The call, the id if it gives nothing, who fails, the key if one object is read.
    using Row =
        std::tuple<std::string, std::string, std::string, std::string, std::function<void()>>;
    const std::string cec = "getCecObj(u,1111-AAA*0000001,",
                      lpars = "getAllLparsFromCec(u,1111-AAA*0000001,";
    const std::string lpar = "getLparObj(u,3*1111-AAA*0000001,",
                      profile = "getLparProfile(u,3*1111-AAA*0000001,normal,";
    const std::string manager = "zemManagerSystem/", host = "zemHostSystem/",
                      partition = "zemVirtualSystem/";
    const std::string key = "3*1111-AAA*0000001";
    // clang-format off
    const Row rows[] = {
        {cec + "1)", "-1", manager + "getHostSystemByName", kHost, [] { zemManagerSystem::getHostSystemByName(kHost, "u"); }},
        {cec + "1)", "-1", host + "updateData", kHost, [&] { m_host.getState(); }},
        {"getAllCecs(u,1)", "UNKNOWN", manager + "getAllHostSystem", "", [] { zemManagerSystem::getAllHostSystem("u"); }},
        {lpars + "2)", "UNKNOWN", host + "getAllVirtualSystem", "", [] { zemManagerSystem::getAllVirtualSystemByHostName("u", kHost); }},
        {lpars + "1)", "UNKNOWN", host + "getAllVirtualSystem", "", [&] { m_host.getAllVirtualSystem(); }},
        {lpars + "1)", "UNKNOWN", host + "getAllXBRG", "", [&] { m_host.getAllXBRG(); }},
        {lpar + "1)", "-1", host + "getVirtualSystemById", key, [&] { m_host.getVirtualSystemById("3"); }},
        {lpar + "1)", "-1", partition + "updateData", key, [&] { m_partition.getName(); }},
        {lpar + "2)", "-1", partition + "updateData", key, [&] { m_partition.getKeyLock(); }},
        {profile + "1)", "-1", "zemVirtualSystemProfile/updateData", "normal", [&] { m_profile.getConnMonitoring(); }},
        {profile + "2)", "-1", "zemVirtualSystemProfile/updateData", "normal", [&] { m_profile.getMinMem(); }},
        {profile + "1)", "-1", partition + "getVirtualSystemProfileByName", "normal", [&] { m_partition.getVirtualSystemProfileByName("normal"); }},
        {"getAllLparProfilesFromLpar(u," + key + ",1)", "UNKNOWN", partition + "getAllVirtualSystemProfiles", "", [&] { m_partition.getAllVirtualSystemProfiles(); }},
    };
    // clang-format on
    for (const auto& [call, nullId, who, only, read] : rows) {
        const std::string operation = call.substr(0, call.find('('));
        const auto words = [](int code) {
            return std::string(errorCodeToString(code)) + '/' + getErrorString(code);
        };
        const std::string noResult =
            nullId + "/Internal Error:API(\"" + operation + "\") calling failed";
        const std::pair<std::optional<int>, std::string> answers[] = {
            {{}, "6/" + who + "//" + noResult}, {0, only.empty() ? "" : "5/" + who + "///" + only},
            {6, "1/" + who + "//" + words(6)},  {7, "5/" + who + '/' + operation + '/' + words(7)},
            {8, "6/" + who + "//" + words(8)},
        };
        for (const auto& [code, failure] : answers) {
            planAnswer(operation.c_str(), code);
            EXPECT_EQ(failure, failureText(read, "kcmait"));
            EXPECT_EQ(call, librarySpy.call);
            EXPECT_EQ(0, librarySpy.held) << failure;
        }
    }
}

TEST_F(SystemConfigTest, ParsesProperties) {
    // clang-format off
    // properties, and name, key, state, addresses, whether it runs osq00
    const std::pair<const char*, const char*> hosts[] = {
        {"UserDefinedName=n;Name=T*S;State=3;PrimaryFSP_IP=p;BackupFSP_IP=b;RuntimeCapability=1073741824", "n|T*S|3|p|b|1|"},
        {"Name=no star;RuntimeCapability=18446744072635809791", "|no star*no star|0|||0|"},
    };
    for (const auto& [properties, shown] : hosts) {
        zemHostSystem h(*object(properties), "", "");
        EXPECT_EQ(shown, joined(h.getSystemName(), h.getMTMS(), h.getState(), h.getPrimaryFSPIP(), h.getBackupFSPIP(), h.getOsq00Capable()));
    }
    // properties, and key, name, environment, state, mode, profiles, processors, keylock, path, migration
    const std::pair<const char*, const char*> partitions[] = {
        {"UserDefinedName=n;DefinitionState=1;PartitionState=2;BootMode=4;Default_prof=1,d,e;Curr_prof=2,c;ProcCompatMode=1;Keylock=2;RedundantPath=1;MigrationState=14", "12*T*S|n|tmxlinux|2|4|d,e|c|1|1|0|4|"},
        {"DefinitionState=2;Default_prof=NULL,a;Curr_prof=,c;Keylock=4", "12*T*S||tmxlinux|0|0||||0|1|0|"},
        {"DefinitionState=3;Default_prof=normal;Curr_prof=null,b", "12*T*S||xbrgserver|0|0||||-1|1|0|"},
        {"DefinitionState=4;Default_prof=", "12*T*S||xbrgserver|0|0||||-1|1|0|"},
        {"DefinitionState=129;Default_prof=", "12*T*S||osq00|0|0||||-1|1|0|"},
        {"DefinitionState=130;Default_prof=", "12*T*S||osq00|0|0||||-1|1|0|"},
        {"DefinitionState=77;Default_prof=", "12*T*S||77|0|0||||-1|1|0|"},
    };
    for (const auto& [properties, shown] : partitions) {
        Partition l(*object(std::string("Name=12*T*S;") + properties), "", "");
        EXPECT_EQ(shown, joined(l.getLparIDAndMTMS(), l.getName(), l.getEnv(), l.getState(), l.getBootMode(), l.getDefaultProfileName(), l.getCurrentProfileName(), l.getProcCompatMode(), l.getKeyLock(), l.getRedundantPath(), l.getMigrationState()));
        failureText([&l] { l.getCurrentProfile(); });
        EXPECT_EQ("getLparProfile(,12*T*S," + std::string(l.getCurrentProfileName()) + ",1)", librarySpy.call);
    }
    // clang-format on
}

static_assert(Profile::IORSC_TYPE_SERIALADAPTER == 1 && Profile::IORSC_TYPE_ETHERNETADAPTER == 2 &&
              Profile::IORSC_TYPE_IOSLOTADAPTER == 3);

/// All that a profile tells: flags, texts, numbers, and its lists in their elements.
std::string shown(Profile p) {
    // clang-format off
    std::string text = joined(p.getName(), p.getConnMonitoring(), p.getAutoStart(), p.getBootMode(), p.getProcMode(), p.getSharingMode(),
                              p.getMinProcUnits(), p.getDesiredProcUnits(), p.getMaxProcUnits(), p.getMinProcs(), p.getDesiredProcs(), p.getMaxProcs(), p.getMinMem(), p.getDesiredMem(), p.getMaxMem(), p.getUncapWeight(), p.getMaxVirtualSlots(),
                              p.getVirtualSCSIAdapterString(), p.getVirtualSerialAdapterString(), p.getVirtualEthernetAdapterString(), p.getIOSlotAdapterString());
    // clang-format on
    for (int type = 0; type < 5; ++type) {
        const auto list = p.getVirtualIOResources(static_cast<Profile::IOResourceType>(type));
        for (int i = 0; i < list.size(); ++i) {
            text += (i == 0 ? '{' : '&') + std::string(*list.getElementAt(i));
        }
    }
    return text;
}

TEST_F(SystemConfigTest, ParsesProfiles) {
    // clang-format off
    const std::pair<const char*, const char*> rows[] = {
        {"UserDefinedName=n;SFPSurveillance=1;AutoIPLEnabled=1;BootMode=3;ProcMode=p;SharingMode=None;MinProcUnit=1;DesiredProcUnit=2;MaxProcUnit=3;MinimumCPUCount=4;DesiredCPUCount=5;MaximumCPUCount=6;MinimumMemory=0;DesiredMemory=8;MaximumMemory=9;UncappedWeight=10;MaxVirtualSlots=11;virtual_scsi_adapters=a,b;virtual_serial_adapters=c;virtual_eth_adapters=2/0,\"3/\"\"5,7\"\"/0\",4;io_slots=d,",
         "n|1|1|3|p|None|1|2|3|4|5|6|0|8|9|10|11|a,b|c|2/0,\"3/\"\"5,7\"\"/0\",4|d,|{a&b{c{2/0&3/\"5,7\"/0&4{d&"},
        {"SFPSurveillance=2;AutoIPLEnabled=2;BootMode=;MinProcUnit=null;DesiredProcUnit=Null;MaxProcUnit=;virtual_scsi_adapters=None;virtual_serial_adapters=none;virtual_eth_adapters=NONE;io_slots=none", "|0|0|0|||-1|-1|-1|-1|-1|-1|-1|-1|-1|-1|-1|||||"},
    };
    // clang-format on
    for (const auto& [properties, text] : rows) {
        EXPECT_EQ(text, shown(Profile(*object(properties), m_partition, "", "")));
    }
    const auto open = [&] {
        shown(Profile(*object("BootMode=1;io_slots=1,\"2"), m_partition, "", ""));
    };
    EXPECT_EQ("6/zemVirtualSystemProfile/getVirtualIOResources/INVALID_RECORD/1,\"2",
              failureText(open));
}

TEST_F(SystemConfigTest, NumbersHaveWords) {
    // clang-format off
    EXPECT_EQ("0 Standby;1 Operating;3 Power Off;6 Initializing;12 Error;13 Error - Dump in progress;14 Error - Terminated;15 QCAP Click to Accept;17 Standby;32 Power Off In Progress;33 Service Processor Failover In Progress;240 Failed Authentication;241 Failed Authentication;242 Pending Authentication - Password Updates Required;243 Pending Authentication - Password Updates Required;250 Version Mismatch;251 Recovery;253 Incomplete;254 No Connection;", wordsOf(zemHostSystem::getStateByID, ""));
    EXPECT_EQ("0 Not Activated;1 Starting;2 Running;3 Shutting Down;4 Error;8 Open Firmware;9 Suspended;252 Not Available;255 unknown;", wordsOf(Partition::getStateByID, ""));
    EXPECT_EQ("1 norm;2 ds;3 sms;4 of;5 dd;", wordsOf(Partition::getBootModeByID, "unknown"));
    EXPECT_EQ("0 norm;1 manual;", wordsOf(Partition::getKeyLockByID, ""));
    EXPECT_EQ("9 1;10 2;12 3;13 4;14 4;15 4;16 6;255 5;", wordsOf([](int number) { return std::to_string(Partition::getMigrationState(number)); }, "0"));
    const std::pair<const char*, int> texts[] = {
        {"not migrating", 1}, {"Migration Starting", 2}, {"MIGRATION STOPPED", 3}, {"Migration In Progress", 4},
        {"to x: LOST connection (1)", 5}, {"Migration Complete", 6}, {"Lost", 0}, {"Migration Complete.", 0},
    };
    // clang-format on
    for (const auto& [text, state] : texts) {
        EXPECT_EQ(state, Partition::getMigrationStateFromString(text)) << text;
    }
}

// What the appliance has as a word reaches objects as a number that stands for the same word.
TEST_F(SystemConfigTest, WordsSurviveTheLibrary) {
    using appliance::Kind;
    m_tools.makeAppliance(ZEM_PROGRAMS);
    const auto check = [this](Kind kind, const char* attribute, const zemString& word, auto read) {
        if (word.isEmpty() || word == "unknown") {
            return;
        }
        {
            auto store = appliance::Store::open(appliance::Database::Access::Write);
            appliance::Transaction change = store.write();
            appliance::Object object = store.all(kind).at(kind == Kind::Host ? 0 : 2);
            object.set(attribute, static_cast<const char*>(word));
            store.put(object);
            change.commit();
        }
        makeObjects("", "");
        EXPECT_STREQ(word, read()) << attribute;
    };
    for (int number = 0; number < 256; ++number) {
        check(Kind::Host, "state", zemHostSystem::getStateByID(number),
              [this] { return zemHostSystem::getStateByID(m_host.getState()); });
        check(Kind::Lpar, "state", Partition::getStateByID(number),
              [this] { return Partition::getStateByID(m_partition.getState()); });
        check(Kind::Lpar, "boot_mode", Partition::getBootModeByID(number),
              [this] { return Partition::getBootModeByID(m_partition.getBootMode()); });
        check(Kind::Lpar, "lpar_keylock", Partition::getKeyLockByID(number),
              [this] { return Partition::getKeyLockByID(m_partition.getKeyLock()); });
    }
    for (const char* word : {"Not Migrating", "Migration Starting", "Migration Stopped",
                             "Migration In Progress", "Lost Connection", "Migration Complete"}) {
        check(Kind::Lpar, "migration_state", word,
              [this] { return m_partition.getMigrationStateString(); });
    }
}

TEST_F(SystemConfigTest, LinesOfTheTools) {
    const std::string m = std::string("-m|") + kHost, lpar = "-r|lpar|" + m, prof = "-r|prof|" + m;
    const std::string change = prof + "|-i|\"name=normal\",\"lpar_id=3\"",
                      sys = "-r|sys|" + m + "|-F|";
    const auto slots =
        pairs({{zemEdplatCmdCaller::PartitionProfileAttribute::ATTR_IO_SLOTS, "21//0"}});
    const auto ids = pairs({{zemNwplatCmdCaller::PartitionAttribute::ATTR_LPAR_ID, "9"}});
    pid_t pid = 0;
    FILE* stream = nullptr;
    // What the tool receives, what comes of its printing 2, and of its printing nothing.
    using Row =
        std::tuple<const char*, std::string, const char*, std::string, std::function<zemString()>>;
    // clang-format off
    const Row rows[] = {
        {"dlplat", lpar + "|--id|3", "0", "", [&] { return m_host.destoryVirtualSystem("3"); }},
        {"nwplat", lpar + "|-i|\"lpar_id=9\"", "0", "", [&] { return m_host.createVirtualSystem(ids); }},
        {"edpower", "-r|lpar|-o|chkey|-k|norm|--id|3|" + m, "0", "", [&] { return m_partition.setKeylock("norm"); }},
        {"edplat", lpar + "|-i|\"lpar_id=3\",\"new_name=a,b\"", "0", "", [&] { return m_partition.setName("a,b"); }},
        {"edplat", lpar + "|-i|\"lpar_id=3\",\"default_profile=P\"", "0", "", [&] { return m_partition.setDefaultProfile("P"); }},
        {"edplat", change + ",\"io_slots+=21//0\"", "0", "", [&] { return m_profile.addVirtualIOResources(slots); }},
        {"edplat", change + ",\"io_slots-=21//0\"", "0", "", [&] { return m_profile.removeVirtualIOResources(slots); }},
        {"edplat", change + ",\"io_slots=21//0\"", "0", "", [&] { return m_profile.setAttributeValues(slots); }},
        {"edplat", change + ",\"io_slots=21//0\"", "0", "", [&] { return m_profile.modifyVirtualSystemResources(slots); }},
        {"domove", "-o|v|" + m + "|-t|T 2|--id|3", "1", "", [&] { return m_partition.validateMigratebility("T 2", false, "x", "u"); }},
        {"domove", "-o|v|" + m + "|-t|T|--ip|10.0.0.1-u|u|--id|3", "1", "", [&] { return m_partition.validateMigratebility("T", true, "10.0.0.1", "u"); }},
        {"domove", "-o|v|" + m + "|-t|T|--ip|x-u|--id|3", "1", "", [&] { return m_partition.validateMigratebility("T", true, "x", ""); }},
        {"domove", "-o|s|" + m + "|--id|3", "0", "", [&] { return m_partition.stopMigration("T", true, "x", "u", 0); }},
        {"domove", "-o|m|" + m + "|-t|T|--ip|x|--id|3", "0", "", [&] { const int rc = m_partition.migrateTo("T", true, "x", nullptr, &pid, &stream); return rc + (pid == waitpid(pid, nullptr, 0) ? fclose(stream) : 1); }},
        {"qyplat", lpar + "|--filter|lpar_names=x,y|-F|lpar_id,state,name,curr_profile,default_profile,lpar_env,boot_mode", "2", "5/zemHostSystem/getVirtualSystemByName//The requested patition(name:x,y) was not found on managed system 1111-AAA*0000001", [&] { return m_host.getVirtualSystemByName("x,y").getLparID(); }},
        {"qyplat", prof + "|--filter|lpar_ids=3,profile_names=normal|-F|name", "2", "5/zemVirtualSystemProfile/getAttributeValue//normal", [&] { return m_profile.getAttributeValue(2); }},
        {"qymove", "-r|manager|-F|remote_lpar_mobility_capable", "0", "6/zemManagerSystem/isEnableRemoteRelocation//0", [] { return zemManagerSystem::isEnableRemoteRelocation(""); }},
        {"qymove", sys + "inactive_lpar_mobility_capable", "0", "6/zemHostSystem/isEnableInactiveMigration//0", [&] { return m_host.isEnableInactiveMigration(); }},
        {"qymove", sys + "num_inactive_migrations_supported", "2", "6/zemHostSystem/getMaxInactiveMigrationNum//0", [&] { return m_host.getMaxInactiveMigrationNum(); }},
        {"qymove", sys + "num_inactive_migrations_in_progress", "2", "6/zemHostSystem/getCurrentInactiveMigrationNum//0", [&] { return m_host.getCurrentInactiveMigrationNum(); }},
        {"qymove", sys + "active_lpar_mobility_capable", "0", "6/zemHostSystem/isEnableActiveMigration//0", [&] { return m_host.isEnableActiveMigration(); }},
        {"qymove", sys + "num_active_migrations_supported", "2", "6/zemHostSystem/getMaxActiveMigrationNum//0", [&] { return m_host.getMaxActiveMigrationNum(); }},
        {"qymove", sys + "num_active_migrations_in_progress", "2", "6/zemHostSystem/getCurrentActiveMigrationNum//0", [&] { return m_host.getCurrentActiveMigrationNum(); }},
        {"qymove", lpar + "|--filter|lpar_ids=3|-F|bytes_transmitted,bytes_remaining", "90", "", [&] { return m_partition.getMigrationPercentComplete(""); }},
        {"edplat", change + ",\"new_name=n\"", "0", "", [&] { return m_profile.setName("n"); }},
    };
    // clang-format on
    for (const auto& [tool, arguments, result, missing, operation] : rows) {
        m_tools.recorder(tool, "2,,\"x,y\"\n6,,x\n");
        EXPECT_STREQ(result, operation()) << arguments;
        EXPECT_EQ(arguments, m_tools.arguments());
        m_tools.recorder(tool);
        EXPECT_EQ(missing, failureText(operation));
    }
    EXPECT_STREQ("n", m_profile.getName());
    m_tools.recorder("qymove", "1\n");
    EXPECT_TRUE(zemManagerSystem::isEnableRemoteRelocation("") && m_host.isEnableActiveMigration());
}

/// @p text with each "@" replaced by @p name, and each "#" by the name with its quotes doubled.
std::string with(const std::string& name, const std::string& text) {
    std::string result;
    for (const char c : text) {
        if (c != '@' && c != '#') {
            result += c;
        }
        for (const char n : c == '@' || c == '#' ? name : "") {
            result.append(c == '#' && n == '"' ? 2 : 1, n);
        }
    }
    return result;
}

// Names are texts to every tool, whatever they hold, and no options, items or other names.
TEST_F(SystemConfigTest, NamesStayWholeInEveryLine) {
    const char* name = nullptr;
    using Row = std::tuple<const char*, std::string, std::function<void()>>;
    pid_t* const p = nullptr;
    FILE** const f = nullptr;
    const auto none = pairs({});
    const auto raw = [&name] { return zemCommandCaller::quoted(name); };
    // clang-format off
    const Row rows[] = {
        {"dlplat", "-r|lpar|-m|@*1|--id|@", [&] { m_host.destoryVirtualSystem(name); }},
        {"nwplat", "-r|lpar|-m|@*1|-i|\"name=#\"", [&] { m_host.createVirtualSystem(pairs({{1, zemCommandCaller::itemValue(name)}})); }},
        {"edpower", "-r|lpar|-o|chkey|-k|@|--id|@|-m|@*1", [&] { m_partition.setKeylock(name); }},
        {"edpower", "-r|lpar|--id|3|-o|on|-f|@|-m|@", [&] { EdpowerCaller c("", ""); c.setManagedSystem(name); c.setResource(1); c.setOperation(1); c.setLparId(3); c.setLparProfileName(raw()); c.run(); }},
        {"edsusp", "-o|suspend|-m|@|--id|3", [&] { EdsuspCaller c("", ""); c.setManagedSystem(name); c.setLparId(3); c.setOperation(1); c.run(); }},
        {"edalloc", "-r|mem|-m|@|-o|a|--id|@", [&] { zemEdallocCmdCaller("", "").addMemory(raw(), raw(), 0, 0, p, f); }},
        {"edalloc", "-r|io|--rsubtype|slot|-o|a|-m|1|--id|@|-l|@", [&] { zemEdallocCmdCaller("", "").addIOSlot("1", raw(), raw(), none, p, f); }},
        {"edplat", "-r|sys|-m|@|-i|\"new_name=#\"", [&] { zemEdplatCmdCaller("", "").modifyManagedSystemInformation(pairs({{0, zemCommandCaller::itemValue(name)}}), name); }},
        {"edplat", "-r|lpar|-m|@*1|-i|\"lpar_id=#\",\"new_name=#\"", [&] { m_partition.setName(name); }},
        {"edplat", "-r|lpar|-m|@*1|-i|\"lpar_id=#\",\"default_profile=#\"", [&] { m_partition.setDefaultProfile(name); }},
        {"edplat", "-r|prof|-m|@*1|-i|\"name=#\",\"lpar_id=#\",\"new_name=#\"", [&] { m_profile.setName(name); }},
        {"domove", "-o|v|-m|@*1|-t|@|--ip|@-u|@|--id|@", [&] { m_partition.validateMigratebility(name, true, raw(), raw()); }},
        {"domove", "-o|s|-m|@*1|--id|@", [&] { m_partition.stopMigration("", false, "", "", 0); }},
        {"qymove", "-r|lpar|-m|@*1|--filter|lpar_ids=@|-F|bytes_transmitted,bytes_remaining", [&] { m_partition.getMigrationPercentComplete(""); }},
        {"qyplat", "-r|lpar|-m|@*1|--filter|lpar_names=@|-F|lpar_id,state,name,curr_profile,default_profile,lpar_env,boot_mode", [&] { m_host.getVirtualSystemByName(name); }},
        {"qyplat", "-r|prof|-m|@*1|--filter|lpar_ids=@,profile_names=@|-F|name", [&] { m_profile.getAttributeValue(2); }},
    };
    // clang-format on
    for (const char* each :
         {"a\" --id \"9", "back\\", "\\\"", "x\"", "东京, \"本番\"", "'$(id)' `id`"}) {
        name = each;
        for (const auto& [tool, arguments, operation] : rows) {
            m_tools.recorder(tool, "5\n");
            m_host = zemHostSystem(zemString(name) + "*1", "", "");
            m_partition = Partition(name, m_host, "", "");
            m_profile = Profile(name, m_partition, "", "");
            EXPECT_EQ("", failureText(operation));
            EXPECT_EQ(with(name, arguments), m_tools.arguments());
        }
    }
}

TEST_F(SystemConfigTest, FindsAnyName) {
    m_tools.makeAppliance(ZEM_PROGRAMS);
    const char* const names[] = {"東京, \"本番\"", "small, \"safe\"",
                                 "\"all\"",        "\"a\", b",
                                 "a\" -m \"b",     "back\\",
                                 "\\\"",           "\"",
                                 "a,lpar_ids=1",   "web server,traveller",
                                 "'$(id)' `id`"};
    zemHostSystem beta("1111-AAB*0000002", "", "");
    EXPECT_STREQ("3", beta.getVirtualSystemByName(names[0]).getLparID());
    Profile safe = Partition("4", m_host, "", "").getVirtualSystemProfileByName(names[1]);
    EXPECT_STREQ(
        "4", safe.getAttributeValue(zemQyplatCmdCaller::PartitionProfileAttribute::ATTR_LPAR_ID));
    EXPECT_THROW(m_host.getVirtualSystemByName(names[9]), zemObjectNotFoundException);
    for (const char* name : names) {
        m_partition.setName(name);
        EXPECT_STREQ("3", m_host.getVirtualSystemByName(name).getLparID()) << name;
        EXPECT_STREQ(name, m_host.getVirtualSystemById("3").getName());
        safe.setName(name);
        EXPECT_STREQ(
            name, safe.getAttributeValue(zemQyplatCmdCaller::PartitionProfileAttribute::ATTR_NAME));
    }
}

TEST_F(SystemConfigTest, NoAttributeIsAskedForByTheEndOfAList) {
    m_tools.recorder("qyplat", "1\n");
    EXPECT_EQ("3/zemVirtualSystemProfile/getAttributeValue/INVALID_INDEX/-1",
              failureText([&] { m_profile.getAttributeValue(-1); }));
    EXPECT_EQ("3/zemCommandCaller/callLsCommand/INVALID_INDEX/44",
              failureText([&] { m_profile.getAttributeValue(44); }));
    EXPECT_EQ("", m_tools.arguments());
}

TEST_F(SystemConfigTest, PartsOfAMove) {
    const std::pair<const char*, int> rows[] = {{"0,0\n", 0},    {"50,50\n", 45},
                                                {"7,0\n", 90},   {"1,999\n", 0},
                                                {"", -1},        {"18446744073709551615,1\n", 90},
                                                {"\"1,1\n", -1}, {"No results were found.", -1}};
    for (const auto& [output, percent] : rows) {
        m_tools.recorder("qymove", output);
        EXPECT_EQ(percent, m_partition.getMigrationPercentComplete("")) << output;
    }
}

TEST_F(SystemConfigTest, FailuresOfTheTools) {
    const bool isRoot = geteuid() == 0;
    makeObjects(isRoot ? "nobody" : "", "xx");
    const std::string user = isRoot ? "65534" : std::to_string(geteuid());
    const auto none = pairs({});
    // Who says that there is no such object, and to which ids.
    const std::string change = "WRTL8018 WRTL8011 WRTL8010", query = "WRTL8018 WRTL8011";
    // clang-format off
    const std::tuple<std::string, std::string, std::function<void()>> rows[] = {
        {"zemVirtualSystem/setVirtualSystemName", change, [&] { m_partition.setName("n"); }},
        {"zemVirtualSystem/setDefaultProfile", change, [&] { m_partition.setDefaultProfile("n"); }},
        {"zemVirtualSystem/setKeylock", change, [&] { m_partition.setKeylock("n"); }},
        {"zemVirtualSystem/setVirtualSystemName", change, [&] { m_profile.setName("n"); }},
        {"zemVirtualSystem/setVirtualSystemName", change, [&] { m_profile.addVirtualIOResources(none); }},
        {"zemHostSystem/getVirtualSystemByName", change, [&] { m_host.getVirtualSystemByName("n"); }},
        {"zemVirtualSystemProfile/getAttributeValues", query, [&] { m_profile.getAttributeValue(2); }},
        {"", "", [&] { m_host.createVirtualSystem(none); }},
        {"", "", [&] { m_host.getMaxActiveMigrationNum(); }},
    };
    // clang-format on
    for (const std::string id : {"WRTL8018", "WRTL8011", "WRTL8010", "WRTL8019"}) {
        for (const char* tool :
             {"dlplat", "edplat", "edpower", "nwplat", "qymove", "qyplat", "domove"}) {
            m_tools.script(tool, "echo \"" + id + " $(id -u) $LC_ALL\" >&2; exit 1");
        }
        for (const auto& [who, ids, operation] : rows) {
            const bool unknown = ids.find(id) != std::string::npos;
            EXPECT_EQ((unknown ? "5/" + who : "6/zemCommandCaller/callGenericCommand") + '/' + id +
                          '/' + id + ' ' + user + " xx",
                      failureText(operation));
        }
    }
    EXPECT_STREQ("normal", m_profile.getName());
    unsetenv("LC_ALL");  // which deletions leave alone
    EXPECT_EQ("6/zemCommandCaller/callGenericCommand/WRTL8019/WRTL8019 " + user + ' ',
              failureText([&] { m_host.destoryVirtualSystem("3"); }));
    const auto validate = [&] { m_partition.validateMigratebility("T", false, "", nullptr); };
    const auto stop = [&] { m_partition.stopMigration("T", false, "", nullptr, 0); };
    const std::string words = "/WRTL8019/" + user + " xx\n";
    EXPECT_EQ("6/zemHostSystem/getVirtualSystemByName" + words, failureText(validate));
    EXPECT_EQ("6/zemHostSystem/stopMigration" + words, failureText(stop));
    for (const std::string text : {"moveless", " no id"}) {
        m_tools.script("domove", "printf '" + text + "'; exit 2");
        EXPECT_EQ("6/zemHostSystem/stopMigration/UNKNOWN/" + text, failureText(stop));
    }
    EXPECT_EQ("6/zemPropertiesHelper/executeCommand/CLI_TIME_OUT/CLI do not return in 10 miniutes.",
              failureText([&] { m_partition.stopMigration("T", false, "", nullptr, 50); }));
    EXPECT_LT(0, waitpid(-1, nullptr, 0));
}

}  // namespace

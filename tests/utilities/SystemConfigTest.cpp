#include <gtest/gtest.h>
#include <sched.h>
#include <sys/mount.h>

#include <tuple>

#include "EdplatCmdCaller.h"
#include "LibraryFaults.h"
#include "NwplatCmdCaller.h"
#include "SystemConfig.h"
#include "ToolFolder.h"

namespace {

namespace fs = std::filesystem;

constexpr char kHost[] = "1111-AAA*0000001";

/// A record as the management library would give it.
std::unique_ptr<apiProp> object(
    const std::vector<std::pair<const char*, const char*>>& properties) {
    auto prop = std::make_unique<apiProp>();
    for (const auto& [name, value] : properties) {
        std::snprintf(prop->name[prop->propertyCount], API_TEXT_SIZE, "%s", name);
        std::snprintf(prop->value[prop->propertyCount++], API_TEXT_SIZE, "%s", value);
    }
    return prop;
}

class SystemConfigTest : public testing::Test {
protected:
    void makeAppliance() {
        ASSERT_EQ(0, m_tools.run(std::string(ZEM_PROGRAMS) + "/appliance init").exit);
        m_host = zemManagerSystem::getHostSystemByName(kHost, "");
    }
    ToolFolder m_tools;
    zemHostSystem m_host{kHost, "", ""};
    zemVirtualSystem m_partition{"3", m_host, "", ""};
    zemVirtualSystemProfile m_profile{"normal", m_partition, "", ""};
};

/// Runs @p test in a child that sees an empty folder /opt of its own.
/// @return its exit status; 77 where the machine lets no process have one
template <typename Test>
int withOwnProductData(Test test) {
    const pid_t child = fork();
    if (child == 0) {
        if (unshare(CLONE_NEWNS) != 0 ||
            mount("none", "/", nullptr, MS_REC | MS_PRIVATE, nullptr) != 0 ||
            mount("none", "/opt", "tmpfs", 0, nullptr) != 0) {
            _exit(77);
        }
        fs::create_directories("/opt/wrt/data");
        _exit(test());
    }
    int status = 0;
    waitpid(child, &status, 0);
    return WIFEXITED(status) ? WEXITSTATUS(status) : 256;
}

// Before the tests that read the data of this machine, which the process then keeps.
TEST_F(SystemConfigTest, ProductDataIsReadOnce) {
    const int failed = withOwnProductData([] {
        const auto write = [](const char* text) {
            std::ofstream("/opt/wrt/data/dnxvpd.properties") << text;
        };
        write("MODELTYPE=1111-AAA\nSERIALNUMBER=0000001\n");
        const std::string none = failureText([] { zemManagerSystem::getDNXUUID(); });
        if (none !=
            "1/zemManagerSystem/getDNXUUID//there is no UUID infoamation in the config "
            "file : /opt/wrt/data/dnxvpd.properties.") {
            return 1;
        }
        const auto known = [] {
            return zemManagerSystem::getDNXUUID() == "a=b" &&
                   zemManagerSystem::getMTMS("") == "1111-AAA*0000001";
        };
        write("uuid=a=b\nMODELTYPE=1111-AAA\nSERIALNUMBER=0000001\nUUID=second\n");
        if (!known()) return 2;
        write("UUID=other\n");
        return known() ? 0 : 3;
    });
    if (failed == 77) GTEST_SKIP() << "this machine allows no mounts";
    EXPECT_EQ(0, failed);
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
    if (access("/opt/wrt/data/dnxvpd.properties", F_OK) != 0) {
        EXPECT_STREQ("", zemManagerSystem::getMTMS(""));
        EXPECT_EQ(
            "1/zemManagerSystem/getDNXUUID//open the config file wrong, can not open file : "
            "/opt/wrt/data/dnxvpd.properties.",
            failureText([] { zemManagerSystem::getDNXUUID(); }));
    }
}

TEST_F(SystemConfigTest, ReadsWhatTheLibraryGives) {
    makeAppliance();
    const zemDynamicArray<zemHostSystem> hosts = zemManagerSystem::getAllHostSystem("");
    ASSERT_EQ(4, hosts.size());
    EXPECT_STREQ("delta, spare", hosts.getElementAt(3)->getSystemName());
    EXPECT_FALSE(hosts.getElementAt(3)->isConnected());
    EXPECT_STREQ("1111-AAA*0000001", m_host.getMTMS());
    EXPECT_STREQ("Operating", zemHostSystem::getStateByID(m_host.getState()));
    EXPECT_TRUE(m_host.getOsq00Capable());
    EXPECT_EQ(7, m_host.getAllVirtualSystem().size());
    EXPECT_EQ(2, m_host.getAllXBRG().size());
    EXPECT_FALSE(m_host.IsUnusedLparId("3"));
    EXPECT_TRUE(m_host.IsUnusedLparId("99"));

    zemVirtualSystem partition = m_host.getVirtualSystemById("7");
    EXPECT_STREQ("traveller", partition.getName());
    EXPECT_STREQ("tmxlinux", partition.getEnv());
    EXPECT_STREQ("Running", zemVirtualSystem::getStateByID(partition.getState()));
    EXPECT_STREQ("norm", zemVirtualSystem::getBootModeByID(partition.getBootMode()));
    EXPECT_STREQ("day, night", partition.getCurrentProfileName());
    EXPECT_STREQ("day, night", partition.getDefaultProfile().getName());
    EXPECT_STREQ("Running", zemVirtualSystem::getStateByID(m_partition.getState()));
    EXPECT_STREQ("web server", m_partition.getName());
    const auto all = zemManagerSystem::getAllVirtualSystemByHostName("", kHost);
    EXPECT_STREQ("1*1111-AAA*0000001", all.getElementAt(0)->getLparIDAndMTMS());

    EXPECT_EQ(8192, m_profile.getDesiredMem());
    EXPECT_EQ(75, m_profile.getMinProcUnits());
    EXPECT_STREQ("", m_profile.getIOSlotAdapterString());
    EXPECT_LE(1, m_partition.getAllVirtualSystemProfiles().size());
}

TEST_F(SystemConfigTest, FailuresOfTheLibrary) {
    makeAppliance();
    const std::string internal = "Internal Error:API(\"";
    const std::string unknown = "/DNX_API_UNKNOWN/Undefined error.";
    // clang-format off
    const std::tuple<const char*, std::optional<int>, std::string, std::function<void()>> rows[] = {
        {"getCecObj", {}, "6/zemManagerSystem/getHostSystemByName/-1/" + internal + "getCecObj\") calling failed", [] { zemManagerSystem::getHostSystemByName(kHost, ""); }},
        {"getAllCecs", {}, "6/zemManagerSystem/getAllHostSystem/UNKNOWN/" + internal + "getAllCecs\") calling failed", [] { zemManagerSystem::getAllHostSystem(""); }},
        {"getAllLparsFromCec", {}, "6/zemHostSystem/getAllVirtualSystem/UNKNOWN/" + internal + "getAllLparsFromCec\") calling failed", [&] { m_host.getAllVirtualSystem(); }},
        {"getAllLparProfilesFromLpar", 8, "6/zemVirtualSystem/getAllVirtualSystemProfiles" + unknown, [&] { m_partition.getAllVirtualSystemProfiles(); }},
        {"getLparObj", 8, "6/zemVirtualSystem/updateData" + unknown, [&] { m_partition.getName(); }},
        {"getLparProfile", 8, "6/zemVirtualSystemProfile/updateData" + unknown, [&] { m_profile.getMinMem(); }},
        {"getLparProfile", 8, "6/zemVirtualSystem/getVirtualSystemProfileByName" + unknown, [&] { m_partition.getVirtualSystemProfileByName("normal"); }},
        {"getCecObj", 0, "5/zemManagerSystem/getHostSystemByName//1111-AAA*0000001", [] { zemManagerSystem::getHostSystemByName(kHost, ""); }},
    };
    // clang-format on
    for (const auto& [operation, code, failure, read] : rows) {
        planAnswer(operation, code);
        EXPECT_EQ(failure, failureText(read)) << operation;
    }
    appliance::clearFaults();
    EXPECT_EQ(
        "5/zemHostSystem/getVirtualSystemById/DNX_API_NOT_FOUND/There is not any object has "
        "been found for the requested query.",
        failureText([&] { m_host.getVirtualSystemById("99"); }));
    EXPECT_NE("", failureText([] { zemHostSystem().getMTMS(); }));
    for (const std::optional<int> code : {std::optional<int>(), std::optional<int>(5)}) {
        planAnswer("getAllLparsFromCec", code);
        EXPECT_FALSE(m_host.IsUnusedLparId("99"));
    }
}

TEST_F(SystemConfigTest, ParsesProperties) {
    // DefinitionState and what it says, Default_prof and the name in it
    const std::tuple<const char*, const char*, const char*, const char*> rows[] = {
        {"2", "tmxlinux", "1,a,b", "a,b"},
        {"3", "xbrgserver", "NULL,a", ""},
        {"130", "osq00", ",a", ""},
        {"77", "77", "normal", ""},
    };
    for (const auto& [definition, env, profile, name] : rows) {
        const auto prop = object({{"Name", "12*T*S"},
                                  {"DefinitionState", definition},
                                  {"Default_prof", profile},
                                  {"MigrationState", "14"}});
        zemVirtualSystem partition(*prop, "", "");
        EXPECT_STREQ("12*T*S", partition.getLparIDAndMTMS());
        EXPECT_STREQ(env, partition.getEnv());
        EXPECT_STREQ(name, partition.getDefaultProfileName());
        EXPECT_TRUE(partition.getRedundantPath());
        EXPECT_FALSE(partition.isLive());
        EXPECT_STREQ("Migration In Progress", partition.getMigrationStateString());
    }
    EXPECT_EQ(5, zemVirtualSystem::getMigrationStateFromString("to x: LOST connection (1)"));
    EXPECT_EQ(0, zemVirtualSystem::getMigrationStateFromString("Lost"));
    EXPECT_EQ(6, zemVirtualSystem::getMigrationState(16));

    const auto prop = object({{"BootMode", "3"},
                              {"MinProcUnit", "null"},
                              {"MinimumMemory", "0"},
                              {"virtual_scsi_adapters", "None"},
                              {"AutoIPLEnabled", "1"},
                              {"virtual_eth_adapters", "2/0,\"3/1/1/\"\"5,7\"\"/0\",4"},
                              {"io_slots", "1,\"2"}});
    zemVirtualSystemProfile profile(*prop, m_partition, "", "");
    EXPECT_TRUE(profile.getAutoStart());
    EXPECT_EQ(3, profile.getBootMode());
    EXPECT_EQ(-1, profile.getMinProcUnits());
    EXPECT_EQ(0, profile.getMinMem());
    EXPECT_EQ(-1, profile.getMaxMem());
    EXPECT_EQ(0, profile.getVirtualIOResources(profile.IORSC_TYPE_SCSIADAPTER).size());
    const auto adapters = profile.getVirtualIOResources(profile.IORSC_TYPE_ETHERNETADAPTER);
    ASSERT_EQ(3, adapters.size());
    EXPECT_STREQ("3/1/1/\"5,7\"/0", *adapters.getElementAt(1));
    EXPECT_STREQ("4", *adapters.getElementAt(2));
    EXPECT_EQ(
        "6/zemVirtualSystemProfile/getVirtualIOResources/INVALID_RECORD/1,\"2",
        failureText([&] { profile.getVirtualIOResources(profile.IORSC_TYPE_IOSLOTADAPTER); }));
}

TEST_F(SystemConfigTest, ChangesThroughTheTools) {
    const std::string m = std::string("-m|") + kHost;
    const std::string prof = "-r|prof|" + m + "|-i|\"name=normal\",\"lpar_id=3\"";
    const auto slots =
        pairs({{zemEdplatCmdCaller::PartitionProfileAttribute::ATTR_IO_SLOTS, "21//0"}});
    const auto ids = pairs({{zemNwplatCmdCaller::PartitionAttribute::ATTR_LPAR_ID, "9"}});
    // clang-format off
    const std::tuple<const char*, std::string, std::function<int()>> rows[] = {
        {"dlplat", "-r|lpar|" + m + "|--id|3", [&] { return m_host.destoryVirtualSystem("3"); }},
        {"nwplat", "-r|lpar|" + m + "|-i|\"lpar_id=9\"", [&] { return m_host.createVirtualSystem(ids); }},
        {"edpower", "-r|lpar|-o|chkey|-k|norm|--id|3|" + m, [&] { return m_partition.setKeylock("norm"); }},
        {"edplat", "-r|lpar|" + m + "|-i|\"lpar_id=3\",\"new_name=a,b\"", [&] { return m_partition.setName("a,b"); }},
        {"edplat", "-r|lpar|" + m + "|-i|\"lpar_id=3\",\"default_profile=P\"", [&] { return m_partition.setDefaultProfile("P"); }},
        {"edplat", prof + ",\"io_slots+=21//0\"", [&] { return m_profile.addVirtualIOResources(slots); }},
        {"edplat", prof + ",\"io_slots-=21//0\"", [&] { return m_profile.removeVirtualIOResources(slots); }},
        {"edplat", prof + ",\"io_slots=21//0\"", [&] { return m_profile.setAttributeValues(slots); }},
        {"edplat", prof + ",\"io_slots=21//0\"", [&] { return m_profile.modifyVirtualSystemResources(slots); }},
        {"edplat", prof + ",\"new_name=n\"", [&] { return m_profile.setName("n"); }},
        {"domove", "-o|v|" + m + "|-t|T 2|--id|3", [&] { return m_partition.validateMigratebility("T 2", false, "x", "u") ? 0 : 1; }},
        {"domove", "-o|v|" + m + "|-t|T|--ip|10.0.0.1-u|u|--id|3", [&] { return m_partition.validateMigratebility("T", true, "10.0.0.1", "u") ? 0 : 1; }},
        {"domove", "-o|s|" + m + "|--id|3", [&] { return m_partition.stopMigration("T", true, "x", "u", 0); }},
        {"domove", "-o|m|" + m + "|-t|T|--ip|x|--id|3", [&] { pid_t pid = 0; FILE* stream = nullptr; const int rc = m_partition.migrateTo("T", true, "x", nullptr, &pid, &stream); EXPECT_EQ(pid, waitpid(pid, nullptr, 0)); return rc + fclose(stream); }},
    };
    // clang-format on
    for (const auto& [tool, arguments, change] : rows) {
        m_tools.recorder(tool);
        EXPECT_EQ(0, change()) << arguments;
        EXPECT_EQ(arguments, m_tools.arguments());
    }
    EXPECT_STREQ("n", m_profile.getName());
}

TEST_F(SystemConfigTest, FailuresOfTheTools) {
    // clang-format off
    const std::tuple<const char*, bool, std::function<void()>> rows[] = {  // true: a query
        {"zemVirtualSystem/setVirtualSystemName", false, [&] { m_partition.setName("n"); }},
        {"zemVirtualSystem/setDefaultProfile", false, [&] { m_partition.setDefaultProfile("n"); }},
        {"zemVirtualSystem/setKeylock", false, [&] { m_partition.setKeylock("n"); }},
        {"zemVirtualSystem/setVirtualSystemName", false, [&] { m_profile.setName("n"); }},
        {"zemHostSystem/getVirtualSystemByName", false, [&] { m_host.getVirtualSystemByName("n"); }},
        {"zemVirtualSystem/getAttributeValue", true, [&] { m_partition.getAttributeValue(1); }},
        {"zemVirtualSystemProfile/getAttributeValues", true, [&] { m_profile.getAttributeValue(2); }},
    };
    // clang-format on
    for (const std::string id : {"WRTL8018", "WRTL8011", "WRTL8010", "WRTL8019"}) {
        for (const char* tool : {"edplat", "edpower", "qyplat", "domove"})
            m_tools.script(tool, "echo '" + id + " gone' >&2; exit 1");
        for (const auto& [who, isQuery, operation] : rows) {
            const bool unknown = id != "WRTL8019" && !(isQuery && id == "WRTL8010");
            const std::string caller = "6/zemCommandCaller/callGenericCommand";
            EXPECT_EQ((unknown ? std::string("5/") + who : caller) + "/" + id + "/" + id + " gone",
                      failureText(operation));
        }
    }
    EXPECT_STREQ("normal", m_profile.getName());
    const auto stop = [&] { m_partition.stopMigration("T", false, "", nullptr, 0); };
    EXPECT_EQ("6/zemHostSystem/getVirtualSystemByName/WRTL8019/gone\n",
              failureText([&] { m_partition.validateMigratebility("T", false, "", nullptr); }));
    EXPECT_EQ("6/zemHostSystem/stopMigration/WRTL8019/gone\n", failureText(stop));
    m_tools.script("domove", "printf 'moveless'; exit 2");
    EXPECT_EQ("6/zemHostSystem/stopMigration/UNKNOWN/moveless", failureText(stop));
    m_tools.recorder("qyplat");
    EXPECT_EQ(
        "5/zemHostSystem/getVirtualSystemByName//The requested patition(name:x) was not found "
        "on managed system 1111-AAA*0000001",
        failureText([&] { m_host.getVirtualSystemByName("x"); }));
    m_tools.recorder("qyplat", "5,Running,\"x,y\",,,tmxlinux,norm\n");
    EXPECT_STREQ("5", m_host.getVirtualSystemByName("x,y").getLparID());
    EXPECT_EQ(
        "-r|lpar|-m|1111-AAA*0000001|--filter|lpar_names=x,y|-F|"
        "lpar_id,state,name,curr_profile,default_profile,lpar_env,boot_mode",
        m_tools.arguments());
}

TEST_F(SystemConfigTest, Migrations) {
    const std::pair<const char*, int> rows[] = {{"0,0\n", 0},    {"50,50\n", 45},
                                                {"7,0\n", 90},   {"1,999\n", 0},
                                                {"", -1},        {"18446744073709551615,1\n", 90},
                                                {"\"1,1\n", -1}, {"No results were found.", -1}};
    for (const auto& [output, percent] : rows) {
        m_tools.recorder("qymove", output);
        EXPECT_EQ(percent, m_partition.getMigrationPercentComplete("")) << output;
    }
    m_tools.recorder("qymove", "1\n");
    EXPECT_TRUE(zemManagerSystem::isEnableRemoteRelocation(""));
    EXPECT_TRUE(m_host.isEnableActiveMigration());
    EXPECT_EQ(1, m_host.getCurrentInactiveMigrationNum());
    EXPECT_EQ("-r|sys|-m|1111-AAA*0000001|-F|num_inactive_migrations_in_progress",
              m_tools.arguments());
    m_tools.recorder("qymove");
    EXPECT_EQ("6/zemManagerSystem/isEnableRemoteRelocation//0",
              failureText([] { zemManagerSystem::isEnableRemoteRelocation(""); }));
    EXPECT_EQ("6/zemHostSystem/getMaxActiveMigrationNum//0",
              failureText([&] { m_host.getMaxActiveMigrationNum(); }));
}

}  // namespace

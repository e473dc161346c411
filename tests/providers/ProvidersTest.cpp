// The providers as a server sees them: the built library, loaded by a broker of each character,
// over the tools of an appliance in a temporary folder.
#include <gtest/gtest.h>
#include <unistd.h>

#include <map>

#include "Server.h"
#include "TestAppliance.h"

namespace {

using namespace cimom;
using testing_support::lines;
using testing_support::TestAppliance;

constexpr const char* kHostClass = "ORXC_CEC_CS";
constexpr const char* kPartitionClass = "ORXC_LPAR_CS";

ObjectPath system(const char* className, const std::string& name) {
    return {"root/cimv2", className, {{"CreationClassName", className}, {"Name", name}}};
}

std::string textOf(const Instance& instance, const char* property) {
    const Value* value = instance.properties.find(property);
    if (value == nullptr || value->isNull()) return "";
    return value->type() == CMPI_string ? value->text() : std::to_string(value->uint());
}

class ProvidersTest : public ::testing::TestWithParam<Character> {
protected:
    void SetUp() override {
        ASSERT_EQ(m_appliance.run("appliance init").exit, 0);
        Options options;
        options.character = GetParam();
        options.classes = ClassRepository::load(ZEM_SCHEMA);
        m_server = std::make_unique<Server>(options);
        m_server->loadRegistration(ZEM_REGISTRATION);
    }

    /// What the tool prints, a field of each record.
    std::vector<std::string> tool(const std::string& arguments) {
        return lines(m_appliance.run("qyplat " + arguments).out);
    }

    TestAppliance m_appliance{ZEM_PROGRAMS};
    std::unique_ptr<Server> m_server;
    Request m_request;
};

TEST_P(ProvidersTest, HostsAreThoseOfTheTool) {
    const Reply hosts = m_server->enumInstances(m_request, {"root/cimv2", kHostClass});
    ASSERT_EQ(hosts.rc, CMPI_RC_OK) << hosts.message;
    EXPECT_TRUE(hosts.done);
    std::vector<std::string> names, states;
    for (const Instance& host : hosts.instances) {
        names.push_back(textOf(host, "TypeModel") + "," + textOf(host, "SerialNumber"));
        states.push_back(textOf(host, "State"));
        EXPECT_EQ(textOf(host, "Name"),
                  textOf(host, "TypeModel") + "*" + textOf(host, "SerialNumber"));
    }
    EXPECT_GE(names.size(), 3u);
    EXPECT_EQ(names, tool("-r sys -F type_model,serial_num"));
    EXPECT_EQ(states, tool("-r sys -F state"));
}

TEST_P(ProvidersTest, EveryPartitionOfEveryHostIsEnumeratedAndGot) {
    const Reply all = m_server->enumInstances(m_request, {"root/cimv2", kPartitionClass});
    ASSERT_EQ(all.rc, CMPI_RC_OK) << all.message;
    ASSERT_GE(all.instances.size(), 14u);
    std::deque<ObjectPath> paths;
    for (const Instance& partition : all.instances) {
        paths.push_back(partition.path);
        const Reply one = m_server->getInstance(m_request, partition.path);
        ASSERT_EQ(one.rc, CMPI_RC_OK) << one.message;
        EXPECT_TRUE(one.instances.at(0) == partition);

        const std::string host = textOf(partition, "HostName");
        EXPECT_EQ(textOf(partition, "Name"), textOf(partition, "LparID") + "*" + host);
        const std::string filter = " --filter lpar_ids=" + textOf(partition, "LparID");
        EXPECT_EQ(textOf(partition, "LparEnvironment"),
                  tool("-r lpar -m '" + host + "' -F lpar_env" + filter).at(0));
    }
    EXPECT_EQ(m_server->enumInstanceNames(m_request, {"root/cimv2", kPartitionClass}).paths, paths);
}

// The tools and the management library are two doors to one appliance.
TEST_P(ProvidersTest, ClassesOfBothDoorsAgree) {
    struct Doors {
        const char* tools;
        const char* library;
        std::vector<const char*> properties;
        const char* unknown;
    };
    const Doors rows[] = {
        {kHostClass,
         "ORXC_ApiHost",
         {"ElementName", "State", "EnabledState", "TypeModel", "SerialNumber", "IPAddress"},
         "9999-ZZZ*0000000"},
        {kPartitionClass,
         "ORXC_ApiPartition",
         {"ElementName", "State", "EnabledState", "LparID", "HostName", "LparEnvironment"},
         "99*1111-AAA*0000001"},
    };
    for (const Doors& row : rows) {
        const Reply byTools = m_server->enumInstances(m_request, {"root/cimv2", row.tools});
        const Reply byLibrary = m_server->enumInstances(m_request, {"root/cimv2", row.library});
        ASSERT_EQ(byLibrary.rc, CMPI_RC_OK) << byLibrary.message;
        ASSERT_EQ(byLibrary.instances.size(), byTools.instances.size()) << row.library;
        std::deque<ObjectPath> paths;
        for (std::size_t i = 0; i < byTools.instances.size(); ++i) {
            const Instance& told = byLibrary.instances[i];
            const std::string name = textOf(byTools.instances[i], "Name");
            EXPECT_EQ(textOf(told, "Name"), name);
            for (const char* property : row.properties) {
                EXPECT_NE(textOf(told, property), "") << name << ' ' << property;
                EXPECT_EQ(textOf(told, property), textOf(byTools.instances[i], property))
                    << name << ' ' << property;
            }
            const Reply one = m_server->getInstance(m_request, system(row.library, name));
            ASSERT_EQ(one.rc, CMPI_RC_OK) << one.message;
            EXPECT_TRUE(one.instances.at(0) == told) << name;
            paths.push_back(told.path);
        }
        EXPECT_EQ(m_server->enumInstanceNames(m_request, {"root/cimv2", row.library}).paths, paths);
        for (const char* name : {row.unknown, "1*9999-ZZZ*0000000", "a b*c", ""}) {
            EXPECT_EQ(m_server->getInstance(m_request, system(row.library, name)).rc,
                      CMPI_RC_ERR_NOT_FOUND)
                << row.library << ' ' << name;
        }
    }
    ASSERT_EQ(m_appliance.run("appliance fault getCecObj --code 5").exit, 0);
    const ObjectPath path = system("ORXC_ApiHost", "1111-AAA*0000001");
    const Reply failed = m_server->getInstance(m_request, path);
    EXPECT_EQ(failed.rc, CMPI_RC_ERR_FAILED);
    EXPECT_NE(failed.message.find("DNX_API_NOT_SUPPORTED"), std::string::npos) << failed.message;
    EXPECT_EQ(m_server->getInstance(m_request, path).rc, CMPI_RC_OK);
}

TEST_P(ProvidersTest, OnlyWantedPropertiesAreAskedOfTheToolAndAnswered) {
    const std::string seen = (m_appliance.folder() / "seen").string();
    m_appliance.replaceTool("qyplat", "echo \"$@\" >'" + seen +
                                          "'\n"
                                          "echo 1111-AAA,0000001,Operating");
    m_request.properties = {{"State", "EnabledState"}};
    const Reply hosts = m_server->enumInstances(m_request, {"root/cimv2", kHostClass});
    ASSERT_EQ(hosts.instances.size(), 1u) << hosts.message;
    EXPECT_EQ(textOf(hosts.instances[0], "State"), "Operating");
    EXPECT_EQ(textOf(hosts.instances[0], "EnabledState"), "2");
    EXPECT_EQ(textOf(hosts.instances[0], "TypeModel"), "");
    EXPECT_EQ(testing_support::contents(seen), "-r sys -F type_model,serial_num,state\n");
}

TEST_P(ProvidersTest, ToolRunsAsTheClientAndInItsLanguage) {
    if (geteuid() != 0) GTEST_SKIP() << "only root can become another user";
    m_appliance.replaceTool("qyplat", "printf 'T-1,S1,%s %s\\n' \"$(id -un)\" \"$LC_ALL\"");
    m_request.user = "nobody";
    m_request.language = "fr;q=0.5,de";
    const Reply hosts = m_server->enumInstances(m_request, {"root/cimv2", kHostClass});
    ASSERT_EQ(hosts.instances.size(), 1u) << hosts.message;
    // third in the query stands the first attribute that only a property needs: the name
    EXPECT_EQ(textOf(hosts.instances[0], "ElementName"), "nobody de_DE.UTF-8");
}

TEST_P(ProvidersTest, NoKeyReachesACommandLineUnlessItHasItsForm) {
    const std::string seen = (m_appliance.folder() / "seen").string();
    m_appliance.replaceTool("qyplat", "echo called >'" + seen + "'");
    for (const char* name : {"1111-AAA", "*0000001", "1111-AAA*", "a*b*c",
                             "1111-AAA*1\" -r prof \"", "a b*c", "a\\*c", "", "\xC3\xA4*1"}) {
        for (const char* className : {kHostClass, kPartitionClass})
            EXPECT_EQ(m_server->getInstance(m_request, system(className, name)).rc,
                      CMPI_RC_ERR_NOT_FOUND)
                << className << ' ' << name;
    }
    EXPECT_FALSE(std::filesystem::exists(seen));
}

INSTANTIATE_TEST_SUITE_P(Brokers, ProvidersTest,
                         ::testing::Values(Character::Full, Character::Lean),
                         [](const auto& broker) {
                             return broker.param == Character::Full ? "full" : "lean";
                         });

}  // namespace

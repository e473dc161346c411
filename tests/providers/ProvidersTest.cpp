// The providers as a server sees them: the built library, loaded by a broker of each character,
// over the tools of an appliance in a temporary folder.
#include <gtest/gtest.h>
#include <unistd.h>

#include <array>
#include <map>
#include <regex>

#include "Json.h"
#include "MofParser.h"
#include "ServedProviders.h"

namespace {

using namespace cimom;
using testing_support::lines;
using testing_support::ScopedEnvironment;
using testing_support::ServedProviders;
using testing_support::textOf;

constexpr const char* kHostClass = "ORXC_CEC_CS";
constexpr const char* kPartitionClass = "ORXC_LPAR_CS";

ObjectPath system(const char* className, const std::string& name) {
    return {"root/cimv2", className, {{"CreationClassName", className}, {"Name", name}}};
}

/// The values of properties, with blanks between their names, as a record of the tool.
std::string textOf(const Instance& instance, const char* properties, char separator) {
    std::string record, property;
    for (std::istringstream names(properties); names >> property;) {
        std::string value = textOf(instance, property);
        if (value.find_first_of(",\"") != std::string::npos) {
            value = '"' + std::regex_replace(value, std::regex("\""), "\"\"") + '"';
        }
        record += (record.empty() ? "" : std::string(1, separator)) + value;
    }
    return record;
}

using ProvidersTest = ServedProviders;

TEST_P(ProvidersTest, InstancesAreTheRecordsOfTheTool) {
    const struct {
        const char* className;
        const char* name;        ///< properties that the Name is made of
        const char* properties;  ///< that the query asks for
        const char* query;
    } rows[] = {
        {kHostClass, "TypeModel SerialNumber", "TypeModel SerialNumber State",
         "-r sys -F type_model,serial_num,state"},
        {kPartitionClass, "LparID HostName", "LparID LparEnvironment State ElementName",
         "-r lpar -F lpar_id,lpar_env,state,name"},
    };
    for (const auto& row : rows) {
        const Reply all = m_server->enumInstances(m_request, {"root/cimv2", row.className});
        ASSERT_EQ(all.rc, CMPI_RC_OK) << all.message;
        EXPECT_TRUE(all.done);
        std::vector<std::string> found;
        std::deque<ObjectPath> paths;
        for (const Instance& each : all.instances) {
            found.push_back(textOf(each, row.properties, ','));
            EXPECT_EQ(textOf(each, "Name"), textOf(each, row.name, '*'));
            const Instance got = m_server->getInstance(m_request, each.path).instances.at(0);
            EXPECT_EQ(textOf(got, row.properties, ','), found.back());
            // a host's clock goes on between two requests
            EXPECT_TRUE(got == each || row.className == kHostClass);
            paths.push_back(each.path);
        }
        EXPECT_EQ(found, lines(m_appliance.run(std::string("qyplat ") + row.query).out));
        EXPECT_EQ(m_server->enumInstanceNames(m_request, {"root/cimv2", row.className}).paths,
                  paths);
    }
}

// The tools and the management library tell of one appliance.
TEST_P(ProvidersTest, ClassesReadByToolsAndByLibraryAgree) {
    const struct {
        const char* tools;
        const char* library;
        const char* properties;
        const char* unknown;
    } rows[] = {
        {kHostClass, "ORXC_ApiHost",
         "Name ElementName State EnabledState TypeModel SerialNumber IPAddress",
         "9999-ZZZ*0000000"},
        {kPartitionClass, "ORXC_ApiPartition",
         "Name ElementName State EnabledState LparID HostName LparEnvironment",
         "99*1111-AAA*0000001"},
    };
    for (const auto& row : rows) {
        const Reply byTools = m_server->enumInstances(m_request, {"root/cimv2", row.tools});
        const Reply byLibrary = m_server->enumInstances(m_request, {"root/cimv2", row.library});
        ASSERT_EQ(byLibrary.rc, CMPI_RC_OK) << byLibrary.message;
        ASSERT_EQ(byLibrary.instances.size(), byTools.instances.size()) << row.library;
        std::deque<ObjectPath> paths;
        for (std::size_t i = 0; i < byTools.instances.size(); ++i) {
            const Instance& told = byLibrary.instances[i];
            const std::string values = textOf(told, row.properties, ';');
            EXPECT_EQ(values, textOf(byTools.instances[i], row.properties, ';'));
            EXPECT_EQ(values.find(";;"), values.npos) << values;
            EXPECT_TRUE(m_server->getInstance(m_request, told.path).instances.at(0) == told);
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
                                          "echo '1111-AAA,0000001,Operating,07/01/2024 12:00:00'");
    const ScopedEnvironment abroad("TZ", "America/New_York");
    m_request.properties = {{"State", "SystemTime"}};
    const Reply hosts = m_server->enumInstances(m_request, {"root/cimv2", kHostClass});
    ASSERT_EQ(hosts.instances.size(), 1u) << hosts.message;
    EXPECT_EQ(textOf(hosts.instances[0], "State"), "Operating");
    const Value* time = hosts.instances[0].properties.find("SystemTime");
    ASSERT_NE(time, nullptr);
    EXPECT_EQ(time->dateTime().text(), "20240701120000.000000+000");
    for (const char* other : {"TypeModel", "EnabledState"}) {
        EXPECT_EQ(textOf(hosts.instances[0], other), "") << other;
    }
    EXPECT_EQ(testing_support::contents(seen), "-r sys -F type_model,serial_num,state,sys_time\n");
}

TEST_P(ProvidersTest, GetOfOneObjectStartsNoSecondTool) {
    const std::string seen = (m_appliance.folder() / "seen").string();
    for (const std::string tool : {"qyplat", "qylink"}) {
        m_appliance.replaceTool(
            tool, "echo " + tool + " >>'" + seen + "'\nexec " ZEM_PROGRAMS "/" + tool + " \"$@\"");
    }
    const struct {
        ObjectPath path;
        const char* tools;
    } rows[] = {
        {system(kHostClass, "1111-AAA*0000001"), "qyplat\n"},
        {system(kPartitionClass, "6*1111-AAA*0000001"), "qyplat\n"},
        {system("ORXC_ApiHost", "1111-AAA*0000001"), ""},
        {system("ORXC_ApiPartition", "6*1111-AAA*0000001"), ""},
        {{"root/cimv2", "ORXC_HostConnection", {{"InstanceID", "ORX:1111-AAA*0000001:primary"}}},
         "qylink\n"},
    };
    for (const auto& row : rows) {
        EXPECT_EQ(m_server->getInstance(m_request, row.path).rc, CMPI_RC_OK) << row.path.className;
        EXPECT_EQ(testing_support::contents(seen), row.tools) << row.path.className;
        std::filesystem::remove(seen);
    }
}

TEST_P(ProvidersTest, ToolRunsAsTheClientAndInItsLanguage) {
    if (geteuid() != 0) {
        GTEST_SKIP() << "only root can become another user";
    }
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
        for (const char* className : {kHostClass, kPartitionClass}) {
            EXPECT_EQ(m_server->getInstance(m_request, system(className, name)).rc,
                      CMPI_RC_ERR_NOT_FOUND)
                << className << ' ' << name;
        }
    }
    EXPECT_FALSE(std::filesystem::exists(seen));
}

// Refused by the rule of the association, before its objects are looked for.
TEST_P(ProvidersTest, ObjectsWithoutAHostHaveNoneInCommon) {
    const ObjectPath link("root/cimv2", "ORXC_HostComponent",
                          {{"GroupComponent", system(kHostClass, "")},
                           {"PartComponent", system(kPartitionClass, "12")}});
    const Reply reply = m_server->getInstance(m_request, link);
    EXPECT_EQ(reply.rc, CMPI_RC_ERR_NOT_FOUND);
    EXPECT_NE(reply.message.find("of class ORXC_HostComponent can not"), std::string::npos)
        << reply.message;
}

struct Association {
    const char* name;
    const char* base;
    const char* farRole;
    ObjectPath source;
    const char* farClass;
    std::size_t targets;  ///< of the source
    std::size_t all;
};

ObjectPath named(const char* className, const std::string& id) {
    return {"root/cimv2", className, {{"InstanceID", id}}};
}

// One provider for each way in which the library can find the two sides.
TEST_P(ProvidersTest, EveryAssociationAnswersAllOperationsAndFilters) {
    const std::string ofHost = "*1111-AAA*0000001";
    const ObjectPath host = system(kHostClass, "1111-AAA*0000001");
    const ObjectPath partition = system(kPartitionClass, "4" + ofHost);
    const ObjectPath profile = named("ORXC_VirtualSystemSettingData", "ORX:2*normal-4" + ofHost);
    const ObjectPath adapter = named("ORXC_SCSIAdapterRASettingData", "ORX:4*3*4" + ofHost);
    const ObjectPath link = named("ORXC_HostConnection", "ORX:1111-AAA*0000001:primary");
    const ObjectPath whole = named("ORXC_ProcessorPool", "ORX:3-Primordial" + ofHost);
    const ObjectPath pool = named("ORXC_ProcessorPool", "ORX:3-1" + ofHost);
    const ObjectPath most = named("ORXC_MemoryRASettingData", "ORX:DMAX:4-Primordial" + ofHost);
    ObjectPath service = system("ORXC_SerialAdapterPoolConfigurationService",
                                "ORX:SerialAdapterPoolService:1111-AAA*0000001");
    service.keys.set("SystemCreationClassName", kHostClass);
    service.keys.set("SystemName", "1111-AAA*0000001");
    // clang-format off
    const Association rows[] = {
        {"ORXC_HostedPartition", "CIM_HostedDependency", "Dependent", host, kPartitionClass, 7, 14},
        {"ORXC_ConnectedHost", "CIM_Dependency", "Dependent", host, "ORXC_HostConnection", 2, 8},
        {"ORXC_HostComponent", "CIM_Component", "PartComponent", host, "CIM_EnabledLogicalElement", 9, 22},
        {"ORXC_ReachedHost", "CIM_Dependency", "Dependent", host, "ORXC_HostConnection", 2, 8},
        {"ORXC_PartitionConnection", "CIM_Dependency", "Dependent", link, kPartitionClass, 7, 28},
        {"ORXC_ElementSettingData", "CIM_ElementSettingData", "SettingData", partition, "CIM_SettingData", 2, 15},
        {"ORXC_ElementSettingData", "CIM_ElementSettingData", "ManagedElement", profile, kPartitionClass, 1, 15},
        {"ORXC_SettingsDefineState", "CIM_SettingsDefineState", "SettingData", partition, "CIM_VirtualSystemSettingData", 1, 14},
        {"ORXC_VSSDComponent", "CIM_Component", "PartComponent", profile, "CIM_ResourceAllocationSettingData", 8, 187},
        {"ORXC_VSSDComponent", "CIM_VirtualSystemSettingDataComponent", "GroupComponent", adapter, "CIM_SettingData", 1, 187},
        {"ORXC_HostedResourcePool", "CIM_Component", "PartComponent", host, "CIM_ResourcePool", 9, 30},
        {"ORXC_HostedService", "CIM_HostedDependency", "Dependent", host, "CIM_Service", 7, 28},
        {"ORXC_ServiceAffectsElement", "CIM_ServiceAffectsElement", "AffectingElement", pool, "CIM_EnabledLogicalElement", 1, 30},
        {"ORXC_ElementCapabilities", "CIM_ElementCapabilities", "Capabilities", pool, "CIM_AllocationCapabilities", 1, 54},
        {"ORXC_ElementCapabilities", "CIM_ElementCapabilities", "Capabilities", service, "CIM_ResourcePoolConfigurationCapabilities", 1, 54},
        {"ORXC_SettingsDefineCapabilities", "CIM_Component", "GroupComponent", most, "CIM_Capabilities", 1, 120},
        {"ORXC_ElementAllocatedFromPool", "CIM_Dependency", "Dependent", whole, "ORXC_ProcessorPool", 2, 6},
        {"ORXC_ElementAllocatedFromPool", "CIM_Dependency", "Antecedent", pool, "CIM_ResourcePool", 1, 6},
        {"ORXC_ResourceAllocationFromPool", "CIM_Dependency", "Dependent", pool, "CIM_ResourceAllocationSettingData", 2, 80},
        {"ORXC_ResourceAllocationFromPool", "CIM_Dependency", "Antecedent", adapter, "CIM_ResourcePool", 1, 80},
    };
    // clang-format on
    std::map<std::string, std::deque<ObjectPath>>
        everything;  // whatever the association, by source
    for (const Association& row : rows) {
        SCOPED_TRACE(row.name + std::string(" ") + row.source.className);
        const auto found = [&](const AssociationFilter& filter) {
            const Reply reply = m_server->associatorNames(m_request, row.source, filter);
            EXPECT_EQ(reply.rc, CMPI_RC_OK) << reply.message;
            return reply.paths;
        };
        const auto targets = found({row.name, "", "", ""});
        EXPECT_EQ(targets.size(), row.targets);
        EXPECT_EQ(found({row.name, row.farClass, "", ""}), targets);
        EXPECT_TRUE(found({row.name, "CIM_ConcreteJob", "", ""}).empty());
        EXPECT_TRUE(found({row.name, "", "Neither", ""}).empty());
        EXPECT_TRUE(found({row.name, "", "", "Neither"}).empty());
        auto& reached = everything[printPath(row.source)];
        if (reached.empty()) {
            reached = found({"", "", "", ""});
        }
        for (const auto& all : {reached, found({row.base, "", "", ""})}) {
            for (const ObjectPath& target : targets) {
                EXPECT_NE(std::find(all.begin(), all.end(), target), all.end()) << row.base;
            }
        }
        const auto pathsOf = [](const Reply& reply) {
            std::deque<ObjectPath> paths;
            for (const Instance& each : reply.instances) {
                paths.push_back(each.path);
            }
            return paths;
        };
        EXPECT_EQ(pathsOf(m_server->associators(m_request, row.source, {row.name, "", "", ""})),
                  targets);
        const AssociationFilter links{"", row.name, "", ""};
        const auto references = m_server->referenceNames(m_request, row.source, links).paths;
        EXPECT_EQ(references.size(), row.targets);
        EXPECT_EQ(pathsOf(m_server->references(m_request, row.source, links)), references);
        const Reply one = m_server->getInstance(m_request, references.at(0));
        EXPECT_EQ(*one.instances.at(0).properties.find(row.farRole), Value(targets.at(0)));
        const ObjectPath every("root/cimv2", row.name);
        EXPECT_EQ(m_server->enumInstanceNames(m_request, every).paths.size(), row.all);
        EXPECT_EQ(m_server->enumInstances(m_request, every).instances.size(), row.all);
    }
}

TEST(RegistrationsTest, TellOtherServersWhatCimomReads) {
    const struct {
        const char* file;
        std::array<const char*, 4> stanza;  ///< around class, provider and types
        std::array<const char*, 5> types;   ///< what the bits of Interface are called there
    } rows[] = {
        {"/zemproviders.pegasus.mof",
         {"; ClassName = \"", "\";\n  ProviderName = \"", "\"; ProviderType = {", " };"},
         {" 2", ", 3", ", 5", " 4", ""}},
        {"/zemproviders.sfcb.reg",
         {"[", "]\n   provider: ", "\n   location: zemproviders\n   type:", "\n"},
         {" instance", " association", " method", " indication", " property"}},
    };
    for (const auto& [file, stanza, names] : rows) {
        const std::string text = readRegularFile(std::string(ZEM_OTHER_REGISTRATIONS) + file);
        for (const Registration& served : readRegistration(ZEM_REGISTRATION)) {
            std::string expected =
                stanza[0] + served.className + stanza[1] + served.provider + stanza[2];
            for (std::size_t bit = 0; bit < names.size(); ++bit) {
                expected += served.interfaces >> bit & 1 ? names[bit] : "";
            }
            expected += stanza[3];
            const std::size_t found = text.find(expected);
            EXPECT_EQ(found != std::string::npos, ZEM_EVENTS || served.interfaces != kIndication)
                << expected;
            EXPECT_EQ(text.find(stanza[0] + served.className + stanza[1], found + 1),
                      std::string::npos);
        }
    }
}

ON_BOTH_BROKERS(ProvidersTest);

}  // namespace

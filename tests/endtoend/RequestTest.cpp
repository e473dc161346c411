// What a client does, with the programs as built: from a command line to the tool
// and back, under a broker of each character.
#include <gtest/gtest.h>

#include <algorithm>
#include <map>

#include "TestAppliance.h"

namespace {

using testing_support::lines;
using testing_support::Outcome;
using testing_support::ScopedEnvironment;
using testing_support::TestAppliance;

const std::string kHost =
    R"('ORXC_CEC_CS.CreationClassName="ORXC_CEC_CS",Name="1111-AAA*0000001"')";
const std::string kPartition =
    R"('ORXC_LPAR_CS.CreationClassName="ORXC_LPAR_CS",Name="3*1111-AAA*0000001"')";
const std::string kGeneral =
    "CIM_ERR_FAILED (1): A general error occurred that is not covered by a more specific error "
    "code: \"";

struct Row {
    std::string arguments;
    int exit;
    std::string answer;  ///< on standard output, or with an exit status on standard error
};

class RequestTest : public ::testing::TestWithParam<const char*> {
protected:
    void SetUp() override { ASSERT_EQ(m_appliance.run("appliance init").exit, 0); }

    Outcome cimom(const std::string& arguments) {
        return m_appliance.run(std::string("cimom --broker ") + GetParam() + " " + arguments);
    }

    void expectRows(const std::vector<Row>& rows) {
        for (const Row& row : rows) {
            const Outcome got = cimom(row.arguments);
            EXPECT_EQ(got.exit, row.exit) << row.arguments;
            EXPECT_EQ(got.out, row.exit == 0 ? row.answer : "") << row.arguments;
            EXPECT_EQ(got.err, row.exit == 0 ? "" : row.answer) << row.arguments;
        }
    }
    TestAppliance m_appliance{ZEM_PROGRAMS};
    ScopedEnvironment m_registration{"CIMOM_REGISTRATION", ZEM_REGISTRATION};
    ScopedEnvironment m_schema{"CIMOM_SCHEMA", ZEM_SCHEMA};
};

TEST_P(RequestTest, WhatIsPrintedCanBeGivenBack) {
    // the host's clock goes on between two requests
    const std::string still = " --properties ElementName,State,EnabledState";
    for (const char* cls : {"ORXC_CEC_CS", "ORXC_LPAR_CS", "ORXC_HostConnection"}) {
        const std::vector<std::string> paths = lines(cimom(std::string("ein ") + cls).out);
        ASSERT_FALSE(paths.empty()) << cls;
        std::string one;
        for (const std::string& path : paths) {
            const Outcome got = cimom("gi '" + path + "'" + still);
            ASSERT_EQ(got.exit, 0) << got.err;
            one += got.out;
        }
        EXPECT_EQ(cimom(std::string("ei ") + cls + still).out, one);
    }
}

TEST_P(RequestTest, ClientReadsWhatThereIsAndWhatIsWrong) {
    const std::string unmodifiable =
        "CIM_ERR_INVALID_PARAMETER (4): Attempt to change unmodifiable property \"Caption\" "
        "of class ORXC_LPAR_CS from \"web server\" to \"x\".\n";
    const std::string foreign = R"(ORXC_CEC_CS.CreationClassName="X",Name="1111-AAA*0000001")";
    expectRows({
        {"gi '" + foreign + "'", 6,
         "CIM_ERR_NOT_FOUND (6): The requested object root/cimv2:" + foreign +
             " of class ORXC_CEC_CS can not be found. The exception was thrown from method "
             "getInstance on provider ORXC_CEC_CSProvider.\n"},
        {"gp " + kPartition + " ElementName", 0, "\"web server\"\n"},
        {"gp " + kPartition + " OtherEnabledState", 12,
         "CIM_ERR_NO_SUCH_PROPERTY (12): OtherEnabledState\n"},
        {"sp " + kPartition + " ElementName 'web server'", 0, ""},
        {"sp " + kPartition + " Caption x", 4, unmodifiable},
        {"mi " + kPartition + " ElementName=new Caption=x", 4, unmodifiable},
        {"gp " + kPartition + " ElementName", 0, "\"web server\"\n"},
        {"im " + kHost + " RequestStateChange RequestedState=2", 0, "returnValue = 1;\n"},
        {"im " + kHost + " RequestStateChange RequestedState=77", 1,
         kGeneral + "Invalid value of 77 is provided for parameter RequestedState to method "
                    "RequestStateChange on provider ORXC_CEC_CSProvider.\"\n"},
        {"im ORXC_CEC_CS FindHost 'ElementName=delta, spare'", 0,
         "returnValue = 0;\nHost = \"root/cimv2:ORXC_CEC_CS.CreationClassName=\\\"ORXC_CEC_CS\\\","
         "Name=\\\"1111-AAD*0000004\\\"\";\n"},
    });
}

// The life of a partition, in the order of the rows.
TEST_P(RequestTest, PartitionsAreMadeChangedStartedStoppedAndDeleted) {
    const std::string path =
        R"(root/cimv2:ORXC_LPAR_CS.CreationClassName="ORXC_LPAR_CS",Name="8*1111-AAA*0000001")";
    const std::string made = "'" + path + "'";
    const std::string define =
        R"(im 'ORXC_VirtualSystemManagementService.SystemCreationClassName="ORXC_CEC_CS",)"
        R"(SystemName="1111-AAA*0000001",CreationClassName="ORXC_VirtualSystemManagementService",)"
        R"(Name="VirtualSystemManagement"' DefineSystem )"
        R"('SystemSettings=instance of ORXC_VirtualSystemSettingData { VirtualSystemType = "tmxlinux";)"
        R"( ProfileName = "p, \"q\""; ElementName = "a $HOME, \"b\" \\c" }' )"
        "'ResourceSettings={instance of ORXC_MemoryRASettingData { ConsumerVisibility = 2;"
        " Minimum = 262144; Reservation = 524288; Limit = 1048576 }, instance of"
        " ORXC_ProcessorRASettingData { ConsumerVisibility = 3; SharingMode = \"cap\";"
        " VirtualMinimum = 100; VirtualQuantity = 100; VirtualMaximum = 200; Minimum = 10;"
        " Reservation = 55; Limit = 100 }}'";
    const std::string state = "im " + made + " RequestStateChange RequestedState=";
    const std::string done = "returnValue = 0;\n", impossible = "returnValue = 4097;\n";
    expectRows({
        {define, 0,
         "returnValue = 0;\nResultingSystem = \"root/cimv2:ORXC_LPAR_CS.CreationClassName="
         R"(\"ORXC_LPAR_CS\",Name=\"8*1111-AAA*0000001\"";)"
         "\n"},
        {"gp " + made + " ElementName", 0, "\"a $HOME, \\\"b\\\" \\\\c\"\n"},
        {"gp " + made + " DesiredProcessingUnits", 0, "55\n"},
        {"mi " + made + " 'ElementName=ü, \"x\"' Keylock=manual", 0, ""},
        {"gp " + made + " ElementName", 0, "\"ü, \\\"x\\\"\"\n"},
        {"gp " + made + " Keylock", 0, "\"manual\"\n"},
        {state + "4", 0, impossible},
        {state + "2", 0, done},
        {"gp " + made + " State", 0, "\"Running\"\n"},
        {state + "2", 0, impossible},
        {state + "9", 0, "returnValue = 1;\n"},
        {state + "2 TimeoutPeriod=00000000000100.000000:000", 0, "returnValue = 4098;\n"},
        {state + "6", 1,
         kGeneral + "WRTL8064 The partition with the ID 8, or its managed system, cannot "
                    "suspend.\"\n"},
        {"di " + made, 1,
         "CIM_ERR_FAILED (1): An exception occurred during executing method deleteInstance on "
         "provider ORXC_LPAR_CSProvider. The exception was thrown from method callGenericCommand "
         "on class zemCommandCaller with an exception id of WRTL8049 and an exception string of "
         "\"WRTL8049 The partition with the ID 8 cannot do this in the state \"Running\".\". The "
         "exception was thrown on behalf of access method \"dlplat -r lpar -m "
         "\"1111-AAA*0000001\" --id \"8\"\".\n"},
        {state + "11", 0, done},
        {state + "4", 0, done},
        {"gp " + made + " EnabledState", 0, "3\n"},
        {"ci ORXC_LPAR_CS CreationClassName=ORXC_LPAR_CS Name=9*1111-AAA*0000001", 7,
         "CIM_ERR_NOT_SUPPORTED (7): Method createInstance on provider ORXC_LPAR_CSProvider is not "
         "supported for class ORXC_LPAR_CS.\n"},
        {"di " + made, 0, ""},
        {"gi " + made, 6,
         "CIM_ERR_NOT_FOUND (6): The requested object " + path +
             " of class ORXC_LPAR_CS can not be found. The exception was thrown from method "
             "getInstance on provider ORXC_LPAR_CSProvider.\n"},
    });
    EXPECT_EQ(m_appliance.run("appliance check").out, "");
}

struct Association {
    const char* name;
    const char* base;
    const char* nearRole;  ///< of the source
    const char* farRole;
    std::string source;
    const char* farClass;
    std::size_t targets;  ///< of the source
    std::size_t all;
};

// One provider for each way in which the library can find the two sides.
TEST_P(RequestTest, EveryAssociationAnswersAllOperationsAndFilters) {
    const std::string partition =
        R"('ORXC_LPAR_CS.CreationClassName="ORXC_LPAR_CS",Name="4*1111-AAA*0000001"')";
    const std::string profile =
        R"('ORXC_VirtualSystemSettingData.InstanceID="ORX:2*normal-4*1111-AAA*0000001"')";
    const std::string adapter =
        R"('ORXC_SCSIAdapterRASettingData.InstanceID="ORX:4*3*4*1111-AAA*0000001"')";
    const std::string link = R"('ORXC_HostConnection.InstanceID="ORX:1111-AAA*0000001:primary"')";
    const std::string whole =
        R"('ORXC_ProcessorPool.InstanceID="ORX:3-Primordial*1111-AAA*0000001"')";
    const std::string pool = R"('ORXC_ProcessorPool.InstanceID="ORX:3-1*1111-AAA*0000001"')";
    const std::string most =
        R"('ORXC_MemoryRASettingData.InstanceID="ORX:DMAX:4-Primordial*1111-AAA*0000001"')";
    const std::string service =
        R"('ORXC_SerialAdapterPoolConfigurationService.SystemCreationClassName="ORXC_CEC_CS",)"
        R"(SystemName="1111-AAA*0000001",Name="ORX:SerialAdapterPoolService:1111-AAA*0000001",)"
        R"(CreationClassName="ORXC_SerialAdapterPoolConfigurationService"')";
    const Association rows[] = {
        {"ORXC_HostedPartition", "CIM_HostedDependency", "Antecedent", "Dependent", kHost,
         "ORXC_LPAR_CS", 7, 14},
        {"ORXC_ConnectedHost", "CIM_Dependency", "Antecedent", "Dependent", kHost,
         "ORXC_HostConnection", 2, 8},
        {"ORXC_HostComponent", "CIM_Component", "GroupComponent", "PartComponent", kHost,
         "CIM_EnabledLogicalElement", 9, 22},
        {"ORXC_ReachedHost", "CIM_Dependency", "Antecedent", "Dependent", kHost,
         "ORXC_HostConnection", 2, 8},
        {"ORXC_PartitionConnection", "CIM_Dependency", "Antecedent", "Dependent", link,
         "ORXC_LPAR_CS", 7, 28},
        {"ORXC_ElementSettingData", "CIM_ElementSettingData", "ManagedElement", "SettingData",
         partition, "CIM_SettingData", 2, 15},
        {"ORXC_ElementSettingData", "CIM_ElementSettingData", "SettingData", "ManagedElement",
         profile, "ORXC_LPAR_CS", 1, 15},
        {"ORXC_SettingsDefineState", "CIM_SettingsDefineState", "ManagedElement", "SettingData",
         partition, "CIM_VirtualSystemSettingData", 1, 14},
        {"ORXC_VSSDComponent", "CIM_Component", "GroupComponent", "PartComponent", profile,
         "CIM_ResourceAllocationSettingData", 8, 187},
        {"ORXC_VSSDComponent", "CIM_VirtualSystemSettingDataComponent", "PartComponent",
         "GroupComponent", adapter, "CIM_SettingData", 1, 187},
        {"ORXC_HostedResourcePool", "CIM_Component", "GroupComponent", "PartComponent", kHost,
         "CIM_ResourcePool", 9, 30},
        {"ORXC_HostedService", "CIM_HostedDependency", "Antecedent", "Dependent", kHost,
         "CIM_Service", 7, 28},
        {"ORXC_ServiceAffectsElement", "CIM_ServiceAffectsElement", "AffectedElement",
         "AffectingElement", pool, "CIM_EnabledLogicalElement", 1, 30},
        {"ORXC_ElementCapabilities", "CIM_ElementCapabilities", "ManagedElement", "Capabilities",
         pool, "CIM_AllocationCapabilities", 1, 54},
        {"ORXC_ElementCapabilities", "CIM_ElementCapabilities", "ManagedElement", "Capabilities",
         service, "CIM_ResourcePoolConfigurationCapabilities", 1, 54},
        {"ORXC_SettingsDefineCapabilities", "CIM_Component", "PartComponent", "GroupComponent",
         most, "CIM_Capabilities", 1, 120},
        {"ORXC_ElementAllocatedFromPool", "CIM_Dependency", "Antecedent", "Dependent", whole,
         "ORXC_ProcessorPool", 2, 6},
        {"ORXC_ElementAllocatedFromPool", "CIM_Dependency", "Dependent", "Antecedent", pool,
         "CIM_ResourcePool", 1, 6},
        {"ORXC_ResourceAllocationFromPool", "CIM_Dependency", "Antecedent", "Dependent", pool,
         "CIM_ResourceAllocationSettingData", 2, 80},
        {"ORXC_ResourceAllocationFromPool", "CIM_Dependency", "Dependent", "Antecedent", adapter,
         "CIM_ResourcePool", 1, 80},
    };
    std::map<std::string, std::vector<std::string>> known;
    const auto answers = [&](const std::string& arguments) {
        const auto [answer, isNew] = known.try_emplace(arguments);
        if (isNew) {
            const Outcome got = cimom(arguments);
            EXPECT_EQ(got.exit, 0) << arguments << got.err;
            answer->second = lines(got.out);
        }
        return answer->second;
    };
    for (const Association& row : rows) {
        const std::string of = row.source + " --assoc-class " + row.name;
        const std::vector<std::string> targets = answers("ain " + of);
        EXPECT_EQ(targets.size(), row.targets) << row.name;
        EXPECT_EQ(answers("ain " + of + " --result-class " + row.farClass), targets) << row.name;
        EXPECT_TRUE(answers("ain " + of + " --result-class CIM_ConcreteJob").empty()) << row.name;
        EXPECT_TRUE(answers("ain " + of + " --role Neither").empty()) << row.name;
        EXPECT_TRUE(answers("ain " + of + " --result-role Neither").empty()) << row.name;
        for (const std::string& wider :
             {std::string(), std::string(" --assoc-class ") + row.base}) {
            const std::vector<std::string> all = answers("ain " + row.source + wider);
            for (const std::string& target : targets) {
                EXPECT_NE(std::find(all.begin(), all.end(), target), all.end())
                    << row.name << wider << ": " << target;
            }
        }

        std::vector<std::string> found;
        for (const std::string& line : answers("ai " + of)) {
            if (line.rfind("// ", 0) == 0) {
                found.push_back(line.substr(3));
            }
        }
        EXPECT_EQ(found, targets) << row.name;

        const std::string named = row.source + " --result-class " + row.name;
        const std::vector<std::string> references = answers("rin " + named);
        EXPECT_EQ(references.size(), row.targets) << row.name;
        EXPECT_EQ(cimom("gi '" + references.at(0) + "'").exit, 0) << references[0];
        const std::string instances = cimom("ri " + named).out;
        EXPECT_NE(instances.find(std::string("instance of ") + row.name), std::string::npos);
        EXPECT_EQ(answers(std::string("ein ") + row.name).size(), row.all) << row.name;
        EXPECT_NE(cimom(std::string("ei ") + row.name).out.find(row.farRole), std::string::npos);
    }
}

INSTANTIATE_TEST_SUITE_P(Brokers, RequestTest, ::testing::Values("full", "lean"),
                         [](const auto& broker) { return std::string(broker.param); });

}  // namespace

// What a client does, with the programs as built: from a command line to the tool and back, under
// brokers of both characters.
#include <gtest/gtest.h>

#include "TestAppliance.h"

namespace {

using testing_support::DemoAppliance;
using testing_support::Outcome;
using testing_support::ScopedEnvironment;

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

class RequestTest : public ::testing::Test {
protected:
    void expectRows(const std::string& broker, const std::vector<Row>& rows) {
        for (const Row& row : rows) {
            const Outcome got = m_appliance.run("cimom --broker " + broker + " " + row.arguments);
            EXPECT_EQ(got.exit, row.exit) << row.arguments;
            EXPECT_EQ(got.out, row.exit == 0 ? row.answer : "") << row.arguments;
            EXPECT_EQ(got.err, row.exit == 0 ? "" : row.answer) << row.arguments;
        }
    }
    DemoAppliance m_appliance{ZEM_PROGRAMS};
    ScopedEnvironment m_registration{"CIMOM_REGISTRATION", ZEM_REGISTRATION};
    ScopedEnvironment m_schema{"CIMOM_SCHEMA", ZEM_SCHEMA};
};

TEST_F(RequestTest, ClientReadsWhatThereIsAndWhatIsWrong) {
    const std::string unmodifiable =
        "CIM_ERR_INVALID_PARAMETER (4): Attempt to change unmodifiable property \"Caption\" "
        "of class ORXC_LPAR_CS from \"web server\" to \"x\".\n";
    const std::string foreign = R"(ORXC_CEC_CS.CreationClassName="X",Name="1111-AAA*0000001")";
    const std::vector<Row> rows = {
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
    };
    expectRows("full", rows);
    expectRows("lean", rows);
}

// The life of a partition, in the order of the rows.
TEST_F(RequestTest, PartitionsAreMadeChangedStartedStoppedAndDeleted) {
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
    expectRows(
        "lean",
        {
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
             "provider ORXC_LPAR_CSProvider. The exception was thrown from method "
             "callGenericCommand "
             "on class zemCommandCaller with an exception id of WRTL8049 and an exception string "
             "of "
             "\"WRTL8049 The partition with the ID 8 cannot do this in the state \"Running\".\". "
             "The "
             "exception was thrown on behalf of access method \"dlplat -r lpar -m "
             "\"1111-AAA*0000001\" --id \"8\"\".\n"},
            {state + "11", 0, done},
            {state + "4", 0, done},
            {"gp " + made + " EnabledState", 0, "3\n"},
            {"ci ORXC_LPAR_CS CreationClassName=ORXC_LPAR_CS Name=9*1111-AAA*0000001", 7,
             "CIM_ERR_NOT_SUPPORTED (7): Method createInstance on provider ORXC_LPAR_CSProvider is "
             "not "
             "supported for class ORXC_LPAR_CS.\n"},
            {"di " + made, 0, ""},
            {"gi " + made, 6,
             "CIM_ERR_NOT_FOUND (6): The requested object " + path +
                 " of class ORXC_LPAR_CS can not be found. The exception was thrown from method "
                 "getInstance on provider ORXC_LPAR_CSProvider.\n"},
        });
    EXPECT_EQ(m_appliance.run("appliance check").out, "");
}

}  // namespace

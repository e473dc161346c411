// What a client reads when something is wrong, byte for byte: from the command line through each
// broker and the frame to a provider and back, with and without a bundle of translated texts.
#include <gtest/gtest.h>

#include <functional>
#include <nlohmann/json.hpp>
#include <regex>
#include <set>

#include "TestAppliance.h"

namespace {

namespace fs = std::filesystem;
using testing_support::contents;
using testing_support::Outcome;
using testing_support::ScopedEnvironment;
using testing_support::TestAppliance;

struct Status {
    int code;
    const char* name;
};
constexpr Status kFailed = {1, "CIM_ERR_FAILED"};
constexpr Status kDenied = {2, "CIM_ERR_ACCESS_DENIED"};
constexpr Status kInvalid = {4, "CIM_ERR_INVALID_PARAMETER"};
constexpr Status kNotFound = {6, "CIM_ERR_NOT_FOUND"};
constexpr Status kNotSupported = {7, "CIM_ERR_NOT_SUPPORTED"};
constexpr Status kExists = {11, "CIM_ERR_ALREADY_EXISTS"};
constexpr Status kNoProperty = {12, "CIM_ERR_NO_SUCH_PROPERTY"};
constexpr Status kMismatch = {13, "CIM_ERR_TYPE_MISMATCH"};
constexpr Status kNoMethod = {17, "CIM_ERR_METHOD_NOT_FOUND"};

constexpr const char* kEither = nullptr;
constexpr const char* kFull = "full";
constexpr const char* kLean = "lean";

struct Row {
    std::string arguments;  ///< or the name of a failure
    Status status;
    std::string english;
    std::string german = "";       ///< with the bundle; empty: not asked for
    const char* broker = kEither;  ///< of which the row tells
};

const std::string kPlainDisk = R"(Test_Disk.Name="sda",Slot=1)";
const std::string kPlainHost =
    R"(ORXC_CEC_CS.CreationClassName="ORXC_CEC_CS",Name="1111-AAA*0000001")";
const std::string kDisk = "'" + kPlainDisk + "'";
const std::string kHost = "'" + kPlainHost + "'";
const std::string kNoHost =
    R"(ORXC_CEC_CS.CreationClassName="ORXC_CEC_CS",Name="9999-ZZZ*0000000")";
const std::string kNoHostInstance =
    R"('Host=instance of ORXC_CEC_CS { CreationClassName = "ORXC_CEC_CS"; )"
    R"(Name = "9999-ZZZ*0000000"; }')";

std::string disk(const std::string& keys) { return "'Test_Disk." + keys + "'"; }
std::string providedTo(const char* method) {
    return std::string(" for class Test_Disk is provided to method ") + method +
           " on provider Test_DiskProvider.";
}
std::string germanProvidedTo(const char* method, const char* how) {
    return std::string(" der Klasse Test_Disk wurde der Methode ") + method +
           " des Providers Test_DiskProvider " + how + "übergeben.";
}
/// What comes of the text of a failure in a method.
std::string general(const std::string& text) {
    return "A general error occurred that is not covered by a more specific error code: \"" + text +
           "\"";
}

class FailureRoad : public ::testing::TestWithParam<const char*> {
protected:
    void SetUp() override { ASSERT_EQ(m_appliance.run("appliance init").exit, 0); }

    bool full() const { return std::string(GetParam()) == kFull; }

    Outcome cimom(const std::string& arguments) {
        return m_appliance.run(m_before + "cimom --broker " + GetParam() + " --registration '" +
                               ZEM_REGISTRATION "' --registration '" ZEM_FAILING
                                                ".json' --library-folder '" ZEM_FAILING_FOLDER
                                                "' " +
                               arguments);
    }

    void expectFailure(const std::string& arguments, const Status& status,
                       const std::string& text) {
        const Outcome got = cimom(arguments);
        EXPECT_EQ(got.exit, status.code) << arguments;
        EXPECT_EQ(got.err, std::string(status.name) + " (" + std::to_string(status.code) +
                               "): " + text + "\n")
            << arguments;
        EXPECT_EQ(got.out, "") << arguments;
    }

    /// Without a bundle, and with one, which small brokers have no way to read.
    void expectFailure(const Row& row) {
        if (row.broker != kEither && row.broker != std::string(GetParam())) return;
        expectFailure(row.arguments, row.status, row.english);
        if (row.german.empty()) return;
        expectFailure("--messages '" ZEM_MESSAGES "' --language de " + row.arguments, row.status,
                      full() ? row.german : row.english);
    }

    TestAppliance m_appliance{ZEM_PROGRAMS};
    ScopedEnvironment m_schema{"CIMOM_SCHEMA", ZEM_FAILING ".mof"};
    ScopedEnvironment m_locale{"LC_ALL", ""};
    std::string m_before;  ///< environment of cimom alone
};

// -- the failures that providers throw by name ----------------------------------------------------

const std::string kUnexpected =
    "A key provided for class Test_Disk to method getInstance on provider Test_DiskProvider "
    "had an unexpected value. A value of 1 was provided for key k instead of the expected "
    "value of 2.";
const std::string kSpecified =
    " were specified for class Test_Disk for partition lp1 on managed "
    "system host. ";
const std::string kLarge = "Conflicted property value 18446744073709551615 of ";
const std::vector<Row> kThrownByName = {
    {"MethodNotSupported", kNotSupported,
     "Method getInstance on provider Test_DiskProvider is not supported for class Test_Disk.",
     "Die Methode getInstance des Providers Test_DiskProvider wird für die Klasse Test_Disk "
     "nicht unterstützt."},
    {"MethodNotFound", kNoMethod,
     "CIM_ERR_METHOD_NOT_FOUND (The invoked method  getInstance is not supported for class "
     "Test_Disk)",
     "CIM_ERR_METHOD_NOT_FOUND (Die aufgerufene Methode getInstance wird für die Klasse "
     "Test_Disk nicht unterstützt)"},
    {"UserAccessDenied", kDenied,
     "User kim is not authorized to utilize getInstance operation of class Test_Disk on "
     "provider Test_DiskProvider.",
     "Der Benutzer kim darf die Operation getInstance der Klasse Test_Disk des Providers "
     "Test_DiskProvider nicht ausführen."},
    {"KeyNotFound", kInvalid,
     "Key k for class Test_Disk is not provided to method getInstance on provider "
     "Test_DiskProvider.",
     "Der Schlüssel k" + germanProvidedTo("getInstance", "nicht ")},
    {"InvalidKey", kInvalid, "Invalid key name k" + providedTo("getInstance"),
     "Ein ungültiger Schlüsselname k" + germanProvidedTo("getInstance", "")},
    {"DuplicateKey", kInvalid, "Duplicate key k" + providedTo("getInstance"),
     "Der Schlüssel k" + germanProvidedTo("getInstance", "mehrfach ")},
    {"KeyValueDoesntMatch", kInvalid, kUnexpected,
     "Ein Schlüssel der Klasse Test_Disk, der der Methode getInstance des Providers "
     "Test_DiskProvider übergeben wurde, hatte einen unerwarteten Wert. Für den Schlüssel k "
     "wurde der Wert 1 statt des erwarteten Wertes 2 angegeben."},
    {"PropertyNotFound", kInvalid,
     "Property p is not found on instance provided for class Test_Disk.",
     "Die Eigenschaft p fehlt in der Instanz der Klasse Test_Disk."},
    {"DuplicateProperty", kInvalid, "Duplicate property name p" + providedTo("getInstance"),
     "Der Eigenschaftsname p" + germanProvidedTo("getInstance", "mehrfach ")},
    {"InvalidProperty", kInvalid, "Invalid property name p" + providedTo("getInstance"),
     "Ein ungültiger Eigenschaftsname p" + germanProvidedTo("getInstance", "")},
    {"ObjectNotFound", kNotFound,
     "The requested object o of class Test_Disk can not be found. The exception was thrown "
     "from method getInstance on provider Test_DiskProvider.",
     "Das angeforderte Objekt o der Klasse Test_Disk wurde nicht gefunden. Die Ausnahme kam "
     "aus der Methode getInstance des Providers Test_DiskProvider."},
    {"WrongMethodArg", kInvalid,
     "Wrong method argument a when invoking method m on provider Test_DiskProvider.",
     "Falsches Argument a beim Aufruf der Methode m des Providers Test_DiskProvider."},
    {"DuplicateMethodArg", kInvalid,
     "Duplicate method argument a when invoking method m on provider Test_DiskProvider.",
     "Mehrfaches Argument a beim Aufruf der Methode m des Providers Test_DiskProvider."},
    {"InvalidMethodArgValue", kInvalid,
     "Invalid value of v is provided for parameter a to method m on provider "
     "Test_DiskProvider.",
     // the one that no bundle translates
     "Invalid value of v is provided for parameter a to method m on provider "
     "Test_DiskProvider."},
    {"ParameterNotFound", kInvalid, "Parameter a is not found in provided parameters.",
     "Der Parameter a fehlt unter den angegebenen Parametern."},
    {"PropertyValueDoesntMatch", kInvalid,
     "A property provided for class Test_Disk had an unexpected value. An invalid value of 1 "
     "was specifieded for property \"p\" instead of the expected value of 2",
     "Eine Eigenschaft der Klasse Test_Disk hatte einen unerwarteten Wert. Der ungültige Wert "
     "1 wurde für die Eigenschaft \"p\" angegeben, erwartet wurde 2."},
    {"MultiResource", kInvalid,
     "Multiple memory instances were specified for partition lp1 on managed system host. Only "
     "one instance should be specified for such resource."},
    {"DuplicateResource", kInvalid,
     "Duplicate slot resources \"v\" were specified for partition lp1 on managed system host"},
    {"ResourceHasExisted", kInvalid,
     "The specified slot \"v\" has been existing on partition lp1 current profile on managed "
     "system host. "},
    {"ResourceNotExisting", kInvalid,
     "The specified slot \"v\" was not existing on partition lp1 current profile on managed "
     "system host. It maybe have never been added or have already been removed.Current "
     "existing such type resource are \"w,x\"."},
    {"MinGtDesiredValue", kInvalid,
     kLarge + "\"Reservation\" and property value 1 of \"VirtualQuantity\"" + kSpecified +
         "Desired memory should be greater than or equal to min memory."},
    {"MinGtMaxValue", kInvalid,
     kLarge + "\"VirtualQuantity\" and property value 1 of \"Limit\"" + kSpecified +
         "Min memory should be less than or equal to max memory."},
    {"DesiredGtMaxValue", kInvalid,
     kLarge + "\"Reservation\" and property value 1 of \"Limit\"" + kSpecified +
         "Desired memory should be less than or equal to max memory."},
    {"AlreadyExists", kExists, "there is one"},
    {"NoSuchProperty", kNoProperty, "there is none"},
    {"OtherKind", kFailed, "of no kind"},
};

TEST_P(FailureRoad, ProvidersThrowByName) {
    for (const Row& row : kThrownByName) {
        const std::string& name = row.arguments;
        expectFailure(
            {"gi " + disk("Name=\"" + name + "\",Slot=1"), row.status, row.english, row.german});
        // a method's failure has one status, and quotes the text
        expectFailure({"im Test_Disk Fail Failure=" + name, kFailed, general(row.english)});
    }
}

// An exception that names its class gets a sentence around its text, but not in a method; what the
// binding throws is answered as it stands.
const std::string kThrown =
    " on provider Test_DiskProvider. The exception was thrown from method "
    "run on class Tool with an exception id of ";
const std::string kGermanThrown =
    " des Providers Test_DiskProvider trat eine Ausnahme auf. Sie kam "
    "aus der Methode run der Klasse Tool, mit der Kennung ";
const std::vector<Row> kThrownOtherwise = {
    {"gi " + disk("Name=\"OfAClass\",Slot=1"), kDenied,
     "An exception occurred during executing method getInstance" + kThrown +
         "CIM_ERROR and an exception string of \"it \"broke\"\".",
     "Bei der Ausführung der Methode getInstance" + kGermanThrown +
         "CIM_ERROR und dem Text \"it \"broke\"\"."},
    {"gp " + disk("Name=\"OnBehalf\",Slot=1") + " Size", kFailed,
     "An exception occurred during executing method getProperty" + kThrown +
         "E7 and an exception string of \"broke\". The exception was thrown on behalf of "
         "access method readDisks.",
     "Bei der Ausführung der Methode getProperty" + kGermanThrown +
         "E7 und dem Text \"broke\", im Auftrag der Zugriffsmethode readDisks."},
    {"gp " + disk("Name=\"Status\",Slot=1") + " Size", kNotFound, "the binding's own",
     "the binding's own"},
    {"im Test_Disk Fail Failure=OfAClass", kFailed, general("it \"broke\"")},
    {"im Test_Disk Fail Failure=OnBehalf", kFailed, general("broke")},
    {"im Test_Disk Fail Failure=Status", kNotFound, "the binding's own"},
};

TEST_P(FailureRoad, OtherExceptionsThatProvidersThrow) {
    for (const Row& row : kThrownOtherwise) expectFailure(row);
}

// Some failures of an enumeration are the client's business, the others the log's. What was found
// before stays.
TEST_P(FailureRoad, EnumerationsLogWhatTheyDoNotAnswer) {
    const struct {
        const char* user;  ///< says how the provider fails
        int exit;
        std::string err;
        std::string log;
    } rows[] = {
        {"guest", 0, "",
         "log 3 Test_DiskProvider: CIM_ERR_ACCESS_DENIED: User guest is not authorized to utilize "
         "enumerateInstances operation of class Test_Disk on provider Test_DiskProvider.\n"},
        {"ObjectNotFound", 0, "",
         "log 3 Test_DiskProvider: CIM_ERR_NOT_FOUND: The requested object o of class Test_Disk "
         "can not be found. The exception was thrown from method getInstance on provider "
         "Test_DiskProvider.\n"},
        {"Status", 0, "", "log 3 Test_DiskProvider: CIM_ERR_NOT_FOUND: the binding's own\n"},
        {"ParameterNotFound", 4,
         "CIM_ERR_INVALID_PARAMETER (4): Parameter a is not found in provided parameters.\n", ""},
        {"OtherKind", 1, "CIM_ERR_FAILED (1): of no kind\n", ""},
    };
    for (const auto& row : rows) {
        const Outcome got = cimom(std::string("--trace 0 --user ") + row.user + " ei Test_Disk");
        EXPECT_EQ(got.exit, row.exit) << row.user;
        EXPECT_EQ(got.err, (full() ? row.log : "") + row.err) << row.user;
        EXPECT_NE(got.out.find("Test_Disk.Name=\"sda\",Slot=1\n"), std::string::npos) << row.user;
    }
    const Row names = {"ein Test_Disk", kNotSupported,
                       "Method enumerateInstanceNames on provider Test_DiskProvider is not "
                       "supported for class Test_Disk."};
    expectFailure(names);
}

// The class test of every operation, which names the operation as its clients know it.
TEST_P(FailureRoad, ClassesMustBeServed) {
    const std::string other = "'Test_Other.Name=\"x\"'";
    const struct {
        std::string arguments;
        const char* operation;
        const char* className;
    } rows[] = {
        {"gi " + other, "getInstance", "Test_Other"},
        {"ei Test_Other", "enumerateInstances", "Test_Other"},
        {"ein Test_Other", "enumInstanceNames", "Test_Other"},
        {"ci Test_Other Name=x", "createInstance", "Test_Other"},
        {"mi " + other + " Text=x", "modifyInstance", "Test_Other"},
        {"di " + other, "deleteInstance", "Test_Other"},
        {"gp " + other + " Text", "getProperty", "Test_Other"},
        {"sp " + other + " Text x", "setProperty", "Test_Other"},
        {"ai " + kDisk + " --assoc-class Test_Link", "associators", "Test_Link"},
        {"ain " + kDisk + " --assoc-class Test_Link", "associatorNames", "Test_Link"},
        {"ri " + kDisk + " --result-class Test_Link", "references", "Test_Link"},
        {"rin " + kDisk + " --result-class Test_Link", "referenceNames", "Test_Link"},
        // without a filter it is the worker that refuses, with the class of the path
        {"ai " + kDisk, "associators", "Test_Disk"},
        {"rin " + kDisk, "referenceNames", "Test_Disk"},
    };
    for (const auto& [arguments, operation, className] : rows)
        expectFailure({arguments, kNotSupported,
                       std::string("Method ") + operation +
                           " on provider Test_DiskProvider is not supported for class " +
                           className + ".",
                       std::string("Die Methode ") + operation +
                           " des Providers Test_DiskProvider wird für die Klasse " + className +
                           " nicht unterstützt."});
    expectFailure({"im " + other + " Work", kFailed,
                   general("Method invokeMethod on provider Test_DiskProvider is not supported for "
                           "class Test_Other.")});
    // what an indication provider says of its failures does not reach the server
    expectFailure({"watch Test_Other", kNotSupported, "", ""});
    expectFailure({"watch Test_Alarm", kNotSupported, "", ""});
}

// -- wrong requests -------------------------------------------------------------------------------

const std::string kUnexpectedValue =
    "A key provided for class Test_Disk to method getInstance on "
    "provider Test_DiskProvider had an unexpected value. A value of ";
const std::vector<Row> kWrongKeys = {
    {"gi " + disk("Name=\"sda\",Slot=1,Third=\"x\""), kInvalid,
     "Invalid key name Third" + providedTo("getInstance"),
     "Ein ungültiger Schlüsselname Third" + germanProvidedTo("getInstance", "")},
    {"gi " + disk("Name=\"moved\",Slot=1"), kInvalid,
     kUnexpectedValue + "moved was provided for key Name instead of the expected value of sda.",
     "Ein Schlüssel der Klasse Test_Disk, der der Methode getInstance des Providers "
     "Test_DiskProvider übergeben wurde, hatte einen unerwarteten Wert. Für den Schlüssel Name "
     "wurde der Wert moved statt des erwarteten Wertes sda angegeben."},
    {"gi " + disk("Name=\"sda\",Slot=2"), kInvalid,
     kUnexpectedValue + " was provided for key Slot instead of the expected value of ."},
    {"gi " + disk("Name=\"sda\",Slot=1,name=\"sda\""), kInvalid,
     "at character 34 of 'Test_Disk.Name=\"sda\",Slot=1,name=\"sda\"': key name stands twice"},
    {"gi " + disk("Name=\"sda\",Slot=\"one\""), kMismatch, "'one' is no uint32"},
    {"gi " + disk("Name=5,Slot=1"), kInvalid, "key Name of Test_Disk is of type string"},
};

TEST_P(FailureRoad, KeysMustBeThoseOfTheObject) {
    const std::string half = disk("Name=\"sda\"");
    const std::pair<const char*, std::string> incomplete[] = {
        {"getInstance", "gi " + half},
        {"deleteInstance", "di " + half},
        {"modifyInstance", "mi " + half + " Size=5"},
        {"createInstance", "ci Test_Disk Name=sda"},
        {"getProperty", "gp " + half + " Size"},
        {"setProperty", "sp " + half + " Size 5"},
    };
    for (const auto& [method, arguments] : incomplete)
        expectFailure({arguments, kInvalid,
                       std::string("Key Slot for class Test_Disk is not provided to method ") +
                           method + " on provider Test_DiskProvider.",
                       "Der Schlüssel Slot" + germanProvidedTo(method, "nicht ")});
    for (const Row& row : kWrongKeys) expectFailure(row);

    ScopedEnvironment none("CIMOM_SCHEMA", "");
    const Row untyped[] = {
        {"gi " + disk("Name=\"sda\",Slot=\"one\""), kInvalid,
         kUnexpectedValue + "one was provided for key Slot instead of the expected value of ."},
        {"gi " + disk("Name=5,Slot=1"), kMismatch, ""},
    };
    for (const Row& row : untyped) expectFailure(row);
}

const std::string kCreate = "ci Test_Disk Name=sdb Slot=1 ";
const std::string kWrongType =
    " of property \"Size\" is invalid in instance root/cimv2:Test_Disk."
    "Name=\"sdb\",Slot=1, the expected data type is \"uint64\"";
const std::vector<Row> kWrongProperties = {
    {"gi " + kDisk + " --properties Size,Colour", kInvalid,
     "Invalid property name Colour" + providedTo("getInstance"),
     "Ein ungültiger Eigenschaftsname Colour" + germanProvidedTo("getInstance", "")},
    {"ei Test_Disk --properties Size,size", kInvalid,
     "Duplicate property name Size" + providedTo("enumerateInstances"),
     "Der Eigenschaftsname Size" + germanProvidedTo("enumerateInstances", "mehrfach ")},
    {kCreate + "Caption=x caption=y", kInvalid, "'caption' is given twice"},
    {kCreate + "Colour=red", kNoProperty, "there is no 'Colour' to set", "", kFull},
    {kCreate + "Colour=red", kInvalid,
     "Invalid property name Colour" + providedTo("createInstance"), "", kLean},
    {"mi " + kDisk + " Colour=red", kNoProperty, "there is no 'Colour' to set", "", kFull},
    {"mi " + kDisk + " Colour=red", kInvalid,
     "Invalid property name Colour" + providedTo("getInstance"), "", kLean},
    {"sp " + kHost + " Colour red", kNoProperty, "class ORXC_CEC_CS has no property Colour", "",
     kFull},
    {"sp " + kHost + " Colour red", kInvalid,
     "Attempt to change unmodifiable property \"Colour\" of class ORXC_CEC_CS from  to "
     "\"red\".",
     "", kLean},
    {"gp " + kDisk + " Colour", kNoProperty, "Colour"},
    {kCreate + "Size=big", kMismatch, "'big' is no uint64", "", kFull},
    {kCreate + "Size=big", kInvalid, "The data type(\"string\")" + kWrongType, "", kLean},
    {kCreate + "Size=-1", kMismatch, "'-1' is no uint64", "", kFull},
    {kCreate + "Size=-1", kInvalid, "The data type(\"sint64\")" + kWrongType, "", kLean},
    {kCreate + "Size=1", kInvalid,
     "The requested property  \"Caption\" for class Test_Disk was not provided."},
    {kCreate + "Caption=x Firmware=1", kInvalid,
     "Attempt to create or modify unsupported property \"Firmware\" of class Test_Disk."},
    {kCreate + "Caption=x Vendor=1", kInvalid,
     "Attempt to create or modify unimplemented property \"Vendor\" of class Test_Disk to "
     "\"1\"."},
    {kCreate + "Caption=x State=1", kInvalid,
     "Attempt to set property \"State\" of class Test_Disk to \"1\". Can not specify this "
     "property \"State\", when execute this operation."},
    {kCreate + "Caption=x Kind=tape", kInvalid,
     "A property provided for class Test_Disk had an unexpected value. An invalid value of "
     "tape was specifieded for property \"Kind\" instead of the expected value of disk",
     "Eine Eigenschaft der Klasse Test_Disk hatte einen unerwarteten Wert. Der ungültige Wert "
     "tape wurde für die Eigenschaft \"Kind\" angegeben, erwartet wurde disk."},
};

TEST_P(FailureRoad, PropertiesMustBeThoseOfTheClass) {
    for (const Row& row : kWrongProperties) expectFailure(row);
}

const std::vector<Row> kWrongArguments = {
    {"im Test_Disk Fail", kFailed,
     general("Parameter Failure is not found in provided parameters."),
     general("Der Parameter Failure fehlt unter den angegebenen Parametern.")},
    {"im Test_Disk Fail Wrong=1", kInvalid, "there is no 'Wrong' to set", "", kFull},
    {"im Test_Disk Fail Wrong=1", kFailed,
     general("Wrong method argument Wrong when invoking method Fail on provider "
             "Test_DiskProvider."),
     "", kLean},
    {"im Test_Disk Fail Failure=x failure=y", kInvalid, "'failure' is given twice"},
    {"im " + kHost + " RequestStateChange RequestedState=on", kMismatch, "'on' is no uint16", "",
     kFull},
    {"im " + kHost + " RequestStateChange RequestedState=on", kMismatch, "", "", kLean},
    {"im " + kDisk + " Nonsense", kNoMethod, "class Test_Disk has no method Nonsense", "", kFull},
    {"im " + kDisk + " Nonsense", kFailed,
     general("CIM_ERR_METHOD_NOT_FOUND (The invoked method  Nonsense is not supported for "
             "class Test_Disk)"),
     "", kLean},
    {"im Test_Disk Attach Host=" + kHost, kFailed,
     general("refers to an invalid object:root/cimv2:Test_Disk to inovke method Attach"),
     general("refers to an invalid object:root/cimv2:Test_Disk to inovke method Attach")},
};

TEST_P(FailureRoad, ArgumentsMustBeThoseOfTheMethod) {
    for (const Row& row : kWrongArguments) expectFailure(row);
}

// What an argument or a property refers to must exist; the server is asked for it.
const std::string kUnserved = "no provider serves class CIM_ComputerSystem in root/cimv2 for this";
const std::string kUnservedHost =
    "An error ocurred, when validate value CIM_ComputerSystem.Name=\"x\" "
    "of parameter \"Host\". And the error string was \"" +
    kUnserved + "\"";
const std::string kReplace = "im " + kDisk + " Replace 'Disk=instance of Test_Disk { ";
const auto refused = [](const std::string& value, const char* parameter, const char* method) {
    return "Invalid value of " + value + " is provided for parameter " + parameter + " to method " +
           method + " on provider Test_DiskProvider.";
};
const std::vector<Row> kMissingObjects = {
    {"im " + kDisk + " Attach 'Host=" + kNoHost + "'", kFailed,
     general(refused(kNoHost, "Host", "Attach")), general(refused(kNoHost, "Host", "Attach"))},
    {"im " + kDisk + " Attach Host=ORXC_CEC_CS", kFailed,
     general(refused("ORXC_CEC_CS", "Host", "Attach"))},
    {"im " + kDisk + " Attach 'Host=CIM_ComputerSystem.Name=\"x\"'", kFailed,
     general(kUnservedHost)},
    {"im " + disk("Name=\"sdb\",Slot=1") + " Attach Host=" + kHost, kFailed,
     general("refers to an invalid object:root/cimv2:Test_Disk.Name=\"sdb\",Slot=1 to inovke "
             "method Attach")},
    {"mi " + kDisk + " " + kNoHostInstance, kInvalid, refused(kNoHost, "Host", "modifyInstance")},
    {"mi " + kDisk + " 'Host=instance of CIM_ComputerSystem { Name = \"x\"; }'", kFailed,
     "An exception occurred during executing method modifyInstance on provider "
     "Test_DiskProvider. The exception was thrown from method validateEmbeddedObject on class "
     "zemVirtualSystemManagementServiceProvider with an exception id of CIM_ERR_NOT_SUPPORTED "
     "and an exception string of \"" +
         kUnservedHost + "\". The exception was thrown on behalf of access method getInstance.",
     "Bei der Ausführung der Methode modifyInstance des Providers Test_DiskProvider trat eine "
     "Ausnahme auf. Sie kam aus der Methode validateEmbeddedObject der Klasse "
     "zemVirtualSystemManagementServiceProvider, mit der Kennung CIM_ERR_NOT_SUPPORTED und dem "
     "Text \"" +
         kUnservedHost + "\", im Auftrag der Zugriffsmethode getInstance."},
    {kReplace + "Name = \"sdb\"; Slot = 1; }'", kFailed,
     general(refused("Test_Disk.Name=\"sdb\",Slot=1", "Disk", "Replace"))},
    {kReplace + "Size = 5; }'", kFailed, general(refused("Test_Disk", "Disk", "Replace"))},
    {kReplace + "Colour = \"red\"; }'", kNoProperty, "class Test_Disk has no property Colour", "",
     kFull},
    {kReplace + "Colour = \"red\"; }'", kFailed,
     general("Invalid property name Colour" + providedTo("Replace")), "", kLean},
    {kReplace + "Size = \"big\"; }'", kMismatch, "'big' is no uint64", "", kFull},
    {kReplace + "Size = \"big\"; }'", kFailed,
     general("The data type(\"string\") of property \"Size\" is invalid in instance Test_Disk, "
             "the expected data type is \"uint64\""),
     "", kLean},
    {"im " + kDisk + " Replace Disk=red", kInvalid, "at character 4 of 'red': Class { is missing",
     "", kFull},
    {"im " + kDisk + " Replace Disk=red", kMismatch, "", "", kLean},
};

TEST_P(FailureRoad, EmbeddedObjectsMustExist) {
    for (const Row& row : kMissingObjects) expectFailure(row);
}

TEST_P(FailureRoad, UsersMayBeRefused) {
    const std::pair<const char*, std::string> rows[] = {
        {"getInstance", "gi " + kDisk},
        {"getInstance", "gp " + kDisk + " Size"},
        {"createInstance", "ci Test_Disk Name=sdb Slot=1"},
    };
    for (const auto& [method, arguments] : rows)
        expectFailure({"--user guest " + arguments, kDenied,
                       std::string("User guest is not authorized to utilize ") + method +
                           " operation of class Test_Disk on provider Test_DiskProvider.",
                       std::string("Der Benutzer guest darf die Operation ") + method +
                           " der Klasse Test_Disk des Providers Test_DiskProvider nicht "
                           "ausführen."});
    EXPECT_EQ(cimom("--user kim gi " + kDisk).exit, 0);
}

TEST_P(FailureRoad, DisabledProvidersFindNothing) {
    m_before = "ASAN_OPTIONS=verify_asan_link_order=0:detect_leaks=0 LD_PRELOAD=" ZEM_DISABLED " ";
    for (const std::string& arguments : std::vector<std::string>{
             "ei Test_Disk", "ein Test_Disk", "ei ORXC_CEC_CS", "ein ORXC_HostedPartition",
             "ai " + kHost + " --assoc-class ORXC_HostedPartition",
             "rin " + kHost + " --result-class ORXC_HostedPartition"}) {
        const Outcome got = cimom(arguments);
        EXPECT_EQ(got.exit, 0) << arguments << got.err;
        EXPECT_EQ(got.out, "") << arguments;
    }
    const std::string english =
        "The requested object The XBRG is managed by DNX, this provider on the XGRB in dissabled. "
        "of class zemBaseProvider can not be found. The exception was thrown from method "
        "getInstance on provider Test_DiskProvider.";
    const std::string german =
        "Das angeforderte Objekt The XBRG is managed by DNX, this provider on the XGRB in "
        "dissabled. der Klasse zemBaseProvider wurde nicht gefunden. Die Ausnahme kam aus der "
        "Methode getInstance des Providers Test_DiskProvider.";
    const Row rows[] = {
        {"gi " + kDisk, kNotFound, english, german},
        {"mi " + kDisk + " Size=5", kNotFound, english, german},  // its existence test finds none
        {"di " + kDisk, kNotSupported,
         "Method deleteInstance on provider Test_DiskProvider is not supported for class "
         "Test_Disk."},
        {"im Test_Disk Fail Failure=OtherKind", kFailed, general("of no kind")},
    };
    for (const Row& row : rows) expectFailure(row);
}

// -- associations ---------------------------------------------------------------------------------

std::string reference(const std::string& path) {
    return std::regex_replace(path, std::regex("\""), "\\\"");
}

const std::string kFarPartition =
    R"(ORXC_LPAR_CS.CreationClassName="ORXC_LPAR_CS",Name="1*1111-AAB*0000002")";

/// Command that gets an association by its two references.
std::string getLink(const std::string& name, const char* role1, const std::string& path1,
                    const char* role2, const std::string& path2) {
    return "gi '" + name + "." + role1 + "=\"" + reference(path1) + "\"," + role2 + "=\"" +
           reference(path2) + "\"'";
}

const std::vector<Row> kWrongAssociations = {
    {getLink("ORXC_HostedPartition", "Antecedent", kPlainDisk, "Dependent", kPlainDisk), kInvalid,
     "Invalid value " + kPlainDisk +
         " for the property Antecedent of the class ORXC_HostedPartition is provided to method "
         "getInstance on provider ORXC_HostedPartitionProvider"},
    {getLink("ORXC_HostedPartition", "Antecedent", kPlainHost, "Dependent", kFarPartition),
     kInvalid,
     "There doesn't exist an association ORXC_HostedPartition between the property Antecedent with "
     "value " +
         kPlainHost + " and the property Dependent with value " + kFarPartition},
    {getLink("ORXC_ConnectedHost", "Antecedent", kPlainDisk, "Dependent", kPlainDisk), kInvalid,
     "Invalid value \"" + kPlainDisk + "\" for the property Antecedent and invalid value \"" +
         kPlainDisk +
         "\" for the property Dependent of the class ORXC_ConnectedHost were provided to method "
         "getInstance on provider ORXC_ConnectedHostProvider"},
    {getLink("ORXC_HostComponent", "GroupComponent", kPlainDisk, "PartComponent", kFarPartition),
     kInvalid,
     "Invalid value \"" + kPlainDisk +
         "\" for the property GroupComponent of the class ORXC_HostComponent was provided to "
         "method getInstance on provider ORXC_HostComponentProvider"},
    {getLink("ORXC_HostComponent", "GroupComponent", kPlainHost, "PartComponent", kFarPartition),
     kNotFound,
     "The requested object root/cimv2:ORXC_HostComponent.GroupComponent=" + kPlainHost +
         ",PartComponent=" + kFarPartition +
         " of class ORXC_HostComponent can not be found. The exception was thrown from method "
         "getInstance on provider ORXC_HostComponentProvider."},
    {"gi 'ORXC_HostedPartition.Antecedent=\"" + reference(kPlainHost) + "\"'", kInvalid,
     "Key Dependent for class ORXC_HostedPartition is not provided to method getInstance on "
     "provider ORXC_HostedPartitionProvider."},
};

TEST_P(FailureRoad, AssociationsMustBeWhatTheyAre) {
    for (const Row& row : kWrongAssociations) expectFailure(row);
}

// The failure of the provider of the other side, in that of the association's provider; the
// families differ in what they tell of it.
TEST_P(FailureRoad, AssociationsOfWhatIsNotThereAreRefused) {
    const struct {
        const char* name;
        const char* id;
        const char* access;
    } rows[] = {
        {"ORXC_HostedPartition", "CIM_ERR", "getInstance"},
        {"ORXC_ConnectedHost", "CIM_ERR", "getInstance"},
        {"ORXC_HostComponent", "CIM_ERR_NOT_FOUND", "getInstance"},
        {"ORXC_ReachedHost", "CIM_ERR", "enumerateInstanceNames"},
    };
    const std::string missing = "root/cimv2:" + kNoHost;
    for (const auto& [name, id, access] : rows) {
        const std::string provider = std::string(name) + "Provider";
        const std::string english =
            "The requested object " + missing +
            " of class ORXC_CEC_CS can not be found. The exception was thrown from method "
            "getInstance on provider ORXC_CEC_CSProvider.";
        const std::string german =
            "Das angeforderte Objekt " + missing +
            " der Klasse ORXC_CEC_CS wurde nicht gefunden. Die Ausnahme kam aus der Methode "
            "getInstance des Providers ORXC_CEC_CSProvider.";
        expectFailure(
            {"ain '" + kNoHost + "' --assoc-class " + name, kInvalid,
             "An exception occurred during executing method associatorNames on provider " +
                 provider +
                 ". The exception was thrown from method associatorNames on class ORXC_CEC_CS with "
                 "an exception id of " +
                 id + " and an exception string of \"" + english +
                 "\". The exception was thrown on behalf of access method " + access + ".",
             "Bei der Ausführung der Methode associatorNames des Providers " + provider +
                 " trat eine Ausnahme auf. Sie kam aus der Methode associatorNames der Klasse "
                 "ORXC_CEC_CS, mit der Kennung " +
                 id + " und dem Text \"" + german + "\", im Auftrag der Zugriffsmethode " + access +
                 "."});
    }
}

// -- languages ------------------------------------------------------------------------------------

// The client's languages choose the locale of the tools, whose first is taken, and the bundle, of
// which the first that there is.
TEST_P(FailureRoad, LanguagesChooseTheTextAndTheToolsLocale) {
    const fs::path messages = m_appliance.folder() / "messages";
    fs::create_directory(messages);
    fs::copy(ZEM_MESSAGES "/default_de.json", messages);
    std::ofstream(messages / "default_fr.json")
        << R"({"Error.PropertiesAccessException2": "{0} : {6} : {5}"})";
    m_appliance.replaceTool("qyplat", "echo \"WRTL0001 $LC_ALL\"\nexit 1");
    const std::string call = "\"qyplat -r sys -F type_model,serial_num\"";
    const auto english = [&call](const std::string& text) {
        return "An exception occurred during executing method enumInstanceNames on provider "
               "ORXC_CEC_CSProvider. The exception was thrown from method callGenericCommand on "
               "class zemCommandCaller with an exception id of WRTL0001 and an exception string "
               "of \"" +
               text + "\". The exception was thrown on behalf of access method " + call + ".";
    };
    const auto german = [&call](const std::string& text) {
        return "Bei der Ausführung der Methode enumInstanceNames des Providers "
               "ORXC_CEC_CSProvider trat eine Ausnahme auf. Sie kam aus der Methode "
               "callGenericCommand der Klasse zemCommandCaller, mit der Kennung WRTL0001 und dem "
               "Text \"" +
               text + "\", im Auftrag der Zugriffsmethode " + call + ".";
    };
    const auto french = [&call](const std::string& text) {
        return "enumInstanceNames : " + call + " : " + text;
    };
    const struct {
        const char* accepted;
        const char* locale;
        std::function<std::string(const std::string&)> words;
    } rows[] = {
        {"", "", english},
        {"root", "", english},
        {"en", "en_US.UTF-8", english},
        {"zh", "en_US.UTF-8", english},
        {"de", "de_DE.UTF-8", german},
        {"de-AT", "de_AT.UTF-8", german},
        {"fr-ca", "fr_CA.UTF-8", french},
        {"fr;q=0", "", english},
        {"fr;q=0.5,de", "de_DE.UTF-8", german},
        {"fr;q=0.5,de;q=0.5", "fr_FR.UTF-8", french},
        {"pt-br;q=0.7,de;q=0.5", "pt_BR.UTF-8", german},
    };
    for (const auto& row : rows) {
        const std::string told = std::string("WRTL0001 ") + row.locale;
        const std::string arguments =
            std::string("--language '") + row.accepted + "' ein ORXC_CEC_CS";
        expectFailure({arguments, kFailed, english(told)});
        expectFailure({"--messages '" + messages.string() + "' " + arguments, kFailed,
                       full() ? row.words(told) : english(told)});
    }
}

INSTANTIATE_TEST_SUITE_P(Brokers, FailureRoad, ::testing::Values(kFull, kLean),
                         [](const auto& broker) { return std::string(broker.param); });

// The bundle has a text for every key that the library can look up, and for nothing else.
TEST(FailureBundle, HasEveryKeyOfTheLibrary) {
    std::set<std::string> used, translated;
    const std::regex key(R"re("(Error\.\w+)")re");
    for (const fs::directory_entry& file : fs::directory_iterator(ZEM_UTILITIES)) {
        const std::string source = contents(file.path());
        for (std::sregex_iterator at(source.begin(), source.end(), key), end; at != end; ++at)
            used.insert((*at)[1]);
    }
    const auto texts = nlohmann::json::parse(contents(ZEM_MESSAGES "/default_de.json"));
    for (const auto& [name, text] : texts.items()) translated.insert(name);
    EXPECT_GE(used.size(), 15U);
    EXPECT_EQ(translated, used);
}

}  // namespace

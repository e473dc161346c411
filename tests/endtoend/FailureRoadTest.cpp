// What a client reads when something is wrong, byte for byte: from the command line through each
// broker and the frame to a provider and back, with and without a bundle of translated texts.
#include <gtest/gtest.h>

#include <nlohmann/json.hpp>
#include <regex>
#include <set>

#include "TestAppliance.h"

namespace {

namespace fs = std::filesystem;
using testing_support::contents;
using testing_support::lines;
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

/// The same text with and without a bundle; the second is empty where it is not asked for.
struct Texts {
    Texts(const char* text) : english(text) {}             // NOLINT(google-explicit-constructor)
    Texts(std::string text) : english(std::move(text)) {}  // NOLINT(google-explicit-constructor)
    Texts(std::string first, std::string second)
        : english(std::move(first)), german(std::move(second)) {}
    std::string english, german;
};

constexpr const char* kEither = nullptr;
constexpr const char* kFull = "full";
constexpr const char* kLean = "lean";

struct Row {
    std::string arguments;
    Status status;
    Texts text;
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

/// A sentence of the library, with numbers in braces where the inserts stand.
struct Sentence {
    const char* name;  ///< with which the failing provider is told to use it
    Status status;
    const char* inserts;  ///< of the failing provider, a line each
    std::string english, german = "";
};

const std::string kUntranslated =
    "Invalid value of {1} is provided for parameter {0} to method {2} on provider "
    "Test_DiskProvider.";
const std::string kConflict =
    "Conflicted property value 18446744073709551615 of \"{0}\" and property value 1 of \"{1}\" "
    "were specified for class Test_Disk for partition lp1 on managed system host. {2} memory "
    "should be {3} memory.";
const std::string kThrown =
    "An exception occurred during executing method {0} on provider {1}Provider. The exception "
    "was thrown from method {2} on class {3} with an exception id of {4} and an exception string "
    "of \"{5}\".";
const std::string kGermanThrown =
    "Bei der Ausführung der Methode {0} des Providers {1}Provider trat eine Ausnahme auf. Sie kam "
    "aus der Methode {2} der Klasse {3}, mit der Kennung {4} und dem Text \"{5}\"";
const Sentence kSentences[] = {
    {"MethodNotSupported", kNotSupported, "getInstance\nTest_Disk",
     "Method {0} on provider Test_DiskProvider is not supported for class {1}.",
     "Die Methode {0} des Providers Test_DiskProvider wird für die Klasse {1} nicht unterstützt."},
    {"MethodNotFound", kNoMethod, "getInstance",
     "CIM_ERR_METHOD_NOT_FOUND (The invoked method  {0} is not supported for class Test_Disk)",
     "CIM_ERR_METHOD_NOT_FOUND (Die aufgerufene Methode {0} wird für die Klasse Test_Disk nicht "
     "unterstützt)"},
    {"UserAccessDenied", kDenied, "kim\ngetInstance",
     "User {0} is not authorized to utilize {1} operation of class Test_Disk on provider "
     "Test_DiskProvider.",
     "Der Benutzer {0} darf die Operation {1} der Klasse Test_Disk des Providers "
     "Test_DiskProvider nicht ausführen."},
    {"KeyNotFound", kInvalid, "k\nTest_Disk\ngetInstance",
     "Key {0} for class {1} is not provided to method {2} on provider {1}Provider.",
     "Der Schlüssel {0} der Klasse {1} wurde der Methode {2} des Providers {1}Provider nicht "
     "übergeben."},
    {"InvalidKey", kInvalid, "k\ngetInstance",
     "Invalid key name {0} for class Test_Disk is provided to method {1} on provider "
     "Test_DiskProvider.",
     "Ein ungültiger Schlüsselname {0} der Klasse Test_Disk wurde der Methode {1} des Providers "
     "Test_DiskProvider übergeben."},
    {"DuplicateKey", kInvalid, "k\ngetInstance",
     "Duplicate key {0} for class Test_Disk is provided to method {1} on provider "
     "Test_DiskProvider.",
     "Der Schlüssel {0} der Klasse Test_Disk wurde der Methode {1} des Providers "
     "Test_DiskProvider mehrfach übergeben."},
    {"KeyValueDoesntMatch", kInvalid, "k\n1\n2",
     "A key provided for class Test_Disk to method getInstance on provider Test_DiskProvider had "
     "an unexpected value. A value of {1} was provided for key {0} instead of the expected value "
     "of {2}.",
     "Ein Schlüssel der Klasse Test_Disk, der der Methode getInstance des Providers "
     "Test_DiskProvider übergeben wurde, hatte einen unerwarteten Wert. Für den Schlüssel {0} "
     "wurde der Wert {1} statt des erwarteten Wertes {2} angegeben."},
    {"PropertyNotFound", kInvalid, "p",
     "Property {0} is not found on instance provided for class Test_Disk.",
     "Die Eigenschaft {0} fehlt in der Instanz der Klasse Test_Disk."},
    {"DuplicateProperty", kInvalid, "p\ngetInstance",
     "Duplicate property name {0} for class Test_Disk is provided to method {1} on provider "
     "Test_DiskProvider.",
     "Der Eigenschaftsname {0} der Klasse Test_Disk wurde der Methode {1} des Providers "
     "Test_DiskProvider mehrfach übergeben."},
    {"InvalidProperty", kInvalid, "p\ngetInstance",
     "Invalid property name {0} for class Test_Disk is provided to method {1} on provider "
     "Test_DiskProvider.",
     "Ein ungültiger Eigenschaftsname {0} der Klasse Test_Disk wurde der Methode {1} des "
     "Providers Test_DiskProvider übergeben."},
    {"ObjectNotFound", kNotFound, "o\nTest_Disk\nTest_Disk",
     "The requested object {0} of class {1} can not be found. The exception was thrown from "
     "method getInstance on provider {2}Provider.",
     "Das angeforderte Objekt {0} der Klasse {1} wurde nicht gefunden. Die Ausnahme kam aus der "
     "Methode getInstance des Providers {2}Provider."},
    {"WrongMethodArg", kInvalid, "a\nm",
     "Wrong method argument {0} when invoking method {1} on provider Test_DiskProvider.",
     "Falsches Argument {0} beim Aufruf der Methode {1} des Providers Test_DiskProvider."},
    {"DuplicateMethodArg", kInvalid, "a\nm",
     "Duplicate method argument {0} when invoking method {1} on provider Test_DiskProvider.",
     "Mehrfaches Argument {0} beim Aufruf der Methode {1} des Providers Test_DiskProvider."},
    // the one that no bundle translates
    {"InvalidMethodArgValue", kInvalid, "a\nv\nm", kUntranslated, kUntranslated},
    {"ParameterNotFound", kInvalid, "a", "Parameter {0} is not found in provided parameters.",
     "Der Parameter {0} fehlt unter den angegebenen Parametern."},
    {"PropertyValueDoesntMatch", kInvalid, "p\n1\n2",
     "A property provided for class Test_Disk had an unexpected value. An invalid value of {1} "
     "was specifieded for property \"{0}\" instead of the expected value of {2}",
     "Eine Eigenschaft der Klasse Test_Disk hatte einen unerwarteten Wert. Der ungültige Wert "
     "{1} wurde für die Eigenschaft \"{0}\" angegeben, erwartet wurde {2}."},
    {"OfAClass", kDenied, "getInstance\nTest_Disk\nrun\nTool\nCIM_ERROR\nit \"broke\"", kThrown,
     kGermanThrown + "."},
    {"OnBehalf", kFailed, "getInstance\nTest_Disk\nrun\nTool\nE7\nbroke\nreadDisks",
     kThrown + " The exception was thrown on behalf of access method {6}.",
     kGermanThrown + ", im Auftrag der Zugriffsmethode {6}."},
    {"MultiResource", kInvalid, "",
     "Multiple memory instances were specified for partition lp1 on managed system host. Only "
     "one instance should be specified for such resource."},
    {"DuplicateResource", kInvalid, "",
     "Duplicate slot resources \"v\" were specified for partition lp1 on managed system host"},
    {"ResourceHasExisted", kInvalid, "",
     "The specified slot \"v\" has been existing on partition lp1 current profile on managed "
     "system host. "},
    {"ResourceNotExisting", kInvalid, "",
     "The specified slot \"v\" was not existing on partition lp1 current profile on managed "
     "system host. It maybe have never been added or have already been removed.Current "
     "existing such type resource are \"w,x\"."},
    {"MinGtDesiredValue", kInvalid,
     "Reservation\nVirtualQuantity\nDesired\ngreater than or equal to min", kConflict},
    {"MinGtMaxValue", kInvalid, "VirtualQuantity\nLimit\nMin\nless than or equal to max",
     kConflict},
    {"DesiredGtMaxValue", kInvalid, "Reservation\nLimit\nDesired\nless than or equal to max",
     kConflict},
    {"AlreadyExists", kExists, "", "there is one"},
    {"NoSuchProperty", kNoProperty, "", "there is none"},
    {"OtherKind", kFailed, "", "of no kind"},
    {"Status", kNotFound, "", "the binding's own", "the binding's own"},
};

std::string filled(std::string text, const std::vector<Texts>& inserts, bool inGerman) {
    std::size_t from = 0;
    for (std::size_t at; (at = text.find('{', from)) != std::string::npos;) {
        const Texts& insert = inserts.at(static_cast<std::size_t>(text[at + 1] - '0'));
        const std::string& word =
            inGerman && !insert.german.empty() ? insert.german : insert.english;
        text.replace(at, 3, word);
        from = at + word.size();
    }
    return text;
}

/// The sentence of that name, with the failing provider's inserts unless others are given.
Texts says(const std::string& name, std::vector<Texts> inserts = {}) {
    for (const Sentence& sentence : kSentences) {
        if (sentence.name != name) continue;
        if (inserts.empty())
            for (const std::string& word : lines(sentence.inserts)) inserts.push_back(word);
        return {filled(sentence.english, inserts, false), filled(sentence.german, inserts, true)};
    }
    throw std::out_of_range(name);
}

/// What comes of the text of a failure in a method.
Texts general(const Texts& text) {
    const auto wrapped = [](const std::string& inner) {
        return inner.empty() ? inner
                             : "A general error occurred that is not covered by a more specific "
                               "error code: \"" +
                                   inner + "\"";
    };
    return {wrapped(text.english), wrapped(text.german)};
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

    void expectGerman(const std::string& arguments, const Status& status, const std::string& text) {
        expectFailure("--messages '" ZEM_MESSAGES "' --language de " + arguments, status, text);
    }

    /// With a bundle under the broker that reads one, without under the other, unless the row
    /// tells of one broker alone.
    void expectFailure(const Row& row) {
        if (row.broker != kEither && row.broker != std::string(GetParam())) return;
        if (full() && !row.text.german.empty()) {
            expectGerman(row.arguments, row.status, row.text.german);
        } else if (!full() || row.broker == kFull) {
            expectFailure(row.arguments, row.status, row.text.english);
        }
    }

    TestAppliance m_appliance{ZEM_PROGRAMS};
    ScopedEnvironment m_schema{"CIMOM_SCHEMA", ZEM_FAILING ".mof"};
    ScopedEnvironment m_locale{"LC_ALL", ""};
    std::string m_before;  ///< environment of cimom alone
};

// -- the failures that providers throw by name ----------------------------------------------------

TEST_P(FailureRoad, ProvidersThrowByName) {
    for (const Sentence& sentence : kSentences) {
        const std::string name = sentence.name;
        const std::string arguments = "gi " + disk("Name=\"" + name + "\",Slot=1");
        const Texts text = says(name);
        expectFailure(arguments, sentence.status, text.english);
        if (full() && !text.german.empty()) expectGerman(arguments, sentence.status, text.german);
    }
    expectFailure({"gp " + disk("Name=\"OnBehalf\",Slot=1") + " Size", kFailed,
                   says("OnBehalf",
                        {"getProperty", "Test_Disk", "run", "Tool", "E7", "broke", "readDisks"})});
    expectFailure({"gp " + disk("Name=\"Status\",Slot=1") + " Size", kNotFound, says("Status")});
}

// A method's failure has one status, and quotes the text, which gets no sentence around it; what
// the binding throws is answered as it stands.
TEST_P(FailureRoad, MethodsThrowByName) {
    const std::string fail = "im Test_Disk Fail Failure=";
    for (const char* name :
         {"MethodNotSupported", "MethodNotFound", "UserAccessDenied", "ParameterNotFound",
          "ObjectNotFound", "AlreadyExists", "NoSuchProperty", "OtherKind"})
        expectFailure({fail + name, kFailed, general(says(name))});
    expectFailure({fail + "OfAClass", kFailed, general("it \"broke\"")});
    expectFailure({fail + "OnBehalf", kFailed, general("broke")});
    expectFailure({fail + "Status", kNotFound, says("Status")});
}

// Some failures of an enumeration are the client's business, the others the log's. What was found
// before stays.
TEST_P(FailureRoad, EnumerationsLogWhatTheyDoNotAnswer) {
    const std::string logged = "log 3 Test_DiskProvider: CIM_ERR_";
    const struct {
        const char* user;  ///< says how the provider fails
        int exit;
        std::string err;
        std::string log;
    } rows[] = {
        {"guest", 0, "",
         logged + "ACCESS_DENIED: " +
             says("UserAccessDenied", {"guest", "enumerateInstances"}).english + '\n'},
        {"ObjectNotFound", 0, "", logged + "NOT_FOUND: " + says("ObjectNotFound").english + '\n'},
        {"Status", 0, "", logged + "NOT_FOUND: the binding's own\n"},
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
    expectFailure({"ein Test_Disk", kNotSupported,
                   says("MethodNotSupported", {"enumerateInstanceNames", "Test_Disk"})});
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
        expectFailure(
            {arguments, kNotSupported, says("MethodNotSupported", {operation, className})});
    expectFailure({"im " + other + " Work", kFailed,
                   general(says("MethodNotSupported", {"invokeMethod", "Test_Other"}))});
    // what an indication provider says of its failures does not reach the server
    expectFailure({"watch Test_Other", kNotSupported, ""});
    expectFailure({"watch Test_Alarm", kNotSupported, ""});
}

// -- wrong requests -------------------------------------------------------------------------------

const std::vector<Row> kWrongKeys = {
    {"gi " + disk("Name=\"sda\",Slot=1,Third=\"x\""), kInvalid,
     says("InvalidKey", {"Third", "getInstance"})},
    {"gi " + disk("Name=\"moved\",Slot=1"), kInvalid,
     says("KeyValueDoesntMatch", {"Name", "moved", "sda"})},
    {"gi " + disk("Name=\"sda\",Slot=2"), kInvalid, says("KeyValueDoesntMatch", {"Slot", "", ""})},
    {"gi " + disk("Name=\"sda\",Slot=1,name=\"sda\""), kInvalid,
     "at character 34 of 'Test_Disk.Name=\"sda\",Slot=1,name=\"sda\"': key name stands twice",
     kFull},
    {"gi " + disk("Name=\"sda\",Slot=1,name=\"sda\""), kInvalid,
     says("DuplicateKey", {"Name", "getInstance"}), kLean},
    {"gi " + disk("Name=\"sda\",Slot=\"one\""), kMismatch, "'one' is no uint32", kFull},
    {"gi " + disk("Name=\"sda\",Slot=\"one\""), kInvalid,
     says("KeyValueDoesntMatch", {"Slot", "one", ""}), kLean},
    {"gi " + disk("Name=5,Slot=1"), kInvalid, "key Name of Test_Disk is of type string", kFull},
    {"gi " + disk("Name=5,Slot=1"), kMismatch, "", kLean},
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
        expectFailure({arguments, kInvalid, says("KeyNotFound", {"Slot", "Test_Disk", method})});
    for (const Row& row : kWrongKeys) expectFailure(row);

    ScopedEnvironment none("CIMOM_SCHEMA", "");
    const Row untyped[] = {
        {"gi " + disk("Name=\"sda\",Slot=\"one\""), kInvalid,
         says("KeyValueDoesntMatch", {"Slot", "one", ""})},
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
     says("InvalidProperty", {"Colour", "getInstance"})},
    {"ei Test_Disk --properties Size,size", kInvalid,
     says("DuplicateProperty", {"Size", "enumerateInstances"})},
    {kCreate + "Caption=x caption=y", kInvalid, "'caption' is given twice", kFull},
    {kCreate + "Caption=x caption=y", kInvalid,
     says("DuplicateProperty", {"Caption", "createInstance"}), kLean},
    {kCreate + "Colour=red", kNoProperty, "there is no 'Colour' to set", kFull},
    {kCreate + "Colour=red", kInvalid, says("InvalidProperty", {"Colour", "createInstance"}),
     kLean},
    {"mi " + kDisk + " Colour=red", kNoProperty, "there is no 'Colour' to set", kFull},
    {"mi " + kDisk + " Colour=red", kInvalid, says("InvalidProperty", {"Colour", "getInstance"}),
     kLean},
    {"sp " + kHost + " Colour red", kNoProperty, "class ORXC_CEC_CS has no property Colour", kFull},
    {"sp " + kHost + " Colour red", kInvalid,
     "Attempt to change unmodifiable property \"Colour\" of class ORXC_CEC_CS from  to "
     "\"red\".",
     kLean},
    {"gp " + kDisk + " Colour", kNoProperty, "Colour"},
    {kCreate + "Size=big", kMismatch, "'big' is no uint64", kFull},
    {kCreate + "Size=big", kInvalid, "The data type(\"string\")" + kWrongType, kLean},
    {kCreate + "Size=-1", kMismatch, "'-1' is no uint64", kFull},
    {kCreate + "Size=-1", kInvalid, "The data type(\"sint64\")" + kWrongType, kLean},
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
     says("PropertyValueDoesntMatch", {"Kind", "tape", "disk"})},
};

TEST_P(FailureRoad, PropertiesMustBeThoseOfTheClass) {
    for (const Row& row : kWrongProperties) expectFailure(row);
}

const std::string kNoObject =
    "refers to an invalid object:root/cimv2:Test_Disk to inovke method Attach";
const std::vector<Row> kWrongArguments = {
    {"im Test_Disk Fail", kFailed, general(says("ParameterNotFound", {"Failure"}))},
    {"im Test_Disk Fail Wrong=1", kInvalid, "there is no 'Wrong' to set", kFull},
    {"im Test_Disk Fail Wrong=1", kFailed, general(says("WrongMethodArg", {"Wrong", "Fail"})),
     kLean},
    {"im Test_Disk Fail Failure=x failure=y", kInvalid, "'failure' is given twice", kFull},
    {"im Test_Disk Fail Failure=x failure=y", kFailed,
     general(says("DuplicateMethodArg", {"Failure", "Fail"})), kLean},
    {"im " + kHost + " RequestStateChange RequestedState=on", kMismatch, "'on' is no uint16",
     kFull},
    {"im " + kHost + " RequestStateChange RequestedState=on", kMismatch, "", kLean},
    {"im " + kDisk + " Nonsense", kNoMethod, "class Test_Disk has no method Nonsense", kFull},
    {"im " + kDisk + " Nonsense", kFailed, general(says("MethodNotFound", {"Nonsense"})), kLean},
    {"im Test_Disk Attach Host=" + kHost, kFailed, general({kNoObject, kNoObject})},
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
const std::vector<Row> kMissingObjects = {
    {"im " + kDisk + " Attach 'Host=" + kNoHost + "'", kFailed,
     general(says("InvalidMethodArgValue", {"Host", kNoHost, "Attach"}))},
    {"im " + kDisk + " Attach Host=ORXC_CEC_CS", kFailed,
     general(says("InvalidMethodArgValue", {"Host", "ORXC_CEC_CS", "Attach"}))},
    {"im " + kDisk + " Attach 'Host=CIM_ComputerSystem.Name=\"x\"'", kFailed,
     general(kUnservedHost)},
    {"im " + disk("Name=\"sdb\",Slot=1") + " Attach Host=" + kHost, kFailed,
     general("refers to an invalid object:root/cimv2:Test_Disk.Name=\"sdb\",Slot=1 to inovke "
             "method Attach")},
    {"mi " + kDisk + " " + kNoHostInstance, kInvalid,
     says("InvalidMethodArgValue", {"Host", kNoHost, "modifyInstance"})},
    {"mi " + kDisk + " 'Host=instance of CIM_ComputerSystem { Name = \"x\"; }'", kFailed,
     says("OnBehalf", {"modifyInstance", "Test_Disk", "validateEmbeddedObject",
                       "zemVirtualSystemManagementServiceProvider", "CIM_ERR_NOT_SUPPORTED",
                       kUnservedHost, "getInstance"})},
    {kReplace + "Name = \"sdb\"; Slot = 1; }'", kFailed,
     general(says("InvalidMethodArgValue", {"Disk", "Test_Disk.Name=\"sdb\",Slot=1", "Replace"}))},
    {kReplace + "Size = 5; }'", kFailed,
     general(says("InvalidMethodArgValue", {"Disk", "Test_Disk", "Replace"}))},
    {kReplace + "Colour = \"red\"; }'", kNoProperty, "class Test_Disk has no property Colour",
     kFull},
    {kReplace + "Colour = \"red\"; }'", kFailed,
     general(says("InvalidProperty", {"Colour", "Replace"})), kLean},
    {kReplace + "Size = \"big\"; }'", kMismatch, "'big' is no uint64", kFull},
    {kReplace + "Size = \"big\"; }'", kFailed,
     general("The data type(\"string\") of property \"Size\" is invalid in instance Test_Disk, "
             "the expected data type is \"uint64\""),
     kLean},
    {"im " + kDisk + " Replace Disk=red", kInvalid, "at character 4 of 'red': Class { is missing",
     kFull},
    {"im " + kDisk + " Replace Disk=red", kMismatch, "", kLean},
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
        expectFailure(
            {"--user guest " + arguments, kDenied, says("UserAccessDenied", {"guest", method})});
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
    const Texts absent = says(
        "ObjectNotFound", {"The XBRG is managed by DNX, this provider on the XGRB in dissabled.",
                           "zemBaseProvider", "Test_Disk"});
    const Row rows[] = {
        {"gi " + kDisk, kNotFound, absent},
        {"mi " + kDisk + " Size=5", kNotFound, absent},  // its existence test finds none
        {"di " + kDisk, kNotSupported, says("MethodNotSupported", {"deleteInstance", "Test_Disk"})},
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
     says("ObjectNotFound", {"root/cimv2:ORXC_HostComponent.GroupComponent=" + kPlainHost +
                                 ",PartComponent=" + kFarPartition,
                             "ORXC_HostComponent", "ORXC_HostComponent"})},
    {"gi 'ORXC_HostedPartition.Antecedent=\"" + reference(kPlainHost) + "\"'", kInvalid,
     says("KeyNotFound", {"Dependent", "ORXC_HostedPartition", "getInstance"})},
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
    const Texts missing =
        says("ObjectNotFound", {"root/cimv2:" + kNoHost, "ORXC_CEC_CS", "ORXC_CEC_CS"});
    for (const auto& [name, id, access] : rows)
        expectFailure({"ain '" + kNoHost + "' --assoc-class " + name, kInvalid,
                       says("OnBehalf", {"associatorNames", name, "associatorNames", "ORXC_CEC_CS",
                                         id, missing, access})});
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
    const struct {
        const char* accepted;
        const char* locale;
        const char* words;
    } rows[] = {
        {"", "", "English"},
        {"root", "", "English"},
        {"en", "en_US.UTF-8", "English"},
        {"zh", "en_US.UTF-8", "English"},
        {"de", "de_DE.UTF-8", "German"},
        {"de-AT", "de_AT.UTF-8", "German"},
        {"fr-ca", "fr_CA.UTF-8", "French"},
        {"fr;q=0", "", "English"},
        {"fr;q=0.5,de", "de_DE.UTF-8", "German"},
        {"fr;q=0.5,de;q=0.5", "fr_FR.UTF-8", "French"},
        {"pt-br;q=0.7,de;q=0.5", "pt_BR.UTF-8", "German"},
    };
    for (const auto& [accepted, locale, words] : rows) {
        const std::string told = std::string("WRTL0001 ") + locale;
        const Texts text =
            says("OnBehalf", {"enumInstanceNames", "ORXC_CEC_CS", "callGenericCommand",
                              "zemCommandCaller", "WRTL0001", told, call});
        expectFailure(
            "--messages '" + messages.string() + "' --language '" + accepted + "' ein ORXC_CEC_CS",
            kFailed,
            !full() || words == std::string("English") ? text.english
            : words == std::string("German")           ? text.german
                                             : "enumInstanceNames : " + call + " : " + told);
    }
    expectFailure("--language de di " + kDisk, kNotSupported,
                  says("MethodNotSupported", {"deleteInstance", "Test_Disk"}).english);
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

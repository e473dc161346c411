// What a client reads when something is wrong, byte for byte: from the command line through each
// broker and the frame to a provider and back, with and without a bundle of translated texts.
#include <map>
#include <regex>
#include <set>

#include "../cimom/BothBrokers.h"
#include "Json.h"
#include "TestAppliance.h"

namespace {

namespace fs = std::filesystem;
using testing_support::contents;
using testing_support::DemoAppliance;
using testing_support::lines;
using testing_support::Outcome;
using testing_support::ScopedEnvironment;

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

/// A request and its answer; where a lean broker leaves more to the provider, both answers.
struct Row {
    std::string arguments;
    Status status;
    Texts text;
    Status leanStatus = {0, ""};
    Texts leanText = "";
};

const std::string kDisk = R"('Test_Disk.Name="sda",Slot=1')";
const std::string kHost =
    R"('ORXC_CEC_CS.CreationClassName="ORXC_CEC_CS",Name="1111-AAA*0000001"')";
const std::string kNoHost =
    R"(ORXC_CEC_CS.CreationClassName="ORXC_CEC_CS",Name="9999-ZZZ*0000000")";
const std::string kNoHostInstance =
    R"('Host=instance of ORXC_CEC_CS { CreationClassName = "ORXC_CEC_CS"; )"
    R"(Name = "9999-ZZZ*0000000"; }')";

std::string disk(const std::string& keys) { return "'Test_Disk." + keys + "'"; }

/// A sentence of the library, with numbers in braces where the inserts stand; the bundle has its
/// German form, with the same numbers, under its name.
struct Sentence {
    const char* name;  ///< with which the failing provider is told to use it
    Status status;
    const char* inserts;  ///< of the failing provider, a line each
    std::string english;
    bool untranslated = false;  ///< stays English, whatever the bundle has
};

constexpr char kOfAClass[] = "PropertiesAccessException1";
constexpr char kOnBehalf[] = "PropertiesAccessException2";
const std::string kConflict =
    "Conflicted property value 18446744073709551615 of \"{0}\" and property value 1 of \"{1}\" "
    "were specified for class Test_Disk for partition lp1 on managed system host. {2} memory "
    "should be {3} memory.";
const std::string kThrown =
    "An exception occurred during executing method {0} on provider {1}. The exception was thrown "
    "from method {2} on class {3} with an exception id of {4} and an exception string of \"{5}\".";
// clang-format off
const Sentence kSentences[] = {
    {"MethodNotSupported", kNotSupported, "getInstance\nTest_DiskProvider\nTest_Disk", "Method {0} on provider {1} is not supported for class {2}."},
    {"MethodNotFound", kNoMethod, "getInstance\nTest_DiskProvider\nTest_Disk", "CIM_ERR_METHOD_NOT_FOUND (The invoked method  {0} is not supported for class {2})"},
    {"UserAccessDenied", kDenied, "kim\ngetInstance\nTest_Disk\nTest_DiskProvider", "User {0} is not authorized to utilize {1} operation of class {2} on provider {3}."},
    {"KeyNotFound", kInvalid, "k\nTest_Disk\ngetInstance\nTest_DiskProvider", "Key {0} for class {1} is not provided to method {2} on provider {3}."},
    {"InvalidKey", kInvalid, "k\nTest_Disk\ngetInstance\nTest_DiskProvider", "Invalid key name {0} for class {1} is provided to method {2} on provider {3}."},
    {"DuplicateKey", kInvalid, "k\nTest_Disk\ngetInstance\nTest_DiskProvider", "Duplicate key {0} for class {1} is provided to method {2} on provider {3}."},
    {"KeyValueDoesntMatch", kInvalid, "Test_Disk\ngetInstance\nTest_DiskProvider\n1\nk\n2",
     "A key provided for class {0} to method {1} on provider {2} had an unexpected value. A value "
     "of {3} was provided for key {4} instead of the expected value of {5}."},
    {"PropertyNotFound", kInvalid, "p\nTest_Disk", "Property {0} is not found on instance provided for class {1}."},
    {"DuplicateProperty", kInvalid, "p\nTest_Disk\ngetInstance\nTest_DiskProvider", "Duplicate property name {0} for class {1} is provided to method {2} on provider {3}."},
    {"InvalidProperty", kInvalid, "p\nTest_Disk\ngetInstance\nTest_DiskProvider", "Invalid property name {0} for class {1} is provided to method {2} on provider {3}."},
    {"ObjectNotFound", kNotFound, "o\nTest_Disk\ngetInstance\nTest_DiskProvider", "The requested object {0} of class {1} can not be found. The exception was thrown from method {2} on provider {3}."},
    {"WrongMethodArg", kInvalid, "a\nm\nTest_DiskProvider", "Wrong method argument {0} when invoking method {1} on provider {2}."},
    {"DuplicateMethodArg", kInvalid, "a\nm\nTest_DiskProvider", "Duplicate method argument {0} when invoking method {1} on provider {2}."},
    {"InvalidMethodArgValue", kInvalid, "a\nv\nm\nTest_DiskProvider", "Invalid value of {1} is provided for parameter {0} to method {2} on provider {3}.", true},
    {"ParameterNotFound", kInvalid, "a", "Parameter {0} is not found in provided parameters."},
    {"PropertyValueDoesntMatch", kInvalid, "Test_Disk\n1\np\n2",
     "A property provided for class {0} had an unexpected value. An invalid value of {1} was "
     "specifieded for property \"{2}\" instead of the expected value of {3}"},
    {kOfAClass, kDenied, "getInstance\nTest_DiskProvider\nrun\nTool\nCIM_ERROR\nit \"broke\"", kThrown},
    {kOnBehalf, kFailed, "getInstance\nTest_DiskProvider\nrun\nTool\nE7\nbroke\nreadDisks", kThrown + " The exception was thrown on behalf of access method {6}."},
    {"MultiResource", kInvalid, "", "Multiple memory instances were specified for partition lp1 on managed system host. Only one instance should be specified for such resource."},
    {"DuplicateResource", kInvalid, "", "Duplicate slot resources \"v\" were specified for partition lp1 on managed system host"},
    {"ResourceHasExisted", kInvalid, "", "The specified slot \"v\" has been existing on partition lp1 current profile on managed system host. "},
    {"ResourceNotExisting", kInvalid, "",
     "The specified slot \"v\" was not existing on partition lp1 current profile on managed "
     "system host. It maybe have never been added or have already been removed.Current "
     "existing such type resource are \"w,x\"."},
    {"MinGtDesiredValue", kInvalid, "Reservation\nVirtualQuantity\nDesired\ngreater than or equal to min", kConflict},
    {"MinGtMaxValue", kInvalid, "VirtualQuantity\nLimit\nMin\nless than or equal to max", kConflict},
    {"DesiredGtMaxValue", kInvalid, "Reservation\nLimit\nDesired\nless than or equal to max", kConflict},
    {"AlreadyExists", kExists, "", "there is one"},
    {"NoSuchProperty", kNoProperty, "", "there is none"},
    {"OtherKind", kFailed, "", "of no kind"},
    {"Status", kNotFound, "", "the binding's own", true},
};
// clang-format on

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

const cimom::MessageTexts& bundle() {
    static const auto texts = cimom::readTexts(ZEM_MESSAGES "/default_de.json").value();
    return texts;
}

/// The sentence of that name, with the failing provider's inserts where none are @p given.
Texts says(const std::string& name, const std::map<std::size_t, Texts>& given = {}) {
    const auto* const row = std::find_if(std::begin(kSentences), std::end(kSentences),
                                         [&](const Sentence& each) { return each.name == name; });
    if (row == std::end(kSentences)) {
        throw std::out_of_range(name);
    }
    std::vector<Texts> inserts;
    for (const std::string& word : lines(row->inserts)) {
        inserts.push_back(word);
    }
    for (const auto& [number, text] : given) {
        inserts.at(number) = text;
    }
    const std::string english = filled(row->english, inserts, false);
    if (row->untranslated) {
        return {english, english};
    }
    const auto german = bundle().find("Error." + name);
    return german == bundle().end() ? english
                                    : Texts(english, filled(german->second, inserts, true));
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

class FailureTest : public BothBrokers {
protected:
    Outcome cimom(const std::string& arguments) {
        return m_appliance.run(
            m_before + "cimom --broker " + brokerName({GetParam(), 0}) + " --registration '" +
            ZEM_REGISTRATION "' --registration '" ZEM_FAILING
                             ".json' --library-folder '" ZEM_FAILING_FOLDER "' " +
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

    /// With a bundle under the broker that reads one, without under the other. Where the two
    /// answer differently, without.
    void expectFailure(const Row& row) {
        const bool differ = row.leanStatus.code != 0;
        if (differ && lean()) {
            expectFailure(row.arguments, row.leanStatus, row.leanText.english);
        } else if (lean() || differ) {
            expectFailure(row.arguments, row.status, row.text.english);
        } else if (!row.text.german.empty()) {
            expectFailure("--messages '" ZEM_MESSAGES "' --language de " + row.arguments,
                          row.status, row.text.german);
        }
    }

    DemoAppliance m_appliance{ZEM_PROGRAMS};
    ScopedEnvironment m_schema{"CIMOM_SCHEMA", ZEM_FAILING ".mof"};
    ScopedEnvironment m_locale{"LC_ALL", ""};
    std::string m_before;  ///< environment of cimom alone
};

// -- the failures that providers throw by name ----------------------------------------------------

TEST_P(FailureTest, ProvidersThrowByName) {
    for (const Sentence& sentence : kSentences) {
        expectFailure({"gi " + disk("Name=\"" + std::string(sentence.name) + "\",Slot=1"),
                       sentence.status, says(sentence.name)});
    }
    expectFailure({"gp " + disk("Name=\"PropertiesAccessException2\",Slot=1") + " Size", kFailed,
                   says(kOnBehalf, {{0, "getProperty"}})});
    expectFailure({"gp " + disk("Name=\"Status\",Slot=1") + " Size", kNotFound, says("Status")});
}

// A method's failure has one status, and quotes the text, which gets no sentence around it; what
// the binding throws is answered as it stands.
TEST_P(FailureTest, MethodsThrowByName) {
    const std::string fail = "im Test_Disk Fail Failure=";
    for (const char* name :
         {"MethodNotSupported", "MethodNotFound", "UserAccessDenied", "ParameterNotFound",
          "ObjectNotFound", "AlreadyExists", "NoSuchProperty", "OtherKind"}) {
        expectFailure({fail + name, kFailed, general(says(name))});
    }
    expectFailure({fail + kOfAClass, kFailed, general("it \"broke\"")});
    expectFailure({fail + kOnBehalf, kFailed, general("broke")});
    expectFailure({fail + "Status", kNotFound, says("Status")});
}

// Some failures of an enumeration are the client's business, the others the log's. What was found
// before stays.
TEST_P(FailureTest, EnumerationsLogWhatTheyDoNotAnswer) {
    const std::string logged = "log 3 Test_DiskProvider: CIM_ERR_";
    const struct {
        const char* user;  ///< says how the provider fails
        int exit;
        std::string err;
        std::string log;
    } rows[] = {
        {"guest", 0, "",
         logged + "ACCESS_DENIED: " +
             says("UserAccessDenied", {{0, "guest"}, {1, "enumerateInstances"}}).english + '\n'},
        {"Status", 0, "", logged + "NOT_FOUND: the binding's own\n"},
        {"OtherKind", 1, "CIM_ERR_FAILED (1): of no kind\n", ""},
    };
    for (const auto& row : rows) {
        const Outcome got = cimom(std::string("--trace 0 --user ") + row.user + " ei Test_Disk");
        EXPECT_EQ(got.exit, row.exit) << row.user;
        EXPECT_EQ(got.err, (lean() ? "" : row.log) + row.err) << row.user;
        EXPECT_NE(got.out.find("Test_Disk.Name=\"sda\",Slot=1\n"), std::string::npos) << row.user;
    }
    expectFailure({"ein Test_Disk", kNotSupported,
                   says("MethodNotSupported", {{0, "enumerateInstanceNames"}})});
}

// -- wrong requests -------------------------------------------------------------------------------

const std::vector<Row> kWrongKeys = {
    {"gi " + disk("Name=\"sda\",Slot=1,Third=\"x\""), kInvalid, says("InvalidKey", {{0, "Third"}})},
    {"gi " + disk("Name=\"moved\",Slot=1"), kInvalid,
     says("KeyValueDoesntMatch", {{3, "moved"}, {4, "Name"}, {5, "sda"}})},
    {"gp " + disk("Name=\"sda\",Slot=2") + " Size", kInvalid,
     says("KeyValueDoesntMatch", {{1, "getProperty"}, {3, ""}, {4, "Slot"}, {5, ""}})},
    {"gi " + disk("Name=\"sda\",Slot=1,name=\"sda\""), kInvalid,
     "at character 34 of 'Test_Disk.Name=\"sda\",Slot=1,name=\"sda\"': key name stands twice",
     kInvalid, says("DuplicateKey", {{0, "Name"}})},
    {"gi " + disk("Name=\"sda\",Slot=\"one\""), kMismatch, "'one' is no uint32", kInvalid,
     says("KeyValueDoesntMatch", {{3, "one"}, {4, "Slot"}, {5, ""}})},
    {"gi " + disk("Name=5,Slot=1"), kInvalid, "key Name of Test_Disk is of type string", kMismatch,
     ""},
};

TEST_P(FailureTest, KeysMustBeThoseOfTheObject) {
    const std::string half = disk("Name=\"sda\"");
    const std::pair<const char*, std::string> incomplete[] = {
        {"getInstance", "gi " + half},
        {"deleteInstance", "di " + half},
        {"modifyInstance", "mi " + half + " Size=5"},
        {"createInstance", "ci Test_Disk Name=sda"},
        {"getProperty", "gp " + half + " Size"},
        {"setProperty", "sp " + half + " Size 5"},
    };
    for (const auto& [method, arguments] : incomplete) {
        expectFailure({arguments, kInvalid, says("KeyNotFound", {{0, "Slot"}, {2, method}})});
    }
    for (const Row& row : kWrongKeys) {
        expectFailure(row);
    }
    expectFailure("gi ORXC_Unknown.Name=1", {5, "CIM_ERR_INVALID_CLASS"}, "no class ORXC_Unknown");

    ScopedEnvironment none("CIMOM_SCHEMA", "");
    const Row untyped[] = {
        {"gi " + disk("Name=\"sda\",Slot=\"one\""), kInvalid,
         says("KeyValueDoesntMatch", {{3, "one"}, {4, "Slot"}, {5, ""}})},
        {"gi " + disk("Name=5,Slot=1"), kMismatch, ""},
        {"gi ORXC_Unknown.Name=1", kNotSupported,
         "no provider serves class ORXC_Unknown in root/cimv2: no registration lists it, or a "
         "class "
         "above it, with the interface instance"},
    };
    for (const Row& row : untyped) {
        expectFailure(row);
    }
}

const std::string kCreate = "ci Test_Disk Name=sdb Slot=1 ";
const std::string kWrongType =
    " of property \"Size\" is invalid in instance root/cimv2:Test_Disk."
    "Name=\"sdb\",Slot=1, the expected data type is \"uint64\"";
const std::string kNoObject =
    "refers to an invalid object:root/cimv2:Test_Disk to inovke method Attach";
const std::string kUnserved =
    "no provider serves class CIM_ComputerSystem in root/cimv2: no registration lists it, or a "
    "class "
    "above it, with the interface instance";
const std::string kUnservedHost =
    "An error ocurred, when validate value CIM_ComputerSystem.Name=\"x\" "
    "of parameter \"Host\". And the error string was \"" +
    kUnserved + "\"";
const std::string kReplace = "im " + kDisk + " Replace 'Disk=instance of Test_Disk { ";
// clang-format off
const std::vector<Row> kWrongRequests = {
    // properties must be those of the class
    {"gi " + kDisk + " --properties Size,Colour", kInvalid, says("InvalidProperty", {{0, "Colour"}})},
    {"ei Test_Disk --properties Size,size", kInvalid, says("DuplicateProperty", {{0, "Size"}, {2, "enumerateInstances"}})},
    {kCreate + "Caption=x caption=y", kInvalid, "'caption' is given twice", kInvalid, says("DuplicateProperty", {{0, "Caption"}, {2, "createInstance"}})},
    {kCreate + "Colour=red", kNoProperty, "there is no 'Colour' to set", kInvalid, says("InvalidProperty", {{0, "Colour"}, {2, "createInstance"}})},
    {"mi " + kDisk + " Colour=red", kNoProperty, "there is no 'Colour' to set", kInvalid, says("InvalidProperty", {{0, "Colour"}})},
    {"sp " + kHost + " Colour red", kNoProperty, "class ORXC_CEC_CS has no property Colour", kInvalid, "Attempt to change unmodifiable property \"Colour\" of class ORXC_CEC_CS from  to \"red\"."},
    {"gp " + kDisk + " Colour", kNoProperty, "Colour"},
    {kCreate + "Size=big", kMismatch, "'big' is no uint64", kInvalid, "The data type(\"string\")" + kWrongType},
    {kCreate + "Size=-1", kMismatch, "'-1' is no uint64", kInvalid, "The data type(\"sint64\")" + kWrongType},
    {kCreate + "Size=1", kInvalid, "The requested property  \"Caption\" for class Test_Disk was not provided."},
    {kCreate + "Caption=x Firmware=1", kInvalid, "Attempt to create or modify unsupported property \"Firmware\" of class Test_Disk."},
    {kCreate + "Caption=x Vendor=1", kInvalid, "Attempt to create or modify unimplemented property \"Vendor\" of class Test_Disk to \"1\"."},
    {kCreate + "Caption=x State=1", kInvalid, "Attempt to set property \"State\" of class Test_Disk to \"1\". Can not specify this property \"State\", when execute this operation."},
    {kCreate + "Caption=x Kind=tape", kInvalid, says("PropertyValueDoesntMatch", {{1, "tape"}, {2, "Kind"}, {3, "disk"}})},
    // arguments must be those of the method
    {"im Test_Disk Fail", kFailed, general(says("ParameterNotFound", {{0, "Failure"}}))},
    {"im Test_Disk Fail Wrong=1", kInvalid, "there is no 'Wrong' to set", kFailed, general(says("WrongMethodArg", {{0, "Wrong"}, {1, "Fail"}}))},
    {"im Test_Disk Fail Failure=x failure=y", kInvalid, "'failure' is given twice", kFailed, general(says("DuplicateMethodArg", {{0, "Failure"}, {1, "Fail"}}))},
    {"im " + kHost + " RequestStateChange RequestedState=on", kMismatch, "'on' is no uint16", kMismatch, ""},
    {"im " + kDisk + " Nonsense", kNoMethod, "class Test_Disk has no method Nonsense", kFailed, general(says("MethodNotFound", {{0, "Nonsense"}}))},
    {"im Test_Disk Attach Host=" + kHost, kFailed, general({kNoObject, kNoObject})},
    // what an argument or a property refers to must exist; the server is asked for it
    {"im " + kDisk + " Attach 'Host=" + kNoHost + "'", kFailed, general(says("InvalidMethodArgValue", {{0, "Host"}, {1, kNoHost}, {2, "Attach"}}))},
    {"im " + kDisk + " Attach Host=ORXC_CEC_CS", kFailed, general(says("InvalidMethodArgValue", {{0, "Host"}, {1, "ORXC_CEC_CS"}, {2, "Attach"}}))},
    {"im " + kDisk + " Attach 'Host=CIM_ComputerSystem.Name=\"x\"'", kFailed, general(kUnservedHost)},
    {"im " + disk("Name=\"sdb\",Slot=1") + " Attach Host=" + kHost, kFailed, general("refers to an invalid object:root/cimv2:Test_Disk.Name=\"sdb\",Slot=1 to inovke method Attach")},
    {"mi " + kDisk + " " + kNoHostInstance, kInvalid, says("InvalidMethodArgValue", {{0, "Host"}, {1, kNoHost}, {2, "modifyInstance"}})},
    {"mi " + kDisk + " 'Host=instance of CIM_ComputerSystem { Name = \"x\"; }'", kFailed,
     says(kOnBehalf, {{0, "modifyInstance"},
                      {2, "validateEmbeddedObject"},
                      {3, "zemVirtualSystemManagementServiceProvider"},
                      {4, "CIM_ERR_NOT_SUPPORTED"},
                      {5, kUnservedHost},
                      {6, "getInstance"}})},
    {kReplace + "Name = \"sdb\"; Slot = 1; }'", kFailed, general(says("InvalidMethodArgValue", {{0, "Disk"}, {1, "Test_Disk.Name=\"sdb\",Slot=1"}, {2, "Replace"}}))},
    {kReplace + "Size = 5; }'", kFailed, general(says("InvalidMethodArgValue", {{0, "Disk"}, {1, "Test_Disk"}, {2, "Replace"}}))},
    {kReplace + "Colour = \"red\"; }'", kNoProperty, "class Test_Disk has no property Colour", kFailed, general(says("InvalidProperty", {{0, "Colour"}, {2, "Replace"}}))},
    {kReplace + "Size = \"big\"; }'", kMismatch, "'big' is no uint64", kFailed,
     general("The data type(\"string\") of property \"Size\" is invalid in instance Test_Disk, "
             "the expected data type is \"uint64\"")},
    {"im " + kDisk + " Replace Disk=red", kInvalid, "at character 4 of 'red': Class { is missing", kMismatch, ""},
};
// clang-format on

TEST_P(FailureTest, PropertiesArgumentsAndReferencesMustBeRight) {
    for (const Row& row : kWrongRequests) {
        expectFailure(row);
    }
}

TEST_P(FailureTest, DisabledProvidersFindNothing) {
    m_before = "ASAN_OPTIONS=verify_asan_link_order=0:detect_leaks=0 LD_PRELOAD=" ZEM_DISABLED " ";
    for (const std::string& arguments : std::vector<std::string>{
             "ei Test_Disk", "ein Test_Disk", "ei ORXC_CEC_CS", "ein ORXC_HostedPartition",
             "ai " + kHost + " --assoc-class ORXC_HostedPartition",
             "rin " + kHost + " --result-class ORXC_HostedPartition"}) {
        const Outcome got = cimom(arguments);
        EXPECT_EQ(got.exit, 0) << arguments << got.err;
        EXPECT_EQ(got.out, "") << arguments;
    }
    const Texts absent =
        says("ObjectNotFound",
             {{0, "The XBRG is managed by DNX, this provider on the XGRB in dissabled."},
              {1, "zemBaseProvider"}});
    const Row rows[] = {
        {"gi " + kDisk, kNotFound, absent},
        {"mi " + kDisk + " Size=5", kNotFound, absent},  // its existence test finds none
        {"di " + kDisk, kNotSupported, says("MethodNotSupported", {{0, "deleteInstance"}})},
        {"im Test_Disk Fail Failure=OtherKind", kFailed, general("of no kind")},
    };
    for (const Row& row : rows) {
        expectFailure(row);
    }
}

ON_BOTH_BROKERS(FailureTest);

// The bundle has a text for every key that the library can look up, and for nothing else.
TEST(FailureBundle, HasEveryKeyOfTheLibrary) {
    std::set<std::string> used, translated;
    const std::regex key(R"re("(Error\.\w+)")re");
    for (const fs::directory_entry& file : fs::directory_iterator(ZEM_UTILITIES)) {
        const std::string source = contents(file.path());
        for (std::sregex_iterator at(source.begin(), source.end(), key), end; at != end; ++at) {
            used.insert((*at)[1]);
        }
    }
    for (const auto& [name, text] : bundle()) {
        translated.insert(name);
    }
    EXPECT_GE(used.size(), 15U);
    EXPECT_EQ(translated, used);
}

}  // namespace

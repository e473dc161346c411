// What providers have of their base: failures, logs, texts, and values.
#include <limits>
#include <tuple>

#include "../cimom/Folder.h"
#include "BaseProviderText.h"
#include "ProviderHarness.h"

namespace {

using cimom::Character;
using cimom::Value;
using Z = zemBaseProvider;

class BaseProviderServices : public BothBrokers {
protected:
    BaseProviderServices() : h(GetParam()), p(h.provider()) {}

    Answer handled(const zemException& e) {
        return h.answer([&](CMPIResult*) {
            const CmpiStatus status = p.handleException("enumInstances", e);
            const CMPIBroker* mb = h.server.broker();
            return CMPIStatus{status.rc(), mb->eft->newString(mb, status.msg(), nullptr)};
        });
    }

    using Args = FromServer<CmpiArgs>;
    using Disk = FromServer<CmpiInstance>;

    /// A value as a provider gets it from the server.
    CmpiData data(const Value& value) { return Args(h.args({{"v", value}})).getArg("v"); }

    /// What a call refuses, or "".
    static std::string refused(const std::function<void()>& call) { return failureText(call, "t"); }

    Harness h;
    zemBaseProvider& p;
};

TEST_P(BaseProviderServices, ThrowsTheFamily) {
    const std::pair<std::function<void()>, std::string> rows[] = {
        {[&] { p.throwMethodNotSupportedExc("M", "K"); },
         "4/Method M on provider TestProvider is not supported for class K."},
        {[&] { p.throwMethodNotFoundExc("M", "K"); },
         "8/CIM_ERR_METHOD_NOT_FOUND (The invoked method  M is not supported for class K)"},
        {[&] { p.throwUserAccessDeniedExc("M", "K", nullptr); },
         "1/User  is not authorized to utilize M operation of class K on provider TestProvider."},
        {[&] { p.throwInvalidPropertyExc("M", "K", "100%s$M"); },
         "3/Invalid property name 100%s$M for class K is provided to method M on provider "
         "TestProvider."},
    };
    for (const auto& [call, text] : rows) {
        testing::internal::CaptureStdout();
        EXPECT_EQ(text, failureText(call, "kt"));
        const std::string output = testing::internal::GetCapturedStdout();
        const std::string words = text.substr(2), told = "errMessage:" + words;
        const auto says = [&](const std::string& line) { return output.find(line) != line.npos; };
        EXPECT_TRUE(says("> Exception: " + words + "\n"));
        EXPECT_EQ(text[0] == '4' || text[0] == '8', says("Exc <-\n"));  // the console is told, too
        EXPECT_EQ(text[0] == '4', says("\nzemMethodNotFoundException:" + told));
        EXPECT_EQ(text[0] == '8', says("\nthrowMethodNotFoundExc:" + told));
    }
}

TEST_P(BaseProviderServices, TurnsExceptionsIntoStatus) {
    const int codes[] = {1, 2, 11, 4, 7, 6, 1, 12, 17, 1};  // by kind
    for (int kind = 0; kind < 10; ++kind) {
        const Answer answer = handled(zemException(kind, "x"));
        EXPECT_EQ(codes[kind], answer.rc);
        EXPECT_EQ("x", answer.text);
        EXPECT_EQ(1, answer.traced("CMPI_RC_ERR_[A-Z_]+: x"));
    }
    const std::string start =
        "An exception occurred during executing method enumInstances on provider TestProvider. The "
        "exception was thrown from method ";
    EXPECT_EQ(start +
                  " on class Tool with an exception id of CIM_ERROR and an exception string of "
                  "\"it broke\".",
              handled(zemOperationFailedException("Tool", "", "it broke")).text);
    EXPECT_EQ(start +
                  "run on class Tool with an exception id of E7 and an exception string of "
                  "\"\". The exception was thrown on behalf of access method getLPAR.",
              handled(zemOperationFailedException("Tool", "run", "getLPAR", "E7", "")).text);
    // Texts from outside may be of any length; what is told ends between two characters.
    std::string text = "x";
    for (int i = 0; i < 10000; ++i) {
        text += "\xC3\xA4";
    }
    EXPECT_EQ(text.substr(0, 16383) + "...",
              handled(zemOperationFailedException(text.c_str())).text);
}

// A server need not have all functions: none of them is called where it is missing.
TEST_P(BaseProviderServices, TakesServersThatLackFunctions) {
    static CMPIBrokerEncFT table;
    table = *h.server.broker()->eft;
    table.newString = nullptr;
    table.trace = nullptr;
    table.logMessage = nullptr;
    table.openMessageFile = nullptr;
    table.newInstance = nullptr;
    h.server.broker()->eft = &table;
    EXPECT_STREQ("as is", p.retrieveLocalizedString("none", "E.X", "as is", 0));
    EXPECT_EQ(CMPI_RC_ERR_NOT_FOUND, p.handleException("M", zemObjectNotFoundException("x")).rc());
    p.trace("x");
    static CMPIContextFT contextTable;
    contextTable = *h.ctx()->ft;
    contextTable.addEntry = nullptr;
    h.ctx()->ft = &contextTable;
    p.logICUMessage(CmpiContext(h.ctx()), 1, "Id", "none", "E.X", "x");
    const char* names[] = {"Colour",
                           nullptr};  // of which a server without new instances says nothing
    p.validateProerties(CmpiObjectPath(h.path()), names, "M");
    CMPIObjectPath* const found = h.path();
    static CMPIObjectPathFT pathTable;
    pathTable = *found->ft;
    pathTable.getKey = nullptr;
    found->ft = &pathTable;
    p.validateKeys(CmpiObjectPath(h.path()), CmpiObjectPath(found), "M", true);
}

CMPIString* readMessage(const CMPIBroker*, const char* key, const CMPIMsgFileHandle, const char*,
                        CMPIStatus*, CMPICount, ...) {
    if (*key == 'T') {
        throw std::bad_alloc();
    }
    return nullptr;
}

// However the reading of a message ends, what was opened for it is closed.
TEST_P(BaseProviderServices, ClosesWhatItOpens) {
    static int opened, closed;
    opened = closed = 0;
    static CMPIBrokerEncFT table;
    table = *h.server.broker()->eft;
    table.openMessageFile = [](auto, auto, CMPIMsgFileHandle* handle) {
        *handle = &opened;
        return CMPIStatus{++opened % 2 == 0 ? CMPI_RC_ERR_FAILED : CMPI_RC_OK, nullptr};
    };
    table.closeMessageFile = [](auto, const CMPIMsgFileHandle handle) {
        closed += handle == &opened ? 1 : 0;
        return CMPIStatus{CMPI_RC_OK, nullptr};
    };
    h.server.broker()->eft = &table;
    for (const auto message : {readMessage, decltype(&readMessage){nullptr}}) {
        for (const char* key : {"Throws", "Unopened", "None", "Unopened"}) {
            table.getMessage2 = message;
            EXPECT_STREQ("as is", p.retrieveLocalizedString("b", key, "as is", 0));
        }
    }
    EXPECT_EQ(8, opened);
    EXPECT_EQ(4, closed);
}

TEST_P(BaseProviderServices, FallsBackToTheDefaultText) {
    CMPIBroker bare = *h.server.broker();
    bare.eft = nullptr;
    EXPECT_STREQ("as is", p.retrieveLocalizedString("none", "E.X", "as is", 0));
    EXPECT_STREQ("", Z::retrieveLocalizedString(nullptr, "P", "none", "E.X", nullptr, 0));
    EXPECT_STREQ("as is", Z::retrieveLocalizedString(&bare, "P", "none", "E.X", "as is", 0));
}

TEST_P(BaseProviderServices, LogsThroughTheServer) {
    cimom::LogCollector log(h.server);
    const Answer answer = h.answer([&](CMPIResult*) {
        p.logMessage(3, "Id", "text");
        p.logMessage(2, "", "text alone");
        p.logMessage(1, nullptr, nullptr);
        Z::logMessage(nullptr, "P", 3, "Id", "text");
        p.logICUMessage(CmpiContext(h.ctx()), 4, "Id", "none", "E.X", "default");
        p.trace("as it comes");
        CMPIStatus status = {CMPI_RC_OK, nullptr};
        // The lean server's contexts take no entries.
        EXPECT_EQ(GetParam() == Character::Full,
                  h.ctx()->ft->getEntry(h.ctx(), "UseProcessLocale", &status).value.boolean != 0);
        return CMPIStatus{CMPI_RC_OK, nullptr};
    });
    EXPECT_EQ(1, answer.traced("LOG MESSAGE: Id: text"));
    EXPECT_EQ(3, answer.traced("LOG MESSAGE: .*"));
    EXPECT_EQ(1, answer.traced("LOG ICU MESSAGE E.X: default"));
    if (GetParam() == Character::Lean) {
        return;  // it logs nothing
    }
    using Kind = cimom::LogLine::Kind;
    EXPECT_TRUE(log.contains(Kind::Message, 2, "TestProvider", "text alone"));
    EXPECT_TRUE(log.contains(Kind::Message, 4, "TestProvider", "Id: default"));
    EXPECT_TRUE(log.contains(Kind::Trace, 0, "ProviderAgent", "as it comes"));
}

TEST_P(BaseProviderServices, ReadsUserAndLanguageOfTheRequest) {
    EXPECT_STREQ("", Z::getUserContext(CmpiContext(h.ctx())));
    EXPECT_STREQ("", Z::getUserContext(CmpiContext(nullptr)));
    const std::pair<const char*, const char*> rows[] = {
        {"", ""},
        {"ROOT", ""},
        {"pt", "pt_BR.UTF-8"},
        {"fr-ca", "fr_CA.UTF-8"},
        {"zh-hant-tw", "zh_HANT_TW.UTF-8"},
        {"pt-br;q=0.7,de;q=0.5", "pt_BR.UTF-8"},
        {"fr;q=0.5,de", "de_DE.UTF-8"},
        {"fr;q=0.5,de;q=0.5", "fr_FR.UTF-8"},
        {"fr;q=0.5,de;level=1", "fr_FR.UTF-8"},  // the weight stays that of the range before
        {"fr;q=nan,de;q=-1", ""},
        {"fr;q=0.5,", ""},
    };
    for (const auto& [accepted, locale] : rows) {
        cimom::Request request;
        request.user = "kim";
        request.language = accepted;
        cimom::RequestScope scope(h.server, request);
        const CmpiContext ctx(scope.context());
        EXPECT_STREQ(locale, Z::getExternalLanguageName(ctx)) << accepted;
        EXPECT_STREQ("kim", Z::getUserContext(ctx));
    }
}

TEST_P(BaseProviderServices, PrintsValues) {
    const cimom::ObjectPath path("root/cimv2", "Test_Disk", {{"Name", "d1"}});
    const std::pair<Value, const char*> rows[] = {
        {Value(std::int8_t{-8}), "-8"},
        {Value(std::numeric_limits<std::uint32_t>::max()), "4294967295"},
        {Value(std::numeric_limits<std::uint64_t>::max()), "18446744073709551615"},
        {Value(16777217.0), "16777216.000000"},  // a real64 has the precision of a real32
        {Value(-1e300), "-inf"},
        {Value("50%d"), "\"50%d\""},
        {Value(path), "root/cimv2:Test_Disk.Name=\"d1\""},
        {Value(cimom::DateTime::fromBinary(1500000, true)), "00000000000001.500000:000"},
        {Value::array(CMPI_string, {Value("a"), Value::null(CMPI_string)}), "{\"a\",}"},
        {Value::char16(65), ""},
    };
    for (const auto& [value, expected] : rows) {
        EXPECT_STREQ(expected, Z::cmpidata2String(data(value)));
    }
    // Further properties depend on the server.
    CmpiInstance disk = Disk(h.disk());
    const std::string mof(Z::instanceToString(disk));
    EXPECT_EQ(0U, mof.find("instance of Test_Disk {\n    string Name = \"d1\""));
}

TEST_P(BaseProviderServices, ParsesObjectPaths) {
    const std::pair<const char*, const char*> rows[] = {
        {"Foo", "root/cimv2:Foo"},
        {"root/x:Foo.a=\"1\",b=2", "root/x:Foo.a=\"1\",b=\"2\""},
        {"//h/test/x:Foo.k=\"\"v\"\"", "//h/test/x:Foo.k=\"v\""},
        {"Foo.a=x=y", "root/cimv2:Foo.a=\"x=y\""},
        {"//h/Foo", "refused"},
        {"//h", "refused"},
        {"Foo.", "refused"},
        {"Foo.a=\"1,2\"", "refused"},
    };
    for (const auto& [source, expected] : rows) {
        zemString made = "refused";
        const std::string refusal = refused(
            [&, s = source] { made = Z::objectPathToString(Z::createObjectPath(zemString(s))); });
        EXPECT_STREQ(expected, made);
        EXPECT_EQ(made == "refused" ? source : "", refusal);
    }
    const CmpiObjectPath from = Z::createObjectPath(zemString("//box/test/a:Test_Disk.Name=1"));
    EXPECT_STREQ("//box/test/a:Test_Disk", Z::objectPathToString(Z::createObjectPath(from)));
    EXPECT_STREQ("//box/test/b:Other",
                 Z::objectPathToString(Z::createObjectPath(from, "test/b", "Other")));
}

TEST_P(BaseProviderServices, ConvertsDateTimes) {
    const std::pair<CmpiDateTime, const char*> rows[] = {
        {Z::convertDateTime(0L), "00000000000000.000000:000"},
        {Z::convertDateTime(1000000000L), "20010909014640.000000+000"},
        {Z::convertDateTime(timeval{1000000000, 7}), "20010909014640.000007+000"},
        {Z::convertDateTime(std::numeric_limits<long>::max()), "00000000000000.000000:000"},
    };
    for (const auto& [time, text] : rows) {
        EXPECT_STREQ(text, Z::cmpidata2String(CmpiData(time)));
    }
    EXPECT_EQ(1000000000L, Z::convertDateTime(Z::convertDateTime(1000000000L)));
    // before and after a change to and from summer time, wherever the process thinks it is
    for (const char* zone : {"UTC", "Europe/Berlin", "America/St_Johns", "Asia/Kolkata"}) {
        setenv("TZ", zone, 1);
        tzset();
        for (const long when :
             {1L, 1364691599L, 1364691600L, 1382835599L, 1382835600L, 4102444800L}) {
            EXPECT_EQ(when, Z::convertDateTime(Z::convertDateTime(when))) << zone;
        }
        EXPECT_LE(std::abs(Z::convertDateTime(Z::getCurrentDateTime()) - time(nullptr)), 5) << zone;
    }
    unsetenv("TZ");
    tzset();
}

TEST_P(BaseProviderServices, ReadsWhatMustBeThere) {
    const cimom::NamedValues values{{"Name", "d1"}, {"Caption", Value::null(CMPI_string)}};
    const Args args(h.args(values));
    const Disk disk(h.disk(values));
    EXPECT_STREQ("\"d1\"", Z::cmpidata2String(p.getParmVal(args, "Name")));
    EXPECT_STREQ("\"d1\"", Z::cmpidata2String(p.getPropVal(disk, "Name")));
    for (const char* name : {"Caption", "None"}) {
        EXPECT_EQ("Parameter " + std::string(name) + " is not found in provided parameters.",
                  refused([&] { p.getParmVal(args, name); }));
        EXPECT_EQ("Property " + std::string(name) +
                      " is not found on instance provided for class Test_Disk.",
                  refused([&] { p.getPropVal(disk, name); }));
    }
    EXPECT_TRUE(Z::getKeyBinding(CmpiObjectPath(h.path()), "None").isNotFound());
}

TEST_P(BaseProviderServices, ComparesKeys) {
    const auto compare = [&](const cimom::NamedValues& given, bool namesOnly = false) {
        return refused([&] {
            const CmpiObjectPath path(h.scope.wrap(cimom::ObjectPath("", "Test_Disk", given)));
            p.validateKeys(path, CmpiObjectPath(h.path()), "M", namesOnly);
        });
    };
    EXPECT_EQ("", compare({{"name", "D1"}}));
    EXPECT_NE("", compare({{"Name", "d2"}}));
    EXPECT_EQ("", compare({{"Name", "d2"}}, true));
}

TEST_P(BaseProviderServices, ComparesKeyValues) {
    const cimom::ObjectPath one("root/a", "K", {{"k", "x"}}), same("ROOT/A", "k", {{"K", "X"}}),
        other("root/a", "K", {{"k", "y"}});
    const std::tuple<Value, Value, bool> rows[] = {
        {Value("abc"), Value("ABC"), true},
        {Value(std::uint16_t{7}), Value(std::int64_t{7}), true},
        {Value(std::uint64_t{7}), Value(std::int8_t{-7}), false},
        {Value(std::int32_t{7}), Value(7.9), true},  // converted to the width of the first
        {Value(std::int32_t{7}), Value(1e30), false},
        {Value(true), Value(true), false},
        {Value(cimom::DateTime()), Value(cimom::DateTime()), true},
        {Value(one), Value(same), true},
        {Value(one), Value(other), false},
        {Value::null(CMPI_string), Value::null(CMPI_uint8), true},
        {Value::null(CMPI_string), Value(""), false},
    };
    CMPIBroker* const broker = h.server.broker();
    CMPIBrokerEncFT silent = *broker->eft;  // prints no paths
    silent.toString = nullptr;
    for (CMPIBrokerEncFT* table : {&silent, broker->eft}) {
        broker->eft = table;
        for (const auto& [a, b, equal] : rows) {
            zemString text1("old"), text2("old");
            EXPECT_EQ(equal, Z::compareKeyValues(data(a), data(b), text1, text2) != 0)
                << Z::cmpidata2String(data(a)) << " " << Z::cmpidata2String(data(b));
            EXPECT_TRUE(text1 != "old" && text2 != "old");
        }
    }
}

TEST_P(BaseProviderServices, ConvertsStringArrays) {
    zemDynamicArray<zemString> texts(25);
    texts.addElement(new zemString("a"));
    texts.addElement(nullptr);
    const zemDynamicArray<zemString> back = Z::convertStringArray(Z::convertStringArray(texts));
    ASSERT_EQ(2, back.size());
    EXPECT_STREQ("a", *back[0]);
    EXPECT_STREQ("", *back[1]);
}

TEST_P(BaseProviderServices, ComparesClassNames) {
    EXPECT_TRUE(Z::compareClassNames("ORX_Disk", "orx_disk"));
    EXPECT_TRUE(Z::compareClassNames("ORXDSG_Disk", "_disk"));
    EXPECT_FALSE(Z::compareClassNames("Disk", "_Disk"));
    EXPECT_FALSE(Z::compareClassNames("ORX_My_Disk", "_Disk"));
    EXPECT_STREQ("ORXDSG_OperatingSystem", Z::getOSClassName("orxdsg_X"));
}

ON_BOTH_BROKERS(BaseProviderServices);

TEST(BaseProviderBundle, GivesTheTranslatedText) {
    const fixture::Folder folder;
    folder.write("default_de.json", R"json({
        "Error.KeyNotFound": "Schluessel {0} fehlt ({1},{2},{3})",
        "Error.InvalidMethodArgValue": "nie gelesen"})json");
    folder.write("own.json", R"json({"Own.Text": "{0}{1}{2}"})json");
    cimom::Request request;
    request.language = "de";
    Harness h(Character::Full, FactoriesOf<ScriptedProvider>::create, request, folder / "");
    zemBaseProvider& p = h.provider();

    EXPECT_EQ("3/Schluessel k fehlt (K,M,TestProvider)",
              failureText([&] { p.throwKeyNotFoundExc("M", "K", "k"); }, "kt"));
    EXPECT_EQ(
        "3/Invalid value of v is provided for parameter a to method M on provider TestProvider.",
        failureText([&] { p.throwInvalidMethodArgValueExc("a", "v", "M"); }, "kt"));
    EXPECT_EQ("3/Duplicate key k for class K is provided to method M on provider TestProvider.",
              failureText([&] { p.throwDuplicateKeyExc("M", "K", "k"); }, "kt"));
    script.bundle = "own";  // the list of inserts ends at the first null
    EXPECT_STREQ("12{2}", p.retrieveLocalizedString("Own.Text", "?", "1", "2", nullptr, "4"));
}

TEST(BaseProviderValidation, FindsRepeatedNamesInLongLists) {
    Harness h(cimom::Character::Full);
    h.className = "Test_Unknown";  // of which the server cannot tell the properties
    std::vector<std::string> names;
    for (int i = 0; i < 20000; ++i) {
        names.push_back("Caption" + std::to_string(i));
    }
    names.insert(names.end(), {"CAPTION7", "caption3"});
    std::vector<const char*> list;
    for (const std::string& name : names) {
        list.push_back(name.c_str());
    }
    list.push_back(nullptr);
    EXPECT_EQ(
        "3/Duplicate property name Caption3 for class Test_Unknown is provided to "
        "method M on provider TestProvider.",
        failureText(
            [&] { h.provider().validateProerties(CmpiObjectPath(h.path()), list.data(), "M"); },
            "kt"));
    EXPECT_TRUE(Z::containsProperty(list.data(), "CAPTION3"));
    EXPECT_FALSE(Z::containsProperty(list.data(), "Name"));
    EXPECT_TRUE(Z::containsProperty(nullptr, "Name"));
}

}  // namespace

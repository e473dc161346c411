#include <cstdlib>
#include <filesystem>
#include <fstream>

#include "ProviderHarness.h"

namespace {

using cimom::Character;

class Folder {
public:
    Folder() {
        char name[] = "/tmp/zemmessagesXXXXXX";
        m_path = mkdtemp(name);
    }
    ~Folder() { std::filesystem::remove_all(m_path); }
    void write(const std::string& name, const std::string& text) const {
        std::ofstream(m_path + "/" + name) << text;
    }
    const std::string& path() const { return m_path; }

private:
    std::string m_path;
};

class BaseProviderStatus : public BothBrokers {
protected:
    BaseProviderStatus() : h(GetParam()), provider(h.provider()) {}

    // What a status says, and what was traced while it was made.
    Answer handled(const zemException& e) {
        return h.answer([&](CMPIResult*) {
            const CmpiStatus status = provider.handleException("enumInstances", e);
            const CMPIBroker* mb = h.server.broker();
            return CMPIStatus{status.rc(), mb->eft->newString(mb, status.msg(), nullptr)};
        });
    }

    Harness h;
    ScriptedProvider& provider;
};

struct Raised {
    int kind = 0;
    std::string text;
    std::string output;
};

Raised raised(const std::function<void()>& call) {
    Raised result;
    testing::internal::CaptureStdout();
    try {
        call();
    } catch (const zemException& e) {
        result.kind = e.getExceptionType();
        result.text = e.getExceptionString();
        EXPECT_STREQ("", e.getThrowingClass());
    }
    result.output = testing::internal::GetCapturedStdout();
    return result;
}

TEST_P(BaseProviderStatus, ThrowsTheFamily) {
    const ScriptedProvider& p = provider;
    const struct {
        std::function<void()> call;
        int kind;
        const char* text;
    } rows[] = {
        {[&] { p.throwMethodNotSupportedExc("M", "K"); }, 4,
         "Method M on provider TestProvider is not supported for class K."},
        {[&] { p.throwMethodNotFoundExc("M", "K"); }, 8,
         "CIM_ERR_METHOD_NOT_FOUND (The invoked method  M is not supported for class K)"},
        {[&] { p.throwUserAccessDeniedExc("M", "K", "u"); }, 1,
         "User u is not authorized to utilize M operation of class K on provider TestProvider."},
        {[&] { p.throwKeyNotFoundExc("M", "K", "k"); }, 3,
         "Key k for class K is not provided to method M on provider TestProvider."},
        {[&] { p.throwInvalidKeyExc("M", "K", "k"); }, 3,
         "Invalid key name k for class K is provided to method M on provider TestProvider."},
        {[&] { p.throwDuplicateKeyExc("M", "K", "k"); }, 3,
         "Duplicate key k for class K is provided to method M on provider TestProvider."},
        {[&] { p.throwKeyValueDoesntMatchExc("M", "K", "k", "1", "2"); }, 3,
         "A key provided for class K to method M on provider TestProvider had an unexpected value. "
         "A value of 1 was provided for key k instead of the expected value of 2."},
        {[&] { p.throwPropertyNotFoundExc("K", "p"); }, 3,
         "Property p is not found on instance provided for class K."},
        {[&] { p.throwDuplicatePropertyExc("M", "K", "p"); }, 3,
         "Duplicate property name p for class K is provided to method M on provider TestProvider."},
        {[&] { p.throwInvalidPropertyExc("M", "K", "100%s"); }, 3,
         "Invalid property name 100%s for class K is provided to method M on provider "
         "TestProvider."},
        {[&] { p.throwObjectNotFoundExc("M", "K", "o"); }, 5,
         "The requested object o of class K can not be found. The exception was thrown from method "
         "M on provider TestProvider."},
        {[&] { p.throwWrongMethodArgExc("a", "M"); }, 3,
         "Wrong method argument a when invoking method M on provider TestProvider."},
        {[&] { p.throwDuplicateMethodArgExc("a", "M"); }, 3,
         "Duplicate method argument a when invoking method M on provider TestProvider."},
        {[&] { p.throwInvalidMethodArgValueExc("a", "v", "M"); }, 3,
         "Invalid value of v is provided for parameter a to method M on provider TestProvider."},
        {[&] { p.throwParameterNotFoundExc("a"); }, 3,
         "Parameter a is not found in provided parameters."},
        {[&] { p.throwUserAccessDeniedExc("M", "K", nullptr); }, 1,
         "User  is not authorized to utilize M operation of class K on provider TestProvider."},
    };
    int row = 0;
    for (const auto& [call, kind, text] : rows) {
        const Raised result = raised(call);
        EXPECT_EQ(kind, result.kind);
        EXPECT_EQ(text, result.text);
        EXPECT_NE(std::string::npos, result.output.find("> Exception: " + result.text + "\n"));
        // Two of them tell the console as well, without the prefix of the trace.
        const char* printed[] = {"zemMethodNotFoundException", "throwMethodNotFoundExc"};
        const size_t line =
            row < 2 ? result.output.find("\n" + std::string(printed[row]) + ":errMessage:" + text)
                    : result.output.find("errMessage");
        EXPECT_EQ(row < 2, line != std::string::npos);
        EXPECT_EQ(row < 2, result.output.find("\nthrowMethodNot") != std::string::npos);
        ++row;
    }
}

TEST_P(BaseProviderStatus, TurnsExceptionsIntoStatus) {
    const struct {
        int kind;
        CMPIrc rc;
        const char* label;
    } kinds[] = {
        {1, CMPI_RC_ERR_ACCESS_DENIED, "CMPI_RC_ERR_ACCESS_DENIED: x"},
        {2, CMPI_RC_ERR_ALREADY_EXISTS, "CMPI_RC_ERR_ALREADY_EXISTS: x"},
        {3, CMPI_RC_ERR_INVALID_PARAMETER, "CMPI_RC_ERR_INVALID_PARAMETER: x"},
        {4, CMPI_RC_ERR_NOT_SUPPORTED, "CMPI_RC_ERR_NOT_SUPPORTED: x"},
        {5, CMPI_RC_ERR_NOT_FOUND, "CMPI_RC_ERR_NOT_FOUND: x"},
        {6, CMPI_RC_ERR_FAILED, "CMPI_RC_ERR_FAILED: x"},
        {7, CMPI_RC_ERR_NO_SUCH_PROPERTY, "CMPI_RC_ERR_NO_SUCH_PROPERTY: x"},
        {8, CMPI_RC_ERR_METHOD_NOT_FOUND, "CMPI_RC_ERR_METHOD_NOT_FOUND: x"},
        {0, CMPI_RC_ERR_FAILED, "CMPI_RC_ERR_FAILED: x"},
    };
    for (const auto& [kind, rc, label] : kinds) {
        const Answer answer = handled(zemException(kind, "x"));
        EXPECT_EQ(rc, answer.rc);
        EXPECT_EQ("x", answer.text);
        EXPECT_EQ(1, answer.traced(label)) << answer.output;
    }

    const std::string start =
        "An exception occurred during executing method enumInstances on provider TestProvider. The "
        "exception was thrown from method ";
    EXPECT_EQ(start +
                  "run on class Tool with an exception id of CIM_ERROR and an exception string "
                  "of \"it broke\".",
              handled(zemOperationFailedException("Tool", "run", "it broke")).text);
    EXPECT_EQ(start + " on class Tool with an exception id of E7 and an exception string of \"\".",
              handled(zemOperationFailedException("Tool", "", "E7", "")).text);
    EXPECT_EQ(
        start +
            "run on class Tool with an exception id of E7 and an exception string of "
            "\"it broke\". The exception was thrown on behalf of access method getLPAR.",
        handled(zemOperationFailedException("Tool", "run", "getLPAR", "E7", "it broke")).text);
}

TEST_P(BaseProviderStatus, FallsBackToTheDefaultText) {
    const Answer answer = h.answer([&](CMPIResult*) {
        EXPECT_STREQ("as is", provider.retrieveLocalizedString("none", "Error.X", "as is", 0));
        EXPECT_STREQ("as is", zemBaseProvider::retrieveLocalizedString(nullptr, "P", "none",
                                                                       "Error.X", "as is", 0));
        CMPIBroker bare = *h.server.broker();
        bare.eft = nullptr;
        EXPECT_STREQ("as is", zemBaseProvider::retrieveLocalizedString(&bare, "P", "none",
                                                                       "Error.X", "as is", 0));
        return CMPIStatus{CMPI_RC_OK, nullptr};
    });
    EXPECT_EQ(1, answer.traced("OPEN MESSAGE BUNDLE FILE[(]none[)] FAILED,RETURN DEFAULT STRING "
                               "Error.X:as is"));
    EXPECT_EQ(1, answer.traced("ERROR brkr->eft is NULL"));
}

TEST_P(BaseProviderStatus, LogsThroughTheServer) {
    cimom::LogCollector log(h.server);
    testing::internal::CaptureStdout();
    provider.logMessage(3, "Id", "text");
    provider.logMessage(2, "", "text alone");
    provider.logMessage(1, nullptr, nullptr);
    zemBaseProvider::logMessage(nullptr, "P", 3, "Id", "text");
    provider.logICUMessage(CmpiContext(h.ctx()), 4, "Id", "none", "Error.X", "default");
    provider.trace("as it comes");
    const std::string output = testing::internal::GetCapturedStdout();
    EXPECT_NE(std::string::npos, output.find("> LOG MESSAGE: Id: text\n"));
    EXPECT_NE(std::string::npos, output.find("> LOG MESSAGE: text alone\n"));
    EXPECT_NE(std::string::npos, output.find("> LOG ICU MESSAGE Error.X: default\n"));
    CMPIStatus rc = {CMPI_RC_OK, nullptr};
    const CMPIData process = h.ctx()->ft->getEntry(h.ctx(), "UseProcessLocale", &rc);
    EXPECT_TRUE(rc.rc == CMPI_RC_OK && process.value.boolean);
    if (GetParam() == Character::Lean) return;
    using Kind = cimom::LogLine::Kind;
    EXPECT_TRUE(log.contains(Kind::Message, 3, "TestProvider", "Id: text"));
    EXPECT_TRUE(log.contains(Kind::Message, 2, "TestProvider", "text alone"));
    EXPECT_TRUE(log.contains(Kind::Message, 4, "TestProvider", "Id: default"));
    EXPECT_TRUE(log.contains(Kind::Trace, 0, "ProviderAgent", "as it comes"));
    EXPECT_TRUE(log.contains(Kind::Trace, 4, "TestProvider", "LOG MESSAGE: text alone"));
}

TEST_P(BaseProviderStatus, NamesTheUser) {
    EXPECT_STREQ("", zemBaseProvider::getUserContext(CmpiContext(h.ctx())));
    cimom::Request request;
    request.user = "kim";
    cimom::RequestScope scope(h.server, request);
    EXPECT_STREQ("kim", zemBaseProvider::getUserContext(CmpiContext(scope.context())));
    EXPECT_STREQ("", zemBaseProvider::getUserContext(CmpiContext(nullptr)));
}

TEST_P(BaseProviderStatus, ReducesTheLanguageToALocale) {
    const struct {
        const char* accepted;
        const char* locale;
    } rows[] = {
        {"", ""},
        {"e", ""},
        {"ROOT", ""},
        {"en", "en_US.UTF-8"},
        {"zh", "en_US.UTF-8"},
        {"ja", "ja_JP.UTF-8"},
        {"pt", "pt_BR.UTF-8"},
        {"fr-ca", "fr_CA.UTF-8"},
        {"deu", "deu.UTF-8"},
        {"zh-hant-tw", "zh_HANT_TW.UTF-8"},
        {"pt-br;q=0.7,de;q=0.5", "pt_BR.UTF-8"},
        {"fr;q=0.5,de", "de_DE.UTF-8"},
        {"fr;q=0.5,de;q=0.5", "fr_FR.UTF-8"},
        {"fr;q=0.2,de;q=0.5,it;q=0.4", "de_DE.UTF-8"},
        {"fr;q=0", ""},
        {"fr;q=0.5,de;level=1", "fr_FR.UTF-8"},  // the weight stays that of the range before
        {"fr;q=nan,de;q=-1", ""},
        {"fr;q=0.5,", ""},
        {";q=1", ""},
    };
    for (const auto& [accepted, locale] : rows) {
        cimom::Request request;
        request.language = accepted;
        cimom::RequestScope scope(h.server, request);
        EXPECT_STREQ(locale, zemBaseProvider::getExternalLanguageName(CmpiContext(scope.context())))
            << accepted;
    }
}

ON_BOTH_BROKERS(BaseProviderStatus);

TEST(BaseProviderBundle, GivesTheTranslatedText) {
    Folder folder;
    folder.write("default_de.json", R"json({
        "Error.KeyNotFound": "Schluessel {0} fehlt ({1},{2},{3})",
        "Error.MethodNotSupported": "{0} bei {1} fuer {2}: nein",
        "Error.InvalidMethodArgValue": "nie gelesen"})json");
    folder.write("own.json", R"json({"Own.Text": "{0}{1}{2}"})json");
    cimom::Request request;
    request.language = "de";
    Harness h(Character::Full, request, folder.path());
    const ScriptedProvider& p = h.provider();

    EXPECT_EQ("Schluessel k fehlt (K,M,TestProvider)",
              raised([&] { p.throwKeyNotFoundExc("M", "K", "k"); }).text);
    EXPECT_EQ("M bei TestProvider fuer K: nein",
              raised([&] { p.throwMethodNotSupportedExc("M", "K"); }).text);
    EXPECT_EQ(
        "Invalid value of v is provided for parameter a to method M on provider TestProvider.",
        raised([&] { p.throwInvalidMethodArgValueExc("a", "v", "M"); }).text);
    EXPECT_EQ("Duplicate key k for class K is provided to method M on provider TestProvider.",
              raised([&] { p.throwDuplicateKeyExc("M", "K", "k"); }).text);

    // The provider's own bundle; the list of inserts ends at the first null.
    script.bundle = "own";
    const Answer answer = h.answer([&](CMPIResult*) {
        EXPECT_STREQ("12{2}",
                     h.provider().retrieveLocalizedString("Own.Text", "?", "1", "2", nullptr, "4"));
        return CMPIStatus{CMPI_RC_OK, nullptr};
    });
    EXPECT_EQ(1, answer.traced("READ ICU MESSAGE Own.Text FROM own"));
    EXPECT_EQ(1, answer.traced("ICU MESSAGE Own.Text: 12.*"));
}

}  // namespace

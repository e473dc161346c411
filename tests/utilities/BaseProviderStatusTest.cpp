#include "../cimom/Folder.h"
#include "ProviderHarness.h"

namespace {

using cimom::Character;

class BaseProviderStatus : public BothBrokers {
protected:
    BaseProviderStatus() : h(GetParam()), p(h.provider()) {}

    Answer handled(const zemException& e) {
        return h.answer([&](CMPIResult*) {
            const CmpiStatus status = p.handleException("enumInstances", e);
            const CMPIBroker* mb = h.server.broker();
            return CMPIStatus{status.rc(), mb->eft->newString(mb, status.msg(), nullptr)};
        });
    }

    Harness h;
    zemBaseProvider& p;
};

TEST_P(BaseProviderStatus, ThrowsTheFamily) {
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

TEST_P(BaseProviderStatus, TurnsExceptionsIntoStatus) {
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
TEST_P(BaseProviderStatus, TakesServersThatLackFunctions) {
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
TEST_P(BaseProviderStatus, ClosesWhatItOpens) {
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

TEST_P(BaseProviderStatus, FallsBackToTheDefaultText) {
    using Z = zemBaseProvider;
    CMPIBroker bare = *h.server.broker();
    bare.eft = nullptr;
    EXPECT_STREQ("as is", p.retrieveLocalizedString("none", "E.X", "as is", 0));
    EXPECT_STREQ("", Z::retrieveLocalizedString(nullptr, "P", "none", "E.X", nullptr, 0));
    EXPECT_STREQ("as is", Z::retrieveLocalizedString(&bare, "P", "none", "E.X", "as is", 0));
}

TEST_P(BaseProviderStatus, LogsThroughTheServer) {
    cimom::LogCollector log(h.server);
    const Answer answer = h.answer([&](CMPIResult*) {
        p.logMessage(3, "Id", "text");
        p.logMessage(2, "", "text alone");
        p.logMessage(1, nullptr, nullptr);
        zemBaseProvider::logMessage(nullptr, "P", 3, "Id", "text");
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

TEST_P(BaseProviderStatus, ReadsUserAndLanguageOfTheRequest) {
    EXPECT_STREQ("", zemBaseProvider::getUserContext(CmpiContext(h.ctx())));
    EXPECT_STREQ("", zemBaseProvider::getUserContext(CmpiContext(nullptr)));
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
        EXPECT_STREQ(locale, zemBaseProvider::getExternalLanguageName(ctx)) << accepted;
        EXPECT_STREQ("kim", zemBaseProvider::getUserContext(ctx));
    }
}

ON_BOTH_BROKERS(BaseProviderStatus);

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

}  // namespace

// Message bundles, as providers reach them through the broker.
#include <cstdlib>
#include <tuple>

#include "Fixture.h"
#include "Messages.h"
#include "cmpimacs.h"

namespace {

using namespace cimom;
using fixture::textOf;

class Messages : public testing::Test {
protected:
    Messages() {
        m_folder.write("default_de.json", R"({"Greet": "Hallo {0}, $1", "Odd": 5})");
        m_folder.write("default_de_AT.json", R"({"Greet": "Servus {0}"})");
        m_folder.write("default.json", R"({"Greet": "Hello {0}"})");
        m_folder.write("broken.json", "{");
        std::filesystem::create_directory(m_folder / "sub");
        m_folder.write("sub/osbase_fr.json", R"({"Greet": "Bonjour {0}"})");
    }

    /// What Greet says, or the status of opening the bundle.
    std::string greet(const std::string& bundle, const std::string& language, bool local = false) {
        Request request;
        request.language = language;
        if (local) {
            request.context.set("UseProcessLocale", true);
        }
        const RequestScope scope(m_server, request);
        CMPIBroker* mb = m_server.broker();
        CMPIMsgFileHandle handle = nullptr;
        const CMPIStatus opened = CMOpenMessageFile(mb, bundle.c_str(), &handle);
        if (opened.rc != CMPI_RC_OK) {
            return statusName(opened.rc);
        }
        CMPIStatus rc{CMPI_RC_OK, nullptr};
        CMPIString* text = mb->eft->getMessage2(mb, "Greet", handle, "default $0", &rc, 2,
                                                CMPI_chars, "Eve", CMPI_sint32, -3);
        EXPECT_EQ(rc.rc, CMPI_RC_OK);
        EXPECT_EQ(CMCloseMessageFile(mb, handle).rc, CMPI_RC_OK);
        EXPECT_EQ(CMCloseMessageFile(mb, handle).rc, CMPI_RC_ERR_INVALID_HANDLE);
        return textOf(text);
    }

    const fixture::Folder m_folder;
    Server m_server{{Character::Full, m_folder / "", {}, nullptr}};
};

TEST_F(Messages, BundlesAreFoundByLanguage) {
    const std::string sub = m_folder / "sub/osbase";
    const std::tuple<std::string, std::string, std::string> rows[] = {
        {"", "de", "Hallo Eve, -3"},
        {"", "de-AT", "Servus Eve"},
        {"", "de-CH,fr", "Hallo Eve, -3"},
        {"", "fr;q=0.9,de-AT;q=0.5,de;q=0.7", "Hallo Eve, -3"},
        {"", "fr", "Hello Eve"},
        {"", "", "Hello Eve"},
        {"", "../../etc/passwd,de;q=0", "Hello Eve"},
        {"default", "de", "Hallo Eve, -3"},
        {sub, "fr", "Bonjour Eve"},
        {sub, "de", "CIM_ERR_NOT_FOUND"},
        {"/nowhere/default", "de", "Hallo Eve, -3"},
        {"other", "de", "CIM_ERR_NOT_FOUND"},
        {"broken", "de", "CIM_ERR_NOT_FOUND"},
    };
    for (const auto& [bundle, language, expected] : rows) {
        EXPECT_EQ(greet(bundle, language), expected) << bundle << language;
    }
    setenv("LC_ALL", "de_AT.UTF-8", 1);
    EXPECT_EQ(greet("", "fr", true), "Servus Eve");
    unsetenv("LC_ALL");
}

TEST_F(Messages, TextsTakeInserts) {
    const std::pair<const char*, const char*> rows[] = {{"$0$1", "ab"},
                                                        {"{1} {0}", "b a"},
                                                        {"$2 {2} $ {x} {0", "$2 {2} $ {x} {0"},
                                                        {"{0}{0}", "aa"},
                                                        {"", ""}};
    for (const auto& [text, expected] : rows) {
        EXPECT_EQ(withInserts(text, {"a", "b"}), expected);
    }
    EXPECT_EQ(withInserts("$0", {"$1", "x"}), "$1");  // an insert is not looked at again

    const RequestScope scope(m_server);
    CMPIBroker* mb = m_server.broker();
    CMPIStatus rc{CMPI_RC_OK, nullptr};
    CMPIString* string = CMNewString(mb, "s", nullptr);
    EXPECT_EQ(textOf(mb->eft->getMessage2(mb, "x", nullptr, "$0 $1 $2 $3 $4 $5 $6", &rc, 7,
                                          CMPI_uint32, 4000000000U, CMPI_sint64, -5LL, CMPI_uint64,
                                          5ULL, CMPI_real64, 2.5, CMPI_boolean, 1, CMPI_string,
                                          string, CMPI_chars, nullptr)),
              "4000000000 -5 5 2.5 true s ");
    EXPECT_EQ(textOf(mb->eft->getMessage(mb, "Greet", "x", &rc, 1, CMPI_chars, "you")),
              "Hello you");
    EXPECT_EQ(textOf(mb->eft->getMessage(mb, "Unknown", "no $0", &rc, 1, CMPI_chars, "way")),
              "no way");
    mb->eft->getMessage2(mb, "x", nullptr, "", &rc, 11);
    EXPECT_EQ(rc.rc, CMPI_RC_ERR_INVALID_PARAMETER);
    mb->eft->getMessage2(mb, "x", nullptr, "", &rc, 1, CMPI_ref, nullptr);
    EXPECT_EQ(rc.rc, CMPI_RC_ERR_TYPE_MISMATCH);
}

}  // namespace

// Message bundles, as providers reach them through the broker.
#include <unistd.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>

#include "Fixture.h"
#include "Messages.h"

namespace {

using namespace cimom;
namespace fs = std::filesystem;

class Messages : public testing::Test {
protected:
    Messages() {
        std::string name = (fs::temp_directory_path() / "messagesXXXXXX").string();
        m_folder = mkdtemp(name.data());
        write("default_de.json", R"({"Greet": "Hallo {0}, $1", "Odd": 5})");
        write("default_de_AT.json", R"({"Greet": "Servus {0}"})");
        write("default.json", R"({"Greet": "Hello {0}"})");
        write("broken.json", "{");
        fs::create_directory(m_folder / "sub");
        write("sub/osbase_fr.json", R"({"Greet": "Bonjour {0}"})");
        m_server =
            std::make_unique<Server>(Options{Character::Full, m_folder.string(), {}, nullptr});
    }
    ~Messages() override { fs::remove_all(m_folder); }

    void write(const std::string& name, const char* text) {
        std::ofstream(m_folder / name) << text;
    }

    /// What Greet says, or the status of opening the bundle.
    std::string greet(const std::string& bundle, const std::string& language, bool local = false) {
        Request request;
        request.language = language;
        if (local) request.context.set("UseProcessLocale", true);
        RequestScope scope(*m_server, request);
        CMPIBroker* mb = m_server->broker();
        CMPIMsgFileHandle handle = nullptr;
        const CMPIStatus opened = mb->eft->openMessageFile(mb, bundle.c_str(), &handle);
        if (opened.rc != CMPI_RC_OK) return statusName(opened.rc);
        CMPIStatus rc{CMPI_RC_OK, nullptr};
        CMPIString* text = mb->eft->getMessage2(mb, "Greet", handle, "default $0", &rc, 2,
                                                CMPI_chars, "Eve", CMPI_sint32, -3);
        EXPECT_EQ(rc.rc, CMPI_RC_OK);
        EXPECT_EQ(mb->eft->closeMessageFile(mb, handle).rc, CMPI_RC_OK);
        EXPECT_EQ(mb->eft->closeMessageFile(mb, handle).rc, CMPI_RC_ERR_INVALID_HANDLE);
        return text->ft->getCharPtr(text, nullptr);
    }

    fs::path m_folder;
    std::unique_ptr<Server> m_server;
};

TEST_F(Messages, BundlesAreFoundByLanguage) {
    const std::string sub = (m_folder / "sub" / "osbase").string();
    const struct {
        std::string bundle, language, expected;
    } rows[] = {
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
    for (const auto& row : rows)
        EXPECT_EQ(greet(row.bundle, row.language), row.expected) << row.bundle << row.language;
    setenv("LC_ALL", "de_AT.UTF-8", 1);
    EXPECT_EQ(greet("", "fr", true), "Servus Eve");
    unsetenv("LC_ALL");
}

TEST_F(Messages, TextsTakeInserts) {
    const struct {
        const char* text;
        const char* expected;
    } rows[] = {{"$0$1", "ab"},
                {"{1} {0}", "b a"},
                {"$2 {2} $ {x} {0", "$2 {2} $ {x} {0"},
                {"{0}{0}", "aa"},
                {"", ""}};
    for (const auto& row : rows) EXPECT_EQ(withInserts(row.text, {"a", "b"}), row.expected);
    EXPECT_EQ(withInserts("$0", {"$1", "x"}), "$1");  // an insert is not looked at again

    RequestScope scope(*m_server);
    CMPIBroker* mb = m_server->broker();
    CMPIStatus rc{CMPI_RC_OK, nullptr};
    const auto message = [&](CMPIString* text) {
        return std::string(text ? text->ft->getCharPtr(text, nullptr) : "(none)");
    };
    CMPIString* string = mb->eft->newString(mb, "s", nullptr);
    EXPECT_EQ(message(mb->eft->getMessage2(mb, "x", nullptr, "$0 $1 $2 $3 $4 $5 $6", &rc, 7,
                                           CMPI_uint32, 4000000000U, CMPI_sint64, -5LL, CMPI_uint64,
                                           5ULL, CMPI_real64, 2.5, CMPI_boolean, 1, CMPI_string,
                                           string, CMPI_chars, nullptr)),
              "4000000000 -5 5 2.5 true s ");
    EXPECT_EQ(message(mb->eft->getMessage(mb, "Greet", "x", &rc, 1, CMPI_chars, "you")),
              "Hello you");
    EXPECT_EQ(message(mb->eft->getMessage(mb, "Unknown", "no $0", &rc, 1, CMPI_chars, "way")),
              "no way");
    mb->eft->getMessage2(mb, "x", nullptr, "", &rc, 11);
    EXPECT_EQ(rc.rc, CMPI_RC_ERR_INVALID_PARAMETER);
    mb->eft->getMessage2(mb, "x", nullptr, "", &rc, 1, CMPI_ref, nullptr);
    EXPECT_EQ(rc.rc, CMPI_RC_ERR_TYPE_MISMATCH);
}

}  // namespace

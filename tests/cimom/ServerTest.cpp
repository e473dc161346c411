// Operations of a server: finding and loading providers, upcalls, classes, indications, threads.
#include <unistd.h>

#include <algorithm>
#include <atomic>
#include <filesystem>
#include <fstream>
#include <stdexcept>
#include <thread>

#include "Fixture.h"

namespace {

using namespace cimom;
using fixture::thing;
namespace fs = std::filesystem;

const ObjectPath kThings("root/cimv2", "Fix_Thing");

std::vector<std::string> names(const std::vector<ObjectPath>& paths) {
    std::vector<std::string> out;
    for (const ObjectPath& path : paths) out.push_back(path.keys.at(0).value.text());
    std::sort(out.begin(), out.end());
    return out;
}

class Operations : public fixture::BothBrokers {
protected:
    void SetUp() override {
        m_server.registerProvider("Fixture", {"Fix_Thing", "Fix_Link", "Fix_Event"},
                                  fixture::factories());
    }
    // Nothing of any request is left, and nothing was used that had been released.
    void TearDown() override {
        EXPECT_EQ(m_server.liveObjects(), m_kept);
        EXPECT_EQ(m_server.staleUses(), 0U);
    }

    std::size_t m_kept = 0;
    Server m_server{{GetParam(), "", {}, fixture::classes()}};
    const Request m_request;
};

TEST_P(Operations, InstancesLiveAndDie) {
    Request request = m_request;
    const Reply created = m_server.createInstance(
        request, Instance(thing("three"), {{"Name", "three"}, {"Size", std::uint32_t{3}}}));
    ASSERT_EQ(created.rc, CMPI_RC_OK) << created.message;
    EXPECT_EQ(created.paths, std::vector<ObjectPath>{thing("three")});
    EXPECT_EQ(m_server.createInstance(request, Instance(thing("three"))).rc,
              CMPI_RC_ERR_ALREADY_EXISTS);

    const Reply all = m_server.enumInstances(request, kThings);
    ASSERT_EQ(all.instances.size(), 3U);
    EXPECT_TRUE(all.done);
    EXPECT_EQ(all.instances[2].path, thing("three"));
    EXPECT_EQ(*all.instances[2].properties.find("Tags"),
              Value::array(CMPI_string, {"first", Value()}));
    // A lean broker fills new instances with what else the class has.
    EXPECT_EQ(all.instances[2].properties.find("Since") != nullptr, lean());

    request.properties = {{"size"}};
    EXPECT_EQ(m_server.getInstance(request, thing("three")).instances.at(0).properties,
              NamedValues({{"Size", std::uint32_t{3}}}));
    EXPECT_EQ(
        m_server.modifyInstance(request, Instance(thing("three"), {{"Size", std::uint32_t{33}}}))
            .rc,
        CMPI_RC_OK);
    EXPECT_EQ(m_server.getProperty(request, thing("three"), "Size").value(),
              Value(std::uint32_t{33}));
    EXPECT_EQ(m_server.setProperty(request, thing("three"), "Size", std::uint32_t{34}).rc,
              CMPI_RC_OK);
    EXPECT_EQ(m_server.setProperty(request, thing("three"), "Size", "big").rc,
              lean() ? CMPI_RC_OK : CMPI_RC_ERR_TYPE_MISMATCH);
    EXPECT_EQ(m_server.deleteInstance(request, thing("three")).rc, CMPI_RC_OK);
    const Reply gone = m_server.getInstance(request, thing("three"));
    EXPECT_EQ(gone.rc, CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(gone.message, "no such thing");
}

TEST_P(Operations, ClassesDecideWhoAnswers) {
    // By the class above; by classes below; by nobody; by no class.
    EXPECT_EQ(m_server.enumInstanceNames(m_request, {"root/cimv2", "Fix_Base"}).paths.size(), 2U);
    EXPECT_EQ(m_server.enumInstanceNames(m_request, {"", "fix_thing"}).paths.size(), 2U);
    EXPECT_EQ(m_server.enumInstanceNames(m_request, {"", "Fix_Foreign"}).rc,
              CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(m_server.enumInstanceNames(m_request, {"", "Unknown"}).rc, CMPI_RC_ERR_INVALID_CLASS);
    EXPECT_EQ(m_server.getInstance(m_request, {"", "Fix_Thing", {{"Name", 5}}}).rc,
              CMPI_RC_ERR_INVALID_PARAMETER);
    Server other({GetParam(), "", {}, nullptr});
    other.registerProvider("Fixture", {"Fix_Thing"}, fixture::factories(), {"root/other"});
    EXPECT_EQ(other.enumInstanceNames(m_request, kThings).rc, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(other.enumInstanceNames(m_request, {"ROOT/other", "Fix_Thing"}).paths.size(), 2U);
}

TEST_P(Operations, AssociationsAreFetchedByUpcalls) {
    const Reply others = m_server.associatorNames(m_request, thing("one"));
    ASSERT_EQ(others.rc, CMPI_RC_OK) << others.message;
    EXPECT_EQ(names(others.paths), std::vector<std::string>{"two, \"quoted\" \\"});
    EXPECT_EQ(m_server.associators(m_request, thing("one"), {"Fix_Link", "", "", ""})
                  .instances.at(0)
                  .path,
              others.paths[0]);
    const Reply links = m_server.references(m_request, thing("one"), {"", "", "Antecedent", ""});
    ASSERT_EQ(links.instances.size(), 1U);
    EXPECT_EQ(*links.instances[0].properties.find("Dependent"), Value(others.paths[0]));
    EXPECT_EQ(m_server.referenceNames(m_request, thing("one")).paths.at(0),
              links.instances[0].path);
    EXPECT_EQ(m_server.references(m_request, thing("one"), {"", "", "Dependent", ""}).paths.size(),
              0U);
    // An association that cannot hold the class is not asked; one that nobody serves is refused.
    EXPECT_TRUE(m_server.associatorNames(m_request, {"", "Fix_Event"}).paths.empty());
    EXPECT_EQ(m_server.associatorNames(m_request, thing("one"), {"Fix_Foreign", "", "", ""}).rc,
              CMPI_RC_ERR_NOT_SUPPORTED);
}

TEST_P(Operations, MethodsTakeAndGive) {
    const Value names = Value::array(CMPI_string, {"a", "b"});
    for (const char* method : {"Echo", "Relay"}) {
        const Reply reply = m_server.invokeMethod(m_request, thing("one"), method,
                                                  {{"Number", 5}, {"Names", names}});
        ASSERT_EQ(reply.rc, CMPI_RC_OK) << reply.message;
        EXPECT_TRUE(reply.done);
        EXPECT_EQ(reply.value(), Value(std::uint32_t{2}));
        // As the method declares it, where the broker can see that.
        EXPECT_EQ(reply.out.find("Number")->type(), CMPI_uint16);
    }
    EXPECT_EQ(m_server.invokeMethod(m_request, thing("one"), "Dance").rc,
              CMPI_RC_ERR_METHOD_NOT_FOUND);
    Request request = m_request;
    request.user = "admin";
    request.language = "fr";
    const Reply context = m_server.invokeMethod(request, thing("one"), "Context");
    EXPECT_EQ(*context.out.find(CMPIPrincipal), Value("admin"));
    EXPECT_EQ(*context.out.find(CMPIAcceptLanguage), Value("fr"));
    m_server.invokeMethod(m_request, thing("one"), "Keep");
    m_kept = 1;  // the leak shows
}

TEST_P(Operations, QueriesAreAnsweredByEnumeration) {
    const Reply reply = m_server.execQuery(m_request, "SELECT Name FROM Fix_Base WHERE Size > 1");
    ASSERT_EQ(reply.instances.size(), 1U) << reply.message;
    EXPECT_EQ(reply.instances[0].properties.size(), 1U);
    EXPECT_EQ(m_server.execQuery(m_request, "SELECT").rc, CMPI_RC_ERR_INVALID_QUERY);
}

TEST_P(Operations, IndicationsReachWhoAskedForThem) {
    LogCollector log(m_server);
    std::vector<Value> seen;
    Server::SubscriptionId first = 0, second = 0;
    const auto handler = [&](const Indication& indication) {
        EXPECT_EQ(indication.instance.path.className, "Fix_Event");
        seen.push_back(*indication.instance.properties.find("Severity"));
    };
    const auto fire = [&](std::uint16_t severity) {
        const Reply reply =
            m_server.invokeMethod(m_request, thing("one"), "Fire", {{"Severity", severity}});
        EXPECT_EQ(reply.rc, CMPI_RC_OK) << reply.message;
    };
    const auto subscribe = [&](const char* query, Server::SubscriptionId& id) {
        return m_server.subscribe(m_request, query, "WQL", handler, id).rc;
    };
    fire(9);
    EXPECT_EQ(subscribe("SELECT * FROM Fix_Event WHERE Severity > 3", first), CMPI_RC_OK);
    EXPECT_EQ(subscribe("SELECT * FROM Fix_Event", second), CMPI_RC_OK);
    fire(2);
    fire(4);
    EXPECT_EQ(m_server.unsubscribe(m_request, second).rc, CMPI_RC_OK);
    EXPECT_EQ(m_server.unsubscribe(m_request, second).rc, CMPI_RC_ERR_NOT_FOUND);
    fire(5);
    EXPECT_EQ(seen, std::vector<Value>(
                        {std::uint16_t{2}, std::uint16_t{4}, std::uint16_t{4}, std::uint16_t{5}}));
    EXPECT_EQ(m_server.unsubscribe(m_request, first).rc, CMPI_RC_OK);
    if (!lean()) {
        std::string steps;
        for (const LogLine& line : log.lines()) steps += line.text + "; ";
        EXPECT_EQ(steps,
                  "activate Fix_Event edge; enable  edge; activate Fix_Event inner; "
                  "deactivate Fix_Event inner; deactivate Fix_Event edge; disable  edge; ");
    }
    // Filters that are refused leave nothing behind.
    Request eve = m_request;
    eve.user = "eve";
    const Reply refused = m_server.subscribe(eve, "SELECT * FROM Fix_Event", "WQL", handler, first);
    EXPECT_EQ(refused.rc, CMPI_RC_ERR_ACCESS_DENIED);
    EXPECT_EQ(refused.message, "eve");
    EXPECT_EQ(subscribe("SELECT * FROM Fix_Foreign", first), CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(m_server.filterStep(m_request, FilterStep::MustPoll, "SELECT * FROM Fix_Event").rc,
              CMPI_RC_ERR_NOT_SUPPORTED);

    // A handler may end its own subscription.
    int count = 0;
    m_server.subscribe(
        m_request, "SELECT * FROM Fix_Event", "WQL",
        [&](const Indication&) {
            ++count;
            m_server.unsubscribe(m_request, first);
        },
        first);
    fire(1);
    fire(1);
    EXPECT_EQ(count, 1);
}

TEST_P(Operations, RequestsRunAtOnce) {
    Server::SubscriptionId id = 0;
    std::atomic<int> indications{0};
    m_server.subscribe(
        m_request, "SELECT * FROM Fix_Event", "WQL", [&](const Indication&) { ++indications; }, id);
    // All interfaces are made first: the factories of C providers write a common variable.
    m_server.associatorNames(m_request, thing("one"));
    m_server.invokeMethod(m_request, thing("one"), "Echo");
    m_server.getProperty(m_request, thing("one"), "Size");
    std::vector<std::thread> threads;
    std::atomic<int> failures{0};
    for (int t = 0; t < 8; ++t)
        threads.emplace_back([&, t] {
            Request request;
            request.user = "user" + std::to_string(t);
            for (int i = 0; i < 25; ++i) {
                const Reply found = m_server.associators(request, thing("one"));
                const Reply context = m_server.invokeMethod(request, thing("one"), "Context");
                m_server.invokeMethod(request, thing("one"), "Fire",
                                      {{"Severity", std::uint16_t{1}}});
                if (found.instances.size() != 1 ||
                    *context.out.find(CMPIPrincipal) != Value(*request.user))
                    ++failures;
            }
        });
    for (std::thread& thread : threads) thread.join();
    EXPECT_EQ(failures, 0);
    EXPECT_EQ(indications, 200);
    m_server.unsubscribe(m_request, id);
}

TEST_P(Operations, InstancesKeepTheRulesOfTheirClass) {
    RequestScope scope(m_server);
    CMPIBroker* mb = m_server.broker();
    CMPIInstance* inst = mb->eft->newInstance(mb, scope.wrap(thing("x")), nullptr);
    const auto set = [&](const char* name, const Value& value) {
        CMPIArgs* args = scope.wrap(NamedValues{{"v", value}});
        const CMPIData data = args->ft->getArg(args, "v", nullptr);
        return inst->ft->setProperty(inst, name, value.isNull() ? nullptr : &data.value, data.type)
            .rc;
    };
    const CMPIrc mismatch = lean() ? CMPI_RC_OK : CMPI_RC_ERR_TYPE_MISMATCH;
    const struct {
        const char* name;
        Value value;
        CMPIrc expected;
    } rows[] = {
        {"size", std::uint32_t{1}, CMPI_RC_OK},
        {"Size", std::uint16_t{1}, mismatch},
        {"Size", "one", mismatch},
        {"Size", Value::null(CMPI_string), CMPI_RC_OK},
        {"Tags", "one", mismatch},
        {"Tags", Value::array(CMPI_string, {}), CMPI_RC_OK},
        {"Part", Instance(thing("z")), CMPI_RC_OK},
        {"Part", "instance of Fix_Base {}", CMPI_RC_OK},
        {"Color", "red", lean() ? CMPI_RC_OK : CMPI_RC_ERR_NO_SUCH_PROPERTY},
    };
    for (const auto& row : rows) EXPECT_EQ(set(row.name, row.value), row.expected) << row.name;
    CMPIStatus rc{CMPI_RC_OK, nullptr};
    const CMPIData since = inst->ft->getProperty(inst, "Since", &rc);  // declared, never set
    EXPECT_EQ(rc.rc, CMPI_RC_OK);
    EXPECT_EQ(since.state, CMPI_nullValue);
    EXPECT_EQ(since.type, CMPI_dateTime);
    EXPECT_TRUE(inst->ft->getProperty(inst, "Name", &rc).state & CMPI_keyValue);
    EXPECT_EQ(inst->ft->getPropertyCount(inst, nullptr), lean() ? 6U : 4U);

    CMPIInstance* unknown =
        mb->eft->newInstance(mb, scope.wrap(ObjectPath("root/cimv2", "Unknown")), &rc);
    EXPECT_EQ(unknown != nullptr, lean());
    EXPECT_EQ(rc.rc, lean() ? CMPI_RC_OK : CMPI_RC_ERR_NOT_FOUND);
    const CMPIObjectPath* path = scope.wrap(thing("x"));
    EXPECT_TRUE(mb->eft->classPathIsA(mb, path, "fix_base", &rc));
    EXPECT_FALSE(mb->eft->classPathIsA(mb, path, "Fix_Event", &rc));
    const CMPIData units = path->ft->getPropertyQualifier(path, "Size", "Units", &rc);
    EXPECT_EQ(rc.rc, lean() ? CMPI_RC_ERR_NOT_SUPPORTED : CMPI_RC_OK);
    EXPECT_EQ(units.type, lean() ? CMPI_null : CMPI_string);
    path->ft->getParameterQualifier(path, "Echo", "Nothing", "In", &rc);
    EXPECT_EQ(rc.rc, lean() ? CMPI_RC_ERR_NOT_SUPPORTED : CMPI_RC_ERR_INVALID_PARAMETER);
}

ON_BOTH_BROKERS(Operations);

// -- providers that fail --------------------------------------------------------------------------

CMPIInstanceMI* throwingFactory(const CMPIBroker*, const CMPIContext*, CMPIStatus*) {
    static CMPIInstanceMIFT table = {};
    table.enumerateInstanceNames = [](CMPIInstanceMI*, const CMPIContext*, const CMPIResult*,
                                      const CMPIObjectPath*) -> CMPIStatus {
        throw std::runtime_error("lost my mind");
    };
    table.cleanup = [](CMPIInstanceMI*, const CMPIContext*, CMPIBoolean) -> CMPIStatus {
        throw std::runtime_error("again");
    };
    static CMPIInstanceMI mi = {nullptr, &table};
    return &mi;
}

TEST(Providers, WhatTheyThrowIsAnswered) {
    Server server;
    server.registerProvider("Mad", {"C"}, {throwingFactory, nullptr, nullptr, nullptr, nullptr});
    const Reply reply = server.enumInstanceNames({}, {"", "C"});
    EXPECT_EQ(reply.rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(reply.message, "provider Mad threw: lost my mind");
}

class Loader : public testing::Test {
protected:
    Loader() {
        std::string name = (fs::temp_directory_path() / "loaderXXXXXX").string();
        m_folder = mkdtemp(name.data());
    }
    ~Loader() override { fs::remove_all(m_folder); }

    std::string write(const std::string& text) {
        const fs::path file = m_folder / "registration.json";
        std::ofstream(file) << text;
        return file.string();
    }
    static std::string row(const char* cls, const char* provider, const char* library) {
        return std::string(R"({"namespace": ["root/cimv2", "root/b"], "library": ")") + library +
               R"(", "classes": {")" + cls + R"(": {"provider": ")" + provider +
               R"(", "interfaces": ["instance"]}}})";
    }

    fs::path m_folder;
};

TEST_F(Loader, LibrariesAreFoundLoadedAndUnloaded) {
    const fs::path built = FIXTURE_LIBRARY;
    fs::create_symlink(built, m_folder / "libbeside.so");
    const struct {
        std::string library;
        std::vector<std::string> folders;
    } rows[] = {{built.string(), {}},
                {"beside", {}},
                {built.filename().string(), {"/nowhere", built.parent_path().string()}}};
    for (const auto& each : rows) {
        Server server({Character::Full, "", each.folders, nullptr});
        server.loadRegistration(write(row("Fix_Thing", "Fixture", each.library.c_str())));
        const Reply reply = server.enumInstanceNames({}, {"root/b", "Fix_Thing"});
        EXPECT_EQ(reply.paths.size(), 2U) << reply.message;
        EXPECT_EQ(server.createInstance({}, Instance(thing("new"))).rc, CMPI_RC_OK);
        EXPECT_TRUE(server.unloadProviders(false).empty());
        // The library is new again.
        EXPECT_EQ(server.enumInstanceNames({}, {"root/b", "Fix_Thing"}).paths.size(), 2U);
    }
}

TEST_F(Loader, SomeWantToStay) {
    Server server;
    server.loadRegistration(write(row("Fix_Thing", "Stayer", FIXTURE_LIBRARY)));
    EXPECT_EQ(server.enumInstanceNames({}, kThings).paths.size(), 2U);
    EXPECT_EQ(server.unloadProviders(false), std::vector<std::string>{"Stayer"});
    EXPECT_TRUE(server.unloadProviders(true).empty());
}

TEST_F(Loader, FailuresHaveWords) {
    const struct {
        const char* provider;
        const char* library;
        const char* expected;
    } rows[] = {
        {"Refuser", FIXTURE_LIBRARY,
         "its factory made no InstanceMI, CIM_ERR_ACCESS_DENIED: not today"},
        {"Nobody", FIXTURE_LIBRARY, "its factory made no InstanceMI"},
        {"Fixture", "no-such-library", "cannot load libno-such-library.so: "},
        {"Fixture", "libm.so.6", "libm.so.6 has no factory Fixture_Create_InstanceMI"},
    };
    for (const auto& each : rows) {
        Server server;
        server.loadRegistration(write(row("Fix_Thing", each.provider, each.library)));
        const Reply reply = server.enumInstanceNames({}, kThings);
        EXPECT_EQ(reply.rc, CMPI_RC_ERR_FAILED);
        EXPECT_NE(reply.message.find(each.expected), std::string::npos) << reply.message;
    }
    for (
        const char* text :
        {"", "[]", "{\"classes\": {\"C\": {\"provider\": \"P\", \"interfaces\": [\"instance\"]}}}",
         R"({"namespace": "n", "library": "l", "classes": {"C": {"provider": "P", "interfaces": ["x"]}}})"})
        EXPECT_THROW(Server().loadRegistration(write(text)), std::runtime_error) << text;
    EXPECT_THROW(Server().loadRegistration("/nowhere/r.json"), std::runtime_error);
}

}  // namespace

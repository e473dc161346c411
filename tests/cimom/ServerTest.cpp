// Operations of a server: finding and loading providers, upcalls, classes, indications, threads.
#include <atomic>
#include <stdexcept>
#include <tuple>

#include "../utilities/OnThreads.h"
#include "Fixture.h"
#include "cmpimacs.h"

namespace {

using namespace cimom;
using fixture::thing;

const ObjectPath kThings("root/cimv2", "Fix_Thing");

class Operations : public BothBrokers {
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

    void fire(std::uint16_t severity, const Request& request = {}) {
        const Reply reply =
            m_server.invokeMethod(request, thing("one"), "Fire", {{"Severity", severity}});
        EXPECT_EQ(reply.rc, CMPI_RC_OK) << reply.message;
    }

    std::size_t m_kept = 0;
    Server m_server{{GetParam(), "", {}, fixture::classes()}};
    const Request m_request{};
};

TEST_P(Operations, InstancesLiveAndDie) {
    Request request = m_request;
    const auto three = [](std::uint32_t size) {
        return Instance(thing("three"), {{"Name", "three"}, {"Size", size}});
    };
    const Reply created = m_server.createInstance(request, three(3));
    ASSERT_EQ(created.rc, CMPI_RC_OK) << created.message;
    EXPECT_EQ(created.paths.at(0), thing("three"));
    EXPECT_EQ(m_server.createInstance(request, three(4)).rc, CMPI_RC_ERR_ALREADY_EXISTS);

    const Reply all = m_server.enumInstances(request, kThings);
    ASSERT_EQ(all.instances.size(), 3U);
    EXPECT_TRUE(all.done);
    EXPECT_EQ(all.instances[2].path, thing("three"));
    const NamedValues& properties = all.instances[2].properties;
    EXPECT_EQ(*properties.find("Tags"), Value::array(CMPI_string, {"first", Value()}));
    // A lean broker fills new instances with what else the class has.
    EXPECT_EQ(properties.find("Since") != nullptr, lean());

    // What was not asked for: the key, which the fixture returns.
    request.properties = {{"size"}};
    EXPECT_EQ(m_server.getInstance(request, thing("three")).instances.at(0).properties.size(),
              lean() ? 2U : 1U);
    EXPECT_EQ(m_server.modifyInstance(request, three(33)).rc, CMPI_RC_OK);
    const auto set = [&](const Value& size) {
        return m_server.setProperty(request, thing("three"), "Size", size).rc;
    };
    const auto get = [&] { return m_server.getProperty(request, thing("three"), "Size").value(); };
    EXPECT_EQ(get(), Value(std::uint32_t{33}));
    EXPECT_EQ(set(std::uint32_t{34}), CMPI_RC_OK);
    EXPECT_EQ(get(), Value(std::uint32_t{34}));
    EXPECT_EQ(set("big"), lean() ? CMPI_RC_OK : CMPI_RC_ERR_TYPE_MISMATCH);
    EXPECT_EQ(m_server.deleteInstance(request, thing("three")).rc, CMPI_RC_OK);
    const Reply gone = m_server.getInstance(request, thing("three"));
    EXPECT_EQ(gone.rc, CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(gone.message, "no such thing");
}

TEST_P(Operations, ClassesDecideWhoAnswers) {
    Server other({GetParam(), "", {}, nullptr});
    other.registerProvider("Fixture", {"Fix_Thing"}, fixture::factories(), {"root/other"});
    const std::tuple<Server&, ObjectPath, CMPIrc> rows[] = {
        {m_server, {"root/cimv2", "Fix_Base"}, CMPI_RC_OK},  // by the class below
        {m_server, {"", "fix_thing"}, CMPI_RC_OK},
        {m_server, {"", "Fix_Foreign"}, CMPI_RC_ERR_NOT_SUPPORTED},
        {m_server, {"", "Unknown"}, CMPI_RC_ERR_INVALID_CLASS},
        {other, kThings, CMPI_RC_ERR_NOT_SUPPORTED},
        {other, {"ROOT/other", "Fix_Thing"}, CMPI_RC_OK},
    };
    for (const auto& [server, path, rc] : rows) {
        const Reply reply = server.enumInstanceNames(m_request, path);
        EXPECT_EQ(reply.rc, rc) << path.className;
        EXPECT_EQ(reply.paths.size(), rc == CMPI_RC_OK ? 2U : 0U) << path.className;
    }
    // a key of another type is left to the provider by the lean one
    EXPECT_EQ(
        m_server.getInstance(m_request, {"", "Fix_Thing", {{"Name", 5}}}).rc,
        GetParam() == Character::Lean ? CMPI_RC_ERR_NOT_FOUND : CMPI_RC_ERR_INVALID_PARAMETER);
}

TEST_P(Operations, AssociationsAreFetchedByUpcalls) {
    const ObjectPath one = thing("one"), two = thing("two, \"quoted\" \\");
    const Reply others = m_server.associatorNames(m_request, one);
    ASSERT_EQ(others.paths.size(), 1U) << others.message;
    EXPECT_EQ(others.paths[0], two);
    const Reply things = m_server.associators(m_request, one, {"Fix_Link", "", "", ""});
    EXPECT_EQ(things.instances.at(0).path, two);
    const Reply links = m_server.references(m_request, one, {"", "", "Antecedent", ""});
    ASSERT_EQ(links.instances.size(), 1U);
    EXPECT_EQ(*links.instances[0].properties.find("Dependent"), Value(two));
    EXPECT_EQ(m_server.referenceNames(m_request, one).paths.at(0), links.instances[0].path);
    EXPECT_TRUE(m_server.references(m_request, one, {"", "", "Dependent", ""}).paths.empty());
    // An association that cannot hold the class is not asked; one that nobody serves is refused.
    EXPECT_EQ(m_server.associatorNames(m_request, {"", "Fix_Event"}).paths.empty(), !lean());
    EXPECT_EQ(m_server.associatorNames(m_request, one, {"Fix_Foreign", "", "", ""}).rc,
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

TEST_P(Operations, UpcallsReachEveryOperation) {
    const RequestScope scope(m_server);
    const CMPIBroker* mb = m_server.broker();
    const CMPIContext* ctx = scope.context();
    const CMPIObjectPath *one = scope.wrap(thing("one")), *three = scope.wrap(thing("three"));
    const auto sized = [&](std::uint32_t size) {
        return scope.wrap(Instance(thing("three"), {{"Name", "three"}, {"Size", size}}));
    };
    const auto size = [&] { return CBGetProperty(mb, ctx, three, "Size", nullptr).value.uint32; };
    const auto count = [](CMPIEnumeration* all) {
        return all ? CMGetArrayCount(CMToArray(all, nullptr), nullptr) : 1000;
    };
    EXPECT_EQ(RequestScope::read(CBCreateInstance(mb, ctx, three, sized(3), nullptr)),
              thing("three"));
    EXPECT_EQ(CBModifyInstance(mb, ctx, three, sized(4), nullptr).rc, CMPI_RC_OK);
    EXPECT_EQ(size(), 4U);
    const CMPIUint32 five = 5;
    EXPECT_EQ(CBSetProperty(mb, ctx, three, "Size", &five, CMPI_uint32).rc, CMPI_RC_OK);
    EXPECT_EQ(size(), 5U);
    const char* const query = "SELECT * FROM Fix_Thing WHERE Size > 4";
    EXPECT_EQ(count(CBExecQuery(mb, ctx, three, query, "WQL", nullptr)), 1U);
    EXPECT_EQ(CBDeleteInstance(mb, ctx, three).rc, CMPI_RC_OK);
    EXPECT_EQ(count(CBEnumInstanceNames(mb, ctx, one, nullptr)), 2U);
    const char *no = nullptr, *link = "Fix_Link", *far = "Dependent";  // which the fixture minds
    EXPECT_EQ(count(CBAssociators(mb, ctx, one, link, no, no, far, nullptr, nullptr)), 1U);
    EXPECT_EQ(count(CBAssociatorNames(mb, ctx, one, link, no, no, far, nullptr)), 1U);
    EXPECT_EQ(count(CBReferences(mb, ctx, one, link, no, nullptr, nullptr)), 1U);
    EXPECT_EQ(count(CBReferenceNames(mb, ctx, one, link, far, nullptr)), 0U);

    // Properties of a class whose provider has no entries for them go with the instance.
    Server plain({GetParam(), "", {}, fixture::classes()});
    plain.registerProvider("Fixture", {"Fix_Thing"}, {fixture::factories().instance});
    for (const std::uint32_t value : {9U, 1U}) {
        EXPECT_EQ(plain.setProperty({}, thing("one"), "Size", value).rc, CMPI_RC_OK);
        EXPECT_EQ(plain.getProperty({}, thing("one"), "Size").value(), Value(value));
    }
}

TEST_P(Operations, QueriesAreAnsweredByEnumeration) {
    const Reply reply = m_server.execQuery(m_request, "SELECT Name FROM Fix_Base WHERE Size > 1");
    ASSERT_EQ(reply.instances.size(), 1U) << reply.message;
    EXPECT_EQ(reply.instances[0].properties.size(), 1U);
    EXPECT_EQ(m_server.execQuery(m_request, "SELECT").rc, CMPI_RC_ERR_INVALID_QUERY);
    Request named = m_request;  // the query alone says what is wanted
    named.properties = {{"Name"}};
    const Reply whole = m_server.execQuery(named, "SELECT * FROM Fix_Thing WHERE Size > 1");
    ASSERT_EQ(whole.instances.size(), 1U);
    EXPECT_EQ(*whole.instances[0].properties.find("Size"), Value(std::uint32_t{2}));
}

TEST_P(Operations, IndicationsReachWhoAskedForThem) {
    LogCollector log(m_server);
    std::vector<Value> seen;
    Server::SubscriptionId first = 0, second = 0;
    const auto handler = [&](const Indication& indication) {
        EXPECT_EQ(indication.instance.path.className, "Fix_Event");
        seen.push_back(*indication.instance.properties.find("Severity"));
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
        for (const LogLine& line : log.lines()) {
            steps += line.text + "; ";
        }
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
    std::atomic<int> indications{0}, failures{0};
    m_server.subscribe(
        m_request, "SELECT * FROM Fix_Event", "WQL", [&](const Indication&) { ++indications; }, id);
    // All interfaces are made first: the factories of C providers write a common variable.
    m_server.associatorNames(m_request, thing("one"));
    m_server.invokeMethod(m_request, thing("one"), "Echo");
    m_server.getProperty(m_request, thing("one"), "Size");
    onThreads(8, [&](int number) {
        Request request;
        request.user = "user" + std::to_string(number);
        for (int i = 0; i < 25; ++i) {
            const Reply found = m_server.associators(request, thing("one"));
            const Reply context = m_server.invokeMethod(request, thing("one"), "Context");
            fire(1, request);
            if (found.instances.size() != 1 ||
                *context.out.find(CMPIPrincipal) != Value(*request.user)) {
                ++failures;
            }
        }
    });
    EXPECT_EQ(failures, 0);
    EXPECT_EQ(indications, 200);
    m_server.unsubscribe(m_request, id);
}

TEST_P(Operations, InstancesKeepTheRulesOfTheirClass) {
    RequestScope scope(m_server);
    CMPIBroker* mb = m_server.broker();
    CMPIInstance* inst = CMNewInstance(mb, scope.wrap(thing("x")), nullptr);
    const CMPIrc mismatch = lean() ? CMPI_RC_OK : CMPI_RC_ERR_TYPE_MISMATCH;
    const std::tuple<const char*, Value, CMPIrc> rows[] = {
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
    for (const auto& [name, value, expected] : rows) {
        const CMPIArgs* args = scope.wrap(NamedValues{{"v", value}});
        const CMPIData data = CMGetArg(args, "v", nullptr);
        const CMPIValue* given = value.isNull() ? nullptr : &data.value;
        EXPECT_EQ(CMSetProperty(inst, name, given, data.type).rc, expected) << name;
    }
    CMPIStatus rc{CMPI_RC_OK, nullptr};
    const CMPIData since = CMGetProperty(inst, "Since", &rc);  // declared, never set
    EXPECT_EQ(rc.rc, CMPI_RC_OK);
    EXPECT_EQ(since.state, CMPI_nullValue);
    EXPECT_EQ(since.type, CMPI_dateTime);
    EXPECT_TRUE(CMIsKeyValue(CMGetProperty(inst, "Name", &rc)));
    EXPECT_EQ(CMGetPropertyCount(inst, nullptr), lean() ? 7U : 5U);
    EXPECT_EQ(CMGetProperty(inst, "State", nullptr).value.uint16, 5);

    CMPIInstance* unknown = CMNewInstance(mb, scope.wrap(ObjectPath("root/cimv2", "None")), &rc);
    EXPECT_EQ(unknown != nullptr, lean());
    EXPECT_EQ(rc.rc, lean() ? CMPI_RC_OK : CMPI_RC_ERR_NOT_FOUND);
    const CMPIObjectPath* path = scope.wrap(thing("x"));
    EXPECT_TRUE(CMClassPathIsA(mb, path, "fix_base", &rc));
    EXPECT_FALSE(CMClassPathIsA(mb, path, "Fix_Event", &rc));
    const CMPIData units = CMGetPropertyQualifier(path, "Size", "Units", &rc);
    EXPECT_EQ(rc.rc, lean() ? CMPI_RC_ERR_NOT_SUPPORTED : CMPI_RC_OK);
    EXPECT_EQ(units.type, lean() ? CMPI_null : CMPI_string);
    CMGetParameterQualifier(path, "Echo", "Nothing", "In", &rc);
    EXPECT_EQ(rc.rc, lean() ? CMPI_RC_ERR_NOT_SUPPORTED : CMPI_RC_ERR_INVALID_PARAMETER);
}

ON_BOTH_BROKERS(Operations);

// -- what providers are handed, and must not return -------------------------------------------

/// A provider that notes what it is handed, and returns a link to a thing.
struct Probe {
    const CMPIBroker* broker = nullptr;
    std::string heard;    ///< of associations, the classes; of a modify, the property list
    NamedValues given;    ///< to create or modify
    bool returns = true;  ///< the link
    const char* nameSpace = "root/cimv2";       ///< of the link
    const char* thingNameSpace = "root/cimv2";  ///< of the thing
    std::function<void()> meanwhile = [] {};    ///< done in a modify
    std::function<void()> ending = [] {};       ///< done when it goes
};
Probe probe;
const CMPIStatus kDone{CMPI_RC_OK, nullptr};

CMPIStatus returnLink(const CMPIResult* result) {
    if (!probe.returns) {
        return kDone;
    }
    CMPIValue thing{};
    thing.ref = CMNewObjectPath(probe.broker, probe.thingNameSpace, "Fix_Thing", nullptr);
    CMPIObjectPath* link = CMNewObjectPath(probe.broker, probe.nameSpace, "Fix_Link", nullptr);
    CMAddKey(link, "Antecedent", &thing, CMPI_ref);
    return CMReturnObjectPath(result, link);
}

CMPIInstanceMI* probeInstances(const CMPIBroker* mb, const CMPIContext*, CMPIStatus*) {
    probe.broker = mb;
    static CMPIInstanceMIFT table = {};
    table.cleanup = [](auto...) {
        probe.ending();
        return kDone;
    };
    table.createInstance = [](auto, auto, auto result, auto, auto inst) {
        probe.given = RequestScope::read(inst).properties;
        return returnLink(result);
    };
    table.modifyInstance = [](auto, auto, auto, auto, auto inst, const char** names) {
        probe.given = RequestScope::read(inst).properties;
        if (!names) {
            probe.heard += "all";
        }
        for (; names && *names; ++names) {
            probe.heard += *names;
        }
        probe.meanwhile();
        return kDone;
    };
    static CMPIInstanceMI mi = {nullptr, &table};
    return &mi;
}

CMPIAssociationMI* probeAssociations(const CMPIBroker* mb, const CMPIContext*, CMPIStatus*) {
    probe.broker = mb;
    static CMPIAssociationMIFT table = {};
    table.cleanup = [](auto...) { return kDone; };
    table.referenceNames = [](auto, auto, auto result, auto, const char* className, auto) {
        probe.heard += (className ? className : "none") + std::string(" ");
        return returnLink(result);
    };
    static CMPIAssociationMI mi = {nullptr, &table};
    return &mi;
}

class Probed : public BothBrokers {
protected:
    Probed() {
        probe = Probe();
        m_server.registerProvider("Probe", {"Fix_Thing", "Fix_Tie", "Fix_Foreign"},
                                  {probeInstances, probeAssociations, nullptr, nullptr, nullptr});
    }
    Server m_server{{GetParam(), "", {}, fixture::classes()}};
};

TEST_P(Probed, GetsAWholeInstanceToCreateAndModify) {
    const Instance given(thing("one"), {{"Size", std::uint32_t{7}}});
    const NamedValues whole = {{"Name", "one"},
                               {"Size", std::uint32_t{7}},
                               {"State", std::uint16_t{5}},
                               {"Since", Value::null(CMPI_dateTime)},
                               {"Tags", Value::null(CMPI_stringA)},
                               {"Part", Value::null(CMPI_instance)}};
    EXPECT_EQ(m_server.createInstance({}, given).rc, CMPI_RC_OK);
    EXPECT_EQ(probe.given, whole);
    EXPECT_EQ(m_server.modifyInstance({}, given).rc, CMPI_RC_OK);
    EXPECT_EQ(probe.given, whole);
    EXPECT_EQ(probe.heard, lean() ? "all" : "Size");
}

TEST_P(Probed, HearsOfAssociationsAsItsBrokerHasThem) {
    const std::tuple<const char*, const char*, const char*> rows[] = {
        {"", "Fix_Tie ", "none "},
        {"Fix_Link", "Fix_Tie ", "Fix_Link "},
        {"fix_tie", "fix_tie ", "fix_tie "}};
    for (const auto& [named, full, whenLean] : rows) {
        probe.heard.clear();
        EXPECT_EQ(m_server.referenceNames({}, thing("one"), {"", named, "", ""}).rc, CMPI_RC_OK);
        EXPECT_EQ(probe.heard, lean() ? whenLean : full);
    }
}

TEST_P(Probed, IsToldOnWhereItReturnsLessThanItShould) {
    const auto expect = [&](const Reply& reply, const char* words) {
        EXPECT_EQ(reply.rc, *words ? CMPI_RC_ERR_FAILED : CMPI_RC_OK);
        EXPECT_EQ(reply.message, words);
        EXPECT_EQ(reply.paths.empty(), *words != '\0');
    };
    const std::tuple<const char*, const char*, const char*> rows[] = {
        {"root/cimv2", "root/cimv2", ""},
        {"", "root/cimv2",
         "provider Probe returned the path Fix_Link.Antecedent=\"root/cimv2:Fix_Thing\", which "
         "has no namespace"},
        {"root/cimv2", "", "provider Probe returned the path Fix_Thing, which has no namespace"}};
    for (const auto& [nameSpace, thingNameSpace, words] : rows) {
        probe.nameSpace = nameSpace;
        probe.thingNameSpace = thingNameSpace;
        expect(m_server.referenceNames({}, thing("one"), {"", "Fix_Tie", "", ""}), words);
        expect(m_server.createInstance({}, Instance(thing("one"))), words);
    }
    probe.returns = false;
    expect(m_server.createInstance({}, Instance(thing("one"))),
           "provider Probe returned no path of the instance that it was to create");
}

TEST_P(Probed, StaysWhileItWorks) {
    std::vector<std::string> stayed;
    probe.meanwhile = [&] { stayed = m_server.unloadProviders(false); };
    EXPECT_EQ(m_server.modifyInstance({}, Instance(thing("one"))).rc, CMPI_RC_OK);
    EXPECT_EQ(stayed, std::vector<std::string>{"Probe"});
    EXPECT_TRUE(m_server.unloadProviders(false).empty());
}

TEST_P(Probed, IsAnsweredForWhatItThrows) {
    probe.meanwhile = [] { throw std::runtime_error("lost my mind"); };
    probe.ending = [] { throw std::runtime_error("again"); };
    const Reply reply = m_server.modifyInstance({}, Instance(thing("one")));
    EXPECT_EQ(reply.rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(reply.message, "provider Probe threw: lost my mind");
}

ON_BOTH_BROKERS(Probed);

// -- libraries ------------------------------------------------------------------------------------

class Loader : public testing::Test {
protected:
    /// A server with the provider in a registration of its own.
    std::unique_ptr<Server> load(const std::string& provider, const std::string& library,
                                 const std::vector<std::string>& folders = {}) {
        const std::string row = R"({"namespace": ["root/cimv2", "root/b"], "library": ")" +
                                library + R"(", "classes": {"Fix_Thing": {"provider": ")" +
                                provider + R"(", "interfaces": ["instance"]}}})";
        auto server = std::make_unique<Server>(Options{Character::Full, "", folders, nullptr});
        server->loadRegistration(m_folder.write("registration.json", row));
        return server;
    }

    const fixture::Folder m_folder;
};

TEST_F(Loader, LibrariesAreFoundLoadedAndUnloaded) {
    const std::filesystem::path built = FIXTURE_LIBRARY;
    std::filesystem::create_symlink(built, m_folder / "libbeside.so");
    const std::pair<std::string, std::vector<std::string>> rows[] = {
        {built.string(), {}},
        {"beside", {}},
        {built.filename().string(), {"/nowhere", built.parent_path().string()}}};
    for (const auto& [library, folders] : rows) {
        const auto server = load("Fixture", library, folders);
        const Reply reply = server->enumInstanceNames({}, {"root/b", "Fix_Thing"});
        EXPECT_EQ(reply.paths.size(), 2U) << reply.message;
        EXPECT_EQ(server->createInstance({}, Instance(thing("new"))).rc, CMPI_RC_OK);
        EXPECT_TRUE(server->unloadProviders(false).empty());
        // The library is new again.
        EXPECT_EQ(server->enumInstanceNames({}, {"root/b", "Fix_Thing"}).paths.size(), 2U);
    }
}

TEST_F(Loader, SomeWantToStay) {
    const auto server = load("Stayer", FIXTURE_LIBRARY);
    EXPECT_EQ(server->enumInstanceNames({}, kThings).paths.size(), 2U);
    EXPECT_EQ(server->unloadProviders(false), std::vector<std::string>{"Stayer"});
    EXPECT_TRUE(server->unloadProviders(true).empty());
}

TEST_F(Loader, FailuresHaveWords) {
    const std::tuple<const char*, const char*, const char*> rows[] = {
        {"Refuser", FIXTURE_LIBRARY,
         "its factory made no InstanceMI, CIM_ERR_ACCESS_DENIED: not today"},
        {"Nobody", FIXTURE_LIBRARY, "its factory made no InstanceMI"},
        {"Fixture", "no-such-library", "cannot load libno-such-library.so: "},
        {"Fixture", "libm.so.6", "libm.so.6 has no factory Fixture_Create_InstanceMI"},
    };
    for (const auto& [provider, library, words] : rows) {
        const Reply reply = load(provider, library)->enumInstanceNames({}, kThings);
        EXPECT_EQ(reply.rc, CMPI_RC_ERR_FAILED);
        EXPECT_NE(reply.message.find(words), std::string::npos) << reply.message;
    }
    const std::string c = R"("classes": {"C": )", l = R"({"library": "l", )" + c;
    const std::pair<std::string, const char*> files[] = {
        {"", ": ends before its JSON does"},
        {"{\n  \"classes\": x}", ":2:14: not JSON from here on"},
        {"[]", ": \"classes\" is missing"},
        {R"({"classes": 5})", ": \"classes\": not an object of classes"},
        {"{" + c + "5}}", ": \"classes\": class C: \"provider\" is missing"},
        {"{" + c + R"([{"provider": "P"}]}})", ": \"classes\": class C: \"library\" is missing"},
        {l + R"({"provider": "P", "namespace": ["n", 5]}}})",
         ": \"classes\": class C: \"namespace\": not a name"},
        {l + R"({"provider": "P", "namespace": "n", "interfaces": "x"}}})",
         ": \"classes\": class C: \"interfaces\": there is no interface 'x', but instance, "
         "association, method, indication, property"},
    };
    for (const auto& [text, words] : files) {
        const std::string file = m_folder.write("r.json", text);
        try {
            Server().loadRegistration(file);
            ADD_FAILURE() << text;
        } catch (const std::runtime_error& e) {
            EXPECT_EQ(e.what(), file + words);
        }
    }
    EXPECT_THROW(Server().loadRegistration("/nowhere/r.json"), std::runtime_error);
}

}  // namespace

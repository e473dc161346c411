// Indication subscriptions: what clients may make, what lasts, and what listeners get of it.
#include <sys/stat.h>

#include <csignal>
#include <mutex>
#include <thread>

#include "../utilities/OnThreads.h"
#include "Failure.h"
#include "Fixture.h"
#include "HttpServer.h"
#include "Interop.h"
#include "InteropMof.h"

namespace {

using namespace cimom;
using namespace std::chrono_literals;
using Texts = std::vector<std::string>;

struct Answer {
    unsigned status = 200;
    std::string body;
    std::chrono::milliseconds after{0};
};

/// A listener that answers as it is told, and keeps the severities of what it took.
class Listener {
public:
    explicit Listener(std::vector<Answer> first = {}, Answer then = {})
        : m_first(std::move(first)), m_then(std::move(then)) {}

    std::string url() const { return "http://127.0.0.1:" + std::to_string(m_http.port()); }
    Texts taken() const {
        const std::lock_guard<std::mutex> lock(m_mutex);
        return m_taken;
    }

private:
    HttpAnswer take(const HttpRequest& request) {
        Answer answer = m_then;
        {
            const std::lock_guard<std::mutex> lock(m_mutex);
            if (m_asked < m_first.size()) {
                answer = m_first[m_asked];
            }
            ++m_asked;
            if (answer.status == 200 && answer.body.empty()) {
                const std::string mark = "Severity\" TYPE=\"uint16\"><VALUE>";
                const std::size_t at = request.body.find(mark) + mark.size();
                m_taken.push_back(request.body.substr(at, request.body.find('<', at) - at));
            }
        }
        std::this_thread::sleep_for(answer.after);
        HttpAnswer http;
        http.status = answer.status;
        http.next = [body = answer.body](std::string& out) mutable {
            out += body;
            return !std::exchange(body, "").empty();
        };
        return http;
    }

    mutable std::mutex m_mutex;
    const std::vector<Answer> m_first;
    const Answer m_then;
    std::size_t m_asked = 0;
    Texts m_taken;
    HttpServer m_http{{}, [this](const HttpRequest& request) { return take(request); }};
};

ExportOptions impatient() {
    ExportOptions options;
    options.firstPause = 10ms;
    options.longestPause = 100ms;
    return options;
}
Request asked(const std::string& user = "ann", const char* nameSpace = kInteropNamespace) {
    Request request;
    request.user = user;
    request.nameSpace = nameSpace;
    return request;
}

/// An object manager with the fixture provider, whose events are subscribed to.
struct World {
    explicit World(const std::string& state = "", Character character = Character::Full,
                   ExportOptions options = impatient())
        : server({character, "", {}, classes()}) {
        std::signal(SIGPIPE, [](int) {});
        const auto log = [this](const std::string& line) {
            const std::lock_guard<std::mutex> lock(mutex);
            lines += line + "\n";
        };
        server.registerProvider("Fixture", {"Fix_Thing", "Fix_Event"}, fixture::factories(),
                                {"root/cimv2"});
        options.log = log;
        exports = std::make_shared<IndicationExport>(options);
        subscriptions =
            std::make_shared<Subscriptions>(server, classes().get(), "here", state, exports, log);
        serveInterop(server, "1", subscriptions);
        subscriptions->start();
    }
    ~World() {
        subscriptions->stop();
        exports->stop(0ms);
    }
    static std::shared_ptr<const ClassRepository> classes() {
        static const auto all = ClassRepository::load(
            "fixture.mof", [](const std::string&) { return fixture::kMof; }, interopMof());
        return all;
    }
    bool logged(const std::string& text) {
        const std::lock_guard<std::mutex> lock(mutex);
        return lines.find(text) != std::string::npos;
    }

    Reply create(const char* className, const NamedValues& properties) {
        return server.createInstance(asked(), Instance({"", className}, properties));
    }
    Value filter(const std::string& name, const std::string& query = "SELECT * FROM Fix_Event") {
        return pathOf(create(kFilterClass, {{"Name", name},
                                            {"Query", query},
                                            {"QueryLanguage", "WQL"},
                                            {"SourceNamespace", "root/cimv2"}}));
    }
    Value destination(const std::string& name, const std::string& url) {
        return pathOf(create(kDestinationClass, {{"Name", name}, {"Destination", url}}));
    }
    static Value pathOf(const Reply& reply) {
        return reply.ok() ? Value(reply.paths.at(0)) : Value(reply.message);
    }
    CMPIrc modify(const Value& path, const char* property, const Value& value) {
        return server.setProperty(asked(), path.reference(), property, value).rc;
    }
    void fire(int from, int to) {
        for (int i = from; i < to; ++i) {
            server.invokeMethod(asked("ann", "root/cimv2"), fixture::thing("one"), "Fire",
                                {{"Severity", Value(static_cast<std::uint16_t>(i))}});
        }
    }
    std::size_t count() { return subscriptions->instances(kSubscriptionClass).size(); }

    std::mutex mutex;
    std::string lines;
    Server server;
    std::shared_ptr<IndicationExport> exports;
    std::shared_ptr<Subscriptions> subscriptions;
};

Texts numbers(int from, int to) {
    Texts all;
    for (int i = from; i < to; ++i) {
        all.push_back(std::to_string(i));
    }
    return all;
}

class OfClients : public BothBrokers {};
ON_BOTH_BROKERS(OfClients);

TEST_P(OfClients, InstancesAreMadeByTheRules) {
    World world("", GetParam());
    const Value f = world.filter("f"), d = world.destination("d", "there:5990/x");
    const auto filter = [](const char* name, const char* query, const char* language = "WQL") {
        return NamedValues{{"Name", name}, {"Query", query}, {"QueryLanguage", language}};
    };
    const auto destination = [](const char* url) {
        return NamedValues{{"Name", url}, {"Destination", url}};
    };
    const NamedValues link = {{"Filter", f}, {"Handler", d}};
    NamedValues strange = link, foreign = filter("x", "SELECT * FROM Fix_Event");
    strange.set("SubscriptionState", std::uint16_t{9});
    foreign.set("CreationClassName", "CIM_Filter");
    const struct {
        const char* className;
        NamedValues properties;
        CMPIrc rc;
    } rows[] = {
        {kFilterClass, filter("f", "SELECT * FROM Fix_Event"), CMPI_RC_ERR_ALREADY_EXISTS},
        {kFilterClass, filter("", "SELECT * FROM Fix_Event"), CMPI_RC_ERR_INVALID_PARAMETER},
        {kFilterClass, filter("x", ""), CMPI_RC_ERR_INVALID_PARAMETER},
        {kFilterClass, filter("x", "SELECT *"), CMPI_RC_ERR_INVALID_QUERY},
        {kFilterClass, filter("x", "SELECT * FROM Fix_Thing"), CMPI_RC_ERR_INVALID_QUERY},
        {kFilterClass, filter("x", "SELECT * FROM Fix_Event", "SQL"),
         CMPI_RC_ERR_QUERY_LANGUAGE_NOT_SUPPORTED},
        {kFilterClass, foreign, CMPI_RC_ERR_INVALID_PARAMETER},
        {kFilterClass, filter("elsewhere", "SELECT * FROM Fix_Event"), CMPI_RC_OK},
        {kDestinationClass, destination("ftp://x"), CMPI_RC_ERR_INVALID_PARAMETER},
        {kDestinationClass, destination("http://a:b@x"), CMPI_RC_ERR_INVALID_PARAMETER},
        {kDestinationClass, destination("http://x y"), CMPI_RC_ERR_INVALID_PARAMETER},
        {kDestinationClass, destination("https://[::1]:1/p"), CMPI_RC_OK},
        {kSubscriptionClass, strange, CMPI_RC_ERR_INVALID_PARAMETER},
        {kSubscriptionClass, {{"Filter", f}, {"Handler", f}}, CMPI_RC_ERR_INVALID_PARAMETER},
        {kSubscriptionClass, link, CMPI_RC_OK},
        {kSubscriptionClass, link, CMPI_RC_ERR_ALREADY_EXISTS},
        {"CIM_Namespace", {{"Name", "x"}}, CMPI_RC_ERR_NOT_SUPPORTED},
    };
    for (const auto& row : rows) {
        const Reply reply = world.create(row.className, row.properties);
        EXPECT_EQ(reply.rc, row.rc) << row.className << ": " << reply.message;
    }
    const Request ann = asked(), eve = asked("eve");
    const AssociationFilter any, filters{"", "CIM_IndicationFilter", "", ""};
    const ObjectPath subscription = world.server.referenceNames(ann, f.reference()).paths.at(0);
    EXPECT_EQ(world.server.associatorNames(ann, f.reference(), any).paths.at(0), d.reference());
    EXPECT_EQ(world.server.associators(ann, d.reference(), filters).instances.size(), 1U);
    EXPECT_EQ(world.server.associators(ann, f.reference(), filters).instances.size(), 0U);
    EXPECT_EQ(world.server.getInstance(ann, subscription).rc, CMPI_RC_OK);
    EXPECT_EQ(world.server.enumInstances(ann, {"", "CIM_Namespace"}).instances.size(), 2U);
    const std::pair<Request, ObjectPath> deletions[] = {
        {ann, f.reference()}, {ann, d.reference()}, {eve, subscription}, {ann, subscription},
        {ann, f.reference()}, {ann, d.reference()}, {ann, d.reference()}};
    std::vector<CMPIrc> answers;
    for (const auto& [request, path] : deletions) {
        answers.push_back(world.server.deleteInstance(request, path).rc);
    }
    EXPECT_EQ(answers, (std::vector<CMPIrc>{CMPI_RC_ERR_FAILED, CMPI_RC_ERR_FAILED,
                                            CMPI_RC_ERR_ACCESS_DENIED, CMPI_RC_OK, CMPI_RC_OK,
                                            CMPI_RC_OK, CMPI_RC_ERR_NOT_FOUND}));
}

TEST(Subscriptions, EachListenerGetsInOrderWhatItTakesAndNoneWaitsForAnother) {
    const std::string error =
        "<CIM><MESSAGE><SIMPLEEXPRSP><EXPMETHODRESPONSE><ERROR CODE=\"1\"/></EXPMETHODRESPONSE>"
        "</SIMPLEEXPRSP></MESSAGE></CIM>";
    const Listener moody({{500, "", 0ms}, {200, error, 0ms}, {302, "", 0ms}});
    const Listener slow({}, {200, "", 1500ms});
    ExportOptions options = impatient();
    options.patience = 500ms;
    World world("", Character::Full, options);
    const Value f = world.filter("f");
    const Value away = world.destination("away", "http://127.0.0.1:1");
    for (const Value& to :
         {world.destination("moody", moody.url()), world.destination("slow", slow.url())}) {
        EXPECT_EQ(world.create(kSubscriptionClass, {{"Filter", f}, {"Handler", to}}).rc, 0);
    }
    world.create(kSubscriptionClass,
                 {{"Filter", f}, {"Handler", away}, {"OnFatalErrorPolicy", std::uint16_t{4}}});
    world.fire(0, 20);
    EXPECT_TRUE(within(2s, [&] { return moody.taken() == numbers(0, 20); }));
    EXPECT_EQ(slow.taken(), numbers(0, 1));
    EXPECT_TRUE(within(5s, [&] {
        world.subscriptions->watch();
        return world.count() == 2;
    }));
    EXPECT_TRUE(world.logged(" given up: Couldn't connect")) << world.lines;
    EXPECT_TRUE(world.logged("500; it is tried again")) << world.lines;
    const auto before = std::chrono::steady_clock::now();
    world.exports->stop(200ms);
    EXPECT_LT(std::chrono::steady_clock::now() - before, 2s);
    EXPECT_TRUE(world.logged(" given up: the")) << world.lines;
}

TEST(Subscriptions, ChangesHoldAtOnceAndFullQueuesLoseTheLast) {
    const Listener one, other({}, {200, "", 100ms});
    ExportOptions options = impatient();
    options.mostWaiting = 3;
    World world("", Character::Full, options);
    const Value f = world.filter("f"), d = world.destination("d", one.url());
    const Value link =
        World::pathOf(world.create(kSubscriptionClass, {{"Filter", f}, {"Handler", d}}));
    const auto fired = [&](int from, int to, const Listener& listener, const Texts& taken) {
        world.fire(from, to);
        return within(2s, [&] { return listener.taken() == taken; });
    };
    EXPECT_TRUE(fired(0, 1, one, numbers(0, 1)));
    EXPECT_EQ(world.modify(link, "SubscriptionState", std::uint16_t{4}), CMPI_RC_OK);
    world.fire(1, 2);
    EXPECT_EQ(world.modify(link, "SubscriptionState", std::uint16_t{2}), CMPI_RC_OK);
    EXPECT_EQ(world.modify(f, "Query", "SELECT * FROM Fix_Event WHERE Severity > 2"), CMPI_RC_OK);
    EXPECT_EQ(world.modify(f, "Query", "SELECT"), CMPI_RC_ERR_INVALID_QUERY);
    EXPECT_TRUE(fired(2, 4, one, {"0", "3"}));
    EXPECT_EQ(world.modify(d, "Destination", other.url()), CMPI_RC_OK);
    world.fire(10, 30);
    EXPECT_TRUE(within(5s, [&] { return other.taken().size() >= options.mostWaiting; }));
    const Texts taken = other.taken();
    EXPECT_EQ(taken, numbers(10, 10 + static_cast<int>(taken.size())));
    EXPECT_TRUE(within(5s, [&] { return world.logged(" given up: too many wait"); }));
    EXPECT_EQ(world.modify(link, "SubscriptionDuration", std::uint64_t{0}), CMPI_RC_OK);
    world.subscriptions->watch();
    EXPECT_EQ(world.count(), 0U);
}

TEST(Subscriptions, OutlastTheProcessInAFileThatIsNobodyElses) {
    const Listener listener;
    const fixture::Folder folder;
    const std::string file = folder / "subscriptions.db";
    {
        World world(folder / "");
        const Value f = world.filter("\"\xC3\xA9\" \\ it", "SELECT Severity FROM Fix_Event");
        world.create(kSubscriptionClass,
                     {{"Filter", f}, {"Handler", world.destination("d", listener.url())}});
        EXPECT_THROW(World(folder / ""), std::runtime_error);  // in use
    }
    struct stat status = {};
    ASSERT_EQ(stat(file.c_str(), &status), 0);
    EXPECT_EQ(status.st_mode & 0777U, 0600U);
    {
        World world(file);
        world.fire(7, 8);
        EXPECT_TRUE(within(2s, [&] { return listener.taken() == Texts{"7"}; }));
        const ObjectPath path = world.subscriptions->instances(kSubscriptionClass).at(0).path;
        EXPECT_EQ(world.server.deleteInstance(asked("bob"), path).rc, CMPI_RC_ERR_ACCESS_DENIED);
        EXPECT_EQ(world.server.deleteInstance(asked("root"), path).rc, CMPI_RC_OK);
    }
    EXPECT_EQ(World(file).count(), 0U);
    chmod(file.c_str(), 0640);
    EXPECT_THROW(World{file}, std::runtime_error);
    const std::string other = folder.write("other", std::string(5000, 'x'));
    chmod(other.c_str(), 0600);
    EXPECT_THROW(World{other}, std::runtime_error);
    EXPECT_THROW(World(folder / "none/state"), std::runtime_error);
}

}  // namespace

/// A small world for association providers: two kinds of systems and of devices, served by a plain
/// provider that can be told to fail, and the provider under test, which serves Test_Link, all on
/// a broker of the object manager.
#ifndef ASSOCIATION_HARNESS_H
#define ASSOCIATION_HARNESS_H

#include <gtest/gtest.h>

#include <algorithm>
#include <functional>
#include <map>
#include <memory>
#include <mutex>
#include <string>
#include <thread>
#include <vector>

#include "AssociationProvider.h"
#include "CmpiInstanceMI.h"
#include "FailureText.h"
#include "InProcessFactories.h"
#include "MultiNtoNAssociationProvider.h"
#include "NtoNAssociationProvider.h"

inline constexpr const char* kNameSpace = "root/cimv2";
inline const cimom::AssociationFilter kNone = {"Test_Link", "", "", ""};

inline constexpr const char* kAssociationMof = R"(
Qualifier Key : boolean = false, Scope(property, reference), Flavor(DisableOverride);
Qualifier Association : boolean = false, Scope(association), Flavor(DisableOverride);
class Test_Element { [Key] string Name; string Caption; };
class Test_System : Test_Element {};
class Test_BigSystem : Test_System {};
class Test_Device : Test_Element {};
class Test_Disk : Test_Device {};
class Test_Port : Test_Device {};
[Association] class Test_Link {
    [Key] Test_Element ref Left;
    [Key] Test_Element ref Right;
    string Note;
};
)";

/// A row of zemAssociationData.
using Row = std::vector<const char*>;

/// What the objects are, how the provider under test is made, which happens at its first use, and
/// what the two do when they are called. Reset by each World.
struct WorldScript {
    std::vector<Row> rows = {
        {"Test_Link", "", "Test_System", "Left", "", "Test_Disk", "Right", ""}};
    std::string class1 = "Test_System", class2 = "Test_Disk";
    std::string pairs = std::string("Test_System\0Test_Disk\0", 22);
    int supported = 127;

    std::map<std::string, std::vector<std::string>> objects = {{"Test_System", {"s1", "s2"}},
                                                               {"Test_BigSystem", {"b1"}},
                                                               {"Test_Disk", {"d1", "d2"}},
                                                               {"Test_Port", {"p1"}}};
    /// Called with "names:class", "instances:class" or "get:class"; may throw a CmpiStatus.
    std::function<void(const std::string& call)> onCall = [](const std::string&) {};
    /// The pairs that belong together, by names.
    std::function<bool(const std::string& left, const std::string& right)> valid =
        [](const std::string&, const std::string&) { return true; };
    /// Called with "before", "after" or "addKeys"; the answer counts for the Before hook.
    std::function<bool(const std::string& hook)> onHook = [](const std::string&) { return true; };

    void note(const std::string& line) {
        const std::lock_guard<std::mutex> hold(mutex);
        calls.push_back(line);
    }
    /// How many notes begin with a text.
    long count(const std::string& text) {
        const std::lock_guard<std::mutex> hold(mutex);
        return std::count_if(calls.begin(), calls.end(), [&](const std::string& call) {
            return call.compare(0, text.size(), text) == 0;
        });
    }
    bool hook(const std::string& name) {
        note(name);
        return onHook(name);
    }
    std::vector<std::string> calls;
    std::mutex mutex;
};

inline std::unique_ptr<WorldScript> world;

/// Has something done on another thread while the first pair is looked at.
inline void whilePairing(const std::function<void()>& other) {
    world->valid = [other, met = false](const std::string&, const std::string&) mutable {
        if (!std::exchange(met, true)) {
            std::thread(other).join();
        }
        return true;
    };
}

/// Lets a hook, or "valid" for the look at a pair, throw; "refuse" lets the hooks answer no.
inline void failIn(const std::string& failing) {
    const auto act = [failing](const std::string& hook) {
        if (hook == failing) {
            throw zemOperationFailedException("hook failed");
        }
        return failing != "refuse";
    };
    world->onHook = act;
    world->valid = [act](const std::string&, const std::string&) { return act("valid"); };
}

/// All that was noted, with a blank behind each.
inline std::string noted() {
    std::string all;
    for (const std::string& call : world->calls) {
        all += call + " ";
    }
    return all;
}

/// Name of an object, whatever its class.
inline std::string nameOf(const CmpiObjectPath& path) {
    return path.getKey("Name").getString().charPtr();
}

/// Notes a call, lets the script act, and gives the objects of a class.
inline std::vector<CmpiObjectPath> askWorld(const std::string& call, const CmpiObjectPath& path) {
    const std::string className = path.getClassName().charPtr();
    world->note(call + ":" + className);
    world->onCall(call + ":" + className);
    std::vector<CmpiObjectPath> found;
    for (const std::string& name : world->objects[className]) {
        found.emplace_back(path.getNameSpace(), className.c_str());
        found.back().setKey("Name", CmpiData(name.c_str()));
    }
    return found;
}

class Objects : public CmpiInstanceMI {
public:
    Objects(const CmpiBroker& mb, const CmpiContext& ctx, const char*)
        : CmpiBaseMI(mb, ctx), CmpiInstanceMI(mb, ctx) {}

    CmpiStatus enumInstanceNames(const CmpiContext&, CmpiResult& result,
                                 const CmpiObjectPath& path) override {
        for (const CmpiObjectPath& object : askWorld("names", path)) {
            result.returnData(object);
        }
        return CmpiStatus(CMPI_RC_OK);
    }
    CmpiStatus enumInstances(const CmpiContext&, CmpiResult& result, const CmpiObjectPath& path,
                             const char**) override {
        for (const CmpiObjectPath& object : askWorld("instances", path)) {
            giveInstance(result, object);
        }
        return CmpiStatus(CMPI_RC_OK);
    }
    CmpiStatus getInstance(const CmpiContext&, CmpiResult& result, const CmpiObjectPath& path,
                           const char**) override {
        if (path.getKeyCount() == 0) {
            return CmpiStatus(CMPI_RC_ERR_INVALID_PARAMETER, "no key");
        }
        for (const CmpiObjectPath& object : askWorld("get", path)) {
            if (nameOf(object) != nameOf(path)) {
                continue;
            }
            giveInstance(result, object);
            return CmpiStatus(CMPI_RC_OK);
        }
        return CmpiStatus(CMPI_RC_ERR_NOT_FOUND, "no such object");
    }

private:
    static void giveInstance(CmpiResult& result, const CmpiObjectPath& path) {
        CmpiInstance instance(path);
        instance.setProperty("Name", path.getKey("Name"));
        result.returnData(instance);
    }
};

/// What the script says of a provider under test, whatever its family.
template <class Family>
class Scripted : public Family {
public:
    template <class... Rest>
    Scripted(const CmpiBroker& mb, const CmpiContext& ctx, Rest... rest)
        : CmpiBaseMI(mb, ctx), Family(mb, ctx, rest...) {}
    void addKeys(CmpiObjectPath& ncop, const CmpiObjectPath& cop1, const CmpiObjectPath& cop2,
                 const char* className) override {
        world->hook("addKeys");
        Family::addKeys(ncop, cop1, cop2, className);
    }

protected:
    static auto supported() {
        return static_cast<typename Family::SupportedOpType>(world->supported);
    }
    static bool isValid(const CmpiObjectPath& cop1, const CmpiObjectPath& cop2) {
        return world->valid(nameOf(cop1), nameOf(cop2));
    }
};

/// The providers under test, one of each family.
class Rows : public Scripted<zemAssociationProvider> {
public:
    Rows(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
        : CmpiBaseMI(mb, ctx), Scripted(mb, ctx, name, supported()) {
        // A row puts its namespace on the paths of its associations as it stands.
        for (const Row& r : world->rows) {
            addAssoData(new zemAssociationData(r[0], *r[1] != '\0' ? r[1] : "root/cimv2", r[2],
                                               r[3], r[4], r[5], r[6], r[7]));
        }
    }
    bool isValidateAssociation(const CmpiContext&, const zemAssociationData&,
                               const CmpiObjectPath& cop1, const CmpiObjectPath& cop2) override {
        return isValid(cop1, cop2);
    }
    bool BeforeGenerateAssociation(const CmpiContext&, const char*) override {
        return world->hook("before");
    }
    void AfterGenerateAssociation(const CmpiContext&, const char*) override {
        world->hook("after");
    }
};

class Pair : public Scripted<zemNtoNAssociationProvider> {
public:
    Pair(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
        : CmpiBaseMI(mb, ctx),
          Scripted(mb, ctx, name, "Test_Link", world->class1.c_str(), world->class2.c_str(), "Left",
                   "Right", supported(), "", "", "") {}
    bool isValidateAssociation(const CmpiContext&, const CmpiObjectPath& cop1,
                               const CmpiObjectPath& cop2) override {
        return isValid(cop1, cop2);
    }
    bool BeforeGenerateAssociation(const CmpiContext&) override { return world->hook("before"); }
    void AfterGenerateAssociation(const CmpiContext&) override { world->hook("after"); }
};

class Pairs : public Scripted<zemMultiNtoNAssociationProvider> {
public:
    Pairs(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
        : CmpiBaseMI(mb, ctx),
          Scripted(mb, ctx, name, "Test_Link", world->pairs.c_str(), "Left", "Right", supported(),
                   "", "", "") {}
    bool isValidateAssociation(const CmpiContext&, const CmpiObjectPath& cop1,
                               const CmpiObjectPath& cop2) override {
        return isValid(cop1, cop2);
    }
    using zemMultiNtoNAssociationProvider::aggregateReferenceClasses;
    using zemMultiNtoNAssociationProvider::m_aFirstClassName;
    using zemMultiNtoNAssociationProvider::m_aSecondClassName;
};

/// The result of a request as a provider sees it, for workers that are called directly.
using DirectResult = FromServer<CmpiResult>;

inline cimom::ObjectPath objectPath(const std::string& name) {
    static const std::map<char, const char*> classes = {
        {'s', "Test_System"}, {'b', "Test_BigSystem"}, {'d', "Test_Disk"}, {'p', "Test_Port"}};
    return {kNameSpace, classes.at(name.at(0)), {{"Name", name}}};
}

inline cimom::ObjectPath linkPath(const std::string& left, const std::string& right) {
    return {kNameSpace, "Test_Link", {{"Left", objectPath(left)}, {"Right", objectPath(right)}}};
}

/// "s1" is an object, "s1-d1" an association, "" the class of associations.
inline cimom::ObjectPath pathOf(const std::string& text) {
    const std::size_t dash = text.find('-');
    if (text.empty()) {
        return {kNameSpace, "Test_Link"};
    }
    return dash == std::string::npos ? objectPath(text)
                                     : linkPath(text.substr(0, dash), text.substr(dash + 1));
}

/// The reverse, for answers.
inline std::string show(const cimom::NamedValues& values) {
    if (const cimom::Value* const name = values.find("Name")) {
        return name->text();
    }
    return show(values.find("Left")->reference().keys) + "-" +
           show(values.find("Right")->reference().keys);
}

inline std::string show(const cimom::Reply& reply) {
    std::string text;
    for (const cimom::Instance& each : reply.instances) {
        text += show(each.properties) + " ";
    }
    for (const cimom::ObjectPath& each : reply.paths) {
        text += show(each.keys) + " ";
    }
    if (!text.empty()) {
        text.pop_back();
    }
    return text;
}

template <class Provider>
class World {
public:
    explicit World(cimom::Character character = cimom::Character::Full)
        : server({character, "", {}, classes()}), scope(reset(server)) {
        makeKnown(server.broker());
        server.registerProvider("Objects",
                                {"Test_System", "Test_BigSystem", "Test_Disk", "Test_Port"},
                                {FactoriesOf<Objects>::all().instance});
        server.registerProvider("UnderTest", {"Test_Link"}, FactoriesOf<Provider>::all());
    }
    ~World() { EXPECT_EQ(0U, server.staleUses()); }

    /// A provider beside the one that the server calls, for calling its workers directly.
    Provider& provider() {
        if (!m_provider) {
            m_provider = std::make_unique<Provider>(CmpiBroker(server.broker()), ctx(), "Direct");
        }
        return *m_provider;
    }
    CmpiContext ctx() const { return CmpiContext(scope.context()); }
    /// Paths of the request, once the binding has a broker from a provider.
    CmpiObjectPath path(const cimom::ObjectPath& path) const {
        return CmpiObjectPath(scope.wrap(path));
    }
    /// An object as messages name it.
    std::string textOf(const std::string& name) {
        provider();
        return static_cast<const char*>(
            zemBaseProvider::objectPathToString(path(objectPath(name))));
    }

    /// One of the seven operations by its first letters (ei, ein, gi, a, an, r, rn) on an object
    /// "s1", an association "s1-d1", or the class "".
    cimom::Reply run(const std::string& operation, const std::string& object,
                     const cimom::AssociationFilter& filter = kNone) {
        const cimom::ObjectPath path = pathOf(object);
        const cimom::AssociationFilter links = {"", filter.assocClass, filter.role, ""};
        return operation == "ei"    ? server.enumInstances({}, path)
               : operation == "ein" ? server.enumInstanceNames({}, path)
               : operation == "gi"  ? server.getInstance({}, path)
               : operation == "a"   ? server.associators({}, path, filter)
               : operation == "an"  ? server.associatorNames({}, path, filter)
               : operation == "r"   ? server.references({}, path, links)
                                    : server.referenceNames({}, path, links);
    }

    static std::shared_ptr<const cimom::ClassRepository> classes() {
        static const auto repository = cimom::ClassRepository::load(
            "t.mof", [](const std::string&) { return kAssociationMof; });
        return repository;
    }

    cimom::Server server;
    cimom::RequestScope scope;

private:
    static cimom::Server& reset(cimom::Server& server) {
        world = std::make_unique<WorldScript>();
        return server;
    }
    std::unique_ptr<Provider> m_provider;
};

/// One operation, what it works on in the World as it comes, and its words in failures.
struct Operation {
    const char* letters;
    const char* object;
    int bit;
    const char* word;
    const char* access;
};

inline constexpr Operation kOperations[] = {
    {"gi", "s1-d1", 1, "getInstance", "getInstance"},
    {"ei", "", 2, "enumerateInstances", "enumerateInstanceNames"},
    {"ein", "", 4, "enumerateInstanceNames", "enumerateInstanceNames"},
    {"a", "s1", 8, "associators", "enumerateInstances"},
    {"an", "s1", 16, "associatorNames", "enumerateInstanceNames"},
    {"r", "s1", 32, "references", "enumerateInstanceNames"},
    {"rn", "s1", 64, "referenceNames", "enumerateInstanceNames"}};

/// A client's request, and what comes of it.
struct RequestCase {
    const char* what;
    const char* operation;
    const char* object;
    cimom::AssociationFilter filter;
    std::string expected;
    CMPIrc rc = CMPI_RC_OK;
};

/// Runs a request in a new World of each character, made by @p configure and looked at by @p check.
template <class Provider>
void expectAnswer(
    const RequestCase& c, const std::function<void()>& configure = [] {},
    const std::function<void()>& check = [] {}) {
    for (const auto character : {cimom::Character::Full, cimom::Character::Lean}) {
        SCOPED_TRACE(c.what + std::string(character == cimom::Character::Full ? "" : ", lean"));
        World<Provider> w(character);
        configure();
        const cimom::Reply reply = w.run(c.operation, c.object, c.filter);
        EXPECT_EQ(c.rc, reply.rc) << reply.message;
        EXPECT_EQ(c.expected, show(reply));
        check();
    }
}

#endif

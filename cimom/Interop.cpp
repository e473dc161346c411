#include "Interop.h"

#include <algorithm>

#include "Broker.h"
#include "Failure.h"
#include "PathText.h"

namespace cimom {

namespace {

constexpr const char* kName = "Interop";
constexpr const char* kManagerClass = "CIM_ObjectManager";
constexpr const char* kNamespaceClass = "CIM_Namespace";
constexpr const char* kProfileClass = "CIM_RegisteredProfile";
constexpr const char* kAnyNamespace = "root/cimv2";
constexpr std::uint16_t kEnabledState = 2;
constexpr std::uint16_t kUnknownClasses = 0;

/// The provider: instances by class, in the terms of the object manager.
class Interop {
public:
    Interop(Server& server, const std::string& version,
            std::shared_ptr<Subscriptions> subscriptions)
        : m_server(server),
          m_version(version),
          m_subscriptions(std::move(subscriptions)),
          m_manager{{"SystemCreationClassName", "CIM_ComputerSystem"},
                    {"SystemName", m_subscriptions->system()},
                    {"CreationClassName", kManagerClass},
                    {"Name", "cimom:" + m_subscriptions->system()}} {}

    Subscriptions& subscriptions() { return *m_subscriptions; }

    std::deque<Instance> instances(const std::string& className) const {
        if (sameName(className, kManagerClass)) {
            return {manager()};
        }
        return sameName(className, kNamespaceClass) ? nameSpaces()
                                                    : m_subscriptions->instances(className);
    }

    Instance instance(const ObjectPath& path) const {
        for (Instance& each : instances(path.className)) {
            if (sameObject(each.path, path)) {
                return std::move(each);
            }
        }
        throw Failure(CMPI_RC_ERR_NOT_FOUND, "no instance " + printPath(path));
    }

    /// The subscriptions in which an object stands in a role, and what stands in the other one.
    /// @param found  takes a subscription, the role and path of the other end
    template <class Found>
    void eachSubscription(const ObjectPath& path, const char* wanted, Found found) const {
        for (const Instance& link : m_subscriptions->instances(kSubscriptionClass)) {
            for (const char* role : {"Filter", "Handler"}) {
                const char* const other = *role == 'F' ? "Handler" : "Filter";
                const bool inRole = !wanted || !*wanted || sameName(role, wanted);
                if (inRole && sameObject(link.properties.find(role)->reference(), path)) {
                    found(link, other, link.properties.find(other)->reference());
                }
            }
        }
    }
    bool isA(const std::string& className, const char* base) const {
        return !base || !*base || m_subscriptions->classes().isA(className, base);
    }

private:
    /// Hosts do not tell objects of one namespace apart.
    static bool sameObject(const ObjectPath& own, const ObjectPath& path) {
        ObjectPath local = path;
        local.host.clear();
        for (const auto& [name, value] : path.keys) {
            if (value.type() == CMPI_ref && !value.isNull()) {
                ObjectPath end = value.reference();
                end.host.clear();
                local.keys.set(name, end);
            }
        }
        return own == local;
    }

    Instance make(const char* className, const NamedValues& keys, const NamedValues& more) const {
        const CimClass* cls = m_subscriptions->classes().findClass(className);
        Instance made(ObjectPath(kInteropNamespace, className, keys), cls->defaults());
        for (const NamedValues& values : {keys, more}) {
            for (const auto& [name, value] : values) {
                made.properties.set(name, value);
            }
        }
        return made;
    }
    Instance manager() const {
        return make(kManagerClass, m_manager,
                    {{"ElementName", "cimom"},
                     {"Description", "CIM object manager cimom version " + m_version},
                     {"Started", true},
                     {"GatherStatisticalData", false},
                     {"EnabledState", kEnabledState}});
    }
    std::deque<Instance> nameSpaces() const {
        std::vector<std::string> names = m_server.namespaces();
        if (!containsName(names, kAnyNamespace) && m_server.hasNamespace(kAnyNamespace)) {
            names.emplace_back(kAnyNamespace);
        }
        std::deque<Instance> all;
        for (const std::string& name : names) {
            all.push_back(make(kNamespaceClass,
                               {{"SystemCreationClassName", m_manager.begin()[0].value},
                                {"SystemName", m_manager.begin()[1].value},
                                {"ObjectManagerCreationClassName", kManagerClass},
                                {"ObjectManagerName", m_manager.begin()[3].value},
                                {"CreationClassName", kNamespaceClass},
                                {"Name", name}},
                               {{"ClassInfo", kUnknownClasses}}));
        }
        return all;
    }

    Server& m_server;
    const std::string m_version;
    const std::shared_ptr<Subscriptions> m_subscriptions;
    const NamedValues m_manager;  ///< keys of the object manager
};

// -- the tables of CMPI ---------------------------------------------------------------------------
// Failures are thrown: it is the broker alone that calls these.

using Context = const CMPIContext*;
using Result = const CMPIResult*;
using Path = const CMPIObjectPath*;

constexpr CMPIStatus kOk = {CMPI_RC_OK, nullptr};
constexpr CMPIStatus kNotSupported = {CMPI_RC_ERR_NOT_SUPPORTED, nullptr};

template <class MI>
Interop& self(MI* mi) {
    return *static_cast<Interop*>(mi->hdl);
}
Reply& replyOf(Result result) { return *bodyOf(result).reply; }

CMPIStatus returned(Result result, std::deque<Instance> instances, bool whole) {
    Reply& reply = replyOf(result);
    for (Instance& each : instances) {
        if (whole) {
            reply.instances.push_back(std::move(each));
        } else {
            reply.paths.push_back(std::move(each.path));
        }
    }
    reply.done = true;
    return kOk;
}

template <class MI>
CMPIStatus cleanup(MI*, Context, CMPIBoolean) {
    return kOk;
}
CMPIStatus enumerateNames(CMPIInstanceMI* mi, Context, Result result, Path path) {
    return returned(result, self(mi).instances(bodyOf(path).className), false);
}
CMPIStatus enumerateInstances(CMPIInstanceMI* mi, Context, Result result, Path path, const char**) {
    return returned(result, self(mi).instances(bodyOf(path).className), true);
}
CMPIStatus getInstance(CMPIInstanceMI* mi, Context, Result result, Path path, const char**) {
    return returned(result, {self(mi).instance(bodyOf(path))}, true);
}
CMPIStatus createInstance(CMPIInstanceMI* mi, Context context, Result result, Path,
                          const CMPIInstance* instance) {
    const Request request = requestOf(bodyOf(context));
    return returned(result,
                    {Instance(self(mi).subscriptions().create(request, bodyOf(instance).value))},
                    false);
}
CMPIStatus modifyInstance(CMPIInstanceMI* mi, Context context, Result, Path path,
                          const CMPIInstance* instance, const char** properties) {
    const Instance given(bodyOf(path), bodyOf(instance).value.properties);
    std::vector<std::string> names;
    if (properties) {
        names = namesIn(properties);
    } else {
        for (const auto& each : given.properties) {
            names.push_back(each.name);
        }
    }
    self(mi).subscriptions().modify(requestOf(bodyOf(context)), given, names);
    return kOk;
}
CMPIStatus deleteInstance(CMPIInstanceMI* mi, Context context, Result, Path path) {
    self(mi).subscriptions().remove(requestOf(bodyOf(context)), bodyOf(path));
    return kOk;
}
CMPIStatus execQuery(CMPIInstanceMI*, Context, Result, Path, const char*, const char*) {
    return kNotSupported;
}

CMPIStatus ends(CMPIAssociationMI* mi, Result result, Path path, const char* association,
                const char* resultClass, const char* role, const char* resultRole, bool whole) {
    std::deque<Instance> found;
    const Interop& own = self(mi);
    if (own.isA(kSubscriptionClass, association)) {
        own.eachSubscription(bodyOf(path), role,
                             [&](const Instance&, const char* otherRole, const ObjectPath& other) {
                                 const bool inRole =
                                     !resultRole || !*resultRole || sameName(otherRole, resultRole);
                                 if (inRole && own.isA(other.className, resultClass)) {
                                     found.push_back(own.instance(other));
                                 }
                             });
    }
    return returned(result, std::move(found), whole);
}
CMPIStatus links(CMPIAssociationMI* mi, Result result, Path path, const char* association,
                 const char* role, bool whole) {
    std::deque<Instance> found;
    if (self(mi).isA(kSubscriptionClass, association)) {
        self(mi).eachSubscription(
            bodyOf(path), role,
            [&](const Instance& link, const char*, const ObjectPath&) { found.push_back(link); });
    }
    return returned(result, std::move(found), whole);
}
CMPIStatus associators(CMPIAssociationMI* mi, Context, Result result, Path path,
                       const char* association, const char* resultClass, const char* role,
                       const char* resultRole, const char**) {
    return ends(mi, result, path, association, resultClass, role, resultRole, true);
}
CMPIStatus associatorNames(CMPIAssociationMI* mi, Context, Result result, Path path,
                           const char* association, const char* resultClass, const char* role,
                           const char* resultRole) {
    return ends(mi, result, path, association, resultClass, role, resultRole, false);
}
CMPIStatus references(CMPIAssociationMI* mi, Context, Result result, Path path,
                      const char* association, const char* role, const char**) {
    return links(mi, result, path, association, role, true);
}
CMPIStatus referenceNames(CMPIAssociationMI* mi, Context, Result result, Path path,
                          const char* association, const char* role) {
    return links(mi, result, path, association, role, false);
}

CMPIInstanceMIFT instanceTable = {CMPIVersion200, CMPIVersion200,     kName,       cleanup,
                                  enumerateNames, enumerateInstances, getInstance, createInstance,
                                  modifyInstance, deleteInstance,     execQuery};
CMPIAssociationMIFT associationTable = {CMPIVersion200, CMPIVersion200, kName,
                                        cleanup,        associators,    associatorNames,
                                        references,     referenceNames};

/// A factory of an interface with a table, which holds the provider.
template <class MI, class Table>
Factory<MI> factoryOf(const std::shared_ptr<Interop>& provider, Table& table) {
    struct Face {
        std::shared_ptr<Interop> provider;
        MI mi;
    };
    const auto face = std::make_shared<Face>(Face{provider, {provider.get(), &table}});
    return [face](const CMPIBroker*, const CMPIContext*, CMPIStatus*) { return &face->mi; };
}

}  // namespace

void serveInterop(Server& server, const std::string& version,
                  std::shared_ptr<Subscriptions> subscriptions) {
    const auto provider = std::make_shared<Interop>(server, version, std::move(subscriptions));
    Factories instances;
    instances.instance = factoryOf<CMPIInstanceMI>(provider, instanceTable);
    server.registerProvider(kName,
                            {kManagerClass, kNamespaceClass, kProfileClass, kFilterClass,
                             kDestinationClass, kSubscriptionClass},
                            instances, {kInteropNamespace});
    Factories associations;
    associations.association = factoryOf<CMPIAssociationMI>(provider, associationTable);
    server.registerProvider(kName, {kSubscriptionClass}, associations, {kInteropNamespace});
}

}  // namespace cimom

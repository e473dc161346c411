#include "Server.h"

#include <algorithm>

#include "PathText.h"
#include "ServerImpl.h"

namespace cimom {

namespace {

/// A null-terminated list of names for a provider; null for "all".
class NameList {
public:
    explicit NameList(const std::optional<std::vector<std::string>>& names) : m_all(!names) {
        if (names) {
            for (const std::string& name : *names) {
                m_pointers.push_back(name.c_str());
            }
        }
        m_pointers.push_back(nullptr);
    }
    const char** get() { return m_all ? nullptr : m_pointers.data(); }

private:
    const bool m_all;
    std::vector<const char*> m_pointers;
};

const char* orNull(const std::string& text) { return text.empty() ? nullptr : text.c_str(); }

CMPIInstance* wrapInstance(Broker& broker, const Instance& instance) {
    return make<CMPIInstance>(broker, instanceBody(broker, instance));
}

}  // namespace

Server::Server(const Options& options) : m_impl(std::make_unique<Impl>(*this, options)) {}

Server::~Server() {
    std::vector<SubscriptionId> open;
    for (const auto& each : m_impl->subscriptions) {
        open.push_back(each.first);
    }
    for (SubscriptionId id : open) {
        unsubscribe({}, id);
    }
    unloadProviders(true);
}

// -- providers --------------------------------------------------------------------------------

std::vector<std::string> Server::unloadProviders(bool terminating) {
    std::vector<std::string> stayed;
    for (Provider& provider : m_impl->providers) {
        Activation activation(m_impl->broker, contextOf({}, m_impl->broker.lean()));
        if (!provider.unload(activation.context(), terminating)) {
            stayed.push_back(provider.name());
        }
    }
    return stayed;
}

bool Server::hasNamespace(const std::string& nameSpace) const {
    const auto& routes = m_impl->routes;
    return routes.empty() || std::any_of(routes.begin(), routes.end(), [&](const auto& route) {
               return route.serves(nameSpace, ~0U);
           });
}

std::vector<std::string> Server::namespaces() const {
    std::vector<std::string> names;
    for (const auto& route : m_impl->routes) {
        for (const std::string& name : route.nameSpaces) {
            if (!containsName(names, name)) {
                names.push_back(name);
            }
        }
    }
    return names;
}

// -- instances --------------------------------------------------------------------------------

namespace {

/// Calls the providers of a class and of those below it, each for its class.
template <class Body>
Reply enumerate(Server::Impl& impl, const Request& request, const ObjectPath& classPath,
                Body body) {
    return answerAt(impl, request, classPath, [&](const ObjectPath& path) {
        Reply reply = impl.callAll<CMPIInstanceMI>(request, impl.targetsBelow(path, kInstance),
                                                   path, true, body);
        impl.select(request, reply);
        return reply;
    });
}

}  // namespace

Reply Server::enumInstances(const Request& request, const ObjectPath& classPath) {
    NameList names(request.properties);
    return enumerate(*m_impl, request, classPath,
                     calling(&CMPIInstanceMIFT::enumerateInstances, names.get()));
}

Reply Server::enumInstanceNames(const Request& request, const ObjectPath& classPath) {
    return enumerate(*m_impl, request, classPath,
                     calling(&CMPIInstanceMIFT::enumerateInstanceNames));
}

// Providers that do not answer queries are enumerated and sifted here.
Reply Server::execQuery(const Request& request, const std::string& query,
                        const std::string& language) {
    return answer([&] {
        const auto parsed = Query::parse(query, language);
        const ObjectPath path(request.nameSpace, parsed->className());
        Request all = request;
        all.properties.reset();
        Reply reply =
            enumerate(*m_impl, all, path,
                      calling(&CMPIInstanceMIFT::execQuery, query.c_str(), language.c_str()));
        if (reply.rc == CMPI_RC_ERR_NOT_SUPPORTED) {
            reply = enumInstances(all, path);
            auto& found = reply.instances;
            const auto fails = [&](const Instance& instance) {
                return !instanceMatches(m_impl->broker, *parsed, instance);
            };
            found.erase(std::remove_if(found.begin(), found.end(), fails), found.end());
        }
        if (!parsed->projection().empty()) {
            all.properties = parsed->projection();
        }
        Impl::keepProperties(all.properties, reply);
        return reply;
    });
}

Reply Server::getInstance(const Request& request, const ObjectPath& path) {
    return answerAt(*m_impl, request, path, [&](const ObjectPath& full) {
        NameList names(request.properties);
        Reply reply = m_impl->callFor<CMPIInstanceMI>(
            request, full, calling(&CMPIInstanceMIFT::getInstance, names.get()));
        if (reply.ok() && reply.instances.empty()) {
            reply.fail(CMPI_RC_ERR_NOT_FOUND,
                       "the provider returned no instance of " + printPath(full));
        }
        m_impl->select(request, reply);
        return reply;
    });
}

Reply Server::createInstance(const Request& request, const Instance& instance) {
    return answerAt(*m_impl, request, instance.path, [&](const ObjectPath& path) {
        const Instance whole = m_impl->filled(Instance(path, instance.properties));
        return m_impl->callFor<CMPIInstanceMI>(
            request, path, [&](CMPIInstanceMI* mi, const Call& call) {
                const CMPIStatus status = calling(&CMPIInstanceMIFT::createInstance,
                                                  wrapInstance(m_impl->broker, whole))(mi, call);
                if (status.rc == CMPI_RC_OK && call.reply.paths.empty()) {
                    throw ProviderFault("no path of the instance that it was to create");
                }
                return status;
            });
    });
}

Reply Server::modifyInstance(const Request& request, const Instance& instance) {
    return answerAt(*m_impl, request, instance.path, [&](const ObjectPath& path) {
        std::optional<std::vector<std::string>> list = request.properties;
        if (!list && !m_impl->broker.lean()) {  // what the client gave, for more is in the instance
            list.emplace();
            for (const auto& each : instance.properties) {
                list->push_back(each.name);
            }
        }
        NameList names(list);
        const Instance whole = m_impl->filled(Instance(path, instance.properties));
        return m_impl->callFor<CMPIInstanceMI>(
            request, path, [&](CMPIInstanceMI* mi, const Call& call) {
                return calling(&CMPIInstanceMIFT::modifyInstance,
                               wrapInstance(m_impl->broker, whole), names.get())(mi, call);
            });
    });
}

Reply Server::deleteInstance(const Request& request, const ObjectPath& path) {
    return answerAt(*m_impl, request, path, [&](const ObjectPath& full) {
        return m_impl->callFor<CMPIInstanceMI>(request, full,
                                               calling(&CMPIInstanceMIFT::deleteInstance));
    });
}

// -- associations -----------------------------------------------------------------------------

namespace {

/// The four operations differ in the class to go by and in what they call, and nothing else.
template <class Entry, class... A>
Reply navigate(Server::Impl& impl, const Request& request, const ObjectPath& path,
               const std::string& association, Entry entry, A... more) {
    return answerAt(impl, request, path, [&](const ObjectPath& full) {
        Reply reply = impl.callAll<CMPIAssociationMI>(
            request, impl.associationTargets(request, full, association), full, false,
            [&](CMPIAssociationMI* mi, const Call& call) {
                return calling(entry, call.className, more...)(mi, call);
            });
        impl.select(request, reply);
        return reply;
    });
}

}  // namespace

Reply Server::associators(const Request& request, const ObjectPath& path,
                          const AssociationFilter& filter) {
    NameList names(request.properties);
    return navigate(*m_impl, request, path, filter.assocClass, &CMPIAssociationMIFT::associators,
                    orNull(filter.resultClass), orNull(filter.role), orNull(filter.resultRole),
                    names.get());
}

Reply Server::associatorNames(const Request& request, const ObjectPath& path,
                              const AssociationFilter& filter) {
    return navigate(*m_impl, request, path, filter.assocClass,
                    &CMPIAssociationMIFT::associatorNames, orNull(filter.resultClass),
                    orNull(filter.role), orNull(filter.resultRole));
}

Reply Server::references(const Request& request, const ObjectPath& path,
                         const AssociationFilter& filter) {
    NameList names(request.properties);
    return navigate(*m_impl, request, path, filter.resultClass, &CMPIAssociationMIFT::references,
                    orNull(filter.role), names.get());
}

Reply Server::referenceNames(const Request& request, const ObjectPath& path,
                             const AssociationFilter& filter) {
    return navigate(*m_impl, request, path, filter.resultClass,
                    &CMPIAssociationMIFT::referenceNames, orNull(filter.role));
}

// -- methods and properties -------------------------------------------------------------------

namespace {

// A value that is an instance or a path came the way of instances and paths.
Reply withValues(Reply reply) {
    for (const Instance& instance : reply.instances) {
        reply.values.emplace_back(instance);
    }
    for (const ObjectPath& path : reply.paths) {
        reply.values.emplace_back(path);
    }
    reply.instances.clear();
    reply.paths.clear();
    return reply;
}

// Arguments as the method declares them, where nothing is lost.
NamedValues typedArguments(const Broker& broker, const ObjectPath& path, const std::string& method,
                           const NamedValues& in) {
    const CimClass* cls = broker.classOf(path);
    const CimMethod* declared = cls ? cls->methods.find(method) : nullptr;
    if (!declared) {
        return in;
    }
    NamedValues typed;
    for (const auto& [name, value] : in) {
        const CimParameter* parameter = declared->parameters.find(name);
        Value converted;
        const bool fits = parameter && value.convertTo(typeOf(*parameter), converted);
        typed.add(name, fits ? converted : value);
    }
    return typed;
}

}  // namespace

Reply Server::invokeMethod(const Request& request, const ObjectPath& path,
                           const std::string& method, const NamedValues& in) {
    return answerAt(*m_impl, request, path, [&](const ObjectPath& full) {
        Broker& broker = m_impl->broker;
        const NamedValues typed = typedArguments(broker, full, method, in);
        return withValues(
            m_impl->callFor<CMPIMethodMI>(request, full, [&](CMPIMethodMI* mi, const Call& call) {
                CMPIArgs* out = make<CMPIArgs>(broker, {});
                const CMPIStatus status =
                    mi->ft->invokeMethod(mi, call.context, call.result, call.path, method.c_str(),
                                         make<CMPIArgs>(broker, typed), out);
                call.reply.out = bodyOf(out);
                return status;
            }));
    });
}

Reply Server::getProperty(const Request& request, const ObjectPath& path, const std::string& name) {
    return answerAt(*m_impl, request, path, [&](const ObjectPath& full) {
        if (m_impl->providerOf(full, kProperty)) {
            return withValues(m_impl->callFor<CMPIPropertyMI>(
                request, full, calling(&CMPIPropertyMIFT::getProperty, name.c_str())));
        }
        Request one = request;
        one.properties = {name};
        Reply reply = getInstance(one, full);
        if (!reply.ok()) {
            return reply;
        }
        const Value* value = reply.instances.front().properties.find(name);
        if (!value) {
            throw Failure(CMPI_RC_ERR_NO_SUCH_PROPERTY, name);
        }
        reply.values.push_back(*value);
        reply.instances.clear();
        return reply;
    });
}

Reply Server::setProperty(const Request& request, const ObjectPath& path, const std::string& name,
                          const Value& value) {
    return answerAt(*m_impl, request, path, [&](const ObjectPath& full) {
        if (m_impl->providerOf(full, kProperty)) {
            return m_impl->callFor<CMPIPropertyMI>(
                request, full, [&](CMPIPropertyMI* mi, const Call& call) {
                    return calling(&CMPIPropertyMIFT::setProperty, name.c_str(),
                                   makeData(m_impl->broker, value))(mi, call);
                });
        }
        Request one = request;
        one.properties = {name};
        return modifyInstance(one, Instance(full, {{name, value}}));
    });
}

// -- the broker -------------------------------------------------------------------------------

CMPIBroker* Server::broker() { return m_impl->broker.face(); }
void Server::setLogHook(std::function<void(const LogLine&)> hook) {
    m_impl->broker.setLogHook(std::move(hook));
}
std::size_t Server::liveObjects() const {
    return static_cast<std::size_t>(m_impl->broker.live().load());
}
std::size_t Server::staleUses() const { return staleUseCount(); }

struct RequestScope::State {
    Broker& broker;
    Activation activation;
};

RequestScope::RequestScope(Server& server, const Request& request)
    : m_state(new State{server.impl().broker,
                        {server.impl().broker, contextOf(request, server.impl().broker.lean())}}) {}
RequestScope::~RequestScope() = default;

CMPIContext* RequestScope::context() const { return m_state->activation.context(); }
CMPIObjectPath* RequestScope::wrap(const ObjectPath& path) const {
    return make<CMPIObjectPath>(m_state->broker, path);
}
CMPIInstance* RequestScope::wrap(const Instance& instance) const {
    return wrapInstance(m_state->broker, instance);
}
CMPIArgs* RequestScope::wrap(const NamedValues& args) const {
    return make<CMPIArgs>(m_state->broker, args);
}
CMPIResult* RequestScope::result(Reply& reply) const {
    return make<CMPIResult>(m_state->broker, {std::shared_ptr<Reply>(&reply, [](Reply*) {})});
}
ObjectPath RequestScope::read(const CMPIObjectPath* path) { return bodyOf(path); }
Instance RequestScope::read(const CMPIInstance* instance) { return bodyOf(instance).value; }
NamedValues RequestScope::read(const CMPIArgs* args) { return bodyOf(args); }

// -- logs and names ---------------------------------------------------------------------------

LogCollector::LogCollector(Server& server) : m_server(server) {
    m_server.setLogHook([this](const LogLine& line) {
        std::lock_guard<std::mutex> lock(m_mutex);
        m_lines.push_back(line);
    });
}
LogCollector::~LogCollector() { m_server.setLogHook(nullptr); }

std::vector<LogLine> LogCollector::lines() const {
    std::lock_guard<std::mutex> lock(m_mutex);
    return m_lines;
}
bool LogCollector::contains(LogLine::Kind kind, int level, const std::string& component,
                            const std::string& text) const {
    std::lock_guard<std::mutex> lock(m_mutex);
    return std::any_of(m_lines.begin(), m_lines.end(), [&](const LogLine& line) {
        return line.kind == kind && line.level == level && line.component == component &&
               line.text.find(text) != std::string::npos;
    });
}

namespace {

struct StatusName {
    int rc;
    const char* name;
};
constexpr StatusName kStatusNames[] = {
    {CMPI_RC_OK, "CIM_OK"},
    {CMPI_RC_ERR_FAILED, "CIM_ERR_FAILED"},
    {CMPI_RC_ERR_ACCESS_DENIED, "CIM_ERR_ACCESS_DENIED"},
    {CMPI_RC_ERR_INVALID_NAMESPACE, "CIM_ERR_INVALID_NAMESPACE"},
    {CMPI_RC_ERR_INVALID_PARAMETER, "CIM_ERR_INVALID_PARAMETER"},
    {CMPI_RC_ERR_INVALID_CLASS, "CIM_ERR_INVALID_CLASS"},
    {CMPI_RC_ERR_NOT_FOUND, "CIM_ERR_NOT_FOUND"},
    {CMPI_RC_ERR_NOT_SUPPORTED, "CIM_ERR_NOT_SUPPORTED"},
    {CMPI_RC_ERR_CLASS_HAS_CHILDREN, "CIM_ERR_CLASS_HAS_CHILDREN"},
    {CMPI_RC_ERR_CLASS_HAS_INSTANCES, "CIM_ERR_CLASS_HAS_INSTANCES"},
    {CMPI_RC_ERR_INVALID_SUPERCLASS, "CIM_ERR_INVALID_SUPERCLASS"},
    {CMPI_RC_ERR_ALREADY_EXISTS, "CIM_ERR_ALREADY_EXISTS"},
    {CMPI_RC_ERR_NO_SUCH_PROPERTY, "CIM_ERR_NO_SUCH_PROPERTY"},
    {CMPI_RC_ERR_TYPE_MISMATCH, "CIM_ERR_TYPE_MISMATCH"},
    {CMPI_RC_ERR_QUERY_LANGUAGE_NOT_SUPPORTED, "CIM_ERR_QUERY_LANGUAGE_NOT_SUPPORTED"},
    {CMPI_RC_ERR_INVALID_QUERY, "CIM_ERR_INVALID_QUERY"},
    {CMPI_RC_ERR_METHOD_NOT_AVAILABLE, "CIM_ERR_METHOD_NOT_AVAILABLE"},
    {CMPI_RC_ERR_METHOD_NOT_FOUND, "CIM_ERR_METHOD_NOT_FOUND"},
    {CMPI_RC_ERR_INVALID_HANDLE, "CIM_ERR_INVALID_HANDLE"},
    {CMPI_RC_ERR_INVALID_DATA_TYPE, "CIM_ERR_INVALID_DATA_TYPE"},
    {CMPI_RC_ERROR_SYSTEM, "CIM_ERROR_SYSTEM"},
    {CMPI_RC_ERROR, "CIM_ERROR"},
};

}  // namespace

const char* statusName(CMPIrc rc) {
    for (const StatusName& row : kStatusNames) {
        if (row.rc == static_cast<int>(rc)) {
            return row.name;
        }
    }
    return "CIM_ERR_UNKNOWN";
}

}  // namespace cimom

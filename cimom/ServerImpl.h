/// The inside of a Server: which providers serve what, and how one of them is called.
#ifndef CIMOM_SERVER_IMPL_H
#define CIMOM_SERVER_IMPL_H

#include <deque>
#include <exception>
#include <list>
#include <map>
#include <unordered_map>

#include "Broker.h"
#include "Provider.h"
#include "Query.h"
#include "Server.h"

namespace cimom {

/// A provider to be called, and the class to call it for.
struct Target {
    Provider* provider;
    std::string className;  ///< none where a client names no association to a lean broker
};

/// What a provider is called with.
struct Call {
    CMPIContext* context;
    CMPIResult* result;
    CMPIObjectPath* path;
    const char* className;  ///< of the target; null when it has none
    Reply& reply;
};

/// What an indication provider is asked about a filter, one call each.
enum class FilterStep { Authorize, MustPoll, Activate, Deactivate };

/// One filter that a client has active.
struct Subscription {
    std::string nameSpace;
    std::shared_ptr<const Query> query;
    Server::IndicationHandler handler;
    std::vector<Target> targets;
    // Held while the handler runs, so that unsubscribing waits for it; the handler itself may
    // unsubscribe.
    std::recursive_mutex mutex;
    bool ended = false;
};

class Server::Impl {
public:
    Impl(Server& server, const Options& options) : broker(server, options) {}

    /// The path in the request's namespace where it has none, and so the paths in its keys; its
    /// keys typed by the class.
    /// @throws Failure CMPI_RC_ERR_INVALID_CLASS, CMPI_RC_ERR_INVALID_PARAMETER
    ObjectPath complete(const Request& request, const ObjectPath& path) const;

    /// The provider of a class, or of the nearest class above it that has one; null for none.
    Provider* providerOf(const ObjectPath& path, Interface bit) const;
    /// The same. @throws Failure CMPI_RC_ERR_NOT_SUPPORTED when there is none
    Target targetOf(const ObjectPath& path, Interface bit) const;
    /// The providers of a class and of those below it.
    /// @throws Failure CMPI_RC_ERR_NOT_SUPPORTED when there is none
    std::vector<Target> targetsBelow(const ObjectPath& classPath, Interface bit) const;
    /// The providers to ask about the associations of an object, through those of a class, or
    /// through all where none is named. Each is called for an association of its own that the
    /// object may stand in. From a lean broker each hears once, whatever it is of, what was named.
    std::vector<Target> associationTargets(const Request& request, const ObjectPath& path,
                                           const std::string& association);

    /// Calls one provider in a request of its own; nothing that goes wrong is thrown.
    /// @param body  takes the interface and a Call, and returns the provider's status
    template <class MI, class Body>
    Reply call(const Request& request, const Target& target, const ObjectPath& path, Body body);
    /// Calls the provider of a path.
    template <class MI, class Body>
    Reply callFor(const Request& request, const ObjectPath& path, Body body) {
        return call<MI>(request, targetOf(path, kindOfInterface<MI>().bit), path, body);
    }
    /// Calls all targets and puts their answers together.
    /// @param perClass  each target is called for its own class instead of the path
    template <class MI, class Body>
    Reply callAll(const Request& request, const std::vector<Target>& targets,
                  const ObjectPath& path, bool perClass, Body body);

    /// A client's instance as a provider gets it: with all properties of its class, those that the
    /// client leaves out with their defaults.
    Instance filled(Instance instance) const;
    /// Drops the properties not asked for, where the broker does that for its providers.
    void select(const Request& request, Reply& reply) const {
        if (!broker.lean()) {
            keepProperties(request.properties, reply);
        }
    }
    static void keepProperties(const std::optional<std::vector<std::string>>& names, Reply& reply);

    // Indications, Indications.cpp.
    void filterStep(const Request& request, const Target& target, FilterStep step,
                    const std::shared_ptr<const Query>& query, bool firstOrLast);
    Reply switchIndications(const Request& request, const Target& target, bool on);
    void activate(const Request& request, Subscription& subscription, const Target& target);
    void deactivate(const Request& request, const Subscription& subscription);
    bool countFilter(const Target& target, int by, bool ofProvider);

    struct Route {
        std::string className;
        std::vector<std::string> nameSpaces;  // empty: all
        unsigned interfaces;
        Provider* provider;

        bool serves(const std::string& nameSpace, unsigned anyOf) const {
            return (interfaces & anyOf) != 0 &&
                   (nameSpaces.empty() || containsName(nameSpaces, nameSpace));
        }
    };
    void addRoute(Route route);

    Broker broker;
    std::list<Provider> providers;
    std::deque<Route> routes;  // in the order of registration
    std::unordered_map<std::string, std::vector<const Route*>, NameHash, NameEqual> routesOf;

    std::mutex subscriptionMutex;
    SubscriptionId nextSubscription = 1;
    std::map<SubscriptionId, std::shared_ptr<Subscription>> subscriptions;
    std::map<std::pair<Provider*, std::string>, int> activeFilters;  // empty class: all of them

private:
    /// Whether an association may hold a class, for all that the broker looks at.
    bool mayHold(const std::string& association, const std::string& className) const;
    Provider* routeOf(const std::string& className, const std::string& nameSpace,
                      Interface bit) const;
};

/// A body that calls an entry of an interface with what all entries take, and these behind it.
template <class Entry, class... A>
auto calling(Entry entry, A... more) {
    return [=](auto* mi, const Call& call) {
        return (mi->ft->*entry)(mi, call.context, call.result, call.path, more...);
    };
}

/// Runs an operation of the facade: a Failure becomes its reply.
template <class F>
Reply answer(F operation) {
    try {
        return operation();
    } catch (const Failure& failure) {
        Reply reply;
        reply.fail(failure.rc(), failure.what());
        return reply;
    }
}

/// The same for one on a path, which is completed first.
template <class F>
Reply answerAt(const Server::Impl& impl, const Request& request, const ObjectPath& path,
               F operation) {
    return answer([&] { return operation(impl.complete(request, path)); });
}

/// What a provider must not return, in words that go on "provider P returned".
class ProviderFault : public Failure {
public:
    explicit ProviderFault(std::string what) : Failure(CMPI_RC_ERR_FAILED, std::move(what)) {}
};
/// No server finds out where an object is that its provider does not place in a namespace.
/// @throws ProviderFault
void refuseUnplaced(const Reply& reply);

template <class MI, class Body>
Reply Server::Impl::call(const Request& request, const Target& target, const ObjectPath& path,
                         Body body) {
    auto reply = std::make_shared<Reply>();
    try {
        Activation activation(broker, contextOf(request, broker.lean()));
        Provider::Use use(*target.provider);
        MI& mi = target.provider->interface<MI>(broker, activation.context());
        const Call parts{activation.context(), make<CMPIResult>(broker, {reply}),
                         make<CMPIObjectPath>(broker, path),
                         target.className.empty() ? nullptr : target.className.c_str(), *reply};
        const CMPIStatus status = body(&mi, parts);
        reply->rc = status.rc;
        if (status.msg) {
            reply->message = bodyOf(status.msg).text;
        }
        if (reply->ok()) {
            refuseUnplaced(*reply);
        }
    } catch (const ProviderFault& fault) {
        reply->instances.clear();
        reply->paths.clear();
        reply->fail(CMPI_RC_ERR_FAILED,
                    "provider " + target.provider->name() + " returned " + fault.what());
    } catch (const Failure& failure) {
        reply->fail(failure.rc(), failure.what());
    } catch (const std::exception& e) {
        reply->fail(CMPI_RC_ERR_FAILED,
                    "provider " + target.provider->name() + " threw: " + e.what());
    } catch (...) {
        if (!std::current_exception()) {
            throw;  // a cancelled thread must end
        }
        reply->fail(CMPI_RC_ERR_FAILED, "provider " + target.provider->name() + " threw");
    }
    return std::move(*reply);
}

/// Puts the elements of one list behind those of another.
template <class List>
void append(List& all, List& more) {
    if (all.empty()) {
        all.swap(more);
    } else {
        std::move(more.begin(), more.end(), std::back_inserter(all));
    }
}

template <class MI, class Body>
Reply Server::Impl::callAll(const Request& request, const std::vector<Target>& targets,
                            const ObjectPath& path, bool perClass, Body body) {
    Reply all;
    all.done = true;
    std::size_t refused = 0;
    for (const Target& target : targets) {
        const ObjectPath own = perClass ? ObjectPath(path.nameSpace, target.className) : path;
        Reply one = call<MI>(request, target, own, body);
        append(all.instances, one.instances);
        append(all.paths, one.paths);
        append(all.values, one.values);
        append(all.errors, one.errors);
        all.done = all.done && one.done;
        // Of several providers, one that does not know the operation does not spoil it, except in
        // a lean broker.
        const bool refuses =
            !broker.lean() && one.rc == CMPI_RC_ERR_NOT_SUPPORTED && ++refused < targets.size();
        if (all.ok() && !one.ok() && !refuses) {
            all.fail(one.rc, one.message);
        }
    }
    return all;
}

}  // namespace cimom

#endif

/// Indication subscriptions as clients make them: filters, destinations of listeners, and the
/// subscriptions that send the indications of a filter to a destination.
///
/// All three are instances, known by their paths. A subscription that is enabled is a filter at the
/// providers, in the name of who made it; what these deliver is exported. What a subscription
/// refers to stays as long as it does. What somebody has made who signed in is changed and deleted
/// by nobody else but root: a subscription works in its maker's name.
///
/// Thread-safety: any number of threads at once. Changes take turns, and a provider may take its
/// time with one; reading waits for none.
#ifndef CIMOM_SUBSCRIPTIONS_H
#define CIMOM_SUBSCRIPTIONS_H

#include <chrono>
#include <deque>
#include <functional>
#include <map>
#include <memory>
#include <mutex>
#include <string>
#include <vector>

#include "IndicationExport.h"
#include "Server.h"
#include "SubscriptionFile.h"

namespace cimom {

constexpr const char* kInteropNamespace = "root/interop";
constexpr const char* kFilterClass = "CIM_IndicationFilter";
constexpr const char* kDestinationClass = "CIM_ListenerDestinationCIMXML";
constexpr const char* kSubscriptionClass = "CIM_IndicationSubscription";

class Subscriptions {
public:
    using Log = std::function<void(const std::string& line)>;

    /// @param server   outlives this, as do @p classes
    /// @param classes  have those of interopMof(); null when none are known
    /// @param system   name of this system, for instances whose client names none
    /// @param state    see SubscriptionFile
    /// @throws std::runtime_error when the state cannot be used
    Subscriptions(Server& server, const ClassRepository* classes, std::string system,
                  const std::string& state, std::shared_ptr<IndicationExport> exports, Log log);

    /// Those given, or those of interopMof() alone.
    const ClassRepository& classes() const { return *m_classes; }
    const std::string& system() const { return m_system; }

    /// Those of one of the three classes.
    std::deque<Instance> instances(const std::string& className) const;
    /// @return the path
    /// @throws Failure CMPI_RC_ERR_INVALID_PARAMETER, CMPI_RC_ERR_INVALID_QUERY,
    ///         CMPI_RC_ERR_QUERY_LANGUAGE_NOT_SUPPORTED for what cannot be,
    ///         CMPI_RC_ERR_ALREADY_EXISTS, CMPI_RC_ERR_FAILED beyond the limit, or as a provider
    ///         refuses the filter
    ObjectPath create(const Request& request, const Instance& wanted);
    /// Changes properties; keys, and what is known here alone, stay.
    /// @throws Failure as create, and CMPI_RC_ERR_NOT_FOUND, CMPI_RC_ERR_ACCESS_DENIED
    void modify(const Request& request, const Instance& wanted,
                const std::vector<std::string>& properties);
    /// @throws Failure CMPI_RC_ERR_NOT_FOUND, CMPI_RC_ERR_ACCESS_DENIED, CMPI_RC_ERR_FAILED when it
    ///         is in use
    void remove(const Request& request, const ObjectPath& path);

    /// Begins what was enabled when the state was left. What a provider refuses stays, is logged,
    /// and tried again by watch().
    void start();
    /// Ends subscriptions whose time is over or whose listener has failed them, as they ask for;
    /// to be called about once a second.
    void watch();
    /// Takes all filters from the providers, for the end of the process.
    void stop();

private:
    struct Record {
        Instance instance;
        std::string owner;
        std::vector<Server::SubscriptionId> active;  // of a subscription that is enabled
        std::chrono::steady_clock::time_point nextAttempt{};
        bool failing = false;
    };
    using Records = std::map<std::string, Record>;

    using Active = std::vector<Server::SubscriptionId>;

    void load();
    ObjectPath canonical(const ObjectPath& path) const;
    std::string idOf(const ObjectPath& path) const;
    const CimClass& madeByClients(const ObjectPath& path) const;
    Records::iterator changeable(const Request& request, const ObjectPath& path);
    std::string referred(const Instance& subscription, const char* role) const;
    std::vector<std::string> subscriptionsOn(const std::string& id) const;
    std::string labelOf(const Instance& subscription) const;

    Instance typed(const Instance& wanted) const;
    void check(Instance& instance) const;
    void checkFilter(const Instance& filter) const;
    void checkSubscription(Instance& subscription) const;

    Active activated(const std::string& id, const Record& subscription, const Instance& filter);
    void deactivate(const Active& active);
    void keep(const std::string& id, const Record& record);
    void erase(Records::iterator at);
    void change(Records::iterator at, Instance changed);
    void switchOver(std::map<std::string, Active>& fresh);
    void tend(Records::iterator at);
    void revive(Records::iterator at);
    void applyPolicy(const std::string& id);

    Server& m_server;
    const std::shared_ptr<const ClassRepository> m_ownClasses;  // where none are given
    const ClassRepository* const m_classes;
    const bool m_knowsClasses;
    const std::string m_system;
    const std::shared_ptr<IndicationExport> m_exports;
    const Log m_log;

    std::mutex m_changes;  // held by whoever changes something, for as long as that takes
    SubscriptionFile m_file;
    mutable std::mutex
        m_mutex;  // of the records: to read them, and to write by who holds the other
    Records m_records;
};

}  // namespace cimom

#endif

/// A CIM object manager inside this process: providers, and the operations that reach them.
///
/// A Server loads or is given CMPI providers, serves CIM operations with them, and is the broker
/// through which providers reach one another. Example:
///
///     cimom::Server server({cimom::Character::Full});
///     server.loadRegistration("providers.json");
///     cimom::Request request;
///     request.user = "admin";
///     cimom::Reply reply = server.enumInstances(request, {"root/cimv2", "ORXC_Host"});
///     if (reply.rc != CMPI_RC_OK) std::cerr << reply.message;
///
/// Ownership: requests, paths and replies are plain values. CMPI objects that a provider makes
/// belong to the request during which they were made and end with it; clones live until released.
///
/// Thread-safety: after the registrations, all operations may be called from any number of
/// threads at a time, also from inside providers. The destructor unloads the providers and must
/// run alone.
#ifndef CIMOM_SERVER_H
#define CIMOM_SERVER_H

#include <deque>
#include <functional>
#include <memory>
#include <mutex>
#include <optional>
#include <string>
#include <vector>

#include "ClassRepository.h"
#include "Value.h"
#include "cmpidt.h"
#include "cmpift.h"

namespace cimom {

/// How the broker behaves where brokers in the field differ, which is where providers fail that
/// have met only one of them.
///
/// In both, new instances have their class's defaults (in lean ones null in all other properties),
/// and instances that a client gives to create or modify have all properties, with their defaults
/// or null. Neither mends what a provider returns: a path without a namespace, anywhere in it, is
/// told to the client as the provider's fault.
enum class Character {
    /// As OpenPegasus where that is unkind, else by the standard: complete function tables of
    /// version 2.0; property names and types are checked when the class is known. The elements of
    /// an enumeration have the state of a null. Arrays of CMPI_chars stay what they are, and take
    /// no strings. Where a client names no association, each provider hears of its own classes.
    /// A modify without a property list gets the list of what the client gave.
    Full,
    /// As sfcb, and other small servers in the field.
    /// - Function tables report version 1 or 0 and end early (the remaining entries are null, also
    ///   that by which a context takes further entries); there are no message files and no
    ///   CMPIError; logMessage, trace, getMessage, the clone of a context and the text of anything
    ///   but a path or an instance answer CMPI_RC_ERR_NOT_SUPPORTED.
    /// - Unknown property names, keys and properties of another type and names that stand twice
    ///   are taken.
    /// - What is not there has the state CMPI_notFound and not that of a null; for a property that
    ///   is CMPI_RC_ERR_NOT_FOUND; a position behind the end of an array or enumeration is no
    ///   failure, but a bad value.
    /// - Arrays of CMPI_chars are arrays of strings. A string of no text has none.
    /// - setPropertyFilter drops the keys that its list of keys lacks, also from the path. A client
    ///   gets what the provider returned, properties not asked for among it.
    /// - A path cannot be returned by returnData.
    /// - Associations: providers of all are asked, also of those that cannot hold the object, and
    ///   hear of the class that the client named, be it a base of theirs, or of none. What one of
    ///   several providers refuses fails for all.
    /// - Indication providers are asked whether to poll, and nobody cares for the answer.
    /// - Without a user the principal is a string whose text is null.
    Lean,
};

struct Options {
    Character character = Character::Full;
    /// Folder of the translated texts, see Messages.h; empty for none.
    std::string messageFolder;
    /// Where to look for provider libraries, after the folder of the registration file.
    std::vector<std::string> libraryFolders;
    /// The classes; null when nothing is known of them: then every class and property is taken as
    /// it comes. With them the broker checks names and types, keys are known, enumerations
    /// include subclasses, and classes have qualifiers. They hold in every namespace.
    std::shared_ptr<const ClassRepository> classes;
};

/// Who asks, how, and where. Operations on a path without a namespace use the request's.
struct Request {
    std::optional<std::string> user;
    /// As in an Accept-Language header, "de-DE;q=0.8,fr"; empty for none.
    std::string language;
    std::string nameSpace = "root/cimv2";
    CMPIFlags flags = 0;
    /// Properties wanted of instances; none for all, an empty list for no property.
    std::optional<std::vector<std::string>> properties;
    /// Further context entries for the provider.
    NamedValues context;
};

/// What came of one operation. Where several providers answer, the results of all are here and
/// rc and message are those of the first failure.
struct Reply {
    CMPIrc rc = CMPI_RC_OK;
    std::string message;
    std::deque<Instance> instances;  ///< not a vector: they need not move as they come
    std::deque<ObjectPath> paths;
    /// Values returned by returnData: a property, the return value of a method.
    std::vector<Value> values;
    /// Arguments that a method gave back.
    NamedValues out;
    /// CMPIError objects returned, as their fields (names: ErrorEntries.cpp).
    std::vector<NamedValues> errors;
    /// Whether each provider that was called called returnDone.
    bool done = false;

    bool ok() const { return rc == CMPI_RC_OK; }
    void fail(CMPIrc code, std::string text) {
        rc = code;
        message = std::move(text);
    }
    /// The first value, or a null.
    Value value() const { return values.empty() ? Value() : values.front(); }
};

/// Filters of association operations; empty means unrestricted and reaches providers as null.
struct AssociationFilter {
    std::string assocClass;  ///< associators only; for references the class is resultClass
    std::string resultClass;
    std::string role;
    std::string resultRole;  ///< associators only
};

/// The kinds of provider interfaces, as bits.
enum Interface : unsigned {
    kInstance = 1,
    kAssociation = 2,
    kMethod = 4,
    kIndication = 8,
    kProperty = 16,
};

/// Factories of a provider linked into the process; null for interfaces that it does not have.
/// What they hold lives as long as the server.
template <class MI>
using Factory = std::function<MI*(const CMPIBroker*, const CMPIContext*, CMPIStatus*)>;
struct Factories {
    Factory<CMPIInstanceMI> instance = nullptr;
    Factory<CMPIAssociationMI> association = nullptr;
    Factory<CMPIMethodMI> method = nullptr;
    Factory<CMPIIndicationMI> indication = nullptr;
    Factory<CMPIPropertyMI> property = nullptr;
};

/// One line that a provider wrote through the broker's trace or logMessage.
struct LogLine {
    enum class Kind { Trace, Message };
    Kind kind;
    int level;  ///< level of the trace, severity of the message
    std::string component;
    std::string text;
};

/// One indication on its way to a subscriber.
struct Indication {
    std::string nameSpace;
    Instance instance;
};

class Server {
public:
    explicit Server(const Options& options = {});
    /// Ends all subscriptions, cleans up and unloads the providers, and frees what they left.
    ~Server();
    Server(const Server&) = delete;
    Server& operator=(const Server&) = delete;

    // -- providers ------------------------------------------------------------------------

    /// Reads a registration file (form: Provider.h) and adds its providers. Libraries are
    /// loaded when first needed.
    /// @throws std::runtime_error with the file and the reason; nothing is added then
    void loadRegistration(const std::string& file);
    /// Adds a provider of this process that serves @p classes by the interfaces for which it has
    /// factories, in all namespaces unless @p nameSpaces are given.
    void registerProvider(const std::string& name, const std::vector<std::string>& classes,
                          const Factories& factories,
                          const std::vector<std::string>& nameSpaces = {});
    /// Calls every interface's cleanup and unloads the libraries of the providers, except those
    /// in use and, unless @p terminating, those that ask to stay. They load again when needed.
    /// @return names of the providers that stayed
    std::vector<std::string> unloadProviders(bool terminating);

    /// Whether a provider serves anything in that namespace. Without providers all are the same.
    bool hasNamespace(const std::string& nameSpace) const;
    /// The namespaces in which providers serve, without those that serve in all of them.
    std::vector<std::string> namespaces() const;

    // -- operations -----------------------------------------------------------------------
    // Failures come back in the reply: CMPI_RC_ERR_NOT_SUPPORTED when no provider serves the
    // class, CMPI_RC_ERR_INVALID_CLASS when the classes are known and it is not among them,
    // CMPI_RC_ERR_FAILED when a provider cannot be loaded or threw, and whatever the provider
    // answered.

    /// When the classes are known, instances of subclasses are included.
    Reply enumInstances(const Request& request, const ObjectPath& classPath);
    Reply enumInstanceNames(const Request& request, const ObjectPath& classPath);
    Reply getInstance(const Request& request, const ObjectPath& path);
    Reply createInstance(const Request& request, const Instance& instance);
    /// The request's properties are those to change; none for all.
    Reply modifyInstance(const Request& request, const Instance& instance);
    Reply deleteInstance(const Request& request, const ObjectPath& path);
    Reply execQuery(const Request& request, const std::string& query,
                    const std::string& language = "WQL");

    Reply associators(const Request& request, const ObjectPath& path,
                      const AssociationFilter& filter = {});
    Reply associatorNames(const Request& request, const ObjectPath& path,
                          const AssociationFilter& filter = {});
    Reply references(const Request& request, const ObjectPath& path,
                     const AssociationFilter& filter = {});
    Reply referenceNames(const Request& request, const ObjectPath& path,
                         const AssociationFilter& filter = {});

    Reply invokeMethod(const Request& request, const ObjectPath& path, const std::string& method,
                       const NamedValues& in = {});

    /// By a property provider, or by way of the instance where the class has none.
    Reply getProperty(const Request& request, const ObjectPath& path, const std::string& name);
    Reply setProperty(const Request& request, const ObjectPath& path, const std::string& name,
                      const Value& value);

    // -- indications ----------------------------------------------------------------------

    using SubscriptionId = std::uint64_t;
    using IndicationHandler = std::function<void(const Indication&)>;

    /// Authorizes and activates a filter at the providers of its class, enables their indications
    /// with the first filter, and hands each indication that matches to @p handler, on the
    /// delivering thread, with the properties that the query selects. @p id receives the
    /// subscription unless the reply is a failure.
    Reply subscribe(const Request& request, const std::string& query, const std::string& language,
                    IndicationHandler handler, SubscriptionId& id);
    /// Deactivates the filter and, with the last one of a provider, disables its indications.
    /// No handler runs any more when it returns, except one that called it.
    Reply unsubscribe(const Request& request, SubscriptionId id);
    /// Hands an indication to the subscribers, as a provider does through the broker.
    Reply deliver(const Request& request, const Instance& indication);

    // -- the broker -----------------------------------------------------------------------

    CMPIBroker* broker();
    /// Called for each line of trace or log, on the provider's thread; null for none.
    void setLogHook(std::function<void(const LogLine&)> hook);
    /// CMPI objects now alive in this server, of requests and clones.
    std::size_t liveObjects() const;
    /// Uses of objects that had been released, double releases among them, since the start.
    std::size_t staleUses() const;

    class Impl;
    Impl& impl() { return *m_impl; }

private:
    std::unique_ptr<Impl> m_impl;
};

/// A request opened by hand on this thread, so that CMPI functions can be called directly.
/// Objects made meanwhile end with the scope. Scopes nest.
class RequestScope {
public:
    explicit RequestScope(Server& server, const Request& request = {});
    ~RequestScope();
    RequestScope(const RequestScope&) = delete;
    RequestScope& operator=(const RequestScope&) = delete;

    CMPIContext* context() const;

    /// C objects of the scope with the given content.
    CMPIObjectPath* wrap(const ObjectPath& path) const;
    CMPIInstance* wrap(const Instance& instance) const;
    CMPIArgs* wrap(const NamedValues& args) const;
    /// A result that collects into @p reply, which must outlive it.
    CMPIResult* result(Reply& reply) const;
    /// The content of C objects of this server.
    static ObjectPath read(const CMPIObjectPath* path);
    static Instance read(const CMPIInstance* instance);
    static NamedValues read(const CMPIArgs* args);

private:
    struct State;
    std::unique_ptr<State> m_state;
};

/// Keeps the log lines of a server while it lives.
class LogCollector {
public:
    explicit LogCollector(Server& server);
    ~LogCollector();
    LogCollector(const LogCollector&) = delete;
    LogCollector& operator=(const LogCollector&) = delete;

    std::vector<LogLine> lines() const;
    /// Whether a line has the level and component and contains the text.
    bool contains(LogLine::Kind kind, int level, const std::string& component,
                  const std::string& text) const;

private:
    Server& m_server;
    mutable std::mutex m_mutex;
    std::vector<LogLine> m_lines;
};

/// "CIM_ERR_NOT_FOUND" and the like; "CIM_ERR_UNKNOWN" for other numbers.
const char* statusName(CMPIrc rc);

}  // namespace cimom

#endif

/// The broker of one server: its CMPI function tables, what they need to answer, and the
/// requests that run on each thread.
///
/// Thread-safety: all of it may be used from any thread.
#ifndef CIMOM_BROKER_H
#define CIMOM_BROKER_H

#include <atomic>
#include <functional>
#include <memory>
#include <mutex>
#include <string>
#include <unordered_set>

#include "ClassRepository.h"
#include "Messages.h"
#include "Objects.h"
#include "Server.h"

namespace cimom {

class Broker {
public:
    Broker(Server& server, const Options& options);
    ~Broker();
    Broker(const Broker&) = delete;
    Broker& operator=(const Broker&) = delete;

    /// @throws Failure CMPI_RC_ERR_INVALID_HANDLE unless it is a broker of this program
    static Broker& of(const CMPIBroker* face);
    CMPIBroker* face() { return &m_face; }

    Server& server() { return m_server; }
    bool lean() const { return m_options.character == Character::Lean; }
    const Options& options() const { return m_options; }
    /// Null when nothing is known of classes.
    const ClassRepository* classes() const { return m_options.classes.get(); }
    /// Null also when the class is not among them.
    const CimClass* classOf(const ObjectPath& path) const;
    MessageStore& messages() { return m_messages; }

    void setLogHook(std::function<void(const LogLine&)> hook);
    void log(const LogLine& line);

    /// Blocks from the broker's memory functions; those not freed end with the broker.
    void* allocate(void* old, std::size_t size, bool zeroed);
    void freeBlock(void* block);

    Pool& strays() { return m_strays; }
    ObjectTables& tables() { return m_tables; }
    std::atomic<std::ptrdiff_t>& live() { return m_live; }

private:
    Server& m_server;
    const Options m_options;
    CMPIBroker m_face{};
    CMPIBrokerFT m_operations{};
    CMPIBrokerEncFT m_encapsulation{};
    CMPIBrokerExtFT m_extension{};
    CMPIBrokerMemFT m_memory{};
    ObjectTables m_tables;
    MessageStore m_messages;

    std::mutex m_hookMutex;
    std::function<void(const LogLine&)> m_hook;
    std::mutex m_blocksMutex;
    std::unordered_set<void*> m_blocks;
    std::atomic<std::ptrdiff_t> m_live{0};
    Pool m_strays;  // last: its objects need the rest when they go
};

/// A request that runs on this thread, from construction to destruction. What providers make
/// meanwhile belongs to it. Activations of a thread nest, as upcalls do.
class Activation {
public:
    Activation(Broker& broker, const NamedValues& contextEntries);
    ~Activation();
    Activation(const Activation&) = delete;
    Activation& operator=(const Activation&) = delete;

    /// The innermost one of this thread for the broker; null outside requests.
    static Activation* current(const Broker& broker);

    CMPIContext* context() { return m_context; }
    Pool& pool() { return m_pool; }

private:
    Activation* const m_outer;
    Pool m_pool;
    CMPIContext* const m_context;
};

/// The context entries that stand for a request, and the request that an upcall's context
/// stands for.
NamedValues contextOf(const Request& request, bool lean);
Request requestOf(const NamedValues& contextEntries);

// -- entries on the broker -----------------------------------------------------------------------

/// Runs the body of an entry with the broker behind @p mb.
template <class F>
auto brokerEntry(const CMPIBroker* mb, CMPIStatus* rc, F body) {
    Broker* broker = mb ? static_cast<Broker*>(mb->hdl) : nullptr;
    return entry(rc, broker, [&] { return body(Broker::of(mb)); });
}
template <class F>
CMPIStatus brokerStatus(const CMPIBroker* mb, F body) {
    CMPIStatus status{CMPI_RC_OK, nullptr};
    brokerEntry(mb, &status, body);
    return status;
}
template <auto Body, class R, class... A>
struct EntryPoint<const CMPIBroker, Body, R (*)(Broker&, A...)> {
    static R run(const CMPIBroker* mb, A... arguments, CMPIStatus* rc) {
        return brokerEntry(mb, rc, [&](Broker& broker) { return Body(broker, arguments...); });
    }
};
template <auto Body, class... A>
struct EntryPoint<const CMPIBroker, Body, void (*)(Broker&, A...)> {
    static CMPIStatus run(const CMPIBroker* mb, A... arguments) {
        return brokerStatus(mb, [&](Broker& broker) { Body(broker, arguments...); });
    }
};

// -- the function tables, by source --------------------------------------------------------------

/// Cuts a table short behind @p last, as small brokers have it.
template <class T, class M>
void endTableAfter(T& table, M T::*last) {
    char* const begin = reinterpret_cast<char*>(&table);
    char* const end = reinterpret_cast<char*>(&(table.*last)) + sizeof(M);
    std::fill(end, begin + sizeof(T), '\0');
}

/// A table with its version; small brokers have another one and end behind @p leanEnd.
template <class T, class M, class... Entries>
T brokerTable(bool lean, int leanVersion, M T::*leanEnd, Entries... entries) {
    T table = {lean ? leanVersion : CMPIVersion200, entries...};
    if (lean) {
        endTableAfter(table, leanEnd);
    }
    return table;
}

CMPIBrokerFT operationTable(bool lean);         // BrokerOperations.cpp
CMPIBrokerEncFT encapsulationTable(bool lean);  // BrokerEncapsulation.cpp
CMPIBrokerExtFT extensionTable(bool lean);      // BrokerServices.cpp
CMPIBrokerMemFT memoryTable(bool lean);         // BrokerServices.cpp
void fillObjectTables(ObjectTables& tables);    // ObjectEntries.cpp
void fillInstanceTables(ObjectTables& tables);  // InstanceEntries.cpp
void fillQueryTables(ObjectTables& tables);     // QueryEntries.cpp
void fillErrorTable(ObjectTables& tables);      // ErrorEntries.cpp

// -- instances by the rules of their class, InstanceEntries.cpp
// ------------------------------------

/// A new instance of the class of @p path with its keys and the defaults of other properties, for
/// lean brokers with all that have none null.
/// @throws Failure CMPI_RC_ERR_NOT_FOUND for a class that is not known
InstanceBody newInstanceOf(Broker& broker, const ObjectPath& path);
/// Sets a property as a provider does: checked against the class when it is known.
/// @throws Failure CMPI_RC_ERR_NO_SUCH_PROPERTY, CMPI_RC_ERR_TYPE_MISMATCH
void setInstanceProperty(Broker& broker, InstanceBody& body, std::string_view name, Value&& value);

/// The names of a null-terminated list.
std::vector<std::string> namesIn(const char** names);
/// Whether an instance is of the query's class, or one below it, and meets its condition.
bool instanceMatches(Broker& broker, const Query& query, const Instance& instance);
/// The fields of a new CMPIError.
NamedValues newErrorFields(const char* owner, const char* messageId, const char* message,
                           CMPIErrorSeverity severity, CMPIErrorProbableCause cause, CMPIrc rc);

}  // namespace cimom

#endif

/// The appliance's state: all its objects, in the file appliance.db in the folder that the
/// environment variable APPLIANCE_HOME names.
///
/// Any number of processes may use it at once. Each opens its own Store and does everything inside
/// one transaction; a Store belongs to one thread.
///
///     Store store = Store::open(Database::Access::Write);
///     Transaction change = store.write();
///     Object host = store.all(Kind::Host).front();
///     host.set("state", "Standby");
///     store.put(host);
///     change.commit();
#ifndef APPLIANCE_STORE_H
#define APPLIANCE_STORE_H

#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "Database.h"
#include "Object.h"

namespace appliance {

class Store {
public:
    /// @param access  Read or Write
    /// @throws Failure NoHome, NoState, StateVersion, StateUnusable
    static Store open(Database::Access access);

    /// Opens the state to be filled anew, and makes folder and file where they are missing. What
    /// is there stays until a transaction with clear() is committed.
    /// @throws Failure NoHome, StateUnusable
    static Store create();

    Transaction read() { return {*m_database, Transaction::Purpose::Read}; }
    Transaction write() { return {*m_database, Transaction::Purpose::Write}; }

    /// Removes every object, and what another version of this program may have left.
    /// @throws Failure StateExists there is an appliance and @p force is false
    void clear(bool force);

    /// Adds @p object, or replaces the one in its place.
    void put(const Object& object);
    /// Removes the object in this place, if there is one.
    void remove(Kind kind, const Place& place);

    /// The object in this place, if there is one.
    std::optional<Object> find(Kind kind, const Place& place);

    /// Adds @p line to the journal of changes, which keeps the order of the transactions.
    void append(const std::string& line);
    /// The lines that were added after the one with the number @p after, each with its number;
    /// numbers start from 1 and are never used again. At most @p most lines.
    std::vector<std::pair<std::int64_t, std::string>> journal(std::int64_t after,
                                                              std::int64_t most);
    /// The number of the last line; 0 when there is none.
    std::int64_t journalEnd();

    /// All objects of @p kind, by host, partition and number.
    std::vector<Object> all(Kind kind);
    /// Those of one host, by partition and number.
    std::vector<Object> all(Kind kind, std::int64_t host);

private:
    explicit Store(std::unique_ptr<Database> database);
    std::int64_t version();

    // Behind pointers, so that a Store can be moved while statements refer to its database.
    std::unique_ptr<Database> m_database;
    std::unique_ptr<Statement> m_put;
};

}  // namespace appliance

#endif

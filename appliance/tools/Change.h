/// One change of the appliance's state: a transaction with a line in the journal.
///
/// What is put and removed is seen at once by the change itself, and by others when it is
/// committed. Before that, the rules that every appliance obeys (Check.h) are applied to the hosts
/// that were touched: a change that would break one is refused, and nothing of it remains. The
/// journal's line (Json.h) tells of each object that differs afterwards.
///
///     Change change(request);
///     Object lpar = change.lpar();
///     lpar.set("name", "www");
///     change.put(lpar);
///     change.commit();
#ifndef APPLIANCE_CHANGE_H
#define APPLIANCE_CHANGE_H

#include <map>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "Json.h"
#include "Request.h"
#include "View.h"

namespace appliance {

class Change {
public:
    /// Of the host that -m names. Starts when host() or lpar() is first called, so that what is
    /// wrong with the command line alone can be judged before, and then waits until no other change
    /// is under way.
    explicit Change(const Request& request) : m_request(request) {}

    const Request& request() const { return m_request; }

    /// The host that -m names, as it stands now. A view of a host, and what it gives, holds until
    /// something of that host is put or removed.
    /// @throws Failure MissingOption, HostNotFound, and those of Store::open
    const HostView& host();
    /// The partition that --id names.
    /// @throws Failure those of host(); MissingOption, BadOptionValue, LparIdNotFound
    Object lpar();

    // What follows is for a change that has started.

    /// Another host, by its name or type and serial number.
    /// @throws Failure HostNotFound
    const HostView& host(const std::string& name);

    /// Whether a host is called so, or has this type and serial number.
    bool isHost(const std::string& name);

    /// Adds @p object, or replaces the one in its place.
    void put(const Object& object);
    void remove(const Object& object);

    /// Puts the object @p name with these values into the journal's line, for what those who follow
    /// the journal would otherwise have to look up.
    void note(const char* name, std::vector<std::pair<const char*, std::string>> values);

    /// Judges what was changed so far; a change that ends without commit() changes nothing.
    /// @throws Failure Unsound the change breaks a rule
    void verify();

    /// Ends the change; nothing can be asked of it any more.
    /// @throws Failure Unsound as verify(); StateUnusable, with nothing changed
    void commit();

private:
    const HostView& view(std::int64_t host);
    std::int64_t numberOf(const std::string& name);
    /// Keeps what is in the place of @p object before its first change.
    void keep(const Object& object);
    std::string journalLine();

    struct Session {
        Store store = Store::open(Database::Access::Write);
        Transaction transaction = store.write();
        std::map<std::int64_t, std::unique_ptr<HostView>> views = {};
    };

    const Request& m_request;
    std::unique_ptr<Session> m_session;  ///< while the change is under way
    std::int64_t m_host = 0;
    std::map<std::pair<Kind, Place>, std::optional<Object>> m_before;
    JournalNotes m_notes;
};

/// @param states  with commas between them
/// @throws Failure HostState the host is in none of them
void requireState(const HostView& host, const char* states);
/// @throws Failure HostState what the appliance knows of the host may be out of date
void requireConnection(const HostView& host);

/// @throws Failure LparState
void requireState(const Object& lpar, const char* states);

/// @throws Failure LparMoving the partition is on its way to another host, or from there
void requireStill(const Object& lpar);

}  // namespace appliance

#endif

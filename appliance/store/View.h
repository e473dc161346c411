/// The objects as the tools and the management library see them: hosts with what belongs to them,
/// and the values of attributes, stored or not.
///
/// What follows from other objects is never stored: what is free on a host, who is in a pool, the
/// names of remote partitions are worked out when asked for, so that they cannot disagree with
/// what they follow from. The tables of Values.cpp say which attributes are such, and how.
#ifndef APPLIANCE_VIEW_H
#define APPLIANCE_VIEW_H

#include <ctime>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "Object.h"
#include "Store.h"

namespace appliance {

/// Consecutive objects of a view.
struct Objects {
    const Object* first;
    const Object* last;  ///< behind the last one

    const Object* begin() const { return first; }
    const Object* end() const { return last; }
    bool empty() const { return first == last; }
};

/// One host with what belongs to it. Each kind of object is loaded once, when first asked for, so
/// all of it is one picture when the store's read transaction is. Belongs to one thread.
class HostView {
public:
    HostView(Store& store, Object host) : m_store(store), m_host(std::move(host)) {}

    const Object& host() const { return m_host; }
    /// The host's key: "<type_model>*<serial_num>".
    std::string mtms() const;
    /// What memory comes in multiples of, in megabytes; at least 1, whatever is stored.
    std::int64_t memRegion() const;
    /// By partition and number; valid as long as the view.
    const std::vector<Object>& all(Kind kind) const;
    /// Those of one partition.
    Objects all(Kind kind, std::int64_t lpar) const;
    /// The first whose attribute has this value; null when there is none.
    const Object* find(Kind kind, const char* attribute, const std::string& value) const;
    /// Null when the host has no such partition, or the partition no such profile.
    const Object* lpar(std::int64_t id) const;
    const Object* profile(std::int64_t lpar, const std::string& name) const;
    /// The name of that partition, or the empty text. @p id is an attribute's value, which may be
    /// a word such as "any".
    std::string lparName(const std::string& id) const;

    /// A partition of the host with the name @p host, which may be another.
    std::optional<Object> lparElsewhere(const std::string& host, std::int64_t id) const;

private:
    Store& m_store;
    Object m_host;
    mutable std::map<Kind, std::vector<Object>> m_objects;
};

using Hosts = std::vector<std::unique_ptr<HostView>>;

/// Every host of @p store, in its order.
Hosts allHosts(Store& store);

/// The hosts that are called @p name, or that have this type and serial number with @p joint
/// between them; every host when it is empty.
/// @throws Failure HostNotFound
Hosts hostsNamed(Store& store, const std::string& name, char joint);

/// What one record is about. The pointers are borrowed from the view.
struct Row {
    const HostView* view = nullptr;
    const Object* self = nullptr;
    const Object* lpar = nullptr;  ///< the partition that self belongs to or is; may be null
    std::time_t time = 0;          ///< of a utilisation sample
    std::int64_t maxMem = 0;       ///< megabytes, for the memory that a partition would need
};

/// The row for an object of @p view.
Row rowOf(const HostView& view, const Object& object);

/// The value of the attribute @p name of the row's object: a derived one, or one of the object's
/// own.
/// @throws std::logic_error there is no such attribute
std::string valueOf(const Row& row, const std::string& name);

}  // namespace appliance

#endif

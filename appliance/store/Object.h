/// The one form in which the appliance keeps everything that it knows: objects with attributes.
///
/// An object is of a kind, belongs to a host and mostly to one of its partitions, and has a number
/// among its like. Its attributes are texts under the names by which the tools print them. The
/// table of a kind (Object.cpp) names the attributes that it has, with the value of each that was
/// never set; only what was set is stored. Plain values without locking.
#ifndef APPLIANCE_OBJECT_H
#define APPLIANCE_OBJECT_H

#include <cstdint>
#include <string>
#include <string_view>
#include <tuple>
#include <vector>

namespace appliance {

enum class Kind {
    Host,
    Link,      ///< connection to a service processor of a host
    Unit,      ///< I/O unit of a host
    Bus,       ///< I/O bus in a unit
    Slot,      ///< physical I/O slot on a bus; its partition is 0 while it is free
    ProcPool,  ///< shared processor pool; number 0 is the one that every host has
    MemPool,   ///< shared memory pool; a host has one or none
    HslPool,   ///< group of partitions joined by high speed link
    OptiPool,  ///< group of partitions joined by virtual optical link
    Hca,       ///< host channel adapter; its partition is its user
    Sni,       ///< switch network adapter; its partition is its user
    Lpar,      ///< partition
    Profile,   ///< stored settings of a partition, numbered from 0
    Ethernet,  ///< virtual Ethernet adapter that exists now, by virtual slot
    VirtualScsi,
    Serial,
    SystemProfile,  ///< partitions of a host that are started together, each with a profile
};
constexpr int kKinds = static_cast<int>(Kind::SystemProfile) + 1;

/// The adapters that are in virtual slots.
constexpr Kind kVirtual[] = {Kind::Ethernet, Kind::VirtualScsi, Kind::Serial};

/// What a host has whether a partition holds it or not.
constexpr Kind kPhysical[] = {Kind::Slot, Kind::Hca, Kind::Sni};

/// All that belongs to a partition.
constexpr Kind kOfLpar[] = {Kind::Profile, Kind::Ethernet, Kind::VirtualScsi, Kind::Serial,
                            Kind::Slot,    Kind::Hca,      Kind::Sni};

constexpr bool isPhysical(Kind kind) {
    return kind == Kind::Slot || kind == Kind::Hca || kind == Kind::Sni;
}

/// The word for a kind in the stored state.
const char* kindName(Kind kind);

/// Where an object belongs. Objects are told apart, and ordered, by kind, host, lpar and number.
struct Place {
    std::int64_t host = 0;    ///< from 1
    std::int64_t lpar = 0;    ///< ID of the partition; 0 for what is the host's own
    std::int64_t number = 0;  ///< slot number, pool ID ... ; 0 where there is only one

    bool operator<(const Place& other) const {
        return std::tie(host, lpar, number) < std::tie(other.host, other.lpar, other.number);
    }
};

class Object {
public:
    /// @param attributes  stored() of an earlier object
    Object(Kind kind, Place place, std::string attributes = {});

    Kind kind() const { return m_kind; }
    const Place& place() const { return m_place; }

    /// The value that was set, or else the kind's own.
    /// @throws std::logic_error the kind has no such attribute, or it has no value of its own
    std::string get(std::string_view name) const;

    /// @throws Failure BadValue the value holds a line break or a zero byte, which the tools'
    ///         output could not carry
    /// @throws std::logic_error as get()
    void set(std::string_view name, std::string_view value);

    /// As set(), but leaves alone what has the value already, so that what is stored stays short.
    void update(std::string_view name, std::string_view value) {
        if (get(name) != value) {
            set(name, value);
        }
    }

    /// Gives the attribute the kind's own value again.
    void unset(std::string_view name);

    /// A copy with the same number for the host and partition of @p place.
    Object movedTo(const Place& place) const {
        return {m_kind, {place.host, place.lpar, m_place.number}, m_attributes};
    }

    /// The attributes that were set, as the text to store: a line "name=value" for each, with a
    /// line break before every line and behind the last.
    const std::string& stored() const { return m_attributes; }

    /// Name and value of each of them, in the order in which they were first set. The texts are
    /// parts of stored().
    std::vector<std::pair<std::string_view, std::string_view>> settings() const;

private:
    std::size_t find(std::string_view name, std::size_t* size) const;

    Kind m_kind;
    Place m_place;
    std::string m_attributes;
};

}  // namespace appliance

#endif

/// Starts partitions of one host with profiles.
///
/// What a profile asks for is judged against what is left when the partitions that were started
/// before have theirs; one that is refused takes nothing. Nothing is changed before apply().
///
///     Activation activation(change.host());
///     activation.start(lpar, "normal", "");
///     activation.apply(change);
#ifndef APPLIANCE_ACTIVATION_H
#define APPLIANCE_ACTIVATION_H

#include <map>
#include <set>
#include <string>
#include <vector>

#include "Adapters.h"
#include "Change.h"

namespace appliance {

class Activation {
public:
    /// @param host  as it stands now; must hold until apply()
    explicit Activation(const HostView& host);

    /// Gives @p lpar the profile's memory and processors (as wanted, or what is left if that is
    /// enough), its virtual adapters in place of those it has, and its physical slots, and makes
    /// it run. A server adapter that a client of another partition uses stays as it is.
    /// @param bootMode  empty: the profile's
    /// @throws Failure HostState, LparState, LparMoving, ProfileNotFound, NotEnough, NoPool,
    ///         NoServerAdapter, SlotNotFound, SlotNotFree, BadValue
    void start(const Object& lpar, const std::string& profile, const std::string& bootMode);

    /// Whether start() made this partition run.
    bool hasStarted(const Object& lpar) const { return m_lpars.count(lpar.place().lpar) != 0; }

    /// Puts all that start() decided, and makes a host that stood by operate.
    void apply(Change& change) const;

private:
    /// Of a resource: now, and when pending changes are in effect.
    struct Amount {
        std::int64_t curr = 0;
        std::int64_t pend = 0;
    };
    /// Of memory, entitlements to the memory pool's, and of processor pools by their IDs.
    using Amounts = std::map<std::string, Amount>;

    static Amounts held(const Object& lpar);
    /// What a partition would have of @p resource if it gave back what it has.
    std::int64_t room(const std::string& resource, const Object& lpar) const;
    void setMemory(const Object& before, const Object& profile, Object& lpar) const;
    void setProcessors(const Object& before, const Object& profile, Object& lpar) const;
    Object withResources(const Object& before, const Object& profile) const;
    std::map<VirtualSlot, Object> adaptersFor(const Object& lpar, const Object& profile) const;
    /// Whether the adapter in @p slot is a server for @p client, and free for it.
    bool isFreeFor(const Object& client, const VirtualSlot& slot) const;
    /// Joins a client to its server: if the profile leaves open which, to the one that it had
    /// before, or else the first that is free, and not among @p taken, to which it is added then.
    /// @throws Failure NoServerAdapter
    void join(Object& client, std::set<VirtualSlot>& taken) const;
    std::map<std::string, Object> slotsFor(const Object& lpar, const Object& profile) const;
    void account(const Object& lpar, int sign);

    const HostView& m_host;
    Amounts m_left;
    std::map<VirtualSlot, Object> m_adapters;
    std::map<VirtualSlot, VirtualSlot> m_clients;  ///< of server adapters
    std::map<std::string, Object> m_slots;         ///< by DRC index
    std::map<std::int64_t, Object> m_lpars;        ///< that were started
};

/// Makes these partitions of @p host be in @p state, on what they hold already.
void enter(Change& change, const HostView& host, std::vector<Object> lpars, const char* state);

/// Makes a partition be as its profile says, apart from its memory and processors.
void takeSettings(const Object& profile, Object& lpar);

/// Takes the last reference code away from a partition that starts.
void clearRefcode(Object& lpar);

}  // namespace appliance

#endif

#include "Check.h"

#include <algorithm>
#include <map>
#include <optional>
#include <set>

#include "Adapters.h"
#include "LparState.h"
#include "Text.h"

namespace appliance {

namespace {

/// The sentences about one host.
struct Findings {
    std::string host;
    std::vector<std::string> texts;

    void require(bool holds, const std::string& what) {
        if (!holds) {
            texts.push_back(host + ": " + what);
        }
    }
    void require(bool holds, const Object& object, const std::string& what) {
        if (holds) {
            return;
        }
        const Place& place = object.place();
        require(false, std::string(kindName(object.kind())) + ' ' + std::to_string(place.number) +
                           " of partition " + std::to_string(place.lpar) + ' ' + what);
    }
};

using Rule = void (*)(const HostView& view, Findings& findings);

void ownersExist(const HostView& view, Findings& findings) {
    for (Kind kind : kOfLpar) {
        for (const Object& object : view.all(kind)) {
            const std::int64_t lpar = object.place().lpar;
            findings.require((lpar == 0 && isPhysical(kind)) || view.lpar(lpar) != nullptr, object,
                             "belongs to a partition that does not exist");
        }
    }
}

void namesAreUnique(const HostView& view, Findings& findings) {
    std::set<std::string> names;
    for (const Object& lpar : view.all(Kind::Lpar)) {
        findings.require(names.insert(lpar.get("name")).second, lpar,
                         "has the name of another: " + lpar.get("name"));
    }
    std::set<std::pair<std::int64_t, std::string>> profiles;
    for (const Object& profile : view.all(Kind::Profile)) {
        findings.require(profiles.emplace(profile.place().lpar, profile.get("name")).second,
                         profile, "has the name of another: " + profile.get("name"));
    }
    for (const Object& lpar : view.all(Kind::Lpar)) {
        for (const char* which : {"default_profile", "curr_profile"}) {
            const std::string name = lpar.get(which);
            const bool none = name.empty() && std::string(which) == "curr_profile";
            findings.require(none || profiles.count({lpar.place().lpar, name}) != 0, lpar,
                             std::string("has a ") + which + " that does not exist: " + name);
        }
    }
}

void capacityHolds(const HostView& view, Findings& findings) {
    constexpr struct {
        const char* free;
        const char* what;
    } kFree[] = {
        {"curr_avail_sys_mem", "memory than there is"},
        {"pend_avail_sys_mem", "memory than there is"},
        {"curr_avail_sys_proc_units", "processors than there are"},
        {"pend_avail_sys_proc_units", "processors than there are"},
    };
    for (const auto& row : kFree) {
        findings.require(hundredths(valueOf({&view, &view.host()}, row.free)) >= 0,
                         std::string("the partitions have more ") + row.what + ": " + row.free);
    }
    for (const Object& pool : view.all(Kind::ProcPool)) {
        const std::string left = valueOf({&view, &pool}, "pend_avail_pool_proc_units");
        findings.require(hundredths(left) >= 0, pool,
                         "is a pool whose partitions have more processors than it may use");
    }
    findings.require(static_cast<std::int64_t>(view.all(Kind::Lpar).size()) <=
                         number(view.host().get("max_lpars")),
                     "there are more partitions than the host can have");
}

/// "<prefix>min", "<desired>" and "<prefix>max" of a quantity must rise.
void rises(const Object& object, const std::string& prefix, const std::string& desired,
           Findings& findings) {
    for (const char* quantity : {"mem", "procs", "proc_units"}) {
        const std::int64_t least = hundredths(object.get(prefix + "min_" + quantity));
        const std::int64_t wanted = hundredths(object.get(desired + quantity));
        const std::int64_t most = hundredths(object.get(prefix + "max_" + quantity));
        findings.require(least <= wanted && wanted <= most, object,
                         "has a quantity outside its limits: " + desired + quantity);
    }
}

void quantitiesAreWithinLimits(const HostView& view, Findings& findings) {
    for (const Object& lpar : view.all(Kind::Lpar)) {
        rises(lpar, "pend_", "pend_", findings);
        findings.require(number(lpar.get("pend_mem")) % view.memRegion() == 0, lpar,
                         "has memory that is no multiple of the region size");
        const std::string pool = lpar.get("pend_shared_proc_pool_id");
        const bool known = (pool == "null" && lpar.get("pend_proc_mode") == "ded") ||
                           view.find(Kind::ProcPool, "shared_proc_pool_id", pool) != nullptr;
        findings.require(known, lpar, "is in a processor pool that does not exist: " + pool);
    }
    for (const Object& profile : view.all(Kind::Profile)) {
        rises(profile, "", "desired_", findings);
    }
}

void virtualSlotsFit(const HostView& view, Findings& findings) {
    std::map<VirtualSlot, const Object*> slots;
    std::set<std::string> macs;
    for (Kind kind : kVirtual) {
        for (const Object& adapter : view.all(kind)) {
            findings.require(slots.emplace(slotOf(adapter), &adapter).second, adapter,
                             "shares its virtual slot with another adapter");
            const Object* lpar = view.lpar(adapter.place().lpar);
            findings.require(lpar != nullptr && adapter.place().number <
                                                    number(lpar->get("curr_max_virtual_slots")),
                             adapter, "lies behind the partition's last virtual slot");
            findings.require(kind != Kind::Ethernet || macs.insert(adapter.get("mac_addr")).second,
                             adapter, "has the MAC address of another");
        }
    }
    std::set<VirtualSlot> servers;
    for (const auto& [place, adapter] : slots) {
        if (adapter->kind() == Kind::Ethernet || adapter->get("adapter_type") != "client") {
            continue;
        }
        const std::optional<VirtualSlot> server = serverOf(*adapter);
        const auto found = server ? slots.find(*server) : slots.end();
        const bool served = found != slots.end() && serves(*found->second, *adapter);
        findings.require(served, *adapter, "is joined to an adapter that is not joined to it");
        findings.require(!served || servers.insert(*server).second, *adapter,
                         "is joined to an adapter that serves another client");
    }
}

void physicalSlotsAreUnique(const HostView& view, Findings& findings) {
    std::set<std::string> drcs;
    for (const Object& slot : view.all(Kind::Slot)) {
        findings.require(drcs.insert(slot.get("drc_index")).second, slot,
                         "has the DRC index of another");
    }
}

void activeLparsHaveActiveHosts(const HostView& view, Findings& findings) {
    const std::string state = view.host().get("state");
    for (const Object& lpar : view.all(Kind::Lpar)) {
        findings.require(state == "Operating" || !isActive(lpar), lpar,
                         "is active on a host in the state " + state);
    }
}

/// A partition that moves and the place that is kept for it must name each other.
void movesHaveTwoEnds(const HostView& view, Findings& findings) {
    const auto same = namesIn(
        "name,migration_state,migration_type,source_sys_name,dest_sys_name,source_lpar_id,"
        "dest_lpar_id,bytes_remaining,bytes_transmitted");
    const std::string name = view.host().get("name");
    for (const Object& lpar : view.all(Kind::Lpar)) {
        if (!isMoving(lpar)) {
            continue;
        }
        const bool leaves = lpar.get("source_sys_name") == name &&
                            lpar.get("source_lpar_id") == lpar.get("lpar_id");
        const bool arrives =
            lpar.get("dest_sys_name") == name && lpar.get("dest_lpar_id") == lpar.get("lpar_id");
        const std::optional<Object> other =
            view.lparElsewhere(lpar.get(leaves ? "dest_sys_name" : "source_sys_name"),
                               number(lpar.get(leaves ? "dest_lpar_id" : "source_lpar_id")));
        const auto agrees = [&](std::string_view attribute) {
            return lpar.get(attribute) == other->get(attribute);
        };
        findings.require(
            leaves != arrives && other && std::all_of(same.begin(), same.end(), agrees), lpar,
            "is in a move without another end");
    }
}

constexpr Rule kRules[] = {ownersExist,
                           namesAreUnique,
                           capacityHolds,
                           quantitiesAreWithinLimits,
                           virtualSlotsFit,
                           physicalSlotsAreUnique,
                           activeLparsHaveActiveHosts,
                           movesHaveTwoEnds};

}  // namespace

std::vector<std::string> check(const HostView& view) {
    Findings findings{view.host().get("name"), {}};
    for (Rule rule : kRules) {
        rule(view, findings);
    }
    return findings.texts;
}

std::vector<std::string> check(Store& store) {
    std::vector<std::string> all;
    std::set<std::string> names;
    for (const auto& view : allHosts(store)) {
        Findings findings{view->host().get("name"), {}};
        findings.require(names.insert(findings.host).second && names.insert(view->mtms()).second,
                         "another host has the same name or serial number");
        for (Rule rule : kRules) {
            rule(*view, findings);
        }
        all.insert(all.end(), findings.texts.begin(), findings.texts.end());
    }
    return all;
}

}  // namespace appliance

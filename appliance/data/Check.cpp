#include "Check.h"

#include <map>
#include <set>

#include "Text.h"
#include "View.h"

namespace appliance {

namespace {

class Findings {
public:
    void setHost(const HostView& view) { m_host = view.host().get("name"); }

    void require(bool holds, const std::string& what) {
        if (!holds) m_texts.push_back(m_host + ": " + what);
    }
    void require(bool holds, const Object& object, const std::string& what) {
        if (holds) return;
        const Place& place = object.place();
        require(false, std::string(kindName(object.kind())) + ' ' + std::to_string(place.number) +
                           " of partition " + std::to_string(place.lpar) + ' ' + what);
    }
    std::vector<std::string> take() { return std::move(m_texts); }

private:
    std::string m_host;
    std::vector<std::string> m_texts;
};

using Rule = void (*)(const HostView& view, Findings& findings);

constexpr Kind kOfLpar[] = {Kind::Profile, Kind::Ethernet, Kind::VirtualScsi, Kind::Serial,
                            Kind::Slot,    Kind::Hca,      Kind::Sni};
constexpr Kind kVirtual[] = {Kind::Ethernet, Kind::VirtualScsi, Kind::Serial};

void ownersExist(const HostView& view, Findings& findings) {
    for (Kind kind : kOfLpar) {
        const bool mayBeFree = kind == Kind::Slot || kind == Kind::Hca || kind == Kind::Sni;
        for (const Object& object : view.all(kind)) {
            const std::int64_t lpar = object.place().lpar;
            findings.require((lpar == 0 && mayBeFree) || view.lpar(lpar) != nullptr, object,
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
    const Row row{&view, &view.host()};
    for (const char* free : {"curr_avail_sys_mem", "pend_avail_sys_mem"}) {
        findings.require(number(valueOf(row, free)) >= 0,
                         std::string("the partitions have more memory than there is: ") + free);
    }
    for (const char* free : {"curr_avail_sys_proc_units", "pend_avail_sys_proc_units"}) {
        findings.require(
            hundredths(valueOf(row, free)) >= 0,
            std::string("the partitions have more processors than there are: ") + free);
    }
    for (const Object& pool : view.all(Kind::ProcPool)) {
        const Row poolRow{&view, &pool};
        findings.require(hundredths(valueOf(poolRow, "pend_avail_pool_proc_units")) >= 0, pool,
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
        const std::int64_t region = number(view.host().get("mem_region_size"));
        findings.require(region > 0 && number(lpar.get("pend_mem")) % region == 0, lpar,
                         "has memory that is no multiple of the region size");
        const std::string pool = lpar.get("pend_shared_proc_pool_id");
        bool known = pool == "null" && lpar.get("pend_proc_mode") == "ded";
        for (const Object& other : view.all(Kind::ProcPool)) {
            known = known || pool == other.get("shared_proc_pool_id");
        }
        findings.require(known, lpar, "is in a processor pool that does not exist: " + pool);
    }
    for (const Object& profile : view.all(Kind::Profile)) {
        rises(profile, "", "desired_", findings);
    }
}

using VirtualSlot = std::pair<std::int64_t, std::int64_t>;  // partition, slot
using VirtualSlots = std::map<VirtualSlot, const Object*>;

/// Whether what @p adapter is joined to is joined to it, and is of the other type.
bool isPaired(const Object& adapter, const VirtualSlots& slots) {
    std::int64_t lpar = 0, slot = 0;
    if (!wholeNumber(adapter.get("remote_lpar_id"), &lpar) ||
        !wholeNumber(adapter.get("remote_slot_num"), &slot)) {
        return adapter.get("adapter_type") == "server";
    }
    const auto found = slots.find({lpar, slot});
    if (found == slots.end() || found->second->kind() != adapter.kind()) return false;
    const Object& other = *found->second;
    return other.get("remote_lpar_id") == std::to_string(adapter.place().lpar) &&
           other.get("remote_slot_num") == std::to_string(adapter.place().number) &&
           other.get("adapter_type") != adapter.get("adapter_type");
}

void virtualSlotsFit(const HostView& view, Findings& findings) {
    VirtualSlots slots;
    std::set<std::string> macs;
    for (Kind kind : kVirtual) {
        for (const Object& adapter : view.all(kind)) {
            const Place& place = adapter.place();
            findings.require(slots.emplace(VirtualSlot{place.lpar, place.number}, &adapter).second,
                             adapter, "shares its virtual slot with another adapter");
            const Object* lpar = view.lpar(place.lpar);
            findings.require(
                lpar != nullptr && place.number < number(lpar->get("curr_max_virtual_slots")),
                adapter, "lies behind the partition's last virtual slot");
            findings.require(kind != Kind::Ethernet || macs.insert(adapter.get("mac_addr")).second,
                             adapter, "has the MAC address of another");
        }
    }
    for (const auto& [place, adapter] : slots) {
        findings.require(adapter->kind() == Kind::Ethernet || isPaired(*adapter, slots), *adapter,
                         "is joined to an adapter that is not joined to it");
    }
}

void physicalSlotsAreUnique(const HostView& view, Findings& findings) {
    std::set<std::string> drcs;
    for (const Object& slot : view.all(Kind::Slot)) {
        findings.require(drcs.insert(slot.get("drc_index")).second, slot,
                         "has the DRC index of another");
    }
}

constexpr Rule kRules[] = {ownersExist,     namesAreUnique,
                           capacityHolds,   quantitiesAreWithinLimits,
                           virtualSlotsFit, physicalSlotsAreUnique};

}  // namespace

std::vector<std::string> check(Store& store) {
    Findings findings;
    std::set<std::string> names;
    for (const auto& view : allHosts(store)) {
        findings.setHost(*view);
        findings.require(
            names.insert(view->host().get("name")).second && names.insert(view->mtms()).second,
            "another host has the same name or serial number");
        for (Rule rule : kRules) rule(*view, findings);
    }
    return findings.take();
}

}  // namespace appliance

#include "Activation.h"

#include <algorithm>

#include "Adapters.h"
#include "ConfigureRules.h"
#include "Failure.h"
#include "LparState.h"
#include "Text.h"

namespace appliance {

namespace {

// Resources; others are further processor pools.
constexpr const char* kMemory = "mem";
constexpr const char* kEntitlement = "io_entitled_mem";
constexpr const char* kWholePool = "0";  ///< of all processors that are not dedicated

/// What a partition takes over from its profile, where it stands without "pend_" and "desired_".
constexpr const char* kTaken =
    "mem_mode,pend_mem_weight,primary_psp_id,secondary_psp_id,pend_proc_mode,pend_sharing_mode,"
    "pend_uncap_weight,pend_shared_proc_pool_id,pend_max_virtual_slots,load_source_slot,"
    "alt_restart_device_slot,console_slot,alt_console_slot,op_console_slot,boot_mode,auto_start,"
    "power_ctrl_lpar_ids,work_group_id,redundant_err_path_reporting,electronic_err_reporting,"
    "desired_lpar_proc_compat_mode,hsl_pool_id,virtual_opti_pool_id";

/// What is in effect from the start as it was to be: "curr_" as "pend_".
constexpr const char* kPending =
    "min_mem,mem,max_mem,mem_weight,io_entitled_mem,proc_mode,min_procs,procs,max_procs,"
    "min_proc_units,proc_units,max_proc_units,sharing_mode,uncap_weight,shared_proc_pool_id,"
    "max_virtual_slots";

/// As much of what is wanted as there is, in whole steps.
/// @throws Failure NotEnough
std::int64_t granted(const char* attribute, std::int64_t room, std::int64_t step,
                     std::int64_t least, std::int64_t wanted) {
    const std::int64_t given = std::min(wanted, room / step * step);
    if (given >= least) {
        return given;
    }
    const bool isMemory = std::string(attribute).find("mem") != std::string::npos;
    throw Failure(Fault::NotEnough, {attribute, isMemory ? std::to_string(room) : units(room)});
}

/// Whether a profile asks for all that is free, whatever its quantities say.
bool wantsAll(const Object& profile) { return profile.get("all_resources") == "1"; }

/// What a partition is to have of @p quantity, and its limits.
void setQuantity(Object& lpar, const Object& profile, const std::string& quantity,
                 const std::string& given) {
    lpar.set("pend_" + quantity, given);
    lpar.set("pend_min_" + quantity, profile.get("min_" + quantity));
    lpar.set("pend_max_" + quantity, wantsAll(profile) ? given : profile.get("max_" + quantity));
}

std::string text(std::int64_t value) { return std::to_string(value); }

}  // namespace

Activation::Activation(const HostView& host) : m_host(host) {
    const Row row{&host, &host.host()};
    m_left[kMemory] = {number(valueOf(row, "curr_avail_sys_mem")),
                       number(valueOf(row, "pend_avail_sys_mem"))};
    Amount& entitlement = m_left[kEntitlement];
    for (const Object& pool : host.all(Kind::MemPool)) {
        entitlement.pend = number(valueOf(rowOf(host, pool), "pend_avail_pool_mem"));
        entitlement.curr = entitlement.pend;
    }
    for (const Object& pool : host.all(Kind::ProcPool)) {
        const Row poolRow = rowOf(host, pool);
        m_left[pool.get("shared_proc_pool_id")] = {
            hundredths(valueOf(poolRow, "curr_avail_pool_proc_units")),
            hundredths(valueOf(poolRow, "pend_avail_pool_proc_units"))};
    }
    for (Kind kind : kVirtual) {
        for (const Object& adapter : host.all(kind)) {
            m_adapters.emplace(slotOf(adapter), adapter);
            if (const auto server = serverOf(adapter)) {
                m_clients[*server] = slotOf(adapter);
            }
        }
    }
    for (const Object& slot : host.all(Kind::Slot)) {
        m_slots.emplace(slot.get("drc_index"), slot);
    }
}

Activation::Amounts Activation::held(const Object& lpar) {
    Amounts held;
    if (lpar.get("mem_mode") == "shared") {
        const std::int64_t entitled = number(lpar.get("pend_io_entitled_mem"));
        held[kEntitlement] = {entitled, entitled};
    } else {
        held[kMemory] = {number(lpar.get("curr_mem")), number(lpar.get("pend_mem"))};
    }
    const Amount units{hundredths(lpar.get("curr_proc_units")),
                       hundredths(lpar.get("pend_proc_units"))};
    held[lpar.get("curr_shared_proc_pool_id")].curr = units.curr;
    held[lpar.get("pend_shared_proc_pool_id")].pend = units.pend;
    held[kWholePool] = units;
    return held;
}

std::int64_t Activation::room(const std::string& resource, const Object& lpar) const {
    const Amount left = m_left.at(resource), own = held(lpar)[resource];
    return std::min(left.curr + own.curr, left.pend + own.pend);
}

void Activation::setMemory(const Object& before, const Object& profile, Object& lpar) const {
    const std::int64_t region = m_host.memRegion();
    const std::int64_t wanted = number(profile.get("desired_mem"));
    if (lpar.get("mem_mode") != "shared") {
        const std::int64_t free = room(kMemory, before);
        const std::int64_t least = wantsAll(profile) ? region : number(profile.get("min_mem"));
        const std::int64_t given =
            granted("pend_avail_sys_mem", free, region, least, wantsAll(profile) ? free : wanted);
        setQuantity(lpar, profile, "mem", text(given));
        lpar.set("pend_io_entitled_mem", "0");
        lpar.set("auto_io_entitled_mem", "0");
        return;
    }
    refuseIf(m_host.all(Kind::MemPool).empty(), Fault::NoPool, {"mem_mode"});
    // The appliance's own choice is that of the time before, or else one region.
    const std::string entitled = profile.get("desired_io_entitled_mem");
    std::int64_t share = number(entitled == "auto" ? before.get("pend_io_entitled_mem") : entitled);
    if (entitled == "auto" && share == 0) {
        share = region;
    }
    granted("pend_avail_pool_mem", room(kEntitlement, before), 1, share, share);
    // However much of it others use: a partition sees no more memory than the host has.
    const char* const all = "configurable_sys_mem";
    const std::int64_t most = number(valueOf({&m_host, &m_host.host()}, all));
    const std::int64_t given = granted(all, most, region, number(profile.get("min_mem")), wanted);
    setQuantity(lpar, profile, "mem", text(given));
    lpar.set("pend_io_entitled_mem", text(share));
    lpar.set("auto_io_entitled_mem", entitled == "auto" ? "1" : "0");
}

void Activation::setProcessors(const Object& before, const Object& profile, Object& lpar) const {
    const bool all = wantsAll(profile);
    const auto quantity = [&](const char* name) { return hundredths(profile.get(name)); };
    const char* const attribute = "pend_avail_sys_proc_units";
    std::int64_t free = room(kWholePool, before);
    if (profile.get("proc_mode") == "ded") {
        const std::int64_t given = granted(attribute, free, 100, all ? 100 : quantity("min_procs"),
                                           all ? free : quantity("desired_procs"));
        setQuantity(lpar, profile, "procs", text(given / 100));
        for (const std::string edge : {"pend_", "pend_min_", "pend_max_"}) {
            lpar.set(edge + "proc_units", units(hundredths(lpar.get(edge + "procs"))));
        }
        return;
    }
    const std::string pool = profile.get("shared_proc_pool_id");
    refuseIf(m_left.count(pool) == 0, Fault::NoPool, {"shared_proc_pool_id"});
    free = std::min(free, room(pool, before));
    // A virtual processor needs its share of units: fewer units may mean fewer processors.
    const std::int64_t share =
        std::max<std::int64_t>(1, hundredths(m_host.host().get("min_proc_units_per_virtual_proc")));
    const std::int64_t given = granted(attribute, free, 1, all ? share : quantity("min_proc_units"),
                                       all ? free : quantity("desired_proc_units"));
    const std::int64_t procs =
        all ? (given + 99) / 100 : std::min(quantity("desired_procs") / 100, given / share);
    refuseIf(procs * 100 < quantity("min_procs"), Fault::NotEnough, {attribute, units(free)});
    setQuantity(lpar, profile, "procs", text(procs));
    setQuantity(lpar, profile, "proc_units", units(given));
}

bool Activation::isFreeFor(const Object& client, const VirtualSlot& slot) const {
    const auto server = m_adapters.find(slot);
    const auto other = m_clients.find(slot);
    const std::int64_t id = client.place().lpar;
    const bool isFree = other == m_clients.end() || other->second.first == id;
    return slot.first != id && isFree && server != m_adapters.end() &&
           serves(server->second, client);
}

void Activation::join(Object& client, std::set<VirtualSlot>& taken) const {
    const Failure notFound(Fault::NoServerAdapter, {text(client.place().number)});
    std::optional<VirtualSlot> found = serverOf(client);
    if (found && !isFreeFor(client, *found)) {
        throw notFound;
    }
    const auto fits = [&](const VirtualSlot& slot) {
        return admits(client, slot) && taken.count(slot) == 0 && isFreeFor(client, slot);
    };
    const auto old = m_adapters.find(slotOf(client));
    const auto before = old == m_adapters.end() ? std::nullopt : serverOf(old->second);
    if (!found && before && fits(*before)) {
        found = before;
    }
    for (auto other = m_adapters.begin(); !found && other != m_adapters.end(); ++other) {
        if (fits(other->first)) {
            found = other->first;
        }
    }
    if (!found) {
        throw notFound;
    }
    client.set("remote_lpar_id", text(found->first));
    client.set("remote_slot_num", text(found->second));
    taken.insert(*found);
}

std::map<VirtualSlot, Object> Activation::adaptersFor(const Object& lpar,
                                                      const Object& profile) const {
    std::map<VirtualSlot, Object> adapters;
    const std::map<std::int64_t, Object> asked = adaptersOf(profile);
    std::set<VirtualSlot> servers;
    for (const auto& [number, wanted] : asked) {
        if (const auto server = serverOf(wanted)) {
            servers.insert(*server);
        }
    }
    for (const auto& [number, wanted] : asked) {
        // What the profile does not say of an adapter that was there before stays: its MAC
        // address, the devices behind it.
        const auto old = m_adapters.find(slotOf(wanted));
        const bool stays = old != m_adapters.end() && old->second.kind() == wanted.kind();
        Object adapter(wanted.kind(), wanted.place(), stays ? old->second.stored() : "");
        for (const auto& [name, value] : wanted.settings()) {
            adapter.set(name, value);
        }
        if (wanted.kind() == Kind::Ethernet && !stays) {
            adapter.set("mac_addr", newMac(m_host, wanted.place()));
        }
        if (adapter.kind() != Kind::Ethernet && adapter.get("adapter_type") == "client") {
            join(adapter, servers);
        }
        adapters.emplace(slotOf(adapter), std::move(adapter));
    }
    const std::int64_t id = lpar.place().lpar;
    for (auto used = m_clients.lower_bound({id, 0});
         used != m_clients.end() && used->first.first == id; ++used) {
        const auto server = m_adapters.find(used->first);
        if (server != m_adapters.end()) {
            adapters.insert_or_assign(server->first, server->second);
        }
    }
    for (auto& [slot, adapter] : adapters) {
        adapter.set("state", "1");
    }
    return adapters;
}

std::map<std::string, Object> Activation::slotsFor(const Object& lpar,
                                                   const Object& profile) const {
    const std::int64_t id = lpar.place().lpar;
    std::map<std::string, Object> slots;
    const auto give = [&](const Object& slot, std::int64_t owner) -> Object& {
        const Object given = slot.movedTo({slot.place().host, owner});
        return slots.emplace(slot.get("drc_index"), given).first->second;
    };
    for (const IoSlot& wanted : ioSlotsFromList(profile.get("io_slots"))) {
        const auto slot = m_slots.find(wanted.drcIndex);
        const std::int64_t owner = slot == m_slots.end() ? -1 : slot->second.place().lpar;
        if (owner == 0 || owner == id) {
            Object& given = give(slot->second, id);
            if (wanted.pool != "none") {
                given.set("slot_io_pool_id", wanted.pool);
            }
        } else if (wanted.isRequired && owner < 0) {
            throw Failure(Fault::SlotNotFound, {wanted.drcIndex});
        } else if (wanted.isRequired) {
            throw Failure(Fault::SlotNotFree, {wanted.drcIndex, text(owner)});
        }
    }
    for (const auto& [drc, slot] : m_slots) {
        if (slot.place().lpar == id && slots.count(drc) == 0) {
            give(slot, 0);
        }
    }
    return slots;
}

void Activation::account(const Object& lpar, int sign) {
    Amounts held = Activation::held(lpar);
    for (auto& [resource, left] : m_left) {
        left.curr += sign * held[resource].curr;
        left.pend += sign * held[resource].pend;
    }
}

Object Activation::withResources(const Object& before, const Object& profile) const {
    Object lpar = before;
    takeSettings(profile, lpar);
    lpar.set("curr_psp_id", profile.get("primary_psp_id"));
    setMemory(before, profile, lpar);
    setProcessors(before, profile, lpar);
    return lpar;
}

void Activation::start(const Object& before, const std::string& profileName,
                       const std::string& bootMode) {
    const std::int64_t id = before.place().lpar;
    requireState(m_host, "Operating,Standby");
    requireStill(before);
    requireState(before, "Not Activated");
    const Object* profile = m_host.profile(id, profileName);
    refuseIf(profile == nullptr, Fault::ProfileNotFound, {profileName});
    Object lpar = withResources(before, *profile);
    std::map<VirtualSlot, Object> adapters = adaptersFor(lpar, *profile);
    std::map<std::string, Object> slots = slotsFor(lpar, *profile);

    // Nothing is refused from here on. A server in use may lie behind the profile's last slot.
    const std::int64_t highest = adapters.empty() ? 0 : adapters.rbegin()->first.second;
    lpar.set("pend_max_virtual_slots",
             text(std::max(highest + 1, number(lpar.get("pend_max_virtual_slots")))));
    for (const std::string& name : split(kPending)) {
        lpar.set("curr_" + name, lpar.get("pend_" + name));
    }
    const std::string compat = profile->get("lpar_proc_compat_mode");
    const std::string newest = split(m_host.host().get("lpar_proc_compat_modes")).back();
    lpar.set("curr_lpar_proc_compat_mode", compat == "default" ? newest : compat);
    lpar.set("resource_config", "1");
    lpar.set("curr_profile", profileName);
    if (!bootMode.empty()) {
        lpar.set("boot_mode", bootMode);
    }
    setActive(lpar, lpar.get("boot_mode") == "of" ? "Open Firmware" : "Running");
    clearRefcode(lpar);

    account(before, 1);
    account(lpar, -1);
    const auto first = m_adapters.lower_bound({id, 0});
    const auto last = m_adapters.lower_bound({id + 1, 0});
    for (auto old = first; old != last; ++old) {
        if (const auto server = serverOf(old->second)) {
            m_clients.erase(*server);
        }
    }
    m_adapters.erase(first, last);
    for (const auto& [slot, adapter] : adapters) {
        if (const auto server = serverOf(adapter)) {
            m_clients[*server] = slot;
        }
    }
    m_adapters.merge(adapters);
    for (auto& [drc, slot] : slots) {
        m_slots.insert_or_assign(drc, std::move(slot));
    }
    m_lpars.emplace(id, std::move(lpar));
}

void Activation::apply(Change& change) const {
    std::vector<Object> before, after;
    for (Kind kind : kVirtual) {
        for (const Object& adapter : m_host.all(kind)) {
            if (hasStarted(adapter)) {
                before.push_back(adapter);
            }
        }
    }
    for (const auto& [slot, adapter] : m_adapters) {
        if (hasStarted(adapter)) {
            after.push_back(adapter);
        }
    }
    for (const Object& slot : m_host.all(Kind::Slot)) {
        const Object& now = m_slots.at(slot.get("drc_index"));
        if (now.place().lpar == slot.place().lpar && now.stored() == slot.stored()) {
            continue;
        }
        before.push_back(slot);
        after.push_back(now);
    }
    for (const auto& [id, lpar] : m_lpars) {
        after.push_back(lpar);
    }
    if (!m_lpars.empty() && m_host.host().get("state") == "Standby") {
        after.push_back(m_host.host());
        after.back().set("state", "Operating");
    }
    for (const Object& object : before) {
        change.remove(object);
    }
    for (const Object& object : after) {
        change.put(object);
    }
}

void enter(Change& change, const HostView& host, std::vector<Object> lpars, const char* state) {
    std::vector<Object> adapters;
    for (Object& lpar : lpars) {
        lpar.set("state", state);
        const bool runs = isActive(lpar);
        (runs ? setActive : setInactive)(lpar, state);
        for (Kind kind : kVirtual) {
            for (Object adapter : host.all(kind, lpar.place().lpar)) {
                adapter.set("state", runs ? "1" : "0");
                adapters.push_back(std::move(adapter));
            }
        }
    }
    for (const Object& object : lpars) {
        change.put(object);
    }
    for (const Object& object : adapters) {
        change.put(object);
    }
}

void takeSettings(const Object& profile, Object& lpar) {
    for (std::string_view name : namesIn(kTaken)) {
        std::string_view stored = name;
        for (std::string_view prefix : {"pend_", "desired_"}) {
            if (name.substr(0, prefix.size()) == prefix) {
                stored.remove_prefix(prefix.size());
            }
        }
        lpar.set(name, profile.get(stored));
    }
}

void clearRefcode(Object& lpar) {
    for (const char* code : {"refcode", "word2"}) {
        lpar.set(code, "00000000");
    }
    lpar.set("fru_call_out_loc_codes", "none");
    lpar.set("refcode_time", timeText(std::time(nullptr)));
}

}  // namespace appliance

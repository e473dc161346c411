// edalloc: what a partition has now.

#include <algorithm>
#include <set>

#include "Adapters.h"
#include "Change.h"
#include "ConfigureRules.h"
#include "Failure.h"
#include "LparState.h"
#include "Operation.h"
#include "Settings.h"
#include "Text.h"

namespace appliance {

namespace {

constexpr std::int64_t kFirstSlot = 2;  ///< behind the consoles, which cannot be changed

/// The partition of the request, when its resources can change.
Object changeable(Change& change) {
    requireState(change.host(), {"Operating", "Standby"});
    Object lpar = change.lpar();
    requireStill(lpar);
    if (lpar.get("resource_config") != "1") {
        throw Failure(Fault::NoResources, {lpar.get("lpar_id")});
    }
    requireState(lpar, {"Running", "Not Activated"});
    return lpar;
}

std::vector<Setting> neededSettings(const Request& request, const Operation& operation) {
    std::vector<Setting> settings = settingsOf(request, "-a", operation.attributes);
    if (settings.empty()) throw Failure(Fault::MissingOption, {"-a"});
    return settings;
}

int signOf(const Operation& operation) { return *operation.name == 'a' ? 1 : -1; }

// Memory and processors. Quantities are in hundredths, which suits whole numbers as well.

/// Sets what is pending, in effect and at work, of which those that are not set follow the first.
void setAll(Object& lpar, const std::string& attribute, const std::string& value) {
    const std::string run = isActive(lpar) ? value : lpar.get("run_" + attribute);
    lpar.set("pend_" + attribute, value);
    lpar.set("curr_" + attribute, value);
    lpar.set("run_" + attribute, run);
}

/// Gives the partition @p change more of a quantity, within @p least and @p most.
void add(Object& lpar, const std::string& quantity, std::int64_t change, std::int64_t least,
         std::int64_t most) {
    const auto text = [&](const std::string& attribute, std::int64_t more) {
        const std::int64_t size = hundredths(lpar.get(attribute)) + more;
        return quantity == "proc_units" ? units(size) : std::to_string(size / 100);
    };
    const std::int64_t wanted = hundredths(lpar.get("pend_" + quantity)) + change;
    if (wanted < least || wanted > most) throw Failure(Fault::OutsideLimits, {"pend_" + quantity});
    const std::string pend = text("pend_" + quantity, change);
    const std::string curr = text("curr_" + quantity, change);
    const std::string run = text("run_" + quantity, isActive(lpar) ? change : 0);
    lpar.set("pend_" + quantity, pend);
    lpar.set("curr_" + quantity, curr);
    lpar.set("run_" + quantity, run);
}

/// As above, within the limits that the partition has from its profile.
void add(Object& lpar, const std::string& quantity, std::int64_t change) {
    add(lpar, quantity, change, hundredths(lpar.get("pend_min_" + quantity)),
        hundredths(lpar.get("pend_max_" + quantity)));
}

/// @throws Failure NotEnough one of the attributes of @p row is less than @p change
void requireFree(const Row& row, const std::vector<std::string>& attributes, std::int64_t change) {
    for (const std::string& attribute : attributes) {
        const std::string left = valueOf(row, attribute);
        if (hundredths(left) < change) throw Failure(Fault::NotEnough, {attribute, left});
    }
}

void changeMemory(const Request& request, const Operation& operation) {
    constexpr std::int64_t kMost = 1LL << 40;
    Change change(request);
    const HostView& host = change.host();
    Object lpar = changeable(change);
    const std::int64_t size = request.number("-q", 1, kMost, 0);
    const std::int64_t entitled = request.number("--entitled", 1, kMost, 0);
    if (size == 0 && entitled == 0) throw Failure(Fault::MissingOption, {"-q"});
    if (size % number(host.host().get("mem_region_size")) != 0) {
        throw Failure(Fault::BadOptionValue, {"-q", request.value("-q")});
    }
    const int sign = signOf(operation);
    const bool isShared = lpar.get("mem_mode") == "shared";
    if (size != 0) add(lpar, "mem", sign * size * 100);
    if (!isShared) {
        if (entitled != 0) throw Failure(Fault::Disagree, {"--entitled", "mem_mode"});
        requireFree({&host, &host.host()}, {"curr_avail_sys_mem", "pend_avail_sys_mem"},
                    sign * size * 100);
    } else {
        // The memory itself comes from the pool as it is used; what I/O may hold is promised.
        add(lpar, "io_entitled_mem", sign * entitled * 100, 0, hundredths(lpar.get("pend_mem")));
        if (entitled != 0) lpar.set("auto_io_entitled_mem", "0");
        for (const Object& pool : host.all(Kind::MemPool)) {
            requireFree(rowOf(host, pool), {"pend_avail_pool_mem"}, sign * entitled * 100);
        }
    }
    change.put(lpar);
    change.commit();
}

/// A partition's virtual processors need a share of units each, and can use no more than one.
void requireShares(const HostView& host, const Object& lpar) {
    const std::int64_t share = hundredths(host.host().get("min_proc_units_per_virtual_proc"));
    const std::int64_t procs = number(lpar.get("pend_procs"));
    const std::int64_t size = hundredths(lpar.get("pend_proc_units"));
    if (size < procs * share || size > procs * 100) {
        throw Failure(Fault::OutsideLimits, {"pend_proc_units"});
    }
}

void changeProcessors(const Request& request, const Operation& operation) {
    constexpr std::int64_t kMost = 1'000'000;
    Change change(request);
    const HostView& host = change.host();
    Object lpar = changeable(change);
    const std::int64_t procs = request.number("--procs", 1, kMost, 0);
    std::int64_t size = 0;
    if (request.has("--procunits") &&
        (!wholeUnits(request.value("--procunits"), &size) || size == 0)) {
        throw Failure(Fault::BadOptionValue, {"--procunits", request.value("--procunits")});
    }
    if (procs == 0 && size == 0) throw Failure(Fault::MissingOption, {"--procs"});
    const int sign = signOf(operation);
    const bool isDedicated = lpar.get("pend_proc_mode") == "ded";
    if (isDedicated && size != 0) throw Failure(Fault::Disagree, {"--procunits", "proc_mode"});
    if (isDedicated) size = procs * 100;
    if (procs != 0) add(lpar, "procs", sign * procs * 100);
    if (size != 0) add(lpar, "proc_units", sign * size);
    if (!isDedicated) requireShares(host, lpar);
    requireFree({&host, &host.host()}, {"curr_avail_sys_proc_units", "pend_avail_sys_proc_units"},
                sign * size);
    for (const Object& pool : host.all(Kind::ProcPool)) {
        if (lpar.get("pend_shared_proc_pool_id") != pool.get("shared_proc_pool_id")) continue;
        requireFree(rowOf(host, pool), {"curr_avail_pool_proc_units", "pend_avail_pool_proc_units"},
                    sign * size);
    }
    change.put(lpar);
    change.commit();
}

void setMemory(const Request& request, const Operation& operation) {
    Change change(request);
    Object lpar = changeable(change);
    for (const Setting& setting : neededSettings(request, operation)) {
        if (lpar.get("mem_mode") != "shared") {
            throw Failure(Fault::Disagree, {setting.name, "mem_mode"});
        }
        setAll(lpar, setting.name, checkedValue(change.host(), profileRules(), setting));
    }
    change.put(lpar);
    change.commit();
}

void setProcessors(const Request& request, const Operation& operation) {
    Change change(request);
    Object lpar = changeable(change);
    for (const Setting& setting : neededSettings(request, operation)) {
        const std::string value = checkedValue(change.host(), profileRules(), setting);
        const std::string before = lpar.get("pend_sharing_mode");
        if (setting.name == "uncap_weight") {
            if (before != "uncap") throw Failure(Fault::Disagree, {setting.name, "sharing_mode"});
            setAll(lpar, setting.name, value);
        } else if (sharesPool(value) != sharesPool(before)) {
            throw Failure(Fault::Disagree, {setting.name, "proc_mode"});
        } else if (value != before) {
            lpar.set("pend_sharing_mode", value);
            lpar.set("curr_sharing_mode", value);
            setAll(lpar, "uncap_weight", value == "uncap" ? "128" : "0");
        }
    }
    change.put(lpar);
    change.commit();
}

// Physical slots.

/// The slot that -l names.
Object slotOf(const Request& request, const HostView& host) {
    if (!request.has("-l")) throw Failure(Fault::MissingOption, {"-l"});
    std::string drc = request.value("-l");
    std::transform(drc.begin(), drc.end(), drc.begin(),
                   [](char c) { return c >= 'a' && c <= 'f' ? static_cast<char>(c - 32) : c; });
    for (const Object& slot : host.all(Kind::Slot)) {
        if (slot.get("drc_index") == drc) return slot;
    }
    throw Failure(Fault::SlotNotFound, {request.value("-l")});
}

void moveSlot(Change& change, const Object& slot, std::int64_t lpar) {
    change.remove(slot);
    change.put(Object(Kind::Slot, {slot.place().host, lpar, slot.place().number}, slot.stored()));
    change.commit();
}

void addSlot(const Request& request, const Operation& operation) {
    Change change(request);
    const Object lpar = changeable(change);
    Object slot = slotOf(request, change.host());
    if (slot.place().lpar != 0) {
        throw Failure(Fault::SlotNotFree,
                      {slot.get("drc_index"), std::to_string(slot.place().lpar)});
    }
    const std::int64_t pools = number(change.host().host().get("max_io_pools"));
    for (const Setting& setting : settingsOf(request, "-a", operation.attributes)) {
        std::int64_t pool = 0;
        if (setting.value != "none" && (!wholeNumber(setting.value, &pool) || pool >= pools)) {
            throw Failure(Fault::BadValue, {setting.name, setting.value});
        }
        slot.set(setting.name, setting.value);
    }
    moveSlot(change, slot, lpar.place().lpar);
}

void removeSlot(const Request& request, const Operation&) {
    Change change(request);
    const HostView& host = change.host();
    const Object lpar = changeable(change);
    const Object slot = slotOf(request, host);
    const std::string drc = slot.get("drc_index");
    if (slot.place().lpar != lpar.place().lpar) throw Failure(Fault::SlotNotHeld, {drc});
    for (const Object& profile : host.all(Kind::Profile)) {
        if (profile.place().lpar != lpar.place().lpar || !isActive(lpar) ||
            profile.get("name") != lpar.get("curr_profile")) {
            continue;
        }
        for (const IoSlot& held : ioSlotsFromList(profile.get("io_slots"))) {
            if (held.drcIndex == drc && held.isRequired) throw Failure(Fault::Required, {drc});
        }
    }
    moveSlot(change, slot, 0);
}

// Virtual adapters.

constexpr Kind kVirtual[] = {Kind::Ethernet, Kind::VirtualScsi, Kind::Serial};

Kind kindOf(const Operation& operation) {
    const std::string subtype = operation.subtype;
    return subtype == "eth" ? Kind::Ethernet : subtype == "scsi" ? Kind::VirtualScsi : Kind::Serial;
}

/// The slot that -s names, or the first that is free.
std::int64_t freeSlot(const Request& request, const HostView& host, const Object& lpar) {
    const std::int64_t end = number(lpar.get("curr_max_virtual_slots"));
    std::set<std::int64_t> used;
    for (Kind kind : kVirtual) {
        for (const Object& adapter : host.all(kind)) {
            if (adapter.place().lpar == lpar.place().lpar) used.insert(adapter.place().number);
        }
    }
    std::int64_t slot = kFirstSlot;
    while (used.count(slot) != 0) ++slot;
    slot = request.number("-s", 0, 65535, slot);
    if (slot < kFirstSlot || slot >= end || used.count(slot) != 0) {
        throw Failure(Fault::VirtualSlotNotFree, {std::to_string(slot)});
    }
    return slot;
}

void setAdapter(const HostView& host, const Setting& setting, Object& adapter) {
    if (setting.op != Setting::Operator::Set) throw Failure(Fault::NotAList, {setting.name});
    if (setting.name == "remote_lpar_name") {
        const Object* lpar = host.lparNamed(setting.value);
        if (lpar == nullptr) throw Failure(Fault::LparNameNotFound, {setting.value});
        return adapter.set("remote_lpar_id", lpar->get("lpar_id"));
    }
    const auto value = adapterValue(setting.name, setting.value);
    if (!value) throw Failure(Fault::BadValue, {setting.name, setting.value});
    adapter.set(setting.name, *value);
}

/// Whether the adapter's values go together, and a client finds its server free.
void requireWhole(const HostView& host, const Object& adapter) {
    const bool isEthernet = adapter.kind() == Kind::Ethernet;
    if (!isWhole(adapter)) {
        throw isEthernet ? Failure(Fault::Disagree, {"addl_vlan_ids", "ieee_virtual_eth"})
                         : Failure(Fault::Disagree, {"adapter_type", "remote_slot_num"});
    }
    if (isEthernet && (adapter.get("is_trunk") == "1") != (adapter.get("trunk_priority") != "0")) {
        throw Failure(Fault::Disagree, {"is_trunk", "trunk_priority"});
    }
    const auto server = serverOf(adapter);
    if (!server) return;
    bool found = false;
    for (const Object& other : host.all(adapter.kind())) {
        if (appliance::slotOf(other) == *server) found = serves(other, adapter);
        if (serverOf(other) == server)
            throw Failure(Fault::InUse, {std::to_string(other.place().lpar)});
    }
    if (!found) throw Failure(Fault::NoServerAdapter, {adapter.get("slot_num")});
}

void addAdapter(const Request& request, const Operation& operation) {
    Change change(request);
    const HostView& host = change.host();
    const Object lpar = changeable(change);
    const Kind kind = kindOf(operation);
    const Place& place = lpar.place();
    Object adapter(kind, {place.host, place.lpar, freeSlot(request, host, lpar)});
    adapter.set("state", isActive(lpar) ? "1" : "0");
    adapter.set("is_required", "0");
    std::set<std::string> names;
    for (const Setting& setting : settingsOf(request, "-a", operation.attributes)) {
        setAdapter(host, setting, adapter);
        names.insert(setting.name);
    }
    const char* needed = kind == Kind::Ethernet ? "port_vlan_id" : "adapter_type";
    if (names.count(needed) == 0) throw Failure(Fault::MissingSetting, {needed});
    if (kind == Kind::Ethernet) {
        adapter.set("mac_addr", newMac(host, adapter.place()));
    } else if (kind == Kind::Serial && adapter.get("adapter_type") == "client") {
        adapter.set("supports_dnx", "0");
    }
    requireWhole(host, adapter);
    change.put(adapter);
    change.commit();
}

void removeAdapter(const Request& request, const Operation& operation) {
    Change change(request);
    const HostView& host = change.host();
    const Object lpar = changeable(change);
    if (!request.has("-s")) throw Failure(Fault::MissingOption, {"-s"});
    const std::int64_t slot = request.number("-s", 0, 65535, 0);
    const VirtualSlot place{lpar.place().lpar, slot};
    const Object* adapter = nullptr;
    for (const Object& other : host.all(kindOf(operation))) {
        if (appliance::slotOf(other) == place) adapter = &other;
        if (serverOf(other) == place) {
            throw Failure(Fault::InUse, {std::to_string(other.place().lpar)});
        }
    }
    if (adapter == nullptr) throw Failure(Fault::AdapterNotFound, {std::to_string(slot)});
    if (slot < kFirstSlot || (isActive(lpar) && adapter->get("is_required") == "1")) {
        throw Failure(Fault::Required, {std::to_string(slot)});
    }
    change.remove(*adapter);
    change.commit();
}

constexpr const char* kEthernet =
    "ieee_virtual_eth,port_vlan_id,addl_vlan_ids,is_trunk,trunk_priority,vswitch";
constexpr const char* kScsi = "adapter_type,remote_lpar_id,remote_lpar_name,remote_slot_num";
constexpr const char* kSerial =
    "adapter_type,remote_lpar_id,remote_lpar_name,remote_slot_num,supports_dnx";

}  // namespace

const std::vector<Operation> kAllocateOperations = {
    {kEdalloc, "mem", nullptr, "a", changeMemory},
    {kEdalloc, "mem", nullptr, "r", changeMemory},
    {kEdalloc, "mem", nullptr, "s", setMemory, "mem_weight"},
    {kEdalloc, "proc", nullptr, "a", changeProcessors},
    {kEdalloc, "proc", nullptr, "r", changeProcessors},
    {kEdalloc, "proc", nullptr, "s", setProcessors, "sharing_mode,uncap_weight"},
    {kEdalloc, "io", "slot", "a", addSlot, "slot_io_pool_id"},
    {kEdalloc, "io", "slot", "r", removeSlot},
    {kEdalloc, "virtualio", "eth", "a", addAdapter, kEthernet},
    {kEdalloc, "virtualio", "eth", "r", removeAdapter},
    {kEdalloc, "virtualio", "scsi", "a", addAdapter, kScsi},
    {kEdalloc, "virtualio", "scsi", "r", removeAdapter},
    {kEdalloc, "virtualio", "serial", "a", addAdapter, kSerial},
    {kEdalloc, "virtualio", "serial", "r", removeAdapter},
};

}  // namespace appliance

// edalloc: what a partition has now.

#include <algorithm>
#include <map>
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
    requireState(change.host(), "Operating,Standby");
    Object lpar = change.lpar();
    requireStill(lpar);
    refuseIf(lpar.get("resource_config") != "1", Fault::NoResources, {lpar.get("lpar_id")});
    requireState(lpar, "Running,Not Activated");
    return lpar;
}

Settings settingsOf(const Change& change, const Operation& operation) {
    return settingsOf(change.request(), "-a", operation.attributes);
}

Settings neededSettings(const Change& change, const Operation& operation) {
    Settings settings = settingsOf(change, operation);
    refuseIf(settings.empty(), Fault::MissingOption, {"-a"});
    return settings;
}

int signOf(const Operation& operation) { return *operation.last == 'a' ? 1 : -1; }

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
    const std::int64_t wanted = hundredths(lpar.get("pend_" + quantity)) + change;
    refuseIf(wanted < least || wanted > most, Fault::OutsideLimits, {"pend_" + quantity});
    const Object before = lpar;
    for (const std::string when : {"pend_", "curr_", "run_"}) {
        const bool changes = when != "run_" || isActive(lpar);
        const std::int64_t size = hundredths(before.get(when + quantity)) + (changes ? change : 0);
        lpar.set(when + quantity,
                 quantity == "proc_units" ? units(size) : std::to_string(size / 100));
    }
}

/// As above, within the limits that the partition has from its profile.
void add(Object& lpar, const std::string& quantity, std::int64_t change) {
    add(lpar, quantity, change, hundredths(lpar.get("pend_min_" + quantity)),
        hundredths(lpar.get("pend_max_" + quantity)));
}

/// @param attributes  with commas between them
/// @throws Failure NotEnough one of them is less than @p change
void requireFree(const Row& row, const char* attributes, std::int64_t change) {
    for (const std::string& attribute : split(attributes)) {
        const std::string left = valueOf(row, attribute);
        refuseIf(hundredths(left) < change, Fault::NotEnough, {attribute, left});
    }
}

void changeMemory(Change& change, const Operation& operation) {
    constexpr std::int64_t kMost = 1LL << 40;
    const Request& request = change.request();
    const HostView& host = change.host();
    Object lpar = changeable(change);
    const std::int64_t size = request.number("-q", 1, kMost, 0);
    const std::int64_t entitled = request.number("--entitled", 1, kMost, 0);
    refuseIf(size == 0 && entitled == 0, Fault::MissingOption, {"-q"});
    refuseIf(size % host.memRegion() != 0, Fault::BadOptionValue, {"-q", request.value("-q")});
    const int sign = signOf(operation);
    const bool isShared = lpar.get("mem_mode") == "shared";
    if (size != 0) {
        add(lpar, "mem", sign * size * 100);
    }
    if (!isShared) {
        refuseIf(entitled != 0, Fault::Disagree, {"--entitled", "mem_mode"});
        requireFree({&host, &host.host()}, "curr_avail_sys_mem,pend_avail_sys_mem",
                    sign * size * 100);
    } else {
        // The memory itself comes from the pool as it is used; what I/O may hold is promised.
        requireFree({&host, &host.host()}, "configurable_sys_mem",
                    hundredths(lpar.get("pend_mem")));
        add(lpar, "io_entitled_mem", sign * entitled * 100, 0, hundredths(lpar.get("pend_mem")));
        if (entitled != 0) {
            lpar.set("auto_io_entitled_mem", "0");
        }
        for (const Object& pool : host.all(Kind::MemPool)) {
            requireFree(rowOf(host, pool), "pend_avail_pool_mem", sign * entitled * 100);
        }
    }
    change.put(lpar);
}

/// A partition's virtual processors need a share of units each, and can use no more than one.
void requireShares(const HostView& host, const Object& lpar) {
    const std::int64_t share = hundredths(host.host().get("min_proc_units_per_virtual_proc"));
    const std::int64_t procs = number(lpar.get("pend_procs"));
    const std::int64_t size = hundredths(lpar.get("pend_proc_units"));
    refuseIf(size < procs * share || size > procs * 100, Fault::OutsideLimits, {"pend_proc_units"});
}

void changeProcessors(Change& change, const Operation& operation) {
    constexpr std::int64_t kMost = 1'000'000;
    const Request& request = change.request();
    const HostView& host = change.host();
    Object lpar = changeable(change);
    const std::int64_t procs = request.number("--procs", 1, kMost, 0);
    std::int64_t size = 0;
    refuseIf(request.has("--procunits") &&
                 (!wholeUnits(request.value("--procunits"), &size) || size == 0),
             Fault::BadOptionValue, {"--procunits", request.value("--procunits")});
    refuseIf(procs == 0 && size == 0, Fault::MissingOption, {"--procs"});
    const int sign = signOf(operation);
    const bool isDedicated = lpar.get("pend_proc_mode") == "ded";
    refuseIf(isDedicated && size != 0, Fault::Disagree, {"--procunits", "proc_mode"});
    if (isDedicated) {
        size = procs * 100;
    }
    if (procs != 0) {
        add(lpar, "procs", sign * procs * 100);
    }
    if (size != 0) {
        add(lpar, "proc_units", sign * size);
    }
    if (!isDedicated) {
        requireShares(host, lpar);
    }
    requireFree({&host, &host.host()}, "curr_avail_sys_proc_units,pend_avail_sys_proc_units",
                sign * size);
    const std::string pool = lpar.get("pend_shared_proc_pool_id");
    if (const Object* found = host.find(Kind::ProcPool, "shared_proc_pool_id", pool)) {
        requireFree(rowOf(host, *found), "curr_avail_pool_proc_units,pend_avail_pool_proc_units",
                    sign * size);
    }
    change.put(lpar);
}

void setMemory(Change& change, const Operation& operation) {
    Object lpar = changeable(change);
    for (const Setting& setting : neededSettings(change, operation)) {
        refuseIf(lpar.get("mem_mode") != "shared", Fault::Disagree, {setting.name, "mem_mode"});
        setAll(lpar, setting.name, checkedValue(change.host(), profileRules(), setting));
    }
    change.put(lpar);
}

void setProcessors(Change& change, const Operation& operation) {
    Object lpar = changeable(change);
    for (const Setting& setting : neededSettings(change, operation)) {
        const std::string value = checkedValue(change.host(), profileRules(), setting);
        const std::string before = lpar.get("pend_sharing_mode");
        if (setting.name == "uncap_weight") {
            refuseIf(before != "uncap", Fault::Disagree, {setting.name, "sharing_mode"});
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
}

// Physical slots.

/// The slot that -l names.
Object physicalSlot(Change& change) {
    const Request& request = change.request();
    refuseIf(!request.has("-l"), Fault::MissingOption, {"-l"});
    const Object* slot = change.host().find(Kind::Slot, "drc_index", upperHex(request.value("-l")));
    refuseIf(slot == nullptr, Fault::SlotNotFound, {request.value("-l")});
    return *slot;
}

void moveSlot(Change& change, const Object& slot, std::int64_t lpar) {
    change.remove(slot);
    change.put(slot.movedTo({slot.place().host, lpar}));
}

void addSlot(Change& change, const Operation& operation) {
    const Object lpar = changeable(change);
    Object slot = physicalSlot(change);
    refuseIf(slot.place().lpar != 0, Fault::SlotNotFree,
             {slot.get("drc_index"), std::to_string(slot.place().lpar)});
    const std::int64_t pools = number(change.host().host().get("max_io_pools"));
    for (const Setting& setting : settingsOf(change, operation)) {
        std::int64_t pool = 0;
        refuseIf(setting.value != "none" && (!wholeNumber(setting.value, &pool) || pool >= pools),
                 Fault::BadValue, {setting.name, setting.value});
        slot.set(setting.name, setting.value);
    }
    moveSlot(change, slot, lpar.place().lpar);
}

void removeSlot(Change& change, const Operation&) {
    const Object lpar = changeable(change);
    const Object slot = physicalSlot(change);
    const std::string drc = slot.get("drc_index");
    const std::int64_t id = lpar.place().lpar;
    refuseIf(slot.place().lpar != id, Fault::SlotNotHeld, {drc});
    const Object* profile = change.host().profile(id, lpar.get("curr_profile"));
    if (profile != nullptr && isActive(lpar)) {
        for (const IoSlot& held : ioSlotsFromList(profile->get("io_slots"))) {
            refuseIf(held.drcIndex == drc && held.isRequired, Fault::Required, {drc});
        }
    }
    moveSlot(change, slot, 0);
}

// Virtual adapters.

Kind kindOf(const Operation& operation) {
    const std::string subtype = operation.subtype;
    return subtype == "eth" ? Kind::Ethernet : subtype == "scsi" ? Kind::VirtualScsi : Kind::Serial;
}

/// The slot that -s names, or the first that is free.
std::int64_t freeSlot(const Request& request, const HostView& host, const Object& lpar) {
    const std::int64_t end = number(lpar.get("curr_max_virtual_slots"));
    std::set<std::int64_t> used;
    for (Kind kind : kVirtual) {
        for (const Object& adapter : host.all(kind, lpar.place().lpar)) {
            used.insert(adapter.place().number);
        }
    }
    std::int64_t slot = kFirstSlot;
    while (used.count(slot) != 0) {
        ++slot;
    }
    slot = request.number("-s", 0, 65535, slot);
    refuseIf(slot < kFirstSlot || slot >= end || used.count(slot) != 0, Fault::VirtualSlotNotFree,
             {std::to_string(slot)});
    return slot;
}

void setAdapter(const HostView& host, const Setting& setting, Object& adapter) {
    refuseIf(setting.op != Setting::Operator::Set, Fault::NotAList, {setting.name});
    if (setting.name == "remote_lpar_name") {
        const Object* lpar = host.find(Kind::Lpar, "name", setting.value);
        refuseIf(lpar == nullptr, Fault::LparNameNotFound, {setting.value});
        return adapter.set("remote_lpar_id", lpar->get("lpar_id"));
    }
    const auto value = adapterValue(setting.name, setting.value);
    refuseIf(!value, Fault::BadValue, {setting.name, setting.value});
    adapter.set(setting.name, *value);
}

void requireWhole(const Object& ethernet) {
    refuseIf(!isWhole(ethernet), Fault::Disagree, {"addl_vlan_ids", "ieee_virtual_eth"});
    refuseIf((ethernet.get("is_trunk") == "1") != (ethernet.get("trunk_priority") != "0"),
             Fault::Disagree, {"is_trunk", "trunk_priority"});
}

/// Joins a client to the server that it names or, where it leaves that open, to the first that is
/// free.
void join(const HostView& host, Object& client) {
    std::map<VirtualSlot, const Object*> servers;
    std::map<VirtualSlot, std::int64_t> users;
    for (const Object& other : host.all(client.kind())) {
        if (serves(other, client) && admits(client, slotOf(other)) &&
            other.place().lpar != client.place().lpar) {
            servers.emplace(slotOf(other), &other);
        }
        if (const auto server = serverOf(other)) {
            users.emplace(*server, other.place().lpar);
        }
    }
    if (const auto named = serverOf(client); named && users.count(*named) != 0) {
        throw Failure(Fault::InUse, {std::to_string(users[*named])});
    }
    const auto found = std::find_if(servers.begin(), servers.end(), [&](const auto& server) {
        return users.count(server.first) == 0;
    });
    refuseIf(found == servers.end(), Fault::NoServerAdapter, {client.get("slot_num")});
    client.set("remote_lpar_id", std::to_string(found->first.first));
    client.set("remote_slot_num", std::to_string(found->first.second));
}

void addAdapter(Change& change, const Operation& operation) {
    const HostView& host = change.host();
    const Object lpar = changeable(change);
    const Kind kind = kindOf(operation);
    const Place& place = lpar.place();
    Object adapter(kind, {place.host, place.lpar, freeSlot(change.request(), host, lpar)});
    adapter.set("state", isActive(lpar) ? "1" : "0");
    adapter.set("is_required", "0");
    const Settings settings = settingsOf(change, operation);
    for (const Setting& setting : settings) {
        setAdapter(host, setting, adapter);
    }
    needed(settings, kind == Kind::Ethernet ? "port_vlan_id" : "adapter_type");
    if (kind == Kind::Ethernet) {
        adapter.set("mac_addr", newMac(host, adapter.place()));
        requireWhole(adapter);
    } else if (adapter.get("adapter_type") == "client") {
        if (kind == Kind::Serial) {
            adapter.set("supports_dnx", "0");
        }
        join(host, adapter);
    }
    change.put(adapter);
}

void removeAdapter(Change& change, const Operation& operation) {
    const HostView& host = change.host();
    const Object lpar = changeable(change);
    refuseIf(!change.request().has("-s"), Fault::MissingOption, {"-s"});
    const VirtualSlot slot{lpar.place().lpar, change.request().number("-s", 0, 65535, 0)};
    const std::string text = std::to_string(slot.second);
    const Object* adapter = nullptr;
    for (const Object& other : host.all(kindOf(operation))) {
        if (slotOf(other) == slot) {
            adapter = &other;
        }
        refuseIf(serverOf(other) == slot, Fault::InUse, {std::to_string(other.place().lpar)});
    }
    refuseIf(adapter == nullptr, Fault::AdapterNotFound, {text});
    refuseIf(slot.second < kFirstSlot || (isActive(lpar) && adapter->get("is_required") == "1"),
             Fault::Required, {text});
    change.remove(*adapter);
}

constexpr const char* kEthernetGiven =
    "ieee_virtual_eth,port_vlan_id,addl_vlan_ids,is_trunk,trunk_priority,vswitch";
constexpr const char* kScsiGiven = "adapter_type,remote_lpar_id,remote_lpar_name,remote_slot_num";
constexpr const char* kSerialGiven =
    "adapter_type,remote_lpar_id,remote_lpar_name,remote_slot_num,supports_dnx";

}  // namespace

const std::vector<Operation> kAllocateOperations = {
    {{kEdalloc, "mem", nullptr, "a"}, changeMemory},
    {{kEdalloc, "mem", nullptr, "r"}, changeMemory},
    {{kEdalloc, "mem", nullptr, "s", "mem_weight"}, setMemory},
    {{kEdalloc, "proc", nullptr, "a"}, changeProcessors},
    {{kEdalloc, "proc", nullptr, "r"}, changeProcessors},
    {{kEdalloc, "proc", nullptr, "s", "sharing_mode,uncap_weight"}, setProcessors},
    {{kEdalloc, "io", "slot", "a", "slot_io_pool_id"}, addSlot},
    {{kEdalloc, "io", "slot", "r"}, removeSlot},
    {{kEdalloc, "virtualio", "eth", "a", kEthernetGiven}, addAdapter},
    {{kEdalloc, "virtualio", "eth", "r"}, removeAdapter},
    {{kEdalloc, "virtualio", "scsi", "a", kScsiGiven}, addAdapter},
    {{kEdalloc, "virtualio", "scsi", "r"}, removeAdapter},
    {{kEdalloc, "virtualio", "serial", "a", kSerialGiven}, addAdapter},
    {{kEdalloc, "virtualio", "serial", "r"}, removeAdapter},
};

}  // namespace appliance

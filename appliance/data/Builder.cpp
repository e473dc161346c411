#include "Builder.h"

#include <algorithm>

#include "Adapters.h"
#include "LparState.h"
#include "Text.h"

namespace appliance {

namespace {

constexpr std::int64_t kFirstFreeSlot = 2;  ///< 0 and 1 are the consoles of every partition
constexpr std::int64_t kEthernetSlot = 2;
constexpr std::int64_t kScsiClientSlot = 3;
constexpr std::int64_t kFirstScsiServerSlot = 10;
constexpr std::int64_t kSlotsPerBus = 8;
constexpr std::int64_t kBusesPerUnit = 2;

bool isDedicated(const LparPlan& plan) { return plan.sharing != "cap" && plan.sharing != "uncap"; }

std::string rounded(std::int64_t mem) {
    return std::to_string((mem + kMemRegion - 1) / kMemRegion * kMemRegion);
}

/// Sets "<prefix>min<suffix>" and its like to a share of the plan's resources: a partition and its
/// profiles name the same quantities differently.
void setQuantities(Object& object, const LparPlan& plan, const char* desired, const char* prefix) {
    const std::string p = prefix, d = desired;
    const std::int64_t procs = (plan.procUnits + 99) / 100;
    const std::int64_t least =
        isDedicated(plan) ? 100 : std::max<std::int64_t>(5, plan.procUnits / 2);
    object.set(p + "min_mem", rounded(plan.mem / 2));
    object.set(d + "mem", rounded(plan.mem));
    object.set(p + "max_mem", rounded(plan.mem * 2));
    object.set(p + "min_procs", std::to_string((least + 99) / 100));
    object.set(d + "procs", std::to_string(procs));
    object.set(p + "max_procs", std::to_string(procs * 2));
    object.set(p + "min_proc_units", units(least));
    object.set(d + "proc_units", units(plan.procUnits));
    object.set(p + "max_proc_units", units(isDedicated(plan) ? procs * 200 : plan.procUnits * 2));
}

/// Sets how processors are shared, under names that begin with @p prefix.
void setSharing(Object& object, const LparPlan& plan, const std::string& prefix) {
    object.set(prefix + "sharing_mode", plan.sharing);
    if (isDedicated(plan)) {
        object.set(prefix + "proc_mode", "ded");
        object.set(prefix + "shared_proc_pool_id", "null");
        return;
    }
    if (plan.sharing == "uncap") object.set(prefix + "uncap_weight", "128");
    if (plan.procPool != 0) {
        object.set(prefix + "shared_proc_pool_id", std::to_string(plan.procPool));
    }
}

/// What runs is what is in effect, as long as nothing else is stored.
void setState(Object& lpar, const LparPlan& plan) {
    lpar.set("state", plan.state);
    if (plan.state != "Not Activated") lpar.set("os_version", osVersion(plan.env));
    if (!isActive(lpar)) setInactive(lpar, plan.state.c_str());
}

}  // namespace

HostBuilder::HostBuilder(Store& store, std::int64_t number, const HostPlan& plan)
    : m_store(store), m_number(number), m_host(Kind::Host, {number}) {
    m_host.set("name", plan.name);
    m_host.set("type_model", plan.typeModel);
    m_host.set("serial_num", plan.serial);
    m_host.set("state", plan.state);
    m_host.set("ipaddr", "10." + std::to_string(number / 65536 % 256) + '.' +
                             std::to_string(number / 256 % 256) + '.' +
                             std::to_string(number % 256));
    m_host.set("installed_sys_mem", std::to_string(plan.mem));
    m_host.set("sys_firmware_mem", std::to_string(kFirmwareMem));
    m_host.set("mem_region_size", std::to_string(kMemRegion));
    m_host.set("installed_sys_proc_units", units(plan.procUnits));
    m_host.set("mac_prefix", "A2" + hex(number, 4));
    addLinks(plan);

    Object pool(Kind::ProcPool, {m_number});
    pool.set("name", "DefaultPool");
    m_ofHost.push_back(pool);
    if (plan.memPool == 0) return;
    Object memPool(Kind::MemPool, {m_number});
    memPool.set("curr_pool_mem", std::to_string(plan.memPool));
    m_ofHost.push_back(memPool);
}

void HostBuilder::addLinks(const HostPlan& plan) {
    for (std::int64_t i = 0; i < 2; ++i) {
        Object link(Kind::Link, {m_number, 0, i});
        link.set("sp", i == 0 ? "primary" : "secondary");
        link.set("sp_phys_loc",
                 'U' + plan.typeModel + '.' + plan.serial + "-P1-C" + std::to_string(i + 1));
        link.set("ipaddr", i == 0 ? m_host.get("ipaddr") : "172." + m_host.get("ipaddr").substr(3));
        if (plan.state == "No Connection") {
            link.set("state", "No Connection");
            link.set("connection_error_code", "unreachable");
        }
        m_ofHost.push_back(link);
    }
}

Object& HostBuilder::addTo(std::int64_t lpar, Kind kind, std::int64_t number) {
    auto& objects = m_lpars[lpar];
    objects.emplace_back(kind, Place{m_number, lpar, number});
    return objects.back();
}

void HostBuilder::add(const LparPlan& plan) {
    Object& lpar = addTo(plan.id, Kind::Lpar, 0);
    lpar.set("name", plan.name);
    lpar.set("lpar_env", plan.env);
    lpar.set("default_profile", plan.profile);
    setQuantities(lpar, plan, "pend_", "pend_");
    setSharing(lpar, plan, "pend_");
    setState(lpar, plan);

    Object& profile = addTo(plan.id, Kind::Profile, 0);
    profile.set("name", plan.profile);
    setQuantities(profile, plan, "desired_", "");
    setSharing(profile, plan, "");

    addAdapters(plan);
    addSlots(plan);
}

void HostBuilder::add(const Object& object) { objectsOf(object.place().lpar).push_back(object); }

std::vector<Object>& HostBuilder::objectsOf(std::int64_t lpar) {
    return lpar == 0 ? m_ofHost : m_lpars.at(lpar);
}

Object& HostBuilder::first(Kind kind, std::int64_t lpar) {
    auto& objects = objectsOf(lpar);
    return *std::find_if(objects.begin(), objects.end(),
                         [&](const Object& object) { return object.kind() == kind; });
}

void HostBuilder::addProfile(std::int64_t lpar, const std::string& name) {
    const auto& objects = m_lpars.at(lpar);
    const auto number = std::count_if(objects.begin(), objects.end(), [](const Object& object) {
        return object.kind() == Kind::Profile;
    });
    Object profile(Kind::Profile, {m_number, lpar, number}, first(Kind::Profile, lpar).stored());
    profile.set("name", name);
    profile.set("desired_mem", profile.get("min_mem"));
    profile.set("desired_proc_units", profile.get("min_proc_units"));
    profile.set("desired_procs", profile.get("min_procs"));
    m_lpars[lpar].push_back(profile);
}

void HostBuilder::addAdapters(const LparPlan& plan) {
    const char* state = plan.state == "Not Activated" ? "0" : "1";
    for (std::int64_t console = 0; console < kFirstFreeSlot; ++console) {
        addTo(plan.id, Kind::Serial, console).set("state", state);
    }
    Object& eth = addTo(plan.id, Kind::Ethernet, kEthernetSlot);
    eth.set("state", state);
    eth.set("port_vlan_id", std::to_string(1 + plan.id % 4));
    eth.set("mac_addr", m_host.get("mac_prefix") + hex(plan.id, 4) + hex(kEthernetSlot, 2));
    if (plan.env == "xbrgserver") {
        // The bridge carries the networks of all the others.
        eth.set("ieee_virtual_eth", "1");
        eth.set("addl_vlan_ids", "10,20,30");
        eth.set("is_trunk", "1");
        eth.set("trunk_priority", std::to_string(plan.id));
    }
    if (plan.scsiServer != 0) addScsi(plan);
}

void HostBuilder::addScsi(const LparPlan& plan) {
    const std::int64_t serverSlot = kFirstScsiServerSlot + plan.id;
    Object& client = addTo(plan.id, Kind::VirtualScsi, kScsiClientSlot);
    client.set("adapter_type", "client");
    client.set("remote_lpar_id", std::to_string(plan.scsiServer));
    client.set("remote_slot_num", std::to_string(serverSlot));
    client.set("is_required", "1");
    Object& server = addTo(plan.scsiServer, Kind::VirtualScsi, serverSlot);
    server.set("adapter_type", "server");
    server.set("remote_lpar_id", std::to_string(plan.id));
    server.set("remote_slot_num", std::to_string(kScsiClientSlot));
    server.set("backing_devices", "disk" + std::to_string(plan.id));
}

void HostBuilder::addSlots(const LparPlan& plan) {
    if (plan.env == "tmxlinux") return;
    std::vector<Object>& objects = m_lpars[plan.id];
    std::vector<std::string>& list = m_slots[plan.id];
    const std::string drc = addSlot(objects, plan.id, "Storage controller");
    list.push_back(drc + "/none/1");
    if (plan.env == "xbrgserver") {
        list.push_back(addSlot(objects, plan.id, "PCI 1Gbps Ethernet") + "/none/0");
        return;
    }
    for (Object& object : objects) {
        if (object.kind() != Kind::Lpar && object.kind() != Kind::Profile) continue;
        object.set("load_source_slot", drc);
        object.set("alt_restart_device_slot", drc);
        object.set("console_slot", "dnx");
    }
}

std::string HostBuilder::addSlot(std::vector<Object>& into, std::int64_t lpar,
                                 const char* description) {
    const std::int64_t bus = m_slotCount / kSlotsPerBus + 1;
    const std::string unit =
        "U2222.00" + std::to_string((bus - 1) / kBusesPerUnit + 1) + '.' + m_host.get("serial_num");
    if (m_slotCount % (kSlotsPerBus * kBusesPerUnit) == 0) {
        Object place(Kind::Unit, {m_number, 0, (bus - 1) / kBusesPerUnit});
        place.set("unit_phys_loc", unit);
        m_ofHost.push_back(place);
    }
    if (m_slotCount % kSlotsPerBus == 0) {
        Object place(Kind::Bus, {m_number, 0, bus});
        place.set("unit_phys_loc", unit);
        m_ofHost.push_back(place);
    }
    const std::int64_t inUnit = m_slotCount % (kSlotsPerBus * kBusesPerUnit) + 1;
    std::string drc = hex(0x30000000 + ++m_slotCount, 8);
    Object& slot = into.emplace_back(Kind::Slot, Place{m_number, lpar, m_slotCount});
    slot.set("unit_phys_loc", unit);
    slot.set("bus_id", std::to_string(bus));
    slot.set("phys_loc", unit + "-P1-C" + std::to_string(inUnit));
    slot.set("drc_index", drc);
    if (description == nullptr) return drc;
    slot.set("description", description);
    slot.set("feature_codes", "2201,2202");
    slot.set("pci_vendor_id", "1234");
    slot.set("pci_device_id", "0101");
    slot.set("pci_subs_vendor_id", "1234");
    slot.set("pci_subs_device_id", "0102");
    slot.set("pci_class", "0104");
    slot.set("pci_revision_id", "01");
    return drc;
}

void HostBuilder::writeLists(std::vector<Object>& objects) {
    std::vector<Object*> owners;  // the partition and its profiles
    std::map<Kind, std::vector<std::string>> lists;
    std::int64_t highest = 0;
    for (Object& object : objects) {
        const bool isProfile = object.kind() == Kind::Profile;
        if (isProfile || object.kind() == Kind::Lpar) owners.push_back(&object);
        const AdapterForm* form = adapterForm(object.kind());
        if (form == nullptr) continue;
        lists[object.kind()].push_back(adapterElement(*form, object));
        highest = std::max(highest, object.place().number);
    }
    const bool isBridge = objects.front().get("lpar_env") == "xbrgserver";
    const std::string slots =
        std::to_string(std::max<std::int64_t>(isBridge ? 20 : 10, highest + 5));
    for (Object* owner : owners) {
        if (owner->kind() == Kind::Lpar) {
            owner->set("pend_max_virtual_slots", slots);
            continue;
        }
        owner->set("max_virtual_slots", slots);
        for (const auto& [kind, elements] : lists) {
            owner->set(adapterForm(kind)->list, adapterList(elements));
        }
        owner->set("io_slots", adapterList(m_slots[objects.front().place().lpar]));
    }
}

void HostBuilder::finish() {
    constexpr int kFreeSlots = 2;
    for (int i = 0; i < kFreeSlots; ++i) addSlot(m_ofHost, 0, nullptr);
    m_store.put(m_host);
    for (const Object& object : m_ofHost) m_store.put(object);
    std::vector<std::string> starts;
    for (auto& [id, objects] : m_lpars) {
        writeLists(objects);
        for (const Object& object : objects) m_store.put(object);
        starts.push_back(std::to_string(id) + "/0");
    }
    if (starts.empty()) return;
    Object all(Kind::SystemProfile, {m_number});
    all.set("name", "all");
    all.set("lpar_profiles", joined(starts));
    m_store.put(all);
}

}  // namespace appliance

#include "Builder.h"

#include <algorithm>
#include <sstream>

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
void setQuantities(Object& object, const LparPlan& plan, const std::string& desired,
                   const std::string& prefix) {
    const std::int64_t procs = (plan.procUnits + 99) / 100;
    const std::int64_t least =
        isDedicated(plan) ? 100 : std::max<std::int64_t>(5, plan.procUnits / 2);
    const std::int64_t most = isDedicated(plan) ? procs * 200 : plan.procUnits * 2;
    object.set(prefix + "min_mem", rounded(plan.mem / 2));
    object.set(desired + "mem", rounded(plan.mem));
    object.set(prefix + "max_mem", rounded(plan.mem * 2));
    object.set(prefix + "min_procs", std::to_string((least + 99) / 100));
    object.set(desired + "procs", std::to_string(procs));
    object.set(prefix + "max_procs", std::to_string(procs * 2));
    object.set(prefix + "min_proc_units", units(least));
    object.set(desired + "proc_units", units(plan.procUnits));
    object.set(prefix + "max_proc_units", units(most));
}

/// Sets how processors are shared, under names that begin with @p prefix.
void setSharing(Object& object, const LparPlan& plan, const std::string& prefix) {
    object.set(prefix + "sharing_mode", plan.sharing);
    if (isDedicated(plan)) {
        object.set(prefix + "proc_mode", "ded");
        object.set(prefix + "shared_proc_pool_id", "null");
        return;
    }
    if (plan.sharing == "uncap") {
        object.set(prefix + "uncap_weight", "128");
    }
    if (plan.procPool != 0) {
        object.set(prefix + "shared_proc_pool_id", std::to_string(plan.procPool));
    }
}

/// What runs is what is in effect, as long as nothing else is stored.
void setState(Object& lpar, const LparPlan& plan) {
    lpar.set("state", plan.state);
    if (plan.state != "Not Activated") {
        lpar.set("os_version", osVersion(plan.env));
    }
    if (!isActive(lpar)) {
        setInactive(lpar, plan.state.c_str());
    }
}

}  // namespace

void set(Object& object, const std::string& settings) {
    std::istringstream in(settings);
    for (std::string name, value; std::getline(in, name, '=') && std::getline(in, value, ';');) {
        object.set(name, value);
    }
}

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

    add(Kind::ProcPool, {m_number}).set("name", "DefaultPool");
    if (plan.memPool == 0) {
        return;
    }
    add(Kind::MemPool, {m_number}).set("curr_pool_mem", std::to_string(plan.memPool));
}

void HostBuilder::addLinks(const HostPlan& plan) {
    for (std::int64_t i = 0; i < 2; ++i) {
        Object& link = add(Kind::Link, {m_number, 0, i});
        link.set("sp", i == 0 ? "primary" : "secondary");
        link.set("sp_phys_loc",
                 'U' + plan.typeModel + '.' + plan.serial + "-P1-C" + std::to_string(i + 1));
        link.set("ipaddr", i == 0 ? m_host.get("ipaddr") : "172." + m_host.get("ipaddr").substr(3));
        if (plan.state == "No Connection") {
            set(link, "state=No Connection;connection_error_code=unreachable");
        }
    }
}

Object& HostBuilder::add(Kind kind, const Place& place) {
    return m_objects[place.lpar].emplace_back(kind, place);
}

void HostBuilder::add(const LparPlan& plan) {
    Object& lpar = add(Kind::Lpar, {m_number, plan.id});
    lpar.set("name", plan.name);
    lpar.set("lpar_env", plan.env);
    lpar.set("default_profile", plan.profile);
    setQuantities(lpar, plan, "pend_", "pend_");
    setSharing(lpar, plan, "pend_");
    setState(lpar, plan);

    Object& profile = add(Kind::Profile, {m_number, plan.id});
    profile.set("name", plan.profile);
    setQuantities(profile, plan, "desired_", "");
    setSharing(profile, plan, "");

    addAdapters(plan);
    addSlots(plan);
}

Object& HostBuilder::first(Kind kind, std::int64_t lpar) {
    std::vector<Object>& objects = m_objects.at(lpar);
    return *std::find_if(objects.begin(), objects.end(),
                         [&](const Object& object) { return object.kind() == kind; });
}

void HostBuilder::addProfile(std::int64_t lpar, const std::string& name) {
    std::vector<Object>& objects = m_objects.at(lpar);
    const auto number = std::count_if(objects.begin(), objects.end(), [](const Object& object) {
        return object.kind() == Kind::Profile;
    });
    Object profile(Kind::Profile, {m_number, lpar, number}, first(Kind::Profile, lpar).stored());
    profile.set("name", name);
    for (const std::string quantity : {"mem", "proc_units", "procs"}) {
        profile.set("desired_" + quantity, profile.get("min_" + quantity));
    }
    objects.push_back(profile);
}

void HostBuilder::addAdapters(const LparPlan& plan) {
    const char* state = plan.state == "Not Activated" ? "0" : "1";
    for (std::int64_t console = 0; console < kFirstFreeSlot; ++console) {
        add(Kind::Serial, {m_number, plan.id, console}).set("state", state);
    }
    Object& eth = add(Kind::Ethernet, {m_number, plan.id, kEthernetSlot});
    eth.set("state", state);
    eth.set("port_vlan_id", std::to_string(1 + plan.id % 4));
    eth.set("mac_addr", m_host.get("mac_prefix") + hex(plan.id, 4) + hex(kEthernetSlot, 2));
    if (plan.env == "xbrgserver") {
        // The bridge carries the networks of all the others.
        set(eth, "ieee_virtual_eth=1;addl_vlan_ids=10,20,30;is_trunk=1");
        eth.set("trunk_priority", std::to_string(plan.id));
    }
    if (plan.scsiServer != 0) {
        addScsi(plan);
    }
}

void HostBuilder::addScsi(const LparPlan& plan) {
    const std::string id = std::to_string(plan.id);
    const std::int64_t serverSlot = kFirstScsiServerSlot + plan.id;
    set(add(Kind::VirtualScsi, {m_number, plan.id, kScsiClientSlot}),
        "adapter_type=client;remote_lpar_id=" + std::to_string(plan.scsiServer) +
            ";remote_slot_num=" + std::to_string(serverSlot) + ";is_required=1");
    set(add(Kind::VirtualScsi, {m_number, plan.scsiServer, serverSlot}),
        "adapter_type=server;remote_lpar_id=" + id +
            ";remote_slot_num=" + std::to_string(kScsiClientSlot) + ";backing_devices=disk" + id);
}

void HostBuilder::addSlots(const LparPlan& plan) {
    if (plan.env == "tmxlinux") {
        return;
    }
    std::vector<std::string>& list = m_slots[plan.id];
    const std::string drc = addSlot(plan.id, "Storage controller");
    list.push_back(drc + "/none/1");
    if (plan.env == "xbrgserver") {
        list.push_back(addSlot(plan.id, "PCI 1Gbps Ethernet") + "/none/0");
        return;
    }
    const std::string tags =
        "load_source_slot=" + drc + ";alt_restart_device_slot=" + drc + ";console_slot=dnx";
    for (Kind kind : {Kind::Lpar, Kind::Profile}) {
        set(first(kind, plan.id), tags);
    }
}

std::string HostBuilder::addSlot(std::int64_t lpar, const char* description) {
    constexpr std::int64_t kSlotsPerUnit = kSlotsPerBus * kBusesPerUnit;
    const std::int64_t bus = m_slotCount / kSlotsPerBus + 1;
    const std::int64_t unitIndex = m_slotCount / kSlotsPerUnit;
    const std::int64_t inUnit = m_slotCount % kSlotsPerUnit + 1;
    const std::string unit =
        "U2222.00" + std::to_string(unitIndex + 1) + '.' + m_host.get("serial_num");
    if (inUnit == 1) {
        add(Kind::Unit, {m_number, 0, unitIndex}).set("unit_phys_loc", unit);
    }
    if (m_slotCount % kSlotsPerBus == 0) {
        add(Kind::Bus, {m_number, 0, bus}).set("unit_phys_loc", unit);
    }
    std::string drc = hex(0x30000000 + ++m_slotCount, 8);
    Object& slot = add(Kind::Slot, {m_number, lpar, m_slotCount});
    set(slot, "unit_phys_loc=" + unit + ";bus_id=" + std::to_string(bus) + ";phys_loc=" + unit +
                  "-P1-C" + std::to_string(inUnit) + ";drc_index=" + drc);
    if (description == nullptr) {
        return drc;
    }
    slot.set("description", description);
    set(slot,
        "feature_codes=2201,2202;pci_vendor_id=1234;pci_device_id=0101;pci_subs_vendor_id=1234;"
        "pci_subs_device_id=0102;pci_class=0104;pci_revision_id=01");
    return drc;
}

void HostBuilder::writeLists(std::vector<Object>& objects) {
    std::vector<Object*> owners;  // the partition and its profiles
    std::map<Kind, std::vector<std::string>> lists;
    std::int64_t highest = 0;
    for (Object& object : objects) {
        const bool isProfile = object.kind() == Kind::Profile;
        if (isProfile || object.kind() == Kind::Lpar) {
            owners.push_back(&object);
        }
        const AdapterForm* form = adapterForm(object.kind());
        if (form == nullptr) {
            continue;
        }
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
    for (int i = 0; i < kFreeSlots; ++i) {
        addSlot(0, nullptr);
    }
    m_store.put(m_host);
    std::vector<std::string> starts;
    for (auto& [id, objects] : m_objects) {
        if (id != 0) {
            writeLists(objects);
            starts.push_back(std::to_string(id) + "/0");
        }
        for (const Object& object : objects) {
            m_store.put(object);
        }
    }
    if (starts.empty()) {
        return;
    }
    Object all(Kind::SystemProfile, {m_number});
    all.set("name", "all");
    all.set("lpar_profiles", joined(starts));
    m_store.put(all);
}

}  // namespace appliance

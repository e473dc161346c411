#include "Family.h"

#include <algorithm>
#include <array>
#include <cstdlib>
#include <cstring>

#include "Text.h"

namespace appliance {

namespace {

// Words and codes. A row without a word stands for all other words, one without a code keeps them.

struct Code {
    const char* word;
    const char* code;
};

constexpr Code kHostState[] = {
    {"Standby", "0"},
    {"Operating", "1"},
    {"Power Off", "3"},
    {"Initializing", "6"},
    {"Error", "12"},
    {"Error - Dump in progress", "13"},
    {"Error - Terminated", "14"},
    {"QCAP Click to Accept", "15"},
    {"Power Off In Progress", "32"},
    {"Service Processor Failover In Progress", "33"},
    {"Failed Authentication", "241"},
    {"Pending Authentication - Password Updates Required", "242"},
    {"Version Mismatch", "250"},
    {"Recovery", "251"},
    {"Incomplete", "253"},
    {"No Connection", "254"},
    {nullptr, "255"},
};

constexpr Code kLparState[] = {
    {"Not Activated", "0"}, {"Starting", "1"},        {"Running", "2"},
    {"Shutting Down", "3"}, {"Error", "4"},           {"Open Firmware", "8"},
    {"Suspended", "9"},     {"Not Available", "252"}, {nullptr, "255"},
};

constexpr Code kMigrationState[] = {
    {"Not Migrating", "9"},
    {"Migration Starting", "10"},
    {"Migration Stopped", "12"},
    {"Migration In Progress", "13"},
    {"Migration Complete", "16"},
    {"Lost Connection", "255"},
    {nullptr, "0"},
};

constexpr Code kCompatMode[] = {
    {"CORAL5", "0"},          {"CORAL6_enhanced", "1"},  {"CORAL6", "2"},
    {"CORAL6+", "3"},         {"CORAL7", "4"},           {"CORAL6+_enhanced", "5"},
    {"CORAL7_enhanced", "6"}, {"CORAL7+", "7"},          {"CORAL7+_enhanced", "8"},
    {"CORAL8", "9"},          {"CORAL8_enhanced", "10"}, {"default", "63"},
    {nullptr, "255"},
};

constexpr Code kBootMode[] = {
    {"norm", "1"}, {"ds", "2"}, {"sms", "3"}, {"of", "4"}, {"dd", "5"}, {nullptr, "0"},
};

constexpr Code kKeylock[] = {{"norm", "4"}, {"manual", "2"}, {nullptr, nullptr}};
constexpr Code kMemMode[] = {{"ded", "255"}, {nullptr, "0"}};

// How processors are shared is one word, and two codes: whether the partition is greedy (uncapped,
// or keeps its idle processors), and whether it donates while it runs.
constexpr Code kSharing[] = {
    {"uncap", "1"}, {"keep_idle_procs", "1"}, {"share_idle_procs_active", "1"}, {nullptr, "0"}};
constexpr Code kDonor[] = {
    {"share_idle_procs_always", "1"}, {"share_idle_procs_active", "1"}, {nullptr, "0"}};

constexpr Code kEntitled[] = {{"auto", "0"}, {nullptr, nullptr}};
constexpr Code kEntitledMode[] = {{"auto", "1"}, {nullptr, "0"}};

constexpr Code kAdapterType[] = {{"client", "0"}, {nullptr, "1"}};
constexpr Code kAny[] = {{"any", "65535"}, {nullptr, nullptr}};
constexpr Code kConnection[] = {
    {"unavailable", "null"}, {"none", "0"}, {"active", "1"}, {nullptr, "2"}};
constexpr Code kTruth[] = {{"1", "true"}, {nullptr, "false"}};
constexpr Code kNoIds[] = {{"none", ""}, {nullptr, nullptr}};
constexpr Code kNoPool[] = {{"none", "65535"}, {nullptr, nullptr}};
constexpr Code kNoParent[] = {{"none", "null"}, {nullptr, nullptr}};
constexpr Code kNoOwner[] = {{"null", ""}, {nullptr, nullptr}};  // of a slot that is free

std::string codeOf(const Code* codes, const std::string& word) {
    while (codes->word != nullptr && word != codes->word) ++codes;
    return codes->code == nullptr ? word : codes->code;
}

template <const Code* codes>
std::string code(const Row& row, const char* attribute) {
    return codeOf(codes, valueOf(row, attribute));
}

// Values.

std::string same(const Row& row, const char* attribute) { return valueOf(row, attribute); }

std::string constant(const Row&, const char* value) { return value; }

std::string hostKey(const Row& row, const char*) { return row.view->mtms(); }

std::string lparKey(const Row& row, const char*) {
    return std::to_string(row.self->place().lpar) + '*' + row.view->mtms();
}

/// The key of a profile: its number in front of its partition's key.
std::string profileKey(const Row& row, const char* attribute) {
    return std::to_string(row.self->place().number) + '*' + lparKey(row, attribute);
}

std::string percent(const Row& row, const char* attribute) {
    return std::to_string(hundredths(valueOf(row, attribute)));
}

std::string whole(const Row& row, const char* attribute) {
    return std::to_string(hundredths(valueOf(row, attribute)) / 100);
}

std::string bracketed(const Row& row, const char* attribute) {
    return '[' + valueOf(row, attribute) + ']';
}

std::string decimal(const Row& row, const char* attribute) {
    return std::to_string(std::strtoul(valueOf(row, attribute).c_str(), nullptr, 16));
}

/// Address of the service processor @p role; empty when the host has no such link.
std::string addressOf(const Row& row, const char* role) {
    for (const Object& link : row.view->all(Kind::Link)) {
        if (link.get("sp") == role) return link.get("ipaddr");
    }
    return {};
}

std::string compatModes(const Row& row, const char* attribute) {
    std::vector<std::string> codes;
    for (const std::string& mode : split(valueOf(row, attribute))) {
        codes.push_back(codeOf(kCompatMode, mode));
    }
    return '[' + joined(codes) + ']';
}

/// The environment, odd while the partition holds resources.
std::string definition(const Row& row, const char*) {
    const std::string env = row.lpar->get("lpar_env");
    const int first = env == "tmxlinux" ? 1 : env == "xbrgserver" ? 3 : env == "osq00" ? 129 : 0;
    return std::to_string(first + (first != 0 && row.lpar->get("resource_config") == "0"));
}

/// "<number>,<name>" of the partition's profile whose name stands in @p attribute.
std::string profileOf(const Row& row, const char* attribute) {
    const std::string name = valueOf(row, attribute);
    if (name.empty()) return "null,";
    const std::int64_t id = row.self->place().lpar;
    const auto& profiles = row.view->all(Kind::Profile);
    auto profile = std::lower_bound(
        profiles.begin(), profiles.end(), id,
        [](const Object& object, std::int64_t wanted) { return object.place().lpar < wanted; });
    for (; profile != profiles.end() && profile->place().lpar == id; ++profile) {
        if (profile->get("name") == name) {
            return std::to_string(profile->place().number) + ',' + name;
        }
    }
    return "0," + name;
}

/// The pool of shared processors, or 255 for dedicated ones; attributes begin with @p prefix.
std::string procMode(const Row& row, const char* prefix) {
    const std::string p = prefix;
    return valueOf(row, p + "proc_mode") == "ded" ? "255" : valueOf(row, p + "shared_proc_pool_id");
}

/// What a host can do: bits of the words of one list.
struct CapabilityBit {
    std::size_t word;
    unsigned bit;
    const char* attribute;
};

constexpr CapabilityBit kCapabilities[] = {
    {0, 8, "virtual_io_server_capable"},
    {0, 32, "redundant_err_path_reporting_capable"},
    {0, 64, "osq00_capable"},
    {1, 1, "virtual_switch_capable"},
    {1, 32, "active_lpar_mobility_capable"},
    {1, 64, "inactive_lpar_mobility_capable"},
    {2, 16, "lpar_proc_compat_mode_capable"},
    {5, 16, "lpar_suspend_capable"},
};

std::string capabilities(const Row& row, const char*) {
    std::array<unsigned, 8> words{};
    for (const CapabilityBit& capability : kCapabilities) {
        if (valueOf(row, capability.attribute) == "1") words[capability.word] |= capability.bit;
    }
    std::string list;
    for (unsigned word : words) list += (list.empty() ? '[' : ',') + std::to_string(word);
    return list + ']';
}

std::string runtimeCapability(const Row& row, const char* attribute) {
    return valueOf(row, attribute) == "1" ? std::to_string(1U << 30) : "0";
}

// The tables, one for each family.

constexpr Property kCec[] = {
    {"Name", 1, hostKey, ""},
    {"UserDefinedName", 1, same, "name"},
    {"State", 1, code<kHostState>, "state"},
    {"PrimaryFSP_IP", 1, addressOf, "primary"},
    {"BackupFSP_IP", 1, addressOf, "secondary"},
    {"RuntimeCapability", 1, runtimeCapability, "osq00_capable"},
    {"ProcCompatModesSupported", 2, compatModes, "lpar_proc_compat_modes"},
    {"Capability", 2, constant, "0"},
    {"GlvExCaps", 2, capabilities, ""},
    // What the pool of all shared processors has, as the tools print it.
    {"ConfigurableProcUnits", 2, same, "configurable_pool_proc_uints"},
    {"PendAvailProcUnits", 2, same, "pend_avail_sys_proc_units"},
};

constexpr Property kLpar[] = {
    {"Name", 1, lparKey, ""},
    {"UserDefinedName", 1, same, "name"},
    {"DefinitionState", 1, definition, ""},
    {"PartitionState", 1, code<kLparState>, "state"},
    {"BootMode", 1, code<kBootMode>, "boot_mode"},
    {"MigrationState", 1, code<kMigrationState>, "migration_state"},
    {"Lpar_env", 1, same, "lpar_env"},
    {"Default_prof", 2, profileOf, "default_profile"},
    {"Curr_prof", 2, profileOf, "curr_profile"},
    {"Keylock", 2, code<kKeylock>, "lpar_keylock"},
    {"RedundantPath", 2, same, "redundant_err_path_reporting"},
    {"ProcCompatMode", 2, code<kCompatMode>, "desired_lpar_proc_compat_mode"},
    {"ActualProcCompatMode", 2, code<kCompatMode>, "curr_lpar_proc_compat_mode"},
    {"PowerOnWithHypervisor", 2, same, "auto_start"},
};

constexpr Property kProfile[] = {
    {"Name", 1, profileKey, ""},
    {"PartitionName", 1, lparKey, ""},
    {"UserDefinedName", 1, same, "name"},
    {"DefinitionState", 1, definition, ""},
    {"SFPSurveillance", 1, same, "conn_monitoring"},
    {"lpar_env", 1, same, "lpar_env"},
    {"lpar_name", 1, same, "lpar_name"},
    {"AutoIPLEnabled", 2, same, "auto_start"},
    {"MaxVirtualSlots", 2, same, "max_virtual_slots"},
    {"BootMode", 2, code<kBootMode>, "boot_mode"},
    {"RedundantPath", 2, same, "redundant_err_path_reporting"},
    {"ProcMode", 2, procMode, ""},
    {"ProcessorMode", 2, code<kCompatMode>, "lpar_proc_compat_mode"},
    {"SharingMode", 2, code<kSharing>, "sharing_mode"},
    {"DonorMode", 2, code<kDonor>, "sharing_mode"},
    {"UncappedWeight", 2, same, "uncap_weight"},
    {"MinProcUnit", 2, percent, "min_proc_units"},
    {"DesiredProcUnit", 2, percent, "desired_proc_units"},
    {"MaxProcUnit", 2, percent, "max_proc_units"},
    {"MinimumCPUCount", 2, same, "min_procs"},
    {"DesiredCPUCount", 2, same, "desired_procs"},
    {"MaximumCPUCount", 2, same, "max_procs"},
    {"SharedProcPoolId", 2, same, "shared_proc_pool_id"},
    {"MinimumMemory", 2, same, "min_mem"},
    {"DesiredMemory", 2, same, "desired_mem"},
    {"MaximumMemory", 2, same, "max_mem"},
    {"MemMode", 2, code<kMemMode>, "mem_mode"},
    {"VRMWeight", 2, same, "mem_weight"},
    {"EntitledMode", 2, code<kEntitledMode>, "desired_io_entitled_mem"},
    {"EntMem", 2, code<kEntitled>, "desired_io_entitled_mem"},
    {"AltConsoleDRCIndex", 2, same, "alt_console_slot"},
    {"AltLoadSourceDRCIndex", 2, same, "alt_restart_device_slot"},
    {"ConsoleDRCIndex", 2, same, "console_slot"},
    {"LoadSourceDRCIndex", 2, same, "load_source_slot"},
    {"ECSDRCIndex", 2, same, "op_console_slot"},
    {"virtual_serial_adapters", 2, same, "virtual_serial_adapters"},
    {"virtual_scsi_adapters", 2, same, "virtual_scsi_adapters"},
    {"virtual_eth_adapters", 2, same, "virtual_eth_adapters"},
    {"io_slots", 2, same, "io_slots"},
};

constexpr Property kCecMemoryCfg[] = {
    {"Name", 1, hostKey, ""},
    {"ConfigurableMem", 2, same, "configurable_sys_mem"},
    {"InstalledMemory", 2, same, "installed_sys_mem"},
    {"MaxMemPools", 2, same, "max_mem_pools"},
    {"PendAvailMem", 2, same, "pend_avail_sys_mem"},
    {"LMBSize", 2, same, "mem_region_size"},
};

constexpr Property kCecMemoryPool[] = {
    {"SystemName", 1, hostKey, ""},
    {"curr_pool_mem", 2, same, "curr_pool_mem"},
    {"pend_pool_mem", 2, same, "pend_pool_mem"},
    {"pend_avail_pool_mem", 2, same, "pend_avail_pool_mem"},
};

// Processing units of hosts and pools stand as the tools print them: readers take them as such.
constexpr Property kCecProcessorCfg[] = {
    {"Name", 1, hostKey, ""},
    {"ConfigurableProcUnits", 2, same, "configurable_sys_proc_units"},
    {"CurAvailProcUnits", 2, same, "curr_avail_sys_proc_units"},
    {"InstalledProcessors", 2, whole, "installed_sys_proc_units"},
    {"MaxProcPools", 2, same, "max_shared_proc_pools"},
    {"MinProcUnit", 2, same, "min_proc_units_per_virtual_proc"},
    {"PendAvailProcUnits", 2, same, "pend_avail_sys_proc_units"},
};

constexpr Property kCecProcessorPool[] = {
    {"SystemName", 1, hostKey, ""},
    {"SharedProcPoolId", 1, same, "shared_proc_pool_id"},
    {"MaxPoolCapacity", 2, same, "max_pool_proc_units"},
    {"PendReservedPoolCapacity", 2, same, "pend_reserved_pool_proc_units"},
    {"lpar_ids", 2, same, "lpar_ids"},
};

constexpr Property kLparMemoryCfg[] = {
    {"Name", 1, lparKey, ""},
    {"UserDefinedName", 1, same, "name"},
    {"CurAllocMem", 2, same, "curr_mem"},
    {"CurMaxMem", 2, same, "curr_max_mem"},
    {"CurMinMem", 2, same, "curr_min_mem"},
    {"PendAllocMem", 2, same, "pend_mem"},
    {"PendMaxMem", 2, same, "pend_max_mem"},
    {"PendMinMem", 2, same, "pend_min_mem"},
    {"RuntimeEntMem", 2, same, "run_io_entitled_mem"},
    {"RuntimeMem", 2, same, "run_mem"},
    {"RuntimeVRMWeight", 2, same, "run_mem_weight"},
    {"RuntimeMinMem", 2, same, "run_min_mem"},
    {"EntUsage", 2, same, "auto_io_entitled_mem"},
    {"CurrMemMode", 2, code<kMemMode>, "mem_mode"},
};

constexpr Property kLparProcessorCfg[] = {
    {"Name", 1, lparKey, ""},
    {"UserDefinedName", 1, same, "name"},
    {"CurMaxProcs", 2, same, "curr_max_procs"},
    {"CurMaxProcUnits", 2, percent, "curr_max_proc_units"},
    {"CurMinProcs", 2, same, "curr_min_procs"},
    {"CurMinProcUnits", 2, percent, "curr_min_proc_units"},
    {"CurProcMode", 2, procMode, "curr_"},
    {"CurAllocProcs", 2, same, "curr_procs"},
    {"CurAllocProcUnits", 2, percent, "curr_proc_units"},
    {"CurDonorMode", 2, code<kDonor>, "curr_sharing_mode"},
    {"CurSharingMode", 2, code<kSharing>, "curr_sharing_mode"},
    {"CurUncappedWeight", 2, same, "curr_uncap_weight"},
    {"PendMaxProcs", 2, same, "pend_max_procs"},
    {"PendMaxProcUnits", 2, percent, "pend_max_proc_units"},
    {"PendMinProcs", 2, same, "pend_min_procs"},
    {"PendMinProcUnits", 2, percent, "pend_min_proc_units"},
    {"PendProcMode", 2, procMode, "pend_"},
    {"PendAllocProcs", 2, same, "pend_procs"},
    {"PendAllocProcUnits", 2, percent, "pend_proc_units"},
    {"PendDonorMode", 2, code<kDonor>, "pend_sharing_mode"},
    {"PendSharingMode", 2, code<kSharing>, "pend_sharing_mode"},
    {"PendUncappedWeight", 2, same, "pend_uncap_weight"},
    {"RuntimeProcs", 2, same, "run_procs"},
    {"RuntimeProcUnits", 2, percent, "run_proc_units"},
    {"RuntimeUncappedWeight", 2, same, "run_uncap_weight"},
};

constexpr Property kEthernet[] = {
    {"Name", 1, lparKey, ""},
    {"lpar_id", 1, same, "lpar_id"},
    {"lpar_name", 1, same, "lpar_name"},
    {"slot_num", 1, same, "slot_num"},
    {"state", 1, same, "state"},
    {"mac_addr", 2, same, "mac_addr"},
    {"ieee_virtual_eth", 2, same, "ieee_virtual_eth"},
    {"port_vlan_id", 2, same, "port_vlan_id"},
    {"addl_vlan_ids", 2, code<kNoIds>, "addl_vlan_ids"},
    {"is_required", 2, code<kTruth>, "is_required"},
    {"is_trunk", 2, same, "is_trunk"},
    {"trunk_priority", 2, same, "trunk_priority"},
    {"vswitch", 2, same, "vswitch"},
};

constexpr Property kScsi[] = {
    {"Name", 1, lparKey, ""},
    {"lpar_name", 1, same, "lpar_name"},
    {"slot_num", 1, same, "slot_num"},
    {"state", 1, same, "state"},
    {"adapter_type", 2, code<kAdapterType>, "adapter_type"},
    {"backing_devices", 2, same, "backing_devices"},
    {"remote_lpar_id", 2, code<kAny>, "remote_lpar_id"},
    {"remote_lpar_name", 2, same, "remote_lpar_name"},
    {"remote_slot_num", 2, code<kAny>, "remote_slot_num"},
    {"is_required", 2, code<kTruth>, "is_required"},
};

constexpr Property kSerial[] = {
    {"Name", 1, lparKey, ""},
    {"lpar_name", 1, same, "lpar_name"},
    {"slot_num", 1, same, "slot_num"},
    {"state", 1, same, "state"},
    {"adapter_type", 2, code<kAdapterType>, "adapter_type"},
    {"connect_status", 2, code<kConnection>, "connect_status"},
    {"is_required", 2, code<kTruth>, "is_required"},
    {"remote_lpar_id", 2, code<kAny>, "remote_lpar_id"},
    {"remote_lpar_name", 2, same, "remote_lpar_name"},
    {"remote_slot_num", 2, code<kAny>, "remote_slot_num"},
    {"supports_dnx", 2, same, "supports_dnx"},
};

constexpr Property kIoSlot[] = {
    {"SystemName", 1, hostKey, ""},
    {"lpar_id", 1, code<kNoOwner>, "lpar_id"},
    {"lpar_name", 1, code<kNoOwner>, "lpar_name"},
    {"drc_index", 1, same, "drc_index"},
    {"drc_name", 1, same, "drc_name"},
    {"bus_grouping", 2, same, "bus_grouping"},
    {"bus_id", 2, same, "bus_id"},
    {"description", 2, same, "description"},
    {"feature_codes", 2, bracketed, "feature_codes"},
    {"iop", 2, code<kTruth>, "iop"},
    {"parent_slot_drc_index", 2, code<kNoParent>, "parent_slot_drc_index"},
    {"pci_class", 2, decimal, "pci_class"},
    {"pci_device_id", 2, decimal, "pci_device_id"},
    {"pci_revision_id", 2, decimal, "pci_revision_id"},
    {"pci_subs_device_id", 2, decimal, "pci_subs_device_id"},
    {"pci_subs_vendor_id", 2, decimal, "pci_subs_vendor_id"},
    {"pci_vendor_id", 2, decimal, "pci_vendor_id"},
    {"slot_io_pool_id", 2, code<kNoPool>, "slot_io_pool_id"},
    {"unit_phys_loc", 2, same, "unit_phys_loc"},
};

template <std::size_t N>
constexpr Family family(int classType, Kind kind, const Property (&properties)[N]) {
    return {classType, kind, properties, N};
}

}  // namespace

const Family kCecs = family(1, Kind::Host, kCec);
const Family kLpars = family(2, Kind::Lpar, kLpar);
const Family kProfiles = family(3, Kind::Profile, kProfile);
const Family kCecMemory = family(4, Kind::Host, kCecMemoryCfg);
const Family kCecMemoryPools = family(5, Kind::MemPool, kCecMemoryPool);
const Family kCecProcessors = family(6, Kind::Host, kCecProcessorCfg);
const Family kCecProcessorPools = family(7, Kind::ProcPool, kCecProcessorPool);
const Family kLparMemory = family(8, Kind::Lpar, kLparMemoryCfg);
const Family kLparProcessors = family(9, Kind::Lpar, kLparProcessorCfg);
const Family kEthernets = family(10, Kind::Ethernet, kEthernet);
const Family kScsis = family(11, Kind::VirtualScsi, kScsi);
const Family kSerials = family(12, Kind::Serial, kSerial);
const Family kIoSlots = family(13, Kind::Slot, kIoSlot);

}  // namespace appliance

#include "Family.h"

#include <array>
#include <cstdlib>
#include <map>

#include "Text.h"

namespace appliance {

namespace {

// Words and codes: "<word>=<code>" with commas between them. "*" stands for all other words, which
// otherwise keep their words.

constexpr char kHostState[] =
    "Standby=0,Operating=1,Power Off=3,Initializing=6,Error=12,Error - Dump in progress=13,"
    "Error - Terminated=14,QCAP Click to Accept=15,Power Off In Progress=32,"
    "Service Processor Failover In Progress=33,Failed Authentication=241,"
    "Pending Authentication - Password Updates Required=242,Version Mismatch=250,Recovery=251,"
    "Incomplete=253,No Connection=254,*=255";
constexpr char kLparState[] =
    "Not Activated=0,Starting=1,Running=2,Shutting Down=3,Error=4,Open Firmware=8,Suspended=9,"
    "Not Available=252,*=255";
constexpr char kMigrationState[] =
    "Not Migrating=9,Migration Starting=10,Migration Stopped=12,Migration In Progress=13,"
    "Migration Complete=16,Lost Connection=255,*=0";
constexpr char kCompatMode[] =
    "CORAL5=0,CORAL6_enhanced=1,CORAL6=2,CORAL6+=3,CORAL7=4,CORAL6+_enhanced=5,CORAL7_enhanced=6,"
    "CORAL7+=7,CORAL7+_enhanced=8,CORAL8=9,CORAL8_enhanced=10,default=63,*=255";
constexpr char kBootMode[] = "norm=1,ds=2,sms=3,of=4,dd=5,*=0";
constexpr char kKeylock[] = "norm=4,manual=2";
constexpr char kMemMode[] = "ded=255,*=0";

// How processors are shared is one word, and two codes: whether the partition is greedy (uncapped,
// or keeps its idle processors), and whether it donates while it runs.
constexpr char kSharing[] = "uncap=1,keep_idle_procs=1,share_idle_procs_active=1,*=0";
constexpr char kDonor[] = "share_idle_procs_always=1,share_idle_procs_active=1,*=0";

constexpr char kEntitled[] = "auto=0";
constexpr char kEntitledMode[] = "auto=1,*=0";
constexpr char kAdapterType[] = "client=0,*=1";
constexpr char kAny[] = "any=65535";
constexpr char kConnection[] = "unavailable=null,none=0,active=1,*=2";
constexpr char kTruth[] = "1=true,*=false";
constexpr char kNoIds[] = "none=";
constexpr char kNoPool[] = "none=65535";
constexpr char kNoParent[] = "none=null";
constexpr char kNoOwner[] = "null=";  // of a slot that is free

template <const char* codes>
std::string codeOf(const std::string& word) {
    static const std::map<std::string, std::string, std::less<>> all = [] {
        std::map<std::string, std::string, std::less<>> map;
        for (std::string_view row : namesIn(codes)) {
            const std::size_t equals = row.find('=');
            map.emplace(row.substr(0, equals), row.substr(equals + 1));
        }
        return map;
    }();
    auto found = all.find(word);
    if (found == all.end()) {
        found = all.find("*");
    }
    return found == all.end() ? word : found->second;
}

template <const char* codes>
std::string code(const Row& row, const std::string& attribute) {
    return codeOf<codes>(valueOf(row, attribute));
}

// Values.

std::string same(const Row& row, const std::string& attribute) { return valueOf(row, attribute); }

std::string constant(const Row&, const std::string& value) { return value; }

/// The key of a profile: its number in front of its partition's key.
std::string profileKey(const Row& row, const std::string&) {
    return std::to_string(row.self->place().number) + '*' + valueOf(row, "lpar_key");
}

std::string percent(const Row& row, const std::string& attribute) {
    return std::to_string(hundredths(valueOf(row, attribute)));
}

std::string whole(const Row& row, const std::string& attribute) {
    return std::to_string(hundredths(valueOf(row, attribute)) / 100);
}

std::string bracketed(const Row& row, const std::string& attribute) {
    return '[' + valueOf(row, attribute) + ']';
}

std::string decimal(const Row& row, const std::string& attribute) {
    return std::to_string(std::strtoul(valueOf(row, attribute).c_str(), nullptr, 16));
}

/// Address of the service processor @p role; empty when the host has no such link.
std::string addressOf(const Row& row, const std::string& role) {
    const Object* link = row.view->find(Kind::Link, "sp", role);
    return link == nullptr ? std::string() : link->get("ipaddr");
}

std::string compatModes(const Row& row, const std::string& attribute) {
    std::vector<std::string> codes;
    for (const std::string& mode : split(valueOf(row, attribute))) {
        codes.push_back(codeOf<kCompatMode>(mode));
    }
    return '[' + joined(codes) + ']';
}

/// The environment, odd while the partition holds resources.
std::string definition(const Row& row, const std::string&) {
    const std::string env = row.lpar->get("lpar_env");
    const int first = env == "tmxlinux" ? 1 : env == "xbrgserver" ? 3 : env == "osq00" ? 129 : 0;
    return std::to_string(first + (first != 0 && row.lpar->get("resource_config") == "0"));
}

/// "<number>,<name>" of the partition's profile whose name stands in @p attribute.
std::string profileOf(const Row& row, const std::string& attribute) {
    const std::string name = valueOf(row, attribute);
    if (name.empty()) {
        return "null,";
    }
    const Object* profile = row.view->profile(row.self->place().lpar, name);
    return std::to_string(profile == nullptr ? 0 : profile->place().number) + ',' + name;
}

/// The pool of shared processors, or 255 for dedicated ones; attributes begin with @p prefix.
std::string procMode(const Row& row, const std::string& prefix) {
    return valueOf(row, prefix + "proc_mode") == "ded"
               ? "255"
               : valueOf(row, prefix + "shared_proc_pool_id");
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

std::string capabilities(const Row& row, const std::string&) {
    std::array<unsigned, 8> words{};
    for (const CapabilityBit& capability : kCapabilities) {
        if (valueOf(row, capability.attribute) == "1") {
            words[capability.word] |= capability.bit;
        }
    }
    std::string list;
    for (unsigned word : words) {
        list += (list.empty() ? '[' : ',') + std::to_string(word);
    }
    return list + ']';
}

std::string runtimeCapability(const Row& row, const std::string& attribute) {
    return valueOf(row, attribute) == "1" ? std::to_string(1U << 30) : "0";
}

// The tables, one for each family.

/// Properties in their order: "<key>:<attribute>" with commas between them, or the key alone where
/// the attribute has its name, or the maker asks for none.
struct PropertyRow {
    int level;
    Make make;
    const char* properties;
};

constexpr PropertyRow kCec[] = {
    {1, same, "Name:type_model_serial_num,UserDefinedName:name"},
    {1, code<kHostState>, "State:state"},
    {1, addressOf, "PrimaryFSP_IP:primary,BackupFSP_IP:secondary"},
    {1, runtimeCapability, "RuntimeCapability:osq00_capable"},
    {2, compatModes, "ProcCompatModesSupported:lpar_proc_compat_modes"},
    {2, constant, "Capability:0"},
    {2, capabilities, "GlvExCaps"},
    // What the pool of all shared processors has, as the tools print it.
    {2, same,
     "ConfigurableProcUnits:configurable_pool_proc_uints,"
     "PendAvailProcUnits:pend_avail_sys_proc_units"},
};

constexpr PropertyRow kLpar[] = {
    {1, same, "Name:lpar_key,UserDefinedName:name"},
    {1, definition, "DefinitionState"},
    {1, code<kLparState>, "PartitionState:state"},
    {1, code<kBootMode>, "BootMode:boot_mode"},
    {1, code<kMigrationState>, "MigrationState:migration_state"},
    {1, same, "Lpar_env:lpar_env"},
    {2, profileOf, "Default_prof:default_profile,Curr_prof:curr_profile"},
    {2, code<kKeylock>, "Keylock:lpar_keylock"},
    {2, same, "RedundantPath:redundant_err_path_reporting"},
    {2, code<kCompatMode>,
     "ProcCompatMode:desired_lpar_proc_compat_mode,"
     "ActualProcCompatMode:curr_lpar_proc_compat_mode"},
    {2, same, "PowerOnWithHypervisor:auto_start"},
};

constexpr PropertyRow kProfile[] = {
    {1, profileKey, "Name"},
    {1, same, "PartitionName:lpar_key,UserDefinedName:name"},
    {1, definition, "DefinitionState"},
    {1, same, "SFPSurveillance:conn_monitoring,lpar_env,lpar_name"},
    {2, same, "AutoIPLEnabled:auto_start,MaxVirtualSlots:max_virtual_slots"},
    {2, code<kBootMode>, "BootMode:boot_mode"},
    {2, same, "RedundantPath:redundant_err_path_reporting"},
    {2, procMode, "ProcMode:"},
    {2, code<kCompatMode>, "ProcessorMode:lpar_proc_compat_mode"},
    {2, code<kSharing>, "SharingMode:sharing_mode"},
    {2, code<kDonor>, "DonorMode:sharing_mode"},
    {2, same, "UncappedWeight:uncap_weight"},
    {2, percent,
     "MinProcUnit:min_proc_units,DesiredProcUnit:desired_proc_units,MaxProcUnit:max_proc_units"},
    {2, same,
     "MinimumCPUCount:min_procs,DesiredCPUCount:desired_procs,MaximumCPUCount:max_procs,"
     "SharedProcPoolId:shared_proc_pool_id,MinimumMemory:min_mem,DesiredMemory:desired_mem,"
     "MaximumMemory:max_mem"},
    {2, code<kMemMode>, "MemMode:mem_mode"},
    {2, same, "VRMWeight:mem_weight"},
    {2, code<kEntitledMode>, "EntitledMode:desired_io_entitled_mem"},
    {2, code<kEntitled>, "EntMem:desired_io_entitled_mem"},
    {2, same,
     "AltConsoleDRCIndex:alt_console_slot,AltLoadSourceDRCIndex:alt_restart_device_slot,"
     "ConsoleDRCIndex:console_slot,LoadSourceDRCIndex:load_source_slot,"
     "ECSDRCIndex:op_console_slot,virtual_serial_adapters,virtual_scsi_adapters,"
     "virtual_eth_adapters,io_slots"},
};

constexpr PropertyRow kCecMemoryCfg[] = {
    {1, same, "Name:type_model_serial_num"},
    {2, same,
     "ConfigurableMem:configurable_sys_mem,InstalledMemory:installed_sys_mem,"
     "MaxMemPools:max_mem_pools,PendAvailMem:pend_avail_sys_mem,LMBSize:mem_region_size"},
};

constexpr PropertyRow kCecMemoryPool[] = {
    {1, same, "SystemName:type_model_serial_num"},
    {2, same, "curr_pool_mem,pend_pool_mem,pend_avail_pool_mem"},
};

// Processing units of hosts and pools stand as the tools print them: readers take them as such.
constexpr PropertyRow kCecProcessorCfg[] = {
    {1, same, "Name:type_model_serial_num"},
    {2, same,
     "ConfigurableProcUnits:configurable_sys_proc_units,"
     "CurAvailProcUnits:curr_avail_sys_proc_units"},
    {2, whole, "InstalledProcessors:installed_sys_proc_units"},
    {2, same,
     "MaxProcPools:max_shared_proc_pools,MinProcUnit:min_proc_units_per_virtual_proc,"
     "PendAvailProcUnits:pend_avail_sys_proc_units"},
};

constexpr PropertyRow kCecProcessorPool[] = {
    {1, same, "SystemName:type_model_serial_num,SharedProcPoolId:shared_proc_pool_id"},
    {2, same,
     "MaxPoolCapacity:max_pool_proc_units,PendReservedPoolCapacity:pend_reserved_pool_proc_units,"
     "lpar_ids"},
};

constexpr PropertyRow kLparMemoryCfg[] = {
    {1, same, "Name:lpar_key,UserDefinedName:name"},
    {2, same,
     "CurAllocMem:curr_mem,CurMaxMem:curr_max_mem,CurMinMem:curr_min_mem,PendAllocMem:pend_mem,"
     "PendMaxMem:pend_max_mem,PendMinMem:pend_min_mem,RuntimeEntMem:run_io_entitled_mem,"
     "RuntimeMem:run_mem,RuntimeVRMWeight:run_mem_weight,RuntimeMinMem:run_min_mem,"
     "EntUsage:auto_io_entitled_mem"},
    {2, code<kMemMode>, "CurrMemMode:mem_mode"},
};

constexpr PropertyRow kLparProcessorCfg[] = {
    {1, same, "Name:lpar_key,UserDefinedName:name"},
    {2, same, "CurMaxProcs:curr_max_procs"},
    {2, percent, "CurMaxProcUnits:curr_max_proc_units"},
    {2, same, "CurMinProcs:curr_min_procs"},
    {2, percent, "CurMinProcUnits:curr_min_proc_units"},
    {2, procMode, "CurProcMode:curr_"},
    {2, same, "CurAllocProcs:curr_procs"},
    {2, percent, "CurAllocProcUnits:curr_proc_units"},
    {2, code<kDonor>, "CurDonorMode:curr_sharing_mode"},
    {2, code<kSharing>, "CurSharingMode:curr_sharing_mode"},
    {2, same, "CurUncappedWeight:curr_uncap_weight,PendMaxProcs:pend_max_procs"},
    {2, percent, "PendMaxProcUnits:pend_max_proc_units"},
    {2, same, "PendMinProcs:pend_min_procs"},
    {2, percent, "PendMinProcUnits:pend_min_proc_units"},
    {2, procMode, "PendProcMode:pend_"},
    {2, same, "PendAllocProcs:pend_procs"},
    {2, percent, "PendAllocProcUnits:pend_proc_units"},
    {2, code<kDonor>, "PendDonorMode:pend_sharing_mode"},
    {2, code<kSharing>, "PendSharingMode:pend_sharing_mode"},
    {2, same, "PendUncappedWeight:pend_uncap_weight,RuntimeProcs:run_procs"},
    {2, percent, "RuntimeProcUnits:run_proc_units"},
    {2, same, "RuntimeUncappedWeight:run_uncap_weight"},
};

constexpr PropertyRow kEthernet[] = {
    {1, same, "Name:lpar_key,lpar_id,lpar_name,slot_num,state"},
    {2, same, "mac_addr,ieee_virtual_eth,port_vlan_id"},
    {2, code<kNoIds>, "addl_vlan_ids"},
    {2, code<kTruth>, "is_required"},
    {2, same, "is_trunk,trunk_priority,vswitch"},
};

constexpr PropertyRow kScsi[] = {
    {1, same, "Name:lpar_key,lpar_name,slot_num,state"},
    {2, code<kAdapterType>, "adapter_type"},
    {2, same, "backing_devices"},
    {2, code<kAny>, "remote_lpar_id"},
    {2, same, "remote_lpar_name"},
    {2, code<kAny>, "remote_slot_num"},
    {2, code<kTruth>, "is_required"},
};

constexpr PropertyRow kSerial[] = {
    {1, same, "Name:lpar_key,lpar_name,slot_num,state"},
    {2, code<kAdapterType>, "adapter_type"},
    {2, code<kConnection>, "connect_status"},
    {2, code<kTruth>, "is_required"},
    {2, code<kAny>, "remote_lpar_id"},
    {2, same, "remote_lpar_name"},
    {2, code<kAny>, "remote_slot_num"},
    {2, same, "supports_dnx"},
};

constexpr PropertyRow kIoSlot[] = {
    {1, same, "SystemName:type_model_serial_num"},
    {1, code<kNoOwner>, "lpar_id,lpar_name"},
    {1, same, "drc_index,drc_name"},
    {2, same, "bus_grouping,bus_id,description"},
    {2, bracketed, "feature_codes"},
    {2, code<kTruth>, "iop"},
    {2, code<kNoParent>, "parent_slot_drc_index"},
    {2, decimal,
     "pci_class,pci_device_id,pci_revision_id,pci_subs_device_id,pci_subs_vendor_id,pci_vendor_id"},
    {2, code<kNoPool>, "slot_io_pool_id"},
    {2, same, "unit_phys_loc"},
};

template <std::size_t N>
Family family(int classType, Kind kind, const PropertyRow (&rows)[N]) {
    Family family{classType, kind, {}};
    for (const PropertyRow& row : rows) {
        for (std::string_view property : namesIn(row.properties)) {
            const std::size_t end = property.find(':');
            const std::size_t attribute = end == std::string_view::npos ? 0 : end + 1;
            family.properties.push_back({std::string(property.substr(0, end)), row.level, row.make,
                                         std::string(property.substr(attribute))});
        }
    }
    return family;
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

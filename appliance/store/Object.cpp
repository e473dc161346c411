#include "Object.h"

#include <algorithm>
#include <stdexcept>

#include "AttributeIndex.h"
#include "Failure.h"

namespace appliance {

namespace {

constexpr const char* kKindNames[] = {
    "host", "link", "unit", "bus",     "slot",     "procpool", "mempool", "hslpool",   "optipool",
    "hca",  "sni",  "lpar", "profile", "ethernet", "scsi",     "serial",  "sysprofile"};
static_assert(sizeof kKindNames / sizeof *kKindNames == kKinds);

/// Attributes of kinds and the value that each has until it is set. "$name" stands for the value of
/// that other attribute, "$prefix_" for the one with this in place of the attribute's own prefix,
/// "#lpar" and "#number" for the object's place; null means that every object must set it.
struct AttributeRow {
    Kinds kinds;
    const char* names;
    const char* value;
};

constexpr AttributeRow kAttributes[] = {
    {Kind::Host, "name,type_model,serial_num,ipaddr,state", nullptr},
    {Kind::Host, "max_lpars", "1000"},
    {Kind::Host, "max_suspend_capable_lpars,max_remote_restart_capable_lpars", "$max_lpars"},
    {Kind::Host, "max_power_ctrl_lpars", "1"},
    {Kind::Host, "service_lpar_id", "none"},
    {Kind::Host, "sp_version", "00070000"},
    {Kind::Host, "lpar_proc_compat_modes", "default,CORAL6,CORAL6+,CORAL7"},
    // Capabilities.
    {Kind::Host,
     "active_lpar_mobility_capable,active_lpar_share_idle_procs_capable,active_mem_sharing_capable,"
     "coralhv_lpar_remote_restart_capable,electronic_err_reporting_capable,hca_capable,"
     "inactive_lpar_mobility_capable,lpar_avail_priority_capable,lpar_proc_compat_mode_capable,"
     "lpar_suspend_capable,micro_lpar_capable,osq00_capable,redundant_err_path_reporting_capable,"
     "shared_eth_failover_capable,sni_msg_passing_capable,sp_failover_capable,"
     "vet_activation_capable,virtual_io_server_capable,virtual_switch_capable",
     "1"},
    {Kind::Host,
     "bsr_capable,cod_mem_capable,cod_proc_capable,huge_page_mem_capable,lhea_capable,"
     "7460_application_capable,assign_7460_wkl_percent",
     "0"},
    // Power and start.
    {Kind::Host, "power_off_policy,mfg_default_config,sp_boot_minor_type", "0"},
    {Kind::Host, "sp_boot_major_type,sp_failover_enabled", "1"},
    {Kind::Host, "curr_sys_keylock,curr_mfg_default_boot_mode", "norm"},
    {Kind::Host, "curr_power_on_side", "temp"},
    {Kind::Host, "curr_power_on_speed", "fast"},
    {Kind::Host, "curr_power_on_speed_override", "none"},
    {Kind::Host, "curr_mfg_default_ipl_source", "a"},
    {Kind::Host,
     "pend_sys_keylock,pend_power_on_side,pend_power_on_speed,pend_power_on_speed_override,"
     "pend_mfg_default_ipl_source,pend_mfg_default_boot_mode",
     "$curr_"},
    {Kind::Host, "power_on_type", "power on"},
    {Kind::Host, "power_on_option", "standby"},
    {Kind::Host, "pend_power_on_option", "$power_on_option"},
    {Kind::Host, "power_on_method", "02"},
    {Kind::Host, "power_on_attr,sp_boot_attr", "0000"},
    // Capacity: memory in megabytes, processors in processing units.
    {Kind::Host, "installed_sys_mem,installed_sys_proc_units", nullptr},
    {Kind::Host, "deconfig_sys_mem", "0"},
    {Kind::Host, "deconfig_sys_proc_units", "0.0"},
    {Kind::Host, "sys_firmware_mem", "2048"},
    {Kind::Host, "mem_region_size", "256"},
    {Kind::Host, "max_mem_pools", "1"},
    {Kind::Host, "min_proc_units_per_virtual_proc", "0.05"},
    {Kind::Host, "max_shared_proc_pools", "64"},
    {Kind::Host, "proc_cycles_per_second", "1000000000"},
    // Virtual and physical I/O.
    {Kind::Host, "max_vlans_per_port", "20"},
    {Kind::Host, "mac_prefix", nullptr},
    {Kind::Host, "max_io_pools", "255"},
    // Moves, utilisation samples (a rate of 0 seconds is off), the last reference code.
    {Kind::Host, "num_active_migrations_supported,num_inactive_migrations_supported", "8"},
    {Kind::Host, "sample_rate", "300"},
    {{Kind::Host, Kind::Lpar}, "refcode", "00000000"},

    {Kind::Link, "sp,sp_phys_loc,ipaddr", nullptr},
    {Kind::Link, "alt_ipaddr", "unavailable"},
    {Kind::Link, "state", "Connected"},
    {Kind::Link, "connection_error_code", "none"},

    {{Kind::Unit, Kind::Bus, Kind::Slot}, "unit_phys_loc", nullptr},
    {Kind::Bus, "bus_id", "#number"},
    {Kind::Slot, "bus_id,phys_loc,drc_index", nullptr},
    {Kind::Slot, "slot_io_pool_id,parent_slot_drc_index", "none"},
    {Kind::Slot, "description", "Empty slot"},
    {Kind::Slot, "feature_codes,bus_grouping,iop", "0"},
    {Kind::Slot, "pci_vendor_id,pci_device_id,pci_subs_vendor_id,pci_subs_device_id,pci_class",
     "FFFF"},
    {Kind::Slot, "pci_revision_id", "FF"},

    {Kind::ProcPool, "name", nullptr},
    {Kind::ProcPool, "shared_proc_pool_id", "#number"},
    {Kind::ProcPool, "max_pool_proc_units", "null"},
    {Kind::ProcPool, "curr_reserved_pool_proc_units", "0.0"},
    {Kind::ProcPool, "pend_reserved_pool_proc_units", "$curr_"},
    {Kind::MemPool, "curr_pool_mem", nullptr},
    {Kind::MemPool, "pend_pool_mem,curr_max_pool_mem", "$curr_pool_mem"},
    {Kind::MemPool, "pend_max_pool_mem", "$curr_"},
    {Kind::MemPool, "sys_firmware_pool_mem", "256"},
    {Kind::MemPool, "psp_ids", "none"},
    {Kind::HslPool, "hsl_pool_id", "#number"},
    {Kind::OptiPool, "virtual_opti_pool_id", "#number"},

    {{Kind::Hca, Kind::Sni}, "adapter_id,phys_loc", nullptr},
    {Kind::Hca, "capability", "low"},
    {Kind::Hca, "state", "1"},
    {Kind::Sni, "sni_device_id", "#number"},

    {{Kind::Lpar, Kind::Profile}, "lpar_id", "#lpar"},
    {{Kind::Lpar, Kind::Profile}, "name", nullptr},
    {Kind::Lpar, "lpar_env,state,default_profile", nullptr},
    {Kind::Lpar, "resource_config", "1"},
    {Kind::Lpar, "os_version", "Unknown"},
    {Kind::Lpar, "curr_profile", "$default_profile"},
    {Kind::Lpar, "shared_proc_pool_util_auth,allow_perf_collection", "0"},
    {Kind::Lpar, "suspend_capable,remote_restart_capable", "0"},
    {Kind::Lpar, "lpar_keylock", "norm"},
    {Kind::Lpar, "desired_lpar_proc_compat_mode", "default"},
    {Kind::Lpar, "curr_lpar_proc_compat_mode", "CORAL7"},
    {Kind::Lpar, "remote_restart_status", "Not Ready"},
    {Kind::Lpar, "lpar_avail_priority", "127"},
    {Kind::Lpar, "ipl_source", "b"},
    {{Kind::Lpar, Kind::Profile},
     "auto_start,redundant_err_path_reporting,electronic_err_reporting",
     "0"},
    {{Kind::Lpar, Kind::Profile}, "boot_mode", "norm"},
    {{Kind::Lpar, Kind::Profile},
     "work_group_id,power_ctrl_lpar_ids,primary_psp_id,secondary_psp_id",
     "none"},
    {{Kind::Lpar, Kind::Profile}, "hsl_pool_id,virtual_opti_pool_id", "none"},
    {{Kind::Lpar, Kind::Profile}, "load_source_slot,alt_restart_device_slot", "none"},
    {{Kind::Lpar, Kind::Profile}, "console_slot,alt_console_slot,op_console_slot", "none"},
    {{Kind::Lpar, Kind::Profile}, "mem_mode", "ded"},
    // What the next change of a partition aims at, what is in effect, what runs: memory in
    // megabytes, and processors. One with dedicated ones has as many units as processors.
    {Kind::Lpar, "pend_min_mem,pend_mem,pend_max_mem,pend_min_procs,pend_procs,pend_max_procs",
     nullptr},
    {Kind::Lpar, "pend_min_proc_units,pend_proc_units,pend_max_proc_units", nullptr},
    {Kind::Lpar, "pend_mem_weight,pend_io_entitled_mem,pend_uncap_weight,pend_shared_proc_pool_id",
     "0"},
    {Kind::Lpar, "pend_proc_mode", "shared"},
    {Kind::Lpar, "pend_sharing_mode", "cap"},
    {Kind::Lpar, "pend_max_virtual_slots", "10"},
    {Kind::Lpar, "auto_io_entitled_mem", "0"},
    {Kind::Lpar,
     "curr_min_mem,curr_mem,curr_max_mem,curr_mem_weight,curr_io_entitled_mem,curr_proc_mode,"
     "curr_min_procs,curr_procs,curr_max_procs,curr_min_proc_units,curr_proc_units,"
     "curr_max_proc_units,curr_sharing_mode,curr_uncap_weight,curr_shared_proc_pool_id,"
     "curr_max_virtual_slots",
     "$pend_"},
    {Kind::Lpar,
     "run_min_mem,run_mem,run_mem_weight,run_io_entitled_mem,run_procs,run_proc_units,"
     "run_uncap_weight",
     "$curr_"},
    {Kind::Lpar, "curr_psp_id", "$primary_psp_id"},
    {Kind::Lpar, "recent_alt_restart_device_slot", "none"},
    // Move to another host; the token tells one move of a partition from its next.
    {Kind::Lpar, "migration_state", "Not Migrating"},
    {Kind::Lpar,
     "migration_type,migration_token,source_sys_name,dest_sys_name,source_lpar_id,dest_lpar_id,"
     "source_msp_name,source_msp_id,dest_msp_name,dest_msp_id",
     "none"},
    {Kind::Lpar, "bytes_transmitted,bytes_remaining", "0"},
    // The last reference code.
    {Kind::Lpar, "refcode_time", "01/01/2024 00:00:00"},
    {Kind::Lpar, "word2", "00000000"},
    {Kind::Lpar, "fru_call_out_loc_codes", "none"},

    {Kind::Profile, "all_resources,mem_weight,uncap_weight,shared_proc_pool_id,conn_monitoring",
     "0"},
    {Kind::Profile, "min_mem,desired_mem,max_mem,min_procs,desired_procs,max_procs", nullptr},
    {Kind::Profile, "min_proc_units,desired_proc_units,max_proc_units", nullptr},
    {Kind::Profile, "desired_io_entitled_mem", "null"},
    {Kind::Profile, "proc_mode", "shared"},
    {Kind::Profile, "sharing_mode", "cap"},
    {Kind::Profile, "lpar_proc_compat_mode", "default"},
    {Kind::Profile, "max_virtual_slots", "10"},
    // Adapter lists: as the tools print them, but without the names of remote partitions.
    {Kind::Profile, "virtual_serial_adapters,virtual_scsi_adapters,virtual_eth_adapters", "none"},
    {Kind::Profile, "io_slots,hca_adapters,lpar_io_pool_ids", "none"},

    {{Kind::Ethernet, Kind::VirtualScsi, Kind::Serial}, "slot_num", "#number"},
    {{Kind::Ethernet, Kind::VirtualScsi, Kind::Serial}, "state", "1"},
    {Kind::Ethernet, "port_vlan_id,mac_addr", nullptr},
    {Kind::Ethernet, "ieee_virtual_eth,is_trunk,trunk_priority", "0"},
    {Kind::Ethernet, "addl_vlan_ids", ""},
    {Kind::Ethernet, "vswitch", "default"},
    {{Kind::Ethernet, Kind::VirtualScsi}, "is_required", "0"},
    {Kind::Serial, "is_required,supports_dnx", "1"},
    {Kind::VirtualScsi, "adapter_type", nullptr},
    {Kind::Serial, "adapter_type", "server"},
    {{Kind::VirtualScsi, Kind::Serial}, "remote_lpar_id,remote_slot_num", "any"},
    {Kind::VirtualScsi, "backing_devices", "none"},
    {Kind::Serial, "connect_status", "unavailable"},

    // The second is a list of "<lpar_id>/<number of the profile>", in the order of their start.
    {Kind::SystemProfile, "name,lpar_profiles", nullptr},
};

/// @throws std::logic_error the kind has no such attribute
const char* defaultOf(Kind kind, std::string_view name) {
    static const AttributeIndex<AttributeRow> index(kAttributes);
    if (const AttributeRow* row = index.find(kind, name)) {
        return row->value;
    }
    throw std::logic_error(std::string(kindName(kind)) + " has no attribute " + std::string(name));
}

/// The attribute that @p other stands for as the default of @p name: itself, or a prefix.
std::string otherName(std::string other, std::string_view name) {
    if (other.back() == '_') {
        other += name.substr(name.find('_') + 1);
    }
    return other;
}

}  // namespace

const char* kindName(Kind kind) { return kKindNames[static_cast<std::size_t>(kind)]; }

Object::Object(Kind kind, Place place, std::string attributes)
    : m_kind(kind), m_place(place), m_attributes(std::move(attributes)) {
    // What is stored may have been written by others: every line has both its ends from here on.
    if (m_attributes.empty() || m_attributes.front() != '\n') {
        m_attributes.insert(0, 1, '\n');
    }
    if (m_attributes.back() != '\n') {
        m_attributes += '\n';
    }
}

std::size_t Object::find(std::string_view name, std::size_t* size) const {
    for (std::size_t begin = 1; begin < m_attributes.size();) {
        const std::size_t equals = begin + name.size();
        const std::size_t end = m_attributes.find('\n', begin);
        if (equals < end && m_attributes[equals] == '=' &&
            m_attributes.compare(begin, name.size(), name) == 0) {
            *size = end - equals - 1;
            return equals + 1;
        }
        begin = end + 1;
    }
    return std::string::npos;
}

std::string Object::get(std::string_view name) const {
    std::size_t size = 0;
    const std::size_t at = find(name, &size);
    if (at != std::string::npos) {
        return m_attributes.substr(at, size);
    }

    const char* value = defaultOf(m_kind, name);
    if (value == nullptr) {
        throw std::logic_error(std::string(kindName(m_kind)) + " without " + std::string(name));
    }
    if (*value == '$') {
        return get(otherName(value + 1, name));
    }
    if (*value == '#') {
        return std::to_string(value[1] == 'l' ? m_place.lpar : m_place.number);
    }
    return value;
}

void Object::set(std::string_view name, std::string_view value) {
    defaultOf(m_kind, name);
    if (value.find_first_of(std::string_view("\n\r\0", 3)) != std::string_view::npos) {
        throw Failure(Fault::BadValue, {std::string(name), std::string(value)});
    }
    std::size_t size = 0;
    const std::size_t at = find(name, &size);
    if (at != std::string::npos) {
        m_attributes.replace(at, size, value);
    } else {
        m_attributes.append(name).append("=").append(value).append("\n");
    }
}

void Object::unset(std::string_view name) {
    defaultOf(m_kind, name);
    std::size_t size = 0;
    const std::size_t at = find(name, &size);
    const std::size_t line = name.size() + 1;  // with the equals sign
    if (at != std::string::npos) {
        m_attributes.erase(at - line, line + size + 1);
    }
}

std::vector<std::pair<std::string_view, std::string_view>> Object::settings() const {
    std::vector<std::pair<std::string_view, std::string_view>> all;
    const std::string_view lines = m_attributes;
    for (std::size_t begin = 1; begin < lines.size();) {
        const std::size_t equals = lines.find('=', begin), end = lines.find('\n', begin);
        if (equals < end) {
            all.emplace_back(lines.substr(begin, equals - begin),
                             lines.substr(equals + 1, end - equals - 1));
        }
        begin = end + 1;
    }
    return all;
}

}  // namespace appliance

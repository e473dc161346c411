#include "Object.h"

#include <array>
#include <stdexcept>
#include <unordered_map>

#include "Failure.h"
#include "Text.h"

namespace appliance {

namespace {

/// One attribute of a kind and the value that it has until it is set. "$name" stands for the value
/// of that other attribute, "#lpar" and "#number" for the object's place; null means that every
/// object of the kind must set it.
struct AttributeRow {
    const char* name;
    const char* value;
};

constexpr AttributeRow kHost[] = {
    {"name", nullptr},
    {"type_model", nullptr},
    {"serial_num", nullptr},
    {"ipaddr", nullptr},
    {"state", nullptr},
    {"max_lpars", "1000"},
    {"max_power_ctrl_lpars", "1"},
    {"service_lpar_id", "none"},
    {"sp_version", "00070000"},
    {"lpar_proc_compat_modes", "default,CORAL6,CORAL6+,CORAL7"},
    {"max_suspend_capable_lpars", "$max_lpars"},
    {"max_remote_restart_capable_lpars", "$max_lpars"},
    // Capabilities.
    {"active_lpar_mobility_capable", "1"},
    {"active_lpar_share_idle_procs_capable", "1"},
    {"active_mem_sharing_capable", "1"},
    {"bsr_capable", "0"},
    {"cod_mem_capable", "0"},
    {"cod_proc_capable", "0"},
    {"coralhv_lpar_remote_restart_capable", "1"},
    {"electronic_err_reporting_capable", "1"},
    {"hca_capable", "1"},
    {"huge_page_mem_capable", "0"},
    {"inactive_lpar_mobility_capable", "1"},
    {"lhea_capable", "0"},
    {"lpar_avail_priority_capable", "1"},
    {"lpar_proc_compat_mode_capable", "1"},
    {"lpar_suspend_capable", "1"},
    {"micro_lpar_capable", "1"},
    {"osq00_capable", "1"},
    {"redundant_err_path_reporting_capable", "1"},
    {"shared_eth_failover_capable", "1"},
    {"sni_msg_passing_capable", "1"},
    {"sp_failover_capable", "1"},
    {"vet_activation_capable", "1"},
    {"virtual_io_server_capable", "1"},
    {"virtual_switch_capable", "1"},
    {"7460_application_capable", "0"},
    {"assign_7460_wkl_percent", "0"},
    // Power and start.
    {"power_off_policy", "0"},
    {"mfg_default_config", "0"},
    {"curr_sys_keylock", "norm"},
    {"pend_sys_keylock", "$curr_sys_keylock"},
    {"curr_power_on_side", "temp"},
    {"pend_power_on_side", "$curr_power_on_side"},
    {"curr_power_on_speed", "fast"},
    {"pend_power_on_speed", "$curr_power_on_speed"},
    {"curr_power_on_speed_override", "none"},
    {"pend_power_on_speed_override", "$curr_power_on_speed_override"},
    {"power_on_type", "power on"},
    {"power_on_option", "standby"},
    {"pend_power_on_option", "$power_on_option"},
    {"power_on_method", "02"},
    {"power_on_attr", "0000"},
    {"sp_boot_attr", "0000"},
    {"sp_boot_major_type", "1"},
    {"sp_boot_minor_type", "0"},
    {"curr_mfg_default_ipl_source", "a"},
    {"pend_mfg_default_ipl_source", "$curr_mfg_default_ipl_source"},
    {"curr_mfg_default_boot_mode", "norm"},
    {"pend_mfg_default_boot_mode", "$curr_mfg_default_boot_mode"},
    {"sp_failover_enabled", "1"},
    // Capacity: memory in megabytes, processors in processing units.
    {"installed_sys_mem", nullptr},
    {"deconfig_sys_mem", "0"},
    {"sys_firmware_mem", "2048"},
    {"mem_region_size", "256"},
    {"max_mem_pools", "1"},
    {"installed_sys_proc_units", nullptr},
    {"deconfig_sys_proc_units", "0.0"},
    {"min_proc_units_per_virtual_proc", "0.05"},
    {"max_shared_proc_pools", "64"},
    {"proc_cycles_per_second", "1000000000"},
    // Virtual and physical I/O.
    {"max_vlans_per_port", "20"},
    {"mac_prefix", nullptr},
    {"max_io_pools", "255"},
    // Moves, utilisation samples (a rate of 0 seconds is off), the last reference code.
    {"num_active_migrations_supported", "8"},
    {"num_inactive_migrations_supported", "8"},
    {"sample_rate", "300"},
    {"refcode", "00000000"},
};

constexpr AttributeRow kLink[] = {
    {"sp", nullptr},        {"sp_phys_loc", nullptr},
    {"ipaddr", nullptr},    {"alt_ipaddr", "unavailable"},
    {"state", "Connected"}, {"connection_error_code", "none"},
};

constexpr AttributeRow kUnit[] = {
    {"unit_phys_loc", nullptr},
};

constexpr AttributeRow kBus[] = {
    {"unit_phys_loc", nullptr},
    {"bus_id", "#number"},
};

constexpr AttributeRow kSlot[] = {
    {"unit_phys_loc", nullptr},
    {"bus_id", nullptr},
    {"phys_loc", nullptr},
    {"drc_index", nullptr},
    {"slot_io_pool_id", "none"},
    {"description", "Empty slot"},
    {"feature_codes", "0"},
    {"pci_vendor_id", "FFFF"},
    {"pci_device_id", "FFFF"},
    {"pci_subs_vendor_id", "FFFF"},
    {"pci_subs_device_id", "FFFF"},
    {"pci_class", "FFFF"},
    {"pci_revision_id", "FF"},
    {"bus_grouping", "0"},
    {"iop", "0"},
    {"parent_slot_drc_index", "none"},
};

constexpr AttributeRow kProcPool[] = {
    {"name", nullptr},
    {"shared_proc_pool_id", "#number"},
    {"max_pool_proc_units", "null"},
    {"curr_reserved_pool_proc_units", "0.0"},
    {"pend_reserved_pool_proc_units", "$curr_reserved_pool_proc_units"},
};

constexpr AttributeRow kMemPool[] = {
    {"curr_pool_mem", nullptr},
    {"pend_pool_mem", "$curr_pool_mem"},
    {"curr_max_pool_mem", "$curr_pool_mem"},
    {"pend_max_pool_mem", "$curr_max_pool_mem"},
    {"sys_firmware_pool_mem", "256"},
    {"psp_ids", "none"},
};

constexpr AttributeRow kHslPool[] = {
    {"hsl_pool_id", "#number"},
};

constexpr AttributeRow kOptiPool[] = {
    {"virtual_opti_pool_id", "#number"},
};

constexpr AttributeRow kHca[] = {
    {"adapter_id", nullptr},
    {"phys_loc", nullptr},
    {"capability", "low"},
    {"state", "1"},
};

constexpr AttributeRow kSni[] = {
    {"sni_device_id", "#number"},
    {"adapter_id", nullptr},
    {"phys_loc", nullptr},
};

constexpr AttributeRow kLpar[] = {
    {"lpar_id", "#lpar"},
    {"name", nullptr},
    {"lpar_env", nullptr},
    {"state", nullptr},
    {"resource_config", "1"},
    {"os_version", "Unknown"},
    {"default_profile", nullptr},
    {"curr_profile", "$default_profile"},
    {"work_group_id", "none"},
    {"shared_proc_pool_util_auth", "0"},
    {"allow_perf_collection", "0"},
    {"power_ctrl_lpar_ids", "none"},
    {"boot_mode", "norm"},
    {"lpar_keylock", "norm"},
    {"auto_start", "0"},
    {"desired_lpar_proc_compat_mode", "default"},
    {"curr_lpar_proc_compat_mode", "CORAL7"},
    {"redundant_err_path_reporting", "0"},
    {"suspend_capable", "0"},
    {"remote_restart_capable", "0"},
    {"remote_restart_status", "Not Ready"},
    {"electronic_err_reporting", "0"},
    {"lpar_avail_priority", "127"},
    {"ipl_source", "b"},
    // Memory in megabytes: what the next change aims at, what is in effect, what runs.
    {"pend_min_mem", nullptr},
    {"pend_mem", nullptr},
    {"pend_max_mem", nullptr},
    {"curr_min_mem", "$pend_min_mem"},
    {"curr_mem", "$pend_mem"},
    {"curr_max_mem", "$pend_max_mem"},
    {"run_min_mem", "$curr_min_mem"},
    {"run_mem", "$curr_mem"},
    {"mem_mode", "ded"},
    {"pend_mem_weight", "0"},
    {"curr_mem_weight", "$pend_mem_weight"},
    {"run_mem_weight", "$curr_mem_weight"},
    {"pend_io_entitled_mem", "0"},
    {"curr_io_entitled_mem", "$pend_io_entitled_mem"},
    {"run_io_entitled_mem", "$curr_io_entitled_mem"},
    {"auto_io_entitled_mem", "0"},
    {"primary_psp_id", "none"},
    {"secondary_psp_id", "none"},
    {"curr_psp_id", "$primary_psp_id"},
    // Processors, likewise. A partition with dedicated ones has as many units as processors.
    {"pend_proc_mode", "shared"},
    {"pend_min_procs", nullptr},
    {"pend_procs", nullptr},
    {"pend_max_procs", nullptr},
    {"pend_min_proc_units", nullptr},
    {"pend_proc_units", nullptr},
    {"pend_max_proc_units", nullptr},
    {"pend_sharing_mode", "cap"},
    {"pend_uncap_weight", "0"},
    {"pend_shared_proc_pool_id", "0"},
    {"curr_proc_mode", "$pend_proc_mode"},
    {"curr_min_procs", "$pend_min_procs"},
    {"curr_procs", "$pend_procs"},
    {"curr_max_procs", "$pend_max_procs"},
    {"curr_min_proc_units", "$pend_min_proc_units"},
    {"curr_proc_units", "$pend_proc_units"},
    {"curr_max_proc_units", "$pend_max_proc_units"},
    {"curr_sharing_mode", "$pend_sharing_mode"},
    {"curr_uncap_weight", "$pend_uncap_weight"},
    {"curr_shared_proc_pool_id", "$pend_shared_proc_pool_id"},
    {"run_procs", "$curr_procs"},
    {"run_proc_units", "$curr_proc_units"},
    {"run_uncap_weight", "$curr_uncap_weight"},
    // I/O.
    {"pend_max_virtual_slots", "10"},
    {"curr_max_virtual_slots", "$pend_max_virtual_slots"},
    {"load_source_slot", "none"},
    {"alt_restart_device_slot", "none"},
    {"recent_alt_restart_device_slot", "none"},
    {"console_slot", "none"},
    {"alt_console_slot", "none"},
    {"op_console_slot", "none"},
    {"hsl_pool_id", "none"},
    {"virtual_opti_pool_id", "none"},
    // Move to another host.
    {"migration_state", "Not Migrating"},
    {"migration_type", "none"},
    {"source_sys_name", "none"},
    {"dest_sys_name", "none"},
    {"source_lpar_id", "none"},
    {"dest_lpar_id", "none"},
    {"source_msp_name", "none"},
    {"source_msp_id", "none"},
    {"dest_msp_name", "none"},
    {"dest_msp_id", "none"},
    {"bytes_transmitted", "0"},
    {"bytes_remaining", "0"},
    {"migration_token", "none"},  // tells one move of a partition from its next
    // The last reference code.
    {"refcode", "00000000"},
    {"refcode_time", "01/01/2024 00:00:00"},
    {"word2", "00000000"},
    {"fru_call_out_loc_codes", "none"},
};

constexpr AttributeRow kProfile[] = {
    {"lpar_id", "#lpar"},
    {"name", nullptr},
    {"all_resources", "0"},
    {"min_mem", nullptr},
    {"desired_mem", nullptr},
    {"max_mem", nullptr},
    {"mem_mode", "ded"},
    {"mem_weight", "0"},
    {"desired_io_entitled_mem", "null"},
    {"primary_psp_id", "none"},
    {"secondary_psp_id", "none"},
    {"proc_mode", "shared"},
    {"min_procs", nullptr},
    {"desired_procs", nullptr},
    {"max_procs", nullptr},
    {"min_proc_units", nullptr},
    {"desired_proc_units", nullptr},
    {"max_proc_units", nullptr},
    {"sharing_mode", "cap"},
    {"uncap_weight", "0"},
    {"shared_proc_pool_id", "0"},
    {"lpar_proc_compat_mode", "default"},
    // Adapter lists: as the tools print them, but without the names of remote partitions.
    {"io_slots", "none"},
    {"virtual_serial_adapters", "none"},
    {"virtual_scsi_adapters", "none"},
    {"virtual_eth_adapters", "none"},
    {"hca_adapters", "none"},
    {"load_source_slot", "none"},
    {"alt_restart_device_slot", "none"},
    {"console_slot", "none"},
    {"alt_console_slot", "none"},
    {"op_console_slot", "none"},
    {"lpar_io_pool_ids", "none"},
    {"max_virtual_slots", "10"},
    {"boot_mode", "norm"},
    {"conn_monitoring", "0"},
    {"auto_start", "0"},
    {"power_ctrl_lpar_ids", "none"},
    {"work_group_id", "none"},
    {"redundant_err_path_reporting", "0"},
    {"electronic_err_reporting", "0"},
    {"hsl_pool_id", "none"},
    {"virtual_opti_pool_id", "none"},
};

constexpr AttributeRow kEthernet[] = {
    {"slot_num", "#number"},   {"state", "1"},        {"ieee_virtual_eth", "0"},
    {"port_vlan_id", nullptr}, {"addl_vlan_ids", ""}, {"is_trunk", "0"},
    {"trunk_priority", "0"},   {"is_required", "0"},  {"mac_addr", nullptr},
    {"vswitch", "default"},
};

constexpr AttributeRow kVirtualScsi[] = {
    {"slot_num", "#number"},     {"state", "1"},
    {"adapter_type", nullptr},   {"remote_lpar_id", "any"},
    {"remote_slot_num", "any"},  {"is_required", "0"},
    {"backing_devices", "none"},
};

constexpr AttributeRow kSerial[] = {
    {"slot_num", "#number"},    {"state", "1"},
    {"adapter_type", "server"}, {"supports_dnx", "1"},
    {"remote_lpar_id", "any"},  {"remote_slot_num", "any"},
    {"is_required", "1"},       {"connect_status", "unavailable"},
};

constexpr AttributeRow kSystemProfile[] = {
    {"name", nullptr},
    // A list of "<lpar_id>/<number of the profile>", in the order in which they are started.
    {"lpar_profiles", nullptr},
};

struct KindRow {
    const char* name;
    const AttributeRow* attributes;
    std::size_t size;

    template <std::size_t N>
    constexpr KindRow(const char* kindName, const AttributeRow (&rows)[N])
        : name(kindName), attributes(rows), size(N) {}
};

/// In the order of Kind.
constexpr KindRow kKindRows[] = {
    {"host", kHost},
    {"link", kLink},
    {"unit", kUnit},
    {"bus", kBus},
    {"slot", kSlot},
    {"procpool", kProcPool},
    {"mempool", kMemPool},
    {"hslpool", kHslPool},
    {"optipool", kOptiPool},
    {"hca", kHca},
    {"sni", kSni},
    {"lpar", kLpar},
    {"profile", kProfile},
    {"ethernet", kEthernet},
    {"scsi", kVirtualScsi},
    {"serial", kSerial},
    {"sysprofile", kSystemProfile},
};
static_assert(sizeof kKindRows / sizeof *kKindRows == kKinds);

const KindRow& rowOf(Kind kind) { return kKindRows[static_cast<std::size_t>(kind)]; }

using Defaults = std::unordered_map<std::string_view, const char*>;

const char* defaultOf(Kind kind, std::string_view name) {
    static const std::array<Defaults, kKinds> all = [] {
        std::array<Defaults, kKinds> maps;
        for (std::size_t i = 0; i < kKinds; ++i) {
            for (std::size_t j = 0; j < kKindRows[i].size; ++j) {
                const AttributeRow& row = kKindRows[i].attributes[j];
                maps[i].emplace(row.name, row.value);
            }
        }
        return maps;
    }();
    const Defaults& defaults = all[static_cast<std::size_t>(kind)];
    const auto found = defaults.find(name);
    if (found == defaults.end()) {
        throw std::logic_error(std::string(rowOf(kind).name) + " has no attribute " +
                               std::string(name));
    }
    return found->second;
}

}  // namespace

const char* kindName(Kind kind) { return rowOf(kind).name; }

Object::Object(Kind kind, Place place, std::string attributes)
    : m_kind(kind), m_place(place), m_attributes(std::move(attributes)) {
    if (m_attributes.empty()) m_attributes = "\n";
}

std::size_t Object::find(std::string_view name, std::size_t* size) const {
    std::string line;
    line.reserve(name.size() + 2);
    line.append("\n").append(name).append("=");
    const std::size_t at = m_attributes.find(line);
    if (at == std::string::npos) return at;
    const std::size_t begin = at + line.size();
    *size = m_attributes.find('\n', begin) - begin;
    return begin;
}

std::string Object::get(std::string_view name) const {
    std::size_t size = 0;
    const std::size_t at = find(name, &size);
    if (at != std::string::npos) return m_attributes.substr(at, size);

    const char* value = defaultOf(m_kind, name);
    if (value == nullptr) {
        throw std::logic_error(std::string(kindName(m_kind)) + " without " + std::string(name));
    }
    if (*value == '$') return get(value + 1);
    if (*value == '#') return std::to_string(value[1] == 'l' ? m_place.lpar : m_place.number);
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
    if (at != std::string::npos) m_attributes.erase(at - line, line + size + 1);
}

std::vector<std::pair<std::string_view, std::string_view>> Object::settings() const {
    std::vector<std::pair<std::string_view, std::string_view>> all;
    const std::string_view lines = m_attributes;
    for (std::size_t begin = 1; begin < lines.size();) {
        const std::size_t equals = lines.find('=', begin), end = lines.find('\n', begin);
        all.emplace_back(lines.substr(begin, equals - begin),
                         lines.substr(equals + 1, end - equals - 1));
        begin = end + 1;
    }
    return all;
}

}  // namespace appliance

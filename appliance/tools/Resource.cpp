#include "Resource.h"

#include "Rows.h"

namespace appliance {

namespace {

constexpr const char* kSystem =
    "name,type_model,serial_num,ipaddr,state,sys_time,power_off_policy,cod_mem_capable,"
    "cod_proc_capable,micro_lpar_capable,osq00_capable,max_lpars,max_power_ctrl_lpars,"
    "service_lpar_id,mfg_default_config,active_lpar_mobility_capable,"
    "inactive_lpar_mobility_capable,lpar_proc_compat_mode_capable,lpar_proc_compat_modes,"
    "virtual_io_server_capable,lhea_capable,virtual_switch_capable,"
    "active_lpar_share_idle_procs_capable,bsr_capable,electronic_err_reporting_capable,"
    "hca_capable,huge_page_mem_capable,lpar_avail_priority_capable,7460_application_capable,"
    "redundant_err_path_reporting_capable,shared_eth_failover_capable,sni_msg_passing_capable,"
    "sp_failover_capable,vet_activation_capable,assign_7460_wkl_percent,curr_sys_keylock,"
    "pend_sys_keylock,curr_power_on_side,pend_power_on_side,curr_power_on_speed,"
    "pend_power_on_speed,curr_power_on_speed_override,pend_power_on_speed_override,power_on_type,"
    "power_on_option,pend_power_on_option,power_on_method,power_on_attr,sp_boot_attr,"
    "sp_boot_major_type,sp_boot_minor_type,sp_version,curr_mfg_default_ipl_source,"
    "pend_mfg_default_ipl_source,curr_mfg_default_boot_mode,pend_mfg_default_boot_mode,"
    "sp_failover_enabled,lpar_suspend_capable,coralhv_lpar_remote_restart_capable,"
    "max_suspend_capable_lpars,max_remote_restart_capable_lpars,active_mem_sharing_capable";

constexpr const char* kLpar =
    "lpar_id,name,lpar_env,state,resource_config,os_version,logical_serial_num,default_profile,"
    "curr_profile,work_group_id,shared_proc_pool_util_auth,allow_perf_collection,"
    "power_ctrl_lpar_ids,boot_mode,lpar_keylock,auto_start,desired_lpar_proc_compat_mode,"
    "curr_lpar_proc_compat_mode,migration_state,redundant_err_path_reporting,suspend_capable,"
    "remote_restart_capable,remote_restart_status";

constexpr const char* kProfile =
    "lpar_id,lpar_name,name,lpar_env,all_resources,min_mem,desired_mem,max_mem,mem_mode,"
    "mem_weight,desired_io_entitled_mem,primary_psp_id,primary_psp_name,secondary_psp_id,"
    "secondary_psp_name,proc_mode,min_proc_units,desired_proc_units,max_proc_units,min_procs,"
    "desired_procs,max_procs,sharing_mode,uncap_weight,io_slots,load_source_slot,"
    "alt_restart_device_slot,console_slot,alt_console_slot,op_console_slot,lpar_io_pool_ids,"
    "max_virtual_slots,virtual_serial_adapters,virtual_scsi_adapters,virtual_eth_adapters,"
    "boot_mode,conn_monitoring,auto_start,power_ctrl_lpar_ids,shared_proc_pool_id,"
    "lpar_proc_compat_mode,hca_adapters,work_group_id,redundant_err_path_reporting";

constexpr const char* kMemLpar =
    "lpar_id,lpar_name,curr_min_mem,curr_mem,curr_max_mem,pend_min_mem,pend_mem,pend_max_mem,"
    "run_min_mem,run_mem,mem_mode,pend_mem_weight,curr_mem_weight,run_mem_weight,"
    "pend_io_entitled_mem,curr_io_entitled_mem,run_io_entitled_mem,auto_io_entitled_mem,"
    "primary_psp_name,primary_psp_id,secondary_psp_name,secondary_psp_id,curr_psp_id,"
    "curr_psp_name";

constexpr const char* kMemSystem =
    "configurable_sys_mem,curr_avail_sys_mem,pend_avail_sys_mem,installed_sys_mem,"
    "deconfig_sys_mem,sys_firmware_mem,mem_region_size,required_min_mem_tmx_linux,"
    "required_min_mem_osq00,max_mem_pools";

constexpr const char* kProcLpar =
    "lpar_id,lpar_name,curr_shared_proc_pool_id,curr_proc_mode,curr_min_proc_units,"
    "curr_proc_units,curr_max_proc_units,curr_min_procs,curr_procs,curr_max_procs,"
    "curr_sharing_mode,curr_uncap_weight,pend_shared_proc_pool_id,pend_proc_mode,"
    "pend_min_proc_units,pend_proc_units,pend_max_proc_units,pend_min_procs,pend_procs,"
    "pend_max_procs,pend_sharing_mode,pend_uncap_weight,run_proc_units,run_procs,"
    "run_uncap_weight";

constexpr const char* kProcSystem =
    "configurable_sys_proc_units,curr_avail_sys_proc_units,pend_avail_sys_proc_units,"
    "installed_sys_proc_units,deconfig_sys_proc_units,min_proc_units_per_virtual_proc,"
    "max_shared_proc_pools,configurable_pool_proc_uints,pend_pool_mem";

constexpr const char* kProcOfPool =
    "shared_proc_pool_id,configurable_pool_proc_units,curr_avail_pool_proc_units,"
    "pend_avail_pool_proc_units";

constexpr const char* kMemPool =
    "curr_pool_mem,pend_pool_mem,curr_max_pool_mem,pend_max_pool_mem,sys_firmware_pool_mem,"
    "pend_avail_pool_mem,psp_names,psp_ids";

constexpr const char* kProcPool =
    "name,shared_proc_pool_id,max_pool_proc_units,curr_reserved_pool_proc_units,"
    "pend_reserved_pool_proc_units,lpar_names,lpar_ids";

constexpr const char* kEthernet =
    "lpar_id,lpar_name,slot_num,state,ieee_virtual_eth,port_vlan_id,addl_vlan_ids,is_trunk,"
    "is_required,mac_addr,trunk_priority";

constexpr const char* kScsi =
    "lpar_id,lpar_name,slot_num,state,adapter_type,remote_lpar_id,remote_lpar_name,"
    "remote_slot_num,is_required,backing_devices";

constexpr const char* kSerial =
    "lpar_id,lpar_name,slot_num,state,is_required,connect_status,adapter_type,supports_dnx,"
    "remote_lpar_id,remote_lpar_name,remote_slot_num";

constexpr const char* kVirtualSlots =
    "lpar_id,lpar_name,curr_max_virtual_slots,pend_max_virtual_slots";

constexpr const char* kVirtualSlot = "lpar_id,lpar_name,slot_num,config,state,drc_name";

constexpr const char* kBus = "unit_phys_loc,bus_id,backplane_phys_loc,bus_drc_index,bus_drc_name";

constexpr const char* kSlot =
    "lpar_id,unit_phys_loc,bus_id,phys_loc,drc_index,slot_io_pool_id,description,feature_codes,"
    "pci_vendor_id,pci_device_id,pci_subs_vendor_id,pci_subs_device_id,pci_class,"
    "pci_revision_id,bus_grouping,iop,parent_slot_drc_index,drc_name";

constexpr const char* kTaggedIo =
    "lpar_id,lpar_name,load_source_slot,alt_restart_device_slot,recent_alt_restart_device_slot,"
    "console_slot,alt_console_slot,op_console_slot";

// The callers of these two only count records.
constexpr const char* kHca = "adapter_id,phys_loc,capability,state,lpar_id";
constexpr const char* kSni = "sni_device_id,adapter_id,phys_loc,lpar_id";

constexpr const char* kMoveLpar =
    "name,lpar_id,migration_state,migration_type,source_sys_name,dest_sys_name,source_lpar_id,"
    "dest_lpar_id,source_msp_name,source_msp_id,dest_msp_name,dest_msp_id,bytes_transmitted,"
    "bytes_remaining";

constexpr const char* kMoveSystem =
    "inactive_lpar_mobility_capable,num_inactive_migrations_supported,"
    "num_inactive_migrations_in_progress,active_lpar_mobility_capable,"
    "num_active_migrations_supported,num_active_migrations_in_progress";

constexpr const char* kUsageSystem =
    "time,event_type,resource_type,sys_time,state,configurable_sys_proc_units,"
    "configurable_sys_mem,curr_avail_sys_proc_units,curr_avail_7460_wkl_percent,"
    "curr_avail_sys_mem,sys_firmware_mem,proc_cycles_per_second";

constexpr const char* kUsageLpar =
    "time,event_type,resource_type,sys_time,time_cycles,lpar_name,lpar_id,curr_proc_mode,"
    "curr_procs,curr_sharing_mode,curr_7460_wkl_percent,curr_mem,entitled_cycles,capped_cycles,"
    "uncapped_cycles,mem_mode";

constexpr const char* kFaultLpar =
    "lpar_name,lpar_id,time_stamp,refcode,word2,fru_call_out_loc_codes";

constexpr const char* kLink =
    "resource_type,type_model_serial_num,sp,sp_phys_loc,ipaddr,alt_ipaddr,state,"
    "connection_error_code";

constexpr const char* kByHost = "sys_names";
constexpr const char* kByLpar = "lpar_ids,lpar_names";
constexpr const char* kByVirtualSlot = "lpar_ids,lpar_names,slots";
constexpr const char* kBySlot = "lpar_ids,lpar_names,units,buses,drc_indexes,io_pools";

constexpr auto eachLpar = each<Kind::Lpar>;
constexpr auto eachPool = each<Kind::ProcPool>;
constexpr auto eachVirtualSlot = each<Kind::Ethernet, Kind::VirtualScsi, Kind::Serial>;

}  // namespace

// NOLINTNEXTLINE(readability-function-size): one table
const std::vector<Resource>& resources() {
    // clang-format off
    static const std::vector<Resource> all = {
        {{kQyplat, "sys", nullptr, nullptr, kSystem, kByHost}, eachHost},
        {{kQyplat, "lpar", nullptr, nullptr,
          kLpar, "lpar_ids,lpar_names,lpar_envs,work_groups"}, eachLpar},
        {{kQyplat, "prof", nullptr, nullptr,
          kProfile, "lpar_ids,lpar_names,profile_names"}, each<Kind::Profile>},

        {{kQyalloc, "mem", nullptr, "lpar", kMemLpar, kByLpar}, eachLpar},
        {{kQyalloc, "mem", nullptr, "sys", kMemSystem, kByHost}, hostCapacity},
        {{kQyalloc, "proc", nullptr, "lpar", kProcLpar, kByLpar}, eachLpar},
        {{kQyalloc, "proc", nullptr, "pool", kProcOfPool, "pool_ids"}, eachPool},
        {{kQyalloc, "proc", nullptr, "sys", kProcSystem, kByHost}, hostCapacity},
        {{kQyalloc, "mempool", nullptr, kAnyLevel, kMemPool, kByHost}, each<Kind::MemPool>},
        {{kQyalloc, "procpool", nullptr, kAnyLevel, kProcPool, "pool_ids"}, eachPool},
        {{kQyalloc, "virtualio", "eth", "lpar", kEthernet, kByVirtualSlot}, each<Kind::Ethernet>},
        {{kQyalloc, "virtualio", "eth", "sys", "max_vlans_per_port,mac_prefix", kByHost}, eachHost},
        {{kQyalloc, "virtualio", "hsl", kAnyLevel,
          "hsl_pool_id,lpar_names,lpar_ids", kByHost}, each<Kind::HslPool>},
        {{kQyalloc, "virtualio", "virtualopti", kAnyLevel,
          "virtual_opti_pool_id,lpar_names,lpar_ids", kByHost}, each<Kind::OptiPool>},
        {{kQyalloc, "virtualio", "scsi", "lpar", kScsi, kByVirtualSlot}, each<Kind::VirtualScsi>},
        {{kQyalloc, "virtualio", "serial", "lpar", kSerial, kByVirtualSlot}, each<Kind::Serial>},
        {{kQyalloc, "virtualio", "slot", "lpar", kVirtualSlots, kByLpar}, eachLpar},
        {{kQyalloc, "virtualio", "slot", "slot", kVirtualSlot, kByVirtualSlot}, eachVirtualSlot},
        {{kQyalloc, "io", "unit", kAnyLevel, "unit_phys_loc", "units"}, each<Kind::Unit>},
        {{kQyalloc, "io", "bus", kAnyLevel, kBus, "units,buses"}, each<Kind::Bus>},
        {{kQyalloc, "io", "slot", kAnyLevel, kSlot, kBySlot}, each<Kind::Slot>},
        {{kQyalloc, "io", "iopool", kAnyLevel, "max_io_pools", kByHost}, eachHost},
        {{kQyalloc, "io", "taggedio", kAnyLevel, kTaggedIo, kByLpar}, taggedLpars},
        {{kQyalloc, "hca", nullptr, "lpar", kHca, kByLpar}, eachUsed<Kind::Hca>},
        {{kQyalloc, "hca", nullptr, "sys", kHca, kByLpar}, each<Kind::Hca>},
        {{kQyalloc, "sni", nullptr, kAnyLevel, kSni, kByLpar}, each<Kind::Sni>},

        // In the order of qyplat's partitions: callers pair the two lists line by line.
        {{kQymove, "lpar", nullptr, nullptr, kMoveLpar, kByLpar}, eachLpar},
        {{kQymove, "sys", nullptr, nullptr, kMoveSystem, kByHost}, eachHost},
        {{kQymove, "manager", nullptr, nullptr,
          "remote_lpar_mobility_capable", kByHost}, theAppliance},

        {{kQyusage, "config", nullptr, nullptr,
          "type_model_serial_num,name,sample_rate", kByHost}, eachHost},
        {{kQyusage, "sys", nullptr, nullptr, kUsageSystem, "event_types"}, hostSamples},
        {{kQyusage, "lpar", nullptr, nullptr,
          kUsageLpar, "event_types,lpar_ids,lpar_names"}, lparSamples},

        {{kQyfault, "lpar", nullptr, nullptr, kFaultLpar, kByLpar}, eachLpar},
        {{kQyfault, "sys", nullptr, nullptr, "refcode_num,refcode", kByHost}, eachHost},

        {{kQylink, "all", nullptr, nullptr, kLink, kByHost}, each<Kind::Link>},

        {{kQylwh, nullptr, nullptr, nullptr, "type_model,serial_num,lpar_id"}, singleHostManager},

        // By partition ID: callers take the first place where "7*<host>" occurs, and that must not
        // be within "17*<host>".
        {{kQydyn, nullptr, nullptr, nullptr, "lpar_key,dlpar_capabilities"}, dynamicLpars},

        {{kXbrgcli, "version", nullptr, nullptr, "os_version"}, ioServer},
        {{kXbrgcli, "mappings", nullptr, nullptr,
          "slot_num,remote_lpar_id,remote_lpar_name,remote_slot_num,backing_devices"}, ioServerMappings},
    };
    // clang-format on
    return all;
}

}  // namespace appliance

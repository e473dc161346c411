/// Asks the tool "qyplat" for hosts, partitions and profiles.
///
///     zemQyplatCmdCaller caller(userName, locale);
///     int wanted[] = {zemQyplatCmdCaller::ManagedSystemAttribute::ATTR_NAME,
///                     zemQyplatCmdCaller::ManagedSystemAttribute::ATTR_END};
///     zemRecordSetsType hosts = caller.getManagedSystemInformation(wanted, nullptr);
///     for (int i = 0; i < hosts.size(); ++i) puts((*hosts.getElementAt(i))[wanted[0]]);
///
/// An object is made for one operation and is not shared between threads. Operations throw what
/// the tool's failures raise (CommandCaller.h); "no results" is such a failure.
#ifndef QYPLAT_CMD_CALLER_H
#define QYPLAT_CMD_CALLER_H

#include "CommandCaller.h"

// Enumerators are the fields' names in upper case, but for three that users know by other
// spellings.

#define ZEM_QYPLAT_SYS(X)                                                           \
    X(NAME, "name")                                                                 \
    X(TYPE_MODEL, "type_model")                                                     \
    X(SERIAL_NUM, "serial_num")                                                     \
    X(IPADDR, "ipaddr")                                                             \
    X(STATE, "state")                                                               \
    X(SYS_TIME, "sys_time")                                                         \
    X(POWER_OFF_POLICY, "power_off_policy")                                         \
    X(COD_MEM_CAPABLE, "cod_mem_capable")                                           \
    X(COD_PROC_CAPABLE, "cod_proc_capable")                                         \
    X(MICRO_LPAR_CAPABLE, "micro_lpar_capable")                                     \
    X(OSQ00_CAPABLE, "osq00_capable")                                               \
    X(MAX_LPARS, "max_lpars")                                                       \
    X(MAX_POWER_CTRL_LPARS, "max_power_ctrl_lpars")                                 \
    X(SERVICE_LPAR_ID, "service_lpar_id")                                           \
    X(MFG_DEFAULT_CONFIG, "mfg_default_config")                                     \
    X(ACTIVE_LPAR_MOBILITY_CAPABLE, "active_lpar_mobility_capable")                 \
    X(INACTIVE_LPAR_MOBILITY_CAPABLE, "inactive_lpar_mobility_capable")             \
    X(LPAR_PROC_COMPAT_MODE_CAPABLE, "lpar_proc_compat_mode_capable")               \
    X(LPAR_PROC_COMPAT_MODES, "lpar_proc_compat_modes")                             \
    X(VIRTUAL_IO_SERVER_CAPABLE, "virtual_io_server_capable")                       \
    X(LHEA_CAPABLE, "lhea_capable")                                                 \
    X(VIRTUAL_SWITCH_CAPABLE, "virtual_switch_capable")                             \
    X(ACTIVE_LPAR_SHARE_IDLE_PROCS_CAPABLE, "active_lpar_share_idle_procs_capable") \
    X(BSR_CAPABLE, "bsr_capable")                                                   \
    X(ELECTRONIC_ERR_REPORTING_CAPABLE, "electronic_err_reporting_capable")         \
    X(HCA_CAPABLE, "hca_capable")                                                   \
    X(HUGE_PAGE_MEM_CAPABLE, "huge_page_mem_capable")                               \
    X(LPAR_AVAIL_PRIORITY_CAPABLE, "lpar_avail_priority_capable")                   \
    X(7460_APPLICATION_CAPABLE, "7460_application_capable")                         \
    X(REDUNDANT_ERR_PATH_REPORTING_CAPABLE, "redundant_err_path_reporting_capable") \
    X(SHARED_ETH_FAILOVER_CAPABLE, "shared_eth_failover_capable")                   \
    X(SNI_MSG_PASSING_CAPABLE, "sni_msg_passing_capable")                           \
    X(SP_FAILOVER_CAPABLE, "sp_failover_capable")                                   \
    X(VET_ACTIVATION_CAPABLE, "vet_activation_capable")                             \
    X(ASSIGN_7460_WKL_PERCENT, "assign_7460_wkl_percent")                           \
    X(CURR_SYS_KEYLOCK, "curr_sys_keylock")                                         \
    X(PEND_SYS_KEYLOCK, "pend_sys_keylock")                                         \
    X(CURR_POWER_ON_SIDE, "curr_power_on_side")                                     \
    X(PEND_POWER_ON_SIDE, "pend_power_on_side")                                     \
    X(CURR_POWER_ON_SPEED, "curr_power_on_speed")                                   \
    X(PEND_POWER_ON_SPEED, "pend_power_on_speed")                                   \
    X(CURR_POWER_ON_SPEED_OVERRIDE, "curr_power_on_speed_override")                 \
    X(PEND_POWER_ON_SPEED_OVERRIDE, "pend_power_on_speed_override")                 \
    X(POWER_ON_TYPE, "power_on_type")                                               \
    X(POWER_ON_OPTION, "power_on_option")                                           \
    X(PEND_POWER_ON_OPTION, "pend_power_on_option")                                 \
    X(POWER_ON_METHOD, "power_on_method")                                           \
    X(POWER_ON_ATTR, "power_on_attr")                                               \
    X(SP_BOOT_ATTR, "sp_boot_attr")                                                 \
    X(SP_BOOT_MAJOR_TYPE, "sp_boot_major_type")                                     \
    X(SP_BOTT_MINOR_TYPE, "sp_boot_minor_type")                                     \
    X(SP_VERSION, "sp_version")                                                     \
    X(CURR_MFG_DEFAULT_IPL_SOURCW, "curr_mfg_default_ipl_source")                   \
    X(PEND_MFG_DEFAULT_IPL_SOURCE, "pend_mfg_default_ipl_source")                   \
    X(CURR_MFG_DEFAULT_BOOT_MODE, "curr_mfg_default_boot_mode")                     \
    X(PEND_MFG_DEFAULT_BOOT_MODE, "pend_mfg_default_boot_mode")                     \
    X(SP_FAILOVER_ENABLED, "sp_failover_enabled")                                   \
    X(LPAR_SUSPEND_CAPABLE, "lpar_suspend_capable")                                 \
    X(CORALHV_LPAR_REMOTE_RESTART_CAPABLE, "coralhv_lpar_remote_restart_capable")   \
    X(MAX_SUSPEND_CAPABLE_LPARS, "max_suspend_capable_lpars")                       \
    X(MAX_REMOTE_RESTART_CAPABLE_LPARS, "max_remote_restart_capable_lpars")         \
    X(ACTIVE_MEMORY_SHARING_CAPABLE, "active_mem_sharing_capable")

#define ZEM_QYPLAT_LPAR(X)                                            \
    X(LPAR_ID, "lpar_id")                                             \
    X(NAME, "name")                                                   \
    X(LPAR_ENV, "lpar_env")                                           \
    X(STATE, "state")                                                 \
    X(RESOURCE_CONFIG, "resource_config")                             \
    X(OS_VERSION, "os_version")                                       \
    X(LOGICAL_SERIAL_NUM, "logical_serial_num")                       \
    X(DEFAULT_PROFILE, "default_profile")                             \
    X(CURR_PROFILE, "curr_profile")                                   \
    X(WORK_GROUP_ID, "work_group_id")                                 \
    X(SHARED_PROC_POOL_UTIL_AUTH, "shared_proc_pool_util_auth")       \
    X(ALLOW_PERF_COLLECTION, "allow_perf_collection")                 \
    X(POWER_CTRL_LPAR_IDS, "power_ctrl_lpar_ids")                     \
    X(BOOT_MODE, "boot_mode")                                         \
    X(LPAR_KEYLOCK, "lpar_keylock")                                   \
    X(AUTO_START, "auto_start")                                       \
    X(DESIRED_LPAR_PROC_COMPAT_MODE, "desired_lpar_proc_compat_mode") \
    X(CURR_LPAR_PROC_COMPAT_MODE, "curr_lpar_proc_compat_mode")       \
    X(MIGRATION_STATE, "migration_state")                             \
    X(REDUNDANT_ERR_PATH_REPORTING, "redundant_err_path_reporting")   \
    X(SUSPEND_CAPABLE, "suspend_capable")                             \
    X(REMOTE_RESTART_CAPABLE, "remote_restart_capable")               \
    X(REMOTE_RESTART_STATUS, "remote_restart_status")

#define ZEM_QYPLAT_PROF(X)                                \
    X(LPAR_ID, "lpar_id")                                 \
    X(LPAR_NAME, "lpar_name")                             \
    X(NAME, "name")                                       \
    X(LPAR_ENV, "lpar_env")                               \
    X(ALL_RESOURCES, "all_resources")                     \
    X(MIN_MEM, "min_mem")                                 \
    X(DESIRED_MEM, "desired_mem")                         \
    X(MAX_MEM, "max_mem")                                 \
    X(MEM_MODE, "mem_mode")                               \
    X(MEM_WEIGHT, "mem_weight")                           \
    X(DESIRED_IO_ENTITLED_MEM, "desired_io_entitled_mem") \
    X(PRIMARY_PSP_ID, "primary_psp_id")                   \
    X(PRIMARY_PSP_NAME, "primary_psp_name")               \
    X(SECONDARY_PSP_ID, "secondary_psp_id")               \
    X(SECONDARY_PSP_NAME, "secondary_psp_name")           \
    X(PROC_MODE, "proc_mode")                             \
    X(MIN_PROC_UNITS, "min_proc_units")                   \
    X(DESIRED_PROC_UNITS, "desired_proc_units")           \
    X(MAX_PROC_UNITS, "max_proc_units")                   \
    X(MIN_PROCS, "min_procs")                             \
    X(DESIRED_PROCS, "desired_procs")                     \
    X(MAX_PROCS, "max_procs")                             \
    X(SHARING_MODE, "sharing_mode")                       \
    X(UNCAP_WEIGHT, "uncap_weight")                       \
    X(IO_SLOTS, "io_slots")                               \
    X(LOAD_SOURCE_SLOT, "load_source_slot")               \
    X(ALT_RESTART_DEVICE_SLOT, "alt_restart_device_slot") \
    X(CONSOLE_SLOT, "console_slot")                       \
    X(ALT_CONSOLE_SLOT, "alt_console_slot")               \
    X(OP_CONSOLE_SLOT, "op_console_slot")                 \
    X(LPAR_IO_POOL_IDS, "lpar_io_pool_ids")               \
    X(MAX_VIRTUAL_SLOTS, "max_virtual_slots")             \
    X(VIRTUAL_SERIAL_ADAPTERS, "virtual_serial_adapters") \
    X(VIRTUAL_SCSI_ADAPTERS, "virtual_scsi_adapters")     \
    X(VIRTUAL_ETH_ADAPTERS, "virtual_eth_adapters")       \
    X(BOOT_MODE, "boot_mode")                             \
    X(CONN_MONITORING, "conn_monitoring")                 \
    X(AUTO_START, "auto_start")                           \
    X(POWER_CTRL_LPAR_IDS, "power_ctrl_lpar_ids")         \
    X(SHARED_PROC_POOL_ID, "shared_proc_pool_id")         \
    X(LPAR_PROC_COMPAT_MODE, "lpar_proc_compat_mode")     \
    X(HCA_ADAPTERS, "hca_adapters")                       \
    X(WORK_GROUP_ID, "work_group_id")                     \
    X(REDUNDANT_ERR_PATH_REPORTING, "redundant_err_path_reporting")

class ZEM_EXPORT zemQyplatCmdCaller : public zemCommandCaller {
public:
    ZEM_ATTRIBUTE_TABLE(ManagedSystemAttribute, ZEM_QYPLAT_SYS);
    ZEM_ATTRIBUTE_TABLE(PartitionAttribute, ZEM_QYPLAT_LPAR);
    ZEM_ATTRIBUTE_TABLE(PartitionProfileAttribute, ZEM_QYPLAT_PROF);

    /// @param auth,locale  as for zemCommandCaller
    zemQyplatCmdCaller(const char* auth, const char* locale);

    /// Each gives one record for a host, partition or profile of @p managedSystem.
    /// @param paramAttr  wanted attributes, ending in ATTR_END; null: all
    /// @param managedSystem  key or name of a host; null or empty: all hosts
    /// @param filter  the tool's filter with its own quoting; null or empty: none
    zemRecordSetsType getManagedSystemInformation(int* paramAttr, const char* managedSystem);
    zemRecordSetsType getPartitionsInformation(int* paramAttr, const char* managedSystem,
                                               const char* filter);
    zemRecordSetsType getPartitionsProfileInformation(int* paramAttr, const char* managedSystem,
                                                      const char* filter);
};

#undef ZEM_QYPLAT_SYS
#undef ZEM_QYPLAT_LPAR
#undef ZEM_QYPLAT_PROF

#endif

/// Changes attributes of hosts, partitions and profiles through the tool "edplat".
///
///     zemEdplatCmdCaller caller(userName, locale);
///     zemDynamicArray<tagAttributePair> pairs;
///     pairs.addElement(new tagAttributePair{
///         zemEdplatCmdCaller::PartitionAttribute::ATTR_NEW_NAME, "web2"});
///     caller.modifyPartitionsInformation("3", pairs, mtms);
///
/// The operations return 0, or throw what the tool's failures raise (CommandCaller.h). An object is
/// made for one operation and is not shared between threads.
#ifndef EDPLAT_CMD_CALLER_H
#define EDPLAT_CMD_CALLER_H

#include "CommandCaller.h"

#define ZEM_EDPLAT_PROF(X)                                          \
    X(NAME, "name")                                                 \
    X(LPAR_ID, "lpar_id")                                           \
    X(LPAR_NAME, "lpar_name")                                       \
    X(NEW_NAME, "new_name")                                         \
    X(MIN_MEM, "min_mem")                                           \
    X(DESIRED_MEM, "desired_mem")                                   \
    X(MAX_MEM, "max_mem")                                           \
    X(MEM_MODE, "mem_mode")                                         \
    X(MEM_WEIGHT, "mem_weight")                                     \
    X(DESIRED_IO_ENTITLED_MEM, "desired_io_entitled_mem")           \
    X(PRIMARY_PSP_ID, "primary_psp_id")                             \
    X(PRIMARY_PSP_NAME, "primary_psp_name")                         \
    X(SECONDARY_PSP_ID, "secondary_psp_id")                         \
    X(SECONDARY_PSP_NAME, "secondary_psp_name")                     \
    X(MIN_PROCS, "min_procs")                                       \
    X(DESIRED_PROCS, "desired_procs")                               \
    X(MAX_PROCS, "max_procs")                                       \
    X(MIN_PROC_UNITS, "min_proc_units")                             \
    X(DESIRED_PROC_UNITS, "desired_proc_units")                     \
    X(MAX_PROC_UNITS, "max_proc_units")                             \
    X(PROC_MODE, "proc_mode")                                       \
    X(SHARING_MODE, "sharing_mode")                                 \
    X(UNCAP_WEIGHT, "uncap_weight")                                 \
    X(LPAR_PROC_COMPAT_MODE, "lpar_proc_compat_mode")               \
    X(SHARED_PROC_POOL_ID, "shared_proc_pool_id")                   \
    X(SHARED_PROC_POOL_NAME, "shared_proc_pool_name")               \
    X(BOOT_MODE, "boot_mode")                                       \
    X(AUTO_START, "auto_start")                                     \
    X(MAX_VIRTUAL_SLOTS, "max_virtual_slots")                       \
    X(VIRTUAL_ETH_ADAPTERS, "virtual_eth_adapters")                 \
    X(VIRTUAL_SCSI_ADAPTERS, "virtual_scsi_adapters")               \
    X(VIRTUAL_SERIAL_ADAPTERS, "virtual_serial_adapters")           \
    X(IO_SLOTS, "io_slots")                                         \
    X(LOAD_SOURCE_SLOT, "load_source_slot")                         \
    X(ALT_RESTART_DEVICE_SLOT, "alt_restart_device_slot")           \
    X(CONSOLE_SLOT, "console_slot")                                 \
    X(ALT_CONSOLE_SLOT, "alt_console_slot")                         \
    X(OP_CONSOLE_SLOT, "op_console_slot")                           \
    X(MIN_NUM_HUGE_PAGES, "min_num_huge_pages")                     \
    X(DESIRED_NUM_HUGE_PAGES, "desired_num_huge_pages")             \
    X(MAX_NUM_HUGE_PAGES, "max_num_huge_pages")                     \
    X(BSR_ARRAYS, "bsr_arrays")                                     \
    X(MIN_7460_WKL_PERCENT, "min_7460_wkl_percent")                 \
    X(DESIRED_7460_WKL_PERCENT, "desired_7460_wkl_percent")         \
    X(MAX_7460_WKL_PERCENT, "max_7460_wkl_percent")                 \
    X(LPAR_IO_POOL_IDS, "lpar_io_pool_ids")                         \
    X(CONN_MONITORING, "conn_monitoring")                           \
    X(VIRTUAL_OPTI_POOL_ID, "virtual_opti_pool_id")                 \
    X(HSL_POOL_ID, "hsl_pool_id")                                   \
    X(POWER_CTRL_LPAR_IDS, "power_ctrl_lpar_ids")                   \
    X(POWER_CTRL_LPAR_NAMES, "power_ctrl_lpar_names")               \
    X(HCA_ADAPTERS, "hca_adapters")                                 \
    X(LHEA_LOGICAL_PORTS, "lhea_logical_ports")                     \
    X(LHEA_CAPABILITIES, "lhea_capabilities")                       \
    X(SNI_DEVICE_IDS, "sni_device_ids")                             \
    X(WORK_GROUP_ID, "work_group_id")                               \
    X(REDUNDANT_ERR_PATH_REPORTING, "redundant_err_path_reporting") \
    X(ELECTRONIC_ERR_REPORTING, "electronic_err_reporting")

#define ZEM_EDPLAT_LPAR(X)                            \
    X(NAME, "name")                                   \
    X(LPAR_ID, "lpar_id")                             \
    X(NEW_NAME, "new_name")                           \
    X(WORK_GROUP_ID, "work_group_id")                 \
    X(DEFAULT_PROFILE, "default_profile")             \
    X(IPL_SOURCE, "ipl_source")                       \
    X(ALLOW_PERF_COLLECTION, "allow_perf_collection") \
    X(LPAR_AVAIL_PRIORITY, "lpar_avail_priority")     \
    X(ELECTRONIC_ERR_REPORTING, "electronic_err_reporting")

#define ZEM_EDPLAT_SYS(X)                                 \
    X(NEW_NAME, "new_name")                               \
    X(POWER_OFF_POLICY, "power_off_policy")               \
    X(SERVICE_LPAR_ID, "service_lpar_id")                 \
    X(SERVICE_LPAR_NAME, "service_lpar_name")             \
    X(POWER_ON_OPTION, "power_on_option")                 \
    X(POWER_ON_SIDE, "power_on_side")                     \
    X(POWER_ON_SPEED, "power_on_speed")                   \
    X(POWER_ON_SPEED_OVERRIDE, "power_on_speed_override") \
    X(SP_FAILOVER_ENABLED, "sp_failover_enabled")

class ZEM_EXPORT zemEdplatCmdCaller : public zemCommandCaller {
public:
    ZEM_ATTRIBUTE_TABLE(PartitionProfileAttribute, ZEM_EDPLAT_PROF);
    ZEM_ATTRIBUTE_TABLE(PartitionAttribute, ZEM_EDPLAT_LPAR);
    ZEM_ATTRIBUTE_TABLE(ManagedSystemAttribute, ZEM_EDPLAT_SYS);

    /// @param auth,locale  as for zemCommandCaller
    zemEdplatCmdCaller(const char* auth, const char* locale);

    /// Adds to, sets or takes from attributes of a host, a partition or a profile.
    /// @param profName,lparId  name of the profile, number of the partition
    /// @param attrPairs  positions in the table of the resource, and their values
    /// @param managedSystem  key or name of the host; null: the line does not name it
    /// @throws zemInvalidParameterException id "INVALID_INDEX": a position outside the table
    int changeManagedSystemInformation(const zemDynamicArray<tagAttributePair>& attrPairs,
                                       const char* managedSystem, CH_OP_TYPE op);
    int changePartitionsInformation(const zemString& lparId,
                                    const zemDynamicArray<tagAttributePair>& attrPairs,
                                    const char* managedSystem, CH_OP_TYPE op);
    int changePartitionsProfileInformation(const zemString& profName,
                                           const zemDynamicArray<tagAttributePair>& attrPairs,
                                           const char* lparId, const char* managedSystem,
                                           CH_OP_TYPE op);

    /// The same with the change that the name says.
    int modifyManagedSystemInformation(const zemDynamicArray<tagAttributePair>& attrPairs,
                                       const char* managedSystem);
    int addPartitionsInformation(const zemString& lparId,
                                 const zemDynamicArray<tagAttributePair>& attrPairs,
                                 const char* managedSystem);
    int modifyPartitionsInformation(const zemString& lparId,
                                    const zemDynamicArray<tagAttributePair>& attrPairs,
                                    const char* managedSystem);
    int removePartitionsInformation(const zemString& lparId,
                                    const zemDynamicArray<tagAttributePair>& attrPairs,
                                    const char* managedSystem);
    int addPartitionsProfileInformation(const zemString& profName,
                                        const zemDynamicArray<tagAttributePair>& attrPairs,
                                        const char* lparId, const char* managedSystem);
    int modifyPartitionsProfileInformation(const zemString& profName,
                                           const zemDynamicArray<tagAttributePair>& attrPairs,
                                           const char* lparId, const char* managedSystem);
    int removePartitionsProfileInformation(const zemString& profName,
                                           const zemDynamicArray<tagAttributePair>& attrPairs,
                                           const char* lparId, const char* managedSystem);

private:
    int change(const char* resource, const zemDynamicArray<tagAttributePair>& identity,
               const zemDynamicArray<tagAttributePair>& attrPairs, const char* managedSystem,
               zemAttributeNames table, CH_OP_TYPE op);
};

#undef ZEM_EDPLAT_PROF
#undef ZEM_EDPLAT_LPAR
#undef ZEM_EDPLAT_SYS

#endif

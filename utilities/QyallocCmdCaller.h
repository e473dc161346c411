/// Asks the tool "qyalloc" for the resources of a host: memory, processors, pools, adapters, slots.
///
///     using Sys = zemQyallocCmdCaller::MemoryResourceAttribute::SysLevelAttribute;
///     zemQyallocCmdCaller caller(userName, locale);
///     int wanted[] = {Sys::ATTR_CURR_AVAIL_SYS_MEM, Sys::ATTR_END};
///     zemRecordSetsType memory = caller.getSystemMemoryResources(wanted, mtms, 0, nullptr);
///
/// An object is made for one operation and is not shared between threads. Operations throw what
/// the tool's failures raise (CommandCaller.h); "no results" is such a failure.
#ifndef QYALLOC_CMD_CALLER_H
#define QYALLOC_CMD_CALLER_H

#include "CommandCaller.h"

#define ZEM_QYALLOC_MEMPOOL(X)                        \
    X(CURR_POOL_MEM, "curr_pool_mem")                 \
    X(PEND_POOL_MEM, "pend_pool_mem")                 \
    X(CURR_MAX_POOL_MEM, "curr_max_pool_mem")         \
    X(PEND_MAX_POOL_MEM, "pend_max_pool_mem")         \
    X(SYS_FIRMWARE_POOL_MEM, "sys_firmware_pool_mem") \
    X(PEND_AVAIL_POOL_MEM, "pend_avail_pool_mem")     \
    X(PSP_NAMES, "psp_names")                         \
    X(PSP_IDS, "psp_ids")

#define ZEM_QYALLOC_PROCPOOL(X)                                       \
    X(NAME, "name")                                                   \
    X(SHARED_PROC_POOL_ID, "shared_proc_pool_id")                     \
    X(MAX_POOL_PROC_UNITS, "max_pool_proc_units")                     \
    X(CURR_RESERVED_POOL_PROC_UNITS, "curr_reserved_pool_proc_units") \
    X(PEND_RESERVED_POOL_PROC_UNITS, "pend_reserved_pool_proc_units") \
    X(LPAR_NAMES, "lpar_names")                                       \
    X(LPAR_IDS, "lpar_ids")

#define ZEM_QYALLOC_MEM_LPAR(X)                     \
    X(LPAR_ID, "lpar_id")                           \
    X(LPAR_NAME, "lpar_name")                       \
    X(CURR_MIN_MEM, "curr_min_mem")                 \
    X(CURR_MEM, "curr_mem")                         \
    X(CURR_MAX_MEM, "curr_max_mem")                 \
    X(PEND_MIN_MEM, "pend_min_mem")                 \
    X(PEND_MEM, "pend_mem")                         \
    X(PEND_MAX_MEM, "pend_max_mem")                 \
    X(RUN_MIN_MEM, "run_min_mem")                   \
    X(RUN_MEM, "run_mem")                           \
    X(MEM_MODE, "mem_mode")                         \
    X(PEND_MEM_WEIGHT, "pend_mem_weight")           \
    X(CURR_MEM_WEIGHT, "curr_mem_weight")           \
    X(RUN_MEM_WEIGHT, "run_mem_weight")             \
    X(PEND_IO_ENTITLED_MEM, "pend_io_entitled_mem") \
    X(CURR_IO_ENTITLED_MEM, "curr_io_entitled_mem") \
    X(RUN_IO_ENTITLED_MEM, "run_io_entitled_mem")   \
    X(AUTO_IO_ENTITLED_MEM, "auto_io_entitled_mem") \
    X(PRIMARY_PSP_NAME, "primary_psp_name")         \
    X(PRIMARY_PSP_ID, "primary_psp_id")             \
    X(SECONDARY_PSP_NAME, "secondary_psp_name")     \
    X(SECONDARY_PSP_ID, "secondary_psp_id")         \
    X(CURR_PSP_ID, "curr_psp_id")                   \
    X(CURR_PSP_NAME, "curr_psp_name")

#define ZEM_QYALLOC_MEM_SYS(X)                                  \
    X(CONFIGURABLE_SYS_MEM, "configurable_sys_mem")             \
    X(CURR_AVAIL_SYS_MEM, "curr_avail_sys_mem")                 \
    X(PEND_AVAIL_SYS_MEM, "pend_avail_sys_mem")                 \
    X(INSTALLED_SYS_MEM, "installed_sys_mem")                   \
    X(DECONFIG_SYS_MEM, "deconfig_sys_mem")                     \
    X(SYS_FIRMWARE_MEM, "sys_firmware_mem")                     \
    X(MEM_REGION_SIZE, "mem_region_size")                       \
    X(REQUIRED_MIN_MEM_TMX_LINUX, "required_min_mem_tmx_linux") \
    X(REQUIRED_MIN_MEM_OSQ00, "required_min_mem_osq00")         \
    X(MAX_MEM_POOLS, "max_mem_pools")

#define ZEM_QYALLOC_PROC_LPAR(X)                            \
    X(LPAR_ID, "lpar_id")                                   \
    X(LPAR_NAME, "lpar_name")                               \
    X(CURR_SHARED_PROC_POOL_ID, "curr_shared_proc_pool_id") \
    X(CURR_PROC_MODE, "curr_proc_mode")                     \
    X(CURR_MIN_PROC_UNITS, "curr_min_proc_units")           \
    X(CURR_PROC_UNITS, "curr_proc_units")                   \
    X(CURR_MAX_PROC_UNITS, "curr_max_proc_units")           \
    X(CURR_MIN_PROCS, "curr_min_procs")                     \
    X(CURR_PROCS, "curr_procs")                             \
    X(CURR_MAX_PROCS, "curr_max_procs")                     \
    X(CURR_SHARING_MODE, "curr_sharing_mode")               \
    X(CURR_UNCAP_WEIGHT, "curr_uncap_weight")               \
    X(PEND_SHARED_PROC_POOL_ID, "pend_shared_proc_pool_id") \
    X(PEND_PROC_MODE, "pend_proc_mode")                     \
    X(PEND_MIN_PROC_UNITS, "pend_min_proc_units")           \
    X(PEND_PROC_UNITS, "pend_proc_units")                   \
    X(PEND_MAX_PROC_UNITS, "pend_max_proc_units")           \
    X(PEND_MIN_PROCS, "pend_min_procs")                     \
    X(PEND_PROCS, "pend_procs")                             \
    X(PEND_MAX_PROCS, "pend_max_procs")                     \
    X(PEND_SHARING_MODE, "pend_sharing_mode")               \
    X(PEND_UNCAP_WEIGHT, "pend_uncap_weight")               \
    X(RUN_PROC_UNITS, "run_proc_units")                     \
    X(RUN_PROCS, "run_procs")                               \
    X(RUN_UNCAP_WEIGHT, "run_uncap_weight")

#define ZEM_QYALLOC_PROC_POOL(X)                                    \
    X(SHARED_PROC_POOL_ID, "shared_proc_pool_id")                   \
    X(CONFIGURABLE_POOL_PROC_UNITS, "configurable_pool_proc_units") \
    X(CURR_AVAIL_POOL_PROC_UNITS, "curr_avail_pool_proc_units")     \
    X(PEND_AVAIL_POOL_PROC_UNITS, "pend_avail_pool_proc_units")

#define ZEM_QYALLOC_PROC_SYS(X)                                           \
    X(CONFIGURABLE_SYS_PROC_UNITS, "configurable_sys_proc_units")         \
    X(CURR_AVAIL_SYS_PROC_UNITS, "curr_avail_sys_proc_units")             \
    X(PEND_AVAIL_SYS_PROC_UNITS, "pend_avail_sys_proc_units")             \
    X(INSTALLED_SYS_PROC_UNITS, "installed_sys_proc_units")               \
    X(DECONFIG_SYS_PROC_UNITS, "deconfig_sys_proc_units")                 \
    X(MIN_PROC_UNITS_PER_VIRTUAL_PROC, "min_proc_units_per_virtual_proc") \
    X(MAX_SHARED_PROC_POOLS, "max_shared_proc_pools")                     \
    X(CONFIGURABLE_POOL_PROC_UINTS, "configurable_pool_proc_uints")       \
    X(PEND_POOL_MEM, "pend_pool_mem")

#define ZEM_QYALLOC_ETH_LPAR(X)             \
    X(LPAR_ID, "lpar_id")                   \
    X(LPAR_NAME, "lpar_name")               \
    X(SLOT_NUM, "slot_num")                 \
    X(STATE, "state")                       \
    X(IEEE_VIRTUAL_ETH, "ieee_virtual_eth") \
    X(PORT_VLAN_ID, "port_vlan_id")         \
    X(ADDL_VLAN_IDS, "addl_vlan_ids")       \
    X(IS_TRUNK, "is_trunk")                 \
    X(IS_REQUIRED, "is_required")           \
    X(MAC_ADDR, "mac_addr")                 \
    X(TRUNK_PRIORITY, "trunk_priority")

#define ZEM_QYALLOC_ETH_SYS(X)                  \
    X(MAX_VLANS_PER_PORT, "max_vlans_per_port") \
    X(MAC_PREFIX, "mac_prefix")

#define ZEM_QYALLOC_HSL(X)        \
    X(HSL_POOL_ID, "hsl_pool_id") \
    X(LPAR_NAMES, "lpar_names")   \
    X(LPAR_IDS, "lpar_ids")

#define ZEM_QYALLOC_VIRTUALOPTI(X)                  \
    X(VIRTUAL_OPTI_POOL_ID, "virtual_opti_pool_id") \
    X(LPAR_NAMES, "lpar_names")                     \
    X(LPAR_IDS, "lpar_ids")

#define ZEM_QYALLOC_SCSI_LPAR(X)            \
    X(LPAR_ID, "lpar_id")                   \
    X(LPAR_NAME, "lpar_name")               \
    X(SLOT_NUM, "slot_num")                 \
    X(STATE, "state")                       \
    X(ADAPTER_TYPE, "adapter_type")         \
    X(REMOTE_LPAR_ID, "remote_lpar_id")     \
    X(REMOTE_LPAR_NAME, "remote_lpar_name") \
    X(REMOTE_SLOT_NUM, "remote_slot_num")   \
    X(IS_REQUIRED, "is_required")           \
    X(BACKING_DEVICES, "backing_devices")

#define ZEM_QYALLOC_SERIAL_LPAR(X)          \
    X(LPAR_ID, "lpar_id")                   \
    X(LPAR_NAME, "lpar_name")               \
    X(SLOT_NUM, "slot_num")                 \
    X(STATE, "state")                       \
    X(IS_REQUIRED, "is_required")           \
    X(CONNECT_STATUS, "connect_status")     \
    X(ADAPTER_TYPE, "adapter_type")         \
    X(SUPPORTS_DNX, "supports_dnx")         \
    X(REMOTE_LPAR_ID, "remote_lpar_id")     \
    X(REMOTE_LPAR_NAME, "remote_lpar_name") \
    X(REMOTE_SLOT_NUM, "remote_slot_num")

#define ZEM_QYALLOC_SLOT_LPAR(X)                        \
    X(LPAR_ID, "lpar_id")                               \
    X(LPAR_NAME, "lpar_name")                           \
    X(CURR_MAX_VIRTUAL_SLOTS, "curr_max_virtual_slots") \
    X(PEND_MAX_VIRTUAL_SLOTS, "pend_max_virtual_slots")

#define ZEM_QYALLOC_SLOT_SLOT(X) \
    X(LPAR_ID, "lpar_id")        \
    X(LPAR_NAME, "lpar_name")    \
    X(SLOT_NUM, "slot_num")      \
    X(CONFIG, "config")          \
    X(STATE, "state")            \
    X(DRC_NAME, "drc_name")

#define ZEM_QYALLOC_IO_UNIT(X) X(UNIT_PHYS_LOC, "unit_phys_loc")

#define ZEM_QYALLOC_IO_BUS(X)                   \
    X(UNIT_PHYS_LOC, "unit_phys_loc")           \
    X(BUS_ID, "bus_id")                         \
    X(BACKPLANE_PHYS_LOC, "backplane_phys_loc") \
    X(BUS_DRC_INDEX, "bus_drc_index")           \
    X(BUS_DRC_NAME, "bus_drc_name")

#define ZEM_QYALLOC_IO_SLOT(X)                        \
    X(LPAR_ID, "lpar_id")                             \
    X(UNIT_PHYS_LOC, "unit_phys_loc")                 \
    X(BUS_ID, "bus_id")                               \
    X(PHYS_LOC, "phys_loc")                           \
    X(DRC_INDEX, "drc_index")                         \
    X(SLOT_IO_POOL_ID, "slot_io_pool_id")             \
    X(DESCRIPTION, "description")                     \
    X(FEATURE_CODES, "feature_codes")                 \
    X(PCI_VENDOR_ID, "pci_vendor_id")                 \
    X(PCI_DEVICE_ID, "pci_device_id")                 \
    X(PCI_SUBS_VENDOR_ID, "pci_subs_vendor_id")       \
    X(PCI_SUBS_DEVICE_ID, "pci_subs_device_id")       \
    X(PCI_CLASS, "pci_class")                         \
    X(PCI_REVISION_ID, "pci_revision_id")             \
    X(BUS_GROUPING, "bus_grouping")                   \
    X(IOP, "iop")                                     \
    X(PARENT_SLOT_DRC_INDEX, "parent_slot_drc_index") \
    X(DRC_NAME, "drc_name")

#define ZEM_QYALLOC_IO_IOPOOL(X) X(MAX_IO_POOLS, "max_io_pools")

#define ZEM_QYALLOC_IO_TAGGEDIO(X)                                      \
    X(LPAR_ID, "lpar_id")                                               \
    X(LPAR_NAME, "lpar_name")                                           \
    X(LOAD_SOURCE_SLOT, "load_source_slot")                             \
    X(ALT_RESTART_DEVICE_SLOT, "alt_restart_device_slot")               \
    X(RECENT_ALT_RESTART_DEVICE_SLOT, "recent_alt_restart_device_slot") \
    X(CONSOLE_SLOT, "console_slot")                                     \
    X(ALT_CONSOLE_SLOT, "alt_console_slot")                             \
    X(OP_CONSOLE_SLOT, "op_console_slot")

class ZEM_EXPORT zemQyallocCmdCaller : public zemCommandCaller {
public:
    ZEM_ATTRIBUTE_TABLE(MemoryPoolAttribute, ZEM_QYALLOC_MEMPOOL);
    ZEM_ATTRIBUTE_TABLE(ProcessorPoolAttribute, ZEM_QYALLOC_PROCPOOL);

    struct HCAResourceAttribute {
        enum Level : int { LEVEL_NO_APPLICABLE = -1, LEVEL_LPAR = 0, LEVEL_SYS = 1 };
    };

    struct MemoryResourceAttribute {
        enum Level : int { LEVEL_NO_APPLICABLE = -1, LEVEL_LPAR = 0, LEVEL_SYS = 1 };
        ZEM_ATTRIBUTE_TABLE(LparLevelAttribute, ZEM_QYALLOC_MEM_LPAR);
        ZEM_ATTRIBUTE_TABLE(SysLevelAttribute, ZEM_QYALLOC_MEM_SYS);
    };

    struct PhyIOResourceAttribute {
        enum Level : int { LEVEL_NO_APPLICABLE = -1, LEVEL_SYS = 0, LEVEL_POOL = 1 };
        enum SubType : int {
            SUBTYPE_UNIT = 0,
            SUBTYPE_BUS = 1,
            SUBTYPE_SLOT = 2,
            SUBTYPE_IOPOOL = 3,
            SUBTYPE_TAGGEDIO = 4
        };
        ZEM_ATTRIBUTE_TABLE(UnitAttribute, ZEM_QYALLOC_IO_UNIT);
        ZEM_ATTRIBUTE_TABLE(BusAttribute, ZEM_QYALLOC_IO_BUS);
        ZEM_ATTRIBUTE_TABLE(SlotAttribute, ZEM_QYALLOC_IO_SLOT);
        ZEM_ATTRIBUTE_TABLE(IOPoolAttribute, ZEM_QYALLOC_IO_IOPOOL);
        ZEM_ATTRIBUTE_TABLE(TaggedIOAttribute, ZEM_QYALLOC_IO_TAGGEDIO);
    };

    struct ProcessorResourceAttribute {
        enum Level : int {
            LEVEL_NO_APPLICABLE = -1,
            LEVEL_LPAR = 0,
            LEVEL_POOL = 1,
            LEVEL_SYS = 2
        };
        ZEM_ATTRIBUTE_TABLE(LparLevelAttribute, ZEM_QYALLOC_PROC_LPAR);
        ZEM_ATTRIBUTE_TABLE(PoolLevelAttribute, ZEM_QYALLOC_PROC_POOL);
        ZEM_ATTRIBUTE_TABLE(SysLevelAttribute, ZEM_QYALLOC_PROC_SYS);
    };

    struct VirtualIOResourceAttribute {
        enum Level : int {
            LEVEL_NO_APPLICABLE = -1,
            LEVEL_LPAR = 0,
            LEVEL_SLOT = 1,
            LEVEL_SYS = 2
        };
        enum SubType : int {
            SUBTYPE_ETH = 0,
            SUBTYPE_HSL = 1,
            SUBTYPE_VIRTUALOPTI = 2,
            SUBTYPE_SCSI = 3,
            SUBTYPE_SERIAL = 4,
            SUBTYPE_SLOT = 5
        };
        ZEM_ATTRIBUTE_TABLE(EthLparLevelAttribute, ZEM_QYALLOC_ETH_LPAR);
        ZEM_ATTRIBUTE_TABLE(EthSysLevelAttribute, ZEM_QYALLOC_ETH_SYS);
        ZEM_ATTRIBUTE_TABLE(HSLAttribute, ZEM_QYALLOC_HSL);
        ZEM_ATTRIBUTE_TABLE(VirtualOptiAttribute, ZEM_QYALLOC_VIRTUALOPTI);
        ZEM_ATTRIBUTE_TABLE(SCSILparLevelAttribute, ZEM_QYALLOC_SCSI_LPAR);
        ZEM_ATTRIBUTE_TABLE(SerialLparLevelAttribute, ZEM_QYALLOC_SERIAL_LPAR);
        ZEM_ATTRIBUTE_TABLE(SlotLparLevelAttribute, ZEM_QYALLOC_SLOT_LPAR);
        ZEM_ATTRIBUTE_TABLE(SlotSlotLevelAttribute, ZEM_QYALLOC_SLOT_SLOT);
    };

    /// @param auth,locale  as for zemCommandCaller
    zemQyallocCmdCaller(const char* auth, const char* locale);

    /// The pools of @p managedSystem, one record each. Arguments here and below:
    /// @param paramAttr  wanted attributes, ending in ATTR_END; null: all
    /// @param managedSystem  key or name of a host; null or empty: all hosts
    /// @param filter  the tool's filter with its own quoting; null or empty: none
    zemRecordSetsType getMemPoolInfo(int* paramAttr, const char* managedSystem, const char* filter);
    zemRecordSetsType getProcPoolInfo(int* paramAttr, const char* managedSystem,
                                      const char* filter);

    /// How many pools @p managedSystem has.
    int getMemPoolNum(int* paramAttr, const char* managedSystem);
    int getProcPoolNum(int* paramAttr, const char* managedSystem);

    /// Resources of which the tool names no attributes: records without values, to be counted.
    zemRecordSetsType getSNIAdapterResources(int* paramAttr, const char* managedSystem,
                                             const char* filter);
    zemRecordSetsType getHCAResources(int* paramAttr, const char* managedSystem,
                                      HCAResourceAttribute::Level level, const char* filter);

    /// Memory by partition or of the host. A level without a table gives records without values,
    /// here as below.
    /// @param maxmem  asks for the host's limits at this much memory if positive; without it, and
    ///        without a list of attributes, the last row of the host's table is left out
    zemRecordSetsType getMemoryResources(int* paramAttr, const char* managedSystem,
                                         MemoryResourceAttribute::Level level, int maxmem,
                                         const char* filter);

    /// Processors by partition, by pool or of the host.
    /// @param procunits  asks for the host's limits at this many processors if positive
    zemRecordSetsType getProcessorResources(int* paramAttr, const char* managedSystem,
                                            ProcessorResourceAttribute::Level level, int procunits,
                                            const char* filter);

    /// Virtual adapters and slots; not every subtype has every level.
    zemRecordSetsType getVirtualIOResources(int* paramAttr, const char* managedSystem,
                                            VirtualIOResourceAttribute::SubType subType,
                                            VirtualIOResourceAttribute::Level level,
                                            const char* filter);

    /// Physical units, buses, slots and pools.
    zemRecordSetsType getPhysicalIOResources(int* paramAttr, const char* managedSystem,
                                             PhyIOResourceAttribute::SubType subType,
                                             PhyIOResourceAttribute::Level level,
                                             const char* filter);

    /// The queries above at one subtype and level, as the names say.
    zemRecordSetsType getPhysicalIOBusResources(int* paramAttr, const char* managedSystem,
                                                const char* filter);
    zemRecordSetsType getIOPoolResources(int* paramAttr, const char* managedSystem,
                                         const char* filter);
    zemRecordSetsType getSystemIOPoolResources(int* paramAttr, const char* managedSystem,
                                               const char* filter);
    zemRecordSetsType getPhysicalIOSlotResources(int* paramAttr, const char* managedSystem,
                                                 const char* filter);
    zemRecordSetsType getPhysicalIOUnitResources(int* paramAttr, const char* managedSystem,
                                                 const char* filter);
    zemRecordSetsType getPhysicalTaggedIOResources(int* paramAttr, const char* managedSystem,
                                                   const char* filter);

    zemRecordSetsType getPartitionMemoryResources(int* paramAttr, const char* managedSystem,
                                                  const char* filter);
    zemRecordSetsType getSystemMemoryResources(int* paramAttr, const char* managedSystem,
                                               int maxmem, const char* filter);
    zemRecordSetsType getPartitionProcessorResources(int* paramAttr, const char* managedSystem,
                                                     const char* filter);
    zemRecordSetsType getSharedProcessorPoolResources(int* paramAttr, const char* managedSystem,
                                                      const char* filter);
    zemRecordSetsType getSystemProcessorResources(int* paramAttr, const char* managedSystem,
                                                  int procunits, const char* filter);

    zemRecordSetsType getPartitionVirtualEthernetResources(int* paramAttr,
                                                           const char* managedSystem,
                                                           const char* filter);
    zemRecordSetsType getSystemVirtualEthernetResources(int* paramAttr, const char* managedSystem,
                                                        const char* filter);
    zemRecordSetsType getPartitionVirtualSCSIResources(int* paramAttr, const char* managedSystem,
                                                       const char* filter);
    zemRecordSetsType getPartitionVirtualSerialResources(int* paramAttr, const char* managedSystem,
                                                         const char* filter);
    zemRecordSetsType getPartitionVirtualIOSlotResources(int* paramAttr, const char* managedSystem,
                                                         const char* filter);
    zemRecordSetsType getVirtualIOSlotResources(int* paramAttr, const char* managedSystem,
                                                const char* filter);
    zemRecordSetsType getHSLOptiConnectResources(int* paramAttr, const char* managedSystem,
                                                 const char* filter);
    zemRecordSetsType getVirtualOptiConnectResources(int* paramAttr, const char* managedSystem,
                                                     const char* filter);

    zemRecordSetsType getPartitionHCAResources(int* paramAttr, const char* managedSystem,
                                               const char* filter);
    zemRecordSetsType getSystemHCAResources(int* paramAttr, const char* managedSystem,
                                            const char* filter);
};

#undef ZEM_QYALLOC_MEMPOOL
#undef ZEM_QYALLOC_PROCPOOL
#undef ZEM_QYALLOC_MEM_LPAR
#undef ZEM_QYALLOC_MEM_SYS
#undef ZEM_QYALLOC_PROC_LPAR
#undef ZEM_QYALLOC_PROC_POOL
#undef ZEM_QYALLOC_PROC_SYS
#undef ZEM_QYALLOC_ETH_LPAR
#undef ZEM_QYALLOC_ETH_SYS
#undef ZEM_QYALLOC_HSL
#undef ZEM_QYALLOC_VIRTUALOPTI
#undef ZEM_QYALLOC_SCSI_LPAR
#undef ZEM_QYALLOC_SERIAL_LPAR
#undef ZEM_QYALLOC_SLOT_LPAR
#undef ZEM_QYALLOC_SLOT_SLOT
#undef ZEM_QYALLOC_IO_UNIT
#undef ZEM_QYALLOC_IO_BUS
#undef ZEM_QYALLOC_IO_SLOT
#undef ZEM_QYALLOC_IO_IOPOOL
#undef ZEM_QYALLOC_IO_TAGGEDIO

#endif

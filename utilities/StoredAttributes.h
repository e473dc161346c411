/// The attributes of a partition's stored configuration that both creating and changing tools know:
/// the runs that stand in the same order in the tables of NwplatCmdCaller.h and EdplatCmdCaller.h.
#ifndef STORED_ATTRIBUTES_H
#define STORED_ATTRIBUTES_H

// Memory and processors.
#define ZEM_STORED_SIZES(X)                               \
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
    X(MIN_PROCS, "min_procs")                             \
    X(DESIRED_PROCS, "desired_procs")                     \
    X(MAX_PROCS, "max_procs")                             \
    X(MIN_PROC_UNITS, "min_proc_units")                   \
    X(DESIRED_PROC_UNITS, "desired_proc_units")           \
    X(MAX_PROC_UNITS, "max_proc_units")                   \
    X(PROC_MODE, "proc_mode")                             \
    X(SHARING_MODE, "sharing_mode")                       \
    X(UNCAP_WEIGHT, "uncap_weight")                       \
    X(LPAR_PROC_COMPAT_MODE, "lpar_proc_compat_mode")

// How the partition starts, and what it reaches.
#define ZEM_STORED_ADAPTERS(X)                            \
    X(BOOT_MODE, "boot_mode")                             \
    X(AUTO_START, "auto_start")                           \
    X(MAX_VIRTUAL_SLOTS, "max_virtual_slots")             \
    X(VIRTUAL_ETH_ADAPTERS, "virtual_eth_adapters")       \
    X(VIRTUAL_SCSI_ADAPTERS, "virtual_scsi_adapters")     \
    X(VIRTUAL_SERIAL_ADAPTERS, "virtual_serial_adapters") \
    X(IO_SLOTS, "io_slots")

// Tagged slots, huge pages and shares.
#define ZEM_STORED_DEVICES(X)                               \
    X(LOAD_SOURCE_SLOT, "load_source_slot")                 \
    X(ALT_RESTART_DEVICE_SLOT, "alt_restart_device_slot")   \
    X(CONSOLE_SLOT, "console_slot")                         \
    X(ALT_CONSOLE_SLOT, "alt_console_slot")                 \
    X(OP_CONSOLE_SLOT, "op_console_slot")                   \
    X(MIN_NUM_HUGE_PAGES, "min_num_huge_pages")             \
    X(DESIRED_NUM_HUGE_PAGES, "desired_num_huge_pages")     \
    X(MAX_NUM_HUGE_PAGES, "max_num_huge_pages")             \
    X(BSR_ARRAYS, "bsr_arrays")                             \
    X(MIN_7460_WKL_PERCENT, "min_7460_wkl_percent")         \
    X(DESIRED_7460_WKL_PERCENT, "desired_7460_wkl_percent") \
    X(MAX_7460_WKL_PERCENT, "max_7460_wkl_percent")

// Pools, and what else is bound to others.
#define ZEM_STORED_POOLS(X)                           \
    X(LPAR_IO_POOL_IDS, "lpar_io_pool_ids")           \
    X(CONN_MONITORING, "conn_monitoring")             \
    X(VIRTUAL_OPTI_POOL_ID, "virtual_opti_pool_id")   \
    X(HSL_POOL_ID, "hsl_pool_id")                     \
    X(POWER_CTRL_LPAR_IDS, "power_ctrl_lpar_ids")     \
    X(POWER_CTRL_LPAR_NAMES, "power_ctrl_lpar_names") \
    X(HCA_ADAPTERS, "hca_adapters")                   \
    X(LHEA_LOGICAL_PORTS, "lhea_logical_ports")

// The pool of shared processors.
#define ZEM_STORED_SHARED_POOL(X)                 \
    X(SHARED_PROC_POOL_ID, "shared_proc_pool_id") \
    X(SHARED_PROC_POOL_NAME, "shared_proc_pool_name")

#endif

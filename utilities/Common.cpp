#include "Common.h"

#include "QyplatCmdCaller.h"

namespace {

using Host = zemQyplatCmdCaller::ManagedSystemAttribute;
using Partition = zemQyplatCmdCaller::PartitionAttribute;
using Profile = zemQyplatCmdCaller::PartitionProfileAttribute;

}  // namespace

// What masks have in common.
#define HOST_DEFAULT Host::ATTR_TYPE_MODEL, Host::ATTR_SERIAL_NUM, Host::ATTR_STATE, Host::ATTR_NAME
#define PARTITION_DEFAULT \
    Partition::ATTR_LPAR_ID, Partition::ATTR_STATE, Partition::ATTR_NAME, Partition::ATTR_LPAR_ENV
#define PARTITION_VSSD                                                           \
    PARTITION_DEFAULT, Partition::ATTR_AUTO_START, Partition::ATTR_CURR_PROFILE, \
        Partition::ATTR_DEFAULT_PROFILE, Partition::ATTR_LPAR_KEYLOCK, Partition::ATTR_BOOT_MODE
#define PROFILE_DEFAULT                                                           \
    Profile::ATTR_LPAR_ID, Profile::ATTR_NAME, Profile::ATTR_MAX_VIRTUAL_SLOTS,   \
        Profile::ATTR_LPAR_ID, Profile::ATTR_AUTO_START, Profile::ATTR_LPAR_NAME, \
        Profile::ATTR_NAME, Profile::ATTR_BOOT_MODE, Profile::ATTR_CONN_MONITORING

int sys_default_mask[] = {HOST_DEFAULT, Host::ATTR_END};
int sys_all_mask[] = {HOST_DEFAULT,
                      Host::ATTR_MAX_LPARS,
                      Host::ATTR_ACTIVE_LPAR_MOBILITY_CAPABLE,
                      Host::ATTR_INACTIVE_LPAR_MOBILITY_CAPABLE,
                      Host::ATTR_VIRTUAL_IO_SERVER_CAPABLE,
                      Host::ATTR_LPAR_PROC_COMPAT_MODES,
                      Host::ATTR_OSQ00_CAPABLE,
                      Host::ATTR_LHEA_CAPABLE,
                      Host::ATTR_END};

int lpar_default_mask[] = {PARTITION_DEFAULT, Partition::ATTR_END};
int processor_lpar_mask[] = {PARTITION_DEFAULT, Partition::ATTR_CURR_LPAR_PROC_COMPAT_MODE,
                             Partition::ATTR_END};
int lpar_lpar_mask[] = {PARTITION_DEFAULT, Partition::ATTR_BOOT_MODE, Partition::ATTR_END};
int VSSD_lpar_mask[] = {PARTITION_VSSD, Partition::ATTR_END};
int other_RASD_lpar_mask[] = {PARTITION_VSSD, Partition::ATTR_END};
int processor_RASD_lpar_mask[] = {PARTITION_VSSD, Partition::ATTR_DESIRED_LPAR_PROC_COMPAT_MODE,
                                  Partition::ATTR_END};
int Resource_RASD_SettingData_lpar_mask[] = {Partition::ATTR_LPAR_ID, Partition::ATTR_STATE,
                                             Partition::ATTR_CURR_PROFILE,
                                             Partition::ATTR_DEFAULT_PROFILE, Partition::ATTR_END};
int VSSD_SettingData_lpar_mask[] = {Partition::ATTR_LPAR_ID, Partition::ATTR_CURR_PROFILE,
                                    Partition::ATTR_DEFAULT_PROFILE, Partition::ATTR_END};

int profile_name_mask[] = {Profile::ATTR_LPAR_ID, Profile::ATTR_NAME, Profile::ATTR_END};
int profile_default_mask[] = {PROFILE_DEFAULT, Profile::ATTR_END};
int VSSD_profile_mask[] = {PROFILE_DEFAULT, Profile::ATTR_END};
int Processor_RASD_profile_mask[] = {PROFILE_DEFAULT,
                                     Profile::ATTR_PROC_MODE,
                                     Profile::ATTR_SHARING_MODE,
                                     Profile::ATTR_MIN_PROCS,
                                     Profile::ATTR_DESIRED_PROCS,
                                     Profile::ATTR_MAX_PROCS,
                                     Profile::ATTR_UNCAP_WEIGHT,
                                     Profile::ATTR_MIN_PROC_UNITS,
                                     Profile::ATTR_DESIRED_PROC_UNITS,
                                     Profile::ATTR_MAX_PROC_UNITS,
                                     Profile::ATTR_LPAR_PROC_COMPAT_MODE,
                                     Profile::ATTR_END};
int Memory_RASD_profile_mask[] = {PROFILE_DEFAULT,          Profile::ATTR_MEM_MODE,
                                  Profile::ATTR_MEM_WEIGHT, Profile::ATTR_DESIRED_IO_ENTITLED_MEM,
                                  Profile::ATTR_MIN_MEM,    Profile::ATTR_DESIRED_MEM,
                                  Profile::ATTR_MAX_MEM,    Profile::ATTR_END};
int IOSlot_RASD_profile_mask[] = {PROFILE_DEFAULT,
                                  Profile::ATTR_IO_SLOTS,
                                  Profile::ATTR_LOAD_SOURCE_SLOT,
                                  Profile::ATTR_ALT_RESTART_DEVICE_SLOT,
                                  Profile::ATTR_CONSOLE_SLOT,
                                  Profile::ATTR_ALT_CONSOLE_SLOT,
                                  Profile::ATTR_OP_CONSOLE_SLOT,
                                  Profile::ATTR_END};
int Serial_RASD_profile_mask[] = {PROFILE_DEFAULT, Profile::ATTR_VIRTUAL_SERIAL_ADAPTERS,
                                  Profile::ATTR_END};
int SCSI_RASD_profile_mask[] = {PROFILE_DEFAULT, Profile::ATTR_VIRTUAL_SCSI_ADAPTERS,
                                Profile::ATTR_END};
int Eth_RASD_profile_mask[] = {PROFILE_DEFAULT, Profile::ATTR_VIRTUAL_ETH_ADAPTERS,
                               Profile::ATTR_END};

/// What the readers of hosts, partitions and profiles ask the tool "qyplat" for: lists of
/// attributes of zemQyplatCmdCaller, each ending in -1, as its queries take them.
///
/// The order is that of the question, and some attributes are asked for twice. Nobody changes the
/// lists, which all threads read.
///
///     records = caller.getPartitionsInformation(lpar_default_mask, mtms, filter);
#ifndef COMMON_H
#define COMMON_H

#include "ZemExport.h"

/// Of hosts (ManagedSystemAttribute).
ZEM_EXPORT extern int sys_default_mask[];  ///< identity, state and name
ZEM_EXPORT extern int sys_all_mask[];      ///< and capabilities

/// Of partitions (PartitionAttribute).
ZEM_EXPORT extern int lpar_default_mask[];         ///< identity, state and what runs there
ZEM_EXPORT extern int processor_lpar_mask[];       ///< and the compatibility mode in effect
ZEM_EXPORT extern int lpar_lpar_mask[];            ///< and the boot mode
ZEM_EXPORT extern int VSSD_lpar_mask[];            ///< for a VSSD
ZEM_EXPORT extern int other_RASD_lpar_mask[];      ///< for a VSSD with RASDs, but processors
ZEM_EXPORT extern int processor_RASD_lpar_mask[];  ///< for one with a processor RASD
ZEM_EXPORT extern int Resource_RASD_SettingData_lpar_mask[];  ///< for setting data of resources
ZEM_EXPORT extern int VSSD_SettingData_lpar_mask[];           ///< for setting data of systems

/// Of profiles (PartitionProfileAttribute).
ZEM_EXPORT extern int profile_name_mask[];            ///< names alone
ZEM_EXPORT extern int profile_default_mask[];         ///< settings of the system
ZEM_EXPORT extern int VSSD_profile_mask[];            ///< the same
ZEM_EXPORT extern int Processor_RASD_profile_mask[];  ///< and those of one kind of resource
ZEM_EXPORT extern int Memory_RASD_profile_mask[];
ZEM_EXPORT extern int IOSlot_RASD_profile_mask[];
ZEM_EXPORT extern int Serial_RASD_profile_mask[];
ZEM_EXPORT extern int SCSI_RASD_profile_mask[];
ZEM_EXPORT extern int Eth_RASD_profile_mask[];

#endif

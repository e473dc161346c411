/// Records of what the management library tells of a host's and a partition's processors, memory,
/// slots, virtual adapters and profiles.
///
/// Each is a row of texts, filled field by field from the library's properties. The library tells
/// codes; a setter turns them into the words of the tools at once, so that a field reads the same
/// whoever filled it. The comment of a field tells its meaning, the property that it is filled
/// from, and, where the setter translates, what it takes and what it stores. Numbers in a setter's
/// text are read as strtol() does; but a boot mode, a compatibility mode and the sharing mode of
/// shared processors are "unknown" for a text that is no number.
///
///     zemPartitionIOSlotResource slot("3*1111-AAA*0000001");
///     slot.setPciClass("512");
///     puts(slot.getPciClass());  // "200"
///
/// Units: memory in whole megabytes; processor units of partitions with two decimals.
///
/// Thread-safety: none; plain values.
#ifndef VIRTUAL_SYSTEM_RESOURCE_RECORDS_H
#define VIRTUAL_SYSTEM_RESOURCE_RECORDS_H

#include "StringUtils.h"
#include "VirtualSystemFields.h"
#include "ZemExport.h"

/// The root: whose resources they are.
class ZEM_EXPORT zemHardwareResource {
public:
    zemHardwareResource() = default;
    explicit zemHardwareResource(const zemString& mtms) : m_mtms(mtms) {}

    /// The library's hundredths as the tools write units: "125" gives "1.25", "5" gives "0.05";
    /// "" and "0" give "0.0". Any text is taken for a number.
    static zemString getCLIUnits(const zemString& units);

    /// A decimal text in upper-case hexadecimal digits: "512" gives "200".
    static zemString getHexValueByDecValue(const zemString& value);

    ZEM_FIELD(zemString, m_mtms, MTMS);  ///< key of the host, "<type model>*<serial number>"
};

/// The root of what a partition has.
class ZEM_EXPORT zemPartitionHardwareResource : public zemHardwareResource {
public:
    zemPartitionHardwareResource() = default;

    /// @param lparIdAndMTMS  the library's "Name": number of the partition, "*", key of the host
    /// @throws zemInvalidParameterException there is no "*"
    explicit zemPartitionHardwareResource(const zemString& lparIdAndMTMS);
    zemPartitionHardwareResource(const zemString& mtms, const zemString& lparid)
        : zemHardwareResource(mtms), m_lparid(lparid) {}

    /// The number, "*" and the key of the host.
    zemString getLparIDAndMTMS() const;

    ZEM_FIELD(zemString, m_lparid, LparID);  ///< number of the partition on its host
};

/// The processors of a host, in units as the library has them; "then" is after pending changes.
class ZEM_EXPORT zemSystemProcessorResource : public zemHardwareResource {
public:
    using zemHardwareResource::zemHardwareResource;

    /// can be given out; "ConfigurableProcUnits"
    ZEM_TEXT_FIELD(m_ConfigurableSysProcUnits, ConfigurableSysProcUnits);
    /// are free; "CurAvailProcUnits"
    ZEM_TEXT_FIELD(m_CurrAvailSysProcUnits, CurrAvailSysProcUnits);
    /// free then; "PendAvailProcUnits"
    ZEM_TEXT_FIELD(m_PendAvailSysProcUnits, PendAvailSysProcUnits);
    /// are built in; "InstalledProcessors"
    ZEM_TEXT_FIELD(m_InstalledSysProcUnits, InstalledSysProcUnits);
    /// most shared pools; "MaxProcPools"
    ZEM_TEXT_FIELD(m_MaxSharedProcPools, MaxSharedProcPools);
    /// least for a virtual processor; "MinProcUnit"
    ZEM_TEXT_FIELD(m_MinProcUnitsPerVirtualProc, MinProcUnitsPerVirtualProc);
};

/// The processors that a host's shared pools are made of, in such units.
class ZEM_EXPORT zemPoolProcessorResource : public zemHardwareResource {
public:
    using zemHardwareResource::zemHardwareResource;

    /// free then; "PendAvailProcUnits"
    ZEM_TEXT_FIELD(m_PendAvailPoolProcUnits, PendAvailPoolProcUnits);
    /// can be given out; "ConfigurableProcUnits"
    ZEM_TEXT_FIELD(m_ConfigurablePoolProcUnits, ConfigurablePoolProcUnits);
};

/// One shared processor pool of a host.
class ZEM_EXPORT zemProcessorPoolResource : public zemHardwareResource {
public:
    using zemHardwareResource::zemHardwareResource;

    /// number of the pool; "SharedProcPoolId"
    ZEM_TEXT_FIELD(m_SharedProcPoolId, SharedProcPoolId);
    ZEM_TEXT_FIELD(m_LparIds, LparIds);  ///< partitions in it, with commas; "lpar_ids"
    ZEM_TEXT_FIELD(m_MaxPoolProcUnits, MaxPoolProcUnits);  ///< the most units in it
    /// units kept; "PendReservedPoolCapacity"
    ZEM_TEXT_FIELD(m_PendReservedPoolProcUnits, PendReservedPoolProcUnits);
    /// the most that it may hold; "MaxPoolCapacity"
    ZEM_TEXT_FIELD(m_MaxPoolCapacity, MaxPoolCapacity);
};

/// The memory of a host, in megabytes.
class ZEM_EXPORT zemSystemMemoryResource : public zemHardwareResource {
public:
    using zemHardwareResource::zemHardwareResource;

    /// can be given out; "ConfigurableMem"
    ZEM_TEXT_FIELD(m_ConfigurableSysMem, ConfigurableSysMem);
    ZEM_TEXT_FIELD(m_InstalledSysMem, InstalledSysMem);  ///< is built in; "InstalledMemory"
    ZEM_TEXT_FIELD(m_MaxMemPools, MaxMemPools);  ///< most shared memory pools; "MaxMemPools"
    /// free after pending changes; "PendAvailMem"
    ZEM_TEXT_FIELD(m_PendAvailSysMem, PendAvailSysMem);
    /// step in which memory is given out; "LMBSize"
    ZEM_TEXT_FIELD(m_MemRegionSize, MemRegionSize);
};

/// The shared memory pool of a host, in megabytes.
class ZEM_EXPORT zemMemoryPoolResource : public zemHardwareResource {
public:
    using zemHardwareResource::zemHardwareResource;

    ZEM_FIELD(zemString, m_curr_pool_mem, CurrPoolMem);  ///< size; "curr_pool_mem"
    /// free after pending changes; "pend_avail_pool_mem"
    ZEM_FIELD(zemString, m_pend_avail_pool_mem, PendAvailPoolMem);
    ZEM_FIELD(zemString, m_pend_pool_mem, PendPoolMem);  ///< size aimed at; "pend_pool_mem"

public:
    bool isSupport() const { return m_isSupport; }
    void setSupport(bool isSupport) { m_isSupport = isSupport; }

private:
    bool m_isSupport = false;  ///< whether the host has a shared memory pool
};

/// The processors of a partition: those in effect (Curr), those that the next change aims at
/// (Pend), and those that the hypervisor runs (Run).
class ZEM_EXPORT zemPartitionProcessorResource : public zemPartitionHardwareResource {
public:
    using zemPartitionHardwareResource::zemPartitionHardwareResource;

    ZEM_TEXT_FIELD(m_LparName, LparName);  ///< name of the partition; "UserDefinedName"
    /// "CurProcMode", "null" for 255
    ZEM_TRANSLATED_FIELD(m_CurrSharedProcPoolId, CurrSharedProcPoolId);
    /// "ded" for 255, or "shared"; "CurProcMode"
    ZEM_TRANSLATED_FIELD(m_CurrProcMode, CurrProcMode);
    /// least units; "CurMinProcUnits", hundredths
    ZEM_TRANSLATED_FIELD(m_CurrMinProcUnits, CurrMinProcUnits);
    /// units; "CurAllocProcUnits", hundredths
    ZEM_TRANSLATED_FIELD(m_CurrProcUnits, CurrProcUnits);
    /// most units; "CurMaxProcUnits", hundredths
    ZEM_TRANSLATED_FIELD(m_CurrMaxProcUnits, CurrMaxProcUnits);
    ZEM_TEXT_FIELD(m_CurrMinProcs, CurrMinProcs);  ///< least processors; "CurMinProcs"
    ZEM_TEXT_FIELD(m_CurrProcs, CurrProcs);        ///< processors; "CurAllocProcs"
    ZEM_TEXT_FIELD(m_CurrMaxProcs, CurrMaxProcs);  ///< most processors; "CurMaxProcs"
    /// how processors are shared; see the setter
    ZEM_READ_FIELD(m_CurrSharingMode, CurrSharingMode);
    /// share of idle processors; "CurUncappedWeight"
    ZEM_TEXT_FIELD(m_CurrUncapWeight, CurrUncapWeight);
    ZEM_TEXT_FIELD(m_PendSharedProcPoolId, PendSharedProcPoolId);  ///< "PendProcMode"
    /// stays empty: the setter stores "ded" or "shared" in CurrProcMode; "PendProcMode"
    ZEM_TRANSLATED_FIELD(m_PendProcMode, PendProcMode);
    /// least units; "PendMinProcUnits", hundredths
    ZEM_TRANSLATED_FIELD(m_PendMinProcUnits, PendMinProcUnits);
    /// units; "PendAllocProcUnits", hundredths
    ZEM_TRANSLATED_FIELD(m_PendProcUnits, PendProcUnits);
    /// most units; "PendMaxProcUnits", hundredths
    ZEM_TRANSLATED_FIELD(m_PendMaxProcUnits, PendMaxProcUnits);
    ZEM_TEXT_FIELD(m_PendMinProcs, PendMinProcs);  ///< least processors; "PendMinProcs"
    ZEM_TEXT_FIELD(m_PendProcs, PendProcs);        ///< processors; "PendAllocProcs"
    ZEM_TEXT_FIELD(m_PendMaxProcs, PendMaxProcs);  ///< most processors; "PendMaxProcs"
    /// how processors are shared; see the setter
    ZEM_READ_FIELD(m_PendSharingMode, PendSharingMode);
    /// share of idle processors; "PendUncappedWeight"
    ZEM_TEXT_FIELD(m_PendUncapWeight, PendUncapWeight);
    ZEM_TRANSLATED_FIELD(m_RunProcUnits, RunProcUnits);  ///< units; "RuntimeProcUnits", hundredths
    ZEM_TEXT_FIELD(m_RunProcs, RunProcs);                ///< processors; "RuntimeProcs"
    /// share of idle ones; "RuntimeUncappedWeight"
    ZEM_TEXT_FIELD(m_RunUncapWeight, RunUncapWeight);

public:
    /// How processors are shared, from "CurProcMode" (255: dedicated), "CurDonorMode" and
    /// "CurSharingMode", or those of the pending change. Shared processors are "cap" or "uncap";
    /// dedicated ones "share_idle_procs", "share_idle_procs_always", "keep_idle_procs" or
    /// "share_idle_procs_active"; other numbers give "unknown".
    void setCurrSharingMode(const zemString& procMode, const zemString& donorMode,
                            const zemString& sharingMode);
    void setPendSharingMode(const zemString& procMode, const zemString& donorMode,
                            const zemString& sharingMode);
};

/// The memory of a partition in megabytes, in effect, aimed at and run, as above.
class ZEM_EXPORT zemPartitionMemoryResource : public zemPartitionHardwareResource {
public:
    using zemPartitionHardwareResource::zemPartitionHardwareResource;

    ZEM_TEXT_FIELD(m_CurrMem, CurrMem);            ///< "CurAllocMem"
    ZEM_TEXT_FIELD(m_PendMem, PendMem);            ///< "PendAllocMem"
    ZEM_TEXT_FIELD(m_LparName, LparName);          ///< name of the partition; "UserDefinedName"
    ZEM_TEXT_FIELD(m_CurrMinMem, CurrMinMem);      ///< least; "CurMinMem"
    ZEM_TEXT_FIELD(m_CurrMaxMem, CurrMaxMem);      ///< most; "CurMaxMem"
    ZEM_TEXT_FIELD(m_PendMinMem, PendMinMem);      ///< least; "PendMinMem"
    ZEM_TEXT_FIELD(m_PendMaxMem, PendMaxMem);      ///< most; "PendMaxMem"
    ZEM_TEXT_FIELD(m_RunMinMem, RunMinMem);        ///< least; "RuntimeMinMem"
    ZEM_TEXT_FIELD(m_RunMem, RunMem);              ///< "RuntimeMem"
    ZEM_TRANSLATED_FIELD(m_MemMode, MemMode);      ///< "ded" for 255, or "shared"; "CurrMemMode"
    ZEM_TEXT_FIELD(m_RunMemWeight, RunMemWeight);  ///< share of the memory pool; "RuntimeVRMWeight"
    /// whether memory for I/O is set by itself; "EntUsage"
    ZEM_TEXT_FIELD(m_AutoIoEntitledMem, AutoIoEntitledMem);
    ZEM_TEXT_FIELD(m_RunIoEntitledMem, RunIoEntitledMem);  ///< memory kept for I/O; "RuntimeEntMem"
};

/// A slot for a physical adapter.
class ZEM_EXPORT zemPartitionIOSlotResource : public zemPartitionHardwareResource {
public:
    using zemPartitionHardwareResource::zemPartitionHardwareResource;

    ZEM_TEXT_FIELD(m_DrcIndex, DrcIndex);              ///< key of the slot on its host; "drc_index"
    ZEM_TEXT_FIELD(m_Description, Description);        ///< what is plugged in; "description"
    ZEM_TRANSLATED_FIELD(m_PciClass, PciClass);        ///< hexadecimal; "pci_class", decimal
    ZEM_TEXT_FIELD(m_BusId, BusId);                    ///< "bus_id"
    ZEM_TRANSLATED_FIELD(m_PciDeviceId, PciDeviceId);  ///< hexadecimal; "pci_device_id", decimal
    /// hexadecimal; "pci_revision_id", decimal
    ZEM_TRANSLATED_FIELD(m_PciRevisionId, PciRevisionId);
    /// hexadecimal; "pci_subs_device_id", decimal
    ZEM_TRANSLATED_FIELD(m_PciSubsDeviceId, PciSubsDeviceId);
    /// hexadecimal; "pci_subs_vendor_id", decimal
    ZEM_TRANSLATED_FIELD(m_PciSubsVendorId, PciSubsVendorId);
    ZEM_TRANSLATED_FIELD(m_PciVendorId, PciVendorId);  ///< hexadecimal; "pci_vendor_id", decimal
    ZEM_TEXT_FIELD(m_DrcName, DrcName);                ///< location code of the slot; "drc_name"
    /// "none" for "null"; "parent_slot_drc_index"
    ZEM_TRANSLATED_FIELD(m_ParentSlotDrcIndex, ParentSlotDrcIndex);
    /// whether the bus must stay whole; "bus_grouping"
    ZEM_TEXT_FIELD(m_BusGrouping, BusGrouping);
    ZEM_TRANSLATED_FIELD(m_Iop, Iop);  ///< an I/O processor: "0" for "false", or "1"; "iop"
    ZEM_TEXT_FIELD(m_UnitPhysLoc, UnitPhysLoc);  ///< location code of the unit; "unit_phys_loc"
    /// "none" for 65535 and "null"; "slot_io_pool_id"
    ZEM_TRANSLATED_FIELD(m_SlotIoPoolId, SlotIoPoolId);
    /// without the brackets; "feature_codes", "[2201]"
    ZEM_TRANSLATED_FIELD(m_FeatureCodes, FeatureCodes);
};

/// A virtual serial adapter.
class ZEM_EXPORT zemPartitionSerialAdapterResource : public zemPartitionHardwareResource {
public:
    using zemPartitionHardwareResource::zemPartitionHardwareResource;

    ZEM_TEXT_FIELD(m_LparName, LparName);            ///< name of the partition; "lpar_name"
    ZEM_TEXT_FIELD(m_SlotNum, SlotNum);              ///< virtual slot; "slot_num"
    ZEM_TEXT_FIELD(m_State, State);                  ///< "1" while it works; "state"
    ZEM_TRANSLATED_FIELD(m_IsRequired, IsRequired);  ///< "1" for "true", or "0"; "is_required"
    /// "unavailable" for "null", "none" for 0, "active" for 1, or "unknown"; "connect_status"
    ZEM_TRANSLATED_FIELD(m_ConnectStatus, ConnectStatus);
    /// "client" for 0, or "server"; "adapter_type"
    ZEM_TRANSLATED_FIELD(m_AdapterType, AdapterType);
    /// whether the appliance's console reaches it: "0" for 0, or "1"; "supports_dnx"
    ZEM_TRANSLATED_FIELD(m_SupportsDnx, SupportsDnx);
    /// partition at the other end, "any" for 65535; "remote_lpar_id"
    ZEM_TRANSLATED_FIELD(m_RemoteLparId, RemoteLparId);
    ZEM_TEXT_FIELD(m_RemoteLparName, RemoteLparName);  ///< its name; "remote_lpar_name"
    /// slot there, "any" for 65535; "remote_slot_num"
    ZEM_TRANSLATED_FIELD(m_RemoteSlotNum, RemoteSlotNum);
};

/// A virtual SCSI adapter.
class ZEM_EXPORT zemPartitionSCSIAdapterResource : public zemPartitionHardwareResource {
public:
    using zemPartitionHardwareResource::zemPartitionHardwareResource;

    ZEM_TEXT_FIELD(m_LparName, LparName);  ///< name of the partition; "lpar_name"
    ZEM_TEXT_FIELD(m_SlotNum, SlotNum);    ///< virtual slot; "slot_num"
    ZEM_TEXT_FIELD(m_State, State);        ///< "1" while it works; "state"
    /// "client" for 0, or "server"; "adapter_type"
    ZEM_TRANSLATED_FIELD(m_AdapterType, AdapterType);
    /// partition at the other end, "any" for 65535; "remote_lpar_id"
    ZEM_TRANSLATED_FIELD(m_RemoteLparId, RemoteLparId);
    ZEM_TEXT_FIELD(m_RemoteLparName, RemoteLparName);  ///< its name; "remote_lpar_name"
    ZEM_TEXT_FIELD(m_RemoteSlotNum, RemoteSlotNum);    ///< slot there; "remote_slot_num"
    ZEM_TEXT_FIELD(m_BackingDevices, BackingDevices);  ///< what it serves; "backing_devices"
    ZEM_TRANSLATED_FIELD(m_IsRequired, IsRequired);    ///< "1" for "true", or "0"; "is_required"
};

/// A virtual Ethernet adapter.
class ZEM_EXPORT zemPartitionEthernetAdapterResource : public zemPartitionHardwareResource {
public:
    using zemPartitionHardwareResource::zemPartitionHardwareResource;

    ZEM_TEXT_FIELD(m_SlotNum, SlotNum);    ///< virtual slot; "slot_num"
    ZEM_TEXT_FIELD(m_State, State);        ///< "1" while it works; "state"
    ZEM_TEXT_FIELD(m_MacAddr, MacAddr);    ///< "mac_addr"
    ZEM_TEXT_FIELD(m_LparName, LparName);  ///< name of the partition; "lpar_name"
    /// "1" if it tells VLANs apart; "ieee_virtual_eth"
    ZEM_TEXT_FIELD(m_IeeeVirtualEth, IeeeVirtualEth);
    ZEM_TEXT_FIELD(m_PortVlanID, PortVlanID);    ///< its VLAN; "port_vlan_id"
    ZEM_TEXT_FIELD(m_AddlVlanIds, AddlVlanIds);  ///< further VLANs, with commas; "addl_vlan_ids"
    ZEM_TRANSLATED_FIELD(m_IsRequired, IsRequired);  ///< "1" for "true", or "0"; "is_required"
    ZEM_TEXT_FIELD(m_IsTrunk, IsTrunk);              ///< whether it leads outside; "is_trunk"
    /// rank among those that lead outside; "trunk_priority"
    ZEM_TEXT_FIELD(m_TruukPriority, TruukPriority);
    ZEM_TEXT_FIELD(m_VSwitch, VSwitch);  ///< name of the virtual switch; "vswitch"
};

/// One stored profile of a partition. Tagged slots are DRC indexes, "none" if there is none.
class ZEM_EXPORT zemPartitionProfileConfiguration : public zemPartitionHardwareResource {
public:
    using zemPartitionHardwareResource::zemPartitionHardwareResource;

    ZEM_TEXT_FIELD(m_ProfileName, ProfileName);  ///< "UserDefinedName"
    ZEM_TEXT_FIELD(m_LparName, LparName);        ///< name of the partition; "lpar_name"
    ZEM_TEXT_FIELD(m_LparEnv, LparEnv);          ///< what runs there, as "tmxlinux"; "lpar_env"
    ZEM_TEXT_FIELD(m_LoadSourceSlot, LoadSourceSlot);  ///< slot to start from; "LoadSourceDRCIndex"
    /// to start from else; "AltLoadSourceDRCIndex"
    ZEM_TEXT_FIELD(m_AltRestartDeviceSlot, AltRestartDeviceSlot);
    ZEM_TEXT_FIELD(m_ConsoleSlot, ConsoleSlot);  ///< of the console; "ConsoleDRCIndex"
    /// of the other console; "AltConsoleDRCIndex"
    ZEM_TEXT_FIELD(m_AltConsoleSlot, AltConsoleSlot);
    ZEM_TEXT_FIELD(m_OpConsoleSlot, OpConsoleSlot);  ///< of the operator's console; "ECSDRCIndex"
    ZEM_TEXT_FIELD(m_AutoStart, AutoStart);  ///< "1" if started with the host; "AutoIPLEnabled"
    /// "1" if connections are watched; "SFPSurveillance"
    ZEM_TEXT_FIELD(m_ConnMonitoring, ConnMonitoring);
    /// megabytes kept for I/O, "auto" for 0; "EntMem"
    ZEM_TRANSLATED_FIELD(m_DesiredIoEntitledMem, DesiredIoEntitledMem);
    ZEM_TEXT_FIELD(m_MemWeight, MemWeight);  ///< share of the memory pool; "VRMWeight"
    ZEM_TEXT_FIELD(m_RedundantErrPathReporting, RedundantErrPathReporting);  ///< "RedundantPath"
    ZEM_TEXT_FIELD(m_UncapWeight, UncapWeight);  ///< share of idle processors; "UncappedWeight"
    /// "norm", "ds", "sms", "of", "dd" for 1 to 5, or "unknown"; "BootMode"
    ZEM_TRANSLATED_FIELD(m_BootMode, BootMode);
    /// how many virtual slots; "MaxVirtualSlots"
    ZEM_TEXT_FIELD(m_MaxVirtualSlots, MaxVirtualSlots);
    ZEM_TRANSLATED_FIELD(m_ProcMode, ProcMode);    ///< "ded" for 255, or "shared"; "ProcMode"
    ZEM_READ_FIELD(m_SharingMode, SharingMode);    ///< how processors are shared; see the setter
    ZEM_TEXT_FIELD(m_MinProcs, MinProcs);          ///< least processors; "MinimumCPUCount"
    ZEM_TEXT_FIELD(m_DesiredProcs, DesiredProcs);  ///< processors; "DesiredCPUCount"
    ZEM_TEXT_FIELD(m_MaxProcs, MaxProcs);          ///< most processors; "MaximumCPUCount"
    /// least units; "MinProcUnit", hundredths
    ZEM_TRANSLATED_FIELD(m_MinProcsUnits, MinProcsUnits);
    /// units; "DesiredProcUnit", hundredths
    ZEM_TRANSLATED_FIELD(m_DesiredProcsUnits, DesiredProcsUnits);
    /// most units; "MaxProcUnit", hundredths
    ZEM_TRANSLATED_FIELD(m_MaxProcsUnits, MaxProcsUnits);
    /// shared processor pool; "SharedProcPoolId"
    ZEM_TEXT_FIELD(m_SharedProcPoolID, SharedProcPoolID);
    /// processor generation, as "CORAL7", or "unknown"; "ProcessorMode", a number
    ZEM_TRANSLATED_FIELD(m_LparProcCompatMode, LparProcCompatMode);
    ZEM_TRANSLATED_FIELD(m_MemMode, MemMode);  ///< "ded" for 255, or "shared"; "MemMode"
    ZEM_TEXT_FIELD(m_MinMem, MinMem);          ///< least memory; "MinimumMemory"
    ZEM_TEXT_FIELD(m_DesiredMem, DesiredMem);  ///< memory; "DesiredMemory"
    ZEM_TEXT_FIELD(m_MaxMem, MaxMem);          ///< most memory; "MaximumMemory"
    /// adapter strings; "virtual_serial_adapters"
    ZEM_TEXT_FIELD(m_VirtualSerialAdapters, VirtualSerialAdapters);
    /// adapter strings; "virtual_scsi_adapters"
    ZEM_TEXT_FIELD(m_VirtualScsiAdapters, VirtualScsiAdapters);
    /// adapter strings; "virtual_eth_adapters"
    ZEM_TEXT_FIELD(m_VirtualEthAdapters, VirtualEthAdapters);
    ZEM_TEXT_FIELD(m_IoSlots, IoSlots);  ///< slots' strings; "io_slots"

public:
    /// As zemPartitionProcessorResource::setCurrSharingMode(), from "ProcMode", "DonorMode" and
    /// "SharingMode".
    void setSharingMode(const zemString& procMode, const zemString& donorMode,
                        const zemString& sharingMode);

    /// Sets every field to the text "zemNULL"; whose profile it is stays.
    void setDefaultValue();
};

#endif

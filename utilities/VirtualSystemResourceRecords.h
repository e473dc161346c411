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

    ZEM_TEXT_FIELD(ConfigurableSysProcUnits);    ///< can be given out; "ConfigurableProcUnits"
    ZEM_TEXT_FIELD(CurrAvailSysProcUnits);       ///< are free; "CurAvailProcUnits"
    ZEM_TEXT_FIELD(PendAvailSysProcUnits);       ///< free then; "PendAvailProcUnits"
    ZEM_TEXT_FIELD(InstalledSysProcUnits);       ///< are built in; "InstalledProcessors"
    ZEM_TEXT_FIELD(MaxSharedProcPools);          ///< most shared pools; "MaxProcPools"
    ZEM_TEXT_FIELD(MinProcUnitsPerVirtualProc);  ///< least for a virtual processor; "MinProcUnit"
};

/// The processors that a host's shared pools are made of, in such units.
class ZEM_EXPORT zemPoolProcessorResource : public zemHardwareResource {
public:
    using zemHardwareResource::zemHardwareResource;

    ZEM_TEXT_FIELD(PendAvailPoolProcUnits);     ///< free then; "PendAvailProcUnits"
    ZEM_TEXT_FIELD(ConfigurablePoolProcUnits);  ///< can be given out; "ConfigurableProcUnits"
};

/// One shared processor pool of a host.
class ZEM_EXPORT zemProcessorPoolResource : public zemHardwareResource {
public:
    using zemHardwareResource::zemHardwareResource;

    ZEM_TEXT_FIELD(SharedProcPoolId);           ///< number of the pool; "SharedProcPoolId"
    ZEM_TEXT_FIELD(LparIds);                    ///< partitions in it, with commas; "lpar_ids"
    ZEM_TEXT_FIELD(MaxPoolProcUnits);           ///< the most units in it
    ZEM_TEXT_FIELD(PendReservedPoolProcUnits);  ///< units kept; "PendReservedPoolCapacity"
    ZEM_TEXT_FIELD(MaxPoolCapacity);            ///< the most that it may hold; "MaxPoolCapacity"
};

/// The memory of a host, in megabytes.
class ZEM_EXPORT zemSystemMemoryResource : public zemHardwareResource {
public:
    using zemHardwareResource::zemHardwareResource;

    ZEM_TEXT_FIELD(ConfigurableSysMem);  ///< can be given out; "ConfigurableMem"
    ZEM_TEXT_FIELD(InstalledSysMem);     ///< is built in; "InstalledMemory"
    ZEM_TEXT_FIELD(MaxMemPools);         ///< most shared memory pools; "MaxMemPools"
    ZEM_TEXT_FIELD(PendAvailSysMem);     ///< free after pending changes; "PendAvailMem"
    ZEM_TEXT_FIELD(MemRegionSize);       ///< step in which memory is given out; "LMBSize"
};

/// The shared memory pool of a host, in megabytes.
class ZEM_EXPORT zemMemoryPoolResource : public zemHardwareResource {
public:
    using zemHardwareResource::zemHardwareResource;

    ZEM_FIELD(zemString, m_curr_pool_mem, CurrPoolMem);             ///< size; "curr_pool_mem"
    ZEM_FIELD(zemString, m_pend_avail_pool_mem, PendAvailPoolMem);  ///< free after pending changes;
                                                                    ///< "pend_avail_pool_mem"
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

    ZEM_TEXT_FIELD(LparName);                    ///< name of the partition; "UserDefinedName"
    ZEM_TRANSLATED_FIELD(CurrSharedProcPoolId);  ///< "CurProcMode", "null" for 255
    ZEM_TRANSLATED_FIELD(CurrProcMode);          ///< "ded" for 255, or "shared"; "CurProcMode"
    ZEM_TRANSLATED_FIELD(CurrMinProcUnits);      ///< least units; "CurMinProcUnits", hundredths
    ZEM_TRANSLATED_FIELD(CurrProcUnits);         ///< units; "CurAllocProcUnits", hundredths
    ZEM_TRANSLATED_FIELD(CurrMaxProcUnits);      ///< most units; "CurMaxProcUnits", hundredths
    ZEM_TEXT_FIELD(CurrMinProcs);                ///< least processors; "CurMinProcs"
    ZEM_TEXT_FIELD(CurrProcs);                   ///< processors; "CurAllocProcs"
    ZEM_TEXT_FIELD(CurrMaxProcs);                ///< most processors; "CurMaxProcs"
    ZEM_READ_FIELD(CurrSharingMode);             ///< how processors are shared; see the setter
    ZEM_TEXT_FIELD(CurrUncapWeight);             ///< share of idle processors; "CurUncappedWeight"
    ZEM_TEXT_FIELD(PendSharedProcPoolId);        ///< "PendProcMode"
    ZEM_TRANSLATED_FIELD(PendProcMode);      ///< stays empty: the setter stores "ded" or "shared"
                                             ///< in CurrProcMode; "PendProcMode"
    ZEM_TRANSLATED_FIELD(PendMinProcUnits);  ///< least units; "PendMinProcUnits", hundredths
    ZEM_TRANSLATED_FIELD(PendProcUnits);     ///< units; "PendAllocProcUnits", hundredths
    ZEM_TRANSLATED_FIELD(PendMaxProcUnits);  ///< most units; "PendMaxProcUnits", hundredths
    ZEM_TEXT_FIELD(PendMinProcs);            ///< least processors; "PendMinProcs"
    ZEM_TEXT_FIELD(PendProcs);               ///< processors; "PendAllocProcs"
    ZEM_TEXT_FIELD(PendMaxProcs);            ///< most processors; "PendMaxProcs"
    ZEM_READ_FIELD(PendSharingMode);         ///< how processors are shared; see the setter
    ZEM_TEXT_FIELD(PendUncapWeight);         ///< share of idle processors; "PendUncappedWeight"
    ZEM_TRANSLATED_FIELD(RunProcUnits);      ///< units; "RuntimeProcUnits", hundredths
    ZEM_TEXT_FIELD(RunProcs);                ///< processors; "RuntimeProcs"
    ZEM_TEXT_FIELD(RunUncapWeight);          ///< share of idle ones; "RuntimeUncappedWeight"

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

    ZEM_TEXT_FIELD(CurrMem);            ///< "CurAllocMem"
    ZEM_TEXT_FIELD(PendMem);            ///< "PendAllocMem"
    ZEM_TEXT_FIELD(LparName);           ///< name of the partition; "UserDefinedName"
    ZEM_TEXT_FIELD(CurrMinMem);         ///< least; "CurMinMem"
    ZEM_TEXT_FIELD(CurrMaxMem);         ///< most; "CurMaxMem"
    ZEM_TEXT_FIELD(PendMinMem);         ///< least; "PendMinMem"
    ZEM_TEXT_FIELD(PendMaxMem);         ///< most; "PendMaxMem"
    ZEM_TEXT_FIELD(RunMinMem);          ///< least; "RuntimeMinMem"
    ZEM_TEXT_FIELD(RunMem);             ///< "RuntimeMem"
    ZEM_TRANSLATED_FIELD(MemMode);      ///< "ded" for 255, or "shared"; "CurrMemMode"
    ZEM_TEXT_FIELD(RunMemWeight);       ///< share of the memory pool; "RuntimeVRMWeight"
    ZEM_TEXT_FIELD(AutoIoEntitledMem);  ///< whether memory for I/O is set by itself; "EntUsage"
    ZEM_TEXT_FIELD(RunIoEntitledMem);   ///< memory kept for I/O; "RuntimeEntMem"
};

/// A slot for a physical adapter.
class ZEM_EXPORT zemPartitionIOSlotResource : public zemPartitionHardwareResource {
public:
    using zemPartitionHardwareResource::zemPartitionHardwareResource;

    ZEM_TEXT_FIELD(DrcIndex);                  ///< key of the slot on its host; "drc_index"
    ZEM_TEXT_FIELD(Description);               ///< what is plugged in; "description"
    ZEM_TRANSLATED_FIELD(PciClass);            ///< hexadecimal; "pci_class", decimal
    ZEM_TEXT_FIELD(BusId);                     ///< "bus_id"
    ZEM_TRANSLATED_FIELD(PciDeviceId);         ///< hexadecimal; "pci_device_id", decimal
    ZEM_TRANSLATED_FIELD(PciRevisionId);       ///< hexadecimal; "pci_revision_id", decimal
    ZEM_TRANSLATED_FIELD(PciSubsDeviceId);     ///< hexadecimal; "pci_subs_device_id", decimal
    ZEM_TRANSLATED_FIELD(PciSubsVendorId);     ///< hexadecimal; "pci_subs_vendor_id", decimal
    ZEM_TRANSLATED_FIELD(PciVendorId);         ///< hexadecimal; "pci_vendor_id", decimal
    ZEM_TEXT_FIELD(DrcName);                   ///< location code of the slot; "drc_name"
    ZEM_TRANSLATED_FIELD(ParentSlotDrcIndex);  ///< "none" for "null"; "parent_slot_drc_index"
    ZEM_TEXT_FIELD(BusGrouping);               ///< whether the bus must stay whole; "bus_grouping"
    ZEM_TRANSLATED_FIELD(Iop);                 ///< an I/O processor: "0" for "false", or "1"; "iop"
    ZEM_TEXT_FIELD(UnitPhysLoc);               ///< location code of the unit; "unit_phys_loc"
    ZEM_TRANSLATED_FIELD(SlotIoPoolId);        ///< "none" for 65535 and "null"; "slot_io_pool_id"
    ZEM_TRANSLATED_FIELD(FeatureCodes);        ///< without the brackets; "feature_codes", "[2201]"
};

/// A virtual serial adapter.
class ZEM_EXPORT zemPartitionSerialAdapterResource : public zemPartitionHardwareResource {
public:
    using zemPartitionHardwareResource::zemPartitionHardwareResource;

    ZEM_TEXT_FIELD(LparName);             ///< name of the partition; "lpar_name"
    ZEM_TEXT_FIELD(SlotNum);              ///< virtual slot; "slot_num"
    ZEM_TEXT_FIELD(State);                ///< "1" while it works; "state"
    ZEM_TRANSLATED_FIELD(IsRequired);     ///< "1" for "true", or "0"; "is_required"
    ZEM_TRANSLATED_FIELD(ConnectStatus);  ///< "unavailable" for "null", "none" for 0, "active" for
                                          ///< 1, or "unknown"; "connect_status"
    ZEM_TRANSLATED_FIELD(AdapterType);    ///< "client" for 0, or "server"; "adapter_type"
    ZEM_TRANSLATED_FIELD(SupportsDnx);   ///< whether the appliance's console reaches it: "0" for 0,
                                         ///< or "1"; "supports_dnx"
    ZEM_TRANSLATED_FIELD(RemoteLparId);  ///< partition at the other end, "any" for 65535;
                                         ///< "remote_lpar_id"
    ZEM_TEXT_FIELD(RemoteLparName);      ///< its name; "remote_lpar_name"
    ZEM_TRANSLATED_FIELD(RemoteSlotNum);  ///< slot there, "any" for 65535; "remote_slot_num"
};

/// A virtual SCSI adapter.
class ZEM_EXPORT zemPartitionSCSIAdapterResource : public zemPartitionHardwareResource {
public:
    using zemPartitionHardwareResource::zemPartitionHardwareResource;

    ZEM_TEXT_FIELD(LparName);            ///< name of the partition; "lpar_name"
    ZEM_TEXT_FIELD(SlotNum);             ///< virtual slot; "slot_num"
    ZEM_TEXT_FIELD(State);               ///< "1" while it works; "state"
    ZEM_TRANSLATED_FIELD(AdapterType);   ///< "client" for 0, or "server"; "adapter_type"
    ZEM_TRANSLATED_FIELD(RemoteLparId);  ///< partition at the other end, "any" for 65535;
                                         ///< "remote_lpar_id"
    ZEM_TEXT_FIELD(RemoteLparName);      ///< its name; "remote_lpar_name"
    ZEM_TEXT_FIELD(RemoteSlotNum);       ///< slot there; "remote_slot_num"
    ZEM_TEXT_FIELD(BackingDevices);      ///< what it serves; "backing_devices"
    ZEM_TRANSLATED_FIELD(IsRequired);    ///< "1" for "true", or "0"; "is_required"
};

/// A virtual Ethernet adapter.
class ZEM_EXPORT zemPartitionEthernetAdapterResource : public zemPartitionHardwareResource {
public:
    using zemPartitionHardwareResource::zemPartitionHardwareResource;

    ZEM_TEXT_FIELD(SlotNum);           ///< virtual slot; "slot_num"
    ZEM_TEXT_FIELD(State);             ///< "1" while it works; "state"
    ZEM_TEXT_FIELD(MacAddr);           ///< "mac_addr"
    ZEM_TEXT_FIELD(LparName);          ///< name of the partition; "lpar_name"
    ZEM_TEXT_FIELD(IeeeVirtualEth);    ///< "1" if it tells VLANs apart; "ieee_virtual_eth"
    ZEM_TEXT_FIELD(PortVlanID);        ///< its VLAN; "port_vlan_id"
    ZEM_TEXT_FIELD(AddlVlanIds);       ///< further VLANs, with commas; "addl_vlan_ids"
    ZEM_TRANSLATED_FIELD(IsRequired);  ///< "1" for "true", or "0"; "is_required"
    ZEM_TEXT_FIELD(IsTrunk);           ///< whether it leads outside; "is_trunk"
    ZEM_TEXT_FIELD(TruukPriority);     ///< rank among those that lead outside; "trunk_priority"
    ZEM_TEXT_FIELD(VSwitch);           ///< name of the virtual switch; "vswitch"
};

/// One stored profile of a partition. Tagged slots are DRC indexes, "none" if there is none.
class ZEM_EXPORT zemPartitionProfileConfiguration : public zemPartitionHardwareResource {
public:
    using zemPartitionHardwareResource::zemPartitionHardwareResource;

    ZEM_TEXT_FIELD(ProfileName);                 ///< "UserDefinedName"
    ZEM_TEXT_FIELD(LparName);                    ///< name of the partition; "lpar_name"
    ZEM_TEXT_FIELD(LparEnv);                     ///< what runs there, as "tmxlinux"; "lpar_env"
    ZEM_TEXT_FIELD(LoadSourceSlot);              ///< slot to start from; "LoadSourceDRCIndex"
    ZEM_TEXT_FIELD(AltRestartDeviceSlot);        ///< to start from else; "AltLoadSourceDRCIndex"
    ZEM_TEXT_FIELD(ConsoleSlot);                 ///< of the console; "ConsoleDRCIndex"
    ZEM_TEXT_FIELD(AltConsoleSlot);              ///< of the other console; "AltConsoleDRCIndex"
    ZEM_TEXT_FIELD(OpConsoleSlot);               ///< of the operator's console; "ECSDRCIndex"
    ZEM_TEXT_FIELD(AutoStart);                   ///< "1" if started with the host; "AutoIPLEnabled"
    ZEM_TEXT_FIELD(ConnMonitoring);              ///< "1" if connections are watched;
                                                 ///< "SFPSurveillance"
    ZEM_TRANSLATED_FIELD(DesiredIoEntitledMem);  ///< megabytes kept for I/O, "auto" for 0; "EntMem"
    ZEM_TEXT_FIELD(MemWeight);                   ///< share of the memory pool; "VRMWeight"
    ZEM_TEXT_FIELD(RedundantErrPathReporting);   ///< "RedundantPath"
    ZEM_TEXT_FIELD(UncapWeight);                 ///< share of idle processors; "UncappedWeight"
    ZEM_TRANSLATED_FIELD(BootMode);              ///< "norm", "ds", "sms", "of", "dd" for 1 to 5, or
                                                 ///< "unknown"; "BootMode"
    ZEM_TEXT_FIELD(MaxVirtualSlots);             ///< how many virtual slots; "MaxVirtualSlots"
    ZEM_TRANSLATED_FIELD(ProcMode);              ///< "ded" for 255, or "shared"; "ProcMode"
    ZEM_READ_FIELD(SharingMode);                 ///< how processors are shared; see the setter
    ZEM_TEXT_FIELD(MinProcs);                    ///< least processors; "MinimumCPUCount"
    ZEM_TEXT_FIELD(DesiredProcs);                ///< processors; "DesiredCPUCount"
    ZEM_TEXT_FIELD(MaxProcs);                    ///< most processors; "MaximumCPUCount"
    ZEM_TRANSLATED_FIELD(MinProcsUnits);         ///< least units; "MinProcUnit", hundredths
    ZEM_TRANSLATED_FIELD(DesiredProcsUnits);     ///< units; "DesiredProcUnit", hundredths
    ZEM_TRANSLATED_FIELD(MaxProcsUnits);         ///< most units; "MaxProcUnit", hundredths
    ZEM_TEXT_FIELD(SharedProcPoolID);            ///< shared processor pool; "SharedProcPoolId"
    ZEM_TRANSLATED_FIELD(LparProcCompatMode);    ///< processor generation, as "CORAL7", or
                                                 ///< "unknown"; "ProcessorMode", a number
    ZEM_TRANSLATED_FIELD(MemMode);               ///< "ded" for 255, or "shared"; "MemMode"
    ZEM_TEXT_FIELD(MinMem);                      ///< least memory; "MinimumMemory"
    ZEM_TEXT_FIELD(DesiredMem);                  ///< memory; "DesiredMemory"
    ZEM_TEXT_FIELD(MaxMem);                      ///< most memory; "MaximumMemory"
    ZEM_TEXT_FIELD(VirtualSerialAdapters);       ///< adapter strings; "virtual_serial_adapters"
    ZEM_TEXT_FIELD(VirtualScsiAdapters);         ///< adapter strings; "virtual_scsi_adapters"
    ZEM_TEXT_FIELD(VirtualEthAdapters);          ///< adapter strings; "virtual_eth_adapters"
    ZEM_TEXT_FIELD(IoSlots);                     ///< slots' strings; "io_slots"

public:
    /// As zemPartitionProcessorResource::setCurrSharingMode(), from "ProcMode", "DonorMode" and
    /// "SharingMode".
    void setSharingMode(const zemString& procMode, const zemString& donorMode,
                        const zemString& sharingMode);

    /// Sets every field to the text "zemNULL"; whose profile it is stays.
    void setDefaultValue();
};

#endif

/// Resource allocation setting data (RASDs): one resource of a partition or of a stored profile,
/// as processors, memory, a slot or a virtual adapter.
///
/// zemRASD is the root, zemRASDCommData what all kinds of data share; six classes stand for the six
/// kinds. Each holds its data by value, and the data are open to all. Numbers are -1 and texts
/// empty while nobody has set them; processor quantities are hundredths of a processor, memory
/// quantities kilobytes.
///
/// Whoever is handed a RASD by a pointer to keep, as from clone(), deletes it.
///
/// Thread-safety: none; a RASD belongs to the operation that made it.
///
///     zemVETHRASD adapter("10-4");  // the key: resource type and slot
///     adapter.m_Data.m_PortVLANID = 1;
///     puts(adapter.getInstanceID(true, &vssd));  // "ORX:4*4*3*1111-AAA*0000001"
#ifndef VIRTUAL_SYSTEM_REP_RASD_H
#define VIRTUAL_SYSTEM_REP_RASD_H

#include <cstdint>

#include "Array.h"
#include "StringUtils.h"
#include "ZemExport.h"

class zemVSSD;

/// The two sides of a partition's settings: what a profile says, and what is running.
enum ZEM_EXPORT zemSettingSide { SIDE_DEFINED, SIDE_STATE };

/// What all resources of one kind have in common.
struct ZEM_EXPORT zemRASDKind {
    int resourceType;          ///< CIM's number for the kind
    const char* settingClass;  ///< the CIM class of its setting data
    const char* units;         ///< of the quantities
    int automaticAllocation;
    int automaticDeallocation;
};

struct ZEM_EXPORT zemRASDKinds {
    // clang-format off
    static constexpr zemRASDKind processor = { 3, "ORXC_ProcessorRASettingData",       "Percent",   1, 1};
    static constexpr zemRASDKind memory    = { 4, "ORXC_MemoryRASettingData",          "byte*2^10", 1, 1};
    static constexpr zemRASDKind scsi      = { 6, "ORXC_SCSIAdapterRASettingData",     "Adapter",   1, 0};
    static constexpr zemRASDKind ethernet  = {10, "ORXC_EthernetAdapterRASettingData", "Adapter",   1, 1};
    static constexpr zemRASDKind ioSlot    = {12, "ORXC_IOSlotAdapterRASettingData",   "Slot",      1, 0};
    static constexpr zemRASDKind serial    = {21, "ORXC_SerialAdapterRASettingData",   "Adapter",   1, 0};
    // clang-format on
};

/// The data common to all kinds. Each kind derives its own data from it; alone, it is of no kind.
struct ZEM_EXPORT zemRASDCommData {
    zemRASDCommData() = default;

    /// Copies all of @p source, which must not be null, but its address: a copied RASD has none.
    explicit zemRASDCommData(const zemRASDCommData* source);

    /// What tells the resource from others of the same partition, as "3-Processor"; empty for data
    /// of no kind.
    virtual zemString getKey() const;
    virtual ~zemRASDCommData();

    /// Whether all fields, the address too, are those of @p other, which must not be null.
    bool equals(const zemRASDCommData* other) const;

    int m_ResourceType = -1;        ///< zemRASDKind::resourceType
    zemString m_InstanceID;         ///< as getInstanceID() forms it
    zemString m_PoolID;             ///< of the pool that the resource is taken from; "Primordial"
    int m_MappingBehavior = -1;     ///< 1 shared, 2 dedicated
    zemString m_SharingMode;        ///< the tools' word, as "uncap"
    int m_Weight = -1;              ///< share of what is left over
    int m_ConsumerVisibility = -1;  ///< 2 passed through, 3 virtualized
    zemString m_AllocationUnits;    ///< zemRASDKind::units
    std::int64_t m_VirtualMinimum = -1;
    std::int64_t m_VirtualQuantity = -1;
    std::int64_t m_VirtualMaximum = -1;
    std::int64_t m_Minimum = -1;
    std::int64_t m_Reservation = -1;
    std::int64_t m_Limit = -1;
    zemString m_Address;  ///< MAC address of a running adapter
    int m_AutomaticAllocation = -1;
    int m_AutomaticDeallocation = -1;
    int m_IsRequired = -1;  ///< 1: the partition does not start without it

protected:
    explicit zemRASDCommData(const zemRASDKind& kind);
};

/// One RASD of any kind.
class ZEM_EXPORT zemRASD {
public:
    virtual ~zemRASD();

    /// The data, which belong to this object.
    virtual zemRASDCommData* getData() = 0;
    virtual zemString getKey() = 0;

    /// The instance ID as stored, or formed anew for @p vssd and stored.
    /// @param vssd  the system whose side, profile and partition stand in the ID
    /// @throws zemInvalidParameterException @p regenerate without @p vssd
    virtual zemString getInstanceID(bool regenerate, zemVSSD* vssd) = 0;

    /// A new object of the same kind with a copy of the data; the caller owns it.
    virtual zemRASD* clone() = 0;

    /// Stores @p instanceID, and what the kind reads from it: a slot its DRC index, an adapter its
    /// slot number. Of an ID that is too short for @p mtms they read nothing.
    /// @param mtms  key of the host, with which the ID ends
    virtual void setInstanceID(const zemString& instanceID, const zemString& mtms) = 0;

    /// Whether @p rasd is of the same kind and holds the same data; never for null. Of the lists
    /// only as many elements as this object has are compared, so this is not symmetric.
    virtual bool equals(zemRASD* rasd) = 0;
};

/// The operations of the kinds; @p Rasd is the class of a kind and has the data m_Data.
template <class Rasd>
class ZEM_EXPORT zemRASDOf : public zemRASD {
public:
    zemRASDCommData* getData() override;
    zemString getKey() override;
    zemString getInstanceID(bool regenerate, zemVSSD* vssd) override;
    zemRASD* clone() override;
    void setInstanceID(const zemString& instanceID, const zemString& mtms) override;
    bool equals(zemRASD* rasd) override;

private:
    Rasd& self() { return static_cast<Rasd&>(*this); }
};

// Each kind is made empty, from a key, or as a copy of data that must not be null; the copy has no
// address. A key without "-" tells nothing.

/// Processors of a partition.
class ZEM_EXPORT zemProcessorRASD : public zemRASDOf<zemProcessorRASD> {
public:
    struct zemProcessorRASDData : zemRASDCommData {
        zemProcessorRASDData();
        zemString getKey() const override;  ///< "3-Processor"

        zemString m_ProcCompatMode;  ///< compatibility mode, as "CORAL7"
    };

    zemProcessorRASD() = default;
    explicit zemProcessorRASD(const zemString& key);  ///< there is one key only: not looked at
    explicit zemProcessorRASD(const zemProcessorRASDData* data);
    ~zemProcessorRASD() override;

    void setMTMS(const zemString& mtms) { m_MTMS = mtms; }
    const zemString& getMTMS() const { return m_MTMS; }

    zemProcessorRASDData m_Data;

private:
    zemString m_MTMS;  ///< the host; clones are without
};

/// Memory of a partition.
class ZEM_EXPORT zemMemoryRASD : public zemRASDOf<zemMemoryRASD> {
public:
    struct zemMemoryRASDData : zemRASDCommData {
        zemMemoryRASDData();
        zemString getKey() const override;  ///< "4-Memory"
    };

    zemMemoryRASD() = default;
    explicit zemMemoryRASD(const zemString& key);  ///< there is one key only: not looked at
    explicit zemMemoryRASD(const zemMemoryRASDData* data);
    ~zemMemoryRASD() override;

    void setMTMS(const zemString& mtms) { m_MTMS = mtms; }
    const zemString& getMTMS() const { return m_MTMS; }

    zemMemoryRASDData m_Data;

private:
    zemString m_MTMS;  ///< the host; clones are without
};

/// One physical I/O slot.
class ZEM_EXPORT zemIOSlotRASD : public zemRASDOf<zemIOSlotRASD> {
public:
    struct zemIOSlotRASDData : zemRASDCommData {
        zemIOSlotRASDData();
        zemString getKey() const override;  ///< "12-<DRC index>"

        /// Index of the slot, hexadecimal text. Behind setInstanceID() it reads
        /// "<DRC index>*<partition ID>": whoever compares cuts the rest off.
        zemString m_DRCIndex;
        zemArray<int> m_TaggedIOType;  ///< uses that the slot is tagged for, as 1 load source
    };

    zemIOSlotRASD() = default;
    explicit zemIOSlotRASD(const zemString& key);
    explicit zemIOSlotRASD(const zemIOSlotRASDData* data);
    ~zemIOSlotRASD() override;

    zemIOSlotRASDData m_Data;
};

/// What virtual serial and SCSI adapters hold: an adapter here and its partner in another
/// partition.
struct ZEM_EXPORT zemRemoteAdapterRASDData : zemRASDCommData {
    zemString getKey() const override;  ///< "<type>-<slot>"

    int m_VirtualAdapterType = -1;      ///< 0 server, 1 client
    int m_SlotID = -1;                  ///< virtual slot
    int m_RemoteClientFlag = -1;        ///< 0 one partition, 1 any, 2 the console
    int m_RemoteClientSlotFlag = -1;    ///< 0 one slot, 1 any
    zemString m_RemoteVirtualSystemID;  ///< ID of the partner's partition
    int m_RemoteSlotID = -1;            ///< the partner's slot; -2 any

protected:
    explicit zemRemoteAdapterRASDData(const zemRASDKind& kind);
};

/// One virtual SCSI adapter.
class ZEM_EXPORT zemVSCSIRASD : public zemRASDOf<zemVSCSIRASD> {
public:
    struct zemVSCSIRASDData : zemRemoteAdapterRASDData {
        zemVSCSIRASDData();
    };

    zemVSCSIRASD() = default;
    explicit zemVSCSIRASD(const zemString& key);
    explicit zemVSCSIRASD(const zemVSCSIRASDData* data);
    ~zemVSCSIRASD() override;

    zemVSCSIRASDData m_Data;
};

/// One virtual serial adapter.
class ZEM_EXPORT zemVSERIALRASD : public zemRASDOf<zemVSERIALRASD> {
public:
    struct zemVSERIALRASDData : zemRemoteAdapterRASDData {
        zemVSERIALRASDData();
    };

    zemVSERIALRASD() = default;
    explicit zemVSERIALRASD(const zemString& key);
    explicit zemVSERIALRASD(const zemVSERIALRASDData* data);
    ~zemVSERIALRASD() override;

    zemVSERIALRASDData m_Data;
};

/// One virtual Ethernet adapter.
class ZEM_EXPORT zemVETHRASD : public zemRASDOf<zemVETHRASD> {
public:
    struct zemVETHRASDData : zemRASDCommData {
        zemVETHRASDData();
        zemString getKey() const override;  ///< "10-<slot>"

        int m_SlotID = -1;          ///< virtual slot
        int m_IEEECompatible = -1;  ///< 1: takes additional VLANs
        int m_PortVLANID = -1;
        zemArray<int> m_AddVLANIDs;  ///< additional VLANs
        int m_TrunkPriority = -1;    ///< 0: no trunk
        zemString m_vswitch;         ///< name of the virtual switch
    };

    zemVETHRASD() = default;
    explicit zemVETHRASD(const zemString& key);
    explicit zemVETHRASD(const zemVETHRASDData* data);
    ~zemVETHRASD() override;

    zemVETHRASDData m_Data;
};

extern template class zemRASDOf<zemProcessorRASD>;
extern template class zemRASDOf<zemMemoryRASD>;
extern template class zemRASDOf<zemIOSlotRASD>;
extern template class zemRASDOf<zemVSCSIRASD>;
extern template class zemRASDOf<zemVSERIALRASD>;
extern template class zemRASDOf<zemVETHRASD>;

#endif

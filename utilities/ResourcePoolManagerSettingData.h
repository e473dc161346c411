/// Setting data of resources, as CIM shows them in the class of each kind of resource.
///
/// zemResourceRASettingData is the root, one class a kind stands below it, and two leaves a kind
/// tell of one resource of a partition: what a profile defines, and what is running. A VSSD makes
/// the leaves and owns them.
///
/// A leaf tells which resource it is: resource type, allocation units and instance ID. It holds no
/// quantities.
///
/// Thread-safety: none; an object belongs to the operation that made it.
///
///     zemMemoryRASettingDataState memory;
///     if (memory.initialize(userName, lpar, cec, profileName, "none", "none", type) != -1)
///         memory.addSpecificProperties(instance, properties, className);
#ifndef RESOURCE_POOL_MANAGER_SETTING_DATA_H
#define RESOURCE_POOL_MANAGER_SETTING_DATA_H

#include "StringUtils.h"
#include "VirtualSystemRepRASD.h"
#include "ZemExport.h"

class CmpiInstance;
class zemCEC;
class zemLPAR;
class zemResourcePool;

/// What all setting data hold.
struct ZEM_EXPORT zemResourceRASettingDataCommData {
    virtual ~zemResourceRASettingDataCommData();

    int m_ResourceType = -1;      ///< zemRASDKind::resourceType
    zemString m_InstanceID;       ///< as RASDs of the same resource have it
    zemString m_AllocationUnits;  ///< zemRASDKind::units
};

/// Setting data of any kind.
class ZEM_EXPORT zemResourceRASettingData {
public:
    zemResourceRASettingData() = default;

    /// @param data  stays the caller's and outlives this object
    /// @param type  what getType() tells
    zemResourceRASettingData(zemResourceRASettingDataCommData* data, const zemString& type)
        : m_Data(data), m_Type(type) {}
    zemResourceRASettingData(const zemResourceRASettingData&) = delete;
    zemResourceRASettingData& operator=(const zemResourceRASettingData&) = delete;

    /// The data, which belong to this object.
    zemResourceRASettingDataCommData* getData() const { return m_Data; }

    /// The CIM class, as "ORXC_MemoryRASettingData".
    const zemString& getType() const { return m_Type; }

    /// Fills the object from a pool of @p cec. Returns 0, or -1: it cannot be told.
    virtual int initialize(zemResourcePool* pool, zemCEC* cec, const zemString& filter,
                           int mode) = 0;

    /// Fills the object from one resource of a partition.
    /// @param userName  who asks
    /// @param lpar,cec  the partition and its host; not null
    /// @param profileName  the profile of a defined side
    /// @param id  the DRC index of a slot, the slot number of an adapter, else "none"
    /// @param info  the resource as it stands in the list of its kind, else "none"
    /// @param type  how much is asked for, a VMVisitorType
    /// @return 0, or -1: the object is of no use
    virtual int initialize(const zemString& userName, zemLPAR* lpar, zemCEC* cec,
                           const zemString& profileName, const zemString& id, const zemString& info,
                           int type) = 0;

    /// Sets those properties of @p instance that the object holds and @p properties lists, ignoring
    /// case; a null or empty list has every name.
    /// @param className  the class of @p instance
    virtual void addSpecificProperties(CmpiInstance& instance, const char** properties,
                                       const char* className) = 0;

    virtual ~zemResourceRASettingData();

protected:
    zemResourceRASettingDataCommData* m_Data = nullptr;
    zemString m_Type;
};

/// Setting data of one kind.
template <const zemRASDKind& kind>
class ZEM_EXPORT zemRASettingDataOf : public zemResourceRASettingData {
protected:
    zemRASettingDataOf() : zemResourceRASettingData(&m_CommData, kind.settingClass) {}

private:
    zemResourceRASettingDataCommData m_CommData;
};

using zemProcessorRASettingData = zemRASettingDataOf<zemRASDKinds::processor>;
using zemMemoryRASettingData = zemRASettingDataOf<zemRASDKinds::memory>;
using zemIOSlotRASettingData = zemRASettingDataOf<zemRASDKinds::ioSlot>;
using zemEthernetAdapterRASettingData = zemRASettingDataOf<zemRASDKinds::ethernet>;
using zemSCSIAdapterRASettingData = zemRASettingDataOf<zemRASDKinds::scsi>;
using zemSerialAdapterRASettingData = zemRASettingDataOf<zemRASDKinds::serial>;

/// Setting data of one resource of a partition. It is filled from a partition alone: from a pool,
/// initialize() gives -1, and so it does for an adapter whose @p id is no slot number.
template <const zemRASDKind& kind, zemSettingSide side>
class ZEM_EXPORT zemRASettingDataOnLPAR : public zemRASettingDataOf<kind> {
public:
    int initialize(zemResourcePool* pool, zemCEC* cec, const zemString& filter, int mode) override;
    int initialize(const zemString& userName, zemLPAR* lpar, zemCEC* cec,
                   const zemString& profileName, const zemString& id, const zemString& info,
                   int type) override;
    void addSpecificProperties(CmpiInstance& instance, const char** properties,
                               const char* className) override;
};

using zemProcessorRASettingDataDefined =
    zemRASettingDataOnLPAR<zemRASDKinds::processor, SIDE_DEFINED>;
using zemProcessorRASettingDataState = zemRASettingDataOnLPAR<zemRASDKinds::processor, SIDE_STATE>;
using zemMemoryRASettingDataDefined = zemRASettingDataOnLPAR<zemRASDKinds::memory, SIDE_DEFINED>;
using zemMemoryRASettingDataState = zemRASettingDataOnLPAR<zemRASDKinds::memory, SIDE_STATE>;
using zemIOSlotRASettingDataDefined = zemRASettingDataOnLPAR<zemRASDKinds::ioSlot, SIDE_DEFINED>;
using zemIOSlotRASettingDataState = zemRASettingDataOnLPAR<zemRASDKinds::ioSlot, SIDE_STATE>;
using zemEthernetAdapterRASettingDataDefined =
    zemRASettingDataOnLPAR<zemRASDKinds::ethernet, SIDE_DEFINED>;
using zemEthernetAdapterRASettingDataState =
    zemRASettingDataOnLPAR<zemRASDKinds::ethernet, SIDE_STATE>;
using zemSCSIAdapterRASettingDataDefined = zemRASettingDataOnLPAR<zemRASDKinds::scsi, SIDE_DEFINED>;
using zemSCSIAdapterRASettingDataState = zemRASettingDataOnLPAR<zemRASDKinds::scsi, SIDE_STATE>;
using zemSerialAdapterRASettingDataDefined =
    zemRASettingDataOnLPAR<zemRASDKinds::serial, SIDE_DEFINED>;
using zemSerialAdapterRASettingDataState = zemRASettingDataOnLPAR<zemRASDKinds::serial, SIDE_STATE>;

#endif

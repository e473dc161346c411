/// Setting data of resources, as CIM shows them in the class of each kind of resource.
///
/// zemResourceRASettingData is the root, one class a kind stands below it, and the leaves below
/// those tell of two things:
///
/// - what a partition may take from a pool: the least, the most, what it takes by default and the
///   step, of dedicated and of shared resources (...DedicatedMIN to ...SharedINC). The capability
///   of a pool makes these and owns them (ResourcePoolManagerCapabilities.h);
/// - what a partition has of one resource: what a profile defines, and what is running
///   (...Defined, ...State, below the kind's ...OnLPAR). A VSSD makes these and owns them.
///
/// The leaves of each of the two are one template. Processors are told in hundredths of a
/// processing unit, memory in kilobytes, slots and adapters by count.
///
/// Thread-safety: none; an object belongs to the operation that made it.
///
///     zemMemoryRASettingDataSharedDEF share;
///     if (share.initialize(pool, cec, "", VISITOR_TYPE_RASD_INIT) != -1)
///         share.addSpecificProperties(instance, properties, className);
#ifndef RESOURCE_POOL_MANAGER_SETTING_DATA_H
#define RESOURCE_POOL_MANAGER_SETTING_DATA_H

#include <memory>

#include "CmpiData.h"
#include "StringUtils.h"
#include "VirtualSystemRepRASD.h"
#include "ZemExport.h"
#include "cmpidt.h"

class CmpiInstance;
class zemCEC;
class zemLPAR;
class zemResourcePool;

/// What all setting data hold.
struct ZEM_EXPORT zemResourceRASettingDataCommData {
    virtual ~zemResourceRASettingDataCommData();

    CMPIUint16 m_ResourceType = 0;  ///< zemRASDKind::resourceType; 0 in one that was not filled
    zemString m_InstanceID;         ///< as told at the leaves
    zemString m_AllocationUnits;    ///< zemRASDKind::units
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

    /// Fills the object from a pool.
    /// @param pool  its data name it
    /// @param cec  the pool's host, with the records that the kind needs: of processors or memory,
    ///        of the host, its pools and its partitions; of slots, of partitions
    /// @param filter  has no effect
    /// @param mode  VISITOR_TYPE_RASD_INIT_NI tells the instance ID alone, any other value all
    /// @return 0, or -1: it cannot be told
    /// @throws zemInvalidParameterException a partition names a pool that the host does not have
    virtual int initialize(zemResourcePool* pool, zemCEC* cec, const zemString& filter,
                           int mode) = 0;

    /// Fills the object from one resource of a partition.
    /// @param userName  who asks
    /// @param lpar,cec  the partition and its host; not null
    /// @param profileName  the profile of a defined side
    /// @param id  the DRC index of a slot, the slot number of an adapter, else "none"
    /// @param info  the resource as it stands in the list of its kind, else "none"
    /// @param type  VISITOR_TYPE_RASD_INIT_NI tells which resource it is, any other value all
    /// @return 0, or -1: the object is of no use
    /// @throws what reading records raises (VirtualSystemVisitorVSSD.h)
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

/// Setting data of one kind. Each leaf is filled from a pool or from a partition; the other gives
/// -1.
template <const zemRASDKind& kind>
class ZEM_EXPORT zemRASettingDataOf : public zemResourceRASettingData {
public:
    int initialize(zemResourcePool* pool, zemCEC* cec, const zemString& filter, int mode) override;
    int initialize(const zemString& userName, zemLPAR* lpar, zemCEC* cec,
                   const zemString& profileName, const zemString& id, const zemString& info,
                   int type) override;

protected:
    explicit zemRASettingDataOf(zemResourceRASettingDataCommData* data)
        : zemResourceRASettingData(data, kind.settingClass) {}
};

using zemProcessorRASettingData = zemRASettingDataOf<zemRASDKinds::processor>;
using zemMemoryRASettingData = zemRASettingDataOf<zemRASDKinds::memory>;
using zemIOSlotRASettingData = zemRASettingDataOf<zemRASDKinds::ioSlot>;
using zemEthernetAdapterRASettingData = zemRASettingDataOf<zemRASDKinds::ethernet>;
using zemSCSIAdapterRASettingData = zemRASettingDataOf<zemRASDKinds::scsi>;
using zemSerialAdapterRASettingData = zemRASettingDataOf<zemRASDKinds::serial>;

// --- What a partition may take from a pool

enum ZEM_EXPORT zemPoolSharing { SHARING_DEDICATED, SHARING_SHARED };
enum ZEM_EXPORT zemPoolRole { ROLE_MIN, ROLE_MAX, ROLE_DEF, ROLE_INC };

/// The quantities of a leaf; those that it does not hold are 0.
struct ZEM_EXPORT zemPoolRASettingDataCommData : zemResourceRASettingDataCommData {
    zemString m_PoolID;  ///< as the pool's data have it
    CMPIUint64 m_VirtualQuantity = 0;
    CMPIUint64 m_VirtualMinimum = 0;
    CMPIUint64 m_VirtualMaximum = 0;
    CMPIUint64 m_Minimum = 0;
    CMPIUint64 m_Reservation = 0;
    CMPIUint64 m_Limit = 0;
};

/// Where a leaf has its data, by the name that its kind has for them.
template <const zemRASDKind& kind>
struct ZEM_EXPORT zemPoolRASettingDataBlock {
    zemPoolRASettingDataCommData m_RASettingData;

protected:
    zemPoolRASettingDataCommData* block() { return &m_RASettingData; }
};
template <>
struct ZEM_EXPORT zemPoolRASettingDataBlock<zemRASDKinds::processor> {
    zemPoolRASettingDataCommData m_ProcRASettingData;

protected:
    zemPoolRASettingDataCommData* block() { return &m_ProcRASettingData; }
};

/// Its instance ID is "ORX:<D or S><role>:<resource type>-<pool>*<MTMS>"; with a D for slots and
/// adapters, though those are shared: clients know them so.
template <const zemRASDKind& kind, zemPoolSharing sharing, zemPoolRole role>
class ZEM_EXPORT zemRASettingDataOfPool : public zemPoolRASettingDataBlock<kind>,
                                          public zemRASettingDataOf<kind> {
public:
    using RASettingDataCommData = zemPoolRASettingDataCommData;
    using zemRASettingDataOf<kind>::initialize;

    zemRASettingDataOfPool() : zemRASettingDataOf<kind>(this->block()) {}
    int initialize(zemResourcePool* pool, zemCEC* cec, const zemString& filter, int mode) override;
    void addSpecificProperties(CmpiInstance& instance, const char** properties,
                               const char* className) override;
};

// clang-format off
using zemProcessorRASettingDataDedicatedMIN = zemRASettingDataOfPool<zemRASDKinds::processor, SHARING_DEDICATED, ROLE_MIN>;
using zemProcessorRASettingDataDedicatedMAX = zemRASettingDataOfPool<zemRASDKinds::processor, SHARING_DEDICATED, ROLE_MAX>;
using zemProcessorRASettingDataDedicatedDEF = zemRASettingDataOfPool<zemRASDKinds::processor, SHARING_DEDICATED, ROLE_DEF>;
using zemProcessorRASettingDataDedicatedINC = zemRASettingDataOfPool<zemRASDKinds::processor, SHARING_DEDICATED, ROLE_INC>;
using zemProcessorRASettingDataSharedMIN = zemRASettingDataOfPool<zemRASDKinds::processor, SHARING_SHARED, ROLE_MIN>;
using zemProcessorRASettingDataSharedMAX = zemRASettingDataOfPool<zemRASDKinds::processor, SHARING_SHARED, ROLE_MAX>;
using zemProcessorRASettingDataSharedDEF = zemRASettingDataOfPool<zemRASDKinds::processor, SHARING_SHARED, ROLE_DEF>;
using zemProcessorRASettingDataSharedINC = zemRASettingDataOfPool<zemRASDKinds::processor, SHARING_SHARED, ROLE_INC>;
using zemMemoryRASettingDataDedicatedMIN = zemRASettingDataOfPool<zemRASDKinds::memory, SHARING_DEDICATED, ROLE_MIN>;
using zemMemoryRASettingDataDedicatedMAX = zemRASettingDataOfPool<zemRASDKinds::memory, SHARING_DEDICATED, ROLE_MAX>;
using zemMemoryRASettingDataDedicatedDEF = zemRASettingDataOfPool<zemRASDKinds::memory, SHARING_DEDICATED, ROLE_DEF>;
using zemMemoryRASettingDataDedicatedINC = zemRASettingDataOfPool<zemRASDKinds::memory, SHARING_DEDICATED, ROLE_INC>;
using zemMemoryRASettingDataSharedMIN = zemRASettingDataOfPool<zemRASDKinds::memory, SHARING_SHARED, ROLE_MIN>;
using zemMemoryRASettingDataSharedMAX = zemRASettingDataOfPool<zemRASDKinds::memory, SHARING_SHARED, ROLE_MAX>;
using zemMemoryRASettingDataSharedDEF = zemRASettingDataOfPool<zemRASDKinds::memory, SHARING_SHARED, ROLE_DEF>;
using zemMemoryRASettingDataSharedINC = zemRASettingDataOfPool<zemRASDKinds::memory, SHARING_SHARED, ROLE_INC>;
using zemIOSlotRASettingDataSharedMIN = zemRASettingDataOfPool<zemRASDKinds::ioSlot, SHARING_SHARED, ROLE_MIN>;
using zemIOSlotRASettingDataSharedMAX = zemRASettingDataOfPool<zemRASDKinds::ioSlot, SHARING_SHARED, ROLE_MAX>;
using zemIOSlotRASettingDataSharedDEF = zemRASettingDataOfPool<zemRASDKinds::ioSlot, SHARING_SHARED, ROLE_DEF>;
using zemIOSlotRASettingDataSharedINC = zemRASettingDataOfPool<zemRASDKinds::ioSlot, SHARING_SHARED, ROLE_INC>;
using zemEthernetAdapterRASettingDataSharedMIN = zemRASettingDataOfPool<zemRASDKinds::ethernet, SHARING_SHARED, ROLE_MIN>;
using zemEthernetAdapterRASettingDataSharedMAX = zemRASettingDataOfPool<zemRASDKinds::ethernet, SHARING_SHARED, ROLE_MAX>;
using zemEthernetAdapterRASettingDataSharedDEF = zemRASettingDataOfPool<zemRASDKinds::ethernet, SHARING_SHARED, ROLE_DEF>;
using zemEthernetAdapterRASettingDataSharedINC = zemRASettingDataOfPool<zemRASDKinds::ethernet, SHARING_SHARED, ROLE_INC>;
using zemSCSIAdapterRASettingDataSharedMIN = zemRASettingDataOfPool<zemRASDKinds::scsi, SHARING_SHARED, ROLE_MIN>;
using zemSCSIAdapterRASettingDataSharedMAX = zemRASettingDataOfPool<zemRASDKinds::scsi, SHARING_SHARED, ROLE_MAX>;
using zemSCSIAdapterRASettingDataSharedDEF = zemRASettingDataOfPool<zemRASDKinds::scsi, SHARING_SHARED, ROLE_DEF>;
using zemSCSIAdapterRASettingDataSharedINC = zemRASettingDataOfPool<zemRASDKinds::scsi, SHARING_SHARED, ROLE_INC>;
using zemSerialAdapterRASettingDataSharedMIN = zemRASettingDataOfPool<zemRASDKinds::serial, SHARING_SHARED, ROLE_MIN>;
using zemSerialAdapterRASettingDataSharedMAX = zemRASettingDataOfPool<zemRASDKinds::serial, SHARING_SHARED, ROLE_MAX>;
using zemSerialAdapterRASettingDataSharedDEF = zemRASettingDataOfPool<zemRASDKinds::serial, SHARING_SHARED, ROLE_DEF>;
using zemSerialAdapterRASettingDataSharedINC = zemRASettingDataOfPool<zemRASDKinds::serial, SHARING_SHARED, ROLE_INC>;
// clang-format on

// --- What a partition has

struct ZEM_EXPORT zemOnLPARRASettingDataCommData : zemResourceRASettingDataCommData {
    ~zemOnLPARRASettingDataCommData() override;

    std::unique_ptr<zemRASD> m_RASD;  ///< what is told of the resource; null: only which it is
};

/// Setting data of one resource of a partition. Its instance ID is that of the resource's RASD. An
/// adapter whose @p id is no slot number, and one whose @p info is none of its kind, gives -1.
///
/// Slots and adapters are told by @p info. Processors and memory are told by the records that hang
/// on the partition, as visitors hang them; where there are none, initialize() asks for those of
/// that partition.
template <const zemRASDKind& kind>
class ZEM_EXPORT zemRASettingDataOnLPAR : public zemRASettingDataOf<kind> {
public:
    using RASettingDataCommData = zemOnLPARRASettingDataCommData;

    void addSpecificProperties(CmpiInstance& instance, const char** properties,
                               const char* className) override;

    RASettingDataCommData m_RASettingData;

protected:
    zemRASettingDataOnLPAR() : zemRASettingDataOf<kind>(&m_RASettingData) {}
};

using zemProcessorRASettingDataOnLPAR = zemRASettingDataOnLPAR<zemRASDKinds::processor>;
using zemMemoryRASettingDataOnLPAR = zemRASettingDataOnLPAR<zemRASDKinds::memory>;
using zemIOSlotRASettingDataOnLPAR = zemRASettingDataOnLPAR<zemRASDKinds::ioSlot>;
using zemEthernetAdapterRASettingDataOnLPAR = zemRASettingDataOnLPAR<zemRASDKinds::ethernet>;
using zemSCSIAdapterRASettingDataOnLPAR = zemRASettingDataOnLPAR<zemRASDKinds::scsi>;
using zemSerialAdapterRASettingDataOnLPAR = zemRASettingDataOnLPAR<zemRASDKinds::serial>;

/// One side of it.
template <const zemRASDKind& kind, zemSettingSide side>
class ZEM_EXPORT zemRASettingDataOnSide : public zemRASettingDataOnLPAR<kind> {
public:
    using zemRASettingDataOnLPAR<kind>::initialize;

    int initialize(const zemString& userName, zemLPAR* lpar, zemCEC* cec,
                   const zemString& profileName, const zemString& id, const zemString& info,
                   int type) override;
};

// clang-format off
using zemProcessorRASettingDataDefined = zemRASettingDataOnSide<zemRASDKinds::processor, SIDE_DEFINED>;
using zemProcessorRASettingDataState = zemRASettingDataOnSide<zemRASDKinds::processor, SIDE_STATE>;
using zemMemoryRASettingDataDefined = zemRASettingDataOnSide<zemRASDKinds::memory, SIDE_DEFINED>;
using zemMemoryRASettingDataState = zemRASettingDataOnSide<zemRASDKinds::memory, SIDE_STATE>;
using zemIOSlotRASettingDataDefined = zemRASettingDataOnSide<zemRASDKinds::ioSlot, SIDE_DEFINED>;
using zemIOSlotRASettingDataState = zemRASettingDataOnSide<zemRASDKinds::ioSlot, SIDE_STATE>;
using zemEthernetAdapterRASettingDataDefined = zemRASettingDataOnSide<zemRASDKinds::ethernet, SIDE_DEFINED>;
using zemEthernetAdapterRASettingDataState = zemRASettingDataOnSide<zemRASDKinds::ethernet, SIDE_STATE>;
using zemSCSIAdapterRASettingDataDefined = zemRASettingDataOnSide<zemRASDKinds::scsi, SIDE_DEFINED>;
using zemSCSIAdapterRASettingDataState = zemRASettingDataOnSide<zemRASDKinds::scsi, SIDE_STATE>;
using zemSerialAdapterRASettingDataDefined = zemRASettingDataOnSide<zemRASDKinds::serial, SIDE_DEFINED>;
using zemSerialAdapterRASettingDataState = zemRASettingDataOnSide<zemRASDKinds::serial, SIDE_STATE>;
// clang-format on

// --- How they are shown; @p properties as for addSpecificProperties()

/// Sets the properties that tell which resource it is; nothing for data that were not filled.
ZEM_EXPORT void zemAddIdentity(CmpiInstance& instance, const char** properties,
                               const zemResourceRASettingDataCommData& data);

/// Sets the properties that @p data tell of a resource of a partition. Numbers that were not set,
/// or do not fit the property, and empty texts stay null.
ZEM_EXPORT void zemAddRASDProperties(CmpiInstance& instance, const char** properties,
                                     const zemRASDCommData& data);

#endif

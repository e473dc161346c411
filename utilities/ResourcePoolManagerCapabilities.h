/// What CIM shows around a pool: which requests it takes (allocation capabilities), what may be
/// taken from it (pool capability), and what its configuration service is and can do.
///
/// Each family has one member a kind of resource, and members differ in words alone. A pool makes
/// them, by the mode in which it is itself made, and owns them (ResourcePoolManagerPool.h). The
/// common properties are set by providers from getData(); there are no others, so that
/// addSpecificProperties() does nothing in any of them.
///
///     zemMemoryAllocationCapabilities capabilities;
///     capabilities.initialize(&pool, &host, userName);
///     puts(capabilities.getData()->m_InstanceID);  // "ORX:D:4-Primordial*1111-AAA*0000001"
///
/// In all of initialize(): the pool must have been initialised, and is only looked at; it and the
/// host are not null; userName is who asks. All return 0, but for pool capabilities.
///
/// Thread-safety: none; an object belongs to the operation that made it.
#ifndef RESOURCE_POOL_MANAGER_CAPABILITIES_H
#define RESOURCE_POOL_MANAGER_CAPABILITIES_H

#include "ResourcePoolManagerSettingData.h"
#include "StringUtils.h"
#include "VirtualSystemRepRASD.h"
#include "ZemExport.h"
#include "cmpidt.h"

class CmpiInstance;
class zemCEC;
class zemResourcePool;

/// What all allocation capabilities tell; the name is spelled as users know it.
struct ZEM_EXPORT zemAllcationCapabilitiesCommData {
    CMPIUint16 m_ResourceType = 0;           ///< zemRASDKind::resourceType
    CMPIUint16 m_RequestTypesSupported = 0;  ///< 3
    CMPIUint16 m_SharingMode = 0;            ///< 3
    zemString m_InstanceID;  ///< "ORX:Shared:" or "ORX:D:", then as that of the pool
    zemString m_Caption;     ///< one text for all three
    zemString m_Description;
    zemString m_ElementName;
};

class ZEM_EXPORT zemResourceAllocationCapabilities {
public:
    zemResourceAllocationCapabilities(const zemResourceAllocationCapabilities&) = delete;
    zemResourceAllocationCapabilities& operator=(const zemResourceAllocationCapabilities&) = delete;

    /// Which kind of resource the capabilities of this class belong to, in any case of letters, by
    /// the numbers of zemResourcePool::getIndexFromClassName(); -1: none.
    static int getIndexFromClassName(const zemString& className, bool isAll);

    zemAllcationCapabilitiesCommData* getData() const { return m_Data; }

    /// The dedicated form for a primordial pool, the shared one for others.
    virtual int initialize(zemResourcePool* pool, zemCEC* cec, const zemString& userName);
    virtual int initializeShare(zemResourcePool* pool, zemCEC* cec, const zemString& userName) = 0;
    virtual int initializeDedicated(zemResourcePool* pool, zemCEC* cec,
                                    const zemString& userName) = 0;
    virtual void addSpecificProperties(CmpiInstance& instance, const char** properties,
                                       const char* className);
    virtual ~zemResourceAllocationCapabilities();

protected:
    /// @param data  of the derived class
    explicit zemResourceAllocationCapabilities(zemAllcationCapabilitiesCommData* data)
        : m_Data(data) {}

    zemAllcationCapabilitiesCommData* m_Data;
};

/// Of one kind.
template <const zemRASDKind& kind>
class ZEM_EXPORT zemAllocationCapabilitiesOf : public zemResourceAllocationCapabilities {
public:
    struct zemAllocationCapabilitiesData : zemAllcationCapabilitiesCommData {};

    zemAllocationCapabilitiesOf();
    int initializeShare(zemResourcePool* pool, zemCEC* cec, const zemString& userName) override;
    int initializeDedicated(zemResourcePool* pool, zemCEC* cec, const zemString& userName) override;

    zemAllocationCapabilitiesData m_AllocationCapabilitiesData;
};

using zemProcessorAllocationCapabilities = zemAllocationCapabilitiesOf<zemRASDKinds::processor>;
using zemMemoryAllocationCapabilities = zemAllocationCapabilitiesOf<zemRASDKinds::memory>;
using zemIOSlotAllocationCapabilities = zemAllocationCapabilitiesOf<zemRASDKinds::ioSlot>;
using zemEthernetAdapterAllocationCapabilities =
    zemAllocationCapabilitiesOf<zemRASDKinds::ethernet>;
using zemSCSIAdapterAllocationCapabilities = zemAllocationCapabilitiesOf<zemRASDKinds::scsi>;
using zemSerialAdapterAllocationCapabilities = zemAllocationCapabilitiesOf<zemRASDKinds::serial>;

/// The group of setting data that says how much may be taken from a pool: the least, the most, what
/// is usual, and the step.
class ZEM_EXPORT zemPoolCapability {
public:
    zemPoolCapability();
    zemPoolCapability(const zemPoolCapability&) = delete;
    zemPoolCapability& operator=(const zemPoolCapability&) = delete;
    virtual ~zemPoolCapability();

    /// @param mode  50: of the setting data only the instance IDs
    /// @return 0; -1 when one of the four could not be told, and the object is of no use
    /// @throws what setting data throw (ResourcePoolManagerSettingData.h)
    virtual int initialize(zemResourcePool* pool, zemCEC* cec, const zemString& userName,
                           int mode) = 0;

    zemResourceRASettingData* m_SettingData[ROLE_INC + 1] = {};  ///< by zemPoolRole; owned
};

/// Of one kind, and of what is taken as dedicated or as shared. Slots and adapters are always
/// taken as shared.
template <const zemRASDKind& kind, zemPoolSharing sharing>
class ZEM_EXPORT zemPoolCapabilitiesOf : public zemPoolCapability {
public:
    int initialize(zemResourcePool* pool, zemCEC* cec, const zemString& userName,
                   int mode) override;
};

/// Of one kind; the pool decides: from a primordial one, resources are taken as dedicated.
template <const zemRASDKind& kind>
class ZEM_EXPORT zemPoolCapabilitiesByPool : public zemPoolCapability {
public:
    int initialize(zemResourcePool* pool, zemCEC* cec, const zemString& userName,
                   int mode) override;
};

using zemProcessorPoolCapabilities = zemPoolCapabilitiesByPool<zemRASDKinds::processor>;
using zemProcessorPoolCapabilitiesShared =
    zemPoolCapabilitiesOf<zemRASDKinds::processor, SHARING_SHARED>;
using zemProcessorPoolCapabilitiesDedicated =
    zemPoolCapabilitiesOf<zemRASDKinds::processor, SHARING_DEDICATED>;
using zemMemoryPoolCapabilities = zemPoolCapabilitiesByPool<zemRASDKinds::memory>;
using zemMemoryPoolCapabilitiesShared = zemPoolCapabilitiesOf<zemRASDKinds::memory, SHARING_SHARED>;
using zemMemoryPoolCapabilitiesDedicated =
    zemPoolCapabilitiesOf<zemRASDKinds::memory, SHARING_DEDICATED>;
using zemIOSlotPoolCapabilities = zemPoolCapabilitiesOf<zemRASDKinds::ioSlot, SHARING_SHARED>;
using zemEthernetAdapterPoolCapabilities =
    zemPoolCapabilitiesOf<zemRASDKinds::ethernet, SHARING_SHARED>;
using zemSCSIAdapterPoolCapabilities = zemPoolCapabilitiesOf<zemRASDKinds::scsi, SHARING_SHARED>;
using zemSerialAdapterPoolCapabilities =
    zemPoolCapabilitiesOf<zemRASDKinds::serial, SHARING_SHARED>;

/// What all configuration capabilities tell.
struct ZEM_EXPORT zemPoolConfigurationCapabilitiesCommData {
    zemString m_InstanceID;  ///< that of the pool
    zemString m_Caption;     ///< one text for all three
    zemString m_Description;
    zemString m_ElementName;
};

class ZEM_EXPORT zemResourcePoolConfigurationCapabilities {
public:
    zemResourcePoolConfigurationCapabilities(const zemResourcePoolConfigurationCapabilities&) =
        delete;
    zemResourcePoolConfigurationCapabilities& operator=(
        const zemResourcePoolConfigurationCapabilities&) = delete;

    zemPoolConfigurationCapabilitiesCommData* getData() const { return m_Data; }

    /// @param mode  has no effect
    virtual int initialize(zemResourcePool* pool, zemCEC* cec, const zemString& userName,
                           int mode) = 0;
    virtual void addSpecificProperties(CmpiInstance& instance, const char** properties,
                                       const char* className);
    virtual ~zemResourcePoolConfigurationCapabilities();

protected:
    /// @param data  of the derived class
    explicit zemResourcePoolConfigurationCapabilities(
        zemPoolConfigurationCapabilitiesCommData* data)
        : m_Data(data) {}

    zemPoolConfigurationCapabilitiesCommData* m_Data;
};

/// Of one kind.
template <const zemRASDKind& kind>
class ZEM_EXPORT zemPoolConfigurationCapabilitiesOf
    : public zemResourcePoolConfigurationCapabilities {
public:
    struct zemPoolConfigurationCapabilitiesData : zemPoolConfigurationCapabilitiesCommData {};

    zemPoolConfigurationCapabilitiesOf();
    int initialize(zemResourcePool* pool, zemCEC* cec, const zemString& userName,
                   int mode) override;

    zemPoolConfigurationCapabilitiesData m_PoolConfigurationCapabilitiesData;
};

using zemProcessorPoolConfigurationCapabilities =
    zemPoolConfigurationCapabilitiesOf<zemRASDKinds::processor>;
using zemMemoryPoolConfigurationCapabilities =
    zemPoolConfigurationCapabilitiesOf<zemRASDKinds::memory>;
using zemIOSlotPoolConfigurationCapabilities =
    zemPoolConfigurationCapabilitiesOf<zemRASDKinds::ioSlot>;
using zemEthernetAdapterPoolConfigurationCapabilities =
    zemPoolConfigurationCapabilitiesOf<zemRASDKinds::ethernet>;
using zemSCSIAdapterPoolConfigurationCapabilities =
    zemPoolConfigurationCapabilitiesOf<zemRASDKinds::scsi>;
using zemSerialAdapterPoolConfigurationCapabilities =
    zemPoolConfigurationCapabilitiesOf<zemRASDKinds::serial>;

/// What all configuration services tell.
struct ZEM_EXPORT zemPoolConfigurationServiceCommData {
    zemString m_Name;                     ///< prefix of the kind, then the host's key
    zemString m_CreationClassName;        ///< as "ORXC_MemoryPoolConfigurationService"
    zemString m_SystemName;               ///< the host's key
    zemString m_SystemCreationClassName;  ///< "ORXC_CEC_CS"
    bool m_Started = true;                ///< a pool's service is always there
    zemString m_Caption;                  ///< one text for both
    zemString m_Description;
};

class ZEM_EXPORT zemResourcePoolConfigurationService {
public:
    zemResourcePoolConfigurationService(const zemResourcePoolConfigurationService&) = delete;
    zemResourcePoolConfigurationService& operator=(const zemResourcePoolConfigurationService&) =
        delete;

    zemPoolConfigurationServiceCommData* getData() const { return m_Data; }

    /// @param mode  has no effect
    virtual int initialize(zemResourcePool* pool, zemCEC* cec, const zemString& userName,
                           int mode) = 0;
    virtual void addSpecificProperties(CmpiInstance& instance, const char** properties,
                                       const char* className);
    virtual ~zemResourcePoolConfigurationService();

protected:
    /// @param data  of the derived class
    explicit zemResourcePoolConfigurationService(zemPoolConfigurationServiceCommData* data)
        : m_Data(data) {}

    zemPoolConfigurationServiceCommData* m_Data;
};

/// Of one kind.
template <const zemRASDKind& kind>
class ZEM_EXPORT zemPoolConfigurationServiceOf : public zemResourcePoolConfigurationService {
public:
    struct zemPoolConfigurationServiceData : zemPoolConfigurationServiceCommData {};

    zemPoolConfigurationServiceOf();
    int initialize(zemResourcePool* pool, zemCEC* cec, const zemString& userName,
                   int mode) override;

    zemPoolConfigurationServiceData m_PoolConfigurationServiceData;
};

using zemProcessorPoolConfigurationService = zemPoolConfigurationServiceOf<zemRASDKinds::processor>;
using zemMemoryPoolConfigurationService = zemPoolConfigurationServiceOf<zemRASDKinds::memory>;
using zemIOSlotPoolConfigurationService = zemPoolConfigurationServiceOf<zemRASDKinds::ioSlot>;
using zemEthernetAdapterPoolConfigurationService =
    zemPoolConfigurationServiceOf<zemRASDKinds::ethernet>;
using zemSCSIAdapterPoolConfigurationService = zemPoolConfigurationServiceOf<zemRASDKinds::scsi>;
using zemSerialAdapterPoolConfigurationService =
    zemPoolConfigurationServiceOf<zemRASDKinds::serial>;

#endif

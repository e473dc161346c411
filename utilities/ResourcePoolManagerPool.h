/// zemResourcePool and its six kinds: how much of a resource a host has, and how it is shared out.
///
/// Pools are made from what hangs on a host by now: which records those are, and how they come
/// there, says zemRPVisitor::readHosts(). Numbers are integers: processors in hundredths of a
/// processing unit, memory in kilobytes, slots and adapters by the piece. A number that would be
/// negative, because the host was read while it changed, is 0.
///
///     zemProcessorPool pool;
///     if (pool.initialize(&host, userName, 1) != -1) {
///         puts(pool.getData()->m_InstanceID);              // "ORX:3-Primordial*1111-AAA*0000001"
///         puts(pool.getSubPool(0)->getData()->m_PoolID);  // "0"
///     }
///
/// A pool owns its sub-pools and all that it carries; getters give what still belongs to it.
///
/// Thread-safety: none; a pool belongs to the operation that made it.
#ifndef RESOURCE_POOL_MANAGER_POOL_H
#define RESOURCE_POOL_MANAGER_POOL_H

#include <cstdint>
#include <memory>
#include <string>
#include <unordered_map>
#include <vector>

#include "DynamicArray.h"
#include "RecordSets.h"
#include "ResourcePoolManagerCapabilities.h"
#include "StringUtils.h"
#include "VirtualSystemRepRASD.h"
#include "VirtualSystemResourceRecords.h"
#include "ZemExport.h"
#include "cmpidt.h"

class CmpiInstance;
class zemCEC;
class zemLPAR;

/// How much of a pool is filled: the key, or everything.
enum initializeLevel { LEVEL_NI = 1, LEVEL_EI = 2 };

/// What all pools tell.
struct ZEM_EXPORT zemPoolCommData {
    zemString m_InstanceID;         ///< "ORX:<resource type>-<pool ID>*<MTMS>"
    CMPIUint16 m_ResourceType = 0;  ///< zemRASDKind::resourceType
    zemString m_PoolID;             ///< "Primordial", or the number of a shared pool
    bool m_Primordial = false;      ///< it is the one that all others are made of
    CMPIUint64 m_Capacity = 0;      ///< can be given out
    zemString m_AllocationUnits;    ///< zemRASDKind::units
};

/// One pool of any kind.
class ZEM_EXPORT zemResourcePool {
public:
    zemResourcePool(const zemResourcePool&) = delete;
    zemResourcePool& operator=(const zemResourcePool&) = delete;

    /// How many pools of the kind @p cec has: below 2, the primordial one alone; -1: the host's
    /// records have not been read.
    virtual int getPoolNum(zemCEC* cec, const zemString& userName) = 0;

    /// Makes this the primordial pool of @p cec, with a sub-pool for each shared pool.
    /// @param userName  who asks; setting data may run tools as that user
    /// @param mode  what the pools tell besides their keys, and what they carry. Mind that 0 and 1
    ///        stand the other way round than in VMVisitorType.
    ///
    ///        mode    tell        this pool carries               sub-pools carry
    ///        0
    ///        1       everything
    ///        34      everything  setting data, dedicated         setting data, shared
    ///        50                  the same, instance IDs alone    the same, instance IDs alone
    ///        36, 52              configuration capabilities      allocation capabilities
    ///        40, 56              configuration service           allocation capabilities
    ///        others              allocation capabilities         allocation capabilities
    ///
    /// @return 0; -1 when getPoolNum() gave that, and nothing has been made then
    /// @throws zemInvalidParameterException "Pool ID : <id>": where pools tell everything, a
    ///         partition names a shared pool of processors that the host does not list
    /// @throws what setting data throw (ResourcePoolManagerSettingData.h)
    virtual int initialize(zemCEC* cec, const zemString& userName, int mode);

    /// Whether pools tell everything in a mode.
    static bool isQuantified(int mode);

    /// One step of initialize(): this pool itself; one sub-pool, which is appended. Of a kind
    /// without shared pools, the latter does nothing. Both return 0, and -1 for a null @p resource.
    /// @param resource  the record of a shared pool of @p cec, of the class that the kind names
    virtual int initializePrimordial(zemCEC* cec, initializeLevel level) = 0;
    virtual int initializeShare(zemCEC* cec, const zemHardwareResource* resource,
                                initializeLevel level);

    /// The same for each shared pool that @p cec has. Returns 0.
    int initializeAllShare(zemCEC* cec, initializeLevel level);

    virtual ~zemResourcePool();

    /// What initialize() has made the pool carry; null what it has not. The capability is the first
    /// of getPoolCapability(), which holds null for one that could not be told.
    virtual zemPoolCapability* getCapability();
    virtual zemResourceAllocationCapabilities* getAlloCapShared();
    virtual zemResourceAllocationCapabilities* getAlloCapDedicated();
    virtual zemResourcePoolConfigurationCapabilities* getPoolConfCap();
    virtual zemResourcePoolConfigurationService* getPoolConfService();
    virtual zemDynamicArray<zemPoolCapability>& getPoolCapability();

    /// Sets those properties of @p instance that only this kind of pool has and @p properties
    /// lists, ignoring case; a null or empty list has every name.
    /// @param className  the class of @p instance
    virtual void addSpecificProperties(CmpiInstance& instance, const char** properties,
                                       const char* className) = 0;

    /// Which kind of resource a class belongs to, in any case of letters: 0 processor, 1 memory,
    /// 2 I/O slot, 3 Ethernet, 4 serial, 5 SCSI; -1: none.
    /// @param isAll  false: logical devices are looked for, as "ORXC_Memory"; true: pools and what
    ///        is around them, as "ORXC_MemoryPoolConfigurationService", and not devices
    static int getIndexFromClassName(const zemString& className, bool isAll);

    int getSubPoolSize() const { return m_Pools.size(); }
    zemResourcePool* getSubPool(int index) const { return m_Pools.getElementAt(index); }

    /// What the pool tells; what only its kind tells stands in a member of the kind's class.
    zemPoolCommData* getData() const { return m_Data; }

    bool isPrimordial() const;

    /// An instance ID of something around this pool: "<prefix><resource type>-<pool ID>*<MTMS>".
    zemString formInstanceID(const char* prefix, const zemString& mtms) const;

protected:
    /// @param data  of the derived class
    zemResourcePool(zemPoolCommData* data, const zemRASDKind& kind);

    /// Fills the key; with LEVEL_EI, besides, whether the pool is primordial, and the units.
    void tellKey(const zemString& poolID, const zemString& mtms, initializeLevel level);

    /// The records of the shared pools of @p cec; none.
    virtual std::vector<const zemHardwareResource*> shares(zemCEC& cec) const;

    zemDynamicArray<zemResourcePool> m_Pools;
    zemPoolCommData* m_Data;
    zemPoolCapability* m_Capability = nullptr;  ///< the first of m_PoolCapabilities
    std::unique_ptr<zemResourceAllocationCapabilities> m_AllocationCapabilitiesShared;
    std::unique_ptr<zemResourceAllocationCapabilities> m_AllocationCapabilitiesDedicated;
    std::unique_ptr<zemResourcePoolConfigurationCapabilities> m_PoolConfigurationCapabilities;
    std::unique_ptr<zemResourcePoolConfigurationService> m_PoolConfigurationService;
    zemDynamicArray<zemPoolCapability> m_PoolCapabilities;

private:
    void drop();
    void carry(zemCEC& cec, const zemString& userName, int mode);

    const zemRASDKind& m_kind;
};

/// What the partitions of a pool of processors hold, in hundredths of a unit.
struct ZEM_EXPORT zemProcessorPoolMembers {
    std::int64_t most = 0;  ///< that they may
    std::int64_t now = 0;
    std::int64_t then = 0;      ///< after pending changes
    std::int64_t mostIdle = 0;  ///< the larger of both, of the one that holds most and does not run
};

/// What the tool "qyalloc" tells of a host's processors, asked once for all of its pools.
struct ZEM_EXPORT zemResourceRASettingDataResource {
    bool isInitialized = false;
    float min_proc_units_per_virtual_proc = 0;

    /// A record for each partition, keyed by ProcessorResourceAttribute::LparLevelAttribute of
    /// zemQyallocCmdCaller, and for each shared pool, by PoolLevelAttribute.
    zemRecordSetsType m_results_processor_lpar;
    zemRecordSetsType m_results_processor_pool;

    /// What is held in each pool, by its ID, as the model tells it; empty until setting data of one
    /// of the pools count it for all.
    std::unordered_map<std::string, zemProcessorPoolMembers> m_members;
};

/// Processors. Capacity and what is held are read in single precision, as the appliance's other
/// users do: 0.53 units are 52 hundredths of capacity.
class ZEM_EXPORT zemProcessorPool : public zemResourcePool {
public:
    struct zemProcPoolData : zemPoolCommData {
        CMPIUint64 m_Reserved = 0;  ///< held by active partitions
        CMPIUint64 m_InstalledCapacity = 0;
        CMPIUint16 m_InstalledCapacityType = 0;  ///< 0: there is no installed capacity to tell
        zemString m_ProcCompatModes;             ///< as zemCECCapability has them
        zemString m_Caption;
        zemString m_Description;
    };

    zemProcessorPool();
    ~zemProcessorPool() override;

    int getPoolNum(zemCEC* cec, const zemString& userName) override;
    int initializePrimordial(zemCEC* cec, initializeLevel level) override;

    /// @param resource  a zemProcessorPoolResource
    /// @throws zemInvalidParameterException as initialize()
    int initializeShare(zemCEC* cec, const zemHardwareResource* resource,
                        initializeLevel level) override;
    void addSpecificProperties(CmpiInstance& instance, const char** properties,
                               const char* className) override;

    /// Fills infoRASD unless it is filled: three runs of "qyalloc".
    /// @param mtms  key of the host
    /// @throws what queries throw (CommandCaller.h), in the name of this operation
    void initRASDInfo(const zemString& userName, const zemString& mtms);

    /// The shared pool that a partition names: the one that it aims at, which its setting data tell
    /// too, or else the one in effect; empty for dedicated processors.
    static zemString poolIDOf(const zemPartitionProcessorResource& record);

    zemProcPoolData m_ProcPoolData;

    /// Of a sub-pool, that of the pool to which it belongs.
    zemResourceRASettingDataResource& infoRASD;

protected:
    std::vector<const zemHardwareResource*> shares(zemCEC& cec) const override;

private:
    explicit zemProcessorPool(zemResourceRASettingDataResource& info);
    void countActive(zemCEC& cec);

    zemResourceRASettingDataResource m_ownInfo;

    /// Units that active partitions hold, by the shared pool that they name.
    std::unordered_map<std::string, float> m_activeLpar;
    bool m_isActiveCounted = false;
};

/// Memory. A host has one shared pool at most, whose number is 0.
class ZEM_EXPORT zemMemoryPool : public zemResourcePool {
public:
    struct zemMemoryPoolData : zemPoolCommData {
        CMPIUint64 m_Reserved = 0;  ///< held by active partitions, by pools and by the host itself
        zemString m_ElementName;
        zemString m_Caption;
        zemString m_Description;
        CMPIUint64 m_InstalledCapacity = 0;
    };

    zemMemoryPool();
    ~zemMemoryPool() override;

    int getPoolNum(zemCEC* cec, const zemString& userName) override;
    int initializePrimordial(zemCEC* cec, initializeLevel level) override;

    /// @param resource  a zemMemoryPoolResource
    int initializeShare(zemCEC* cec, const zemHardwareResource* resource,
                        initializeLevel level) override;
    void addSpecificProperties(CmpiInstance& instance, const char** properties,
                               const char* className) override;

    zemMemoryPoolData m_MemoryPoolData;
    zemMemoryPoolResource m_MemoryPoolResourceData;  ///< of a shared pool
    bool m_isReserved = false;                       ///< m_Reserved has been told
    bool m_isInstallCapacity = false;                ///< m_InstalledCapacity has been told

protected:
    std::vector<const zemHardwareResource*> shares(zemCEC& cec) const override;
};

/// I/O slots, of which a host has so many; virtual adapters, which are made as partitions ask for
/// them, so that the pool holds those that there are. These have no shared pools.
template <const zemRASDKind& kind>
class ZEM_EXPORT zemPlainPool : public zemResourcePool {
public:
    struct zemPlainPoolData : zemPoolCommData {
        CMPIUint64 m_Reserved = 0;  ///< partitions have
        zemString m_Caption;
        zemString m_Description;
    };

    zemPlainPool();
    ~zemPlainPool() override;

    int getPoolNum(zemCEC* cec, const zemString& userName) override;
    int initializePrimordial(zemCEC* cec, initializeLevel level) override;
    void addSpecificProperties(CmpiInstance& instance, const char** properties,
                               const char* className) override;

    zemPlainPoolData m_PoolData;
};

using zemIOSlotPool = zemPlainPool<zemRASDKinds::ioSlot>;
using zemEthernetAdapterPool = zemPlainPool<zemRASDKinds::ethernet>;
using zemSerialAdapterPool = zemPlainPool<zemRASDKinds::serial>;
using zemSCSIAdapterPool = zemPlainPool<zemRASDKinds::scsi>;

extern template class zemPlainPool<zemRASDKinds::ioSlot>;
extern template class zemPlainPool<zemRASDKinds::ethernet>;
extern template class zemPlainPool<zemRASDKinds::serial>;
extern template class zemPlainPool<zemRASDKinds::scsi>;

#endif

/// The systems of the model: zemCEC, one managed host, and zemLPAR, one of its partitions.
///
/// A host owns its partitions, pools and hardware records; a partition owns the settings that it
/// runs with (one VSSD), those of each of its profiles (one VSSD each), and its hardware records.
/// Visitors make and fill them; zemLPAR::initialize() fills a partition by itself. Every field is a
/// copy of what the appliance told then: nothing refreshes it.
///
///     zemCEC host(mtms, systemName);
///     auto partition = std::make_unique<zemLPAR>(mtms, "3");
///     partition->initialize(&host, user, "ORXC_ProcessorRASettingData", VISITOR_TYPE_RASD_INIT);
///     host.addLpar(partition.release());
///
/// Almost all fields are texts, and the same text whoever told them: setters that take the
/// management library's numbers store the tools' words for them. What names a pointer in an add or
/// in an array hands the object over; getters give what still belongs to the object.
///
/// Thread-safety: none; hosts and partitions belong to one operation. They are not copied: a copy
/// would take the owned objects away from the original.
#ifndef VIRTUAL_SYSTEM_REP_SYSTEM_H
#define VIRTUAL_SYSTEM_REP_SYSTEM_H

#include <memory>

#include "DynamicArray.h"
#include "HashTable.h"
#include "RecordSets.h"
#include "StringUtils.h"
#include "VirtualSystemFields.h"
#include "VirtualSystemRepVSSD.h"
#include "VirtualSystemResource.h"
#include "VirtualSystemVisitorType.h"
#include "ZemExport.h"

class zemCEC;
class zemLPAR;
class zemResourcePool;
class zemVirtualSystem;

/// Hosts by key and partitions of one host by number; the objects are not the table's. Made with 8
/// chains.
typedef zemHashTable<zemString, zemCEC*, cecHashFunc> zemcecHashType;
typedef zemHashTable<zemString, zemLPAR*, lparHashFunc> zemLparHashType;

/// A logical device of a system. The library makes none; the provider libraries derive theirs.
class ZEM_EXPORT zemLogicalDevice {
public:
    virtual ~zemLogicalDevice();
};

/// What a system is capable of; hosts and partitions each derive their own.
struct ZEM_EXPORT zemCSCapability {};

struct ZEM_EXPORT zemComputerSystemData {
    zemString m_MTMS;  ///< key of the host
};

/// What hosts and partitions are alike in. The library itself fills none of it.
class ZEM_EXPORT zemComputerSystem {
public:
    zemComputerSystem() = default;
    zemComputerSystem(const zemComputerSystem&) = delete;
    zemComputerSystem& operator=(const zemComputerSystem&) = delete;
    virtual ~zemComputerSystem();

protected:
    /// Appends @p element, which belongs to @p array from here on, also when there is no room.
    template <class Element>
    static void own(zemDynamicArray<Element>& array, Element* element) {
        array.addElement(std::unique_ptr<Element>(element));
    }

    zemDynamicArray<zemLogicalDevice> m_LDs;
    zemCSCapability m_Capability;
    zemComputerSystemData m_Data;
};

/// What a host is capable of. "GlvExCaps" is the management library's list of capability words;
/// "word 1, 32" is the bit of value 32 in the second of them. The names of attributes are the
/// tools'.
struct ZEM_EXPORT zemCECCapability : zemCSCapability {
    int m_maxLpars = -1;                         ///< most partitions; -1 unknown
    bool m_activeLparMobilityCapable = false;    ///< word 1, 32; "active_lpar_mobility_capable"
    bool m_inactiveLparMobilityCapable = false;  ///< word 1, 64; "inactive_lpar_mobility_capable"
    bool m_virtualIoServerCapable = false;       ///< word 0, 8; "virtual_io_server_capable"
    bool m_virtualSwitchCapable = false;         ///< word 1, 1; "virtual_switch_capable"

    /// Word 2, 16 as "1" or "0"; or the list of modes itself, "lpar_proc_compat_modes". Readers ask
    /// whether it is empty, which it is until a host's capabilities are set.
    zemString m_lparProcCompatModes;

    /// Word 0, 64, and bit 30 of "RuntimeCapability"; "osq00_capable".
    bool m_osq00Capable = false;
    bool m_electronicErrReportingCapable = false;     ///< not told by the words
    bool m_redundantErrPathReportingCapable = false;  ///< word 0, 32
    bool m_lheaCapable = false;                       ///< not told by the words
    int m_maxMemPools = -1;                           ///< see zemCEC::getMaxMemPools()
    int m_maxProcPools = -1;                          ///< see zemCEC::getMaxProcPools()

    /// Word 5, 16; then "lpar_suspend_capable".
    bool m_lparSuspendCapable = false;
    bool m_lparRemoteRestartCapable = false;         ///< "coralhv_lpar_remote_restart_capable"
    bool m_activeMemorySharingCapable = false;       ///< "active_mem_sharing_capable"
    int m_maxNumberOfSuspendCapableLpars = 0;        ///< "max_suspend_capable_lpars"
    int m_maxNumberOfRemoteRestartCapableLpars = 0;  ///< "max_remote_restart_capable_lpars"
};

/// What a partition is capable of.
struct ZEM_EXPORT zemLPARCapability : zemCSCapability {
    bool m_dlparMemCapable = false;       ///< memory can change while it runs; "qydyn"
    bool m_dlparProcCapable = false;      ///< processors
    bool m_dlparIOCapable = false;        ///< slots and adapters
    bool m_suspendCapable = false;        ///< "suspend_capable"
    bool m_remoteRestartCapable = false;  ///< "remote_restart_capable"
};

/// One managed host.
class ZEM_EXPORT zemCEC : public zemComputerSystem {
public:
    zemCEC();
    zemCEC(const zemString& mtms, const zemString& systemName);
    ~zemCEC() override;

    /// Stores the words for the library's number @p code, as "Operating"; "" for one without words.
    void setStatePlus(const zemString& code);

    /// What the host is capable of; null sets nothing.
    zemCECCapability& getCapability() { return m_capability; }
    void setCapability(const zemCECCapability* capability);

    /// Takes the capabilities from the library's words.
    /// @param exCaps  "GlvExCaps": decimal words in brackets with commas between them; words that
    ///        are not there, and what is no number, are 0, and those behind the 32nd do not count
    /// @param runtimeCap  "RuntimeCapability", a decimal number of 64 bits
    void setCapability(const zemString& exCaps, const zemString& runtimeCap);

    /// Takes what @p record holds of six attributes of zemQyplatCmdCaller::ManagedSystemAttribute:
    /// mobility of active and of inactive partitions, I/O servers, virtual switches, compatibility
    /// modes, osq00. Others, and those that the record lacks, stay as they are.
    void setCapability(const zemRecordType& record);

    /// One of these six attributes as the tool writes it; "" for another number.
    zemString getType(int attribute) const;

    /// Takes the tool's attributes of suspending and restarting; of flags, 0 is false.
    void setSuspendRRCapableAttributes(int maxSuspendLpars, int maxRemoteRestartLpars,
                                       int suspendCapable, int remoteRestartCapable,
                                       int activeMemorySharingCapable);

    /// How many pools of shared memory and of shared processors the host may have. The first call
    /// asks the tool "qyalloc" under the process's own user; the answer is kept unless it is -1.
    /// A tool without a record says 0.
    /// @throws what queries throw (QyallocCmdCaller.h)
    int getMaxMemPools();
    int getMaxProcPools();

    zemDynamicArray<zemResourcePool>& getRPs() { return m_RPs; }

    /// The partitions. Who adds or removes some calls setLparHashState(false).
    zemDynamicArray<zemLPAR>& getLPARs() { return m_LPARs; }
    void addLpar(zemLPAR* lpar);

    /// A copy of the table of partitions by number, which is made first unless its state is true;
    /// of two with one number the first counts.
    zemLparHashType getLparHashMapping();
    void setLparHashState(bool isHashed) { m_isLparHashed = isHashed; }

    /// A partition that stands for the host's resources as a whole; null until it is built, for
    /// which one that is there already counts. It lives until it is released, even without the
    /// host.
    zemLPAR* getVirtualLpar() const { return m_VirtualLpar; }
    void setVirtualLpar(zemLPAR* lpar) { m_VirtualLpar = lpar; }
    void buildupVirtualLpar();
    void releaseVirtualLpar();

    /// Processors and memory of the host, and what of them is for its pools. Two getters are
    /// spelled as providers know them.
    const zemSystemProcessorResource& getProcessor() const { return m_SysProcessor; }
    void setProcessor(const zemSystemProcessorResource& record) { m_SysProcessor = record; }
    const zemPoolProcessorResource& getPoolProcessor() const { return m_PoolProcessor; }
    void setPoolProcessor(const zemPoolProcessorResource& record) { m_PoolProcessor = record; }
    const zemSystemMemoryResource& getMemoy() const { return m_SysMemory; }
    void setMemory(const zemSystemMemoryResource& record) { m_SysMemory = record; }
    const zemMemoryPoolResource& getMemoyPool() const { return m_MemoryPool; }
    void setMemoryPool(const zemMemoryPoolResource& record) { m_MemoryPool = record; }

    /// The pools of shared processors, and the one with a number.
    /// @throws zemInvalidParameterException there is none with this number
    zemDynamicArray<zemProcessorPoolResource>& getProcessorPool() { return m_ProcessorPool; }
    zemProcessorPoolResource& getProcessorPool(const zemString& poolId) const;
    void addProcessorPool(zemProcessorPoolResource* pool) { own(m_ProcessorPool, pool); }

private:
    zemDynamicArray<zemResourcePool> m_RPs;
    zemDynamicArray<zemLPAR> m_LPARs;
    zemLPAR* m_VirtualLpar = nullptr;
    zemLparHashType m_lparHash;
    bool m_isLparHashed = false;
    zemSystemProcessorResource m_SysProcessor;
    zemPoolProcessorResource m_PoolProcessor;
    zemDynamicArray<zemProcessorPoolResource> m_ProcessorPool;
    zemSystemMemoryResource m_SysMemory;
    zemMemoryPoolResource m_MemoryPool;
    ZEM_FIELD(zemString, m_MTMS, MTMS);              ///< key "<type model>*<serial number>"; "Name"
    ZEM_FIELD(zemString, m_SystemName, SystemName);  ///< user's name; "UserDefinedName"
    ZEM_FIELD(zemString, m_state, State);            ///< as "Operating"; "State"
    ZEM_FIELD(zemString, m_PrimaryFSPIP, PrimaryFSPIP);  ///< service processor; "PrimaryFSP_IP"
    ZEM_FIELD(zemString, m_BackupFSPIP, BackupFSPIP);    ///< the second one; "BackupFSP_IP"
    zemCECCapability m_capability;
    ZEM_FIELD(int, m_IOSlotCount, IOSlotCount);  ///< slots, free ones too; -1: not read
};

// A text of a partition: its getter, the member, and a setter that stores the text as it is, or one
// that the class defines.
#define ZEM_LPAR_TEXT(MEMBER, NAME)                                      \
public:                                                                  \
    void set##NAME(zemString value) { this->MEMBER = std::move(value); } \
    ZEM_LPAR_GETTER(MEMBER, NAME)
#define ZEM_LPAR_TRANSLATED(MEMBER, NAME)   \
public:                                     \
    void set##NAME(const zemString& value); \
    ZEM_LPAR_GETTER(MEMBER, NAME)
#define ZEM_LPAR_GETTER(MEMBER, NAME)           \
    const zemString& get##NAME() const {        \
        validatePropertyValue(#MEMBER, MEMBER); \
        return MEMBER;                          \
    }                                           \
                                                \
private:                                        \
    zemString MEMBER = zemString("zemNULL")

/// One partition. Texts that nobody has set yet are "zemNULL".
///
/// Where a field names a property of the management library, its setter takes the property's value
/// and stores the word that the tools have for it; other setters store what they get. What is no
/// number, or none that has a word, is told at the field.
class ZEM_EXPORT zemLPAR : public zemComputerSystem {
public:
    explicit zemLPAR(const zemString& lparid);
    zemLPAR(const zemString& mtms, const zemString& lparid);

    /// @param state,osType,keylock  as the fields hold them: the tools' words
    zemLPAR(const zemString& mtms, const zemString& lparid, const zemString& name,
            const zemString& state, const zemString& defaultprofile, const zemString& current,
            const zemString& osType, const zemString& keylock);
    ~zemLPAR() override;

    /// Fills the partition from the back end: its state and its profiles' names, the state VSSD,
    /// and one defined VSSD more for each profile. A partition without a current profile runs with
    /// its default one.
    /// @param cec  the partition's host
    /// @param className  the class of the setting data wanted, as "ORXC_ProcessorRASettingData"
    /// @param type  one of four values of VMVisitorType; any other does nothing.
    ///        VISITOR_TYPE_VSSD_INIT: VSSDs in full, and the partition's name, type and keylock.
    ///        VISITOR_TYPE_VSSD_INIT_NI: VSSDs of which only the names are told.
    ///        VISITOR_TYPE_RASD_INIT, VISITOR_TYPE_RASD_INIT_NI: VSSDs with the setting data of
    ///        the class, for which lists of adapters are asked for once a list, and, for the
    ///        former, records of processors or memory that do not hang here
    ///        (zemRASettingDataOnLPAR).
    /// @return 0
    /// @throws what the objects of SystemConfig.h and the query of profiles throw; what was filled
    ///         up to then stays
    int initialize(zemCEC* cec, const zemString& userName, const zemString& className, int type);

    /// False only when the state contains "Not Activated".
    bool isActivated() const;

    /// The key "<number>*<key of the host>".
    zemString getLparIDAndMTMS() const;

    /// Stores the word for the number @p code of "PartitionState"; "" for one without a word.
    void setStatePlus(const zemString& code);

    /// The state of a migration as zemVirtualSystem::getMigrationState() numbers it, 0 unknown.
    int getMigrationState() const { return m_migrationState; }

    /// @param isApiNumber  @p state is the library's "MigrationState" rather than such a number
    void setMigrationState(int state, bool isApiNumber);

    /// Takes the tool's text, in any case of letters; null is unknown.
    void setMigrationState(const char* text);

    zemLPARCapability& getCapability() { return m_capability; }
    void setCapability(const zemLPARCapability& capability) { m_capability = capability; }
    void setSuspendCapable(int value) { m_capability.m_suspendCapable = value != 0; }
    void setRRCapable(int value) { m_capability.m_remoteRestartCapable = value != 0; }

    /// The settings that the partition runs with. Setting them copies all fields of @p vssd, and
    /// takes over its RASDs and setting data if it owns them: it keeps pointers to read.
    zemVSSD& getStateVSSD() { return m_stateVSSD; }
    void setStateVSSD(zemVSSD& vssd);

    /// The settings of each profile.
    zemDynamicArray<zemVSSD>& getDefinedVSSDs() { return m_definedVSSD; }
    void addDefinedVSSD(zemVSSD* vssd) { own(m_definedVSSD, vssd); }

    /// Processors and memory, and whether there has been a record of each.
    const zemPartitionProcessorResource& getLparProcessor() const { return m_LparProcessor; }
    void setLparProcessor(zemPartitionProcessorResource record);
    bool isLparProcessorAvailable() const { return m_isLparProcAvailable; }
    const zemPartitionMemoryResource& getLparMemory() const { return m_LparMemory; }
    void setLparMemory(zemPartitionMemoryResource record);
    bool isLparMemoryAvailable() const { return m_isLparMemAvailable; }

    /// Records of the profiles, of slots and of virtual adapters.
    zemDynamicArray<zemPartitionProfileConfiguration>& getLparProfile() { return m_LparProfile; }
    zemDynamicArray<zemPartitionIOSlotResource>& getLparIOSlots() { return m_LparIOSlot; }
    zemDynamicArray<zemPartitionSerialAdapterResource>& getLparSerialAdapters() {
        return m_LparSerialAdapter;
    }
    zemDynamicArray<zemPartitionSCSIAdapterResource>& getLparSCSIAdapters() {
        return m_LparSCSIAdapter;
    }
    zemDynamicArray<zemPartitionEthernetAdapterResource>& getLparEthernetAdapters() {
        return m_LparEthernetAdapter;
    }
    void addLparProfile(zemPartitionProfileConfiguration* record) { own(m_LparProfile, record); }
    void addLparIOSlot(zemPartitionIOSlotResource* record) { own(m_LparIOSlot, record); }
    void addLparSerialAdapter(zemPartitionSerialAdapterResource* record) {
        own(m_LparSerialAdapter, record);
    }
    void addLparSCSIAdapter(zemPartitionSCSIAdapterResource* record) {
        own(m_LparSCSIAdapter, record);
    }
    void addLparEthernetAdapter(zemPartitionEthernetAdapterResource* record) {
        own(m_LparEthernetAdapter, record);
    }

private:
    /// Each getter of a text passes by here, with the name of the member; nothing is checked yet.
    void validatePropertyValue(const char* /*name*/, const zemString& /*value*/) const {}

    zemLPARCapability m_capability;

    ZEM_LPAR_TEXT(m_MTMS, MTMS);          ///< key of the host
    ZEM_LPAR_TEXT(m_lparID, LparID);      ///< number, the partition's key within the host
    ZEM_LPAR_TEXT(m_lparName, LparName);  ///< user's name; "UserDefinedName"
    ZEM_LPAR_TEXT(m_state, State);        ///< as "Not Activated"

    /// Names of profiles: the default one, "Default_prof", and the one last activated, "Curr_prof".
    /// The setters take the name behind the number in "<n>,<name>"; "" when there is no such
    /// number.
    ZEM_LPAR_TRANSLATED(m_defaultProfileName, DefaultProfileName);
    ZEM_LPAR_TRANSLATED(m_currentProfileName, CurrentProfileName);

    /// "tmxlinux", "xbrgserver" or "osq00"; "DefinitionState", of which other numbers set nothing.
    ZEM_LPAR_TRANSLATED(m_virtualSystemType, VirtualSystemType);

    ZEM_LPAR_TRANSLATED(m_keylock, KeyLock);    ///< "norm", "manual"; "Keylock", others as they are
    ZEM_LPAR_TRANSLATED(m_bootMode, BootMode);  ///< as "norm"; "BootMode", "unknow" for others
    int m_migrationState = 0;

    /// Compatibility mode in effect, as "CORAL7"; "ActualProcCompatMode", "unknown" for others.
    ZEM_LPAR_TRANSLATED(m_CurrLparProcCompatMode, CurrLparProcCompatMode);

    /// "0", "1" or "unavailable"; "RedundantPath", of which "null" is "unavailable".
    ZEM_LPAR_TRANSLATED(m_REDUNDANT_ERR_PATH_REPORTING, RedundantErrPathReporting);

    /// Compatibility mode asked for; "ProcCompatMode", in the words of the one in effect.
    ZEM_LPAR_TRANSLATED(m_DesiredLparProcCompatMode, DesiredLparProcCompatMode);

    ZEM_LPAR_TRANSLATED(m_AutoStart,
                        AutoStart);  ///< "PowerOnWithHypervisor", of which "null" is "0"
    ZEM_LPAR_TEXT(m_hibrLostConn, HibrLostConn);   ///< reserved
    ZEM_LPAR_TEXT(m_remoteRestartState, RRState);  ///< "remote_restart_status"

    zemVSSD m_stateVSSD;
    zemDynamicArray<zemVSSD> m_definedVSSD;
    zemDynamicArray<zemPartitionProfileConfiguration> m_LparProfile;
    zemPartitionProcessorResource m_LparProcessor;
    zemPartitionMemoryResource m_LparMemory;
    zemDynamicArray<zemPartitionIOSlotResource> m_LparIOSlot;
    zemDynamicArray<zemPartitionSerialAdapterResource> m_LparSerialAdapter;
    zemDynamicArray<zemPartitionSCSIAdapterResource> m_LparSCSIAdapter;
    zemDynamicArray<zemPartitionEthernetAdapterResource> m_LparEthernetAdapter;
    bool m_isLparProcAvailable = false;
    bool m_isLparMemAvailable = false;
};

#undef ZEM_LPAR_TEXT
#undef ZEM_LPAR_TRANSLATED
#undef ZEM_LPAR_GETTER

#endif

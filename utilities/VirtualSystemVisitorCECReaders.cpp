#include <cstddef>
#include <iterator>
#include <memory>
#include <utility>

#include "DNXApiCaller.h"
#include "NumberText.h"
#include "VirtualSystemVisitorCEC.h"
#include "VirtualSystemVisitorReaders.h"

namespace {

using Lpar = zemLPAR;
using Profile = zemPartitionProfileConfiguration;
using Processor = zemPartitionProcessorResource;
using Memory = zemPartitionMemoryResource;
using Slot = zemPartitionIOSlotResource;
using Serial = zemPartitionSerialAdapterResource;
using Scsi = zemPartitionSCSIAdapterResource;
using Ethernet = zemPartitionEthernetAdapterResource;
using SysProcessor = zemSystemProcessorResource;
using PoolProcessor = zemPoolProcessorResource;
using ProcessorPool = zemProcessorPoolResource;
using SysMemory = zemSystemMemoryResource;
using MemoryPool = zemMemoryPoolResource;

/// One row of a reader's table: a property, and what of the record it fills. Few take other
/// properties besides. Rows stand in the order in which the library tells the properties, which it
/// finds fastest so.
template <class Record>
using Field = zemApiField<void (*)(Record&, const zemApiProp& object, const char* key)>;

template <auto setter, class Record>
void set(Record& record, const zemApiProp& object, const char* key) {
    (record.*setter)(object.getProperty(key));
}

template <class Record>
void fill(Record& record, const zemApiProp& object, const Field<Record>* fields,
          std::size_t count) {
    for (std::size_t i = 0; i < count; ++i) {
        fields[i].set(record, object, fields[i].key);
    }
}

constexpr Field<PoolProcessor> kPoolProcessor[] = {
    {"ConfigurableProcUnits", set<&PoolProcessor::setConfigurablePoolProcUnits>},
    {"PendAvailProcUnits", set<&PoolProcessor::setPendAvailPoolProcUnits>},
};

constexpr Field<zemCEC> kHost[] = {
    {"Name", set<&zemCEC::setMTMS>},
    {"UserDefinedName", set<&zemCEC::setSystemName>},
    {"State", set<&zemCEC::setStatePlus>},
    {"PrimaryFSP_IP", set<&zemCEC::setPrimaryFSPIP>},
    {"BackupFSP_IP", set<&zemCEC::setBackupFSPIP>},
    {"GlvExCaps",
     [](zemCEC& host, const zemApiProp& object, const char* key) {
         host.setCapability(object.getProperty(key), object.getProperty("RuntimeCapability"));
     }},
    // of the processors that a host's shared pools are made of
    {"ConfigurableProcUnits",
     [](zemCEC& host, const zemApiProp& object, const char* /*key*/) {
         PoolProcessor pools(host.getMTMS());
         fill(pools, object, kPoolProcessor, std::size(kPoolProcessor));
         host.setPoolProcessor(pools);
     }},
};

/// All that is read below Level_All.
constexpr Field<Lpar> kLparState[] = {{"PartitionState", set<&Lpar::setStatePlus>}};

constexpr Field<Lpar> kLpar[] = {
    {"UserDefinedName", set<&Lpar::setLparName>},
    {"DefinitionState", set<&Lpar::setVirtualSystemType>},
    {"PartitionState", set<&Lpar::setStatePlus>},
    {"BootMode", set<&Lpar::setBootMode>},
    {"MigrationState",
     [](Lpar& lpar, const zemApiProp& object, const char* key) {
         lpar.setMigrationState(zemWholeNumberOf(object.getProperty(key)), true);
     }},
    {"Default_prof", set<&Lpar::setDefaultProfileName>},
    {"Curr_prof", set<&Lpar::setCurrentProfileName>},
    {"Keylock", set<&Lpar::setKeyLock>},
    {"RedundantPath", set<&Lpar::setRedundantErrPathReporting>},
    {"ProcCompatMode", set<&Lpar::setDesiredLparProcCompatMode>},
    {"ActualProcCompatMode", set<&Lpar::setCurrLparProcCompatMode>},
    {"PowerOnWithHypervisor", set<&Lpar::setAutoStart>},
};

constexpr Field<Profile> kProfile[] = {
    {"UserDefinedName", set<&Profile::setProfileName>},
    {"SFPSurveillance", set<&Profile::setConnMonitoring>},
    {"lpar_env", set<&Profile::setLparEnv>},
    {"lpar_name", set<&Profile::setLparName>},
    {"AutoIPLEnabled", set<&Profile::setAutoStart>},
    {"MaxVirtualSlots", set<&Profile::setMaxVirtualSlots>},
    {"BootMode", set<&Profile::setBootMode>},
    {"RedundantPath", set<&Profile::setRedundantErrPathReporting>},
    {"ProcMode",
     [](Profile& profile, const zemApiProp& object, const char* key) {
         const zemString mode = object.getProperty(key);
         profile.setProcMode(mode);
         profile.setLparProcCompatMode(object.getProperty("ProcessorMode"));
         const zemString sharing = object.getProperty("SharingMode");
         profile.setSharingMode(mode, object.getProperty("DonorMode"), sharing);
     }},
    {"UncappedWeight", set<&Profile::setUncapWeight>},
    {"MinProcUnit", set<&Profile::setMinProcsUnits>},
    {"DesiredProcUnit", set<&Profile::setDesiredProcsUnits>},
    {"MaxProcUnit", set<&Profile::setMaxProcsUnits>},
    {"MinimumCPUCount", set<&Profile::setMinProcs>},
    {"DesiredCPUCount", set<&Profile::setDesiredProcs>},
    {"MaximumCPUCount", set<&Profile::setMaxProcs>},
    {"SharedProcPoolId", set<&Profile::setSharedProcPoolID>},
    {"MinimumMemory", set<&Profile::setMinMem>},
    {"DesiredMemory", set<&Profile::setDesiredMem>},
    {"MaximumMemory", set<&Profile::setMaxMem>},
    {"MemMode", set<&Profile::setMemMode>},
    {"VRMWeight", set<&Profile::setMemWeight>},
    {"EntMem", set<&Profile::setDesiredIoEntitledMem>},
    {"AltConsoleDRCIndex", set<&Profile::setAltConsoleSlot>},
    {"AltLoadSourceDRCIndex", set<&Profile::setAltRestartDeviceSlot>},
    {"ConsoleDRCIndex", set<&Profile::setConsoleSlot>},
    {"LoadSourceDRCIndex", set<&Profile::setLoadSourceSlot>},
    {"ECSDRCIndex", set<&Profile::setOpConsoleSlot>},
    {"virtual_serial_adapters", set<&Profile::setVirtualSerialAdapters>},
    {"virtual_scsi_adapters", set<&Profile::setVirtualScsiAdapters>},
    {"virtual_eth_adapters", set<&Profile::setVirtualEthAdapters>},
    {"io_slots", set<&Profile::setIoSlots>},
};

/// Processors in effect, or of the pending change: the mode fills two fields, and says what the
/// codes of sharing mean, which the library tells behind what is given out.
template <auto setMode, auto setPool, auto setProcs, auto setUnits, auto setSharing>
void setShares(Processor& record, const zemApiProp& object, const char* const (&keys)[5]) {
    const zemString mode = object.getProperty(keys[0]);
    (record.*setMode)(mode);
    (record.*setPool)(mode);
    (record.*setProcs)(object.getProperty(keys[1]));
    (record.*setUnits)(object.getProperty(keys[2]));
    const zemString donor = object.getProperty(keys[3]);
    (record.*setSharing)(mode, donor, object.getProperty(keys[4]));
}

/// Both setters of modes fill one field, in which the pending mode stays.
constexpr Field<Processor> kProcessor[] = {
    {"UserDefinedName", set<&Processor::setLparName>},
    {"CurMaxProcs", set<&Processor::setCurrMaxProcs>},
    {"CurMaxProcUnits", set<&Processor::setCurrMaxProcUnits>},
    {"CurMinProcs", set<&Processor::setCurrMinProcs>},
    {"CurMinProcUnits", set<&Processor::setCurrMinProcUnits>},
    {"CurProcMode",
     [](Processor& record, const zemApiProp& object, const char* key) {
         setShares<&Processor::setCurrProcMode, &Processor::setCurrSharedProcPoolId,
                   &Processor::setCurrProcs, &Processor::setCurrProcUnits,
                   &Processor::setCurrSharingMode>(
             record, object,
             {key, "CurAllocProcs", "CurAllocProcUnits", "CurDonorMode", "CurSharingMode"});
     }},
    {"CurUncappedWeight", set<&Processor::setCurrUncapWeight>},
    {"PendMaxProcs", set<&Processor::setPendMaxProcs>},
    {"PendMaxProcUnits", set<&Processor::setPendMaxProcUnits>},
    {"PendMinProcs", set<&Processor::setPendMinProcs>},
    {"PendMinProcUnits", set<&Processor::setPendMinProcUnits>},
    {"PendProcMode",
     [](Processor& record, const zemApiProp& object, const char* key) {
         setShares<&Processor::setPendProcMode, &Processor::setPendSharedProcPoolId,
                   &Processor::setPendProcs, &Processor::setPendProcUnits,
                   &Processor::setPendSharingMode>(
             record, object,
             {key, "PendAllocProcs", "PendAllocProcUnits", "PendDonorMode", "PendSharingMode"});
     }},
    {"PendUncappedWeight", set<&Processor::setPendUncapWeight>},
    {"RuntimeProcs", set<&Processor::setRunProcs>},
    {"RuntimeProcUnits", set<&Processor::setRunProcUnits>},
    {"RuntimeUncappedWeight", set<&Processor::setRunUncapWeight>},
};

constexpr Field<Memory> kMemory[] = {
    {"UserDefinedName", set<&Memory::setLparName>},
    {"CurAllocMem", set<&Memory::setCurrMem>},
    {"CurMaxMem", set<&Memory::setCurrMaxMem>},
    {"CurMinMem", set<&Memory::setCurrMinMem>},
    {"PendAllocMem", set<&Memory::setPendMem>},
    {"PendMaxMem", set<&Memory::setPendMaxMem>},
    {"PendMinMem", set<&Memory::setPendMinMem>},
    {"RuntimeEntMem", set<&Memory::setRunIoEntitledMem>},
    {"RuntimeMem", set<&Memory::setRunMem>},
    {"RuntimeVRMWeight", set<&Memory::setRunMemWeight>},
    {"RuntimeMinMem", set<&Memory::setRunMinMem>},
    {"EntUsage", set<&Memory::setAutoIoEntitledMem>},
    {"CurrMemMode", set<&Memory::setMemMode>},
};

constexpr Field<Slot> kSlot[] = {
    {"drc_index", set<&Slot::setDrcIndex>},
    {"drc_name", set<&Slot::setDrcName>},
    {"bus_grouping", set<&Slot::setBusGrouping>},
    {"bus_id", set<&Slot::setBusId>},
    {"description", set<&Slot::setDescription>},
    {"feature_codes", set<&Slot::setFeatureCodes>},
    {"iop", set<&Slot::setIop>},
    {"parent_slot_drc_index", set<&Slot::setParentSlotDrcIndex>},
    {"pci_class", set<&Slot::setPciClass>},
    {"pci_device_id", set<&Slot::setPciDeviceId>},
    {"pci_revision_id", set<&Slot::setPciRevisionId>},
    {"pci_subs_device_id", set<&Slot::setPciSubsDeviceId>},
    {"pci_subs_vendor_id", set<&Slot::setPciSubsVendorId>},
    {"pci_vendor_id", set<&Slot::setPciVendorId>},
    {"slot_io_pool_id", set<&Slot::setSlotIoPoolId>},
    {"unit_phys_loc", set<&Slot::setUnitPhysLoc>},
};

constexpr Field<Serial> kSerial[] = {
    {"lpar_name", set<&Serial::setLparName>},
    {"slot_num", set<&Serial::setSlotNum>},
    {"state", set<&Serial::setState>},
    {"adapter_type", set<&Serial::setAdapterType>},
    {"connect_status", set<&Serial::setConnectStatus>},
    {"is_required", set<&Serial::setIsRequired>},
    {"remote_lpar_id", set<&Serial::setRemoteLparId>},
    {"remote_lpar_name", set<&Serial::setRemoteLparName>},
    {"remote_slot_num", set<&Serial::setRemoteSlotNum>},
    {"supports_dnx", set<&Serial::setSupportsDnx>},
};

constexpr Field<Scsi> kScsi[] = {
    {"lpar_name", set<&Scsi::setLparName>},
    {"slot_num", set<&Scsi::setSlotNum>},
    {"state", set<&Scsi::setState>},
    {"adapter_type", set<&Scsi::setAdapterType>},
    {"backing_devices", set<&Scsi::setBackingDevices>},
    {"remote_lpar_id", set<&Scsi::setRemoteLparId>},
    {"remote_lpar_name", set<&Scsi::setRemoteLparName>},
    {"remote_slot_num", set<&Scsi::setRemoteSlotNum>},
    {"is_required", set<&Scsi::setIsRequired>},
};

constexpr Field<Ethernet> kEthernet[] = {
    {"lpar_name", set<&Ethernet::setLparName>},
    {"slot_num", set<&Ethernet::setSlotNum>},
    {"state", set<&Ethernet::setState>},
    {"mac_addr", set<&Ethernet::setMacAddr>},
    {"ieee_virtual_eth", set<&Ethernet::setIeeeVirtualEth>},
    {"port_vlan_id", set<&Ethernet::setPortVlanID>},
    {"addl_vlan_ids", set<&Ethernet::setAddlVlanIds>},
    {"is_required", set<&Ethernet::setIsRequired>},
    {"is_trunk", set<&Ethernet::setIsTrunk>},
    {"trunk_priority", set<&Ethernet::setTruukPriority>},
    {"vswitch", set<&Ethernet::setVSwitch>},
};

constexpr Field<SysProcessor> kSysProcessor[] = {
    {"ConfigurableProcUnits", set<&SysProcessor::setConfigurableSysProcUnits>},
    {"CurAvailProcUnits", set<&SysProcessor::setCurrAvailSysProcUnits>},
    {"InstalledProcessors", set<&SysProcessor::setInstalledSysProcUnits>},
    {"MaxProcPools", set<&SysProcessor::setMaxSharedProcPools>},
    {"MinProcUnit", set<&SysProcessor::setMinProcUnitsPerVirtualProc>},
    {"PendAvailProcUnits", set<&SysProcessor::setPendAvailSysProcUnits>},
};

constexpr Field<ProcessorPool> kProcessorPool[] = {
    {"SharedProcPoolId", set<&ProcessorPool::setSharedProcPoolId>},
    {"MaxPoolCapacity", set<&ProcessorPool::setMaxPoolCapacity>},
    {"PendReservedPoolCapacity", set<&ProcessorPool::setPendReservedPoolProcUnits>},
    {"lpar_ids", set<&ProcessorPool::setLparIds>},
};

constexpr Field<SysMemory> kSysMemory[] = {
    {"ConfigurableMem", set<&SysMemory::setConfigurableSysMem>},
    {"InstalledMemory", set<&SysMemory::setInstalledSysMem>},
    {"MaxMemPools", set<&SysMemory::setMaxMemPools>},
    {"PendAvailMem", set<&SysMemory::setPendAvailSysMem>},
    {"LMBSize", set<&SysMemory::setMemRegionSize>},
};

/// A host tells of its pool when it has one.
constexpr Field<MemoryPool> kMemoryPool[] = {
    {"curr_pool_mem", set<&MemoryPool::setCurrPoolMem>},
    {"pend_avail_pool_mem", set<&MemoryPool::setPendAvailPoolMem>},
    {"pend_pool_mem", set<&MemoryPool::setPendPoolMem>},
    {"SystemName", [](MemoryPool& pool, const zemApiProp& object,
                      const char* key) { pool.setSupport(!object.getProperty(key).isEmpty()); }},
};

/// The library's operations that give a collection: of all hosts, of one, and of one partition.
using All = apiProp* (zemApiCaller::*)(const char* user, int level);
using Keyed = apiProp* (zemApiCaller::*)(const char* user, const char* key, int level);
struct Calls {
    All all;
    Keyed host;
    Keyed partition;
};

/// Whose records are wanted, and who asks.
struct Wanted {
    const zemString& user;
    const zemString& mtms;
    const zemString& lparid;
};

apiProp* answerOf(const Calls& calls, const Wanted& wanted) {
    constexpr int everything = 2;
    zemApiCaller library;
    if (wanted.mtms.isEmpty()) {
        return (library.*calls.all)(wanted.user, everything);
    }
    if (wanted.lparid.isEmpty()) {
        return (library.*calls.host)(wanted.user, wanted.mtms, everything);
    }
    const zemString key = wanted.lparid + "*" + wanted.mtms;
    return (library.*calls.partition)(wanted.user, key, everything);
}

/// A new record of an object, made from the property that tells whose it is; null: nobody's.
template <class Record>
std::unique_ptr<Record> recordOf(const zemApiProp& object, const char* key) {
    return std::make_unique<Record>(object.getProperty(key));
}

template <>
std::unique_ptr<zemCEC> recordOf(const zemApiProp& /*object*/, const char* /*key*/) {
    return std::make_unique<zemCEC>();
}

template <>
std::unique_ptr<Lpar> recordOf(const zemApiProp& object, const char* key) {
    const zemString name = object.getProperty(key);
    const int star = name.find('*');
    if (star < 0) {
        return std::make_unique<Lpar>("", "");
    }
    const auto length = static_cast<unsigned>(star);
    return std::make_unique<Lpar>(name.extractSubstring(length + 1),
                                  name.extractSubstring(0, length));
}

template <>
std::unique_ptr<Slot> recordOf(const zemApiProp& object, const char* key) {
    const zemString mtms = object.getProperty(key);
    return mtms.isEmpty() ? nullptr : std::make_unique<Slot>(mtms, object.getProperty("lpar_id"));
}

/// Of a slot that is free, nobody asks what it is.
template <class Record>
bool isFilled(const Record& /*record*/) {
    return true;
}
bool isFilled(const Slot& slot) { return !slot.getLparID().isEmpty(); }

/// The records of a collection, filled from the first @p count rows of @p fields.
template <class Record>
zemDynamicArray<Record> recordsOf(const char* operation, const Calls& calls, const char* key,
                                  const Field<Record>* fields, std::size_t count,
                                  const Wanted& wanted) {
    const zemApiReader reader = {"zemCECVisitor", operation, operation, nullptr, true};
    const zemApiObjects objects(reader, answerOf(calls, wanted));
    zemDynamicArray<Record> records;
    for (apiProp& each : objects) {
        const zemApiProp object(&each);
        std::unique_ptr<Record> record = recordOf<Record>(object, key);
        if (record == nullptr) {
            continue;
        }
        if (isFilled(*record)) {
            fill(*record, object, fields, count);
        }
        records.addElement(std::move(record));
    }
    return records;
}

}  // namespace

zemDynamicArray<zemLPAR> zemCECVisitor::getAllPartitionObjectsByKeys(
    const zemString& userName, int level, const zemString& mtms, const zemString& lparid) const {
    constexpr Calls calls = {&zemApiCaller::getAllLpars, &zemApiCaller::getAllLparsFromCec,
                             &zemApiCaller::getLparObj};
    const bool isAll = level >= Level_All;
    return recordsOf("getAllPartitionObjectsByKeys", calls, "Name", isAll ? kLpar : kLparState,
                     isAll ? std::size(kLpar) : std::size(kLparState),
                     {actor(userName), mtms, lparid});
}

zemDynamicArray<zemLPAR> zemCECVisitor::getAllPartitionObjectsByKeys(
    const zemString& userName, int* /*mask*/, const zemString& mtms,
    const zemString& lparid) const {
    return getAllPartitionObjectsByKeys(userName, Level_All, mtms, lparid);
}

zemDynamicArray<zemPartitionProfileConfiguration> zemCECVisitor::getAllProfileLevelLparByKeys(
    const zemString& userName, int* /*mask*/, const zemString& mtms,
    const zemString& lparid) const {
    return getAllProfileLevelLparByKeys(userName, Level_All, mtms, lparid);
}

// A collection: its operation, the library's calls, the property that tells whose a record is, and
// the table of the others.
#define OF_PARTITIONS(NAME, RECORD, ALL, HOST, PARTITION, KEY, TABLE)                           \
    zemDynamicArray<RECORD> zemCECVisitor::NAME(                                                \
        const zemString& userName, int, const zemString& mtms, const zemString& lparid) const { \
        constexpr Calls calls = {&zemApiCaller::ALL, &zemApiCaller::HOST,                       \
                                 &zemApiCaller::PARTITION};                                     \
        return recordsOf(#NAME, calls, KEY, TABLE, std::size(TABLE),                            \
                         {actor(userName), mtms, lparid});                                      \
    }
#define OF_HOSTS(NAME, RECORD, ALL, HOST, KEY, TABLE)                               \
    zemDynamicArray<RECORD> zemCECVisitor::NAME(const zemString& userName, int,     \
                                                const zemString& mtms) const {      \
        constexpr Calls calls = {&zemApiCaller::ALL, &zemApiCaller::HOST, nullptr}; \
        return recordsOf(#NAME, calls, KEY, TABLE, std::size(TABLE),                \
                         {actor(userName), mtms, zemString()});                     \
    }

// clang-format off
OF_PARTITIONS(getAllProfileLevelLparByKeys, Profile,
              getAllLparProfiles, getAllLparProfilesFromCec, getAllLparProfilesFromLpar,
              "PartitionName", kProfile)
OF_PARTITIONS(getAllProcessorLevelLparByKeys, Processor,
              getAllLparProcessorCfgs, getAllLparProcessorCfg, getLparProcessorCfg,
              "Name", kProcessor)
OF_PARTITIONS(getAllMemoryLevelLparByKeys, Memory,
              getAllLparMemoryCfgs, getAllLparMemoryCfg, getLparMemoryCfg,
              "Name", kMemory)
OF_PARTITIONS(getAllSerialAdapterLevelLparByKeys, Serial,
              getAllLparVirtualSerial, getVirtualSerial, getLparVirtualSerial,
              "Name", kSerial)
OF_PARTITIONS(getAllSCSIAdapterLevelLparByKeys, Scsi,
              getAllLparVirtualScsi, getVirtualScsi, getLparVirtualScsi,
              "Name", kScsi)
OF_PARTITIONS(getAllEthernetAdapterLevelLparByKeys, Ethernet,
              getAllLparVirtualEthernet, getVirtualEthernet, getLparVirtualEthernet,
              "Name", kEthernet)

OF_HOSTS(getAllCECObjectsByKeys, zemCEC, getAllCecs, getCecObj, nullptr, kHost)
OF_HOSTS(getAllProcessorLevelSysByKeys, SysProcessor,
         getAllCecProcessorCfg, getCecProcessorCfg, "Name", kSysProcessor)
OF_HOSTS(getAllProcessorLevelPoolByKeys, PoolProcessor,
         getAllCecs, getCecObj, "Name", kPoolProcessor)
OF_HOSTS(getAllProcessorPoolByKeys, ProcessorPool,
         getAllCecProcessorPoolCfg, getCecProcessorPoolCfg, "SystemName", kProcessorPool)
OF_HOSTS(getAllMemoryLevelSysByKeys, SysMemory,
         getAllCecMemoryCfg, getCecMemoryCfg, "Name", kSysMemory)
OF_HOSTS(getAllMemoryPoolByKeys, MemoryPool,
         getAllCecMemoryPoolCfgs, getCecMemoryPoolCfg, "SystemName", kMemoryPool)
// clang-format on

#undef OF_PARTITIONS
#undef OF_HOSTS

zemDynamicArray<Slot> zemCECVisitor::slots(const zemString& userName, int /*level*/,
                                           const zemString& mtms, const zemString& lparid) const {
    constexpr Calls calls = {&zemApiCaller::getAllIoSlots, &zemApiCaller::getIoSlots,
                             &zemApiCaller::getLparIoSlots};
    return recordsOf("getAllIOSlotLevelLparByKeys", calls, "SystemName", kSlot, std::size(kSlot),
                     {actor(userName), mtms, lparid});
}

zemDynamicArray<Slot> zemCECVisitor::getAllIOSlotLevelLparByKeys(const zemString& userName,
                                                                 int level, const zemString& mtms,
                                                                 const zemString& lparid) const {
    zemDynamicArray<Slot> all = slots(userName, level, mtms, lparid);
    zemDynamicArray<Slot> owned;
    for (int i = 0; i < all.size(); ++i) {
        if (isFilled(*all.getElementAt(i))) {
            owned.addElement(std::unique_ptr<Slot>(std::exchange(all[i], nullptr)));
        }
    }
    return owned;
}

void zemReadProfile(apiProp& object, zemPartitionProfileConfiguration& profile) {
    fill(profile, zemApiProp(&object), kProfile, std::size(kProfile));
}

#include <gtest/gtest.h>

#include <functional>
#include <memory>
#include <optional>
#include <sstream>
#include <tuple>

#include "LibraryFaults.h"
#include "LibrarySpy.h"
#include "QyplatCmdCaller.h"
#include "ToolFolder.h"
#include "VirtualSystemVisitor.h"

namespace {

using Visitor = zemCECVisitor;

constexpr char kHost[] = "1111-AAA*0000001";

/// A collection's operation, whether its records hang on partitions or on hosts.
template <class Record>
using OfPartitions = zemDynamicArray<Record> (Visitor::*)(const zemString&, int, const zemString&,
                                                          const zemString&) const;
template <class Record>
using OfHosts = zemDynamicArray<Record> (Visitor::*)(const zemString&, int, const zemString&) const;

template <class Record>
zemDynamicArray<Record> read(const Visitor& visitor, OfPartitions<Record> operation,
                             const char* mtms = "", const char* lparid = "") {
    return (visitor.*operation)("u", Visitor::Level_All, mtms, lparid);
}
template <class Record>
zemDynamicArray<Record> read(const Visitor& visitor, OfHosts<Record> operation,
                             const char* mtms = "", const char* /*lparid*/ = "") {
    return (visitor.*operation)("u", Visitor::Level_All, mtms);
}

class VirtualSystemVisitorTest : public testing::Test {
protected:
    ~VirtualSystemVisitorTest() override { EXPECT_EQ(0, librarySpy.held); }

    /// The one record that a collection gives when the library tells of one object.
    template <class Operation>
    auto only(Operation operation, const std::string& properties) {
        const LibraryAnswer answer({properties});
        auto records = read(*m_visitor, operation);
        EXPECT_EQ(1, records.size());
        records.relinquishOwnership();
        return std::unique_ptr<std::remove_pointer_t<decltype(records.getElementAt(0))>>(
            records.getElementAt(0));
    }

    ToolFolder m_tools;
    zemVirtualizationManager m_manager;
    std::unique_ptr<Visitor> m_visitor{m_manager.createCECVisitor({"", "xx"})};
};

/// A collection: what reads it, and what hangs it on the visitor's hosts or on their partitions.
struct Reader {
    const char* operation;
    std::function<int(const Visitor&, const char* mtms, const char* lparid)> count;
    std::vector<const char*> calls;  ///< of all hosts, of one, of one partition
    const char* bare;                ///< what a key without "*" gives, and no property at all
    int (*hang)(Visitor&);
    std::function<int(zemCEC&)> hung;  ///< how many hang there; fails for those of others
};

/// Whose key does not stand in the name.
constexpr char kNoKey[] =
    "3/DNX API property \"Name\" with wrong format, it should be the format : LPARID*MTMS.";

template <class Operation>
auto counter(Operation operation) {
    return [operation](const Visitor& visitor, const char* mtms, const char* lparid) {
        return read(visitor, operation, mtms, lparid).size();
    };
}

int countOf(const zemLPAR& lpar, const zemPartitionHardwareResource& record) {
    const bool isMine = lpar.getLparIDAndMTMS() == record.getLparIDAndMTMS();
    EXPECT_TRUE(isMine || record.getLparID().isEmpty()) << record.getLparIDAndMTMS();
    return isMine ? 1 : 0;
}
int countOf(const zemCEC& host, const zemHardwareResource& record) {
    const bool isMine = host.getMTMS() == record.getMTMS();
    EXPECT_TRUE(isMine || record.getMTMS().isEmpty()) << record.getMTMS();
    return isMine ? 1 : 0;
}
template <class Owner, class Record>
int countOf(const Owner& owner, const zemDynamicArray<Record>& records) {
    int count = 0;
    for (int i = 0; i < records.size(); ++i) {
        count += countOf(owner, *records[i]);
    }
    return count;
}

#define READER(OPERATION, RECORD, KIND) \
    #OPERATION, counter(static_cast<KIND<RECORD>>(&Visitor::OPERATION))
#define ON_PARTITIONS(OPERATION, GET)                                                        \
    [](Visitor& v) { return v.OPERATION("u", "3", Visitor::Level_All); }, [](zemCEC& host) { \
        int count = 0;                                                                       \
        for (int i = 0; i < host.getLPARs().size(); ++i) {                                   \
            count += countOf(*host.getLPARs()[i], host.getLPARs()[i]->GET());                \
        }                                                                                    \
        return count;                                                                        \
    }
#define ON_HOSTS(OPERATION, GET)                                     \
    [](Visitor& v) { return v.OPERATION("u", Visitor::Level_All); }, \
        [](zemCEC& host) { return countOf(host, host.GET()); }

// clang-format off
const Reader kReaders[] = {
    {READER(getAllCECObjectsByKeys, zemCEC, OfHosts), {"getAllCecs", "getCecObj"}, "1", nullptr, nullptr},
    {READER(getAllPartitionObjectsByKeys, zemLPAR, OfPartitions), {"getAllLpars", "getAllLparsFromCec", "getLparObj"}, "1", nullptr, nullptr},
    {READER(getAllProfileLevelLparByKeys, zemPartitionProfileConfiguration, OfPartitions), {"getAllLparProfiles", "getAllLparProfilesFromCec", "getAllLparProfilesFromLpar"}, kNoKey, ON_PARTITIONS(initializeLparProfile, getLparProfile)},
    {READER(getAllProcessorLevelLparByKeys, zemPartitionProcessorResource, OfPartitions), {"getAllLparProcessorCfgs", "getAllLparProcessorCfg", "getLparProcessorCfg"}, kNoKey, ON_PARTITIONS(initializeProcessorLevelLpar, getLparProcessor)},
    {READER(getAllMemoryLevelLparByKeys, zemPartitionMemoryResource, OfPartitions), {"getAllLparMemoryCfgs", "getAllLparMemoryCfg", "getLparMemoryCfg"}, kNoKey, ON_PARTITIONS(initializeMemoryLevelLpar, getLparMemory)},
    {READER(getAllIOSlotLevelLparByKeys, zemPartitionIOSlotResource, OfPartitions), {"getAllIoSlots", "getIoSlots", "getLparIoSlots"}, "0", ON_PARTITIONS(initializeIOSlotLevelLpar, getLparIOSlots)},
    {READER(getAllSerialAdapterLevelLparByKeys, zemPartitionSerialAdapterResource, OfPartitions), {"getAllLparVirtualSerial", "getVirtualSerial", "getLparVirtualSerial"}, kNoKey, ON_PARTITIONS(initializeSerialAdapterLevelLpar, getLparSerialAdapters)},
    {READER(getAllSCSIAdapterLevelLparByKeys, zemPartitionSCSIAdapterResource, OfPartitions), {"getAllLparVirtualScsi", "getVirtualScsi", "getLparVirtualScsi"}, kNoKey, ON_PARTITIONS(initializeSCSIAdapterLevelLpar, getLparSCSIAdapters)},
    {READER(getAllEthernetAdapterLevelLparByKeys, zemPartitionEthernetAdapterResource, OfPartitions), {"getAllLparVirtualEthernet", "getVirtualEthernet", "getLparVirtualEthernet"}, kNoKey, ON_PARTITIONS(initializeEthernetAdapterLevelLpar, getLparEthernetAdapters)},
    {READER(getAllProcessorLevelSysByKeys, zemSystemProcessorResource, OfHosts), {"getAllCecProcessorCfg", "getCecProcessorCfg"}, "1", ON_HOSTS(initializeProcessorLevelSys, getProcessor)},
    {READER(getAllProcessorLevelPoolByKeys, zemPoolProcessorResource, OfHosts), {"getAllCecs", "getCecObj"}, "1", ON_HOSTS(initializeProcessorLevelPool, getPoolProcessor)},
    {READER(getAllProcessorPoolByKeys, zemProcessorPoolResource, OfHosts), {"getAllCecProcessorPoolCfg", "getCecProcessorPoolCfg"}, "1", ON_HOSTS(initializeProcessorPool, getProcessorPool)},
    {READER(getAllMemoryLevelSysByKeys, zemSystemMemoryResource, OfHosts), {"getAllCecMemoryCfg", "getCecMemoryCfg"}, "1", ON_HOSTS(initializeMemoryLevelSys, getMemoy)},
    {READER(getAllMemoryPoolByKeys, zemMemoryPoolResource, OfHosts), {"getAllCecMemoryPoolCfgs", "getCecMemoryPoolCfg"}, "1", ON_HOSTS(initializeMemoryPool, getMemoyPool)},
};
// clang-format on

TEST_F(VirtualSystemVisitorTest, EachCollectionIsOneCall) {
    m_tools.makeAppliance(ZEM_PROGRAMS);
    const std::string arguments[] = {"(u,2)", "(u,1111-AAA*0000001,2)", "(u,3*1111-AAA*0000001,2)"};
    for (const Reader& reader : kReaders) {
        int counts[3] = {};
        for (size_t i = 0; i < reader.calls.size(); ++i) {
            librarySpy.names.clear();
            counts[i] = reader.count(*m_visitor, i > 0 ? kHost : "", i > 1 ? "3" : "");
            EXPECT_EQ(1U, librarySpy.names.size()) << reader.operation;
            EXPECT_EQ(reader.calls[i] + arguments[i], librarySpy.call);
        }
        EXPECT_LE(1, counts[1]) << reader.operation;
        EXPECT_LE(counts[1], counts[0]) << reader.operation;
        EXPECT_LE(counts[2], counts[1]) << reader.operation;
        reader.count(*m_visitor, "", "3");  // a partition of no host
        EXPECT_EQ(reader.calls[0] + arguments[0], librarySpy.call);
    }
    m_visitor->setOperEnv("env", "");
    m_visitor->getAllCECObjectsByKeys("", Visitor::Level_All, "");
    EXPECT_EQ("getAllCecs(env,2)", librarySpy.call);
}

TEST_F(VirtualSystemVisitorTest, AnswersOfTheLibraryBecomeRecordsOrFailures) {
    m_tools.makeAppliance(ZEM_PROGRAMS);
    const std::pair<std::optional<int>, const char*> codes[] = {
        {0, nullptr}, {7, nullptr}, {6, "1"}, {3, "6"}, {8, "6"}, {-2, "6"}, {{}, "6"}};
    for (const Reader& reader : kReaders) {
        for (const auto& [code, kind] : codes) {
            planAnswer(reader.calls[0], code);
            std::string expected;
            if (kind != nullptr) {
                expected = std::string(kind) + "/zemCECVisitor/" + reader.operation + '/' +
                           errorCodeToString(code.value_or(-1)) + '/' +
                           getErrorString(code.value_or(-1));
            }
            int count = 0;
            EXPECT_EQ(expected,
                      failureText([&, &r = reader] { count = r.count(*m_visitor, "", ""); }));
            EXPECT_EQ(0, count);
        }
        for (const char* properties : {"", "Name=x;PartitionName=x;lpar_id=3", "SystemName=x"}) {
            const LibraryAnswer answer({properties});
            std::string outcome;
            const std::string failure = failureText(
                [&, &r = reader] { outcome = std::to_string(r.count(*m_visitor, "", "")); }, "kt");
            EXPECT_EQ(reader.bare, outcome + failure) << reader.operation << ' ' << properties;
        }
    }
    const auto lpar = only<OfPartitions<zemLPAR>>(&Visitor::getAllPartitionObjectsByKeys, "Name=x");
    EXPECT_EQ("||", joined(lpar->getLparID(), lpar->getMTMS()));
}

TEST_F(VirtualSystemVisitorTest, PropertiesOfPartitions) {
    const LibraryAnswer answer(
        {"Name=3*T*S;PartitionState=2;UserDefinedName=a;DefinitionState=3;Curr_prof=1,b;"
         "Default_prof=2,c;BootMode=3;MigrationState=13;ActualProcCompatMode=4;ProcCompatMode=5;"
         "Keylock=2;RedundantPath=null;PowerOnWithHypervisor=1"});
    const std::string all =
        "3|T*S|Running|a|xbrgserver|b|c|sms|4|CORAL7|CORAL6+_enhanced|manual|unavailable|1|";
    const auto shown = [](const zemDynamicArray<zemLPAR>& lpars) {
        zemLPAR& l = *lpars.getElementAt(0);
        return joined(l.getLparID(), l.getMTMS(), l.getState(), l.getLparName(),
                      l.getVirtualSystemType(), l.getCurrentProfileName(),
                      l.getDefaultProfileName(), l.getBootMode(), l.getMigrationState(),
                      l.getCurrLparProcCompatMode(), l.getDesiredLparProcCompatMode(),
                      l.getKeyLock(), l.getRedundantErrPathReporting(), l.getAutoStart());
    };
    int mask[] = {0, -1};
    const auto& v = *m_visitor;
    EXPECT_EQ(all, shown(v.getAllPartitionObjectsByKeys("", Visitor::Level_All, "", "")));
    EXPECT_EQ(all, shown(v.getAllPartitionObjectsByKeys("", mask, "", "")));
    const std::string none = "zemNULL|";
    EXPECT_EQ("3|T*S|Running|" + none + none + none + none + none + "0|" + none + none + none +
                  none + none,
              shown(v.getAllPartitionObjectsByKeys("", Visitor::Level_Basic, "", "")));
}

/// Values that differ from each other, for a list of keys with "," between them.
std::string numbered(const std::string& keys) {
    std::istringstream all(keys);
    std::string properties;
    int number = 1;
    for (std::string key; std::getline(all, key, ',');) {
        properties += ';' + key + '=' + std::to_string(number++);
    }
    return properties;
}

// What each reader takes from which key.
TEST_F(VirtualSystemVisitorTest, PropertiesOfRecords) {
#define TOLD(READ, ...)                           \
    [&](const auto& all) {                        \
        const auto r = only(&Visitor::READ, all); \
        return joined(__VA_ARGS__);               \
    }
    const std::string host = "Name=T*S", pool = "SystemName=T*S", partition = "Name=3*T*S";
    const std::string modes =
        ";CurProcMode=255;CurDonorMode=1;CurSharingMode=0;PendProcMode=2;PendDonorMode=0;"
        "PendSharingMode=1";
    const std::string adapter =
        partition + ";adapter_type=1;is_required=true;connect_status=1" +
        numbered(
            "lpar_name,remote_lpar_id,remote_lpar_name,remote_slot_num,slot_num,state,backing_"
            "devices,supports_dnx,mac_addr,ieee_virtual_eth,port_vlan_id,addl_vlan_ids,is_trunk,"
            "trunk_priority,vswitch");
    // clang-format off
    const std::tuple<std::string, std::string, std::function<std::string(const std::string&)>> rows[] = {
        {host + ";PrimaryFSP_IP=a;BackupFSP_IP=b;State=3;UserDefinedName=c;RuntimeCapability=1073741824;GlvExCaps=[64,32]", "T*S|a|b|Power Off|c|1|1|",
         TOLD(getAllCECObjectsByKeys, r->getMTMS(), r->getPrimaryFSPIP(), r->getBackupFSPIP(), r->getState(), r->getSystemName(), r->getCapability().m_osq00Capable, r->getCapability().m_activeLparMobilityCapable)},
        {host + numbered("ConfigurableProcUnits,CurAvailProcUnits,InstalledProcessors,MaxProcPools,MinProcUnit,PendAvailProcUnits"), "T*S|1|2|3|4|5|6|",
         TOLD(getAllProcessorLevelSysByKeys, r->getMTMS(), r->getConfigurableSysProcUnits(), r->getCurrAvailSysProcUnits(), r->getInstalledSysProcUnits(), r->getMaxSharedProcPools(), r->getMinProcUnitsPerVirtualProc(), r->getPendAvailSysProcUnits())},
        {host + numbered("ConfigurableProcUnits,PendAvailProcUnits"), "T*S|1|2|",
         TOLD(getAllProcessorLevelPoolByKeys, r->getMTMS(), r->getConfigurablePoolProcUnits(), r->getPendAvailPoolProcUnits())},
        {pool + numbered("SharedProcPoolId,MaxPoolCapacity,PendReservedPoolCapacity,lpar_ids"), "T*S|1|2|3|4|",
         TOLD(getAllProcessorPoolByKeys, r->getMTMS(), r->getSharedProcPoolId(), r->getMaxPoolCapacity(), r->getPendReservedPoolProcUnits(), r->getLparIds())},
        {host + numbered("ConfigurableMem,InstalledMemory,MaxMemPools,PendAvailMem,LMBSize"), "T*S|1|2|3|4|5|",
         TOLD(getAllMemoryLevelSysByKeys, r->getMTMS(), r->getConfigurableSysMem(), r->getInstalledSysMem(), r->getMaxMemPools(), r->getPendAvailSysMem(), r->getMemRegionSize())},
        {pool + numbered("curr_pool_mem,pend_avail_pool_mem,pend_pool_mem"), "T*S|1|2|3|1|",
         TOLD(getAllMemoryPoolByKeys, r->getMTMS(), r->getCurrPoolMem(), r->getPendAvailPoolMem(), r->getPendPoolMem(), r->isSupport())},
        {partition + modes + numbered("UserDefinedName,CurMaxProcs,CurMaxProcUnits,CurMinProcs,CurMinProcUnits,CurAllocProcs,CurAllocProcUnits,CurUncappedWeight,PendMaxProcs,PendMaxProcUnits,PendMinProcs,PendMinProcUnits,PendAllocProcs,PendAllocProcUnits,PendUncappedWeight,RuntimeProcs,RuntimeProcUnits,RuntimeUncappedWeight"),
         "3*T*S|1|2|0.03|4|0.05|6|0.07|8|9|0.10|11|0.12|13|0.14|15|16|0.17|18|",
         TOLD(getAllProcessorLevelLparByKeys, r->getLparIDAndMTMS(), r->getLparName(), r->getCurrMaxProcs(), r->getCurrMaxProcUnits(), r->getCurrMinProcs(), r->getCurrMinProcUnits(), r->getCurrProcs(), r->getCurrProcUnits(), r->getCurrUncapWeight(), r->getPendMaxProcs(), r->getPendMaxProcUnits(), r->getPendMinProcs(),
              r->getPendMinProcUnits(), r->getPendProcs(), r->getPendProcUnits(), r->getPendUncapWeight(), r->getRunProcs(), r->getRunProcUnits(), r->getRunUncapWeight())},
        {partition + modes, "shared||null|2|share_idle_procs_always|uncap|",  // the pending mode goes first
         TOLD(getAllProcessorLevelLparByKeys, r->getCurrProcMode(), r->getPendProcMode(), r->getCurrSharedProcPoolId(), r->getPendSharedProcPoolId(), r->getCurrSharingMode(), r->getPendSharingMode())},
        {partition + numbered("UserDefinedName,CurAllocMem,CurMaxMem,CurMinMem,PendAllocMem,PendMaxMem,PendMinMem,RuntimeEntMem,RuntimeMem,RuntimeVRMWeight,RuntimeMinMem,EntUsage,CurrMemMode"), "3*T*S|1|2|3|4|5|6|7|8|9|10|11|12|shared|",
         TOLD(getAllMemoryLevelLparByKeys, r->getLparIDAndMTMS(), r->getLparName(), r->getCurrMem(), r->getCurrMaxMem(), r->getCurrMinMem(), r->getPendMem(), r->getPendMaxMem(), r->getPendMinMem(), r->getRunIoEntitledMem(), r->getRunMem(), r->getRunMemWeight(), r->getRunMinMem(), r->getAutoIoEntitledMem(), r->getMemMode())},
        {pool + ";lpar_id=3;feature_codes=[5,6];iop=false" + numbered("bus_grouping,bus_id,description,drc_index,drc_name,parent_slot_drc_index,pci_class,pci_device_id,pci_revision_id,pci_subs_device_id,pci_subs_vendor_id,pci_vendor_id,slot_io_pool_id,unit_phys_loc"), "3*T*S|1|2|3|4|5|6|7|8|9|A|B|C|13|14|5,6|0|",
         TOLD(getAllIOSlotLevelLparByKeys, r->getLparIDAndMTMS(), r->getBusGrouping(), r->getBusId(), r->getDescription(), r->getDrcIndex(), r->getDrcName(), r->getParentSlotDrcIndex(), r->getPciClass(), r->getPciDeviceId(), r->getPciRevisionId(), r->getPciSubsDeviceId(), r->getPciSubsVendorId(), r->getPciVendorId(), r->getSlotIoPoolId(),
              r->getUnitPhysLoc(), r->getFeatureCodes(), r->getIop())},
        {adapter, "3*T*S|server|1|1|2|3|4|5|6|1|active|",
         TOLD(getAllSerialAdapterLevelLparByKeys, r->getLparIDAndMTMS(), r->getAdapterType(), r->getIsRequired(), r->getLparName(), r->getRemoteLparId(), r->getRemoteLparName(), r->getRemoteSlotNum(), r->getSlotNum(), r->getState(), r->getSupportsDnx(), r->getConnectStatus())},
        {adapter, "3*T*S|server|1|1|2|3|4|5|6|7|",
         TOLD(getAllSCSIAdapterLevelLparByKeys, r->getLparIDAndMTMS(), r->getAdapterType(), r->getIsRequired(), r->getLparName(), r->getRemoteLparId(), r->getRemoteLparName(), r->getRemoteSlotNum(), r->getSlotNum(), r->getState(), r->getBackingDevices())},
        {adapter, "3*T*S|1|1|5|6|9|10|11|12|13|14|15|",
         TOLD(getAllEthernetAdapterLevelLparByKeys, r->getLparIDAndMTMS(), r->getIsRequired(), r->getLparName(), r->getSlotNum(), r->getState(), r->getMacAddr(), r->getIeeeVirtualEth(), r->getPortVlanID(), r->getAddlVlanIds(), r->getIsTrunk(), r->getTruukPriority(), r->getVSwitch())},
    };
    // clang-format on
#undef TOLD
    for (const auto& [properties, expected, told] : rows) {
        EXPECT_EQ(expected, told(properties));
    }
}

// clang-format off
TEST_F(VirtualSystemVisitorTest, PropertiesOfProfiles) {
    const LibraryAnswer answer({"PartitionName=3*T*S;BootMode=2;ProcMode=0;DonorMode=0;SharingMode=0;ProcessorMode=9;MemMode=255" +
        numbered("AltConsoleDRCIndex,AltLoadSourceDRCIndex,AutoIPLEnabled,SFPSurveillance,ConsoleDRCIndex,EntMem,LoadSourceDRCIndex,lpar_env,lpar_name,VRMWeight,ECSDRCIndex,UserDefinedName,RedundantPath,UncappedWeight,MaxVirtualSlots,MinimumCPUCount,DesiredCPUCount,MaximumCPUCount,"
                 "MinProcUnit,DesiredProcUnit,MaxProcUnit,SharedProcPoolId,MinimumMemory,DesiredMemory,MaximumMemory,virtual_serial_adapters,virtual_scsi_adapters,virtual_eth_adapters,io_slots")});
    int mask[] = {0, -1};
    const auto& v = *m_visitor;
    for (const auto& profiles : {v.getAllProfileLevelLparByKeys("", Visitor::Level_Basic, "", ""), v.getAllProfileLevelLparByKeys("", mask, "", "")}) {
        ASSERT_EQ(1, profiles.size());
        const auto& p = *profiles.getElementAt(0);
        EXPECT_EQ("3*T*S|ds|shared|cap|CORAL8|ded|1|2|3|4|5|6|7|8|9|10|11|12|13|14|15|",
                  joined(p.getLparIDAndMTMS(), p.getBootMode(), p.getProcMode(), p.getSharingMode(), p.getLparProcCompatMode(), p.getMemMode(), p.getAltConsoleSlot(), p.getAltRestartDeviceSlot(), p.getAutoStart(), p.getConnMonitoring(), p.getConsoleSlot(), p.getDesiredIoEntitledMem(), p.getLoadSourceSlot(),
                         p.getLparEnv(), p.getLparName(), p.getMemWeight(), p.getOpConsoleSlot(), p.getProfileName(), p.getRedundantErrPathReporting(), p.getUncapWeight(), p.getMaxVirtualSlots()));
        EXPECT_EQ("16|17|18|0.19|0.20|0.21|22|23|24|25|26|27|28|29|",
                  joined(p.getMinProcs(), p.getDesiredProcs(), p.getMaxProcs(), p.getMinProcsUnits(), p.getDesiredProcsUnits(), p.getMaxProcsUnits(), p.getSharedProcPoolID(), p.getMinMem(), p.getDesiredMem(), p.getMaxMem(), p.getVirtualSerialAdapters(), p.getVirtualScsiAdapters(), p.getVirtualEthAdapters(), p.getIoSlots()));
    }
}
// clang-format on

/// The host of this key in the visitor's table.
zemCEC* hashed(Visitor& visitor, const char* mtms) {
    return Visitor::getCECObjectByMTMS(visitor.getCECHashMapping(&visitor), mtms);
}

TEST_F(VirtualSystemVisitorTest, HostsAreReadAndDropped) {
    m_tools.makeAppliance(ZEM_PROGRAMS);
    const char* const off = "1111-AAC*0000003";
    const struct {
        bool onlyOperating;
        const char* mtms;
        int result;
        int hosts;
    } rows[] = {{false, "", 1, 4},  {true, "", 1, 2},   {true, kHost, 1, 1},
                {false, off, 1, 1}, {true, off, -1, 0}, {false, kHost, 1, 1}};
    for (const auto& row : rows) {
        EXPECT_EQ(row.result,
                  m_visitor->initialize("", row.onlyOperating, row.mtms, Visitor::Level_All));
        EXPECT_EQ(row.hosts, m_visitor->size()) << row.mtms;
        zemCEC* const first = m_visitor->getData(0);
        EXPECT_EQ(first, row.hosts == 0 ? nullptr : hashed(*m_visitor, first->getMTMS()));
        EXPECT_TRUE(m_visitor->isCECAlreadyHashed() || row.hosts == 0);
    }
    EXPECT_EQ(1, m_visitor->initialize("", true, Visitor::Level_Basic));
    EXPECT_EQ(2, m_visitor->size());
    planAnswer("getCecObj", 7);
    EXPECT_EQ(-1, m_visitor->initialize("", false, kHost, Visitor::Level_All));
    {
        const LibraryAnswer two({"Name=T*S", "Name=T*S"});
        EXPECT_EQ(-1, m_visitor->initialize("", false, "T*S", Visitor::Level_All));
    }
    m_visitor->initialize("", false, Visitor::Level_All);
    planAnswer("getAllCecs", 5);
    EXPECT_THROW(m_visitor->initialize("", false, Visitor::Level_All), zemOperationFailedException);
    EXPECT_EQ(0, m_visitor->size());
}

TEST_F(VirtualSystemVisitorTest, RecordsHangWhereTheyBelong) {
    m_tools.makeAppliance(ZEM_PROGRAMS);
    for (const Reader& reader : kReaders) {
        if (reader.hang == nullptr) {
            continue;
        }
        for (const char* mtms : {"", kHost}) {  // of all hosts, and of one with its partition 3
            const bool isAll = *mtms == '\0';
            m_visitor->initialize("", false, mtms, Visitor::Level_All);
            m_visitor->initializeLparResource("", "", Visitor::Level_Basic, VISITOR_TYPE_LPAR);
            librarySpy.names.clear();
            EXPECT_EQ(0, reader.hang(*m_visitor));
            const char* const call = isAll ? reader.calls.front() : reader.calls.back();
            EXPECT_EQ(std::vector<std::string>{call}, librarySpy.names);
            int count = 0;
            for (int h = 0; h < m_visitor->size(); ++h) {
                count += reader.hung(*m_visitor->getData(h));
            }
            EXPECT_EQ(reader.count(*m_visitor, mtms, isAll ? "" : "3"), count) << call;
        }
        m_manager.m_CECs.clear();
        EXPECT_EQ(0, reader.hang(*m_visitor));
    }
}

TEST_F(VirtualSystemVisitorTest, PartitionsHangOnTheirHosts) {
    m_tools.makeAppliance(ZEM_PROGRAMS);
    int mask[] = {-1};
    m_visitor->initialize("", true, Visitor::Level_All);
    testing::internal::CaptureStdout();
    m_visitor->initializeLparResource("", "3", Visitor::Level_All, VISITOR_TYPE_LPAR);
    EXPECT_EQ("+++++ initializeLparResource start\n++++cec number\n",
              testing::internal::GetCapturedStdout());
    EXPECT_EQ(7, m_visitor->getData(0)->getLPARs().size());  // of others, too, which are dropped
    EXPECT_EQ(4, m_visitor->getData(1)->getLPARs().size());

    m_visitor->initialize("", false, kHost, Visitor::Level_All);
    zemCEC& host = *m_visitor->getData(0);
    zemLPAR* found = nullptr;
    EXPECT_EQ(3, host.getLparHashMapping().lookup("3", found));
    m_visitor->initializeLparResource("", "3", mask, VISITOR_TYPE_LPAR);
    ASSERT_EQ(1, host.getLPARs().size());
    EXPECT_STREQ("web server", host.getLPARs()[0]->getLparName());
    EXPECT_EQ(0, host.getLparHashMapping().lookup("3", found));
    // Records of partitions that are not there are dropped.
    m_visitor->initializeIOSlotLevelLpar("", "", Visitor::Level_All);
    m_visitor->initializeLparProfile("", "", mask);
    EXPECT_EQ(1, host.getLPARs()[0]->getLparProfile().size());
    // A failure hangs nothing, and comes out.
    planAnswer("getAllLparMemoryCfg", 6);
    EXPECT_THROW(m_visitor->initializeMemoryLevelLpar("", "", Visitor::Level_All),
                 zemAccessDeniedException);
}

TEST_F(VirtualSystemVisitorTest, HostsTellOfSuspending) {
    EXPECT_EQ(0, m_visitor->initilaizeCECSuspendRR("", Visitor::Level_All));
    const std::string fields =
        "type_model,serial_num,max_suspend_capable_lpars,max_remote_restart_capable_lpars,"
        "lpar_suspend_capable,coralhv_lpar_remote_restart_capable,active_mem_sharing_capable";
    m_manager.m_CECs.addElement(new zemCEC("1*2", ""));
    for (const char* arguments : {"-r|sys|-m|1*2|-F|", "-r|sys|-F|"}) {
        m_tools.recorder("qyplat", "1,2,30,x1,1,,1\n9,9,8,7,1,1,1\n");
        testing::internal::CaptureStdout();
        EXPECT_EQ(1, m_visitor->initilaizeCECSuspendRR("", Visitor::Level_All));
        const std::string lines = testing::internal::GetCapturedStdout();
        for (const char* each :
             {"typeModel: 1\nserialNum: 2\nmaxSusLpars: 30\nmaxRRLpars: x1\nSuspendCapable: 1\n"
              "RRCapable: \nactiveMemSharingCapable: 1\n",
              "typeModel: 9\nserialNum: 9\nmaxSusLpars: 8\nmaxRRLpars: 7\nSuspendCapable: 1\n"
              "RRCapable: 1\nactiveMemSharingCapable: 1\n"}) {
            EXPECT_NE(std::string::npos, lines.find(each)) << lines;
        }
        EXPECT_EQ(arguments + fields, m_tools.arguments());
        const zemCECCapability& c = m_manager.m_CECs[0]->getCapability();
        EXPECT_EQ("30|0|1|0|1|",
                  joined(c.m_maxNumberOfSuspendCapableLpars,
                         c.m_maxNumberOfRemoteRestartCapableLpars, c.m_lparSuspendCapable,
                         c.m_lparRemoteRestartCapable, c.m_activeMemorySharingCapable));
        m_manager.m_CECs.addElement(new zemCEC("1*3", ""));
        m_visitor->setCECHashState(false);
    }
}

TEST_F(VirtualSystemVisitorTest, PartitionsTellOfSuspending) {
    m_tools.makeAppliance(ZEM_PROGRAMS);
    m_tools.script("qyplat",
                   "echo \"$LC_ALL $*\" >>$here/lines\nexec " ZEM_PROGRAMS "/qyplat \"$@\"");
    const auto lines = [this] { return testing_support::lines(m_tools.read("lines")); };
    int mask[] = {-1};
    for (const char* mtms : {"", kHost}) {
        m_visitor->initialize("", false, mtms, Visitor::Level_All);
        m_visitor->initializeLparResource("", "", mask, VISITOR_TYPE_LPAR);
        EXPECT_EQ(0, m_visitor->initializeLparSuspendRR("", "5", mask));
        EXPECT_EQ(*mtms == '\0' ? 6U : 8U, lines().size());  // two for each host with partitions
        zemLPAR& lpar = *m_visitor->getData(0)->getLPARs()[4];
        EXPECT_EQ("5|1|1|Ready|",
                  joined(lpar.getLparID(), lpar.getCapability().m_suspendCapable,
                         lpar.getCapability().m_remoteRestartCapable, lpar.getRRState()));
    }
    EXPECT_EQ("xx -r lpar -m 1111-AAA*0000001 --filter lpar_ids=5 -F lpar_id,state,suspend_capable",
              lines()[6]);
    EXPECT_EQ(
        "xx -r lpar -m 1111-AAA*0000001 --filter lpar_ids=5 -F lpar_id,remote_restart_capable,"
        "remote_restart_status",
        lines()[7]);
    m_tools.recorder("qyplat", "5,null,\n9,1,1\n");  // no number; nobody's
    m_visitor->initializeLparSuspendRR("", "", mask);
    EXPECT_EQ("1|0||",
              joined(m_visitor->getData(0)->getLPARs()[4]->getCapability().m_suspendCapable,
                     m_visitor->getData(0)->getLPARs()[4]->getCapability().m_remoteRestartCapable,
                     m_visitor->getData(0)->getLPARs()[4]->getRRState()));
}

TEST_F(VirtualSystemVisitorTest, HostsComeAndGo) {
    m_tools.recorder("qyplat", "al\"\"pha,1,0,1,0,default,1\n");
    EXPECT_EQ(nullptr, m_visitor->getData(""));
    EXPECT_EQ("", m_tools.arguments());
    zemCEC* const host = m_manager.getCEC(kHost, {});
    EXPECT_EQ(
        "-r|sys|-m|1111-AAA*0000001|-F|name,active_lpar_mobility_capable,"
        "inactive_lpar_mobility_capable,virtual_io_server_capable,virtual_switch_capable,"
        "lpar_proc_compat_modes,osq00_capable",
        m_tools.arguments());
    EXPECT_EQ("1111-AAA*0000001|1|default|",
              joined(host->getMTMS(), host->getCapability().m_osq00Capable,
                     host->getCapability().m_lparProcCompatModes));
    EXPECT_EQ(host, hashed(*m_visitor, kHost));
    m_tools.recorder("qyplat");
    EXPECT_EQ(host, m_visitor->getData(kHost));  // without the tool, which knows none now
    EXPECT_EQ(0, m_visitor->addCEC(kHost));
    EXPECT_EQ(-1, m_visitor->addCEC("T*S"));
    EXPECT_EQ(1, m_visitor->size());

    zemCEC other(kHost, "other");
    other.setState("Standby");
    EXPECT_EQ(0, m_visitor->modifyCEC(&other));
    EXPECT_EQ("other|Standby|", joined(host->getSystemName(), host->getState()));
    other.setMTMS("T*S");
    EXPECT_EQ(-1, m_visitor->modifyCEC(&other));
    EXPECT_EQ(-1, m_visitor->removeCEC("T*S"));
    EXPECT_EQ(0, m_visitor->removeCEC(kHost));
    EXPECT_EQ(nullptr, hashed(*m_visitor, kHost));

    m_tools.makeAppliance(ZEM_PROGRAMS);
    EXPECT_EQ(0, m_visitor->addCEC(new zemCEC(kHost, "alpha"), ""));
    EXPECT_EQ(7, m_visitor->getData(0)->getLPARs().size());
    planAnswer("getAllLparsFromCec", 6);
    EXPECT_THROW(m_visitor->addCEC(new zemCEC(kHost, "alpha"), ""), zemAccessDeniedException);
    EXPECT_EQ(1, m_visitor->size());

    zemString first("a"), second("b");
    Visitor::seperateAPIPrepName("3*T*S", first, second);
    EXPECT_EQ("a|b|", joined(first, second));
}

/// Gives each host that is initialized two partitions, and tells how it was asked.
struct TwoEach {
    TwoEach(zemCEC* cec, const zemString& type) : m_CEC(cec), m_Type(type) {}
    void setOperEnv(const zemOperEnv& env) { m_Env = env; }
    int initialize(const zemString& userName, int type) {
        asked = joined(m_CEC->getMTMS(), m_Type, m_Env.m_userName, m_Env.m_locale, userName, type);
        m_CEC->addLpar(new zemLPAR(m_CEC->getMTMS(), "1"));
        m_CEC->addLpar(new zemLPAR(m_CEC->getMTMS(), "2"));
        return 0;
    }
    int size() const { return ++sizes, m_CEC->getLPARs().size(); }
    zemLPAR* getData(int index) const { return m_CEC->getLPARs().getElementAt(index); }

    zemCEC* m_CEC;
    zemString m_Type;
    zemOperEnv m_Env;
    inline static std::string asked;
    inline static int sizes = 0;
};

TEST_F(VirtualSystemVisitorTest, ItemsOfAllHostsStandInOneRow) {
    for (const char* mtms : {"1*2", "empty", "1*3"}) {
        m_manager.m_CECs.addElement(new zemCEC(mtms, ""));
    }
    zemVMVisitor<zemLPAR, TwoEach> items(&m_manager, "class", {"u", "l"});
    EXPECT_EQ(nullptr, items.getData(0));
    EXPECT_EQ(0, items.initialize("1*2", "other", VISITOR_TYPE_VSSD_INIT));
    EXPECT_EQ("1*2|other|u|l|u|33|", TwoEach::asked);
    EXPECT_EQ(-1, items.initializePlus("1*3", VISITOR_TYPE_LPAR, "3*1*3", "other"));
    EXPECT_EQ("1*3|other|u|l|u|512|", TwoEach::asked);
    EXPECT_EQ(4, items.size());
    TwoEach::sizes = 0;
    std::string keys;
    for (int i = 0; zemLPAR* const lpar = items.getData(i); ++i) {
        keys += joined(lpar->getLparIDAndMTMS());
    }
    EXPECT_EQ("1*1*2|2*1*2|1*1*3|2*1*3|", keys);
    EXPECT_EQ(3, TwoEach::sizes);  // each host once
    EXPECT_EQ(items.getData(2), items.getData("1*1*3"));
    EXPECT_EQ(items.getData(1), items.getData("2*1*2"));
    EXPECT_EQ(nullptr, items.getData(-1));
    EXPECT_EQ(nullptr, items.getData("3*1*3"));
    m_tools.recorder("qyplat", "No results were found.\n");
    items.setOperEnv("", "l");
    EXPECT_EQ(-1, items.initialize("unknown", VISITOR_TYPE_LPAR));

    const zemOperEnv env("u", "l");
    const std::unique_ptr<zemLPARonCECVisitor> lpars(m_manager.createLPARVisitor("c", env));
    const std::unique_ptr<zemVSSDonCECVisitor> vssds(m_manager.createVSSDVisitor("c"));
    const std::unique_ptr<zemRPonCECVisitor> pools(m_manager.createRPonCECVisitor("c", env));
    EXPECT_EQ("u|l||l|", joined(lpars->getOperEnv().m_userName, lpars->getOperEnv().m_locale,
                                vssds->getOperEnv().m_userName, pools->getOperEnv().m_locale));
}

}  // namespace

// All operations fit the visitors of the library.
template class zemVMVisitor<zemLPAR, zemLPARVisitor>;
template class zemVMVisitor<zemVSSD, zemVSSDVisitor>;

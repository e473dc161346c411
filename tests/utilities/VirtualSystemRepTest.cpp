#include <gtest/gtest.h>

#include <tuple>

#include "FailingAllocation.h"
#include "LibraryFaults.h"
#include "LibrarySpy.h"
#include "QyplatCmdCaller.h"
#include "ResourcePoolManager.h"
#include "Store.h"
#include "SystemConfig.h"
#include "ToolFolder.h"
#include "VirtualSystemRep.h"

namespace {

constexpr char kHost[] = "1111-AAA*0000001";

// Provider libraries were built with these.
static_assert(VISITOR_TYPE_LPAR_KEY == 0x100 && VISITOR_TYPE_VSSD_KEY == 0x400 &&
              VISITOR_TYPE_RASD_PROC_KEY == 0x1000 && VISITOR_TYPE_RASD_MEM == 0x8000 &&
              VISITOR_TYPE_RASD_IOSLOT == 0x20000 && VISITOR_TYPE_RASD_VSCSI == 0x80000 &&
              VISITOR_TYPE_RASD_VSERIAL == 0x200000 && VISITOR_TYPE_RASD_VETH == 0x800000);

TEST(VirtualSystemRepTest, SettersTakeWhatTheLibraryTells) {
    zemLPAR l("7");
    EXPECT_EQ("zemNULL|7|zemNULL|zemNULL|zemNULL|", joined(l.getMTMS(), l.getLparID(), l.getState(),
                                                           l.getRRState(), l.getHibrLostConn()));
    using Answers = std::vector<std::pair<const char*, const char*>>;
    // clang-format off
    const Answers modes = {{"0", "CORAL5"}, {"3", "CORAL6+"}, {"10", "CORAL8_enhanced"}, {"63", "default"}, {"11", "unknown"}, {"null", "unknown"}};
    const Answers profiles = {{"1,normal", "normal"}, {"2,a,b", "a,b"}, {"normal", ""}, {",normal", ""}, {"NULL,normal", ""}, {"0,null", ""}};
    const struct {
        void (zemLPAR::*set)(const zemString&);
        const zemString& (zemLPAR::*get)() const;
        Answers answers;  // in this order: some keep what was there
    } rows[] = {
        {&zemLPAR::setStatePlus, &zemLPAR::getState, {{"0", "Not Activated"}, {"9", "Suspended"}, {"252", "Not Available"}, {"5", ""}, {"2", "Running"}, {"", ""}, {"4294967298", ""}}},
        {&zemLPAR::setBootMode, &zemLPAR::getBootMode, {{"1", "norm"}, {"5", "dd"}, {"0", "unknow"}, {"6", "unknow"}}},
        {&zemLPAR::setKeyLock, &zemLPAR::getKeyLock, {{"4", "norm"}, {"2", "manual"}, {"1", "1"}, {"null", "null"}}},
        {&zemLPAR::setCurrLparProcCompatMode, &zemLPAR::getCurrLparProcCompatMode, modes},
        {&zemLPAR::setDesiredLparProcCompatMode, &zemLPAR::getDesiredLparProcCompatMode, modes},
        {&zemLPAR::setVirtualSystemType, &zemLPAR::getVirtualSystemType, {{"5", "zemNULL"}, {"1", "tmxlinux"}, {"4", "xbrgserver"}, {"129", "osq00"}, {"131", "osq00"}}},
        {&zemLPAR::setDefaultProfileName, &zemLPAR::getDefaultProfileName, profiles},
        {&zemLPAR::setCurrentProfileName, &zemLPAR::getCurrentProfileName, profiles},
        {&zemLPAR::setRedundantErrPathReporting, &zemLPAR::getRedundantErrPathReporting, {{"1", "1"}, {"Null", "unavailable"}}},
        {&zemLPAR::setAutoStart, &zemLPAR::getAutoStart, {{"1", "1"}, {"Null", "0"}}},
    };
    // clang-format on
    for (const auto& row : rows) {
        for (const auto& [told, kept] : row.answers) {
            (l.*row.set)(told);
            EXPECT_STREQ(kept, (l.*row.get)()) << told;
        }
    }
    l.setMigrationState(16, true);
    EXPECT_EQ(6, l.getMigrationState());
    l.setMigrationState(4, false);
    EXPECT_EQ(4, l.getMigrationState());
    l.setMigrationState("to x: LOST CONNECTION");
    EXPECT_EQ(5, l.getMigrationState());
    l.setMigrationState(nullptr);
    EXPECT_EQ(0, l.getMigrationState());

    zemCEC host;
    const Answers states = {{"17", "Standby"}, {"240", "Failed Authentication"}, {"255", ""}};
    for (const auto& [told, kept] : states) {
        host.setStatePlus(told);
        EXPECT_STREQ(kept, host.getState()) << told;
    }
    zemLPAR lpar(kHost, "7", "n", "is Not Activated yet", "d", "c", "tmxlinux", "norm");
    EXPECT_FALSE(lpar.isActivated());
    lpar.setState("not activated");
    EXPECT_TRUE(lpar.isActivated() && !lpar.isLparProcessorAvailable());
    lpar.setLparProcessor(zemPartitionProcessorResource());
    EXPECT_TRUE(lpar.isLparProcessorAvailable() && !lpar.isLparMemoryAvailable());
}

/// A letter for each capability of a host, and what it tells of compatibility modes.
std::string shown(const zemCECCapability& c) {
    // clang-format off
    const bool flags[] = {c.m_activeLparMobilityCapable, c.m_inactiveLparMobilityCapable, c.m_virtualIoServerCapable, c.m_virtualSwitchCapable, c.m_osq00Capable, c.m_redundantErrPathReportingCapable,
                          c.m_lparSuspendCapable, c.m_lparRemoteRestartCapable, c.m_activeMemorySharingCapable, c.m_electronicErrReportingCapable, c.m_lheaCapable};
    // clang-format on
    std::string text;
    for (size_t i = 0; i < std::size(flags); ++i) {
        text += flags[i] ? std::string(1, "aivsorSRMel"[i]) : "";
    }
    return text + ' ' + std::string(c.m_lparProcCompatModes);
}

TEST(VirtualSystemRepTest, CapabilitiesOfAHost) {
    const std::string bit30 = "1073741824", others = "18446744072635809791";
    // clang-format off
    const std::tuple<std::string, std::string, const char*> rows[] = {
        {"[0,32,0,0,0,0]", "0", "a 0"}, {"[0,64]", "0", "i 0"}, {"[8]", "0", "v 0"}, {"[0,1]", "0", "s 0"}, {"[64]", bit30, "o 0"},
        {"[64]", others, " 0"}, {"[32]", "0", "r 0"}, {"[1,2,1,255,255,1]", "0", " 0"}, {"[0,0,16]", "0", " 1"}, {"[0,0,0,0,0,16]", "0", "S 0"},
        {"[104,97,16,0,0,16,0,0]", bit30, "aivsorS 1"}, {"[0,32," + std::string(500, ',') + "]", "", "a 0"}, {"[99999999999999999999,,16]", "", "vr 1"},
        {"18,64,16", "", "iv 0"},  // the first and the last character go, whatever they are
        {"[", bit30, " 0"}, {"", "", " 0"},
    };
    // clang-format on
    zemCEC host;
    EXPECT_EQ(" ", shown(host.getCapability()));
    for (const auto& [words, runtime, capabilities] : rows) {
        host.setCapability(words.c_str(), runtime.c_str());
        EXPECT_EQ(capabilities, shown(host.getCapability())) << words << ' ' << runtime;
    }
    using Host = zemQyplatCmdCaller::ManagedSystemAttribute;
    zemRecordType record(8);
    record.insert(Host::ATTR_OSQ00_CAPABLE, "1");
    record.insert(Host::ATTR_LPAR_PROC_COMPAT_MODES, "default,CORAL7");
    host.setCapability(record);
    host.setSuspendRRCapableAttributes(3, 4, 0, 1, 1);
    zemCEC copy;
    copy.setCapability(&host.getCapability());
    copy.setCapability(nullptr);
    EXPECT_EQ("oRM default,CORAL7", shown(copy.getCapability()));
    EXPECT_EQ("1|0|default,CORAL7||",
              joined(copy.getType(Host::ATTR_OSQ00_CAPABLE),
                     copy.getType(Host::ATTR_VIRTUAL_SWITCH_CAPABLE),
                     copy.getType(Host::ATTR_LPAR_PROC_COMPAT_MODES), copy.getType(0)));
}

TEST(VirtualSystemRepTest, LimitsOfPoolsAreAskedForOnce) {
    const std::tuple<int (zemCEC::*)(), const char*> rows[] = {
        {&zemCEC::getMaxMemPools, "-r|mem|--level|sys|-m|al \"pha|-F|max_mem_pools"},
        {&zemCEC::getMaxProcPools, "-r|proc|--level|sys|-m|al \"pha|-F|max_shared_proc_pools"},
    };
    // What the tool prints, and what the first and the second call give.
    const std::tuple<const char*, int, int> answers[] = {
        {"64\n1\n", 64, 64}, {"", 0, 0}, {"null\n", 0, 0}, {"-1\n", -1, 5}};
    ToolFolder tools;
    for (const auto& [get, arguments] : rows) {
        for (const auto& [output, first, second] : answers) {
            zemCEC host(kHost, "al \"pha");
            tools.recorder("qyalloc", output);
            EXPECT_EQ(first, (host.*get)()) << output;
            EXPECT_EQ(arguments, tools.arguments());
            tools.recorder("qyalloc", "5\n");
            EXPECT_EQ(second, (host.*get)()) << output;
        }
    }
}

TEST(VirtualSystemRepTest, PartitionsAndPoolsAreFoundByNumber) {
    zemCEC host;
    for (const char* id : {"1", "9", "17", "9"}) {
        host.addLpar(new zemLPAR(kHost, id));
    }
    zemLparHashType table = host.getLparHashMapping();
    zemLPAR* found = nullptr;
    EXPECT_EQ(0, table.lookup("9", found));
    EXPECT_EQ(host.getLPARs().getElementAt(1), found);
    table.clear();  // a copy
    host.getLPARs().removeElementAt(0);
    EXPECT_EQ(0, host.getLparHashMapping().lookup("1", found));
    host.setLparHashState(false);
    EXPECT_EQ(3, host.getLparHashMapping().lookup("1", found));

    auto pool = std::make_unique<zemProcessorPoolResource>(kHost);
    pool->setSharedProcPoolId("2");
    host.addProcessorPool(pool.release());
    EXPECT_EQ(host.getProcessorPool().getElementAt(0), &host.getProcessorPool("2"));
    EXPECT_EQ("3/zemCEC/getProcessorPool//Pool ID : 3",
              failureText([&] { host.getProcessorPool("3"); }));
}

/// A RASD that counts how many like it there are.
struct CountedRASD : zemMemoryRASD {
    CountedRASD() { ++count; }
    ~CountedRASD() override { --count; }
    inline static int count = 0;
};

TEST(VirtualSystemRepTest, StateSettingsTakeOverWhatOthersOwn) {
    {
        zemLPAR lpar("1");
        lpar.getStateVSSD().addRASD(new CountedRASD);
        for (int round = 0; round < 2; ++round) {
            zemVSSD vssd(kHost, "1", "normal");
            vssd.addRASD(new CountedRASD);
            vssd.addRASD(new CountedRASD);
            vssd.getRASDSet().addElement(new zemMemoryRASettingDataState);
            lpar.setStateVSSD(vssd);
            EXPECT_EQ(2, CountedRASD::count);
            EXPECT_EQ(lpar.getStateVSSD().getRASDs()[1], vssd.getRASDs()[1]);  // still readable
        }
        lpar.setStateVSSD(lpar.getStateVSSD());
        EXPECT_EQ("2|1|normal|", joined(CountedRASD::count, lpar.getStateVSSD().getRASDSet().size(),
                                        lpar.getStateVSSD().getProfileName()));
        zemVSSD borrowed;
        CountedRASD mine;
        borrowed.getRASDs().relinquishOwnership();
        borrowed.addRASD(&mine);
        lpar.setStateVSSD(borrowed);
        EXPECT_EQ(1, CountedRASD::count);
    }
    EXPECT_EQ(0, CountedRASD::count);
}

/// A host with partitions that own something of everything, handed from array to array.
void buildAndDrop(int partitions) {
    zemDynamicArray<zemCEC> hosts;
    hosts.addElement(new zemCEC(kHost, "alpha"));
    zemCEC& host = *hosts[0];
    for (int i = 0; i < partitions; ++i) {
        auto lpar = std::make_unique<zemLPAR>(kHost, zemString(i));
        for (const char* profile : {"normal", "other"}) {
            auto vssd = std::make_unique<zemVSSD>(kHost, zemString(i), profile);
            vssd->addRASD(3, "");
            vssd->getRASDSet().addElement(new zemProcessorRASettingDataDefined);
            lpar->setStateVSSD(*vssd);
            lpar->addDefinedVSSD(vssd.release());
        }
        lpar->addLparProfile(new zemPartitionProfileConfiguration);
        lpar->addLparIOSlot(new zemPartitionIOSlotResource);
        lpar->addLparSerialAdapter(new zemPartitionSerialAdapterResource);
        lpar->addLparSCSIAdapter(new zemPartitionSCSIAdapterResource);
        lpar->addLparEthernetAdapter(new zemPartitionEthernetAdapterResource);
        host.addLpar(lpar.release());
    }
    host.getLparHashMapping();
    host.getRPs().addElement(new zemMemoryPool);
    host.buildupVirtualLpar();
    host.buildupVirtualLpar();
    host.releaseVirtualLpar();
    zemDynamicArray<zemCEC> moved = hosts;
    zemDynamicArray<zemLPAR> taken = moved[0]->getLPARs();
    taken.setSize(partitions / 2);
    hosts = moved;
    hosts.clear();
}

TEST(VirtualSystemRepTest, NothingStaysOfManyPartitions) {
    buildAndDrop(2);
    const long before = FailingAllocation::live();
    buildAndDrop(10000);
    EXPECT_EQ(before, FailingAllocation::live());
}

std::unique_ptr<zemRASD> rasd(int type, const char* key) {
    return std::unique_ptr<zemRASD>(zemVSSD::createRASD(type, key));
}

/// Type, units and both automatic flags, as "3 Percent 11".
std::string constantsOf(zemRASD& rasd) {
    const zemRASDCommData& data = *rasd.getData();
    return std::to_string(data.m_ResourceType) + ' ' + std::string(data.m_AllocationUnits) + ' ' +
           std::to_string(data.m_AutomaticAllocation) +
           std::to_string(data.m_AutomaticDeallocation);
}

TEST(VirtualSystemRepTest, EachKindHasItsKeyItsConstantsAndItsIds) {
    const struct {
        const char *key, *made, *constants, *state, *defined;
        const char* keyOfState;    ///< behind setInstanceID() with the ID of the state side
        const char* keyOfDefined;  ///< and of the defined side
    } rows[] = {
        {"x-9", "3-Processor", "3 Percent 11", "ORX:4*7*", "ORX:2*a-b-7*", "3-Processor",
         "3-Processor"},
        {"x-9", "4-Memory", "4 byte*2^10 11", "ORX:4*7*", "ORX:2*a-b-7*", "4-Memory", "4-Memory"},
        {"6-13-4", "6-13", "6 Adapter 10", "ORX:4*13*7*", "ORX:2*a-b-13*7*", "6-13", "6-13"},
        {"13", "10--1", "10 Adapter 11", "ORX:4*-1*7*", "ORX:2*a-b--1*7*", "10--1", "10-1"},
        {"12-2101A003", "12-2101A003", "12 Slot 10", "ORX:4*2101A003*7*", "ORX:2*a-b-2101A003*7*",
         "12-2101A003*7", "12-2101A003*7"},
        {"21-99999999999", "21-2147483647", "21 Adapter 10", "ORX:4*2147483647*7*",
         "ORX:2*a-b-2147483647*7*", "21-2147483647", "21-2147483647"},
    };
    for (const auto& row : rows) {
        const int type = std::atoi(row.constants);
        std::unique_ptr<zemRASD> made = rasd(type, row.key);
        EXPECT_STREQ(row.made, made->getKey());
        EXPECT_EQ(row.constants, constantsOf(*made));
        EXPECT_STREQ("", made->getInstanceID(false, nullptr));
        EXPECT_EQ(
            "3/zemRASD/getInstanceID//When re-generating InstanceID, the parameter vssd is "
            "required.",
            failureText([&] { made->getInstanceID(true, nullptr); }));
        zemVSSD vssd(kHost, "7", "a-b");
        for (const bool isState : {true, false}) {
            vssd.GenerateInstanceID(isState);
            const std::string id = std::string(isState ? row.state : row.defined) + kHost;
            EXPECT_EQ(id, std::string(made->getInstanceID(true, &vssd)));
            EXPECT_EQ(id, std::string(made->getInstanceID(false, nullptr)));
            std::unique_ptr<zemRASD> read = rasd(type, "");
            read->setInstanceID(id.c_str(), kHost);
            EXPECT_STREQ(isState ? row.keyOfState : row.keyOfDefined, read->getKey());
            EXPECT_EQ(id, std::string(read->getInstanceID(false, nullptr)));
        }
        // Too short for the host: stored, and nothing read from it.
        std::unique_ptr<zemRASD> read = rasd(type, row.key);
        read->setInstanceID("ORX:4*5*", kHost);
        EXPECT_STREQ(row.made, read->getKey());
    }
}

TEST(VirtualSystemRepTest, CopiesHaveNoAddress) {
    zemVETHRASD adapter("10-4");
    adapter.m_Data.m_Address = "A2";
    adapter.m_Data.m_vswitch = "net";
    adapter.m_Data.m_AddVLANIDs.append(20);
    adapter.m_Data.m_ResourceType = 5;
    const std::unique_ptr<zemRASD> clone(adapter.clone());
    const auto& copy = static_cast<zemVETHRASD&>(*clone).m_Data;
    EXPECT_TRUE(copy.m_Address.isEmpty());
    EXPECT_EQ(10, copy.m_ResourceType);
    EXPECT_STREQ("net", copy.m_vswitch);
    EXPECT_EQ(20, copy.m_AddVLANIDs[0]);
    EXPECT_FALSE(adapter.equals(clone.get()));
    const zemRASDCommData common(&adapter.m_Data);
    EXPECT_TRUE(common.m_Address.isEmpty() && common.getKey().isEmpty());
    EXPECT_EQ(5, common.m_ResourceType);

    zemProcessorRASD processor("");
    processor.setMTMS(kHost);
    const std::unique_ptr<zemRASD> other(processor.clone());
    EXPECT_TRUE(processor.equals(other.get()));
    EXPECT_STREQ("", static_cast<zemProcessorRASD&>(*other).getMTMS());
}

/// One with a changed field is another.
template <class Rasd, class Data, class Value, class... Field>
void expectChangesSeen(const Value& value, Field Data::*... fields) {
    Rasd mine("0-1");
    EXPECT_FALSE(mine.equals(nullptr));
    const auto check = [&](auto field) {
        Rasd other("0-1");
        EXPECT_TRUE(mine.equals(&other));
        other.m_Data.*field = value;
        EXPECT_FALSE(mine.equals(&other)) << mine.getKey();
        EXPECT_TRUE(other.equals(&other));
    };
    (check(fields), ...);
}

TEST(VirtualSystemRepTest, EqualsComparesAllFields) {
    using Common = zemRASDCommData;
    expectChangesSeen<zemMemoryRASD>("x", &Common::m_InstanceID, &Common::m_PoolID,
                                     &Common::m_SharingMode, &Common::m_AllocationUnits,
                                     &Common::m_Address);
    expectChangesSeen<zemMemoryRASD>(
        0, &Common::m_Weight, &Common::m_ConsumerVisibility, &Common::m_MappingBehavior,
        &Common::m_ResourceType, &Common::m_VirtualMinimum, &Common::m_VirtualQuantity,
        &Common::m_VirtualMaximum, &Common::m_Minimum, &Common::m_Reservation,
        &Common::m_AutomaticAllocation, &Common::m_AutomaticDeallocation, &Common::m_IsRequired);
    expectChangesSeen<zemMemoryRASD>(std::int64_t{1} << 32, &Common::m_Limit);
    expectChangesSeen<zemProcessorRASD>("x",
                                        &zemProcessorRASD::zemProcessorRASDData::m_ProcCompatMode);
    expectChangesSeen<zemIOSlotRASD>("x", &zemIOSlotRASD::zemIOSlotRASDData::m_DRCIndex);
    using Remote = zemRemoteAdapterRASDData;
    expectChangesSeen<zemVSCSIRASD>(0, &Remote::m_VirtualAdapterType, &Remote::m_SlotID,
                                    &Remote::m_RemoteClientFlag, &Remote::m_RemoteClientSlotFlag,
                                    &Remote::m_RemoteSlotID);
    expectChangesSeen<zemVSCSIRASD>("x", &Remote::m_RemoteVirtualSystemID);
    using Ethernet = zemVETHRASD::zemVETHRASDData;
    expectChangesSeen<zemVETHRASD>(0, &Ethernet::m_SlotID, &Ethernet::m_IEEECompatible,
                                   &Ethernet::m_PortVLANID, &Ethernet::m_TrunkPriority);
    expectChangesSeen<zemVETHRASD>("x", &Ethernet::m_vswitch);
    zemVSCSIRASD scsi;
    zemVSERIALRASD serial;
    serial.m_Data.m_ResourceType = scsi.m_Data.m_ResourceType;
    EXPECT_FALSE(scsi.equals(&serial));
}

TEST(VirtualSystemRepTest, ListsAreComparedAsFarAsThisOneGoes) {
    zemVETHRASD fewer("10-4"), more("10-4");
    fewer.m_Data.m_AddVLANIDs.append(5);
    more.m_Data.m_AddVLANIDs.append(5);
    more.m_Data.m_AddVLANIDs.append(0);
    EXPECT_TRUE(fewer.equals(&more));
    EXPECT_FALSE(more.equals(&fewer));
    zemIOSlotRASD untagged, tagged;
    tagged.m_Data.m_TaggedIOType.append(1);
    EXPECT_TRUE(untagged.equals(&tagged));
    EXPECT_FALSE(tagged.equals(&untagged));
}

/// Partition 4 of the demo's first host, which has two profiles, and tools that leave their lines.
class InitializeTest : public testing::Test {
protected:
    InitializeTest() {
        for (const std::string tool : {"qyplat", "qyalloc"}) {
            m_appliance.replaceTool(tool, "echo " + tool + " \"$@\" >>" + lines() + "\nexec " +
                                              ZEM_PROGRAMS "/" + tool + " \"$@\"");
        }
    }
    ~InitializeTest() override { EXPECT_EQ(0, librarySpy.held); }

    /// What the partition is from here on.
    static void setUp(const std::string& state, const std::string& currentProfile) {
        auto store = appliance::Store::open(appliance::Database::Access::Write);
        appliance::Transaction change = store.write();
        appliance::Object object = store.all(appliance::Kind::Lpar).at(3);
        object.set("state", state);
        object.set("curr_profile", currentProfile);
        store.put(object);
        change.commit();
    }

    /// The partition filled, and what asked for then: operations of the library, lines of tools.
    std::unique_ptr<zemLPAR> filled(const std::string& className, int type) {
        librarySpy.names.clear();
        std::filesystem::remove(lines());
        auto lpar = std::make_unique<zemLPAR>(kHost, "4");
        EXPECT_EQ(0, lpar->initialize(&m_host, "", className.c_str(), type));
        m_asked.clear();
        for (const std::string& name : librarySpy.names) {
            m_asked += name + ' ';
        }
        m_asked += testing_support::contents(lines());
        return lpar;
    }

    std::string lines() const { return (m_appliance.folder() / "lines").string(); }

    testing_support::DemoAppliance m_appliance{ZEM_PROGRAMS};
    zemCEC m_host{kHost, "alpha"};
    std::string m_asked;
};

std::string shown(zemVSSD& v) {
    return joined(v.getInstanceID(), v.getLparName(), v.getBootMode(), v.getRASDSet().size());
}

TEST_F(InitializeTest, FillsPartitionsInEveryState) {
    const std::string end = "4*1111-AAA*0000001|", state = "ORX:4*" + end;
    const std::string first = "ORX:2*normal-" + end, second = "ORX:2*small, \"safe\"-" + end;
    const std::string processor = "ORXC_ProcessorRASettingData";
    for (const std::string word : {"Not Activated", "Starting", "Running", "Shutting Down", "Error",
                                   "Open Firmware", "Suspended", "Not Available", "unknown"}) {
        for (const std::string current : {"NORMAL", "", "null", "small, \"safe\""}) {
            setUp(word, current);
            const bool isNone = current.empty() || current == "null";
            const std::string names = "normal|" + (isNone ? "normal" : current) + '|';
            const std::string running = current[0] == 's' ? "norm" : "sms";  // its boot mode
            const bool isActive = word != "Not Activated";
            // Processors of a partition that is not active have no state side.
            const std::string processors =
                isActive ? state + "zemNULL|" + running + "|1|" : "|zemNULL|" + running + "|0|";
            // The type, the class, and partition, state VSSD and defined VSSDs.
            // clang-format off
            const std::tuple<int, std::string, std::string, std::string, std::string, std::string> rows[] = {
                {VISITOR_TYPE_VSSD_INIT, "", "db,main|" + names + "tmxlinux|manual|", state + "db,main|" + running + "|0|", "db,main|sms|0|", "db,main|norm|0|"},
                {VISITOR_TYPE_VSSD_INIT_NI, "", "zemNULL|" + names + "zemNULL|zemNULL|", state + "||0|", "||0|", "||0|"},
                {VISITOR_TYPE_RASD_INIT, processor, "zemNULL|" + names + "zemNULL|zemNULL|", processors, "zemNULL|sms|1|", "zemNULL|norm|1|"},
                {VISITOR_TYPE_RASD_INIT_NI, processor, "zemNULL|" + names + "zemNULL|zemNULL|", processors, "zemNULL|sms|1|", "zemNULL|norm|1|"},
            };
            for (const auto& [type, className, partition, stateSide, normal, small] : rows) {
                SCOPED_TRACE(word + ' ' + current + ' ' + std::to_string(type));
                const auto l = filled(className, type);
                EXPECT_EQ(word, std::string(l->getState()));
                EXPECT_EQ(partition, joined(l->getLparName(), l->getDefaultProfileName(), l->getCurrentProfileName(), l->getVirtualSystemType(), l->getKeyLock()));
                EXPECT_EQ(stateSide, shown(l->getStateVSSD()));
                ASSERT_EQ(2, l->getDefinedVSSDs().size());
                EXPECT_EQ(first + normal, shown(*l->getDefinedVSSDs()[0]));
                EXPECT_EQ(second + small, shown(*l->getDefinedVSSDs()[1]));
            }
            // clang-format on
        }
    }
}

TEST_F(InitializeTest, AsksOnceForEachListOfAdapters) {
    // clang-format off
    const std::string partition = "getCecObj getLparObj getLparObj getAllLparProfilesFromLpar ", profile = "getLparProfile ", both = partition + profile + profile;
    const std::string system = " -m 1111-AAA*0000001 --filter lpar_ids=4 ", virtualIO = both + "qyalloc -r virtualio --rsubtype ";
    const std::string slot = system + "--level lpar -F slot_num,adapter_type,", remote = "remote_lpar_id,remote_lpar_name,remote_slot_num,is_required\n";
    const std::string profiles = "qyplat -r prof" + system + "-F name,lpar_name,lpar_id,lpar_env,all_resources,min_mem,desired_mem,max_mem,proc_mode,min_proc_units,desired_proc_units,max_proc_units,"
        "min_procs,desired_procs,max_procs,sharing_mode,uncap_weight,io_slots,lpar_io_pool_ids,max_virtual_slots,virtual_serial_adapters,virtual_scsi_adapters,virtual_eth_adapters,boot_mode,"
        "conn_monitoring,auto_start,redundant_err_path_reporting\n";
    const std::tuple<int, const char*, std::string> rows[] = {
        {VISITOR_TYPE_VSSD_INIT, "Serial", both + profiles},
        {VISITOR_TYPE_VSSD_INIT_NI, "Serial", partition},
        {VISITOR_TYPE_RASD_INIT, "Processor", both + profile + profile + profile + "qyalloc -r proc --level lpar" + system + "-F lpar_id,curr_proc_mode,curr_min_proc_units,curr_max_proc_units,curr_min_procs,"
            "curr_max_procs,curr_sharing_mode,pend_shared_proc_pool_id,pend_min_proc_units,pend_max_proc_units,pend_min_procs,pend_max_procs,run_proc_units,run_procs,run_uncap_weight\n"},
        {VISITOR_TYPE_RASD_INIT, "Memory", both + profile + profile + "qyalloc -r mem --level lpar" + system + "-F lpar_id,curr_min_mem,curr_max_mem,pend_min_mem,pend_max_mem,run_mem,mem_mode,run_mem_weight,run_io_entitled_mem\n"},
        {VISITOR_TYPE_RASD_INIT_NI, "Processor", both},
        {VISITOR_TYPE_RASD_INIT, "IOSlotAdapter", both},
        {VISITOR_TYPE_RASD_INIT, "Other", both},
        {VISITOR_TYPE_RASD_INIT, "EthernetAdapter", partition + profile + "getLparVirtualEthernet " + profile},
        {VISITOR_TYPE_RASD_INIT_NI, "SerialAdapter", virtualIO + "serial" + slot + "supports_dnx," + remote},
        {VISITOR_TYPE_RASD_INIT, "SCSIAdapter", virtualIO + "scsi" + slot + remote},
        {VISITOR_TYPE_RASD_PROC, "Processor", ""},
        {VISITOR_TYPE_CONF_CAP_INIT, "Processor", ""},
    };
    // clang-format on
    for (const auto& [type, kind, asked] : rows) {
        filled(std::string("ORXC_") + kind + "RASettingData", type);
        EXPECT_EQ(asked, m_asked) << kind << type;
    }
}

TEST_F(InitializeTest, FailuresPass) {
    const char* const calls[] = {"getCecObj", "getLparObj", "getAllLparProfilesFromLpar",
                                 "getLparProfile"};
    const auto fill = [&] { filled("", VISITOR_TYPE_VSSD_INIT); };
    for (const char* call : calls) {
        planAnswer(call, 6);
        EXPECT_THROW(fill(), zemAccessDeniedException) << call;
    }
    m_appliance.replaceTool("qyplat", "echo No results were found.; exit 1");
    EXPECT_THROW(fill(), zemObjectNotFoundException);
}

}  // namespace

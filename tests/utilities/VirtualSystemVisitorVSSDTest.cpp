#include <gtest/gtest.h>

#include <cstring>
#include <functional>
#include <memory>
#include <sstream>

#include "LibraryFaults.h"
#include "LibrarySpy.h"
#include "QyallocCmdCaller.h"
#include "QyplatCmdCaller.h"
#include "ToolFolder.h"
#include "VirtualSystemVisitor.h"

namespace {

using Partition = zemQyplatCmdCaller::PartitionAttribute;
using Profile = zemQyplatCmdCaller::PartitionProfileAttribute;
using Processor = zemQyallocCmdCaller::ProcessorResourceAttribute::LparLevelAttribute;
using Memory = zemQyallocCmdCaller::MemoryResourceAttribute::LparLevelAttribute;
using VirtualIO = zemQyallocCmdCaller::VirtualIOResourceAttribute;
using Slot = zemQyallocCmdCaller::PhyIOResourceAttribute::SlotAttribute;

constexpr char kHost[] = "1111-AAA*0000001";
constexpr int kAllKinds = VISITOR_TYPE_RASD_PROC | VISITOR_TYPE_RASD_MEM |
                          VISITOR_TYPE_RASD_IOSLOT | VISITOR_TYPE_RASD_VSCSI |
                          VISITOR_TYPE_RASD_VSERIAL | VISITOR_TYPE_RASD_VETH;

/// A record of a tool, of "attribute=value" with ";" between them; of two the last counts.
template <class Table>
zemRecordType record(const std::string& values) {
    zemRecordType result(8);
    std::istringstream all(values);
    for (std::string one; std::getline(all, one, ';');) {
        const size_t equals = one.find('=');
        for (int i = 0; i < static_cast<int>(std::size(Table::m_attributeName)); ++i) {
            if (one.substr(0, equals) == Table::m_attributeName[i]) {
                result.remove(i);
                result.insert(i, one.c_str() + equals + 1);
            }
        }
    }
    return result;
}

/// Records of such texts.
template <class Table>
zemRecordSetsType records(const std::vector<std::string>& texts) {
    zemRecordSetsType all;
    for (const std::string& text : texts) {
        all.addElement(new zemRecordType(record<Table>(text)));
    }
    return all;
}

std::string quantities(const zemRASDCommData& data) {
    return joined(data.m_MappingBehavior, data.m_ConsumerVisibility, data.m_PoolID,
                  data.m_SharingMode, data.m_Weight) +
           joined(data.m_VirtualMinimum, data.m_VirtualQuantity, data.m_VirtualMaximum,
                  data.m_Minimum, data.m_Reservation, data.m_Limit);
}

std::string listed(const zemArray<int>& numbers) {
    std::string text;
    for (int i = 0; i < numbers.size(); ++i) {
        text += (i == 0 ? "" : ",") + std::to_string(numbers[i]);
    }
    return text;
}

/// What tells a slot or an adapter from its like; its key alone if it lacks what all have alike.
std::string textOf(zemRASD* rasd) {
    if (rasd == nullptr) {
        return "null";
    }
    const zemRASDCommData& common = *rasd->getData();
    const bool isSlot = common.m_ResourceType == 12;
    if (quantities(common) !=
            (isSlot ? "2|2|0||-1|1|1|1|-1|-1|-1|" : "1|3|0||-1|1|1|1|-1|-1|-1|") ||
        common.m_AllocationUnits != (isSlot ? "Slot" : "Adapter") ||
        common.m_AutomaticAllocation != 1 || common.m_AutomaticDeallocation != 0) {
        return std::string(rasd->getKey());
    }
    const std::string required = std::to_string(common.m_IsRequired);
    if (auto* slot = dynamic_cast<zemIOSlotRASD*>(rasd)) {
        return joined(slot->m_Data.m_DRCIndex, listed(slot->m_Data.m_TaggedIOType)) + required;
    }
    if (auto* ethernet = dynamic_cast<zemVETHRASD*>(rasd)) {
        const auto& data = ethernet->m_Data;
        return joined(data.m_SlotID, data.m_IEEECompatible, data.m_PortVLANID,
                      listed(data.m_AddVLANIDs), data.m_TrunkPriority, data.m_vswitch,
                      data.m_Address) +
               required;
    }
    const auto& data = dynamic_cast<zemRemoteAdapterRASDData&>(*rasd->getData());
    return joined(data.m_SlotID, data.m_VirtualAdapterType, data.m_RemoteClientFlag,
                  data.m_RemoteVirtualSystemID, data.m_RemoteClientSlotFlag, data.m_RemoteSlotID) +
           required;
}

/// The RASDs of a VSSD but processors and memory, which stand as their keys.
std::string rasdsOf(zemVSSD& vssd) {
    std::string all;
    for (int i = 0; i < vssd.getRASDs().size(); ++i) {
        all += (i == 0 ? "" : " ") + textOf(vssd.getRASDs().getElementAt(i));
    }
    return all;
}

std::string dumpOf(zemVSSD& vssd) {
    testing::internal::CaptureStdout();
    zemVSSD::dumpVSSD(&vssd);
    return testing::internal::GetCapturedStdout();
}

class VirtualSystemVisitorVSSDTest : public testing::Test {
protected:
    using Vssd = std::unique_ptr<zemVSSD>;
    using Lpar = std::unique_ptr<zemLPAR>;

    ~VirtualSystemVisitorVSSDTest() override { EXPECT_EQ(0, librarySpy.held); }
    void setPools(int count) {
        zemSystemMemoryResource memory(kHost);
        memory.setMaxMemPools(count);
        m_host.setMemory(memory);
        zemSystemProcessorResource processor(kHost);
        processor.setMaxSharedProcPools(count);
        m_host.setProcessor(processor);
    }
    /// The VSSD of records of a running partition "3" with the profile "p".
    Vssd running(const std::string& profile, const std::vector<std::string>& slots,
                 const std::vector<std::string>& serial, const std::vector<std::string>& scsi,
                 const std::vector<std::string>& ethernet) {
        return Vssd(m_visitor.getStateVSSD(
            record<Partition>("lpar_id=3;state=Running;curr_profile=p"),
            record<Profile>("lpar_id=3;name=p;" + profile), records<Processor>({}),
            records<Memory>({}), records<Slot>(slots),
            records<VirtualIO::SerialLparLevelAttribute>(serial),
            records<VirtualIO::SCSILparLevelAttribute>(scsi),
            records<VirtualIO::EthLparLevelAttribute>(ethernet), kAllKinds));
    }

    ToolFolder m_tools;
    zemCEC m_host{kHost, "alpha"};
    zemVSSDVisitor m_visitor{&m_host, ""};
    zemLPARVisitor m_partitions{&m_host, ""};
};

struct Case {
    const char* attributes;
    const char* expected;
    int pools = 0;
};

TEST_F(VirtualSystemVisitorVSSDTest, DecidesProcessors) {
    const char* const pending[] = {
        "pend_min_procs=2;curr_min_procs=1;pend_max_procs=8;curr_max_procs=6;"
        "pend_min_proc_units=0.50;curr_min_proc_units=0.25;pend_max_proc_units=4.00;"
        "curr_max_proc_units=2.29;",
        "pend_min_procs=1;curr_min_procs=2;pend_max_procs=6;curr_max_procs=8;"
        "pend_min_proc_units=0.25;curr_min_proc_units=0.50;pend_max_proc_units=2.29;"
        "curr_max_proc_units=4.00;"};
    const std::string run =
        "run_procs=3;run_proc_units=1.25;run_uncap_weight=64;pend_shared_proc_pool_id=2;";
    const Case runs[] = {
        {"curr_proc_mode=shared;curr_sharing_mode=uncap", "1|3|2|uncap|64|200|300|600|50|125|229|"},
        {"curr_proc_mode=shared;curr_sharing_mode=cap", "1|3|2|cap|-1|200|300|600|50|125|229|"},
        {"curr_proc_mode=ded;curr_sharing_mode=keep_idle_procs",
         "2|2|Primordial|keep_idle_procs|-1|200|300|600|200|300|600|"},
        {"curr_proc_mode=ded;curr_sharing_mode=uncap",
         "2|2|Primordial|uncap|-1|200|300|600|200|300|600|"},
        // Whatever comes from outside has a value.
        {"curr_proc_mode=shared;run_procs=;run_proc_units=nan", "1|3|2||-1|200|0|600|50|0|229|"},
        {"curr_proc_mode=shared;run_procs=-9999999999;run_proc_units=-inf",
         "1|3|2||-1|200|-214748364800|600|50|-9223372036854775808|229|"},
        {"curr_proc_mode=shared;run_procs=0x9;run_proc_units= 1e30x",
         "1|3|2||-1|200|0|600|50|9223372036854775807|229|"},
    };
    for (const Case& each : runs) {
        for (const char* quantitiesOf : pending) {
            const zemRecordType source = record<Processor>(quantitiesOf + run + each.attributes);
            zemProcessorRASD rasd;
            EXPECT_TRUE(m_visitor.getProcessorRASDData(&source, &rasd.m_Data));
            EXPECT_EQ(each.expected, quantities(rasd.m_Data)) << each.attributes;
        }
    }
    const std::string profile =
        "min_procs=1;desired_procs=2;max_procs=4;min_proc_units=0.10;desired_proc_units=1.25;"
        "max_proc_units=2.0;uncap_weight=128;lpar_proc_compat_mode=CORAL7;";
    const Case profiles[] = {
        {"proc_mode=Shared;sharing_mode=uncap;shared_proc_pool_id=3",
         "1|3|0|uncap|128|100|200|400|10|125|200|", 0},
        {"proc_mode=shared;sharing_mode=cap;shared_proc_pool_id=3",
         "1|3|3|cap|-1|100|200|400|10|125|200|", 1},
        {"proc_mode=shared;sharing_mode=uncap;shared_proc_pool_id=null",
         "1|3|0|uncap|128|100|200|400|10|125|200|", 64},
        {"proc_mode=ded;sharing_mode=uncap;shared_proc_pool_id=3",
         "2|2|Primordial|uncap|-1|100|200|400|100|200|400|", 1},
    };
    for (const Case& each : profiles) {
        setPools(each.pools);
        zemCECCapability capability;
        capability.m_lparProcCompatModes = each.pools == 0 ? "" : "0";
        m_host.setCapability(&capability);
        const Vssd vssd(m_visitor.getProfileVSSD(record<Partition>(""),
                                                 record<Profile>(profile + each.attributes),
                                                 VISITOR_TYPE_RASD_PROC));
        auto& rasd = dynamic_cast<zemProcessorRASD&>(*vssd->getRASD("3-Processor"));
        EXPECT_EQ(each.expected, quantities(rasd.m_Data)) << each.attributes;
        EXPECT_STREQ(each.pools == 0 ? "" : "CORAL7", rasd.m_Data.m_ProcCompatMode);
        EXPECT_EQ(1, vssd->getRASDs().size());
    }
}

TEST_F(VirtualSystemVisitorVSSDTest, DecidesMemory) {
    const char* const pending[] = {"pend_min_mem=2;curr_min_mem=1;pend_max_mem=8;curr_max_mem=6;",
                                   "pend_min_mem=1;curr_min_mem=2;pend_max_mem=6;curr_max_mem=8;"};
    const char* const dedicated = "2|2|Primordial||-1|2048|3072|6144|2048|3072|6144|";
    const Case runs[] = {
        {"mem_mode=shared", "1|3|0||7|3072|3072|3072|-1|1024|-1|", 1},
        {"mem_mode=shared", dedicated, 0},
        {"mem_mode=ded", dedicated, 1},
        {"mem_mode=ded;run_mem=99999999999",
         "2|2|Primordial||-1|2048|2199023254528|6144|2048|2199023254528|6144|", 1},
        {"mem_mode=ded;run_mem=-1", "2|2|Primordial||-1|2048|-1024|6144|2048|-1024|6144|", 1},
    };
    for (const Case& each : runs) {
        setPools(each.pools);
        for (const char* limits : pending) {
            const zemRecordType source = record<Memory>(
                std::string(limits) + "run_mem=3;run_mem_weight=7;run_io_entitled_mem=1;" +
                each.attributes);
            zemMemoryRASD rasd;
            EXPECT_TRUE(m_visitor.getMemoryRASDData(&source, &rasd.m_Data));
            EXPECT_EQ(each.expected, quantities(rasd.m_Data)) << each.attributes;
        }
    }
    const char* const stored = "2|2|Primordial||-1|1024|2048|3072|1024|2048|3072|";
    const Case profiles[] = {
        {"mem_mode=Shared;desired_io_entitled_mem=4", "1|3|0||7|1024|2048|3072|-1|4096|-1|", 1},
        {"mem_mode=shared;desired_io_entitled_mem=auto", "1|3|0||7|1024|2048|3072|-1|-1|-1|", 1},
        {"mem_mode=shared;desired_io_entitled_mem=null", "1|3|0||7|1024|2048|3072|-1|-1|-1|", 1},
        {"mem_mode=shared;desired_io_entitled_mem=4", stored, 0},
        {"mem_mode=ded;desired_io_entitled_mem=4", stored, 1},
    };
    for (const Case& each : profiles) {
        setPools(each.pools);
        const std::string values = "min_mem=1;desired_mem=2;max_mem=3;mem_weight=7;";
        const Vssd vssd(m_visitor.getProfileVSSD(record<Partition>(""),
                                                 record<Profile>(values + each.attributes),
                                                 VISITOR_TYPE_RASD_MEM));
        EXPECT_EQ(each.expected, quantities(*vssd->getRASD("4-Memory")->getData()))
            << each.attributes;
    }
}

TEST_F(VirtualSystemVisitorVSSDTest, MakesRASDsOfElements) {
    const struct {
        int type;
        const char* element;
        const char* expected;
    } rows[] = {
        // slot, client, any partner, partner, any slot, slot; required
        {21, "4/server/1/any//any/0", "4|0|1||1|-2|0"},
        {21, "4/server/1/3//5/1", "4|0|0|3|0|5|1"},
        {21, "4/client/0/3/web/5/1", "4|1|-1|3|-1|5|1"},
        {6, "3/client/1/a,b/13/1", "3|1|-1|1|-1|13|1"},
        {6, "\"14/server/4/db,main/any/0\"", "14|0|0|4|1|-2|0"},
        {6, "9/what/any//any/", "9|-1|1||1|-2|-1"},
        // slot, IEEE, VLAN, VLANs, trunk priority, switch, address; required
        {10, "5/1/7/\"20,30\"/1/1/storage", "5|1|7|20,30|1|storage||1"},
        {10, "\"5/1/7/20,30/1/1/storage\"", "5|1|7|20,30|1|storage||1"},
        {10, "2/0/1//0/0", "2|0|1||0|||0"},
        {12, "30000001/none/1", "30000001||1"},
        {12, "", "null"},
        {12, "\"", "null"},
        {5, "1/2/3", "null"},
    };
    for (const auto& row : rows) {
        const std::unique_ptr<zemRASD> rasd(zemVSSDVisitor::createIORASD(row.element, row.type));
        EXPECT_EQ(row.expected, textOf(rasd.get())) << row.element;
    }
    const struct {
        const char* list;
        const char* expected;
        const char* failure;
    } lists[] = {
        {"", "", ""},
        {"None", "", ""},
        {"null", "", ""},
        {"A//1,\"B,C//0\",,D//0,", "A||1 B,C||0 D||0", ""},
        {"A//1,\"B,C//0,D//0", "A||1",
         "6/zemCommandCaller/callLsCommand/qyplat -r prof/INVALID_RECORD/\"B,C//0,D//0,"},
    };
    for (const auto& row : lists) {
        zemVSSD vssd;
        EXPECT_EQ(
            row.failure,
            failureText([&] { zemVSSDVisitor::createIORASDs(row.list, 12, &vssd); }, "kcmait"));
        EXPECT_EQ(row.expected, rasdsOf(vssd)) << row.list;
    }
}

TEST_F(VirtualSystemVisitorVSSDTest, DecidesRunningAdapters) {
    const char* const profile =
        "io_slots=A//1,B//0,c//0;console_slot=b;op_console_slot=X;load_source_slot=none;"
        "alt_console_slot=0;alt_restart_device_slot=null;virtual_scsi_adapters=3/client/1//13/1;"
        "virtual_eth_adapters=2/0/1//0/0/inside";
    testing::internal::CaptureStdout();
    const Vssd vssd = running(
        profile, {"drc_index=B", "drc_index=a", "drc_index=Z"},
        {"slot_num=0;adapter_type=Server;supports_dnx=0;remote_lpar_id=any;remote_slot_num=5;"
         "is_required=1",
         "slot_num=1;adapter_type=server;supports_dnx=1;remote_lpar_id=any",
         "slot_num=6;adapter_type=client;supports_dnx=1;remote_lpar_id=4;remote_slot_num=7"},
        {"slot_num=3;adapter_type=client;remote_lpar_id=1;remote_slot_num=13;is_required=0",
         "slot_num=4;adapter_type=server;remote_lpar_id=2;remote_slot_num=any;is_required=1"},
        {"slot_num=2;ieee_virtual_eth=1;port_vlan_id=9;addl_vlan_ids=\"20,30\";is_trunk=1;"
         "trunk_priority=3;is_required=1;mac_addr=A2",
         "slot_num=9"});
    const std::string output = testing::internal::GetCapturedStdout();
    EXPECT_NE(std::string::npos, output.find("=======getProfileVSSD:profileName:p\n")) << output;
    EXPECT_NE(std::string::npos, output.find("no slot RASD:12-X\n")) << output;
    EXPECT_EQ(
        "B|4|0 a||1 Z||0 0|0|1||1|-2|1 1|0|2||1|-2|0 6|1|-1|4|-1|7|0 3|1|-1|1|-1|13|1 "
        "4|0|0|2|0|0|0 2|1|9|20,30|3|inside|A2|1",
        rasdsOf(*vssd));

    // A profile's tags go to the slots that it names.
    const Vssd tagged(m_visitor.getProfileVSSD(
        record<Partition>("default_profile=P;lpar_keylock=manual"),
        record<Profile>("name=p;auto_start=1;redundant_err_path_reporting=1;io_slots=A//1,B//0;"
                        "load_source_slot=A;alt_restart_device_slot=A;console_slot=A;"
                        "alt_console_slot=A;op_console_slot=B"),
        VISITOR_TYPE_RASD_IOSLOT));
    EXPECT_EQ("A|1,2,4,5|1 B|6|0", rasdsOf(*tagged));
    EXPECT_EQ("1|1|1|P|manual|", joined(tagged->getIsDefault(), tagged->getAutoActivate(),
                                        tagged->getEnableRedundantErrorPathReporting(),
                                        tagged->getDefaultProfileName(), tagged->getKeylock()));

    // The model tells adapters by itself, and gives all slots all tags.
    zemLPAR lpar(kHost, "3");
    zemPartitionProfileConfiguration stored(kHost, "3");
    stored.setIoSlots("A//1,B//0,C//0");
    stored.setConsoleSlot("B");
    auto scsi = std::make_unique<zemPartitionSCSIAdapterResource>(kHost, "3");
    scsi->setSlotNum("5");
    scsi->setRemoteLparId("65535");
    scsi->setIsRequired("true");
    lpar.addLparSCSIAdapter(scsi.release());
    auto ethernet = std::make_unique<zemPartitionEthernetAdapterResource>(kHost, "3");
    ethernet->setSlotNum("9");
    ethernet->setTruukPriority("2");
    ethernet->setAddlVlanIds("[7,8]");
    ethernet->setVSwitch("outside");
    lpar.addLparEthernetAdapter(ethernet.release());
    auto slot = std::make_unique<zemPartitionIOSlotResource>(kHost, "3");
    slot->setDrcIndex("C");
    lpar.addLparIOSlot(slot.release());
    const Vssd defined(m_visitor.getProfileVSSD(&lpar, &stored, VISITOR_TYPE_RASD_IOSLOT));
    EXPECT_EQ("A|4|1 B|4|0 C|4|0", rasdsOf(*defined));
    EXPECT_STREQ("ORX:2*-A*3*1111-AAA*0000001",
                 defined->getRASDs().getElementAt(0)->getData()->m_InstanceID);
    Vssd state(m_visitor.getStateVSSD(&lpar, &stored, kAllKinds));
    EXPECT_EQ("C|4|0 5|1|1||1|-2|1 9|0|0|7,8|0|outside||0", rasdsOf(*state));
    lpar.setState("Not Activated");
    state.reset(m_visitor.getStateVSSD(&lpar, &stored, kAllKinds));
    EXPECT_EQ("5|1|1||1|-2|1 9|0|0|7,8|0|outside||0", rasdsOf(*state));
}

// All that the back end tells of each partition reads the same by records and by the model.
TEST_F(VirtualSystemVisitorVSSDTest, BothWaysGiveTheSame) {
    m_tools.makeAppliance(ZEM_PROGRAMS);
    zemVirtualizationManager manager;
    const std::unique_ptr<zemCECVisitor> hosts(manager.createCECVisitor());
    constexpr int all = zemCECVisitor::Level_All;
    ASSERT_EQ(1, hosts->initialize("", false, kHost, all));
    hosts->initializeLparResource("", "", all, 0);
    hosts->initializeLparProfile("", "", all);
    hosts->initializeProcessorLevelSys("", all);
    hosts->initializeProcessorLevelLpar("", "", all);
    hosts->initializeMemoryLevelSys("", all);
    hosts->initializeMemoryLevelLpar("", "", all);
    hosts->initializeIOSlotLevelLpar("", "", all);
    hosts->initializeSerialAdapterLevelLpar("", "", all);
    hosts->initializeSCSIAdapterLevelLpar("", "", all);
    hosts->initializeEthernetAdapterLevelLpar("", "", all);
    zemCEC* const host = hosts->getData(0);
    zemVSSDVisitor visitor(host, "");
    ASSERT_EQ(7, host->getLPARs().size());
    for (int i = 0; i < host->getLPARs().size(); ++i) {
        zemLPAR& lpar = *host->getLPARs().getElementAt(i);
        zemPartitionProfileConfiguration& profile = *lpar.getLparProfile().getElementAt(0);
        profile.setConsoleSlot("none");  // the console is no slot, but would tag all by the model
        const Vssd fromModel(visitor.getStateVSSD(&lpar, &profile, kAllKinds));
        const Vssd fromRecords(
            visitor.getData("ORX:4*" + lpar.getLparID() + "*" + kHost, kAllKinds));
        EXPECT_EQ(dumpOf(*fromModel), dumpOf(*fromRecords));
        EXPECT_TRUE(fromRecords->isState());
        const Vssd storedModel(visitor.getProfileVSSD(&lpar, &profile, kAllKinds));
        const Vssd storedRecords(visitor.getData(
            "ORX:2*" + profile.getProfileName() + "-" + lpar.getLparID() + "*" + kHost, kAllKinds));
        EXPECT_EQ(dumpOf(*storedModel), dumpOf(*storedRecords));
    }
    // One by one, as an outside reader finds it.
    const Vssd web(visitor.getStateVSSD("3", kAllKinds));
    EXPECT_EQ("1|3|1|uncap|128|100|200|400|75|150|300|",
              quantities(*web->getRASD("3-Processor")->getData()));
    EXPECT_EQ("1|3|0||128|8388608|8388608|8388608|-1|262144|-1|",
              quantities(*web->getRASD("4-Memory")->getData()));
    EXPECT_EQ("normal|1|3*1111-AAA*0000001|web server|tmxlinux|norm|1|1|",
              joined(web->getProfileName(), web->getIsDefault(), web->getVirtualSystemID(),
                     web->getLparName(), web->getVirtualSystemType(), web->getBootMode(),
                     web->getEnableConnectionMonitoring(), web->getMaxVirtualSlots() > 9));
    EXPECT_EQ(nullptr, visitor.getData(zemString("ORX:3*3*") + kHost, kAllKinds));
}

TEST_F(VirtualSystemVisitorVSSDTest, SaysWhatIsMissing) {
    const zemRecordType active = record<Partition>("lpar_id=3;state=Running"),
                        idle = record<Partition>("state=Not Activated");
    const zemRecordType profile = record<Profile>("name=p");
    const zemRecordSetsType none;
    const zemRecordSetsType two = records<Processor>({"", ""});
    zemLPAR lpar(kHost, "3");
    lpar.setLparProcessor(zemPartitionProcessorResource(kHost, "3"));
    zemPartitionProfileConfiguration stored(kHost, "3");
    stored.setProfileName("p");
    zemLPAR* const noLpar = nullptr;
    zemPartitionProfileConfiguration* const noProfile = nullptr;
    const std::string state = "3/zemVSSDVisitor/getStateVSSD//";
    const std::string one = "The output result should only have one record when executing ";
    const std::string nothing = "There is no output result when executing ";
    const std::string host = " 1111-AAA*0000001",
                      of7 = "qyplat -r lpar --filter lpar_ids=7 -m" + host;
    const struct {
        std::vector<std::string> answer;  ///< the library's objects
        std::function<void()> operation;
        std::string failure;
        // clang-format off
    } rows[] = {
        {{}, [&] { m_visitor.getStateVSSD(noLpar, &stored, 0); }, state + "The lpar which lpar_id is 3 does not existed"},
        {{}, [&] { m_visitor.getStateVSSD(&lpar, noProfile, 0); }, state + "Error occurred when get the profile data of lpar(3) on host(1111-AAA*0000001)."},
        {{}, [&] { m_visitor.getStateVSSD(&lpar, &stored, VISITOR_TYPE_RASD_MEM); }, state + "Error occured when retrieving processor configuration information from profile p for lpar 3 on host" + host},
        {{}, [&] { m_visitor.getStateVSSD(active, profile, two, none, none, none, none, none, 0); }, state + one + "qyalloc -r proc for lpar(3) -m" + host},
        {{}, [&] { m_visitor.getStateVSSD(active, profile, none, two, none, none, none, none, 0); }, state + one + "qyalloc -r mem for lpar(3) -m" + host},
        {{}, [&] { delete m_visitor.getStateVSSD(idle, profile, two, two, none, none, none, none, 0); }, ""},
        {{}, [&] { m_visitor.getStateVSSD("7", 0); }, "5" + state.substr(1) + nothing + of7},
        {{"", ""}, [&] { m_visitor.getStateVSSD("7", 0); }, state + one + of7},
        {{"", ""}, [&] { m_visitor.getProfileVSSD("7", "p", 0); }, "3/zemVSSDVisitor/getProfileVSSD//" + one + "getLparObj with lpar id 7 on" + host},
        {{}, [&] { m_visitor.getProfileVSSD("7", "p", 0); }, "5/zemVSSDVisitor/getProfileVSSD//" + nothing + "getLparProfile for profile name p of lpar 7 on" + host},
        {{}, [&] { m_partitions.getData(&m_host, "7", ""); }, "3/zemLPARVisitor/getData//The lpar(7) does not exist on host" + host},
        {{"", ""}, [&] { m_partitions.getData(&m_host, "7", ""); }, "3/zemLPARVisitor/getData//" + one + of7},
    };
    // clang-format on
    for (const auto& row : rows) {
        const LibraryAnswer answer(row.answer);
        EXPECT_EQ(row.failure, failureText(row.operation));
    }
    EXPECT_EQ(nullptr, m_visitor.getProfileVSSD(noLpar, &stored, 0));
    EXPECT_EQ(nullptr, m_visitor.getProfileVSSD(&lpar, noProfile, 0));

    m_tools.makeAppliance(ZEM_PROGRAMS);
    const std::string throwing = "zemVSSDVisitor/getLparRecords/DNX_API_";
    const std::pair<std::optional<int>, std::string> codes[] = {
        {6, "1/" + throwing + "ACCESS_DENIED"},
        {3, "6/" + throwing + "UNKNOWN_SYTEM"},
        {std::nullopt, "6/" + throwing + "FAILED"},
        {7, "5/zemVSSDVisitor/getStateVSSD/"},
    };
    for (const auto& [code, failure] : codes) {
        planAnswer("getLparObj", code);
        EXPECT_EQ(failure, failureText([&] { m_visitor.getStateVSSD("3", 0); }, "kcmi"));
    }
    planAnswer("getLparProfile", 7);
    EXPECT_EQ(
        "5/zemVSSDVisitor/getStateVSSD//There is no output result when executing qyplat -r "
        "profile --filter lpar_ids=3,profile_names=normal -m 1111-AAA*0000001",
        failureText([&] { m_visitor.getStateVSSD("3", 0); }));
}

TEST_F(VirtualSystemVisitorVSSDTest, ReadsPartitionsByTools) {
    m_tools.script("qyplat", "printf '%s|' \"$@\" >$here/argv; printf '3,a\\n4,b\\n5,c\\n6,d\\n'");
    m_tools.script("qymove",
                   "printf '3,Migration Starting\\n5,Migration Complete\\n5,No LOST CONNECTION"
                   " at all\\n'");
    testing::internal::CaptureStdout();
    const zemRecordSetsType found = m_partitions.getLparRecords("lpar_names=a b", 0);
    const std::string output = testing::internal::GetCapturedStdout();
    EXPECT_EQ(0U, output.find("zemLPARVisitor::getLparRecords<-\nfilter:[lpar_names=a b\n"));
    const std::string asked =
        "lpar_id,name,lpar_env,state,resource_config,os_version,logical_serial_num,"
        "default_profile,curr_profile,boot_mode,lpar_keylock,redundant_err_path_reporting";
    EXPECT_EQ("-r|lpar|-m|1111-AAA*0000001|--filter|lpar_names=a b|-F|" + asked + "|",
              m_tools.read("argv"));
    // The second list is in another order, and short.
    std::string states;
    for (int i = 0; i < found.size(); ++i) {
        const Lpar lpar(m_partitions.getLPAR(found.getElementAt(i)));
        states += joined(lpar->getLparID(), lpar->getMigrationState());
    }
    EXPECT_EQ("3|2|4|1|5|5|6|1|", states);
    zemCECCapability capability;
    capability.m_lparProcCompatModes = "0";
    m_host.setCapability(&capability);
    m_tools.script("qymove", "echo No results were found.");
    const Lpar first(m_partitions.getLPAR(m_partitions.getLparRecords("", 0).getElementAt(0)));
    EXPECT_EQ("3|1|", joined(first->getLparID(), first->getMigrationState()));
    EXPECT_EQ("-r|lpar|-m|1111-AAA*0000001|-F|" + asked + ",desired_lpar_proc_compat_mode|",
              m_tools.read("argv"));

    // A name from outside is one item of the filter.
    failureText([&] { m_partitions.getData(kHost, "", "x,lpar_ids=\"1\" --all", 0); });
    EXPECT_NE(std::string::npos,
              m_tools.read("argv").find("|lpar_names=\"x,lpar_ids=\"\"1\"\" --all\"|"))
        << m_tools.read("argv");
    m_tools.script("qyplat", "echo No results were found.");
    EXPECT_EQ("3/zemLPARVisitor/getData//The lpar() does not exist on host 1111-AAA*0000001",
              failureText([&] { m_partitions.getData(kHost, "", "a", 0); }));
    EXPECT_EQ(nullptr, m_partitions.getData(kHost, "", "", 1));
    EXPECT_EQ(nullptr, m_partitions.getLPAR(nullptr));
}

TEST_F(VirtualSystemVisitorVSSDTest, ReadsPartitionsByTheLibrary) {
    zemCECCapability capability;
    capability.m_lparProcCompatModes = "1";
    m_host.setCapability(&capability);
    const LibraryAnswer answer(
        {"Name=3*1111-AAA*0000001;UserDefinedName=web;DefinitionState=129;PartitionState=252;"
         "BootMode=9;Default_prof=1,a,b;Curr_prof=null,x;RedundantPath=1;Keylock=4;"
         "ProcCompatMode=6;MigrationState=13;PowerOnWithHypervisor=null",
         "Name=4"});
    zemAutoReleaseApiProp prop;
    zemRecordSetsType found = m_visitor.getLparRecords("", 0, prop);
    EXPECT_EQ("getAllLparsFromCec(,1111-AAA*0000001,2)", librarySpy.call);
    EXPECT_EQ(librarySpy.answer, prop.get());
    ASSERT_EQ(2, found.size());
    std::string values;
    for (const int attribute :
         {Partition::ATTR_LPAR_ID, Partition::ATTR_NAME, Partition::ATTR_LPAR_ENV,
          Partition::ATTR_STATE, Partition::ATTR_BOOT_MODE, Partition::ATTR_DEFAULT_PROFILE,
          Partition::ATTR_CURR_PROFILE, Partition::ATTR_REDUNDANT_ERR_PATH_REPORTING,
          Partition::ATTR_LPAR_KEYLOCK, Partition::ATTR_DESIRED_LPAR_PROC_COMPAT_MODE,
          Partition::ATTR_MIGRATION_STATE, Partition::ATTR_AUTO_START}) {
        values += joined((*found[0])[attribute]);
    }
    EXPECT_EQ("3|web|osq00|unknown|unknown|a,b||1|norm|C7 enhanced|4|0|", values);
    EXPECT_EQ(1, zemVSSDVisitor::getResultForLPAR(found, "4").size());
    prop.reset(nullptr);

    const Case outputs[] = {
        {"13*1111-AAA*0000001,DCaps:<7>\n3*1111-AAA*0000001,DCaps:<5>", "101"},
        {"3*1111-AAA*0000001 DCaps:<0x2>", "010"},
        {"13*1111-AAA*0000001,DCaps:<7>\n3*1111-AAA*0000001", "000"},
        {"3*1111-AAA*0000001,DCaps:<ffffffffff", "000"},
    };
    const LibraryAnswer one({"Name=3*1111-AAA*0000001"});
    for (const Case& each : outputs) {
        m_tools.recorder("qydyn", each.attributes);
        const Lpar lpar(m_partitions.getData(&m_host, "3", "ignored"));
        EXPECT_EQ("-dlpar|-c|1111-AAA_0000001", m_tools.arguments());
        const zemLPARCapability& can = lpar->getCapability();
        EXPECT_EQ(each.expected, std::to_string(can.m_dlparMemCapable) +
                                     std::to_string(can.m_dlparProcCapable) +
                                     std::to_string(can.m_dlparIOCapable))
            << each.attributes;
    }
    m_tools.script("qydyn", "exit 1");
    EXPECT_EQ("\"qydyn -dlpar -c 1111-AAA_0000001\"",
              failureText([&] { m_partitions.getData(&m_host, "3", ""); }, "a"));
}

TEST_F(VirtualSystemVisitorVSSDTest, FillsAndChangesTheHost) {
    m_tools.makeAppliance(ZEM_PROGRAMS);
    zemVSSDVisitor visitor(&m_host, "ORXC_MemoryRASettingData");
    EXPECT_EQ(0, visitor.initialize("", VISITOR_TYPE_LPAR));
    EXPECT_EQ(0, visitor.size());
    EXPECT_EQ(0, visitor.initialize("", VISITOR_TYPE_RASD_INIT));
    ASSERT_EQ(7, m_partitions.size());
    EXPECT_STREQ("Suspended", m_partitions.getData(4)->getState());
    ASSERT_EQ(15, visitor.size());  // the fourth partition has two profiles
    EXPECT_EQ(nullptr, visitor.getData(15));
    EXPECT_EQ(nullptr, visitor.getData(-1));
    for (int i : {0, 1, 6, 8, 14, 7}) {
        zemVSSD* const vssd = visitor.getData(i);
        EXPECT_EQ(i == 0 || i == 6, vssd->isState()) << i;
        EXPECT_EQ(vssd, visitor.getData(vssd->getInstanceID(), &m_host)) << i;
    }
    const zemString key = zemString("7*") + kHost;
    auto changed = std::make_unique<zemLPAR>(kHost, "7");
    EXPECT_EQ(0, m_partitions.modifyData(changed.get()));
    EXPECT_EQ(changed.release(), m_partitions.getData(6));
    EXPECT_EQ(0, m_partitions.removeData(key));
    EXPECT_EQ(0, m_partitions.removeData(key));
    EXPECT_EQ(6, m_partitions.size());
    zemLPAR stranger(kHost, "9");
    EXPECT_EQ(0, m_partitions.modifyData(&stranger));
    EXPECT_EQ(0, m_partitions.addData(new zemLPAR(kHost, "8"), ""));
    EXPECT_EQ(7, m_partitions.size());
}

}  // namespace

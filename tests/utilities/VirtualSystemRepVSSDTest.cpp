#include <gtest/gtest.h>

#include <chrono>
#include <memory>
#include <sstream>
#include <string>
#include <tuple>
#include <vector>

#include "LibraryFaults.h"
#include "LibrarySpy.h"
#include "ProviderHarness.h"
#include "QyplatCmdCaller.h"
#include "ResourcePoolManager.h"
#include "SystemConfig.h"
#include "ToolFolder.h"
#include "VirtualSystemRep.h"

namespace {

using Profile = zemQyplatCmdCaller::PartitionProfileAttribute;

constexpr char kHost[] = "1111-AAA*0000001";

/// What dumpVSSD() prints of the fields named, with blanks between them; "|" behind each.
std::string fieldsOf(zemVSSD& vssd, const std::string& names) {
    testing::internal::CaptureStdout();
    zemVSSD::dumpVSSD(&vssd);
    const std::string dump = testing::internal::GetCapturedStdout();
    std::string values;
    std::istringstream all(names);
    for (std::string name; all >> name;) {
        const size_t begin = dump.find("\n\t" + name + ':') + name.size() + 3;
        values += dump.substr(begin, dump.find('\n', begin) - begin) + '|';
    }
    return values;
}

/// The instance IDs of the setting data, without the host.
std::string idsOf(zemVSSD& vssd) {
    std::string ids;
    for (int i = 0; i < vssd.getRASDSet().size(); ++i) {
        const std::string id(vssd.getRASDSet()[i]->getData()->m_InstanceID);
        EXPECT_EQ(kHost, id.substr(id.size() - sizeof kHost + 1));
        ids += (i == 0 ? "" : " ") + id.substr(0, id.size() - sizeof kHost);
    }
    return ids;
}

class VirtualSystemRepVSSDTest : public testing::Test {
protected:
    VirtualSystemRepVSSDTest() {
        m_tools.makeAppliance(ZEM_PROGRAMS);
        librarySpy.call.clear();
    }
    ~VirtualSystemRepVSSDTest() override { EXPECT_EQ(0, librarySpy.held); }

    /// Scripts that count their runs and print @p output.
    void qyallocPrints(const std::string& output) {
        std::ofstream(m_tools.file("output")) << output;
        m_tools.script("qyalloc", "echo run >>$here/runs; cat $here/output");
    }

    /// A VSSD with stored lists.
    zemVSSD withLists(const char* slots, const char* serial, const char* scsi,
                      const char* ethernet) {
        zemRecordType record;
        record.insert(Profile::ATTR_IO_SLOTS, slots);
        record.insert(Profile::ATTR_VIRTUAL_SERIAL_ADAPTERS, serial);
        record.insert(Profile::ATTR_VIRTUAL_SCSI_ADAPTERS, scsi);
        record.insert(Profile::ATTR_VIRTUAL_ETH_ADAPTERS, ethernet);
        return zemVSSD(&m_lpar, record);
    }

    ToolFolder m_tools;
    zemCEC m_cec{kHost, "alpha"};
    zemLPAR m_lpar{kHost, "4", "db", "Running", "Normal", "normal", "tmxlinux", "manual"};
};

TEST_F(VirtualSystemRepVSSDTest, IdsAreTakenApartFromTheRight) {
    const std::string notOfHost =
        "3/zemVSSD/AnalyzeInstanceID//MTMS in the input "
        "ResourceAllocationSettingData.InstanceID is not matched to the MTMS of which the hosted "
        "CEC.";
    const std::tuple<const char*, const char*, std::string> rows[] = {
        // an ID, the host, and "<partition>|<profile>" or the failure
        {"ORX:2*my-prof-3*1111-AAC*0000003", "1111-AAC*0000003", "3|my-prof"},
        {"ORX:2*a*b-3*1111-AAC*0000003", "1111-AAC*0000003", "3|a*b"},
        {"ORX:2*-3*M", "M", "3|"},
        {"ORX:2*3*1111-AAC*0000003", "1111-AAC*0000003", "|"},  // no partition, whatever the host
        {"ORX:4*my-prof-3*M", "M", "my-prof-3|"},
        {"ORX:4*5*3*M", "M", "5*3|"},
        {"ORX:3*a-3*M", "M", "|"},
        {"ORX:2*M", "M", "|"},
        {"ORX:2*p-3*1111-AAC*0000003", kHost, notOfHost},
        {"ORX:2*p*M-3*M", "M", notOfHost},
        {"ORX:2*p-3*MM", "M", notOfHost},
        {"M", "M", notOfHost},
        {"", "M", notOfHost},
        {"*", "", "|"},
    };
    for (const auto& [id, mtms, expected] : rows) {
        std::string seen;
        const std::string failure = failureText([&, id = id, mtms = mtms] {
            const zemVSSD vssd(mtms, id);
            seen = std::string(vssd.getLparID()) + '|' + std::string(vssd.getProfileName());
            EXPECT_STREQ(id, vssd.getInstanceID());
            EXPECT_STREQ(mtms, vssd.getMTMS());
        });
        EXPECT_EQ(expected, seen + failure) << id;
    }
    zemVSSD vssd(kHost, "3", "my-prof");
    EXPECT_FALSE(vssd.isState());
    EXPECT_STREQ("ORX:2*my-prof-3*1111-AAA*0000001", vssd.GenerateInstanceID(false));
    EXPECT_FALSE(vssd.isState());
    EXPECT_STREQ("ORX:4*3*1111-AAA*0000001", vssd.GenerateInstanceID(true));
    EXPECT_TRUE(vssd.isState());
}

TEST_F(VirtualSystemRepVSSDTest, RasdsBelongToTheSystem) {
    zemVSSD vssd;
    EXPECT_TRUE(vssd.getAutoActivate() && vssd.getIsDefault());
    for (const int type : {3, 6, 6, 21}) {
        EXPECT_NE(nullptr, vssd.addRASD(type, type == 6 ? "6-4" : "21-0"));
    }
    EXPECT_EQ(nullptr, vssd.addRASD(5, "5-1"));
    EXPECT_EQ(4, vssd.getRASDs().size());
    EXPECT_EQ(vssd.getRASDs()[0], vssd.getRASD("3-processor"));
    EXPECT_EQ(nullptr, vssd.getRASD("12-1"));
    {
        const zemDynamicArray<zemRASD> scsi = vssd.getRASD(6);
        EXPECT_EQ(2, scsi.size());
        EXPECT_EQ(vssd.getRASDs()[2], scsi[1]);
    }
    EXPECT_TRUE(vssd.removeRASD("6-4"));
    EXPECT_TRUE(vssd.removeRASD("6-4"));
    EXPECT_FALSE(vssd.removeRASD("6-4"));

    // The copy owns them, and the source may still read.
    zemVSSD copy(vssd);
    EXPECT_EQ(vssd.getRASDs()[1], copy.getRASD("21-0"));
    EXPECT_TRUE(copy.equals(&vssd));
    zemVSSD other;
    EXPECT_TRUE(other.equalvssd(&vssd));
    EXPECT_FALSE(other.equals(&vssd) || other.equals(nullptr));
    other.addRASD(3, "");
    other.addRASD(21, "21-1");
    EXPECT_FALSE(other.equals(&vssd));
    other.setMemoryPoolNum(1);
    EXPECT_FALSE(other.equalvssd(&vssd));
}

TEST_F(VirtualSystemRepVSSDTest, DumpsPrintALineAField) {
    zemVSSD vssd("3", kHost, "osq00", 1, "a\nb", "p", "sms", 0, -1, 20, 1, "norm", "d");
    auto* adapter = static_cast<zemVETHRASD*>(vssd.addRASD(10, "10-4"));
    adapter->m_Data.m_AddVLANIDs.append(5);
    adapter->m_Data.m_AddVLANIDs.append(7);
    vssd.addRASD(4, "")->getData()->m_ResourceType = 5;
    testing::internal::CaptureStdout();
    zemVSSD::dumpVSSD(&vssd);
    const std::string dump = testing::internal::GetCapturedStdout();
    const auto count = [&dump](const std::string& text) {
        int found = 0;
        for (size_t at = 0; (at = dump.find(text, at)) != std::string::npos; at += text.size()) {
            ++found;
        }
        return found;
    };
    EXPECT_EQ(1 + 10 + 3 + 10, count(":-1\n"));  // what nobody has set
    for (const char* part :
         {"VSSD, id:\n\tm_MTMS:1111-AAA*0000001\n\tm_virtualSystemType:osq00\n\tm_autoActivate:1\n"
          "\tm_virtualSystemIdentifier:3*1111-AAA*0000001\n\tm_lparID:3\n\tm_lparName:a\\nb\n",
          "\tm_memoryPoolNum:0\nKey:10-4\n\tresource type:10\n\t:m_Weight:-1\n",
          "\t:m_PortVLANID:-1\n\t:m_AddVLANIDs:5,7\n\t:m_TrunkPriority:-1\n\t:m_vswitch:\nKey:5-"
          "Mem",
          "\t:m_Address:\n=====resource type error.\n"}) {
        EXPECT_NE(std::string::npos, dump.find(part)) << part << dump;
    }
}

TEST_F(VirtualSystemRepVSSDTest, SettingsComeFromRecordOrProfile) {
    const std::string names =
        "m_lparName m_profileName m_bootMode m_autoActivate m_enableConnectionMonitoring "
        "m_maxVirtualSlots m_isDefault m_enableRedundantErrorPathReporting "
        "m_virtualSystemIdentifier m_keylock m_virtualSystemType m_defaultProfileName "
        "m_IOSlotsInfo m_virtualSerialAdaptersInfo m_virtualSCSIAdaptersInfo "
        "m_virtualEthetnetAdaptersInfo";
    const std::string ofPartition = "4*1111-AAA*0000001|manual|tmxlinux|Normal|";
    zemVSSD vssd = withLists("s", "v", "c", "e");
    EXPECT_EQ("|||0|0|0|0|0|" + ofPartition + "s|v|c|e|", fieldsOf(vssd, names));
    zemRecordType record;
    const std::pair<int, const char*> values[] = {
        {Profile::ATTR_LPAR_NAME, "n"},
        {Profile::ATTR_NAME, "NORMAL"},
        {Profile::ATTR_BOOT_MODE, "sms"},
        {Profile::ATTR_AUTO_START, "1"},
        {Profile::ATTR_CONN_MONITORING, "2"},
        {Profile::ATTR_MAX_VIRTUAL_SLOTS, "30"},
        {Profile::ATTR_REDUNDANT_ERR_PATH_REPORTING, "4"}};
    for (const auto& [attribute, value] : values) {
        record.insert(attribute, value);
    }
    EXPECT_EQ(0, vssd.initialize(&m_lpar, record));
    EXPECT_EQ("n|NORMAL|sms|1|2|30|1|4|" + ofPartition + "||||", fieldsOf(vssd, names));

    m_tools.run(
        "edplat -r prof -m alpha -i "
        "name=normal,lpar_id=4,auto_start=1,conn_monitoring=1");
    const zemHostSystem host(kHost, "", "");
    zemVirtualSystemProfile profile("normal", zemVirtualSystem("4", host, "", ""), "", "");
    zemVSSD ofProfile(&m_lpar, profile);
    EXPECT_EQ("db|normal|sms|1|1|11|1|1|" + ofPartition +
                  "|0/server/1/any//any/1,1/server/1/any//any/1,6/client/0/2/xbrg2/7/0|"
                  "3/client/2/xbrg2/14/1|2/0/1//0/0/default,\"5/1/7/20,30/0/0/storage\"|",
              fieldsOf(ofProfile, names));
    record.insert(Profile::ATTR_REDUNDANT_ERR_PATH_REPORTING, "0");
    ofProfile.initialize(&m_lpar, zemRecordType());
    ofProfile.initialize(&m_lpar, profile);
    EXPECT_FALSE(ofProfile.getEnableRedundantErrorPathReporting());
}

TEST_F(VirtualSystemRepVSSDTest, RunningSerialAndScsiAdapters) {
    const struct {
        zemString (zemVSSD::*ask)(const zemString&, const zemString&, const zemString&) const;
        const char *output, *list, *arguments;
    } rows[] = {
        {&zemVSSD::getSerialAdapterInfo, "4,server,1,any,,any,0\n5,client,,2,\"a,b\",6,1\n",
         "4/server/1/any//any/0,5/client//2/a,b/6/1,",
         "-r|virtualio|--rsubtype|serial|-m|1111-AAA*0000001|--filter|lpar_ids=4|--level|lpar|-F|"
         "slot_num,adapter_type,supports_dnx,remote_lpar_id,remote_lpar_name,remote_slot_num,"
         "is_required"},
        {&zemVSSD::getSCSIAdapterInfo, "4,server,any,,any,0\n", "4/server/any//any/0,",
         "-r|virtualio|--rsubtype|scsi|-m|1111-AAA*0000001|--filter|lpar_ids=4|--level|lpar|-F|"
         "slot_num,adapter_type,remote_lpar_id,remote_lpar_name,remote_slot_num,is_required"},
    };
    const zemVSSD vssd;
    for (const auto& row : rows) {
        m_tools.recorder("qyalloc", row.output);
        EXPECT_STREQ(row.list, (vssd.*row.ask)("", kHost, "4"));
        EXPECT_EQ(row.arguments, m_tools.arguments());
        for (const char* script :
             {"true", "echo No results were found.", "echo WRTL1 >&2; exit 1", "printf '1,\"x'"}) {
            m_tools.script("qyalloc", script);
            EXPECT_STREQ("none,", (vssd.*row.ask)("", kHost, "4")) << script;
        }
        // One argument, whatever the client calls a partition.
        m_tools.recorder("qyalloc");
        (vssd.*row.ask)("", "a\" b", "4\" --x");
        EXPECT_NE(std::string::npos, m_tools.arguments().find("|-m|a\" b|--filter|"))
            << m_tools.arguments();
        EXPECT_EQ(std::string::npos, m_tools.arguments().find("|--x"));
    }
}

TEST_F(VirtualSystemRepVSSDTest, RunningEthernetAdaptersTakeTheirSwitchesFromTheProfile) {
    const std::pair<const char*, const char*> rows[] = {
        // a stored list, and the adapters of partition 4
        {"2/0/1//0/0/default,\"5/1/7/20,30/0/0/storage\"",
         "2/0/1//0/0/default/A20001000402,\"5/1/7/20,30/0/0/storage/A20001000405\","},
        {"12/0/1//0/0/other,2/0/1//0/1/x,2/0/1//0/0/a/b",
         "2/0/1//0/0/a/b/A20001000402,\"5/1/7/20,30/0/0/,"},
        {"2/0/1//0/0,\"5/1/7/20,30/0/0\"",
         "2/0/1//0/0//A20001000402,5/1/7/20,30/0/0//A20001000405\","},
        {"none", "2/0/1//0/0/,\"5/1/7/20,30/0/0/,"},
        {"\",\"\"2/0/1//0/0/", "2/0/1//0/0/,\"5/1/7/20,30/0/0/,"},
    };
    for (const auto& [stored, running] : rows) {
        const zemVSSD vssd = withLists("", "", "", stored);
        EXPECT_STREQ(running, vssd.getEthernetAdapterInfo("", kHost, "4")) << stored;
    }
    EXPECT_EQ("getLparVirtualEthernet(,4*1111-AAA*0000001,2)", librarySpy.call);
    const std::pair<std::optional<int>, const char*> answers[] = {
        {0, "none,"}, {3, "none,"}, {6, "none,"}, {7, ""}, {std::nullopt, "none,"}};
    for (const auto& [code, list] : answers) {
        planAnswer("getLparVirtualEthernet", code);
        EXPECT_STREQ(list, zemVSSD().getEthernetAdapterInfo("", kHost, "4"));
    }
}

TEST_F(VirtualSystemRepVSSDTest, SettingDataOfOneClass) {
    const struct {
        const char* className;
        const char *defined, *state;  ///< instance IDs
        int runs, calls;              ///< of the tool and the library, for the state side
        bool ofActivated;
    } rows[] = {
        {"ORXC_ProcessorRASettingData", "ORX:2*p-4", "ORX:4*4", 0, 0, true},
        {"ORXC_MemoryRASettingData", "ORX:2*p-4", "ORX:4*4", 0, 0, true},
        {"ORXC_IOSlotAdapterRASettingData", "ORX:2*p-3A*4 ORX:2*p-3B*4", "ORX:4*3A*4 ORX:4*3B*4", 0,
         0, true},
        {"orxc_serialadapterrasettingdata", "ORX:2*p-0*4 ORX:2*p-7*4", "ORX:4*8*4 ORX:4*9*4", 1, 0,
         false},
        {"ORXC_SCSIAdapterRASettingData", "", "ORX:4*8*4 ORX:4*9*4", 1, 0, false},
        {"ORXC_EthernetAdapterRASettingData", "ORX:2*p-5*4", "ORX:4*2*4 ORX:4*5*4", 0, 1, false},
        {"ORXC_Other", "", "", 0, 0, false},
    };
    qyallocPrints("8,server,1,any,\"a,b/c\",any,1\n9,client,1,2,n,3,1\n");
    for (const auto& row : rows) {
        zemVSSD vssd = withLists("3A/none/1,none,3B/none/0,/none/1",
                                 "0/server/1/any//any/1,\"7/server/0/4/db,main/6/0\"", "none",
                                 "\"5/1/7/20,30/0/0/storage\"");
        EXPECT_EQ(0, vssd.initializeDefined("", "p", &m_cec, &m_lpar, row.className, 34));
        EXPECT_EQ(row.defined, idsOf(vssd)) << row.className;
        EXPECT_STREQ("ORX:2*p-4*1111-AAA*0000001", vssd.getInstanceID());
        EXPECT_STREQ("p", vssd.getProfileName());

        for (const char* state : {"Running", "now Not Activated"}) {
            const bool none = row.ofActivated && *state == 'n';
            m_lpar.setState(state);
            m_tools.run("rm -f '" + m_tools.file("runs") + "'");
            librarySpy.call.clear();
            vssd.getRASDSet().clear();
            EXPECT_EQ(none ? -1 : 0,
                      vssd.initializeState("", "p", &m_cec, &m_lpar, row.className, 50));
            EXPECT_EQ(none ? "" : row.state, idsOf(vssd)) << row.className;
            EXPECT_EQ(row.runs, static_cast<int>(m_tools.read("runs").size()) / 4);
            EXPECT_EQ(row.calls == 0, librarySpy.call.empty());
        }
        m_lpar.setState("Running");
        for (const int type : {33, 49}) {
            zemVSSD names;
            EXPECT_EQ(0, names.initializeState("", "p", &m_cec, &m_lpar, row.className, type));
            EXPECT_EQ("", idsOf(names));
            EXPECT_STREQ("ORX:4*4*1111-AAA*0000001", names.getInstanceID());
        }
    }
}

TEST_F(VirtualSystemRepVSSDTest, SettingDataBecomeTheWantedProperties) {
    Harness harness(cimom::Character::Lean);
    zemSCSIAdapterRASettingDataState adapter;
    for (const char* id : {"", "\"7", "x", "-7"}) {
        EXPECT_EQ(-1, adapter.initialize("", &m_lpar, &m_cec, "p", id, "", 34)) << id;
    }
    EXPECT_EQ(-1, adapter.initialize(nullptr, &m_cec, "", 34));
    EXPECT_EQ(0, adapter.initialize("", &m_lpar, &m_cec, "p", "7", "", 34));
    EXPECT_STREQ("ORXC_SCSIAdapterRASettingData", adapter.getType());
    const char* some[] = {"resourcetype", "INSTANCEID", nullptr};
    const std::pair<const char**, const char*> rows[] = {{some, ""}, {nullptr, "Adapter"}};
    for (const auto& [wanted, units] : rows) {
        CmpiInstance instance = FromServer<CmpiInstance>(harness.disk());
        zemSCSIAdapterRASettingDataState().addSpecificProperties(instance, wanted, "");
        EXPECT_TRUE(instance.getProperty("ResourceType").isNullValue());
        adapter.addSpecificProperties(instance, wanted, "");
        EXPECT_EQ(6, instance.getProperty("ResourceType").getUint16());
        EXPECT_STREQ("ORX:4*7*4*1111-AAA*0000001",
                     instance.getProperty("InstanceID").getString().charPtr());
        const CmpiData shown = instance.getProperty("AllocationUnits");
        EXPECT_STREQ(units, shown.isNullValue() ? "" : shown.getString().charPtr());
    }
}

TEST_F(VirtualSystemRepVSSDTest, LongListsAreWalkedOnce) {
    std::string slots, ethernet;
    for (int i = 0; i < 20000; ++i) {
        slots += std::to_string(i) + "/none/1,";
        ethernet += '"' + std::to_string(i) + "/1/1/2,3/0/1/,";  // quotes that nothing closes
    }
    zemVSSD vssd = withLists(slots.c_str(), "", "", ethernet.c_str());
    const auto begin = std::chrono::steady_clock::now();
    vssd.initializeDefined("", "p", &m_cec, &m_lpar, "ORXC_IOSlotAdapterRASettingData", 34);
    vssd.initializeDefined("", "p", &m_cec, &m_lpar, "ORXC_EthernetAdapterRASettingData", 34);
    EXPECT_EQ(40000, vssd.getRASDSet().size());
    EXPECT_LT(std::chrono::steady_clock::now() - begin, std::chrono::seconds(5));
}

}  // namespace

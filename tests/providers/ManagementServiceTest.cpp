// Partitions and profiles made and changed by the service, as a server sees it.
#include <cstring>
#include <random>
#include <thread>

#include "ServedProviders.h"

namespace {

using namespace cimom;
using testing_support::ServedProviders;
using testing_support::textOf;
using Texts = std::vector<std::string>;

constexpr char kService[] =
    R"(root/cimv2:ORXC_VirtualSystemManagementService.SystemCreationClassName="ORXC_CEC_CS",)"
    R"(SystemName="1111-AAA*0000001",CreationClassName="ORXC_VirtualSystemManagementService",)"
    R"(Name="VirtualSystemManagement")";

/// Settings as a client writes them: a semicolon behind each property.
struct Written {
    std::string text() const {
        return "instance of ORXC_" + kind + "SettingData {" + properties + "}";
    }
    /// @param owner  "<profile>-", and the partition with its host
    std::string id(const std::pair<std::string, std::string>& owner) const {
        return "ORX:2*" + owner.first + slot + owner.second;
    }
    Written of(const std::string& instanceId) const {
        return {kind, slot, "InstanceID = " + printValue(Value(instanceId)) + ';' + properties};
    }

    std::string kind;  ///< of class
    std::string slot;  ///< with an asterisk; empty without one
    std::string properties;
};

// clang-format off
// Each "<a|b>" and "<1..9>" stands for one of these.
const Written kSystem = {"VirtualSystem", "", R"(BootMode = "<norm|dd|of|sms>"; MaxVirtualSlots = <20..60>; AutomaticStartupAction = <2|4>; EnableConnectionMonitoring = <true|false>; EnableRedundantErrorPathReporting = <true|false>;)"};
const Texts kTypes = {R"(VirtualSystemType = "tmxlinux"; LparName = "made <ä|'|$x>";)", R"(VirtualSystemType = "xbrgserver"; LparName = "made, <1..9>";)", R"(VirtualSystemType = "osq00"; LparName = "\"<1..9>\"";)"};
const std::vector<Written> kProcessors = {
    {"ProcessorRA", "", "ConsumerVisibility = 2; VirtualMinimum = <1..4>00; VirtualQuantity = <5..9>00; VirtualMaximum = <10..20>00;"},
    {"ProcessorRA", "", "ConsumerVisibility = 2; Minimum = <1..4>00; Reservation = <5..9>00; Limit = <10..20>00;"},
    {"ProcessorRA", "", "ConsumerVisibility = 3; PoolID = \"0\"; SharingMode = \"cap\"; VirtualMinimum = <1..4>00; VirtualQuantity = <5..9>00; VirtualMaximum = <10..20>00; Minimum = <20..99>; Reservation = <100..490>; Limit = <500..990>;"},
    {"ProcessorRA", "", "ConsumerVisibility = 3; SharingMode = \"uncap\"; Weight = <1..255>; VirtualMinimum = <1..4>00; VirtualQuantity = <5..9>00; VirtualMaximum = <10..20>00; Minimum = <20..99>; Reservation = <100..490>; Limit = <500..990>;"}};
const std::vector<Written> kMemory = {
    {"MemoryRA", "", "ConsumerVisibility = 2; VirtualMinimum = <262144|524288>; VirtualQuantity = <786432|1048576>; VirtualMaximum = <1310720|2097152>;"},
    {"MemoryRA", "", "ConsumerVisibility = 2; Minimum = <262144|524288>; Reservation = <786432|1048576>; Limit = <1310720|2097152>;"}};
const std::vector<Written> kAdapters = {
    {"SCSIAdapterRA", "", "IsRequired = <0|1>; VirtualAdapterType = <0|1>; RemoteVirtualSystemID = \"1\"; RemoteSlotID = <2..99>;"},
    {"SerialAdapterRA", "", "IsRequired = <0|1>; VirtualAdapterType = <0|1>; RemoteVirtualSystemID = \"1\"; RemoteSlotID = <2..99>;"},
    {"EthernetAdapterRA", "", "IsRequired = <0|1>; IEEECompatible = 1; PortVLANID = <1..4094>; TrunkPriority = <0|2>; AddVLANIDs = {<5|20, 30>}; <|VSwitch = \"vs w,1\";>"}};
const Written kSlot = {"IOSlotAdapterRA", "30000004*", "DRCIndex = \"30000004\"; IsRequired = <0|1>;"};
// clang-format on

/// Settings with random values. Those of one number have resources of the same kinds in the same
/// slots.
struct Generated {
    Generated(unsigned number, unsigned seed) : random(seed) {
        system.properties =
            filled(kSystem.properties) + "ProfileName = " + printValue(Value(profile)) + ';';
        type = filled(kTypes[number % 3]);
        resources = {kProcessors[random() % 4], kMemory[random() % 2]};
        for (unsigned slot = 2; slot < 2 + number % 5; ++slot) {
            resources.push_back(kAdapters[(number + slot) % 3]);
            resources.back().slot = std::to_string(slot) + '*';
            resources.back().properties += "SlotID = " + std::to_string(slot) + ';';
        }
        if (number % 2 == 0) {
            resources.push_back(kSlot);
            resources.back().properties += number % 3 == 2 ? "TaggedIOType = {1, 4};" : "";
        }
        for (Written& each : resources) {
            each.properties = filled(each.properties);
        }
    }

    std::string filled(std::string text) {
        for (std::size_t from = 0; (from = text.find('<', from)) != text.npos;) {
            const std::size_t length = text.find('>', from) + 1 - from;
            std::istringstream inside(text.substr(from + 1, length - 2));
            Texts choices;
            for (std::string each; std::getline(inside, each, '|');) {
                choices.push_back(each);
            }
            std::string choice = choices[random() % choices.size()];
            if (const std::size_t dots = choice.find(".."); dots != choice.npos) {
                const unsigned long least = std::stoul(choice);
                choice = std::to_string(
                    least + random() % (std::stoul(choice.substr(dots + 2)) - least + 1));
            }
            text.replace(from, length, choice);
        }
        return text;
    }

    std::mt19937 random;
    std::string profile = filled("<normal|day, \"2\"|p-1*x|ü/b>");
    Written system = kSystem;
    std::string type;
    std::vector<Written> resources;
};

class ManagementServiceTest : public ServedProviders {
protected:
    /// @param arguments  names, each followed by the text of its value
    Reply call(const std::string& method, const Texts& arguments) {
        const CimMethod* const declared =
            m_classes->findClass("CIM_VirtualSystemManagementService")->methods.find(method);
        NamedValues in;
        for (std::size_t i = 0; i < arguments.size(); i += 2) {
            const CMPIType type = typeOf(*declared->parameters.find(arguments[i]));
            in.add(arguments[i], parseValue(arguments[i + 1], type, m_classes.get()));
        }
        return m_server->invokeMethod(m_request, parsePath(kService), method, in);
    }
    /// The return value, or why there is none.
    static std::string answerOf(const Reply& reply) {
        return reply.ok() ? plainText(reply.values.at(0)) : reply.message;
    }

    /// Holds what is read to each property that was written.
    void expectRead(const Written& written, const std::string& id) {
        const Instance said = parseValue(written.text(), CMPI_instance, m_classes.get()).instance();
        const Reply reply = m_server->getInstance(
            m_request, {"root/cimv2", said.path.className, {{"InstanceID", id}}});
        ASSERT_EQ(reply.rc, CMPI_RC_OK) << reply.message;
        for (const auto& [name, value] : said.properties) {
            EXPECT_EQ(textOf(reply.instances[0].properties, name), plainText(value)) << id << name;
        }
    }
};

std::string listOf(const std::vector<Written>& settings) {
    std::string list;
    for (const Written& each : settings) {
        list += (list.empty() ? '{' : ',') + each.text();
    }
    return list + '}';
}

// 15 systems under each broker: made, read, changed in all that can be, read, and removed.
TEST_P(ManagementServiceTest, SettingsReadAsTheyWereWritten) {
    for (unsigned i = 0; i < 15; ++i) {
        const unsigned number = i + (lean() ? 15 : 0);
        const Generated first(number, number), second(number, number + 100);
        Written system = first.system;
        system.properties += first.type;
        const Reply made = call("DefineSystem", {"SystemSettings", system.text(),
                                                 "ResourceSettings", listOf(first.resources)});
        ASSERT_EQ(answerOf(made), "0") << system.text() << listOf(first.resources);
        const std::string partition =
            textOf(made.out.find("ResultingSystem")->reference().keys, "Name");
        std::pair<std::string, std::string> owner = {first.profile + '-', partition};
        expectRead(system, system.id(owner));
        for (const Written& each : first.resources) {
            expectRead(each, each.id(owner));
        }

        const Written changed = second.system.of(system.id(owner));
        ASSERT_EQ(answerOf(call("ModifySystemSettings", {"SystemSettings", changed.text()})), "0");
        owner.first = second.profile + '-';
        expectRead(second.system, system.id(owner));
        std::vector<Written> resources;
        for (const Written& each : second.resources) {
            resources.push_back(each.of(each.id(owner)));
        }
        ASSERT_EQ(answerOf(call("ModifyResourceSettings", {"ResourceSettings", listOf(resources)})),
                  "0")
            << listOf(first.resources) << listOf(resources);
        for (const Written& each : resources) {
            expectRead(each, each.id(owner));
        }
        const ObjectPath there("root/cimv2", "ORXC_LPAR_CS",
                               {{"CreationClassName", "ORXC_LPAR_CS"}, {"Name", partition}});
        ASSERT_EQ(answerOf(call("DestroySystem", {"AffectedSystem", printPath(there)})), "0");
        EXPECT_EQ(m_server->getInstance(m_request, there).rc, CMPI_RC_ERR_NOT_FOUND);
    }
    EXPECT_EQ(m_appliance.run("appliance check").out, "");
}

// clang-format off
constexpr char kHere[] = "*1111-AAA*0000001";

/// Settings of a kind with an InstanceID, which is of the host, and more.
std::string named(const char* kind, const std::string& id, const char* more) {
    return Written{kind, "", more}.of(id + kHere).text();
}
std::string referenceTo(const char* kind, const std::string& id) {
    return printPath({"root/cimv2", std::string("ORXC_") + kind + "SettingData",
                      {{"InstanceID", id + kHere}}});
}

// Before a tool runs, and by a tool: nothing has changed then.
TEST_P(ManagementServiceTest, RefusalsChangeNothing) {
    ASSERT_EQ(m_appliance.run("edpower -r lpar --id 6 -o shutdown --immed -m alpha").exit, 0);
    const std::string web = Written{"VirtualSystem", "", "LparName = \"web server\"; VirtualSystemType = \"tmxlinux\";"}.text();
    const auto system = [](const char* more) { return Written{"VirtualSystem", "", more}.text(); };
    const std::string memory = "instance of ORXC_MemoryRASettingData { ConsumerVisibility = 2; Minimum = 262144; Reservation = 524288; Limit = 1048576 }";
    const std::string processor = "instance of ORXC_ProcessorRASettingData { ConsumerVisibility = 2; Minimum = 100; Reservation = 100; Limit = 100 }";
    const std::string both = '{' + memory + ',' + processor + '}';
    const auto adapter = [](const std::string& more) { return "{instance of ORXC_EthernetAdapterRASettingData { PortVLANID = 3; " + more + " }}"; };
    const auto partition = [](const std::string& name) { return printPath({"root/cimv2", "ORXC_LPAR_CS", {{"CreationClassName", "ORXC_LPAR_CS"}, {"Name", name}}}); };
    const std::string normal3 = referenceTo("VirtualSystem", "ORX:2*normal-3");
    const struct {
        const char* method;
        Texts arguments;
        const char* answer;  ///< or a part of the failure's words
    } rows[] = {
        {"DefineSystem", {"SystemSettings", web}, "4"},
        {"DefineSystem", {"SystemSettings", web, "ResourceSettings", '{' + web + '}'}, "4"},
        {"DefineSystem", {"SystemSettings", web, "ResourceSettings", both, "ReferenceConfiguration", normal3}, "1"},
        {"DefineSystem", {"SystemSettings", web, "ResourceSettings", both}, "WRTL8032 The name"},
        {"DefineSystem", {"SystemSettings", web, "ResourceSettings", '{' + memory + '}'}, "No Processor is specified when creating lpar"},
        {"DefineSystem", {"SystemSettings", web, "ResourceSettings", '{' + memory + ',' + memory + ',' + processor + '}'}, "Duplicated Memory is specified when creating lpar"},
        {"DefineSystem", {"SystemSettings", system("LparID = 9;"), "ResourceSettings", both}, "property LparID of class ORXC_VirtualSystemSettingData cannot be set to 9 here"},
        {"DefineSystem", {"SystemSettings", system("Keylock = \"manual\";"), "ResourceSettings", both}, "property Keylock"},
        {"DefineSystem", {"SystemSettings", system("Caption = \"c\";"), "ResourceSettings", both}, "property Caption"},
        {"DefineSystem", {"SystemSettings", web, "ResourceSettings", "{instance of ORXC_MemoryRASettingData { AllocationUnits = \"byte*2^20\" }}"}, "property AllocationUnits"},
        {"DefineSystem", {"SystemSettings", web, "ResourceSettings", "{instance of ORXC_MemoryRASettingData { ConsumerVisibility = 2; Reservation = 1024; VirtualQuantity = 2048 }}"}, "as much as it is seen"},
        {"DefineSystem", {"SystemSettings", web, "ResourceSettings", "{instance of ORXC_MemoryRASettingData { ConsumerVisibility = 3; Limit = 2048 }}"}, "Shared memory has no"},
        {"DefineSystem", {"SystemSettings", web, "ResourceSettings", "{instance of ORXC_SCSIAdapterRASettingData { RemoteVirtualSystemID = \"1/2\" }}"}, "property RemoteVirtualSystemID"},
        {"DestroySystem", {"AffectedSystem", partition("1*1111-AAB*0000002")}, "4"},
        {"DestroySystem", {"AffectedSystem", partition("99*1111-AAA*0000001")}, "WRTL8011"},
        {"DestroySystem", {"AffectedSystem", partition("4*1111-AAA*0000001")}, "WRTL8049"},
        {"ModifySystemSettings", {"SystemSettings", system("BootMode = \"of\";")}, "4"},
        {"ModifySystemSettings", {"SystemSettings", named("VirtualSystem", "ORX:2*other-3", "BootMode = \"of\";")}, "4"},
        {"ModifySystemSettings", {"SystemSettings", named("VirtualSystem", "ORX:2*normal-99", "BootMode = \"of\";")}, "4"},
        {"ModifySystemSettings", {"SystemSettings", named("VirtualSystem", "ORX:2*normal-3", "LparName = \"x\";")}, "property LparName"},
        {"ModifySystemSettings", {"SystemSettings", named("VirtualSystem", "ORX:4*3", "BootMode = \"of\";")}, "property BootMode"},
        {"AddResourceSettings", {"AffectedConfiguration", normal3, "ResourceSettings", both}, "4"},
        {"AddResourceSettings", {"AffectedConfiguration", referenceTo("VirtualSystem", "ORX:2*other-3"), "ResourceSettings", adapter("SlotID = 9")}, "WRTL"},
        {"AddResourceSettings", {"AffectedConfiguration", normal3, "ResourceSettings", adapter("SlotID = 2")}, "WRTL"},
        {"AddResourceSettings", {"AffectedConfiguration", referenceTo("VirtualSystem", "ORX:4*3"), "ResourceSettings", adapter("SlotID = 9; IsRequired = 1")}, "property IsRequired"},
        {"ModifyResourceSettings", {"ResourceSettings", '{' + memory + '}'}, "4"},
        {"ModifyResourceSettings", {"ResourceSettings", '{' + named("MemoryRA", "ORX:2*normal-3", "") + ',' + named("MemoryRA", "ORX:2*normal-4", "") + '}'}, "4"},
        {"ModifyResourceSettings", {"ResourceSettings", '{' + named("EthernetAdapterRA", "ORX:2*normal-2*3", "SlotID = 5;") + '}'}, "property SlotID"},
        {"ModifyResourceSettings", {"ResourceSettings", '{' + named("EthernetAdapterRA", "ORX:2*normal-2*3", "IEEECompatible = 2;") + '}'}, "WRTL"},
        {"ModifyResourceSettings", {"ResourceSettings", '{' + named("EthernetAdapterRA", "ORX:4*2*3", "PortVLANID = 5;") + '}'}, "1"},
        {"ModifyResourceSettings", {"ResourceSettings", '{' + named("IOSlotAdapterRA", "ORX:2*normal-30000005*6", "TaggedIOType = {1};") + '}'}, "The tags 2, 5 and 6"},
        {"ModifyResourceSettings", {"ResourceSettings", '{' + named("MemoryRA", "ORX:4*6", "VirtualQuantity = 1;") + '}'}, "5"},
        {"ModifyResourceSettings", {"ResourceSettings", '{' + named("MemoryRA", "ORX:4*3", "Limit = 1024;") + '}'}, "property Limit"},
        {"ModifyResourceSettings", {"ResourceSettings", '{' + named("MemoryRA", "ORX:2*normal-3", "VirtualQuantity = 8388609;") + '}'}, "property VirtualQuantity"},
        {"RemoveResourceSettings", {"ResourceSettings", '{' + referenceTo("MemoryRA", "ORX:2*normal-3") + '}'}, "4"},
        {"RemoveResourceSettings", {"ResourceSettings", '{' + referenceTo("EthernetAdapterRA", "ORX:2*normal-2*3") + ',' + referenceTo("EthernetAdapterRA", "ORX:2*normal-2*4") + '}'}, "4"},
        {"RemoveResourceSettings", {"ResourceSettings", '{' + referenceTo("EthernetAdapterRA", "ORX:4*9*3") + '}'}, "4"},
        {"AddResourceSettings", {"AffectedConfiguration", normal3, "ResourceSettings", adapter("SlotID = 9; PoolID = \"1\"")}, "property PoolID"},
    };
    const auto all = [this] { return m_appliance.run("qyplat -r prof -m alpha; qyplat -r lpar -m alpha; qyalloc -r virtualio --rsubtype eth --level lpar -m alpha").out; };
    const std::string before = all();
    for (const auto& row : rows) {
        const std::string got = answerOf(call(row.method, row.arguments));
        const bool isNumber = std::strlen(row.answer) == 1;
        EXPECT_TRUE(isNumber ? got == row.answer : got.find(row.answer) != got.npos) << row.method << ' ' << got << "; expected " << row.answer;
    }
    EXPECT_EQ(all(), before);
}

// Each row finds what those before it made.
TEST_P(ManagementServiceTest, WhatIsNotSaidStays) {
    const std::string six = "qyplat -r prof -m alpha --filter lpar_ids=6 -F ", four = "qyplat -r prof -m alpha --filter lpar_ids=4,profile_names=normal -F ";
    const struct {
        const char* method;
        Texts arguments;
        std::string query;
        const char* record;
        bool isJob = false;
    } rows[] = {
        {"ModifyResourceSettings", {"ResourceSettings", '{' + named("MemoryRA", "ORX:2*normal-6", "VirtualQuantity = 9437184;") + '}'}, six + "desired_mem,max_mem,proc_mode,io_slots,load_source_slot,alt_restart_device_slot", "9216,16384,ded,30000005/none/1,30000005,30000005"},
        {"ModifyResourceSettings", {"ResourceSettings", '{' + named("IOSlotAdapterRA", "ORX:2*normal-30000005*6", "IsRequired = 0; TaggedIOType = {1, 2, 4};") + '}'}, six + "io_slots,load_source_slot", "30000005/none/0,30000005"},
        {"ModifyResourceSettings", {"ResourceSettings", '{' + named("ProcessorRA", "ORX:2*normal-6", "ConsumerVisibility = 3; SharingMode = \"uncap\"; Weight = 9; Reservation = 150; Limit = 600;") + '}'}, six + "proc_mode,sharing_mode,uncap_weight,desired_procs,desired_proc_units,max_proc_units,shared_proc_pool_id", "shared,uncap,9,3,1.50,6.00,0"},
        {"ModifyResourceSettings", {"ResourceSettings", '{' + named("EthernetAdapterRA", "ORX:2*normal-5*4", "AddVLANIDs = {21};") + '}'}, four + "virtual_eth_adapters", R"("2/0/1//0/0/default,5/1/7/21/0/0/storage")"},
        {"AddResourceSettings", {"AffectedConfiguration", referenceTo("VirtualSystem", "ORX:2*normal-4"), "ResourceSettings", "{instance of ORXC_SCSIAdapterRASettingData { SlotID = 8; VirtualAdapterType = 1 }}"}, four + "virtual_scsi_adapters", "\"3/client/2/xbrg2/14/1,8/client/any//any/0\""},
        {"RemoveResourceSettings", {"ResourceSettings", '{' + referenceTo("SCSIAdapterRA", "ORX:2*normal-3*4") + '}'}, four + "virtual_scsi_adapters,virtual_eth_adapters", R"(8/client/any//any/0,"2/0/1//0/0/default,5/1/7/21/0/0/storage")"},
        {"ModifySystemSettings", {"SystemSettings", named("VirtualSystem", "ORX:2*normal-4", "ElementName = \"usual\"; ProfileName = \"normal\"; BootMode = \"sms\";")}, "qyplat -r prof -m alpha --filter lpar_ids=4,profile_names=usual -F name,boot_mode,max_virtual_slots", "usual,sms,11"},
        {"ModifySystemSettings", {"SystemSettings", named("VirtualSystem", "ORX:4*4", "LparName = \"db\"; Keylock = \"norm\";")}, "qyplat -r lpar -m alpha --filter lpar_ids=4 -F name,lpar_keylock,default_profile", "db,norm,usual"},
        {"ModifyResourceSettings", {"ResourceSettings", '{' + named("ProcessorRA", "ORX:4*3", "VirtualQuantity = 300; Reservation = 140; Weight = 9;") + ',' + named("MemoryRA", "ORX:4*3", "VirtualQuantity = 7340032;") + '}'}, "qyalloc -r mem --level lpar -m alpha --filter lpar_ids=3 -F run_mem", "7168", true},
        {"AddResourceSettings", {"AffectedConfiguration", referenceTo("VirtualSystem", "ORX:4*3"), "ResourceSettings", "{instance of ORXC_EthernetAdapterRASettingData { SlotID = 7; PortVLANID = 3 }}"}, "qyalloc -r virtualio --rsubtype eth --level lpar -m alpha --filter lpar_ids=3 -F slot_num,port_vlan_id", "2,4\n7,3", true},
        {"RemoveResourceSettings", {"ResourceSettings", '{' + referenceTo("EthernetAdapterRA", "ORX:4*7*3") + '}'}, "qyalloc -r virtualio --rsubtype eth --level lpar -m alpha --filter lpar_ids=3 -F slot_num,port_vlan_id", "2,4", true},
        {"ModifyResourceSettings", {"ResourceSettings", '{' + named("MemoryRA", "ORX:4*3", "VirtualQuantity = 7340032;") + '}'}, "qyalloc -r proc --level lpar -m alpha --filter lpar_ids=3 -F run_procs,run_proc_units,run_uncap_weight", "3,1.40,9"},
    };
    for (const auto& row : rows) {
        const Reply reply = call(row.method, row.arguments);
        EXPECT_EQ(answerOf(reply), row.isJob ? "4096" : "0") << row.record;
        const Value* const job = reply.out.find("Job");
        while (job != nullptr && std::stoi(textOf(m_server->getInstance(m_request, job->reference()).instances.at(0).properties, "JobState")) < 7) {
            std::this_thread::sleep_for(std::chrono::milliseconds(10));
        }
        EXPECT_EQ(m_appliance.run(row.query).out, row.record + std::string("\n"));
        EXPECT_EQ(job != nullptr, row.isJob);
    }
    EXPECT_EQ(m_appliance.run("appliance check").out, "");
}
// clang-format on

ON_BOTH_BROKERS(ManagementServiceTest);

}  // namespace

// The settings of partitions, and the pools from which these take their resources, as a server sees
// them, beside what the tools print of the same, and what they cost in calls of the management
// library.
#include <cmath>
#include <map>
#include <regex>

#include "LibrarySpy.h"
#include "ServedProviders.h"
#include "ToolRecords.h"

namespace {

using namespace cimom;
using testing_support::lines;
using testing_support::ServedProviders;
using testing_support::textOf;

constexpr char kSystem[] = "ORXC_VirtualSystemSettingData";
constexpr const char* kClasses[] = {kSystem,
                                    "ORXC_ProcessorRASettingData",
                                    "ORXC_MemoryRASettingData",
                                    "ORXC_IOSlotAdapterRASettingData",
                                    "ORXC_EthernetAdapterRASettingData",
                                    "ORXC_SCSIAdapterRASettingData",
                                    "ORXC_SerialAdapterRASettingData"};

/// The classes of pools, of one kind of resource after the other, in the order of kClasses.
const std::vector<std::string> kPoolClasses = [] {
    std::vector<std::string> names;
    for (const char* kind :
         {"Processor", "Memory", "IOSlot", "EthernetAdapter", "SCSIAdapter", "SerialAdapter"}) {
        for (const char* role : {"Pool", "AllocationCapabilities", "PoolConfigurationCapabilities",
                                 "PoolConfigurationService"}) {
            names.push_back(std::string("ORXC_") + kind + role);
        }
    }
    return names;
}();

ObjectPath settings(const std::string& className, const std::string& id) {
    return {"root/cimv2", className, {{"InstanceID", id}}};
}

/// What a property shows of a tool's value, which is a number where it is scaled.
std::string shown(const std::string& value, const std::string& scale) {
    static const std::map<std::string, std::string> words = {
        {"server", "0"}, {"client", "1"}, {"any", ""}, {"none", ""}, {"20,30", "{20,30}"}};
    if (!scale.empty()) {
        return std::to_string(std::llround(std::stod(value) * std::stod(scale)));
    }
    const auto word = words.find(value);
    return word == words.end() ? value : word->second;
}

class SettingProvidersTest : public ServedProviders {
protected:
    std::deque<Instance> all(const std::string& className) {
        const Reply reply = m_server->enumInstances(m_request, {"root/cimv2", className});
        EXPECT_EQ(reply.rc, CMPI_RC_OK) << className << reply.message;
        return reply.instances;
    }

    /// Those whose InstanceIDs, or Names, begin and end with these.
    std::vector<Instance> some(const std::string& className, const std::string& front,
                               const std::string& back) {
        std::vector<Instance> found;
        for (const Instance& each : all(className)) {
            const std::string id = textOf(each, "InstanceID") + textOf(each, "Name");
            if (id.rfind(front, 0) == 0 && id.size() > back.size() &&
                id.compare(id.size() - back.size(), back.size(), back) == 0) {
                found.push_back(each);
            }
        }
        return found;
    }
};

// Of partition 4 but where it is said, or of pools; "Property=attribute*scale", or what all have.
TEST_P(SettingProvidersTest, PropertiesAreWhatTheToolsPrint) {
    const std::string here = " -m '1111-AAA*0000001' --filter lpar_ids=";
    const struct {
        const char* className;
        const char* front;
        std::string partition;
        const char* query;
        std::string properties;
        // clang-format off
    } rows[] = {
        {kSystem, "ORX:4*", "4", "qyplat -r lpar", "ElementName=name LparName=name LparID=lpar_id VirtualSystemType=lpar_env BootMode=boot_mode Keylock=lpar_keylock ProfileName=curr_profile DefaultProfileName=default_profile IsDefault:true HostName:1111-AAA*0000001 AutomaticStartupAction:2 MaxVirtualSlots:11"},
        {kSystem, "ORX:2*small", "4", "qyplat -r prof", "ElementName=name ProfileName=name LparName=lpar_name IsDefault:false BootMode=boot_mode MaxVirtualSlots=max_virtual_slots DefaultProfileName:normal"},
        {kSystem, "ORX:4*", "2", "qyplat -r lpar", "AutomaticStartupAction=auto_start*4"},
        {kClasses[1], "ORX:4*", "4", "qyalloc -r proc --level lpar",
         "VirtualMinimum=curr_min_procs*100 VirtualQuantity=run_procs*100 "
         "VirtualMaximum=curr_max_procs*100 Minimum=curr_min_proc_units*100 "
         "Reservation=run_proc_units*100 Limit=curr_max_proc_units*100 "
         "SharingMode=curr_sharing_mode "
         "PoolID=curr_shared_proc_pool_id ConsumerVisibility:3 MappingBehavior:1 Weight: "
         "ElementName:3-Processor ResourceType:3 AllocationUnits:Percent ProcCompatMode:CORAL6+"},
        {kClasses[1], "ORX:2*small", "4", "qyplat -r prof", "VirtualMinimum=min_procs*100 VirtualQuantity=desired_procs*100 Limit=max_proc_units*100 Reservation=desired_proc_units*100 SharingMode=sharing_mode PoolID=shared_proc_pool_id ProcCompatMode=lpar_proc_compat_mode"},
        {kClasses[2], "ORX:4*", "4", "qyalloc -r mem --level lpar", "Minimum=curr_min_mem*1024 Reservation=run_mem*1024 Limit=curr_max_mem*1024 VirtualQuantity=run_mem*1024 PoolID:Primordial AutomaticAllocation:true IsRequired:"},
        {kClasses[2], "ORX:4*", "3", "qyalloc -r mem --level lpar", "VirtualQuantity=run_mem*1024 Reservation=run_io_entitled_mem*1024 Weight=run_mem_weight ConsumerVisibility:3 PoolID:0 Limit:"},
        {kClasses[3], "ORX:4*", "6", "qyalloc -r io --rsubtype slot", "DRCIndex=drc_index IsRequired:1 TaggedIOType:{1,2,4} IsVirtualized:false"},
        {kClasses[4], "ORX:4*", "4", "qyalloc -r virtualio --rsubtype eth --level lpar", "SlotID=slot_num Address=mac_addr PortVLANID=port_vlan_id AddVLANIDs=addl_vlan_ids IEEECompatible=ieee_virtual_eth TrunkPriority=trunk_priority IsRequired=is_required"},
        {kClasses[5], "ORX:4*", "4", "qyalloc -r virtualio --rsubtype scsi --level lpar", "SlotID=slot_num VirtualAdapterType=adapter_type RemoteVirtualSystemID=remote_lpar_id RemoteSlotID=remote_slot_num IsRequired=is_required"},
        {kClasses[6], "ORX:4*", "4", "qyalloc -r virtualio --rsubtype serial --level lpar", "SlotID=slot_num VirtualAdapterType=adapter_type RemoteVirtualSystemID=remote_lpar_id RemoteSlotID=remote_slot_num IsRequired=is_required IsVirtualized:true"},
        {"ORXC_ProcessorPool", "ORX:3-Primordial", "", "qyalloc -r proc --level sys", "Capacity=configurable_sys_proc_units*100 InstalledCapacity=installed_sys_proc_units*100 Reserved:1050 Primordial:true PoolID:Primordial ResourceType:3 AllocationUnits:Percent ConsumedResourceUnits:Percent"},
        {"ORXC_ProcessorPool", "ORX:3-1", "", "qyalloc -r procpool --filter pool_ids=1", "Capacity=max_pool_proc_units*100 Reserved:375 InstalledCapacity: Primordial:false PoolID=shared_proc_pool_id ElementName=shared_proc_pool_id"},
        {"ORXC_MemoryPool", "ORX:4-Primordial", "", "qyalloc -r mem --level sys", "Capacity=configurable_sys_mem*1024 InstalledCapacity=installed_sys_mem*1024"},
        {"ORXC_MemoryPool", "ORX:4-0", "", "qyalloc -r mempool", "Capacity=pend_pool_mem*1024 InstalledCapacity=curr_pool_mem*1024 Reserved:524288"},
        {"ORXC_IOSlotPool", "ORX:12-", "", "qyalloc -r mem --level sys", "Capacity:7 Reserved:5 InstalledCapacity: AllocationUnits:Slot"},
        {"ORXC_MemoryAllocationCapabilities", "ORX:Shared:4-0", "", "qyalloc -r mempool", "ResourceType:4 RequestTypesSupported:3 SharingMode:3"},
        {"ORXC_MemoryPoolConfigurationService", "ORX:MemoryPoolService:", "", "qyalloc -r mem --level sys", "SystemName:1111-AAA*0000001 SystemCreationClassName:ORXC_CEC_CS Started:true"},
        {"ORXC_ProcessorPoolConfigurationService", "ORXCORAL:ProcessorPoolService:", "", "qyalloc -r mem --level sys", "CreationClassName:ORXC_ProcessorPoolConfigurationService"},
        {kClasses[1], "ORX:SMIN:3-1", "", "qyalloc -r proc --level sys", "Reservation=min_proc_units_per_virtual_proc*100 VirtualQuantity:100 Limit: PoolID:1 ElementName:SMIN:3-1 VirtualQuantityUnits:Percent"},
        {kClasses[2], "ORX:DDEF:4-Primordial", "", "qyalloc -r mem --level sys", "Reservation=mem_region_size*1024 Minimum=mem_region_size*1024 Limit=mem_region_size*2048 VirtualQuantity: PoolID:Primordial ResourceType:4 AllocationUnits:byte*2^10"},
        {kClasses[4], "ORX:DMAX:10-", "", "qyalloc -r mem --level sys", "VirtualQuantity:65534"},
    };
    // clang-format on
    for (const auto& row : rows) {
        std::string query =
            row.query + (row.partition.empty() ? " -m 1111-AAA*0000001" : here + row.partition);
        if (std::string(row.front) == "ORX:2*small") {
            query += R"(',"profile_names=small, ""safe"""')";
        }
        const std::vector<std::string> records = lines(m_appliance.run(query).out);
        const std::vector<Instance> found =
            some(row.className, row.front,
                 row.partition.empty() ? "1111-AAA*0000001" : row.partition + "*1111-AAA*0000001");
        ASSERT_EQ(found.size(), records.size()) << row.className << row.front << query;
        for (std::size_t i = 0; i < found.size(); ++i) {
            std::map<std::string, std::string> fields;
            for (const std::string& field : fieldsOf(records[i])) {
                const std::size_t equals = field.find('=');
                fields[field.substr(0, equals)] = field.substr(equals + 1);
            }
            std::istringstream properties(row.properties);
            for (std::string property; properties >> property;) {
                const std::size_t end = property.find_first_of("=:");
                const std::size_t star = property.find('*', end);
                std::string expected = property.substr(end + 1);
                if (property[end] == '=') {
                    const auto value = fields.find(property.substr(end + 1, star - end - 1));
                    ASSERT_NE(value, fields.end()) << property;
                    expected = shown(value->second,
                                     star == property.npos ? "" : property.substr(star + 1));
                }
                const std::string text = textOf(found[i], property.substr(0, end));
                EXPECT_EQ(text[0] == '{' ? std::regex_replace(text, std::regex(" "), "") : text,
                          expected)
                    << row.className << ' ' << row.front << ' ' << property;
            }
        }
    }
}

TEST_P(SettingProvidersTest, EverySettingIsFoundByItsNameAndHasOnlyWantedProperties) {
    std::vector<std::string> classes = kPoolClasses;
    classes.insert(classes.end(), std::begin(kClasses), std::end(kClasses));
    classes.push_back("ORXC_HostConnection");
    for (const std::string& name : classes) {
        const std::deque<Instance> found = all(name);
        ASSERT_GE(found.size(), 4u) << name;
        std::deque<ObjectPath> paths;
        for (const Instance& each : found) {
            EXPECT_TRUE(m_server->getInstance(m_request, each.path).instances.at(0) == each)
                << plainText(Value(each.path));
            paths.push_back(each.path);
        }
        EXPECT_EQ(m_server->enumInstanceNames(m_request, {"root/cimv2", name}).paths, paths);

        ObjectPath wrong = paths.back();
        wrong.keys.set(wrong.keys.begin()->name, std::string("ORXC_LPAR_CS"));
        EXPECT_EQ(m_server->getInstance(m_request, wrong).rc, CMPI_RC_ERR_NOT_FOUND) << name;

        m_request.properties = {{"ElementName"}};
        const Instance one = m_server->getInstance(m_request, paths.back()).instances.at(0);
        EXPECT_EQ(textOf(one, "ElementName"), textOf(found.back(), "ElementName"));
        for (const char* other : {"HostName", "ResourceType", "VirtualQuantityUnits", "SlotID",
                                  "Capacity", "Caption"}) {
            EXPECT_EQ(textOf(one, other), "") << name << other;
        }
        m_request.properties.reset();
    }
}

// The library is asked for nothing whose name has not the form of one.
TEST_P(SettingProvidersTest, NamesOfNothingAreNotFound) {
    const std::pair<bool, std::vector<const char*>> rows[] = {
        // whether the library is asked
        {false,
         {"", "*", "**", "ORX:4*", "ORX:4*1111-AAA*0000001", "ORX:4**1111-AAA*0000001",
          "ORX:3*4*1111-AAA*0000001", "ORX:4*4*1111-AAA*", "ORX:4*x*1111-AAA*0000001",
          "ORX:4*1*x*1111-AAA*0000001", "ORX:4*4444444*1111-AAA*0000001",
          "ORX:2*4*1111-AAA*0000001", "ORX:2*normal-*1111-AAA*0000001",
          "ORX:2*normal-3*\" -m *0000001", "ORX:3-Primordial", "ORX:3-Primordial*\" -m *0000001",
          "ORX:5-Primordial*1111-AAA*0000001"}},
        {true,
         {"ORX:4*99*1111-AAA*0000001", "ORX:4*99*99*1111-AAA*0000001", "ORX:4*1*9999-ZZZ*0000009",
          "ORX:2*other-4*1111-AAA*0000001", "ORX:2*normal-99*4*1111-AAA*0000001",
          "ORX:4*04*1111-AAA*0000001", "ORX:3-Primordial*9999-ZZZ*0000009",
          "ORX:3-64*1111-AAA*0000001", "ORX:DMIN:3-0*1111-AAA*0000001",
          "ORX:SMIN:10-Primordial*1111-AAA*0000001"}}};
    std::vector<std::string> classes = {kPoolClasses[0], kPoolClasses[5], kPoolClasses[10]};
    classes.insert(classes.end(), std::begin(kClasses), std::end(kClasses));
    for (const auto& [isAsked, ids] : rows) {
        for (const char* id : ids) {
            librarySpy.names.clear();
            for (const std::string& name : classes) {
                EXPECT_EQ(m_server->getInstance(m_request, settings(name, id)).rc,
                          CMPI_RC_ERR_NOT_FOUND)
                    << name << ' ' << id;
            }
            EXPECT_EQ(!librarySpy.names.empty(), isAsked) << id;
        }
    }
    // of a partition that is not activated, the adapters alone
    for (const char* name : kClasses) {
        const bool isHeld = name == kClasses[1] || name == kClasses[2] || name == kClasses[3];
        EXPECT_EQ(some(name, "ORX:4*", "1*1111-AAB*0000002").empty(), isHeld) << name;
        EXPECT_FALSE(some(name, "ORX:2*normal-", "1*1111-AAB*0000002").empty()) << name;
    }
    const ObjectPath stopped = settings(kClasses[1], "ORX:4*1*1111-AAB*0000002");
    EXPECT_EQ(m_server->getInstance(m_request, stopped).rc, CMPI_RC_ERR_NOT_FOUND);
}

// An enumeration, and a get of the last one that it found: of the settings of partitions, and,
// behind those, of the pools of the same kind.
TEST_P(SettingProvidersTest, CollectionsAreAskedForOnceWhateverTheNumberOfPartitions) {
    const struct {
        std::string all, behind, one;   // of partitions, and what the pools behind them need more
        std::string pools, quantities;  // of pools: what is read for names, and what besides
        std::string pool, ofOne;        // of those of one host
    } rows[] = {
        // as the classes
        {},
        {"getAllCecProcessorCfg getAllLparProcessorCfgs ", "getAllCecProcessorPoolCfg ",
         "getCecProcessorCfg getLparProcessorCfg ",
         "getAllCecProcessorCfg getAllCecProcessorPoolCfg ", "getAllLpars getAllLparProcessorCfgs ",
         "getCecProcessorCfg getCecProcessorPoolCfg ",
         "getAllLparsFromCec getAllLparProcessorCfg "},
        {"getAllCecMemoryCfg getAllLparMemoryCfgs ", "getAllCecMemoryPoolCfgs ",
         "getCecMemoryCfg getLparMemoryCfg ", "getAllCecMemoryCfg getAllCecMemoryPoolCfgs ",
         "getAllLpars getAllLparMemoryCfgs ", "getCecMemoryCfg getCecMemoryPoolCfg ",
         "getAllLparsFromCec getAllLparMemoryCfg "},
        {"getAllIoSlots ", "", "getLparIoSlots ", "", "getAllLpars getAllIoSlots ", "",
         "getAllLparsFromCec getIoSlots "},
        {"getAllLparVirtualEthernet ", "", "getLparVirtualEthernet ", "",
         "getAllLpars getAllLparVirtualEthernet ", "", "getAllLparsFromCec getVirtualEthernet "},
        {"getAllLparVirtualScsi ", "", "getLparVirtualScsi ", "",
         "getAllLpars getAllLparVirtualScsi ", "", "getAllLparsFromCec getVirtualScsi "},
        {"getAllLparVirtualSerial ", "", "getLparVirtualSerial ", "",
         "getAllLpars getAllLparVirtualSerial ", "", "getAllLparsFromCec getVirtualSerial "},
    };
    const auto calls = [] {
        std::string names;
        for (const std::string& name : std::exchange(librarySpy.names, {})) {
            names += name + ' ';
        }
        return names;
    };
    calls();
    for (const char* size :
         {"true", "appliance generate --hosts 2 --lpars 40 --pools 64 --force"}) {
        ASSERT_EQ(m_appliance.run(size).exit, 0);
        for (std::size_t i = 0; i < std::size(kClasses); ++i) {
            const auto& row = rows[i];
            const std::string ofPools = i == 0 ? "" : "getAllCecs " + row.pools + row.quantities;
            std::vector<Instance> found = some(kClasses[i], "ORX:2*", "");
            EXPECT_EQ(calls(), "getAllCecs getAllLpars getAllLparProfiles " + row.all + row.behind);
            m_server->getInstance(m_request, found.back().path);
            EXPECT_EQ(calls(), "getCecObj getLparObj getAllLparProfilesFromLpar " + row.one);
            for (std::size_t role = 0; i > 0 && role < 4; ++role) {
                const std::string& name = kPoolClasses[4 * (i - 1) + role];
                found = some(name, "", "");
                EXPECT_EQ(calls(), role == 0 ? ofPools : "getAllCecs " + row.pools) << name;
                m_server->getInstance(m_request, found.back().path);
                EXPECT_EQ(calls(), "getCecObj " + row.pool + (role == 0 ? row.ofOne : "")) << name;
            }
        }
    }
    // associations look for what could belong to their source
    const ObjectPath system = settings(kSystem, "ORX:4*1*1111-AAA*0000001");
    EXPECT_FALSE(m_server->associatorNames(m_request, system, {}).paths.empty());
    EXPECT_EQ(calls().find("getAllLpars "), std::string::npos);
    EXPECT_EQ(librarySpy.held, 0);
}

// Through an association that is read at once; the primordial pool counts what its parts have
// given.
TEST_P(SettingProvidersTest, PoolsOfProcessorsHaveGivenWhatPartitionsHave) {
    ASSERT_EQ(m_appliance.run("appliance generate --hosts 3 --lpars 40 --pools 9 --force").exit, 0);
    std::map<std::string, long> held, given;
    std::map<std::string, std::string> quantities;
    for (const Instance& each : all(kClasses[1])) {
        quantities[textOf(each, "InstanceID")] = textOf(each, "Reservation");
    }
    librarySpy.names.clear();
    for (const Instance& each : all("ORXC_ResourceAllocationFromPool")) {
        const auto idOf = [&](const char* end) {
            return each.properties.find(end)->reference().keys.begin()->value.text();
        };
        const std::string pool = idOf("Antecedent");
        if (pool.rfind("ORX:3-", 0) == 0) {
            const long units = std::stol(quantities.at(idOf("Dependent")));
            held[pool] += units;
            held["ORX:3-Primordial" + pool.substr(pool.find('*'))] +=
                pool.find("Primordial") == pool.npos ? units : 0;
        }
    }
    EXPECT_LT(librarySpy.names.size(), 70u);
    for (const Instance& each : all("ORXC_ProcessorPool")) {
        const std::string pool = textOf(each, "InstanceID");
        given[pool] = std::stol(textOf(each, "Reserved"));
        held[pool] += 0;
    }
    EXPECT_EQ(given.size(), 30u);
    EXPECT_EQ(held, given);
}

TEST_P(SettingProvidersTest, ProfilesTellWhichIsTheDefaultAndWhichRuns) {
    std::vector<std::string> told, expected;
    for (const Instance& each : all("ORXC_ElementSettingData")) {
        told.push_back(textOf(each, "IsDefault") + textOf(each, "IsCurrent"));
    }
    for (const std::string& state : lines(m_appliance.run("qyplat -r lpar -F state").out)) {
        expected.push_back(state == "Not Activated" ? "12" : "11");
    }
    expected.insert(expected.begin() + 4, "22");  // the second profile of the fourth partition
    EXPECT_EQ(told, expected);
}

ON_BOTH_BROKERS(SettingProvidersTest);

}  // namespace

// That the management library and the tools tell one story, in all that both tell.

#include <cctype>
#include <cstring>
#include <map>
#include <set>
#include <sstream>
#include <stdexcept>

#include "ApiAnswer.h"
#include "Operations.h"
#include "Store.h"
#include "Text.h"

namespace {

using appliance::Kind;

/// What a tool prints about objects that operations of the library tell of.
struct Door {
    /// The tool prints one record for each object, in the same order. With `match` it is asked host
    /// by host, and those records belong together in which this pair agrees; where there is none,
    /// its words count as empty.
    const char* command;

    /// "<key>:<printed>|<how>" with semicolons between them; the key alone where both have one
    /// name. <printed> is an attribute, or several with characters between them; "@" is the host's
    /// key. <how> turns the tool's words into the library's: not at all when it is empty, to
    /// hundredths with "%", without decimals with "whole", from hexadecimal with "x", in brackets
    /// with "[" and how for each element, without a text in front with that text and a slash, or by
    /// words with their codes ("*" for all others) or their name in kWords. Some turn the
    /// library's: "," and
    /// ">" to what is behind the first comma or asterisk, "bit<n>:<b>" to whether word n of a list
    /// has bit b.
    const char* pairs;

    const char* match = nullptr;
};

/// Operations that return one kind of record.
struct Records {
    OfAll all;
    OfKey ofHost, ofLpar;  // null where there is none
    Kind kind;
    std::vector<Door> doors;
    std::string untold = "";  // keys that no tool prints, with semicolons between them
};

const std::map<std::string, std::string> kWords = {
    {"host state",
     "Operating=1,Standby=0,Power Off=3,Initializing=6,Error=12,Error - Dump in progress=13,"
     "Error - Terminated=14,QCAP Click to Accept=15,Power Off In Progress=32,"
     "Service Processor Failover In Progress=33,Failed Authentication=241,"
     "Pending Authentication - Password Updates Required=242,Version Mismatch=250,Recovery=251,"
     "Incomplete=253,No Connection=254"},
    {"lpar state",
     "Not Activated=0,Starting=1,Running=2,Shutting Down=3,Error=4,Open Firmware=8,Suspended=9,"
     "Not Available=252,unknown=255"},
    {"migration",
     "Not Migrating=9,Migration Starting=10,Migration Stopped=12,Migration In Progress=13,"
     "Migration Complete=16,Lost Connection=255"},
    {"modes",
     "CORAL5=0,CORAL6_enhanced=1,CORAL6=2,CORAL6+=3,CORAL7=4,CORAL6+_enhanced=5,"
     "CORAL7_enhanced=6,CORAL7+=7,CORAL7+_enhanced=8,CORAL8=9,CORAL8_enhanced=10,default=63"},
    {"boot", "norm=1,ds=2,sms=3,of=4,dd=5"},
    {"sharing",
     "cap=0,uncap=1,keep_idle_procs=1,share_idle_procs=0,share_idle_procs_always=0,"
     "share_idle_procs_active=1"},
    {"donor",
     "cap=0,uncap=0,keep_idle_procs=0,share_idle_procs=0,share_idle_procs_always=1,"
     "share_idle_procs_active=1"},
    {"pool", "ded/null=255,shared/0=0,shared/1=1"},
    {"definition",
     "tmxlinux/1=1,tmxlinux/0=2,xbrgserver/1=3,xbrgserver/0=4,osq00/1=129,osq00/0=130"},
    {"truth", "1=true,0=false"},
    {"any", "any=65535"},
    {"side", "client=0,server=1"},
    {"mem mode", "ded=255,shared=0"},
};

// clang-format off
const std::vector<Records> kRecords = {
    {getAllCecs, getCecObj, nullptr, Kind::Host,
     {{"qyplat -r sys",
       "Name:type_model*serial_num;UserDefinedName:name;PrimaryFSP_IP:ipaddr;"
       "State:state|host state;RuntimeCapability:osq00_capable|1=1073741824,0=0;"
       "ProcCompatModesSupported:lpar_proc_compat_modes|[modes;"
       "GlvExCaps:virtual_io_server_capable|bit0:8;GlvExCaps:osq00_capable|bit0:64;"
       "GlvExCaps:redundant_err_path_reporting_capable|bit0:32;"
       "GlvExCaps:virtual_switch_capable|bit1:1;GlvExCaps:active_lpar_mobility_capable|bit1:32;"
       "GlvExCaps:inactive_lpar_mobility_capable|bit1:64;"
       "GlvExCaps:lpar_proc_compat_mode_capable|bit2:16;GlvExCaps:lpar_suspend_capable|bit5:16"},
      {"qylink -r all", "PrimaryFSP_IP:ipaddr", "Name:sp/type_model_serial_num|primary/"},
      {"qylink -r all", "BackupFSP_IP:ipaddr", "Name:sp/type_model_serial_num|secondary/"},
      {"qyalloc -r proc --level sys",
       "ConfigurableProcUnits:configurable_pool_proc_uints;"
       "PendAvailProcUnits:pend_avail_sys_proc_units"}},
     "Capability"},
    {getAllLpars, getAllLparsFromCec, getLparObj, Kind::Lpar,
     {{"qyplat -r lpar",
       "Name:lpar_id*@;UserDefinedName:name;Lpar_env:lpar_env;"
       "DefinitionState:lpar_env/resource_config|definition;PartitionState:state|lpar state;"
       "BootMode:boot_mode|boot;MigrationState:migration_state|migration;"
       "Default_prof:default_profile|,;Curr_prof:curr_profile|,;"
       "Keylock:lpar_keylock|norm=4,manual=2;RedundantPath:redundant_err_path_reporting;"
       "ProcCompatMode:desired_lpar_proc_compat_mode|modes;"
       "ActualProcCompatMode:curr_lpar_proc_compat_mode|modes;PowerOnWithHypervisor:auto_start"}}},
    {getAllLparProfiles, getAllLparProfilesFromCec, getAllLparProfilesFromLpar, Kind::Profile,
     {{"qyplat -r prof",
       "Name:lpar_id*@|>;PartitionName:lpar_id*@;UserDefinedName:name;lpar_env;lpar_name;"
       "SFPSurveillance:conn_monitoring;AutoIPLEnabled:auto_start;"
       "MaxVirtualSlots:max_virtual_slots;BootMode:boot_mode|boot;"
       "RedundantPath:redundant_err_path_reporting;ProcMode:proc_mode/shared_proc_pool_id|pool;"
       "ProcessorMode:lpar_proc_compat_mode|modes;SharingMode:sharing_mode|sharing;"
       "DonorMode:sharing_mode|donor;UncappedWeight:uncap_weight;MinProcUnit:min_proc_units|%;"
       "DesiredProcUnit:desired_proc_units|%;MaxProcUnit:max_proc_units|%;"
       "MinimumCPUCount:min_procs;DesiredCPUCount:desired_procs;MaximumCPUCount:max_procs;"
       "SharedProcPoolId:shared_proc_pool_id;MinimumMemory:min_mem;DesiredMemory:desired_mem;"
       "MaximumMemory:max_mem;MemMode:mem_mode|mem mode;VRMWeight:mem_weight;"
       "EntitledMode:desired_io_entitled_mem|auto=1,*=0;EntMem:desired_io_entitled_mem|auto=0;"
       "AltConsoleDRCIndex:alt_console_slot;AltLoadSourceDRCIndex:alt_restart_device_slot;"
       "ConsoleDRCIndex:console_slot;LoadSourceDRCIndex:load_source_slot;"
       "ECSDRCIndex:op_console_slot;virtual_serial_adapters;virtual_scsi_adapters;"
       "virtual_eth_adapters;io_slots"},
      {"qyplat -r lpar", "DefinitionState:lpar_env/resource_config|definition",
       "PartitionName:lpar_id*@"}}},
    {getAllCecMemoryCfg, getCecMemoryCfg, nullptr, Kind::Host,
     {{"qyalloc -r mem --level sys",
       "Name:@;ConfigurableMem:configurable_sys_mem;InstalledMemory:installed_sys_mem;"
       "MaxMemPools:max_mem_pools;PendAvailMem:pend_avail_sys_mem;LMBSize:mem_region_size"}}},
    {getAllCecMemoryPoolCfgs, getCecMemoryPoolCfg, nullptr, Kind::MemPool,
     {{"qyalloc -r mempool", "SystemName:@;curr_pool_mem;pend_pool_mem;pend_avail_pool_mem"}}},
    {getAllCecProcessorCfg, getCecProcessorCfg, nullptr, Kind::Host,
     {{"qyalloc -r proc --level sys",
       "Name:@;ConfigurableProcUnits:configurable_sys_proc_units;"
       "CurAvailProcUnits:curr_avail_sys_proc_units;"
       "InstalledProcessors:installed_sys_proc_units|whole;MaxProcPools:max_shared_proc_pools;"
       "MinProcUnit:min_proc_units_per_virtual_proc;"
       "PendAvailProcUnits:pend_avail_sys_proc_units"}}},
    {getAllCecProcessorPoolCfg, getCecProcessorPoolCfg, nullptr, Kind::ProcPool,
     {{"qyalloc -r procpool",
       "SystemName:@;SharedProcPoolId:shared_proc_pool_id;MaxPoolCapacity:max_pool_proc_units;"
       "PendReservedPoolCapacity:pend_reserved_pool_proc_units;lpar_ids"}}},
    {getAllLparMemoryCfgs, getAllLparMemoryCfg, getLparMemoryCfg, Kind::Lpar,
     {{"qyalloc -r mem --level lpar",
       "Name:lpar_id*@;UserDefinedName:lpar_name;CurAllocMem:curr_mem;CurMaxMem:curr_max_mem;"
       "CurMinMem:curr_min_mem;PendAllocMem:pend_mem;PendMaxMem:pend_max_mem;"
       "PendMinMem:pend_min_mem;RuntimeEntMem:run_io_entitled_mem;RuntimeMem:run_mem;"
       "RuntimeVRMWeight:run_mem_weight;RuntimeMinMem:run_min_mem;EntUsage:auto_io_entitled_mem;"
       "CurrMemMode:mem_mode|mem mode"}}},
    {getAllLparProcessorCfgs, getAllLparProcessorCfg, getLparProcessorCfg, Kind::Lpar,
     {{"qyalloc -r proc --level lpar",
       "Name:lpar_id*@;UserDefinedName:lpar_name;CurMaxProcs:curr_max_procs;"
       "CurMaxProcUnits:curr_max_proc_units|%;CurMinProcs:curr_min_procs;"
       "CurMinProcUnits:curr_min_proc_units|%;"
       "CurProcMode:curr_proc_mode/curr_shared_proc_pool_id|pool;CurAllocProcs:curr_procs;"
       "CurAllocProcUnits:curr_proc_units|%;CurDonorMode:curr_sharing_mode|donor;"
       "CurSharingMode:curr_sharing_mode|sharing;CurUncappedWeight:curr_uncap_weight;"
       "PendMaxProcs:pend_max_procs;PendMaxProcUnits:pend_max_proc_units|%;"
       "PendMinProcs:pend_min_procs;PendMinProcUnits:pend_min_proc_units|%;"
       "PendProcMode:pend_proc_mode/pend_shared_proc_pool_id|pool;PendAllocProcs:pend_procs;"
       "PendAllocProcUnits:pend_proc_units|%;PendDonorMode:pend_sharing_mode|donor;"
       "PendSharingMode:pend_sharing_mode|sharing;PendUncappedWeight:pend_uncap_weight;"
       "RuntimeProcs:run_procs;RuntimeProcUnits:run_proc_units|%;"
       "RuntimeUncappedWeight:run_uncap_weight"}}},
    {getAllLparVirtualEthernet, getVirtualEthernet, getLparVirtualEthernet, Kind::Ethernet,
     {{"qyalloc -r virtualio --rsubtype eth --level lpar",
       "Name:lpar_id*@;lpar_id;lpar_name;mac_addr;slot_num;state;ieee_virtual_eth;port_vlan_id;"
       "addl_vlan_ids|none=;is_required|truth;is_trunk;trunk_priority"}},
     "vswitch"},
    {getAllLparVirtualScsi, getVirtualScsi, getLparVirtualScsi, Kind::VirtualScsi,
     {{"qyalloc -r virtualio --rsubtype scsi --level lpar",
       "Name:lpar_id*@;adapter_type|side;backing_devices;lpar_name;remote_lpar_id|any;"
       "remote_lpar_name;remote_slot_num|any;slot_num;state;is_required|truth"}}},
    {getAllLparVirtualSerial, getVirtualSerial, getLparVirtualSerial, Kind::Serial,
     {{"qyalloc -r virtualio --rsubtype serial --level lpar",
       "Name:lpar_id*@;adapter_type|side;connect_status|unavailable=null,none=0,active=1;"
       "is_required|truth;lpar_name;remote_lpar_id|any;remote_lpar_name;remote_slot_num|any;"
       "slot_num;state;supports_dnx"}}},
    {getAllIoSlots, getIoSlots, getLparIoSlots, Kind::Slot,
     {{"qyalloc -r io --rsubtype slot",
       "SystemName:@;lpar_id|null=;bus_grouping;bus_id;description;drc_index;drc_name;"
       "feature_codes|[;iop|truth;parent_slot_drc_index|none=null;pci_class|x;pci_device_id|x;"
       "pci_revision_id|x;pci_subs_device_id|x;pci_subs_vendor_id|x;pci_vendor_id|x;"
       "slot_io_pool_id|none=65535;unit_phys_loc"},
      {"qyplat -r lpar", "lpar_name:name", "lpar_id"}}},
};
// clang-format on

struct Pair {
    std::string key, printed, how;
};

std::vector<std::string> parts(const std::string& text, char separator) {
    std::vector<std::string> all;
    std::istringstream in(text);
    for (std::string part; std::getline(in, part, separator);) all.push_back(part);
    return all;
}

Pair pairOf(const std::string& text) {
    const std::string names = text.substr(0, text.find('|'));
    const std::size_t colon = names.find(':');
    const std::string how = names == text ? "" : text.substr(names.size() + 1);
    const auto words = kWords.find(how);
    return {names.substr(0, colon), colon == std::string::npos ? names : names.substr(colon + 1),
            words == kWords.end() ? how : words->second};
}

std::vector<Pair> pairsOf(const char* pairs) {
    std::vector<Pair> all;
    for (const std::string& text : parts(pairs, ';')) all.push_back(pairOf(text));
    return all;
}

/// The library's form of what a tool printed.
std::string coded(const std::string& word, const std::string& how) {
    if (how == "%") return std::to_string(appliance::hundredths(word));
    if (how == "whole") return std::to_string(appliance::hundredths(word) / 100);
    if (how == "x") return std::to_string(std::stoul(word, nullptr, 16));
    if (how[0] == '[') {
        const auto words = kWords.find(how.substr(1));
        std::vector<std::string> codes;
        for (const std::string& element : fieldsOf(word)) {
            codes.push_back(coded(element, words == kWords.end() ? " " : words->second));
        }
        return '[' + appliance::joined(codes) + ']';
    }
    if (how.back() == '/' && word.rfind(how, 0) == 0) return word.substr(how.size());
    for (const std::string& code : parts(how, ',')) {
        const std::size_t equals = code.find('=');
        if (equals == std::string::npos) break;
        if (code.substr(0, equals) == word || code[0] == '*') return code.substr(equals + 1);
    }
    return word;
}

/// The part of the library's value that a tool prints too.
std::string told(const std::string& value, const std::string& how) {
    if (how == ",") return value.substr(value.find(',') + 1);
    if (how == ">") return value.substr(value.find('*') + 1);
    if (how.rfind("bit", 0) != 0) return value;
    const auto words = parts(value.substr(1), ',');
    const auto bit = std::stoul(how.substr(how.find(':') + 1));
    return (std::stoul(words.at(std::stoul(how.substr(3)))) & bit) != 0 ? "1" : "0";
}

bool isNameCharacter(char c) { return c == '_' || std::isalnum(static_cast<unsigned char>(c)); }

/// The records of a tool as the texts that a door's pairs stand for.
class Printed {
public:
    explicit Printed(std::vector<Pair> pairs) : m_pairs(std::move(pairs)) {
        for (const Pair& pair : m_pairs) {
            std::string name;
            for (char c : pair.printed + ' ') {
                if (isNameCharacter(c)) {
                    name += c;
                } else if (!name.empty()) {
                    m_columns.emplace(name, m_columns.size());
                    name.clear();
                }
            }
        }
        std::vector<std::string> names(m_columns.size());
        for (const auto& [name, column] : m_columns) names[column] = name;
        m_names = appliance::joined(names);
    }

    const std::vector<Pair>& pairs() const { return m_pairs; }
    const std::vector<Record>& records() const { return m_records; }
    Record emptyRecord() const { return Record(m_columns.size()); }

    void ask(testing_support::TestAppliance& appliance, const std::string& command) {
        const auto outcome = appliance.run(command + " -F " + m_names);
        ASSERT_EQ(0, outcome.exit) << outcome.err;
        m_records = outcome.out == "No results were found.\n" ? std::vector<Record>()
                                                              : recordsOf(outcome.out);
    }

    /// What pair @p index has for @p record of the host, in the library's form.
    std::string expected(std::size_t index, const Record& record, const std::string& host) const {
        const Pair& pair = m_pairs[index];
        std::string text, name;
        for (char c : pair.printed + '\0') {
            if (isNameCharacter(c)) {
                name += c;
                continue;
            }
            if (!name.empty()) text += record.at(m_columns.at(name));
            name.clear();
            if (c != '\0') text += c == '@' ? host : std::string(1, c);
        }
        return pair.how.empty() ? text : coded(text, pair.how);
    }

private:
    std::vector<Pair> m_pairs;
    std::map<std::string, std::size_t> m_columns;
    std::string m_names;
    std::vector<Record> m_records;
};

class AgreementTest : public ApiTest {
protected:
    void compareAll() {
        const std::string printed = m_appliance.run("qyplat -r sys -F type_model,serial_num").out;
        m_hosts.clear();
        for (const Record& host : recordsOf(printed)) m_hosts.push_back(host[0] + '*' + host[1]);
        for (const Records& records : kRecords) {
            for (const Door& door : records.doors) {
                if (door.match == nullptr) {
                    compareInOrder(records, door);
                } else {
                    compareMatching(records, door);
                }
                if (HasFatalFailure()) return;
            }
            checkThatAllIsCompared(records);
        }
    }

    /// Lets no two attributes agree by chance: gives those that have codes all of their words, one
    /// after the other, flags a pattern of their own, and numbers that of their pair.
    void spreadValues() {
        appliance::Store store = appliance::Store::open(appliance::Database::Access::Write);
        appliance::Transaction change = store.write();
        for (appliance::Object& host : store.all(Kind::Host)) {
            host.set("deconfig_sys_mem", "256");
            store.put(host);
            appliance::Object pool(Kind::MemPool, host.place());
            pool.set("curr_pool_mem", "512");
            store.put(pool);
        }
        for (const Records& records : kRecords) {
            std::size_t index = 0;
            for (appliance::Object& object : store.all(records.kind)) {
                std::size_t number = 0;
                for (const Door& door : records.doors) {
                    for (const Pair& pair : pairsOf(door.pairs)) {
                        spread(object, pair, index, ++number);
                    }
                }
                store.put(object);
                ++index;
            }
        }
        change.commit();
    }

private:
    /// @param index  of the object among its like
    /// @param number  of the pair, from 1
    static void spread(appliance::Object& object, const Pair& pair, std::size_t index,
                       std::size_t number) {
        const auto names = parts(pair.printed, '/');
        const bool turn = index / number % 2 != 0;
        std::vector<std::string> values = {std::to_string(1000 + number)};
        std::int64_t unused = 0;
        try {
            if (pair.how == "%") {
                values[0] = std::to_string(number) + ".25";
            } else if (pair.how.rfind("bit", 0) == 0) {
                values[0] = turn ? "1" : "0";
            } else if (pair.how.find('=') != std::string::npos) {
                const auto codes = parts(pair.how, ',');
                const std::string& code = codes[(index + number) % codes.size()];
                if (code[0] == '*') return;
                if (codes.size() > 1 || turn) values = parts(code.substr(0, code.find('=')), '/');
            } else if (pair.how != "," && pair.how != "x" &&
                       (!pair.how.empty() || names[0] == "shared_proc_pool_id" ||
                        !appliance::wholeNumber(object.get(names[0]), &unused))) {
                return;
            }
            for (std::size_t i = 0; i < names.size(); ++i) object.set(names[i], values[i]);
        } catch (const std::logic_error&) {
            return;  // it follows from other objects
        }
    }

    void compareInOrder(const Records& records, const Door& door) {
        Printed printed(pairsOf(door.pairs));
        printed.ask(m_appliance, door.command);
        std::size_t next = 0;
        for (const std::string& host : m_hosts) {
            const Answer answer(records.ofHost("", host.c_str(), 2));
            for (int i = 0; i < answer.size(); ++i, ++next) {
                ASSERT_GT(printed.records().size(), next) << door.command;
                compare(door, printed, printed.records()[next], host, answer, i);
            }
        }
        ASSERT_EQ(printed.records().size(), next) << door.command;
    }

    void compareMatching(const Records& records, const Door& door) {
        auto pairs = pairsOf(door.pairs);
        pairs.push_back(pairOf(door.match));
        Printed printed(pairs);
        const std::size_t match = pairs.size() - 1;
        for (const std::string& host : m_hosts) {
            printed.ask(m_appliance, std::string(door.command) + " -m '" + host + '\'');
            std::map<std::string, Record> byMatch;
            for (const Record& record : printed.records()) {
                byMatch.emplace(printed.expected(match, record, host), record);
            }
            const Answer answer(records.ofHost("", host.c_str(), 2));
            for (int i = 0; i < answer.size(); ++i) {
                const auto found = byMatch.find(answer.value(i, pairs[match].key));
                compare(door, printed,
                        found == byMatch.end() ? printed.emptyRecord() : found->second, host,
                        answer, i, match);
            }
        }
    }

    /// @param end  behind the last pair to compare
    static void compare(const Door& door, const Printed& printed, const Record& record,
                        const std::string& host, const Answer& answer, int index,
                        std::size_t end = ~std::size_t{0}) {
        for (std::size_t i = 0; i < std::min(end, printed.pairs().size()); ++i) {
            const Pair& pair = printed.pairs()[i];
            ASSERT_EQ(printed.expected(i, record, host),
                      told(answer.value(index, pair.key), pair.how))
                << door.command << ", " << host << ", record " << index << ", " << pair.key;
        }
    }

    /// Fails for a key that is neither compared nor known as one that no tool prints.
    static void checkThatAllIsCompared(const Records& records) {
        std::set<std::string> compared;
        for (const Door& door : records.doors) {
            for (const Pair& pair : pairsOf(door.pairs)) compared.insert(pair.key);
        }
        for (const std::string& key : parts(records.untold, ';')) {
            EXPECT_TRUE(compared.insert(key).second) << key;
        }
        const Answer answer(records.all("", 2));
        for (int i = 0; i < answer.size(); ++i) {
            std::set<std::string> keys;
            const apiProp& record = *answer.record(i);
            for (int j = 0; j < record.propertyCount; ++j) keys.insert(record.name[j]);
            keys.erase("");  // more of a long value
            ASSERT_EQ(compared, keys);
        }
    }

    std::vector<std::string> m_hosts;
};

TEST_F(AgreementTest, OfTheDemo) {
    make("init");
    compareAll();
    for (const Records& records : kRecords) EXPECT_LT(0, Answer(records.all("", 1)).size());
}

TEST_F(AgreementTest, OfTwoHundredPartitions) {
    make("generate --hosts 2 --lpars 100");
    compareAll();
}

TEST_F(AgreementTest, WhereNoTwoValuesAreTheSame) {
    make("generate --hosts 17 --lpars 12");
    spreadValues();
    compareAll();
}

TEST(RecordsTest, CoverEveryOperation) {
    std::set<void*> covered = {reinterpret_cast<void*>(getLparProfile)};
    for (const Records& records : kRecords) {
        covered.insert(reinterpret_cast<void*>(records.all));
        covered.insert(reinterpret_cast<void*>(records.ofHost));
        if (records.ofLpar != nullptr) covered.insert(reinterpret_cast<void*>(records.ofLpar));
    }
#define COVERED(OPERATION, FAMILY) EXPECT_EQ(1U, covered.erase(reinterpret_cast<void*>(OPERATION)));
    API_OPERATIONS(COVERED, COVERED, COVERED, COVERED)
#undef COVERED
    EXPECT_TRUE(covered.empty());
}

TEST_F(ApiTest, NarrowerOperationsGiveTheSameRecords) {
    make("init");
    const Answer hosts(getAllCecs("", 1)), lpars(getAllLpars("", 1));
    for (const Records& records : kRecords) {
        for (int level : {1, 2}) {
            const Answer all(records.all("", level));
            int next = 0;
            const auto follow = [&](const Answer& some) {
                ASSERT_EQ(API_SUCCESS, some.code());
                for (int i = 0; i < some.size(); ++i, ++next) {
                    EXPECT_EQ(0, std::memcmp(all.record(next), some.record(i), sizeof(apiProp)));
                }
            };
            for (int i = 0; i < hosts.size(); ++i) {
                follow(Answer(records.ofHost("", hosts.value(i, "Name").c_str(), level)));
            }
            EXPECT_EQ(all.size(), next);
            // Free slots belong to no partition, and stand in front of a host's others.
            if (records.ofLpar == nullptr || records.kind == Kind::Slot) continue;
            next = 0;
            for (int i = 0; i < lpars.size(); ++i) {
                follow(Answer(records.ofLpar("", lpars.value(i, "Name").c_str(), level)));
            }
            EXPECT_EQ(all.size(), next);
        }
    }
    EXPECT_EQ(2, Answer(getLparIoSlots("", "1*1111-AAA*0000001", 1)).size());
}

}  // namespace

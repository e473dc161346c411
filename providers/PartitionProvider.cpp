// Reading of ORXC_LPAR_CS; what changes partitions stands in PartitionChanges.cpp.
#include "PartitionProvider.h"

#include <algorithm>
#include <cstdlib>
#include <iterator>
#include <map>

#include "DNXApiCaller.h"
#include "ProviderFactories.h"

namespace {

using Host = zemQyplatCmdCaller::ManagedSystemAttribute;
using Partition = zemQyplatCmdCaller::PartitionAttribute;
using Profile = zemQyplatCmdCaller::PartitionProfileAttribute;

// Rows name attributes of three sources: behind those of a partition are numbered its host, which
// is known from the query, and those of its default profile.
constexpr int kHostOfPartition = static_cast<int>(std::size(Partition::m_attributeName));
constexpr int kOfProfile = kHostOfPartition + 1;

const std::vector<PropertyRow> kRows = {
    {"ElementName", ValueKind::Text, Partition::ATTR_NAME},
    {"Caption", ValueKind::Text, Partition::ATTR_NAME},
    {"EnabledState", ValueKind::EnabledState, Partition::ATTR_STATE},
    {"OperationalStatus", ValueKind::Status, Partition::ATTR_STATE},
    {"LparID", ValueKind::Uint16, Partition::ATTR_LPAR_ID},
    {"HostName", ValueKind::Text, kHostOfPartition},
    {"State", ValueKind::Text, Partition::ATTR_STATE},
    {"LparEnvironment", ValueKind::Text, Partition::ATTR_LPAR_ENV},
    {"OSVersion", ValueKind::Text, Partition::ATTR_OS_VERSION},
    {"LogicalSerialNumber", ValueKind::Text, Partition::ATTR_LOGICAL_SERIAL_NUM},
    {"DefaultProfile", ValueKind::Text, Partition::ATTR_DEFAULT_PROFILE},
    {"CurrentProfile", ValueKind::Text, Partition::ATTR_CURR_PROFILE},
    {"ResourceConfig", ValueKind::Uint16, Partition::ATTR_RESOURCE_CONFIG},
    {"BootMode", ValueKind::Text, Partition::ATTR_BOOT_MODE},
    {"Keylock", ValueKind::Text, Partition::ATTR_LPAR_KEYLOCK},
    {"AutoStart", ValueKind::Flag, Partition::ATTR_AUTO_START},
    {"DesiredProcCompatMode", ValueKind::Text, Partition::ATTR_DESIRED_LPAR_PROC_COMPAT_MODE},
    {"CurrentProcCompatMode", ValueKind::Text, Partition::ATTR_CURR_LPAR_PROC_COMPAT_MODE},
    {"AllowPerfCollection", ValueKind::Flag, Partition::ATTR_ALLOW_PERF_COLLECTION},
    {"SuspendCapable", ValueKind::Flag, Partition::ATTR_SUSPEND_CAPABLE},
    {"RemoteRestartCapable", ValueKind::Flag, Partition::ATTR_REMOTE_RESTART_CAPABLE},
    {"RemoteRestartStatus", ValueKind::Text, Partition::ATTR_REMOTE_RESTART_STATUS},
    {"MemoryMode", ValueKind::Text, kOfProfile + Profile::ATTR_MEM_MODE},
    {"MinMemory", ValueKind::Uint32, kOfProfile + Profile::ATTR_MIN_MEM},
    {"DesiredMemory", ValueKind::Uint32, kOfProfile + Profile::ATTR_DESIRED_MEM},
    {"MaxMemory", ValueKind::Uint32, kOfProfile + Profile::ATTR_MAX_MEM},
    {"ProcessorMode", ValueKind::Text, kOfProfile + Profile::ATTR_PROC_MODE},
    {"SharingMode", ValueKind::Text, kOfProfile + Profile::ATTR_SHARING_MODE},
    {"UncappedWeight", ValueKind::Uint16, kOfProfile + Profile::ATTR_UNCAP_WEIGHT},
    {"MinProcessors", ValueKind::Uint32, kOfProfile + Profile::ATTR_MIN_PROCS},
    {"DesiredProcessors", ValueKind::Uint32, kOfProfile + Profile::ATTR_DESIRED_PROCS},
    {"MaxProcessors", ValueKind::Uint32, kOfProfile + Profile::ATTR_MAX_PROCS},
    {"MinProcessingUnits", ValueKind::Hundredths, kOfProfile + Profile::ATTR_MIN_PROC_UNITS},
    {"DesiredProcessingUnits", ValueKind::Hundredths,
     kOfProfile + Profile::ATTR_DESIRED_PROC_UNITS},
    {"MaxProcessingUnits", ValueKind::Hundredths, kOfProfile + Profile::ATTR_MAX_PROC_UNITS},
    {"MaxVirtualSlots", ValueKind::Uint16, kOfProfile + Profile::ATTR_MAX_VIRTUAL_SLOTS},
};

/// Profiles by the ID of their partition and their name.
using Profiles = std::map<std::pair<std::string, std::string>, const zemRecordType*>;

/// The attributes of partitions that a query needs, and those of their default profiles.
struct Needs {
    explicit Needs(const int* attributes) {
        for (; *attributes != Partition::ATTR_END; ++attributes) {
            if (*attributes >= kOfProfile) {
                profile.push_back(*attributes - kOfProfile);
            }
            if (*attributes < kHostOfPartition) {
                partition.push_back(*attributes);
            }
        }
        ofProfile = profile;
        if (!profile.empty()) {
            partition.push_back(Partition::ATTR_DEFAULT_PROFILE);
            for (int key : {Profile::ATTR_LPAR_ID, Profile::ATTR_NAME}) {
                profile.push_back(key);
            }
        }
        for (Attributes* list : {&partition, &profile}) {
            std::sort(list->begin(), list->end());
            list->erase(std::unique(list->begin(), list->end()), list->end());
            list->push_back(Partition::ATTR_END);
        }
    }

    Attributes partition, profile;  ///< what to ask for, closed by ATTR_END
    Attributes ofProfile;           ///< wanted ones alone
};

using Sink = std::function<void(const std::string& name, const zemRecordType& record)>;

/// Hands a partition to @p sink, with its host and what is wanted of its default profile.
/// @param profileValue  gives the value of an attribute of that profile
template <class ProfileValue>
void hand(zemRecordType& partition, const std::string& host, const Needs& needs,
          ProfileValue profileValue, const Sink& sink) {
    for (int attribute : needs.ofProfile) {
        partition.insert(kOfProfile + attribute, profileValue(attribute));
    }
    partition.insert(kHostOfPartition, host.c_str());
    sink(std::string(partition[Partition::ATTR_LPAR_ID]) + "*" + host, partition);
}

// One profile is read from the management library, which takes no process.

std::string same(const zemApiProp& profile, const char* key) {
    return std::string(profile.getProperty(key));
}

bool isDedicated(const std::string& mode) { return mode == "255"; }

std::string modeWord(const zemApiProp& profile, const char* key) {
    return isDedicated(same(profile, key)) ? "ded" : "shared";
}

/// The library's sharing and donor modes are one word of the tool's.
std::string sharingWord(const zemApiProp& profile, const char* key) {
    const bool isGreedy = same(profile, key) == "1", isDonor = same(profile, "DonorMode") == "1";
    if (!isDedicated(same(profile, "ProcMode"))) {
        return isGreedy ? "uncap" : "cap";
    }
    if (isDonor) {
        return isGreedy ? "share_idle_procs_active" : "share_idle_procs_always";
    }
    return isGreedy ? "keep_idle_procs" : "share_idle_procs";
}

std::string unitsWord(const zemApiProp& profile, const char* key) {
    const std::string units = same(profile, key);
    return units.empty() ? "" : hundredthsText(std::strtoul(units.c_str(), nullptr, 10));
}

/// One attribute of the tool's profile record: its value is words(profile, key).
struct LibraryRow {
    int attribute;
    const char* key;
    std::string (*words)(const zemApiProp& profile, const char* key);
};

constexpr LibraryRow kLibraryRows[] = {
    {Profile::ATTR_MEM_MODE, "MemMode", modeWord},
    {Profile::ATTR_MIN_MEM, "MinimumMemory", same},
    {Profile::ATTR_DESIRED_MEM, "DesiredMemory", same},
    {Profile::ATTR_MAX_MEM, "MaximumMemory", same},
    {Profile::ATTR_PROC_MODE, "ProcMode", modeWord},
    {Profile::ATTR_SHARING_MODE, "SharingMode", sharingWord},
    {Profile::ATTR_UNCAP_WEIGHT, "UncappedWeight", same},
    {Profile::ATTR_MIN_PROCS, "MinimumCPUCount", same},
    {Profile::ATTR_DESIRED_PROCS, "DesiredCPUCount", same},
    {Profile::ATTR_MAX_PROCS, "MaximumCPUCount", same},
    {Profile::ATTR_MIN_PROC_UNITS, "MinProcUnit", unitsWord},
    {Profile::ATTR_DESIRED_PROC_UNITS, "DesiredProcUnit", unitsWord},
    {Profile::ATTR_MAX_PROC_UNITS, "MaxProcUnit", unitsWord},
    {Profile::ATTR_MAX_VIRTUAL_SLOTS, "MaxVirtualSlots", same},
};
constexpr zemApiReader kProfileReader = {"PartitionProvider", "getInstance", "getLparProfile", "-1",
                                         true};
constexpr int kFullLevel = 2;  ///< of detail

/// Hands one partition to @p sink, its default profile read from the library.
void handWithLibraryProfile(zemRecordType& partition, const std::string& host, const Needs& needs,
                            const char* user, const Sink& sink) {
    std::map<int, std::string> values;
    const std::string key = std::string(partition[Partition::ATTR_LPAR_ID]) + "*" + host;
    if (!needs.ofProfile.empty()) {
        const zemString& name = partition[Partition::ATTR_DEFAULT_PROFILE];
        for (apiProp& found :
             zemApiObjects(kProfileReader,
                           zemApiCaller().getLparProfile(user, key.c_str(), name, kFullLevel))) {
            for (const LibraryRow& row : kLibraryRows) {
                values[row.attribute] = row.words(zemApiProp(&found), row.key);
            }
        }
    }
    hand(
        partition, host, needs, [&](int attribute) { return values[attribute].c_str(); }, sink);
}

/// The profiles of a host; none when no attribute of a profile is wanted.
zemRecordSetsType readProfiles(zemQyplatCmdCaller& tool, Needs& needs, const std::string& host) {
    if (needs.ofProfile.empty()) {
        return zemRecordSetsType();
    }
    try {
        return tool.getPartitionsProfileInformation(needs.profile.data(), host.c_str(), nullptr);
    } catch (const zemException& e) {
        // partitions without a profile are partitions still
        if (!isUnknownObject(e)) {
            throw;
        }
        return zemRecordSetsType();
    }
}

/// Hands the partitions of a host to @p sink, each with what is wanted of its default profile.
void readPartitions(zemQyplatCmdCaller& tool, Needs& needs, const std::string& host,
                    const Sink& sink) {
    const zemRecordSetsType partitions =
        tool.getPartitionsInformation(needs.partition.data(), host.c_str(), nullptr);
    const zemRecordSetsType records = readProfiles(tool, needs, host);
    Profiles profiles;
    for (int i = 0; i < records.size(); ++i) {
        const zemRecordType& profile = *records[i];
        profiles[{static_cast<const char*>(profile[Profile::ATTR_LPAR_ID]),
                  static_cast<const char*>(profile[Profile::ATTR_NAME])}] = &profile;
    }
    for (int i = 0; i < partitions.size(); ++i) {
        zemRecordType& partition = *partitions[i];
        auto found = profiles.end();
        if (!needs.ofProfile.empty()) {
            found = profiles.find(
                {static_cast<const char*>(partition[Partition::ATTR_LPAR_ID]),
                 static_cast<const char*>(partition[Partition::ATTR_DEFAULT_PROFILE])});
        }
        hand(
            partition, host, needs,
            [&](int attribute) {
                return found == profiles.end() ? zemString() : (*found->second)[attribute];
            },
            sink);
    }
}

}  // namespace

PartitionProvider::PartitionProvider(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
    : CmpiBaseMI(mb, ctx),
      ComputerSystemProvider(mb, ctx, name, "ORXC_LPAR_CS", kRows, {Partition::ATTR_LPAR_ID}) {}

bool PartitionProvider::split(const std::string& name, Key& key) {
    const std::size_t star = std::min(name.find('*'), name.size());
    key.id = name.substr(0, star);
    key.host = star < name.size() ? name.substr(star + 1) : "";
    return zemString(key.id.c_str()).isDigit() && isHostName(key.host);
}

void PartitionProvider::read(const Client& client, const std::string& name, int* attributes,
                             const Sink& sink) {
    Key key;
    if (!split(name, key)) {
        return;
    }
    Needs needs(attributes);
    const zemRecordSetsType found = toolFor(client).getPartitionsInformation(
        needs.partition.data(), key.host.c_str(), ("\"lpar_ids=" + key.id + "\"").c_str());
    for (int i = 0; i < found.size(); ++i) {
        handWithLibraryProfile(*found[i], key.host, needs, client.user, sink);
    }
}

void PartitionProvider::readAll(const Client& client, int* attributes, const Sink& sink) {
    zemQyplatCmdCaller tool = toolFor(client);
    int hostAttributes[] = {Host::ATTR_TYPE_MODEL, Host::ATTR_SERIAL_NUM, Host::ATTR_END};
    const zemRecordSetsType hosts = tool.getManagedSystemInformation(hostAttributes, nullptr);
    Needs needs(attributes);
    for (int i = 0; i < hosts.size(); ++i) {
        try {
            readPartitions(tool, needs, hostName(*hosts[i]), sink);
        } catch (const zemException& e) {
            // a host without partitions answers so; one removed meanwhile has none either
            if (!isUnknownObject(e)) {
                throw;
            }
        }
    }
}

ZEM_PROVIDER(ORXC_LPAR_CSProvider, PartitionProvider)

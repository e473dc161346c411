// Reading of ORXC_LPAR_CS; what changes partitions stands in PartitionChanges.cpp.
#include "PartitionProvider.h"

#include <algorithm>
#include <map>

#include "ProviderFactories.h"

namespace {

using Host = zemQyplatCmdCaller::ManagedSystemAttribute;
using Partition = zemQyplatCmdCaller::PartitionAttribute;
using Profile = zemQyplatCmdCaller::PartitionProfileAttribute;

/// Added to attributes of a profile, to tell them from those of a partition.
constexpr int kOfProfile = 1000;
/// No attribute of a tool, but known from the query.
constexpr int kHostOfPartition = 2000;

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
        for (; *attributes != Partition::ATTR_END; ++attributes)
            if (*attributes != kHostOfPartition)
                (*attributes < kOfProfile ? partition : profile)
                    .push_back(*attributes % kOfProfile);
        ofProfile = profile;
        if (!profile.empty()) {
            partition.push_back(Partition::ATTR_DEFAULT_PROFILE);
            for (int key : {Profile::ATTR_LPAR_ID, Profile::ATTR_NAME}) profile.push_back(key);
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

/// The profiles of these partitions; none when no attribute of a profile is wanted.
zemRecordSetsType readProfiles(zemQyplatCmdCaller& tool, Needs& needs, const std::string& host,
                               const char* filter) {
    if (needs.ofProfile.empty()) return zemRecordSetsType();
    try {
        return tool.getPartitionsProfileInformation(needs.profile.data(), host.c_str(), filter);
    } catch (const zemException& e) {
        // partitions without a profile are partitions still
        if (!isUnknownObject(e)) throw;
        return zemRecordSetsType();
    }
}

/// Hands partitions of one host to @p sink, each with what is wanted of its default profile.
void readPartitions(zemQyplatCmdCaller& tool, Needs& needs, const std::string& host,
                    const char* filter,
                    const std::function<void(const std::string&, const zemRecordType&)>& sink) {
    const zemRecordSetsType partitions =
        tool.getPartitionsInformation(needs.partition.data(), host.c_str(), filter);
    const zemRecordSetsType records = readProfiles(tool, needs, host, filter);
    Profiles profiles;
    for (int i = 0; i < records.size(); ++i) {
        const zemRecordType& profile = *records[i];
        profiles[{static_cast<const char*>(profile[Profile::ATTR_LPAR_ID]),
                  static_cast<const char*>(profile[Profile::ATTR_NAME])}] = &profile;
    }
    for (int i = 0; i < partitions.size(); ++i) {
        zemRecordType& partition = *partitions[i];
        const std::string id(partition[Partition::ATTR_LPAR_ID]);
        if (!needs.ofProfile.empty()) {
            const auto found = profiles.find(
                {id, static_cast<const char*>(partition[Partition::ATTR_DEFAULT_PROFILE])});
            for (int key : needs.ofProfile)
                partition.insert(kOfProfile + key,
                                 found == profiles.end() ? zemString() : (*found->second)[key]);
        }
        partition.insert(kHostOfPartition, host.c_str());
        sink(std::string(id).append("*").append(host), partition);
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

void PartitionProvider::read(zemQyplatCmdCaller& tool, const std::string& name, int* attributes,
                             const Sink& sink) {
    Key key;
    if (!split(name, key)) return;
    Needs needs(attributes);
    readPartitions(tool, needs, key.host, ("\"lpar_ids=" + key.id + "\"").c_str(), sink);
}

void PartitionProvider::readAll(zemQyplatCmdCaller& tool, int* attributes, const Sink& sink) {
    int hostAttributes[] = {Host::ATTR_TYPE_MODEL, Host::ATTR_SERIAL_NUM, Host::ATTR_END};
    const zemRecordSetsType hosts = tool.getManagedSystemInformation(hostAttributes, nullptr);
    Needs needs(attributes);
    for (int i = 0; i < hosts.size(); ++i) {
        try {
            readPartitions(tool, needs, hostName(*hosts[i]), nullptr, sink);
        } catch (const zemException& e) {
            // a host without partitions answers so; one removed meanwhile has none either
            if (!isUnknownObject(e)) throw;
        }
    }
}

ZEM_PROVIDER(ORXC_LPAR_CSProvider, PartitionProvider)

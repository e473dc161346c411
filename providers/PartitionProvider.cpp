// Reading of ORXC_LPAR_CS; what changes partitions stands in PartitionChanges.cpp.
#include "PartitionProvider.h"

#include <map>

#include "PartitionRows.h"
#include "ProviderFactories.h"

namespace {

using Host = zemQyplatCmdCaller::ManagedSystemAttribute;
using Partition = zemQyplatCmdCaller::PartitionAttribute;

using Profile = zemQyplatCmdCaller::PartitionProfileAttribute;

/// Profiles by the ID of their partition and their name.
using Profiles = std::map<std::pair<std::string, std::string>, const zemRecordType*>;

/// The attributes of partitions that a query needs, and those of their default profiles.
struct Needs {
    explicit Needs(const int* attributes) {
        for (; *attributes != Partition::ATTR_END; ++attributes)
            (*attributes < kOfProfile ? partition : profile).push_back(*attributes % kOfProfile);
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
        std::string name = id;
        sink(name.append("*").append(host), partition);
    }
}

}  // namespace

PartitionProvider::PartitionProvider(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
    : CmpiBaseMI(mb, ctx),
      ComputerSystemProvider(mb, ctx, name, kPartitionClass, partitionRows(),
                             {Partition::ATTR_LPAR_ID}) {}

void PartitionProvider::find(zemQyplatCmdCaller& tool, const std::string& name, int* attributes,
                             const Sink& sink) {
    PartitionName key;
    if (!splitPartitionName(name, key)) return;
    Needs needs(attributes);
    try {
        readPartitions(tool, needs, key.host, ("\"lpar_ids=" + key.id + "\"").c_str(), sink);
    } catch (const zemException& e) {
        if (!isUnknownObject(e)) throw;
    }
}

void PartitionProvider::walk(zemQyplatCmdCaller& tool, int* attributes, const Sink& sink) {
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

void PartitionProvider::complete(CmpiInstance& instance, const std::string& name,
                                 const char** properties) {
    if (containsProperty(properties, "HostName"))
        instance.setProperty("HostName", CmpiData(name.c_str() + name.find('*') + 1));
}

ZEM_PROVIDER(ORXC_LPAR_CSProvider, PartitionProvider)

#include "PartitionProvider.h"

#include "ProviderFactories.h"

namespace {

using Host = zemQyplatCmdCaller::ManagedSystemAttribute;
using Partition = zemQyplatCmdCaller::PartitionAttribute;

const std::vector<PropertyRow> kRows = {
    {"ElementName", ValueKind::Text, Partition::ATTR_NAME},
    {"Caption", ValueKind::Text, Partition::ATTR_NAME},
    {"EnabledState", ValueKind::EnabledState, Partition::ATTR_STATE},
    {"OperationalStatus", ValueKind::Status, Partition::ATTR_STATE},
    {"LparID", ValueKind::Uint16, Partition::ATTR_LPAR_ID},
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
};

std::string partitionName(const zemRecordType& partition, const std::string& host) {
    return std::string(partition[Partition::ATTR_LPAR_ID]) + "*" + host;
}

/// Splits <lparId>*<host> where the ID is all digits and the host has its form.
bool splitName(const std::string& name, std::string& id, std::string& host) {
    const std::size_t star = std::min(name.find('*'), name.size());
    id = name.substr(0, star);
    host = star < name.size() ? name.substr(star + 1) : "";
    return zemString(id.c_str()).isDigit() && isHostName(host);
}

}  // namespace

PartitionProvider::PartitionProvider(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
    : CmpiBaseMI(mb, ctx),
      ComputerSystemProvider(mb, ctx, name, "ORXC_LPAR_CS", kRows, {Partition::ATTR_LPAR_ID}) {}

void PartitionProvider::find(zemQyplatCmdCaller& tool, const std::string& name, int* attributes,
                             const Sink& sink) {
    std::string id, host;
    if (!splitName(name, id, host)) return;
    const std::string filter = "\"lpar_ids=" + id + "\"";
    try {
        const zemRecordSetsType partitions =
            tool.getPartitionsInformation(attributes, host.c_str(), filter.c_str());
        if (partitions.size() == 1) sink(partitionName(*partitions[0], host), *partitions[0]);
    } catch (const zemException& e) {
        if (!isUnknownObject(e)) throw;
    }
}

void PartitionProvider::walk(zemQyplatCmdCaller& tool, int* attributes, const Sink& sink) {
    int hostAttributes[] = {Host::ATTR_TYPE_MODEL, Host::ATTR_SERIAL_NUM, Host::ATTR_END};
    const zemRecordSetsType hosts = tool.getManagedSystemInformation(hostAttributes, nullptr);
    for (int i = 0; i < hosts.size(); ++i) {
        const std::string host = hostName(*hosts[i]);
        try {
            const zemRecordSetsType partitions =
                tool.getPartitionsInformation(attributes, host.c_str(), nullptr);
            for (int k = 0; k < partitions.size(); ++k)
                sink(partitionName(*partitions[k], host), *partitions[k]);
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

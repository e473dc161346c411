#include "PartitionRows.h"

#include "QyplatCmdCaller.h"

namespace {

using Partition = zemQyplatCmdCaller::PartitionAttribute;
using Profile = zemQyplatCmdCaller::PartitionProfileAttribute;

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

}  // namespace

const std::vector<PropertyRow>& partitionRows() { return kRows; }

bool splitPartitionName(const std::string& name, PartitionName& key) {
    const std::size_t star = std::min(name.find('*'), name.size());
    key.id = name.substr(0, star);
    key.host = star < name.size() ? name.substr(star + 1) : "";
    return zemString(key.id.c_str()).isDigit() && isHostName(key.host);
}

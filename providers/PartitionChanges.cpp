// What clients change of partitions: making, changing and deleting them, and their state.
#include <strings.h>

#include <algorithm>
#include <iterator>
#include <memory>

#include "EdpowerCaller.h"
#include "EdsuspCaller.h"
#include "NwplatCmdCaller.h"
#include "PartitionProvider.h"
#include "SystemConfig.h"

namespace {

using Partition = zemQyplatCmdCaller::PartitionAttribute;
using New = zemNwplatCmdCaller::PartitionAttribute;
using State = ComputerSystemProvider;

/// What a client may say of a partition that is to be made.
constexpr PropertyRow kCreation[] = {
    {"ElementName", ValueKind::Text, New::ATTR_NAME},
    {"DefaultProfile", ValueKind::Text, New::ATTR_PROFILE_NAME},
    {"LparEnvironment", ValueKind::Text, New::ATTR_LPAR_ENV},
    {"BootMode", ValueKind::Text, New::ATTR_BOOT_MODE},
    {"AutoStart", ValueKind::Flag, New::ATTR_AUTO_START},
    {"AllowPerfCollection", ValueKind::Flag, New::ATTR_ALLOW_PERF_COLLECTION},
    {"DesiredProcCompatMode", ValueKind::Text, New::ATTR_LPAR_PROC_COMPAT_MODE},
    {"MemoryMode", ValueKind::Text, New::ATTR_MEM_MODE},
    {"MinMemory", ValueKind::Uint32, New::ATTR_MIN_MEM},
    {"DesiredMemory", ValueKind::Uint32, New::ATTR_DESIRED_MEM},
    {"MaxMemory", ValueKind::Uint32, New::ATTR_MAX_MEM},
    {"ProcessorMode", ValueKind::Text, New::ATTR_PROC_MODE},
    {"SharingMode", ValueKind::Text, New::ATTR_SHARING_MODE},
    {"UncappedWeight", ValueKind::Uint16, New::ATTR_UNCAP_WEIGHT},
    {"MinProcessors", ValueKind::Uint32, New::ATTR_MIN_PROCS},
    {"DesiredProcessors", ValueKind::Uint32, New::ATTR_DESIRED_PROCS},
    {"MaxProcessors", ValueKind::Uint32, New::ATTR_MAX_PROCS},
    {"MinProcessingUnits", ValueKind::Hundredths, New::ATTR_MIN_PROC_UNITS},
    {"DesiredProcessingUnits", ValueKind::Hundredths, New::ATTR_DESIRED_PROC_UNITS},
    {"MaxProcessingUnits", ValueKind::Hundredths, New::ATTR_MAX_PROC_UNITS},
    {"MaxVirtualSlots", ValueKind::Uint16, New::ATTR_MAX_VIRTUAL_SLOTS},
};

struct ChangeRow {
    const char* property;
    int (zemVirtualSystem::*set)(const zemString& value);
};

const ChangeRow kChanges[] = {
    {"ElementName", &zemVirtualSystem::setName},
    {"DefaultProfile", &zemVirtualSystem::setDefaultProfile},
    {"Keylock", &zemVirtualSystem::setKeylock},
};

template <typename Rows>
auto rowOf(const Rows& rows, const char* property) {
    return std::find_if(std::begin(rows), std::end(rows),
                        [&](const auto& row) { return strcasecmp(row.property, property) == 0; });
}

constexpr int kPartitionResource = 1;  ///< of EdpowerCaller

/// How a partition comes from one state to another.
struct Transition {
    State::RequestedState requested;
    const char* from;
    enum Tool { Power, Suspend } tool;
    int operation;  ///< of the tool's caller
    bool immediately = false;
    bool restart = false;

    // operations of EdpowerCaller, and of EdsuspCaller
    enum { Activate = 1, SwitchOff = 2, ShutDownSystem = 3 };
    enum { SuspendIt = 1, Resume = 2, DropSuspended = 6 };
};

constexpr Transition kTransitions[] = {
    {State::Enabled, "Not Activated", Transition::Power, Transition::Activate},
    {State::Enabled, "Suspended", Transition::Suspend, Transition::Resume},
    {State::Disabled, "Running", Transition::Power, Transition::SwitchOff, true},
    {State::Disabled, "Open Firmware", Transition::Power, Transition::SwitchOff, true},
    {State::Disabled, "Suspended", Transition::Suspend, Transition::DropSuspended},
    {State::ShutDown, "Running", Transition::Power, Transition::ShutDownSystem},
    {State::Offline, "Running", Transition::Suspend, Transition::SuspendIt},
    {State::Reboot, "Running", Transition::Power, Transition::ShutDownSystem, false, true},
    {State::Reset, "Running", Transition::Power, Transition::SwitchOff, true, true},
    {State::Reset, "Open Firmware", Transition::Power, Transition::SwitchOff, true, true},
};

/// The text that the tool has for the value of a property.
std::string toolText(ValueKind kind, const CmpiData& value) {
    if (kind == ValueKind::Flag) {
        return value.getBoolean() ? "1" : "0";
    }
    if (kind == ValueKind::Text) {
        return std::string(zemCommandCaller::itemValue(value.getString().charPtr()));
    }
    if (kind == ValueKind::Uint16) {
        return std::to_string(value.getUint16());
    }
    const CMPIUint32 number = value.getUint32();
    return kind == ValueKind::Hundredths ? hundredthsText(number) : std::to_string(number);
}

/// The number of the host's partition with this name; empty when there is none.
std::string idOfName(zemQyplatCmdCaller& tool, const std::string& host, const std::string& name) {
    int attributes[] = {Partition::ATTR_LPAR_ID, Partition::ATTR_NAME, Partition::ATTR_END};
    const zemRecordSetsType all = tool.getPartitionsInformation(attributes, host.c_str(), nullptr);
    for (int i = 0; i < all.size(); ++i) {
        if ((*all[i])[Partition::ATTR_NAME] == name.c_str()) {
            return std::string((*all[i])[Partition::ATTR_LPAR_ID]);
        }
    }
    return "";
}

}  // namespace

void PartitionProvider::addCreationPairs(const CmpiInstance& instance, const CmpiObjectPath& path,
                                         zemDynamicArray<tagAttributePair>& pairs) {
    for (const auto& [property, value] : askedFor(instance, path, m_className, nullptr)) {
        const char* const said = property.c_str();
        if (strcasecmp(said, "Name") == 0 || strcasecmp(said, "CreationClassName") == 0) {
            continue;
        }
        const auto row = rowOf(kCreation, said);
        if (row == std::end(kCreation)) {
            validateCannotSpecifiedProperty(instance, said);
            continue;
        }
        const std::string text = toolText(row->kind, value);
        pairs.addElement(std::make_unique<tagAttributePair>(row->attribute, text.c_str()));
    }
}

void PartitionProvider::performCreateInstance(const CmpiContext& context, CmpiResult& result,
                                              const CmpiObjectPath& path,
                                              const CmpiInstance& instance) {
    const std::string name = instance.getProperty("Name").getString().charPtr();
    const bool anyNumber = !name.empty() && name.front() == '*';
    Key key;
    if (!split(anyNumber ? "0" + name : name, key)) {
        throwInvalidKeyExc("createInstance", m_className, "Name");
    }

    const Client client = clientOf(context);
    zemDynamicArray<tagAttributePair> pairs;
    if (!anyNumber) {
        int justTheNumber[] = {Partition::ATTR_LPAR_ID, Partition::ATTR_END};
        find(client, name, justTheNumber, [&](const std::string&, const zemRecordType&) {
            throw zemObjectAlreadyExistsException(
                "PartitionProvider", "performCreateInstance",
                ("There is a partition " + name + " already.").c_str());
        });
        pairs.addElement(std::make_unique<tagAttributePair>(New::ATTR_LPAR_ID, key.id.c_str()));
    }
    addCreationPairs(instance, path, pairs);
    zemHostSystem(key.host.c_str(), client.user, client.locale).createVirtualSystem(pairs);
    if (anyNumber) {
        const CmpiString elementName = getPropVal(instance, "ElementName").getString();
        zemQyplatCmdCaller tool = toolFor(client);
        key.id = idOfName(tool, key.host, elementName.charPtr());
    }
    result.returnData(systemPath(path, m_className, key.id + "*" + key.host));
}

void PartitionProvider::performDeleteInstance(const CmpiContext& context, CmpiResult&,
                                              const CmpiObjectPath& path) {
    static const char* justTheKey[] = {"Name", nullptr};
    performGetInstance(context, path, justTheKey);
    Key key;
    split(getKeyBinding(path, "Name").getString().charPtr(), key);
    const Client client = clientOf(context);
    zemHostSystem(key.host.c_str(), client.user, client.locale)
        .destoryVirtualSystem(key.id.c_str());
}

bool PartitionProvider::isChangeable(const char* property) const {
    return rowOf(kChanges, property) != std::end(kChanges);
}

void PartitionProvider::change(const Client& client, const std::string& name, const char* property,
                               const std::string& value) {
    Key key;
    split(name, key);
    const ChangeRow& row = *rowOf(kChanges, property);
    zemVirtualSystem partition(key.id.c_str(),
                               zemHostSystem(key.host.c_str(), client.user, client.locale),
                               client.user, client.locale);
    (partition.*row.set)(value.c_str());
}

PartitionProvider::StateChangeAnswer PartitionProvider::requestState(const Client& client,
                                                                     const std::string& name,
                                                                     RequestedState state) {
    const auto requested = [&](const Transition& row) { return row.requested == state; };
    if (std::none_of(std::begin(kTransitions), std::end(kTransitions), requested)) {
        return NotSupported;
    }

    int attributes[] = {Partition::ATTR_LPAR_ID, Partition::ATTR_STATE,
                        Partition::ATTR_DEFAULT_PROFILE, Partition::ATTR_END};
    std::string present, profile;
    find(client, name, attributes, [&](const std::string&, const zemRecordType& record) {
        present = static_cast<const char*>(record[Partition::ATTR_STATE]);
        profile = static_cast<const char*>(record[Partition::ATTR_DEFAULT_PROFILE]);
    });
    const auto row = std::find_if(
        std::begin(kTransitions), std::end(kTransitions),
        [&](const Transition& t) { return t.requested == state && present == t.from; });
    if (row == std::end(kTransitions)) {
        return InvalidTransition;
    }

    Key key;
    split(name, key);
    if (row->tool == Transition::Suspend) {
        EdsuspCaller suspend(client.user, client.locale);
        suspend.setManagedSystem(key.host.c_str());
        suspend.setLparId(std::stoi(key.id));
        suspend.setOperation(row->operation);
        suspend.run();
    } else {
        EdpowerCaller power(client.user, client.locale);
        power.setResource(kPartitionResource);
        power.setManagedSystem(key.host.c_str());
        power.setLparId(std::stoi(key.id));
        power.setLparProfileName(zemCommandCaller::quoted(profile.c_str()));
        power.setOperation(row->operation);
        power.setImmed(row->immediately);
        power.setRestart(row->restart);
        power.run();
    }
    return Completed;
}

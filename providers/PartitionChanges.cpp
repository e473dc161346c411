// What clients change of partitions: their names and key lock, their state, and deleting them.
#include <strings.h>

#include <algorithm>
#include <iterator>

#include "EdpowerCaller.h"
#include "EdsuspCaller.h"
#include "PartitionProvider.h"
#include "SystemConfig.h"

namespace {

using Partition = zemQyplatCmdCaller::PartitionAttribute;
using State = ComputerSystemProvider;

struct ChangeRow {
    const char* property;
    int (zemVirtualSystem::*set)(const zemString& value);
};

const ChangeRow kChanges[] = {
    {"ElementName", &zemVirtualSystem::setName},
    {"DefaultProfile", &zemVirtualSystem::setDefaultProfile},
    {"Keylock", &zemVirtualSystem::setKeylock},
};

const ChangeRow* rowOf(const char* property) {
    return std::find_if(std::begin(kChanges), std::end(kChanges), [&](const ChangeRow& row) {
        return strcasecmp(row.property, property) == 0;
    });
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

}  // namespace

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
    return rowOf(property) != std::end(kChanges);
}

void PartitionProvider::change(const Client& client, const std::string& name, const char* property,
                               const std::string& value) {
    Key key;
    split(name, key);
    const ChangeRow& row = *rowOf(property);
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

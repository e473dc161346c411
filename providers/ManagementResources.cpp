// What the management service does with resources: of profiles by one line of a tool, of what a
// partition has now by jobs.
#include <algorithm>
#include <memory>
#include <optional>
#include <set>
#include <vector>

#include "Exception.h"
#include "ManagementService.h"

namespace {

/// Adds or removes one slot or adapter of a partition; owns all that it needs.
JobTable::Step stepFor(const zemOperEnv& client, const SettingOwner& owner, zemRASD& resource,
                       zemCommandCaller::CH_OP_TYPE op) {
    const std::shared_ptr<zemRASD> own(resource.clone());
    return [client, owner, own, op](pid_t* pid, FILE** output) {
        zemCEC host(owner.host.c_str(), "");
        zemLPARVisitor partitions(&host, "");
        partitions.setOperEnv(client);
        return partitions.ChangeRunningIOResource(owner.host.c_str(), owner.partition.c_str(),
                                                  own.get(), pid, output, op);
    };
}

/// The same for a change of processors or memory.
JobTable::Step stepFor(const zemOperEnv& client, const SettingOwner& owner,
                       const std::shared_ptr<zemRASD>& before,
                       const std::shared_ptr<zemRASD>& now) {
    return [client, owner, before, now](pid_t* pid, FILE** output) {
        zemCEC host(owner.host.c_str(), "");
        zemLPARVisitor partitions(&host, "");
        partitions.setOperEnv(client);
        return partitions.ChangeRunningMemProcResource(owner.host.c_str(), owner.partition.c_str(),
                                                       before.get(), now.get(), pid, output);
    };
}

/// A tool changes amounts, in one direction, or how they are shared: as many steps as that takes.
void addSteps(const zemOperEnv& client, const SettingOwner& owner, zemRASD& shown, zemRASD& wanted,
              std::vector<JobTable::Step>& steps) {
    enum Part : unsigned { Held = 1, Seen = 2, Sharing = 4 };
    const zemRASDCommData& before = *shown.getData();
    const zemRASDCommData& after = *wanted.getData();
    const auto add = [&](unsigned parts) {
        std::shared_ptr<zemRASD> now(shown.clone());
        zemRASDCommData& data = *now->getData();
        data.m_Reservation = (parts & Held) != 0 ? after.m_Reservation : before.m_Reservation;
        data.m_VirtualQuantity =
            (parts & Seen) != 0 ? after.m_VirtualQuantity : before.m_VirtualQuantity;
        data.m_Weight = (parts & Sharing) != 0 ? after.m_Weight : before.m_Weight;
        data.m_SharingMode = (parts & Sharing) != 0 ? after.m_SharingMode : before.m_SharingMode;
        if (!data.equals(&before)) {
            steps.push_back(stepFor(client, owner, std::shared_ptr<zemRASD>(shown.clone()), now));
        }
    };
    const bool areOpposite = (after.m_Reservation < before.m_Reservation &&
                              after.m_VirtualQuantity > before.m_VirtualQuantity) ||
                             (after.m_Reservation > before.m_Reservation &&
                              after.m_VirtualQuantity < before.m_VirtualQuantity);
    if (areOpposite) {
        add(Held);
        add(Seen);
    } else {
        add(Held | Seen);
    }
    add(Sharing);
}

/// Tags of slots are set with whatever is set of a profile: slots that have some must be there.
void keepTaggedSlots(zemVSSD& system) {
    const zemDynamicArray<zemRASD> slots = system.getRASD(zemRASDKinds::ioSlot.resourceType);
    for (int i = 0; i < slots.size(); ++i) {
        if (dynamic_cast<const zemIOSlotRASD&>(*slots[i]).m_Data.m_TaggedIOType.size() > 0) {
            return;
        }
    }
    for (int i = 0; i < slots.size(); ++i) {
        system.removeRASD(slots[i]->getKey());
    }
}

/// The tags that a change of a profile can give to a slot, but not take away: the tools have no
/// word for none of them.
std::set<int> lastingTags(const zemVSSD& system) {
    std::set<int> tags;
    const zemDynamicArray<zemRASD> slots = system.getRASD(zemRASDKinds::ioSlot.resourceType);
    for (int i = 0; i < slots.size(); ++i) {
        for (int tag : {2, 5, 6}) {
            const auto& slot = dynamic_cast<const zemIOSlotRASD&>(*slots[i]);
            if (slot.m_Data.m_TaggedIOType.find(tag) >= 0) {
                tags.insert(tag);
            }
        }
    }
    return tags;
}

/// Tells the client the paths of settings.
void tellPaths(const std::vector<CmpiObjectPath>& paths, CmpiArgs& out) {
    CmpiArray list(static_cast<CMPICount>(paths.size()), CMPI_ref);
    for (std::size_t i = 0; i < paths.size(); ++i) {
        list[static_cast<CMPICount>(i)] = CmpiData(paths[i]);
    }
    out.setArg("ResultingResourceSettings", CmpiData(list));
}

}  // namespace

ManagementService::Answer ManagementService::startJob(const Call& call, const SettingOwner& owner,
                                                      const char* name,
                                                      std::vector<JobTable::Step> steps) {
    JobTable::Work work;
    work.name = name;
    work.owner = std::string(call.client.m_userName);
    work.partition = owner.name();
    work.steps = std::move(steps);
    const std::string id = JobTable::instance().start(std::move(work));
    if (id.empty()) {
        return Done;  // nothing was to be done
    }
    call.out.setArg("Job", CmpiData(jobPath(call.path, id)));
    return JobStarted;
}

ManagementService::Answer ManagementService::addResources(const Call& call) const {
    const std::vector<CmpiData> systems = elementsOf(call.in, "AffectedConfiguration");
    const std::vector<Sent> resources = sentIn(call.in, "ResourceSettings", true);
    if (systems.size() != 1 || systems[0].getType() != CMPI_ref || resources.empty()) {
        return InvalidParameter;
    }
    const CmpiObjectPath path = systems[0].getObjectPath();
    const SettingClass* const row = settingClassNamed(path.getClassName().charPtr());
    const std::optional<SettingId> id = settingIdOf(path);
    if (!id || row->resourceType != 0 || id->owner.host != call.host) {
        return InvalidParameter;
    }
    const SettingUse use = id->isState ? SettingUse::AddToState : SettingUse::AddToProfile;
    zemVSSD system(call.host.c_str(), id->system.c_str());
    for (const Sent& each : resources) {
        if (!each.row.hasSlot) {
            return InvalidParameter;  // a system has processors and memory once, and always
        }
        addResource(each, use, call.path, system);
    }
    if (id->isState) {
        std::vector<JobTable::Step> steps;
        steps.reserve(resources.size());
        for (int i = 0; i < system.getRASDs().size(); ++i) {
            steps.push_back(stepFor(call.client, id->owner, *system.getRASDs().getElementAt(i),
                                    zemCommandCaller::CH_OP_ADD));
        }
        return startJob(call, id->owner, "Add resources", std::move(steps));
    }
    zemCEC host(call.host.c_str(), "");
    zemVSSDVisitor profiles(&host, "");
    profiles.setOperEnv(call.client);
    profiles.AddIOResources(&system);
    std::vector<CmpiObjectPath> paths;
    paths.reserve(resources.size());
    for (std::size_t i = 0; i < resources.size(); ++i) {
        zemRASD& resource = *system.getRASDs().getElementAt(static_cast<int>(i));
        paths.push_back(
            SettingPaths(call.path, resources[i].row)(resource.getInstanceID(true, &system)));
    }
    tellPaths(paths, call.out);
    return Done;
}

ManagementService::Answer ManagementService::modifyResources(const Call& call) const {
    const std::vector<Sent> resources = sentIn(call.in, "ResourceSettings", true);
    MeantResources meant;
    for (const Sent& each : resources) {
        if (!meant.add({each.row, each.id, &each.instance}, call.host)) {
            return InvalidParameter;
        }
    }
    if (resources.empty()) {
        return InvalidParameter;
    }
    return meant.system.isState ? modifyState(call, meant) : modifyProfile(call, meant);
}

ManagementService::Answer ManagementService::modifyProfile(const Call& call,
                                                           const MeantResources& meant) const {
    std::vector<const SettingClass*> classes = meant.classes();
    const SettingClass* const slots = settingClassNamed(zemRASDKinds::ioSlot.settingClass);
    const bool areSlotsMeant = std::find(classes.begin(), classes.end(), slots) != classes.end();
    if (!areSlotsMeant) {
        classes.push_back(slots);
    }
    const PresentSettings present = readPresent(call.context, meant.system, classes);
    if (present.shown == nullptr) {
        return InvalidParameter;
    }
    zemVSSD& system = *present.stored;
    const std::set<int> tags = lastingTags(system);
    std::vector<CmpiObjectPath> paths;
    bool isAsked = false;
    for (const MeantResources::One& one : meant.all) {
        zemRASD* const shown = resourceOf(*present.shown, one.row, one.id);
        zemRASD* const stored = resourceOf(system, one.row, one.id);
        if (shown == nullptr || stored == nullptr) {
            return InvalidParameter;
        }
        const Setting setting = {shown->getData()->m_InstanceID, *present.shown, shown->getData()};
        isAsked |= changeResource(
            {SettingUse::ChangeProfile, *one.said, one.row, call.path, setting}, system, *stored);
        paths.push_back(SettingPaths(call.path, one.row)(one.id.c_str()));
    }
    const std::set<int> now = lastingTags(system);
    if (!std::includes(now.begin(), now.end(), tags.begin(), tags.end())) {
        throw zemInvalidParameterException(
            "ManagementService", "modifyProfile",
            "The tags 2, 5 and 6 go to another slot, or with their slot; they are not dropped.");
    }
    if (!areSlotsMeant) {
        keepTaggedSlots(system);
    }
    if (isAsked) {
        zemCEC host(call.host.c_str(), "");
        zemVSSDVisitor profiles(&host, "");
        profiles.setOperEnv(call.client);
        profiles.ModifyResourcesOfProfile(&system, zemCommandCaller::CH_OP_MODIFY);
    }
    tellPaths(paths, call.out);
    return Done;
}

ManagementService::Answer ManagementService::modifyState(const Call& call,
                                                         const MeantResources& meant) const {
    for (const MeantResources::One& one : meant.all) {
        if (one.row.hasSlot) {
            return NotSupported;
        }
    }
    const PresentSettings present = readPresent(call.context, meant.system, meant.classes());
    if (present.shown == nullptr) {
        return InvalidParameter;
    }
    std::vector<JobTable::Step> steps;
    for (const MeantResources::One& one : meant.all) {
        zemRASD* const shown = resourceOf(*present.shown, one.row, one.id);
        if (shown == nullptr) {
            return InvalidState;  // it is not activated
        }
        const std::unique_ptr<zemRASD> now(shown->clone());
        const Setting setting = {shown->getData()->m_InstanceID, *present.shown, shown->getData()};
        if (changeResource({SettingUse::ChangeState, *one.said, one.row, call.path, setting},
                           *present.shown, *now)) {
            addSteps(call.client, meant.system.owner, *shown, *now, steps);
        }
    }
    return startJob(call, meant.system.owner, "Modify resources", std::move(steps));
}

ManagementService::Answer ManagementService::removeResources(const Call& call) const {
    MeantResources meant;
    for (const CmpiData& element : elementsOf(call.in, "ResourceSettings")) {
        if (element.isNullValue() || element.getType() != CMPI_ref) {
            return InvalidParameter;
        }
        const CmpiObjectPath path = element.getObjectPath();
        const SettingClass* const row = settingClassNamed(path.getClassName().charPtr());
        if (row == nullptr || !row->hasSlot || !meant.add({*row, settingKeyOf(path)}, call.host)) {
            return InvalidParameter;
        }
    }
    if (meant.all.empty()) {
        return InvalidParameter;
    }
    const SettingId& id = meant.system;
    const PresentSettings present = readPresent(call.context, id, meant.classes());
    if (present.shown == nullptr) {
        return InvalidParameter;
    }
    zemVSSD& system = id.isState ? *present.shown : *present.stored;
    zemVSSD gone(call.host.c_str(), id.system.c_str());
    std::vector<JobTable::Step> steps;
    for (const MeantResources::One& one : meant.all) {
        zemRASD* const resource = resourceOf(system, one.row, one.id);
        if (resource == nullptr) {
            return InvalidParameter;
        }
        gone.addRASD(resource->clone());
        steps.push_back(stepFor(call.client, id.owner, *resource, zemCommandCaller::CH_OP_REMOVE));
    }
    if (id.isState) {
        return startJob(call, id.owner, "Remove resources", std::move(steps));
    }
    zemCEC host(call.host.c_str(), "");
    zemVSSDVisitor profiles(&host, "");
    profiles.setOperEnv(call.client);
    profiles.RemoveIOResources(&gone);
    return Done;
}

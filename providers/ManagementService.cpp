#include "ManagementService.h"

#include <strings.h>

#include <algorithm>
#include <cstdlib>
#include <memory>
#include <optional>

#include "PropertyRows.h"
#include "ProviderFactories.h"
#include "QyplatCmdCaller.h"
#include "SentSettings.h"

namespace {

constexpr char kService[] = "ORXC_VirtualSystemManagementService";
constexpr char kHost[] = "ORXC_CEC_CS";
constexpr char kPartition[] = "ORXC_LPAR_CS";
constexpr char kName[] = "VirtualSystemManagement";  ///< of the one that a host has

CmpiObjectPath servicePath(const CmpiObjectPath& near, const zemString& host) {
    CmpiObjectPath path = zemBaseProvider::createObjectPath(near, kService);
    path.setKey("SystemCreationClassName", CmpiData(kHost));
    path.setKey("SystemName", CmpiData(static_cast<const char*>(host)));
    path.setKey("CreationClassName", CmpiData(kService));
    path.setKey("Name", CmpiData(kName));
    return path;
}

zemOperEnv clientOf(const CmpiContext& context) {
    return {zemBaseProvider::getUserContext(context),
            zemBaseProvider::getExternalLanguageName(context)};
}

/// The keys of the hosts that there are, or of one; none for a key that has not the form of one.
std::vector<zemString> hostsNamed(const CmpiContext& context, const std::string& host) {
    std::vector<zemString> names;
    zemVirtualizationManager manager;
    const std::unique_ptr<zemCECVisitor> hosts(manager.createCECVisitor(clientOf(context)));
    hosts->initialize(zemBaseProvider::getUserContext(context), false, host.c_str(),
                      zemCECVisitor::Level_Basic);
    names.reserve(static_cast<std::size_t>(hosts->size()));
    for (int i = 0; i < hosts->size(); ++i) {
        names.push_back(hosts->getData(i)->getMTMS());
    }
    return names;
}

/// The number of the host's partition with this name; empty when there is none.
std::string numberOfPartition(const zemOperEnv& client, const std::string& host,
                              const zemString& name) {
    using Partition = zemQyplatCmdCaller::PartitionAttribute;
    int attributes[] = {Partition::ATTR_LPAR_ID, Partition::ATTR_NAME, Partition::ATTR_END};
    const zemRecordSetsType all = zemQyplatCmdCaller(client.m_userName, client.m_locale)
                                      .getPartitionsInformation(attributes, host.c_str(), nullptr);
    for (int i = 0; i < all.size(); ++i) {
        if ((*all[i])[Partition::ATTR_NAME] == name) {
            return std::string((*all[i])[Partition::ATTR_LPAR_ID]);
        }
    }
    return "";
}

}  // namespace

struct ManagementService::Method {
    const char* name;
    std::vector<const char*> arguments;  ///< that go in
    Answer (ManagementService::*run)(const Call& call) const;
};

const ManagementService::Method ManagementService::kMethods[] = {
    {"DefineSystem",
     {"SystemSettings", "ResourceSettings", "ReferenceConfiguration"},
     &ManagementService::defineSystem},
    {"DestroySystem", {"AffectedSystem"}, &ManagementService::destroySystem},
    {"ModifySystemSettings", {"SystemSettings"}, &ManagementService::modifySystem},
    {"AddResourceSettings",
     {"AffectedConfiguration", "ResourceSettings"},
     &ManagementService::addResources},
    {"ModifyResourceSettings", {"ResourceSettings"}, &ManagementService::modifyResources},
    {"RemoveResourceSettings", {"ResourceSettings"}, &ManagementService::removeResources},
};

ManagementService::ManagementService(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
    : CmpiBaseMI(mb, ctx), zemBaseZemProvider(mb, ctx, name) {}

CMPIBoolean ManagementService::isValidInstanceClass(const char* className) {
    return compareClassNames(className, kService);
}

CMPIBoolean ManagementService::isValidMethodClass(const char* className) {
    return isValidInstanceClass(className);
}

void ManagementService::populateEssentialKeys(const char*, CmpiArray& keys) {
    CMPICount i = 0;
    for (const char* key : {"SystemCreationClassName", "SystemName", "CreationClassName", "Name"}) {
        setText(keys, i++, key);
    }
}

const ManagementService::Method* ManagementService::methodNamed(const char* name) {
    const auto* const found =
        std::find_if(std::begin(kMethods), std::end(kMethods),
                     [name](const Method& each) { return strcasecmp(each.name, name) == 0; });
    return found == std::end(kMethods) ? nullptr : found;
}

void ManagementService::populateMethodArgs(const char*, zemDynamicArray<zemString>& args,
                                           const char* method) {
    if (const Method* const found = methodNamed(method)) {
        for (const char* argument : found->arguments) {
            args.addElement(std::make_unique<zemString>(argument));
        }
    }
}

CmpiInstance ManagementService::performGetInstance(const CmpiContext& context,
                                                   const CmpiObjectPath& path,
                                                   const char** properties) {
    const std::string host = getKeyBinding(path, "SystemName").getString().charPtr();
    const CmpiObjectPath own = servicePath(path, host.c_str());
    const auto isOwn = [&](const char* key) {
        return strcasecmp(getKeyBinding(path, key).getString().charPtr(),
                          getKeyBinding(own, key).getString().charPtr()) == 0;
    };
    if (!isHostName(host) || !isOwn("SystemCreationClassName") || !isOwn("CreationClassName") ||
        !isOwn("Name") || hostsNamed(context, host).empty()) {
        throwObjectNotFoundExc("getInstance", kService, objectPathToString(path));
    }
    CmpiInstance instance = newInstance(own, properties);
    if (containsProperty(properties, "ElementName")) {
        instance.setProperty("ElementName", CmpiData(kName));
    }
    return instance;
}

void ManagementService::performEnumInstances(const CmpiContext& context, CmpiResult& result,
                                             const CmpiObjectPath& path, const char** properties) {
    for (const zemString& host : hostsNamed(context, "")) {
        result.returnData(performGetInstance(context, servicePath(path, host), properties));
    }
}

void ManagementService::performEnumInstanceNames(const CmpiContext& context, CmpiResult& result,
                                                 const CmpiObjectPath& path) {
    for (const zemString& host : hostsNamed(context, "")) {
        result.returnData(servicePath(path, host));
    }
}

void ManagementService::performInvokeMethod(const CmpiContext& context, CmpiResult& result,
                                            const CmpiObjectPath& path, const char* method,
                                            const CmpiArgs& in, CmpiArgs& out) {
    const Method* const found = methodNamed(method);
    if (found == nullptr) {
        throwMethodNotFoundExc(method, kService);
    }
    const Call call = {
        context,          path, in, out, getKeyBinding(path, "SystemName").getString().charPtr(),
        clientOf(context)};
    CmpiData answer;
    answer.setUint32((this->*found->run)(call));
    result.returnData(answer);
}

ManagementService::Answer ManagementService::defineSystem(const Call& call) const {
    if (!elementsOf(call.in, "ReferenceConfiguration").empty()) {
        return NotSupported;
    }
    const std::vector<Sent> systems = sentIn(call.in, "SystemSettings", false);
    const std::vector<Sent> resources = sentIn(call.in, "ResourceSettings", true);
    if (systems.size() != 1 || resources.empty()) {
        return InvalidParameter;
    }
    // what a new one is unless the client says otherwise
    const auto blank = [&] {
        return zemVSSD("", call.host.c_str(), "", 0, "", "", "", 0, -1, -1, 0, "norm", "");
    };
    const zemVSSD usual = blank();
    zemVSSD system = blank();
    takeSetting({SettingUse::Define,
                 systems[0].instance,
                 systems[0].row,
                 call.path,
                 {usual.getInstanceID(), usual, nullptr}},
                system, nullptr);
    for (const Sent& each : resources) {
        addResource(each, SettingUse::Define, call.path, system);
    }

    zemVirtualizationManager manager;
    zemCEC* const host = manager.getCEC(call.host.c_str(), call.client);
    if (host == nullptr) {
        return InvalidParameter;
    }
    std::unique_ptr<zemCECVisitor> hosts(manager.createCECVisitor(call.client));
    hosts->createLPAR(host, &system, system.getVirtualSystemType() == "osq00");
    const std::string number = numberOfPartition(call.client, call.host, system.getLparName());
    call.out.setArg("ResultingSystem",
                    CmpiData(systemPath(call.path, kPartition, number + "*" + call.host)));
    return Done;
}

ManagementService::Answer ManagementService::destroySystem(const Call& call) const {
    const std::vector<CmpiData> systems = elementsOf(call.in, "AffectedSystem");
    if (systems.size() != 1 || systems[0].getType() != CMPI_ref) {
        return InvalidParameter;
    }
    const std::optional<SettingOwner> owner = settingOwnerOf(systems[0].getObjectPath());
    if (!owner || owner->host != call.host) {
        return InvalidParameter;
    }
    zemCEC host(call.host.c_str(), "");
    zemLPARVisitor partitions(&host, "");
    partitions.setOperEnv(call.client);
    partitions.deleteLpar(call.host.c_str(), owner->partition.c_str());
    return Done;
}

ManagementService::Answer ManagementService::modifySystem(const Call& call) const {
    const std::vector<Sent> systems = sentIn(call.in, "SystemSettings", false);
    const std::optional<SettingId> named =
        systems.size() == 1 ? settingIdOf(systems[0].row, systems[0].id) : std::nullopt;
    if (!named || named->owner.host != call.host) {
        return InvalidParameter;
    }
    const SettingId& id = *named;
    const PresentSettings present = readPresent(call.context, id, {&systems[0].row});
    if (present.shown == nullptr) {
        return InvalidParameter;
    }
    // of a partition only what is asked for goes to the tool; of a profile all goes
    const SettingUse use = id.isState ? SettingUse::ChangeState : SettingUse::ChangeProfile;
    zemVSSD changed = id.isState ? zemVSSD(call.host.c_str(), id.system.c_str()) : *present.shown;
    const Setting shown = {present.shown->getInstanceID(), *present.shown, nullptr};
    if (!takeSetting({use, systems[0].instance, systems[0].row, call.path, shown}, changed,
                     nullptr)) {
        return Done;
    }
    zemCEC host(call.host.c_str(), "");
    if (id.isState) {
        zemLPARVisitor partitions(&host, "");
        partitions.setOperEnv(call.client);
        partitions.ModifyLparProperties(&changed);
    } else {
        zemVSSDVisitor profiles(&host, "");
        profiles.setOperEnv(call.client);
        profiles.ModifySystemSetting(&changed, id.profile.c_str());
    }
    return Done;
}

ZEM_PROVIDER(ORXC_VirtualSystemManagementServiceProvider, ManagementService)

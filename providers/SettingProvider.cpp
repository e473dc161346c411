#include "SettingProvider.h"

#include <algorithm>
#include <stdexcept>
#include <utility>
#include <vector>

#include "DataTypeConvertUtils.h"
#include "PropertyRows.h"
#include "ProviderFactories.h"

namespace {

constexpr char kPartition[] = "ORXC_LPAR_CS";
constexpr char kKey[] = "InstanceID";

const SettingClass& classOfProvider(std::string name) {
    constexpr std::size_t kSuffix = sizeof "Provider" - 1;
    const SettingClass* const found =
        settingClassNamed(name.erase(name.size() - std::min(name.size(), kSuffix)).c_str());
    if (found == nullptr) {
        throw std::invalid_argument("no provider of settings");
    }
    return *found;
}

bool isPartition(const SettingOwner& owner) {
    constexpr std::size_t kDigits = 5;
    return isHostName(owner.host) && owner.partition.size() <= kDigits &&
           zemString(owner.partition.c_str()).isDigit();
}

/// The InstanceID of a system from that of one of its slots or adapters, of which "<slot>*" goes:
/// it stands in front of the partition, and behind the side or the dash of the profile.
/// @param hostAt  where the "*" in front of the host's key is
std::string withoutSlot(const std::string& id, std::size_t hostAt) {
    const std::size_t side = id.find('*');
    const std::size_t star = id.rfind('*', hostAt - 1);
    if (star <= side) {
        return "";
    }
    const bool isState = id.compare(0, side, "ORX:4") == 0;
    const std::size_t front = isState ? side : id.rfind('-', star);
    return front == id.npos || front < side ? "" : id.substr(0, front + 1) + id.substr(star + 1);
}

}  // namespace

std::optional<SettingId> settingIdOf(const SettingClass& row, const std::string& id) {
    // the second star from the right: the key of a host has one of its own
    const std::size_t last = id.rfind('*');
    const std::size_t hostAt = last == id.npos || last == 0 ? id.npos : id.rfind('*', last - 1);
    if (hostAt == id.npos || hostAt == 0) {
        return std::nullopt;
    }
    SettingId parts;
    parts.owner.host = id.substr(hostAt + 1);
    parts.system = row.hasSlot ? withoutSlot(id, hostAt) : id;
    try {
        const zemVSSD system(parts.owner.host.c_str(), parts.system.c_str());
        parts.owner.partition = system.getLparID();
        parts.profile = system.getProfileName();
        parts.isState = system.isState();
    } catch (const zemInvalidParameterException&) {
        return std::nullopt;
    }
    if (!isPartition(parts.owner)) {
        return std::nullopt;
    }
    return parts;
}

namespace {

/// The settings of the profile of this name; null without it.
zemVSSD* systemOf(const std::vector<std::unique_ptr<zemVSSD>>& stored, const zemString& name) {
    const auto found = std::find_if(stored.begin(), stored.end(), [&](const auto& system) {
        return system->getProfileName() == name;
    });
    return found == stored.end() ? nullptr : found->get();
}

}  // namespace

std::optional<SettingId> settingIdOf(const CmpiObjectPath& path) {
    const SettingClass* const row = settingClassNamed(path.getClassName().charPtr());
    return row == nullptr ? std::nullopt : settingIdOf(*row, settingKeyOf(path));
}

std::optional<SettingOwner> settingOwnerOf(const CmpiObjectPath& path) {
    if (path.getClassName().equalsIgnoreCase(kPartition)) {
        if (keyOf(path, "Name").empty()) {
            return std::nullopt;
        }
        zemString host, partition;
        zemDataTypeConvertManager::getMTMSAndLparIDByOp(path, host, partition);
        const SettingOwner owner = {std::string(host), std::string(partition)};
        return isPartition(owner) ? std::optional(owner) : std::nullopt;
    }
    const std::optional<SettingId> id = settingIdOf(path);
    return id ? std::optional(id->owner) : std::nullopt;
}

std::string settingKeyOf(const CmpiObjectPath& path) { return keyOf(path, kKey); }

SettingPaths::SettingPaths(const CmpiObjectPath& near, const SettingClass& row)
    : m_className(row.name),
      m_nameSpace(near.getNameSpace().charPtr()),
      m_host(near.getHostname().charPtr()) {}

CmpiObjectPath SettingPaths::operator()(const zemString& id) const {
    CmpiObjectPath path(static_cast<const char*>(m_nameSpace), m_className);
    if (!m_host.isEmpty()) {
        path.setHostname(static_cast<const char*>(m_host));
    }
    path.setKey(kKey, CmpiData(static_cast<const char*>(id)));
    return path;
}

std::unique_ptr<zemCECVisitor> readPartitions(zemVirtualizationManager& manager,
                                              const CmpiContext& context,
                                              const SettingOwner& whose) {
    const zemString user = zemBaseProvider::getUserContext(context);
    std::unique_ptr<zemCECVisitor> hosts(
        manager.createCECVisitor({user, zemBaseProvider::getExternalLanguageName(context)}));
    if (hosts->initialize(user, false, whose.host.c_str(), zemCECVisitor::Level_All) < 0) {
        return nullptr;
    }
    hosts->initializeLparResource(user, whose.partition.c_str(), zemCECVisitor::Level_All,
                                  VISITOR_TYPE_LPAR);
    return hosts;
}

std::unique_ptr<zemCECVisitor> readForSettings(zemVirtualizationManager& manager,
                                               const CmpiContext& context,
                                               const SettingOwner& whose,
                                               const std::vector<const SettingClass*>& classes) {
    std::unique_ptr<zemCECVisitor> hosts = readPartitions(manager, context, whose);
    if (hosts == nullptr) {
        return nullptr;
    }
    const zemString user = zemBaseProvider::getUserContext(context);
    constexpr int kLevel = zemCECVisitor::Level_All;
    hosts->initializeLparProfile(user, whose.partition.c_str(), kLevel);
    for (const SettingClass* row : classes) {
        if (row->ofHosts != nullptr) {
            (*hosts.*row->ofHosts)(user, kLevel);
        }
        if (row->ofPartitions != nullptr) {
            (*hosts.*row->ofPartitions)(user, whose.partition.c_str(), kLevel);
        }
    }
    return hosts;
}

void makeSettings(zemCECVisitor& hosts, const std::vector<const SettingClass*>& classes,
                  const SystemSink& sink) {
    int type = 0;
    for (const SettingClass* row : classes) {
        type |= row->type;
    }
    for (int i = 0; i < hosts.size(); ++i) {
        zemCEC& host = *hosts.getData(i);
        zemVSSDVisitor systems(&host, classes.front()->name);
        for (int j = 0; j < host.getLPARs().size(); ++j) {
            zemLPAR& lpar = *host.getLPARs().getElementAt(j);
            const zemDynamicArray<zemPartitionProfileConfiguration>& profiles =
                lpar.getLparProfile();
            std::vector<std::unique_ptr<zemVSSD>> stored(static_cast<std::size_t>(profiles.size()));
            for (int k = 0; k < profiles.size(); ++k) {
                stored[static_cast<std::size_t>(k)].reset(
                    systems.getProfileVSSD(&lpar, profiles[k], type));
            }
            // one that was never activated has no current profile, and starts with its default
            const zemString& current = lpar.getCurrentProfileName();
            if (zemVSSD* const running =
                    systemOf(stored, current.isEmpty() ? lpar.getDefaultProfileName() : current)) {
                sink(host, std::unique_ptr<zemVSSD>(systems.getStateVSSD(&lpar, *running)));
            }
            for (auto& system : stored) {
                sink(host, std::move(system));
            }
        }
    }
}

void readSettings(const CmpiContext& context, const SettingOwner& whose,
                  const std::vector<const SettingClass*>& classes, const SystemSink& sink) {
    zemVirtualizationManager manager;
    if (const auto hosts = readForSettings(manager, context, whose, classes)) {
        makeSettings(*hosts, classes, sink);
    }
}

SettingProvider::SettingProvider(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
    : CmpiBaseMI(mb, ctx),
      zemBaseZemInstanceProvider(mb, ctx, name),
      m_class(classOfProvider(name)) {}

int SettingProvider::getInstance(const CmpiContext& context, const CmpiObjectPath& path,
                                 const char** properties, CmpiInstance& out) {
    const std::string id = settingKeyOf(path);
    const std::optional<SettingId> parts = settingIdOf(m_class, id);
    bool isFound = false;
    if (!parts) {
        return -1;
    }
    try {
        read(context, parts->owner, [&](const Setting& setting) {
            if (!isFound && setting.id == id.c_str()) {
                isFound = true;
                out = makeInstance(SettingPaths(path, m_class), properties, setting);
            }
        });
    } catch (const zemException& e) {
        if (!isUnknownObject(e)) {
            throw;
        }
    }
    return isFound ? 0 : -1;
}

void SettingProvider::enumInstanceNames(const CmpiContext& context, const CmpiObjectPath& path,
                                        zemDynamicArray<CmpiObjectPath>& out,
                                        const CmpiObjectPath& asked) {
    read(context, scopeOf(asked), namesInto(path, out));
}

void SettingProvider::enumInstances(const CmpiContext& context, const CmpiObjectPath& path,
                                    const char** properties, zemDynamicArray<CmpiInstance>& out,
                                    const CmpiObjectPath& asked) {
    read(context, scopeOf(asked), instancesInto(path, properties, out));
}

CMPIBoolean SettingProvider::isValidInstanceClass(const char* className) {
    return compareClassNames(className, m_class.name);
}

void SettingProvider::populateEssentialKeys(const char*, CmpiArray& keys) {
    zemBaseProvider::setText(keys, 0, kKey);
}

SettingProvider::Sink SettingProvider::namesInto(const CmpiObjectPath& path,
                                                 zemDynamicArray<CmpiObjectPath>& out) const {
    return [paths = SettingPaths(path, m_class), &out](const Setting& setting) {
        out.addElement(std::make_unique<CmpiObjectPath>(paths(setting.id)));
    };
}

SettingProvider::Sink SettingProvider::instancesInto(const CmpiObjectPath& path,
                                                     const char** properties,
                                                     zemDynamicArray<CmpiInstance>& out) const {
    return [this, paths = SettingPaths(path, m_class), properties, &out](const Setting& setting) {
        out.addElement(std::make_unique<CmpiInstance>(makeInstance(paths, properties, setting)));
    };
}

void SettingProvider::tell(zemCECVisitor& hosts, const Sink& sink) const {
    makeSettings(hosts, {&m_class}, [&](zemCEC&, const std::unique_ptr<zemVSSD>& system) {
        if (m_class.resourceType == 0) {
            sink({system->getInstanceID(), *system, nullptr});
        }
        for (int i = 0; i < system->getRASDs().size(); ++i) {
            const zemRASDCommData& data = *system->getRASDs()[i]->getData();
            if (data.m_ResourceType == m_class.resourceType) {
                sink({data.m_InstanceID, *system, &data});
            }
        }
    });
}

void SettingProvider::read(const CmpiContext& context, const SettingOwner& whose,
                           const Sink& sink) const {
    zemVirtualizationManager manager;
    if (const auto hosts = readForSettings(manager, context, whose, {&m_class})) {
        tell(*hosts, sink);
    }
}

bool SettingProvider::isAll(const CmpiObjectPath& asked) const {
    return asked.getClassName().equalsIgnoreCase(m_class.name);
}

SettingOwner SettingProvider::scopeOf(const CmpiObjectPath& asked) const {
    return isAll(asked) ? SettingOwner() : settingOwnerOf(asked).value_or(SettingOwner());
}

CmpiInstance SettingProvider::makeInstance(const SettingPaths& paths, const char** properties,
                                           const Setting& setting) const {
    const Keys keys = {{kKey, CmpiData(static_cast<const char*>(setting.id))}};
    CmpiInstance instance = newInstance(paths(setting.id), keys, properties);
    showSetting(instance, m_class, properties, setting);
    return instance;
}

ZEM_PROVIDER(ORXC_VirtualSystemSettingDataProvider, SettingProvider)

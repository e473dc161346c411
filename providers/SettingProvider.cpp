#include "SettingProvider.h"

#include <strings.h>

#include <algorithm>
#include <cstdlib>
#include <limits>
#include <stdexcept>
#include <type_traits>
#include <vector>

#include "DataTypeConvertUtils.h"
#include "PropertyRows.h"
#include "ProviderFactories.h"
#include "ResourcePoolManager.h"

/// One instance to be: the settings of a partition, or one of their resources.
struct Setting {
    const zemString& id;
    zemVSSD& system;
    const zemRASDCommData* resource;  ///< null: the system itself
};

namespace {

/// One property, and the datum that it shows: false leaves it null.
struct Row {
    const char* property;
    bool (*read)(const Setting& setting, CmpiData& value);
};

/// The rows of one table.
struct Rows {
    template <std::size_t count>
    constexpr Rows(const Row (&table)[count]) : first(table), last(table + count) {}

    const Row* begin() const { return first; }
    const Row* end() const { return last; }

    const Row* first;
    const Row* last;
};

// How a datum becomes a value. It is a getter of the system, or a field of the resource. Empty
// texts and numbers beyond the property's type, as -1, are null.

template <class Owner, class Datum>
decltype(auto) datumOf(Datum Owner::*datum, const Setting& setting) {
    if constexpr (std::is_same_v<Owner, zemVSSD>) {
        return std::invoke(datum, setting.system);
    } else {
        return std::invoke(datum, static_cast<const Owner&>(*setting.resource));
    }
}

template <class Number>
bool isOf(std::int64_t value) {
    return value >= 0 && (sizeof(Number) == sizeof value ||
                          value <= static_cast<std::int64_t>(std::numeric_limits<Number>::max()));
}

/// The value refers to @p text, which the model keeps.
bool setText(const zemString& text, CmpiData& value) {
    value = CmpiData(static_cast<const char*>(text));
    return !text.isEmpty();
}
bool setText(const zemString&& text, CmpiData& value) = delete;

template <auto datum>
bool text(const Setting& setting, CmpiData& value) {
    return setText(datumOf(datum, setting), value);
}

template <class Number, auto datum>
bool number(const Setting& setting, CmpiData& value) {
    const std::int64_t told = datumOf(datum, setting);
    value = CmpiData(static_cast<Number>(told));
    return isOf<Number>(told);
}

template <auto datum>
bool flag(const Setting& setting, CmpiData& value) {
    const int told = datumOf(datum, setting);
    value.setBoolean(static_cast<CMPIBoolean>(told > 0));
    return told >= 0;
}

bool systemName(const Setting& setting, CmpiData& value) {
    const zemVSSD& system = setting.system;
    return setText(system.isState() ? system.getLparName() : system.getProfileName(), value);
}

bool resourceName(const Setting& setting, CmpiData& value) {
    value = CmpiData(CmpiString(setting.resource->getKey()));
    return true;
}

bool partitionNumber(const Setting& setting, CmpiData& value) {
    const std::int64_t told = std::strtol(setting.system.getLparID(), nullptr, 10);
    value = CmpiData(static_cast<CMPIUint16>(told));
    return isOf<CMPIUint16>(told);
}

bool startupAction(const Setting& setting, CmpiData& value) {
    constexpr CMPIUint16 kNone = 2, kAlways = 4;  // of the schema
    value = CmpiData(setting.system.getAutoActivate() ? kAlways : kNone);
    return true;
}

constexpr Row kSystemRows[] = {
    {"ElementName", systemName},
    {"VirtualSystemIdentifier", text<&zemVSSD::getVirtualSystemID>},
    {"VirtualSystemType", text<&zemVSSD::getVirtualSystemType>},
    {"AutomaticStartupAction", startupAction},
    {"LparID", partitionNumber},
    {"LparName", text<&zemVSSD::getLparName>},
    {"HostName", text<&zemVSSD::getMTMS>},
    {"ProfileName", text<&zemVSSD::getProfileName>},
    {"DefaultProfileName", text<&zemVSSD::getDefaultProfileName>},
    {"IsDefault", flag<&zemVSSD::getIsDefault>},
    {"BootMode", text<&zemVSSD::getBootMode>},
    {"Keylock", text<&zemVSSD::getKeylock>},
    {"MaxVirtualSlots", number<CMPIUint16, &zemVSSD::getMaxVirtualSlots>},
    {"EnableConnectionMonitoring", flag<&zemVSSD::getEnableConnectionMonitoring>},
    {"EnableRedundantErrorPathReporting", flag<&zemVSSD::getEnableRedundantErrorPathReporting>},
};

using Resource = zemRASDCommData;
// Besides those that the library shows of a resource.
constexpr Row kResourceRows[] = {
    {"ElementName", resourceName},
    {"ResourceType", number<CMPIUint16, &Resource::m_ResourceType>},
    {"AllocationUnits", text<&Resource::m_AllocationUnits>},
    {"VirtualQuantityUnits", text<&Resource::m_AllocationUnits>},
};

}  // namespace

struct SettingClass {
    const char* name;
    int resourceType;  ///< 0: the system itself
    int type;          ///< VMVisitorType that asks for it
    bool hasSlot;      ///< its InstanceID names a slot

    /// What is read besides partitions and profiles: of hosts, whether there are pools, and of
    /// partitions, what they have now. Null: nothing.
    int (zemCECVisitor::*ofHosts)(const zemString& userName, int level);
    int (zemCECVisitor::*ofPartitions)(const zemString& userName, const zemString& lparid,
                                       int level);

    Rows rows;
};

namespace {

using Hosts = zemCECVisitor;
using Kinds = zemRASDKinds;

// clang-format off
constexpr SettingClass kClasses[] = {
    {"ORXC_VirtualSystemSettingData", 0, VISITOR_TYPE_VSSD, false, nullptr, nullptr, kSystemRows},
    {Kinds::processor.settingClass, Kinds::processor.resourceType, VISITOR_TYPE_RASD_PROC, false,
     &Hosts::initializeProcessorLevelSys, &Hosts::initializeProcessorLevelLpar, kResourceRows},
    {Kinds::memory.settingClass, Kinds::memory.resourceType, VISITOR_TYPE_RASD_MEM, false,
     &Hosts::initializeMemoryLevelSys, &Hosts::initializeMemoryLevelLpar, kResourceRows},
    {Kinds::ioSlot.settingClass, Kinds::ioSlot.resourceType, VISITOR_TYPE_RASD_IOSLOT, true,
     nullptr, &Hosts::initializeIOSlotLevelLpar, kResourceRows},
    {Kinds::ethernet.settingClass, Kinds::ethernet.resourceType, VISITOR_TYPE_RASD_VETH, true,
     nullptr, &Hosts::initializeEthernetAdapterLevelLpar, kResourceRows},
    {Kinds::scsi.settingClass, Kinds::scsi.resourceType, VISITOR_TYPE_RASD_VSCSI, true,
     nullptr, &Hosts::initializeSCSIAdapterLevelLpar, kResourceRows},
    {Kinds::serial.settingClass, Kinds::serial.resourceType, VISITOR_TYPE_RASD_VSERIAL, true,
     nullptr, &Hosts::initializeSerialAdapterLevelLpar, kResourceRows},
};
// clang-format on

constexpr char kPartition[] = "ORXC_LPAR_CS";
constexpr char kKey[] = "InstanceID";

/// Null: it is no class of settings.
const SettingClass* classNamed(const char* name) {
    for (const SettingClass& row : kClasses) {
        if (strcasecmp(row.name, name) == 0) {
            return &row;
        }
    }
    return nullptr;
}

const SettingClass& classOfProvider(std::string name) {
    constexpr std::size_t kSuffix = sizeof "Provider" - 1;
    const SettingClass* const found =
        classNamed(name.erase(name.size() - std::min(name.size(), kSuffix)).c_str());
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

/// The settings of the profile of this name; null without it.
zemVSSD* systemOf(const std::vector<std::unique_ptr<zemVSSD>>& stored, const zemString& name) {
    const auto found = std::find_if(stored.begin(), stored.end(), [&](const auto& system) {
        return system->getProfileName() == name;
    });
    return found == stored.end() ? nullptr : found->get();
}

}  // namespace

std::optional<SettingId> settingIdOf(const CmpiObjectPath& path) {
    const SettingClass* const row = classNamed(path.getClassName().charPtr());
    return row == nullptr ? std::nullopt : settingIdOf(*row, keyOf(path, kKey));
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

SettingProvider::SettingProvider(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
    : CmpiBaseMI(mb, ctx),
      zemBaseZemInstanceProvider(mb, ctx, name),
      m_class(classOfProvider(name)) {}

int SettingProvider::getInstance(const CmpiContext& context, const CmpiObjectPath& path,
                                 const char** properties, CmpiInstance& out) {
    const std::string id = keyOf(path, kKey);
    const std::optional<SettingId> parts = settingIdOf(m_class, id);
    bool isFound = false;
    if (!parts) {
        return -1;
    }
    try {
        read(context, parts->owner, [&](const Setting& setting) {
            if (!isFound && setting.id == id.c_str()) {
                isFound = true;
                out = makeInstance(path, properties, setting);
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
    read(context, scopeOf(asked), [&](const Setting& setting) {
        out.addElement(std::make_unique<CmpiObjectPath>(pathOf(path, setting)));
    });
}

void SettingProvider::enumInstances(const CmpiContext& context, const CmpiObjectPath& path,
                                    const char** properties, zemDynamicArray<CmpiInstance>& out,
                                    const CmpiObjectPath& asked) {
    read(context, scopeOf(asked), [&](const Setting& setting) {
        out.addElement(std::make_unique<CmpiInstance>(makeInstance(path, properties, setting)));
    });
}

CMPIBoolean SettingProvider::isValidInstanceClass(const char* className) {
    return compareClassNames(className, m_class.name);
}

void SettingProvider::populateEssentialKeys(const char*, CmpiArray& keys) {
    zemBaseProvider::setText(keys, 0, kKey);
}

void SettingProvider::read(const CmpiContext& context, const SettingOwner& whose,
                           const Sink& sink) const {
    zemVirtualizationManager manager;
    const std::unique_ptr<zemCECVisitor> hosts = readPartitions(manager, context, whose);
    if (hosts == nullptr) {
        return;
    }
    const zemString user = getUserContext(context);
    constexpr int kLevel = zemCECVisitor::Level_All;
    hosts->initializeLparProfile(user, whose.partition.c_str(), kLevel);
    if (m_class.ofHosts != nullptr) {
        (*hosts.*m_class.ofHosts)(user, kLevel);
    }
    if (m_class.ofPartitions != nullptr) {
        (*hosts.*m_class.ofPartitions)(user, whose.partition.c_str(), kLevel);
    }
    for (int i = 0; i < hosts->size(); ++i) {
        zemCEC& host = *hosts->getData(i);
        zemVSSDVisitor systems(&host, m_class.name);
        for (int j = 0; j < host.getLPARs().size(); ++j) {
            zemLPAR& lpar = *host.getLPARs().getElementAt(j);
            const zemDynamicArray<zemPartitionProfileConfiguration>& profiles =
                lpar.getLparProfile();
            std::vector<std::unique_ptr<zemVSSD>> stored(static_cast<std::size_t>(profiles.size()));
            for (int k = 0; k < profiles.size(); ++k) {
                stored[static_cast<std::size_t>(k)].reset(
                    systems.getProfileVSSD(&lpar, profiles[k], m_class.type));
            }
            // one that was never activated has no current profile, and starts with its default
            const zemString& current = lpar.getCurrentProfileName();
            if (zemVSSD* const running =
                    systemOf(stored, current.isEmpty() ? lpar.getDefaultProfileName() : current)) {
                tell(*std::unique_ptr<zemVSSD>(systems.getStateVSSD(&lpar, *running)), sink);
            }
            for (const auto& system : stored) {
                tell(*system, sink);
            }
        }
    }
}

void SettingProvider::tell(zemVSSD& system, const Sink& sink) const {
    if (m_class.resourceType == 0) {
        sink({system.getInstanceID(), system, nullptr});
        return;
    }
    const zemDynamicArray<zemRASD> resources = system.getRASD(m_class.resourceType);
    for (int i = 0; i < resources.size(); ++i) {
        const zemRASDCommData* const data = resources[i]->getData();
        sink({data->m_InstanceID, system, data});
    }
}

SettingOwner SettingProvider::scopeOf(const CmpiObjectPath& asked) const {
    const bool isOwn = asked.getClassName().equalsIgnoreCase(m_class.name);
    return isOwn ? SettingOwner() : settingOwnerOf(asked).value_or(SettingOwner());
}

CmpiObjectPath SettingProvider::pathOf(const CmpiObjectPath& near, const Setting& setting) const {
    CmpiObjectPath path = createObjectPath(near, m_class.name);
    path.setKey(kKey, CmpiData(static_cast<const char*>(setting.id)));
    return path;
}

CmpiInstance SettingProvider::makeInstance(const CmpiObjectPath& near, const char** properties,
                                           const Setting& setting) const {
    const Keys keys = {{kKey, CmpiData(static_cast<const char*>(setting.id))}};
    CmpiInstance instance = newInstance(pathOf(near, setting), keys, properties);
    for (const Row& row : m_class.rows) {
        CmpiData value;
        if (containsProperty(properties, row.property) && row.read(setting, value)) {
            instance.setProperty(row.property, value);
        }
    }
    if (setting.resource != nullptr) {
        zemAddRASDProperties(instance, properties, *setting.resource);
    }
    return instance;
}

ZEM_PROVIDER(ORXC_VirtualSystemSettingDataProvider, SettingProvider)

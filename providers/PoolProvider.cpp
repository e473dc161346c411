#include "PoolProvider.h"

#include <strings.h>

#include <algorithm>
#include <cstring>
#include <iterator>
#include <stdexcept>
#include <vector>

#include "PropertyRows.h"
#include "ProviderFactories.h"
#include "ResourcePoolManager.h"

namespace {

/// An instance and the properties of it that are wanted.
struct Shown {
    CmpiInstance& instance;
    const char** properties;
    const char* className;

    void add(const char* property, const CmpiData& value) const {
        if (zemBaseProvider::containsProperty(properties, property)) {
            instance.setProperty(property, value);
        }
    }
    void add(const char* property, const zemString& text) const {
        add(property, CmpiData(static_cast<const char*>(text)));
    }

    /// The texts that all but pools have in their data.
    template <class Data>
    void addTexts(const Data& data) const {
        add("Caption", data.m_Caption);
        add("Description", data.m_Description);
    }
};

using Show = std::function<void(const Shown& shown)>;

/// Receives the name of what there is, an InstanceID or the Name of a service, and how to show it.
using Take = std::function<void(const zemString& name, const Show& show)>;

void takePool(zemResourcePool& pool, const Take& take) {
    const zemPoolCommData& data = *pool.getData();
    take(data.m_InstanceID, [&](const Shown& shown) {
        shown.add("ElementName", data.m_PoolID);
        shown.add("PoolID", data.m_PoolID);
        shown.add("ResourceType", CmpiData(data.m_ResourceType));
        CmpiData primordial;
        primordial.setBoolean(static_cast<CMPIBoolean>(data.m_Primordial));
        shown.add("Primordial", primordial);
        shown.add("Capacity", CmpiData(data.m_Capacity));
        shown.add("AllocationUnits", data.m_AllocationUnits);
        shown.add("ConsumedResourceUnits", data.m_AllocationUnits);
        pool.addSpecificProperties(shown.instance, shown.properties, shown.className);
    });
}

void takeAllocation(zemResourcePool& pool, const Take& take) {
    for (zemResourceAllocationCapabilities* const each :
         {pool.getAlloCapDedicated(), pool.getAlloCapShared()}) {
        if (each == nullptr) {
            continue;
        }
        const zemAllcationCapabilitiesCommData& data = *each->getData();
        take(data.m_InstanceID, [&](const Shown& shown) {
            shown.add("ElementName", data.m_ElementName);
            shown.addTexts(data);
            shown.add("ResourceType", CmpiData(data.m_ResourceType));
            shown.add("RequestTypesSupported", CmpiData(data.m_RequestTypesSupported));
            shown.add("SharingMode", CmpiData(data.m_SharingMode));
            each->addSpecificProperties(shown.instance, shown.properties, shown.className);
        });
    }
}

void takeConfiguration(zemResourcePool& pool, const Take& take) {
    zemResourcePoolConfigurationCapabilities* const each = pool.getPoolConfCap();
    if (each == nullptr) {
        return;
    }
    const zemPoolConfigurationCapabilitiesCommData& data = *each->getData();
    take(data.m_InstanceID, [&](const Shown& shown) {
        shown.add("ElementName", data.m_ElementName);
        shown.addTexts(data);
        each->addSpecificProperties(shown.instance, shown.properties, shown.className);
    });
}

void takeService(zemResourcePool& pool, const Take& take) {
    zemResourcePoolConfigurationService* const each = pool.getPoolConfService();
    if (each == nullptr) {
        return;
    }
    const zemPoolConfigurationServiceCommData& data = *each->getData();
    take(data.m_Name, [&](const Shown& shown) {
        shown.add("ElementName", data.m_Caption);
        shown.addTexts(data);
        CmpiData started;
        started.setBoolean(static_cast<CMPIBoolean>(data.m_Started));
        shown.add("Started", started);
        each->addSpecificProperties(shown.instance, shown.properties, shown.className);
    });
}

void takeSettings(zemResourcePool& pool, const Take& take) {
    if (pool.getCapability() == nullptr) {
        return;
    }
    for (const auto& each : pool.getCapability()->m_SettingData) {
        const zemResourceRASettingDataCommData& data = *each->getData();
        take(data.m_InstanceID, [&](const Shown& shown) {
            constexpr unsigned kFront = sizeof "ORX:" - 1;
            const auto end = static_cast<unsigned>(data.m_InstanceID.find('*'));
            shown.add("ElementName", data.m_InstanceID.extractSubstring(kFront, end));
            shown.add("VirtualQuantityUnits", data.m_AllocationUnits);
            each->addSpecificProperties(shown.instance, shown.properties, shown.className);
        });
    }
}

/// How a pool is made to carry what a class shows of it.
struct Role {
    int names, everything;  ///< modes of zemResourcePool::initialize()
    void (*take)(zemResourcePool& pool, const Take& take);
};

constexpr Role kRoles[] = {
    // as PoolRole
    {0, 1, takePool},
    {VISITOR_TYPE_PART_INIT, VISITOR_TYPE_PART_INIT, takeAllocation},
    {VISITOR_TYPE_CONF_CAP_INIT_NI, VISITOR_TYPE_CONF_CAP_INIT, takeConfiguration},
    {VISITOR_TYPE_CONF_SERV_INIT_NI, VISITOR_TYPE_CONF_SERV_INIT, takeService},
    {VISITOR_TYPE_RASD_INIT_NI, VISITOR_TYPE_RASD_INIT, takeSettings},
};
constexpr int kRoleCount = std::size(kRoles);

const Role& roleOf(PoolRole role) { return kRoles[static_cast<int>(role)]; }

using Kinds = zemRASDKinds;

// clang-format off
constexpr struct {
    const zemRASDKind& kind;
    const char* classes[kRoleCount];  ///< by PoolRole
} kClasses[kPoolKinds] = {
    {Kinds::processor, {"ORXC_ProcessorPool", "ORXC_ProcessorAllocationCapabilities",
                        "ORXC_ProcessorPoolConfigurationCapabilities",
                        "ORXC_ProcessorPoolConfigurationService", Kinds::processor.settingClass}},
    {Kinds::memory, {"ORXC_MemoryPool", "ORXC_MemoryAllocationCapabilities",
                     "ORXC_MemoryPoolConfigurationCapabilities",
                     "ORXC_MemoryPoolConfigurationService", Kinds::memory.settingClass}},
    {Kinds::ioSlot, {"ORXC_IOSlotPool", "ORXC_IOSlotAllocationCapabilities",
                     "ORXC_IOSlotPoolConfigurationCapabilities",
                     "ORXC_IOSlotPoolConfigurationService", Kinds::ioSlot.settingClass}},
    {Kinds::ethernet, {"ORXC_EthernetAdapterPool", "ORXC_EthernetAdapterAllocationCapabilities",
                       "ORXC_EthernetAdapterPoolConfigurationCapabilities",
                       "ORXC_EthernetAdapterPoolConfigurationService", Kinds::ethernet.settingClass}},
    {Kinds::scsi, {"ORXC_SCSIAdapterPool", "ORXC_SCSIAdapterAllocationCapabilities",
                   "ORXC_SCSIAdapterPoolConfigurationCapabilities",
                   "ORXC_SCSIAdapterPoolConfigurationService", Kinds::scsi.settingClass}},
    {Kinds::serial, {"ORXC_SerialAdapterPool", "ORXC_SerialAdapterAllocationCapabilities",
                     "ORXC_SerialAdapterPoolConfigurationCapabilities",
                     "ORXC_SerialAdapterPoolConfigurationService", Kinds::serial.settingClass}},
};
// clang-format on

constexpr char kKey[] = "InstanceID";
constexpr char kHost[] = "ORXC_CEC_CS";

/// The keys of a class; the last one tells its instances apart.
const std::vector<const char*>& keysOf(PoolRole role) {
    static const std::vector<const char*> kServiceKeys = {"SystemCreationClassName", "SystemName",
                                                          "CreationClassName", "Name"};
    static const std::vector<const char*> kOtherKeys = {kKey};
    return role == PoolRole::Service ? kServiceKeys : kOtherKeys;
}

PoolClass classOfProvider(std::string_view name) {
    constexpr std::size_t kSuffix = sizeof "Provider" - 1;
    const auto found = poolClassNamed(name.substr(0, name.size() - std::min(name.size(), kSuffix)));
    return found ? *found : throw std::invalid_argument("no provider of pools");
}

}  // namespace

PoolClass poolClassAt(int index, PoolRole role) {
    const auto& row = kClasses[index];
    return {index, row.kind, role, row.classes[static_cast<int>(role)]};
}

std::optional<PoolClass> poolClassNamed(std::string_view name) {
    for (int index = 0; index < kPoolKinds; ++index) {
        for (int role = 0; role < kRoleCount; ++role) {
            const char* const row = kClasses[index].classes[role];
            if (name.size() == std::strlen(row) &&
                strncasecmp(row, name.data(), name.size()) == 0) {
                return poolClassAt(index, static_cast<PoolRole>(role));
            }
        }
    }
    return std::nullopt;
}

std::string poolNamed(const zemRASDKind& kind, const std::string& poolId) {
    return std::to_string(kind.resourceType) + "-" + poolId;
}

bool PoolKey::isPrimordial() const { return pool.substr(pool.find('-') + 1) == "Primordial"; }

std::optional<PoolKey> poolKeyOf(const CmpiObjectPath& path) {
    const std::optional<PoolClass> row = poolClassNamed(path.getClassName().charPtr());
    if (!row) {
        return std::nullopt;
    }
    PoolKey key;
    if (row->role == PoolRole::Service) {
        key = {keyOf(path, "SystemName"), poolNamed(row->kind), ""};
    } else {
        const std::string id = keyOf(path, kKey);
        const std::size_t star = std::min(id.find('*'), id.size());
        const std::size_t pool = id.rfind(':', star) + 1;  // 0 without one
        key = {id.substr(std::min(star + 1, id.size())), id.substr(pool, star - pool),
               id.substr(0, pool)};
    }
    const bool isOfKind = key.pool.rfind(poolNamed(row->kind, ""), 0) == 0;
    return isOfKind && isHostName(key.host) ? std::optional(key) : std::nullopt;
}

struct PoolProvider::Found {
    const zemString& host;
    const zemString& name;
    const Show& show;
};

PoolProvider::PoolProvider(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
    : CmpiBaseMI(mb, ctx),
      zemBaseZemInstanceProvider(mb, ctx, name),
      m_class(classOfProvider(name)) {}

int PoolProvider::getInstance(const CmpiContext& context, const CmpiObjectPath& path,
                              const char** properties, CmpiInstance& out) {
    const std::optional<PoolKey> key = poolKeyOf(path);
    if (!key) {
        return -1;
    }
    bool isFound = false;
    const std::vector<const char*>& keys = keysOf(m_class.role);
    const std::string name = keyOf(path, keys.back());
    try {
        read(context, key->host, true, [&](const Found& found) {
            if (isFound || found.name != name.c_str()) {
                return;
            }
            const CmpiObjectPath own = pathOf(path, found);
            isFound = std::all_of(keys.begin(), keys.end(), [&](const char* each) {
                return keyOf(own, each) == keyOf(path, each);
            });
            if (isFound) {
                out = makeInstance(path, properties, found);
            }
        });
    } catch (const zemException& e) {
        if (!isUnknownObject(e)) {
            throw;
        }
    }
    return isFound ? 0 : -1;
}

void PoolProvider::enumInstanceNames(const CmpiContext& context, const CmpiObjectPath& path,
                                     zemDynamicArray<CmpiObjectPath>& out,
                                     const CmpiObjectPath& asked) {
    read(context, scopeOf(asked), false, namesInto(path, out));
}

void PoolProvider::enumInstances(const CmpiContext& context, const CmpiObjectPath& path,
                                 const char** properties, zemDynamicArray<CmpiInstance>& out,
                                 const CmpiObjectPath& asked) {
    read(context, scopeOf(asked), true, instancesInto(path, properties, out));
}

void PoolProvider::addInstanceNames(const CmpiContext& context, zemCECVisitor& hosts,
                                    const CmpiObjectPath& path,
                                    zemDynamicArray<CmpiObjectPath>& out) const {
    tell(context, hosts, true, false, namesInto(path, out));
}

void PoolProvider::addInstances(const CmpiContext& context, zemCECVisitor& hosts,
                                const CmpiObjectPath& path, const char** properties,
                                zemDynamicArray<CmpiInstance>& out) const {
    tell(context, hosts, true, true, instancesInto(path, properties, out));
}

CMPIBoolean PoolProvider::isValidInstanceClass(const char* className) {
    return compareClassNames(className, m_class.name);
}

void PoolProvider::populateEssentialKeys(const char*, CmpiArray& keys) {
    CMPICount count = 0;
    for (const char* const each : keysOf(m_class.role)) {
        zemBaseProvider::setText(keys, count++, each);
    }
}

void PoolProvider::read(const CmpiContext& context, const std::string& host, bool isFull,
                        const Sink& sink) const {
    const zemString user = getUserContext(context);
    zemVirtualizationManager manager;
    const std::unique_ptr<zemCECVisitor> hosts(
        manager.createCECVisitor({user, getExternalLanguageName(context)}));
    if (hosts->initialize(user, false, host.c_str(), zemCECVisitor::Level_All) >= 0) {
        tell(context, *hosts, false, isFull, sink);
    }
}

void PoolProvider::tell(const CmpiContext& context, zemCECVisitor& hosts, bool haveSettings,
                        bool isFull, const Sink& sink) const {
    const Role& role = roleOf(m_class.role);
    const int mode = isFull ? role.everything : role.names;
    zemRPVisitor::readHosts(hosts, m_class.name, mode, haveSettings);
    for (int i = 0; i < hosts.size(); ++i) {
        const zemString mtms = hosts.getData(i)->getMTMS();
        zemRPVisitor pools(hosts.getData(i), m_class.name);
        pools.setOperEnv(getUserContext(context), getExternalLanguageName(context));
        pools.initialize("", mode);
        for (int j = 0; zemResourcePool* const pool = pools.getData(j); ++j) {
            role.take(*pool, [&](const zemString& name, const Show& show) {
                sink({mtms, name, show});
            });
        }
    }
}

PoolProvider::Sink PoolProvider::namesInto(const CmpiObjectPath& path,
                                           zemDynamicArray<CmpiObjectPath>& out) const {
    return [this, &path, &out](const Found& found) {
        out.addElement(std::make_unique<CmpiObjectPath>(pathOf(path, found)));
    };
}

PoolProvider::Sink PoolProvider::instancesInto(const CmpiObjectPath& path, const char** properties,
                                               zemDynamicArray<CmpiInstance>& out) const {
    return [this, &path, properties, &out](const Found& found) {
        out.addElement(std::make_unique<CmpiInstance>(makeInstance(path, properties, found)));
    };
}

std::string PoolProvider::scopeOf(const CmpiObjectPath& asked) const {
    const CmpiString className = asked.getClassName();
    if (className.equalsIgnoreCase(m_class.name)) {
        return "";
    }
    if (className.equalsIgnoreCase(kHost)) {
        return keyOf(asked, "Name");
    }
    if (const std::optional<PoolKey> key = poolKeyOf(asked)) {
        return key->host;
    }
    return settingOwnerOf(asked).value_or(SettingOwner()).host;
}

CmpiObjectPath PoolProvider::pathOf(const CmpiObjectPath& near, const Found& found) const {
    const std::vector<const char*>& keys = keysOf(m_class.role);
    const char* const values[] = {kHost, found.host, m_class.name};
    CmpiObjectPath path = createObjectPath(near, m_class.name);
    for (std::size_t i = 0; i + 1 < keys.size(); ++i) {
        path.setKey(keys[i], CmpiData(values[i]));
    }
    path.setKey(keys.back(), CmpiData(static_cast<const char*>(found.name)));
    return path;
}

CmpiInstance PoolProvider::makeInstance(const CmpiObjectPath& near, const char** properties,
                                        const Found& found) const {
    CmpiInstance instance = newInstance(pathOf(near, found), properties);
    found.show({instance, properties, m_class.name});
    return instance;
}

int ResourceSettingProvider::getInstance(const CmpiContext& context, const CmpiObjectPath& path,
                                         const char** properties, CmpiInstance& out) {
    return poolKeyOf(path) ? m_ofPools.getInstance(context, path, properties, out)
                           : SettingProvider::getInstance(context, path, properties, out);
}

void ResourceSettingProvider::enumInstanceNames(const CmpiContext& context,
                                                const CmpiObjectPath& path,
                                                zemDynamicArray<CmpiObjectPath>& out,
                                                const CmpiObjectPath& asked) {
    if (!isAll(asked)) {
        SettingProvider::enumInstanceNames(context, path, out, asked);
        m_ofPools.enumInstanceNames(context, path, out, asked);
        return;
    }
    readAll(context, [&](zemCECVisitor& hosts) {
        tell(hosts, namesInto(path, out));
        m_ofPools.addInstanceNames(context, hosts, path, out);
    });
}

void ResourceSettingProvider::enumInstances(const CmpiContext& context, const CmpiObjectPath& path,
                                            const char** properties,
                                            zemDynamicArray<CmpiInstance>& out,
                                            const CmpiObjectPath& asked) {
    if (!isAll(asked)) {
        SettingProvider::enumInstances(context, path, properties, out, asked);
        m_ofPools.enumInstances(context, path, properties, out, asked);
        return;
    }
    readAll(context, [&](zemCECVisitor& hosts) {
        tell(hosts, instancesInto(path, properties, out));
        m_ofPools.addInstances(context, hosts, path, properties, out);
    });
}

template <class Take>
void ResourceSettingProvider::readAll(const CmpiContext& context, Take take) const {
    zemVirtualizationManager manager;
    if (const auto hosts = readForSettings(manager, context, SettingOwner(), {&settingClass()})) {
        take(*hosts);
    }
}

#define ZEM_POOL_PROVIDERS(KIND)                                                   \
    ZEM_PROVIDER(ORXC_##KIND##PoolProvider, PoolProvider)                          \
    ZEM_PROVIDER(ORXC_##KIND##AllocationCapabilitiesProvider, PoolProvider)        \
    ZEM_PROVIDER(ORXC_##KIND##PoolConfigurationCapabilitiesProvider, PoolProvider) \
    ZEM_PROVIDER(ORXC_##KIND##PoolConfigurationServiceProvider, PoolProvider)
ZEM_POOL_PROVIDERS(Processor)
ZEM_POOL_PROVIDERS(Memory)
ZEM_POOL_PROVIDERS(IOSlot)
ZEM_POOL_PROVIDERS(EthernetAdapter)
ZEM_POOL_PROVIDERS(SCSIAdapter)
ZEM_POOL_PROVIDERS(SerialAdapter)
#undef ZEM_POOL_PROVIDERS

ZEM_PROVIDER(ORXC_ProcessorRASettingDataProvider, ResourceSettingProvider)
ZEM_PROVIDER(ORXC_MemoryRASettingDataProvider, ResourceSettingProvider)
ZEM_PROVIDER(ORXC_IOSlotAdapterRASettingDataProvider, ResourceSettingProvider)
ZEM_PROVIDER(ORXC_EthernetAdapterRASettingDataProvider, ResourceSettingProvider)
ZEM_PROVIDER(ORXC_SCSIAdapterRASettingDataProvider, ResourceSettingProvider)
ZEM_PROVIDER(ORXC_SerialAdapterRASettingDataProvider, ResourceSettingProvider)

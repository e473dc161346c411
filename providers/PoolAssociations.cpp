// What ties resource pools: to their host and their service, to what they are able to do, to each
// other, and to what partitions have taken from them.
//
// Both sides of each can be long, so all stand on the family that compares only objects with one
// key, and takes no lock. The key is in InstanceIDs and Names but for the pool of what a partition
// has taken, which only its settings tell.
#include <functional>
#include <map>
#include <memory>
#include <set>
#include <stdexcept>
#include <string>
#include <utility>

#include "BaseZemMultiNtoNAssociationProvider.h"
#include "DataTypeConvertUtils.h"
#include "JMPIProviderInterfaceStub.h"
#include "OneAssociation.h"
#include "PoolProvider.h"
#include "PropertyRows.h"
#include "ProviderFactories.h"

namespace {

constexpr char kHost[] = "ORXC_CEC_CS";

// The key by which two objects belong together.

std::string byHost(const CmpiObjectPath& path, bool) {
    const std::optional<PoolKey> key = poolKeyOf(path);
    return key ? key->host : std::string(zemDataTypeConvertManager::getMTMSByOP(path));
}

std::string byPool(const CmpiObjectPath& path, bool) {
    const std::optional<PoolKey> key = poolKeyOf(path);
    return key ? key->name() : "";
}

/// A primordial pool stands on the left alone, its parts on the right.
std::string byParts(const CmpiObjectPath& path, bool isLeft) {
    const std::optional<PoolKey> key = poolKeyOf(path);
    const bool isThere = key && key->isPrimordial() == isLeft;
    return isThere ? key->host : isLeft ? "no whole" : "no part";
}

// What an association tells besides its two sides, of which the right one says which it is.

using Tell = std::function<void(const char* property, const CmpiData& value)>;

void tellBounds(const CmpiObjectPath& settings, const Tell& tell) {
    constexpr struct {
        const char* role;
        CMPIUint16 valueRole, valueRange;  // of the schema
    } kBounds[] = {{"DEF:", 0, 0}, {"MIN:", 3, 1}, {"MAX:", 3, 2}, {"INC:", 3, 3}};
    constexpr CMPIUint16 kIndependent = 0;
    const std::string role = poolKeyOf(settings).value_or(PoolKey()).role;
    for (const auto& row : kBounds) {
        if (role.find(row.role) != role.npos) {
            tell("PropertyPolicy", CmpiData(kIndependent));
            tell("ValueRole", CmpiData(row.valueRole));
            tell("ValueRange", CmpiData(row.valueRange));
        }
    }
}

void tellEffects(const CmpiObjectPath&, const Tell& tell) {
    constexpr CMPIUint16 kManages = 5;  // of the schema
    CmpiArray effects(1, CMPI_uint16);
    effects[0] = CmpiData(kManages);
    tell("ElementEffects", CmpiData(effects));
}

/// What stands on a side: one class for each kind of resource, or the hosts.
struct Side {
    enum From { Pools, Partitions, Hosts };

    const char* reference;
    PoolRole role;
    From from = Pools;
};

struct Row {
    const char* name;
    Side sides[2][2];  ///< those of one pair, or of two
    std::string (*key)(const CmpiObjectPath& path, bool isLeft);
    void (*tell)(const CmpiObjectPath& right, const Tell& tell) = nullptr;
};

// clang-format off
constexpr Row kRows[] = {
    {"ORXC_HostedResourcePool",
     {{{"GroupComponent", PoolRole::Pool, Side::Hosts}, {"PartComponent", PoolRole::Pool}}}, byHost},
    {"ORXC_ServiceAffectsElement",
     {{{"AffectedElement", PoolRole::Pool}, {"AffectingElement", PoolRole::Service}}}, byHost, tellEffects},
    {"ORXC_ElementCapabilities",
     {{{"ManagedElement", PoolRole::Pool}, {"Capabilities", PoolRole::Allocation}},
      {{"ManagedElement", PoolRole::Service}, {"Capabilities", PoolRole::Configuration}}}, byPool},
    {"ORXC_SettingsDefineCapabilities",
     {{{"GroupComponent", PoolRole::Allocation}, {"PartComponent", PoolRole::Settings}}}, byPool, tellBounds},
    {"ORXC_ElementAllocatedFromPool",
     {{{"Antecedent", PoolRole::Pool}, {"Dependent", PoolRole::Pool}}}, byParts},
    {"ORXC_ResourceAllocationFromPool",
     {{{"Antecedent", PoolRole::Pool}, {"Dependent", PoolRole::Settings, Side::Partitions}}}, byPool},
};
// clang-format on

const Row& rowOfProvider(const std::string& name) {
    for (const Row& row : kRows) {
        if (name == std::string(row.name) + "Provider") {
            return row;
        }
    }
    throw std::invalid_argument("no association of pools");
}

/// From which pools partitions have taken what they have: what one operation has read of it. Keys
/// of objects are asked for without a context, so its thread has it.
class Takings {
public:
    /// @param asked  what the operation is about: nothing of other hosts is read
    Takings(const CmpiContext& context, const CmpiObjectPath& asked)
        : m_context(context), m_asked(asked), m_outer(std::exchange(current(), this)) {}
    ~Takings() { current() = m_outer; }
    Takings(const Takings&) = delete;
    Takings& operator=(const Takings&) = delete;

    /// Null outside of operations.
    static Takings*& current() {
        thread_local Takings* current = nullptr;
        return current;
    }

    /// Keeps which pool settings name that have been read with PoolID.
    void keep(const CmpiInstance& settings) {
        const CmpiData pool = settings.getProperty("PoolID");
        m_poolIds[keyOf(settings.getObjectPath(), "InstanceID")] =
            pool.isNullValue() ? "" : pool.getString().charPtr();
    }

    /// The pool that settings name; the primordial one where their host has none of that name, as
    /// it is with adapters.
    /// @param sides  has the providers of both
    std::string poolOf(const CmpiObjectPath& settings, const zemProviderPairAssociation& sides);

private:
    const CmpiContext m_context;
    const CmpiObjectPath m_asked;
    Takings* const m_outer;
    std::map<std::string, std::string> m_poolIds;          ///< by InstanceID of settings
    std::map<std::string, std::set<std::string>> m_pools;  ///< keys of those there are, by class
};

const char* kPoolIDAlone[] = {"PoolID", nullptr};

/// The settings of partitions that tell what these have now.
class TakenSettings : public SettingProvider {
public:
    TakenSettings(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
        : CmpiBaseMI(mb, ctx), SettingProvider(mb, ctx, name) {}

    void enumInstanceNames(const CmpiContext& context, const CmpiObjectPath& path,
                           zemDynamicArray<CmpiObjectPath>& out,
                           const CmpiObjectPath& asked) override {
        zemDynamicArray<CmpiInstance> all(25);
        enumInstances(context, path, kPoolIDAlone, all, asked);
        for (int i = 0; i < all.size(); ++i) {
            auto each = std::make_unique<CmpiObjectPath>(all[i]->getObjectPath());
            const std::optional<SettingId> id = settingIdOf(*each);
            if (id && id->isState) {
                Takings::current()->keep(*all[i]);
                out.addElement(std::move(each));
            }
        }
    }
};

std::string Takings::poolOf(const CmpiObjectPath& settings,
                            const zemProviderPairAssociation& sides) {
    const std::optional<SettingId> id = settingIdOf(settings);
    if (!id || !id->isState) {
        return "";
    }
    const CmpiString className = settings.getClassName();
    const std::string instanceId = keyOf(settings, "InstanceID");
    if (m_poolIds.find(instanceId) == m_poolIds.end()) {
        CmpiInstance instance(settings);
        if (sides.getProviderHandleByClassName(className.charPtr())
                ->getInstance(m_context, settings, kPoolIDAlone, instance) != 0) {
            return "";
        }
        keep(instance);
    }
    const PoolClass row = poolClassAt(poolClassNamed(className.charPtr())->index, PoolRole::Pool);
    const auto [pools, isNew] = m_pools.try_emplace(row.name);
    if (isNew) {
        zemDynamicArray<CmpiObjectPath> all(25);
        sides.getProviderHandleByClassName(row.name)->enumInstanceNames(
            m_context, zemBaseProvider::createObjectPath(settings, row.name), all, m_asked);
        for (int i = 0; i < all.size(); ++i) {
            pools->second.insert(byPool(*all[i], true));
        }
    }
    PoolKey key = {id->owner.host, poolNamed(row.kind, m_poolIds[instanceId]), ""};
    if (pools->second.count(key.name()) == 0) {
        key.pool = poolNamed(row.kind);
    }
    return key.name();
}

class PoolAssociation : public OneAssociation<zemEnhanceBaseZemMultiNtoNAssociationProvider> {
public:
    PoolAssociation(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
        : CmpiBaseMI(mb, ctx),
          OneAssociation(rowOfProvider(name).name, mb, ctx, name, OP_ALLOps),
          m_row(rowOfProvider(name)) {
        for (const auto& [left, right] : m_row.sides) {
            for (int index = 0; index < kPoolKinds && left.reference != nullptr; ++index) {
                m_associationDataSet.addNewAssoPair(new zemMultiNtoNAssociationPair(
                    sideOf(mb, ctx, left, index), sideOf(mb, ctx, right, index), m_row.name, ""));
            }
        }
    }

protected:
    zemString getObjectPathHashKeyString(const CmpiObjectPath& path, bool isLeft) override {
        return m_row.key(path, isLeft).c_str();
    }

    void addProperties(CmpiInstance& instance, const CmpiObjectPath& left,
                       const CmpiObjectPath& right, const char** properties, const char* className,
                       void* info) override {
        OneAssociation::addProperties(instance, left, right, properties, className, info);
        if (m_row.tell != nullptr) {
            m_row.tell(right, [&](const char* property, const CmpiData& value) {
                if (containsProperty(properties, property)) {
                    instance.setProperty(property, value);
                }
            });
        }
    }

    /// Of one class on both sides: pools, of which the primordial one stands on the left.
    bool isFirstClassWhen2ClassTheSame(const CmpiContext&, const CmpiObjectPath& path) override {
        return poolKeyOf(path).value_or(PoolKey()).isPrimordial();
    }

private:
    zemMultiNtoNAssociationData sideOf(const CmpiBroker& mb, const CmpiContext& ctx,
                                       const Side& side, int index) {
        const char* const name =
            side.from == Side::Hosts ? kHost : poolClassAt(index, side.role).name;
        const std::string provider = std::string(name) + "Provider";
        std::unique_ptr<zemBaseZemInstanceProvider>& handle = m_handles[name];
        if (handle != nullptr) {
            // it stands in several pairs
        } else if (side.from == Side::Hosts) {
            handle = std::make_unique<zemComputerSystemProviderStub>(mb, ctx);
        } else if (side.from == Side::Partitions) {
            handle = std::make_unique<TakenSettings>(mb, ctx, provider.c_str());
        } else {
            handle = std::make_unique<PoolProvider>(mb, ctx, provider.c_str());
        }
        return {handle.get(), name, side.reference, ""};
    }

    const Row& m_row;
    std::map<std::string, std::unique_ptr<zemBaseZemInstanceProvider>> m_handles;  ///< by class
};

/// Asks the settings of partitions for their pools.
class ResourceAllocationFromPool : public PoolAssociation {
public:
    ResourceAllocationFromPool(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
        : CmpiBaseMI(mb, ctx), PoolAssociation(mb, ctx, name) {}

protected:
    void* BeforeGenerateAssociation(const CmpiContext& context, const char*,
                                    const CmpiObjectPath& asked) override {
        return new Takings(context, asked);
    }
    void AfterGenerateAssociation(const CmpiContext&, const char*, void* takings) override {
        delete static_cast<Takings*>(takings);
    }

    zemString getObjectPathHashKeyString(const CmpiObjectPath& path, bool isLeft) override {
        return isLeft ? PoolAssociation::getObjectPathHashKeyString(path, isLeft)
                      : zemString(Takings::current()->poolOf(path, *this).c_str());
    }
};

}  // namespace

ZEM_PROVIDER(ORXC_HostedResourcePoolProvider, PoolAssociation)
ZEM_PROVIDER(ORXC_ServiceAffectsElementProvider, PoolAssociation)
ZEM_PROVIDER(ORXC_ElementCapabilitiesProvider, PoolAssociation)
ZEM_PROVIDER(ORXC_SettingsDefineCapabilitiesProvider, PoolAssociation)
ZEM_PROVIDER(ORXC_ElementAllocatedFromPoolProvider, PoolAssociation)
ZEM_PROVIDER(ORXC_ResourceAllocationFromPoolProvider, ResourceAllocationFromPool)

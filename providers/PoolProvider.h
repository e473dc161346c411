/// The resource pools of hosts and what stands around them: pools, their allocation capabilities,
/// the capabilities of their configuration services, these services, and the setting data that say
/// how much may be taken from a pool. Six kinds of resources, five classes each.
///
/// All are one provider with a table of the classes. An enumeration reads a collection with one
/// call of the management library, whatever the number of hosts, pools and partitions; a get reads
/// those of one host. What pools tell stands in ResourcePoolManager.h. InstanceIDs are told in
/// mof/pools.mof.
///
/// Of setting data there are those of partitions too, of the same classes (SettingProvider.h). So
/// the provider of such a class, ResourceSettingProvider, puts both together; an association takes
/// the side that it joins.
///
/// Thread-safety: constant tables and no state; any number of operations at once.
#ifndef POOL_PROVIDER_H
#define POOL_PROVIDER_H

#include <functional>
#include <optional>
#include <string>
#include <string_view>

#include "BaseZemInstanceProvider.h"
#include "SettingProvider.h"

class zemResourcePool;

/// What a class is of a pool.
enum class PoolRole { Pool, Allocation, Configuration, Service, Settings };

/// One class of the table.
struct PoolClass {
    int index;  ///< of the kind of resource, below kPoolKinds
    const zemRASDKind& kind;
    PoolRole role;
    const char* name;
};

constexpr int kPoolKinds = 6;

/// The class that has this role for a kind.
PoolClass poolClassAt(int index, PoolRole role);

/// None: it is no class of pools.
std::optional<PoolClass> poolClassNamed(std::string_view name);

/// What the keys of a pool, or of what stands around one, tell.
struct PoolKey {
    std::string host;  ///< its key
    std::string pool;  ///< resource type and PoolID, as "3-Primordial"
    std::string role;  ///< what stands in front of these, as "ORX:DMIN:"; empty for a service

    std::string name() const { return pool + "*" + host; }
    bool isPrimordial() const;
};

/// Takes the keys of @p path apart; none for a path of another class or without such keys, and when
/// the texts have not the form of those of its class. Clients may send any text.
std::optional<PoolKey> poolKeyOf(const CmpiObjectPath& path);

/// The pool of a kind by its PoolID, as PoolKey::pool has it; by default the primordial one.
std::string poolNamed(const zemRASDKind& kind, const std::string& poolId = "Primordial");

class PoolProvider : public zemBaseZemInstanceProvider {
public:
    /// @param name  the class to be served, with "Provider" behind it
    PoolProvider(const CmpiBroker& mb, const CmpiContext& ctx, const char* name);

    using zemBaseZemInstanceProvider::enumInstanceNames;
    using zemBaseZemInstanceProvider::enumInstances;
    using zemBaseZemInstanceProvider::getInstance;

    int getInstance(const CmpiContext& context, const CmpiObjectPath& path, const char** properties,
                    CmpiInstance& out) override;

    /// @param asked  where it is something of a host, and of another class, only that host is read
    void enumInstanceNames(const CmpiContext& context, const CmpiObjectPath& path,
                           zemDynamicArray<CmpiObjectPath>& out,
                           const CmpiObjectPath& asked) override;
    void enumInstances(const CmpiContext& context, const CmpiObjectPath& path,
                       const char** properties, zemDynamicArray<CmpiInstance>& out,
                       const CmpiObjectPath& asked) override;
    CMPIBoolean isValidInstanceClass(const char* className) override;

    /// The same of hosts that have been read for the settings of this kind (readForSettings).
    void addInstanceNames(const CmpiContext& context, zemCECVisitor& hosts,
                          const CmpiObjectPath& path, zemDynamicArray<CmpiObjectPath>& out) const;
    void addInstances(const CmpiContext& context, zemCECVisitor& hosts, const CmpiObjectPath& path,
                      const char** properties, zemDynamicArray<CmpiInstance>& out) const;

protected:
    void populateEssentialKeys(const char* className, CmpiArray& keys) override;

private:
    struct Found;
    using Sink = std::function<void(const Found& found)>;

    /// Hands all of the hosts, or of one, to @p sink, without more than their keys unless @p
    /// isFull.
    void read(const CmpiContext& context, const std::string& host, bool isFull,
              const Sink& sink) const;
    /// The same of hosts of which only hosts have been read, or all that settings need.
    void tell(const CmpiContext& context, zemCECVisitor& hosts, bool haveSettings, bool isFull,
              const Sink& sink) const;
    Sink namesInto(const CmpiObjectPath& path, zemDynamicArray<CmpiObjectPath>& out) const;
    Sink instancesInto(const CmpiObjectPath& path, const char** properties,
                       zemDynamicArray<CmpiInstance>& out) const;
    std::string scopeOf(const CmpiObjectPath& asked) const;
    CmpiObjectPath pathOf(const CmpiObjectPath& near, const Found& found) const;
    CmpiInstance makeInstance(const CmpiObjectPath& near, const char** properties,
                              const Found& found) const;

    const PoolClass m_class;
};

/// The setting data of resources: those of partitions, and behind them those of pools, for which an
/// enumeration of all reads what they have in common once.
class ResourceSettingProvider : public SettingProvider {
public:
    ResourceSettingProvider(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
        : CmpiBaseMI(mb, ctx), SettingProvider(mb, ctx, name), m_ofPools(mb, ctx, name) {}

    int getInstance(const CmpiContext& context, const CmpiObjectPath& path, const char** properties,
                    CmpiInstance& out) override;
    void enumInstanceNames(const CmpiContext& context, const CmpiObjectPath& path,
                           zemDynamicArray<CmpiObjectPath>& out,
                           const CmpiObjectPath& asked) override;
    void enumInstances(const CmpiContext& context, const CmpiObjectPath& path,
                       const char** properties, zemDynamicArray<CmpiInstance>& out,
                       const CmpiObjectPath& asked) override;

private:
    /// Hands what has been read of all hosts for settings to @p take.
    template <class Take>
    void readAll(const CmpiContext& context, Take take) const;

    PoolProvider m_ofPools;
};

#endif

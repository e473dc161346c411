/// ORXC_VirtualSystemSettingData and the six ORXC_...RASettingData: what partitions have now, and
/// what their profiles give them. InstanceIDs tell side, profile, slot, partition and host.
///
/// All are one provider with the table of SettingRows.h: which collections a class is read from,
/// and which property shows which datum of the model. An enumeration reads a collection with one
/// call of the management library, whatever the number of partitions; a get reads those of one
/// partition. What the library's model makes of them, and all rules, stand in
/// VirtualSystemVisitorVSSD.h.
///
/// Thread-safety: constant tables and no state; any number of operations at once.
#ifndef SETTING_PROVIDER_H
#define SETTING_PROVIDER_H

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "BaseZemInstanceProvider.h"
#include "SettingRows.h"

/// A partition, or all of them while both texts are empty.
struct SettingOwner {
    std::string host;       ///< key of its host
    std::string partition;  ///< its ID

    std::string name() const { return partition + "*" + host; }
};

/// What an InstanceID tells.
struct SettingId {
    SettingOwner owner;
    bool isState = false;
    std::string profile;  ///< of the defined side
    std::string system;   ///< InstanceID of the settings of the partition itself
};

/// Takes the InstanceID apart that is the key of @p path; none for a path of another class or
/// without such a key, and when the text has not the form of one of its class. Clients may send
/// any text.
std::optional<SettingId> settingIdOf(const CmpiObjectPath& path);

/// The same for an InstanceID of the class @p row.
std::optional<SettingId> settingIdOf(const SettingClass& row, const std::string& id);

/// The InstanceID that is the key of a path; empty without it.
std::string settingKeyOf(const CmpiObjectPath& path);

/// Makes paths of settings of a class, in the namespace of another path, of which the server is
/// asked once for all of them.
class SettingPaths {
public:
    SettingPaths(const CmpiObjectPath& near, const SettingClass& row);
    CmpiObjectPath operator()(const zemString& id) const;

private:
    const char* m_className;
    zemString m_nameSpace, m_host;
};

/// The partition that an object is, or whose settings it is.
std::optional<SettingOwner> settingOwnerOf(const CmpiObjectPath& path);

/// Reads hosts with their partitions into @p manager, which must outlive the result; null when
/// there is no such host.
/// @throws what zemCECVisitor throws
std::unique_ptr<zemCECVisitor> readPartitions(zemVirtualizationManager& manager,
                                              const CmpiContext& context,
                                              const SettingOwner& whose);

/// The same with profiles and all that the settings of @p classes are made of.
std::unique_ptr<zemCECVisitor> readForSettings(zemVirtualizationManager& manager,
                                               const CmpiContext& context,
                                               const SettingOwner& whose,
                                               const std::vector<const SettingClass*>& classes);

/// Receives the settings of a system with its RASDs; the host lives as long as the call.
using SystemSink = std::function<void(zemCEC& host, std::unique_ptr<zemVSSD> system)>;

/// Hands the settings of all partitions that have been read for them to @p sink, those of a
/// partition's state in front of those of its profiles, with the resources of @p classes, of which
/// there is one at least.
/// @throws what zemVSSDVisitor throws
void makeSettings(zemCECVisitor& hosts, const std::vector<const SettingClass*>& classes,
                  const SystemSink& sink);

/// Reads the settings of @p whose for this, and hands them to @p sink.
/// @throws what zemCECVisitor and zemVSSDVisitor throw
void readSettings(const CmpiContext& context, const SettingOwner& whose,
                  const std::vector<const SettingClass*>& classes, const SystemSink& sink);

class SettingProvider : public zemBaseZemInstanceProvider {
public:
    /// @param name  the class to be served, with "Provider" behind it
    SettingProvider(const CmpiBroker& mb, const CmpiContext& ctx, const char* name);

    using zemBaseZemInstanceProvider::enumInstanceNames;
    using zemBaseZemInstanceProvider::enumInstances;
    using zemBaseZemInstanceProvider::getInstance;

    int getInstance(const CmpiContext& context, const CmpiObjectPath& path, const char** properties,
                    CmpiInstance& out) override;

    /// @param asked  where it is a partition, or settings of another class, only those of that
    ///        partition are read: an association asks for what could belong to it
    void enumInstanceNames(const CmpiContext& context, const CmpiObjectPath& path,
                           zemDynamicArray<CmpiObjectPath>& out,
                           const CmpiObjectPath& asked) override;
    void enumInstances(const CmpiContext& context, const CmpiObjectPath& path,
                       const char** properties, zemDynamicArray<CmpiInstance>& out,
                       const CmpiObjectPath& asked) override;
    CMPIBoolean isValidInstanceClass(const char* className) override;

protected:
    using Sink = std::function<void(const Setting& setting)>;

    void populateEssentialKeys(const char* className, CmpiArray& keys) override;

    /// Whether all settings are asked for, not those that could belong to @p asked.
    bool isAll(const CmpiObjectPath& asked) const;
    const SettingClass& settingClass() const { return m_class; }

    /// What makes of settings that it is handed the paths and the instances of an enumeration,
    /// whose arguments outlive it.
    Sink namesInto(const CmpiObjectPath& path, zemDynamicArray<CmpiObjectPath>& out) const;
    Sink instancesInto(const CmpiObjectPath& path, const char** properties,
                       zemDynamicArray<CmpiInstance>& out) const;

    /// Hands the settings of hosts that have been read for them to @p sink.
    void tell(zemCECVisitor& hosts, const Sink& sink) const;

private:
    /// Hands the settings of @p whose to @p sink, those of a partition's state first.
    void read(const CmpiContext& context, const SettingOwner& whose, const Sink& sink) const;
    SettingOwner scopeOf(const CmpiObjectPath& asked) const;
    CmpiInstance makeInstance(const SettingPaths& paths, const char** properties,
                              const Setting& setting) const;

    const SettingClass& m_class;
};

#endif

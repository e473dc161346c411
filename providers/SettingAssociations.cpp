// What ties the settings of partitions: to the partition whose they are, and those of resources to
// those of the system.
//
// Both sides of each can be long and are served in this process, so all stand on the family that
// compares only objects with one key, and takes no lock. The key is in the InstanceIDs.
#include <map>
#include <memory>
#include <optional>
#include <string>

#include "BaseZemMultiNtoNAssociationProvider.h"
#include "JMPIProviderInterfaceStub.h"
#include "OneAssociation.h"
#include "PropertyRows.h"
#include "ProviderFactories.h"
#include "SettingProvider.h"

namespace {

constexpr char kPartition[] = "ORXC_LPAR_CS";
constexpr char kSystem[] = "ORXC_VirtualSystemSettingData";
constexpr char kSystemProvider[] = "ORXC_VirtualSystemSettingDataProvider";

constexpr char kElementSettingData[] = "ORXC_ElementSettingData";
constexpr char kSettingsDefineState[] = "ORXC_SettingsDefineState";
constexpr char kComponent[] = "ORXC_VSSDComponent";

/// The partitions. Settings name theirs; else the server's provider of partitions is asked.
class Partitions : public zemVirtualSystemProviderStub {
public:
    Partitions(const CmpiBroker& mb, const CmpiContext& ctx)
        : CmpiBaseMI(mb, ctx), zemVirtualSystemProviderStub(mb, ctx) {}

    void enumInstanceNames(const CmpiContext& context, const CmpiObjectPath& path,
                           zemDynamicArray<CmpiObjectPath>& out,
                           const CmpiObjectPath& asked) override {
        if (const std::optional<SettingId> id = settingIdOf(asked)) {
            out.addElement(
                std::make_unique<CmpiObjectPath>(systemPath(path, kPartition, id->owner.name())));
            return;
        }
        zemVirtualSystemProviderStub::enumInstanceNames(context, path, out, asked);
    }
};

/// A partition and its settings of one side.
class SettingsOfPartition : public OneAssociation<zemEnhanceBaseZemMultiNtoNAssociationProvider> {
protected:
    SettingsOfPartition(const CmpiBroker& mb, const CmpiContext& ctx, const char* name,
                        const char* association, bool isState)
        : CmpiBaseMI(mb, ctx),
          OneAssociation(association, mb, ctx, name, OP_ALLOps),
          m_isState(isState),
          m_partitions(mb, ctx),
          m_systems(mb, ctx, kSystemProvider) {
        m_associationDataSet.addNewAssoPair(new zemMultiNtoNAssociationPair(
            {&m_partitions, kPartition, "ManagedElement", ""},
            {&m_systems, kSystem, "SettingData", ""}, association, ""));
    }

    zemString getObjectPathHashKeyString(const CmpiObjectPath& path, bool) override {
        const std::optional<SettingOwner> owner = settingOwnerOf(path);
        return owner ? zemString(owner->name().c_str()) : zemString();
    }

    bool isValidateAssociationPlus(const CmpiContext&, const CmpiObjectPath&,
                                   const CmpiObjectPath& system, void*) override {
        const std::optional<SettingId> id = settingIdOf(system);
        return id && id->isState == m_isState;
    }

private:
    const bool m_isState;
    Partitions m_partitions;
    SettingProvider m_systems;
};

class SettingsDefineState : public SettingsOfPartition {
public:
    SettingsDefineState(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
        : CmpiBaseMI(mb, ctx), SettingsOfPartition(mb, ctx, name, kSettingsDefineState, true) {}
};

/// Which profiles partitions run with, and have by default: read for one operation, when it is
/// first asked for.
class ProfileNames {
public:
    struct Names {
        zemString defaultName, currentName;
    };

    /// @param whose  the partitions that can be asked for
    ProfileNames(const CmpiContext& context, SettingOwner whose)
        : m_context(context), m_whose(std::move(whose)) {}

    const Names& of(const std::string& partition) {
        if (!m_isRead) {
            m_isRead = true;
            readAll();
        }
        return m_names[partition];
    }

private:
    void readAll() {
        zemVirtualizationManager manager;
        const std::unique_ptr<zemCECVisitor> hosts = readPartitions(manager, m_context, m_whose);
        for (int i = 0; hosts != nullptr && i < hosts->size(); ++i) {
            zemDynamicArray<zemLPAR>& lpars = hosts->getData(i)->getLPARs();
            for (int j = 0; j < lpars.size(); ++j) {
                const zemLPAR& lpar = *lpars.getElementAt(j);
                m_names[std::string(lpar.getLparIDAndMTMS())] = {
                    lpar.getDefaultProfileName(),
                    lpar.isActivated() ? lpar.getCurrentProfileName() : zemString()};
            }
        }
    }

    const CmpiContext& m_context;
    const SettingOwner m_whose;
    bool m_isRead = false;
    std::map<std::string, Names> m_names;
};

class ElementSettingData : public SettingsOfPartition {
public:
    ElementSettingData(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
        : CmpiBaseMI(mb, ctx), SettingsOfPartition(mb, ctx, name, kElementSettingData, false) {}

protected:
    void* BeforeGenerateAssociation(const CmpiContext& ctx, const char*,
                                    const CmpiObjectPath& cop) override {
        std::optional<SettingOwner> whose = settingOwnerOf(cop);
        const CmpiData reference = getKeyBinding(cop, "ManagedElement");
        if (!whose && !reference.isNotFound() && !reference.isNullValue()) {
            whose = settingOwnerOf(reference.getObjectPath());
        }
        return new ProfileNames(ctx, whose.value_or(SettingOwner()));
    }

    void AfterGenerateAssociation(const CmpiContext&, const char*, void* names) override {
        delete static_cast<ProfileNames*>(names);
    }

    void addProperties(CmpiInstance& instance, const CmpiObjectPath& partition,
                       const CmpiObjectPath& system, const char** properties, const char* className,
                       void* names) override {
        SettingsOfPartition::addProperties(instance, partition, system, properties, className,
                                           names);
        constexpr CMPIUint16 kIs = 1, kIsNot = 2;  // of the schema
        const auto tell = [&](const char* property, const zemString ProfileNames::Names::*which) {
            if (!containsProperty(properties, property)) {
                return;
            }
            const std::optional<SettingId> id = settingIdOf(system);
            const zemString& name = static_cast<ProfileNames*>(names)->of(id->owner.name()).*which;
            const bool is = zemString::equalsIgnoreCase(name, id->profile.c_str());
            instance.setProperty(property, CmpiData(is ? kIs : kIsNot));
        };
        tell("IsDefault", &ProfileNames::Names::defaultName);
        tell("IsCurrent", &ProfileNames::Names::currentName);
    }
};

/// The settings of a partition, and those of its resources on the same side.
class Component : public OneAssociation<zemEnhanceBaseZemMultiNtoNAssociationProvider> {
public:
    Component(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
        : CmpiBaseMI(mb, ctx),
          OneAssociation(kComponent, mb, ctx, name, OP_ALLOps),
          m_systems(mb, ctx, kSystemProvider) {
        for (const zemRASDKind& kind :
             {zemRASDKinds::processor, zemRASDKinds::memory, zemRASDKinds::ioSlot,
              zemRASDKinds::ethernet, zemRASDKinds::scsi, zemRASDKinds::serial}) {
            const std::string provider = std::string(kind.settingClass) + "Provider";
            m_resources.push_back(std::make_unique<SettingProvider>(mb, ctx, provider.c_str()));
            m_associationDataSet.addNewAssoPair(new zemMultiNtoNAssociationPair(
                {&m_systems, kSystem, "GroupComponent", ""},
                {m_resources.back().get(), kind.settingClass, "PartComponent", ""}, kComponent,
                ""));
        }
    }

protected:
    zemString getObjectPathHashKeyString(const CmpiObjectPath& path, bool) override {
        const std::optional<SettingId> id = settingIdOf(path);
        return id ? zemString(id->system.c_str()) : zemString();
    }

    bool isValidateAssociationPlus(const CmpiContext&, const CmpiObjectPath& system,
                                   const CmpiObjectPath&, void*) override {
        return settingIdOf(system).has_value();
    }

private:
    SettingProvider m_systems;
    std::vector<std::unique_ptr<SettingProvider>> m_resources;
};

}  // namespace

ZEM_PROVIDER(ORXC_ElementSettingDataProvider, ElementSettingData)
ZEM_PROVIDER(ORXC_SettingsDefineStateProvider, SettingsDefineState)
ZEM_PROVIDER(ORXC_VSSDComponentProvider, Component)

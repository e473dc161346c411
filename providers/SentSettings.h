/// What clients hand to the methods of the management service: settings as embedded instances and
/// by reference, which become RASDs of the model.
///
///     for (const Sent& each : sentIn(in, "ResourceSettings", true)) {
///         addResource(each, SettingUse::AddToProfile, path, system);
///     }
///
/// What is changed starts from what is there: PresentSettings has it as clients read it, and as the
/// tools have it. All that a client says can be anything; failures bear the property and its value.
///
/// Thread-safety: functions on their arguments alone.
#ifndef SENT_SETTINGS_H
#define SENT_SETTINGS_H

#include <memory>
#include <string>
#include <vector>

#include "CmpiArgs.h"
#include "SettingProvider.h"

/// The elements of an argument, which is one value or a list; none when it is null.
std::vector<CmpiData> elementsOf(const CmpiArgs& in, const char* name);

/// Settings that a client sends, of which class, and the InstanceID that they bear, if any.
struct Sent {
    CmpiInstance instance;
    const SettingClass& row;
    std::string id;
};

/// The embedded instances of an argument; none if one of them is not of settings: those of a
/// system, or of a resource.
std::vector<Sent> sentIn(const CmpiArgs& in, const char* name, bool isResource);

/// Resources of one system that a client means by their InstanceIDs.
class MeantResources {
public:
    struct One {
        const SettingClass& row;
        std::string id;
        const CmpiInstance* said = nullptr;  ///< null: it names them alone
    };

    /// @return false unless it is of the system of those before, and of @p host
    bool add(const One& one, const std::string& host);

    /// Their classes, each once.
    std::vector<const SettingClass*> classes() const;

    SettingId system;
    std::vector<One> all;
};

/// The settings of a system with resources: as clients read them, and of a profile also with each
/// slot's own tags, as they can be written back. Null: there is no such system.
struct PresentSettings {
    std::unique_ptr<zemVSSD> shown, stored;
};

/// @throws as readSettings(), but for what is not there
PresentSettings readPresent(const CmpiContext& context, const SettingId& id,
                            const std::vector<const SettingClass*>& classes);

/// The RASD of a system with this class and InstanceID, or null: processors and memory share
/// theirs.
zemRASD* resourceOf(zemVSSD& system, const SettingClass& row, const std::string& id);

/// Adds a resource to @p system that is as the client says.
/// @throws as takeSetting()
void addResource(const Sent& sent, SettingUse use, const CmpiObjectPath& near, zemVSSD& system);

/// Makes a resource of @p system what the client says. In another mode of processors or memory
/// nothing stays as it was but what the client says: what a mode needs, the tools know.
/// @param resource  belongs to @p system, in which another may take its place
/// @return as takeSetting()
/// @throws as takeSetting()
bool changeResource(const SentSetting& sent, zemVSSD& system, zemRASD& resource);

#endif

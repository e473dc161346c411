/// The properties of ORXC_VirtualSystemSettingData and of the six ORXC_...RASettingData: how a
/// client sets the datum of the model with an instance that it sends, and which datum each shows,
/// but for those of resources that the library shows itself (zemAddRASDProperties).
///
///     const SettingClass* const row = settingClassNamed("ORXC_MemoryRASettingData");
///     showSetting(instance, *row, properties, {id, system, &rasd.m_Data});   // to a client
///     takeSetting({SettingUse::Add, said, *row, near, shown}, system, &rasd);  // from a client
///
/// Thread-safety: functions on their arguments alone, over constant tables.
#ifndef SETTING_ROWS_H
#define SETTING_ROWS_H

#include <optional>
#include <string>

#include "CmpiInstance.h"
#include "VirtualSystemVisitor.h"

/// One instance: the settings of a partition, or one of their resources.
struct Setting {
    const zemString& id;
    const zemVSSD& system;
    const zemRASDCommData* resource;  ///< null: the system itself
    const zemString key = resource == nullptr ? zemString() : resource->getKey();  ///< its name
};

/// What a client does with the settings that it sends.
enum class SettingUse {
    Define,        ///< makes a partition of them
    AddToProfile,  ///< a resource that is to be there
    AddToState,
    ChangeProfile,  ///< settings that are there
    ChangeState
};

/// Settings that a client sends.
struct SentSetting {
    SettingUse use;
    const CmpiInstance& said;
    const struct SettingClass& row;
    const CmpiObjectPath& near;  ///< in the namespace of the class
    const Setting& shown;        ///< what it reads as now, or would if it were new
};

struct SettingRow;

/// The rows of one table.
struct SettingRows {
    template <std::size_t count>
    constexpr SettingRows(const SettingRow (&table)[count]) : first(table), last(table + count) {}
    constexpr SettingRows() = default;

    const SettingRow* begin() const { return first; }
    const SettingRow* end() const { return last; }

    const SettingRow* first = nullptr;
    const SettingRow* last = nullptr;
};

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

    SettingRows rows, ownRows;
};

/// Null: it is no class of settings.
const SettingClass* settingClassNamed(const char* name);

/// Sets the wanted properties that have a value.
void showSetting(CmpiInstance& instance, const SettingClass& row, const char** properties,
                 const Setting& setting);

/// Gives @p system, or @p resource of its, what the client asks for: each property that it sends,
/// but for those that repeat what is shown, that are at the default of the class, and those of new
/// settings that follow from others.
/// @param resource  null: the system itself
/// @return whether anything is asked for
/// @throws zemInvalidParameterException with the property and its value: it cannot be set, or not
///         so
bool takeSetting(const SentSetting& sent, zemVSSD& system, zemRASDCommData* resource);

/// A resource as it is before a client has said anything of it; the caller owns it.
zemRASD* newResource(const SettingClass& row);

#endif

/// Settings of a partition or profile as small objects that give their value as the tools' text,
/// and records that hold a group of them.
///
///     zemDesiredProcUnitsResource units(150);
///     puts(units.getValue());  // "1.50"
///
/// A setting made without a value holds -1, or the empty text.
///
/// Thread-safety: none; plain values.
#ifndef VIRTUAL_SYSTEM_RESOURCE_SETTINGS_H
#define VIRTUAL_SYSTEM_RESOURCE_SETTINGS_H

#include <cstdint>

#include "StringUtils.h"
#include "VirtualSystemFields.h"
#include "ZemExport.h"

/// The root of all settings. The order of the virtual operations is relied on outside.
class ZEM_EXPORT zemSystemSetting {
public:
    zemSystemSetting() = default;
    zemSystemSetting(const zemSystemSetting&) = default;
    zemSystemSetting& operator=(const zemSystemSetting&) = default;

    /// The value as the tools write it.
    virtual zemString getValue() = 0;

    /// A new object with the same value, which belongs to the caller.
    virtual zemSystemSetting* clone() const = 0;

    virtual ~zemSystemSetting();

    /// The tools' word for a boot mode: "unknown", "norm", "ds", "sms", "of", "dd" for 0 to 5; ""
    /// for other numbers.
    static zemString getBootModeString(int bootMode);

    /// The number of such a word in exactly this case of letters; -1 for others.
    static int convertBootModeToInt(const zemString& bootMode);
};

/// A setting that is a resource.
class ZEM_EXPORT zemVirtualSystemResource : public zemSystemSetting {};

/// The texts that settings make of their values.
struct ZEM_EXPORT zemSettingText {
    static zemString unsignedLong(std::int64_t value);  ///< -1 reads as the greatest number
    static zemString hundredths(std::int64_t value);    ///< two decimals
    static zemString unsignedInt(int value);            ///< -1 reads as the greatest number
    static zemString number(int value);
    static zemString bootMode(int value);
    static zemString procMode(const zemString& value);  ///< "ded" for "255", or "shared"
    static zemString text(const zemString& value) { return value; }
};

/// A setting of the class Self that holds a number, and gives it as TEXT does.
template <class Self, class Number, zemString (*TEXT)(Number)>
class ZEM_EXPORT zemNumberSetting : public zemVirtualSystemResource {
public:
    zemNumberSetting() = default;
    explicit zemNumberSetting(Number value) : m_iValue(value) {}
    zemString getValue() override { return TEXT(m_iValue); }
    zemSystemSetting* clone() const override { return new Self(static_cast<const Self&>(*this)); }

private:
    Number m_iValue = -1;
};

/// The same for a text.
template <class Self, zemString (*TEXT)(const zemString&)>
class ZEM_EXPORT zemTextSetting : public zemVirtualSystemResource {
public:
    zemTextSetting() = default;
    explicit zemTextSetting(const zemString& value) : m_strValue(value) {}
    zemString getValue() override { return TEXT(m_strValue); }
    zemSystemSetting* clone() const override { return new Self(static_cast<const Self&>(*this)); }

private:
    zemString m_strValue;
};

#define ZEM_NUMBER_SETTING(NAME, NUMBER, TEXT)                                            \
    class ZEM_EXPORT NAME : public zemNumberSetting<NAME, NUMBER, zemSettingText::TEXT> { \
    public:                                                                               \
        using zemNumberSetting::zemNumberSetting;                                         \
    }
#define ZEM_TEXT_SETTING(NAME, TEXT)                                            \
    class ZEM_EXPORT NAME : public zemTextSetting<NAME, zemSettingText::TEXT> { \
    public:                                                                     \
        using zemTextSetting::zemTextSetting;                                   \
    }

// How many processors.
ZEM_NUMBER_SETTING(zemMinProcsResource, std::int64_t, unsignedLong);
ZEM_NUMBER_SETTING(zemDesiredProcsResource, std::int64_t, unsignedLong);
ZEM_NUMBER_SETTING(zemMaxProcsResource, std::int64_t, unsignedLong);

// Shares of processors, held in hundredths and given with two decimals.
ZEM_NUMBER_SETTING(zemMinProcUnitsResource, std::int64_t, hundredths);
ZEM_NUMBER_SETTING(zemDesiredProcUnitsResource, std::int64_t, hundredths);
ZEM_NUMBER_SETTING(zemMaxProcUnitsResource, std::int64_t, hundredths);

// Memory in megabytes.
ZEM_NUMBER_SETTING(zemMinMemResource, std::int64_t, unsignedLong);
ZEM_NUMBER_SETTING(zemDesiredMemResource, std::int64_t, unsignedLong);
ZEM_NUMBER_SETTING(zemMaxMemResource, std::int64_t, unsignedLong);

// How processors and memory are shared.
ZEM_NUMBER_SETTING(zemUncapWeightSetting, int, unsignedInt);
ZEM_TEXT_SETTING(zemProcModeSetting, procMode);  ///< holds the library's code
ZEM_TEXT_SETTING(zemSharingModeSetting, text);
ZEM_TEXT_SETTING(zemMemModeSetting, text);
ZEM_TEXT_SETTING(zemProcCompatModeSetting, text);

// How a partition starts and what is watched.
ZEM_NUMBER_SETTING(zemBootModeSetting, int, bootMode);  ///< a number of getBootModeString()
ZEM_NUMBER_SETTING(zemAutoActivateSetting, int, number);
ZEM_NUMBER_SETTING(zemEnableConnectionMonitoringSetting, int, number);
ZEM_NUMBER_SETTING(zemEnableRedundantErrorPathReportingSetting, int, number);
ZEM_NUMBER_SETTING(zemKeyLockSetting, int, number);
ZEM_NUMBER_SETTING(zemMaxVirtualSlotsSetting, int, number);

// What it is.
ZEM_TEXT_SETTING(zemOSTypeSetting, text);
ZEM_TEXT_SETTING(zemProfileNameSetting, text);
ZEM_TEXT_SETTING(zemPartintionNameSetting, text);
ZEM_TEXT_SETTING(zemPartintionIdSetting, text);

#undef ZEM_NUMBER_SETTING
#undef ZEM_TEXT_SETTING

/// A field of a group: the value with its getter, and it as an object of SETTING.
#define ZEM_SETTING_FIELD(TYPE, MEMBER, NAME, SETTING)                 \
public:                                                                \
    zem##SETTING get##SETTING() const { return zem##SETTING(MEMBER); } \
    ZEM_READ_FIELD_OF(TYPE, MEMBER, NAME)

/// Processors by number.
class ZEM_EXPORT zemProcsSettings {
public:
    zemProcsSettings() = default;
    zemProcsSettings(std::int64_t minProcs, std::int64_t desiredProcs, std::int64_t maxProcs,
                     const zemString& procMode, const zemString& procCompatMode);

    ZEM_SETTING_FIELD(std::int64_t, m_iMinProcs, MinProcs, MinProcsResource);
    ZEM_SETTING_FIELD(std::int64_t, m_iDesiredProcs, DesiredProcs, DesiredProcsResource);
    ZEM_SETTING_FIELD(std::int64_t, m_iMaxProcs, MaxProcs, MaxProcsResource);
    ZEM_SETTING_FIELD(zemString, m_strProcMode, ProcMode, ProcModeSetting);
    ZEM_SETTING_FIELD(zemString, m_strProcCompatMode, ProcCompatMode, ProcCompatModeSetting);
};

/// Shares of processors, in hundredths.
class ZEM_EXPORT zemProcUnitsSettings {
public:
    zemProcUnitsSettings() = default;
    zemProcUnitsSettings(std::int64_t minProcUnits, std::int64_t desiredProcUnits,
                         std::int64_t maxProcUnits, const zemString& sharingMode, int uncapWeight);

    ZEM_SETTING_FIELD(std::int64_t, m_iMinProcUnits, MinProcUnits, MinProcUnitsResource);
    ZEM_SETTING_FIELD(std::int64_t, m_iDesiredProcUnits, DesiredProcUnits,
                      DesiredProcUnitsResource);
    ZEM_SETTING_FIELD(std::int64_t, m_iMaxProcUnits, MaxProcUnits, MaxProcUnitsResource);
    ZEM_SETTING_FIELD(zemString, m_strSharingMode, SharingMode, SharingModeSetting);
    ZEM_SETTING_FIELD(int, m_iUncapWeight, UncapWeight, UncapWeightSetting);
};

/// Memory, in megabytes.
class ZEM_EXPORT zemMemorySettings {
public:
    zemMemorySettings() = default;
    zemMemorySettings(std::int64_t minMem, std::int64_t desiredMem, std::int64_t maxMem,
                      const zemString& memMode);

    ZEM_SETTING_FIELD(std::int64_t, m_iMinMem, MinMem, MinMemResource);
    ZEM_SETTING_FIELD(std::int64_t, m_iDesiredMem, DesiredMem, DesiredMemResource);
    ZEM_SETTING_FIELD(std::int64_t, m_iMaxMem, MaxMem, MaxMemResource);
    ZEM_SETTING_FIELD(zemString, m_strMemMode, MemMode, MemModeSetting);
};

/// A partition or profile itself.
class ZEM_EXPORT zemVirtualSystemSettings {
public:
    zemVirtualSystemSettings() = default;
    zemVirtualSystemSettings(int settingType, const zemString& lparName, const zemString& lparId,
                             const zemString& hostName, const zemString& profileName,
                             const zemString& osType, int bootMode, int enableConnectionMonitoring,
                             int autoActivate, int enableRedundantErrorPathReporting, int keyLock,
                             int maxVirtualSlots);

    ZEM_READ_FIELD_OF(int, m_iSettingType, SettingType);  ///< whether a partition or a profile
    ZEM_SETTING_FIELD(zemString, m_strLparName, LparName, PartintionNameSetting);
    ZEM_SETTING_FIELD(zemString, m_strLparId, LparId, PartintionIdSetting);
    ZEM_READ_FIELD_OF(zemString, m_strHostName, HostName);
    ZEM_SETTING_FIELD(zemString, m_strProfileName, ProfileName, ProfileNameSetting);
    ZEM_SETTING_FIELD(zemString, m_strOSType, OSType, OSTypeSetting);
    ZEM_SETTING_FIELD(int, m_iBootMode, BootMode, BootModeSetting);
    ZEM_SETTING_FIELD(int, m_iEnableConnectionMonitoring, EnableConnectionMonitoring,
                      EnableConnectionMonitoringSetting);
    ZEM_SETTING_FIELD(int, m_iAutoActivate, AutoActivate, AutoActivateSetting);
    ZEM_SETTING_FIELD(int, m_iEnableRedundantErrorPathReporting, EnableRedundantErrorPathReporting,
                      EnableRedundantErrorPathReportingSetting);
    ZEM_SETTING_FIELD(int, m_iKeyLock, KeyLock, KeyLockSetting);
    ZEM_SETTING_FIELD(int, m_iMaxVirtualSlots, MaxVirtualSlots, MaxVirtualSlotsSetting);
};

#undef ZEM_SETTING_FIELD

#endif

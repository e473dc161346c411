#include "VirtualSystemResourceSettings.h"

#include <cstdint>
#include <cstdlib>

#include "SystemStateText.h"

namespace {

/// What has number 0 among boot modes; the library's own begin with 1.
constexpr char kNoBootMode[] = "unknown";

constexpr char kDedicated[] = "255";

}  // namespace

zemSystemSetting::~zemSystemSetting() = default;

zemString zemSystemSetting::getBootModeString(int bootMode) {
    return bootMode == 0 ? kNoBootMode : zemBootModeText(bootMode, "");
}

int zemSystemSetting::convertBootModeToInt(const zemString& bootMode) {
    return bootMode == kNoBootMode ? 0 : zemBootModeOf(bootMode);
}

zemString zemSettingText::unsignedLong(std::int64_t value) {
    zemString text;
    text.format("%llu", static_cast<unsigned long long>(value));
    return text;
}

zemString zemSettingText::hundredths(std::int64_t value) {
    // Digit by digit: the decimal point of a printed float is the process locale's.
    constexpr std::int64_t kWhole = 100;
    zemString text;
    text.format("%s%lld.%02lld", value < 0 ? "-" : "",
                static_cast<long long>(std::abs(value / kWhole)),
                static_cast<long long>(std::abs(value % kWhole)));
    return text;
}

zemString zemSettingText::unsignedInt(int value) {
    zemString text;
    text.format("%u", static_cast<unsigned>(value));
    return text;
}

zemString zemSettingText::number(int value) { return zemString(value); }

zemString zemSettingText::bootMode(int value) { return zemSystemSetting::getBootModeString(value); }

zemString zemSettingText::procMode(const zemString& value) {
    return value == kDedicated ? "ded" : "shared";
}

zemProcsSettings::zemProcsSettings(std::int64_t minProcs, std::int64_t desiredProcs,
                                   std::int64_t maxProcs, const zemString& procMode,
                                   const zemString& procCompatMode)
    : m_iMinProcs(minProcs),
      m_iDesiredProcs(desiredProcs),
      m_iMaxProcs(maxProcs),
      m_strProcMode(procMode),
      m_strProcCompatMode(procCompatMode) {}

zemProcUnitsSettings::zemProcUnitsSettings(std::int64_t minProcUnits, std::int64_t desiredProcUnits,
                                           std::int64_t maxProcUnits, const zemString& sharingMode,
                                           int uncapWeight)
    : m_iMinProcUnits(minProcUnits),
      m_iDesiredProcUnits(desiredProcUnits),
      m_iMaxProcUnits(maxProcUnits),
      m_strSharingMode(sharingMode),
      m_iUncapWeight(uncapWeight) {}

zemMemorySettings::zemMemorySettings(std::int64_t minMem, std::int64_t desiredMem,
                                     std::int64_t maxMem, const zemString& memMode)
    : m_iMinMem(minMem), m_iDesiredMem(desiredMem), m_iMaxMem(maxMem), m_strMemMode(memMode) {}

zemVirtualSystemSettings::zemVirtualSystemSettings(
    int settingType, const zemString& lparName, const zemString& lparId, const zemString& hostName,
    const zemString& profileName, const zemString& osType, int bootMode,
    int enableConnectionMonitoring, int autoActivate, int enableRedundantErrorPathReporting,
    int keyLock, int maxVirtualSlots)
    : m_iSettingType(settingType),
      m_strLparName(lparName),
      m_strLparId(lparId),
      m_strHostName(hostName),
      m_strProfileName(profileName),
      m_strOSType(osType),
      m_iBootMode(bootMode),
      m_iEnableConnectionMonitoring(enableConnectionMonitoring),
      m_iAutoActivate(autoActivate),
      m_iEnableRedundantErrorPathReporting(enableRedundantErrorPathReporting),
      m_iKeyLock(keyLock),
      m_iMaxVirtualSlots(maxVirtualSlots) {}

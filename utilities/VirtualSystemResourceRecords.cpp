#include "VirtualSystemResourceRecords.h"

#include <algorithm>
#include <cstdint>
#include <cstdlib>
#include <string>

#include "Exception.h"
#include "NumberText.h"
#include "SystemStateText.h"

namespace {

/// A word of the library and what stands for it.
struct Word {
    const char* told;
    const char* stored;
};

/// How words are translated; what none of them is becomes @p otherwise, or stays if that is null.
struct Words {
    Word words[3];
    const char* otherwise;
};

constexpr Words kModes = {{{"255", "ded"}}, "shared"};
constexpr Words kPools = {{{"255", "null"}}, nullptr};
constexpr Words kRequired = {{{"true", "1"}}, "0"};
constexpr Words kConnections = {{{"null", "unavailable"}, {"0", "none"}, {"1", "active"}},
                                "unknown"};
constexpr Words kNotZero = {{{"0", "0"}}, "1"};
constexpr Words kEntitled = {{{"0", "auto"}}, nullptr};
constexpr Words kParents = {{{"null", "none"}}, nullptr};
constexpr Words kSlotPools = {{{"65535", "none"}, {"null", "none"}}, nullptr};

zemString translated(const Words& words, const zemString& told) {
    for (const Word& word : words.words) {
        if (word.told != nullptr && told == word.told) {
            return word.stored;
        }
    }
    return words.otherwise == nullptr ? told : zemString(words.otherwise);
}

zemString adapterType(const zemString& code) {
    return zemNumberOf(code) == 0 ? "client" : "server";
}

/// A partition or a slot at the other end of a line.
zemString remoteEnd(const zemString& number) {
    constexpr int kAnyNumber = 65535;
    return zemNumberOf(number) == kAnyNumber ? zemString("any") : number;
}

zemString isNotFalse(const zemString& word) {
    return zemString::equalsIgnoreCase(word, "false") ? "0" : "1";
}

/// What stands between the brackets of a list.
zemString withoutBrackets(const zemString& list) {
    const auto begin = static_cast<unsigned>(list.find('[') + 1);
    return list.extractSubstring(begin, static_cast<unsigned>(list.find(']', begin)));
}

/// How the processors of a partition are shared. Dedicated ones are known by two digits, the mode
/// of sharing and that of donating to others; for 255 the latter is not known.
zemString sharingText(const zemString& procMode, const zemString& donorMode,
                      const zemString& sharingMode) {
    static constexpr struct {
        std::int64_t code;
        const char* text;
    } kDedicated[] = {
        {0, "share_idle_procs"},         {1, "share_idle_procs_always"}, {10, "keep_idle_procs"},
        {11, "share_idle_procs_active"}, {255, "share_idle_procs"},      {265, "keep_idle_procs"},
    };
    static constexpr Words kShared = {{{"0", "cap"}, {"1", "uncap"}}, "unknown"};
    if (procMode != "255") {
        return translated(kShared, zemString(zemWholeNumberOf(sharingMode)));
    }
    const std::int64_t code = std::int64_t{zemNumberOf(sharingMode)} * 10 + zemNumberOf(donorMode);
    for (const auto& row : kDedicated) {
        if (row.code == code) {
            return row.text;
        }
    }
    return "unknown";
}

}  // namespace

zemString zemHardwareResource::getCLIUnits(const zemString& units) {
    if (units.isEmpty() || units == "0") {
        return "0.0";
    }
    std::string text(units);
    text.insert(0, std::string(std::max<std::size_t>(text.size(), 3) - text.size(), '0'));
    text.insert(text.size() - 2, ".");
    return text.c_str();
}

zemString zemHardwareResource::getHexValueByDecValue(const zemString& value) {
    constexpr int kBase = 10;
    zemString digits;
    digits.format("%X", static_cast<unsigned>(std::strtol(value, nullptr, kBase)));
    return digits;
}

zemPartitionHardwareResource::zemPartitionHardwareResource(const zemString& lparIdAndMTMS) {
    const int star = lparIdAndMTMS.find('*');
    if (star < 0) {
        throw zemInvalidParameterException(
            "DNX API property \"Name\" with wrong format, it should be the format : "
            "LPARID*MTMS.");
    }
    m_lparid = lparIdAndMTMS.extractSubstring(0, static_cast<unsigned>(star));
    setMTMS(lparIdAndMTMS.extractSubstring(static_cast<unsigned>(star) + 1));
}

zemString zemPartitionHardwareResource::getLparIDAndMTMS() const {
    return m_lparid + "*" + getMTMS();
}

// The fields, and what is stored for the library's value.
#define ZEM_STORES(NAME, TEXT) ZEM_TRANSLATED_SETTER(zemPartitionProcessorResource, NAME, TEXT)
ZEM_STORES(CurrSharedProcPoolId, translated(kPools, value))
ZEM_STORES(CurrProcMode, translated(kModes, value))
ZEM_STORES(CurrMinProcUnits, getCLIUnits(value))
ZEM_STORES(CurrProcUnits, getCLIUnits(value))
ZEM_STORES(CurrMaxProcUnits, getCLIUnits(value))
ZEM_STORES(PendMinProcUnits, getCLIUnits(value))
ZEM_STORES(PendProcUnits, getCLIUnits(value))
ZEM_STORES(PendMaxProcUnits, getCLIUnits(value))
ZEM_STORES(RunProcUnits, getCLIUnits(value))
#undef ZEM_STORES

// The mode that is aimed at is kept as the one in effect, from where the readers of both take it.
void zemPartitionProcessorResource::setPendProcMode(const zemString& value) {
    setCurrProcMode(value);
}

void zemPartitionProcessorResource::setCurrSharingMode(const zemString& procMode,
                                                       const zemString& donorMode,
                                                       const zemString& sharingMode) {
    m_CurrSharingMode = sharingText(procMode, donorMode, sharingMode);
}

void zemPartitionProcessorResource::setPendSharingMode(const zemString& procMode,
                                                       const zemString& donorMode,
                                                       const zemString& sharingMode) {
    m_PendSharingMode = sharingText(procMode, donorMode, sharingMode);
}

ZEM_TRANSLATED_SETTER(zemPartitionMemoryResource, MemMode, translated(kModes, value))

#define ZEM_STORES(NAME, TEXT) ZEM_TRANSLATED_SETTER(zemPartitionIOSlotResource, NAME, TEXT)
ZEM_STORES(PciClass, getHexValueByDecValue(value))
ZEM_STORES(PciDeviceId, getHexValueByDecValue(value))
ZEM_STORES(PciRevisionId, getHexValueByDecValue(value))
ZEM_STORES(PciSubsDeviceId, getHexValueByDecValue(value))
ZEM_STORES(PciSubsVendorId, getHexValueByDecValue(value))
ZEM_STORES(PciVendorId, getHexValueByDecValue(value))
ZEM_STORES(ParentSlotDrcIndex, translated(kParents, value))
ZEM_STORES(Iop, isNotFalse(value))
ZEM_STORES(SlotIoPoolId, translated(kSlotPools, value))
ZEM_STORES(FeatureCodes, withoutBrackets(value))
#undef ZEM_STORES

#define ZEM_STORES(NAME, TEXT) ZEM_TRANSLATED_SETTER(zemPartitionSerialAdapterResource, NAME, TEXT)
ZEM_STORES(IsRequired, translated(kRequired, value))
ZEM_STORES(ConnectStatus, translated(kConnections, value))
ZEM_STORES(AdapterType, adapterType(value))
ZEM_STORES(SupportsDnx, translated(kNotZero, value))
ZEM_STORES(RemoteLparId, remoteEnd(value))
ZEM_STORES(RemoteSlotNum, remoteEnd(value))
#undef ZEM_STORES

#define ZEM_STORES(NAME, TEXT) ZEM_TRANSLATED_SETTER(zemPartitionSCSIAdapterResource, NAME, TEXT)
ZEM_STORES(AdapterType, adapterType(value))
ZEM_STORES(RemoteLparId, remoteEnd(value))
ZEM_STORES(IsRequired, translated(kRequired, value))
#undef ZEM_STORES

ZEM_TRANSLATED_SETTER(zemPartitionEthernetAdapterResource, IsRequired, translated(kRequired, value))

#define ZEM_STORES(NAME, TEXT) ZEM_TRANSLATED_SETTER(zemPartitionProfileConfiguration, NAME, TEXT)
ZEM_STORES(DesiredIoEntitledMem, translated(kEntitled, value))
ZEM_STORES(BootMode, zemBootModeText(zemWholeNumberOf(value)))
ZEM_STORES(ProcMode, translated(kModes, value))
ZEM_STORES(MinProcsUnits, getCLIUnits(value))
ZEM_STORES(DesiredProcsUnits, getCLIUnits(value))
ZEM_STORES(MaxProcsUnits, getCLIUnits(value))
ZEM_STORES(LparProcCompatMode, zemCompatModeText(zemWholeNumberOf(value)))
ZEM_STORES(MemMode, translated(kModes, value))
#undef ZEM_STORES

void zemPartitionProfileConfiguration::setSharingMode(const zemString& procMode,
                                                      const zemString& donorMode,
                                                      const zemString& sharingMode) {
    m_SharingMode = sharingText(procMode, donorMode, sharingMode);
}

void zemPartitionProfileConfiguration::setDefaultValue() {
    for (zemString* const field : {&m_ProfileName,
                                   &m_LparName,
                                   &m_LparEnv,
                                   &m_LoadSourceSlot,
                                   &m_AltRestartDeviceSlot,
                                   &m_ConsoleSlot,
                                   &m_AltConsoleSlot,
                                   &m_OpConsoleSlot,
                                   &m_AutoStart,
                                   &m_ConnMonitoring,
                                   &m_DesiredIoEntitledMem,
                                   &m_MemWeight,
                                   &m_RedundantErrPathReporting,
                                   &m_UncapWeight,
                                   &m_BootMode,
                                   &m_MaxVirtualSlots,
                                   &m_ProcMode,
                                   &m_SharingMode,
                                   &m_MinProcs,
                                   &m_DesiredProcs,
                                   &m_MaxProcs,
                                   &m_MinProcsUnits,
                                   &m_DesiredProcsUnits,
                                   &m_MaxProcsUnits,
                                   &m_SharedProcPoolID,
                                   &m_LparProcCompatMode,
                                   &m_MemMode,
                                   &m_MinMem,
                                   &m_DesiredMem,
                                   &m_MaxMem,
                                   &m_VirtualSerialAdapters,
                                   &m_VirtualScsiAdapters,
                                   &m_VirtualEthAdapters,
                                   &m_IoSlots}) {
        *field = "zemNULL";
    }
}

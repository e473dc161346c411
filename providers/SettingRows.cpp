#include "SettingRows.h"

#include <strings.h>

#include <algorithm>
#include <cctype>
#include <cerrno>
#include <cstdlib>
#include <functional>
#include <limits>
#include <map>
#include <type_traits>

#include "BaseProvider.h"
#include "PropertyRows.h"
#include "ResourcePoolManager.h"

/// What is set by a client's value.
struct SettingTarget {
    SettingUse use;
    zemVSSD& system;
    zemRASDCommData* resource;
};

/// One property, and the datum that it shows and sets.
struct SettingRow {
    /// When a client can set it.
    enum When : unsigned {
        Never = 0,
        Defining = 1 << static_cast<unsigned>(SettingUse::Define),
        AddingToProfile = 1 << static_cast<unsigned>(SettingUse::AddToProfile),
        AddingToState = 1 << static_cast<unsigned>(SettingUse::AddToState),
        ChangingProfile = 1 << static_cast<unsigned>(SettingUse::ChangeProfile),
        ChangingState = 1 << static_cast<unsigned>(SettingUse::ChangeState),
        Follows = 1U << 31U  ///< from others: whatever new settings say of it is no matter
    };

    const char* property;
    /// False: null. None where the library shows the property.
    bool (*read)(const Setting& setting, CmpiData& value);
    bool (*write)(const CmpiData& value, const SettingTarget& target);  ///< false: unfit value
    unsigned when = Never;
};

namespace {

using Row = SettingRow;

// How a datum becomes a value, and a value a datum. A datum is a getter of the system with its
// setter, or a field of the resource. Empty texts and numbers beyond the property's type, as -1,
// are null.

void setDatum(void (zemVSSD::*setter)(const zemString&), const SettingTarget& target,
              const zemString& value) {
    (target.system.*setter)(value);
}
void setDatum(void (zemVSSD::*setter)(int), const SettingTarget& target, std::int64_t value) {
    (target.system.*setter)(static_cast<int>(value));
}
template <class Owner, class Datum, class Value>
std::enable_if_t<!std::is_function_v<Datum>> setDatum(Datum Owner::*field,
                                                      const SettingTarget& target,
                                                      const Value& value) {
    static_cast<Owner&>(*target.resource).*field = static_cast<Datum>(value);
}

template <class Number>
bool isOf(std::int64_t value) {
    return value >= 0 && (sizeof(Number) == sizeof value ||
                          value <= static_cast<std::int64_t>(std::numeric_limits<Number>::max()));
}

/// The value refers to @p text, which the model keeps.
bool setText(const zemString& text, CmpiData& value) {
    value = CmpiData(static_cast<const char*>(text));
    return !text.isEmpty();
}
bool setText(const zemString&& text, CmpiData& value) = delete;

std::optional<zemString> textIn(const CmpiData& value) {
    if (value.getType() == CMPI_string) {
        return zemString(value.getString().charPtr());
    }
    return value.getType() == CMPI_chars ? std::optional(zemString(value.getCString()))
                                         : std::nullopt;
}

/// A number of any width: clients and servers choose it.
template <class Number>
std::optional<std::int64_t> numberIn(const CmpiData& value) {
    const auto type = static_cast<unsigned>(value.getType());
    if ((type & CMPI_UINT) == 0 || (type & CMPI_ARRAY) != 0) {
        return std::nullopt;
    }
    errno = 0;
    const long long number = std::strtoll(zemBaseProvider::cmpidata2String(value), nullptr, 10);
    return errno == 0 && isOf<Number>(number) ? std::optional<std::int64_t>(number) : std::nullopt;
}

/// Sets a datum to what @p in finds in the value.
template <auto datum, auto in>
bool take(const CmpiData& value, const SettingTarget& target) {
    const auto found = in(value);
    if (found) {
        setDatum(datum, target, *found);
    }
    return found.has_value();
}

template <auto datum, auto in>
constexpr auto taker() -> bool (*)(const CmpiData& value, const SettingTarget& target) {
    if constexpr (std::is_null_pointer_v<decltype(datum)>) {
        return nullptr;
    } else {
        return take<datum, in>;
    }
}

/// A name or an index, which stands in a list of a tool as it is.
std::optional<zemString> wordIn(const CmpiData& value) {
    const std::optional<zemString> text = textIn(value);
    const std::string word(text.value_or(""));
    const bool isWord =
        std::all_of(word.begin(), word.end(), [](unsigned char c) { return std::isalnum(c) != 0; });
    return isWord ? text : std::nullopt;
}

std::optional<int> flagIn(const CmpiData& value) {
    return value.getType() == CMPI_boolean ? std::optional<int>(value.getBoolean() ? 1 : 0)
                                           : std::nullopt;
}

std::optional<zemArray<int>> numbersIn(const CmpiData& value) {
    if ((static_cast<unsigned>(value.getType()) & CMPI_ARRAY) == 0) {
        return std::nullopt;
    }
    zemArray<int> numbers;
    const CmpiArray list = value.getArray();
    for (CMPICount i = 0; i < list.size(); ++i) {
        const auto number = numberIn<CMPIUint16>(list[i].getData());
        if (!number) {
            return std::nullopt;
        }
        numbers.append(static_cast<int>(*number));
    }
    return numbers;
}

template <auto datum, auto set>
constexpr Row text(const char* property, unsigned when) {
    return {property,
            [](const Setting& setting, CmpiData& value) {
                return setText(std::invoke(datum, setting.system), value);
            },
            taker<set, textIn>(), when};
}

template <class Number, auto datum, auto set>
constexpr Row number(const char* property, unsigned when) {
    return {property,
            [](const Setting& setting, CmpiData& value) {
                const std::int64_t told = std::invoke(datum, setting.system);
                value = CmpiData(static_cast<Number>(told));
                return isOf<Number>(told);
            },
            taker<set, numberIn<Number>>(), when};
}

template <auto datum, auto set>
constexpr Row flag(const char* property, unsigned when) {
    return {property,
            [](const Setting& setting, CmpiData& value) {
                const int told = std::invoke(datum, setting.system);
                value.setBoolean(static_cast<CMPIBoolean>(told > 0));
                return told >= 0;
            },
            taker<set, flagIn>(), when};
}

bool showName(const Setting& setting, CmpiData& value) {
    const zemVSSD& system = setting.system;
    return setText(system.isState() ? system.getLparName() : system.getProfileName(), value);
}

/// The partition's name, but of a profile that of the profile.
bool takeName(const CmpiData& value, const SettingTarget& target) {
    return target.use == SettingUse::ChangeProfile
               ? take<&zemVSSD::setProfileName, textIn>(value, target)
               : take<&zemVSSD::setLparName, textIn>(value, target);
}

bool showPartitionNumber(const Setting& setting, CmpiData& value) {
    const std::int64_t told = std::strtol(setting.system.getLparID(), nullptr, 10);
    value = CmpiData(static_cast<CMPIUint16>(told));
    return told > 0 && isOf<CMPIUint16>(told);
}

constexpr CMPIUint16 kNoStart = 2, kAlwaysStart = 4;  // of the schema

bool showStartupAction(const Setting& setting, CmpiData& value) {
    value = CmpiData(setting.system.getAutoActivate() ? kAlwaysStart : kNoStart);
    return true;
}

bool takeStartupAction(const CmpiData& value, const SettingTarget& target) {
    const auto action = numberIn<CMPIUint16>(value);
    target.system.setAutoActivate(action == kAlwaysStart ? 1 : 0);
    return action == kAlwaysStart || action == kNoStart;
}

using System = zemVSSD;
constexpr unsigned kStored = Row::Defining | Row::ChangingProfile;

constexpr Row kSystemRows[] = {
    {"ElementName", showName, takeName, kStored | Row::ChangingState},
    text<&System::getVirtualSystemID, nullptr>("VirtualSystemIdentifier", Row::Never),
    text<&System::getVirtualSystemType, &System::setVirtualSystemType>("VirtualSystemType",
                                                                       Row::Defining),
    {"AutomaticStartupAction", showStartupAction, takeStartupAction, kStored},
    {"LparID", showPartitionNumber, nullptr, Row::Never},
    text<&System::getLparName, &System::setLparName>("LparName",
                                                     Row::Defining | Row::ChangingState),
    text<&System::getMTMS, nullptr>("HostName", Row::Never),
    text<&System::getProfileName, &System::setProfileName>("ProfileName", kStored),
    text<&System::getDefaultProfileName, &System::setDefaultProfileName>(
        "DefaultProfileName", Row::ChangingState | Row::Follows),
    flag<&System::getIsDefault, nullptr>("IsDefault", Row::Follows),
    text<&System::getBootMode, &System::setBootMode>("BootMode", kStored),
    text<&System::getKeylock, &System::setKeylock>("Keylock", Row::ChangingState),
    number<CMPIUint16, &System::getMaxVirtualSlots, &System::setMaxVirtualSlots>("MaxVirtualSlots",
                                                                                 kStored),
    flag<&System::getEnableConnectionMonitoring, &System::setEnableConnectionMonitoring>(
        "EnableConnectionMonitoring", kStored),
    flag<&System::getEnableRedundantErrorPathReporting,
         &System::setEnableRedundantErrorPathReporting>("EnableRedundantErrorPathReporting",
                                                        kStored),
};

using Resource = zemRASDCommData;

/// Units in which the tools count processors that a partition sees, and memory.
constexpr int kWholeProcessor = 100, kMegabyte = 1024;

/// What only processors and memory have in any amount, and from any pool.
template <auto datum, auto in>
bool takeAmount(const CmpiData& value, const SettingTarget& target) {
    const int type = target.resource->m_ResourceType;
    return (type == zemRASDKinds::processor.resourceType ||
            type == zemRASDKinds::memory.resourceType) &&
           take<datum, in>(value, target);
}

/// A quantity of memory or processors: what the tools cannot take is refused, for it would read
/// otherwise than it was written.
/// @tparam unit  of processors
template <auto datum, int unit = 1>
bool takeQuantity(const CmpiData& value, const SettingTarget& target) {
    const bool isMemory = target.resource->m_ResourceType == zemRASDKinds::memory.resourceType;
    const std::int64_t size = numberIn<CMPIUint64>(value).value_or(0);
    return size % (isMemory ? kMegabyte : unit) == 0 &&
           takeAmount<datum, numberIn<CMPIUint64>>(value, target);
}

bool showKey(const Setting& setting, CmpiData& value) { return setText(setting.key, value); }

bool showType(const Setting& setting, CmpiData& value) {
    value = CmpiData(static_cast<CMPIUint16>(setting.resource->m_ResourceType));
    return isOf<CMPIUint16>(setting.resource->m_ResourceType);
}

bool showUnits(const Setting& setting, CmpiData& value) {
    return setText(setting.resource->m_AllocationUnits, value);
}

constexpr unsigned kNew = Row::Defining | Row::AddingToProfile | Row::AddingToState;
constexpr unsigned kOfProfile = Row::Defining | Row::AddingToProfile | Row::ChangingProfile;
constexpr unsigned kWhole = kNew | Row::ChangingProfile;
constexpr unsigned kAnywhere = kWhole | Row::ChangingState;

using Data = zemRASDCommData;
constexpr Row kResourceRows[] = {
    {"ElementName", showKey, nullptr, Row::Follows},
    {"ResourceType", showType, nullptr, Row::Never},
    {"PoolID", nullptr, takeAmount<&Data::m_PoolID, textIn>, kWhole},
    {"ConsumerVisibility", nullptr, takeAmount<&Data::m_ConsumerVisibility, numberIn<CMPIUint16>>,
     kWhole},
    {"MappingBehavior", nullptr, nullptr, Row::Follows},
    {"IsVirtualized", nullptr, nullptr, Row::Follows},
    {"AllocationUnits", showUnits, nullptr, Row::Never},
    {"VirtualQuantityUnits", showUnits, nullptr, Row::Never},
    {"VirtualMinimum", nullptr, takeQuantity<&Data::m_VirtualMinimum, kWholeProcessor>, kWhole},
    {"VirtualQuantity", nullptr, takeQuantity<&Data::m_VirtualQuantity, kWholeProcessor>,
     kAnywhere},
    {"VirtualMaximum", nullptr, takeQuantity<&Data::m_VirtualMaximum, kWholeProcessor>, kWhole},
    {"Minimum", nullptr, takeQuantity<&Data::m_Minimum>, kWhole},
    {"Reservation", nullptr, takeQuantity<&Data::m_Reservation>, kAnywhere},
    {"Limit", nullptr, takeQuantity<&Data::m_Limit>, kWhole},
    {"Weight", nullptr, takeAmount<&Data::m_Weight, numberIn<CMPIUint32>>, kAnywhere},
    {"Address", nullptr, nullptr, Row::Never},
    {"AutomaticAllocation", nullptr, nullptr, Row::Follows},
    {"AutomaticDeallocation", nullptr, nullptr, Row::Follows},
    {"IsRequired", nullptr, take<&Data::m_IsRequired, numberIn<CMPIUint8>>, kOfProfile},
};

constexpr Row kProcessorRows[] = {
    {"SharingMode", nullptr, take<&Data::m_SharingMode, textIn>, kAnywhere},
    {"ProcCompatMode", nullptr,
     take<&zemProcessorRASD::zemProcessorRASDData::m_ProcCompatMode, textIn>, kWhole},
};

using Slot = zemIOSlotRASD::zemIOSlotRASDData;
constexpr Row kSlotRows[] = {
    {"DRCIndex", nullptr, take<&Slot::m_DRCIndex, wordIn>, kNew},
    {"TaggedIOType", nullptr, take<&Slot::m_TaggedIOType, numbersIn>, kOfProfile},
};

using Ethernet = zemVETHRASD::zemVETHRASDData;
constexpr Row kEthernetRows[] = {
    {"SlotID", nullptr, take<&Ethernet::m_SlotID, numberIn<CMPIUint16>>, kNew},
    {"IEEECompatible", nullptr, take<&Ethernet::m_IEEECompatible, numberIn<CMPIUint8>>, kWhole},
    {"PortVLANID", nullptr, take<&Ethernet::m_PortVLANID, numberIn<CMPIUint16>>, kWhole},
    {"AddVLANIDs", nullptr, take<&Ethernet::m_AddVLANIDs, numbersIn>, kWhole},
    {"TrunkPriority", nullptr, take<&Ethernet::m_TrunkPriority, numberIn<CMPIUint8>>, kWhole},
    {"VSwitch", nullptr, take<&Ethernet::m_vswitch, textIn>, kWhole},
};

using Remote = zemRemoteAdapterRASDData;
constexpr Row kRemoteRows[] = {
    {"SlotID", nullptr, take<&Remote::m_SlotID, numberIn<CMPIUint16>>, kNew},
    {"VirtualAdapterType", nullptr, take<&Remote::m_VirtualAdapterType, numberIn<CMPIUint8>>,
     kWhole},
    {"RemoteClientFlag", nullptr, nullptr, Row::Follows},
    {"RemoteClientSlotFlag", nullptr, nullptr, Row::Follows},
    {"RemoteVirtualSystemID", nullptr, take<&Remote::m_RemoteVirtualSystemID, wordIn>, kWhole},
    {"RemoteSlotID", nullptr, take<&Remote::m_RemoteSlotID, numberIn<CMPIUint16>>, kWhole},
};

using Hosts = zemCECVisitor;
using Kinds = zemRASDKinds;

// clang-format off
constexpr SettingClass kClasses[] = {
    {"ORXC_VirtualSystemSettingData", 0, VISITOR_TYPE_VSSD, false, nullptr, nullptr, kSystemRows, {}},
    {Kinds::processor.settingClass, Kinds::processor.resourceType, VISITOR_TYPE_RASD_PROC, false,
     &Hosts::initializeProcessorLevelSys, &Hosts::initializeProcessorLevelLpar, kResourceRows, kProcessorRows},
    {Kinds::memory.settingClass, Kinds::memory.resourceType, VISITOR_TYPE_RASD_MEM, false,
     &Hosts::initializeMemoryLevelSys, &Hosts::initializeMemoryLevelLpar, kResourceRows, {}},
    {Kinds::ioSlot.settingClass, Kinds::ioSlot.resourceType, VISITOR_TYPE_RASD_IOSLOT, true,
     nullptr, &Hosts::initializeIOSlotLevelLpar, kResourceRows, kSlotRows},
    {Kinds::ethernet.settingClass, Kinds::ethernet.resourceType, VISITOR_TYPE_RASD_VETH, true,
     nullptr, &Hosts::initializeEthernetAdapterLevelLpar, kResourceRows, kEthernetRows},
    {Kinds::scsi.settingClass, Kinds::scsi.resourceType, VISITOR_TYPE_RASD_VSCSI, true,
     nullptr, &Hosts::initializeSCSIAdapterLevelLpar, kResourceRows, kRemoteRows},
    {Kinds::serial.settingClass, Kinds::serial.resourceType, VISITOR_TYPE_RASD_VSERIAL, true,
     nullptr, &Hosts::initializeSerialAdapterLevelLpar, kResourceRows, kRemoteRows},
};
// clang-format on

struct IgnoringCase {
    bool operator()(const std::string& a, const std::string& b) const {
        return strcasecmp(a.c_str(), b.c_str()) < 0;
    }
};
using Said = std::map<std::string, CmpiData, IgnoringCase>;

std::string textOf(const CmpiData& value) {
    return std::string(zemBaseProvider::cmpidata2String(value));
}

[[noreturn]] void refuse(const SettingClass& row, const std::string& property,
                         const CmpiData& value) {
    const std::string text = std::string("The property ") + property + " of class " + row.name +
                             " cannot be set to " + textOf(value) + " here.";
    throw zemInvalidParameterException("SettingRows", "takeSetting", text.c_str());
}

/// The properties that have a value and are not at the default of their class.
Said valuesOf(const CmpiInstance& instance, const SentSetting& sent) {
    const auto asked = askedFor(instance, sent.near, sent.row.name, nullptr);
    return Said(asked.begin(), asked.end());
}

/// What a client reads now.
Said shownTo(const SentSetting& sent) {
    CmpiInstance shown(zemBaseProvider::createObjectPath(sent.near, sent.row.name));
    showSetting(shown, sent.row, nullptr, sent.shown);
    return valuesOf(shown, sent);
}

/// Takes one property, which says something new.
/// @return whether it asks for anything
bool takeProperty(const SentSetting& sent, const SettingTarget& target, const Row& row,
                  const CmpiData& value) {
    const bool isNew = sent.use < SettingUse::ChangeProfile;
    if (isNew && (row.when & Row::Follows) != 0) {
        return false;
    }
    const bool isSet = (row.when & 1U << static_cast<unsigned>(sent.use)) != 0;
    if (!isSet || row.write == nullptr || !row.write(value, target)) {
        refuse(sent.row, row.property, value);
    }
    return true;
}

}  // namespace

const SettingClass* settingClassNamed(const char* name) {
    for (const SettingClass& row : kClasses) {
        if (strcasecmp(row.name, name) == 0) {
            return &row;
        }
    }
    return nullptr;
}

void showSetting(CmpiInstance& instance, const SettingClass& row, const char** properties,
                 const Setting& setting) {
    for (const SettingRows& rows : {row.rows, row.ownRows}) {
        for (const Row& each : rows) {
            CmpiData value;
            if (each.read != nullptr &&
                zemBaseProvider::containsProperty(properties, each.property) &&
                each.read(setting, value)) {
                instance.setProperty(each.property, value);
            }
        }
    }
    if (setting.resource != nullptr) {
        zemAddRASDProperties(instance, properties, *setting.resource);
    }
}

bool takeSetting(const SentSetting& sent, zemVSSD& system, zemRASDCommData* resource) {
    Said said = valuesOf(sent.said, sent);
    said.erase("InstanceID");  // says which settings these are, and nothing of new ones
    for (const auto& [property, value] : shownTo(sent)) {
        const auto found = said.find(property);
        if (found != said.end() && textOf(found->second) == textOf(value)) {
            said.erase(found);
        }
    }
    const SettingTarget target = {sent.use, system, resource};
    bool isAsked = false;
    for (const SettingRows& rows : {sent.row.rows, sent.row.ownRows}) {
        for (const Row& row : rows) {
            if (const auto found = said.find(row.property); found != said.end()) {
                isAsked |= takeProperty(sent, target, row, found->second);
                said.erase(found);
            }
        }
    }
    if (!said.empty()) {
        refuse(sent.row, said.begin()->first, said.begin()->second);
    }
    return isAsked;
}

zemRASD* newResource(const SettingClass& row) {
    zemRASD* const resource = zemVSSD::createRASD(row.resourceType, "");
    zemRASDCommData& data = *resource->getData();
    if (row.hasSlot) {
        constexpr int kPassedThrough = 2, kVirtualized = 3;
        data.m_ConsumerVisibility =
            row.resourceType == Kinds::ioSlot.resourceType ? kPassedThrough : kVirtualized;
        data.m_PoolID = "0";
        data.m_VirtualMinimum = data.m_VirtualQuantity = data.m_VirtualMaximum = 1;
        data.m_IsRequired = 0;
    }
    if (auto* const ethernet = dynamic_cast<zemVETHRASD*>(resource)) {
        ethernet->m_Data.m_IEEECompatible = 0;
    }
    return resource;
}

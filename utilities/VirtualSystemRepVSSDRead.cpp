// How a VSSD fills itself: from a profile, and its setting data from lists of slots and adapters.

#include <algorithm>
#include <cstddef>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <unordered_map>

#include "DNXApiCaller.h"
#include "Exception.h"
#include "NumberText.h"
#include "QyallocCmdCaller.h"
#include "QyplatCmdCaller.h"
#include "SystemConfig.h"
#include "VirtualSystemInstanceId.h"
#include "VirtualSystemRepSystem.h"
#include "VirtualSystemRepVSSD.h"
#include "VirtualSystemVisitorAttributes.h"

namespace {

/// An attribute's value; empty when the record has none.
zemString valueOf(const zemRecordType& record, int attribute) {
    zemString value;
    record.lookup(attribute, value);
    return value;
}

zemString stringOf(std::string_view text) {
    return zemString(text.data(), static_cast<unsigned>(text.size()));
}

/// Whether @p text begins with a running serial or SCSI adapter.
bool isRunningAdapter(std::string_view text) {
    const std::size_t slash = text.find_first_not_of("0123456789");
    if (slash == 0 || slash == std::string_view::npos) {
        return false;
    }
    const std::string_view type = text.substr(slash, std::string_view("/server/").size());
    return type == "/server/" || type == "/client/";
}

/// Hands @p visit each element of @p list that has more than one field: its first field, and the
/// element. Elements end at commas. One that holds commas itself begins with a quote and ends with
/// one; or with an empty field, as running adapters do that their profile does not know.
/// @param holdsNames  the elements are running adapters with names of partitions, commas and all,
///        in front of the last fields
template <class Visit>
void walkList(std::string_view list, bool holdsNames, Visit visit) {
    while (!list.empty()) {
        const bool quoted = list.front() == '"';
        list.remove_prefix(quoted ? 1 : 0);
        std::size_t comma = list.find(',');
        while (quoted && comma != std::string_view::npos &&
               (comma == 0 || (list[comma - 1] != '"' && list[comma - 1] != '/'))) {
            comma = list.find(',', comma + 1);
        }
        while (holdsNames && comma != std::string_view::npos && comma + 1 < list.size() &&
               !isRunningAdapter(list.substr(comma + 1))) {
            comma = list.find(',', comma + 1);
        }
        std::string_view element = list.substr(0, comma);
        if (quoted && !element.empty() && element.back() == '"') {
            element.remove_suffix(1);
        }
        const std::size_t slash = element.find('/');
        if (slash != std::string_view::npos) {
            visit(element.substr(0, slash), element);
        }
        list.remove_prefix(comma == std::string_view::npos ? list.size() : comma + 1);
    }
}

constexpr char kNoAdapters[] = "none,";

/// The adapters that @p query finds for a partition, each as its @p fields and a comma.
template <class Query, std::size_t N>
zemString adaptersOf(Query query, const int (&fields)[N], const zemString& userName,
                     const zemString& mtms, const zemString& lparId) try {
    int wanted[N];
    std::copy(fields, fields + N, wanted);
    const zemString filter =
        zemCommandCaller::quoted(zemCommandCaller::filterItem("lpar_ids", lparId));
    zemQyallocCmdCaller caller(userName, nullptr);
    const zemRecordSetsType records = (caller.*query)(wanted, mtms, filter);
    std::string list;
    for (int i = 0; i < records.size(); ++i) {
        for (std::size_t field = 0; field + 1 < N; ++field) {
            list += field == 0 ? "" : "/";
            list += valueOf(*records[i], fields[field]);
        }
        list += ',';
    }
    return list.empty() ? kNoAdapters : list.c_str();
} catch (const zemException&) {
    return kNoAdapters;
}

/// What a profile tells of its Ethernet adapters that the management library does not: by all
/// fields up to the virtual switch, what stands behind; null when the element ends there.
using StoredSwitches = std::unordered_map<std::string_view, std::optional<std::string_view>>;

StoredSwitches storedSwitches(std::string_view list) {
    StoredSwitches switches;
    walkList(list, false, [&](std::string_view, std::string_view element) {
        constexpr int kFields = 6;
        std::size_t end = 0;
        for (int field = 0; field < kFields && end != std::string_view::npos; ++field) {
            end = element.find('/', field == 0 ? 0 : end + 1);
        }
        if (end == std::string_view::npos) {
            switches.emplace(element, std::nullopt);
        } else {
            switches.emplace(element.substr(0, end), element.substr(end + 1));
        }
    });
    return switches;
}

/// One running Ethernet adapter as an element of a list, completed by what is stored of it.
std::string ethernetElement(apiProp& object, const StoredSwitches& stored) {
    const zemApiProp adapter(&object);
    const auto text = [&](const char* key) {
        return std::string(static_cast<const char*>(adapter.getProperty(key)));
    };
    const zemString vlans =
        adapter.getProperty("addl_vlan_ids").stripLeading('[').stripLeading(']');
    const std::string fields = text("slot_num") + '/' + text("ieee_virtual_eth") + '/' +
                               text("port_vlan_id") + '/' + static_cast<const char*>(vlans) + '/' +
                               text("trunk_priority") + '/' +
                               (text("is_required") == "true" ? '1' : '0');
    const char* const quote = vlans.find(',') >= 0 ? "\"" : "";
    const auto found = stored.find(fields);
    if (found == stored.end()) {
        return quote + fields + '/';
    }
    if (!found->second) {
        return fields + "//" + text("mac_addr") + quote;  // it opens without the quote: kept
    }
    return quote + fields + '/' + std::string(*found->second) + '/' + text("mac_addr") + quote;
}

template <const zemRASDKind& kind, zemSettingSide side>
std::unique_ptr<zemResourceRASettingData> make() {
    return std::make_unique<zemRASettingDataOnSide<kind, side>>();
}

/// Where the setting data of one class come from.
struct SettingClass {
    const zemRASDKind& kind;
    bool ofActivated;  ///< on the state side there are none unless the partition is activated
    const zemString& (zemVSSD::*stored)() const;  ///< null: a partition has one of the resource
    zemString (zemVSSD::*live)(const zemString&, const zemString&, const zemString&) const;
    std::unique_ptr<zemResourceRASettingData> (*make[2])();  ///< by zemSettingSide
};

template <const zemRASDKind& kind>
constexpr SettingClass settingClass(bool ofActivated, decltype(SettingClass::stored) stored,
                                    decltype(SettingClass::live) live) {
    return {kind, ofActivated, stored, live, {make<kind, SIDE_DEFINED>, make<kind, SIDE_STATE>}};
}

// clang-format off
constexpr SettingClass kSettingClasses[] = {
    settingClass<zemRASDKinds::processor>(true,  nullptr, nullptr),
    settingClass<zemRASDKinds::memory>   (true,  nullptr, nullptr),
    settingClass<zemRASDKinds::ioSlot>   (true,  &zemVSSD::getIOSlotInfo,          nullptr),
    settingClass<zemRASDKinds::serial>   (false, &zemVSSD::getSerialAdapterInfo,   &zemVSSD::getSerialAdapterInfo),
    settingClass<zemRASDKinds::scsi>     (false, &zemVSSD::getSCSIAdapterInfo,     &zemVSSD::getSCSIAdapterInfo),
    settingClass<zemRASDKinds::ethernet> (false, &zemVSSD::getEthernetAdapterInfo, &zemVSSD::getEthernetAdapterInfo),
};
// clang-format on

const SettingClass* settingClassOf(const zemString& className) {
    for (const SettingClass& row : kSettingClasses) {
        if (zemString::equalsIgnoreCase(className, row.kind.settingClass)) {
            return &row;
        }
    }
    return nullptr;
}

}  // namespace

void zemVSSD::takeFromPartition(zemLPAR* lpar) {
    m_defaultProfileName = lpar->getDefaultProfileName();
    m_isDefault = zemString::equalsIgnoreCase(m_profileName, m_defaultProfileName) ? 1 : 0;
    m_virtualSystemIdentifier = lpar->getLparIDAndMTMS();
    m_keylock = lpar->getKeyLock();
    m_virtualSystemType = lpar->getVirtualSystemType();
}

int zemVSSD::initialize(zemLPAR* lpar, const zemRecordType& record) {
    using Profile = zemQyplatCmdCaller::PartitionProfileAttribute;
    static constexpr struct {
        zemString zemVSSD::*field;
        int attribute;
    } kTexts[] = {
        {&zemVSSD::m_lparName, Profile::ATTR_LPAR_NAME},
        {&zemVSSD::m_profileName, Profile::ATTR_NAME},
        {&zemVSSD::m_bootMode, Profile::ATTR_BOOT_MODE},
        {&zemVSSD::m_IOSlotsInfo, Profile::ATTR_IO_SLOTS},
        {&zemVSSD::m_virtualSerialAdaptersInfo, Profile::ATTR_VIRTUAL_SERIAL_ADAPTERS},
        {&zemVSSD::m_virtualSCSIAdaptersInfo, Profile::ATTR_VIRTUAL_SCSI_ADAPTERS},
        {&zemVSSD::m_virtualEthetnetAdaptersInfo, Profile::ATTR_VIRTUAL_ETH_ADAPTERS},
    };
    static constexpr struct {
        int zemVSSD::*field;
        int attribute;
    } kNumbers[] = {
        {&zemVSSD::m_autoActivate, Profile::ATTR_AUTO_START},
        {&zemVSSD::m_enableConnectionMonitoring, Profile::ATTR_CONN_MONITORING},
        {&zemVSSD::m_maxVirtualSlots, Profile::ATTR_MAX_VIRTUAL_SLOTS},
        {&zemVSSD::m_enableRedundantErrorPathReporting, Profile::ATTR_REDUNDANT_ERR_PATH_REPORTING},
    };
    for (const auto& text : kTexts) {
        this->*text.field = valueOf(record, text.attribute);
    }
    for (const auto& number : kNumbers) {
        this->*number.field = zemNumberOf(valueOf(record, number.attribute));
    }
    takeFromPartition(lpar);
    return 0;
}

int zemVSSD::initialize(zemLPAR* lpar, zemVirtualSystemProfile& profile) {
    // The first question reads the profile, its name too.
    const int bootMode = profile.getBootMode();
    m_bootMode = zemSystemSetting::getBootModeString(bootMode);
    m_autoActivate = profile.getAutoStart() ? 1 : 0;
    m_enableConnectionMonitoring = profile.getConnMonitoring() ? 1 : 0;
    m_maxVirtualSlots = profile.getMaxVirtualSlots();
    m_enableRedundantErrorPathReporting = getEnableRedundantErrorPathReporting() ? 1 : 0;
    m_profileName = profile.getName();
    m_IOSlotsInfo = profile.getIOSlotAdapterString();
    m_virtualSerialAdaptersInfo = profile.getVirtualSerialAdapterString();
    m_virtualSCSIAdaptersInfo = profile.getVirtualSCSIAdapterString();
    m_virtualEthetnetAdaptersInfo = profile.getVirtualEthernetAdapterString();
    m_lparName = lpar->getLparName();
    takeFromPartition(lpar);
    return 0;
}

zemString zemVSSD::getSerialAdapterInfo(const zemString& userName, const zemString& mtms,
                                        const zemString& lparId) const {
    return adaptersOf(&zemQyallocCmdCaller::getPartitionVirtualSerialResources, zemSerialFields,
                      userName, mtms, lparId);
}

zemString zemVSSD::getSCSIAdapterInfo(const zemString& userName, const zemString& mtms,
                                      const zemString& lparId) const {
    return adaptersOf(&zemQyallocCmdCaller::getPartitionVirtualSCSIResources, zemScsiFields,
                      userName, mtms, lparId);
}

zemString zemVSSD::getEthernetAdapterInfo(const zemString& userName, const zemString& mtms,
                                          const zemString& lparId) const try {
    static constexpr zemApiReader kReader = {"zemVSSD", "getLparVirtualEthernet",
                                             "getLparVirtualEthernet"};
    const zemApiObjects adapters(
        kReader, zemApiCaller().getLparVirtualEthernet(userName, lparId + "*" + mtms,
                                                       zemConfigObject::OP_LEVEL_2));
    const StoredSwitches stored =
        storedSwitches(static_cast<const char*>(m_virtualEthetnetAdaptersInfo));
    std::string running;
    for (apiProp& adapter : adapters) {
        running += ethernetElement(adapter, stored) + ',';
    }
    return running.empty() ? kNoAdapters : running.c_str();
} catch (const zemObjectNotFoundException&) {
    return "";  // there is no such partition, which has not even no adapters
} catch (const zemException&) {
    return kNoAdapters;
}

int zemVSSD::initializeState(const zemString& userName, const zemString& profileName, zemCEC* cec,
                             zemLPAR* lpar, const zemString& className, int type) {
    return initializeSide(SIDE_STATE, userName, profileName, cec, lpar, className, type);
}

int zemVSSD::initializeDefined(const zemString& userName, const zemString& profileName, zemCEC* cec,
                               zemLPAR* lpar, const zemString& className, int type) {
    return initializeSide(SIDE_DEFINED, userName, profileName, cec, lpar, className, type);
}

int zemVSSD::initializeSide(zemSettingSide side, const zemString& userName,
                            const zemString& profileName, zemCEC* cec, zemLPAR* lpar,
                            const zemString& className, int type) {
    const SettingClass* const wanted = settingClassOf(className);
    if (side == SIDE_STATE && wanted != nullptr && wanted->ofActivated && !lpar->isActivated()) {
        return -1;
    }
    const zemString mtms = cec->getMTMS();
    const zemString lparID = lpar->getLparID();
    m_InstanceID = zemFormInstanceId({side, profileName, lparID, mtms});
    m_profileName = profileName;
    if (wanted == nullptr || type == VISITOR_TYPE_VSSD_INIT || type == VISITOR_TYPE_VSSD_INIT_NI) {
        return 0;
    }
    const auto add = [&](const zemString& id, const zemString& info) {
        std::unique_ptr<zemResourceRASettingData> data = wanted->make[side]();
        if (data->initialize(userName, lpar, cec, profileName, id, info, type) != -1) {
            m_RASDSet.addElement(std::move(data));
        }
    };
    if (wanted->stored == nullptr) {
        add("none", "none");
        return 0;
    }
    const bool asks = side == SIDE_STATE && wanted->live != nullptr;
    zemString list =
        asks ? (this->*wanted->live)(userName, mtms, lparID) : (this->*wanted->stored)();
    walkList(static_cast<const char*>(list),
             asks && wanted->kind.resourceType != zemRASDKinds::ethernet.resourceType,
             [&](std::string_view id, std::string_view element) {
                 add(stringOf(id), stringOf(element));
             });
    return 0;
}

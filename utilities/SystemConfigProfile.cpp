#include <algorithm>
#include <iterator>
#include <memory>
#include <string>
#include <string_view>

#include "DNXApiCaller.h"
#include "EdplatCmdCaller.h"
#include "QyplatCmdCaller.h"
#include "RecordParser.h"
#include "SystemConfig.h"
#include "SystemConfigSupport.h"

namespace {

constexpr char kClass[] = "zemVirtualSystemProfile";

using Profile = zemQyplatCmdCaller::PartitionProfileAttribute;

bool isNone(const zemString& text) { return zemString::equalsIgnoreCase(text, "none"); }

/// A number, of which -1 says that there is none.
int quantityOf(const zemString& text) {
    return text.isEmpty() || zemString::equalsIgnoreCase(text, "null") ? -1 : zemNumberOf(text);
}

}  // namespace

zemVirtualSystemProfile::zemVirtualSystemProfile(apiProp& prop,
                                                 const zemVirtualSystem& virtualSystem,
                                                 const char* requestUserContext, const char* locale)
    : m_virtualSystem(virtualSystem), m_requestUserContext(requestUserContext), m_locale(locale) {
    parseApiProp(prop);
}

zemVirtualSystemProfile::zemVirtualSystemProfile(const zemString& profileName,
                                                 const zemVirtualSystem& virtualSystem,
                                                 const char* requestUserContext, const char* locale)
    : m_profileName(profileName),
      m_virtualSystem(virtualSystem),
      m_requestUserContext(requestUserContext),
      m_locale(locale) {}

zemVirtualSystemProfile::~zemVirtualSystemProfile() = default;

void zemVirtualSystemProfile::updateData(OP_LEVEL level) {
    const int depth = level == OP_LEVEL_ALL ? OP_LEVEL_2 : level;
    const zemApiReader reader = {kClass, "updateData", "getLparProfile"};
    const zemApiObjects profiles(
        reader,
        zemApiCaller().getLparProfile(m_requestUserContext, m_virtualSystem.getLparIDAndMTMS(),
                                      m_profileName, depth));
    parseApiProp(profiles.only(m_profileName));
}

void zemVirtualSystemProfile::parseApiProp(apiProp& prop) {
    using Self = zemVirtualSystemProfile;
    static constexpr struct {
        const char* key;
        zemString Self::*field;
        bool isList;
    } kTexts[] = {
        {"virtual_serial_adapters", &Self::m_virtualSerialAdapters, true},
        {"virtual_scsi_adapters", &Self::m_virtualScsiAdapters, true},
        {"virtual_eth_adapters", &Self::m_virtualEthAdapters, true},
        {"io_slots", &Self::m_ioSlots, true},
        {"ProcMode", &Self::m_procMode, false},
        {"SharingMode", &Self::m_sharingMode, false},
    };
    static constexpr struct {
        const char* key;
        int Self::*field;
    } kQuantities[] = {
        {"MinProcUnit", &Self::m_minProcUnits},     {"DesiredProcUnit", &Self::m_desiredProcUnits},
        {"MaxProcUnit", &Self::m_maxProcUnits},     {"MinimumCPUCount", &Self::m_minProcs},
        {"DesiredCPUCount", &Self::m_desiredProcs}, {"MaximumCPUCount", &Self::m_maxProcs},
        {"MinimumMemory", &Self::m_minMem},         {"DesiredMemory", &Self::m_desiredMem},
        {"MaximumMemory", &Self::m_maxMem},         {"UncappedWeight", &Self::m_uncapWeight},
    };
    const zemApiProp profile(&prop);
    m_profileName = profile.getProperty("UserDefinedName");
    m_connMonitoring = zemNumberOf(profile.getProperty("SFPSurveillance")) == 1;
    m_gotLevel1 = true;
    if (zemApiProp::getProperty(&prop, "BootMode") == nullptr) {
        return;
    }
    m_gotLevel2 = true;
    m_bootMode = zemNumberOf(profile.getProperty("BootMode"));
    for (const auto& row : kTexts) {
        const zemString text = profile.getProperty(row.key);
        this->*row.field = row.isList && isNone(text) ? zemString() : text;
    }
    for (const auto& row : kQuantities) {
        this->*row.field = quantityOf(profile.getProperty(row.key));
    }
    m_autoStart = zemNumberOf(profile.getProperty("AutoIPLEnabled")) == 1;
}

void zemVirtualSystemProfile::needLevel1() {
    if (!m_gotLevel1) {
        updateData(OP_LEVEL_1);
    }
}

void zemVirtualSystemProfile::needLevel2() {
    if (!m_gotLevel2) {
        updateData(OP_LEVEL_2);
    }
}

bool zemVirtualSystemProfile::getConnMonitoring() {
    needLevel1();
    return m_connMonitoring;
}

/// A getter of what level 2 tells.
#define ZEM_PROFILE_GETTER(TYPE, NAME, FIELD) \
    TYPE zemVirtualSystemProfile::NAME() { return level2(&zemVirtualSystemProfile::FIELD); }

ZEM_PROFILE_GETTER(bool, getAutoStart, m_autoStart)
ZEM_PROFILE_GETTER(int, getBootMode, m_bootMode)
ZEM_PROFILE_GETTER(zemString, getProcMode, m_procMode)
ZEM_PROFILE_GETTER(zemString, getSharingMode, m_sharingMode)
ZEM_PROFILE_GETTER(int, getMinProcUnits, m_minProcUnits)
ZEM_PROFILE_GETTER(int, getDesiredProcUnits, m_desiredProcUnits)
ZEM_PROFILE_GETTER(int, getMaxProcUnits, m_maxProcUnits)
ZEM_PROFILE_GETTER(int, getMinProcs, m_minProcs)
ZEM_PROFILE_GETTER(int, getDesiredProcs, m_desiredProcs)
ZEM_PROFILE_GETTER(int, getMaxProcs, m_maxProcs)
ZEM_PROFILE_GETTER(int, getMinMem, m_minMem)
ZEM_PROFILE_GETTER(int, getDesiredMem, m_desiredMem)
ZEM_PROFILE_GETTER(int, getMaxMem, m_maxMem)
ZEM_PROFILE_GETTER(int, getUncapWeight, m_uncapWeight)
ZEM_PROFILE_GETTER(zemString, getVirtualSerialAdapterString, m_virtualSerialAdapters)
ZEM_PROFILE_GETTER(zemString, getVirtualSCSIAdapterString, m_virtualScsiAdapters)
ZEM_PROFILE_GETTER(zemString, getVirtualEthernetAdapterString, m_virtualEthAdapters)
ZEM_PROFILE_GETTER(zemString, getIOSlotAdapterString, m_ioSlots)

zemDynamicArray<zemString> zemVirtualSystemProfile::getVirtualIOResources(IOResourceType rscType) {
    static constexpr zemString zemVirtualSystemProfile::*kLists[] = {
        &zemVirtualSystemProfile::m_virtualScsiAdapters,
        &zemVirtualSystemProfile::m_virtualSerialAdapters,
        &zemVirtualSystemProfile::m_virtualEthAdapters, &zemVirtualSystemProfile::m_ioSlots};
    const auto row = static_cast<std::size_t>(rscType);
    const zemString list = row < std::size(kLists) ? level2(kLists[row]) : zemString();
    zemDynamicArray<zemString> elements;
    if (list.isEmpty() || isNone(list)) {
        return elements;
    }
    // A doubled quote opens and closes as two: what matters here is being inside or not.
    const std::string_view text(list);
    bool quoted = false;
    const auto parts = std::count_if(text.begin(), text.end(), [&quoted](char c) {
        quoted ^= c == '"';
        return c == ',' && !quoted;
    });
    zemRecordSetsType records(0, 1, 1);
    if (!zemParseRecords(text, nullptr, static_cast<unsigned>(parts) + 1, records)) {
        throw zemOperationFailedException(kClass, "getVirtualIOResources", "INVALID_RECORD", list);
    }
    for (int i = 0; i <= parts; ++i) {
        elements.addElement(std::make_unique<zemString>((*records.getElementAt(0))[i]));
    }
    return elements;
}

zemRecordSetsType zemVirtualSystemProfile::getAttributeValues(int* attributeIndex) {
    return zemWithNotFound(kUnknownToQueries, kClass, "getAttributeValues", [&] {
        const zemString items =
            zemCommandCaller::filterItem("lpar_ids", m_virtualSystem.getLparID()) + "," +
            zemCommandCaller::filterItem("profile_names", m_profileName);
        return zemQyplatCmdCaller(m_requestUserContext, m_locale)
            .getPartitionsProfileInformation(attributeIndex, m_virtualSystem.getMTMS(),
                                             zemCommandCaller::quoted(items));
    });
}

zemString zemVirtualSystemProfile::getAttributeValue(int attributeIndex) {
    zemExpectAttribute(attributeIndex, kClass, "getAttributeValue");
    int wanted[] = {attributeIndex, Profile::ATTR_END};
    const zemRecordSetsType records = getAttributeValues(wanted);
    if (records.size() == 0) {
        throw zemObjectNotFoundException(kClass, "getAttributeValue", m_profileName);
    }
    return (*records.getElementAt(0))[attributeIndex];
}

int zemVirtualSystemProfile::change(const zemDynamicArray<tagAttributePair>& attrPairs,
                                    zemCommandCaller::CH_OP_TYPE operation) {
    // Profiles share the names of this failure with partitions; clients know it so.
    return zemWithNotFound(kUnknownToChanges, "zemVirtualSystem", "setVirtualSystemName", [&] {
        return zemEdplatCmdCaller(m_requestUserContext, m_locale)
            .changePartitionsProfileInformation(m_profileName, attrPairs,
                                                m_virtualSystem.getLparID(),
                                                m_virtualSystem.getMTMS(), operation);
    });
}

int zemVirtualSystemProfile::setName(const zemString& newName) {
    zemDynamicArray<tagAttributePair> pairs;
    pairs.addElement(std::make_unique<tagAttributePair>(
        zemEdplatCmdCaller::PartitionProfileAttribute::ATTR_NEW_NAME,
        zemCommandCaller::itemValue(newName)));
    const int rc = change(pairs, zemCommandCaller::CH_OP_MODIFY);
    m_profileName = newName;
    return rc;
}

int zemVirtualSystemProfile::setAttributeValues(
    const zemDynamicArray<tagAttributePair>& attrPairs) {
    return change(attrPairs, zemCommandCaller::CH_OP_MODIFY);
}

int zemVirtualSystemProfile::modifyVirtualSystemResources(
    const zemDynamicArray<tagAttributePair>& attrPairs) {
    return change(attrPairs, zemCommandCaller::CH_OP_MODIFY);
}

int zemVirtualSystemProfile::addVirtualIOResources(
    const zemDynamicArray<tagAttributePair>& attrPairs) {
    return change(attrPairs, zemCommandCaller::CH_OP_ADD);
}

int zemVirtualSystemProfile::removeVirtualIOResources(
    const zemDynamicArray<tagAttributePair>& attrPairs) {
    return change(attrPairs, zemCommandCaller::CH_OP_REMOVE);
}

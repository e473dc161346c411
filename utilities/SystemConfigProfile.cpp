#include <iterator>
#include <memory>
#include <string>
#include <string_view>

#include "EdplatCmdCaller.h"
#include "QyplatCmdCaller.h"
#include "RecordParser.h"
#include "SystemConfig.h"
#include "SystemConfigSupport.h"

namespace {

constexpr char kVirtualSystemProfile[] = "zemVirtualSystemProfile";

using Profile = zemQyplatCmdCaller::PartitionProfileAttribute;

bool isNone(const zemString& text) { return zemString::equalsIgnoreCase(text, "none"); }

/// A list, of which the library's "none" is the empty one.
template <auto field>
void setList(zemVirtualSystemProfile& profile, const zemString& value) {
    profile.*field = isNone(value) ? zemString() : value;
}

/// A number, of which -1 says that there is none.
template <auto field>
void setQuantity(zemVirtualSystemProfile& profile, const zemString& value) {
    const bool isGiven = !value.isEmpty() && !zemString::equalsIgnoreCase(value, "null");
    profile.*field = isGiven ? zemNumberOf(value) : -1;
}

}  // namespace

zemVirtualSystemProfile::zemVirtualSystemProfile(apiProp& prop,
                                                 const zemVirtualSystem& virtualSystem,
                                                 const char* requestUserContext, const char* locale)
    : zemConfigObject(requestUserContext, locale), m_virtualSystem(virtualSystem) {
    parseApiProp(prop);
}

zemVirtualSystemProfile::zemVirtualSystemProfile(const zemString& profileName,
                                                 const zemVirtualSystem& virtualSystem,
                                                 const char* requestUserContext, const char* locale)
    : zemConfigObject(requestUserContext, locale),
      m_profileName(profileName),
      m_virtualSystem(virtualSystem) {}

zemVirtualSystemProfile::~zemVirtualSystemProfile() = default;

void zemVirtualSystemProfile::updateData(OP_LEVEL level) {
    const zemApiReader reader = {kVirtualSystemProfile, "updateData", "getLparProfile"};
    const zemApiObjects profiles(
        reader,
        zemApiCaller().getLparProfile(m_requestUserContext, m_virtualSystem.getLparIDAndMTMS(),
                                      m_profileName, detailOf(level)));
    parseApiProp(profiles.only(m_profileName));
}

void zemVirtualSystemProfile::parseApiProp(apiProp& prop) {
    using Self = zemVirtualSystemProfile;
    static constexpr zemConfigField<Self> kLevel1[] = {
        {"UserDefinedName", zemSetText<&Self::m_profileName>},
        {"SFPSurveillance", zemSetFlag<&Self::m_connMonitoring>},
    };
    static constexpr zemConfigField<Self> kLevel2[] = {
        {"BootMode", zemSetNumber<&Self::m_bootMode>},
        {"virtual_serial_adapters", setList<&Self::m_virtualSerialAdapters>},
        {"virtual_scsi_adapters", setList<&Self::m_virtualScsiAdapters>},
        {"virtual_eth_adapters", setList<&Self::m_virtualEthAdapters>},
        {"io_slots", setList<&Self::m_ioSlots>},
        {"ProcMode", zemSetText<&Self::m_procMode>},
        {"SharingMode", zemSetText<&Self::m_sharingMode>},
        {"MinProcUnit", setQuantity<&Self::m_minProcUnits>},
        {"DesiredProcUnit", setQuantity<&Self::m_desiredProcUnits>},
        {"MaxProcUnit", setQuantity<&Self::m_maxProcUnits>},
        {"MinimumCPUCount", setQuantity<&Self::m_minProcs>},
        {"DesiredCPUCount", setQuantity<&Self::m_desiredProcs>},
        {"MaximumCPUCount", setQuantity<&Self::m_maxProcs>},
        {"MinimumMemory", setQuantity<&Self::m_minMem>},
        {"DesiredMemory", setQuantity<&Self::m_desiredMem>},
        {"MaximumMemory", setQuantity<&Self::m_maxMem>},
        {"UncappedWeight", setQuantity<&Self::m_uncapWeight>},
        {"AutoIPLEnabled", zemSetFlag<&Self::m_autoStart>},
        {"MaxVirtualSlots", setQuantity<&Self::m_maxVirtualSlots>},
    };
    m_gotLevel1 = true;
    zemReadApiFields(&prop, *this, kLevel1);
    if (zemApiProp::getProperty(&prop, "BootMode") != nullptr) {
        m_gotLevel2 = true;
        zemReadApiFields(&prop, *this, kLevel2);
    }
}

ZEM_CONFIG_GETTER(zemVirtualSystemProfile, bool, getConnMonitoring, 1, m_connMonitoring)
ZEM_CONFIG_GETTER(zemVirtualSystemProfile, bool, getAutoStart, 2, m_autoStart)
ZEM_CONFIG_GETTER(zemVirtualSystemProfile, int, getBootMode, 2, m_bootMode)
ZEM_CONFIG_GETTER(zemVirtualSystemProfile, zemString, getProcMode, 2, m_procMode)
ZEM_CONFIG_GETTER(zemVirtualSystemProfile, zemString, getSharingMode, 2, m_sharingMode)
ZEM_CONFIG_GETTER(zemVirtualSystemProfile, int, getMinProcUnits, 2, m_minProcUnits)
ZEM_CONFIG_GETTER(zemVirtualSystemProfile, int, getDesiredProcUnits, 2, m_desiredProcUnits)
ZEM_CONFIG_GETTER(zemVirtualSystemProfile, int, getMaxProcUnits, 2, m_maxProcUnits)
ZEM_CONFIG_GETTER(zemVirtualSystemProfile, int, getMinProcs, 2, m_minProcs)
ZEM_CONFIG_GETTER(zemVirtualSystemProfile, int, getDesiredProcs, 2, m_desiredProcs)
ZEM_CONFIG_GETTER(zemVirtualSystemProfile, int, getMaxProcs, 2, m_maxProcs)
ZEM_CONFIG_GETTER(zemVirtualSystemProfile, int, getMinMem, 2, m_minMem)
ZEM_CONFIG_GETTER(zemVirtualSystemProfile, int, getDesiredMem, 2, m_desiredMem)
ZEM_CONFIG_GETTER(zemVirtualSystemProfile, int, getMaxMem, 2, m_maxMem)
ZEM_CONFIG_GETTER(zemVirtualSystemProfile, int, getUncapWeight, 2, m_uncapWeight)
ZEM_CONFIG_GETTER(zemVirtualSystemProfile, int, getMaxVirtualSlots, 2, m_maxVirtualSlots)
ZEM_CONFIG_GETTER(zemVirtualSystemProfile, zemString, getVirtualSerialAdapterString, 2,
                  m_virtualSerialAdapters)
ZEM_CONFIG_GETTER(zemVirtualSystemProfile, zemString, getVirtualSCSIAdapterString, 2,
                  m_virtualScsiAdapters)
ZEM_CONFIG_GETTER(zemVirtualSystemProfile, zemString, getVirtualEthernetAdapterString, 2,
                  m_virtualEthAdapters)
ZEM_CONFIG_GETTER(zemVirtualSystemProfile, zemString, getIOSlotAdapterString, 2, m_ioSlots)

zemDynamicArray<zemString> zemVirtualSystemProfile::getVirtualIOResources(IOResourceType rscType) {
    using Self = zemVirtualSystemProfile;
    static constexpr zemString Self::*kLists[] = {&Self::m_virtualScsiAdapters,
                                                  &Self::m_virtualSerialAdapters,
                                                  &Self::m_virtualEthAdapters, &Self::m_ioSlots};
    zemDynamicArray<zemString> elements;
    const auto row = static_cast<std::size_t>(rscType);
    if (row >= std::size(kLists)) {
        return elements;
    }
    need(OP_LEVEL_2);
    const zemString& list = this->*kLists[row];
    if (!list.isEmpty() && !zemParseFields(std::string_view(list), elements)) {
        throw zemOperationFailedException(kVirtualSystemProfile, "getVirtualIOResources",
                                          "INVALID_RECORD", list);
    }
    return elements;
}

zemRecordSetsType zemVirtualSystemProfile::getAttributeValues(int* attributeIndex) {
    return zemWithNotFound(kUnknownToQueries, kVirtualSystemProfile, "getAttributeValues", [&] {
        const zemString items =
            zemCommandCaller::filterItem("lpar_ids", m_virtualSystem.getLparID()) + "," +
            zemCommandCaller::filterItem("profile_names", m_profileName);
        return zemQyplatCmdCaller(m_requestUserContext, m_locale)
            .getPartitionsProfileInformation(attributeIndex, m_virtualSystem.getMTMS(),
                                             zemCommandCaller::quoted(items));
    });
}

zemString zemVirtualSystemProfile::getAttributeValue(int attributeIndex) {
    zemExpectAttribute(attributeIndex, kVirtualSystemProfile, "getAttributeValue");
    int wanted[] = {attributeIndex, Profile::ATTR_END};
    const zemRecordSetsType records = getAttributeValues(wanted);
    if (records.size() == 0) {
        throw zemObjectNotFoundException(kVirtualSystemProfile, "getAttributeValue", m_profileName);
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

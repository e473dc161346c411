#include "VirtualSystemRepVSSD.h"

#include <memory>

#include "Exception.h"
#include "VirtualSystemInstanceId.h"

namespace {

template <class Rasd>
zemRASD* make(const zemString& key) {
    return new Rasd(key);
}

struct RasdMaker {
    const zemRASDKind& kind;
    zemRASD* (*make)(const zemString& key);
};

constexpr RasdMaker kMakers[] = {
    {zemRASDKinds::processor, make<zemProcessorRASD>}, {zemRASDKinds::memory, make<zemMemoryRASD>},
    {zemRASDKinds::scsi, make<zemVSCSIRASD>},          {zemRASDKinds::ethernet, make<zemVETHRASD>},
    {zemRASDKinds::ioSlot, make<zemIOSlotRASD>},       {zemRASDKinds::serial, make<zemVSERIALRASD>},
};

}  // namespace

zemVSSD::zemVSSD(const zemString& mtms, const zemString& lparID, const zemString& profileName)
    : m_MTMS(mtms), m_lparID(lparID), m_profileName(profileName) {}

zemVSSD::zemVSSD(const zemString& mtms, const zemString& id) {
    AnalyzeInstanceID(mtms, id);
    m_InstanceID = id;
    m_MTMS = mtms;
}

zemVSSD::zemVSSD(const zemString& lparID, const zemString& mtms, const zemString& virtualSystemType,
                 int autoActivate, const zemString& lparName, const zemString& profileName,
                 const zemString& bootMode, int enableConnectionMonitoring, int isDefault,
                 int maxVirtualSlots, int enableRedundantErrorPathReporting,
                 const zemString& keylock, const zemString& defaultProfileName)
    : m_MTMS(mtms),
      m_virtualSystemType(virtualSystemType),
      m_autoActivate(autoActivate),
      m_virtualSystemIdentifier(lparID + "*" + mtms),
      m_lparID(lparID),
      m_lparName(lparName),
      m_profileName(profileName),
      m_bootMode(bootMode),
      m_enableConnectionMonitoring(enableConnectionMonitoring),
      m_isDefault(isDefault),
      m_maxVirtualSlots(maxVirtualSlots),
      m_enableRedundantErrorPathReporting(enableRedundantErrorPathReporting),
      m_keylock(keylock),
      m_defaultProfileName(defaultProfileName) {}

zemVSSD::zemVSSD(zemLPAR* lpar, const zemRecordType& record) { initialize(lpar, record); }

zemVSSD::zemVSSD(zemLPAR* lpar, zemVirtualSystemProfile& profile) { initialize(lpar, profile); }

bool zemVSSD::isState() const { return zemIsInstanceIdOf(SIDE_STATE, m_InstanceID); }

const zemString& zemVSSD::GenerateInstanceID(bool isState) {
    m_InstanceID =
        zemFormInstanceId({isState ? SIDE_STATE : SIDE_DEFINED, m_profileName, m_lparID, m_MTMS});
    return m_InstanceID;
}

void zemVSSD::AnalyzeInstanceID(const zemString& mtms, const zemString& id) {
    if (!zemInstanceIdEndsWith(id, mtms)) {
        throw zemInvalidParameterException(
            "zemVSSD", "AnalyzeInstanceID",
            "MTMS in the input ResourceAllocationSettingData.InstanceID is not matched to the MTMS "
            "of which the hosted CEC.");
    }
    zemSplitInstanceId(id, mtms, m_profileName, m_lparID);
}

int zemVSSD::indexOf(const zemString& key) const {
    for (int i = 0; i < m_RASDs.size(); ++i) {
        if (zemString::equalsIgnoreCase(m_RASDs[i]->getKey(), key)) {
            return i;
        }
    }
    return -1;
}

zemRASD* zemVSSD::getRASD(const zemString& key) const { return m_RASDs.getElementAt(indexOf(key)); }

zemDynamicArray<zemRASD> zemVSSD::getRASD(int resourceType) const {
    constexpr int kGrow = 25;
    zemDynamicArray<zemRASD> found(0, kGrow, 0);
    for (int i = 0; i < m_RASDs.size(); ++i) {
        if (m_RASDs[i]->getData()->m_ResourceType == resourceType) {
            found.addElement(m_RASDs[i]);
        }
    }
    return found;
}

bool zemVSSD::removeRASD(const zemString& key) {
    return m_RASDs.removeElementAt(indexOf(key)) == 0;
}

int zemVSSD::addRASD(zemRASD* rasd) { return m_RASDs.addElement(std::unique_ptr<zemRASD>(rasd)); }

zemRASD* zemVSSD::createRASD(int resourceType, const zemString& key) {
    for (const RasdMaker& maker : kMakers) {
        if (maker.kind.resourceType == resourceType) {
            return maker.make(key);
        }
    }
    return nullptr;
}

zemRASD* zemVSSD::addRASD(int resourceType, const zemString& key) {
    zemRASD* rasd = createRASD(resourceType, key);
    if (rasd != nullptr) {
        addRASD(rasd);
    }
    return rasd;
}

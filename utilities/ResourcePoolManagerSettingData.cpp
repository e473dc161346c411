#include "ResourcePoolManagerSettingData.h"

#include "BaseProvider.h"
#include "CmpiData.h"
#include "CmpiInstance.h"
#include "NumberText.h"
#include "ResourcePoolManager.h"
#include "VirtualSystemInstanceId.h"
#include "VirtualSystemRepSystem.h"

namespace {

/// Writes the instance ID of the resource @p id of @p owner.
/// @return false when @p id does not name one of this kind
bool formId(const zemRASDKind& kind, const zemInstanceIdOwner& owner, const zemString& id,
            zemString& instanceID) {
    switch (kind.resourceType) {
        case zemRASDKinds::processor.resourceType:
        case zemRASDKinds::memory.resourceType:
            instanceID = zemFormInstanceId(owner);
            return true;
        case zemRASDKinds::ioSlot.resourceType:
            instanceID = zemFormInstanceId(owner, id);
            return !id.isEmpty();
        default:
            instanceID = zemFormInstanceId(owner, zemNumberOf(id));
            return id.isDigit();
    }
}

}  // namespace

zemResourcePool::~zemResourcePool() = default;

zemResourceRASettingDataCommData::~zemResourceRASettingDataCommData() = default;

zemResourceRASettingData::~zemResourceRASettingData() = default;

template <const zemRASDKind& kind, zemSettingSide side>
int zemRASettingDataOnLPAR<kind, side>::initialize(zemResourcePool*, zemCEC*, const zemString&,
                                                   int) {
    return -1;
}

template <const zemRASDKind& kind, zemSettingSide side>
int zemRASettingDataOnLPAR<kind, side>::initialize(const zemString&, zemLPAR* lpar, zemCEC* cec,
                                                   const zemString& profileName,
                                                   const zemString& id, const zemString&, int) {
    zemResourceRASettingDataCommData& data = *this->getData();
    data.m_ResourceType = kind.resourceType;
    data.m_AllocationUnits = kind.units;
    const zemInstanceIdOwner owner = {side, profileName, lpar->getLparID(), cec->getMTMS()};
    return formId(kind, owner, id, data.m_InstanceID) ? 0 : -1;
}

template <const zemRASDKind& kind, zemSettingSide side>
void zemRASettingDataOnLPAR<kind, side>::addSpecificProperties(CmpiInstance& instance,
                                                               const char** properties,
                                                               const char*) {
    const zemResourceRASettingDataCommData& data = *this->getData();
    if (data.m_ResourceType == -1) {
        return;  // never filled
    }
    const auto add = [&](const char* name, const CmpiData& value) {
        if (zemBaseProvider::containsProperty(properties, name)) {
            instance.setProperty(name, value);
        }
    };
    add("InstanceID", CmpiData(static_cast<const char*>(data.m_InstanceID)));
    add("ResourceType", CmpiData(static_cast<CMPIUint16>(data.m_ResourceType)));
    add("AllocationUnits", CmpiData(static_cast<const char*>(data.m_AllocationUnits)));
}

#define ZEM_LEAVES(KIND)                                                     \
    template class zemRASettingDataOnLPAR<zemRASDKinds::KIND, SIDE_DEFINED>; \
    template class zemRASettingDataOnLPAR<zemRASDKinds::KIND, SIDE_STATE>;
ZEM_LEAVES(processor)
ZEM_LEAVES(memory)
ZEM_LEAVES(ioSlot)
ZEM_LEAVES(ethernet)
ZEM_LEAVES(scsi)
ZEM_LEAVES(serial)
#undef ZEM_LEAVES

#include "VirtualSystemRepRASD.h"

#include <cstddef>
#include <string>

#include "Exception.h"
#include "NumberText.h"
#include "VirtualSystemInstanceId.h"
#include "VirtualSystemRepRASDFields.h"
#include "VirtualSystemRepVSSD.h"

namespace {

using ProcessorData = zemProcessorRASD::zemProcessorRASDData;
using MemoryData = zemMemoryRASD::zemMemoryRASDData;
using SlotData = zemIOSlotRASD::zemIOSlotRASDData;
using EthernetData = zemVETHRASD::zemVETHRASDData;

// The field by which a resource is told from others of its kind in keys and instance IDs: none for
// those that a partition has once, the text or the number of others.
std::nullptr_t ownField(ProcessorData&) { return nullptr; }
std::nullptr_t ownField(MemoryData&) { return nullptr; }
zemString* ownField(SlotData& data) { return &data.m_DRCIndex; }
int* ownField(zemRemoteAdapterRASDData& data) { return &data.m_SlotID; }
int* ownField(EthernetData& data) { return &data.m_SlotID; }

void readOwn(std::nullptr_t, const zemString&) {}
void readOwn(zemString* field, const zemString& text) { *field = text; }
void readOwn(int* field, const zemString& text) { *field = zemNumberOf(text); }

zemString formId(const zemInstanceIdOwner& owner, std::nullptr_t) {
    return zemFormInstanceId(owner);
}
template <class Field>
zemString formId(const zemInstanceIdOwner& owner, const Field* field) {
    return zemFormInstanceId(owner, *field);
}

template <class Data>
void readKey(Data& data, const zemString& key) {
    const int dash = key.find('-');
    if (dash >= 0) {
        readOwn(ownField(data), key.extractSubstring(static_cast<unsigned>(dash) + 1));
    }
}

zemString keyOf(int type, const char* what) { return (std::to_string(type) + "-" + what).c_str(); }
zemString keyOf(int type, int slot) { return keyOf(type, std::to_string(slot).c_str()); }

template <class Value>
bool isSame(const Value& mine, const Value& other) {
    return mine == other;
}
bool isSame(const zemArray<int>& mine, const zemArray<int>& other) {
    for (int i = 0; i < mine.size(); ++i) {
        if (i >= other.size() || mine[i] != other[i]) {
            return false;
        }
    }
    return true;
}

template <class Data, class Fields>
bool haveSame(const Fields& fields, const Data& mine, const Data& other) {
    return std::apply(
        [&](const auto&... field) {
            return (isSame(mine.*field.member, other.*field.member) && ...);
        },
        fields);
}

/// A copy as RASDs make it.
template <class Data>
Data copyOf(const Data* source) {
    Data copy(*source);
    copy.m_Address = nullptr;
    copy.m_ResourceType = Data().m_ResourceType;
    return copy;
}

}  // namespace

zemRASDCommData::zemRASDCommData(const zemRASDKind& kind)
    : m_ResourceType(kind.resourceType),
      m_AllocationUnits(kind.units),
      m_AutomaticAllocation(kind.automaticAllocation),
      m_AutomaticDeallocation(kind.automaticDeallocation) {}

zemRASDCommData::zemRASDCommData(const zemRASDCommData* source) : zemRASDCommData(*source) {
    m_Address = nullptr;
}

zemRASDCommData::~zemRASDCommData() = default;

zemString zemRASDCommData::getKey() const { return zemString(); }

bool zemRASDCommData::equals(const zemRASDCommData* other) const {
    return m_ResourceType == other->m_ResourceType && haveSame(zemCommonFields(), *this, *other);
}

zemRASD::~zemRASD() = default;

template <class Rasd>
zemRASDCommData* zemRASDOf<Rasd>::getData() {
    return &self().m_Data;
}

template <class Rasd>
zemString zemRASDOf<Rasd>::getKey() {
    return self().m_Data.getKey();
}

template <class Rasd>
zemString zemRASDOf<Rasd>::getInstanceID(bool regenerate, zemVSSD* vssd) {
    auto& data = self().m_Data;
    if (regenerate) {
        if (vssd == nullptr) {
            throw zemInvalidParameterException(
                "zemRASD", "getInstanceID",
                "When re-generating InstanceID, the parameter vssd is required.");
        }
        const zemInstanceIdOwner owner = {vssd->isState() ? SIDE_STATE : SIDE_DEFINED,
                                          vssd->getProfileName(), vssd->getLparID(),
                                          vssd->getMTMS()};
        data.m_InstanceID = formId(owner, ownField(data));
    }
    return data.m_InstanceID;
}

template <class Rasd>
zemRASD* zemRASDOf<Rasd>::clone() {
    return new Rasd(&self().m_Data);
}

template <class Rasd>
void zemRASDOf<Rasd>::setInstanceID(const zemString& instanceID, const zemString& mtms) {
    auto& data = self().m_Data;
    data.m_InstanceID = instanceID;
    const zemString what = zemResourceOfInstanceId(instanceID, mtms);
    if (!what.isEmpty()) {
        readOwn(ownField(data), what);
    }
}

template <class Rasd>
bool zemRASDOf<Rasd>::equals(zemRASD* rasd) {
    const auto* other = dynamic_cast<Rasd*>(rasd);
    const auto& data = self().m_Data;
    return other != nullptr && data.zemRASDCommData::equals(&other->m_Data) &&
           haveSame(zemFieldsOf(data), data, other->m_Data);
}

template class zemRASDOf<zemProcessorRASD>;
template class zemRASDOf<zemMemoryRASD>;
template class zemRASDOf<zemIOSlotRASD>;
template class zemRASDOf<zemVSCSIRASD>;
template class zemRASDOf<zemVSERIALRASD>;
template class zemRASDOf<zemVETHRASD>;

zemRemoteAdapterRASDData::zemRemoteAdapterRASDData(const zemRASDKind& kind)
    : zemRASDCommData(kind) {}

zemString ProcessorData::getKey() const { return keyOf(m_ResourceType, "Processor"); }
zemString MemoryData::getKey() const { return keyOf(m_ResourceType, "Memory"); }
zemString SlotData::getKey() const { return keyOf(m_ResourceType, m_DRCIndex); }
zemString zemRemoteAdapterRASDData::getKey() const { return keyOf(m_ResourceType, m_SlotID); }
zemString EthernetData::getKey() const { return keyOf(m_ResourceType, m_SlotID); }

// What each kind is made of: its constants, a key, data.
#define ZEM_RASD(NAME, BASE, KIND)                               \
    NAME::NAME##Data::NAME##Data() : BASE(zemRASDKinds::KIND) {} \
    NAME::NAME(const zemString& key) { readKey(m_Data, key); }   \
    NAME::NAME(const NAME##Data* data) : m_Data(copyOf(data)) {} \
    NAME::~NAME() = default;
ZEM_RASD(zemProcessorRASD, zemRASDCommData, processor)
ZEM_RASD(zemMemoryRASD, zemRASDCommData, memory)
ZEM_RASD(zemIOSlotRASD, zemRASDCommData, ioSlot)
ZEM_RASD(zemVSCSIRASD, zemRemoteAdapterRASDData, scsi)
ZEM_RASD(zemVSERIALRASD, zemRemoteAdapterRASDData, serial)
ZEM_RASD(zemVETHRASD, zemRASDCommData, ethernet)
#undef ZEM_RASD

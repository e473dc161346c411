#include "VirtualSystemRepRASD.h"

#include <tuple>

namespace {

auto numbersOf(const zemRASDCommData& d) {
    return std::tie(d.m_Weight, d.m_ConsumerVisibility, d.m_MappingBehavior, d.m_ResourceType,
                    d.m_VirtualMinimum, d.m_VirtualQuantity, d.m_VirtualMaximum, d.m_Minimum,
                    d.m_Reservation, d.m_Limit, d.m_AutomaticAllocation, d.m_AutomaticDeallocation,
                    d.m_IsRequired);
}

auto textsOf(const zemRASDCommData& d) {
    return std::tie(d.m_InstanceID, d.m_PoolID, d.m_SharingMode, d.m_AllocationUnits, d.m_Address);
}

}  // namespace

zemRASDCommData::zemRASDCommData(const zemRASDCommData* source) : zemRASDCommData(*source) {
    m_Address = nullptr;
}

zemRASDCommData::~zemRASDCommData() = default;

bool zemRASDCommData::equals(const zemRASDCommData* other) const {
    return textsOf(*this) == textsOf(*other) && numbersOf(*this) == numbersOf(*other);
}

zemRASD::~zemRASD() = default;

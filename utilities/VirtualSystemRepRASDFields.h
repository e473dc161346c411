/// The fields of RASDs as lists of name and member, for whoever walks them all. Private to the
/// library.
///
///     std::apply([&](const auto&... field) { (print(field.name, data.*field.member), ...); },
///                zemFieldsOf(data));
#ifndef VIRTUAL_SYSTEM_REP_RASD_FIELDS_H
#define VIRTUAL_SYSTEM_REP_RASD_FIELDS_H

#include <tuple>

#include "VirtualSystemRepRASD.h"

/// A field of @p Data, and its name.
template <class Data, class Value>
struct zemNamedField {
    const char* name;
    Value Data::*member;
};
template <class Data, class Value>
zemNamedField(const char*, Value Data::*) -> zemNamedField<Data, Value>;

#define ZEM_NAMED_FIELD(NAME) \
    zemNamedField { #NAME, &Data::NAME }

/// The fields that all kinds share, but for the resource type.
constexpr auto zemCommonFields() {
    using Data = zemRASDCommData;
    return std::tuple{ZEM_NAMED_FIELD(m_Weight),
                      ZEM_NAMED_FIELD(m_ConsumerVisibility),
                      ZEM_NAMED_FIELD(m_MappingBehavior),
                      ZEM_NAMED_FIELD(m_VirtualMinimum),
                      ZEM_NAMED_FIELD(m_VirtualQuantity),
                      ZEM_NAMED_FIELD(m_VirtualMaximum),
                      ZEM_NAMED_FIELD(m_Minimum),
                      ZEM_NAMED_FIELD(m_Reservation),
                      ZEM_NAMED_FIELD(m_Limit),
                      ZEM_NAMED_FIELD(m_AutomaticAllocation),
                      ZEM_NAMED_FIELD(m_AutomaticDeallocation),
                      ZEM_NAMED_FIELD(m_IsRequired),
                      ZEM_NAMED_FIELD(m_InstanceID),
                      ZEM_NAMED_FIELD(m_PoolID),
                      ZEM_NAMED_FIELD(m_SharingMode),
                      ZEM_NAMED_FIELD(m_AllocationUnits),
                      ZEM_NAMED_FIELD(m_Address)};
}

/// The fields that a kind has besides.
constexpr auto zemFieldsOf(const zemProcessorRASD::zemProcessorRASDData&) {
    using Data = zemProcessorRASD::zemProcessorRASDData;
    return std::tuple{ZEM_NAMED_FIELD(m_ProcCompatMode)};
}

constexpr auto zemFieldsOf(const zemMemoryRASD::zemMemoryRASDData&) { return std::tuple{}; }

constexpr auto zemFieldsOf(const zemIOSlotRASD::zemIOSlotRASDData&) {
    using Data = zemIOSlotRASD::zemIOSlotRASDData;
    return std::tuple{ZEM_NAMED_FIELD(m_DRCIndex), ZEM_NAMED_FIELD(m_TaggedIOType)};
}

constexpr auto zemFieldsOf(const zemRemoteAdapterRASDData&) {
    using Data = zemRemoteAdapterRASDData;
    return std::tuple{
        ZEM_NAMED_FIELD(m_VirtualAdapterType),    ZEM_NAMED_FIELD(m_SlotID),
        ZEM_NAMED_FIELD(m_RemoteClientFlag),      ZEM_NAMED_FIELD(m_RemoteClientSlotFlag),
        ZEM_NAMED_FIELD(m_RemoteVirtualSystemID), ZEM_NAMED_FIELD(m_RemoteSlotID)};
}

constexpr auto zemFieldsOf(const zemVETHRASD::zemVETHRASDData&) {
    using Data = zemVETHRASD::zemVETHRASDData;
    return std::tuple{ZEM_NAMED_FIELD(m_SlotID),        ZEM_NAMED_FIELD(m_IEEECompatible),
                      ZEM_NAMED_FIELD(m_PortVLANID),    ZEM_NAMED_FIELD(m_AddVLANIDs),
                      ZEM_NAMED_FIELD(m_TrunkPriority), ZEM_NAMED_FIELD(m_vswitch)};
}

#endif

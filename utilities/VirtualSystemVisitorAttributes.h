/// Attributes of one object, under the numbers that the tools' callers give them, whether a tool's
/// record tells them or an object of the model. Private to the library.
///
/// What is built from either is so built once:
///
///     int processorsOf(const zemAttributes& profile) {
///         return zemNumberOf(profile[Profile::ATTR_DESIRED_PROCS]);
///     }
///     processorsOf(zemAttributes(record));
///     processorsOf(zemAttributes(profileConfiguration));
///
/// Objects of the model are zemLPAR, zemPartitionProfileConfiguration, and the resources of
/// partitions. Functions and views without state of their own; any thread may use them.
#ifndef VIRTUAL_SYSTEM_VISITOR_ATTRIBUTES_H
#define VIRTUAL_SYSTEM_VISITOR_ATTRIBUTES_H

#include <vector>

#include "QyallocCmdCaller.h"
#include "QyplatCmdCaller.h"
#include "RecordSets.h"
#include "StringUtils.h"

// The tools' attributes of what partitions have, by short names.
using zemPartitionAttribute = zemQyplatCmdCaller::PartitionAttribute;
using zemProfileAttribute = zemQyplatCmdCaller::PartitionProfileAttribute;
using zemProcessorAttribute = zemQyallocCmdCaller::ProcessorResourceAttribute::LparLevelAttribute;
using zemMemoryAttribute = zemQyallocCmdCaller::MemoryResourceAttribute::LparLevelAttribute;
using zemSlotAttribute = zemQyallocCmdCaller::PhyIOResourceAttribute::SlotAttribute;
using zemSerialAttribute =
    zemQyallocCmdCaller::VirtualIOResourceAttribute::SerialLparLevelAttribute;
using zemScsiAttribute = zemQyallocCmdCaller::VirtualIOResourceAttribute::SCSILparLevelAttribute;
using zemEthernetAttribute = zemQyallocCmdCaller::VirtualIOResourceAttribute::EthLparLevelAttribute;

/// The virtual switch of an Ethernet adapter, of which the tool has no attribute.
constexpr int zemEthernetSwitch = std::size(zemEthernetAttribute::m_attributeName);

// The attributes that the fields of an element are in the lists of what runs, in their order.
constexpr int zemSerialFields[] = {
    zemSerialAttribute::ATTR_SLOT_NUM,         zemSerialAttribute::ATTR_ADAPTER_TYPE,
    zemSerialAttribute::ATTR_SUPPORTS_DNX,     zemSerialAttribute::ATTR_REMOTE_LPAR_ID,
    zemSerialAttribute::ATTR_REMOTE_LPAR_NAME, zemSerialAttribute::ATTR_REMOTE_SLOT_NUM,
    zemSerialAttribute::ATTR_IS_REQUIRED,      zemSerialAttribute::ATTR_END};
constexpr int zemScsiFields[] = {zemScsiAttribute::ATTR_SLOT_NUM,
                                 zemScsiAttribute::ATTR_ADAPTER_TYPE,
                                 zemScsiAttribute::ATTR_REMOTE_LPAR_ID,
                                 zemScsiAttribute::ATTR_REMOTE_LPAR_NAME,
                                 zemScsiAttribute::ATTR_REMOTE_SLOT_NUM,
                                 zemScsiAttribute::ATTR_IS_REQUIRED,
                                 zemScsiAttribute::ATTR_END};

/// A view of an object, which outlives it.
class zemAttributes {
public:
    explicit zemAttributes(const zemRecordType& record);
    template <class Object>
    explicit zemAttributes(const Object& object);

    /// The value of an attribute, which is the object's; empty when it does not tell it.
    const zemString& operator[](int attribute) const { return m_read(m_object, attribute); }

private:
    const void* m_object;
    const zemString& (*m_read)(const void* object, int attribute);
};

/// What an object of the model tells, as a record.
template <class Object>
zemRecordType zemRecordOf(const Object& object);

/// The attributes that such an object tells, as a list for a query.
template <class Object>
std::vector<int> zemAttributesOf();

#endif

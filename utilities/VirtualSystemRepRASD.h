/// The root of the resource allocation setting data (RASDs), and what all kinds of them share.
///
/// A RASD describes one resource of a partition or of a stored profile: processors, memory, a slot
/// or a virtual adapter. Numbers are -1 and texts empty while nobody has set them; processor
/// quantities are hundredths of a processor, memory quantities kilobytes.
///
/// Thread-safety: none; a RASD belongs to the operation that made it.
#ifndef VIRTUAL_SYSTEM_REP_RASD_H
#define VIRTUAL_SYSTEM_REP_RASD_H

#include <cstdint>

#include "StringUtils.h"
#include "ZemExport.h"

class zemVSSD;

/// The data common to all kinds. Each kind derives its own data from it.
struct ZEM_EXPORT zemRASDCommData {
    zemRASDCommData() = default;

    /// Copies all of @p source, which must not be null, but its address: a copied RASD has none.
    explicit zemRASDCommData(const zemRASDCommData* source);

    /// What tells the resource from others of the same partition, as "3-Processor".
    virtual zemString getKey() const = 0;
    virtual ~zemRASDCommData();

    /// Whether all fields, the address too, are those of @p other, which must not be null.
    bool equals(const zemRASDCommData* other) const;

    int m_ResourceType = -1;
    zemString m_InstanceID;
    zemString m_PoolID;
    int m_MappingBehavior = -1;
    zemString m_SharingMode;
    int m_Weight = -1;
    int m_ConsumerVisibility = -1;
    zemString m_AllocationUnits;
    std::int64_t m_VirtualMinimum = -1;
    std::int64_t m_VirtualQuantity = -1;
    std::int64_t m_VirtualMaximum = -1;
    std::int64_t m_Minimum = -1;
    std::int64_t m_Reservation = -1;
    std::int64_t m_Limit = -1;
    zemString m_Address;
    int m_AutomaticAllocation = -1;
    int m_AutomaticDeallocation = -1;
    int m_IsRequired = -1;
};

/// One RASD of any kind.
class ZEM_EXPORT zemRASD {
public:
    virtual ~zemRASD();

    /// The data, which belong to this object.
    virtual zemRASDCommData* getData() = 0;
    virtual zemString getKey() = 0;

    /// The instance ID as stored, or formed anew for @p vssd and stored.
    /// @param vssd  the system whose side, profile and partition stand in the ID
    /// @throws zemInvalidParameterException @p regenerate without @p vssd
    virtual zemString getInstanceID(bool regenerate, zemVSSD* vssd) = 0;

    /// A new object of the same kind with a copy of the data; the caller owns it.
    virtual zemRASD* clone() = 0;

    /// Stores @p instanceID, and what the kind reads from it.
    /// @param mtms  key of the host, with which the ID ends
    virtual void setInstanceID(const zemString& instanceID, const zemString& mtms) = 0;

    /// Whether @p rasd holds the same data; kinds are not compared beyond their fields.
    virtual bool equals(zemRASD* rasd) = 0;
};

#endif

/// What the console's events tell of partitions, and the indications that show it.
///
/// One table says which property of an event becomes which property of an indication, or of an
/// instance in it. An event is read on the thread that Java delivers it on, and shown on one that
/// the CIM server knows: an event read has no reference into either.
///
/// Thread-safety: functions on their arguments alone.
#ifndef EVENT_VALUES_H
#define EVENT_VALUES_H

#include <memory>
#include <string>

#include "CmpiInstance.h"
#include "CmpiObjectPath.h"
#include "RecordSets.h"
#include "WrtEventHelper.h"

/// What a class of indications is about.
enum class EventAspect {
    Existence,  ///< all that an event tells of the partition
    State,      ///< modifications of what it is and does
    Resources,  ///< modifications of what it has
    Move        ///< steps on its way to another host
};

struct PartitionEvent {
    CMPIUint64 time = 0;                           ///< of its arrival, in microseconds since 1970
    std::string partition;                         ///< Name of the partition
    std::unique_ptr<zemRecordType> before, after;  ///< by row of the table; null for none
};

/// @return null for a modification in which nothing of @p aspect differs, and for what tells of no
///         partition
/// @throws zemOperationFailedException what Java refuses
std::unique_ptr<PartitionEvent> readEvent(const zemWRTEvent& event, EventAspect aspect);

/// The indication of a class of @p aspect.
/// @param nearby  in the namespace of the class
CmpiInstance makeIndication(const CmpiObjectPath& nearby, const char* className, EventAspect aspect,
                            const PartitionEvent& event);

#endif

/// What visitors read with in common. Private to the library.
///
/// Functions without state; any thread may call them.
#ifndef VIRTUAL_SYSTEM_VISITOR_READERS_H
#define VIRTUAL_SYSTEM_VISITOR_READERS_H

#include "DNXApiCaller.h"
#include "Exception.h"
#include "RecordSets.h"
#include "VirtualSystemResourceRecords.h"

/// Fills @p profile from the object in which the management library tells it.
void zemReadProfile(apiProp& object, zemPartitionProfileConfiguration& profile);

/// The records that @p query gets of a tool; none when the tool says that it found nothing.
template <class Query>
zemRecordSetsType zemRecordsOf(Query query) {
    try {
        return query();
    } catch (const zemObjectNotFoundException&) {
        return zemRecordSetsType();
    }
}

#endif

/// What the visitor of hosts reads for other visitors. Private to the library.
///
/// Functions without state; any thread may call them.
#ifndef VIRTUAL_SYSTEM_VISITOR_READERS_H
#define VIRTUAL_SYSTEM_VISITOR_READERS_H

#include "DNXApiCaller.h"
#include "VirtualSystemResourceRecords.h"

/// Fills @p profile from the object in which the management library tells it.
void zemReadProfile(apiProp& object, zemPartitionProfileConfiguration& profile);

#endif

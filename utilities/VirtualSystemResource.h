/// What partitions and hosts have, between the back end and the model: records of what the
/// management library tells, settings as they are asked for, and adapters in the tools' own
/// strings.
///
/// Plain values; an object belongs to the operation that made it.
#ifndef VIRTUAL_SYSTEM_RESOURCE_H
#define VIRTUAL_SYSTEM_RESOURCE_H

#include "VirtualSystemResourceAdapters.h"
#include "VirtualSystemResourceRecords.h"
#include "VirtualSystemResourceSettings.h"

#endif

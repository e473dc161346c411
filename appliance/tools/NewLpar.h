/// How partitions come to a host, and how they go.
#ifndef APPLIANCE_NEWLPAR_H
#define APPLIANCE_NEWLPAR_H

#include "Change.h"
#include "Operation.h"
#include "Settings.h"
#include "View.h"

namespace appliance {

/// Makes the partition that the request's "-i" describes. It holds nothing until it is activated:
/// its resources and adapters are those of its profile from then on.
void makeLpar(Change& change, const Operation& operation);

/// The names of what can be set, with commas between them.
const char* newLparNames();

/// The ID that the settings ask for as "lpar_id", or else the lowest that is free.
/// @throws Failure TooManyLpars, IdTaken, BadValue
std::int64_t newId(const HostView& host, const Settings& settings);

/// @throws Failure NameTaken a partition of the host has this name
void requireFreeName(const HostView& host, const std::string& name);

/// Removes a partition with its profiles and adapters from @p host. Its physical adapters are free
/// then, and those who named it among others, or could do without it, do not name it any more.
void eraseLpar(Change& change, const HostView& host, const Object& lpar);

}  // namespace appliance

#endif

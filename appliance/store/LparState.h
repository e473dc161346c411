/// The state of a partition, and what follows from it. Pure functions on objects of Kind::Lpar.
#ifndef APPLIANCE_LPAR_STATE_H
#define APPLIANCE_LPAR_STATE_H

#include "Object.h"

namespace appliance {

/// The environment of partitions that serve others with adapters.
constexpr const char* kIoServer = "xbrgserver";

/// Whether the partition has processors at work: one that is suspended or not activated has none,
/// though it keeps the resources that it holds.
bool isActive(const Object& lpar);

/// Whether the partition is on its way to another host, or is the place that is kept for one.
bool isMoving(const Object& lpar);

/// What a running partition of the environment @p env says that it runs.
const char* osVersion(const std::string& env);

/// Makes the partition run, on all that it holds.
/// @param state  "Running", or the state in which it waits for a person
void setActive(Object& lpar, const char* state);

/// Makes the partition rest in @p state, with nothing at work.
void setInactive(Object& lpar, const char* state);

}  // namespace appliance

#endif

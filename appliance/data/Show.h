/// What the appliance holds, for people.
#ifndef APPLIANCE_SHOW_H
#define APPLIANCE_SHOW_H

#include <string>

#include "Store.h"

namespace appliance {

/// Hosts with what is free on them, and their partitions as a table.
std::string showText(Store& store);

}  // namespace appliance

#endif

/// What must be true of every appliance, whatever was changed: the rules by which a host would
/// refuse a configuration.
#ifndef APPLIANCE_CHECK_H
#define APPLIANCE_CHECK_H

#include <string>
#include <vector>

#include "View.h"

namespace appliance {

/// A sentence for each rule that is broken, with the object that breaks it.
std::vector<std::string> check(Store& store);
/// Of what one host has; not whether other hosts have its name.
std::vector<std::string> check(const HostView& view);

}  // namespace appliance

#endif

/// The help of the tools, made from the tables of options, resources and operations.
#ifndef APPLIANCE_HELP_H
#define APPLIANCE_HELP_H

#include <string>

#include "Tools.h"

namespace appliance {

std::string help(const ToolName& tool);

}  // namespace appliance

#endif

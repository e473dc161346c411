/// The help of the tools, made from the tables of options, resources and operations.
#ifndef APPLIANCE_HELP_H
#define APPLIANCE_HELP_H

#include <string>

#include "Failure.h"
#include "Tools.h"

namespace appliance {

std::string help(const ToolName& tool, Language language);

}  // namespace appliance

#endif

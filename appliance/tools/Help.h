/// The help of the tools, made from the tables of options and resources.
#ifndef APPLIANCE_HELP_H
#define APPLIANCE_HELP_H

#include <string>
#include <vector>

#include "Failure.h"
#include "Request.h"

namespace appliance {

struct ToolName {
    Tool tool;
    const char* name;
    const char* english;  ///< what the tool is for
    const char* german;
};

const std::vector<ToolName>& toolNames();

/// The name by which the program is called to be @p tool.
const char* toolName(Tool tool);

std::string help(Tool tool, Language language);

}  // namespace appliance

#endif

/// What the query tools can list: one row for each combination of tool, resource, subtype and
/// level, with the records that it covers, their attributes and the filters for them.
///
/// The names and their order are a protocol: callers ask for the names and pair the values with
/// them by position.
#ifndef APPLIANCE_RESOURCE_H
#define APPLIANCE_RESOURCE_H

#include <memory>
#include <vector>

#include "Request.h"
#include "View.h"

namespace appliance {

/// The records of a resource for @p hosts, in the order in which they are printed.
using Rows = std::vector<Row> (*)(const Hosts& hosts, const Request& request);

struct Resource {
    Tool tool;
    const char* type;     ///< value of typeOption(tool); null for a tool that lists one thing only
    const char* subtype;  ///< value of --rsubtype; null when there is none
    const char* level;    ///< value of --level; null when any is taken, and none needed
    Rows rows;
    const char* attributes;  ///< names with commas between them
    const char* filters;     ///< likewise, of the table in Filter.cpp
};

/// The option of @p tool that names the type of a resource.
inline const char* typeOption(Tool tool) { return tool == kXbrgcli ? "-c" : "-r"; }

/// All resources of all tools, in the order of the help.
const std::vector<Resource>& resources();

}  // namespace appliance

#endif

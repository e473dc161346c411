/// What the query tools can list: one row for each combination of tool, resource, subtype and
/// level, with the records that it covers, their attributes and the filters for them.
///
/// The names and their order are a protocol: callers ask for the names and pair the values with
/// them by position.
#ifndef APPLIANCE_RESOURCE_H
#define APPLIANCE_RESOURCE_H

#include <vector>

#include "Command.h"
#include "View.h"

namespace appliance {

struct Resource : Command {
    /// The records for @p hosts, in the order in which they are printed.
    std::vector<Row> (*rows)(const Hosts& hosts, const Request& request);
};

/// All resources of all tools, in the order of the help.
const std::vector<Resource>& resources();

/// What a query tool prints: one line for each record, or the sentence that there is none.
/// @throws Failure whatever is wrong with the request or the state
std::string answer(const Request& request);

}  // namespace appliance

#endif

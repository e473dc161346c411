/// What the change tools can do: one row for each combination of tool, resource, subtype and
/// operation, with the function that does it.
///
/// The tables stand in the sources of the tools: Allocate.cpp (edalloc), Configure.cpp (edplat,
/// nwplat, dlplat), Power.cpp (edpower, edsusp) and Move.cpp (domove).
#ifndef APPLIANCE_OPERATION_H
#define APPLIANCE_OPERATION_H

#include <vector>

#include "Failure.h"
#include "Request.h"

namespace appliance {

struct Operation {
    Tool tool;
    const char* type;     ///< value of -r; null for a tool without resources
    const char* subtype;  ///< value of --rsubtype; null when there is none
    const char* name;     ///< value of -o; null when the tool has but one operation
    /// Carries it out. The state is as before whenever this throws a Failure.
    void (*run)(const Request& request, const Operation& operation);
    const char* attributes = "";  ///< that -a or -i may set, with commas between them
};

extern const std::vector<Operation> kAllocateOperations;
extern const std::vector<Operation> kConfigureOperations;
extern const std::vector<Operation> kPowerOperations;
extern const std::vector<Operation> kMoveOperations;

/// All operations of @p tool, in the order of the help; none for a query tool.
std::vector<Operation> operationsOf(Tool tool);

/// Does what the command line asks of a change tool, and gives what it prints: nothing, or its
/// help.
/// @param arguments  null-terminated, without the program's name
/// @throws Failure whatever is wrong with the request or the state, with nothing changed
std::string carryOut(Tool tool, const char* const* arguments, Language language);

}  // namespace appliance

#endif

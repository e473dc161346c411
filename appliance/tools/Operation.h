/// What the change tools can do: one row for each combination of tool, resource, subtype and
/// operation, with the function that does it.
///
/// The tables stand in the sources of the tools: Allocate.cpp (edalloc), Configure.cpp (edplat,
/// nwplat, dlplat), Power.cpp (edpower, edsusp) and Move.cpp (domove).
#ifndef APPLIANCE_OPERATION_H
#define APPLIANCE_OPERATION_H

#include <vector>

#include "Change.h"
#include "Command.h"

namespace appliance {

struct Operation : Command {
    /// Makes the change, which is committed behind it. The state is as before whenever this throws
    /// a Failure.
    void (*run)(Change& change, const Operation& operation);
    bool isTest = false;  ///< only tells whether it could be done
};

extern const std::vector<Operation> kAllocateOperations;
extern const std::vector<Operation> kConfigureOperations;
extern const std::vector<Operation> kPowerOperations;
extern const std::vector<Operation> kMoveOperations;

/// All operations of @p tool, in the order of the help; none for a query tool.
std::vector<Operation> operationsOf(Tool tool);

/// Does what the command line asks of a change tool.
/// @throws Failure whatever is wrong with the request or the state, with nothing changed
void carryOut(const Request& request);

}  // namespace appliance

#endif

/// "appliance fault": plans failures of tools and of the management library's operations.
#ifndef APPLIANCE_FAULT_COMMAND_H
#define APPLIANCE_FAULT_COMMAND_H

#include <string>

#include "Faults.h"

namespace appliance {

struct FaultOptions {
    PlannedFault plan;
    std::string code;  ///< a number, or "null" for no result at all
    bool clear = false;
};

/// Forgets what is planned, if that is asked for; then plans the fault, or without a name prints
/// what is planned.
/// @throws Failure BadOptionValue for the code; those of planFault()
void carryOut(FaultOptions& options);

/// Empty for the name of a tool or an operation; otherwise what is wrong, with all names in
/// columns.
std::string judgeFaultName(const std::string& name);

}  // namespace appliance

#endif

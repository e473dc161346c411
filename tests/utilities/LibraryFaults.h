/// What the stand-in for the management library answers next.
#pragma once

#include <optional>

#include "Faults.h"

/// Lets the next call of @p operation answer with @p code; without one it answers null.
inline void planAnswer(const char* operation, std::optional<int> code) {
    appliance::PlannedFault fault;
    fault.name = operation;
    fault.code = code;
    fault.isNull = !code;
    appliance::planFault(fault);
}

/// Failures planned by a tester: the next calls of a tool, or of an operation of the management
/// library, go wrong in the way that was asked for.
///
/// The plans stand in the file "faults" in the folder APPLIANCE_HOME, beside the state, so that
/// they work on a state that is missing or broken too. Safe from any thread and process: each call
/// locks the file. Nothing is planned where there is no such file, where the caller may not write
/// to it, and where another holds its lock for over two seconds. Other users may write to it, and
/// their tools fail as planned, when it was made under an umask that lets them.
#ifndef APPLIANCE_FAULTS_H
#define APPLIANCE_FAULTS_H

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

namespace appliance {

struct PlannedFault {
    std::string name;         ///< of the tool or operation
    std::int64_t calls = 1;   ///< how many more calls it concerns
    std::int64_t delay = 0;   ///< milliseconds before the call does anything
    std::optional<int> code;  ///< exit status or return code, in place of an answer
    bool isNull = false;      ///< an operation returns null in place of a result
    int signal = 0;           ///< by which a tool ends itself; 0: none
    std::string text;         ///< what a tool writes to standard error
};

/// Puts @p fault in the place of what was planned for that name.
/// @throws Failure NoHome, StateUnusable, StateBusy; BadValue for a name or text with a line break
/// or a tab
void planFault(const PlannedFault& fault);

/// @throws Failure NoHome, StateUnusable, StateBusy
std::vector<PlannedFault> plannedFaults();

/// @throws Failure NoHome, StateUnusable, StateBusy
void clearFaults();

/// Counts one call of @p name, and gives what is planned for it. Never throws but std::bad_alloc.
std::optional<PlannedFault> takeFault(const std::string& name);

/// Waits for the fault's delay.
void pause(const PlannedFault& fault);

}  // namespace appliance

#endif

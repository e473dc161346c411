/// "appliance fault": plans failures of tools and of the management library's operations.
#ifndef APPLIANCE_FAULT_COMMAND_H
#define APPLIANCE_FAULT_COMMAND_H

#include <CLI/CLI.hpp>

namespace appliance {

void addFaultCommand(CLI::App& app);

}  // namespace appliance

#endif

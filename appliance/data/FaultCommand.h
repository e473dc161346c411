/// "appliance fault": plans failures of tools and of the management library's operations.
#ifndef APPLIANCE_FAULT_COMMAND_H
#define APPLIANCE_FAULT_COMMAND_H

#include <CLI/CLI.hpp>
#include <string>

#include "Faults.h"

namespace appliance {

class FaultCommand {
public:
    explicit FaultCommand(CLI::App& app);

    bool isParsed() const { return m_command->parsed(); }
    CLI::App* command() const { return m_command; }

    /// @return the exit status
    int run();

private:
    CLI::App* m_command;
    PlannedFault m_plan;
    std::string m_code;
    bool m_clear = false;
};

}  // namespace appliance

#endif

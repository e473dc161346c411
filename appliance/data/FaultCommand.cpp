#include "FaultCommand.h"

#include <algorithm>
#include <csignal>
#include <iostream>
#include <limits>

#include "Failure.h"
#include "Help.h"
#include "Operations.h"
#include "Text.h"

namespace appliance {

namespace {

/// Of all tools and operations.
std::vector<std::string> names() {
#define NAME(OPERATION, FAMILY) #OPERATION,
    std::vector<std::string> all = {API_OPERATIONS(NAME, NAME, NAME, NAME)};
#undef NAME
    for (const ToolName& tool : toolNames()) all.emplace_back(tool.name);
    std::sort(all.begin(), all.end());
    return all;
}

std::string describe(const PlannedFault& fault) {
    std::string text = fault.name + ": " + std::to_string(fault.calls) + " calls";
    if (fault.delay != 0) text += ", delay " + std::to_string(fault.delay) + " ms";
    if (fault.isNull) text += ", null";
    if (fault.code) text += ", code " + std::to_string(*fault.code);
    if (fault.signal != 0) text += ", signal " + std::to_string(fault.signal);
    if (!fault.text.empty()) text += ", text \"" + fault.text + '"';
    return text;
}

}  // namespace

FaultCommand::FaultCommand(CLI::App& app)
    : m_command(app.add_subcommand(
          "fault",
          "Let the next calls of a tool (qyplat ...) or of an operation of the management library\n"
          "(getCecObj ...) go wrong. Without a name: show what is planned.")) {
    constexpr std::int64_t kMost = std::numeric_limits<std::int32_t>::max();
    m_command->add_option("name", m_plan.name, "Tool or operation")
        ->check(CLI::IsMember(names()).description(""));
    m_command->add_option("--calls", m_plan.calls, "How many calls")
        ->check(CLI::Range(std::int64_t{1}, kMost))
        ->capture_default_str();
    m_command->add_option("--code", m_code,
                          "Exit status of a tool, or return code of an operation; null lets an "
                          "operation return no result at all");
    m_command->add_option("--text", m_plan.text, "What a tool writes to standard error");
    m_command->add_option("--delay", m_plan.delay, "Milliseconds before anything else")
        ->check(CLI::Range(std::int64_t{0}, kMost));
    m_command->add_option("--signal", m_plan.signal, "Number of the signal that ends a tool")
        ->check(CLI::Range(1, SIGRTMAX));
    m_command->add_flag("--clear", m_clear, "Forget what is planned");
}

int FaultCommand::run() {
    if (m_clear) clearFaults();
    if (m_plan.name.empty()) {
        for (const PlannedFault& fault : plannedFaults()) std::cout << describe(fault) << '\n';
        return 0;
    }
    m_plan.isNull = m_code == "null";
    if (!m_code.empty() && !m_plan.isNull) {
        const bool isNegative = m_code.front() == '-';
        std::int64_t code = 0;
        if (!wholeNumber(m_code.substr(isNegative ? 1 : 0), &code) || code > 255) {
            throw Failure(Fault::BadOptionValue, {"--code", m_code});
        }
        m_plan.code = static_cast<int>(isNegative ? -code : code);
    }
    planFault(m_plan);
    return 0;
}

}  // namespace appliance

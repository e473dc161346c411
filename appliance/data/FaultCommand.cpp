#include "FaultCommand.h"

#include <algorithm>
#include <csignal>
#include <iostream>
#include <limits>
#include <memory>

#include "Failure.h"
#include "Faults.h"
#include "Operations.h"
#include "Text.h"
#include "Tools.h"

namespace appliance {

namespace {

/// Of all tools and operations.
std::vector<std::string> names() {
#define NAME(OPERATION, FAMILY) #OPERATION,
    std::vector<std::string> all = {API_OPERATIONS(NAME, NAME, NAME, NAME)};
#undef NAME
    for (const ToolName& tool : kToolNames) {
        all.emplace_back(tool.name);
    }
    std::sort(all.begin(), all.end());
    return all;
}

/// Empty for the name of a tool or an operation; otherwise what is wrong, with all names in
/// columns.
std::string judge(const std::string& name) {
    constexpr std::size_t kColumns = 3, kWidth = 30;
    const std::vector<std::string> all = names();
    if (std::binary_search(all.begin(), all.end(), name)) {
        return {};
    }
    std::string text = "there is no tool or operation " + name + "; there are";
    for (std::size_t i = 0; i < all.size(); ++i) {
        if (i % kColumns == 0) {
            text += "\n  ";
        }
        text += all[i];
        if (i % kColumns + 1 < kColumns) {
            text.append(kWidth - std::min(kWidth, all[i].size()), ' ');
        }
    }
    return text;
}

std::string describe(const PlannedFault& fault) {
    std::string text = fault.name + ": " + std::to_string(fault.calls) + " calls";
    if (fault.delay != 0) {
        text += ", delay " + std::to_string(fault.delay) + " ms";
    }
    if (fault.isNull) {
        text += ", null";
    }
    if (fault.code) {
        text += ", code " + std::to_string(*fault.code);
    }
    if (fault.signal != 0) {
        text += ", signal " + std::to_string(fault.signal);
    }
    if (!fault.text.empty()) {
        text += ", text \"" + fault.text + '"';
    }
    return text;
}

struct Options {
    PlannedFault plan;
    std::string code;
    bool clear = false;
};

void carryOut(Options& options) {
    PlannedFault& plan = options.plan;
    if (options.clear) {
        clearFaults();
    }
    if (plan.name.empty()) {
        for (const PlannedFault& fault : plannedFaults()) {
            std::cout << describe(fault) << '\n';
        }
        return;
    }
    plan.isNull = options.code == "null";
    if (!options.code.empty() && !plan.isNull) {
        const bool isNegative = options.code.front() == '-';
        std::int64_t code = 0;
        if (!wholeNumber(options.code.substr(isNegative ? 1 : 0), &code) || code > 255) {
            throw Failure(Fault::BadOptionValue, {"--code", options.code});
        }
        plan.code = static_cast<int>(isNegative ? -code : code);
    }
    planFault(plan);
}

}  // namespace

void addFaultCommand(CLI::App& app) {
    constexpr std::int64_t kMost = std::numeric_limits<std::int32_t>::max();
    const auto options = std::make_shared<Options>();
    CLI::App* command = app.add_subcommand(
        "fault",
        "Let the next calls of a tool (qyplat ...) or of an operation of the management library\n"
        "(getCecObj ...) go wrong. Without a name: show what is planned.");
    command->callback([options] { carryOut(*options); });
    command->add_option("name", options->plan.name, "Tool or operation")
        ->check(CLI::Validator([](const std::string& name) { return judge(name); }, ""));
    command->add_option("--calls", options->plan.calls, "How many calls")
        ->check(CLI::Range(std::int64_t{1}, kMost))
        ->capture_default_str();
    command->add_option("--code", options->code,
                        "Exit status of a tool, or return code of an operation; null lets an "
                        "operation return no result at all");
    command->add_option("--text", options->plan.text, "What a tool writes to standard error");
    command->add_option("--delay", options->plan.delay, "Milliseconds before anything else")
        ->check(CLI::Range(std::int64_t{0}, kMost));
    command->add_option("--signal", options->plan.signal, "Number of the signal that ends a tool")
        ->check(CLI::Range(1, SIGRTMAX));
    command->add_flag("--clear", options->clear, "Forget what is planned");
}

}  // namespace appliance

#include "FaultCommand.h"

#include <algorithm>
#include <iostream>

#include "Failure.h"
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

}  // namespace

void carryOut(FaultOptions& options) {
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

std::string judgeFaultName(const std::string& name) {
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

}  // namespace appliance

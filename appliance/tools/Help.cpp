#include "Help.h"

#include <algorithm>

#include "Operation.h"
#include "Resource.h"
#include "Text.h"

namespace appliance {

namespace {

constexpr const char* kRecords =
    "Records are lines of values with commas between them; a value that holds a comma or a\n"
    "double quote stands in double quotes, with its own quotes doubled.\n";

constexpr const char* kEnds =
    "Exit status: 0 done, 1 refused, or named object not found, 2 wrong command line, 3 state "
    "unusable,\n"
    "4 output not written.\n";

/// @p names behind @p heading, in lines of bounded width.
std::string wrapped(const char* heading, const char* names) {
    constexpr std::size_t kWidth = 100;
    std::string text, line = std::string("    ") + heading;
    for (const std::string& name : split(names)) {
        if (line.size() + 1 + name.size() > kWidth) {
            text += line + '\n';
            line = "   ";
        }
        line += ' ' + name;
    }
    return text + line + '\n';
}

std::string optionLines(Tool tool) {
    constexpr std::size_t kColumn = 36;
    std::string text;
    for (const Option& option : optionsOf(tool)) {
        std::string line = std::string("  ") + option.name;
        if (option.value != nullptr) {
            line += std::string(" ") + option.value;
        }
        line.resize(std::max(line.size() + 2, kColumn), ' ');
        text += line + option.meaning + '\n';
    }
    return text;
}

std::string commandLines(const Command& command) {
    std::string text = "\n ";
    const auto options = selectorsOf(command.tool), values = command.words();
    for (std::size_t i = 0; i < options.size(); ++i) {
        if (values[i] == nullptr || values[i] == std::string(kAnyLevel)) {
            continue;
        }
        text += std::string(" ") + options[i] + ' ' + values[i];
    }
    text += '\n';
    if (*command.attributes != '\0') {
        text += wrapped("attributes:", command.attributes);
    }
    if (*command.filters != '\0') {
        text += wrapped("filters:", command.filters);
    }
    return text;
}

}  // namespace

std::string help(const ToolName& tool) {
    std::string text = std::string("Usage: ") + tool.name + " <options>\n" + tool.name + ' ' +
                       tool.purpose + ".\n\nOptions:\n" + optionLines(tool.tool);
    for (const Resource& resource : resources()) {
        if (resource.tool == tool.tool) {
            text += commandLines(resource);
        }
    }
    const std::vector<Operation> operations = operationsOf(tool.tool);
    for (const Operation& operation : operations) {
        text += commandLines(operation);
    }
    return text + '\n' + (operations.empty() ? kRecords + std::string(1, '\n') : "") + kEnds;
}

}  // namespace appliance

#include "Help.h"

#include <algorithm>

#include "Operation.h"
#include "Resource.h"
#include "Text.h"

namespace appliance {

namespace {

struct Words {
    const char* usage;
    const char* call;
    const char* options;
    const char* attributes;
    const char* filters;
    const char* records;
    const char* ends;
};

constexpr Words kEnglish = {
    "Usage:",
    "<options>",
    "Options:",
    "attributes:",
    "filters:",
    "Records are lines of values with commas between them; a value that holds a comma or a\n"
    "double quote stands in double quotes, with its own quotes doubled.\n",
    "Exit status: 0 done, 1 refused, or named object not found, 2 wrong command line, 3 state "
    "unusable,\n"
    "4 output not written.\n"};

constexpr Words kGerman = {
    "Aufruf:",
    "<Optionen>",
    "Optionen:",
    "Attribute:",
    "Filter:",
    "Sätze sind Zeilen aus Werten mit Kommas dazwischen; ein Wert mit Komma oder Anführungs-\n"
    "zeichen steht in Anführungszeichen, seine eigenen sind verdoppelt.\n",
    "Rückgabewert: 0 erledigt, 1 abgelehnt, oder genanntes Objekt nicht gefunden, 2 falscher "
    "Aufruf,\n"
    "3 Zustand nicht benutzbar, 4 Ausgabe nicht geschrieben.\n"};

/// @p names behind @p heading, in lines of bounded width.
std::string wrapped(const char* heading, const char* names) {
    constexpr std::size_t kWidth = 100;
    std::string text, line = std::string("    ") + heading;
    for (const std::string& name : split(names)) {
        if (line.size() + 1 + name.size() > kWidth) {
            text += line + '\n';
            line = "       ";
        }
        line += ' ' + name;
    }
    return text + line + '\n';
}

/// The row's text in that language.
template <typename Row>
const char* textOf(const Row& row, Language language) {
    return language == Language::German ? row.german : row.english;
}

std::string optionLines(Tool tool, Language language) {
    constexpr std::size_t kColumn = 36;
    std::string text;
    for (const Option& option : optionsOf(tool)) {
        std::string line = std::string("  ") + option.name;
        if (option.value != nullptr) line += std::string(" ") + option.value;
        line.resize(std::max(line.size() + 2, kColumn), ' ');
        text += line + textOf(option, language) + '\n';
    }
    return text;
}

std::string commandLines(const Command& command, const Words& words) {
    std::string text = "\n ";
    const auto options = selectorsOf(command.tool), values = command.words();
    for (std::size_t i = 0; i < options.size(); ++i) {
        if (values[i] == nullptr || values[i] == std::string(kAnyLevel)) continue;
        text += std::string(" ") + options[i] + ' ' + values[i];
    }
    text += '\n';
    if (*command.attributes != '\0') text += wrapped(words.attributes, command.attributes);
    if (*command.filters != '\0') text += wrapped(words.filters, command.filters);
    return text;
}

}  // namespace

std::string help(const ToolName& tool, Language language) {
    const Words& words = language == Language::German ? kGerman : kEnglish;
    std::string text = std::string(words.usage) + ' ' + tool.name + ' ' + words.call + '\n' +
                       tool.name + ' ' + textOf(tool, language) + ".\n\n" + words.options + '\n' +
                       optionLines(tool.tool, language);
    for (const Resource& resource : resources()) {
        if (resource.tool == tool.tool) text += commandLines(resource, words);
    }
    const std::vector<Operation> operations = operationsOf(tool.tool);
    for (const Operation& operation : operations) text += commandLines(operation, words);
    return text + '\n' + (operations.empty() ? words.records : "") + words.ends;
}

}  // namespace appliance

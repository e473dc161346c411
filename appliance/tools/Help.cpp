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

std::string optionLines(Tool tool, Language language) {
    constexpr std::size_t kColumn = 36;
    std::string text;
    for (const Option* option = options(); option->name != nullptr; ++option) {
        if ((option->tools & tool) == 0) continue;
        std::string line = std::string("  ") + option->name;
        if (option->value != nullptr) line += std::string(" ") + option->value;
        line.resize(std::max(line.size() + 2, kColumn), ' ');
        text += line + (language == Language::German ? option->german : option->english) + '\n';
    }
    return text;
}

std::string resourceLines(const Resource& resource, const Words& words) {
    std::string text = "\n ";
    if (resource.type != nullptr) {
        text += std::string(1, ' ') + typeOption(resource.tool) + ' ' + resource.type;
    }
    if (resource.subtype != nullptr) text += std::string(" --rsubtype ") + resource.subtype;
    if (resource.level != nullptr) text += std::string(" --level ") + resource.level;
    text += '\n' + wrapped(words.attributes, resource.attributes);
    return *resource.filters == '\0' ? text : text + wrapped(words.filters, resource.filters);
}

std::string operationLines(const Operation& operation, const Words& words) {
    std::string text = "\n ";
    if (operation.type != nullptr) text += std::string(" -r ") + operation.type;
    if (operation.subtype != nullptr) text += std::string(" --rsubtype ") + operation.subtype;
    if (operation.name != nullptr) text += std::string(" -o ") + operation.name;
    text += '\n';
    const char* attributes = operation.attributes;
    return *attributes == '\0' ? text : text + wrapped(words.attributes, attributes);
}

}  // namespace

std::string help(Tool tool, Language language) {
    const bool german = language == Language::German;
    const Words& words = german ? kGerman : kEnglish;
    std::string text;
    for (const ToolName& row : toolNames()) {
        if (row.tool != tool) continue;
        text = std::string(words.usage) + ' ' + row.name + ' ' + words.call + '\n' + row.name +
               ' ' + (german ? row.german : row.english) + ".\n\n";
    }
    text += std::string(words.options) + '\n' + optionLines(tool, language);
    for (const Resource& resource : resources()) {
        if (resource.tool == tool) text += resourceLines(resource, words);
    }
    const std::vector<Operation> operations = operationsOf(tool);
    for (const Operation& operation : operations) text += operationLines(operation, words);
    return text + '\n' + (operations.empty() ? words.records : "") + words.ends;
}

}  // namespace appliance

#include "CommandLine.h"

namespace {

/// Collects the argument that begins at or behind @p pos and moves @p pos past it.
/// @return false when the text ends inside quotes
bool collectArgument(const std::string& text, size_t& pos, std::string& argument, bool& dangling) {
    bool inDouble = false;
    bool inSingle = false;
    bool quoteSeen = false;
    while (pos < text.size()) {
        const char c = text[pos++];
        if (c == ' ' && !inDouble && !inSingle) {
            if (!argument.empty() || quoteSeen) {
                break;
            }
        } else if (c == '"' && !inSingle) {
            inDouble = !inDouble;
            quoteSeen = true;
        } else if (c == '\'' && !inDouble) {
            inSingle = !inSingle;
            quoteSeen = true;
        } else if (c == '\\' && !inSingle) {
            const bool escapes =
                pos < text.size() && (!inDouble || text[pos] == '"' || text[pos] == '\\');
            if (escapes) {
                argument += text[pos++];
            } else if (inDouble) {
                argument += c;
            } else {
                dangling = true;
            }
        } else {
            argument += c;
        }
    }
    return !inDouble && !inSingle;
}

}  // namespace

std::string zemEscaped(const char* text) {
    std::string result;
    for (; zemIsGiven(text); ++text) {
        if (*text == '"' || *text == '\\') {
            result += '\\';
        }
        result += *text;
    }
    return result;
}

std::string zemQuoted(const char* text) { return '"' + zemEscaped(text) + '"'; }

std::string zemArgument(const char* text) {
    const bool isPlain =
        zemIsGiven(text) && zemTextOf(text).find_first_of(" \"'\\") == std::string::npos;
    return isPlain ? text : zemQuoted(text);
}

zemCommandLine zemSplitCommandLine(const char* command) {
    const std::string text = zemTextOf(command);
    zemCommandLine line;
    const size_t blank = text.find(' ');
    line.program = text.substr(0, blank);
    if (blank != std::string::npos) {
        const size_t first = text.find_first_not_of(' ', blank);
        if (first != std::string::npos) {
            line.parameters = text.substr(first, text.find_last_not_of(' ') - first + 1);
        }
    }
    line.arguments.push_back(line.program);
    size_t pos = 0;
    while (pos < line.parameters.size()) {
        std::string argument;
        if (!collectArgument(line.parameters, pos, argument, line.danglingBackslash)) {
            line.unbalancedQuote = true;
            break;
        }
        line.arguments.push_back(std::move(argument));
    }
    return line;
}

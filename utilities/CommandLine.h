/// Takes the flat text of a command line apart, as a shell would do with the words of a line, and
/// makes texts that come out of it as they were.
///
/// There are no expansions, no redirections and no comments: blanks part the arguments, quotes and
/// backslashes keep them together. Plain functions of their arguments; any thread may call them.
#ifndef COMMAND_LINE_H
#define COMMAND_LINE_H

#include <string>
#include <vector>

/// A command line in its parts.
struct zemCommandLine {
    std::string program;                 ///< text before the first blank
    std::string parameters;              ///< the rest, without the blanks around it
    std::vector<std::string> arguments;  ///< the program, then each argument
    bool danglingBackslash = false;      ///< the text ends in a backslash outside quotes
    bool unbalancedQuote = false;        ///< the text ends inside quotes; arguments are incomplete

    bool valid() const { return !danglingBackslash && !unbalancedQuote; }
};

/// Splits @p command, which may be null (the same as empty).
///
/// Outside quotes a backslash keeps the next character whatever it is; between double quotes it
/// does so before a double quote and a backslash only; between single quotes it is a character
/// like any other. A pair of quotes alone is an empty argument.
zemCommandLine zemSplitCommandLine(const char* command);

/// Of arguments that may be null, which is as empty: whether there is a text, and the text.
inline bool zemIsGiven(const char* text) { return text != nullptr && *text != '\0'; }
inline std::string zemTextOf(const char* text) { return text != nullptr ? text : ""; }

/// @p text, which may be null, as it has to stand between double quotes for zemSplitCommandLine()
/// to give it back; and the same with these quotes.
std::string zemEscaped(const char* text);
std::string zemQuoted(const char* text);

/// The same for a line that has no quotes there: only a text that would not be one argument has
/// them.
std::string zemArgument(const char* text);

#endif

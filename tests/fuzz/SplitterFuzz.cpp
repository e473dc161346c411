// Any command line splits into no more arguments than its blanks allow, and arguments of any bytes
// come back as they were when every byte is escaped, or quoted.

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <string>
#include <vector>

#include "CommandLine.h"

namespace {

/// The arguments written so that the splitter takes each byte as it is: escaped outside quotes and
/// within them in turn. The blanks that end a line are dropped, escaped or not.
std::string escaped(const std::vector<std::string>& arguments) {
    std::string line = arguments[0];
    for (std::size_t i = 1; i < arguments.size(); ++i) {
        const std::string& argument = arguments[i];
        const bool quoted = i % 2 == 0 || argument.empty() || argument.back() == ' ';
        line += ' ';
        if (quoted) {
            line += zemQuoted(argument.c_str());
            continue;
        }
        for (const char c : argument) {
            line += '\\';
            line += c;
        }
    }
    return line;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string text(data, data + size);
    const zemCommandLine line = zemSplitCommandLine(text.c_str());
    const std::string seen = text.c_str();
    const auto blanks = static_cast<std::size_t>(std::count(seen.begin(), seen.end(), ' '));
    if (line.arguments.size() > blanks + 1 || (line.danglingBackslash && line.unbalancedQuote)) {
        std::abort();
    }
    std::vector<std::string> arguments = {"tool"};
    for (std::size_t begin = 0; begin <= text.size();) {
        const std::size_t end = std::min(text.find('\0', begin), text.size());
        arguments.push_back(text.substr(begin, end - begin));
        begin = end + 1;
    }
    const zemCommandLine again = zemSplitCommandLine(escaped(arguments).c_str());
    if (!again.valid() || again.arguments != arguments) {
        std::abort();
    }
    return 0;
}

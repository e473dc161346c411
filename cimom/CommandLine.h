/// The command line of cimom: its options, and a verb with what stands behind it.
#ifndef CIMOM_COMMAND_LINE_H
#define CIMOM_COMMAND_LINE_H

#include <optional>
#include <string>
#include <vector>

#include "Commands.h"

namespace cimom {

struct CommandLine {
    Options options;
    Request request;
    std::vector<std::string> registrations;
    std::string schema;
    std::string providerOutput = "discard";
    int traceLevel = -1;  ///< -1 for no trace
    Format format = Format::Text;
    const Verb* verb = nullptr;
    Arguments arguments;
};

/// Prints what --help and --version ask for on standard output, or what is wrong on standard error.
/// @return the exit status where nothing is left to be done; 64 for a wrong command line
std::optional<int> readCommandLine(int argc, char** argv, CommandLine& line);

}  // namespace cimom

#endif

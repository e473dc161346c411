/// A tool's command line, taken apart and judged by the options that the tool has.
#ifndef APPLIANCE_REQUEST_H
#define APPLIANCE_REQUEST_H

#include <map>
#include <string>
#include <vector>

#include "Tools.h"

namespace appliance {

struct Option {
    const char* name;
    unsigned tools;     ///< bits of Tool
    const char* value;  ///< what stands for the value in the help; null: the option has none
    const char* meaning;
};

std::vector<Option> optionsOf(Tool tool);

class Request {
public:
    /// @param arguments  null-terminated, without the program's name
    /// @throws Failure of kind kExitUsage
    Request(const ToolName& tool, const char* const* arguments);

    const ToolName& tool() const { return m_tool; }
    bool has(const char* option) const { return m_values.count(option) != 0; }
    /// The option's value, empty when it was not given.
    std::string value(const char* option) const;
    /// The option's value as a number from @p least to @p most, @p absent when it was not given.
    /// @throws Failure BadOptionValue
    std::int64_t number(const char* option, std::int64_t least, std::int64_t most,
                        std::int64_t absent) const;

private:
    const ToolName& m_tool;
    std::map<std::string, std::string> m_values;
};

}  // namespace appliance

#endif

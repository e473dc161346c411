/// A tool's command line, taken apart and judged by the options that the tool has.
#ifndef APPLIANCE_REQUEST_H
#define APPLIANCE_REQUEST_H

#include <map>
#include <string>

namespace appliance {

/// The tools of the program, as bits, so that an option can name those that have it.
enum Tool : unsigned {
    kQyplat = 1,
    kQyalloc = 2,
    kQymove = 4,
    kQyusage = 8,
    kQyfault = 16,
    kQylink = 32,
    kQylwh = 64,
    kQydyn = 128,
    kXbrgcli = 256,
    kEdalloc = 512,
    kEdplat = 1024,
    kNwplat = 2048,
    kDlplat = 4096,
    kEdpower = 8192,
    kEdsusp = 16384,
    kDomove = 32768,
};

struct Option {
    const char* name;
    unsigned tools;       ///< bits of Tool
    const char* value;    ///< what stands for the value in the help; null: the option has none
    const char* english;  ///< what the help says of it
    const char* german;
};

/// All options of all tools, for the help. The row behind the last has no name.
const Option* options();

class Request {
public:
    /// @param arguments  null-terminated, without the program's name
    /// @throws Failure of kind kExitUsage
    Request(Tool tool, const char* const* arguments);

    Tool tool() const { return m_tool; }
    bool has(const char* option) const { return m_values.count(option) != 0; }
    /// The option's value, empty when it was not given.
    std::string value(const char* option) const;
    /// The option's value as a number from @p least to @p most, @p absent when it was not given.
    /// @throws Failure BadOptionValue
    std::int64_t number(const char* option, std::int64_t least, std::int64_t most,
                        std::int64_t absent) const;

private:
    Tool m_tool;
    std::map<std::string, std::string> m_values;
};

}  // namespace appliance

#endif

/// What a command line can ask of a tool: the part that the tables of queries (Resource.h) and of
/// changes (Operation.h) have in common.
#ifndef APPLIANCE_COMMAND_H
#define APPLIANCE_COMMAND_H

#include <algorithm>
#include <vector>

#include "Failure.h"
#include "Request.h"
#include "Text.h"

namespace appliance {

struct Command {
    Tool tool;
    // The words that select it: values of selectorsOf(tool). Null when the option must be absent;
    // otherwise a list, in which the empty word stands for an absent option.
    const char* type;
    const char* subtype;
    const char* last;
    const char* attributes = "";  ///< what it prints or can set: names with commas between them
    const char* filters = "";     ///< likewise, of the table in Filter.cpp

    std::vector<const char*> words() const { return {type, subtype, last}; }
};

/// Resources that know no levels are asked with any of those that others have, and with none.
constexpr const char* kAnyLevel = ",lpar,sys,pool,slot";

/// The options that select, beginning with the one that decides most.
inline std::vector<const char*> selectorsOf(Tool tool) {
    return {tool == kXbrgcli ? "-c" : "-r", "--rsubtype", tool < kEdalloc ? "--level" : "-o"};
}

/// The row of @p commands for which the command line asks.
/// @throws Failure MissingOption, BadOptionValue of the first option whose value leaves no row
template <typename Row>
const Row& commandFor(const std::vector<Row>& commands, const Request& request) {
    const std::vector<const char*> options = selectorsOf(request.tool().tool);
    std::size_t most = 0;  // options in front whose values some row has
    for (const Row& row : commands) {
        if (row.tool != request.tool().tool) {
            continue;
        }
        const std::vector<const char*> words = row.words();
        std::size_t fits = 0;
        for (; fits < options.size(); ++fits) {
            const std::string value = request.value(options[fits]);
            const char* word = words[fits];
            if (word == nullptr ? !value.empty() : !isListed(word, value)) {
                break;
            }
        }
        if (fits == options.size()) {
            return row;
        }
        most = std::max(most, fits);
    }
    if (!request.has(options[most])) {
        throw Failure(Fault::MissingOption, {options[most]});
    }
    throw Failure(Fault::BadOptionValue, {options[most], request.value(options[most])});
}

}  // namespace appliance

#endif

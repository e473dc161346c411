/// Values as one text to hold against what is expected.
#pragma once

#include <sstream>
#include <string>

/// All @p values, "|" behind each.
template <class... Values>
std::string joined(const Values&... values) {
    std::ostringstream text;
    ((text << values << '|'), ...);
    return text.str();
}

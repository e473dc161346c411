/// The number with which a text begins, read as strtol() does and held to the range of an int; and
/// the same with a point, whatever the locale.
///
/// For numbers from outside: whatever stands there, the result is defined, and 0 says that there is
/// no number. Functions without state; any thread may call them.
#ifndef NUMBER_TEXT_H
#define NUMBER_TEXT_H

#include <cctype>
#include <charconv>
#include <climits>
#include <cmath>
#include <cstdint>
#include <string_view>

inline int zemNumberOf(std::string_view text) {
    std::size_t at = 0;
    while (at < text.size() && std::isspace(static_cast<unsigned char>(text[at])) != 0) {
        ++at;
    }
    bool negative = false;
    if (at < text.size() && (text[at] == '-' || text[at] == '+')) {
        negative = text[at++] == '-';
    }
    constexpr int kBase = 10;
    constexpr std::int64_t kMost = std::int64_t{INT_MAX} + 1;  // of either sign
    std::int64_t value = 0;
    for (; at < text.size() && text[at] >= '0' && text[at] <= '9' && value < kMost; ++at) {
        value = value * kBase + (text[at] - '0');
    }
    if (negative) {
        return static_cast<int>(value < kMost ? -value : INT_MIN);
    }
    return static_cast<int>(value < kMost ? value : INT_MAX);
}

/// The same of a text that ends with a NUL.
inline int zemNumberOf(const char* text) { return zemNumberOf(std::string_view(text)); }

/// Not NaN; infinite for "inf".
inline double zemRealOf(std::string_view text) {
    const std::size_t begin = text.find_first_not_of(" \t+");
    double value = 0;
    if (begin != std::string_view::npos) {
        std::from_chars(text.data() + begin, text.data() + text.size(), value);
    }
    return std::isnan(value) ? 0 : value;
}

/// The number that a text is which consists of digits; -1, which no table lists, for any other.
inline int zemWholeNumberOf(std::string_view text) {
    const bool isNumber =
        !text.empty() && text.find_first_not_of("0123456789") == std::string_view::npos;
    return isNumber ? zemNumberOf(text) : -1;
}
inline int zemWholeNumberOf(const char* text) { return zemWholeNumberOf(std::string_view(text)); }

#endif

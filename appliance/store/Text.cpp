#include "Text.h"

#include <algorithm>
#include <charconv>
#include <cstdio>

namespace appliance {

std::string quoted(std::string_view value) {
    if (value.find_first_of(",\"") == std::string_view::npos) {
        return std::string(value);
    }
    std::string field = "\"";
    for (char c : value) {
        if (c == '"') {
            field += '"';
        }
        field += c;
    }
    return field += '"';
}

std::string joined(const std::vector<std::string>& values) {
    std::string line;
    for (std::size_t i = 0; i < values.size(); ++i) {
        if (i != 0) {
            line += ',';
        }
        line += appliance::quoted(values[i]);  // not what streams know by this name
    }
    return line;
}

bool quotedFieldAt(std::string_view text, std::size_t begin, std::size_t* end) {
    if (begin >= text.size() || text[begin] != '"') {
        return false;
    }
    for (std::size_t i = begin + 1; i < text.size(); ++i) {
        if (text[i] != '"') {
            continue;
        }
        if (i + 1 < text.size() && text[i + 1] == '"') {
            ++i;
            continue;
        }
        *end = i + 1;
        return *end == text.size() || text[*end] == ',';
    }
    return false;
}

std::string unquoted(std::string_view field) {
    std::string value;
    for (std::size_t i = 1; i + 1 < field.size(); ++i) {
        value += field[i];
        if (field[i] == '"') {
            ++i;
        }
    }
    return value;
}

std::vector<std::string> split(std::string_view text) {
    std::vector<std::string> fields;
    for (std::size_t begin = 0;;) {
        std::size_t end = 0;
        if (quotedFieldAt(text, begin, &end)) {
            fields.push_back(unquoted(text.substr(begin, end - begin)));
        } else {
            end = std::min(text.find(',', begin), text.size());
            fields.emplace_back(text.substr(begin, end - begin));
        }
        if (end == text.size()) {
            return fields;
        }
        begin = end + 1;
    }
}

std::vector<std::string_view> namesIn(std::string_view list) {
    std::vector<std::string_view> names;
    for (std::size_t begin = 0, end = 0; end != list.size(); begin = end + 1) {
        end = std::min(list.find(',', begin), list.size());
        names.push_back(list.substr(begin, end - begin));
    }
    return names;
}

bool isListed(std::string_view list, std::string_view word) {
    for (std::size_t begin = 0, end = 0; end != list.size(); begin = end + 1) {
        end = std::min(list.find(',', begin), list.size());
        if (list.substr(begin, end - begin) == word) {
            return true;
        }
    }
    return false;
}

std::int64_t hundredths(std::string_view units) {
    const bool negative = !units.empty() && units.front() == '-';
    if (negative) {
        units.remove_prefix(1);
    }
    const std::size_t point = std::min(units.find('.'), units.size());
    std::string decimals(units.substr(std::min(point + 1, units.size())).substr(0, 2));
    decimals.resize(2, '0');
    const std::int64_t size = number(units.substr(0, point)) * 100 + number(decimals);
    return negative ? -size : size;
}

std::string units(std::int64_t hundredths) {
    if (hundredths == 0) {
        return "0.0";
    }
    const char* sign = hundredths < 0 ? "-" : "";
    const auto size = hundredths < 0 ? -hundredths : hundredths;
    char text[32];
    std::snprintf(text, sizeof text, "%s%lld.%02lld", sign, static_cast<long long>(size / 100),
                  static_cast<long long>(size % 100));
    return text;
}

std::int64_t number(std::string_view text) {
    std::int64_t value = 0;
    std::from_chars(text.data(), text.data() + text.size(), value);
    return value;
}

bool wholeNumber(std::string_view text, std::int64_t* value) {
    if (text.empty() || text.find_first_not_of("0123456789") != std::string_view::npos) {
        return false;
    }
    std::int64_t parsed = 0;
    if (std::from_chars(text.data(), text.data() + text.size(), parsed).ec != std::errc{}) {
        return false;
    }
    *value = parsed;
    return true;
}

bool wholeUnits(std::string_view text, std::int64_t* value) {
    constexpr std::int64_t kMost = 1'000'000'000;
    const std::size_t point = std::min(text.find('.'), text.size());
    const std::string_view decimals = text.substr(std::min(point + 1, text.size()));
    std::int64_t whole = 0, part = 0;
    if (!wholeNumber(text.substr(0, point), &whole) || whole > kMost || decimals.size() > 2 ||
        (point != text.size() && !wholeNumber(decimals, &part))) {
        return false;
    }
    *value = hundredths(text);
    return true;
}

std::string timeText(std::time_t time) {
    std::tm parts{};
    gmtime_r(&time, &parts);
    char text[64];
    return std::string(text, std::strftime(text, sizeof text, "%m/%d/%Y %H:%M:%S", &parts));
}

std::string hex(std::int64_t value, int width) {
    char text[32];
    std::snprintf(text, sizeof text, "%0*llX", width, static_cast<unsigned long long>(value));
    return text;
}

std::size_t characters(std::string_view text) {
    return static_cast<std::size_t>(std::count_if(text.begin(), text.end(), [](char c) {
        return (static_cast<unsigned char>(c) & 0xC0) != 0x80;
    }));
}

std::string upperHex(std::string text) {
    for (char& c : text) {
        if (c >= 'a' && c <= 'f') {
            c = static_cast<char>(c - 'a' + 'A');
        }
    }
    return text;
}

}  // namespace appliance

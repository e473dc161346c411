#include "Literal.h"

#include <algorithm>
#include <cstddef>
#include <cstdio>

#include "Value.h"

namespace cimom {

namespace {

struct TypeName {
    CMPIType type;
    const char* name;
};
constexpr TypeName kTypeNames[] = {
    {CMPI_boolean, "boolean"},
    {CMPI_char16, "char16"},
    {CMPI_real32, "real32"},
    {CMPI_real64, "real64"},
    {CMPI_uint8, "uint8"},
    {CMPI_uint16, "uint16"},
    {CMPI_uint32, "uint32"},
    {CMPI_uint64, "uint64"},
    {CMPI_sint8, "sint8"},
    {CMPI_sint16, "sint16"},
    {CMPI_sint32, "sint32"},
    {CMPI_sint64, "sint64"},
    {CMPI_string, "string"},
    {CMPI_dateTime, "datetime"},
    // from here on not to be declared by their names
    {CMPI_null, "null"},
    {CMPI_instance, "instance"},
    {CMPI_ref, "reference"},
    {CMPI_ptr, "pointer"},
};
constexpr std::ptrdiff_t kDeclaredTypes = 14;

const TypeName* rowOf(CMPIType type) {
    const auto* row = std::find_if(std::begin(kTypeNames), std::end(kTypeNames),
                                   [&](auto& each) { return each.type == (type & ~CMPI_ARRAY); });
    return row == std::end(kTypeNames) ? nullptr : row;
}

struct Escape {
    char letter;
    char meant;
};
constexpr Escape kEscapes[] = {{'"', '"'},  {'\\', '\\'}, {'\'', '\''}, {'n', '\n'},
                               {'t', '\t'}, {'r', '\r'},  {'b', '\b'},  {'f', '\f'}};

std::string byNumber(std::uint64_t unit) {
    char text[16];
    std::snprintf(text, sizeof text, "\\x%04X", static_cast<unsigned>(unit));
    return text;
}

std::string escaped(char c, char quote, Controls controls) {
    const bool marks = c == quote || c == '\\';
    const bool control =
        static_cast<unsigned char>(c) < 0x20 || (c == 0x7F && controls == Controls::ByNumber);
    if (!marks && !control) {
        return {c};
    }
    if (marks || controls == Controls::ByLetter) {
        for (const Escape& escape : kEscapes) {
            if (escape.meant == c) {
                return {'\\', escape.letter};
            }
        }
    }
    return byNumber(static_cast<unsigned char>(c));
}

}  // namespace

bool isValueType(CMPIType type) { return rowOf(type) != nullptr; }

std::string typeName(CMPIType type) {
    const TypeName* row = rowOf(type);
    if (!row) {
        return "type " + std::to_string(type);
    }
    return std::string(row->name) + ((type & CMPI_ARRAY) != 0 ? "[]" : "");
}

const char* declaredTypeName(CMPIType type) {
    const TypeName* row = rowOf(type);
    return row && row - kTypeNames < kDeclaredTypes ? row->name : nullptr;
}

std::optional<CMPIType> declaredTypeNamed(std::string_view word) {
    for (std::ptrdiff_t i = 0; i < kDeclaredTypes; ++i) {
        if (sameName(kTypeNames[i].name, word)) {
            return kTypeNames[i].type;
        }
    }
    return std::nullopt;
}

std::string quoted(const std::string& text, char quote, Controls controls) {
    std::string all(1, quote);
    for (char c : text) {
        all += escaped(c, quote, controls);
    }
    return all + quote;
}

std::string quotedUnit(std::uint64_t unit, Controls controls) {
    const bool shown = unit >= 0x20 && unit < 0x7F && controls == Controls::ByLetter;
    return "'" + (shown ? escaped(static_cast<char>(unit), '\'', controls) : byNumber(unit)) + "'";
}

char meaningOfEscape(char letter) {
    for (const Escape& escape : kEscapes) {
        if (escape.letter == letter) {
            return escape.meant;
        }
    }
    return 0;
}

std::string utf8(unsigned unit) {
    const auto byte = [](unsigned value) { return static_cast<char>(value); };
    if (unit < 0x80) {
        return {byte(unit)};
    }
    if (unit < 0x800) {
        return {byte(0xC0 | unit >> 6), byte(0x80 | (unit & 0x3F))};
    }
    return {byte(0xE0 | unit >> 12), byte(0x80 | (unit >> 6 & 0x3F)), byte(0x80 | (unit & 0x3F))};
}

std::vector<std::string> splitAtCommas(const std::string& text) {
    std::vector<std::string> parts;
    for (std::size_t at = 0; at < text.size();) {
        const std::size_t comma = std::min(text.find(',', at), text.size());
        if (comma > at) {
            parts.push_back(text.substr(at, comma - at));
        }
        at = comma + 1;
    }
    return parts;
}

}  // namespace cimom

#include "MofValue.h"

#include <array>
#include <cfloat>
#include <charconv>
#include <cmath>

#include "Literal.h"
#include "PathText.h"

namespace cimom {

namespace {

// yyyymmddhhmmss.mmmmmmsutc or ddddddddhhmmss.mmmmmm:000, an asterisk for a digit not known.
bool isDateTime(const std::string& text) {
    if (text.size() != 25 || text[14] != '.') {
        return false;
    }
    if (text[21] != '+' && text[21] != '-' && text[21] != ':') {
        return false;
    }
    for (std::size_t i = 0; i < text.size(); ++i) {
        bool isDigit = (text[i] >= '0' && text[i] <= '9') || text[i] == '*';
        if (i != 14 && i != 21 && !isDigit) {
            return false;
        }
    }
    return true;
}

// One literal as a value of a type. Each of these says why it does not fit, or nothing.

std::string mismatch(const CimType& type, const char* what) {
    return "expected a value of type " + mofTypeWord(type) + ", found " + what;
}

std::string convertInteger(const MofInteger& literal, const CimType& type, Value& value) {
    if (isReal(type.type)) {
        const auto magnitude = static_cast<double>(literal.magnitude);
        value = Value::real(type.type, literal.isNegative ? -magnitude : magnitude);
        return {};
    }
    if (!isInteger(type.type)) {
        return mismatch(type, "an integer");
    }
    constexpr std::uint64_t kLeast = std::uint64_t{1} << 63;  // the magnitude of it
    const bool tooLow = literal.isNegative && literal.magnitude > kLeast;
    const Value wide = literal.isNegative ? Value(static_cast<std::int64_t>(0 - literal.magnitude))
                                          : Value(literal.magnitude);
    if (!tooLow && wide.convertTo(type.type, value)) {
        return {};
    }
    return (literal.isNegative ? "-" : "") + std::to_string(literal.magnitude) +
           " is out of the range of " + mofTypeWord(type);
}

std::string convertText(const Value& literal, const CimType& type, Value& value) {
    if (type.type == CMPI_dateTime) {
        if (!isDateTime(literal.text())) {
            return "'" + literal.text().substr(0, 40) + "' is not a datetime";
        }
        if (literal.convertTo(type.type, value)) {
            return {};  // one of no calendar stays a text
        }
    } else if (type.type != CMPI_string && type.type != CMPI_ref) {
        return mismatch(type, "a string");
    }
    value = literal;
    return {};
}

std::string convertLiteral(const MofLiteral& literal, const CimType& type, Value& value) {
    if (const auto* integer = std::get_if<MofInteger>(&literal.value)) {
        return convertInteger(*integer, type, value);
    }
    const auto& given = std::get<Value>(literal.value);
    if (given.type() == CMPI_string) {
        return convertText(given, type, value);
    }
    if (given.type() == CMPI_real64) {
        if (!isReal(type.type)) {
            return mismatch(type, "a real number");
        }
        if (type.type == CMPI_real32 && std::fabs(given.real()) > static_cast<double>(FLT_MAX)) {
            return "the number is out of the range of real32";
        }
        value = Value::real(type.type, given.real());
        return {};
    }
    if (!given.isNull() && given.type() != type.type) {
        return mismatch(type, given.type() == CMPI_boolean ? "a boolean" : "a character");
    }
    value = given;
    return {};
}

// Shortest text that reads as the same number, always with a point, which MOF wants.
std::string realText(double number) {
    std::array<char, 32> buffer;
    auto end = std::to_chars(buffer.data(), buffer.data() + buffer.size(), number).ptr;
    std::string text(buffer.data(), end);
    if (text.find('.') == std::string::npos) {
        text.insert(std::min(text.find('e'), text.size()), ".0");
    }
    return text;
}

}  // namespace

std::string convertMofValue(const MofInitializer& initializer, const CimType& type, Value& value) {
    value = Value::null(type.cmpiType());
    const auto& literals = initializer.literals;
    const auto* first = literals.empty() ? nullptr : std::get_if<Value>(&literals[0].value);
    if (!initializer.isArray && first && first->isNull()) {
        return {};
    }
    if (initializer.isArray != type.isArray) {
        return type.isArray ? "expected values in braces for an array"
                            : "values in braces are for an array only";
    }
    if (type.arraySize > 0 && literals.size() > type.arraySize) {
        return "more values than the array's " + std::to_string(type.arraySize);
    }
    Value::Array values(literals.size());
    for (std::size_t i = 0; i < values.size(); ++i) {
        std::string fault = convertLiteral(literals[i], type, values[i]);
        if (!fault.empty()) {
            return fault;
        }
    }
    value = type.isArray ? Value::array(type.type, std::move(values)) : values[0];
    return {};
}

std::string printMofValue(const Value& value) {
    if (value.isNull()) {
        return printValue(value);
    }
    if (value.isArray()) {
        std::string text;
        for (const Value& element : value.elements()) {
            text += (text.empty() ? "" : ", ") + printMofValue(element);
        }
        return "{" + text + "}";
    }
    if (value.type() == CMPI_char16) {
        return quotedUnit(value.uint(), Controls::ByNumber);
    }
    if (value.type() == CMPI_string) {
        return quoted(value.text(), '"', Controls::ByNumber);
    }
    return isReal(value.type()) ? realText(value.real()) : printValue(value);
}

std::string mofTypeWord(const CimType& type) {
    return type.type == CMPI_ref ? "ref" : typeName(type.type);
}
std::string mofBrackets(const CimType& type) {
    if (!type.isArray) {
        return {};
    }
    return "[" + (type.arraySize > 0 ? std::to_string(type.arraySize) : "") + "]";
}

}  // namespace cimom

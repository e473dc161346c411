#include "MofValue.h"

#include <array>
#include <cfloat>
#include <charconv>
#include <cmath>
#include <cstdio>
#include <limits>

namespace cimom {

namespace {

struct IntegerType {
    CimType type;
    std::int64_t min;
    std::uint64_t max;
};

template <class T>
constexpr IntegerType integerType(CimType type) {
    return {type, static_cast<std::int64_t>(std::numeric_limits<T>::min()),
            static_cast<std::uint64_t>(std::numeric_limits<T>::max())};
}

constexpr IntegerType kIntegers[] = {
    integerType<std::uint8_t>(CimType::Uint8),   integerType<std::int8_t>(CimType::Sint8),
    integerType<std::uint16_t>(CimType::Uint16), integerType<std::int16_t>(CimType::Sint16),
    integerType<std::uint32_t>(CimType::Uint32), integerType<std::int32_t>(CimType::Sint32),
    integerType<std::uint64_t>(CimType::Uint64), integerType<std::int64_t>(CimType::Sint64),
};

const IntegerType* integerRow(CimType type) {
    for (const IntegerType& row : kIntegers)
        if (row.type == type) return &row;
    return nullptr;
}

bool isReal(CimType type) { return type == CimType::Real32 || type == CimType::Real64; }

// yyyymmddhhmmss.mmmmmmsutc or ddddddddhhmmss.mmmmmm:000, an asterisk for a digit not known.
bool isDateTime(const std::string& text) {
    if (text.size() != 25 || text[14] != '.') return false;
    if (text[21] != '+' && text[21] != '-' && text[21] != ':') return false;
    for (std::size_t i = 0; i < text.size(); ++i) {
        bool isDigit = (text[i] >= '0' && text[i] <= '9') || text[i] == '*';
        if (i != 14 && i != 21 && !isDigit) return false;
    }
    return true;
}

// One literal as a scalar of a type. Each operator() says why it does not fit, or nothing.
class ScalarOf {
public:
    ScalarOf(CimType type, CimScalar& scalar) : m_type(type), m_scalar(scalar) {}

    std::string operator()(std::monostate) {
        m_scalar = std::monostate();
        return {};
    }
    std::string operator()(bool literal) {
        if (m_type != CimType::Boolean) return mismatch("a boolean");
        m_scalar = literal;
        return {};
    }
    std::string operator()(const MofInteger& literal) {
        if (isReal(m_type)) {
            double magnitude = static_cast<double>(literal.magnitude);
            return (*this)(literal.isNegative ? -magnitude : magnitude);
        }
        const IntegerType* row = integerRow(m_type);
        if (!row) return mismatch("an integer");
        // -(min + 1) + 1 is the magnitude of the least value, which int64_t cannot hold itself
        std::uint64_t limit = !literal.isNegative ? row->max
                              : row->min == 0     ? 0
                                                  : static_cast<std::uint64_t>(-(row->min + 1)) + 1;
        if (literal.magnitude > limit)
            return (literal.isNegative ? "-" : "") + std::to_string(literal.magnitude) +
                   " is out of the range of " + cimTypeName(m_type);
        if (row->min == 0)
            m_scalar = literal.magnitude;
        else
            m_scalar = static_cast<std::int64_t>(literal.isNegative ? 0 - literal.magnitude
                                                                    : literal.magnitude);
        return {};
    }
    std::string operator()(double literal) {
        if (!isReal(m_type)) return mismatch("a real number");
        if (m_type == CimType::Real32 && std::fabs(literal) > static_cast<double>(FLT_MAX))
            return "the number is out of the range of real32";
        m_scalar = literal;
        return {};
    }
    std::string operator()(const MofCharacter& literal) {
        if (m_type != CimType::Char16) return mismatch("a character");
        m_scalar = static_cast<std::uint64_t>(literal.unit);
        return {};
    }
    std::string operator()(const std::string& literal) {
        bool isText = m_type == CimType::String || m_type == CimType::Reference;
        if (!isText && m_type != CimType::DateTime) return mismatch("a string");
        if (m_type == CimType::DateTime && !isDateTime(literal))
            return "'" + literal.substr(0, 40) + "' is not a datetime";
        m_scalar = literal;
        return {};
    }

private:
    std::string mismatch(const char* what) const {
        return std::string("expected a value of type ") + cimTypeName(m_type) + ", found " + what;
    }

    CimType m_type;
    CimScalar& m_scalar;
};

std::string quoted(const std::string& text, char quote) {
    std::string all(1, quote);
    for (char c : text) {
        if (c == quote || c == '\\') {
            all += '\\';
            all += c;
        } else if (static_cast<unsigned char>(c) < 0x20 || c == 0x7F) {
            char escape[8];
            std::snprintf(escape, sizeof escape, "\\x%04X", static_cast<unsigned>(c));
            all += escape;
        } else {
            all += c;
        }
    }
    return all + quote;
}

// Shortest text that reads as the same number, always with a point, which MOF wants.
std::string realText(double number) {
    std::array<char, 32> buffer;
    auto end = std::to_chars(buffer.data(), buffer.data() + buffer.size(), number).ptr;
    std::string text(buffer.data(), end);
    if (text.find('.') == std::string::npos)
        text.insert(std::min(text.find('e'), text.size()), ".0");
    return text;
}

std::string printScalar(const CimScalar& scalar, CimType type) {
    if (auto flag = std::get_if<bool>(&scalar)) return *flag ? "true" : "false";
    if (auto number = std::get_if<std::uint64_t>(&scalar)) {
        if (type != CimType::Char16) return std::to_string(*number);
        char escape[12];
        std::snprintf(escape, sizeof escape, "'\\x%04X'", static_cast<unsigned>(*number));
        return escape;
    }
    if (auto number = std::get_if<std::int64_t>(&scalar)) return std::to_string(*number);
    if (auto number = std::get_if<double>(&scalar)) return realText(*number);
    if (auto text = std::get_if<std::string>(&scalar)) return quoted(*text, '"');
    return "NULL";
}

}  // namespace

std::string convertMofValue(const MofInitializer& initializer, const MofType& type,
                            CimValue& value) {
    value.reset();
    bool isNull = !initializer.isArray &&
                  std::holds_alternative<std::monostate>(initializer.literals[0].value);
    if (isNull) return {};
    if (initializer.isArray != type.isArray)
        return type.isArray ? "expected values in braces for an array"
                            : "values in braces are for an array only";
    if (type.arraySize > 0 && initializer.literals.size() > type.arraySize)
        return "more values than the array's " + std::to_string(type.arraySize);
    std::vector<CimScalar> scalars(initializer.literals.size());
    for (std::size_t i = 0; i < scalars.size(); ++i) {
        std::string fault =
            std::visit(ScalarOf(type.type, scalars[i]), initializer.literals[i].value);
        if (!fault.empty()) return fault;
    }
    value = std::make_shared<const std::vector<CimScalar>>(std::move(scalars));
    return {};
}

std::string printMofValue(const CimValue& value, CimType type, bool isArray) {
    if (!value) return "NULL";
    std::string text;
    for (const CimScalar& scalar : *value) {
        if (!text.empty()) text += ", ";
        text += printScalar(scalar, type);
    }
    return isArray ? "{" + text + "}" : text;
}

}  // namespace cimom

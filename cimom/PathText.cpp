#include "PathText.h"

#include <strings.h>

#include <algorithm>
#include <cerrno>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <cstring>

#include "Failure.h"

namespace cimom {

namespace {

constexpr std::string_view kInstanceOf = "instance of ";
constexpr int kDeepest = 50;

// The shortest text that reads back as the same number, with something that shows it is a real.
std::string printReal(double value, bool single) {
    if (!std::isfinite(value)) {
        return std::isnan(value) ? "NaN" : value < 0 ? "-INF" : "INF";
    }
    char text[40];
    for (int digits = 6; digits <= 17; ++digits) {
        std::snprintf(text, sizeof text, "%.*g", digits, value);
        const double back = std::strtod(text, nullptr);
        const bool same = single ? static_cast<float>(back) == static_cast<float>(value)
                                 : std::abs(back - value) <= 0.0;
        if (same) {
            break;
        }
    }
    std::string out = text;
    if (out.find_first_of(".e") == std::string::npos) {
        out += ".0";
    }
    return out;
}

}  // namespace

bool parseNumber(const std::string& text, CMPIType type, Value& result) {
    if (text.empty() || std::strchr(" \t\n", text[0])) {
        return false;
    }
    char* end = nullptr;
    errno = 0;
    Value wide;
    if (type == CMPI_real32 || type == CMPI_real64) {
        wide = Value(std::strtod(text.c_str(), &end));
    } else if (text[0] == '-') {
        wide = Value(std::int64_t{std::strtoll(text.c_str(), &end, 10)});
    } else {
        wide = Value(std::uint64_t{std::strtoull(text.c_str(), &end, 10)});
    }
    // The smallest reals are out of range for strtod, and right all the same.
    const bool tiny = wide.type() == CMPI_real64 && std::abs(wide.real()) < 1;
    return end == text.c_str() + text.size() && (errno == 0 || tiny) &&
           wide.convertTo(type, result);
}

namespace {

// Reads texts of the forms above from left to right.
class Scanner {
public:
    explicit Scanner(const std::string& text, std::size_t at = 0) : m_text(text), m_at(at) {}

    bool atEnd() const { return m_at == m_text.size(); }
    char peek() const { return atEnd() ? '\0' : m_text[m_at]; }
    void skipBlanks() {
        while (peek() == ' ' || peek() == '\t' || peek() == '\n' || peek() == '\r') {
            ++m_at;
        }
    }
    bool take(char c) {
        if (peek() != c || atEnd()) {
            return false;
        }
        ++m_at;
        return true;
    }

    /// Up to one of the stops or the end, without trailing blanks.
    std::string word(const char* stops) {
        const std::size_t end = std::min(m_text.find_first_of(stops, m_at), m_text.size());
        std::string out = m_text.substr(m_at, end - m_at);
        m_at = end;
        while (!out.empty() && std::strchr(" \t\r\n", out.back())) {
            out.pop_back();
        }
        return out;
    }

    /// A text between quotes, escapes resolved.
    std::string quotedText() {
        const char quote = m_text[m_at++];
        std::string out;
        while (!atEnd() && peek() != quote) {
            out += take('\\') ? escaped() : std::string(1, m_text[m_at++]);
        }
        if (!take(quote)) {
            fail("a quote is not closed");
        }
        return out;
    }

    /// A value as printValue prints it.
    Value literal(const char* stops) {
        if (peek() == '{') {
            return arrayLiteral();
        }
        if (m_text.compare(m_at, kInstanceOf.size(), kInstanceOf) == 0) {
            return Value(instance());
        }
        if (peek() == '"') {
            return Value(quotedText());
        }
        if (peek() == '\'') {
            return charLiteral();
        }
        const std::string bare = word(stops);
        if (strcasecmp(bare.c_str(), "true") == 0) {
            return Value(true);
        }
        if (strcasecmp(bare.c_str(), "false") == 0) {
            return Value(false);
        }
        if (strcasecmp(bare.c_str(), "null") == 0) {
            return Value();
        }
        return number(bare);
    }

    /// `instance of Class { name = value; ... }`; the first two words may be missing.
    Instance instance() {
        if (++m_depth > kDeepest) {
            fail("too deep a nesting");
        }
        Instance read;
        if (m_text.compare(m_at, kInstanceOf.size(), kInstanceOf) == 0) {
            m_at += kInstanceOf.size();
        }
        skipBlanks();
        read.path.className = word("{");
        if (read.path.className.empty() || !take('{')) {
            fail("Class { is missing");
        }
        for (skipBlanks(); !take('}'); skipBlanks()) {
            const std::string name = word("=;}");
            if (name.empty() || !take('=')) {
                fail("name = value is missing");
            }
            skipBlanks();
            read.properties.add(name, literal(";}"));
            skipBlanks();
            if (peek() != '}' && !take(';')) {
                fail("a semicolon is missing");
            }
        }
        --m_depth;
        return read;
    }

    [[noreturn]] void fail(const std::string& why) const {
        throw Failure(CMPI_RC_ERR_INVALID_PARAMETER,
                      "at character " + std::to_string(m_at + 1) + " of '" + m_text + "': " + why);
    }

private:
    std::string escaped() {
        if (atEnd()) {
            fail("nothing behind a backslash");
        }
        const char letter = m_text[m_at++];
        if (letter == 'x' || letter == 'X') {
            const std::string hex = m_text.substr(m_at, 4);
            char* end = nullptr;
            const unsigned long unit = std::strtoul(hex.c_str(), &end, 16);
            if (hex.size() != 4 || end != hex.c_str() + 4) {
                fail("\\x needs four hex digits");
            }
            m_at += 4;
            m_unit = static_cast<std::uint16_t>(unit);
            return utf8(m_unit);
        }
        const char meant = meaningOfEscape(letter);
        if (meant == 0) {
            fail("unknown escape");
        }
        return {meant};
    }

    Value charLiteral() {
        m_unit = 0;
        const std::string text = quotedText();
        if (text.size() == 1) {
            return Value::char16(static_cast<unsigned char>(text[0]));
        }
        if (text.empty() || m_unit == 0) {
            fail("not one character");
        }
        return Value::char16(m_unit);
    }

    Value arrayLiteral() {
        if (++m_depth > kDeepest) {
            fail("too deep a nesting");
        }
        take('{');
        Value::Array elements;
        for (skipBlanks(); !take('}'); skipBlanks()) {
            elements.push_back(literal(",}"));
            skipBlanks();
            if (peek() != '}' && !take(',')) {
                fail("a comma is missing");
            }
        }
        --m_depth;
        // Elements of one type; the first that is not null tells which.
        CMPIType type = CMPI_string;
        for (auto each = elements.rbegin(); each != elements.rend(); ++each) {
            if (!each->isNull()) {
                type = each->type();
            }
        }
        for (Value& each : elements) {
            if (!each.convertTo(type, each)) {
                fail("an array of mixed types");
            }
        }
        return Value::array(type, std::move(elements));
    }

    Value number(const std::string& bare) const {
        Value value;
        for (const CMPIType type :
             std::initializer_list<CMPIType>{CMPI_sint64, CMPI_uint64, CMPI_real64}) {
            if (parseNumber(bare, type, value)) {
                return value;
            }
        }
        fail("'" + bare + "' is no value");
    }

    const std::string& m_text;
    std::size_t m_at;
    int m_depth = 0;
    std::uint16_t m_unit = 0;  // of the last \x
};

void appendProperties(std::string& out, const Instance& instance, const std::string& indent);

std::string instanceText(const Instance& instance, const std::string& indent) {
    std::string out = "instance of " + instance.path.className + " {\n";
    appendProperties(out, instance, indent + "    ");
    return out + indent + "}";
}

std::string valueText(const Value& value, const std::string& indent) {
    if (value.isNull()) {
        return "NULL";
    }
    if (value.isArray()) {
        std::string out = "{";
        for (const Value& element : value.elements()) {
            if (out.size() > 1) {
                out += ", ";
            }
            out += valueText(element, indent);
        }
        return out + "}";
    }
    switch (value.type()) {
        case CMPI_boolean:
            return value.boolean() ? "true" : "false";
        case CMPI_char16:
            return quotedUnit(value.uint(), Controls::ByLetter);
        case CMPI_real32:
            return printReal(value.real(), true);
        case CMPI_real64:
            return printReal(value.real(), false);
        case CMPI_string:
            return quoted(value.text(), '"', Controls::ByLetter);
        case CMPI_dateTime:
            return quoted(value.dateTime().text(), '"', Controls::ByLetter);
        case CMPI_ref:
            return quoted(printPath(value.reference()), '"', Controls::ByLetter);
        case CMPI_instance:
            return instanceText(value.instance(), indent);
        case CMPI_ptr:
            return "<pointer>";
        default:
            break;
    }
    return value.isSigned() ? std::to_string(value.sint()) : std::to_string(value.uint());
}

void appendProperties(std::string& out, const Instance& instance, const std::string& indent) {
    for (const auto& [name, value] : instance.properties) {
        out += indent + name + " = " + valueText(value, indent) + ";\n";
    }
}

[[noreturn]] void mismatch(const std::string& text, CMPIType type) {
    throw Failure(CMPI_RC_ERR_TYPE_MISMATCH, "'" + text + "' is no " + typeName(type));
}

// A value as it is declared, from what could be read without knowing.
Value convertedValue(const Value& value, CMPIType type, const std::string& what) {
    Value typed;
    if (value.convertTo(type, typed)) {
        return typed;
    }
    if (value.type() == CMPI_string) {
        return parseValue(value.text(), type);
    }
    if (value.isArray() && (type & CMPI_ARRAY)) {
        const auto elementType = static_cast<CMPIType>(type & ~CMPI_ARRAY);
        Value::Array elements;
        for (const Value& element : value.elements()) {
            elements.push_back(convertedValue(element, elementType, what));
        }
        return Value::array(elementType, std::move(elements));
    }
    throw Failure(CMPI_RC_ERR_INVALID_PARAMETER, what + " is of type " + typeName(type));
}
Value declaredValue(const Value& value, CMPIType type, const std::string& what, Unfit unfit) {
    try {
        return convertedValue(value, type, what);
    } catch (const Failure&) {
        if (unfit == Unfit::Refused) {
            throw;
        }
        return value;
    }
}

Instance typedInstance(Instance instance, const ClassRepository* classes, Unfit unfit) {
    const CimClass* cls = classes ? classes->findClass(instance.path.className) : nullptr;
    if (!cls) {
        return instance;
    }
    NamedValues typed;
    for (const auto& [name, value] : instance.properties) {
        const CimProperty* property = cls->properties.find(name);
        if (!property && unfit == Unfit::Refused) {
            throw Failure(CMPI_RC_ERR_NO_SUCH_PROPERTY,
                          "class " + cls->name + " has no property " + name);
        }
        if (typed.find(name) && unfit == Unfit::Refused) {
            throw Failure(CMPI_RC_ERR_INVALID_PARAMETER, "property " + name + " stands twice");
        }
        Value own = value;
        if (!own.isNull() && own.type() == CMPI_instance) {
            own = Value(typedInstance(own.instance(), classes, unfit));
        }
        if (!property) {
            typed.add(name, std::move(own));
            continue;
        }
        typed.add(property->name, declaredValue(own, typeOf(*property),
                                                "property " + cls->name + "." + name, unfit));
        if (property->isKey) {
            instance.path.keys.set(property->name, *typed.find(name));
        }
    }
    instance.properties = std::move(typed);
    return instance;
}

Instance wholeInstance(const std::string& text) {
    Scanner scanner(text);
    scanner.skipBlanks();
    Instance instance = scanner.instance();
    scanner.skipBlanks();
    scanner.take(';');
    scanner.skipBlanks();
    if (!scanner.atEnd()) {
        scanner.fail("something follows the instance");
    }
    return instance;
}

Value parseArray(const std::string& text, CMPIType elementType, const ClassRepository* classes,
                 Unfit unfit) {
    Scanner scanner(text);
    Value::Array elements;
    scanner.skipBlanks();
    const bool braces = scanner.take('{');
    scanner.skipBlanks();
    const char* const stops = braces ? ",}" : ",";
    while (!scanner.atEnd() && scanner.peek() != '}') {
        if (elementType == CMPI_instance) {
            elements.emplace_back(typedInstance(scanner.instance(), classes, unfit));
        } else if (scanner.peek() == '"') {
            elements.push_back(parseValue(scanner.quotedText(), elementType));
        } else {
            elements.push_back(parseValue(scanner.word(stops), elementType));
        }
        scanner.skipBlanks();
        if (!scanner.take(',')) {
            break;
        }
        scanner.skipBlanks();
    }
    if (braces && !scanner.take('}')) {
        scanner.fail("a brace is not closed");
    }
    scanner.skipBlanks();
    if (!scanner.atEnd()) {
        scanner.fail("something follows the array");
    }
    return Value::array(elementType, std::move(elements));
}

}  // namespace

std::string printPath(const ObjectPath& path) {
    std::string out;
    if (!path.host.empty()) {
        out += "//" + path.host + "/";
    }
    if (!path.nameSpace.empty()) {
        out += path.nameSpace + ":";
    }
    out += path.className;
    char separator = '.';
    for (const auto& [name, value] : path.keys) {
        out += separator + name + "=" + valueText(value, {});
        separator = ',';
    }
    return out;
}

ObjectPath parsePath(const std::string& text, Unfit unfit) {
    ObjectPath path;
    std::size_t at = 0;
    if (text.compare(0, 2, "//") == 0) {
        const std::size_t slash = text.find('/', 2);
        if (slash == std::string::npos || slash == 2) {
            Scanner(text).fail("no host behind //");
        }
        path.host = text.substr(2, slash - 2);
        at = slash + 1;
    }
    // Behind the first quote stand key values, in which anything may occur.
    const std::size_t colon = text.find_first_of(":\"", at);
    if (colon != std::string::npos && text[colon] == ':') {
        path.nameSpace = text.substr(at, colon - at);
        if (path.nameSpace.empty()) {
            Scanner(text, at).fail("no namespace before the colon");
        }
        at = colon + 1;
    }
    Scanner scanner(text, at);
    path.className = scanner.word(".\"=,");
    if (path.className.empty()) {
        scanner.fail("no class name");
    }
    if (scanner.atEnd()) {
        return path;
    }
    if (!scanner.take('.')) {
        scanner.fail("a dot is missing behind the class name");
    }
    do {
        scanner.skipBlanks();
        const std::string key = scanner.word("=,\"");
        if (key.empty() || !scanner.take('=')) {
            scanner.fail("key=value is missing");
        }
        if (path.keys.find(key) && unfit == Unfit::Refused) {
            scanner.fail("key " + key + " stands twice");
        }
        scanner.skipBlanks();
        path.keys.add(key, scanner.literal(","));
        scanner.skipBlanks();
    } while (scanner.take(','));
    if (!scanner.atEnd()) {
        scanner.fail("a comma is missing");
    }
    return path;
}

std::string printValue(const Value& value) { return valueText(value, {}); }

std::string plainText(const Value& value) {
    if (!value.isNull() && value.type() == CMPI_string) {
        return value.text();
    }
    if (!value.isNull() && value.type() == CMPI_dateTime) {
        return value.dateTime().text();
    }
    if (!value.isNull() && value.type() == CMPI_ref) {
        return printPath(value.reference());
    }
    return printValue(value);
}

namespace {

Value parseDeclared(const std::string& text, CMPIType type, const ClassRepository* classes,
                    Unfit unfit) {
    if (type & CMPI_ARRAY) {
        return parseArray(text, static_cast<CMPIType>(type & ~CMPI_ARRAY), classes, unfit);
    }
    Value result;
    switch (type) {
        case CMPI_string:
            return Value(text);
        case CMPI_boolean:
            if (strcasecmp(text.c_str(), "true") == 0) {
                return Value(true);
            }
            if (strcasecmp(text.c_str(), "false") == 0) {
                return Value(false);
            }
            mismatch(text, type);
        case CMPI_char16:
            if (text.size() == 1) {
                return Value::char16(static_cast<unsigned char>(text[0]));
            }
            result = Scanner(text).literal("");
            if (result.isNull() || result.type() != CMPI_char16) {
                mismatch(text, type);
            }
            return result;
        case CMPI_dateTime:
            if (!Value(text).convertTo(type, result)) {
                mismatch(text, type);
            }
            return result;
        case CMPI_ref:
            return Value(classes ? typedKeys(parsePath(text, unfit), *classes, unfit)
                                 : parsePath(text, unfit));
        case CMPI_instance:
            return Value(typedInstance(wholeInstance(text), classes, unfit));
        default:
            if (!parseNumber(text, type, result)) {
                mismatch(text, type);
            }
            return result;
    }
}

}  // namespace

Value parseValue(const std::string& text, CMPIType type, const ClassRepository* classes,
                 Unfit unfit) {
    try {
        return parseDeclared(text, type, classes, unfit);
    } catch (const Failure&) {
        if (unfit == Unfit::Refused) {
            throw;
        }
        return guessValue(text);
    }
}

Value guessValue(const std::string& text) {
    try {
        Scanner scanner(text);
        Value value = scanner.literal("");
        if (scanner.atEnd()) {
            return value;
        }
    } catch (const Failure&) {  // not quoted, and so a string
    }
    return Value(text);
}

std::string printInstance(const Instance& instance) {
    return "// " + printPath(instance.path) + "\n" + instanceText(instance, {}) + ";\n";
}

ObjectPath typedKeys(const ObjectPath& path, const ClassRepository& classes, Unfit unfit) {
    const CimClass* cls = classes.findClass(path.className);
    if (!cls) {
        return path;
    }
    ObjectPath typed = path;
    typed.keys = {};
    for (const auto& [name, value] : path.keys) {
        const CimProperty* property = cls->properties.find(name);
        if (!property || value.isNull()) {
            typed.keys.add(name, value);
            continue;
        }
        Value key =
            declaredValue(value, typeOf(*property), "key " + name + " of " + cls->name, unfit);
        if (key.type() == CMPI_ref) {
            key = Value(typedKeys(key.reference(), classes, unfit));
        }
        typed.keys.add(name, std::move(key));
    }
    return typed;
}

void takeKeys(Instance& instance, const ClassRepository* classes) {
    const CimClass* cls = classes ? classes->findClass(instance.path.className) : nullptr;
    if (!cls) {
        return;
    }
    for (const CimProperty* key : cls->keys) {
        if (const Value* value = instance.properties.find(key->name)) {
            instance.path.keys.set(key->name, *value);
        }
    }
}

}  // namespace cimom

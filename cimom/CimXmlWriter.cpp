#include "CimXmlWriter.h"

#include <algorithm>

#include "Literal.h"
#include "PathText.h"

namespace cimom {

// -- text ---------------------------------------------------------------------------------------

namespace {

constexpr const char* kReplacement = "\xEF\xBF\xBD";

/// Length of the UTF-8 sequence at the beginning of a text that is not ASCII, if it is one that a
/// document may hold; else 0.
std::size_t sequenceLength(std::string_view text) {
    const auto byte = [&](std::size_t i) {
        return i < text.size() ? static_cast<unsigned char>(text[i]) : 0U;
    };
    const unsigned lead = byte(0);
    const std::size_t length = lead >= 0xF0 ? 4 : lead >= 0xE0 ? 3 : 2;
    unsigned code = lead & (0xFFU >> (length + 1));
    for (std::size_t i = 1; i < length; ++i) {
        if ((byte(i) & 0xC0) != 0x80) {
            return 0;
        }
        code = code << 6 | (byte(i) & 0x3F);
    }
    constexpr unsigned kLowest[] = {0, 0, 0x80, 0x800, 0x10000};
    const bool surrogate = code >= 0xD800 && code < 0xE000;
    const bool fits = lead >= 0xC0 && lead < 0xF8 && code >= kLowest[length] && code <= 0x10FFFF &&
                      !surrogate && code != 0xFFFE && code != 0xFFFF;
    return fits ? length : 0;
}

/// What a character of ASCII is written as; null for itself.
const char* escapeOf(char c) {
    switch (c) {
        case '<':
            return "&lt;";
        case '>':
            return "&gt;";
        case '&':
            return "&amp;";
        case '"':
            return "&quot;";
        case '\t':  // by number, as else readers make blanks of these
            return "&#9;";
        case '\n':
            return "&#10;";
        case '\r':
            return "&#13;";
        default:
            return static_cast<unsigned char>(c) < 0x20 ? kReplacement : nullptr;
    }
}

}  // namespace

void writeXmlText(std::string& out, std::string_view text) {
    const auto isAscii = [&](std::size_t at) {
        return static_cast<unsigned char>(text[at]) < 0x80;
    };
    for (std::size_t at = 0; at < text.size();) {
        const std::size_t begin = at;
        while (at < text.size() && isAscii(at) && !escapeOf(text[at])) {
            ++at;
        }
        out.append(text, begin, at - begin);
        if (at == text.size()) {
            return;
        }
        if (isAscii(at)) {
            out.append(escapeOf(text[at++]));
            continue;
        }
        const std::size_t length = sequenceLength(text.substr(at));
        length == 0 ? out.append(kReplacement) : out.append(text, at, length);
        at += length == 0 ? 1 : length;
    }
}

void openElement(std::string& out, const char* name, XmlAttributes attributes) {
    out += '<';
    out += name;
    for (const auto& [attribute, value] : attributes) {
        if (attribute) {
            out += ' ';
            out += attribute;
            out += "=\"";
            writeXmlText(out, value);
            out += '"';
        }
    }
    out += '>';
}

void closeElement(std::string& out, const char* name) {
    out += "</";
    out += name;
    out += '>';
}

void writeTextElement(std::string& out, const char* name, std::string_view text) {
    writeElement(out, name, {}, [&] { writeXmlText(out, text); });
}

// -- values -------------------------------------------------------------------------------------

namespace {

CMPIType scalarType(CMPIType type) { return static_cast<CMPIType>(type & ~CMPI_ARRAY); }

bool embeds(const Value& value) { return scalarType(value.type()) == CMPI_instance; }

void writeNameSpace(std::string& out, const std::string& nameSpace) {
    writeElement(out, "LOCALNAMESPACEPATH", {}, [&] {
        for (std::size_t at = 0; at <= nameSpace.size();) {
            const std::size_t end = std::min(nameSpace.find('/', at), nameSpace.size());
            openElement(out, "NAMESPACE",
                        {{"NAME", std::string_view(nameSpace).substr(at, end - at)}});
            closeElement(out, "NAMESPACE");
            at = end + 1;
        }
    });
}

void writePath(std::string& out, const ObjectPath& path) {
    if (!path.host.empty() && !path.nameSpace.empty()) {
        writeInstancePath(out, path, path.host);
    } else if (path.nameSpace.empty()) {
        writeInstanceName(out, path);
    } else {
        writeElement(out, "LOCALINSTANCEPATH", {}, [&] {
            writeNameSpace(out, path.nameSpace);
            writeInstanceName(out, path);
        });
    }
}

void writeScalar(std::string& out, const Value& value) {
    switch (value.type()) {
        case CMPI_ref:
            writeElement(out, "VALUE.REFERENCE", {}, [&] { writePath(out, value.reference()); });
            return;
        case CMPI_instance: {
            std::string xml;
            writeInstance(xml, value.instance());
            return writeTextElement(out, "VALUE", xml);
        }
        case CMPI_string:
            return writeTextElement(out, "VALUE", value.text());
        case CMPI_char16:
            return writeTextElement(out, "VALUE", utf8(static_cast<unsigned>(value.uint())));
        case CMPI_boolean:
            return writeTextElement(out, "VALUE", value.boolean() ? "TRUE" : "FALSE");
        default:
            writeTextElement(out, "VALUE", plainText(value));
    }
}

}  // namespace

const char* xmlTypeName(CMPIType type) {
    const CMPIType scalar = scalarType(type);
    const char* const name = scalar == CMPI_ref ? "reference" : declaredTypeName(scalar);
    return name ? name : "string";
}

void writeValue(std::string& out, const Value& value) {
    if (value.isNull()) {
        return;
    }
    if (!value.isArray()) {
        return writeScalar(out, value);
    }
    const char* const name = value.type() == CMPI_refA ? "VALUE.REFARRAY" : "VALUE.ARRAY";
    writeElement(out, name, {}, [&] {
        for (const Value& element : value.elements()) {
            if (element.isNull()) {
                out += "<VALUE.NULL/>";
            } else {
                writeScalar(out, element);
            }
        }
    });
}

void writeParameter(std::string& out, const char* element, std::string_view name,
                    const Value& value) {
    writeElement(out, element,
                 {{name.empty() ? nullptr : "NAME", name},
                  {"PARAMTYPE", xmlTypeName(value.type())},
                  {embeds(value) ? "EmbeddedObject" : nullptr, "instance"}},
                 [&] { writeValue(out, value); });
}

// -- objects ------------------------------------------------------------------------------------

void writeClassName(std::string& out, std::string_view name) {
    openElement(out, "CLASSNAME", {{"NAME", name}});
    closeElement(out, "CLASSNAME");
}

namespace {

void writeKey(std::string& out, const Value& value) {
    if (value.type() == CMPI_ref && !value.isNull()) {
        return writeScalar(out, value);
    }
    const bool number = isInteger(value.type()) || isReal(value.type());
    const char* const kind = value.type() == CMPI_boolean ? "boolean"
                             : number                     ? "numeric"
                                                          : "string";
    writeElement(out, "KEYVALUE", {{"VALUETYPE", kind}, {"TYPE", xmlTypeName(value.type())}}, [&] {
        if (value.isNull()) {
            return;
        }
        writeXmlText(out, value.type() == CMPI_char16 ? utf8(static_cast<unsigned>(value.uint()))
                                                      : plainText(value));
    });
}

void writeProperty(std::string& out, const std::string& name, const Value& value) {
    const bool reference = value.type() == CMPI_ref;
    const char* const element = value.isArray() ? "PROPERTY.ARRAY"
                                : reference     ? "PROPERTY.REFERENCE"
                                                : "PROPERTY";
    writeElement(out, element,
                 {{"NAME", name},
                  {reference ? nullptr : "TYPE", xmlTypeName(value.type())},
                  {embeds(value) ? "EmbeddedObject" : nullptr, "instance"}},
                 [&] { writeValue(out, value); });
}

}  // namespace

void writeInstanceName(std::string& out, const ObjectPath& path) {
    writeElement(out, "INSTANCENAME", {{"CLASSNAME", path.className}}, [&] {
        for (const auto& [name, value] : path.keys) {
            const Value& key = value;
            writeElement(out, "KEYBINDING", {{"NAME", name}}, [&] { writeKey(out, key); });
        }
    });
}

void writeInstancePath(std::string& out, const ObjectPath& path, std::string_view host) {
    writeElement(out, "INSTANCEPATH", {}, [&] {
        writeElement(out, "NAMESPACEPATH", {}, [&] {
            writeTextElement(out, "HOST", path.host.empty() ? host : path.host);
            writeNameSpace(out, path.nameSpace);
        });
        writeInstanceName(out, path);
    });
}

void writeInstance(std::string& out, const Instance& instance) {
    writeElement(out, "INSTANCE", {{"CLASSNAME", instance.path.className}}, [&] {
        for (const auto& [name, value] : instance.properties) {
            writeProperty(out, name, value);
        }
    });
}

}  // namespace cimom

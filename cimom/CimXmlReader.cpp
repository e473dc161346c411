#include "CimXmlReader.h"

#include <algorithm>
#include <cerrno>
#include <cstdlib>

#include "Failure.h"
#include "Literal.h"

namespace cimom {

namespace {

[[noreturn]] void notValid(const std::string& why) {
    throw CimXmlFault(kBadRequest, "request-not-valid", why);
}

/// The one child that an element has, of a name among those given.
const XmlElement& onlyChild(const XmlElement& element) {
    if (element.children.size() != 1) {
        notValid("one element belongs into " + element.name);
    }
    return element.children.front();
}

const XmlElement& neededChild(const XmlElement& element, const char* name) {
    const XmlElement* found = element.child(name);
    if (!found) {
        notValid(element.name + " lacks " + name);
    }
    return *found;
}

struct Version {
    const char* attribute;
    const char* begin;
    const char* cimError;
};
/// The versions are all of one kind: whatever stands behind the point is compatible.
void checkVersion(const XmlElement& element, const Version& version) {
    if (neededAttribute(element, version.attribute).rfind(version.begin, 0) != 0) {
        throw CimXmlFault(kNotImplemented, version.cimError,
                          std::string(version.attribute) + " other than " + version.begin + "x");
    }
}

const XmlElement& simpleRequest(const XmlElement& document) {
    if (document.name != "CIM") {
        notValid("the document is no CIM but " + document.name);
    }
    checkVersion(document, {"CIMVERSION", "2.", "unsupported-cim-version"});
    checkVersion(document, {"DTDVERSION", "2.", "unsupported-dtd-version"});
    const XmlElement& message = onlyChild(document);
    if (message.name != "MESSAGE") {
        refuseElement(message);
    }
    checkVersion(message, {"PROTOCOLVERSION", "1.", "unsupported-protocol-version"});
    const XmlElement& request = onlyChild(message);
    if (request.name == "MULTIREQ") {
        throw CimXmlFault(kNotImplemented, "multiple-requests-unsupported", "one at a time");
    }
    if (request.name != "SIMPLEREQ") {
        refuseElement(request);
    }
    return request;
}

std::string nameSpaceOf(const XmlElement& local) {
    std::string all;
    for (const XmlElement& each : local.children) {
        if (each.name != "NAMESPACE") {
            refuseElement(each);
        }
        all += "/" + neededAttribute(each, "NAME");
    }
    if (all.empty()) {
        notValid("a path without a namespace");
    }
    if ((all + "/").find("//") != std::string::npos) {
        notValid("a namespace with an empty part");  // which would be read back as another
    }
    return all.substr(1);
}

}  // namespace

void refuseElement(const XmlElement& element) {
    notValid(element.name + " stands where it does not belong");
}

const std::string& neededAttribute(const XmlElement& element, const char* name) {
    const std::string* value = element.attribute(name);
    if (!value) {
        notValid(element.name + " lacks the attribute " + name);
    }
    return *value;
}

std::string trimmed(const std::string& text) {
    constexpr const char* kBlanks = " \t\r\n";
    const std::size_t begin = text.find_first_not_of(kBlanks);
    return begin == std::string::npos
               ? ""
               : text.substr(begin, text.find_last_not_of(kBlanks) - begin + 1);
}

CimXmlCall readCimXmlCall(std::string_view text) {
    CimXmlCall call;
    try {
        call.document = std::make_unique<const XmlElement>(parseXml(text));
    } catch (const XmlError& error) {
        throw CimXmlFault(kBadRequest, "request-not-well-formed", error.what());
    }
    const XmlElement& request = simpleRequest(*call.document);
    call.id = neededAttribute(call.document->children.front(), "ID");
    const XmlElement* operation = nullptr;
    for (const XmlElement& each : request.children) {
        if (each.name != "CORRELATOR") {
            operation = operation ? &request : &each;
        }
    }
    if (!operation || (operation->name != "IMETHODCALL" && operation->name != "METHODCALL")) {
        notValid("a request is one IMETHODCALL or METHODCALL");
    }
    call.intrinsic = operation->name == "IMETHODCALL";
    call.name = neededAttribute(*operation, "NAME");
    const char* const parameter = call.intrinsic ? "IPARAMVALUE" : "PARAMVALUE";
    for (const XmlElement& each : operation->children) {
        if (each.name == parameter) {
            call.parameters.push_back(&each);
        } else if (call.object) {
            refuseElement(each);
        } else {
            call.object = &each;
        }
    }
    if (!call.object) {
        notValid(operation->name + " has no place to work");
    }
    if (call.intrinsic) {
        if (call.object->name != "LOCALNAMESPACEPATH") {
            refuseElement(*call.object);
        }
        call.nameSpace = nameSpaceOf(*call.object);
        call.object = nullptr;
    } else {
        if (call.object->name != "LOCALCLASSPATH" && call.object->name != "LOCALINSTANCEPATH") {
            refuseElement(*call.object);
        }
        call.nameSpace = nameSpaceOf(neededChild(*call.object, "LOCALNAMESPACEPATH"));
    }
    return call;
}

// -- paths --------------------------------------------------------------------------------------

ObjectPath CimXmlReader::path(const XmlElement& element) {
    ObjectPath path;
    if (element.name == "CLASSNAME") {
        path.className = neededAttribute(element, "NAME");
        return path;
    }
    if (element.name == "INSTANCENAME") {
        path.className = neededAttribute(element, "CLASSNAME");
        for (const XmlElement& each : element.children) {
            if (each.name == "KEYBINDING") {
                addKey(path, neededAttribute(each, "NAME"), onlyChild(each));
            } else {  // the only key of a class may stand without its name
                const CimClass* cls = m_classes ? m_classes->findClass(path.className) : nullptr;
                if (!cls || cls->keys.size() != 1) {
                    throw Failure(CMPI_RC_ERR_INVALID_PARAMETER, "a key without a name");
                }
                addKey(path, cls->keys.front()->name, each);
            }
        }
        return path;
    }
    if (element.name == "OBJECTPATH") {
        return this->path(onlyChild(element));
    }
    const bool local = element.name == "LOCALCLASSPATH" || element.name == "LOCALINSTANCEPATH";
    if (!local && element.name != "CLASSPATH" && element.name != "INSTANCEPATH") {
        refuseElement(element);
    }
    if (element.children.size() != 2) {
        notValid(element.name + " is a namespace and a name");
    }
    const XmlElement& name = element.children[1];
    if (name.name != "CLASSNAME" && name.name != "INSTANCENAME") {
        refuseElement(name);
    }
    path = this->path(name);
    if (local) {
        path.nameSpace = nameSpaceOf(neededChild(element, "LOCALNAMESPACEPATH"));
    } else {
        const XmlElement& whole = neededChild(element, "NAMESPACEPATH");
        path.host = trimmed(neededChild(whole, "HOST").text);
        path.nameSpace = nameSpaceOf(neededChild(whole, "LOCALNAMESPACEPATH"));
    }
    return path;
}

void CimXmlReader::addKey(ObjectPath& path, const std::string& name, const XmlElement& element) {
    Value value;
    if (element.name == "VALUE.REFERENCE") {
        value = Value(this->path(onlyChild(element)));
    } else if (element.name == "KEYVALUE") {
        const std::string* kind = element.attribute("VALUETYPE");
        if (!kind || *kind == "string") {
            value = Value(element.text);
        } else if (*kind == "boolean") {
            value = parseValue(trimmed(element.text), CMPI_boolean);
        } else if (*kind == "numeric") {
            value = guessValue(trimmed(element.text));
        } else {
            notValid("VALUETYPE " + *kind);
        }
    } else {
        refuseElement(element);
    }
    if (path.keys.find(name) && m_unfit == Unfit::Refused) {
        throw Failure(CMPI_RC_ERR_INVALID_PARAMETER, "key " + name + " stands twice");
    }
    path.keys.add(name, std::move(value));
}

// -- values -------------------------------------------------------------------------------------

namespace {

[[noreturn]] void mismatch(const std::string& what, CMPIType type) {
    throw Failure(CMPI_RC_ERR_TYPE_MISMATCH, what + " is no " + typeName(type));
}

/// The character of a text that is one, of the first plane of Unicode as a char16 is.
Value characterOf(const std::string& text) {
    const auto byte = [&](std::size_t i) { return static_cast<unsigned char>(text[i]); };
    if (text.size() == 1) {
        return Value::char16(byte(0));
    }
    if (text.size() == 2) {
        return Value::char16(
            static_cast<std::uint16_t>((byte(0) & 0x1FU) << 6 | (byte(1) & 0x3FU)));
    }
    if (text.size() == 3 && byte(0) >= 0xE0) {
        return Value::char16(static_cast<std::uint16_t>(
            (byte(0) & 0x0FU) << 12 | (byte(1) & 0x3FU) << 6 | (byte(2) & 0x3FU)));
    }
    mismatch("'" + text + "'", CMPI_char16);
}

/// An integer may be written with sixteen digits, too.
std::string decimal(const std::string& text) {
    const std::size_t digits = text.find_first_not_of("+-");
    if (digits == std::string::npos || digits > 1 || text.size() < digits + 3 ||
        text[digits] != '0' || (text[digits + 1] != 'x' && text[digits + 1] != 'X')) {
        return text;
    }
    char* end = nullptr;
    errno = 0;
    const auto number =
        static_cast<std::uint64_t>(std::strtoull(text.c_str() + digits + 2, &end, 16));
    if (*end != '\0' || errno != 0) {
        return text;  // which is no number
    }
    return (text[0] == '-' ? "-" : "") + std::to_string(number);
}

bool isArrayElement(const XmlElement& element) {
    return element.name == "VALUE.ARRAY" || element.name == "VALUE.REFARRAY";
}

}  // namespace

Value CimXmlReader::value(const XmlElement& holder, CMPIType type) {
    const bool array = (type & CMPI_ARRAY) != 0;
    const auto elementType = static_cast<CMPIType>(type & ~CMPI_ARRAY);
    for (const XmlElement& each : holder.children) {
        if (each.name == "QUALIFIER") {
            continue;
        }
        if (each.name.rfind("VALUE", 0) != 0) {
            refuseElement(each);
        }
        if (isArrayElement(each) != array) {
            mismatch(each.name, type);
        }
        if (!array) {
            return single(each, elementType);
        }
        Value::Array elements;
        for (const XmlElement& element : each.children) {
            elements.push_back(element.name == "VALUE.NULL" ? Value::null(elementType)
                                                            : single(element, elementType));
        }
        return Value::array(elementType, std::move(elements));
    }
    return Value::null(type);
}

Value CimXmlReader::single(const XmlElement& element, CMPIType type) {
    if (element.name == "VALUE.REFERENCE") {
        if (type != CMPI_ref) {
            mismatch("a reference", type);
        }
        return Value(path(onlyChild(element)));
    }
    if (element.name != "VALUE" || !element.children.empty()) {
        refuseElement(element);
    }
    switch (type) {
        case CMPI_string:
            return Value(element.text);
        case CMPI_instance:
            return embedded(element.text);
        case CMPI_char16:
            return characterOf(element.text);
        case CMPI_ref:
            mismatch("a text", type);
        default:
            return parseValue(decimal(trimmed(element.text)), type);
    }
}

Value CimXmlReader::embedded(const std::string& text) {
    const struct Deeper {
        unsigned& depth;
        ~Deeper() { --depth; }
    } deeper{++m_embedding};
    if (deeper.depth > Value::kMostNested) {
        throw Failure(CMPI_RC_ERR_INVALID_PARAMETER, "too deep a nesting of instances");
    }
    try {
        return Value(instance(parseXml(text)));
    } catch (const XmlError& error) {
        throw Failure(CMPI_RC_ERR_INVALID_PARAMETER,
                      std::string("an embedded instance is no XML: ") + error.what());
    }
}

namespace {

bool saysEmbedded(const XmlElement& element) {
    return element.attribute("EmbeddedObject") || element.attribute("EMBEDDEDOBJECT");
}

/// The type by what the element itself says; a string when it says nothing.
CMPIType ownType(const XmlElement& element, const char* typeAttribute) {
    const std::string* name = element.attribute(typeAttribute);
    std::optional<CMPIType> type = name ? declaredTypeNamed(*name) : CMPI_string;
    if (element.name == "PROPERTY.REFERENCE" || element.child("VALUE.REFERENCE") ||
        element.child("VALUE.REFARRAY") || (name && *name == "reference")) {
        type = CMPI_ref;
    }
    if (!type) {
        notValid("there is no type " + *name);
    }
    if (type == CMPI_string && saysEmbedded(element)) {
        type = CMPI_instance;
    }
    const bool array =
        element.name == "PROPERTY.ARRAY" ||
        std::any_of(element.children.begin(), element.children.end(), isArrayElement);
    return static_cast<CMPIType>(*type | (array ? CMPI_ARRAY : 0));
}

}  // namespace

Value CimXmlReader::declaredValue(const XmlElement& element, const char* typeAttribute,
                                  const CimElement* declared) {
    if (declared) {
        try {
            return value(element, typeOf(*declared));
        } catch (const Failure&) {
            if (m_unfit == Unfit::Refused) {
                throw;
            }
        }
    }
    return value(element, ownType(element, typeAttribute));
}

void CimXmlReader::addValue(NamedValues& values, const XmlElement& element,
                            const char* typeAttribute, const CimElement* declared) {
    const std::string name = declared ? declared->name : neededAttribute(element, "NAME");
    if (values.find(name) && m_unfit == Unfit::Refused) {
        throw Failure(CMPI_RC_ERR_INVALID_PARAMETER, name + " stands twice");
    }
    values.add(name, declaredValue(element, typeAttribute, declared));
}

Instance CimXmlReader::instance(const XmlElement& element) {
    if (element.name == "VALUE.NAMEDINSTANCE" || element.name == "VALUE.INSTANCEWITHPATH") {
        if (element.children.size() != 2) {
            notValid(element.name + " is a path and an instance");
        }
        Instance named = instance(element.children[1]);
        named.path = path(element.children[0]);
        return named;
    }
    if (element.name != "INSTANCE") {
        refuseElement(element);
    }
    Instance instance;
    instance.path.className = neededAttribute(element, "CLASSNAME");
    const CimClass* cls = m_classes ? m_classes->findClass(instance.path.className) : nullptr;
    for (const XmlElement& each : element.children) {
        if (each.name == "QUALIFIER") {
            continue;
        }
        if (each.name.rfind("PROPERTY", 0) != 0) {
            refuseElement(each);
        }
        const std::string& name = neededAttribute(each, "NAME");
        const CimProperty* property = cls ? cls->properties.find(name) : nullptr;
        if (cls && !property && m_unfit == Unfit::Refused) {
            throw Failure(CMPI_RC_ERR_NO_SUCH_PROPERTY,
                          "class " + cls->name + " has no property " + name);
        }
        addValue(instance.properties, each, "TYPE", property);
    }
    return instance;
}

NamedValues CimXmlReader::arguments(const CimXmlCall& call, const CimMethod* declared) {
    NamedValues values;
    for (const XmlElement* each : call.parameters) {
        const std::string& name = neededAttribute(*each, "NAME");
        const CimParameter* parameter = declared ? declared->parameters.find(name) : nullptr;
        if (declared && !parameter && m_unfit == Unfit::Refused) {
            throw Failure(CMPI_RC_ERR_INVALID_PARAMETER,
                          "method " + declared->name + " has no parameter " + name);
        }
        addValue(values, *each, "PARAMTYPE", parameter);
    }
    return values;
}

}  // namespace cimom

// Classes and qualifier types as CIM-XML.

#include <algorithm>

#include "CimXmlWriter.h"

namespace cimom {

namespace {

const char* yesOrNo(bool flag) { return flag ? "true" : "false"; }

/// The class of the lineage in whose declaration a feature stands; its elements are shared by
/// those that inherit it.
template <class T>
const CimClass& originOf(const CimClass& cls, const T& feature, NamedList<T> CimClass::*features) {
    const auto origin = std::find_if(
        cls.lineage.begin(), cls.lineage.end(),
        [&](const CimClass* each) { return (each->*features).find(feature.name) == &feature; });
    return origin == cls.lineage.end() ? cls : **origin;
}

void writeQualifiers(std::string& out, const CimQualified& element, const ClassForm& form) {
    if (!form.qualifiers) {
        return;
    }
    for (const auto& each : element.qualifiers) {
        writeElement(out, "QUALIFIER",
                     {{"NAME", each->name},
                      {"TYPE", xmlTypeName(each->value.type())},
                      {"OVERRIDABLE", yesOrNo(!(each->flavors & DisableOverride))},
                      {"TOSUBCLASS", yesOrNo(!(each->flavors & Restricted))},
                      {"TRANSLATABLE", yesOrNo(each->flavors & Translatable)}},
                     [&] { writeValue(out, each->value); });
    }
}

/// Begins a property, parameter or method; closed by the caller with the name returned.
void openTyped(std::string& out, const char* name, const CimElement& element, const CimClass* cls,
               const CimClass* origin, const ClassForm& form) {
    const bool reference = element.type == CMPI_ref;
    const std::string size = std::to_string(element.arraySize);
    // Clients in the field know this attribute of properties alone.
    const bool embeds =
        element.isEmbeddedObject && std::string_view(name).rfind("PROPERTY", 0) == 0;
    openElement(out, name,
                {{"NAME", element.name},
                 {reference ? nullptr : "TYPE", xmlTypeName(element.type)},
                 {reference && !element.referenceClass.empty() ? "REFERENCECLASS" : nullptr,
                  element.referenceClass},
                 {element.arraySize != 0 ? "ARRAYSIZE" : nullptr, size},
                 {origin && form.classOrigin ? "CLASSORIGIN" : nullptr, origin ? origin->name : ""},
                 {origin ? "PROPAGATED" : nullptr, yesOrNo(origin != cls)},
                 {embeds ? "EmbeddedObject" : nullptr,
                  element.embeddedClass.empty() ? "object" : "instance"}});
}

struct ElementNames {
    const char* scalar;
    const char* array;
    const char* reference;
    const char* referenceArray;
};
constexpr ElementNames kPropertyNames = {"PROPERTY", "PROPERTY.ARRAY", "PROPERTY.REFERENCE",
                                         "PROPERTY.ARRAY"};
constexpr ElementNames kParameterNames = {"PARAMETER", "PARAMETER.ARRAY", "PARAMETER.REFERENCE",
                                          "PARAMETER.REFARRAY"};
const char* nameFor(const CimElement& element, const ElementNames& names) {
    if (element.type == CMPI_ref) {
        return element.isArray ? names.referenceArray : names.reference;
    }
    return element.isArray ? names.array : names.scalar;
}

void writeProperty(std::string& out, const CimClass& cls, const CimProperty& property,
                   const CimClass& origin, const ClassForm& form) {
    const char* const name = nameFor(property, kPropertyNames);
    openTyped(out, name, property, &cls, &origin, form);
    writeQualifiers(out, property, form);
    writeValue(out, property.defaultValue);
    closeElement(out, name);
}

void writeMethod(std::string& out, const CimClass& cls, const CimMethod& method,
                 const CimClass& origin, const ClassForm& form) {
    openTyped(out, "METHOD", method, &cls, &origin, form);
    writeQualifiers(out, method, form);
    for (const auto& parameter : method.parameters) {
        const char* const name = nameFor(*parameter, kParameterNames);
        openTyped(out, name, *parameter, nullptr, nullptr, form);
        writeQualifiers(out, *parameter, form);
        closeElement(out, name);
    }
    closeElement(out, "METHOD");
}

}  // namespace

void writeClass(std::string& out, const CimClass& cls, const ClassForm& form) {
    const auto wanted = [&](const std::string& name, const CimClass& origin) {
        return (!form.localOnly || &origin == &cls) &&
               (!form.properties || containsName(*form.properties, name));
    };
    const std::string_view base = cls.superclass ? std::string_view(cls.superclass->name) : "";
    openElement(out, "CLASS",
                {{"NAME", cls.name}, {cls.superclass ? "SUPERCLASS" : nullptr, base}});
    writeQualifiers(out, cls, form);
    for (const auto& property : cls.properties) {
        const CimClass& origin = originOf(cls, *property, &CimClass::properties);
        if (wanted(property->name, origin)) {
            writeProperty(out, cls, *property, origin, form);
        }
    }
    for (const auto& method : cls.methods) {
        const CimClass& origin = originOf(cls, *method, &CimClass::methods);
        if (!form.localOnly || &origin == &cls) {
            writeMethod(out, cls, *method, origin, form);
        }
    }
    closeElement(out, "CLASS");
}

void writeQualifierType(std::string& out, const CimQualifierType& type) {
    const auto stands = [&](unsigned scope) { return yesOrNo((type.scopes & scope) != 0); };
    writeElement(out, "QUALIFIER.DECLARATION",
                 {{"NAME", type.name},
                  {"TYPE", xmlTypeName(type.type.type)},
                  {"ISARRAY", yesOrNo(type.type.isArray)},
                  {"OVERRIDABLE", yesOrNo(!(type.flavors & DisableOverride))},
                  {"TOSUBCLASS", yesOrNo(!(type.flavors & Restricted))},
                  {"TRANSLATABLE", yesOrNo((type.flavors & Translatable) != 0)}},
                 [&] {
                     openElement(out, "SCOPE",
                                 {{"CLASS", stands(ScopeClass)},
                                  {"ASSOCIATION", stands(ScopeAssociation)},
                                  {"REFERENCE", stands(ScopeReference)},
                                  {"PROPERTY", stands(ScopeProperty)},
                                  {"METHOD", stands(ScopeMethod)},
                                  {"PARAMETER", stands(ScopeParameter)},
                                  {"INDICATION", stands(ScopeIndication)}});
                     closeElement(out, "SCOPE");
                 });
}

}  // namespace cimom

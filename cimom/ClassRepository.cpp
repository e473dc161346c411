#include "ClassRepository.h"

#include <algorithm>

#include "MofValue.h"

namespace cimom {

bool CimElement::flag(std::string_view qualifier, bool otherwise) const {
    const CimQualifier* found = qualifiers.find(qualifier);
    if (!found || !found->value || found->value->empty()) return otherwise;
    const bool* value = std::get_if<bool>(&found->value->front());
    return value ? *value : otherwise;
}

bool CimClass::isA(const CimClass& base) const {
    return base.lineage.size() <= lineage.size() && lineage[base.lineage.size() - 1] == &base;
}

std::vector<const CimClass*> CimClass::allSubclasses() const {
    std::vector<const CimClass*> all(subclasses);
    for (std::size_t i = 0; i < all.size(); ++i)
        all.insert(all.end(), all[i]->subclasses.begin(), all[i]->subclasses.end());
    return all;
}

bool ClassRepository::isA(std::string_view name, std::string_view base) const {
    const CimClass* cls = findClass(name);
    const CimClass* ancestor = findClass(base);
    return cls && ancestor && cls->isA(*ancestor);
}

// ---- printing

namespace {

// Prints classes; knows which flavors go without saying.
class Printer {
public:
    Printer(const NamedList<CimQualifierType>& types, bool all) : m_types(types), m_all(all) {}

    std::string print(const CimClass& cls) {
        addQualifiers(cls.qualifiers, "");
        m_text += "class " + cls.name;
        if (cls.superclass) m_text += " : " + cls.superclass->name;
        m_text += " {\n";
        for (const auto& property : cls.properties)
            if (m_all || property->declaringClass == cls.name) addProperty(cls, *property);
        for (const auto& method : cls.methods)
            if (m_all || method->declaringClass == cls.name) addMethod(*method);
        return m_text + "};\n";
    }

private:
    void addProperty(const CimClass& cls, const CimProperty& property) {
        addElement(property, "    ");
        const CimProperty* base =
            cls.superclass ? cls.superclass->properties.find(property.name) : nullptr;
        if (property.defaultValue || (base && base->defaultValue))  // NULL is said against another
            m_text += " = " + printMofValue(property.defaultValue, property.type, property.isArray);
        m_text += ";\n";
    }

    void addMethod(const CimMethod& method) {
        addElement(method, "    ");
        m_text += "(";
        for (std::size_t i = 0; i < method.parameters.size(); ++i) {
            m_text += i > 0 ? ",\n" : "\n";
            addElement(method.parameters[i], "        ");
        }
        m_text += ");\n";
    }

    void addElement(const CimElement& element, const std::string& indent) {
        addQualifiers(element.qualifiers, indent);
        bool isReference = element.type == CimType::Reference;
        m_text += indent;
        m_text += isReference ? element.referenceClass + " ref" : cimTypeName(element.type);
        m_text += " " + element.name;
        if (!element.isArray) return;
        m_text += element.arraySize > 0 ? "[" + std::to_string(element.arraySize) + "]" : "[]";
    }

    void addQualifiers(const NamedList<CimQualifier>& qualifiers, const std::string& indent) {
        std::string list;
        for (const auto& qualifier : qualifiers) {
            if (qualifier->isPropagated && !m_all) continue;
            if (!list.empty()) list += ",\n" + indent + " ";
            list += qualifierText(*qualifier);
        }
        if (!list.empty()) m_text += indent + "[" + list + "]\n";
    }

    std::string qualifierText(const CimQualifier& qualifier) const {
        std::string text = qualifier.name;
        std::string value = printMofValue(qualifier.value, qualifier.type, qualifier.isArray);
        bool isFlag = qualifier.type == CimType::Boolean && value == "true";
        if (value[0] == '{')
            text += value;
        else if (!isFlag)
            text += "(" + value + ")";

        const CimQualifierType* type = m_types.find(qualifier.name);
        unsigned usual = type ? type->flavors : 0;
        std::string flavors;
        auto addFlavor = [&](unsigned flavor, const char* on, const char* off) {
            if (((qualifier.flavors ^ usual) & flavor) == 0) return;
            flavors += std::string(" ") + ((qualifier.flavors & flavor) != 0 ? on : off);
        };
        addFlavor(DisableOverride, "DisableOverride", "EnableOverride");
        addFlavor(Restricted, "Restricted", "ToSubclass");
        addFlavor(Translatable, "Translatable", "");
        return flavors.empty() ? text : text + " :" + flavors;
    }

    const NamedList<CimQualifierType>& m_types;
    const bool m_all;
    std::string m_text;
};

}  // namespace

std::string ClassRepository::toMof(const CimClass& cls, Features features) const {
    return Printer(m_qualifierTypes, features == Features::All).print(cls);
}

}  // namespace cimom

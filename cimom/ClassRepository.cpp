#include "ClassRepository.h"

#include <algorithm>

#include "MofValue.h"

namespace cimom {

namespace {

// The value of a qualifier, or the first of its values; null when there is none.
const Value* firstValue(const CimQualified& of, std::string_view qualifier) {
    const CimQualifier* found = of.qualifiers.find(qualifier);
    const Value* value = found && !found->value.isNull() ? &found->value : nullptr;
    if (!value || !value->isArray()) {
        return value;
    }
    return value->elements().empty() ? nullptr : &value->elements().front();
}

}  // namespace

bool CimQualified::flag(std::string_view qualifier, bool otherwise) const {
    const Value* value = firstValue(*this, qualifier);
    return value && value->type() == CMPI_boolean && !value->isNull() ? value->boolean()
                                                                      : otherwise;
}

const std::string* CimQualified::text(std::string_view qualifier) const {
    const Value* value = firstValue(*this, qualifier);
    return value && value->type() == CMPI_string && !value->isNull() ? &value->text() : nullptr;
}

CMPIType typeOf(const CimElement& element) {
    if (!element.isEmbeddedObject) {
        return element.cmpiType();
    }
    return element.isArray ? CMPI_instanceA : CMPI_instance;
}

bool CimClass::isA(const CimClass& base) const {
    return base.lineage.size() <= lineage.size() && lineage[base.lineage.size() - 1] == &base;
}

std::vector<const CimClass*> CimClass::allSubclasses() const {
    std::vector<const CimClass*> all(subclasses);
    for (std::size_t i = 0; i < all.size(); ++i) {
        all.insert(all.end(), all[i]->subclasses.begin(), all[i]->subclasses.end());
    }
    return all;
}

const CimClass::InitialValues& CimClass::initialValues() const {
    std::call_once(m_initialValues.made, [this] {
        for (std::size_t i = 0; i < properties.size(); ++i) {
            const CimProperty& property = properties[i];
            const std::string& lasting = lastingName(property.name);
            m_initialValues.names.push_back(&lasting);
            Value value = property.defaultValue;
            value.retypeNull(typeOf(property));
            if (!value.isNull()) {
                m_initialValues.ofDefaults.addLasting(lasting, Value(value));
            } else if (i < m_initialValues.without.size()) {
                m_initialValues.without.set(i);
            }
            m_initialValues.all.addLasting(lasting, std::move(value));
        }
    });
    return m_initialValues;
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
    explicit Printer(const NamedList<CimQualifierType>& types) : m_types(types) {}

    std::string print(const CimClass& cls) {
        addQualifiers(cls.qualifiers, "");
        m_text += "class " + cls.name;
        if (cls.superclass) {
            m_text += " : " + cls.superclass->name;
        }
        m_text += " {\n";
        for (const auto& property : cls.properties) {
            addProperty(cls, *property);
        }
        for (const auto& method : cls.methods) {
            addMethod(*method);
        }
        return m_text + "};\n";
    }

private:
    void addProperty(const CimClass& cls, const CimProperty& property) {
        addElement(property, "    ");
        const CimProperty* base =
            cls.superclass ? cls.superclass->properties.find(property.name) : nullptr;
        if (!property.defaultValue.isNull() || (base && !base->defaultValue.isNull())) {
            m_text += " = " + printMofValue(property.defaultValue);  // NULL against another
        }
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
        m_text += indent;
        if (element.type == CMPI_ref) {
            m_text += element.referenceClass + " ";
        }
        m_text += mofTypeWord(element) + " " + element.name + mofBrackets(element);
    }

    void addQualifiers(const NamedList<CimQualifier>& qualifiers, const std::string& indent) {
        std::string list;
        for (const auto& qualifier : qualifiers) {
            if (!list.empty()) {
                list += ",\n" + indent + " ";
            }
            list += qualifierText(*qualifier);
        }
        if (!list.empty()) {
            m_text += indent + "[" + list + "]\n";
        }
    }

    std::string qualifierText(const CimQualifier& qualifier) const {
        std::string text = qualifier.name;
        std::string value = printMofValue(qualifier.value);
        bool isFlag = qualifier.value.type() == CMPI_boolean && value == "true";
        if (value[0] == '{') {
            text += value;
        } else if (!isFlag) {
            text += "(" + value + ")";
        }

        const CimQualifierType* type = m_types.find(qualifier.name);
        unsigned usual = type ? type->flavors : 0;
        std::string flavors;
        auto addFlavor = [&](unsigned flavor, const char* on, const char* off) {
            if (((qualifier.flavors ^ usual) & flavor) == 0) {
                return;
            }
            flavors += std::string(" ") + ((qualifier.flavors & flavor) != 0 ? on : off);
        };
        addFlavor(DisableOverride, "DisableOverride", "EnableOverride");
        addFlavor(Restricted, "Restricted", "ToSubclass");
        addFlavor(Translatable, "Translatable", "");
        return flavors.empty() ? text : text + " :" + flavors;
    }

    const NamedList<CimQualifierType>& m_types;
    std::string m_text;
};

}  // namespace

std::string ClassRepository::toMof(const CimClass& cls) const {
    return Printer(m_qualifierTypes).print(cls);
}

}  // namespace cimom

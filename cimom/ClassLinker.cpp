#include <algorithm>
#include <string>
#include <unordered_map>
#include <utility>

#include "ClassRepository.h"
#include "MofValue.h"

namespace cimom {

namespace {

constexpr std::size_t kMaxFaults = 50;
constexpr std::size_t kMaxLineage = 64;
// Each class lists what it inherits, so a small text can stand for lists of any size.
constexpr std::size_t kMaxListed = 2000000;

template <class T>
using NameMap = std::unordered_map<std::string_view, T, NameHash, NameEqual>;

std::string in(const std::string& name) { return "'" + name + "'"; }

}  // namespace

/// Makes classes of declarations: resolves names, inherits, and reports what does not fit.
///
/// A class that cannot be placed in the tree is left out, with all below it, so that one fault
/// is not reported again for each of its subclasses.
class ClassLinker {
public:
    ClassLinker(const MofDeclarations& declarations, ClassRepository& repository)
        : m_declarations(declarations), m_repository(repository) {}

    void run() {
        for (const MofQualifierType& declared : m_declarations.qualifierTypes) {
            linkQualifierType(declared);
        }
        for (const MofClass& declared : m_declarations.classes) {
            auto [at, isNew] = m_declared.emplace(declared.name, &declared);
            if (!isNew) {
                fault(declared.place, "class " + in(declared.name) + " is declared already at " +
                                          placeText(at->second->place));
            }
        }
        for (const MofClass& declared : m_declarations.classes) {
            if (m_declared[declared.name] == &declared) {
                linkWithSuperclasses(declared);
            }
        }
        if (!m_faults.empty()) {
            throw MofError(std::move(m_faults));
        }
    }

private:
    // ---- faults

    void fault(const MofPlace& place, const std::string& text) {
        m_faults.push_back({*place.file, place.line, place.column, text});
        if (m_faults.size() >= kMaxFaults) {
            throw MofError(std::move(m_faults));
        }
    }

    static std::string placeText(const MofPlace& place) {
        return *place.file + ":" + std::to_string(place.line) + ":" + std::to_string(place.column);
    }

    // ---- qualifiers

    void linkQualifierType(const MofQualifierType& declared) {
        Value unused;  // a default is checked and has no further use
        if (declared.defaultValue) {
            convert(*declared.defaultValue, declared.type, unused);
        }
        if (!m_repository.m_qualifierTypes.add(std::make_shared<CimQualifierType>(declared))) {
            fault(declared.place, "qualifier " + in(declared.name) + " is declared already");
        }
    }

    void convert(const MofInitializer& initializer, const CimType& type, Value& value) {
        std::string why = convertMofValue(initializer, type, value);
        if (!why.empty()) {
            fault(initializer.place, why);
        }
    }

    // Qualifiers declared on something and those that it takes over from @p base, if any.
    NamedList<CimQualifier> linkQualifiers(const std::vector<MofQualifier>& declared,
                                           unsigned scope, const CimQualified* base) {
        NamedList<CimQualifier> all;
        for (const MofQualifier& one : declared) {
            auto qualifier = linkQualifier(one, scope);
            if (!qualifier) {
                continue;
            }
            const CimQualifier* inherited = base ? base->qualifiers.find(one.name) : nullptr;
            if (inherited &&
                (inherited->flavors & (DisableOverride | Restricted)) == DisableOverride &&
                inherited->value != qualifier->value) {
                fault(one.place, "qualifier " + in(one.name) +
                                     " has another value in the superclass and cannot be changed");
            }
            if (!all.add(std::move(qualifier))) {
                fault(one.place, "qualifier " + in(one.name) + " is given twice");
            }
        }
        static const NamedList<CimQualifier> none;
        for (const auto& inherited : base ? base->qualifiers : none) {
            const bool goesDown = (inherited->flavors & Restricted) == 0;
            if (goesDown) {
                all.add(inherited);  // unless there is one of its own
            }
        }
        m_listed += all.size();
        return all;
    }

    std::shared_ptr<CimQualifier> linkQualifier(const MofQualifier& declared, unsigned scope) {
        const CimQualifierType* type = m_repository.m_qualifierTypes.find(declared.name);
        if (!type) {
            fault(declared.place, "qualifier " + in(declared.name) + " is not declared");
            return nullptr;
        }
        if ((type->scopes & scope) == 0) {
            fault(declared.place, "qualifier " + in(type->name) + " is not for this element");
        }
        auto qualifier = std::make_shared<CimQualifier>();
        qualifier->name = type->name;
        qualifier->flavors = (type->flavors & ~declared.flavorsOff) | declared.flavorsOn;
        qualifier->value = Value::null(type->type.cmpiType());
        if (declared.value) {
            convert(*declared.value, type->type, qualifier->value);
        } else if (type->type.cmpiType() == CMPI_boolean) {
            qualifier->value = true;
        }
        return qualifier;
    }

    // ---- the tree

    // Links a class after all above it that are not linked yet.
    void linkWithSuperclasses(const MofClass& declared) {
        std::vector<const MofClass*> line;  // from the class upwards
        const MofClass* at = &declared;
        while (m_metFrom.emplace(at, &declared).second) {
            line.push_back(at);
            if (at->superclass.empty()) {
                break;
            }
            at = superclassOf(*at, declared);
            if (!at) {
                return;
            }
        }
        for (auto next = line.rbegin(); next != line.rend(); ++next) {
            if (!linkClass(**next)) {
                return;
            }
        }
    }

    // Declaration of the superclass. Null, and reported, when there is none, or when it closes a
    // circle, that is, has been met already on the way up from @p start.
    const MofClass* superclassOf(const MofClass& declared, const MofClass& start) {
        auto found = m_declared.find(declared.superclass);
        if (found == m_declared.end()) {
            fault(declared.superclassPlace, "superclass " + in(declared.superclass) + " of " +
                                                in(declared.name) + " is not declared");
            return nullptr;
        }
        auto met = m_metFrom.find(found->second);
        if (met == m_metFrom.end() || met->second != &start) {
            return found->second;
        }
        fault(declared.superclassPlace, "class " + in(declared.name) + " inherits from itself");
        return nullptr;
    }

    // False when the class cannot be placed: it, and what is below it, is left out.
    bool linkClass(const MofClass& declared) {
        CimClass* superclass = nullptr;
        if (!declared.superclass.empty()) {
            auto found = m_linked.find(declared.superclass);
            if (found == m_linked.end()) {
                return false;
            }
            superclass = found->second;
        }
        auto cls = std::make_shared<CimClass>();
        cls->name = declared.name;
        cls->superclass = superclass;
        if (superclass) {
            cls->lineage = superclass->lineage;
            cls->properties = superclass->properties;
            cls->methods = superclass->methods;
        }
        cls->lineage.push_back(cls.get());
        if (cls->lineage.size() > kMaxLineage) {
            fault(declared.place, "class " + in(declared.name) + " has more than " +
                                      std::to_string(kMaxLineage - 1) + " classes above it");
            return false;
        }
        linkClassQualifiers(declared, *cls);
        linkFeatures(declared, *cls);
        m_listed += cls->properties.size() + cls->methods.size();
        if (m_listed > kMaxListed) {
            fault(declared.place, "the classes have too many features");
            throw MofError(std::move(m_faults));
        }
        if (superclass) {
            superclass->subclasses.push_back(cls.get());
        }
        m_linked.emplace(cls->name, cls.get());
        m_repository.m_classes.add(std::move(cls));
        return true;
    }

    void linkClassQualifiers(const MofClass& declared, CimClass& cls) {
        auto has = [&](const char* name) {
            return std::any_of(declared.qualifiers.begin(), declared.qualifiers.end(),
                               [&](const MofQualifier& q) { return sameName(q.name, name); });
        };
        const CimClass* base = cls.superclass;
        unsigned scope = ScopeClass;
        if ((base && base->isAssociation) || has("Association")) {
            scope |= ScopeAssociation;
        }
        if ((base && base->isIndication) || has("Indication")) {
            scope |= ScopeIndication;
        }
        cls.qualifiers = linkQualifiers(declared.qualifiers, scope, base);
        cls.isAssociation = cls.flag("Association");
        cls.isIndication = cls.flag("Indication");
    }

    // ---- features

    void linkFeatures(const MofClass& declared, CimClass& cls) {
        NameSet properties;
        NameSet methods;
        for (const MofFeature& feature : declared.features) {
            NameSet& names = feature.isMethod ? methods : properties;
            if (!names.insert(feature.name).second) {
                fault(feature.place, std::string(feature.isMethod ? "method " : "property ") +
                                         in(feature.name) + " is declared twice in this class");
                continue;
            }
            if (feature.isMethod) {
                linkMethod(feature, cls);
            } else {
                linkProperty(feature, cls);
            }
        }
        std::size_t references = 0;
        for (const auto& property : cls.properties) {
            if (property->isKey) {
                cls.keys.push_back(property.get());
            }
            if (property->type == CMPI_ref) {
                ++references;
            }
        }
        if (cls.isAssociation && references < 2) {
            fault(declared.place, "association " + in(cls.name) + " has fewer than two references");
        }
        if (!cls.isAssociation && references > 0) {
            fault(declared.place, "class " + in(cls.name) +
                                      " has references and so needs the qualifier 'Association'");
        }
    }

    // What all kinds of element share.
    void linkElement(const MofParameter& declared, unsigned scope, const CimElement* base,
                     CimElement& element) {
        element.name = declared.name;
        static_cast<CimType&>(element) = declared.type;
        element.qualifiers = linkQualifiers(declared.qualifiers, scope, base);
        if (element.type == CMPI_ref) {
            element.referenceClass = classNamed(element.referenceClass, declared);
        }
        const std::string* embedded = element.text("EmbeddedInstance");
        element.isEmbeddedObject = embedded || element.flag("EmbeddedObject");
        if (embedded) {
            element.embeddedClass = classNamed(*embedded, declared);
        }
        if (element.isEmbeddedObject && element.type != CMPI_string) {
            fault(declared.place,
                  in(element.name) + " carries an instance and so must be a string");
        }
        if (base) {
            checkOverride(declared, *base, element);
        }
    }

    // Name of a class as its declaration spells it.
    std::string classNamed(const std::string& name, const MofParameter& user) {
        auto found = m_declared.find(name);
        if (found != m_declared.end()) {
            return found->second->name;
        }
        fault(user.place, "class " + in(name) + " of " + in(user.name) + " is not declared");
        return name;
    }

    void checkOverride(const MofParameter& declared, const CimElement& base,
                       const CimElement& element) {
        if (element.type != base.type || element.isArray != base.isArray ||
            element.arraySize != base.arraySize) {
            fault(declared.place, in(element.name) + " overrides one of another type, " +
                                      mofTypeWord(base) + mofBrackets(base));
        } else if (!isDeclaredBelow(element.referenceClass, base.referenceClass) ||
                   !isDeclaredBelow(element.embeddedClass, base.embeddedClass)) {
            fault(declared.place, in(element.name) + " overrides one of class " +
                                      in(base.referenceClass + base.embeddedClass) +
                                      ", of which its own is no subclass");
        }
    }

    // By the declarations, since a class referred to may not be linked yet.
    bool isDeclaredBelow(const std::string& name, const std::string& base) const {
        if (base.empty()) {
            return true;
        }
        std::string_view at = name;
        for (std::size_t i = 0; i < kMaxLineage && !at.empty(); ++i) {
            if (sameName(at, base)) {
                return true;
            }
            auto found = m_declared.find(at);
            at = found == m_declared.end() ? std::string_view() : found->second->superclass;
        }
        return false;
    }

    // The qualifier Override must name what is overridden, with or without the class.
    void checkOverrideName(const MofFeature& feature, const CimElement& element, bool hasBase) {
        const std::string* name = element.text("Override");
        if (!name) {
            return;
        }
        std::size_t dot = name->rfind('.');
        std::string last = dot == std::string::npos ? *name : name->substr(dot + 1);
        if (!hasBase || !sameName(last, feature.name)) {
            fault(feature.place, in(feature.name) + " overrides " + in(*name) +
                                     ", which is no feature of that name in a superclass");
        }
    }

    void linkProperty(const MofFeature& feature, CimClass& cls) {
        const CimProperty* base = cls.properties.find(feature.name);
        auto property = std::make_shared<CimProperty>();
        bool isReference = feature.type.type == CMPI_ref;
        linkElement(feature, isReference ? ScopeReference : ScopeProperty, base, *property);
        checkOverrideName(feature, *property, base != nullptr);
        if (feature.defaultValue) {
            convert(*feature.defaultValue, feature.type, property->defaultValue);
        } else if (base) {
            property->defaultValue = base->defaultValue;
        }

        property->isKey = property->flag("Key");
        if (property->isKey && (property->isArray || property->isEmbeddedObject)) {
            fault(feature.place,
                  "key " + in(property->name) + " cannot be an array or an instance");
        }
        bool wasKey = base && base->isKey;
        if (property->isKey && !wasKey && cls.superclass && !cls.superclass->keys.empty()) {
            fault(feature.place, in(property->name) + " cannot become a key: " +
                                     in(cls.superclass->name) + " has its keys already");
        }
        if (wasKey && !property->isKey) {
            fault(feature.place,
                  in(property->name) + " is a key of the superclass and must stay one");
        }
        cls.properties.put(std::move(property));
    }

    void linkMethod(const MofFeature& feature, CimClass& cls) {
        const CimMethod* base = cls.methods.find(feature.name);
        auto method = std::make_shared<CimMethod>();
        linkElement(feature, ScopeMethod, base, *method);
        checkOverrideName(feature, *method, base != nullptr);
        for (const MofParameter& declared : feature.parameters) {
            auto parameter = std::make_shared<CimParameter>();
            const CimParameter* old = base ? base->parameters.find(declared.name) : nullptr;
            linkElement(declared, ScopeParameter, old, *parameter);
            if (!method->parameters.add(std::move(parameter))) {
                fault(declared.place, "parameter " + in(declared.name) + " is declared twice");
            }
        }
        cls.methods.put(std::move(method));
    }

    const MofDeclarations& m_declarations;
    ClassRepository& m_repository;
    NameMap<const MofClass*> m_declared;
    NameMap<CimClass*> m_linked;
    std::unordered_map<const MofClass*, const MofClass*> m_metFrom;  // where a way up began
    std::size_t m_listed = 0;                                        // entries of all lists
    std::vector<MofFault> m_faults;
};

namespace {

/// Puts declarations behind others, except those whose name is taken.
template <class Declared>
void addMissing(std::vector<Declared>& all, const std::vector<Declared>& further) {
    NameSet names;
    for (const Declared& each : all) {
        names.insert(each.name);
    }
    std::copy_if(further.begin(), further.end(), std::back_inserter(all),
                 [&](const Declared& each) { return names.count(each.name) == 0; });
}

}  // namespace

std::shared_ptr<const ClassRepository> ClassRepository::load(const std::string& path,
                                                             const MofReader& reader,
                                                             const std::string& further) {
    MofDeclarations declarations = parseMof(path, reader);
    const MofDeclarations more =
        parseMof("(further classes)", [&](const std::string&) { return further; });
    addMissing(declarations.qualifierTypes, more.qualifierTypes);
    addMissing(declarations.classes, more.classes);
    std::shared_ptr<ClassRepository> repository(new ClassRepository);
    ClassLinker(declarations, *repository).run();
    return repository;
}

}  // namespace cimom

/// The CIM classes that this object manager knows, read from MOF and then never changed.
///
///     auto classes = cimom::ClassRepository::load("providers/mof/zem.mof");
///     if (const cimom::CimClass* cls = classes->findClass("orxc_lpar_cs")) {
///         for (const auto& property : cls->properties) use(property->name, property->type);
///         bool system = classes->isA("ORXC_LPAR_CS", "CIM_System");
///     }
///
/// Names of classes, properties, methods, parameters and qualifiers are found by hash and
/// without regard to ASCII case; they are stored as declared. Everything reached from a
/// repository is owned by it and lives as long as it does. A loaded repository is immutable:
/// any number of threads may use it at once, without a lock.
#ifndef CIMOM_CLASS_REPOSITORY_H
#define CIMOM_CLASS_REPOSITORY_H

#include <bitset>
#include <cstddef>
#include <cstdint>
#include <memory>
#include <mutex>
#include <string>
#include <string_view>
#include <unordered_map>
#include <utility>
#include <variant>
#include <vector>

#include "MofParser.h"

namespace cimom {

/// Named things in the order in which they were added, found by name in constant time.
///
/// A copy shares its elements with the original. T has a member `name`, fixed once added.
template <class T>
class NamedList {
public:
    using Item = std::shared_ptr<const T>;

    /// Appends @p item; false, and nothing is added, when its name is already taken.
    bool add(Item item) {
        if (!m_index.emplace(item->name, m_items.size()).second) {
            return false;
        }
        m_items.push_back(std::move(item));
        return true;
    }
    /// Puts @p item in the place of the element of its name, or appends it.
    void put(Item item) {
        auto found = m_index.find(item->name);
        if (found == m_index.end()) {
            add(std::move(item));
            return;
        }
        std::size_t position = found->second;
        m_index.erase(found);  // its key views the name of the element that goes
        m_index.emplace(item->name, position);
        m_items[position] = std::move(item);
    }
    /// The position of the element of that name; size() when there is none.
    std::size_t indexOf(std::string_view name) const {
        auto found = m_index.find(name);
        return found == m_index.end() ? m_items.size() : found->second;
    }
    /// The element of that name, or null.
    const T* find(std::string_view name) const {
        const std::size_t at = indexOf(name);
        return at == m_items.size() ? nullptr : m_items[at].get();
    }
    std::size_t size() const { return m_items.size(); }
    bool empty() const { return m_items.empty(); }
    const T& operator[](std::size_t i) const { return *m_items[i]; }
    auto begin() const { return m_items.begin(); }
    auto end() const { return m_items.end(); }

private:
    std::vector<Item> m_items;
    std::unordered_map<std::string_view, std::size_t, NameHash, NameEqual> m_index;
};

struct CimQualifier {
    std::string name;
    Value value;           ///< of the declared type, null or not
    unsigned flavors = 0;  ///< MofFlavor bits in effect here
};

/// What has qualifiers: own ones and those propagated.
struct CimQualified {
    NamedList<CimQualifier> qualifiers;

    /// Value of a boolean qualifier, or @p otherwise when it is absent or NULL.
    bool flag(std::string_view qualifier, bool otherwise = false) const;
    /// Value of a qualifier that is a text; null when it is absent, NULL or something else.
    const std::string* text(std::string_view qualifier) const;
};

/// What properties, parameters and methods (by what they return) have in common.
struct CimElement : CimType, CimQualified {
    std::string name;
    bool isEmbeddedObject = false;  ///< a string that carries an instance, or a class
    std::string embeddedClass;      ///< class of the embedded instances; empty: any class
};
/// CMPI type of a declared element; strings that carry instances are CMPI_instance.
CMPIType typeOf(const CimElement& element);

using CimParameter = CimElement;

struct CimProperty : CimElement {
    bool isKey = false;
    Value defaultValue;
};

struct CimMethod : CimElement {
    NamedList<CimParameter> parameters;
};

/// Some of the properties of a class, by position; those behind the end are never among them.
using Positions = std::bitset<128>;

/// A class with all that it inherits. Inherited features come first, in the superclass's order.
struct CimClass : CimQualified {
    std::string name;
    const CimClass* superclass = nullptr;     ///< null for a root
    std::vector<const CimClass*> lineage;     ///< root first, this class last
    std::vector<const CimClass*> subclasses;  ///< direct ones, in order of declaration
    std::vector<const CimProperty*> keys;     ///< key properties
    bool isAssociation = false;
    bool isIndication = false;
    NamedList<CimProperty> properties;  ///< references included
    NamedList<CimMethod> methods;

    /// True when this is @p base or descends from it. Constant time.
    bool isA(const CimClass& base) const;
    /// All classes below this one, parents before children; without this class.
    std::vector<const CimClass*> allSubclasses() const;
    /// The properties that have a default, with it, and those that have none.
    const NamedValues& defaults() const { return initialValues().ofDefaults; }
    const Positions& withoutDefault() const { return initialValues().without; }
    /// The name of a property, by its position, for the values of instances: it lasts.
    const std::string& lastingNameAt(std::size_t at) const { return *initialValues().names[at]; }
    /// All properties, with their defaults or null.
    const NamedValues& blank() const { return initialValues().all; }

private:
    struct InitialValues {
        std::once_flag made;
        NamedValues ofDefaults;
        NamedValues all;
        Positions without;
        std::vector<const std::string*> names;
    };
    const InitialValues& initialValues() const;

    mutable InitialValues
        m_initialValues;  // made when first asked for: most classes have no instance
};

class ClassRepository {
public:
    /// Reads the MOF file @p path and all that it includes.
    ///
    /// Superclasses and referenced classes may be declared after their use. Instance
    /// declarations are parsed and dropped: instances come from providers alone.
    /// @param further  MOF text with classes and qualifiers to have in any case: each is taken
    ///                 unless the file has one of its name
    /// @throws MofError with the first fault of form, or every fault of meaning (up to a limit)
    static std::shared_ptr<const ClassRepository> load(const std::string& path,
                                                       const MofReader& reader = readRegularFile,
                                                       const std::string& further = {});

    /// The class, or null.
    const CimClass* findClass(std::string_view name) const { return m_classes.find(name); }

    /// True when both classes exist and @p name is @p base or descends from it.
    bool isA(std::string_view name, std::string_view base) const;

    /// All classes, each after its superclass.
    const NamedList<CimClass>& classes() const { return m_classes; }
    const NamedList<CimQualifierType>& qualifierTypes() const { return m_qualifierTypes; }

    /// The class with all that it inherits as MOF text, which load() reads again given the
    /// class's surroundings.
    std::string toMof(const CimClass& cls) const;

private:
    friend class ClassLinker;
    ClassRepository() = default;

    NamedList<CimClass> m_classes;
    NamedList<CimQualifierType> m_qualifierTypes;
};

}  // namespace cimom

#endif

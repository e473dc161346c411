/// An instance that takes the properties which a caller listed. Private to the library.
///
/// Thread-safety: none; it belongs to the operation that made it.
#ifndef LISTED_PROPERTIES_H
#define LISTED_PROPERTIES_H

#include "BaseProvider.h"
#include "CmpiData.h"
#include "CmpiInstance.h"
#include "StringUtils.h"

class zemListedProperties {
public:
    /// @param properties  names, in any case of letters; a null or empty list has every name
    zemListedProperties(CmpiInstance& instance, const char** properties)
        : m_instance(instance), m_properties(properties) {}

    bool has(const char* name) const {
        return zemBaseProvider::containsProperty(m_properties, name);
    }

    void add(const char* name, const CmpiData& value) const {
        if (has(name)) {
            m_instance.setProperty(name, value);
        }
    }
    void add(const char* name, const zemString& text) const {
        add(name, CmpiData(static_cast<const char*>(text)));
    }

private:
    CmpiInstance& m_instance;
    const char** m_properties;
};

#endif

/// The entries of CMPI objects that hold values by name, the same for instances, paths,
/// arguments and contexts.
#ifndef CIMOM_NAMED_ENTRIES_H
#define CIMOM_NAMED_ENTRIES_H

#include "Broker.h"

namespace cimom {

inline NamedValues& namedIn(NamedValues& body) { return body; }
inline NamedValues& namedIn(ObjectPath& body) { return body.keys; }
inline NamedValues& namedIn(InstanceBody& body) { return body.value.properties; }

inline bool isKey(const NamedValues&, std::string_view) { return false; }
inline bool isKey(const ObjectPath&, std::string_view) { return true; }
bool isKey(const InstanceBody& body, std::string_view name);  // InstanceEntries.cpp

/// The C form of an entry of a C object.
template <class C>
CMPIData namedData(Broker& broker, const BodyOf<C>& body, const std::string& name,
                   const Value& value) {
    CMPIData data = makeData(broker, value);
    if (isKey(body, name)) {
        data.state |= CMPI_keyValue;
    }
    // Small brokers hand out a principal even when there is none: a string without a text.
    if (std::is_same_v<C, CMPIContext> && broker.lean() && value.isNull() &&
        sameName(name, CMPIPrincipal)) {
        data.state = CMPI_goodValue;
        data.value.string = make<CMPIString>(broker, {"", true});
    }
    return data;
}

/// What is answered to a name, or a position, that is not there. Brokers do not agree.
template <class C>
CMPIrc missing(const Broker& broker) {
    const bool lean = broker.lean() && !std::is_same_v<C, CMPIContext>;
    return lean ? CMPI_RC_ERR_NOT_FOUND : CMPI_RC_ERR_NO_SUCH_PROPERTY;
}
template <class C>
CMPIrc missingName(const Broker& broker) {
    return std::is_same_v<C, CMPIObjectPath> ? CMPI_RC_ERR_NOT_FOUND : missing<C>(broker);
}

template <class C>
CMPIData getNamed(BodyOf<C>& body, Broker& broker, const char* name) {
    const std::string wanted = textOf(name);
    const Value* value = namedIn(body).find(wanted);
    if (!value) {
        throw Failure(missingName<C>(broker), "no " + wanted);
    }
    return namedData<C>(broker, body, wanted, *value);
}

template <class C>
CMPIData getNamedAt(BodyOf<C>& body, Broker& broker, CMPICount index, CMPIString** name) {
    const NamedValues::Entry& entry = elementAt(namedIn(body), index, missing<C>(broker));
    if (name) {
        *name = makeString(broker, entry.name);
    }
    return namedData<C>(broker, body, entry.name, entry.value);
}

template <class C>
CMPICount countNamed(BodyOf<C>& body, Broker&) {
    return static_cast<CMPICount>(namedIn(body).size());
}

template <class C>
void setNamed(BodyOf<C>& body, Broker&, const char* name, const CMPIValue* value, CMPIType type) {
    if (!name || !*name) {
        throw Failure(CMPI_RC_ERR_INVALID_PARAMETER, "a value without name");
    }
    namedIn(body).set(name, readValue(value, type));
}

}  // namespace cimom

#endif

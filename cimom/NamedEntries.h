/// The entries of CMPI objects that hold values by name, the same for instances, paths,
/// arguments and contexts.
#ifndef CIMOM_NAMED_ENTRIES_H
#define CIMOM_NAMED_ENTRIES_H

#include "Broker.h"

namespace cimom {

inline NamedValues& namedIn(NamedValues& body) { return body; }
inline NamedValues& namedIn(ObjectPath& body) { return body.keys; }
inline NamedValues& namedIn(InstanceBody& body) { return body.value.properties; }

/// The C form of an entry of a C object.
template <class C>
CMPIData namedData(Broker& broker, const BodyOf<C>&, const std::string& name, const Value& value) {
    CMPIData data = makeData(broker, value);
    if (std::is_same_v<C, CMPIObjectPath>) data.state |= CMPI_keyValue;
    // Small brokers hand out a principal even when there is none: a string without a text.
    if (std::is_same_v<C, CMPIContext> && broker.lean() && value.isNull() &&
        sameName(name, CMPIPrincipal)) {
        data.state = CMPI_goodValue;
        data.value.string = make<CMPIString>(broker, {"", true});
    }
    return data;
}
/// A property that is a key says so.
template <>
CMPIData namedData<CMPIInstance>(Broker& broker, const InstanceBody& body, const std::string& name,
                                 const Value& value);

template <class C, CMPIrc Missing>
CMPIData getNamed(const C* object, const char* name, CMPIStatus* rc) {
    return objectEntry(object, rc, [name](BodyOf<C>& body, Broker& broker) {
        const std::string wanted = textOf(name);
        const Value* value = namedIn(body).find(wanted);
        if (!value) throw Failure(Missing, "no " + wanted);
        return namedData<C>(broker, body, wanted, *value);
    });
}

template <class C>
CMPIData getNamedAt(const C* object, CMPICount index, CMPIString** name, CMPIStatus* rc) {
    return objectEntry(object, rc, [index, name](BodyOf<C>& body, Broker& broker) {
        NamedValues& values = namedIn(body);
        if (index >= values.size())
            throw Failure(CMPI_RC_ERR_NO_SUCH_PROPERTY, "index " + std::to_string(index));
        const NamedValues::Entry& entry = values.at(index);
        if (name) *name = makeString(broker, entry.name);
        return namedData<C>(broker, body, entry.name, entry.value);
    });
}

template <class C>
CMPICount countNamed(const C* object, CMPIStatus* rc) {
    return objectEntry(object, rc, [](BodyOf<C>& body, Broker&) {
        return static_cast<CMPICount>(namedIn(body).size());
    });
}

template <class C, class Handle>
CMPIStatus setNamed(Handle* object, const char* name, const CMPIValue* value, const CMPIType type) {
    const C* target = object;
    return objectStatus(target, [=](BodyOf<C>& body, Broker&) {
        if (!name || !*name) throw Failure(CMPI_RC_ERR_INVALID_PARAMETER, "a value without name");
        namedIn(body).set(name, readValue(value, type));
    });
}

}  // namespace cimom

#endif

// Entries of CMPIInstance, and the rules by which the class of an instance checks its properties.

#include <algorithm>

#include "NamedEntries.h"
#include "PathText.h"

namespace cimom {

namespace {

const CimProperty* declared(const InstanceBody& body, std::string_view name) {
    return body.cls ? body.cls->properties.find(name) : nullptr;
}

// Stores the value of a property at a position in the class, or behind it. One that is not there
// yet need not be looked for among the others.
void store(InstanceBody& body, std::size_t at, std::string_view name, Value&& value) {
    if (at >= body.unset.size() || !body.unset[at]) {
        body.value.properties.set(name, std::move(value));
        return;
    }
    body.unset.reset(at);
    const std::string& lasting = body.cls->lastingNameAt(at);
    if (lasting == name) {
        body.value.properties.addLasting(lasting, std::move(value));
    } else {  // in other letters
        body.value.properties.add(name, std::move(value));
    }
}

bool passesFilter(const InstanceBody& body, std::string_view name) {
    return !body.filter || body.filter->count(std::string(name)) != 0;
}

// Without its class, an instance has the keys of its path.
bool isKey(const InstanceBody& body, const CimProperty* element, std::string_view name) {
    return body.cls ? element && element->isKey : body.value.path.keys.find(name) != nullptr;
}

// An embedded instance may also come as a text that shows it.
bool typeAgrees(const CimProperty& element, const Value& value) {
    const CMPIType wanted = typeOf(element);
    return value.type() == wanted || (wanted == CMPI_instance && value.type() == CMPI_string) ||
           (wanted == CMPI_instanceA && value.type() == CMPI_stringA);
}

// Makes the value one that the class declares; @p element is null when it has no such property.
void check(bool lean, const CimClass& cls, const CimProperty* element, std::string_view name,
           Value& value) {
    if (!element) {
        if (lean) {
            return;
        }
        throw Failure(CMPI_RC_ERR_NO_SUCH_PROPERTY,
                      "class " + cls.name + " has no property " + std::string(name));
    }
    value.retypeNull(typeOf(*element));
    if (!lean && !typeAgrees(*element, value)) {
        throw Failure(CMPI_RC_ERR_TYPE_MISMATCH, "property " + cls.name + "." + std::string(name) +
                                                     " is " + typeName(typeOf(*element)) +
                                                     ", not " + typeName(value.type()));
    }
}

// Keys that are as they were stay shared with the path that they came from.
void setKey(InstanceBody& body, std::string_view name, const Value& value) {
    const Value* present = body.value.path.keys.find(name);
    if (!present || *present != value) {
        body.value.path.keys.set(name, value);
    }
}

// The keys of the path become properties, typed by the class. What the class does not have, or
// not so, stays in the path alone: that a path is wrong is for the provider to say.
void takeKeys(InstanceBody& body) {
    const NamedValues keys = body.value.path.keys;
    for (const auto& [name, value] : keys) {
        Value typed = value;
        std::size_t at = body.unset.size();
        if (body.cls) {
            const auto& properties = body.cls->properties;
            at = properties.indexOf(name);
            if (at == properties.size() || !value.convertTo(typeOf(properties[at]), typed)) {
                continue;
            }
        }
        setKey(body, name, typed);
        store(body, at, name, std::move(typed));
    }
}

CMPIData getProperty(InstanceBody& body, Broker& broker, const char* name) {
    const std::string wanted = textOf(name);
    if (const Value* value = body.value.properties.find(wanted)) {
        return namedData<CMPIInstance>(broker, body, wanted, *value);
    }
    // A property of the class that has not been set is there, and null, except in small brokers.
    const bool may = !broker.lean() && passesFilter(body, wanted);
    const CimProperty* element = may ? declared(body, wanted) : nullptr;
    if (!element) {
        throw Failure(missing<CMPIInstance>(broker), "no property " + wanted);
    }
    return namedData<CMPIInstance>(broker, body, wanted, Value::null(typeOf(*element)));
}

void setProperty(InstanceBody& body, Broker& broker, const char* name, const CMPIValue* value,
                 CMPIType type) {
    if (!name || !*name) {
        throw Failure(CMPI_RC_ERR_INVALID_PARAMETER, "a value without name");
    }
    setInstanceProperty(broker, body, name, readValue(value, type));
}
void setPropertyWithOrigin(InstanceBody& body, Broker& broker, const char* name,
                           const CMPIValue* value, CMPIType type, const char*) {
    setProperty(body, broker, name, value, type);
}

CMPIObjectPath* getObjectPath(InstanceBody& body, Broker& broker) {
    return make<CMPIObjectPath>(broker, body.value.path);
}
void setObjectPath(InstanceBody& body, Broker& broker, const CMPIObjectPath* path) {
    body.value.path = bodyOf(path);
    body.cls = broker.classOf(body.value.path);
    body.unset.reset();
    takeKeys(body);
}

// Keys stay by the class, as the standard has come to say, and the key list means nothing. In small
// brokers they stay by that list, and what it lacks is missing in the path too.
bool stays(const InstanceBody& body, const Broker& broker, std::string_view name, bool isKey) {
    return passesFilter(body, name) || (!broker.lean() && isKey);
}
void setPropertyFilter(InstanceBody& body, Broker& broker, const char** properties,
                       const char** keys) {
    if (!properties) {
        if (!broker.lean()) {
            body.filter.reset();
        }
        return;
    }
    std::vector<std::string> names = namesIn(properties);
    if (broker.lean() && keys) {
        for (std::string& key : namesIn(keys)) {
            names.push_back(std::move(key));
        }
    }
    body.filter = std::make_shared<const NameSet>(names.begin(), names.end());
    const auto keep = [&](NamedValues& values) {
        NamedValues kept;
        for (const auto& [name, value] : values) {
            if (stays(body, broker, name, isKey(body, name))) {
                kept.set(name, value);
            }
        }
        values = std::move(kept);
    };
    keep(body.value.properties);
    if (broker.lean()) {
        keep(body.value.path.keys);
    }
}

}  // namespace

bool isKey(const InstanceBody& body, std::string_view name) {
    return isKey(body, declared(body, name), name);
}

InstanceBody instanceBody(Broker& broker, Instance value) {
    const CimClass* cls = broker.classOf(value.path);
    return {std::move(value), nullptr, cls};
}

InstanceBody newInstanceOf(Broker& broker, const ObjectPath& path) {
    InstanceBody body = instanceBody(broker, Instance(path));
    if (!body.cls && broker.classes() && !broker.lean()) {
        throw Failure(CMPI_RC_ERR_NOT_FOUND, "no class " + path.className);
    }
    if (body.cls) {
        body.value.properties = broker.lean() ? body.cls->blank() : body.cls->defaults();
        body.unset = broker.lean() ? Positions() : body.cls->withoutDefault();
        // most are given half of the many properties of a class, and nearly all of few
        constexpr std::size_t kFew = 32;
        const std::size_t all = body.cls->properties.size();
        body.value.properties.reserve(std::max(std::min(all, kFew), all / 2));
    }
    takeKeys(body);
    return body;
}

void setInstanceProperty(Broker& broker, InstanceBody& body, std::string_view name, Value&& value) {
    const CimProperty* element = nullptr;
    std::size_t at = body.unset.size();
    if (body.cls) {
        const auto& properties = body.cls->properties;
        at = properties.indexOf(name);
        element = at == properties.size() ? nullptr : &properties[at];
        check(broker.lean(), *body.cls, element, name, value);
    }
    // The path of an instance is made of its key properties.
    const bool key = isKey(body, element, name);
    if (!stays(body, broker, name, key)) {
        return;
    }
    if (!value.isNull() && key) {
        setKey(body, name, value);
    }
    store(body, at, name, std::move(value));
}

void fillInstanceTables(ObjectTables& tables) {
    std::get<CMPIInstanceFT>(tables) = tableOf<CMPIInstance>(
        entryOf<getProperty>, entryOf<getNamedAt<CMPIInstance>>, entryOf<countNamed<CMPIInstance>>,
        entryOf<setProperty>, entryOf<getObjectPath>, entryOf<setPropertyFilter>,
        entryOf<setObjectPath>, entryOf<setPropertyWithOrigin>);
}

}  // namespace cimom

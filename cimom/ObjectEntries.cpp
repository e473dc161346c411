// Entries of the small CMPI objects: strings, date-times, arrays, enumerations, arguments,
// contexts, paths and results.

#include "Broker.h"
#include "NamedEntries.h"
#include "PathText.h"

namespace cimom {

namespace {

// -- string, date-time ------------------------------------------------------------------------

const char* charPtr(const CMPIString* string, CMPIStatus* rc) {
    return objectEntry(string, rc, [](StringBody& body, Broker&) -> const char* {
        return body.null ? nullptr : body.text.c_str();
    });
}

CMPIUint64 binaryFormat(const CMPIDateTime* dateTime, CMPIStatus* rc) {
    return objectEntry(dateTime, rc,
                       [](DateTime& body, Broker&) -> CMPIUint64 { return body.binary(); });
}
CMPIString* stringFormat(const CMPIDateTime* dateTime, CMPIStatus* rc) {
    return objectEntry(dateTime, rc, [](DateTime& body, Broker& broker) {
        return makeString(broker, body.text());
    });
}
CMPIBoolean isInterval(const CMPIDateTime* dateTime, CMPIStatus* rc) {
    return objectEntry(dateTime, rc, [](DateTime& body, Broker&) -> CMPIBoolean {
        return body.isInterval() ? 1 : 0;
    });
}

// -- array, enumeration -----------------------------------------------------------------------

CMPICount arraySize(const CMPIArray* array, CMPIStatus* rc) {
    return objectEntry(array, rc, [](ArrayBody& body, Broker&) {
        return static_cast<CMPICount>(body.elements.size());
    });
}
CMPIType arrayType(const CMPIArray* array, CMPIStatus* rc) {
    return objectEntry(array, rc, [](ArrayBody& body, Broker&) { return body.elementType; });
}

Value& elementAt(ArrayBody& body, CMPICount index) {
    if (index >= body.elements.size())
        throw Failure(CMPI_RC_ERR_NO_SUCH_PROPERTY, "index " + std::to_string(index));
    return body.elements[index];
}
CMPIData getElement(const CMPIArray* array, CMPICount index, CMPIStatus* rc) {
    return objectEntry(array, rc, [index](ArrayBody& body, Broker& broker) {
        return makeData(broker, elementAt(body, index));
    });
}
CMPIStatus setElement(CMPIArray* array, CMPICount index, const CMPIValue* value, CMPIType type) {
    return objectStatus(array, [=](ArrayBody& body, Broker&) {
        Value& element = elementAt(body, index);
        Value given = readValue(value, type);
        if (given.isNull()) given = Value::null(body.elementType);
        if (given.type() != body.elementType)
            throw Failure(CMPI_RC_ERR_TYPE_MISMATCH,
                          typeName(given.type()) + " in an array of " + typeName(body.elementType));
        element = std::move(given);
    });
}

CMPIData nextItem(const CMPIEnumeration* enumeration, CMPIStatus* rc) {
    return objectEntry(enumeration, rc, [](EnumerationBody& body, Broker& broker) {
        if (body.next == body.items.size()) throw Failure(CMPI_RC_NO_MORE_ELEMENTS);
        return makeData(broker, body.items[body.next++]);
    });
}
CMPIBoolean hasNext(const CMPIEnumeration* enumeration, CMPIStatus* rc) {
    return objectEntry(enumeration, rc, [](EnumerationBody& body, Broker&) -> CMPIBoolean {
        return body.next < body.items.size() ? 1 : 0;
    });
}
CMPIArray* toArray(const CMPIEnumeration* enumeration, CMPIStatus* rc) {
    return objectEntry(enumeration, rc, [](EnumerationBody& body, Broker& broker) {
        const CMPIType type = body.items.empty() ? CMPIType{CMPI_null} : body.items.front().type();
        return make<CMPIArray>(broker, {type, body.items});
    });
}

// -- paths ------------------------------------------------------------------------------------

template <std::string ObjectPath::*Part>
CMPIStatus setPart(CMPIObjectPath* path, const char* text) {
    return objectStatus(path, [text](ObjectPath& body, Broker&) { body.*Part = textOf(text); });
}
template <std::string ObjectPath::*Part>
CMPIString* getPart(const CMPIObjectPath* path, CMPIStatus* rc) {
    return objectEntry(
        path, rc, [](ObjectPath& body, Broker& broker) { return makeString(broker, body.*Part); });
}
template <bool WithHost>
CMPIStatus setPlaceFrom(CMPIObjectPath* path, const CMPIObjectPath* source) {
    return objectStatus(path, [source](ObjectPath& body, Broker&) {
        const ObjectPath& from = bodyOf(source);
        body.nameSpace = from.nameSpace;
        if (WithHost) body.host = from.host;
    });
}

CMPIString* pathText(const CMPIObjectPath* path, CMPIStatus* rc) {
    return objectEntry(path, rc, [](ObjectPath& body, Broker& broker) {
        return makeString(broker, printPath(body));
    });
}

// The qualifier of whatever @p select finds in the class of a path.
template <class F>
CMPIData qualifier(const CMPIObjectPath* path, const char* name, CMPIStatus* rc, F select) {
    return objectEntry(path, rc, [&](ObjectPath& body, Broker& broker) {
        if (broker.lean() || !broker.classes()) throw Failure(CMPI_RC_ERR_NOT_SUPPORTED);
        const CimClass* cls = broker.classOf(body);
        if (!cls) throw Failure(CMPI_RC_ERR_INVALID_CLASS, body.className);
        const NamedList<CimQualifier>* qualifiers = select(*cls);
        if (!qualifiers) throw Failure(CMPI_RC_ERR_INVALID_PARAMETER, "no such element");
        const CimQualifier* found = qualifiers->find(textOf(name));
        if (!found) throw Failure(CMPI_RC_ERR_NOT_FOUND, textOf(name));
        return makeData(broker, valueOf(found->value, found->type, found->isArray));
    });
}
template <class T>
const NamedList<CimQualifier>* qualifiersOf(const T* element) {
    return element ? &element->qualifiers : nullptr;
}
CMPIData classQualifier(const CMPIObjectPath* path, const char* name, CMPIStatus* rc) {
    return qualifier(path, name, rc, [](const CimClass& cls) { return &cls.qualifiers; });
}
CMPIData propertyQualifier(const CMPIObjectPath* path, const char* property, const char* name,
                           CMPIStatus* rc) {
    return qualifier(path, name, rc, [property](const CimClass& cls) {
        return qualifiersOf(cls.properties.find(textOf(property)));
    });
}
CMPIData methodQualifier(const CMPIObjectPath* path, const char* method, const char* name,
                         CMPIStatus* rc) {
    return qualifier(path, name, rc, [method](const CimClass& cls) {
        return qualifiersOf(cls.methods.find(textOf(method)));
    });
}
CMPIData parameterQualifier(const CMPIObjectPath* path, const char* method, const char* parameter,
                            const char* name, CMPIStatus* rc) {
    return qualifier(path, name, rc, [method, parameter](const CimClass& cls) {
        const CimMethod* found = cls.methods.find(textOf(method));
        return qualifiersOf(found ? found->parameters.find(textOf(parameter)) : nullptr);
    });
}

// -- results ----------------------------------------------------------------------------------

void giveValue(Reply& reply, const Value& value) {
    if (!value.isNull() && value.type() == CMPI_instance)
        reply.instances.push_back(value.instance());
    else if (!value.isNull() && value.type() == CMPI_ref)
        reply.paths.push_back(value.reference());
    else
        reply.values.push_back(value);
}
CMPIStatus returnData(const CMPIResult* result, const CMPIValue* value, CMPIType type) {
    return objectStatus(
        result, [=](ResultBody& body, Broker&) { giveValue(*body.reply, readValue(value, type)); });
}
CMPIStatus returnInstance(const CMPIResult* result, const CMPIInstance* instance) {
    return objectStatus(result, [=](ResultBody& body, Broker&) {
        body.reply->instances.push_back(bodyOf(instance).value);
    });
}
CMPIStatus returnObjectPath(const CMPIResult* result, const CMPIObjectPath* path) {
    return objectStatus(
        result, [=](ResultBody& body, Broker&) { body.reply->paths.push_back(bodyOf(path)); });
}
CMPIStatus returnDone(const CMPIResult* result) {
    return objectStatus(result, [](ResultBody& body, Broker&) { body.reply->done = true; });
}
CMPIStatus returnError(const CMPIResult* result, const CMPIError* error) {
    return objectStatus(result, [error](ResultBody& body, Broker&) {
        body.reply->errors.push_back(bodyOf(error));
    });
}

}  // namespace

namespace {

void fillPathTable(ObjectTables& tables) {
    std::get<CMPIObjectPathFT>(tables) = {0,
                                          releaseObject<CMPIObjectPath>,
                                          cloneObject<CMPIObjectPath>,
                                          setPart<&ObjectPath::nameSpace>,
                                          getPart<&ObjectPath::nameSpace>,
                                          setPart<&ObjectPath::host>,
                                          getPart<&ObjectPath::host>,
                                          setPart<&ObjectPath::className>,
                                          getPart<&ObjectPath::className>,
                                          setNamed<CMPIObjectPath, CMPIObjectPath>,
                                          getNamed<CMPIObjectPath, CMPI_RC_ERR_NOT_FOUND>,
                                          getNamedAt<CMPIObjectPath>,
                                          countNamed<CMPIObjectPath>,
                                          setPlaceFrom<false>,
                                          setPlaceFrom<true>,
                                          classQualifier,
                                          propertyQualifier,
                                          methodQualifier,
                                          parameterQualifier,
                                          pathText};
}

}  // namespace

void fillObjectTables(ObjectTables& tables) {
    constexpr CMPIrc kNotFound = CMPI_RC_ERR_NOT_FOUND;
    std::get<CMPIStringFT>(tables) = {0, releaseObject<CMPIString>, cloneObject<CMPIString>,
                                      charPtr};
    std::get<CMPIDateTimeFT>(tables) = {0,
                                        releaseObject<CMPIDateTime>,
                                        cloneObject<CMPIDateTime>,
                                        binaryFormat,
                                        stringFormat,
                                        isInterval};
    std::get<CMPIArrayFT>(tables) = {0,
                                     releaseObject<CMPIArray>,
                                     cloneObject<CMPIArray>,
                                     arraySize,
                                     arrayType,
                                     getElement,
                                     setElement};
    std::get<CMPIEnumerationFT>(tables) = {
        0,      releaseObject<CMPIEnumeration>, cloneObject<CMPIEnumeration>, nextItem, hasNext,
        toArray};
    std::get<CMPIArgsFT>(tables) = {0,
                                    releaseObject<CMPIArgs>,
                                    cloneObject<CMPIArgs>,
                                    setNamed<CMPIArgs, const CMPIArgs>,
                                    getNamed<CMPIArgs, kNotFound>,
                                    getNamedAt<CMPIArgs>,
                                    countNamed<CMPIArgs>};
    std::get<CMPIContextFT>(tables) = {0,
                                       releaseObject<CMPIContext>,
                                       cloneObject<CMPIContext>,
                                       getNamed<CMPIContext, CMPI_RC_ERR_NO_SUCH_PROPERTY>,
                                       getNamedAt<CMPIContext>,
                                       countNamed<CMPIContext>,
                                       setNamed<CMPIContext, const CMPIContext>};
    fillPathTable(tables);
    std::get<CMPIResultFT>(tables) = {0,
                                      releaseObject<CMPIResult>,
                                      cloneObject<CMPIResult>,
                                      returnData,
                                      returnInstance,
                                      returnObjectPath,
                                      returnDone,
                                      returnError};
}

}  // namespace cimom

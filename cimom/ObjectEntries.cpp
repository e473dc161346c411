// Entries of the small CMPI objects: strings, date-times, arrays, enumerations, arguments,
// contexts, paths and results.

#include "Broker.h"
#include "NamedEntries.h"
#include "PathText.h"

namespace cimom {

namespace {

// -- string, date-time ------------------------------------------------------------------------

const char* charPtr(StringBody& body, Broker&) { return body.null ? nullptr : body.text.c_str(); }

CMPIUint64 binaryFormat(DateTime& body, Broker&) { return body.binary(); }
CMPIString* stringFormat(DateTime& body, Broker& broker) { return makeString(broker, body.text()); }
CMPIBoolean isInterval(DateTime& body, Broker&) { return body.isInterval(); }

// -- array, enumeration -----------------------------------------------------------------------

CMPICount arraySize(ArrayBody& body, Broker&) {
    return static_cast<CMPICount>(body.elements.size());
}
CMPIType arrayType(ArrayBody& body, Broker&) { return body.elementType; }
CMPIData badData(CMPIType type) {
    CMPIData data{};
    data.type = type;
    data.state = CMPI_badValue;
    return data;
}
// Small brokers find no fault with a position behind the end.
CMPIData getElement(ArrayBody& body, Broker& broker, CMPICount index) {
    if (broker.lean() && index >= body.elements.size()) {
        return badData(body.elementType);
    }
    const Value& element = elementAt(body.elements, index);
    CMPIData data = makeData(broker, element);
    data.type = body.elementType;
    if (data.type == CMPI_chars && !element.isNull()) {
        data.value.chars = const_cast<char*>(element.text().c_str());
    }
    return data;
}
// Small brokers have arrays of strings alone and turn texts of C into these; others have arrays of
// either, and do not mix them.
void setElement(ArrayBody& body, Broker& broker, CMPICount index, const CMPIValue* value,
                CMPIType type) {
    const bool lean = broker.lean();
    Value& element =
        elementAt(body.elements, index, lean ? CMPI_RC_ERR_FAILED : CMPI_RC_ERR_NO_SUCH_PROPERTY);
    if (!lean && !value) {
        throw Failure(CMPI_RC_ERR_INVALID_PARAMETER, "no value");
    }
    Value given = readValue(value, type);
    const CMPIType givenType = lean ? given.type() : type;
    if (givenType != body.elementType && givenType != CMPI_null) {
        throw Failure(lean ? CMPI_RC_ERR_FAILED : CMPI_RC_ERR_TYPE_MISMATCH,
                      typeName(givenType) + " in an array of " + typeName(body.elementType));
    }
    given.retypeNull(stringFor(body.elementType));
    element = std::move(given);
}

// The elements of an enumeration are there, whatever their state says; small brokers find no fault
// with going on behind the last.
CMPIData nextItem(EnumerationBody& body, Broker& broker) {
    const bool over = body.next == body.items.size();
    if (over && broker.lean()) {
        return badData(CMPI_null);
    }
    if (over) {
        throw Failure(CMPI_RC_NO_MORE_ELEMENTS);
    }
    CMPIData data = makeData(broker, body.items[body.next++]);
    if (!broker.lean()) {
        data.state = CMPI_nullValue;
    }
    return data;
}
CMPIBoolean hasNext(EnumerationBody& body, Broker&) { return body.next < body.items.size(); }
CMPIArray* toArray(EnumerationBody& body, Broker& broker) {
    const CMPIType type = body.items.empty() ? CMPIType{CMPI_null} : body.items.front().type();
    return make<CMPIArray>(broker, {type, body.items});
}

// -- paths ------------------------------------------------------------------------------------

template <std::string ObjectPath::*Part>
void setPart(ObjectPath& body, Broker&, const char* text) {
    body.*Part = textOf(text);
}
template <std::string ObjectPath::*Part>
CMPIString* getPart(ObjectPath& body, Broker& broker) {
    return makeString(broker, body.*Part);
}
template <bool WithHost>
void setPlaceFrom(ObjectPath& body, Broker&, const CMPIObjectPath* source) {
    const ObjectPath& from = bodyOf(source);
    body.nameSpace = from.nameSpace;
    if (WithHost) {
        body.host = from.host;
    }
}
CMPIString* pathText(ObjectPath& body, Broker& broker) {
    return makeString(broker, printPath(body));
}

// The qualifier of whatever @p select finds in the class of a path.
template <class F>
CMPIData qualifier(const ObjectPath& path, Broker& broker, const char* name, F select) {
    if (broker.lean() || !broker.classes()) {
        throw Failure(CMPI_RC_ERR_NOT_SUPPORTED);
    }
    const CimClass* cls = broker.classOf(path);
    if (!cls) {
        throw Failure(CMPI_RC_ERR_INVALID_CLASS, path.className);
    }
    const auto* element = select(*cls);
    if (!element) {
        throw Failure(CMPI_RC_ERR_INVALID_PARAMETER, "no such element");
    }
    const CimQualifier* found = element->qualifiers.find(textOf(name));
    if (!found) {
        throw Failure(CMPI_RC_ERR_NOT_FOUND, textOf(name));
    }
    return makeData(broker, found->value);
}
CMPIData classQualifier(ObjectPath& path, Broker& broker, const char* name) {
    return qualifier(path, broker, name, [](const CimClass& cls) { return &cls; });
}
CMPIData propertyQualifier(ObjectPath& path, Broker& broker, const char* property,
                           const char* name) {
    return qualifier(path, broker, name, [property](const CimClass& cls) {
        return cls.properties.find(textOf(property));
    });
}
CMPIData methodQualifier(ObjectPath& path, Broker& broker, const char* method, const char* name) {
    return qualifier(path, broker, name,
                     [method](const CimClass& cls) { return cls.methods.find(textOf(method)); });
}
CMPIData parameterQualifier(ObjectPath& path, Broker& broker, const char* method,
                            const char* parameter, const char* name) {
    return qualifier(path, broker, name, [method, parameter](const CimClass& cls) {
        const CimMethod* found = cls.methods.find(textOf(method));
        return found ? found->parameters.find(textOf(parameter)) : nullptr;
    });
}

// -- contexts ---------------------------------------------------------------------------------

CMPIContext* cloneContext(NamedValues& body, Broker& broker) {
    if (broker.lean()) {
        throw Failure(CMPI_RC_ERR_NOT_SUPPORTED);
    }
    return cloneBody<CMPIContext>(body, broker);
}

// -- results ----------------------------------------------------------------------------------

void returnData(ResultBody& body, Broker& broker, const CMPIValue* value, CMPIType type) {
    if (!broker.lean() && !value) {
        throw Failure(CMPI_RC_ERR_INVALID_PARAMETER, "no value");
    }
    if (broker.lean() && type == CMPI_ref) {
        throw Failure(CMPI_RC_ERR_FAILED, "a path is returned by returnObjectPath alone");
    }
    const Value given = readValue(value, type);
    if (!given.isNull() && given.type() == CMPI_instance) {
        body.reply->instances.push_back(given.instance());
    } else if (!given.isNull() && given.type() == CMPI_ref) {
        body.reply->paths.push_back(given.reference());
    } else {
        body.reply->values.push_back(given);
    }
}
void returnInstance(ResultBody& body, Broker&, const CMPIInstance* instance) {
    body.reply->instances.push_back(bodyOf(instance).value);
}
void returnObjectPath(ResultBody& body, Broker&, const CMPIObjectPath* path) {
    body.reply->paths.push_back(bodyOf(path));
}
void returnDone(ResultBody& body, Broker&) { body.reply->done = true; }
void returnError(ResultBody& body, Broker&, const CMPIError* error) {
    body.reply->errors.push_back(bodyOf(error));
}

}  // namespace

void fillObjectTables(ObjectTables& tables) {
    std::get<CMPIStringFT>(tables) = tableOf<CMPIString>(entryOf<charPtr>);
    std::get<CMPIDateTimeFT>(tables) =
        tableOf<CMPIDateTime>(entryOf<binaryFormat>, entryOf<stringFormat>, entryOf<isInterval>);
    std::get<CMPIArrayFT>(tables) = tableOf<CMPIArray>(entryOf<arraySize>, entryOf<arrayType>,
                                                       entryOf<getElement>, entryOf<setElement>);
    std::get<CMPIEnumerationFT>(tables) =
        tableOf<CMPIEnumeration>(entryOf<nextItem>, entryOf<hasNext>, entryOf<toArray>);
    std::get<CMPIArgsFT>(tables) =
        tableOf<CMPIArgs>(entryOf<setNamed<CMPIArgs>>, entryOf<getNamed<CMPIArgs>>,
                          entryOf<getNamedAt<CMPIArgs>>, entryOf<countNamed<CMPIArgs>>);
    std::get<CMPIContextFT>(tables) =
        tableOf<CMPIContext>(entryOf<getNamed<CMPIContext>>, entryOf<getNamedAt<CMPIContext>>,
                             entryOf<countNamed<CMPIContext>>, entryOf<setNamed<CMPIContext>>);
    std::get<CMPIContextFT>(tables).clone = entryOf<cloneContext>;
    std::get<CMPIObjectPathFT>(tables) = tableOf<CMPIObjectPath>(
        entryOf<setPart<&ObjectPath::nameSpace>>, entryOf<getPart<&ObjectPath::nameSpace>>,
        entryOf<setPart<&ObjectPath::host>>, entryOf<getPart<&ObjectPath::host>>,
        entryOf<setPart<&ObjectPath::className>>, entryOf<getPart<&ObjectPath::className>>,
        entryOf<setNamed<CMPIObjectPath>>, entryOf<getNamed<CMPIObjectPath>>,
        entryOf<getNamedAt<CMPIObjectPath>>, entryOf<countNamed<CMPIObjectPath>>,
        entryOf<setPlaceFrom<false>>, entryOf<setPlaceFrom<true>>, entryOf<classQualifier>,
        entryOf<propertyQualifier>, entryOf<methodQualifier>, entryOf<parameterQualifier>,
        entryOf<pathText>);
    std::get<CMPIResultFT>(tables) =
        tableOf<CMPIResult>(entryOf<returnData>, entryOf<returnInstance>, entryOf<returnObjectPath>,
                            entryOf<returnDone>, entryOf<returnError>);
}

}  // namespace cimom

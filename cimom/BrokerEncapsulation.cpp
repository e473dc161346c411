// The broker's encapsulation functions: making objects, asking about them, messages and logs.

#include <cstdarg>
#include <cstdlib>
#include <cstring>

#include "Broker.h"
#include "PathText.h"
#include "Query.h"

namespace cimom {

namespace {

// -- making -----------------------------------------------------------------------------------

CMPIInstance* newInstance(Broker& broker, const CMPIObjectPath* path) {
    return make<CMPIInstance>(broker, newInstanceOf(broker, bodyOf(path)));
}
CMPIObjectPath* newObjectPath(Broker& broker, const char* nameSpace, const char* className) {
    return make<CMPIObjectPath>(broker, ObjectPath(textOf(nameSpace), textOf(className)));
}
CMPIArgs* newArgs(Broker& broker) { return make<CMPIArgs>(broker, {}); }
CMPIString* newString(Broker& broker, const char* text) {
    return make<CMPIString>(broker, {textOf(text), !text && broker.lean()});
}
CMPIArray* newArray(Broker& broker, CMPICount size, CMPIType type) {
    const Value null = readValue(nullptr, type);
    if (null.isArray() || null.type() == CMPI_null || !isValueType(null.type())) {
        throw Failure(CMPI_RC_ERR_INVALID_DATA_TYPE, "type " + std::to_string(type));
    }
    const CMPIType seen = broker.lean() || type != CMPI_chars ? null.type() : type;
    return make<CMPIArray>(broker, {seen, Value::Array(size, null)});
}
CMPIDateTime* newDateTime(Broker& broker) { return make<CMPIDateTime>(broker, DateTime::now()); }
CMPIDateTime* newDateTimeFromBinary(Broker& broker, CMPIUint64 micros, CMPIBoolean interval) {
    return make<CMPIDateTime>(broker, DateTime::fromBinary(micros, interval != 0));
}
CMPIDateTime* newDateTimeFromChars(Broker& broker, const char* text) {
    DateTime when;
    if (!DateTime::parse(textOf(text), when)) {
        throw Failure(CMPI_RC_ERR_INVALID_PARAMETER, "no date-time: " + textOf(text));
    }
    return make<CMPIDateTime>(broker, when);
}
CMPISelectExp* newSelectExp(Broker& broker, const char* text, const char* language,
                            CMPIArray** projection) {
    auto query = Query::parse(textOf(text), textOf(language));
    if (projection) {
        const auto& names = query->projection();
        *projection = names.empty()
                          ? nullptr
                          : make<CMPIArray>(broker, {CMPI_string, {names.begin(), names.end()}});
    }
    return make<CMPISelectExp>(broker, std::move(query));
}
CMPIError* newError(Broker& broker, const char* owner, const char* messageId, const char* message,
                    CMPIErrorSeverity severity, CMPIErrorProbableCause cause, CMPIrc code) {
    return make<CMPIError>(broker,
                           newErrorFields(owner, messageId, message, severity, cause, code));
}

// -- asking -----------------------------------------------------------------------------------

CMPIBoolean classPathIsA(Broker& broker, const CMPIObjectPath* path, const char* className) {
    const std::string& mine = bodyOf(path).className;
    const std::string other = textOf(className);
    if (other.empty()) {
        throw Failure(CMPI_RC_ERR_INVALID_PARAMETER, "no class name");
    }
    if (sameName(mine, other)) {
        return 1;
    }
    if (!broker.classes()) {
        return 0;
    }
    if (!broker.lean() && !broker.classes()->findClass(mine)) {
        throw Failure(CMPI_RC_ERR_NOT_FOUND, "no class " + mine);
    }
    return broker.classes()->isA(mine, other);
}

// In the order of Kinds.
constexpr const char* kObjectTypes[] = {
    "CMPIString",     "CMPIInstance", "CMPIObjectPath",  "CMPIArgs",   "CMPIContext",
    "CMPIArray",      "CMPIDateTime", "CMPIEnumeration", "CMPIResult", "CMPISelectExp",
    "CMPISelectCond", "CMPISubCond",  "CMPIPredicate",   "CMPIError"};
static_assert(std::size(kObjectTypes) == kKindCount, "one name for each kind");

Node& anyNode(const void* object) {
    if (!object) {
        throw Failure(CMPI_RC_ERR_INVALID_HANDLE, "no object");
    }
    Node& node = nodeAt(object);
    withKind(node.chunk->kind, [object](auto kind) {
        nodeOf(static_cast<const typename decltype(kind)::Face*>(object));
    });
    return node;
}

/// Its text; of what has none of its own, the name of its type.
std::string describe(Node& node) {
    return withKind(node.chunk->kind, [&node](auto kind) -> std::string {
        using B = typename decltype(kind)::Body;
        const B& body = *static_cast<NodeOf<typename decltype(kind)::Face>&>(node).body;
        if constexpr (std::is_same_v<B, StringBody>) {
            return body.text;
        } else if constexpr (std::is_same_v<B, InstanceBody>) {
            return printInstance(body.value);
        } else if constexpr (std::is_same_v<B, ObjectPath>) {
            return printPath(body);
        } else if constexpr (std::is_same_v<B, DateTime>) {
            return body.text();
        } else {
            return kObjectTypes[node.chunk->kind];
        }
    });
}

// Small brokers have a text for paths and instances alone.
CMPIString* objectText(Broker& broker, const void* object) {
    Node& node = anyNode(object);
    const std::size_t kind = node.chunk->kind;
    if (broker.lean() && kind != kindOf<CMPIObjectPath>() && kind != kindOf<CMPIInstance>()) {
        throw Failure(CMPI_RC_ERR_NOT_SUPPORTED);
    }
    return makeString(broker, describe(node));
}
const char* typeOfObject(const void* object) { return kObjectTypes[anyNode(object).chunk->kind]; }
CMPIBoolean isOfType(Broker&, const void* object, const char* type) {
    return textOf(type) == typeOfObject(object);
}
CMPIString* getType(Broker& broker, const void* object) {
    return makeString(broker, typeOfObject(object));
}

// -- messages ---------------------------------------------------------------------------------

constexpr CMPICount kMostInserts = 10;

std::string insertText(int type, std::va_list& list) {
    switch (type) {
        case CMPI_sint32:
            return std::to_string(va_arg(list, int));
        case CMPI_uint32:
            return std::to_string(va_arg(list, unsigned));
        case CMPI_sint64:
            return std::to_string(va_arg(list, long long));
        case CMPI_uint64:
            return std::to_string(va_arg(list, unsigned long long));
        case CMPI_real64:
            return printValue(Value(va_arg(list, double)));
        case CMPI_boolean:
            return va_arg(list, int) ? "true" : "false";
        case CMPI_chars:
            return textOf(va_arg(list, const char*));
        case CMPI_string: {
            const CMPIString* string = va_arg(list, const CMPIString*);
            return string ? bodyOf(string).text : std::string();
        }
        default:
            throw Failure(CMPI_RC_ERR_TYPE_MISMATCH, "insert of type " + std::to_string(type));
    }
}

std::vector<std::string> readInserts(CMPICount count, std::va_list& list) {
    if (count > kMostInserts) {
        throw Failure(CMPI_RC_ERR_INVALID_PARAMETER, std::to_string(count) + " inserts");
    }
    std::vector<std::string> inserts;
    for (CMPICount i = 0; i < count; ++i) {
        const int type = va_arg(list, int);
        inserts.push_back(insertText(type, list));
    }
    return inserts;
}

// The languages of the request on this thread, or of the process where the request says so.
std::vector<std::string> languagesOf(const Broker& broker) {
    Activation* activation = Activation::current(broker);
    if (!activation) {
        return {};
    }
    const NamedValues& context = bodyOf(activation->context());
    const auto given = [&context](const char* name, CMPIType type) {
        const Value* value = context.find(name);
        return value && !value->isNull() && value->type() == type ? value : nullptr;
    };
    const Value* local = given("UseProcessLocale", CMPI_boolean);
    if (local && local->boolean()) {
        for (const char* variable : {"LC_ALL", "LC_MESSAGES", "LANG"}) {
            if (const char* locale = std::getenv(variable)) {
                if (*locale) {
                    return wantedLanguages(locale);
                }
            }
        }
        return {};
    }
    const Value* accepted = given(CMPIAcceptLanguage, CMPI_string);
    return accepted ? wantedLanguages(accepted->text()) : std::vector<std::string>{};
}

void openMessageFile(Broker& broker, const char* file, CMPIMsgFileHandle* handle) {
    if (!handle) {
        throw Failure(CMPI_RC_ERR_INVALID_PARAMETER, "no place for the handle");
    }
    *handle = nullptr;
    *handle = const_cast<MessageTexts*>(broker.messages().open(textOf(file), languagesOf(broker)));
}
void closeMessageFile(Broker& broker, CMPIMsgFileHandle handle) {
    if (!broker.messages().close(static_cast<MessageStore::Handle>(handle))) {
        throw Failure(CMPI_RC_ERR_INVALID_HANDLE, "message file not open");
    }
}

CMPIString* message(const CMPIBroker* mb, const char* id, CMPIMsgFileHandle handle,
                    const char* text, CMPIStatus* rc, CMPICount count, std::va_list& list) {
    return brokerEntry(mb, rc, [&](Broker& broker) {
        const std::vector<std::string> inserts = readInserts(count, list);
        const std::string* found =
            handle ? broker.messages().find(static_cast<MessageStore::Handle>(handle), textOf(id))
                   : nullptr;
        return makeString(broker, withInserts(found ? *found : textOf(text), inserts));
    });
}

CMPIString* getMessage2(const CMPIBroker* mb, const char* id, const CMPIMsgFileHandle handle,
                        const char* text, CMPIStatus* rc, CMPICount count, ...) {
    std::va_list list;
    va_start(list, count);
    CMPIString* result = message(mb, id, handle, text, rc, count, list);
    va_end(list);
    return result;
}
// Small brokers have no texts, and give back the one at hand as it is.
CMPIString* giveMessageBack(const CMPIBroker* mb, const char*, const char* text, CMPIStatus* rc,
                            CMPICount, ...) {
    CMPIString* back =
        brokerEntry(mb, rc, [text](Broker& broker) { return newString(broker, text); });
    if (back) {
        setStatus(rc, CMPI_RC_ERR_NOT_SUPPORTED);
    }
    return back;
}
// Without a bundle of its own, a text is looked up in the default one.
CMPIString* getMessage(const CMPIBroker* mb, const char* id, const char* text, CMPIStatus* rc,
                       CMPICount count, ...) {
    CMPIMsgFileHandle handle = nullptr;
    brokerStatus(mb, [&](Broker& broker) { openMessageFile(broker, "", &handle); });
    std::va_list list;
    va_start(list, count);
    CMPIString* result = message(mb, id, handle, text, rc, count, list);
    va_end(list);
    if (handle) {
        brokerStatus(mb, [&](Broker& broker) { closeMessageFile(broker, handle); });
    }
    return result;
}

// -- logs -------------------------------------------------------------------------------------

CMPIStatus log(const CMPIBroker* mb, LogLine::Kind kind, int level, const char* component,
               const char* text, const CMPIString* string) {
    return brokerStatus(mb, [=](Broker& broker) {
        if (broker.lean()) {
            throw Failure(CMPI_RC_ERR_NOT_SUPPORTED);
        }
        broker.log(
            {kind, level, textOf(component), text || !string ? textOf(text) : bodyOf(string).text});
    });
}
CMPIStatus logMessage(const CMPIBroker* mb, CMPISeverity severity, const char* id, const char* text,
                      const CMPIString* string) {
    return log(mb, LogLine::Kind::Message, severity, id, text, string);
}
CMPIStatus trace(const CMPIBroker* mb, CMPILevel level, const char* component, const char* text,
                 const CMPIString* string) {
    // Providers trace at levels that the enumeration does not name; those are no values of it.
    int number = 0;
    static_assert(sizeof number == sizeof level, "an enumeration is an int");
    std::memcpy(&number, &level, sizeof number);
    return log(mb, LogLine::Kind::Trace, number, component, text, string);
}

}  // namespace

CMPIBrokerEncFT encapsulationTable(bool lean) {
    return brokerTable(lean, 1, &CMPIBrokerEncFT::trace, entryOf<newInstance>,
                       entryOf<newObjectPath>, entryOf<newArgs>, entryOf<newString>,
                       entryOf<newArray>, entryOf<newDateTime>, entryOf<newDateTimeFromBinary>,
                       entryOf<newDateTimeFromChars>, entryOf<newSelectExp>, entryOf<classPathIsA>,
                       entryOf<objectText>, entryOf<isOfType>, entryOf<getType>,
                       lean ? giveMessageBack : getMessage, logMessage, trace, entryOf<newError>,
                       entryOf<openMessageFile>, entryOf<closeMessageFile>, getMessage2);
}

}  // namespace cimom

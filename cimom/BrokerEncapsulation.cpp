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

CMPIInstance* newInstance(const CMPIBroker* mb, const CMPIObjectPath* path, CMPIStatus* rc) {
    return brokerEntry(mb, rc, [path](Broker& broker) {
        return make<CMPIInstance>(broker, newInstanceOf(broker, bodyOf(path)));
    });
}
CMPIObjectPath* newObjectPath(const CMPIBroker* mb, const char* nameSpace, const char* className,
                              CMPIStatus* rc) {
    return brokerEntry(mb, rc, [=](Broker& broker) {
        return make<CMPIObjectPath>(broker, ObjectPath(textOf(nameSpace), textOf(className)));
    });
}
CMPIArgs* newArgs(const CMPIBroker* mb, CMPIStatus* rc) {
    return brokerEntry(mb, rc, [](Broker& broker) { return make<CMPIArgs>(broker, {}); });
}
CMPIString* newString(const CMPIBroker* mb, const char* text, CMPIStatus* rc) {
    return brokerEntry(mb, rc, [text](Broker& broker) { return makeString(broker, textOf(text)); });
}
CMPIArray* newArray(const CMPIBroker* mb, CMPICount size, CMPIType type, CMPIStatus* rc) {
    return brokerEntry(mb, rc, [=](Broker& broker) {
        const Value null = readValue(nullptr, type);
        if (null.isArray() || null.type() == CMPI_null || !isValueType(null.type()))
            throw Failure(CMPI_RC_ERR_INVALID_DATA_TYPE, "type " + std::to_string(type));
        return make<CMPIArray>(broker, {null.type(), Value::Array(size, null)});
    });
}
CMPIDateTime* newDateTime(const CMPIBroker* mb, CMPIStatus* rc) {
    return brokerEntry(mb, rc,
                       [](Broker& broker) { return make<CMPIDateTime>(broker, DateTime::now()); });
}
CMPIDateTime* newDateTimeFromBinary(const CMPIBroker* mb, CMPIUint64 micros, CMPIBoolean interval,
                                    CMPIStatus* rc) {
    return brokerEntry(mb, rc, [=](Broker& broker) {
        return make<CMPIDateTime>(broker, DateTime::fromBinary(micros, interval != 0));
    });
}
CMPIDateTime* newDateTimeFromChars(const CMPIBroker* mb, const char* text, CMPIStatus* rc) {
    return brokerEntry(mb, rc, [text](Broker& broker) {
        DateTime when;
        if (!DateTime::parse(textOf(text), when))
            throw Failure(CMPI_RC_ERR_INVALID_PARAMETER, "no date-time: " + textOf(text));
        return make<CMPIDateTime>(broker, when);
    });
}
CMPISelectExp* newSelectExp(const CMPIBroker* mb, const char* text, const char* language,
                            CMPIArray** projection, CMPIStatus* rc) {
    return brokerEntry(mb, rc, [=](Broker& broker) {
        auto query = Query::parse(textOf(text), textOf(language));
        if (projection) {
            Value::Array names;
            for (const std::string& name : query->projection()) names.emplace_back(name);
            *projection =
                names.empty() ? nullptr : make<CMPIArray>(broker, {CMPI_string, std::move(names)});
        }
        return make<CMPISelectExp>(broker, std::move(query));
    });
}
CMPIError* newError(const CMPIBroker* mb, const char* owner, const char* messageId,
                    const char* message, const CMPIErrorSeverity severity,
                    const CMPIErrorProbableCause cause, const CMPIrc code, CMPIStatus* rc) {
    return brokerEntry(mb, rc, [=](Broker& broker) {
        return make<CMPIError>(broker,
                               newErrorFields(owner, messageId, message, severity, cause, code));
    });
}

// -- asking -----------------------------------------------------------------------------------

CMPIBoolean classPathIsA(const CMPIBroker* mb, const CMPIObjectPath* path, const char* className,
                         CMPIStatus* rc) {
    return brokerEntry(mb, rc, [=](Broker& broker) -> CMPIBoolean {
        const std::string& mine = bodyOf(path).className;
        const std::string other = textOf(className);
        if (other.empty()) throw Failure(CMPI_RC_ERR_INVALID_PARAMETER, "no class name");
        if (sameName(mine, other)) return 1;
        if (!broker.classes()) return 0;
        if (!broker.lean() && !broker.classes()->findClass(mine))
            throw Failure(CMPI_RC_ERR_NOT_FOUND, "no class " + mine);
        return broker.classes()->isA(mine, other) ? 1 : 0;
    });
}

// In the order of Kinds.
constexpr const char* kObjectTypes[] = {
    "CMPIString",     "CMPIInstance", "CMPIObjectPath",  "CMPIArgs",   "CMPIContext",
    "CMPIArray",      "CMPIDateTime", "CMPIEnumeration", "CMPIResult", "CMPISelectExp",
    "CMPISelectCond", "CMPISubCond",  "CMPIPredicate",   "CMPIError"};
static_assert(std::size(kObjectTypes) == kKindCount, "one name for each kind");

// Every CMPI object begins with its hdl.
Node& anyNode(const void* object) {
    Node* node = object ? static_cast<Node*>(*static_cast<void* const*>(object)) : nullptr;
    if (object && !node) countStaleUse();
    if (!node) throw Failure(CMPI_RC_ERR_INVALID_HANDLE, "no object");
    return *node;
}

std::string describe(Node& node) {
    return withKind(node.chunk->kind, [&node](auto kind) -> std::string {
        using B = typename decltype(kind)::Body;
        const B& body = *static_cast<NodeOf<typename decltype(kind)::Face>&>(node).body;
        if constexpr (std::is_same_v<B, StringBody>)
            return body.text;
        else if constexpr (std::is_same_v<B, InstanceBody>)
            return printInstance(body.value);
        else if constexpr (std::is_same_v<B, ObjectPath>)
            return printPath(body);
        else if constexpr (std::is_same_v<B, DateTime>)
            return body.text();
        else if constexpr (std::is_same_v<B, ArrayBody>)
            return printValue(Value::array(body.elementType, body.elements));
        else if constexpr (std::is_same_v<B, std::shared_ptr<const Query>>)
            return body->text();
        else if constexpr (std::is_same_v<B, NamedValues>) {
            std::string out = "{";
            for (const auto& [name, value] : body)
                out += (out.size() > 1 ? ", " : "") + name + " = " + printValue(value);
            return out + "}";
        } else
            return kObjectTypes[node.chunk->kind];
    });
}

CMPIString* objectText(const CMPIBroker* mb, const void* object, CMPIStatus* rc) {
    return brokerEntry(
        mb, rc, [object](Broker& broker) { return makeString(broker, describe(anyNode(object))); });
}
CMPIBoolean isOfType(const CMPIBroker* mb, const void* object, const char* type, CMPIStatus* rc) {
    return brokerEntry(mb, rc, [=](Broker&) -> CMPIBoolean {
        return textOf(type) == kObjectTypes[anyNode(object).chunk->kind] ? 1 : 0;
    });
}
CMPIString* getType(const CMPIBroker* mb, const void* object, CMPIStatus* rc) {
    return brokerEntry(mb, rc, [object](Broker& broker) {
        return makeString(broker, kObjectTypes[anyNode(object).chunk->kind]);
    });
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
    if (count > kMostInserts)
        throw Failure(CMPI_RC_ERR_INVALID_PARAMETER, std::to_string(count) + " inserts");
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
    if (!activation) return {};
    const NamedValues& context = bodyOf(activation->context());
    const Value* local = context.find("UseProcessLocale");
    if (local && !local->isNull() && local->type() == CMPI_boolean && local->boolean()) {
        for (const char* variable : {"LC_ALL", "LC_MESSAGES", "LANG"})
            if (const char* locale = std::getenv(variable))
                if (*locale) return wantedLanguages(locale);
        return {};
    }
    const Value* accepted = context.find(CMPIAcceptLanguage);
    const bool given = accepted && !accepted->isNull() && accepted->type() == CMPI_string;
    return given ? wantedLanguages(accepted->text()) : std::vector<std::string>{};
}

CMPIStatus openMessageFile(const CMPIBroker* mb, const char* file, CMPIMsgFileHandle* handle) {
    if (handle) *handle = nullptr;
    return brokerStatus(mb, [=](Broker& broker) {
        if (!handle) throw Failure(CMPI_RC_ERR_INVALID_PARAMETER, "no place for the handle");
        *handle =
            const_cast<MessageTexts*>(broker.messages().open(textOf(file), languagesOf(broker)));
    });
}
CMPIStatus closeMessageFile(const CMPIBroker* mb, const CMPIMsgFileHandle handle) {
    return brokerStatus(mb, [handle](Broker& broker) {
        if (!broker.messages().close(static_cast<MessageStore::Handle>(handle)))
            throw Failure(CMPI_RC_ERR_INVALID_HANDLE, "message file not open");
    });
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
// Without a bundle of its own, a text is looked up in the default one.
CMPIString* getMessage(const CMPIBroker* mb, const char* id, const char* text, CMPIStatus* rc,
                       CMPICount count, ...) {
    CMPIMsgFileHandle handle = nullptr;
    openMessageFile(mb, "", &handle);
    std::va_list list;
    va_start(list, count);
    CMPIString* result = message(mb, id, handle, text, rc, count, list);
    va_end(list);
    if (handle) closeMessageFile(mb, handle);
    return result;
}

// -- logs -------------------------------------------------------------------------------------

CMPIStatus log(const CMPIBroker* mb, LogLine::Kind kind, int level, const char* component,
               const char* text, const CMPIString* string) {
    return brokerStatus(mb, [=](Broker& broker) {
        if (broker.lean()) throw Failure(CMPI_RC_ERR_NOT_SUPPORTED);
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
    CMPIBrokerEncFT table = {CMPIVersion200,
                             newInstance,
                             newObjectPath,
                             newArgs,
                             newString,
                             newArray,
                             newDateTime,
                             newDateTimeFromBinary,
                             newDateTimeFromChars,
                             newSelectExp,
                             classPathIsA,
                             objectText,
                             isOfType,
                             getType,
                             getMessage,
                             logMessage,
                             trace,
                             newError,
                             openMessageFile,
                             closeMessageFile,
                             getMessage2};
    if (lean) {
        table.ftVersion = 1;
        endTableAfter(table, &CMPIBrokerEncFT::trace);
    }
    return table;
}

}  // namespace cimom

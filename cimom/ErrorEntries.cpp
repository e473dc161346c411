// Entries of CMPIError. Its fields are values by the names of the properties of CIM_Error.

#include "NamedEntries.h"

namespace cimom {

namespace {

constexpr char kType[] = "ErrorType";
constexpr char kOtherType[] = "OtherErrorType";
constexpr char kOwner[] = "OwningEntity";
constexpr char kMessageId[] = "MessageID";
constexpr char kMessage[] = "Message";
constexpr char kSeverity[] = "PerceivedSeverity";
constexpr char kCause[] = "ProbableCause";
constexpr char kCauseText[] = "ProbableCauseDescription";
constexpr char kActions[] = "RecommendedActions";
constexpr char kSource[] = "ErrorSource";
constexpr char kSourceFormat[] = "ErrorSourceFormat";
constexpr char kOtherSourceFormat[] = "OtherErrorSourceFormat";
constexpr char kStatus[] = "CIMStatusCode";
constexpr char kStatusText[] = "CIMStatusCodeDescription";
constexpr char kArguments[] = "MessageArguments";

template <const char* Field>
CMPIString* getText(const CMPIError* error, CMPIStatus* rc) {
    return objectEntry(error, rc, [](NamedValues& fields, Broker& broker) -> CMPIString* {
        const Value* value = fields.find(Field);
        return value && !value->isNull() ? makeString(broker, value->text()) : nullptr;
    });
}
template <const char* Field>
CMPIStatus setText(CMPIError* error, const char* text) {
    return objectStatus(error,
                        [text](NamedValues& fields, Broker&) { fields.set(Field, Value(text)); });
}

template <const char* Field, class Enum>
Enum getCode(const CMPIError* error, CMPIStatus* rc) {
    return objectEntry(error, rc, [](NamedValues& fields, Broker&) {
        const Value* value = fields.find(Field);
        return static_cast<Enum>(value ? value->uint() : 0);
    });
}
template <const char* Field, class Enum>
CMPIStatus setCode(CMPIError* error, const Enum code) {
    return objectStatus(error, [code](NamedValues& fields, Broker&) {
        fields.set(Field, Value(static_cast<std::uint32_t>(code)));
    });
}

template <const char* Field>
CMPIArray* getTexts(const CMPIError* error, CMPIStatus* rc) {
    return objectEntry(error, rc, [](NamedValues& fields, Broker& broker) -> CMPIArray* {
        const Value* value = fields.find(Field);
        return value ? makeData(broker, *value).value.array : nullptr;
    });
}
template <const char* Field, class Array>
CMPIStatus setTexts(CMPIError* error, Array* texts) {
    return objectStatus(error, [texts](NamedValues& fields, Broker&) {
        const ArrayBody& body = bodyOf(static_cast<const CMPIArray*>(texts));
        if (body.elementType != CMPI_string)
            throw Failure(CMPI_RC_ERR_INVALID_PARAMETER, "not an array of strings");
        fields.set(Field, Value::array(CMPI_string, body.elements));
    });
}

}  // namespace

NamedValues newErrorFields(const char* owner, const char* messageId, const char* message,
                           CMPIErrorSeverity severity, CMPIErrorProbableCause cause, CMPIrc rc) {
    return {{kOwner, Value(owner)},
            {kMessageId, Value(messageId)},
            {kMessage, Value(message)},
            {kSeverity, Value(static_cast<std::uint32_t>(severity))},
            {kCause, Value(static_cast<std::uint32_t>(cause))},
            {kStatus, Value(static_cast<std::uint32_t>(rc))}};
}

void fillErrorTable(ObjectTables& tables) {
    std::get<CMPIErrorFT>(tables) = {0,
                                     releaseObject<CMPIError>,
                                     cloneObject<CMPIError>,
                                     getCode<kType, CMPIErrorType>,
                                     getText<kOtherType>,
                                     getText<kOwner>,
                                     getText<kMessageId>,
                                     getText<kMessage>,
                                     getCode<kSeverity, CMPIErrorSeverity>,
                                     getCode<kCause, CMPIErrorProbableCause>,
                                     getText<kCauseText>,
                                     getTexts<kActions>,
                                     getText<kSource>,
                                     getCode<kSourceFormat, CMPIErrorSrcFormat>,
                                     getText<kOtherSourceFormat>,
                                     getCode<kStatus, CMPIrc>,
                                     getText<kStatusText>,
                                     getTexts<kArguments>,
                                     setCode<kType, CMPIErrorType>,
                                     setText<kOtherType>,
                                     setText<kCauseText>,
                                     setTexts<kActions, const CMPIArray>,
                                     setText<kSource>,
                                     setCode<kSourceFormat, CMPIErrorSrcFormat>,
                                     setText<kOtherSourceFormat>,
                                     setText<kStatusText>,
                                     setTexts<kArguments, CMPIArray>};
}

}  // namespace cimom

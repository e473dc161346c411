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

// A field that has not been set is null, or code 0.
template <const char* Field, auto Member, class R>
R getField(NamedValues& fields, Broker& broker) {
    const Value* value = fields.find(Field);
    const CMPIValue data = value ? makeData(broker, *value).value : CMPIValue{};
    return static_cast<R>(data.*Member);
}
template <const char* Field>
constexpr auto getText = entryOf<getField<Field, &CMPIValue::string, CMPIString*>>;
template <const char* Field>
constexpr auto getTexts = entryOf<getField<Field, &CMPIValue::array, CMPIArray*>>;
template <const char* Field, class Enum>
constexpr auto getCode = entryOf<getField<Field, &CMPIValue::uint32, Enum>>;

Value fieldOf(const char* text) { return Value(text); }
Value fieldOf(const CMPIArray* texts) {
    const ArrayBody& body = bodyOf(texts);
    if (stringFor(body.elementType) != CMPI_string) {
        throw Failure(CMPI_RC_ERR_INVALID_PARAMETER, "not an array of strings");
    }
    return Value::array(CMPI_string, body.elements);
}
template <class Enum, class = std::enable_if_t<std::is_enum_v<Enum>>>
Value fieldOf(Enum code) {
    return Value(static_cast<std::uint32_t>(code));
}

template <const char* Field, class T>
void setField(NamedValues& fields, Broker&, T given) {
    fields.set(Field, fieldOf(given));
}
template <const char* Field, class T>
constexpr auto set = entryOf<setField<Field, T>>;

}  // namespace

NamedValues newErrorFields(const char* owner, const char* messageId, const char* message,
                           CMPIErrorSeverity severity, CMPIErrorProbableCause cause, CMPIrc rc) {
    return {{kOwner, fieldOf(owner)},     {kMessageId, fieldOf(messageId)},
            {kMessage, fieldOf(message)}, {kSeverity, fieldOf(severity)},
            {kCause, fieldOf(cause)},     {kStatus, fieldOf(rc)}};
}

void fillErrorTable(ObjectTables& tables) {
    std::get<CMPIErrorFT>(tables) = tableOf<CMPIError>(
        getCode<kType, CMPIErrorType>, getText<kOtherType>, getText<kOwner>, getText<kMessageId>,
        getText<kMessage>, getCode<kSeverity, CMPIErrorSeverity>,
        getCode<kCause, CMPIErrorProbableCause>, getText<kCauseText>, getTexts<kActions>,
        getText<kSource>, getCode<kSourceFormat, CMPIErrorSrcFormat>, getText<kOtherSourceFormat>,
        getCode<kStatus, CMPIrc>, getText<kStatusText>, getTexts<kArguments>,
        // what can be set
        set<kType, CMPIErrorType>, set<kOtherType, const char*>, set<kCauseText, const char*>,
        set<kActions, const CMPIArray*>, set<kSource, const char*>,
        set<kSourceFormat, CMPIErrorSrcFormat>, set<kOtherSourceFormat, const char*>,
        set<kStatusText, const char*>, set<kArguments, CMPIArray*>);
}

}  // namespace cimom

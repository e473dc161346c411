// The throw family of zemBaseProvider.
#include "BaseProviderFailure.h"

#include <cstdlib>
#include <string>

#include "BaseProvider.h"
#include "Exception.h"
#include "Log.h"

namespace {

using Text = const char*;
constexpr auto kInvalidParameter = zemThrow<zemInvalidParameterException>;

// Marks: M method, K class, P provider; u user, k key, p property or parameter, o object, v value,
// w value expected.

constexpr zemFailure kMethodNotSupported = {
    "throwMethodNotSupportedExc",
    "Error.MethodNotSupported",
    "Method $M on provider $P is not supported for class $K.",
    "MPK",
    zemThrow<zemNotSupportedException>,
    true,
    "zemMethodNotFoundException"};

constexpr zemFailure kMethodNotFound = {
    "throwMethodNotFoundExc",
    "Error.MethodNotFound",
    "CIM_ERR_METHOD_NOT_FOUND (The invoked method  $M is not supported for class $K)",
    "MPK",
    zemThrow<zemMethodNotFoundException>,
    true,
    "throwMethodNotFoundExc"};

constexpr zemFailure kUserAccessDenied = {
    "throwUserAccessDeniedExc", "Error.UserAccessDenied",
    "User $u is not authorized to utilize $M operation of class $K on provider $P.", "uMKP",
    zemThrow<zemAccessDeniedException>};

constexpr zemFailure kKeyNotFound = {
    "throwKeyNotFoundExc", "Error.KeyNotFound",
    "Key $k for class $K is not provided to method $M on provider $P.", "kKMP", kInvalidParameter};

constexpr zemFailure kInvalidKey = {
    "throwInvalidKeyExc", "Error.InvalidKey",
    "Invalid key name $k for class $K is provided to method $M on provider $P.", "kKMP",
    kInvalidParameter};

constexpr zemFailure kDuplicateKey = {
    "throwDuplicateKeyExc", "Error.DuplicateKey",
    "Duplicate key $k for class $K is provided to method $M on provider $P.", "kKMP",
    kInvalidParameter};

constexpr zemFailure kKeyValueDoesntMatch = {
    "throwKeyValueDoesntMatchExc", "Error.KeyValueDoesntMatch",
    "A key provided for class $K to method $M on provider $P had an unexpected value. A value of "
    "$v was provided for key $k instead of the expected value of $w.",
    "KMPvkw", kInvalidParameter};

constexpr zemFailure kPropertyNotFound = {
    "throwPropertyNotFoundExc", "Error.PropertyNotFound",
    "Property $p is not found on instance provided for class $K.", "pK", kInvalidParameter};

constexpr zemFailure kDuplicateProperty = {
    "throwDuplicatePropertyExc", "Error.DuplicateProperty",
    "Duplicate property name $p for class $K is provided to method $M on provider $P.", "pKMP",
    kInvalidParameter};

constexpr zemFailure kInvalidProperty = {
    "throwInvalidPropertyExc", "Error.InvalidProperty",
    "Invalid property name $p for class $K is provided to method $M on provider $P.", "pKMP",
    kInvalidParameter};

constexpr zemFailure kObjectNotFound = {
    "throwObjectNotFoundExc", "Error.ObjectNotFound",
    "The requested object $o of class $K can not be found. The exception was thrown from method "
    "$M on provider $P.",
    "oKMP", zemThrow<zemObjectNotFoundException>};

constexpr zemFailure kWrongMethodArg = {
    "throwWrongMethodArgExc", "Error.WrongMethodArg",
    "Wrong method argument $p when invoking method $M on provider $P.", "pMP", kInvalidParameter};

constexpr zemFailure kDuplicateMethodArg = {
    "throwDuplicateMethodArgExc", "Error.DuplicateMethodArg",
    "Duplicate method argument $p when invoking method $M on provider $P.", "pMP",
    kInvalidParameter};

constexpr bool kNotLocalised = false;
constexpr zemFailure kInvalidMethodArgValue = {
    "throwInvalidMethodArgValueExc",
    "Error.InvalidMethodArgValue",
    "Invalid value of $v is provided for parameter $p to method $M on provider $P.",
    "",
    kInvalidParameter,
    kNotLocalised};

constexpr zemFailure kParameterNotFound = {"throwParameterNotFoundExc", "Error.ParameterNotFound",
                                           "Parameter $p is not found in provided parameters.", "p",
                                           kInvalidParameter};

Text insertFor(char mark, Text provider, std::initializer_list<zemInsert> inserts) {
    if (mark == 'P') {
        return provider;
    }
    for (const zemInsert& insert : inserts) {
        if (insert.mark == mark) {
            return insert.text;
        }
    }
    return nullptr;
}

}  // namespace

std::string zemFillSentence(Text sentence, Text provider,
                            std::initializer_list<zemInsert> inserts) {
    std::string text;
    for (Text next = sentence; *next != '\0'; ++next) {
        if (*next != '$') {
            text += *next;
        } else if (Text insert = insertFor(*++next, provider, inserts)) {
            text += insert;
        }
    }
    return text;
}

void zemRaise(CMPIBroker* broker, Text provider, const zemFailure& failure,
              std::initializer_list<zemInsert> inserts) {
    PROV_TRACE_OF(broker, provider);
    zemProviderTracer::_traceEnter(PROV_TRACE_BROKER, PROV_TRACE_FILE, __LINE__,
                                   PROV_TRACE_COMPONENT, failure.function);
    if (failure.printedAs != nullptr) {
        zemLog::LogPlain((std::string(failure.function) + " <-").c_str());
    }

    const std::string sentence = zemFillSentence(failure.sentence, provider, inserts);
    zemString text(sentence.c_str());
    if (failure.localised) {
        Text a[10] = {};
        for (size_t i = 0; i < 10 && failure.arguments[i] != '\0'; ++i) {
            a[i] = insertFor(failure.arguments[i], provider, inserts);
        }
        text = zemBaseProvider::retrieveLocalizedString(broker, provider, "", failure.messageKey,
                                                        sentence.c_str(), 0, a[0], a[1], a[2], a[3],
                                                        a[4], a[5], a[6], a[7], a[8], a[9]);
    }

    PROV_TRACE_STRING(3, "Exception: %s", static_cast<Text>(text));
    zemProviderTracer::_traceExit(PROV_TRACE_BROKER, PROV_TRACE_FILE, __LINE__,
                                  PROV_TRACE_COMPONENT, failure.function);
    if (failure.printedAs != nullptr) {
        zemLog::LogPlain((std::string(failure.printedAs) + ":errMessage:" + Text(text)).c_str());
    }
    failure.throwIt(text);
    std::abort();  // throwIt does not return
}

void zemBaseProvider::throwMethodNotSupportedExc(Text M, Text K) const {
    zemRaise(rawBroker(), m_providerName, kMethodNotSupported, {{'M', M}, {'K', K}});
}

void zemBaseProvider::throwMethodNotFoundExc(Text M, Text K) const {
    zemRaise(rawBroker(), m_providerName, kMethodNotFound, {{'M', M}, {'K', K}});
}

void zemBaseProvider::throwUserAccessDeniedExc(Text M, Text K, Text user) const {
    zemRaise(rawBroker(), m_providerName, kUserAccessDenied, {{'M', M}, {'K', K}, {'u', user}});
}

void zemBaseProvider::throwKeyNotFoundExc(Text M, Text K, Text key) const {
    zemRaise(rawBroker(), m_providerName, kKeyNotFound, {{'M', M}, {'K', K}, {'k', key}});
}

void zemBaseProvider::throwInvalidKeyExc(Text M, Text K, Text key) const {
    zemRaise(rawBroker(), m_providerName, kInvalidKey, {{'M', M}, {'K', K}, {'k', key}});
}

void zemBaseProvider::throwDuplicateKeyExc(Text M, Text K, Text key) const {
    zemRaise(rawBroker(), m_providerName, kDuplicateKey, {{'M', M}, {'K', K}, {'k', key}});
}

void zemBaseProvider::throwKeyValueDoesntMatchExc(Text M, Text K, Text key, Text value1,
                                                  Text value2) const {
    zemRaise(rawBroker(), m_providerName, kKeyValueDoesntMatch,
             {{'M', M}, {'K', K}, {'k', key}, {'v', value1}, {'w', value2}});
}

void zemBaseProvider::throwPropertyNotFoundExc(Text K, Text property) const {
    zemRaise(rawBroker(), m_providerName, kPropertyNotFound, {{'K', K}, {'p', property}});
}

void zemBaseProvider::throwDuplicatePropertyExc(Text M, Text K, Text property) const {
    zemRaise(rawBroker(), m_providerName, kDuplicateProperty,
             {{'M', M}, {'K', K}, {'p', property}});
}

void zemBaseProvider::throwInvalidPropertyExc(Text M, Text K, Text property) const {
    zemRaise(rawBroker(), m_providerName, kInvalidProperty, {{'M', M}, {'K', K}, {'p', property}});
}

void zemBaseProvider::throwObjectNotFoundExc(Text M, Text K, Text object) const {
    zemRaise(rawBroker(), m_providerName, kObjectNotFound, {{'M', M}, {'K', K}, {'o', object}});
}

void zemBaseProvider::throwWrongMethodArgExc(Text parameter, Text method) const {
    zemRaise(rawBroker(), m_providerName, kWrongMethodArg, {{'p', parameter}, {'M', method}});
}

void zemBaseProvider::throwDuplicateMethodArgExc(Text parameter, Text method) const {
    zemRaise(rawBroker(), m_providerName, kDuplicateMethodArg, {{'p', parameter}, {'M', method}});
}

void zemBaseProvider::throwInvalidMethodArgValueExc(Text parameter, Text value, Text method) const {
    zemRaise(rawBroker(), m_providerName, kInvalidMethodArgValue,
             {{'p', parameter}, {'v', value}, {'M', method}});
}

void zemBaseProvider::throwParameterNotFoundExc(Text parameter) const {
    zemRaise(rawBroker(), m_providerName, kParameterNotFound, {{'p', parameter}});
}

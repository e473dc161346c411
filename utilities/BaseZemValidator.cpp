#include "BaseZemValidator.h"

#include <string>

#include "BaseProviderFailure.h"
#include "BaseProviderText.h"
#include "Exception.h"

namespace {

using Text = const char*;

// Marks: p property, K class, v value, w new or expected value.
constexpr Text kRequested = "The requested property  \"$p\" for class $K was not provided.";
constexpr Text kUnsupported =
    "Attempt to create or modify unsupported property \"$p\" of class $K.";
constexpr Text kUnimplemented =
    "Attempt to create or modify unimplemented property \"$p\" of class $K to $v.";
constexpr Text kCannotSpecified =
    "Attempt to set property \"$p\" of class $K to $v. Can not specify this property \"$p\", when "
    "execute this operation.";
constexpr Text kUnmodifiable =
    "Attempt to change unmodifiable property \"$p\" of class $K from $v to $w.";

// Marks: r kind of resource, v value, l partition, s managed system, e existing resources.
constexpr Text kMultiResource =
    "Multiple $r instances were specified for partition $l on managed system $s. Only one instance "
    "should be specified for such resource.";
constexpr Text kDuplicateResource =
    "Duplicate $r resources \"$v\" were specified for partition $l on managed system $s";
constexpr Text kResourceHasExisted =
    "The specified $r \"$v\" has been existing on partition $l current profile on managed system "
    "$s. ";
constexpr Text kResourceNotExisting =
    "The specified $r \"$v\" was not existing on partition $l current profile on managed system "
    "$s. It maybe have never been added or have already been removed.Current existing such type "
    "resource are \"$e\".";

// Marks: f first and t second value, K class; l, s, r as above.
constexpr Text kMinGtDesired =
    "Conflicted property value $f of \"Reservation\" and property value $t of \"VirtualQuantity\" "
    "were specified for class $K for partition $l on managed system $s. Desired $r should be "
    "greater than or equal to min $r.";
constexpr Text kMinGtMax =
    "Conflicted property value $f of \"VirtualQuantity\" and property value $t of \"Limit\" were "
    "specified for class $K for partition $l on managed system $s. Min $r should be less than or "
    "equal to max $r.";
constexpr Text kDesiredGtMax =
    "Conflicted property value $f of \"Reservation\" and property value $t of \"Limit\" were "
    "specified for class $K for partition $l on managed system $s. Desired $r should be less than "
    "or equal to max $r.";

constexpr zemFailure kPropertyValueDoesntMatch = {
    "throwPropertyValueDoesntMatchExc", "Error.PropertyValueDoesntMatch",
    "A property provided for class $K had an unexpected value. An invalid value of $v was "
    "specifieded for property \"$p\" instead of the expected value of $w",
    "Kvpw", zemThrow<zemInvalidParameterException>};

[[noreturn]] void fail(Text sentence, std::initializer_list<zemInsert> inserts) {
    throw zemInvalidParameterException(zemFillSentence(sentence, nullptr, inserts).c_str());
}

[[noreturn]] void failNumbers(Text sentence, CMPIUint64 first, CMPIUint64 second, Text className,
                              Text partition, Text system, Text kind) {
    const std::string f = std::to_string(first);
    const std::string t = std::to_string(second);
    fail(sentence, {{'f', f.c_str()},
                    {'t', t.c_str()},
                    {'K', className},
                    {'l', partition},
                    {'s', system},
                    {'r', kind}});
}

// Characters and strings are one type to a client.
CMPIType comparable(CMPIType type) {
    constexpr CMPIType array = CMPI_ARRAY;
    const CMPIType simple = static_cast<CMPIType>(type & ~array);
    return static_cast<CMPIType>((simple == CMPI_chars ? CMPI_string : simple) | (type & array));
}

}  // namespace

zemBaseZemValidator::zemBaseZemValidator(const CmpiBroker& mb, const CmpiContext& ctx, Text name)
    : CmpiBaseMI(mb, ctx), zemBaseProvider(mb, ctx, name) {}

Text zemBaseZemValidator::getMessageBundlePath() { return ""; }

CmpiData zemBaseZemValidator::getInstanceProperty(const CmpiInstance& instance, Text name,
                                                  CMPIType expected) {
    PROV_TRACE_LOCALS();
    CmpiData value;
    try {
        value = instance.getProperty(name);
    } catch (const CmpiStatus& status) {
        // Small servers call it not found, which not every binding takes for an answer.
        if (status.rc() == CMPI_RC_ERR_NO_SUCH_PROPERTY || status.rc() == CMPI_RC_ERR_NOT_FOUND) {
            return CmpiData();
        }
        const zemString className = zemClassOf(instance);
        PROV_TRACE_STRING(4, "Internal error.Get property:\"%s\" of %s failed. CMPI STATUS:%s  %s",
                          name, Text(className), cmpiRcToString(status.rc()),
                          zemOrEmpty(status.msg()));
        zemString text;
        text.format("Get Property:\"%s\" of %s failed. %s", name, Text(className),
                    zemOrEmpty(status.msg()));
        throw zemOperationFailedException(text);
    }
    if (zemIsMissing(value) || expected == CMPI_null ||
        comparable(value.getType()) == comparable(expected)) {
        return value;
    }
    zemString text;
    text.format(
        "The data type(\"%s\") of property \"%s\" is invalid in instance %s, the expected data "
        "type is \"%s\"",
        Text(cmpiDataTypeToString(value.getType())), name,
        Text(objectPathToString(instance.getObjectPath())), Text(cmpiDataTypeToString(expected)));
    PROV_TRACE_STRING(4, "%s", Text(text));
    throw zemInvalidParameterException(text);
}

void zemBaseZemValidator::validateRequestedProperty(const CmpiInstance& instance, Text name) {
    if (!zemIsMissing(anyProperty(instance, name))) {
        return;
    }
    PROV_TRACE_LOCALS();
    PROV_TRACE_STRING(4, "Invalid \"%s\"", name);
    fail(kRequested, {{'p', name}, {'K', zemClassOf(instance)}});
}

void zemBaseZemValidator::validateUnsupportedProperty(const CmpiInstance& instance, Text name) {
    refuseValue(instance, name, kUnsupported);
}

void zemBaseZemValidator::validateUnimplementedProperty(const CmpiInstance& instance, Text name) {
    refuseValue(instance, name, kUnimplemented);
}

void zemBaseZemValidator::validateCannotSpecifiedProperty(const CmpiInstance& instance, Text name) {
    refuseValue(instance, name, kCannotSpecified);
}

void zemBaseZemValidator::validateUnmodifiableProperty(const CmpiInstance& oldInstance,
                                                       const CmpiInstance& newInstance, Text name) {
    const CmpiData newValue = anyProperty(newInstance, name);
    if (zemIsMissing(newValue)) {
        return;
    }
    const zemString oldText = cmpidata2String(anyProperty(oldInstance, name));
    const zemString newText = cmpidata2String(newValue);
    if (oldText == newText) {
        return;
    }
    traceInvalid(newInstance, name);
    fail(kUnmodifiable,
         {{'p', name}, {'K', zemClassOf(newInstance)}, {'v', oldText}, {'w', newText}});
}

void zemBaseZemValidator::validateFixedValueProperty(const CmpiInstance& instance,
                                                     Text propertyName, const zemString& value,
                                                     bool allowEmpty) {
    const CmpiData found = anyProperty(instance, propertyName);
    if (allowEmpty && zemIsMissing(found)) {
        return;
    }
    zemString text;
    if (!zemReadText(found, text)) {
        text = cmpidata2String(found);
    }
    if (text == value) {
        return;
    }
    traceInvalid(instance, propertyName);
    throwPropertyValueDoesntMatchExc(zemClassOf(instance), propertyName, text, value);
}

void zemBaseZemValidator::validateEmbededInstanceProerties(const CmpiInstance& instance,
                                                           Text callingMethod) {
    validateProerties(instance.getObjectPath(), zemPropertyNames(instance), callingMethod);
}

CmpiInstance zemBaseZemValidator::validateEmbeddedObject(const CmpiContext& ctx,
                                                         const CmpiObjectPath& cop,
                                                         Text parameterName, Text methodName) {
    const zemString path = objectPathToString(cop);
    if (cop.getKeyCount() == 0) {
        throwInvalidMethodArgValueExc(parameterName, path, methodName);
    }
    try {
        return broker->getInstance(ctx, cop, nullptr);
    } catch (const CmpiStatus& status) {
        PROV_TRACE_LOCALS();
        Text code = cmpiRcToString(status.rc());
        PROV_TRACE_STRING(4, "Validate \"%s\" element:%s failed. CMPI STATUS:%s  %s",
                          zemOrEmpty(parameterName), Text(path), code, zemOrEmpty(status.msg()));
        if (status.rc() == CMPI_RC_ERR_NOT_FOUND || status.rc() == CMPI_RC_ERR_INVALID_PARAMETER) {
            throwInvalidMethodArgValueExc(parameterName, path, methodName);
        }
        const std::string text = zemFillSentence(
            "An error ocurred, when validate value $v of parameter \"$p\". And the error string "
            "was \"$e\"",
            nullptr, {{'v', path}, {'p', parameterName}, {'e', status.msg()}});
        // Named after the service whose methods take such references; clients match on it.
        throw zemOperationFailedException("zemVirtualSystemManagementServiceProvider",
                                          "validateEmbeddedObject", "getInstance", code,
                                          text.c_str());
    }
}

void zemBaseZemValidator::throwMultiResourceExc(Text kind, Text partition, Text system) const {
    fail(kMultiResource, {{'r', kind}, {'l', partition}, {'s', system}});
}

void zemBaseZemValidator::throwDuplicateResourceExc(Text kind, Text value, Text partition,
                                                    Text system) const {
    fail(kDuplicateResource, {{'r', kind}, {'v', value}, {'l', partition}, {'s', system}});
}

void zemBaseZemValidator::throwResourceHasExistedExc(Text kind, Text value, Text partition,
                                                     Text system) const {
    fail(kResourceHasExisted, {{'r', kind}, {'v', value}, {'l', partition}, {'s', system}});
}

void zemBaseZemValidator::throwResourceNotExistingExc(Text kind, Text value, Text partition,
                                                      Text system, Text existing) const {
    fail(kResourceNotExisting,
         {{'r', kind}, {'v', value}, {'l', partition}, {'s', system}, {'e', existing}});
}

void zemBaseZemValidator::throwMinGtDesiredValueExc(CMPIUint64 first, CMPIUint64 second,
                                                    Text className, Text partition, Text system,
                                                    Text kind) const {
    failNumbers(kMinGtDesired, first, second, className, partition, system, kind);
}

void zemBaseZemValidator::throwMinGtMaxValueExc(CMPIUint64 first, CMPIUint64 second, Text className,
                                                Text partition, Text system, Text kind) const {
    failNumbers(kMinGtMax, first, second, className, partition, system, kind);
}

void zemBaseZemValidator::throwDesiredGtMaxValueExc(CMPIUint64 first, CMPIUint64 second,
                                                    Text className, Text partition, Text system,
                                                    Text kind) const {
    failNumbers(kDesiredGtMax, first, second, className, partition, system, kind);
}

void zemBaseZemValidator::throwPropertyValueDoesntMatchExc(Text className, Text property,
                                                           Text found, Text expected) const {
    zemRaise(rawBroker(), m_providerName, kPropertyValueDoesntMatch,
             {{'K', className}, {'v', found}, {'p', property}, {'w', expected}});
}

CmpiData zemBaseZemValidator::anyProperty(const CmpiInstance& instance, Text name) {
    return getInstanceProperty(instance, name, CMPI_null);
}

void zemBaseZemValidator::refuseValue(const CmpiInstance& instance, Text name, Text sentence) {
    const CmpiData value = anyProperty(instance, name);
    if (zemIsMissing(value)) {
        return;
    }
    traceInvalid(instance, name);
    fail(sentence, {{'p', name}, {'K', zemClassOf(instance)}, {'v', cmpidata2String(value)}});
}

void zemBaseZemValidator::traceInvalid(const CmpiInstance& instance, Text name) const {
    PROV_TRACE_LOCALS();
    CmpiInstance readable(instance);
    zemString text = instanceToString(readable);
    if (text.length() <= kZemPrintable) {
        zemPrint(instance, text);
    }
    PROV_TRACE_STRING(4, "Invalid \"%s\":%s", name, Text(text));
}

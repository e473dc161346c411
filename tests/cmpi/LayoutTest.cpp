// The binary interface, in literal numbers: what a CIM server built on anybody's CMPI headers of
// level 2.0 expects. The file uses nothing but published names and compiles against other such
// headers.
#include <gtest/gtest.h>

#include <cstddef>

#include "cmpidt.h"
#include "cmpift.h"

static_assert(sizeof(void*) == 8, "the numbers below are those of 64 bits");

#define SIZE(type, size) static_assert(sizeof(type) == size, #type);
#define AT1(type, at, a) static_assert(offsetof(type, a) == (at), #type "." #a);
#define AT2(type, at, a, b) AT1(type, at, a) AT1(type, (at) + 8, b)
#define AT3(type, at, a, b, c) AT2(type, at, a, b) AT1(type, (at) + 16, c)
#define AT4(type, at, a, b, c, d) AT3(type, at, a, b, c) AT1(type, (at) + 24, d)

#define HANDLE(type) SIZE(type, 16) AT2(type, 0, hdl, ft)
#define IS(constant, value) static_assert((constant) == (value), #constant);

// clang-format off
SIZE(CMPIBoolean, 1) SIZE(CMPIChar16, 2) SIZE(CMPISint8, 1) SIZE(CMPIUint64, 8)
SIZE(CMPISint64, 8) SIZE(CMPIReal32, 4) SIZE(CMPIReal64, 8) SIZE(CMPICount, 4) SIZE(CMPIType, 2)
SIZE(CMPIValueState, 2) SIZE(CMPIrc, 4) SIZE(CMPIValuePtr, 16) SIZE(CMPIValue, 16)
SIZE(CMPIData, 24) SIZE(CMPIStatus, 16) AT1(CMPIValuePtr, 8, length) AT1(CMPIData, 0, type)
AT1(CMPIData, 2, state) AT1(CMPIData, 8, value) AT1(CMPIStatus, 8, msg)

HANDLE(CMPIContext) HANDLE(CMPIResult) HANDLE(CMPIError) HANDLE(CMPIInstance)
HANDLE(CMPIObjectPath) HANDLE(CMPISelectExp) HANDLE(CMPISelectCond) HANDLE(CMPISubCond)
HANDLE(CMPIPredicate) HANDLE(CMPIArgs) HANDLE(CMPIString) HANDLE(CMPIArray)
HANDLE(CMPIEnumeration) HANDLE(CMPIDateTime) HANDLE(CMPIInstanceMI) HANDLE(CMPIAssociationMI)
HANDLE(CMPIMethodMI) HANDLE(CMPIPropertyMI) HANDLE(CMPIIndicationMI)

SIZE(CMPIBroker, 40) AT4(CMPIBroker, 0, hdl, bft, eft, xft)
AT1(CMPIBroker, 32, mft)

SIZE(CMPIBrokerFT, 160)
AT1(CMPIBrokerFT, 0, brokerCapabilities) AT1(CMPIBrokerFT, 4, brokerVersion)
AT4(CMPIBrokerFT, 8, brokerName, prepareAttachThread, attachThread, detachThread)
AT4(CMPIBrokerFT, 40, deliverIndication, enumerateInstanceNames, getInstance, createInstance)
AT4(CMPIBrokerFT, 72, modifyInstance, deleteInstance, execQuery, enumerateInstances)
AT4(CMPIBrokerFT, 104, associators, associatorNames, references, referenceNames)
AT3(CMPIBrokerFT, 136, invokeMethod, setProperty, getProperty)

SIZE(CMPIBrokerEncFT, 168) AT4(CMPIBrokerEncFT, 0, ftVersion, newInstance, newObjectPath, newArgs)
AT4(CMPIBrokerEncFT, 32, newString, newArray, newDateTime, newDateTimeFromBinary)
AT4(CMPIBrokerEncFT, 64, newDateTimeFromChars, newSelectExp, classPathIsA, toString)
AT4(CMPIBrokerEncFT, 96, isOfType, getType, getMessage, logMessage)
AT4(CMPIBrokerEncFT, 128, trace, newCMPIError, openMessageFile, closeMessageFile)
AT1(CMPIBrokerEncFT, 160, getMessage2)

SIZE(CMPIBrokerExtFT, 168)
AT4(CMPIBrokerExtFT, 0, ftVersion, resolveFileName, newThread, joinThread)
AT4(CMPIBrokerExtFT, 32, exitThread, cancelThread, threadSleep, threadOnce)
AT4(CMPIBrokerExtFT, 64, createThreadKey, destroyThreadKey, getThreadSpecific, setThreadSpecific)
AT4(CMPIBrokerExtFT, 96, newMutex, destroyMutex, lockMutex, unlockMutex)
AT4(CMPIBrokerExtFT, 128, newCondition, destroyCondition, condWait, timedCondWait)
AT1(CMPIBrokerExtFT, 160, signalCondition)

SIZE(CMPIBrokerMemFT, 120) AT4(CMPIBrokerMemFT, 0, ftVersion, mark, release, cmpiMalloc)
AT4(CMPIBrokerMemFT, 32, cmpiCalloc, cmpiRealloc, cmpiStrDup, cmpiFree)
AT4(CMPIBrokerMemFT, 64, freeInstance, freeObjectPath, freeArgs, freeString)
AT3(CMPIBrokerMemFT, 96, freeArray, freeDateTime, freeSelectExp)

SIZE(CMPIContextFT, 56) AT4(CMPIContextFT, 0, ftVersion, release, clone, getEntry)
AT3(CMPIContextFT, 32, getEntryAt, getEntryCount, addEntry)

SIZE(CMPIResultFT, 64) AT4(CMPIResultFT, 0, ftVersion, release, clone, returnData)
AT4(CMPIResultFT, 32, returnInstance, returnObjectPath, returnDone, returnError)

SIZE(CMPIErrorFT, 216) AT4(CMPIErrorFT, 0, ftVersion, release, clone, getErrorType)
AT4(CMPIErrorFT, 32, getOtherErrorType, getOwningEntity, getMessageID, getMessage)
AT4(CMPIErrorFT, 64, getPerceivedSeverity, getProbableCause, getProbableCauseDescription, getRecommendedActions)
AT4(CMPIErrorFT, 96, getErrorSource, getErrorSourceFormat, getOtherErrorSourceFormat, getCIMStatusCode)
AT4(CMPIErrorFT, 128, getCIMStatusCodeDescription, getMessageArguments, setErrorType, setOtherErrorType)
AT4(CMPIErrorFT, 160, setProbableCauseDescription, setRecommendedActions, setErrorSource, setErrorSourceFormat)
AT3(CMPIErrorFT, 192, setOtherErrorSourceFormat, setCIMStatusCodeDescription, setMessageArguments)

SIZE(CMPIInstanceFT, 88) AT4(CMPIInstanceFT, 0, ftVersion, release, clone, getProperty)
AT4(CMPIInstanceFT, 32, getPropertyAt, getPropertyCount, setProperty, getObjectPath)
AT3(CMPIInstanceFT, 64, setPropertyFilter, setObjectPath, setPropertyWithOrigin)

SIZE(CMPIObjectPathFT, 160) AT4(CMPIObjectPathFT, 0, ftVersion, release, clone, setNameSpace)
AT4(CMPIObjectPathFT, 32, getNameSpace, setHostname, getHostname, setClassName)
AT4(CMPIObjectPathFT, 64, getClassName, addKey, getKey, getKeyAt)
AT4(CMPIObjectPathFT, 96, getKeyCount, setNameSpaceFromObjectPath, setHostAndNameSpaceFromObjectPath, getClassQualifier)
AT4(CMPIObjectPathFT, 128, getPropertyQualifier, getMethodQualifier, getParameterQualifier, toString)

SIZE(CMPISelectExpFT, 64) AT4(CMPISelectExpFT, 0, ftVersion, release, clone, evaluate)
AT4(CMPISelectExpFT, 32, getString, getDOC, getCOD, evaluateUsingAccessor)

SIZE(CMPISelectCondFT, 40) AT4(CMPISelectCondFT, 0, ftVersion, release, clone, getCountAndType)
AT1(CMPISelectCondFT, 32, getSubCondAt)

SIZE(CMPISubCondFT, 48) AT4(CMPISubCondFT, 0, ftVersion, release, clone, getCount)
AT2(CMPISubCondFT, 32, getPredicateAt, getPredicate)

SIZE(CMPIPredicateFT, 40) AT4(CMPIPredicateFT, 0, ftVersion, release, clone, getData)
AT1(CMPIPredicateFT, 32, evaluateUsingAccessor)

SIZE(CMPIArgsFT, 56) AT4(CMPIArgsFT, 0, ftVersion, release, clone, addArg)
AT3(CMPIArgsFT, 32, getArg, getArgAt, getArgCount)

SIZE(CMPIStringFT, 32) AT4(CMPIStringFT, 0, ftVersion, release, clone, getCharPtr)

SIZE(CMPIArrayFT, 56) AT4(CMPIArrayFT, 0, ftVersion, release, clone, getSize)
AT3(CMPIArrayFT, 32, getSimpleType, getElementAt, setElementAt)

SIZE(CMPIEnumerationFT, 48) AT4(CMPIEnumerationFT, 0, ftVersion, release, clone, getNext)
AT2(CMPIEnumerationFT, 32, hasNext, toArray)

SIZE(CMPIDateTimeFT, 48) AT4(CMPIDateTimeFT, 0, ftVersion, release, clone, getBinaryFormat)
AT2(CMPIDateTimeFT, 32, getStringFormat, isInterval)

SIZE(CMPIInstanceMIFT, 80) AT1(CMPIInstanceMIFT, 0, ftVersion) AT1(CMPIInstanceMIFT, 4, miVersion)
AT4(CMPIInstanceMIFT, 8, miName, cleanup, enumerateInstanceNames, enumerateInstances)
AT4(CMPIInstanceMIFT, 40, getInstance, createInstance, modifyInstance, deleteInstance)
AT1(CMPIInstanceMIFT, 72, execQuery)

SIZE(CMPIAssociationMIFT, 56) AT1(CMPIAssociationMIFT, 0, ftVersion) AT1(CMPIAssociationMIFT, 4, miVersion)
AT4(CMPIAssociationMIFT, 8, miName, cleanup, associators, associatorNames)
AT2(CMPIAssociationMIFT, 40, references, referenceNames)

SIZE(CMPIMethodMIFT, 32) AT1(CMPIMethodMIFT, 0, ftVersion) AT1(CMPIMethodMIFT, 4, miVersion)
AT3(CMPIMethodMIFT, 8, miName, cleanup, invokeMethod)

SIZE(CMPIPropertyMIFT, 40) AT1(CMPIPropertyMIFT, 0, ftVersion) AT1(CMPIPropertyMIFT, 4, miVersion)
AT4(CMPIPropertyMIFT, 8, miName, cleanup, setProperty, getProperty)

SIZE(CMPIIndicationMIFT, 72) AT1(CMPIIndicationMIFT, 0, ftVersion) AT1(CMPIIndicationMIFT, 4, miVersion)
AT4(CMPIIndicationMIFT, 8, miName, cleanup, authorizeFilter, mustPoll)
AT4(CMPIIndicationMIFT, 40, activateFilter, deActivateFilter, enableIndications, disableIndications)

IS(CMPI_null, 0) IS(CMPI_boolean, 2) IS(CMPI_char16, 3) IS(CMPI_real32, 8) IS(CMPI_real64, 12)
IS(CMPI_uint8, 128) IS(CMPI_uint16, 144) IS(CMPI_uint32, 160) IS(CMPI_uint64, 176)
IS(CMPI_sint8, 192) IS(CMPI_sint16, 208) IS(CMPI_sint32, 224) IS(CMPI_sint64, 240)
IS(CMPI_instance, 0x1000) IS(CMPI_ref, 0x1100) IS(CMPI_args, 0x1200) IS(CMPI_class, 0x1300)
IS(CMPI_filter, 0x1400) IS(CMPI_enumeration, 0x1500) IS(CMPI_string, 0x1600) IS(CMPI_chars, 0x1700)
IS(CMPI_dateTime, 0x1800) IS(CMPI_ptr, 0x1900) IS(CMPI_charsptr, 0x1A00) IS(CMPI_ARRAY, 0x2000)
IS(CMPI_SIMPLE, 2) IS(CMPI_REAL, 8) IS(CMPI_UINT, 128) IS(CMPI_SINT, 192) IS(CMPI_INTEGER, 192)
IS(CMPI_ENC, 0x1000) IS(CMPI_booleanA, 0x2002) IS(CMPI_real64A, 0x200C) IS(CMPI_uint64A, 0x20B0)
IS(CMPI_sint8A, 0x20C0) IS(CMPI_stringA, 0x3600) IS(CMPI_charsA, 0x3700) IS(CMPI_dateTimeA, 0x3800)
IS(CMPI_instanceA, 0x3000) IS(CMPI_refA, 0x3100) IS(CMPI_charsptrA, 0x3A00) IS(CMPI_keyInteger, 240)
IS(CMPI_keyString, 0x1600) IS(CMPI_numericString, 0x16FC) IS(CMPI_nameString, 0x1e00)
IS(CMPI_Byte, 192) IS(CMPI_DoubleA, 0x200C) IS(CMPI_goodValue, 0) IS(CMPI_nullValue, 0x100)
IS(CMPI_keyValue, 0x200) IS(CMPI_notFound, 0x400) IS(CMPI_badValue, 0x8000) IS(CMPI_RC_OK, 0)
IS(CMPI_RC_ERR_FAILED, 1) IS(CMPI_RC_ERR_ACCESS_DENIED, 2) IS(CMPI_RC_ERR_INVALID_NAMESPACE, 3)
IS(CMPI_RC_ERR_INVALID_PARAMETER, 4) IS(CMPI_RC_ERR_INVALID_CLASS, 5) IS(CMPI_RC_ERR_NOT_FOUND, 6)
IS(CMPI_RC_ERR_NOT_SUPPORTED, 7) IS(CMPI_RC_ERR_CLASS_HAS_CHILDREN, 8)
IS(CMPI_RC_ERR_CLASS_HAS_INSTANCES, 9) IS(CMPI_RC_ERR_INVALID_SUPERCLASS, 10)
IS(CMPI_RC_ERR_ALREADY_EXISTS, 11) IS(CMPI_RC_ERR_NO_SUCH_PROPERTY, 12)
IS(CMPI_RC_ERR_TYPE_MISMATCH, 13) IS(CMPI_RC_ERR_QUERY_LANGUAGE_NOT_SUPPORTED, 14)
IS(CMPI_RC_ERR_INVALID_QUERY, 15) IS(CMPI_RC_ERR_METHOD_NOT_AVAILABLE, 16)
IS(CMPI_RC_ERR_METHOD_NOT_FOUND, 17) IS(CMPI_RC_NO_MORE_ELEMENTS, 18) IS(CMPI_RC_DO_NOT_UNLOAD, 50)
IS(CMPI_RC_NEVER_UNLOAD, 51) IS(CMPI_RC_ERR_INVALID_HANDLE, 60)
IS(CMPI_RC_ERR_INVALID_DATA_TYPE, 61) IS(CMPI_RC_ERROR_SYSTEM, 100) IS(CMPI_RC_ERROR, 200)
IS(CMPICurrentVersion, 200) IS(UnsupportedOperationError, 10) IS(Oversubscription_Error, 8)
IS(ErrorSevLow, 2) IS(ErrorSevFatal, 5) IS(Adapter_Card_Error, 2) IS(Frequency_Hopping_Failure, 87)
IS(Timeout, 111) IS(Protection_Mechanism_Failure, 114) IS(Unexpected_Information, 130)
IS(CIMObjectHandle, 2)
    // clang-format on

    extern "C" CMPIMethodMI* SampleInC_Create_MethodMI(const CMPIBroker*, const CMPIContext*,
                                                       CMPIStatus*);

TEST(Layout, AProviderInCGetsItsTable) {
    CMPIMethodMI* const mi = SampleInC_Create_MethodMI(nullptr, nullptr, nullptr);
    EXPECT_EQ(mi->ft->ftVersion, 200);
    EXPECT_STREQ(mi->ft->miName, "methodSampleInC");
    EXPECT_EQ(mi->ft->cleanup(mi, nullptr, 0).rc, CMPI_RC_DO_NOT_UNLOAD);
    EXPECT_STREQ(CMPIAcceptLanguage, "CMPIAcceptLanguage");
}

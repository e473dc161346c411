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
// The beginnings of the tables of objects and of providers.
#define OBJECT(type, size) SIZE(type, size) AT3(type, 0, ftVersion, release, clone)
#define PROVIDER(type, size) \
    SIZE(type, size) AT1(type, 0, ftVersion) AT1(type, 4, miVersion) AT2(type, 8, miName, cleanup)
#define IS(constant, value) static_assert((constant) == (value), #constant);
#define C(name, value) IS(CMPI_##name, value)
#define ERR(name, value) IS(CMPI_RC_ERR_##name, value)

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

OBJECT(CMPIContextFT, 56) AT4(CMPIContextFT, 24, getEntry, getEntryAt, getEntryCount, addEntry)
OBJECT(CMPIResultFT, 64) AT1(CMPIResultFT, 56, returnError)
AT4(CMPIResultFT, 24, returnData, returnInstance, returnObjectPath, returnDone)
OBJECT(CMPIErrorFT, 216)
AT4(CMPIErrorFT, 24, getErrorType, getOtherErrorType, getOwningEntity, getMessageID)
AT4(CMPIErrorFT, 56, getMessage, getPerceivedSeverity, getProbableCause, getProbableCauseDescription)
AT4(CMPIErrorFT, 88, getRecommendedActions, getErrorSource, getErrorSourceFormat, getOtherErrorSourceFormat)
AT4(CMPIErrorFT, 120, getCIMStatusCode, getCIMStatusCodeDescription, getMessageArguments, setErrorType)
AT4(CMPIErrorFT, 152, setOtherErrorType, setProbableCauseDescription, setRecommendedActions, setErrorSource)
AT4(CMPIErrorFT, 184, setErrorSourceFormat, setOtherErrorSourceFormat, setCIMStatusCodeDescription, setMessageArguments)
OBJECT(CMPIInstanceFT, 88)
AT4(CMPIInstanceFT, 24, getProperty, getPropertyAt, getPropertyCount, setProperty)
AT4(CMPIInstanceFT, 56, getObjectPath, setPropertyFilter, setObjectPath, setPropertyWithOrigin)
OBJECT(CMPIObjectPathFT, 160)
AT4(CMPIObjectPathFT, 24, setNameSpace, getNameSpace, setHostname, getHostname)
AT4(CMPIObjectPathFT, 56, setClassName, getClassName, addKey, getKey)
AT4(CMPIObjectPathFT, 88, getKeyAt, getKeyCount, setNameSpaceFromObjectPath, setHostAndNameSpaceFromObjectPath)
AT4(CMPIObjectPathFT, 120, getClassQualifier, getPropertyQualifier, getMethodQualifier, getParameterQualifier)
AT1(CMPIObjectPathFT, 152, toString)
OBJECT(CMPISelectExpFT, 64) AT4(CMPISelectExpFT, 24, evaluate, getString, getDOC, getCOD)
AT1(CMPISelectExpFT, 56, evaluateUsingAccessor)
OBJECT(CMPISelectCondFT, 40) AT2(CMPISelectCondFT, 24, getCountAndType, getSubCondAt)
OBJECT(CMPISubCondFT, 48) AT3(CMPISubCondFT, 24, getCount, getPredicateAt, getPredicate)
OBJECT(CMPIPredicateFT, 40) AT2(CMPIPredicateFT, 24, getData, evaluateUsingAccessor)
OBJECT(CMPIArgsFT, 56) AT4(CMPIArgsFT, 24, addArg, getArg, getArgAt, getArgCount)
OBJECT(CMPIStringFT, 32) AT1(CMPIStringFT, 24, getCharPtr)
OBJECT(CMPIArrayFT, 56) AT4(CMPIArrayFT, 24, getSize, getSimpleType, getElementAt, setElementAt)
OBJECT(CMPIEnumerationFT, 48) AT3(CMPIEnumerationFT, 24, getNext, hasNext, toArray)
OBJECT(CMPIDateTimeFT, 48) AT3(CMPIDateTimeFT, 24, getBinaryFormat, getStringFormat, isInterval)
PROVIDER(CMPIInstanceMIFT, 80)
AT4(CMPIInstanceMIFT, 24, enumerateInstanceNames, enumerateInstances, getInstance, createInstance)
AT3(CMPIInstanceMIFT, 56, modifyInstance, deleteInstance, execQuery)
PROVIDER(CMPIAssociationMIFT, 56)
AT4(CMPIAssociationMIFT, 24, associators, associatorNames, references, referenceNames)
PROVIDER(CMPIMethodMIFT, 32) AT1(CMPIMethodMIFT, 24, invokeMethod)
PROVIDER(CMPIPropertyMIFT, 48)
AT3(CMPIPropertyMIFT, 24, setProperty, getProperty, setPropertyWithOrigin)
PROVIDER(CMPIIndicationMIFT, 72)
AT4(CMPIIndicationMIFT, 24, authorizeFilter, mustPoll, activateFilter, deActivateFilter)
AT2(CMPIIndicationMIFT, 56, enableIndications, disableIndications)

C(null, 0) C(boolean, 2) C(char16, 3) C(real32, 8) C(real64, 12) C(uint8, 128) C(uint16, 144)
C(uint32, 160) C(uint64, 176) C(sint8, 192) C(sint16, 208) C(sint32, 224) C(sint64, 240)
C(instance, 0x1000) C(ref, 0x1100) C(args, 0x1200) C(class, 0x1300) C(filter, 0x1400)
C(enumeration, 0x1500) C(string, 0x1600) C(chars, 0x1700) C(dateTime, 0x1800) C(ptr, 0x1900)
C(charsptr, 0x1A00) C(ARRAY, 0x2000) C(SIMPLE, 2) C(REAL, 8) C(UINT, 128) C(SINT, 192)
C(INTEGER, 192) C(ENC, 0x1000) C(booleanA, 0x2002) C(real64A, 0x200C) C(uint64A, 0x20B0)
C(sint8A, 0x20C0) C(stringA, 0x3600) C(charsA, 0x3700) C(dateTimeA, 0x3800) C(instanceA, 0x3000)
C(refA, 0x3100) C(charsptrA, 0x3A00) C(keyInteger, 240) C(keyString, 0x1600)
C(numericString, 0x16FC) C(nameString, 0x1e00) C(Byte, 192) C(DoubleA, 0x200C) C(goodValue, 0)
C(nullValue, 0x100) C(keyValue, 0x200) C(notFound, 0x400) C(badValue, 0x8000) IS(CMPI_RC_OK, 0)
ERR(FAILED, 1) ERR(ACCESS_DENIED, 2) ERR(INVALID_NAMESPACE, 3) ERR(INVALID_PARAMETER, 4)
ERR(INVALID_CLASS, 5) ERR(NOT_FOUND, 6) ERR(NOT_SUPPORTED, 7) ERR(CLASS_HAS_CHILDREN, 8)
ERR(CLASS_HAS_INSTANCES, 9) ERR(INVALID_SUPERCLASS, 10) ERR(ALREADY_EXISTS, 11)
ERR(NO_SUCH_PROPERTY, 12) ERR(TYPE_MISMATCH, 13) ERR(QUERY_LANGUAGE_NOT_SUPPORTED, 14)
ERR(INVALID_QUERY, 15) ERR(METHOD_NOT_AVAILABLE, 16) ERR(METHOD_NOT_FOUND, 17)
IS(CMPI_RC_NO_MORE_ELEMENTS, 18) IS(CMPI_RC_DO_NOT_UNLOAD, 50) IS(CMPI_RC_NEVER_UNLOAD, 51)
ERR(INVALID_HANDLE, 60) ERR(INVALID_DATA_TYPE, 61) IS(CMPI_RC_ERROR_SYSTEM, 100)
IS(CMPI_RC_ERROR, 200) IS(CMPICurrentVersion, 200) IS(UnsupportedOperationError, 10)
IS(Oversubscription_Error, 8) IS(ErrorSevLow, 2) IS(ErrorSevFatal, 5) IS(Adapter_Card_Error, 2)
IS(Frequency_Hopping_Failure, 87) IS(Timeout, 111) IS(Protection_Mechanism_Failure, 114)
IS(Unexpected_Information, 130) IS(CIMObjectHandle, 2)
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

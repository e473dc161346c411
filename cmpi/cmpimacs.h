/* CMPI convenience macros: one for each entry of a function table, status helpers, and the stubs
 * and factories that give a provider library its entry points.
 *
 * The call macros are plain shorthands: they test neither the object nor the entry for null. Each
 * is named for the entry; b is a broker, rc a status pointer or NULL, v a value pointer (the text
 * itself for CMPI_chars).
 *
 * A C provider writes, for example
 *     static const CMPIBroker* broker;
 *     CMInstanceMIStub(Disk, DiskProvider, broker, CMNoHook)
 * which takes DiskCleanup, DiskEnumInstanceNames and so on and defines
 * DiskProvider_Create_InstanceMI. A C++ provider on the object binding writes
 *     CMProviderBase(DiskProvider)
 *     CMInstanceMIFactory(DiskClass, DiskProvider)
 */
#ifndef _CMPIMACS_H_
#define _CMPIMACS_H_

#include "cmpidt.h"
#include "cmpift.h"

/* Status. */
#define CMReturn(rc_)         \
    do {                      \
        CMPIStatus cmStatus_; \
        cmStatus_.rc = (rc_); \
        cmStatus_.msg = NULL; \
        return cmStatus_;     \
    } while (0)
#define CMReturnWithString(rc_, str_) \
    do {                              \
        CMPIStatus cmStatus_;         \
        cmStatus_.rc = (rc_);         \
        cmStatus_.msg = (str_);       \
        return cmStatus_;             \
    } while (0)
#define CMReturnWithChars(b, rc_, chars_)                                      \
    do {                                                                       \
        CMPIStatus cmStatus_;                                                  \
        cmStatus_.rc = (rc_);                                                  \
        cmStatus_.msg = (b) ? (b)->eft->newString((b), (chars_), NULL) : NULL; \
        return cmStatus_;                                                      \
    } while (0)
#define CMSetStatus(st, rc_) CMSetStatusWithString(st, rc_, NULL)
#define CMSetStatusWithString(st, rc_, str_) \
    do {                                     \
        CMPIStatus* cmStatus_ = (st);        \
        if (cmStatus_) {                     \
            cmStatus_->rc = (rc_);           \
            cmStatus_->msg = (str_);         \
        }                                    \
    } while (0)
#define CMSetStatusWithChars(b, st, rc_, chars_) \
    CMSetStatusWithString(st, rc_, (b) ? (b)->eft->newString((b), (chars_), NULL) : NULL)

/* Values and objects. */
#define CMIsNullObject(o) ((o) == NULL || *((void* const*)(o)) == NULL)
#define CMIsNullValue(v) ((v).state & CMPI_nullValue)
#define CMIsKeyValue(v) ((v).state & CMPI_keyValue)
#define CMIsArray(v) ((v).type & CMPI_ARRAY)
#define CMClone(o, rc) ((o)->ft->clone((o), (rc)))
#define CMRelease(o) ((o)->ft->release((o)))

/* CMPIBroker: factories and type tests. */
#define CMNewInstance(b, op, rc) ((b)->eft->newInstance((b), (op), (rc)))
#define CMNewObjectPath(b, ns, cn, rc) ((b)->eft->newObjectPath((b), (ns), (cn), (rc)))
#define CMNewString(b, s, rc) ((b)->eft->newString((b), (s), (rc)))
#define CMNewArgs(b, rc) ((b)->eft->newArgs((b), (rc)))
#define CMNewArray(b, max, t, rc) ((b)->eft->newArray((b), (max), (t), (rc)))
#define CMNewDateTime(b, rc) ((b)->eft->newDateTime((b), (rc)))
#define CMNewDateTimeFromBinary(b, d, i, rc) ((b)->eft->newDateTimeFromBinary((b), (d), (i), (rc)))
#define CMNewDateTimeFromChars(b, d, rc) ((b)->eft->newDateTimeFromChars((b), (d), (rc)))
#define CMNewSelectExp(b, q, l, p, rc) ((b)->eft->newSelectExp((b), (q), (l), (p), (rc)))
#define CMClassPathIsA(b, op, cn, rc) ((b)->eft->classPathIsA((b), (op), (cn), (rc)))
#define CDToString(b, o, rc) ((b)->eft->toString((b), (const void*)(o), (rc)))
#define CDIsOfType(b, o, t, rc) ((b)->eft->isOfType((b), (const void*)(o), (t), (rc)))
#define CDGetType(b, o, rc) ((b)->eft->getType((b), (const void*)(o), (rc)))

/* CMPIBroker: messages. The inserts are one CMFmtArgsN of CMFmt values. */
#define CMFmtSint(v) CMPI_sint32, ((long int)(v))
#define CMFmtUint(v) CMPI_uint32, ((unsigned long int)(v))
#define CMFmtSint64(v) CMPI_sint64, ((CMPISint64)(v))
#define CMFmtUint64(v) CMPI_uint64, ((CMPIUint64)(v))
#define CMFmtReal(v) CMPI_real64, ((double)(v))
#define CMFmtBoolean(v) CMPI_boolean, ((int)(v))
#define CMFmtChars(v) CMPI_chars, ((char*)(v))
#define CMFmtString(v) CMPI_string, ((CMPIString*)(v))
#define CMFmtArgs0() 0
#define CMFmtArgs1(a) 1, a
#define CMFmtArgs2(a, b) 2, a, b
#define CMFmtArgs3(a, b, c) 3, a, b, c
#define CMFmtArgs4(a, b, c, d) 4, a, b, c, d
#define CMFmtArgs5(a, b, c, d, e) 5, a, b, c, d, e
#define CMFmtArgs6(a, b, c, d, e, f) 6, a, b, c, d, e, f
#define CMFmtArgs7(a, b, c, d, e, f, g) 7, a, b, c, d, e, f, g
#define CMFmtArgs8(a, b, c, d, e, f, g, h) 8, a, b, c, d, e, f, g, h
#define CMFmtArgs9(a, b, c, d, e, f, g, h, i) 9, a, b, c, d, e, f, g, h, i
#define CMFmtArgs10(a, b, c, d, e, f, g, h, i, j) 10, a, b, c, d, e, f, g, h, i, j
#define CMGetMessage(b, id, def, rc, parms) ((b)->eft->getMessage((b), (id), (def), (rc), parms))
#define CMGetMessage2(b, id, mfh, def, rc, parms) \
    ((b)->eft->getMessage2((b), (id), (mfh), (def), (rc), parms))
#define CMOpenMessageFile(b, mf, mfh) ((b)->eft->openMessageFile((b), (mf), (mfh)))
#define CMCloseMessageFile(b, mfh) ((b)->eft->closeMessageFile((b), (mfh)))
#define CMLogMessage(b, sev, id, text, str) ((b)->eft->logMessage((b), (sev), (id), (text), (str)))
#define CMTraceMessage(b, lev, comp, text, str) ((b)->eft->trace((b), (lev), (comp), (text), (str)))
#define CMNewCMPIError(b, owner, id, msg, sev, pc, cimrc, rc) \
    ((b)->eft->newCMPIError((b), (owner), (id), (msg), (sev), (pc), (cimrc), (rc)))

/* CMPIInstance. */
#define CMGetProperty(i, n, rc) ((i)->ft->getProperty((i), (n), (rc)))
#define CMGetPropertyAt(i, pos, name, rc) ((i)->ft->getPropertyAt((i), (pos), (name), (rc)))
#define CMGetPropertyCount(i, rc) ((i)->ft->getPropertyCount((i), (rc)))
#define CMSetProperty(i, n, v, t) ((i)->ft->setProperty((i), (n), (const CMPIValue*)(v), (t)))
#define CMSetPropertyFilter(i, list, keys) ((i)->ft->setPropertyFilter((i), (list), (keys)))
#define CMSetPropertyWithOrigin(i, n, v, t, o) \
    ((i)->ft->setPropertyWithOrigin((i), (n), (const CMPIValue*)(v), (t), (o)))
#define CMGetObjectPath(i, rc) ((i)->ft->getObjectPath((i), (rc)))
#define CMSetObjectPath(i, op) ((i)->ft->setObjectPath((i), (op)))

/* CMPIObjectPath. */
#define CMSetHostname(p, n) ((p)->ft->setHostname((p), (n)))
#define CMGetHostname(p, rc) ((p)->ft->getHostname((p), (rc)))
#define CMSetNameSpace(p, n) ((p)->ft->setNameSpace((p), (n)))
#define CMGetNameSpace(p, rc) ((p)->ft->getNameSpace((p), (rc)))
#define CMSetClassName(p, n) ((p)->ft->setClassName((p), (n)))
#define CMGetClassName(p, rc) ((p)->ft->getClassName((p), (rc)))
#define CMAddKey(p, n, v, t) ((p)->ft->addKey((p), (n), (const CMPIValue*)(v), (t)))
#define CMGetKey(p, n, rc) ((p)->ft->getKey((p), (n), (rc)))
#define CMGetKeyAt(p, pos, name, rc) ((p)->ft->getKeyAt((p), (pos), (name), (rc)))
#define CMGetKeyCount(p, rc) ((p)->ft->getKeyCount((p), (rc)))
#define CMSetNameSpaceFromObjectPath(p, src) ((p)->ft->setNameSpaceFromObjectPath((p), (src)))
#define CMSetHostAndNameSpaceFromObjectPath(p, src) \
    ((p)->ft->setHostAndNameSpaceFromObjectPath((p), (src)))
#define CMGetClassQualifier(p, q, rc) ((p)->ft->getClassQualifier((p), (q), (rc)))
#define CMGetPropertyQualifier(p, n, q, rc) ((p)->ft->getPropertyQualifier((p), (n), (q), (rc)))
#define CMGetMethodQualifier(p, m, q, rc) ((p)->ft->getMethodQualifier((p), (m), (q), (rc)))
#define CMGetParameterQualifier(p, m, n, q, rc) \
    ((p)->ft->getParameterQualifier((p), (m), (n), (q), (rc)))
#define CMObjectPathToString(p, rc) ((p)->ft->toString((p), (rc)))

/* CMPIArray, CMPIArgs, CMPIString, CMPIDateTime, CMPIEnumeration. */
#define CMGetArrayCount(a, rc) ((a)->ft->getSize((a), (rc)))
#define CMGetArrayType(a, rc) ((a)->ft->getSimpleType((a), (rc)))
#define CMGetArrayElementAt(a, pos, rc) ((a)->ft->getElementAt((a), (pos), (rc)))
#define CMSetArrayElementAt(a, pos, v, t) \
    ((a)->ft->setElementAt((a), (pos), (const CMPIValue*)(v), (t)))
#define CMAddArg(a, n, v, t) ((a)->ft->addArg((a), (n), (const CMPIValue*)(v), (t)))
#define CMGetArg(a, n, rc) ((a)->ft->getArg((a), (n), (rc)))
#define CMGetArgAt(a, pos, name, rc) ((a)->ft->getArgAt((a), (pos), (name), (rc)))
#define CMGetArgCount(a, rc) ((a)->ft->getArgCount((a), (rc)))
#define CMGetCharPtr(s) ((s)->ft->getCharPtr((s), NULL))
#define CMGetCharsPtr(s, rc) ((s)->ft->getCharPtr((s), (rc)))
#define CMGetStringFormat(d, rc) ((d)->ft->getStringFormat((d), (rc)))
#define CMGetBinaryFormat(d, rc) ((d)->ft->getBinaryFormat((d), (rc)))
#define CMIsInterval(d, rc) ((d)->ft->isInterval((d), (rc)))
#define CMGetNext(e, rc) ((e)->ft->getNext((e), (rc)))
#define CMHasNext(e, rc) ((e)->ft->hasNext((e), (rc)))
#define CMToArray(e, rc) ((e)->ft->toArray((e), (rc)))

/* CMPIResult and CMPIContext. */
#define CMReturnData(r, v, t) ((r)->ft->returnData((r), (const CMPIValue*)(v), (t)))
#define CMReturnInstance(r, i) ((r)->ft->returnInstance((r), (i)))
#define CMReturnObjectPath(r, op) ((r)->ft->returnObjectPath((r), (op)))
#define CMReturnDone(r) ((r)->ft->returnDone((r)))
#define CMReturnError(r, e) ((r)->ft->returnError((r), (e)))
#define CMGetContextEntry(c, n, rc) ((c)->ft->getEntry((c), (n), (rc)))
#define CMGetContextEntryAt(c, pos, name, rc) ((c)->ft->getEntryAt((c), (pos), (name), (rc)))
#define CMGetContextEntryCount(c, rc) ((c)->ft->getEntryCount((c), (rc)))
#define CMAddContextEntry(c, n, v, t) ((c)->ft->addEntry((c), (n), (const CMPIValue*)(v), (t)))

/* CMPIError. */
#define CMGetErrorType(e, rc) ((e)->ft->getErrorType((e), (rc)))
#define CMGetOtherErrorType(e, rc) ((e)->ft->getOtherErrorType((e), (rc)))
#define CMGetOwningEntity(e, rc) ((e)->ft->getOwningEntity((e), (rc)))
#define CMGetMessageID(e, rc) ((e)->ft->getMessageID((e), (rc)))
#define CMGetErrorMessage(e, rc) ((e)->ft->getMessage((e), (rc)))
#define CMGetPerceivedSeverity(e, rc) ((e)->ft->getPerceivedSeverity((e), (rc)))
#define CMGetProbableCause(e, rc) ((e)->ft->getProbableCause((e), (rc)))
#define CMGetProbableCauseDescription(e, rc) ((e)->ft->getProbableCauseDescription((e), (rc)))
#define CMGetRecommendedActions(e, rc) ((e)->ft->getRecommendedActions((e), (rc)))
#define CMGetErrorSource(e, rc) ((e)->ft->getErrorSource((e), (rc)))
#define CMGetErrorSourceFormat(e, rc) ((e)->ft->getErrorSourceFormat((e), (rc)))
#define CMGetOtherErrorSourceFormat(e, rc) ((e)->ft->getOtherErrorSourceFormat((e), (rc)))
#define CMGetCIMStatusCode(e, rc) ((e)->ft->getCIMStatusCode((e), (rc)))
#define CMGetCIMStatusCodeDescription(e, rc) ((e)->ft->getCIMStatusCodeDescription((e), (rc)))
#define CMGetMessageArguments(e, rc) ((e)->ft->getMessageArguments((e), (rc)))
#define CMSetErrorType(e, t) ((e)->ft->setErrorType((e), (t)))
#define CMSetOtherErrorType(e, t) ((e)->ft->setOtherErrorType((e), (t)))
#define CMSetProbableCauseDescription(e, d) ((e)->ft->setProbableCauseDescription((e), (d)))
#define CMSetRecommendedActions(e, a) ((e)->ft->setRecommendedActions((e), (a)))
#define CMSetErrorSource(e, s) ((e)->ft->setErrorSource((e), (s)))
#define CMSetErrorSourceFormat(e, f) ((e)->ft->setErrorSourceFormat((e), (f)))
#define CMSetOtherErrorSourceFormat(e, f) ((e)->ft->setOtherErrorSourceFormat((e), (f)))
#define CMSetCIMStatusCodeDescription(e, d) ((e)->ft->setCIMStatusCodeDescription((e), (d)))
#define CMSetMessageArguments(e, a) ((e)->ft->setMessageArguments((e), (a)))

/* CMPISelectExp and its parts. */
#define CMGetSelExpString(s, rc) ((s)->ft->getString((s), (rc)))
#define CMEvaluateSelExp(s, i, rc) ((s)->ft->evaluate((s), (i), (rc)))
#define CMEvaluateSelExpUsingAccessor(s, acc, parm, rc) \
    ((s)->ft->evaluateUsingAccessor((s), (acc), (parm), (rc)))
#define CMGetDoc(s, rc) ((s)->ft->getDOC((s), (rc)))
#define CMGetCod(s, rc) ((s)->ft->getCOD((s), (rc)))
#define CMGetSubCondCountAndType(c, t, rc) ((c)->ft->getCountAndType((c), (t), (rc)))
#define CMGetSubCondAt(c, pos, rc) ((c)->ft->getSubCondAt((c), (pos), (rc)))
#define CMGetPredicateCount(s, rc) ((s)->ft->getCount((s), (rc)))
#define CMGetPredicateAt(s, pos, rc) ((s)->ft->getPredicateAt((s), (pos), (rc)))
#define CMGetPredicate(s, n, rc) ((s)->ft->getPredicate((s), (n), (rc)))
#define CMGetPredicateData(p, t, op, l, r) ((p)->ft->getData((p), (t), (op), (l), (r)))
#define CMEvaluatePredicateUsingAccessor(p, acc, parm, rc) \
    ((p)->ft->evaluateUsingAccessor((p), (acc), (parm), (rc)))

/* CMPIBroker: operations on other providers' objects, threads, indications. */
#define CBGetBrokerCapabilities(b) ((b)->bft->brokerCapabilities)
#define CBBrokerVersion(b) ((b)->bft->brokerVersion)
#define CBBrokerName(b) ((b)->bft->brokerName)
#define CBPrepareAttachThread(b, c) ((b)->bft->prepareAttachThread((b), (c)))
#define CBAttachThread(b, c) ((b)->bft->attachThread((b), (c)))
#define CBDetachThread(b, c) ((b)->bft->detachThread((b), (c)))
#define CBDeliverIndication(b, c, ns, i) ((b)->bft->deliverIndication((b), (c), (ns), (i)))
#define CBEnumInstanceNames(b, c, op, rc) ((b)->bft->enumerateInstanceNames((b), (c), (op), (rc)))
#define CBEnumInstances(b, c, op, pr, rc) ((b)->bft->enumerateInstances((b), (c), (op), (pr), (rc)))
#define CBGetInstance(b, c, op, pr, rc) ((b)->bft->getInstance((b), (c), (op), (pr), (rc)))
#define CBCreateInstance(b, c, op, i, rc) ((b)->bft->createInstance((b), (c), (op), (i), (rc)))
#define CBModifyInstance(b, c, op, i, pr) ((b)->bft->modifyInstance((b), (c), (op), (i), (pr)))
#define CBDeleteInstance(b, c, op) ((b)->bft->deleteInstance((b), (c), (op)))
#define CBExecQuery(b, c, op, q, l, rc) ((b)->bft->execQuery((b), (c), (op), (q), (l), (rc)))
#define CBAssociators(b, c, op, ac, resc, r, rr, pr, rc) \
    ((b)->bft->associators((b), (c), (op), (ac), (resc), (r), (rr), (pr), (rc)))
#define CBAssociatorNames(b, c, op, ac, resc, r, rr, rc) \
    ((b)->bft->associatorNames((b), (c), (op), (ac), (resc), (r), (rr), (rc)))
#define CBReferences(b, c, op, resc, r, pr, rc) \
    ((b)->bft->references((b), (c), (op), (resc), (r), (pr), (rc)))
#define CBReferenceNames(b, c, op, resc, r, rc) \
    ((b)->bft->referenceNames((b), (c), (op), (resc), (r), (rc)))
#define CBInvokeMethod(b, c, op, m, in, out, rc) \
    ((b)->bft->invokeMethod((b), (c), (op), (m), (in), (out), (rc)))
#define CBSetProperty(b, c, op, n, v, t) \
    ((b)->bft->setProperty((b), (c), (op), (n), (const CMPIValue*)(v), (t)))
#define CBGetProperty(b, c, op, n, rc) ((b)->bft->getProperty((b), (c), (op), (n), (rc)))

/* Entry points of a C provider: the table, the record, and the factory that the server looks up.
 * The hook is a statement run by the factory (it sees brkr, ctx and rc), or CMNoHook. */
#define CMNoHook

#define CM_MI_STUB_(kind, tag, label, pn, broker, hook, ...)                                       \
    static CMPI##kind##MIFT tag##MIFT__ = {CMPICurrentVersion, CMPICurrentVersion, label #pn,      \
                                           __VA_ARGS__};                                           \
    CMPI_EXTERN_C CMPI##kind##MI* pn##_Create_##kind##MI(const CMPIBroker* brkr,                   \
                                                         const CMPIContext* ctx, CMPIStatus* rc) { \
        static CMPI##kind##MI mi = {NULL, &tag##MIFT__};                                           \
        (void)ctx;                                                                                 \
        (void)rc;                                                                                  \
        broker = brkr;                                                                             \
        hook;                                                                                      \
        return &mi;                                                                                \
    }

/* What a level changed in the lists of entries, or added to them; providers that fill a table by
 * hand use these, too. A list of additions ends with its comma. */
#define CMInstanceMIStubChange(pfx) pfx##ModifyInstance
#define CMIndicationMIStubExtensions(pfx) pfx##EnableIndications, pfx##DisableIndications,

#define CMInstanceMIStub(pfx, pn, broker, hook)                                                    \
    CM_MI_STUB_(Instance, inst, "instance", pn, broker, hook, pfx##Cleanup,                        \
                pfx##EnumInstanceNames, pfx##EnumInstances, pfx##GetInstance, pfx##CreateInstance, \
                CMInstanceMIStubChange(pfx), pfx##DeleteInstance, pfx##ExecQuery)
#define CMAssociationMIStub(pfx, pn, broker, hook)                                            \
    CM_MI_STUB_(Association, assoc, "association", pn, broker, hook, pfx##AssociationCleanup, \
                pfx##Associators, pfx##AssociatorNames, pfx##References, pfx##ReferenceNames)
#define CMMethodMIStub(pfx, pn, broker, hook) \
    CM_MI_STUB_(Method, meth, "method", pn, broker, hook, pfx##MethodCleanup, pfx##InvokeMethod)
#define CMPropertyMIStub(pfx, pn, broker, hook)                                     \
    CM_MI_STUB_(Property, prop, "property", pn, broker, hook, pfx##PropertyCleanup, \
                pfx##SetProperty, pfx##GetProperty, NULL)
#define CMIndicationMIStub(pfx, pn, broker, hook)                                                \
    CM_MI_STUB_(Indication, ind, "indication", pn, broker, hook, pfx##IndicationCleanup,         \
                pfx##AuthorizeFilter, pfx##MustPoll, pfx##ActivateFilter, pfx##DeActivateFilter, \
                CMIndicationMIStubExtensions(pfx))

#ifdef __cplusplus
/* Entry points of a C++ provider class cn under the name pn. One object serves all kinds; it is
 * made by the first factory called and ends with the last cleanup. Needs CmpiBaseMI.h and the
 * kind's header. */
#define CMProviderBase(pn) CmpiProviderBase base##pn;

#define CM_MI_FACTORY_(kind, label, cn, pn, ...)                                                   \
    CMPI_EXTERN_C CMPI##kind##MI* pn##_Create_##kind##MI(const CMPIBroker* brkr,                   \
                                                         const CMPIContext* ctx, CMPIStatus* rc) { \
        static CMPI##kind##MIFT table = {                                                          \
            CMPICurrentVersion, CMPICurrentVersion, label #pn,                                     \
            [](CMPI##kind##MI* self, const CMPIContext* cleanupCtx, CMPIBoolean terminating) {     \
                return CmpiBaseMI::driveBaseCleanup(self, cleanupCtx, terminating);                \
            },                                                                                     \
            __VA_ARGS__};                                                                          \
        static CMPI##kind##MI mi = {NULL, &table};                                                 \
        mi.hdl = CmpiBaseMI::acquire(                                                              \
            base##pn, brkr, ctx, rc,                                                               \
            [](const CmpiBroker& providerBroker, CmpiContext& providerCtx) -> CmpiBaseMI* {        \
                return new cn(providerBroker, providerCtx);                                        \
            });                                                                                    \
        return mi.hdl ? &mi : NULL;                                                                \
    }

#define CMInstanceMIFactory(cn, pn)                                                       \
    CM_MI_FACTORY_(Instance, "instance", cn, pn, CmpiInstanceMI::driveEnumInstanceNames,  \
                   CmpiInstanceMI::driveEnumInstances, CmpiInstanceMI::driveGetInstance,  \
                   CmpiInstanceMI::driveCreateInstance, CmpiInstanceMI::driveSetInstance, \
                   CmpiInstanceMI::driveDeleteInstance, CmpiInstanceMI::driveExecQuery)
#define CMAssociationMIFactory(cn, pn)                                                          \
    CM_MI_FACTORY_(Association, "association", cn, pn, CmpiAssociationMI::driveAssociators,     \
                   CmpiAssociationMI::driveAssociatorNames, CmpiAssociationMI::driveReferences, \
                   CmpiAssociationMI::driveReferenceNames)
#define CMMethodMIFactory(cn, pn) \
    CM_MI_FACTORY_(Method, "method", cn, pn, CmpiMethodMI::driveInvokeMethod)
#define CMPropertyMIFactory(cn, pn)                                                \
    CM_MI_FACTORY_(Property, "property", cn, pn, CmpiPropertyMI::driveSetProperty, \
                   CmpiPropertyMI::driveGetProperty, NULL)
#define CMIndicationMIFactoryExtensions \
    CmpiIndicationMI::driveEnableIndications, CmpiIndicationMI::driveDisableIndications,
#define CMIndicationMIFactory(cn, pn)                                                        \
    CM_MI_FACTORY_(Indication, "indication", cn, pn, CmpiIndicationMI::driveAuthorizeFilter, \
                   CmpiIndicationMI::driveMustPoll, CmpiIndicationMI::driveActivateFilter,   \
                   CmpiIndicationMI::driveDeActivateFilter, CMIndicationMIFactoryExtensions)
#endif

#endif

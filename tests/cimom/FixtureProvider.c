/* A provider in C with all five interfaces: things in a small store, links between each two of
 * them, methods that tell what the broker hands over, and events.
 *
 * Fixture is built into tests and as a library; Refuser and Stayer are providers of the library
 * that cannot be made, and that does not want to go. */
#include <pthread.h>
#include <stdio.h>
#include <string.h>

#include "cmpidt.h"
#include "cmpift.h"
#include "cmpimacs.h"

enum { MaxThings = 32, NameSize = 64 };

typedef struct {
    char name[NameSize];
    CMPIUint32 size;
} Thing;

static Thing things[MaxThings] = {{"one", 1}, {"two, \"quoted\" \\", 2}};
static int thingCount = 2;
static pthread_mutex_t storeMutex = PTHREAD_MUTEX_INITIALIZER;
static const CMPIBroker* broker;
static void hook(void) { printf("fixture: a line for standard output\n"); }

static int findThing(const char* name) {
    for (int i = 0; i < thingCount; ++i)
        if (strcmp(things[i].name, name) == 0) return i;
    return -1;
}

static const char* keyOf(const CMPIObjectPath* path) {
    CMPIStatus rc;
    CMPIData key = path->ft->getKey(path, "Name", &rc);
    if (rc.rc != CMPI_RC_OK || key.type != CMPI_string) return "";
    return key.value.string->ft->getCharPtr(key.value.string, NULL);
}

static CMPIStatus status(CMPIrc rc, const char* text) {
    CMPIStatus result = {rc, NULL};
    if (text) result.msg = broker->eft->newString(broker, text, NULL);
    return result;
}

static const char* nameSpaceOf(const CMPIObjectPath* path) {
    return path->ft->getNameSpace(path, NULL)
        ->ft->getCharPtr(path->ft->getNameSpace(path, NULL), NULL);
}

static CMPIObjectPath* thingPath(const char* ns, const Thing* thing) {
    CMPIObjectPath* path = broker->eft->newObjectPath(broker, ns, "Fix_Thing", NULL);
    path->ft->addKey(path, "Name", (const CMPIValue*)thing->name, CMPI_chars);
    return path;
}

static CMPIInstance* thingInstance(const char* ns, const Thing* thing, const char** properties) {
    CMPIInstance* inst = broker->eft->newInstance(broker, thingPath(ns, thing), NULL);
    CMPIValue value;
    if (!inst) return NULL;
    if (properties) inst->ft->setPropertyFilter(inst, properties, NULL);
    value.uint32 = thing->size;
    inst->ft->setProperty(inst, "Size", &value, CMPI_uint32);
    value.array = broker->eft->newArray(broker, 2, CMPI_chars, NULL);
    value.array->ft->setElementAt(value.array, 0, (const CMPIValue*)"first", CMPI_chars);
    inst->ft->setProperty(inst, "Tags", &value, CMPI_stringA);
    return inst;
}

/* -- instances -- */

static CMPIStatus FixtureCleanup(CMPIInstanceMI* mi, const CMPIContext* ctx, CMPIBoolean ending) {
    (void)ctx;
    /* The Stayer goes when there is no other way. */
    return status(mi->hdl && !ending ? CMPI_RC_DO_NOT_UNLOAD : CMPI_RC_OK, NULL);
}
static CMPIStatus enumerate(const CMPIResult* result, const CMPIObjectPath* path, int names,
                            const char** properties) {
    const char* ns = nameSpaceOf(path);
    hook();
    pthread_mutex_lock(&storeMutex);
    for (int i = 0; i < thingCount; ++i) {
        if (names)
            result->ft->returnObjectPath(result, thingPath(ns, &things[i]));
        else
            result->ft->returnInstance(result, thingInstance(ns, &things[i], properties));
    }
    pthread_mutex_unlock(&storeMutex);
    result->ft->returnDone(result);
    return status(CMPI_RC_OK, NULL);
}
static CMPIStatus FixtureEnumInstanceNames(CMPIInstanceMI* mi, const CMPIContext* ctx,
                                           const CMPIResult* result, const CMPIObjectPath* path) {
    (void)mi, (void)ctx;
    return enumerate(result, path, 1, NULL);
}
static CMPIStatus FixtureEnumInstances(CMPIInstanceMI* mi, const CMPIContext* ctx,
                                       const CMPIResult* result, const CMPIObjectPath* path,
                                       const char** properties) {
    (void)mi, (void)ctx;
    return enumerate(result, path, 0, properties);
}
static CMPIStatus FixtureGetInstance(CMPIInstanceMI* mi, const CMPIContext* ctx,
                                     const CMPIResult* result, const CMPIObjectPath* path,
                                     const char** properties) {
    int at;
    (void)mi, (void)ctx;
    pthread_mutex_lock(&storeMutex);
    at = findThing(keyOf(path));
    if (at >= 0)
        result->ft->returnInstance(result,
                                   thingInstance(nameSpaceOf(path), &things[at], properties));
    pthread_mutex_unlock(&storeMutex);
    if (at < 0) return status(CMPI_RC_ERR_NOT_FOUND, "no such thing");
    result->ft->returnDone(result);
    return status(CMPI_RC_OK, NULL);
}
static void takeSize(Thing* thing, const CMPIInstance* inst) {
    CMPIStatus rc;
    CMPIData size = inst->ft->getProperty(inst, "Size", &rc);
    if (rc.rc == CMPI_RC_OK && !(size.state & CMPI_nullValue)) thing->size = size.value.uint32;
}
static CMPIStatus FixtureCreateInstance(CMPIInstanceMI* mi, const CMPIContext* ctx,
                                        const CMPIResult* result, const CMPIObjectPath* path,
                                        const CMPIInstance* inst) {
    const char* name = keyOf(path);
    CMPIrc rc = CMPI_RC_OK;
    (void)mi, (void)ctx;
    pthread_mutex_lock(&storeMutex);
    if (findThing(name) >= 0 || thingCount == MaxThings) {
        rc = CMPI_RC_ERR_ALREADY_EXISTS;
    } else {
        Thing* thing = &things[thingCount++];
        memset(thing, 0, sizeof *thing);
        strncpy(thing->name, name, NameSize - 1);
        takeSize(thing, inst);
    }
    pthread_mutex_unlock(&storeMutex);
    if (rc != CMPI_RC_OK) return status(rc, "such a thing is there");
    result->ft->returnObjectPath(result, path);
    result->ft->returnDone(result);
    return status(CMPI_RC_OK, NULL);
}
static CMPIStatus change(const CMPIObjectPath* path, const CMPIInstance* inst, int delete) {
    int at;
    pthread_mutex_lock(&storeMutex);
    at = findThing(keyOf(path));
    if (at >= 0 && delete) things[at] = things[--thingCount];
    if (at >= 0 && !delete) takeSize(&things[at], inst);
    pthread_mutex_unlock(&storeMutex);
    return at < 0 ? status(CMPI_RC_ERR_NOT_FOUND, "no such thing") : status(CMPI_RC_OK, NULL);
}
static CMPIStatus FixtureModifyInstance(CMPIInstanceMI* mi, const CMPIContext* ctx,
                                        const CMPIResult* result, const CMPIObjectPath* path,
                                        const CMPIInstance* inst, const char** properties) {
    (void)mi, (void)ctx, (void)result, (void)properties;
    return change(path, inst, 0);
}
static CMPIStatus FixtureDeleteInstance(CMPIInstanceMI* mi, const CMPIContext* ctx,
                                        const CMPIResult* result, const CMPIObjectPath* path) {
    (void)mi, (void)ctx, (void)result;
    return change(path, NULL, 1);
}
static CMPIStatus FixtureExecQuery(CMPIInstanceMI* mi, const CMPIContext* ctx,
                                   const CMPIResult* result, const CMPIObjectPath* path,
                                   const char* query, const char* lang) {
    (void)mi, (void)ctx, (void)result, (void)path, (void)query, (void)lang;
    return status(CMPI_RC_ERR_NOT_SUPPORTED, NULL);
}

/* -- associations: every thing is linked with every other one; fetched by upcalls -- */

enum { Paths = 1, Links = 2 };

static CMPIInstance* linkInstance(const CMPIObjectPath* from, CMPIObjectPath* to) {
    CMPIObjectPath* path = broker->eft->newObjectPath(broker, nameSpaceOf(from), "Fix_Link", NULL);
    CMPIValue value;
    value.ref = (CMPIObjectPath*)from;
    path->ft->addKey(path, "Antecedent", &value, CMPI_ref);
    value.ref = to;
    path->ft->addKey(path, "Dependent", &value, CMPI_ref);
    return broker->eft->newInstance(broker, path, NULL);
}
static CMPIStatus related(const CMPIContext* ctx, const CMPIResult* result,
                          const CMPIObjectPath* from, int what, const char** properties) {
    CMPIStatus rc;
    CMPIObjectPath* cls = broker->eft->newObjectPath(broker, nameSpaceOf(from), "Fix_Thing", NULL);
    CMPIEnumeration* all = broker->bft->enumerateInstances(broker, ctx, cls, properties, &rc);
    if (!all) return rc;
    while (all->ft->hasNext(all, NULL)) {
        CMPIInstance* inst = all->ft->getNext(all, NULL).value.inst;
        CMPIObjectPath* path = inst->ft->getObjectPath(inst, NULL);
        if (strcmp(keyOf(path), keyOf(from)) == 0) continue;
        if (what & Links) inst = linkInstance(from, path);
        if (what & Paths)
            result->ft->returnObjectPath(result, inst->ft->getObjectPath(inst, NULL));
        else
            result->ft->returnInstance(result, inst);
    }
    result->ft->returnDone(result);
    return status(CMPI_RC_OK, NULL);
}
static CMPIStatus FixtureAssociationCleanup(CMPIAssociationMI* mi, const CMPIContext* ctx,
                                            CMPIBoolean ending) {
    (void)mi, (void)ctx, (void)ending;
    return status(CMPI_RC_OK, NULL);
}
static CMPIStatus FixtureAssociators(CMPIAssociationMI* mi, const CMPIContext* ctx,
                                     const CMPIResult* result, const CMPIObjectPath* path,
                                     const char* assocClass, const char* resultClass,
                                     const char* role, const char* resultRole,
                                     const char** properties) {
    (void)mi, (void)assocClass, (void)resultClass, (void)role, (void)resultRole;
    return related(ctx, result, path, 0, properties);
}
static CMPIStatus FixtureAssociatorNames(CMPIAssociationMI* mi, const CMPIContext* ctx,
                                         const CMPIResult* result, const CMPIObjectPath* path,
                                         const char* assocClass, const char* resultClass,
                                         const char* role, const char* resultRole) {
    (void)mi, (void)assocClass, (void)resultClass, (void)role, (void)resultRole;
    return related(ctx, result, path, Paths, NULL);
}
static CMPIStatus FixtureReferences(CMPIAssociationMI* mi, const CMPIContext* ctx,
                                    const CMPIResult* result, const CMPIObjectPath* path,
                                    const char* resultClass, const char* role,
                                    const char** properties) {
    (void)mi, (void)resultClass, (void)properties;
    if (role && strcmp(role, "Dependent") == 0) return status(CMPI_RC_OK, NULL);
    return related(ctx, result, path, Links, NULL);
}
static CMPIStatus FixtureReferenceNames(CMPIAssociationMI* mi, const CMPIContext* ctx,
                                        const CMPIResult* result, const CMPIObjectPath* path,
                                        const char* resultClass, const char* role) {
    (void)mi, (void)resultClass;
    if (role && strcmp(role, "Dependent") == 0) return status(CMPI_RC_OK, NULL);
    return related(ctx, result, path, Links | Paths, NULL);
}

/* -- methods -- */

static void echo(const CMPIArgs* in, CMPIArgs* out) {
    CMPICount count = in->ft->getArgCount(in, NULL);
    for (CMPICount i = 0; i < count; ++i) {
        CMPIString* name;
        CMPIData data = in->ft->getArgAt(in, i, &name, NULL);
        out->ft->addArg(out, name->ft->getCharPtr(name, NULL),
                        data.state & CMPI_nullValue ? NULL : &data.value, data.type);
    }
}
static void tellContext(const CMPIContext* ctx, CMPIArgs* out) {
    CMPICount count = ctx->ft->getEntryCount(ctx, NULL);
    for (CMPICount i = 0; i < count; ++i) {
        CMPIString* name;
        CMPIData data = ctx->ft->getEntryAt(ctx, i, &name, NULL);
        if (data.type != CMPI_string || (data.state & CMPI_nullValue))
            out->ft->addArg(out, name->ft->getCharPtr(name, NULL), &data.value, data.type);
        else
            out->ft->addArg(
                out, name->ft->getCharPtr(name, NULL),
                (const CMPIValue*)data.value.string->ft->getCharPtr(data.value.string, NULL),
                CMPI_chars);
    }
}
static CMPIStatus fire(const CMPIContext* ctx, const CMPIObjectPath* path, const CMPIArgs* in) {
    CMPIData severity = in->ft->getArg(in, "Severity", NULL);
    CMPIObjectPath* cls = broker->eft->newObjectPath(broker, nameSpaceOf(path), "Fix_Event", NULL);
    CMPIInstance* event = broker->eft->newInstance(broker, cls, NULL);
    event->ft->setProperty(event, "Severity", &severity.value, severity.type);
    return broker->bft->deliverIndication(broker, ctx, nameSpaceOf(path), event);
}
static CMPIStatus FixtureMethodCleanup(CMPIMethodMI* mi, const CMPIContext* ctx,
                                       CMPIBoolean ending) {
    (void)mi, (void)ctx, (void)ending;
    return status(CMPI_RC_OK, NULL);
}
static CMPIStatus FixtureInvokeMethod(CMPIMethodMI* mi, const CMPIContext* ctx,
                                      const CMPIResult* result, const CMPIObjectPath* path,
                                      const char* method, const CMPIArgs* in, CMPIArgs* out) {
    CMPIValue value;
    (void)mi;
    value.uint32 = in->ft->getArgCount(in, NULL);
    if (strcmp(method, "Echo") == 0) {
        echo(in, out);
    } else if (strcmp(method, "Context") == 0) {
        tellContext(ctx, out);
    } else if (strcmp(method, "Relay") == 0) { /* Echo, by way of the broker */
        CMPIData data = broker->bft->invokeMethod(broker, ctx, path, "Echo", in, out, NULL);
        value.uint32 = data.value.uint32;
    } else if (strcmp(method, "Fire") == 0) {
        CMPIStatus rc = fire(ctx, path, in);
        if (rc.rc != CMPI_RC_OK) return rc;
    } else if (strcmp(method, "Keep") == 0) { /* a clone that nobody releases */
        path->ft->clone(path, NULL);
    } else {
        return status(CMPI_RC_ERR_METHOD_NOT_FOUND, method);
    }
    result->ft->returnData(result, &value, CMPI_uint32);
    result->ft->returnDone(result);
    return status(CMPI_RC_OK, NULL);
}

/* -- properties -- */

static CMPIStatus FixturePropertyCleanup(CMPIPropertyMI* mi, const CMPIContext* ctx,
                                         CMPIBoolean ending) {
    (void)mi, (void)ctx, (void)ending;
    return status(CMPI_RC_OK, NULL);
}
static CMPIStatus FixtureSetProperty(CMPIPropertyMI* mi, const CMPIContext* ctx,
                                     const CMPIResult* result, const CMPIObjectPath* path,
                                     const char* name, const CMPIData data) {
    CMPIInstance* inst = broker->eft->newInstance(broker, path, NULL);
    CMPIStatus rc = inst->ft->setProperty(inst, name, &data.value, data.type);
    (void)mi, (void)ctx, (void)result;
    return rc.rc != CMPI_RC_OK ? rc : change(path, inst, 0);
}
static CMPIStatus FixtureGetProperty(CMPIPropertyMI* mi, const CMPIContext* ctx,
                                     const CMPIResult* result, const CMPIObjectPath* path,
                                     const char* name) {
    CMPIValue value;
    int at;
    (void)mi, (void)ctx;
    if (strcmp(name, "Size") != 0) return status(CMPI_RC_ERR_NO_SUCH_PROPERTY, name);
    at = findThing(keyOf(path));
    if (at < 0) return status(CMPI_RC_ERR_NOT_FOUND, "no such thing");
    value.uint32 = things[at].size;
    result->ft->returnData(result, &value, CMPI_uint32);
    result->ft->returnDone(result);
    return status(CMPI_RC_OK, NULL);
}

/* -- indications: what happens to filters is written to the log -- */

static CMPIStatus note(const char* what, const char* className, CMPIBoolean edge) {
    char text[128];
    snprintf(text, sizeof text, "%s %s %s", what, className, edge ? "edge" : "inner");
    broker->eft->trace(broker, CMPI_LEV_INFO, "Fixture", text, NULL);
    return status(CMPI_RC_OK, NULL);
}
static CMPIStatus FixtureIndicationCleanup(CMPIIndicationMI* mi, const CMPIContext* ctx,
                                           CMPIBoolean ending) {
    (void)mi, (void)ctx, (void)ending;
    return status(CMPI_RC_OK, NULL);
}
static CMPIStatus FixtureAuthorizeFilter(CMPIIndicationMI* mi, const CMPIContext* ctx,
                                         const CMPISelectExp* filter, const char* className,
                                         const CMPIObjectPath* path, const char* owner) {
    (void)mi, (void)ctx, (void)filter, (void)className, (void)path;
    return status(strcmp(owner, "eve") == 0 ? CMPI_RC_ERR_ACCESS_DENIED : CMPI_RC_OK, owner);
}
static CMPIStatus FixtureMustPoll(CMPIIndicationMI* mi, const CMPIContext* ctx,
                                  const CMPISelectExp* filter, const char* className,
                                  const CMPIObjectPath* path) {
    (void)mi, (void)ctx, (void)filter, (void)className, (void)path;
    return status(CMPI_RC_ERR_NOT_SUPPORTED, "never");
}
static CMPIStatus FixtureActivateFilter(CMPIIndicationMI* mi, const CMPIContext* ctx,
                                        const CMPISelectExp* filter, const char* className,
                                        const CMPIObjectPath* path, CMPIBoolean first) {
    (void)mi, (void)ctx, (void)filter, (void)path;
    return note("activate", className, first);
}
static CMPIStatus FixtureDeActivateFilter(CMPIIndicationMI* mi, const CMPIContext* ctx,
                                          const CMPISelectExp* filter, const char* className,
                                          const CMPIObjectPath* path, CMPIBoolean last) {
    (void)mi, (void)ctx, (void)filter, (void)path;
    return note("deactivate", className, last);
}
static CMPIStatus FixtureEnableIndications(CMPIIndicationMI* mi, const CMPIContext* ctx) {
    (void)mi, (void)ctx;
    return note("enable", "", 1);
}
static CMPIStatus FixtureDisableIndications(CMPIIndicationMI* mi, const CMPIContext* ctx) {
    (void)mi, (void)ctx;
    return note("disable", "", 1);
}

CMInstanceMIStub(Fixture, Fixture, broker, CMNoHook)
    CMAssociationMIStub(Fixture, Fixture, broker, CMNoHook)
        CMMethodMIStub(Fixture, Fixture, broker, CMNoHook)
            CMPropertyMIStub(Fixture, Fixture, broker, CMNoHook)
                CMIndicationMIStub(Fixture, Fixture, broker, CMNoHook)

                    CMPI_EXTERN_C CMPIInstanceMI* Refuser_Create_InstanceMI(const CMPIBroker* mb,
                                                                            const CMPIContext* ctx,
                                                                            CMPIStatus* rc) {
    (void)ctx;
    rc->rc = CMPI_RC_ERR_ACCESS_DENIED;
    rc->msg = mb->eft->newString(mb, "not today", NULL);
    return NULL;
}

/* The same things under another name, by the generic factory. */
CMPI_EXTERN_C CMPIInstanceMI* _Generic_Create_InstanceMI(const CMPIBroker* mb,
                                                         const CMPIContext* ctx, const char* name,
                                                         CMPIStatus* rc) {
    static CMPIInstanceMI stayer;
    if (strcmp(name, "Stayer") != 0) return NULL;
    stayer = *Fixture_Create_InstanceMI(mb, ctx, rc);
    stayer.hdl = &stayer;
    return &stayer;
}

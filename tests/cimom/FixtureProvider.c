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

/* Every operation has all the parameters of its entry, whatever it needs of them. */
#pragma GCC diagnostic ignored "-Wunused-parameter"

typedef const CMPIContext* Context;
typedef const CMPIResult* Result;
typedef const CMPIObjectPath* Path;
typedef const CMPISelectExp* Filter;
typedef const char* Text;

enum { MaxThings = 32, NameSize = 64 };

typedef struct {
    char name[NameSize];
    CMPIUint32 size;
} Thing;

static Thing things[MaxThings] = {{"one", 1}, {"two, \"quoted\" \\", 2}};
static int thingCount = 2;
static pthread_mutex_t storeMutex = PTHREAD_MUTEX_INITIALIZER;
static const CMPIBroker* broker;

static Text nameSpaceOf(Path path) { return CMGetCharPtr(CMGetNameSpace(path, NULL)); }
static Text keyOf(Path path) {
    CMPIStatus rc;
    CMPIData key = CMGetKey(path, "Name", &rc);
    return rc.rc == CMPI_RC_OK && key.type == CMPI_string ? CMGetCharPtr(key.value.string) : "";
}

static CMPIStatus status(CMPIrc rc, Text text) {
    if (!text) {
        CMReturn(rc);
    }
    CMReturnWithChars(broker, rc, text);
}
static CMPIStatus done(Result result) {
    CMReturnDone(result);
    CMReturn(CMPI_RC_OK);
}

static int findThing(Text name) {
    for (int i = 0; i < thingCount; ++i) {
        if (strcmp(things[i].name, name) == 0) {
            return i;
        }
    }
    return -1;
}
static CMPIObjectPath* newPath(Path like, Text className) {
    return broker->eft->newObjectPath(broker, nameSpaceOf(like), className, NULL);
}
static CMPIObjectPath* thingPath(Path like, const Thing* thing) {
    CMPIObjectPath* path = newPath(like, "Fix_Thing");
    path->ft->addKey(path, "Name", (const CMPIValue*)thing->name, CMPI_chars);
    return path;
}
static CMPIInstance* thingInstance(Path like, const Thing* thing, Text* properties) {
    CMPIInstance* inst = broker->eft->newInstance(broker, thingPath(like, thing), NULL);
    CMPIValue value;
    Text keys[] = {"Name", NULL};
    if (!inst) {
        return NULL;
    }
    if (properties) {
        inst->ft->setPropertyFilter(inst, properties, keys);
    }
    value.uint32 = thing->size;
    inst->ft->setProperty(inst, "Size", &value, CMPI_uint32);
    value.array = broker->eft->newArray(broker, 2, CMPI_chars, NULL);
    value.array->ft->setElementAt(value.array, 0, (const CMPIValue*)"first", CMPI_chars);
    inst->ft->setProperty(inst, "Tags", &value, CMPI_stringA);
    return inst;
}
static void takeSize(Thing* thing, const CMPIInstance* inst) {
    CMPIStatus rc;
    CMPIData size = inst->ft->getProperty(inst, "Size", &rc);
    if (rc.rc == CMPI_RC_OK && !(size.state & CMPI_nullValue)) {
        thing->size = size.value.uint32;
    }
}

/* -- instances -- */

static CMPIStatus FixtureCleanup(CMPIInstanceMI* mi, Context ctx, CMPIBoolean ending) {
    /* The Stayer goes when there is no other way. */
    return status(mi->hdl && !ending ? CMPI_RC_DO_NOT_UNLOAD : CMPI_RC_OK, NULL);
}
static CMPIStatus enumerate(Result result, Path path, int names, Text* properties) {
    printf("fixture: a line for standard output\n");
    pthread_mutex_lock(&storeMutex);
    for (int i = 0; i < thingCount; ++i) {
        if (names) {
            CMReturnObjectPath(result, thingPath(path, &things[i]));
        } else {
            CMReturnInstance(result, thingInstance(path, &things[i], properties));
        }
    }
    pthread_mutex_unlock(&storeMutex);
    return done(result);
}
static CMPIStatus FixtureEnumInstanceNames(CMPIInstanceMI* mi, Context ctx, Result result,
                                           Path path) {
    return enumerate(result, path, 1, NULL);
}
static CMPIStatus FixtureEnumInstances(CMPIInstanceMI* mi, Context ctx, Result result, Path path,
                                       Text* properties) {
    return enumerate(result, path, 0, properties);
}
static CMPIStatus FixtureGetInstance(CMPIInstanceMI* mi, Context ctx, Result result, Path path,
                                     Text* properties) {
    int at;
    pthread_mutex_lock(&storeMutex);
    at = findThing(keyOf(path));
    if (at >= 0) {
        CMReturnInstance(result, thingInstance(path, &things[at], properties));
    }
    pthread_mutex_unlock(&storeMutex);
    return at < 0 ? status(CMPI_RC_ERR_NOT_FOUND, "no such thing") : done(result);
}
static CMPIStatus FixtureCreateInstance(CMPIInstanceMI* mi, Context ctx, Result result, Path path,
                                        const CMPIInstance* inst) {
    CMPIBoolean fits;
    pthread_mutex_lock(&storeMutex);
    fits = findThing(keyOf(path)) < 0 && thingCount < MaxThings;
    if (fits) {
        Thing* thing = &things[thingCount++];
        thing->size = 0;
        snprintf(thing->name, NameSize, "%s", keyOf(path));
        takeSize(thing, inst);
    }
    pthread_mutex_unlock(&storeMutex);
    if (!fits) {
        return status(CMPI_RC_ERR_ALREADY_EXISTS, "such a thing is there");
    }
    CMReturnObjectPath(result, path);
    return done(result);
}
static CMPIStatus change(Path path, const CMPIInstance* inst, int delete) {
    int at;
    pthread_mutex_lock(&storeMutex);
    at = findThing(keyOf(path));
    if (at >= 0 && delete) {
        things[at] = things[--thingCount];
    }
    if (at >= 0 && !delete) {
        takeSize(&things[at], inst);
    }
    pthread_mutex_unlock(&storeMutex);
    return at < 0 ? status(CMPI_RC_ERR_NOT_FOUND, "no such thing") : status(CMPI_RC_OK, NULL);
}
static CMPIStatus FixtureModifyInstance(CMPIInstanceMI* mi, Context ctx, Result result, Path path,
                                        const CMPIInstance* inst, Text* properties) {
    return change(path, inst, 0);
}
static CMPIStatus FixtureDeleteInstance(CMPIInstanceMI* mi, Context ctx, Result result, Path path) {
    return change(path, NULL, 1);
}
static CMPIStatus FixtureExecQuery(CMPIInstanceMI* mi, Context ctx, Result result, Path path,
                                   Text query, Text lang) {
    return status(CMPI_RC_ERR_NOT_SUPPORTED, NULL);
}

/* -- associations: every thing is linked with every other one; fetched by upcalls -- */

enum { Paths = 1, Links = 2 };

static CMPIInstance* linkInstance(Path from, CMPIObjectPath* to) {
    CMPIObjectPath* path = newPath(from, "Fix_Link");
    CMPIValue value;
    value.ref = (CMPIObjectPath*)from;
    path->ft->addKey(path, "Antecedent", &value, CMPI_ref);
    value.ref = to;
    path->ft->addKey(path, "Dependent", &value, CMPI_ref);
    return broker->eft->newInstance(broker, path, NULL);
}
static CMPIStatus related(Context ctx, Result result, Path from, Text role, int what,
                          Text* properties) {
    CMPIStatus rc;
    CMPIEnumeration* all;
    if (role && strcmp(role, "Dependent") == 0) {
        return status(CMPI_RC_OK, NULL);
    }
    all = broker->bft->enumerateInstances(broker, ctx, newPath(from, "Fix_Thing"), properties, &rc);
    if (!all) {
        return rc;
    }
    while (all->ft->hasNext(all, NULL)) {
        CMPIInstance* inst = all->ft->getNext(all, NULL).value.inst;
        CMPIObjectPath* path = inst->ft->getObjectPath(inst, NULL);
        if (strcmp(keyOf(path), keyOf(from)) == 0) {
            continue;
        }
        if (what & Links) {
            inst = linkInstance(from, path);
        }
        if (what & Paths) {
            CMReturnObjectPath(result, inst->ft->getObjectPath(inst, NULL));
        } else {
            CMReturnInstance(result, inst);
        }
    }
    return done(result);
}
static CMPIStatus FixtureAssociators(CMPIAssociationMI* mi, Context ctx, Result result, Path path,
                                     Text assocClass, Text resultClass, Text role, Text resultRole,
                                     Text* properties) {
    return related(ctx, result, path, role, 0, properties);
}
static CMPIStatus FixtureAssociatorNames(CMPIAssociationMI* mi, Context ctx, Result result,
                                         Path path, Text assocClass, Text resultClass, Text role,
                                         Text resultRole) {
    return related(ctx, result, path, role, Paths, NULL);
}
static CMPIStatus FixtureReferences(CMPIAssociationMI* mi, Context ctx, Result result, Path path,
                                    Text resultClass, Text role, Text* properties) {
    return related(ctx, result, path, role, Links, NULL);
}
static CMPIStatus FixtureReferenceNames(CMPIAssociationMI* mi, Context ctx, Result result,
                                        Path path, Text resultClass, Text role) {
    return related(ctx, result, path, role, Links | Paths, NULL);
}

/* -- methods -- */

static void give(CMPIArgs* out, const CMPIString* name, CMPIData data) {
    CMAddArg(out, CMGetCharPtr(name), CMIsNullValue(data) ? NULL : &data.value, data.type);
}
static CMPIStatus fire(Context ctx, Path path, const CMPIArgs* in) {
    CMPIData severity = CMGetArg(in, "Severity", NULL);
    CMPIInstance* event = broker->eft->newInstance(broker, newPath(path, "Fix_Event"), NULL);
    event->ft->setProperty(event, "Severity", &severity.value, severity.type);
    return broker->bft->deliverIndication(broker, ctx, nameSpaceOf(path), event);
}
static CMPIStatus FixtureInvokeMethod(CMPIMethodMI* mi, Context ctx, Result result, Path path,
                                      Text method, const CMPIArgs* in, CMPIArgs* out) {
    CMPIString* name;
    CMPIValue value;
    value.uint32 = CMGetArgCount(in, NULL);
    if (strcmp(method, "Echo") == 0) {
        for (CMPICount i = 0; i < value.uint32; ++i) {
            CMPIData data = CMGetArgAt(in, i, &name, NULL);
            give(out, name, data);
        }
    } else if (strcmp(method, "Context") == 0) {
        for (CMPICount i = 0; i < ctx->ft->getEntryCount(ctx, NULL); ++i) {
            CMPIData data = ctx->ft->getEntryAt(ctx, i, &name, NULL);
            give(out, name, data);
        }
    } else if (strcmp(method, "Relay") == 0) { /* Echo, by way of the broker */
        CMPIData data = broker->bft->invokeMethod(broker, ctx, path, "Echo", in, out, NULL);
        value.uint32 = data.value.uint32;
    } else if (strcmp(method, "Fire") == 0) {
        CMPIStatus rc = fire(ctx, path, in);
        if (rc.rc != CMPI_RC_OK) {
            return rc;
        }
    } else if (strcmp(method, "Keep") == 0) { /* a clone that nobody releases */
        path->ft->clone(path, NULL);
    } else {
        return status(CMPI_RC_ERR_METHOD_NOT_FOUND, method);
    }
    CMReturnData(result, &value, CMPI_uint32);
    return done(result);
}

/* -- properties -- */

static CMPIStatus FixtureSetProperty(CMPIPropertyMI* mi, Context ctx, Result result, Path path,
                                     Text name, const CMPIData data) {
    CMPIInstance* inst = broker->eft->newInstance(broker, path, NULL);
    CMPIStatus rc = inst->ft->setProperty(inst, name, &data.value, data.type);
    return rc.rc != CMPI_RC_OK ? rc : change(path, inst, 0);
}
static CMPIStatus FixtureGetProperty(CMPIPropertyMI* mi, Context ctx, Result result, Path path,
                                     Text name) {
    const int at = findThing(keyOf(path));
    CMPIValue value;
    if (strcmp(name, "Size") != 0) {
        return status(CMPI_RC_ERR_NO_SUCH_PROPERTY, name);
    }
    if (at < 0) {
        return status(CMPI_RC_ERR_NOT_FOUND, "no such thing");
    }
    value.uint32 = things[at].size;
    CMReturnData(result, &value, CMPI_uint32);
    return done(result);
}

/* -- indications: what happens to filters is written to the log -- */

static CMPIStatus note(Text what, Text className, CMPIBoolean edge) {
    char text[128];
    snprintf(text, sizeof text, "%s %s %s", what, className, edge ? "edge" : "inner");
    broker->eft->trace(broker, CMPI_LEV_INFO, "Fixture", text, NULL);
    return status(CMPI_RC_OK, NULL);
}
static CMPIStatus FixtureAuthorizeFilter(CMPIIndicationMI* mi, Context ctx, Filter filter,
                                         Text className, Path path, Text owner) {
    return status(strcmp(owner, "eve") == 0 ? CMPI_RC_ERR_ACCESS_DENIED : CMPI_RC_OK, owner);
}
static CMPIStatus FixtureMustPoll(CMPIIndicationMI* mi, Context ctx, Filter filter, Text className,
                                  Path path) {
    return status(CMPI_RC_ERR_NOT_SUPPORTED, "never");
}
static CMPIStatus FixtureActivateFilter(CMPIIndicationMI* mi, Context ctx, Filter filter,
                                        Text className, Path path, CMPIBoolean first) {
    return note("activate", className, first);
}
static CMPIStatus FixtureDeActivateFilter(CMPIIndicationMI* mi, Context ctx, Filter filter,
                                          Text className, Path path, CMPIBoolean last) {
    return note("deactivate", className, last);
}
static CMPIStatus FixtureEnableIndications(CMPIIndicationMI* mi, Context ctx) {
    return note("enable", "", 1);
}
static CMPIStatus FixtureDisableIndications(CMPIIndicationMI* mi, Context ctx) {
    return note("disable", "", 1);
}

/* -- factories -- */

#define CLEANUP(Kind)                                                                            \
    static CMPIStatus Fixture##Kind##Cleanup(CMPI##Kind##MI* mi, Context ctx, CMPIBoolean end) { \
        return status(CMPI_RC_OK, NULL);                                                         \
    }
CLEANUP(Association)
CLEANUP(Method)
CLEANUP(Property)
CLEANUP(Indication)

CMInstanceMIStub(Fixture, Fixture, broker, CMNoHook)
    CMAssociationMIStub(Fixture, Fixture, broker, CMNoHook)
        CMMethodMIStub(Fixture, Fixture, broker, CMNoHook)
            CMPropertyMIStub(Fixture, Fixture, broker, CMNoHook)
                CMIndicationMIStub(Fixture, Fixture, broker, CMNoHook)

                    CMPI_EXTERN_C CMPIInstanceMI* Refuser_Create_InstanceMI(const CMPIBroker* mb,
                                                                            Context ctx,
                                                                            CMPIStatus* rc) {
    CMSetStatusWithChars(mb, rc, CMPI_RC_ERR_ACCESS_DENIED, "not today");
    return NULL;
}

/* The same things under another name, by the generic factory. */
CMPI_EXTERN_C CMPIInstanceMI* _Generic_Create_InstanceMI(const CMPIBroker* mb, Context ctx,
                                                         Text name, CMPIStatus* rc) {
    static CMPIInstanceMI stayer;
    if (strcmp(name, "Stayer") != 0) {
        return NULL;
    }
    stayer = *Fixture_Create_InstanceMI(mb, ctx, rc);
    stayer.hdl = &stayer;
    return &stayer;
}

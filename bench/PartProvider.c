/* The trivial provider of the comparison of servers: a class Bench_Part<n> has n instances of six
 * properties. In C and without any help, so that every CMPI server can load it. */
#include <stdio.h>
#include <stdlib.h>
#include <string.h>

#include "cmpidt.h"
#include "cmpift.h"
#include "cmpimacs.h"

/* Every operation has all the parameters of its entry, whatever it needs of them. */
#pragma GCC diagnostic ignored "-Wunused-parameter"

static const CMPIBroker* broker;

static CMPIObjectPath* makePath(const CMPIObjectPath* like, const char* name) {
    const char* nameSpace = CMGetCharPtr(CMGetNameSpace(like, NULL));
    const char* className = CMGetCharPtr(CMGetClassName(like, NULL));
    CMPIObjectPath* path = CMNewObjectPath(broker, nameSpace, className, NULL);
    CMAddKey(path, "Name", name, CMPI_chars);
    return path;
}

static CMPIInstance* makeInstance(const CMPIObjectPath* path, const char* name) {
    static const char* const texts[] = {"A", "B", "C", "D"};
    CMPIInstance* instance = CMNewInstance(broker, path, NULL);
    CMPIValue state;
    state.uint16 = 2;
    CMSetProperty(instance, "Name", name, CMPI_chars);
    for (size_t i = 0; i < sizeof texts / sizeof *texts; ++i) {
        CMSetProperty(instance, texts[i], "some text", CMPI_chars);
    }
    CMSetProperty(instance, "State", &state, CMPI_uint16);
    return instance;
}

static long countOf(const CMPIObjectPath* reference) {
    return atol(CMGetCharPtr(CMGetClassName(reference, NULL)) + strlen("Bench_Part"));
}

static CMPIStatus partCleanup(CMPIInstanceMI* mi, const CMPIContext* context, CMPIBoolean isEnd) {
    CMReturn(CMPI_RC_OK);
}

static CMPIStatus enumerate(const CMPIObjectPath* reference, const CMPIResult* result,
                            int withInstances) {
    const long count = countOf(reference);
    for (long i = 0; i < count; ++i) {
        char name[32];
        snprintf(name, sizeof name, "%ld", i);
        CMPIObjectPath* path = makePath(reference, name);
        if (withInstances) {
            CMReturnInstance(result, makeInstance(path, name));
        } else {
            CMReturnObjectPath(result, path);
        }
    }
    CMReturnDone(result);
    CMReturn(CMPI_RC_OK);
}

static CMPIStatus partEnumInstanceNames(CMPIInstanceMI* mi, const CMPIContext* context,
                                        const CMPIResult* result, const CMPIObjectPath* reference) {
    return enumerate(reference, result, 0);
}

static CMPIStatus partEnumInstances(CMPIInstanceMI* mi, const CMPIContext* context,
                                    const CMPIResult* result, const CMPIObjectPath* reference,
                                    const char** properties) {
    return enumerate(reference, result, 1);
}

static CMPIStatus partGetInstance(CMPIInstanceMI* mi, const CMPIContext* context,
                                  const CMPIResult* result, const CMPIObjectPath* reference,
                                  const char** properties) {
    const CMPIData key = CMGetKey(reference, "Name", NULL);
    const char* name = key.type == CMPI_string ? CMGetCharPtr(key.value.string) : "";
    CMReturnInstance(result, makeInstance(makePath(reference, name), name));
    CMReturnDone(result);
    CMReturn(CMPI_RC_OK);
}

static CMPIStatus partCreateInstance(CMPIInstanceMI* mi, const CMPIContext* context,
                                     const CMPIResult* result, const CMPIObjectPath* path,
                                     const CMPIInstance* instance) {
    CMReturn(CMPI_RC_ERR_NOT_SUPPORTED);
}

static CMPIStatus partModifyInstance(CMPIInstanceMI* mi, const CMPIContext* context,
                                     const CMPIResult* result, const CMPIObjectPath* path,
                                     const CMPIInstance* instance, const char** properties) {
    CMReturn(CMPI_RC_ERR_NOT_SUPPORTED);
}

static CMPIStatus partDeleteInstance(CMPIInstanceMI* mi, const CMPIContext* context,
                                     const CMPIResult* result, const CMPIObjectPath* path) {
    CMReturn(CMPI_RC_ERR_NOT_SUPPORTED);
}

static CMPIStatus partExecQuery(CMPIInstanceMI* mi, const CMPIContext* context,
                                const CMPIResult* result, const CMPIObjectPath* path,
                                const char* query, const char* language) {
    CMReturn(CMPI_RC_ERR_NOT_SUPPORTED);
}

CMInstanceMIStub(part, Part, broker, CMNoHook)

// A provider with all five interfaces, on the C interface alone: things in a small store, links
// between each two of them, methods that tell what the broker hands over, and events.
//
// Fixture is built into tests and as a library; Refuser and Stayer are providers of the library
// that cannot be made, and that does not want to go.
#include <algorithm>
#include <cstdio>
#include <cstring>
#include <mutex>
#include <string>
#include <vector>

#include "cmpidt.h"
#include "cmpift.h"
#include "cmpimacs.h"

namespace {

using Context = const CMPIContext*;
using Result = const CMPIResult*;
using Path = const CMPIObjectPath*;
using Text = const char*;

struct Thing {
    std::string name;
    CMPIUint32 size;
};

std::vector<Thing> things = {{"one", 1}, {"two, \"quoted\" \\", 2}};
std::mutex storeMutex;
const CMPIBroker* broker;

Text nameSpaceOf(Path path) { return CMGetCharPtr(CMGetNameSpace(path, nullptr)); }
Text keyOf(Path path) {
    CMPIStatus rc;
    const CMPIData key = CMGetKey(path, "Name", &rc);
    return rc.rc == CMPI_RC_OK && key.type == CMPI_string ? CMGetCharPtr(key.value.string) : "";
}

CMPIStatus status(CMPIrc rc, Text text = nullptr) {
    if (!text) {
        CMReturn(rc);
    }
    CMReturnWithChars(broker, rc, text);
}
CMPIStatus done(Result result) {
    CMReturnDone(result);
    CMReturn(CMPI_RC_OK);
}

std::vector<Thing>::iterator findThing(Path path) {
    return std::find_if(things.begin(), things.end(),
                        [key = keyOf(path)](const Thing& thing) { return thing.name == key; });
}
CMPIObjectPath* newPath(Path like, Text className) {
    return CMNewObjectPath(broker, nameSpaceOf(like), className, nullptr);
}
CMPIObjectPath* thingPath(Path like, const Thing& thing) {
    CMPIObjectPath* path = newPath(like, "Fix_Thing");
    CMAddKey(path, "Name", thing.name.c_str(), CMPI_chars);
    return path;
}
CMPIInstance* thingInstance(Path like, const Thing& thing, Text* properties) {
    CMPIInstance* inst = CMNewInstance(broker, thingPath(like, thing), nullptr);
    Text keys[] = {"Name", nullptr};
    if (!inst) {
        return nullptr;
    }
    if (properties) {
        CMSetPropertyFilter(inst, properties, keys);
    }
    CMSetProperty(inst, "Size", &thing.size, CMPI_uint32);
    CMPIArray* tags = CMNewArray(broker, 2, CMPI_chars, nullptr);
    CMSetArrayElementAt(tags, 0, "first", CMPI_chars);
    CMSetProperty(inst, "Tags", &tags, CMPI_stringA);
    return inst;
}
void takeSize(Thing& thing, const CMPIInstance* inst) {
    CMPIStatus rc;
    const CMPIData size = CMGetProperty(inst, "Size", &rc);
    if (rc.rc == CMPI_RC_OK && !CMIsNullValue(size)) {
        thing.size = size.value.uint32;
    }
}

/// A cleanup that does nothing, for all kinds but that of instances.
constexpr auto ends = [](auto...) { return status(CMPI_RC_OK); };

// -- instances ------------------------------------------------------------------------------------

CMPIStatus enumerate(Result result, Path path, bool names, Text* properties) {
    std::printf("fixture: a line for standard output\n");
    const std::lock_guard<std::mutex> lock(storeMutex);
    for (const Thing& thing : things) {
        if (names) {
            CMReturnObjectPath(result, thingPath(path, thing));
        } else {
            CMReturnInstance(result, thingInstance(path, thing, properties));
        }
    }
    return done(result);
}
CMPIStatus change(Path path, const CMPIInstance* inst) {
    const std::lock_guard<std::mutex> lock(storeMutex);
    const auto thing = findThing(path);
    if (thing == things.end()) {
        return status(CMPI_RC_ERR_NOT_FOUND, "no such thing");
    }
    if (inst) {
        takeSize(*thing, inst);
    } else {
        things.erase(thing);
    }
    return status(CMPI_RC_OK);
}

constexpr auto FixtureCleanup = [](CMPIInstanceMI* mi, Context, CMPIBoolean ending) {
    // The Stayer goes when there is no other way.
    return status(mi->hdl && !ending ? CMPI_RC_DO_NOT_UNLOAD : CMPI_RC_OK);
};
constexpr auto FixtureEnumInstanceNames = [](auto, Context, Result result, Path path) {
    return enumerate(result, path, true, nullptr);
};
constexpr auto FixtureEnumInstances = [](auto, Context, Result result, Path path, Text* names) {
    return enumerate(result, path, false, names);
};
constexpr auto FixtureGetInstance = [](auto, Context, Result result, Path path, Text* names) {
    const std::lock_guard<std::mutex> lock(storeMutex);
    const auto thing = findThing(path);
    if (thing == things.end()) {
        return status(CMPI_RC_ERR_NOT_FOUND, "no such thing");
    }
    CMReturnInstance(result, thingInstance(path, *thing, names));
    return done(result);
};
constexpr auto FixtureCreateInstance = [](auto, Context, Result result, Path path, auto inst) {
    const std::lock_guard<std::mutex> lock(storeMutex);
    if (findThing(path) != things.end()) {
        return status(CMPI_RC_ERR_ALREADY_EXISTS, "such a thing is there");
    }
    things.push_back({keyOf(path), 0});
    takeSize(things.back(), inst);
    CMReturnObjectPath(result, path);
    return done(result);
};
constexpr auto FixtureModifyInstance = [](auto, Context, Result, Path path, auto inst, Text*) {
    return change(path, inst);
};
constexpr auto FixtureDeleteInstance = [](auto, Context, Result, Path path) {
    return change(path, nullptr);
};
constexpr auto FixtureExecQuery = [](auto...) { return status(CMPI_RC_ERR_NOT_SUPPORTED); };

// -- associations: every thing is linked with every other one; fetched by upcalls -----------------

enum { Paths = 1, Links = 2 };

CMPIInstance* linkInstance(Path from, CMPIObjectPath* to) {
    CMPIObjectPath* path = newPath(from, "Fix_Link");
    CMAddKey(path, "Antecedent", &from, CMPI_ref);
    CMAddKey(path, "Dependent", &to, CMPI_ref);
    return CMNewInstance(broker, path, nullptr);
}
CMPIStatus related(Context ctx, Result result, Path from, Text role, int what,
                   Text* properties = nullptr) {
    CMPIStatus rc;
    if (role && std::strcmp(role, "Dependent") == 0) {
        return status(CMPI_RC_OK);
    }
    CMPIEnumeration* all =
        CBEnumInstances(broker, ctx, newPath(from, "Fix_Thing"), properties, &rc);
    if (!all) {
        return rc;
    }
    while (CMHasNext(all, nullptr)) {
        CMPIInstance* inst = CMGetNext(all, nullptr).value.inst;
        CMPIObjectPath* path = CMGetObjectPath(inst, nullptr);
        if (std::strcmp(keyOf(path), keyOf(from)) == 0) {
            continue;
        }
        if (what & Links) {
            inst = linkInstance(from, path);
        }
        if (what & Paths) {
            CMReturnObjectPath(result, CMGetObjectPath(inst, nullptr));
        } else {
            CMReturnInstance(result, inst);
        }
    }
    return done(result);
}
constexpr auto FixtureAssociators = [](auto, Context ctx, Result result, Path path, Text, Text,
                                       Text role, Text, Text* names) {
    return related(ctx, result, path, role, 0, names);
};
constexpr auto FixtureAssociatorNames = [](auto, Context ctx, Result result, Path path, Text, Text,
                                           Text role, Text) {
    return related(ctx, result, path, role, Paths);
};
constexpr auto FixtureReferences = [](auto, Context ctx, Result result, Path path, Text, Text role,
                                      Text*) { return related(ctx, result, path, role, Links); };
constexpr auto FixtureReferenceNames = [](auto, Context ctx, Result result, Path path, Text,
                                          Text role) {
    return related(ctx, result, path, role, Links | Paths);
};

// -- methods --------------------------------------------------------------------------------------

void give(CMPIArgs* out, const CMPIString* name, CMPIData data) {
    CMAddArg(out, CMGetCharPtr(name), CMIsNullValue(data) ? nullptr : &data.value, data.type);
}
CMPIStatus fire(Context ctx, Path path, const CMPIArgs* in) {
    const CMPIData severity = CMGetArg(in, "Severity", nullptr);
    CMPIInstance* event = CMNewInstance(broker, newPath(path, "Fix_Event"), nullptr);
    CMSetProperty(event, "Severity", &severity.value, severity.type);
    return CBDeliverIndication(broker, ctx, nameSpaceOf(path), event);
}
constexpr auto FixtureInvokeMethod = [](auto, Context ctx, Result result, Path path, Text name,
                                        const CMPIArgs* in, CMPIArgs* out) {
    const std::string method = name;
    CMPIString* each = nullptr;
    CMPIUint32 answer = CMGetArgCount(in, nullptr);
    if (method == "Echo") {
        for (CMPICount i = 0; i < answer; ++i) {
            const CMPIData data = CMGetArgAt(in, i, &each, nullptr);
            give(out, each, data);
        }
    } else if (method == "Context") {
        for (CMPICount i = 0; i < CMGetContextEntryCount(ctx, nullptr); ++i) {
            const CMPIData data = CMGetContextEntryAt(ctx, i, &each, nullptr);
            give(out, each, data);
        }
    } else if (method == "Relay") {  // Echo, by way of the broker
        answer = CBInvokeMethod(broker, ctx, path, "Echo", in, out, nullptr).value.uint32;
    } else if (method == "Fire") {
        const CMPIStatus rc = fire(ctx, path, in);
        if (rc.rc != CMPI_RC_OK) {
            return rc;
        }
    } else if (method == "Keep") {  // a clone that nobody releases
        CMClone(path, nullptr);
    } else {
        return status(CMPI_RC_ERR_METHOD_NOT_FOUND, name);
    }
    CMReturnData(result, &answer, CMPI_uint32);
    return done(result);
};

// -- properties -----------------------------------------------------------------------------------

constexpr auto FixtureSetProperty = [](auto, Context, Result, Path path, Text name,
                                       const CMPIData data) {
    CMPIInstance* inst = CMNewInstance(broker, path, nullptr);
    const CMPIStatus rc = CMSetProperty(inst, name, &data.value, data.type);
    return rc.rc != CMPI_RC_OK ? rc : change(path, inst);
};
constexpr auto FixtureGetProperty = [](auto, Context, Result result, Path path, Text name) {
    const auto thing = findThing(path);
    if (std::strcmp(name, "Size") != 0) {
        return status(CMPI_RC_ERR_NO_SUCH_PROPERTY, name);
    }
    if (thing == things.end()) {
        return status(CMPI_RC_ERR_NOT_FOUND, "no such thing");
    }
    CMReturnData(result, &thing->size, CMPI_uint32);
    return done(result);
};

// -- indications: what happens to filters is written to the log -----------------------------------

CMPIStatus note(const std::string& what, Text className = "", bool isEdge = true) {
    const std::string text = what + " " + className + (isEdge ? " edge" : " inner");
    CMTraceMessage(broker, CMPI_LEV_INFO, "Fixture", text.c_str(), nullptr);
    return status(CMPI_RC_OK);
}
constexpr auto FixtureAuthorizeFilter = [](auto, Context, auto, Text, Path, Text owner) {
    return status(std::strcmp(owner, "eve") == 0 ? CMPI_RC_ERR_ACCESS_DENIED : CMPI_RC_OK, owner);
};
constexpr auto FixtureMustPoll = [](auto...) { return status(CMPI_RC_ERR_NOT_SUPPORTED, "never"); };
constexpr auto FixtureActivateFilter = [](auto, Context, auto, Text className, Path,
                                          CMPIBoolean first) {
    return note("activate", className, first);
};
constexpr auto FixtureDeActivateFilter = [](auto, Context, auto, Text className, Path,
                                            CMPIBoolean last) {
    return note("deactivate", className, last);
};
constexpr auto FixtureEnableIndications = [](auto...) { return note("enable"); };
constexpr auto FixtureDisableIndications = [](auto...) { return note("disable"); };

// -- factories ------------------------------------------------------------------------------------

constexpr auto FixtureAssociationCleanup = ends, FixtureMethodCleanup = ends,
               FixturePropertyCleanup = ends, FixtureIndicationCleanup = ends;

}  // namespace

// clang-format off
CMInstanceMIStub(Fixture, Fixture, broker, CMNoHook)
CMAssociationMIStub(Fixture, Fixture, broker, CMNoHook)
CMMethodMIStub(Fixture, Fixture, broker, CMNoHook)
CMPropertyMIStub(Fixture, Fixture, broker, CMNoHook)
CMIndicationMIStub(Fixture, Fixture, broker, CMNoHook)
    // clang-format on

    CMPI_EXTERN_C CMPIInstanceMI* Refuser_Create_InstanceMI(const CMPIBroker* mb, Context,
                                                            CMPIStatus* rc) {
    CMSetStatusWithChars(mb, rc, CMPI_RC_ERR_ACCESS_DENIED, "not today");
    return nullptr;
}

/// The same things under another name, by the generic factory.
CMPI_EXTERN_C CMPIInstanceMI* _Generic_Create_InstanceMI(const CMPIBroker* mb, Context ctx,
                                                         Text name, CMPIStatus* rc) {
    static CMPIInstanceMI stayer;
    if (std::strcmp(name, "Stayer") != 0) {
        return nullptr;
    }
    stayer = *Fixture_Create_InstanceMI(mb, ctx, rc);
    stayer.hdl = &stayer;
    return &stayer;
}

/// Watches the calls of the management library, which it passes on: each of its functions stands
/// here under the library's name, and a program's own functions go before those of libraries. For
/// one source of a test program.
#pragma once

#include <dlfcn.h>

#include <string>
#include <vector>

#include "libapi.h"

/// The operations that take no key, and those that take one; getLparProfile takes a name besides.
// clang-format off
#define LIBRARY_OPERATIONS(ALL, KEYED) \
    ALL(getAllCecs) ALL(getAllLpars) ALL(getAllLparProfiles) ALL(getAllLparVirtualSerial) \
    ALL(getAllLparVirtualScsi) ALL(getAllLparVirtualEthernet) ALL(getAllIoSlots) \
    ALL(getAllCecMemoryCfg) ALL(getAllCecProcessorCfg) ALL(getAllCecMemoryPoolCfgs) \
    ALL(getAllCecProcessorPoolCfg) ALL(getAllLparMemoryCfgs) ALL(getAllLparProcessorCfgs) \
    KEYED(getCecObj) KEYED(getLparObj) KEYED(getAllLparsFromCec) \
    KEYED(getAllLparProfilesFromLpar) KEYED(getAllLparProfilesFromCec) \
    KEYED(getLparVirtualSerial) KEYED(getLparVirtualScsi) KEYED(getLparVirtualEthernet) \
    KEYED(getLparIoSlots) KEYED(getVirtualSerial) KEYED(getVirtualScsi) KEYED(getVirtualEthernet) \
    KEYED(getIoSlots) KEYED(getCecMemoryCfg) KEYED(getCecProcessorCfg) KEYED(getCecMemoryPoolCfg) \
    KEYED(getCecProcessorPoolCfg) KEYED(getLparMemoryCfg) KEYED(getLparProcessorCfg) \
    KEYED(getAllLparMemoryCfg) KEYED(getAllLparProcessorCfg)
// clang-format on

/// The last call, as "getCecObj(user,key,1)", what it gave, the results not given back yet, the
/// names of all calls, and what they give in place of the library's answers, if anything.
struct LibrarySpy {
    std::string call;
    std::vector<std::string> names;
    apiProp* result = nullptr;
    int held = 0;
    apiProp* answer = nullptr;
};
inline LibrarySpy librarySpy;

template <class Function>
Function* libraryFunction(const char* name) {
    return reinterpret_cast<Function*>(dlsym(RTLD_NEXT, name));
}

inline std::string textOf(const char* text) { return text; }
inline std::string textOf(int number) { return std::to_string(number); }

template <class... Arguments>
apiProp* watchedCall(const char* name, Arguments... arguments) {
    librarySpy.names.emplace_back(name);
    librarySpy.call = name;
    const char* separator = "(";
    ((librarySpy.call += separator + textOf(arguments), separator = ","), ...);
    librarySpy.call += ')';
    librarySpy.result = librarySpy.answer != nullptr
                            ? librarySpy.answer
                            : libraryFunction<apiProp*(Arguments...)>(name)(arguments...);
    librarySpy.held += librarySpy.result != nullptr;
    return librarySpy.result;
}

extern "C" {
#define WATCH_ALL(NAME) \
    apiProp* NAME(const char* user, int level) { return watchedCall(#NAME, user, level); }
#define WATCH_KEYED(NAME)                                         \
    apiProp* NAME(const char* user, const char* key, int level) { \
        return watchedCall(#NAME, user, key, level);              \
    }
LIBRARY_OPERATIONS(WATCH_ALL, WATCH_KEYED)

apiProp* getLparProfile(const char* user, const char* key, const char* profile, int level) {
    return watchedCall("getLparProfile", user, key, profile, level);
}

void freeApi(apiProp* result) {
    librarySpy.held -= result != nullptr;
    if (result != librarySpy.answer) {
        libraryFunction<void(apiProp*)>("freeApi")(result);
    }
}
}

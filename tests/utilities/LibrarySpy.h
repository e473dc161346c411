/// Watches the calls of the management library, which it passes on: each of its functions stands
/// here under the library's name, and a program's own functions go before those of libraries.
/// Answers may be made by hand. For one source of a test program.
#pragma once

#include <dlfcn.h>

#include <memory>
#include <sstream>
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

/// Fills a record from "name=value" with ";" between them.
inline void fillRecord(apiProp& record, const std::string& properties) {
    std::istringstream all(properties);
    for (std::string one; std::getline(all, one, ';');) {
        const size_t equals = one.find('=');
        one.copy(record.name[record.propertyCount], equals);
        one.copy(record.value[record.propertyCount++], one.size(), equals + 1);
    }
}

/// A record of its own.
inline std::unique_ptr<apiProp> object(const std::string& properties) {
    auto record = std::make_unique<apiProp>();
    fillRecord(*record, properties);
    return record;
}

/// Lets all calls answer with these objects until the end of the scope.
class LibraryAnswer {
public:
    explicit LibraryAnswer(const std::vector<std::string>& objects)
        : m_records(new apiProp[objects.size() + 1]()) {
        m_records[0].objCount = static_cast<int>(objects.size()) + 1;
        for (size_t i = 0; i < objects.size(); ++i) {
            fillRecord(m_records[i + 1], objects[i]);
        }
        librarySpy.answer = m_records.get();
    }
    ~LibraryAnswer() { librarySpy.answer = nullptr; }
    LibraryAnswer(const LibraryAnswer&) = delete;
    LibraryAnswer& operator=(const LibraryAnswer&) = delete;

private:
    std::unique_ptr<apiProp[]> m_records;
};

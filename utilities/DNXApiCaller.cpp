#include "DNXApiCaller.h"

#include "Exception.h"
#include "TraceTool.h"

namespace {

struct ErrorRow {
    int code;
    const char* name;
    const char* text;
};

constexpr ErrorRow kErrors[] = {
    {-1, "DNX_API_FAILED",
     "The return code -1 indicates that the required DNX API operation can not be finished "
     "correctly."},
    {0, "DNX_API_SUCCESS",
     "The return code 0 always indicates that the required operation has been executed "
     "successfully."},
    {1, "DNX_API_INVALID_INPUT",
     "One or more of the input parameter is invalid, e.g. Null MTMS, etc."},
    {2, "DNX_API_INVALID_STATE",
     "The target is in invalid state for the operation. An example of this is if the "
     "VirtualSystem is activated while it is already in \"Active\" state already."},
    {3, "DNX_API_UNKNOWN_SYTEM",  // the spelling that clients know
     "The given CEC, lpar, or frame is not recognized by the DNX. Either the system name is "
     "invalid or it is not managed by the DNX."},
    {4, "DNX_API_INVALID_BKN",
     "Operations that require BKN connection in order to talk with the lpars (e.g. OSShutdown, "
     "dlpar operation, etc.) could receive this type of exception if there is no BKN connection "
     "to the lpar. A major cause of this type of exception is bad network set up."},
    {5, "DNX_API_NOT_SUPPORTED",
     "The operation is not supported by the DNX API on the CEC, lpar, or OS."},
    {6, "DNX_API_ACCESS_DENIED", "The user has no permission to execute the required functions."},
    {7, "DNX_API_NOT_FOUND", "There is not any object has been found for the requested query."},
};

constexpr ErrorRow kUndefined = {0, "DNX_API_UNKNOWN", "Undefined error."};

const ErrorRow& errorOf(int code) {
    for (const ErrorRow& row : kErrors) {
        if (row.code == code) {
            return row;
        }
    }
    return kUndefined;
}

constexpr int kFailed = -1;
constexpr int kAccessDenied = 6;
constexpr int kNotFound = 7;

/// The appliance's own header may declare texts that are only read as char*; this fits both.
char* argument(const char* text) { return const_cast<char*>(text); }
int argument(int number) { return number; }

template <class Operation, class... Arguments>
apiProp* timed(apiProp*& last, const char* name, Operation operation, Arguments... arguments) {
    CTimeLoger* timing = CTimeLogerManager::getInstance()->getLogger("zemApiCaller");
    timing->begin(name);
    last = operation(argument(arguments)...);
    timing->end(name);
    return last;
}

[[noreturn]] void throwNoResult(const zemApiReader& reader) {
    zemString text;
    text.format("Internal Error:API(\"%s\") calling failed", reader.operation);
    throw zemOperationFailedException(reader.throwClass, reader.throwMethod, reader.nullId, text);
}

[[noreturn]] void throwCode(const zemApiReader& reader, int code) {
    const ErrorRow& error = errorOf(code);
    if (code == kAccessDenied) {
        throw zemAccessDeniedException(reader.throwClass, reader.throwMethod, error.name,
                                       error.text);
    }
    if (code == kNotFound) {
        throw zemObjectNotFoundException(reader.throwClass, reader.throwMethod, reader.operation,
                                         error.name, error.text);
    }
    throw zemOperationFailedException(reader.throwClass, reader.throwMethod, error.name,
                                      error.text);
}

}  // namespace

const char* errorCodeToString(int error) { return errorOf(error).name; }

const char* getErrorString(int error) { return errorOf(error).text; }

// The operations, by their arguments.
#define ALL(NAME)                                              \
    apiProp* zemApiCaller::NAME(const char* user, int level) { \
        return timed(m_prop, #NAME, ::NAME, user, level);      \
    }
#define KEYED(NAME)                                                             \
    apiProp* zemApiCaller::NAME(const char* user, const char* key, int level) { \
        return timed(m_prop, #NAME, ::NAME, user, key, level);                  \
    }

// clang-format off
ALL(getAllCecs)
ALL(getAllLpars)
ALL(getAllLparProfiles)
ALL(getAllLparVirtualSerial)
ALL(getAllLparVirtualScsi)
ALL(getAllLparVirtualEthernet)
ALL(getAllIoSlots)
ALL(getAllCecMemoryCfg)
ALL(getAllCecProcessorCfg)
ALL(getAllCecMemoryPoolCfgs)
ALL(getAllCecProcessorPoolCfg)
ALL(getAllLparMemoryCfgs)
ALL(getAllLparProcessorCfgs)

KEYED(getCecObj)
KEYED(getLparObj)
KEYED(getAllLparsFromCec)
KEYED(getAllLparProfilesFromLpar)
KEYED(getAllLparProfilesFromCec)
KEYED(getLparVirtualSerial)
KEYED(getLparVirtualScsi)
KEYED(getLparVirtualEthernet)
KEYED(getLparIoSlots)
KEYED(getVirtualSerial)
KEYED(getVirtualScsi)
KEYED(getVirtualEthernet)
KEYED(getIoSlots)
KEYED(getCecMemoryCfg)
KEYED(getCecProcessorCfg)
KEYED(getCecMemoryPoolCfg)
KEYED(getCecProcessorPoolCfg)
KEYED(getLparMemoryCfg)
KEYED(getLparProcessorCfg)
KEYED(getAllLparMemoryCfg)
KEYED(getAllLparProcessorCfg)
// clang-format on

#undef ALL
#undef KEYED

apiProp* zemApiCaller::getLparProfile(const char* user, const char* lparKey, const char* profile,
                                      int level) {
    return timed(m_prop, "getLparProfile", ::getLparProfile, user, lparKey, profile, level);
}

apiProp* zemApiCaller::getWRTConsole(const char*, int) { return m_prop = nullptr; }

apiProp* zemApiCaller::getAllLparIoSlots(const char*, int) { return m_prop = nullptr; }

apiProp* zemApiCaller::getServiceableEvents(const char*, int, const char*, const char*, const char*,
                                            int) {
    return m_prop = nullptr;
}

void zemApiCaller::freeApi() {
    freeApi(m_prop);
    m_prop = nullptr;
}

int zemApiCaller::getReturnCode(void* result) {
    return result == nullptr ? kFailed : ::getReturnCode(static_cast<apiProp*>(result));
}

char* zemApiCaller::getProperty(void* record, const char* key) {
    if (record == nullptr || key == nullptr) {
        return nullptr;
    }
    return ::getProperty(static_cast<apiProp*>(record), argument(key));
}

void zemApiCaller::freeApi(void* result) {
    if (result != nullptr) {
        ::freeApi(static_cast<apiProp*>(result));
    }
}

void zemApiProp::freeApi() {
    zemApiCaller::freeApi(m_prop);
    m_prop = nullptr;
}

zemApiObjects::zemApiObjects(const zemApiReader& reader, apiProp* result)
    : m_reader(reader), m_result(result) {
    if (result == nullptr && reader.nullId != nullptr) {
        throwNoResult(reader);
    }
    const int code = zemApiCaller::getReturnCode(result);
    if (code == kNotFound && reader.notFoundIsEmpty) {
        return;
    }
    if (code != 0) {
        throwCode(reader, code);
    }
    if (result->objCount > 1) {
        m_size = static_cast<std::size_t>(result->objCount) - 1;
    }
}

apiProp& zemApiObjects::only(const char* key) const {
    if (m_size == 0) {
        throw zemObjectNotFoundException(m_reader.throwClass, m_reader.throwMethod, key);
    }
    return *begin();
}

/// Reading through the appliance's management library (libapi.h): its operations with timing, its
/// results as objects, and its return codes as failures.
///
/// A reader is a call and a loop. zemApiObjects owns the result and turns what is not objects (no
/// result, a return code) into the failure that callers expect; zemApiProp reads one object:
///
///     const zemApiReader reader = {"zemHostSystem", "getAllHostSystem", "getAllCecs"};
///     for (apiProp& host : zemApiObjects(reader, zemApiCaller().getAllCecs(user, 1))) {
///         puts(zemApiProp(&host).getProperty("UserDefinedName"));
///     }
///
/// Results are large: hold them for as long as they are read, and never copy a record.
///
/// Thread-safety: the library may be called from any thread; an object here, and a result, belong
/// to one thread.
#ifndef DNX_API_CALLER_H
#define DNX_API_CALLER_H

#include <cstddef>
#include <functional>

#include "AutoRelease.h"
#include "StringUtils.h"
#include "ZemExport.h"
#include "libapi.h"

/// The name of a return code, and its words for a human; "DNX_API_UNKNOWN" and "Undefined error."
/// for a code that the library does not define.
ZEM_EXPORT const char* errorCodeToString(int error);
ZEM_EXPORT const char* getErrorString(int error);

/// The operations of the management library, each timed under its name by the logger
/// "zemApiCaller". The arguments are those of libapi.h.
///
/// Each returns the library's result, which the caller frees, and keeps it as the last result; the
/// object itself frees nothing unless it is told to.
class ZEM_EXPORT zemApiCaller {
public:
    explicit zemApiCaller(apiProp* prop = nullptr) : m_prop(prop) {}

    apiProp* getCecObj(const char* user, const char* mtms, int level);
    apiProp* getAllCecs(const char* user, int level);
    apiProp* getLparObj(const char* user, const char* lparKey, int level);
    apiProp* getAllLpars(const char* user, int level);
    apiProp* getAllLparsFromCec(const char* user, const char* mtms, int level);

    apiProp* getLparProfile(const char* user, const char* lparKey, const char* profile, int level);
    apiProp* getAllLparProfilesFromLpar(const char* user, const char* lparKey, int level);
    apiProp* getAllLparProfilesFromCec(const char* user, const char* mtms, int level);
    apiProp* getAllLparProfiles(const char* user, int level);

    apiProp* getLparVirtualSerial(const char* user, const char* lparKey, int level);
    apiProp* getLparVirtualScsi(const char* user, const char* lparKey, int level);
    apiProp* getLparVirtualEthernet(const char* user, const char* lparKey, int level);
    apiProp* getLparIoSlots(const char* user, const char* lparKey, int level);
    apiProp* getVirtualSerial(const char* user, const char* mtms, int level);
    apiProp* getVirtualScsi(const char* user, const char* mtms, int level);
    apiProp* getVirtualEthernet(const char* user, const char* mtms, int level);
    apiProp* getIoSlots(const char* user, const char* mtms, int level);
    apiProp* getAllLparVirtualSerial(const char* user, int level);
    apiProp* getAllLparVirtualScsi(const char* user, int level);
    apiProp* getAllLparVirtualEthernet(const char* user, int level);
    apiProp* getAllIoSlots(const char* user, int level);

    apiProp* getCecMemoryCfg(const char* user, const char* mtms, int level);
    apiProp* getCecProcessorCfg(const char* user, const char* mtms, int level);
    apiProp* getCecMemoryPoolCfg(const char* user, const char* mtms, int level);
    apiProp* getCecProcessorPoolCfg(const char* user, const char* mtms, int level);
    apiProp* getAllCecMemoryCfg(const char* user, int level);
    apiProp* getAllCecProcessorCfg(const char* user, int level);
    apiProp* getAllCecMemoryPoolCfgs(const char* user, int level);
    apiProp* getAllCecProcessorPoolCfg(const char* user, int level);

    apiProp* getLparMemoryCfg(const char* user, const char* lparKey, int level);
    apiProp* getLparProcessorCfg(const char* user, const char* lparKey, int level);
    apiProp* getAllLparMemoryCfg(const char* user, const char* mtms, int level);
    apiProp* getAllLparProcessorCfg(const char* user, const char* mtms, int level);
    apiProp* getAllLparMemoryCfgs(const char* user, int level);
    apiProp* getAllLparProcessorCfgs(const char* user, int level);

    /// The library has no such operations: each returns null, as for an internal failure.
    apiProp* getWRTConsole(const char* user, int level);
    apiProp* getAllLparIoSlots(const char* user, int level);
    apiProp* getServiceableEvents(const char* user, int number, const char* a, const char* b,
                                  const char* c, int level);

    /// Of the last result: its return code, -1 when there is none; a value of its header, or null.
    int getReturnCode() const { return getReturnCode(m_prop); }
    char* getProperty(const char* key) const { return getProperty(m_prop, key); }

    /// Frees the last result and forgets it.
    void freeApi();

    /// The same for any result or record.
    static int getReturnCode(void* result);
    static char* getProperty(void* record, const char* key);
    static void freeApi(void* result);

private:
    apiProp* m_prop;
};

/// A view of one record, which it does not own.
class ZEM_EXPORT zemApiProp {
public:
    explicit zemApiProp(apiProp* prop = nullptr) : m_prop(prop) {}

    int getReturnCode() const { return zemApiCaller::getReturnCode(m_prop); }

    /// The value under @p key; empty when there is no record or no such key.
    zemString getProperty(const char* key) const { return getProperty(m_prop, key); }

    /// The library's own call: null when there is no such key.
    static char* getProperty(void* record, const char* key) {
        return zemApiCaller::getProperty(record, key);
    }

    /// Frees the result whose header this is, and forgets it.
    void freeApi();

private:
    apiProp* m_prop;
};

struct ZEM_EXPORT zemApiPropFree {
    void operator()(apiProp* result) const { zemApiCaller::freeApi(result); }
};

/// Owns a result.
using zemAutoReleaseApiProp = zemAutoRelease<apiProp, zemApiPropFree>;

/// Who reads, for the failures that reading raises, and where readers differ.
struct zemApiReader {
    const char* throwClass;
    const char* throwMethod;
    const char* operation;

    /// Id of the failure when there is no result, with the text "Internal Error:API(...) calling
    /// failed"; null: that counts as return code -1.
    const char* nullId = "-1";

    /// Return code 7: no object, in place of a failure.
    bool notFoundIsEmpty = false;
};

/// The objects of a result, which it owns: the one place where a result becomes objects or a
/// failure.
class ZEM_EXPORT zemApiObjects {
public:
    /// @throws zemAccessDeniedException code 6
    /// @throws zemObjectNotFoundException code 7, with the operation as access method
    /// @throws zemOperationFailedException any other code but 0, and no result
    zemApiObjects(const zemApiReader& reader, apiProp* result);

    std::size_t size() const { return m_size; }
    apiProp* begin() const { return m_size == 0 ? nullptr : m_result.get() + 1; }
    apiProp* end() const { return m_size == 0 ? nullptr : begin() + m_size; }

    /// The first object, for readers of the one object that @p key names.
    /// @throws zemObjectNotFoundException there is none; the text is @p key
    apiProp& only(const char* key) const;

    /// Gives the result, with its objects, up to the caller.
    apiProp* release() {
        m_size = 0;
        return m_result.release();
    }

private:
    zemApiReader m_reader;
    zemAutoReleaseApiProp m_result;
    std::size_t m_size = 0;
};

/// One row of a reader's table: the value of a key, and the setter that takes it, an operation of
/// the record or a function of the record and the value.
template <class Setter>
struct zemApiField {
    const char* key;
    Setter set;
};

/// Hands the value of each key to its setter of @p record, in the table's order; absent keys give
/// empty texts.
template <class Record, class Setter, std::size_t N>
void zemReadApiFields(apiProp* object, Record& record, const zemApiField<Setter> (&fields)[N]) {
    for (const zemApiField<Setter>& field : fields) {
        std::invoke(field.set, record, zemApiProp(object).getProperty(field.key));
    }
}

#endif

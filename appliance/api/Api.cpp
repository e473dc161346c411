// The operations of the management library.

#include <algorithm>
#include <cstring>
#include <optional>
#include <stdexcept>
#include <vector>

#include "Failure.h"
#include "Family.h"
#include "Faults.h"
#include "Operations.h"
#include "Result.h"
#include "Text.h"
#include "libapi.h"

namespace {

using namespace appliance;

/// Ends a call with a return code in place of objects.
struct Refusal {
    int code;
};

/// Whose objects an operation gives.
enum class Of { All, Host, Lpar, Name };

/// What an operation was called with, as it came.
struct Call {
    const char* operation;
    const Family& family;
    const char* user;
    int level;
    Of of;
    const char* key = nullptr;  ///< of a host or a partition
    const char* name = nullptr;
};

/// Whose objects are asked for: of all hosts, of one host, of one of its partitions.
struct Scope {
    std::string mtms;
    std::optional<std::int64_t> lpar;
    std::optional<std::string> name;
};

std::string argument(const char* text) {
    if (text == nullptr || *text == '\0') {
        throw Refusal{API_INVALID_INPUT};
    }
    return text;
}

Scope scopeOf(const Call& call) {
    if (call.of == Of::All) {
        return {};
    }
    const std::string key = argument(call.key);
    if (call.of == Of::Host) {
        return {key, {}, {}};
    }
    const std::size_t star = key.find('*');
    std::int64_t id = 0;
    if (star == std::string::npos || !wholeNumber(key.substr(0, star), &id)) {
        throw Refusal{API_INVALID_INPUT};
    }
    Scope scope{argument(key.c_str() + star + 1), id, {}};
    if (call.of == Of::Name) {
        scope.name = argument(call.name);
    }
    return scope;
}

std::vector<Row> rowsOf(const Hosts& hosts, Kind kind, const Scope& scope) {
    std::vector<Row> rows;
    bool isKnown = scope.mtms.empty();
    for (const auto& host : hosts) {
        if (!scope.mtms.empty() && host->mtms() != scope.mtms) {
            continue;
        }
        isKnown = true;
        if (scope.lpar && host->lpar(*scope.lpar) == nullptr) {
            throw Refusal{API_NOT_FOUND};
        }
        for (const Object& object : host->all(kind)) {
            if (scope.lpar && object.place().lpar != *scope.lpar) {
                continue;
            }
            if (!scope.name || object.get("name") == *scope.name) {
                rows.push_back(rowOf(*host, object));
            }
        }
    }
    if (!isKnown) {
        throw Refusal{API_UNKNOWN_SYSTEM};
    }
    if (scope.name && rows.empty()) {
        throw Refusal{API_NOT_FOUND};
    }
    return rows;
}

apiProp* read(const Call& call) {
    const Scope scope = scopeOf(call);
    if (call.level != 1 && call.level != 2) {
        throw Refusal{API_INVALID_INPUT};
    }
    Store store = Store::open(Database::Access::Read);
    const Transaction picture = store.read();
    const Hosts hosts = allHosts(store);
    const std::vector<Row> rows = rowsOf(hosts, call.family.kind, scope);
    Result result(rows.size());
    for (const Row& row : rows) {
        result.addObject(call.family.classType);
        for (const Property& property : call.family.properties) {
            if (property.level > call.level) {
                continue;
            }
            result.put(property.key, property.make(row, property.attribute));
        }
    }
    return result.release();
}

/// The whole of an operation: what was planned to go wrong does, nothing else leaves as exception.
apiProp* answer(const Call& call) noexcept {
    try {
        try {
            if (const auto fault = takeFault(call.operation)) {
                pause(*fault);
                if (fault->isNull) {
                    return nullptr;
                }
                if (fault->code) {
                    throw Refusal{*fault->code};
                }
            }
            if (call.user == nullptr) {
                throw Refusal{API_INVALID_INPUT};
            }
            return read(call);
        } catch (const Refusal& refusal) {
            return Result().release(refusal.code);
        } catch (const std::length_error&) {
            return Result().release(API_FAILED);
        } catch (const Failure& failure) {
            if (failure.fault() == Fault::StateBusy) {
                return Result().release(API_FAILED);
            }
            return nullptr;
        }
    } catch (const std::exception&) {
        return nullptr;
    }
}

}  // namespace

#define API extern "C" __attribute__((visibility("default")))

// One body for each shape of operation.
#define OPERATION_ALL(NAME, FAMILY)                           \
    API apiProp* NAME(const char* user, int level) {          \
        return answer({#NAME, FAMILY, user, level, Of::All}); \
    }
#define OPERATION_OF_HOST(NAME, FAMILY)                                \
    API apiProp* NAME(const char* user, const char* mtms, int level) { \
        return answer({#NAME, FAMILY, user, level, Of::Host, mtms});   \
    }
#define OPERATION_OF_LPAR(NAME, FAMILY)                                   \
    API apiProp* NAME(const char* user, const char* lparKey, int level) { \
        return answer({#NAME, FAMILY, user, level, Of::Lpar, lparKey});   \
    }
#define OPERATION_NAMED(NAME, FAMILY)                                                       \
    API apiProp* NAME(const char* user, const char* lparKey, const char* name, int level) { \
        return answer({#NAME, FAMILY, user, level, Of::Name, lparKey, name});               \
    }

API_OPERATIONS(OPERATION_ALL, OPERATION_OF_HOST, OPERATION_OF_LPAR, OPERATION_NAMED)

API char* getProperty(apiProp* record, const char* key) {
    if (record == nullptr || key == nullptr || *key == '\0') {
        return nullptr;
    }
    const int count = std::min<int>(record->propertyCount, API_MAX_PROPERTIES);
    // Readers mostly ask for the next key next, of one record after the other: the search begins
    // behind the entry that this thread found last.
    static thread_local int next = 0;
    const int first = next < count ? next : 0;
    for (int i = first, end = first + count; i < end; ++i) {
        const int at = i < count ? i : i - count;
        if (std::strncmp(record->name[at], key, API_TEXT_SIZE) != 0) {
            continue;
        }
        // Entries lie far apart: what a record fills comes into the cache while its caller works
        // on the value before.
        next = at + 1;
        if (next < count) {
            __builtin_prefetch(record->name[next]);
            __builtin_prefetch(record->value[next]);
        }
        return record->value[at];
    }
    return nullptr;
}

API int getReturnCode(apiProp* result) { return result == nullptr ? API_FAILED : result->rc; }

API void freeApi(apiProp* result) { Result::free(result); }

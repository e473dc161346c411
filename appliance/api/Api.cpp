// The operations of the management library.

#include <algorithm>
#include <cstring>
#include <memory>
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

/// Whose objects are asked for: of all hosts, of one host, of one of its partitions.
struct Scope {
    std::string mtms;
    std::optional<std::int64_t> lpar;
    const char* profile = nullptr;
};

std::string argument(const char* text) {
    if (text == nullptr || *text == '\0') throw Refusal{API_INVALID_INPUT};
    return text;
}

Scope allHostsScope() { return {}; }

Scope hostScope(const char* mtms) { return {argument(mtms), {}, nullptr}; }

Scope lparScope(const char* lparKey) {
    const std::string key = argument(lparKey);
    const std::size_t star = key.find('*');
    std::int64_t id = 0;
    if (star == std::string::npos || !wholeNumber(key.substr(0, star), &id)) {
        throw Refusal{API_INVALID_INPUT};
    }
    return {argument(key.c_str() + star + 1), id, nullptr};
}

Scope profileScope(const char* lparKey, const char* profile) {
    Scope scope = lparScope(lparKey);
    argument(profile);
    scope.profile = profile;
    return scope;
}

bool isIn(const Scope& scope, const Object& object) {
    return (!scope.lpar || object.place().lpar == *scope.lpar) &&
           (scope.profile == nullptr || object.get("name") == scope.profile);
}

std::vector<Row> rowsOf(const std::vector<std::unique_ptr<HostView>>& hosts, Kind kind,
                        const Scope& scope) {
    std::vector<Row> rows;
    bool isKnown = scope.mtms.empty();
    for (const auto& host : hosts) {
        if (!scope.mtms.empty() && host->mtms() != scope.mtms) continue;
        isKnown = true;
        if (scope.lpar && host->lpar(*scope.lpar) == nullptr) throw Refusal{API_NOT_FOUND};
        for (const Object& object : host->all(kind)) {
            if (isIn(scope, object)) rows.push_back(rowOf(*host, object));
        }
    }
    if (!isKnown) throw Refusal{API_UNKNOWN_SYSTEM};
    if (scope.profile != nullptr && rows.empty()) throw Refusal{API_NOT_FOUND};
    return rows;
}

apiProp* read(const Family& family, const Scope& scope, int level) {
    if (level != 1 && level != 2) throw Refusal{API_INVALID_INPUT};
    Store store = Store::open(Database::Access::Read);
    const Transaction picture = store.read();
    const auto hosts = allHosts(store);
    const std::vector<Row> rows = rowsOf(hosts, family.kind, scope);
    Result result(rows.size());
    for (const Row& row : rows) {
        result.addObject(family.classType);
        for (const Property& property : family) {
            if (property.level > level) continue;
            result.put(property.key, property.make(row, property.attribute));
        }
    }
    return result.release();
}

/// The whole of an operation: what was planned to go wrong does, nothing else leaves as exception.
template <typename MakeScope>
apiProp* answer(const char* operation, const Family& family, const char* user, MakeScope makeScope,
                int level) noexcept {
    try {
        try {
            if (const auto fault = takeFault(operation)) {
                pause(*fault);
                if (fault->isNull) return nullptr;
                if (fault->code) throw Refusal{*fault->code};
            }
            if (user == nullptr) throw Refusal{API_INVALID_INPUT};
            return read(family, makeScope(), level);
        } catch (const Refusal& refusal) {
            return Result().release(refusal.code);
        } catch (const std::length_error&) {
            return Result().release(API_FAILED);
        } catch (const Failure& failure) {
            if (failure.fault() == Fault::StateBusy) return Result().release(API_FAILED);
            return nullptr;
        }
    } catch (const std::exception&) {
        return nullptr;
    }
}

}  // namespace

#define API extern "C" __attribute__((visibility("default")))

// One body for each shape of operation.
#define OPERATION_ALL(NAME, FAMILY)                               \
    API apiProp* NAME(const char* user, int level) {              \
        return answer(#NAME, FAMILY, user, allHostsScope, level); \
    }
#define OPERATION_OF_HOST(NAME, FAMILY)                                   \
    API apiProp* NAME(const char* user, const char* mtms, int level) {    \
        return answer(                                                    \
            #NAME, FAMILY, user, [&] { return hostScope(mtms); }, level); \
    }
#define OPERATION_OF_LPAR(NAME, FAMILY)                                      \
    API apiProp* NAME(const char* user, const char* lparKey, int level) {    \
        return answer(                                                       \
            #NAME, FAMILY, user, [&] { return lparScope(lparKey); }, level); \
    }
#define OPERATION_NAMED(NAME, FAMILY)                                                          \
    API apiProp* NAME(const char* user, const char* lparKey, const char* profile, int level) { \
        return answer(                                                                         \
            #NAME, FAMILY, user, [&] { return profileScope(lparKey, profile); }, level);       \
    }

API_OPERATIONS(OPERATION_ALL, OPERATION_OF_HOST, OPERATION_OF_LPAR, OPERATION_NAMED)

API char* getProperty(apiProp* record, const char* key) {
    if (record == nullptr || key == nullptr || *key == '\0') return nullptr;
    const int count = std::min<int>(record->propertyCount, API_MAX_PROPERTIES);
    for (int i = 0; i < count; ++i) {
        if (std::strncmp(record->name[i], key, API_TEXT_SIZE) != 0) continue;
        // Entries lie far apart, and readers mostly ask for the next key next: what a record fills
        // comes into the cache while its caller works on the value before.
        if (i + 1 < count) {
            __builtin_prefetch(record->name[i + 1]);
            __builtin_prefetch(record->value[i + 1]);
        }
        return record->value[i];
    }
    return nullptr;
}

API int getReturnCode(apiProp* result) { return result == nullptr ? API_FAILED : result->rc; }

API void freeApi(apiProp* result) { Result::free(result); }

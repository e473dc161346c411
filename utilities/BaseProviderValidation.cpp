// Tests of keys, property lists and method arguments of zemBaseProvider.
#include <strings.h>

#include <algorithm>
#include <cmath>
#include <limits>
#include <numeric>
#include <type_traits>
#include <vector>

#include "BaseProvider.h"
#include "BaseProviderText.h"
#include "ServerCall.h"

namespace {

using Text = const char*;

struct Key {
    zemString name;
    CmpiData value;
};

// Read once: with some servers each access walks the path's keys from the start.
std::vector<Key> keysOf(const CmpiObjectPath& path) {
    std::vector<Key> keys;
    const unsigned count = path.getKeyCount();
    for (unsigned i = 0; i < count; ++i) {
        CmpiString name;
        const CmpiData value = path.getKey(static_cast<int>(i), &name);
        keys.push_back({zemTextOf(name), value});
    }
    return keys;
}

// The first name that another one repeats, ignoring case; null if each stands once. Lists come
// from clients and may be long, so they are sorted rather than compared pair by pair.
const char* firstRepeated(const std::vector<const char*>& names) {
    std::vector<size_t> order(names.size());
    std::iota(order.begin(), order.end(), size_t{0});
    std::sort(order.begin(), order.end(), [&names](size_t a, size_t b) {
        const int difference = strcasecmp(names[a], names[b]);
        return difference != 0 ? difference < 0 : a < b;
    });
    size_t first = names.size();
    for (size_t i = 1; i < order.size(); ++i) {
        if (strcasecmp(names[order[i - 1]], names[order[i]]) == 0) {
            first = std::min(first, order[i - 1]);
        }
    }
    return first < names.size() ? names[first] : nullptr;
}

// Integers wrap to the width asked for; a real that no integer of it holds cannot be converted.
template <class To, class From>
bool convert(From from, To& to) {
    if constexpr (std::is_floating_point_v<From> && std::is_integral_v<To>) {
        const double value = static_cast<double>(from);
        const double limit = std::ldexp(1.0, std::numeric_limits<To>::digits);
        const double low = std::is_signed_v<To> ? -limit : 0.0;
        if (!(value >= low && value < limit)) {
            return false;
        }
    }
    to = static_cast<To>(from);  // NOLINT(bugprone-signed-char-misuse): numbers, not characters
    return true;
}

// What @p use says of the number in @p data; false when there is none.
template <class Use>
bool withNumber(const CmpiData& data, Use use) {
    switch (data.getType()) {
        case CMPI_uint8:
            return use(data.getUint8());
        case CMPI_uint16:
            return use(data.getUint16());
        case CMPI_uint32:
            return use(data.getUint32());
        case CMPI_uint64:
            return use(data.getUint64());
        case CMPI_sint8:
            return use(data.getSint8());
        case CMPI_sint16:
            return use(data.getSint16());
        case CMPI_sint32:
            return use(data.getSint32());
        case CMPI_sint64:
            return use(data.getSint64());
        case CMPI_real32:
            return use(data.getReal32());
        case CMPI_real64:
            return use(data.getReal64());
        default:
            return false;
    }
}

bool equalNumbers(const CmpiData& value1, const CmpiData& value2) {
    return withNumber(value1, [&value2](auto number) {
        return withNumber(value2, [number](auto given) {
            auto converted = number;
            return convert(given, converted) && converted == number;
        });
    });
}

bool equalTexts(const CmpiData& value1, const CmpiData& value2, zemString& text1,
                zemString& text2) {
    const bool read1 = zemReadText(value1, text1);
    const bool read2 = zemReadText(value2, text2);
    return read1 && read2 && strcasecmp(text1, text2) == 0;
}

bool equalPaths(const CmpiData& value1, const CmpiData& value2, zemString& text1,
                zemString& text2) {
    if (value2.getType() != CMPI_ref) {
        return false;
    }
    const CmpiObjectPath path1 = value1.getObjectPath();
    const CmpiObjectPath path2 = value2.getObjectPath();
    text1 = zemPathText(path1);
    text2 = zemPathText(path2);
    if (path1.getKeyCount() != path2.getKeyCount() ||
        strcasecmp(zemTextOf(path1.getNameSpace()), zemTextOf(path2.getNameSpace())) != 0 ||
        strcasecmp(zemTextOf(path1.getClassName()), zemTextOf(path2.getClassName())) != 0) {
        return false;
    }
    for (const Key& key : keysOf(path1)) {
        const CmpiData other = zemBaseProvider::getKeyBinding(path2, key.name);
        zemString ignored1, ignored2;
        if (!zemBaseProvider::compareKeyValues(key.value, other, ignored1, ignored2)) {
            return false;
        }
    }
    return true;
}

bool equalValues(const CmpiData& value1, const CmpiData& value2, zemString& text1,
                 zemString& text2) {
    switch (value1.getType()) {
        case CMPI_string:
        case CMPI_chars:
            return equalTexts(value1, value2, text1, text2);
        case CMPI_dateTime:
            return value2.getType() == CMPI_dateTime &&
                   value1.getDateTime().getDateTime() == value2.getDateTime().getDateTime();
        case CMPI_ref:
            return equalPaths(value1, value2, text1, text2);
        default:
            return equalNumbers(value1, value2);
    }
}

}  // namespace

void zemBaseProvider::validateKeys(const CmpiObjectPath& copt, const CmpiObjectPath& cop,
                                   const char* callingMethod, CMPIBoolean checkKeyNameOnly) const {
    PROV_TRACE_LOCALS();
    PROV_TRACE_ENTER();
    const zemString className = zemClassOf(copt);
    const std::vector<Key> given = keysOf(copt);
    for (const Key& key : keysOf(cop)) {
        bool found = false;
        for (const Key& candidate : given) {
            if (strcasecmp(candidate.name, key.name) != 0) {
                continue;
            }
            if (found) {
                PROV_TRACE_EXIT();
                throwDuplicateKeyExc(callingMethod, className, key.name);
            }
            found = true;
            zemString value, expected;
            if (!checkKeyNameOnly &&
                !compareKeyValues(candidate.value, key.value, value, expected)) {
                PROV_TRACE_EXIT();
                throwKeyValueDoesntMatchExc(callingMethod, className, key.name, value, expected);
            }
        }
        if (!found) {
            PROV_TRACE_EXIT();
            throwKeyNotFoundExc(callingMethod, className, key.name);
        }
    }
    const CMPIObjectPath* raw = cop.getEnc();
    for (const Key& key : given) {
        CMPIStatus status = kZemServed;
        zemCallServer(raw->ft, &CMPIObjectPathFT::getKey, CMPIData(), raw, Text(key.name), &status);
        if (status.rc == CMPI_RC_ERR_NOT_FOUND) {
            PROV_TRACE_EXIT();
            throwInvalidKeyExc(callingMethod, className, key.name);
        }
    }
    PROV_TRACE_EXIT();
}

CMPIBoolean zemBaseProvider::compareKeyValues(const CmpiData& value1, const CmpiData& value2,
                                              zemString& valueString1, zemString& valueString2) {
    valueString1 = "";
    valueString2 = "";
    if (value1.isNotFound() != 0 || value2.isNotFound() != 0) {
        return value1.isNotFound() != 0 && value2.isNotFound() != 0;
    }
    if (value1.isNullValue() != 0 || value2.isNullValue() != 0) {
        return value1.isNullValue() != 0 && value2.isNullValue() != 0;
    }
    try {
        return equalValues(value1, value2, valueString1, valueString2);
    } catch (const CmpiStatus&) {
        return false;
    }
}

void zemBaseProvider::validateProerties(const CmpiObjectPath& cop, const char** properties,
                                        const char* callingMethod) const {
    CMPIBroker* raw = rawBroker();
    if (raw == nullptr || properties == nullptr || properties[0] == nullptr) {
        return;
    }
    PROV_TRACE_LOCALS();
    PROV_TRACE_ENTER();
    const zemString className = zemClassOf(cop);
    std::vector<const char*> names;
    for (const char** next = properties; *next != nullptr; ++next) {
        names.push_back(*next);
    }

    // A server that does not know the class cannot tell what belongs to it.
    CMPIStatus made = kZemServed;
    CMPIInstance* const none = nullptr;
    const CMPIInstance* const blank =
        zemCallServer(raw->eft, &CMPIBrokerEncFT::newInstance, none, raw, cop.getEnc(), &made);
    if (made.rc == CMPI_RC_OK && blank != nullptr) {
        for (Text name : names) {
            CMPIStatus status = kZemServed;
            zemCallServer(blank->ft, &CMPIInstanceFT::getProperty, CMPIData(), blank, name,
                          &status);
            if (status.rc == CMPI_RC_ERR_NOT_FOUND || status.rc == CMPI_RC_ERR_NO_SUCH_PROPERTY) {
                PROV_TRACE_EXIT();
                throwInvalidPropertyExc(callingMethod, className, name);
            }
        }
    }
    if (const char* repeated = firstRepeated(names)) {
        PROV_TRACE_EXIT();
        throwDuplicatePropertyExc(callingMethod, className, repeated);
    }
    PROV_TRACE_EXIT();
}

CMPIBoolean zemBaseProvider::containsProperty(const char** properties, const char* name) {
    if (properties == nullptr || properties[0] == nullptr) {
        return true;
    }
    if (name == nullptr) {
        return false;
    }
    for (const char** next = properties; *next != nullptr; ++next) {
        if (strcasecmp(*next, name) == 0) {
            return true;
        }
    }
    return false;
}

void zemBaseProvider::validateMethodArgs(const char* methodName, const CmpiArgs& in,
                                         const char* className) {
    PROV_TRACE_LOCALS();
    PROV_TRACE_ENTER();
    zemDynamicArray<zemString> known(25);
    populateMethodArgs(className, known, methodName);

    std::vector<zemString> names;
    const unsigned count = in.getArgCount();
    for (unsigned i = 0; i < count; ++i) {
        CmpiString name;
        in.getArg(static_cast<int>(i), &name);
        names.push_back(zemTextOf(name));
        bool isKnown = false;
        for (int k = 0; k < known.size() && !isKnown; ++k) {
            const zemString* candidate = known.getElementAt(k);
            isKnown = candidate != nullptr && zemString::equalsIgnoreCase(*candidate, names.back());
        }
        if (!isKnown) {
            PROV_TRACE_EXIT();
            throwWrongMethodArgExc(names.back(), methodName);
        }
    }
    if (const char* repeated = firstRepeated({names.begin(), names.end()})) {
        PROV_TRACE_EXIT();
        throwDuplicateMethodArgExc(repeated, methodName);
    }
    PROV_TRACE_EXIT();
}

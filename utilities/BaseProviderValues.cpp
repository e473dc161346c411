// CIM values of zemBaseProvider: names, texts, date-times, paths.
#include <strings.h>

#include <cfloat>
#include <cmath>
#include <cstdarg>
#include <cstdio>
#include <cstring>
#include <ctime>
#include <memory>
#include <string>

#include "BaseProvider.h"
#include "BaseProviderText.h"
#include "Exception.h"
#include "LetUnwind.h"
#include "PropertiesHelper.h"
#include "ServerCall.h"

namespace {

struct CodeRow {
    int rc;
    const char* name;
};

// By number: not every level of the CMPI headers has a symbol for each.
constexpr CodeRow kCodes[] = {
    {0, "CIM_OK"},
    {1, "CIM_ERR_FAILED"},
    {2, "CIM_ERR_ACCESS_DENIED"},
    {3, "CIM_ERR_INVALID_NAMESPACE"},
    {4, "CIM_ERR_INVALID_PARAMETER"},
    {5, "CIM_ERR_INVALID_CLASS"},
    {6, "CIM_ERR_NOT_FOUND"},
    {7, "CIM_ERR_NOT_SUPPORTED"},
    {8, "CIM_ERR_CLASS_HAS_CHILDREN"},
    {9, "CIM_ERR_CLASS_HAS_INSTANCES"},
    {10, "CIM_ERR_INVALID_SUPERCLASS"},
    {11, "CIM_ERR_ALREADY_EXISTS"},
    {12, "CIM_ERR_NO_SUCH_PROPERTY"},
    {13, "CIM_ERR_TYPE_MISMATCH"},
    {14, "CIM_ERR_QUERY_LANGUAGE_NOT_SUPPORTED"},
    {15, "CIM_ERR_INVALID_QUERY"},
    {16, "CIM_ERR_METHOD_NOT_AVAILABLE"},
    {17, "CIM_ERR_METHOD_NOT_FOUND"},
    {50, "CIM_RDO_NOT_UNLOAD"},
    {51, "CIM_NEVER_UNLOAD"},
    {60, "CIM_ERR_INVALID_HANDLE"},
    {61, "CIM_ERR_INVALID_DATA_TYPE"},
    {100, "CIM_ERROR_SYSTEM"},
    {200, "CIM_ERROR"},
};

struct TypeRow {
    CMPIType type;
    const char* name;
};

constexpr TypeRow kTypes[] = {
    {CMPI_boolean, "boolean"}, {CMPI_real32, "real32"},
    {CMPI_real64, "real64"},   {CMPI_uint8, "uint8"},
    {CMPI_uint16, "uint16"},   {CMPI_uint32, "uint32"},
    {CMPI_uint64, "uint64"},   {CMPI_sint8, "sint8"},
    {CMPI_sint16, "sint16"},   {CMPI_sint32, "sint32"},
    {CMPI_sint64, "sint64"},   {CMPI_instance, "[embedded instance] string"},
    {CMPI_ref, "reference"},   {CMPI_string, "string"},
    {CMPI_chars, "string"},    {CMPI_dateTime, "datetime"},
};

constexpr const char* kZeroInterval = "00000000000000.000000:000";
constexpr const char* kDefaultNameSpace = "root/cimv2";

std::string formatted(const char* format, ...) __attribute__((format(printf, 1, 2)));
std::string formatted(const char* format, ...) {
    char text[128];
    va_list args;
    va_start(args, format);
    vsnprintf(text, sizeof text, format, args);
    va_end(args);
    return text;
}

// Both real types show the precision of the smaller one.
float asReal32(double value) {
    if (std::fabs(value) > static_cast<double>(FLT_MAX)) {
        return std::copysign(HUGE_VALF, static_cast<float>(std::signbit(value) ? -1 : 1));
    }
    return static_cast<float>(value);
}

std::string arrayText(const CmpiArray& array) {
    std::string text = "{";
    const CMPICount count = array.size();
    for (CMPICount i = 0; i < count; ++i) {
        if (i != 0) {
            text += ',';
        }
        text += zemBaseProvider::cmpidata2String(array[i].getData());
    }
    return text + "}";
}

// Not every server prints date-times as it does other objects.
std::string dateTimeText(const CmpiDateTime& time) {
    CMPIDateTime* const raw = time.getEnc();
    CMPIStatus status = kZemServed;
    CMPIString* text = nullptr;
    if (raw != nullptr) {
        text = zemCallServer(raw->ft, &CMPIDateTimeFT::getStringFormat, text, raw, &status);
    }
    const char* chars = nullptr;
    if (text != nullptr) {
        chars = zemCallServer(text->ft, &CMPIStringFT::getCharPtr, chars, text, &status);
    }
    return zemOrEmpty(chars);
}

std::string valueText(const CmpiData& data) {
    if ((data.getType() & CMPI_ARRAY) != 0) {
        return arrayText(data.getArray());
    }
    switch (data.getType()) {
        case CMPI_boolean:
            return data.getBoolean() ? "TRUE" : "FALSE";
        case CMPI_sint8:
            return formatted("%d", data.getSint8());
        case CMPI_sint16:
            return formatted("%d", data.getSint16());
        case CMPI_sint32:
            return formatted("%d", data.getSint32());
        case CMPI_sint64:
            return formatted("%lld", data.getSint64());
        case CMPI_uint8:
            return formatted("%d", data.getUint8());
        case CMPI_uint16:
            return formatted("%d", data.getUint16());
        case CMPI_uint32:
            return formatted("%u", data.getUint32());
        case CMPI_uint64:
            return formatted("%llu", data.getUint64());
        case CMPI_real32:
            return formatted("%f", static_cast<double>(data.getReal32()));
        case CMPI_real64:
            return formatted("%f", static_cast<double>(asReal32(data.getReal64())));
        case CMPI_string:
        case CMPI_chars: {
            zemString text;
            zemReadText(data, text);
            return std::string("\"") + static_cast<const char*>(text) + "\"";
        }
        case CMPI_dateTime:
            return dateTimeText(data.getDateTime());
        case CMPI_instance: {
            CmpiInstance instance = data.getInstance();
            return static_cast<const char*>(zemBaseProvider::instanceToString(instance));
        }
        case CMPI_ref:
            return static_cast<const char*>(
                zemBaseProvider::objectPathToString(data.getObjectPath()));
        default:
            return "";
    }
}

std::string pathText(const CmpiObjectPath& path) {
    std::string text;
    const zemString host = zemTextOf(path.getHostname());
    if (!host.isEmpty()) {
        text.append("//").append(host).append("/");
    }
    const zemString nameSpace = zemTextOf(path.getNameSpace());
    if (!nameSpace.isEmpty()) {
        text.append(nameSpace).append(":");
    }
    text.append(zemTextOf(path.getClassName()));
    const unsigned count = path.getKeyCount();
    for (unsigned i = 0; i < count; ++i) {
        CmpiString name;
        const CmpiData value = path.getKey(static_cast<int>(i), &name);
        text.append(i == 0 ? "." : ",").append(zemOrEmpty(name.charPtr())).append("=");
        text.append(zemBaseProvider::cmpidata2String(value));
    }
    return text;
}

// The local time of the kernel's time zone, and how far it is from Greenwich. Times that do not
// fit into the 25 bytes of a CIM date-time give the zero interval.
CmpiDateTime dateTimeOf(const timeval& time) {
    timeval now = {};
    struct timezone zone = {};
    gettimeofday(&now, &zone);
    const time_t local = time.tv_sec - zone.tz_minuteswest * 60L;
    tm fields = {};
    char seconds[32] = {};
    if (gmtime_r(&local, &fields) == nullptr ||
        strftime(seconds, sizeof seconds, "%Y%m%d%H%M%S.", &fields) == 0) {
        return CmpiDateTime(kZeroInterval);
    }
    const std::string text =
        formatted("%s%06ld%+04i", seconds, static_cast<long>(time.tv_usec), -zone.tz_minuteswest);
    return CmpiDateTime(text.size() == strlen(kZeroInterval) ? text.c_str() : kZeroInterval);
}

std::string stripQuotes(const std::string& value) {
    const size_t first = value.find_first_not_of('"');
    if (first == std::string::npos) {
        return "";
    }
    return value.substr(first, value.find_last_not_of('"') - first + 1);
}

bool belongsToSharedSchema(const char* className) {
    return strncasecmp(zemOrEmpty(className), "ORXDSG_", 7) == 0;
}

}  // namespace

const char* zemBaseProvider::cmpiRcToString(CMPIrc rc) {
    for (const CodeRow& row : kCodes) {
        if (row.rc == static_cast<int>(rc)) {
            return row.name;
        }
    }
    return "CIM_ERR_UNKNOWN";
}

zemString zemBaseProvider::cmpiDataTypeToString(CMPIType type) {
    zemString name("Unknown Type");
    for (const TypeRow& row : kTypes) {
        if (row.type == (type & ~CMPI_ARRAY)) {
            name = row.name;
        }
    }
    if ((type & CMPI_ARRAY) != 0) {
        name += "[]";
    }
    return name;
}

// NOLINTNEXTLINE(performance-unnecessary-value-param): providers link against this form
zemString zemBaseProvider::cmpidata2String(CmpiData data) {
    if (zemIsMissing(data)) {
        return zemString("");
    }
    try {
        return zemString(valueText(data).c_str());
    } catch (const CmpiStatus&) {
        return zemString("");
    }
}

zemString zemBaseProvider::instanceToString(CmpiInstance& instance) {
    std::string text = "instance of ";
    try {
        text.append(zemTextOf(instance.getObjectPath().getClassName())).append(" {\n");
        const unsigned count = instance.getPropertyCount();
        for (unsigned i = 0; i < count; ++i) {
            CmpiString name;
            const CmpiData value = instance.getProperty(static_cast<int>(i), &name);
            text.append("    ").append(cmpiDataTypeToString(value.getType())).append(" ");
            text.append(zemOrEmpty(name.charPtr())).append(" = ").append(cmpidata2String(value));
        }
    } catch (const CmpiStatus&) {
        // A trace shows what could be read.
    }
    return zemString((text + "};").c_str());
}

zemString zemBaseProvider::objectPathToString(const CmpiObjectPath& path) {
    try {
        return zemString(pathText(path).c_str());
    } catch (const CmpiStatus&) {
        return zemString("");
    }
}

CmpiDateTime zemBaseProvider::getCurrentDateTime() {
    timeval now = {};
    gettimeofday(&now, nullptr);
    return dateTimeOf(now);
}

CmpiDateTime zemBaseProvider::convertDateTime(long seconds) {
    if (seconds == 0) {
        return CmpiDateTime(kZeroInterval);
    }
    timeval time = {};
    time.tv_sec = seconds;
    return dateTimeOf(time);
}

CmpiDateTime zemBaseProvider::convertDateTime(timeval time) { return dateTimeOf(time); }

long zemBaseProvider::convertDateTime(const CmpiDateTime& dateTime) {
    try {
        return static_cast<long>(dateTime.getDateTime() / 1000000);
    } catch (const CmpiStatus&) {
        return 0;
    }
}

CmpiObjectPath zemBaseProvider::createObjectPath(const CmpiObjectPath& path) {
    return createObjectPath(path, zemTextOf(path.getClassName()));
}

CmpiObjectPath zemBaseProvider::createObjectPath(const CmpiObjectPath& path,
                                                 const char* className) {
    return createObjectPath(path, zemTextOf(path.getNameSpace()), className);
}

CmpiObjectPath zemBaseProvider::createObjectPath(const CmpiObjectPath& path, const char* ns,
                                                 const char* className) {
    CmpiObjectPath created(ns, className);
    const zemString host = zemTextOf(path.getHostname());
    if (!host.isEmpty()) {
        created.setHostname(static_cast<const char*>(host));
    }
    return created;
}

CmpiObjectPath zemBaseProvider::createObjectPath(const zemString& source) {
    const std::string text(static_cast<const char*>(source));
    size_t at = 0;

    std::string host;
    const bool hasHost = text.compare(0, 2, "//") == 0;
    if (hasHost) {
        const size_t slash = text.find('/', 2);
        if (slash == std::string::npos) {
            throw zemInvalidParameterException(source);
        }
        host = text.substr(2, slash - 2);
        at = slash + 1;
    }

    std::string nameSpace = kDefaultNameSpace;
    const size_t colon = text.find(':', at);
    if (colon != std::string::npos) {
        nameSpace = text.substr(at, colon - at);
        at = colon + 1;
    } else if (hasHost) {
        throw zemInvalidParameterException(source);
    }

    const size_t dot = std::min(text.find('.', at), text.size());
    CmpiObjectPath path(nameSpace.c_str(), text.substr(at, dot - at).c_str());
    if (!host.empty()) {
        path.setHostname(host.c_str());
    }

    for (at = dot + 1; dot < text.size() && at <= text.size();) {
        const size_t comma = std::min(text.find(',', at), text.size());
        const size_t equals = text.find('=', at);
        if (equals >= comma) {
            throw zemInvalidParameterException(source);
        }
        const std::string value = stripQuotes(text.substr(equals + 1, comma - equals - 1));
        path.setKey(text.substr(at, equals - at).c_str(), CmpiData(value.c_str()));
        at = comma + 1;
    }
    return path;
}

CmpiData zemBaseProvider::getKeyBinding(const CmpiObjectPath& path, const char* name) {
    // Not every binding's empty value tests as not found.
    struct NotFound : CmpiData {
        NotFound() { _data.state = CMPI_nullValue | CMPI_notFound; }
    };
    CmpiData value = NotFound();
    zemQuietly([&] { value = path.getKey(name); });
    return value;
}

CmpiData zemBaseProvider::getParmVal(const CmpiArgs& args, const char* name) const {
    CmpiData value;  // missing, as which some servers throw
    zemQuietly([&] { value = args.getArg(name); });
    if (!zemIsMissing(value)) {
        return value;
    }
    throwParameterNotFoundExc(name);
}

CmpiData zemBaseProvider::getPropVal(const CmpiInstance& instance, const char* name) const {
    CmpiData value;
    zemQuietly([&] { value = instance.getProperty(name); });
    if (!zemIsMissing(value)) {
        return value;
    }
    throwPropertyNotFoundExc(zemClassOf(instance), name);
}

void zemBaseProvider::setText(CmpiArray& array, CMPICount index, const char* text) {
    if (text == nullptr) {
        return;
    }
    const bool ofStrings = CmpiData(array).getType() == CMPI_stringA;
    array[index] = ofStrings ? CmpiData(CmpiString(text)) : CmpiData(text);
}

CmpiArray zemBaseProvider::convertStringArray(const zemDynamicArray<zemString>& strings) {
    CmpiArray array(static_cast<CMPICount>(strings.size()), CMPI_chars);
    for (int i = 0; i < strings.size(); ++i) {
        const zemString* text = strings.getElementAt(i);
        if (text != nullptr) {
            setText(array, static_cast<CMPICount>(i), *text);
        }
    }
    return array;
}

CmpiArray zemBaseProvider::convertStringArray(const zemArray<const char*>& strings) {
    CmpiArray array(static_cast<CMPICount>(strings.size()), CMPI_chars);
    for (int i = 0; i < strings.size(); ++i) {
        setText(array, static_cast<CMPICount>(i), strings[i]);
    }
    return array;
}

zemDynamicArray<zemString> zemBaseProvider::convertStringArray(const CmpiArray& strings) {
    zemDynamicArray<zemString> texts(25);
    for (CMPICount i = 0; i < strings.size(); ++i) {
        zemString text;
        zemReadText(strings[i].getData(), text);
        texts.addElement(std::make_unique<zemString>(text));
    }
    return texts;
}

CMPIBoolean zemBaseProvider::compareClassNames(const char* className, const char* compareName) {
    const char* name = zemOrEmpty(className);
    const char* other = zemOrEmpty(compareName);
    if (other[0] == '_') {
        name = zemOrEmpty(strchr(name, '_'));
    }
    return strcasecmp(name, other) == 0;
}

zemString zemBaseProvider::getCSName() { return zemPropertiesHelper::getFullHostName(); }

zemString zemBaseProvider::getSystemName() { return zemPropertiesHelper::getHostName(); }

const char* zemBaseProvider::getOSClassName(const char* className) {
    return belongsToSharedSchema(className) ? "ORXDSG_OperatingSystem" : "ORX_OperatingSystem";
}

const char* zemBaseProvider::getCSClassName(const char* className) {
    return belongsToSharedSchema(className) ? "ORXDSG_ComputerSystem" : "ORX_ComputerSystem";
}

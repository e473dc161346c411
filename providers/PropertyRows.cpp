#include "PropertyRows.h"

#include <strings.h>

#include <algorithm>
#include <cctype>
#include <climits>
#include <cstdlib>
#include <ctime>
#include <map>

#include "BaseProvider.h"
#include "DNXApiCaller.h"
#include "QyplatCmdCaller.h"

namespace {

using Host = zemQyplatCmdCaller::ManagedSystemAttribute;

// The tools' codes for what they do not know.
constexpr const char kNoSuchHost[] = "WRTL8018";
constexpr const char kNoSuchPartition[] = "WRTL8011";

// Values of the schema.
enum EnabledState : CMPIUint16 {
    Unknown = 0,
    Other = 1,
    Enabled = 2,
    Disabled = 3,
    ShuttingDown = 4,
    EnabledButOffline = 6,
    Quiesce = 9,
    Starting = 10
};
enum class Operational : CMPIUint16 {
    Unknown = 0,
    Ok = 2,
    Error = 6,
    Starting = 8,
    Stopping = 9,
    Stopped = 10,
    LostCommunication = 13,
    Dormant = 15
};

/// What clients are told of the state words of hosts, partitions and connections.
struct StateRow {
    const char* word;
    EnabledState enabled;
    Operational status;
};

constexpr StateRow kStates[] = {
    {"Operating", Enabled, Operational::Ok},
    {"Running", Enabled, Operational::Ok},
    {"Connected", Enabled, Operational::Ok},
    {"Standby", EnabledButOffline, Operational::Ok},
    {"Starting", Starting, Operational::Starting},
    {"Initializing", Starting, Operational::Starting},
    {"Open Firmware", Starting, Operational::Starting},
    {"Shutting Down", ShuttingDown, Operational::Stopping},
    {"Power Off In Progress", ShuttingDown, Operational::Stopping},
    {"Suspended", Quiesce, Operational::Dormant},
    {"Not Activated", Disabled, Operational::Stopped},
    {"Power Off", Disabled, Operational::Stopped},
    {"Error", Other, Operational::Error},
    {"No Connection", Unknown, Operational::LostCommunication},
};
constexpr StateRow kUnknownState = {"", Unknown, Operational::Unknown};

const StateRow& stateRow(const char* word) {
    const auto* row = std::find_if(std::begin(kStates), std::end(kStates), [&](const StateRow& r) {
        return strcasecmp(r.word, word) == 0;
    });
    return row == std::end(kStates) ? kUnknownState : *row;
}

/// The whole text as a decimal number up to @p limit.
bool parseNumber(const char* text, unsigned long limit, unsigned long& value) {
    char* end = nullptr;
    value = std::strtoul(text, &end, 10);
    return std::isdigit(static_cast<unsigned char>(*text)) != 0 && *end == '\0' && value <= limit;
}

/// The whole text as a decimal number with at most two places behind the point, in hundredths.
bool parseHundredths(const char* text, unsigned long& value) {
    const std::string number = text;
    const std::size_t point = std::min(number.find('.'), number.size());
    std::string places = number.substr(std::min(point + 1, number.size()));
    if (places.size() > 2 || places.find_first_not_of("0123456789") != std::string::npos) {
        return false;
    }
    places.resize(2, '0');
    if (!parseNumber(number.substr(0, point).c_str(), 0xFFFFFFFF / 100 - 1, value)) {
        return false;
    }
    value = value * 100 + std::strtoul(places.c_str(), nullptr, 10);
    return true;
}

CmpiArray textList(const std::string& text) {
    const auto count = static_cast<CMPICount>(1 + std::count(text.begin(), text.end(), ','));
    CmpiArray list(count, CMPI_chars);
    std::size_t from = 0;
    for (CMPICount i = 0; i < count; ++i) {
        const std::size_t to = std::min(text.find(',', from), text.size());
        zemBaseProvider::setText(list, i, text.substr(from, to - from).c_str());
        from = to + 1;
    }
    return list;
}

CmpiArray listOf(Operational status) {
    CmpiArray list(1, CMPI_uint16);
    CmpiData element;
    element.setUint16(static_cast<CMPIUint16>(status));
    list[0] = element;
    return list;
}

/// Sets @p data from the text of an attribute.
/// @return false when the text is empty or of another form, so that the property stays null
bool convert(ValueKind kind, const char* text, CmpiData& data) {
    if (*text == '\0') {
        return false;
    }
    unsigned long value = 0;
    std::tm when = {};
    switch (kind) {
        case ValueKind::Text:
            data = CmpiData(text);
            return true;
        case ValueKind::TextList:
            data = CmpiData(textList(text));
            return true;
        case ValueKind::Uint16:
            if (!parseNumber(text, 0xFFFF, value)) {
                return false;
            }
            data.setUint16(static_cast<CMPIUint16>(value));
            return true;
        case ValueKind::Uint32:
            if (!parseNumber(text, 0xFFFFFFFF, value)) {
                return false;
            }
            data.setUint32(static_cast<CMPIUint32>(value));
            return true;
        case ValueKind::Uint64:
            if (!parseNumber(text, ULONG_MAX, value)) {
                return false;
            }
            data.setUint64(value);
            return true;
        case ValueKind::Hundredths:
            if (!parseHundredths(text, value)) {
                return false;
            }
            data.setUint32(static_cast<CMPIUint32>(value));
            return true;
        case ValueKind::Flag:
            if (!parseNumber(text, 1, value)) {
                return false;
            }
            data.setBoolean(static_cast<CMPIBoolean>(value));
            return true;
        case ValueKind::Timestamp:
            if (strptime(text, "%m/%d/%Y %H:%M:%S", &when) == nullptr) {
                return false;
            }
            data.setDateTime(zemBaseProvider::convertDateTime(static_cast<long>(timegm(&when))));
            return true;
        case ValueKind::EnabledState:
            data.setUint16(stateRow(text).enabled);
            return true;
        case ValueKind::Status:
            data = CmpiData(listOf(stateRow(text).status));
            return true;
    }
    return false;
}

/// The properties that have a value.
std::vector<std::pair<std::string, CmpiData>> valuesOf(const CmpiInstance& instance) {
    std::vector<std::pair<std::string, CmpiData>> values;
    const unsigned count = instance.getPropertyCount();
    for (unsigned i = 0; i < count; ++i) {
        CmpiString name;
        const CmpiData value = instance.getProperty(static_cast<int>(i), &name);
        if (!value.isNullValue()) {
            values.emplace_back(name.charPtr(), value);
        }
    }
    return values;
}

std::string textOf(const CmpiData& value) {
    return std::string(zemBaseProvider::cmpidata2String(value));
}

}  // namespace

Attributes attributesFor(const std::vector<PropertyRow>& rows, const Attributes& identity,
                         const char** properties) {
    Attributes attributes = identity;
    for (const PropertyRow& row : rows) {
        if (zemBaseProvider::containsProperty(properties, row.property) &&
            std::find(attributes.begin(), attributes.end(), row.attribute) == attributes.end()) {
            attributes.push_back(row.attribute);
        }
    }
    attributes.push_back(Host::ATTR_END);
    return attributes;
}

void setProperties(CmpiInstance& instance, const std::vector<PropertyRow>& rows,
                   const char** properties, const zemRecordType& record) {
    for (const PropertyRow& row : rows) {
        CmpiData value;
        if (zemBaseProvider::containsProperty(properties, row.property) &&
            convert(row.kind, record[row.attribute], value)) {
            instance.setProperty(row.property, value);
        }
    }
}

std::string hundredthsText(unsigned long hundredths) {
    const std::string places = std::to_string(100 + hundredths % 100).substr(1);
    return std::to_string(hundredths / 100) + "." + places;
}

bool isHostName(const std::string& text) {
    const std::size_t star = text.find('*');
    return star != std::string::npos && star > 0 && star + 1 < text.size() &&
           std::count(text.begin(), text.end(), '*') == 1 &&
           std::all_of(text.begin(), text.end(),
                       [](unsigned char c) { return std::isalnum(c) || c == '-' || c == '*'; });
}

bool isUnknownObject(const zemException& failure) {
    const zemString id(failure.getExceptionId());
    return failure.getExceptionType() == zemObjectNotFoundException::kind || id == kNoSuchHost ||
           id == kNoSuchPartition || id == errorCodeToString(API_UNKNOWN_SYSTEM);
}

std::string hostName(const zemRecordType& host) {
    return std::string(host[Host::ATTR_TYPE_MODEL]) + "*" +
           static_cast<const char*>(host[Host::ATTR_SERIAL_NUM]);
}

std::string keyOf(const CmpiObjectPath& path, const char* name) {
    const CmpiData key = zemBaseProvider::getKeyBinding(path, name);
    return key.isNotFound() || key.isNullValue() ? "" : key.getString().charPtr();
}

void listSystemKeys(CmpiArray& keys) {
    zemBaseProvider::setText(keys, 0, "CreationClassName");
    zemBaseProvider::setText(keys, 1, "Name");
}

CmpiObjectPath systemPath(const CmpiObjectPath& near, const char* className,
                          const std::string& name) {
    CmpiObjectPath path = zemBaseProvider::createObjectPath(near, className);
    path.setKey("CreationClassName", CmpiData(className));
    path.setKey("Name", CmpiData(name.c_str()));
    return path;
}

CmpiInstance newInstance(const CmpiObjectPath& path, const char** properties) {
    const unsigned count = path.getKeyCount();
    std::vector<CmpiString> names(count);
    Keys keys;
    for (unsigned i = 0; i < count; ++i) {
        const CmpiData value = path.getKey(static_cast<int>(i), &names[i]);
        keys.emplace_back(names[i].charPtr(), value);
    }
    return newInstance(path, keys, properties);
}

CmpiInstance newInstance(const CmpiObjectPath& path, const Keys& keys, const char** properties) {
    CmpiInstance instance(path);
    if (properties != nullptr && *properties != nullptr) {
        std::vector<const char*> names;
        for (const auto& key : keys) {
            names.push_back(key.first);
        }
        names.push_back(nullptr);
        try {
            instance.setPropertyFilter(properties, names.data());
        } catch (const CmpiStatus& status) {
            // a server without filters leaves the choice to its clients
            if (status.rc() != CMPI_RC_ERR_NOT_SUPPORTED) {
                throw;
            }
        }
    }
    for (const auto& [name, value] : keys) {
        instance.setProperty(name, value);
    }
    return instance;
}

CmpiData argumentOf(const CmpiArgs& in, const char* name) {
    try {
        return in.getArg(name);
    } catch (const CmpiStatus&) {
        return CmpiData();
    }
}

std::vector<std::pair<std::string, CmpiData>> askedFor(const CmpiInstance& instance,
                                                       const CmpiObjectPath& near,
                                                       const char* className,
                                                       const char** properties) {
    // what the server puts into an instance that nobody has filled yet
    const std::map<std::string, std::string> defaults = [&] {
        std::map<std::string, std::string> texts;
        const CmpiInstance fresh(zemBaseProvider::createObjectPath(near, className));
        for (const auto& [name, value] : valuesOf(fresh)) {
            texts.emplace(name, textOf(value));
        }
        return texts;
    }();
    std::vector<std::pair<std::string, CmpiData>> asked;
    for (const auto& [name, value] : valuesOf(instance)) {
        const auto standard = defaults.find(name);
        if (zemBaseProvider::containsProperty(properties, name.c_str()) &&
            (standard == defaults.end() || standard->second != textOf(value))) {
            asked.emplace_back(name, value);
        }
    }
    return asked;
}

bool hasTimeout(const CmpiArgs& in) {
    const CmpiData limit = argumentOf(in, "TimeoutPeriod");
    if (limit.isNotFound() || limit.isNullValue()) {
        return false;
    }
    return limit.getDateTime().getDateTime() != 0;
}

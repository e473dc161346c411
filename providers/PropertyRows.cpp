#include "PropertyRows.h"

#include <strings.h>

#include <algorithm>
#include <cctype>
#include <cstdlib>
#include <ctime>

#include "BaseProvider.h"
#include "QyplatCmdCaller.h"

namespace {

using Host = zemQyplatCmdCaller::ManagedSystemAttribute;

/// What clients are told of the state words of hosts and partitions.
struct StateRow {
    const char* word;
    CMPIUint16 enabledState;
    CMPIUint16 operationalStatus;
};

constexpr StateRow kStates[] = {
    {"Operating", 2, 2},
    {"Running", 2, 2},
    {"Standby", 6, 2},
    {"Starting", 10, 8},
    {"Initializing", 10, 8},
    {"Shutting Down", 4, 9},
    {"Open Firmware", 10, 8},
    {"Suspended", 9, 15},
    {"Not Activated", 3, 10},
    {"Power Off", 3, 10},
    {"Power Off In Progress", 4, 9},
    {"Error", 1, 6},
    {"Connected", 2, 2},
    {"No Connection", 0, 13},
    {"Not Available", 0, 0},
};
constexpr StateRow kUnknownState = {"", 0, 0};

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
    if (places.size() > 2 || places.find_first_not_of("0123456789") != std::string::npos)
        return false;
    places.resize(2, '0');
    if (!parseNumber(number.substr(0, point).c_str(), 0xFFFFFFFF / 100 - 1, value)) return false;
    value = value * 100 + std::strtoul(places.c_str(), nullptr, 10);
    return true;
}

CmpiArray textList(const std::string& text) {
    const auto count = static_cast<CMPICount>(1 + std::count(text.begin(), text.end(), ','));
    CmpiArray list(count, CMPI_chars);
    std::size_t from = 0;
    for (CMPICount i = 0; i < count; ++i) {
        const std::size_t to = std::min(text.find(',', from), text.size());
        list[i] = CmpiData(text.substr(from, to - from).c_str());
        from = to + 1;
    }
    return list;
}

CmpiArray oneNumber(CMPIUint16 value) {
    CmpiArray list(1, CMPI_uint16);
    CmpiData element;
    element.setUint16(value);
    list[0] = element;
    return list;
}

/// Sets @p data from the text of an attribute.
/// @return false when the text is empty or of another form, so that the property stays null
bool convert(ValueKind kind, const char* text, CmpiData& data) {
    if (*text == '\0') return false;
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
            if (!parseNumber(text, 0xFFFF, value)) return false;
            data.setUint16(static_cast<CMPIUint16>(value));
            return true;
        case ValueKind::Uint32:
            if (!parseNumber(text, 0xFFFFFFFF, value)) return false;
            data.setUint32(static_cast<CMPIUint32>(value));
            return true;
        case ValueKind::Hundredths:
            if (!parseHundredths(text, value)) return false;
            data.setUint32(static_cast<CMPIUint32>(value));
            return true;
        case ValueKind::Flag:
            if (!parseNumber(text, 1, value)) return false;
            data.setBoolean(static_cast<CMPIBoolean>(value));
            return true;
        case ValueKind::Timestamp:
            if (strptime(text, "%m/%d/%Y %H:%M:%S", &when) == nullptr) return false;
            when.tm_isdst = -1;
            data.setDateTime(zemBaseProvider::convertDateTime(static_cast<long>(mktime(&when))));
            return true;
        case ValueKind::EnabledState:
            data.setUint16(stateRow(text).enabledState);
            return true;
        case ValueKind::Status:
            data = CmpiData(oneNumber(stateRow(text).operationalStatus));
            return true;
    }
    return false;
}

}  // namespace

Attributes attributesFor(const std::vector<PropertyRow>& rows, const Attributes& identity,
                         const char** properties) {
    Attributes attributes = identity;
    for (const PropertyRow& row : rows)
        if (zemBaseProvider::containsProperty(properties, row.property) &&
            std::find(attributes.begin(), attributes.end(), row.attribute) == attributes.end())
            attributes.push_back(row.attribute);
    attributes.push_back(Host::ATTR_END);
    return attributes;
}

void setProperties(CmpiInstance& instance, const std::vector<PropertyRow>& rows,
                   const char** properties, const zemRecordType& record) {
    for (const PropertyRow& row : rows) {
        CmpiData value;
        if (zemBaseProvider::containsProperty(properties, row.property) &&
            convert(row.kind, record[row.attribute], value))
            instance.setProperty(row.property, value);
    }
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
    return failure.getExceptionType() == 5 || id == "WRTL8011" || id == "WRTL8018";
}

std::string hostName(const zemRecordType& host) {
    return std::string(host[Host::ATTR_TYPE_MODEL]) + "*" +
           static_cast<const char*>(host[Host::ATTR_SERIAL_NUM]);
}

void listSystemKeys(CmpiArray& keys) {
    keys[0] = CmpiData("CreationClassName");
    keys[1] = CmpiData("Name");
}

CmpiObjectPath systemPath(const CmpiObjectPath& near, const char* className,
                          const std::string& name) {
    CmpiObjectPath path = zemBaseProvider::createObjectPath(near, className);
    path.setKey("CreationClassName", CmpiData(className));
    path.setKey("Name", CmpiData(name.c_str()));
    return path;
}

CmpiInstance systemInstance(const CmpiObjectPath& near, const char* className,
                            const std::string& name) {
    CmpiInstance instance(systemPath(near, className, name));
    instance.setProperty("CreationClassName", CmpiData(className));
    instance.setProperty("Name", CmpiData(name.c_str()));
    return instance;
}

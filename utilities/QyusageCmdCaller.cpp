#include "QyusageCmdCaller.h"

#include <string>
#include <utility>

#include "CommandLine.h"

namespace {

constexpr zemQuery kConfiguration = {"qyusage -r config",
                                     zemQyusageCmdCaller::ConfigurationAttribute::m_attributeName,
                                     zemQuery::WHEN_NOT_NULL};
constexpr zemQuery kPartitionUsage = {"qyusage -r lpar",
                                      zemQyusageCmdCaller::PartitionAttribute::m_attributeName,
                                      zemQuery::WHEN_NOT_NULL};
constexpr zemQuery kSystemUsage = {"qyusage -r sys",
                                   zemQyusageCmdCaller::ManagedSystemAttribute::m_attributeName,
                                   zemQuery::WHEN_NOT_NULL};

constexpr char kSamples[] = " --filter \"event_types=sample\"";
constexpr int kNoLimit = -1;

std::string additional(const char* option) { return ' ' + zemTextOf(option); }

/// One end of a range of time, to the hour: the tool takes nothing finer.
std::string hourOptions(const std::string& end, const tm* when) {
    if (when == nullptr) {
        return "";
    }
    const std::pair<const char*, int> parts[] = {{"year ", when->tm_year + 1900},
                                                 {"month ", when->tm_mon + 1},
                                                 {"day ", when->tm_mday},
                                                 {"hour ", when->tm_hour}};
    std::string text;
    for (const auto& [name, value] : parts) {
        text += " --" + end + name + std::to_string(value);
    }
    return text + ' ';
}

/// Seconds since the epoch as a calendar date in UTC, or none.
class UtcTime {
public:
    explicit UtcTime(int seconds) {
        const time_t time = seconds;
        m_given = seconds != kNoLimit && gmtime_r(&time, &m_time) != nullptr;
    }
    tm* get() { return m_given ? &m_time : nullptr; }

private:
    bool m_given = false;
    tm m_time = {};
};

}  // namespace

zemQyusageCmdCaller::zemQyusageCmdCaller(const char* auth, const char* locale)
    : zemCommandCaller(auth, locale) {}

std::string zemQyusageCmdCaller::formatDataTimeFilter(const tm* pStart, const tm* pEnd) {
    return hourOptions("start", pStart) + hourOptions("end", pEnd);
}

zemRecordSetsType zemQyusageCmdCaller::getConfigurationSettings(int* paramAttr,
                                                                const char* managedSystem,
                                                                const char* additionalOption) {
    return query(kConfiguration, paramAttr, managedSystem, nullptr, "",
                 additional(additionalOption).c_str());
}

zemRecordSetsType zemQyusageCmdCaller::getPartitionsMetrics(int* paramAttr,
                                                            const char* managedSystem,
                                                            const char* filter, tm* pStartDateTime,
                                                            tm* pEndDateTime,
                                                            const char* additionalOption) {
    std::string options = additional(additionalOption) + kSamples;
    if (zemIsGiven(filter)) {
        options += ',' + zemTextOf(filter);
    }
    options += formatDataTimeFilter(pStartDateTime, pEndDateTime);
    return query(kPartitionUsage, paramAttr, managedSystem, nullptr, "", options.c_str());
}

zemRecordSetsType zemQyusageCmdCaller::getManagedSystemMetrics(int* paramAttr,
                                                               const char* managedSystem,
                                                               tm* pStartDateTime, tm* pEndDateTime,
                                                               const char* additionalOption) {
    const std::string options = additional(additionalOption) + kSamples +
                                formatDataTimeFilter(pStartDateTime, pEndDateTime);
    return query(kSystemUsage, paramAttr, managedSystem, nullptr, "", options.c_str());
}

zemRecordSetsType zemQyusageCmdCaller::getPartitionsMetrics(int* paramAttr,
                                                            const char* managedSystem,
                                                            const char* filter, int startDateTime,
                                                            int endDateTime,
                                                            const char* additionalOption) {
    UtcTime start(startDateTime);
    UtcTime end(endDateTime);
    return getPartitionsMetrics(paramAttr, managedSystem, filter, start.get(), end.get(),
                                additionalOption);
}

zemRecordSetsType zemQyusageCmdCaller::getManagedSystemMetrics(int* paramAttr,
                                                               const char* managedSystem,
                                                               int startDateTime, int endDateTime,
                                                               const char* additionalOption) {
    UtcTime start(startDateTime);
    UtcTime end(endDateTime);
    return getManagedSystemMetrics(paramAttr, managedSystem, start.get(), end.get(),
                                   additionalOption);
}

#include "QyusageCmdCaller.h"

#include <string>

namespace {

constexpr zemQuery kConfiguration = {"qyusage -r config",
                                     zemQyusageCmdCaller::ConfigurationAttribute::m_attributeName,
                                     zemQuery::WHEN_NOT_NULL};
constexpr zemQuery kPartitions = {"qyusage -r lpar",
                                  zemQyusageCmdCaller::PartitionAttribute::m_attributeName,
                                  zemQuery::WHEN_NOT_NULL};
constexpr zemQuery kSystems = {"qyusage -r sys",
                               zemQyusageCmdCaller::ManagedSystemAttribute::m_attributeName,
                               zemQuery::WHEN_NOT_NULL};

constexpr char kSamples[] = " --filter \"event_types=sample\"";
constexpr int kNoLimit = -1;

std::string additional(const char* option) {
    return std::string(" ") + (option != nullptr ? option : "");
}

/// One end of a range of time, to the hour: the tool takes nothing finer.
std::string hourOptions(const char* end, const tm* when) {
    if (when == nullptr) {
        return "";
    }
    zemString text;
    text.format(" --%syear %d --%smonth %d --%sday %d --%shour %d ", end, when->tm_year + 1900, end,
                when->tm_mon + 1, end, when->tm_mday, end, when->tm_hour);
    return std::string(text);
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

zemString zemQyusageCmdCaller::formatDataTimeFilter(const tm* pStart, const tm* pEnd) {
    return zemString((hourOptions("start", pStart) + hourOptions("end", pEnd)).c_str());
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
    if (filter != nullptr && *filter != '\0') {
        options += std::string(",") + filter;
    }
    options += formatDataTimeFilter(pStartDateTime, pEndDateTime);
    return query(kPartitions, paramAttr, managedSystem, nullptr, "", options.c_str());
}

zemRecordSetsType zemQyusageCmdCaller::getManagedSystemMetrics(int* paramAttr,
                                                               const char* managedSystem,
                                                               tm* pStartDateTime, tm* pEndDateTime,
                                                               const char* additionalOption) {
    const std::string options = additional(additionalOption) + kSamples +
                                std::string(formatDataTimeFilter(pStartDateTime, pEndDateTime));
    return query(kSystems, paramAttr, managedSystem, nullptr, "", options.c_str());
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

#include "PropertiesHelper.h"

#include <cstdlib>
#include <cstring>
#include <ctime>
#include <string_view>

namespace {

constexpr std::string_view special = "$#@";
constexpr std::string_view numbers = "0123456789";
constexpr std::string_view uppercase = "ABCDEFGHIJKLMNOPQRSTUVWXYZ";
constexpr std::string_view lowercase = "abcdefghijklmnopqrstuvwxyz";

bool isOneOf(char c, std::string_view set) { return set.find(c) != std::string_view::npos; }

bool isLetter(char c) { return isOneOf(c, uppercase) || isOneOf(c, lowercase); }

/// Number in the next @p width characters of @p stamp, which is moved past them. A stamp need not
/// be terminated; one that ends early, or holds no digits, counts as far as it goes.
int nextField(const char*& stamp, size_t width) {
    char digits[8] = {};
    const size_t present = strnlen(stamp, width);
    std::memcpy(digits, stamp, present);
    stamp += present;
    return static_cast<int>(std::strtol(digits, nullptr, 10));
}

/// Seconds of a stamp whose year is read already and whose month and day come next in @p date,
/// hour, minute and second in @p time.
long secondsOf(int year, const char*& date, const char*& time) {
    std::tm parts = {};
    parts.tm_year = year;
    parts.tm_mon = nextField(date, 2) - 1;
    parts.tm_mday = nextField(date, 2);
    parts.tm_hour = nextField(time, 2);
    parts.tm_min = nextField(time, 2);
    parts.tm_sec = nextField(time, 2);
    parts.tm_isdst = -1;
    return std::mktime(&parts);
}

}  // namespace

int zemPropertiesHelper::isValidIPAddress(const zemString& text) {
    int part[4];
    if (std::sscanf(text, "%d%*[.]%d%*[.]%d%*[.]%d", &part[0], &part[1], &part[2], &part[3]) != 4) {
        return 0;
    }
    for (const int number : part) {
        if (number > 255) {
            return 0;
        }
    }
    return 1;
}

int zemPropertiesHelper::isValidName(const zemString& name, const zemString& extra) {
    const std::string_view text(name);
    const std::string_view additional = extra.isEmpty() ? special : std::string_view(extra);
    if (text.empty()) {
        return 0;
    }
    if (!isLetter(text[0]) && !(extra.isEmpty() && isOneOf(text[0], special))) {
        return 0;
    }
    for (const char c : text.substr(1)) {
        if (!isLetter(c) && !isOneOf(c, numbers) && !isOneOf(c, additional)) {
            return 0;
        }
    }
    return 1;
}

long zemPropertiesHelper::getLocalDateTime() { return std::time(nullptr); }

long zemPropertiesHelper::getCurrentTimeBaseSec() {
    const std::time_t now = std::time(nullptr);
    std::tm parts = {};
    localtime_r(&now, &parts);
    return std::mktime(&parts);
}

long zemPropertiesHelper::getTimeFromTimeStamp13(char* stamp) {
    constexpr std::string_view blanks = "             ";
    if (stamp == nullptr || std::strncmp(stamp, blanks.data(), blanks.size()) == 0) {
        return 0;
    }
    const char* next = stamp;
    const int century = nextField(next, 1);
    const int year = century * 100 + nextField(next, 2);
    return secondsOf(year, next, next);
}

long zemPropertiesHelper::getTimeFromDateTimeStamps(char* date, char* time) {
    if (date == nullptr || time == nullptr || *date == ' ' || *time == ' ') {
        return 0;
    }
    const char* nextOfDate = date;
    const char* nextOfTime = time;
    const int year = nextField(nextOfDate, 4) - 1900;
    return secondsOf(year, nextOfDate, nextOfTime);
}

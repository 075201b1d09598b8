#include "history/HistoryDate.h"

#include <ctime>
#include <regex>

namespace history {

namespace {

// Year, month, day, then optionally hour, minute, second and the offset.
std::regex const& datePattern() {
    static std::regex const pattern(R"(^(\d{4})-(\d{2})-(\d{2})(?:[T ](\d{2}):(\d{2}))"
                                    R"((?::(\d{2}))?(Z|[+-]\d{2}:?\d{2})?)?$)");
    return pattern;
}

int number(std::ssub_match const& match) {
    return match.matched ? std::stoi(match.str()) : 0;
}

// The offset from UTC in seconds of "Z", "+01:00" or "-0130".
std::optional<long long> offsetSeconds(std::string const& text) {
    if (text == "Z") {
        return 0;
    }
    int const hours = std::stoi(text.substr(1, 2));
    int const minutes = std::stoi(text.substr(text.size() - 2));
    if (hours > 23 || minutes > 59) {
        return std::nullopt;
    }
    long long const seconds = hours * 3600LL + minutes * 60LL;
    return text[0] == '-' ? -seconds : seconds;
}

std::tm calendarTime(std::smatch const& parts) {
    std::tm time{};
    time.tm_year = number(parts[1]) - 1900;
    time.tm_mon = number(parts[2]) - 1;
    time.tm_mday = number(parts[3]);
    time.tm_hour = number(parts[4]);
    time.tm_min = number(parts[5]);
    time.tm_sec = number(parts[6]);
    return time;
}

// Whether the calendar kept the fields as given: the 31 April and the
// 25th hour are refused rather than moved on.
bool isSameTime(std::tm const& given, std::tm const& normalised) {
    return given.tm_year == normalised.tm_year && given.tm_mon == normalised.tm_mon &&
           given.tm_mday == normalised.tm_mday && given.tm_hour == normalised.tm_hour &&
           given.tm_min == normalised.tm_min && given.tm_sec == normalised.tm_sec;
}

} // namespace

std::optional<long long> momentOfDate(std::string const& text) {
    std::smatch parts;
    if (!std::regex_match(text, parts, datePattern())) {
        return std::nullopt;
    }
    std::tm const given = calendarTime(parts);
    std::tm normalised = given;
    if (!parts[7].matched) {
        normalised.tm_isdst = -1;
        std::time_t const local = std::mktime(&normalised);
        normalised.tm_isdst = given.tm_isdst;
        return isSameTime(given, normalised) ? std::optional<long long>(local) : std::nullopt;
    }
    std::optional<long long> const offset = offsetSeconds(parts[7].str());
    std::time_t const utc = timegm(&normalised);
    if (!offset || !isSameTime(given, normalised)) {
        return std::nullopt;
    }
    return static_cast<long long>(utc) - *offset;
}

} // namespace history

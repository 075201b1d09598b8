#include "report/ReadableTime.h"

#include <array>
#include <cstdio>

namespace report {

namespace {

struct TimeParts {
    int year = 0;
    int month = 0;
    int day = 0;
    int hour = 0;
    int minute = 0;
    int second = 0;
    // "UTC", or "UTC+01:00".
    std::string zone;
};

// The zone of an ISO offset ("+01:00", "-05:30", "Z"); nothing for anything else.
std::optional<std::string> zoneOf(std::string const& offset) {
    if (offset == "Z" || offset == "+00:00" || offset == "-00:00") {
        return std::string("UTC");
    }
    int hours = 0;
    int minutes = 0;
    int end = 0;
    bool const hasSign = !offset.empty() && (offset[0] == '+' || offset[0] == '-');
    if (!hasSign || std::sscanf(offset.c_str() + 1, "%2d:%2d%n", &hours, &minutes, &end) != 2 ||
        offset.size() != 6 || end != 5 || hours > 23 || minutes > 59) {
        return std::nullopt;
    }
    return "UTC" + offset;
}

std::optional<TimeParts> partsOf(std::string const& isoTime) {
    TimeParts parts;
    int end = 0;
    int const read =
        std::sscanf(isoTime.c_str(), "%4d-%2d-%2dT%2d:%2d:%2d%n", &parts.year, &parts.month,
                    &parts.day, &parts.hour, &parts.minute, &parts.second, &end);
    constexpr int dateAndTimeLength = 19;
    if (read != 6 || end != dateAndTimeLength || parts.month < 1 || parts.month > 12 ||
        parts.day < 1 || parts.day > 31 || parts.hour > 23 || parts.minute > 59 ||
        parts.second > 60) {
        return std::nullopt;
    }
    std::optional<std::string> zone = zoneOf(isoTime.substr(dateAndTimeLength));
    if (!zone) {
        return std::nullopt;
    }
    parts.zone = std::move(*zone);
    return parts;
}

// 0 for Sunday: days since 1970-01-01 (a Thursday) in the proleptic
// Gregorian calendar, counted in eras of 400 years.
int weekdayOf(int year, int month, int day) {
    int const shiftedYear = month <= 2 ? year - 1 : year;
    int const era = (shiftedYear >= 0 ? shiftedYear : shiftedYear - 399) / 400;
    int const yearOfEra = shiftedYear - era * 400;
    int const dayOfYear = (153 * (month > 2 ? month - 3 : month + 9) + 2) / 5 + day - 1;
    int const dayOfEra = yearOfEra * 365 + yearOfEra / 4 - yearOfEra / 100 + dayOfYear;
    long long const days = era * 146097LL + dayOfEra - 719468;
    return static_cast<int>((days % 7 + 11) % 7);
}

} // namespace

std::optional<std::string> readableTime(std::string const& isoTime) {
    static constexpr std::array<char const*, 7> weekdays = {"Sun", "Mon", "Tue", "Wed",
                                                            "Thu", "Fri", "Sat"};
    static constexpr std::array<char const*, 12> months = {
        "Jan", "Feb", "Mar", "Apr", "May", "Jun", "Jul", "Aug", "Sep", "Oct", "Nov", "Dec"};
    std::optional<TimeParts> const parts = partsOf(isoTime);
    if (!parts) {
        return std::nullopt;
    }
    char text[64] = {};
    std::snprintf(
        text, sizeof text, "%s %d %s %04d %02d:%02d:%02d %s",
        weekdays[static_cast<std::size_t>(weekdayOf(parts->year, parts->month, parts->day))],
        parts->day, months[static_cast<std::size_t>(parts->month - 1)], parts->year, parts->hour,
        parts->minute, parts->second, parts->zone.c_str());
    return std::string(text);
}

} // namespace report

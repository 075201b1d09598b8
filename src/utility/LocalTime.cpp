#include "utility/LocalTime.h"

#include <cstdio>
#include <ctime>

namespace util {

std::string localTimeText(long long secondsSinceEpoch) {
    auto const time = static_cast<std::time_t>(secondsSinceEpoch);
    std::tm local{};
    if (localtime_r(&time, &local) == nullptr) {
        return "";
    }
    char text[40] = {};
    if (std::strftime(text, sizeof text, "%Y-%m-%dT%H:%M:%S%z", &local) == 0) {
        return "";
    }
    std::string iso = text;
    // strftime writes the offset as +0100.
    iso.insert(iso.size() - 2, ":");
    return iso;
}

std::optional<long long> secondsOfTimeText(std::string const& text) {
    std::tm utc{};
    char sign = 0;
    int offsetHours = 0;
    int offsetMinutes = 0;
    int consumed = 0;
    int const fields = std::sscanf(text.c_str(), "%4d-%2d-%2dT%2d:%2d:%2d%c%2d:%2d%n", &utc.tm_year,
                                   &utc.tm_mon, &utc.tm_mday, &utc.tm_hour, &utc.tm_min,
                                   &utc.tm_sec, &sign, &offsetHours, &offsetMinutes, &consumed);
    if (fields != 9 || (sign != '+' && sign != '-') || text.size() != 25 ||
        static_cast<std::size_t>(consumed) != text.size()) {
        return std::nullopt;
    }
    utc.tm_year -= 1900;
    utc.tm_mon -= 1;
    long long const offset = (offsetHours * 3600LL + offsetMinutes * 60LL) * (sign == '+' ? 1 : -1);
    return static_cast<long long>(timegm(&utc)) - offset;
}

} // namespace util

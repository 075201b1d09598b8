#include "utility/LocalTime.h"

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

} // namespace util

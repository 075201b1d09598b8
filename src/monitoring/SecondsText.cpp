#include "monitoring/SecondsText.h"

#include <cstdio>

namespace monitoring {

std::string secondsText(double seconds) {
    char text[32];
    std::snprintf(text, sizeof text, "%.3f", seconds);
    return text;
}

} // namespace monitoring

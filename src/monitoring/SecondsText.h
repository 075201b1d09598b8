#pragma once

#include <string>

namespace monitoring {

// Seconds as the metrics and JUnit files write them: three decimals, for
// milliseconds are the finest the run measures to any purpose ("2.500").
std::string secondsText(double seconds);

} // namespace monitoring

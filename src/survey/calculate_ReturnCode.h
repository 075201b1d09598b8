#pragma once

#include <string>
#include <vector>

// Prints the run's overall code on standard error: a line end, the tool's
// name with "ReturnCode: ", a line end, then one digit without line end:
// "8" when no code is "0" (so also for no codes at all), "0" when every code
// is "0", else "4".
void calculate_ReturnCode(std::vector<std::string> const& returnCodes);

// The overall code that calculate_ReturnCode prints: "8", "0" or "4".
char const* get_OverallCode(std::vector<std::string> const& returnCodes);

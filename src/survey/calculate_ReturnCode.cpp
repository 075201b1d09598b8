#include "survey/calculate_ReturnCode.h"

#include "survey/Survey_Files.h"

#include <algorithm>
#include <iostream>

char const* get_OverallCode(std::vector<std::string> const& returnCodes) {
    auto const surveyed = std::count(returnCodes.begin(), returnCodes.end(), "0");
    // Tested first, so that an empty sequence gives "8" too.
    // Kept for the console's scripts: see docs/compatibility.md#overall-code
    if (surveyed == 0) {
        return "8";
    }
    if (static_cast<std::size_t>(surveyed) == returnCodes.size()) {
        return "0";
    }
    return "4";
}

void calculate_ReturnCode(std::vector<std::string> const& returnCodes) {
    std::cerr << std::endl << Quorvex::PYLON::VPD::gc_ProgramName << " ReturnCode: " << std::endl;
    std::cerr << get_OverallCode(returnCodes);
    std::cerr.flush();
}

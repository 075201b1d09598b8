#pragma once

#include <string>
#include <vector>

namespace Quorvex::PYLON::Listing_Utility {

// Runs a console listing tool (tool + arguments, appended without a blank) and
// returns the ";"-separated entries of the first line it prints. The console's
// listing tools print one line; later lines, the exit code and standard error
// are ignored. No output at all gives no entries.
std::vector<std::string> u_run_Listing(std::string const& tool, std::string const& arguments);

} // namespace Quorvex::PYLON::Listing_Utility

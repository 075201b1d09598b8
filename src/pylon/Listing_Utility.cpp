#include "pylon/Listing_Utility.h"

#include "utility/ShellCommand.h"
#include "utility/StringUtility.h"

namespace Quorvex::PYLON::Listing_Utility {

namespace {

constexpr char gc_Entry_Delimiter[] = ";";

} // namespace

std::vector<std::string> u_run_Listing(std::string const& tool, std::string const& arguments) {
    ::Utility::ShellCommand command(tool);
    command.append_Command(arguments);
    command.execute();
    std::vector<std::string> entries;
    // The exit code and standard error are not looked at; only the first line is read.
    // Empty only when the command could not be run at all.
    // Kept for the console's listing tools: see docs/compatibility.md#listing-first-line
    if (command.get_stdout().empty()) {
        return entries;
    }
    ::StringUtility::splitString(command.get_stdout().front(), gc_Entry_Delimiter, entries);
    return entries;
}

} // namespace Quorvex::PYLON::Listing_Utility

#pragma once

#include <CLI/App.hpp>

#include <ostream>
#include <string>

namespace estate {

// The exit statuses of "estate" (sysexits.h), beside 0 for an estate report
// written: its collect folder has no records.json that can be read, or one
// that is not such a file; or an output cannot be written (as the run's); or
// a console's run could not be recorded in the history, every output written
// (as the run's).
inline constexpr int gc_ExitMalformedRecords = 65;
inline constexpr int gc_ExitNoRecords = 66;
inline constexpr int gc_ExitHistoryNotRecorded = 74;

// What "estate --from COLLECT_DIR --report DIR [--history FILE |
// --no-history]" was given.
struct EstateRequest {
    std::string collectFolder;
    std::string reportFolder;
    // The history database the consoles' runs are recorded in; empty for
    // none. The subcommand's default is the run's (history::gc_DefaultHistoryFile).
    std::string historyFile;
};

// Registers the subcommand "estate" on app, filling request when it is
// given; returns it, so that the caller can ask whether it was parsed.
CLI::App* addEstateSubcommand(CLI::App& app, EstateRequest& request);

// Throws a CLI::ValidationError with the reason in plain words when the
// parsed subcommand lacks a folder.
void checkEstateRequest(EstateRequest const& request);

// Merges the collect folder's consoles into the estate report and the
// history, and prints the page's path on out, then one line on errors per
// console that could not be collected, with its record and reason, so that
// no console goes missing in silence, and one per console whose run could
// not be recorded. Returns 0, or a status above with the reason on errors.
int runEstateSubcommand(EstateRequest const& request, std::ostream& out, std::ostream& errors);

} // namespace estate

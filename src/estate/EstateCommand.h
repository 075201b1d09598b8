#pragma once

#include <CLI/App.hpp>

#include <ostream>
#include <string>

namespace estate {

// The exit statuses of "estate" (sysexits.h), beside 0 for an estate report
// written: its collect folder has no records.json that can be read, or one
// that is not such a file; or an output cannot be written (as the run's).
inline constexpr int gc_ExitMalformedRecords = 65;
inline constexpr int gc_ExitNoRecords = 66;

// What "estate --from COLLECT_DIR --report DIR" was given.
struct EstateRequest {
    std::string collectFolder;
    std::string reportFolder;
};

// Registers the subcommand "estate" on app, filling request when it is
// given; returns it, so that the caller can ask whether it was parsed.
CLI::App* addEstateSubcommand(CLI::App& app, EstateRequest& request);

// Throws a CLI::ValidationError with the reason in plain words when the
// parsed subcommand lacks a folder.
void checkEstateRequest(EstateRequest const& request);

// Merges the collect folder's consoles into the estate report and prints the
// page's path on out, then one line on errors per console that could not be
// collected, with its record and reason, so that no console goes missing in
// silence. Returns 0, or a status above with the reason on errors.
int runEstateSubcommand(EstateRequest const& request, std::ostream& out, std::ostream& errors);

} // namespace estate

#pragma once

#include <nlohmann/json.hpp>

#include <optional>
#include <string>

namespace report {

// How the report marks a machine, or a run, whose listing failed.
inline constexpr char gc_ListingFailedName[] = "listing_failed";
inline constexpr char gc_ListingFailedLabel[] = "listing failed";

// A console listing command that failed: the machine listing of --all, or a
// machine's partition listing. The listing code of the single-machine tool
// ignores the command's exit status and standard error, so the failure is
// read back from the trace block that the command runner writes for it.
struct ListingFailure {
    // The command line as run, without the redirections to its output
    // files; empty when it never ran.
    std::string command;
    // nullopt when the command did not end by itself or never ran.
    std::optional<int> exitStatus;
    // The console's first error line (the first non-blank line of standard
    // error, else of standard output), or why there is none.
    std::string message;
};

// The failure of the one listing command whose run a trace holds: a command
// that exited non-zero, or one that never ran (its output files could not be
// made, so the trace has no block of it); nullopt when it exited 0.
std::optional<ListingFailure> listingFailureInTrace(std::string const& trace);

// The command line the trace's listing block ran; empty when it has none.
std::string listingCommandInTrace(std::string const& trace);

// A listing command of the trace that the time limit stopped.
ListingFailure stoppedListing(std::string const& trace, unsigned int timeoutSeconds);

// The summary's "listing_failure" object: command, exit_status, message.
nlohmann::ordered_json listingFailureDocument(ListingFailure const& failure);

// One line for an operator: "<command> exited with status N: <message>".
std::string listingFailureText(ListingFailure const& failure);
// The same for a summary's "listing_failure" object, read as a report reads
// any summary: a missing field is unknown.
std::string listingFailureText(nlohmann::ordered_json const& failure);

} // namespace report

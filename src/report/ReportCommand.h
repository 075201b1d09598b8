#pragma once

#include "report/SinceLastRun.h"

#include <CLI/App.hpp>
#include <nlohmann/json.hpp>

#include <optional>
#include <ostream>
#include <string>

namespace report {

// The console's folder of status files and VPD documents.
inline constexpr char gc_DefaultVpdFolder[] = "/var/adm/quorvex/VPD";
// The name quorvex-survey says its messages under and writes into its summary.
inline constexpr char gc_ProgramName[] = "quorvex-survey";

// The exit status of "report" when its VPD folder gives nothing to read:
// missing, not a folder, unreadable, or holding no status file of a survey
// run. The folder is one of the command's arguments, default or given, so it
// is the status of a bad command line.
inline constexpr int gc_ExitNothingToRead = 64;

// An output (a result folder, the summary, the report, a machine's file)
// cannot be written: sysexits.h's EX_CANTCREAT, for the run and for
// "report" alike.
inline constexpr int gc_ExitCannotCreate = 73;

// What "report [--from VPD_FOLDER] [--history FILE] [--stale-after N] DIR"
// was given.
struct ReportRequest {
    std::string vpdFolder = gc_DefaultVpdFolder;
    std::string folder;
    // The history database whose newest run of the files' console the report
    // compares; none: the report shows no history.
    std::string historyFile;
    int staleAfterRuns = gc_DefaultStaleAfterRuns;
};

// Registers the subcommand "report [--from VPD_FOLDER] DIR" on app, filling
// request when it is given; returns the subcommand, so that the caller can
// ask whether it was parsed. A --from that is no folder is refused while
// parsing with a CLI::ValidationError whose text is the whole reason.
CLI::App* addReportSubcommand(CLI::App& app, ReportRequest& request);

// Throws a CLI::ValidationError with the reason in plain words when the
// parsed subcommand lacks its DIR. Called once the caller has refused what
// the parser could not place, so that a mistyped option is named first.
void checkReportRequest(ReportRequest const& request);

// Registers the option "--report DIR" on app, filling folder when given.
CLI::Option* addReportOption(CLI::App& app, std::string& folder);

// Registers "--stale-after N" on app (the run and "report"): partitions not
// surveyed for N runs in a row are marked stale. Any other value than a whole
// number from 1 to gc_MostStaleAfterRuns is refused while parsing with a
// CLI::ValidationError that says what the option takes.
CLI::Option* addStaleAfterOption(CLI::App& app, int& staleAfterRuns);

// The largest --stale-after: far more runs than a console's history keeps.
inline constexpr int gc_MostStaleAfterRuns = 1000000;

// What --stale-after takes, in the words of the errors ("a whole number of
// runs from 1 to 1000000").
std::string staleAfterWords();

// Writes the report of the survey files in request.vpdFolder into
// request.folder and prints the page's path on out. With
// request.historyFile, the report shows what changed in the newest run the
// history holds of the files' console (their console_host); one line on
// errors says when the history holds none or cannot be read, and the report
// is then written without history. Returns 0;
// gc_ExitCannotCreate with the reason on errors when a file cannot be written; gc_ExitNothingToRead
// with the reason on errors, writing nothing, when the VPD folder gives nothing to read.
int runReportSubcommand(ReportRequest const& request, std::ostream& out, std::ostream& errors);

// Writes the report of a run's summary into folder, its documents lying in
// the console's VPD folder; prints nothing, so that the run's standard
// streams stay what the survey prints. Why it could not be written
// ("report: cannot write PATH: reason"), or nothing when it was.
// With since, the report shows what changed since the last run.
[[nodiscard]] std::optional<std::string>
writeRunReport(nlohmann::ordered_json const& summary, std::string const& folder,
               std::optional<SinceLastRun> const& since = std::nullopt);

} // namespace report

#pragma once

#include "estate/EstateCommand.h"
#include "history/HistoryCommand.h"
#include "history/HistoryDatabase.h"
#include "report/ReportCommand.h"

#include <optional>
#include <string>
#include <vector>

namespace fleet {

// The run's options as given on the command line.
struct Options {
    std::size_t jobs = 8;
    // Seconds one remote action may take; 0 for no limit.
    unsigned int timeoutSeconds = 1800;
    std::string summaryFile;
    // --report DIR: the run's report is written there.
    std::string reportFolder;
    // --stale-after N: the report marks partitions not surveyed for N runs
    // in a row stale.
    int staleAfterRuns = report::gc_DefaultStaleAfterRuns;
    // --metrics FILE: the run's figures for the node exporter's textfile
    // collector; --junit FILE: the run as JUnit XML (src/monitoring).
    std::string metricsFile;
    std::string junitFile;
    bool quiet = false;
    // --recap (true) or --no-recap (false); nullopt: a recap when standard
    // error is a terminal and the run is not quiet.
    std::optional<bool> recap;
    bool all = false;
    // --wait: wait for another run using the same result folder to end,
    // rather than exit with gc_ExitTemporaryFailure.
    bool waitForFolder = false;
    // --history FILE: the database the run is recorded in, unless
    // --no-history turns recordHistory off.
    std::string historyFile = history::gc_DefaultHistoryFile;
    bool recordHistory = true;
    // As given, an identity given more than once kept at its first place.
    std::vector<std::string> identities;
};

// Reads the command line with CLI11. A bad command line prints two lines on
// standard error, its reason in plain words and where the help is, and ends
// the program with 64 before anything runs; --help and --version print on
// standard output and end it with 0.
struct ParsedCommandLine {
    Options options;
    // Set when the program ends here with this status.
    std::optional<int> exitStatus;
    // Warnings to print on standard error before anything else.
    std::vector<std::string> warnings;
    // Set for "report [--from VPD_FOLDER] DIR", which surveys nothing.
    std::optional<report::ReportRequest> reportRequest;
    // Set for "history ACTION [options]", which surveys nothing.
    std::optional<history::HistoryRequest> historyRequest;
    // Set for "estate --from COLLECT_DIR --report DIR", which surveys nothing.
    std::optional<estate::EstateRequest> estateRequest;
};

constexpr int gc_ExitUsage = 64;
using report::gc_ExitCannotCreate;

ParsedCommandLine parseCommandLine(int argc, char const* const* argv);

} // namespace fleet

#include "fleet/CommandLine.h"

#include <CLI/CLI.hpp>

#include <algorithm>
#include <iostream>
#include <set>

namespace fleet {

namespace {

constexpr char gc_ProgramName[] = "quorvex-survey";
constexpr std::size_t gc_MostJobs = 1024;
constexpr unsigned int gc_LongestTimeout = 31536000;

std::string const& versionText() {
    static std::string const text = std::string(gc_ProgramName) + " " + QUORVEX_SURVEY_VERSION;
    return text;
}

// The survey's options; the report subcommand adds its own.
void addSurveyOptions(CLI::App& app, Options& options) {
    // Defaults are shown for the numbers only: CLI11 2.1 reads past the end of
    // an empty list when it captures the identities' default.
    app.add_option("-j,--jobs", options.jobs,
                   "Partitions surveyed at the same time, over all machines (1 = one after the "
                   "other)")
        ->check(CLI::Range(std::size_t{1}, gc_MostJobs))
        ->capture_default_str();
    app.add_option("-t,--timeout", options.timeoutSeconds,
                   "Time limit in seconds of one remote action (0 = none)")
        ->check(CLI::Range(0U, gc_LongestTimeout))
        ->capture_default_str();
    app.add_option("--summary", options.summaryFile,
                   "Write a machine-readable summary of the run (JSON) to this file");
    app.add_flag("-q,--quiet", options.quiet, "No progress display");
    auto* all = app.add_flag("--all", options.all,
                             "Every managed machine the console lists with object type 0");
    auto* identities =
        app.add_option("IDENTITY", options.identities, "Managed machine (type-model_serial)");
    identities->excludes(all);
    report::addReportOption(app, options.reportFolder);
}

// What CLI11 cannot say: a survey needs machines, and no identity is empty.
void checkMachines(Options const& options) {
    if (!options.all && options.identities.empty()) {
        throw CLI::RequiredError("IDENTITY or --all");
    }
    if (std::any_of(options.identities.begin(), options.identities.end(),
                    [](std::string const& identity) { return identity.empty(); })) {
        throw CLI::ValidationError("IDENTITY", "an identity must not be empty");
    }
}

// An identity given more than once is surveyed once, at its first place,
// with one warning.
void keepFirstOfEach(ParsedCommandLine& parsed) {
    std::vector<std::string> kept;
    std::set<std::string> seen;
    std::set<std::string> warned;
    for (auto const& identity : parsed.options.identities) {
        if (seen.insert(identity).second) {
            kept.push_back(identity);
        } else if (warned.insert(identity).second) {
            parsed.warnings.push_back(std::string(gc_ProgramName) + ": warning: " + identity +
                                      " given more than once, surveyed once");
        }
    }
    parsed.options.identities = kept;
}

// The program ends here: --help, --version, or a bad command line.
ParsedCommandLine endingWith(int exitStatus) {
    ParsedCommandLine parsed;
    parsed.exitStatus = exitStatus;
    return parsed;
}

} // namespace

ParsedCommandLine parseCommandLine(int argc, char const* const* argv) {
    ParsedCommandLine parsed;
    CLI::App app{"Surveys the client partitions of the PYLON console's managed machines, "
                 "several partitions at a time.",
                 gc_ProgramName};
    addSurveyOptions(app, parsed.options);
    report::ReportRequest reportRequest;
    CLI::App const* const reportCommand = report::addReportSubcommand(app, reportRequest);
    app.set_version_flag("--version", versionText());
    try {
        app.parse(argc, argv);
        if (reportCommand->parsed()) {
            parsed.reportRequest = reportRequest;
            return parsed;
        }
        checkMachines(parsed.options);
    } catch (CLI::CallForHelp const&) {
        std::cout << app.help();
        return endingWith(0);
    } catch (CLI::CallForVersion const&) {
        std::cout << versionText() << "\n";
        return endingWith(0);
    } catch (CLI::ParseError const& error) {
        std::cerr << gc_ProgramName << ": " << error.what() << "\n" << app.help();
        return endingWith(gc_ExitUsage);
    }
    keepFirstOfEach(parsed);
    return parsed;
}

} // namespace fleet

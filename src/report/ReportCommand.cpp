#include "report/ReportCommand.h"

#include "report/FolderReader.h"
#include "report/JsonMember.h"
#include "report/ReportWriter.h"
#include "report/SinceLastRunReader.h"
#include "utility/SystemError.h"
#include "utility/WholeNumber.h"

#include <CLI/CLI.hpp>
#include <optional>
#include <stdexcept>

namespace report {

namespace {

// Why the report could not be written ("report: cannot write ..."), or nothing.
std::optional<std::string> reportFailure(nlohmann::ordered_json const& summary,
                                         std::string const& vpdFolder, std::string const& folder,
                                         std::optional<SinceLastRun> const& since) {
    try {
        writeReport(summary, vpdFolder, folder, since);
    } catch (std::exception const& failure) {
        return std::string("report: ") + failure.what();
    }
    return std::nullopt;
}

// The summary of the files in vpdFolder; nothing, the reason said on errors,
// when there is nothing to read: an empty report would look like a console
// without machines.
std::optional<nlohmann::ordered_json> readSummaryReporting(std::string const& vpdFolder,
                                                           std::ostream& errors) {
    std::optional<nlohmann::ordered_json> summary;
    try {
        summary = readSummaryFromFolder(vpdFolder);
    } catch (util::SystemError const& failure) {
        errors << gc_ProgramName << ": report: " << failure.what() << "\n";
        return std::nullopt;
    }
    if ((*summary)["machines"].empty()) {
        errors << gc_ProgramName << ": report: " << vpdFolder
               << " holds no status file of a survey run\n";
        return std::nullopt;
    }
    return summary;
}

// The changes of the newest run the history holds of the summary's console;
// nothing, said on errors, when it holds none or cannot be read: the report
// is still worth writing without them.
std::optional<SinceLastRun> newestChanges(ReportRequest const& request,
                                          nlohmann::ordered_json const& summary,
                                          std::ostream& errors) {
    nlohmann::ordered_json const& host = member(summary, "console_host");
    std::string const console = host.is_string() ? host.get<std::string>() : "";
    try {
        std::optional<long long> const run = newestRunOf(request.historyFile, console);
        if (!run) {
            errors << gc_ProgramName << ": report: " << request.historyFile
                   << " holds no run of the console " << console
                   << ": the report shows no changes\n";
            return std::nullopt;
        }
        return readSinceLastRun(request.historyFile, *run, request.staleAfterRuns);
    } catch (util::SystemError const& failure) {
        errors << gc_ProgramName << ": report: " << failure.what()
               << ": the report shows no changes\n";
        return std::nullopt;
    } catch (std::exception const& failure) {
        errors << gc_ProgramName << ": report: cannot read the history " << request.historyFile
               << ": " << failure.what() << ": the report shows no changes\n";
        return std::nullopt;
    }
}

// The number of runs in text, or a refusal that says what the option takes.
int staleAfterValue(std::string const& text) {
    std::optional<unsigned long long> const runs =
        util::wholeNumberWithin(text, 1, gc_MostStaleAfterRuns);
    if (!runs) {
        throw CLI::ValidationError("--stale-after takes " + staleAfterWords() + ", not '" + text +
                                   "'");
    }
    return static_cast<int>(*runs);
}

} // namespace

CLI::App* addReportSubcommand(CLI::App& app, ReportRequest& request) {
    CLI::App* const command =
        app.add_subcommand("report", "write into DIR the report of the files earlier runs left");
    // Whether the folder can be read is checked when it is read, so that the
    // default folder and a given one fail alike.
    command->add_option("--from", request.vpdFolder, "where the status files and VPD documents are")
        ->type_name("VPD_FOLDER")
        ->default_str(gc_DefaultVpdFolder)
        ->multi_option_policy(CLI::MultiOptionPolicy::TakeLast);
    command
        ->add_option("--history", request.historyFile,
                     "show what changed in the newest run FILE holds of this console")
        ->type_name("FILE")
        ->multi_option_policy(CLI::MultiOptionPolicy::TakeLast);
    addStaleAfterOption(*command, request.staleAfterRuns);
    command->add_option("DIR", request.folder, "folder to write the report into");
    return command;
}

void checkReportRequest(ReportRequest const& request) {
    if (request.folder.empty()) {
        throw CLI::ValidationError("no DIR given (the folder to write the report into)");
    }
}

CLI::Option* addReportOption(CLI::App& app, std::string& folder) {
    return app.add_option("--report", folder, "after the run, write its report into DIR")
        ->type_name("DIR")
        ->multi_option_policy(CLI::MultiOptionPolicy::TakeLast);
}

CLI::Option* addStaleAfterOption(CLI::App& app, int& staleAfterRuns) {
    return app
        .add_option_function<std::string>(
            "--stale-after",
            [&staleAfterRuns](std::string const& text) { staleAfterRuns = staleAfterValue(text); },
            "mark partitions not surveyed for N runs in a row stale")
        ->type_name("N")
        ->default_str(std::to_string(gc_DefaultStaleAfterRuns))
        ->multi_option_policy(CLI::MultiOptionPolicy::TakeLast);
}

std::string staleAfterWords() {
    return "a whole number of runs from 1 to " + std::to_string(gc_MostStaleAfterRuns);
}

int runReportSubcommand(ReportRequest const& request, std::ostream& out, std::ostream& errors) {
    std::optional<nlohmann::ordered_json> const summary =
        readSummaryReporting(request.vpdFolder, errors);
    if (!summary) {
        return gc_ExitNothingToRead;
    }
    std::optional<SinceLastRun> const since =
        request.historyFile.empty() ? std::nullopt : newestChanges(request, *summary, errors);
    if (std::optional<std::string> const failure =
            reportFailure(*summary, request.vpdFolder, request.folder, since)) {
        errors << gc_ProgramName << ": " << *failure << "\n";
        return gc_ExitCannotCreate;
    }
    out << request.folder << "/index.html\n";
    return 0;
}

std::optional<std::string> writeRunReport(nlohmann::ordered_json const& summary,
                                          std::string const& folder,
                                          std::optional<SinceLastRun> const& since) {
    return reportFailure(summary, gc_DefaultVpdFolder, folder, since);
}

} // namespace report

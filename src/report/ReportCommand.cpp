#include "report/ReportCommand.h"

#include "report/FolderReader.h"
#include "report/ReportWriter.h"
#include "utility/SystemError.h"

#include <CLI/CLI.hpp>
#include <optional>
#include <stdexcept>

namespace report {

namespace {

// Why the report could not be written ("report: cannot write ..."), or nothing.
std::optional<std::string> reportFailure(nlohmann::ordered_json const& summary,
                                         std::string const& vpdFolder, std::string const& folder) {
    try {
        writeReport(summary, vpdFolder, folder);
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

int runReportSubcommand(ReportRequest const& request, std::ostream& out, std::ostream& errors) {
    std::optional<nlohmann::ordered_json> const summary =
        readSummaryReporting(request.vpdFolder, errors);
    if (!summary) {
        return gc_ExitNothingToRead;
    }
    if (std::optional<std::string> const failure =
            reportFailure(*summary, request.vpdFolder, request.folder)) {
        errors << gc_ProgramName << ": " << *failure << "\n";
        return gc_ExitCannotCreate;
    }
    out << request.folder << "/index.html\n";
    return 0;
}

std::optional<std::string> writeRunReport(nlohmann::ordered_json const& summary,
                                          std::string const& folder) {
    return reportFailure(summary, gc_DefaultVpdFolder, folder);
}

} // namespace report

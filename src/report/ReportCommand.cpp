#include "report/ReportCommand.h"

#include "report/FolderReader.h"
#include "report/ReportWriter.h"

#include <CLI/CLI.hpp>
#include <filesystem>
#include <stdexcept>

namespace report {

namespace {

constexpr char gc_ProgramName[] = "quorvex-survey";

bool writeReportReporting(nlohmann::ordered_json const& summary, std::string const& vpdFolder,
                          std::string const& folder, std::ostream& errors) {
    try {
        writeReport(summary, vpdFolder, folder);
    } catch (std::exception const& failure) {
        errors << gc_ProgramName << ": report: " << failure.what() << "\n";
        return false;
    }
    return true;
}

// The folder is checked here rather than by a parser check, so that a
// refusal says in plain words what is wrong.
void takeVpdFolder(ReportRequest& request, std::string const& folder) {
    std::error_code failure;
    if (!std::filesystem::is_directory(folder, failure)) {
        throw CLI::ValidationError("--from " + folder + ": no such folder");
    }
    request.vpdFolder = folder;
}

} // namespace

CLI::App* addReportSubcommand(CLI::App& app, ReportRequest& request) {
    CLI::App* const command =
        app.add_subcommand("report", "write into DIR the report of the files earlier runs left");
    command
        ->add_option_function<std::string>(
            "--from", [&request](std::string const& folder) { takeVpdFolder(request, folder); },
            "where the status files and VPD documents are")
        ->type_name("VPD_FOLDER")
        ->default_str(defaultVpdFolder)
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
    nlohmann::ordered_json const summary = readSummaryFromFolder(request.vpdFolder);
    if (!writeReportReporting(summary, request.vpdFolder, request.folder, errors)) {
        return 1;
    }
    out << request.folder << "/index.html\n";
    return 0;
}

bool writeRunReport(nlohmann::ordered_json const& summary, std::string const& folder,
                    std::ostream& errors) {
    return writeReportReporting(summary, defaultVpdFolder, folder, errors);
}

} // namespace report

#include "estate/EstateCommand.h"

#include "estate/CollectRecords.h"
#include "estate/EstateWriter.h"
#include "history/HistoryDatabase.h"
#include "report/ReportCommand.h"
#include "utility/SystemError.h"

#include <CLI/CLI.hpp>

#include <optional>

namespace estate {

namespace {

constexpr char gc_Prefix[] = "quorvex-survey: estate: ";

std::optional<Estate> readEstateReporting(std::string const& collectFolder, std::ostream& errors,
                                          int& status) {
    try {
        return readEstate(collectFolder);
    } catch (util::SystemError const& failure) {
        errors << gc_Prefix << failure.what() << "\n";
        status = gc_ExitNoRecords;
    } catch (MalformedInput const& failure) {
        errors << gc_Prefix << failure.what() << "\n";
        status = gc_ExitMalformedRecords;
    }
    return std::nullopt;
}

void reportNotCollected(Estate const& estate, std::ostream& errors) {
    for (ConsoleRun const& console : estate.consoles) {
        if (console.record.kind == RecordKind::Collected) {
            continue;
        }
        errors << gc_Prefix << "console " << console.record.console << ": "
               << textOf(console.record.kind).label
               << (console.record.message.empty() ? "" : ": " + console.record.message) << "\n";
    }
}

// Where the consoles' runs are recorded: the run's database unless told.
void addHistoryOptions(CLI::App& command, EstateRequest& request) {
    request.historyFile = history::gc_DefaultHistoryFile;
    CLI::Option* const history =
        command
            .add_option("--history", request.historyFile,
                        "record each console's run in the history database FILE")
            ->type_name("FILE")
            ->default_str(request.historyFile)
            ->multi_option_policy(CLI::MultiOptionPolicy::TakeLast);
    CLI::Option* const noHistory = command.add_flag_callback(
        "--no-history", [&request] { request.historyFile.clear(); },
        "record nothing in the history database");
    history->excludes(noHistory);
}

} // namespace

CLI::App* addEstateSubcommand(CLI::App& app, EstateRequest& request) {
    CLI::App* const command = app.add_subcommand(
        "estate", "merge the consoles' bundles in COLLECT_DIR into one estate report in DIR");
    command
        ->add_option("--from", request.collectFolder,
                     "the collect folder: records.json and consoles/<name>/ bundles")
        ->type_name("COLLECT_DIR")
        ->multi_option_policy(CLI::MultiOptionPolicy::TakeLast);
    command->add_option("--report", request.reportFolder, "folder to write the estate report into")
        ->type_name("DIR")
        ->multi_option_policy(CLI::MultiOptionPolicy::TakeLast);
    addHistoryOptions(*command, request);
    return command;
}

void checkEstateRequest(EstateRequest const& request) {
    if (request.collectFolder.empty()) {
        throw CLI::ValidationError(
            "no --from COLLECT_DIR given (the folder the collection filled)");
    }
    if (request.reportFolder.empty()) {
        throw CLI::ValidationError(
            "no --report DIR given (the folder to write the estate report into)");
    }
}

int runEstateSubcommand(EstateRequest const& request, std::ostream& out, std::ostream& errors) {
    int status = 0;
    std::optional<Estate> const estate = readEstateReporting(request.collectFolder, errors, status);
    if (!estate) {
        return status;
    }
    EstateHistory history(request.historyFile);
    try {
        writeEstate(*estate, request.reportFolder, history);
    } catch (util::SystemError const& failure) {
        errors << gc_Prefix << failure.what() << "\n";
        return report::gc_ExitCannotCreate;
    }
    out << request.reportFolder << "/index.html\n";
    reportNotCollected(*estate, errors);
    for (std::string const& failure : history.failures()) {
        errors << gc_Prefix << failure << "\n";
    }
    return history.failures().empty() ? 0 : gc_ExitHistoryNotRecorded;
}

} // namespace estate

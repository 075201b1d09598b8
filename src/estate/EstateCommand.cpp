#include "estate/EstateCommand.h"

#include "estate/CollectRecords.h"
#include "estate/EstateWriter.h"
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
    try {
        writeEstate(*estate, request.reportFolder);
    } catch (util::SystemError const& failure) {
        errors << gc_Prefix << failure.what() << "\n";
        return report::gc_ExitCannotCreate;
    }
    out << request.reportFolder << "/index.html\n";
    reportNotCollected(*estate, errors);
    return 0;
}

} // namespace estate

#include "history/HistoryCommand.h"

#include "history/ChangeList.h"
#include "history/HistoryDate.h"
#include "history/HistoryExport.h"
#include "history/HistoryPrune.h"
#include "history/PartitionStory.h"
#include "history/RunList.h"
#include "history/UnusableHistory.h"
#include "report/ReportCommand.h"
#include "utility/AtomicFile.h"
#include "utility/SystemError.h"

#include <CLI/CLI.hpp>

#include <algorithm>
#include <charconv>
#include <functional>
#include <sstream>

namespace history {

namespace {

using Json = nlohmann::ordered_json;

constexpr char gc_Actions[] = "runs, changes, partition, export or prune";
constexpr char gc_DateWords[] =
    "a date (2026-11-01) or an ISO 8601 time (2026-11-01T14:05:09+01:00)";

// The number in text, or a refusal that says what the option takes.
unsigned long long wholeNumber(std::string const& option, std::string const& text,
                               unsigned long long lowest) {
    unsigned long long value = 0;
    char const* const end = text.data() + text.size();
    auto const [stop, failure] = std::from_chars(text.data(), end, value);
    if (text.empty() || failure != std::errc{} || stop != end || value < lowest ||
        value > 1000000000000ULL) {
        throw CLI::ValidationError(option + " takes a whole number" +
                                   (lowest > 0 ? " from " + std::to_string(lowest) : "") +
                                   ", not '" + text + "'");
    }
    return value;
}

void addNumber(CLI::App& command, std::string const& name, unsigned long long lowest,
               std::string const& description, std::function<void(unsigned long long)> set) {
    command
        .add_option_function<std::string>(
            name,
            [set = std::move(set), name, lowest](std::string const& text) {
                set(wholeNumber(name, text, lowest));
            },
            description)
        ->type_name("N")
        ->multi_option_policy(CLI::MultiOptionPolicy::TakeLast);
}

void addCommonOptions(CLI::App& command, HistoryRequest& request, bool withJson) {
    command.add_option("--history", request.file, "the history database")
        ->type_name("FILE")
        ->default_str(gc_DefaultHistoryFile)
        ->multi_option_policy(CLI::MultiOptionPolicy::TakeLast);
    if (withJson) {
        command.add_flag("--json", request.json, "answer in JSON, for scripts");
    }
}

void addConsoleOption(CLI::App& command, HistoryRequest& request) {
    command
        .add_option_function<std::string>(
            "--console", [&request](std::string const& name) { request.console = name; },
            "only this console's runs (as runs list it)")
        ->type_name("NAME")
        ->multi_option_policy(CLI::MultiOptionPolicy::TakeLast);
}

void addTextOption(CLI::App& command, char const* name, std::string& target, char const* valueName,
                   char const* description) {
    command.add_option(name, target, description)
        ->type_name(valueName)
        ->multi_option_policy(CLI::MultiOptionPolicy::TakeLast);
}

// Each action, with the options it takes.
CLI::App* addAction(CLI::App& history, HistoryRequest& request, HistoryAction action,
                    char const* name, char const* description) {
    CLI::App* const command = history.add_subcommand(name, description);
    command->callback([&request, action] { request.action = action; });
    addCommonOptions(*command, request, action != HistoryAction::Export);
    return command;
}

void addActions(CLI::App& history, HistoryRequest& request) {
    CLI::App* const runs = addAction(history, request, HistoryAction::Runs, "runs",
                                     "list the recorded runs, oldest first");
    addConsoleOption(*runs, request);
    addNumber(*runs, "--last", 0, "the newest N runs, 0 for all (default 20)",
              [&request](unsigned long long n) { request.last = n; });
    CLI::App* const changes = addAction(history, request, HistoryAction::Changes, "changes",
                                        "what a run changed (the newest by default), or "
                                        "every run since a date");
    addNumber(*changes, "--run", 1, "the run whose changes are shown",
              [&request](unsigned long long n) { request.run = static_cast<long long>(n); });
    addTextOption(*changes, "--since", request.since, "DATE", "every run started since DATE");
    addConsoleOption(*changes, request);
    CLI::App* const partition = addAction(history, request, HistoryAction::Partition, "partition",
                                          "one partition's outcomes and "
                                          "component changes over time");
    partition->add_option("MACHINE", request.machine, "the machine (type-model_serial)");
    partition->add_option("PARTITION", request.partition, "the partition's host name as listed");
    addConsoleOption(*partition, request);
    CLI::App* const exported = addAction(history, request, HistoryAction::Export, "export",
                                         "write runs, changes or partition results as JSON or CSV");
    addTextOption(*exported, "--format", request.format, "json|csv", "the output's format");
    addTextOption(*exported, "--what", request.what, "runs|changes|partitions",
                  "what is written (default runs)");
    addTextOption(*exported, "--since", request.since, "DATE", "only runs started since DATE");
    addTextOption(*exported, "--output", request.output, "FILE", "write FILE, not standard output");
    addConsoleOption(*exported, request);
    CLI::App* const prune = addAction(history, request, HistoryAction::Prune, "prune",
                                      "remove old runs from the history");
    addNumber(*prune, "--keep", 1, "keep the newest N runs of each console",
              [&request](unsigned long long n) { request.keep = n; });
    addTextOption(*prune, "--before", request.before, "DATE",
                  "remove the runs started before DATE");
}

} // namespace

CLI::App* addHistorySubcommand(CLI::App& app, HistoryRequest& request) {
    CLI::App* const history = app.add_subcommand("history", "what the history database holds: " +
                                                                std::string(gc_Actions));
    addActions(*history, request);
    return history;
}

namespace {

std::optional<long long> momentOf(char const* option, std::string const& text) {
    if (text.empty()) {
        return std::nullopt;
    }
    std::optional<long long> const moment = momentOfDate(text);
    if (!moment) {
        throw CLI::ValidationError(std::string(option) + " takes " + gc_DateWords + ", not '" +
                                   text + "'");
    }
    return moment;
}

void checkExport(HistoryRequest const& request) {
    if (request.format != "json" && request.format != "csv") {
        throw CLI::ValidationError(
            request.format.empty() ? std::string("export needs --format json or --format csv")
                                   : "--format takes json or csv, not '" + request.format + "'");
    }
    if (request.what != "runs" && request.what != "changes" && request.what != "partitions") {
        throw CLI::ValidationError("--what takes runs, changes or partitions, not '" +
                                   request.what + "'");
    }
}

void checkAction(HistoryRequest const& request) {
    if (request.action == HistoryAction::Changes && request.run && !request.since.empty()) {
        throw CLI::ValidationError("--run and --since exclude each other: give one of them");
    }
    if (request.action == HistoryAction::Partition && request.partition.empty()) {
        throw CLI::ValidationError("partition needs MACHINE and PARTITION");
    }
    if (request.action == HistoryAction::Export) {
        checkExport(request);
    }
    if (request.action == HistoryAction::Prune &&
        request.keep.has_value() == !request.before.empty()) {
        throw CLI::ValidationError(request.keep ? "give either --keep or --before, not both"
                                                : "prune needs --keep N or --before DATE");
    }
}

} // namespace

void checkHistoryRequest(CLI::App const& historyCommand, HistoryRequest& request) {
    if (request.action == HistoryAction::None) {
        std::vector<std::string> const words = historyCommand.remaining();
        throw CLI::ValidationError(words.empty() || words.front().rfind('-', 0) == 0
                                       ? std::string("name what to show: ") + gc_Actions
                                       : "unknown history command '" + words.front() + "': use " +
                                             gc_Actions);
    }
    if (request.file.empty()) {
        throw CLI::ValidationError("--history needs a file name, not an empty value");
    }
    checkAction(request);
    request.sinceUnix = momentOf("--since", request.since);
    request.beforeUnix = momentOf("--before", request.before);
}

namespace {

std::string jsonText(Json const& document) {
    return document.dump(2, ' ', false, Json::error_handler_t::replace) + "\n";
}

// The document with the file it was read from first.
Json withFile(std::string const& file, Json const& answer) {
    Json document = {{"file", file}};
    document.update(answer);
    return document;
}

std::string runsAnswer(HistoryRequest const& request, std::size_t width) {
    SQLite::Database database = openHistoryForReading(request.file);
    RunSelection const selection{request.console, request.last};
    return request.json ? jsonText(withFile(request.file, runListJson(database, selection)))
                        : runListText(database, selection, width);
}

std::string changesAnswer(HistoryRequest const& request, std::size_t width) {
    SQLite::Database database = openHistoryForReading(request.file);
    if (request.run && !hasRun(database, *request.run)) {
        throw UnusableHistory("no run " + std::to_string(*request.run) + " in " + request.file,
                              gc_ExitUsage);
    }
    ChangeSelection const selection{request.run, request.sinceUnix, request.since, request.console};
    return request.json ? jsonText(withFile(request.file, changeListJson(database, selection)))
                        : changeListText(database, selection, width);
}

// The console of the partition: the one given, or the only one that
// listed it.
std::string partitionConsole(SQLite::Database& database, HistoryRequest const& request,
                             PartitionSelection const& selection) {
    std::vector<std::string> const consoles = consolesListing(database, selection);
    std::string const named = request.partition + " on " + request.machine;
    if (consoles.empty() || (request.console && std::find(consoles.begin(), consoles.end(),
                                                          *request.console) == consoles.end())) {
        throw UnusableHistory("no run " + (request.console ? "of " + *request.console + " " : "") +
                                  "listed " + named + " in " + request.file,
                              gc_ExitUsage);
    }
    if (!request.console && consoles.size() > 1) {
        std::string list;
        for (std::string const& console : consoles) {
            list += (list.empty() ? "" : ", ") + console;
        }
        throw UnusableHistory(named + " is listed by several consoles (" + list +
                                  "): choose one with --console",
                              gc_ExitUsage);
    }
    return request.console.value_or(consoles.front());
}

std::string partitionAnswer(HistoryRequest const& request, std::size_t width) {
    SQLite::Database database = openHistoryForReading(request.file);
    PartitionSelection selection{request.machine, request.partition, request.console};
    selection.console = partitionConsole(database, request, selection);
    return request.json ? jsonText(withFile(request.file, partitionStoryJson(database, selection)))
                        : partitionStoryText(database, selection, width);
}

std::string exportAnswer(HistoryRequest const& request) {
    SQLite::Database database = openHistoryForReading(request.file);
    ExportSelection const selection{request.format, request.what, request.sinceUnix, request.since,
                                    request.console};
    std::ostringstream text;
    writeExport(database, selection, text);
    if (request.output.empty()) {
        return text.str();
    }
    util::writeFileAtomically(request.output, text.str());
    return "";
}

std::string pruneAnswer(HistoryRequest const& request) {
    SQLite::Database database = openHistoryForWriting(request.file);
    PruneSelection const selection{request.keep, request.beforeUnix, request.before};
    PruneResult const result = pruneRuns(database, selection);
    return request.json ? jsonText(withFile(request.file, pruneJson(result))) : pruneText(result);
}

std::string answer(HistoryRequest const& request, std::size_t width) {
    try {
        switch (request.action) {
        case HistoryAction::Runs:
            return runsAnswer(request, width);
        case HistoryAction::Changes:
            return changesAnswer(request, width);
        case HistoryAction::Partition:
            return partitionAnswer(request, width);
        case HistoryAction::Export:
            return exportAnswer(request);
        default:
            return pruneAnswer(request);
        }
    } catch (SQLite::Exception const& failure) {
        throwUnusable(request.file, failure);
    }
}

} // namespace

int runHistorySubcommand(HistoryRequest const& request, std::ostream& out, std::ostream& errors,
                         std::size_t width) {
    try {
        out << answer(request, width) << std::flush;
    } catch (UnusableHistory const& failure) {
        errors << report::gc_ProgramName << ": history: " << failure.what() << "\n";
        return failure.exitStatus();
    } catch (util::SystemError const& failure) {
        errors << report::gc_ProgramName << ": history: " << failure.what() << "\n";
        return gc_ExitCannotCreate;
    }
    return 0;
}

} // namespace history

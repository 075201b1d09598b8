#include "fleet/ChildProcess.h"
#include "fleet/CommandLine.h"
#include "fleet/MachineListing.h"
#include "fleet/OutputFolders.h"
#include "fleet/ProcessTree.h"
#include "fleet/Recap.h"
#include "fleet/RunFiles.h"
#include "fleet/RunHistory.h"
#include "fleet/RunLock.h"
#include "fleet/SignalPipe.h"
#include "fleet/Summary.h"
#include "fleet/SurveyRun.h"
#include "fleet/TerminalWidth.h"
#include "monitoring/JunitReport.h"
#include "monitoring/RunMetrics.h"
#include "report/ReportCommand.h"
#include "report/RunSummary.h"
#include "utility/AtomicFile.h"
#include "utility/LocalTime.h"
#include "utility/SystemError.h"
#include "utility/Trace.h"

#include <poll.h>
#include <sys/prctl.h>
#include <sys/types.h>
#include <unistd.h>

#include <chrono>
#include <csignal>
#include <ctime>
#include <filesystem>
#include <functional>
#include <iostream>

namespace {

// When the run started, and on which console, for its summary and report.
struct RunClock {
    std::time_t started;
    std::chrono::steady_clock::time_point startedAt;
    std::string consoleHost;
};

// A signal outweighs a file that could not be written, which outweighs a
// console whose machines could not be listed (sysexits.h's EX_UNAVAILABLE),
// which outweighs a history that could not be recorded (EX_IOERR), which
// outweighs the overall code: 128 + signal, then 73, 69, 74, then 0, 4 or 8.
int finalExitStatus(fleet::SurveyRun const& run, std::vector<std::string> const& failures,
                    fleet::MachineListing const& listing, fleet::RunHistory const& history) {
    int const status = run.exitStatus();
    if (status >= 128) {
        return status;
    }
    if (!failures.empty()) {
        return fleet::gc_ExitCannotCreate;
    }
    if (listing.failure) {
        return fleet::gc_ExitUnavailable;
    }
    return history.failure() ? fleet::gc_ExitHistoryNotRecorded : status;
}

// Who holds the result folder, as a second run reads it in the lock file.
std::string holderText() {
    return "PID " + std::to_string(getpid()) + ", started " +
           util::localTimeText(std::time(nullptr));
}

// The holder as a message gives it; a run that has just made the file may
// not have written itself into it yet.
std::string holderOf(fleet::RunLock const& lock) {
    std::string const holder = lock.holder();
    return holder.empty() ? "its PID not written yet" : holder;
}

// One run per result folder, taken before any console command runs: nullopt
// when this run may go on, else its exit status.
std::optional<int> lockResultFolder(fleet::RunLock& lock, bool waitForFolder) {
    if (lock.tryTake(holderText())) {
        return std::nullopt;
    }
    std::string const folder = std::filesystem::path(lock.path()).parent_path().string();
    if (!waitForFolder) {
        std::cerr << report::gc_ProgramName << ": another run uses the result folder " << folder
                  << ": " << holderOf(lock) << " (lock file " << lock.path()
                  << "); try again later, or use --wait" << std::endl;
        return fleet::gc_ExitTemporaryFailure;
    }
    std::cerr << report::gc_ProgramName << ": waiting for the run that uses " << folder << " ("
              << holderOf(lock) << ") to end" << std::endl;
    if (lock.waitToTake(holderText(), fleet::signalPipeDescriptor())) {
        return std::nullopt;
    }
    return 128 + fleet::takeSignal();
}

// The machines to survey: those given, or with --all those the console
// lists. A listing that fails is said at once, in one line.
fleet::MachineListing machinesToSurvey(fleet::Options const& options) {
    if (!options.all) {
        return fleet::MachineListing{options.identities, std::nullopt};
    }
    fleet::MachineListing listing = fleet::listManagedMachines(options.timeoutSeconds);
    if (listing.failure) {
        std::cerr << report::gc_ProgramName << ": cannot list the managed machines: "
                  << report::listingFailureText(*listing.failure) << std::endl;
    }
    return listing;
}

// The summary of the run as it stands, with the exit status it ends with so
// far.
report::RunSummary summaryOf(fleet::Options const& options, fleet::SurveyRun const& run,
                             RunClock const& clock, fleet::MachineListing const& listing) {
    fleet::RunFacts facts;
    facts.listingFailure = listing.failure;
    facts.options = options;
    facts.consoleHost = clock.consoleHost;
    facts.started = util::localTimeText(clock.started);
    facts.ended = util::localTimeText(std::time(nullptr));
    facts.elapsedSeconds =
        std::chrono::duration<double>(std::chrono::steady_clock::now() - clock.startedAt).count();
    if (run.interruptingSignal() != 0) {
        facts.interruptedBy = fleet::signalName(run.interruptingSignal());
    }
    facts.exitStatus = run.exitStatus();
    return fleet::runSummary(facts, run.machines());
}

// The node exporter's textfile collector runs as another user: the metrics
// file is readable by all whatever the run's umask.
constexpr mode_t gc_MetricsFileMode = 0644;

// Writes the text made by textOf to path when one was given, with mode, or
// else the mode a new file gets; what could not be written joins failures.
void writeOutput(std::string const& path, std::function<std::string()> const& textOf,
                 std::optional<mode_t> mode, std::vector<std::string>& failures) {
    if (path.empty()) {
        return;
    }
    try {
        if (mode) {
            util::writeFileAtomically(path, textOf(), *mode);
        } else {
            util::writeFileAtomically(path, textOf());
        }
    } catch (util::SystemError const& failure) {
        failures.emplace_back(failure.what());
    }
}

// The run's figures, as they stand once every other file was written.
// The run's changes as its history computed them, when it recorded the run
// and they can be read back; else nothing, which the metrics leave out
// rather than claim that nothing changed.
std::optional<monitoring::RunChanges> changesOf(fleet::RunHistory const& history) {
    std::optional<report::HistoryRecord> const& record = history.member();
    if (!record || !record->runId) {
        return std::nullopt;
    }
    try {
        return monitoring::runChangesOf(record->file, *record->runId);
    } catch (std::exception const&) {
        return std::nullopt;
    }
}

std::string metricsTextOf(report::RunSummary const& summary, RunClock const& clock, int exitStatus,
                          fleet::RunHistory const& history) {
    monitoring::RunEnding ending;
    ending.startedUnix = clock.started;
    ending.endedUnix = std::time(nullptr);
    ending.durationSeconds =
        std::chrono::duration<double>(std::chrono::steady_clock::now() - clock.startedAt).count();
    ending.exitStatus = exitStatus;
    ending.historyRecorded = history.member() && history.member()->recorded;
    ending.changes = changesOf(history);
    return monitoring::metricsText(summary, ending);
}

// The history first (the status files and traces are written by now), then
// the report, which shows the run's changes, the JUnit file, then the
// summary, so that the summary's exit status counts a report or JUnit file
// that could not be written; the metrics last, so that they carry the run's
// final exit status. Returns
// what could not be written, "cannot write PATH: reason" each.
std::vector<std::string> writeRunFiles(fleet::Options const& options, fleet::SurveyRun const& run,
                                       RunClock const& clock, fleet::MachineListing const& listing,
                                       fleet::RunHistory& history) {
    std::vector<std::string> failures = run.writeFailures();
    report::RunSummary summary = summaryOf(options, run, clock, listing);
    // The history's and the report's copies of the summary tell the same
    // exit status as the run, but for a file written after them, which they
    // cannot know.
    summary.exitStatus = finalExitStatus(run, failures, listing, history);
    history.record(summary);
    summary.history = history.member();
    summary.exitStatus = finalExitStatus(run, failures, listing, history);
    if (!options.reportFolder.empty()) {
        if (std::optional<std::string> const failure =
                report::writeRunReport(report::summaryDocument(summary), options.reportFolder,
                                       history.sinceLastRun(options.staleAfterRuns))) {
            failures.push_back(*failure);
        }
    }
    writeOutput(
        options.junitFile, [&summary] { return monitoring::junitText(summary); }, std::nullopt,
        failures);
    summary.exitStatus = finalExitStatus(run, failures, listing, history);
    writeOutput(
        options.summaryFile,
        [&summary] { return report::summaryText(report::summaryDocument(summary)); }, std::nullopt,
        failures);
    int const exitStatus = finalExitStatus(run, failures, listing, history);
    writeOutput(
        options.metricsFile, [&] { return metricsTextOf(summary, clock, exitStatus, history); },
        gc_MetricsFileMode, failures);
    return failures;
}

// The console's host name when the run writes a summary or report or records
// its history (which knows a console by it), asked in
// a child process once every unit of work has ended: the host name command
// runs through system(), which ignores SIGINT in its caller meanwhile, and a
// signal then must still reach the run. Asked here when no child can be made.
std::string consoleHostFor(fleet::Options const& options) {
    if (options.summaryFile.empty() && options.reportFolder.empty() && !options.recordHistory &&
        options.metricsFile.empty() && options.junitFile.empty()) {
        return {};
    }
    fleet::ChildProcess child([] { return Utility::get_HostName(); });
    if (!child.isStarted()) {
        return Utility::get_HostName();
    }
    while (child.readAvailable()) {
        pollfd result{child.resultDescriptor(), POLLIN, 0};
        // A signal ends the wait early; it is noted once the name is known.
        ::poll(&result, 1, -1);
    }
    return child.takeResult();
}

// Writes the run's last files. A signal that comes while they are written
// makes them be written again saying so; once they are in place the
// signals are held, and the run is finished.
std::vector<std::string> finishRun(fleet::Options const& options, fleet::SurveyRun& run,
                                   RunClock clock, fleet::MachineListing const& listing,
                                   fleet::RunHistory& history) {
    clock.consoleHost = consoleHostFor(options);
    run.noteSignal();
    int const signalSeen = run.interruptingSignal();
    std::vector<std::string> failures = writeRunFiles(options, run, clock, listing, history);
    fleet::holdSignals();
    run.noteSignal();
    if (run.interruptingSignal() != signalSeen) {
        failures = writeRunFiles(options, run, clock, listing, history);
    }
    return failures;
}

// The recap of the run, when one is wanted: by default only for a person at
// a terminal, so that scripts read the blocks alone.
std::string recapText(fleet::Options const& options, fleet::SurveyRun const& run,
                      RunClock const& clock) {
    if (!options.recap.value_or(!options.quiet && isatty(STDERR_FILENO) == 1)) {
        return "";
    }
    fleet::RecapEnding ending;
    ending.elapsedSeconds =
        std::chrono::duration<double>(std::chrono::steady_clock::now() - clock.startedAt).count();
    if (run.interruptingSignal() != 0) {
        ending.interruptedBy = fleet::signalName(run.interruptingSignal());
    }
    ending.summaryFile = options.summaryFile;
    ending.reportFolder = options.reportFolder;
    return fleet::Recap(run.machines()).text(ending, fleet::terminalColumns(STDERR_FILENO));
}

// Diagnostics, then the recap, after the machines' blocks, on lines of their
// own, though the last block ends with its code digit and no line end.
void printAfterBlocks(fleet::SurveyRun const& run, std::vector<std::string> const& messages,
                      std::string const& recap) {
    if (messages.empty() && recap.empty()) {
        return;
    }
    if (run.endsOnOpenRow()) {
        std::cerr << "\n";
    }
    for (std::string const& message : messages) {
        std::cerr << report::gc_ProgramName << ": " << message << "\n";
    }
    std::cerr << recap << std::flush;
}

// What ends the run's standard error: the files that could not be written,
// the history that could not be recorded, then, for a run stopped by SIGHUP
// or SIGPIPE, which nobody sends on purpose (a closed terminal, a reader
// gone), why it stopped. SIGINT and SIGTERM are asked for, and the summary
// records every one.
std::vector<std::string> closingMessages(fleet::SurveyRun const& run,
                                         std::vector<std::string> messages,
                                         fleet::RunHistory const& history) {
    if (std::optional<std::string> const failure = history.failure()) {
        messages.push_back(*failure);
    }
    int const signalNumber = run.interruptingSignal();
    if (signalNumber == SIGHUP || signalNumber == SIGPIPE) {
        messages.push_back(std::string("stopped by ") + fleet::signalName(signalNumber));
    }
    return messages;
}

// Each output that cannot be written is said before anything runs.
bool areOutputsWritable(fleet::Options const& options) {
    std::vector<std::string> const failures = fleet::unwritableOutputs(options);
    for (std::string const& failure : failures) {
        std::cerr << report::gc_ProgramName << ": " << failure << std::endl;
    }
    return failures.empty();
}

// The exit status of the subcommand given, which surveys nothing; nullopt
// for a survey.
std::optional<int> runSubcommand(fleet::ParsedCommandLine const& parsed) {
    if (parsed.reportRequest) {
        return report::runReportSubcommand(*parsed.reportRequest, std::cout, std::cerr);
    }
    if (parsed.historyRequest) {
        return history::runHistorySubcommand(*parsed.historyRequest, std::cout, std::cerr,
                                             fleet::terminalColumns(STDOUT_FILENO));
    }
    if (parsed.estateRequest) {
        return estate::runEstateSubcommand(*parsed.estateRequest, std::cout, std::cerr);
    }
    return std::nullopt;
}

} // namespace

int main(int argc, char** argv) {
    auto const parsed = fleet::parseCommandLine(argc, argv);
    if (parsed.exitStatus) {
        return *parsed.exitStatus;
    }
    if (std::optional<int> const status = runSubcommand(parsed)) {
        return *status;
    }
    for (auto const& warning : parsed.warnings) {
        std::cerr << warning << std::endl;
    }
    fleet::Options const& options = parsed.options;
    if (!areOutputsWritable(options)) {
        return fleet::gc_ExitCannotCreate;
    }
    // What a dying worker leaves comes to this process, which ends it.
    prctl(PR_SET_CHILD_SUBREAPER, 1);
    if (std::optional<std::string> const failure = fleet::installSignalPipe()) {
        std::cerr << report::gc_ProgramName << ": " << *failure << std::endl;
    }
    fleet::RunLock lock(fleet::runLockPath());
    if (std::optional<int> const refused = lockResultFolder(lock, options.waitForFolder)) {
        return *refused;
    }
    // What a run killed by SIGKILL left, now that no other run writes there.
    fleet::removeTracePiecesOfEndedRuns(fleet::traceFolder());
    RunClock const clock{std::time(nullptr), std::chrono::steady_clock::now(), {}};
    fleet::MachineListing const listing = machinesToSurvey(options);
    fleet::SurveyRun run(options, listing.identities);
    run.run();
    fleet::RunHistory history(options);
    std::vector<std::string> const failures = finishRun(options, run, clock, listing, history);
    // Nothing the run started outlives it.
    fleet::endChildrenExcept({});
    printAfterBlocks(run, closingMessages(run, failures, history), recapText(options, run, clock));
    return finalExitStatus(run, failures, listing, history);
}

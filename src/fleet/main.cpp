#include "fleet/ChildProcess.h"
#include "fleet/CommandLine.h"
#include "fleet/OutputFolders.h"
#include "fleet/ProcessTree.h"
#include "fleet/Recap.h"
#include "fleet/SignalPipe.h"
#include "fleet/Summary.h"
#include "fleet/SurveyRun.h"
#include "fleet/TerminalWidth.h"
#include "fleet/TimeLimits.h"
#include "fleet/WorkUnits.h"
#include "fleet/WorkerPool.h"
#include "report/ReportCommand.h"
#include "report/RunSummary.h"
#include "utility/AtomicFile.h"
#include "utility/LocalTime.h"
#include "utility/SystemError.h"
#include "utility/Trace.h"

#include <poll.h>
#include <sys/prctl.h>
#include <unistd.h>

#include <chrono>
#include <csignal>
#include <ctime>
#include <iostream>

namespace {

// When the run started, and on which console, for its summary and report.
struct RunClock {
    std::time_t started;
    std::chrono::steady_clock::time_point startedAt;
    std::string consoleHost;
};

// A signal outweighs a file that could not be written, which outweighs the
// overall code: 128 + signal, then 73, then 0, 4 or 8.
int finalExitStatus(fleet::SurveyRun const& run, std::vector<std::string> const& failures) {
    int const status = run.exitStatus();
    return status < 128 && !failures.empty() ? fleet::gc_ExitCannotCreate : status;
}

// The console's managed machines, listed in a worker of its own so that this
// process never writes through the survey code's trace. A listing action that
// runs past the time limit, or an interruption, stops the listing with
// everything it started, and it never goes on: the run then has no machines.
std::vector<std::string> listManagedMachines(unsigned int timeoutSeconds) {
    fleet::WorkerPool pool(fleet::signalPipeDescriptor());
    fleet::TimeLimits limits(timeoutSeconds);
    if (std::optional<std::string> const failure =
            pool.start(0, fleet::UnitKind::MachineListing, &fleet::listMachines)) {
        std::cerr << report::gc_ProgramName << ": cannot list the managed machines: " << *failure
                  << std::endl;
        return {};
    }
    while (true) {
        std::vector<fleet::WorkerEvent> const ended = pool.waitForEvents();
        if (!ended.empty()) {
            return fleet::decodeMachines(ended.front().text);
        }
        limits.interrupt(fleet::takeSignal());
        if (!pool.stopDueActions(limits).empty() || limits.isInterrupted()) {
            // The pool ends the stopped worker with everything it started.
            return {};
        }
    }
}

// The summary of the run as it stands, with the exit status it ends with so
// far.
report::RunSummary summaryOf(fleet::Options const& options, fleet::SurveyRun const& run,
                             RunClock const& clock) {
    fleet::RunFacts facts;
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

// The report first, then the summary, so that the summary's exit status
// counts a report that could not be written. Returns what could not be
// written, "cannot write PATH: reason" each.
std::vector<std::string> writeRunFiles(fleet::Options const& options, fleet::SurveyRun const& run,
                                       RunClock const& clock) {
    std::vector<std::string> failures = run.writeFailures();
    report::RunSummary summary = summaryOf(options, run, clock);
    if (!options.reportFolder.empty()) {
        if (std::optional<std::string> const failure =
                report::writeRunReport(report::summaryDocument(summary), options.reportFolder)) {
            failures.push_back(*failure);
        }
    }
    summary.exitStatus = finalExitStatus(run, failures);
    try {
        if (!options.summaryFile.empty()) {
            util::writeFileAtomically(options.summaryFile,
                                      report::summaryText(report::summaryDocument(summary)));
        }
    } catch (util::SystemError const& failure) {
        failures.emplace_back(failure.what());
    }
    return failures;
}

// The console's host name when the run writes a summary or report, asked in
// a child process once every unit of work has ended: the host name command
// runs through system(), which ignores SIGINT in its caller meanwhile, and a
// signal then must still reach the run. Asked here when no child can be made.
std::string consoleHostFor(fleet::Options const& options) {
    if (options.summaryFile.empty() && options.reportFolder.empty()) {
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
                                   RunClock clock) {
    clock.consoleHost = consoleHostFor(options);
    run.noteSignal();
    int const signalSeen = run.interruptingSignal();
    std::vector<std::string> failures = writeRunFiles(options, run, clock);
    fleet::holdSignals();
    run.noteSignal();
    if (run.interruptingSignal() != signalSeen) {
        failures = writeRunFiles(options, run, clock);
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
// then, for a run stopped by SIGHUP or SIGPIPE, which nobody sends on
// purpose (a closed terminal, a reader gone), why it stopped. SIGINT and
// SIGTERM are asked for, and the summary records every one.
std::vector<std::string> closingMessages(fleet::SurveyRun const& run,
                                         std::vector<std::string> messages) {
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

} // namespace

int main(int argc, char** argv) {
    auto const parsed = fleet::parseCommandLine(argc, argv);
    if (parsed.exitStatus) {
        return *parsed.exitStatus;
    }
    if (parsed.reportRequest) {
        return report::runReportSubcommand(*parsed.reportRequest, std::cout, std::cerr);
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
    RunClock const clock{std::time(nullptr), std::chrono::steady_clock::now(), {}};
    std::vector<std::string> const identities =
        options.all ? listManagedMachines(options.timeoutSeconds) : options.identities;
    fleet::SurveyRun run(options, identities);
    run.run();
    std::vector<std::string> const failures = finishRun(options, run, clock);
    // Nothing the run started outlives it.
    fleet::endChildrenExcept({});
    printAfterBlocks(run, closingMessages(run, failures), recapText(options, run, clock));
    return finalExitStatus(run, failures);
}

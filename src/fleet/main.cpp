#include "fleet/CommandLine.h"
#include "fleet/ProcessTree.h"
#include "fleet/SignalPipe.h"
#include "fleet/Summary.h"
#include "fleet/SurveyRun.h"
#include "fleet/TimeLimits.h"
#include "fleet/WorkUnits.h"
#include "fleet/WorkerPool.h"
#include "report/ReportCommand.h"
#include "report/RunSummary.h"
#include "utility/AtomicFile.h"
#include "utility/LocalTime.h"
#include "utility/SystemError.h"
#include "utility/Trace.h"

#include <sys/prctl.h>

#include <chrono>
#include <ctime>
#include <iostream>
#include <sstream>

namespace {

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

// The summary and the report of a run that has ended. What cannot be
// written is said in messages, one line each.
void writeRunFiles(fleet::Options const& options, fleet::SurveyRun const& run, int exitStatus,
                   std::time_t started, std::chrono::steady_clock::time_point startedAt,
                   std::ostream& messages) {
    fleet::RunFacts facts;
    facts.options = options;
    // Every unit of work has ended: the host name command may trace here.
    facts.consoleHost = Utility::get_HostName();
    facts.started = util::localTimeText(started);
    facts.ended = util::localTimeText(std::time(nullptr));
    facts.elapsedSeconds =
        std::chrono::duration<double>(std::chrono::steady_clock::now() - startedAt).count();
    if (run.interruptingSignal() != 0) {
        facts.interruptedBy = fleet::signalName(run.interruptingSignal());
    }
    facts.exitStatus = exitStatus;
    nlohmann::ordered_json const summary =
        report::summaryDocument(fleet::runSummary(facts, run.machines()));
    try {
        if (!options.summaryFile.empty()) {
            util::writeFileAtomically(options.summaryFile, report::summaryText(summary));
        }
    } catch (util::SystemError const& failure) {
        messages << report::gc_ProgramName << ": " << failure.what() << "\n";
    }
    if (!options.reportFolder.empty()) {
        report::writeRunReport(summary, options.reportFolder, messages);
    }
}

// Diagnostics after the machines' blocks, each on a line of its own,
// though the last block ends with its code digit and no line end.
void printAfterBlocks(fleet::SurveyRun const& run, std::string const& messages) {
    if (messages.empty()) {
        return;
    }
    if (run.endsOnOpenRow()) {
        std::cerr << "\n";
    }
    std::cerr << messages << std::flush;
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
    // What a dying worker leaves comes to this process, which ends it.
    prctl(PR_SET_CHILD_SUBREAPER, 1);
    if (std::optional<std::string> const failure = fleet::installSignalPipe()) {
        std::cerr << report::gc_ProgramName << ": " << *failure << std::endl;
    }
    auto const startedAt = std::chrono::steady_clock::now();
    std::time_t const started = std::time(nullptr);

    fleet::Options const& options = parsed.options;
    std::vector<std::string> const identities =
        options.all ? listManagedMachines(options.timeoutSeconds) : options.identities;
    fleet::SurveyRun run(options, identities);
    int const exitStatus = run.run();

    std::ostringstream messages;
    if (!options.summaryFile.empty() || !options.reportFolder.empty()) {
        writeRunFiles(options, run, exitStatus, started, startedAt, messages);
    }
    printAfterBlocks(run, messages.str());
    // Nothing the run started outlives it.
    fleet::endChildrenExcept({});
    return exitStatus;
}

#include "fleet/CommandLine.h"
#include "fleet/RunFiles.h"
#include "fleet/SignalPipe.h"
#include "fleet/Summary.h"
#include "fleet/SurveyRun.h"
#include "fleet/TimeLimits.h"
#include "fleet/WorkUnits.h"
#include "fleet/WorkerPool.h"
#include "report/ReportCommand.h"
#include "report/RunSummary.h"
#include "utility/LocalTime.h"
#include "utility/Trace.h"

#include <chrono>
#include <ctime>
#include <iostream>

namespace {

// The console's managed machines, listed in a worker of its own so that this
// process never writes through the survey code's trace. A listing action that
// runs past the time limit, or an interruption, stops the listing with
// everything it started, and it never goes on: the run then has no machines.
std::vector<std::string> listManagedMachines(unsigned int timeoutSeconds) {
    Fleet::WorkerPool pool(Fleet::signalPipeDescriptor());
    Fleet::TimeLimits limits(timeoutSeconds);
    if (std::optional<std::string> const failure =
            pool.start(0, Fleet::UnitKind::MachineListing, &Fleet::listMachines)) {
        std::cerr << "quorvex-survey: cannot list the managed machines: " << *failure << std::endl;
        return {};
    }
    while (true) {
        std::vector<Fleet::WorkerEvent> const ended = pool.waitForEvents();
        if (!ended.empty()) {
            return Fleet::decodeMachines(ended.front().text);
        }
        limits.interrupt(Fleet::takeSignal());
        if (!pool.stopDueActions(limits).empty() || limits.isInterrupted()) {
            // The pool ends the stopped worker with everything it started.
            return {};
        }
    }
}

void writeSummary(Fleet::RunFacts const& facts, nlohmann::ordered_json const& summary) {
    std::string const text = report::summaryText(summary);
    if (!Fleet::RunFiles::writeAtomically(facts.options.summaryFile, text)) {
        std::cerr << "quorvex-survey: cannot write the summary to " << facts.options.summaryFile
                  << std::endl;
    }
}

// The summary and the report of a run that has ended.
void writeRunFiles(Fleet::Options const& options, Fleet::SurveyRun const& run, int exitStatus,
                   std::time_t started, std::chrono::steady_clock::time_point startedAt) {
    Fleet::RunFacts facts;
    facts.options = options;
    // Every unit of work has ended: the host name command may trace here.
    facts.consoleHost = Utility::get_HostName();
    facts.started = util::localTimeText(started);
    facts.ended = util::localTimeText(std::time(nullptr));
    facts.elapsedSeconds =
        std::chrono::duration<double>(std::chrono::steady_clock::now() - startedAt).count();
    if (run.interruptingSignal() != 0) {
        facts.interruptedBy = Fleet::signalName(run.interruptingSignal());
    }
    facts.exitStatus = exitStatus;
    nlohmann::ordered_json const summary =
        report::summaryDocument(Fleet::runSummary(facts, run.machines()));
    if (!options.summaryFile.empty()) {
        writeSummary(facts, summary);
    }
    if (!options.reportFolder.empty()) {
        report::writeRunReport(summary, options.reportFolder, std::cerr);
    }
}

} // namespace

int main(int argc, char** argv) {
    auto const parsed = Fleet::CommandLine::parse(argc, argv);
    if (parsed.exitStatus) {
        return *parsed.exitStatus;
    }
    if (parsed.reportRequest) {
        return report::runReportSubcommand(*parsed.reportRequest, std::cout, std::cerr);
    }
    for (auto const& warning : parsed.warnings) {
        std::cerr << warning << std::endl;
    }
    if (std::optional<std::string> const failure = Fleet::installSignalPipe()) {
        std::cerr << "quorvex-survey: " << *failure << std::endl;
    }
    auto const startedAt = std::chrono::steady_clock::now();
    std::time_t const started = std::time(nullptr);

    Fleet::Options const& options = parsed.options;
    std::vector<std::string> const identities =
        options.all ? listManagedMachines(options.timeoutSeconds) : options.identities;
    Fleet::SurveyRun run(options, identities);
    int const exitStatus = run.run();

    if (!options.summaryFile.empty() || !options.reportFolder.empty()) {
        writeRunFiles(options, run, exitStatus, started, startedAt);
    }
    return exitStatus;
}

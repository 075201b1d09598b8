#include "fleet/ChildProcess.h"
#include "fleet/CommandLine.h"
#include "fleet/ProcessTree.h"
#include "fleet/RunFiles.h"
#include "fleet/SignalPipe.h"
#include "fleet/Summary.h"
#include "fleet/SurveyRun.h"
#include "fleet/WorkUnits.h"
#include "report/ReportCommand.h"
#include "report/RunSummary.h"
#include "utility/LocalTime.h"
#include "utility/Trace.h"

#include <poll.h>

#include <chrono>
#include <csignal>
#include <ctime>
#include <iostream>

namespace {

constexpr int gc_PollMilliseconds = 50;

// The console's managed machines, listed in a child of its own so that this
// process never writes through the survey code's trace. A listing that runs
// past the time limit, or an interruption, stops it with everything it
// started; the run then has no machines.
std::vector<std::string> listManagedMachines(unsigned int timeoutSeconds) {
    Fleet::ChildProcess lister(&Fleet::WorkUnits::listMachines);
    if (!lister.isStarted()) {
        return {};
    }
    auto const started = std::chrono::steady_clock::now();
    while (lister.readAvailable()) {
        pollfd descriptors[] = {{lister.resultDescriptor(), POLLIN, 0},
                                {Fleet::SignalPipe::readDescriptor(), POLLIN, 0}};
        poll(descriptors, 2, gc_PollMilliseconds);
        std::chrono::duration<double> const elapsed = std::chrono::steady_clock::now() - started;
        bool const overLimit = timeoutSeconds > 0 && elapsed.count() >= timeoutSeconds;
        if (overLimit || Fleet::SignalPipe::takeSignal() != 0) {
            int status = 0;
            if (Fleet::ProcessTree::stopChild(lister.pid(), status)) {
                Fleet::ProcessTree::killDescendants(lister.pid());
                lister.killAndReap();
            } else {
                lister.markReaped();
            }
            return {};
        }
    }
    lister.killAndReap();
    return Fleet::WorkUnits::decodeMachines(lister.result());
}

void writeSummary(Fleet::RunFacts const& facts, nlohmann::ordered_json const& summary) {
    std::string const text = report::summaryText(summary);
    if (!Fleet::RunFiles::writeAtomically(facts.options.summaryFile, text)) {
        std::cerr << "quorvex-survey: cannot write the summary to " << facts.options.summaryFile
                  << std::endl;
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
    Fleet::SignalPipe::install();
    auto const startedAt = std::chrono::steady_clock::now();
    std::time_t const started = std::time(nullptr);

    Fleet::Options const& options = parsed.options;
    std::vector<std::string> const identities =
        options.all ? listManagedMachines(options.timeoutSeconds) : options.identities;
    Fleet::SurveyRun run(options, identities);
    int const exitStatus = run.run();

    if (!options.summaryFile.empty() || !options.reportFolder.empty()) {
        Fleet::RunFacts facts;
        facts.options = options;
        // Every unit of work has ended: the host name command may trace here.
        facts.consoleHost = Utility::get_HostName();
        facts.started = util::localTimeText(started);
        facts.ended = util::localTimeText(std::time(nullptr));
        facts.elapsedSeconds =
            std::chrono::duration<double>(std::chrono::steady_clock::now() - startedAt).count();
        if (run.interruptingSignal() != 0) {
            facts.interruptedBy = run.interruptingSignal() == SIGTERM ? "SIGTERM" : "SIGINT";
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
    return exitStatus;
}

#include "fleet/ChildProcess.h"
#include "fleet/CommandLine.h"
#include "fleet/RunFiles.h"
#include "fleet/SignalPipe.h"
#include "fleet/Summary.h"
#include "fleet/SurveyRun.h"
#include "fleet/WorkUnits.h"
#include "utility/Trace.h"

#include <poll.h>

#include <chrono>
#include <csignal>
#include <ctime>
#include <iostream>

namespace {

// The console's managed machines, listed in a child of its own so that this
// process never writes through the survey code's trace.
std::vector<std::string> listManagedMachines() {
    Fleet::ChildProcess lister(&Fleet::WorkUnits::listMachines);
    if (!lister.isStarted()) {
        return {};
    }
    while (lister.readAvailable()) {
        pollfd descriptor{lister.resultDescriptor(), POLLIN, 0};
        poll(&descriptor, 1, -1);
    }
    lister.killAndReap();
    return Fleet::WorkUnits::decodeMachines(lister.result());
}

void writeSummary(Fleet::RunFacts const& facts, Fleet::SurveyRun const& run) {
    std::string const text = Fleet::Summary::text(Fleet::Summary::build(facts, run.machines()));
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
    for (auto const& warning : parsed.warnings) {
        std::cerr << warning << std::endl;
    }
    Fleet::SignalPipe::install();
    auto const startedAt = std::chrono::steady_clock::now();
    std::time_t const started = std::time(nullptr);

    Fleet::Options const& options = parsed.options;
    std::vector<std::string> const identities =
        options.all ? listManagedMachines() : options.identities;
    Fleet::SurveyRun run(options, identities);
    int const exitStatus = run.run();

    if (!options.summaryFile.empty()) {
        Fleet::RunFacts facts;
        facts.options = options;
        // Every unit of work has ended: the host name command may trace here.
        facts.consoleHost = Utility::get_HostName();
        facts.started = Fleet::Summary::localTime(started);
        facts.ended = Fleet::Summary::localTime(std::time(nullptr));
        facts.elapsedSeconds =
            std::chrono::duration<double>(std::chrono::steady_clock::now() - startedAt).count();
        if (run.interruptingSignal() != 0) {
            facts.interruptedBy = run.interruptingSignal() == SIGTERM ? "SIGTERM" : "SIGINT";
        }
        facts.returnCode = run.overallCode();
        facts.exitStatus = exitStatus;
        writeSummary(facts, run);
    }
    return exitStatus;
}

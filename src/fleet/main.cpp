#include "fleet/CommandLine.h"
#include "fleet/MachineListing.h"
#include "fleet/RunFiles.h"
#include "fleet/RunLock.h"
#include "fleet/SignalPipe.h"
#include "fleet/Summary.h"
#include "fleet/SurveyRun.h"
#include "report/ReportCommand.h"
#include "report/RunSummary.h"
#include "utility/AtomicFile.h"
#include "utility/LocalTime.h"
#include "utility/SystemError.h"
#include "utility/Trace.h"

#include <unistd.h>

#include <chrono>
#include <ctime>
#include <filesystem>
#include <iostream>
#include <sstream>

namespace {

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

// A console whose machines cannot be listed is unavailable (sysexits.h's
// EX_UNAVAILABLE), unless a signal ended the run first.
int exitStatusOf(fleet::SurveyRun const& run, int runStatus, fleet::MachineListing const& listing) {
    return listing.failure && run.interruptingSignal() == 0 ? fleet::gc_ExitUnavailable : runStatus;
}

// The summary and the report of a run that has ended. What cannot be
// written is said in messages, one line each.
void writeRunFiles(fleet::Options const& options, fleet::SurveyRun const& run, int exitStatus,
                   std::time_t started, std::chrono::steady_clock::time_point startedAt,
                   std::optional<report::ListingFailure> const& listingFailure,
                   std::ostream& messages) {
    fleet::RunFacts facts;
    facts.listingFailure = listingFailure;
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
    if (std::optional<std::string> const failure = fleet::installSignalPipe()) {
        std::cerr << report::gc_ProgramName << ": " << *failure << std::endl;
    }
    fleet::RunLock lock(fleet::runLockPath());
    if (std::optional<int> const refused = lockResultFolder(lock, parsed.options.waitForFolder)) {
        return *refused;
    }
    auto const startedAt = std::chrono::steady_clock::now();
    std::time_t const started = std::time(nullptr);

    fleet::Options const& options = parsed.options;
    fleet::MachineListing const listing = machinesToSurvey(options);
    fleet::SurveyRun run(options, listing.identities);
    int const exitStatus = exitStatusOf(run, run.run(), listing);

    std::ostringstream messages;
    if (!options.summaryFile.empty() || !options.reportFolder.empty()) {
        writeRunFiles(options, run, exitStatus, started, startedAt, listing.failure, messages);
    }
    printAfterBlocks(run, messages.str());
    return exitStatus;
}

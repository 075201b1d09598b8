#pragma once

#include "fleet/CommandLine.h"
#include "fleet/MachineOutput.h"
#include "fleet/Progress.h"
#include "fleet/ProgressLine.h"
#include "fleet/RunRecords.h"
#include "fleet/Scheduler.h"
#include "fleet/TimeLimits.h"
#include "fleet/WorkerPool.h"

#include <chrono>
#include <optional>
#include <string>
#include <vector>

namespace fleet {

// One console-wide survey: lists each machine and surveys its partitions,
// each unit of work in a forked process of its own, at most `jobs` at once;
// stops remote actions that run past the time limit; prints each machine's
// block, writes its status file and joins its trace as soon as it and every
// machine before it are done. SIGINT, SIGTERM, SIGHUP and SIGPIPE stop the run as documented
// in quorvex-survey(8). It coordinates: the Scheduler says what starts, the
// WorkerPool runs it, the TimeLimits say what to stop, MachineOutput writes
// what is done and ProgressLine shows how far the run is; the records are
// kept here.
class SurveyRun {
public:
    SurveyRun(Options options, std::vector<std::string> const& identities);

    // Runs to the end and returns exitStatus().
    int run();
    // Takes a signal that came since the last look: the first one makes the
    // run interrupted, also once every unit has ended (while its last files
    // are written); later ones change nothing.
    void noteSignal();
    // The exit status as the run stands: 128 + the interrupting signal, 73
    // (EX_CANTCREAT) when one of its machines' files could not be written,
    // else the overall code (0, 4 or 8).
    int exitStatus() const;

    std::vector<MachineRecord> const& machines() const;
    int interruptingSignal() const;
    // Each machine file (status file, trace, document) that could not be
    // written, as "cannot write PATH: reason".
    std::vector<std::string> const& writeFailures() const;
    // Whether standard error's last row is still open: a machine's block
    // ends with its code digit and no line end.
    bool endsOnOpenRow() const;
    std::string overallCode() const;

private:
    using Clock = std::chrono::steady_clock;
    // A unit in flight; the pool knows its worker by the unit's trace slot,
    // which no other unit in flight has.
    struct InFlight {
        Scheduler::Unit unit;
        std::size_t slot = 0;
        Clock::time_point started;
        bool listingStopped = false;
        bool listingTimedOut = false;
    };

    void _startUnit(Scheduler::Unit const& unit);
    void _notStarted(Scheduler::Unit const& unit, std::string const& failure);
    void _handle(std::vector<WorkerEvent> const& events);
    void _finish(WorkerEvent const& ended);
    void _finishListing(InFlight const& running, std::string const& result);
    std::optional<report::ListingFailure>
    _listingFailure(InFlight const& running, std::optional<std::string> const& trace) const;
    void _finishSurvey(InFlight const& running, WorkerEvent const& ended);
    void _settleWorkerDeath(PartitionRecord& record, WorkerEvent const& ended);
    void _recordStop(InFlight& running, WorkerEvent const& event);
    void _drawProgress();
    ProgressFigures _progressFigures() const;
    void _countMachines(ProgressFigures& figures) const;
    PartitionRecord& _record(Scheduler::Unit const& unit);
    PartitionRecord const& _record(Scheduler::Unit const& unit) const;

    Options _options;
    std::vector<MachineRecord> _machines;
    Scheduler _scheduler;
    TimeLimits _limits;
    WorkerPool _pool;
    ProgressLine _progress;
    MachineOutput _output;
    // By trace slot.
    std::vector<std::optional<InFlight>> _inFlight;
    Clock::time_point _start;
};

} // namespace fleet

#pragma once

#include "fleet/ChildProcess.h"
#include "fleet/CommandLine.h"
#include "fleet/RunRecords.h"
#include "fleet/Scheduler.h"

#include <chrono>
#include <map>
#include <memory>
#include <string>
#include <vector>

namespace Fleet {

// One console-wide survey: lists each machine and surveys its partitions,
// each unit of work in a forked process of its own, at most `jobs` at once;
// stops remote actions that run past the time limit; prints each machine's
// block, writes its status file and joins its trace as soon as it and every
// machine before it are done. SIGINT and SIGTERM stop the run as documented
// in quorvex-survey(8).
class SurveyRun {
public:
    SurveyRun(Options options, std::vector<std::string> const& identities);

    // Runs to the end and returns the exit status: the overall code (0, 4
    // or 8), or 128 + the signal that interrupted the run.
    int run();

    std::vector<MachineRecord> const& machines() const;
    int interruptingSignal() const;
    std::string overallCode() const;

private:
    using Clock = std::chrono::steady_clock;
    struct Running {
        Scheduler::Unit unit;
        std::unique_ptr<ChildProcess> child;
        Clock::time_point started;
        // Which of the run's trace pieces the unit writes.
        std::size_t slot = 0;
        // On the clock of action ages, taken before the fork, so that no
        // action of the unit is older than the unit.
        double bootSecondsAtStart = 0;
        bool listingStopped = false;
    };

    void _startUnits();
    void _startUnit(Scheduler::Unit const& unit);
    std::size_t _takeSlot();
    std::string _tracePiece(Running const& running) const;
    void _waitForEvents();
    void _takeSignal();
    void _collectFinished();
    bool _mayHaveEnded(Running const& running) const;
    void _finish(Running& running);
    void _finishListing(Running& running);
    void _finishSurvey(Running& running);
    void _enforceLimits();
    bool _mayHaveActionToStop(Running const& running) const;
    bool _stopAction(Running& running, pid_t action);
    std::string _stopNote(double seconds) const;
    void _markUnfinished();
    // runOver: every machine left is reported, done or not.
    void _reportReadyMachines(bool runOver);
    void _reportMachine(std::size_t index);
    void _removeTracePieces(std::string const& identity) const;
    void _drawProgress();
    void _eraseProgress();
    PartitionRecord& _record(Scheduler::Unit const& unit);
    double _secondsSince(Clock::time_point start) const;

    Options _options;
    std::vector<MachineRecord> _machines;
    Scheduler _scheduler;
    std::vector<Running> _running;
    // The descriptors the last wait found readable or closed.
    std::vector<int> _readyDescriptors;
    // Slots of units in flight; a unit takes the first free one.
    std::vector<bool> _slotInUse;
    std::size_t _reported = 0;
    int _signal = 0;
    bool _showProgress = false;
    // A progress line is on the terminal now.
    bool _progressShown = false;
    // The length of standard error's last output line while it has no line
    // end (a machine's block ends with its code digit); 0 once it has one.
    std::size_t _openColumns = 0;
    Clock::time_point _start;
    Clock::time_point _lastDraw;
};

} // namespace Fleet

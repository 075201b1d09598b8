#include "fleet/SurveyRun.h"

#include "fleet/MachineReport.h"
#include "fleet/PartitionName.h"
#include "fleet/RunFiles.h"
#include "fleet/SignalPipe.h"
#include "fleet/WorkUnits.h"
#include "report/StatusText.h"
#include "survey/Quorvex_PYLON_VPD_Survey_ClientPartition_Utility.h"
#include "survey/calculate_ReturnCode.h"

#include <unistd.h>

#include <cstdlib>
#include <iostream>

namespace fleet {

namespace {

Quorvex::PYLON::VPD::PartitionOutcome notStartedOutcome() {
    Quorvex::PYLON::VPD::PartitionOutcome outcome;
    outcome.returnCode = report::gc_NotSurveyedCode;
    outcome.statusText = report::gc_NotStartedStatusText;
    outcome.kind = Quorvex::PYLON::VPD::PartitionOutcomeKind::ChannelFailure;
    return outcome;
}

double secondsSince(std::chrono::steady_clock::time_point start) {
    return std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
}

} // namespace

SurveyRun::SurveyRun(Options options, std::vector<std::string> const& identities)
    : _options(std::move(options)), _scheduler(identities.size(), _options.jobs),
      _limits(_options.timeoutSeconds), _pool(signalPipeDescriptor()),
      _progress(!_options.quiet && isatty(STDERR_FILENO) == 1, std::cerr, STDERR_FILENO),
      _output(_machines, _progress) {
    for (auto const& identity : identities) {
        MachineRecord machine;
        machine.identity = identity;
        _machines.push_back(machine);
    }
}

std::vector<MachineRecord> const& SurveyRun::machines() const {
    return _machines;
}

bool SurveyRun::endsOnOpenRow() const {
    return _progress.isRowOpen();
}

int SurveyRun::interruptingSignal() const {
    return _limits.interruptingSignal();
}

std::string SurveyRun::overallCode() const {
    std::vector<std::string> codes;
    for (auto const& machine : _machines) {
        auto const machineCodes = machineReturnCodes(machine);
        codes.insert(codes.end(), machineCodes.begin(), machineCodes.end());
        // As in the summary: a machine the console could not list counts as
        // not surveyed.
        if (machine.listingFailure) {
            codes.emplace_back(report::gc_NotSurveyedCode);
        }
    }
    return get_OverallCode(codes);
}

int SurveyRun::run() {
    _start = Clock::now();
    // A signal may have come while the machines were listed, and a run
    // without machines never enters the loop.
    noteSignal();
    while (!_scheduler.isFinished()) {
        noteSignal();
        for (auto const& unit : _scheduler.takeStartable()) {
            _startUnit(unit);
        }
        if (_scheduler.isFinished()) {
            break;
        }
        std::vector<WorkerEvent> const ended = _pool.waitForEvents();
        noteSignal();
        _handle(ended);
        _handle(_pool.stopDueActions(_limits));
        _output.writeReady(_scheduler);
        _drawProgress();
    }
    if (_limits.isInterrupted()) {
        settleUnfinished(_machines);
    }
    _output.writeRest();
    _progress.erase();
    // A signal may have come while the last machines were written.
    noteSignal();
    return exitStatus();
}

int SurveyRun::exitStatus() const {
    int const signalNumber = _limits.interruptingSignal();
    if (signalNumber != 0) {
        return 128 + signalNumber;
    }
    return _output.writeFailures().empty() ? std::atoi(overallCode().c_str()) : gc_ExitCannotCreate;
}

std::vector<std::string> const& SurveyRun::writeFailures() const {
    return _output.writeFailures();
}

void SurveyRun::noteSignal() {
    int const signalNumber = takeSignal();
    if (signalNumber != 0 && !_limits.isInterrupted()) {
        _limits.interrupt(signalNumber);
        _scheduler.stopStarting();
    }
}

PartitionRecord& SurveyRun::_record(Scheduler::Unit const& unit) {
    return _machines[unit.machine].partitions[*unit.partition];
}

PartitionRecord const& SurveyRun::_record(Scheduler::Unit const& unit) const {
    return _machines[unit.machine].partitions[*unit.partition];
}

void SurveyRun::_startUnit(Scheduler::Unit const& unit) {
    std::size_t const slot = _output.takeSlot();
    std::string const piece = _output.tracePiece(unit.machine, slot);
    ChildProcess::Body body;
    if (unit.partition) {
        auto const partition = _record(unit).partition;
        body = [partition, piece] { return surveyPartition(partition, piece); };
    } else {
        std::string const identity = _machines[unit.machine].identity;
        body = [identity, piece] { return listPartitions(identity, piece); };
    }
    UnitKind const kind = unit.partition ? UnitKind::Survey : UnitKind::PartitionListing;
    if (std::optional<std::string> const failure = _pool.start(slot, kind, body)) {
        _output.releaseSlot(slot);
        _notStarted(unit, *failure);
        return;
    }
    if (_inFlight.size() <= slot) {
        _inFlight.resize(slot + 1);
    }
    _inFlight[slot] = InFlight{unit, slot, Clock::now()};
}

// The status text stays the one the tool writes for a partition it could not
// survey; why it could not goes to the run's summary.
void SurveyRun::_notStarted(Scheduler::Unit const& unit, std::string const& failure) {
    if (unit.partition) {
        Quorvex::PYLON::VPD::PartitionOutcome outcome = notStartedOutcome();
        outcome.reason = failure;
        settlePartition(_record(unit), outcome);
    } else {
        _machines[unit.machine].listed = true;
    }
    _scheduler.finish(unit);
}

void SurveyRun::_handle(std::vector<WorkerEvent> const& events) {
    for (auto const& event : events) {
        if (event.kind == WorkerEvent::Kind::Ended) {
            _finish(event);
        } else {
            _recordStop(*_inFlight[event.tag], event);
        }
    }
}

void SurveyRun::_finish(WorkerEvent const& ended) {
    InFlight const running = *_inFlight[ended.tag];
    _inFlight[ended.tag].reset();
    _output.releaseSlot(ended.tag);
    if (running.unit.partition) {
        _finishSurvey(running, ended);
    } else {
        _finishListing(running, ended.text);
    }
}

void SurveyRun::_finishListing(InFlight const& running, std::string const& result) {
    _scheduler.finish(running.unit);
    std::optional<std::string> trace =
        takeTracePiece(_output.tracePiece(running.unit.machine, running.slot));
    if (running.listingStopped) {
        return;
    }
    MachineRecord& machine = _machines[running.unit.machine];
    machine.listingTrace = std::move(trace);
    machine.listingTraceError = decodeTraceError(result);
    machine.listingFailure = _listingFailure(running, machine.listingTrace);
    auto const partitions = decodePartitions(machine.identity, result);
    std::vector<std::string> ids;
    for (auto const& partition : partitions.value_or(std::vector<Quorvex::System::Partition>{})) {
        PartitionRecord record;
        record.partition = partition;
        machine.partitions.push_back(record);
        ids.push_back(partition.get_PartitionID());
    }
    machine.listed = true;
    _scheduler.setListed(running.unit.machine, ids);
}

// The command runner reads a listing command the time limit killed as one
// that exited 0, so the stop is known only here.
std::optional<report::ListingFailure>
SurveyRun::_listingFailure(InFlight const& running, std::optional<std::string> const& trace) const {
    if (running.listingTimedOut) {
        return report::stoppedListing(trace.value_or(""), _options.timeoutSeconds);
    }
    return trace ? report::listingFailureInTrace(*trace) : std::nullopt;
}

void SurveyRun::_finishSurvey(InFlight const& running, WorkerEvent const& ended) {
    PartitionRecord& record = _record(running.unit);
    record.seconds = secondsSince(running.started);
    record.trace = takeTracePiece(_output.tracePiece(running.unit.machine, running.slot));
    record.traceError = decodeTraceError(ended.text);
    if (std::optional<Quorvex::PYLON::VPD::PartitionOutcome> result = decodeOutcome(ended.text)) {
        settlePartition(record, std::move(*result));
    } else {
        _settleWorkerDeath(record, ended);
    }
    _scheduler.finish(running.unit);
}

// A worker that died left its actions to this process, which ends them
// before it writes the partition's default document in their place.
void SurveyRun::_settleWorkerDeath(PartitionRecord& record, WorkerEvent const& ended) {
    _pool.endAdopted();
    settlePartition(record, WorkerDeath{ended.waitStatus.value_or(0), record.seconds.value_or(0)});
    record.result.documentError =
        Quorvex_PYLON_VPD_Survey_ClientPartition_Utility::u_create_DefaultXML_forFailedPartition(
            record.partition, record.result.reason, record.result.fileName);
}

// The outcome itself is settled when the unit ends, from what its survey left.
void SurveyRun::_recordStop(InFlight& running, WorkerEvent const& event) {
    if (running.unit.partition) {
        _record(running.unit).stop = ActionStop{report::remoteActionOfCommandLine(event.text),
                                                event.seconds, _limits.isInterrupted()};
    } else if (_limits.isInterrupted()) {
        running.listingStopped = true;
    } else {
        running.listingTimedOut = true;
    }
}

void SurveyRun::_drawProgress() {
    // Once every machine is written nothing is left to show.
    if (_output.isAllWritten() || !_progress.isDue(Clock::now())) {
        return;
    }
    _progress.draw(formatProgress(_progressFigures(), _progress.columns()), Clock::now());
}

void SurveyRun::_countMachines(ProgressFigures& figures) const {
    figures.machines = _machines.size();
    for (std::size_t index = 0; index < _machines.size(); ++index) {
        MachineRecord const& machine = _machines[index];
        figures.listingsPending += machine.listed ? 0 : 1;
        figures.machinesDone += _scheduler.isMachineDone(index) ? 1 : 0;
        figures.partitions += machine.partitions.size();
        for (auto const& record : machine.partitions) {
            if (record.outcome) {
                ++(report::isFailure(*record.outcome) ? figures.failed
                                                      : figures.endedWithoutFailure);
            }
        }
    }
}

ProgressFigures SurveyRun::_progressFigures() const {
    ProgressFigures figures;
    _countMachines(figures);
    RunningSurveys surveys;
    surveys.timeoutSeconds = _options.timeoutSeconds;
    for (auto const& running : _inFlight) {
        if (running && !running->unit.partition) {
            ++figures.listingsRunning;
        }
        if (!running || !running->unit.partition) {
            continue;
        }
        ++figures.running;
        double const seconds = secondsSince(running->started);
        surveys.seconds.push_back(seconds);
        if (seconds >= figures.longestSeconds) {
            figures.longestSeconds = seconds;
            figures.longestName = shownName(_record(running->unit).partition);
        }
    }
    figures.elapsedSeconds = secondsSince(_start);
    figures.left = estimateLeft(figures, surveys);
    return figures;
}

} // namespace fleet

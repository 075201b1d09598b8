#include "fleet/SurveyRun.h"

#include "fleet/MachineReport.h"
#include "fleet/ProcessTree.h"
#include "fleet/Progress.h"
#include "fleet/RunFiles.h"
#include "fleet/SignalPipe.h"
#include "fleet/WorkUnits.h"
#include "survey/calculate_ReturnCode.h"

#include <poll.h>
#include <unistd.h>

#include <algorithm>
#include <csignal>
#include <cstdio>
#include <cstdlib>

namespace Fleet {

namespace {

constexpr int gc_PollMilliseconds = 50;
// A child that has closed its result pipe is about to end; its exit is
// awaited this closely, so that the next unit starts at once.
constexpr int gc_EndingPollMilliseconds = 1;
constexpr auto gc_ProgressInterval = std::chrono::milliseconds(200);
constexpr char gc_RemoteActionTool[] = "runact-api";
constexpr char gc_NotSurveyedCode[] = "8";
constexpr char gc_NotStarted[] = "Failed - not started";

bool contains(std::string const& text, char const* part) {
    return text.find(part) != std::string::npos;
}

char const* signalName(int signalNumber) {
    return signalNumber == SIGTERM ? "SIGTERM" : "SIGINT";
}

Quorvex::PYLON::VPD::PartitionOutcome notStartedOutcome() {
    Quorvex::PYLON::VPD::PartitionOutcome outcome;
    outcome.returnCode = gc_NotSurveyedCode;
    outcome.statusText = gc_NotStarted;
    outcome.kind = Quorvex::PYLON::VPD::PartitionOutcomeKind::ChannelFailure;
    return outcome;
}

} // namespace

SurveyRun::SurveyRun(Options options, std::vector<std::string> const& identities)
    : _options(std::move(options)), _scheduler(identities.size(), _options.jobs) {
    for (auto const& identity : identities) {
        MachineRecord machine;
        machine.identity = identity;
        _machines.push_back(machine);
    }
    _showProgress = !_options.quiet && isatty(STDERR_FILENO) == 1;
}

std::vector<MachineRecord> const& SurveyRun::machines() const {
    return _machines;
}

int SurveyRun::interruptingSignal() const {
    return _signal;
}

std::string SurveyRun::overallCode() const {
    std::vector<std::string> codes;
    for (auto const& machine : _machines) {
        auto const machineCodes = MachineReport::returnCodes(machine);
        codes.insert(codes.end(), machineCodes.begin(), machineCodes.end());
    }
    return get_OverallCode(codes);
}

int SurveyRun::run() {
    _start = Clock::now();
    while (!_scheduler.isFinished()) {
        _takeSignal();
        _startUnits();
        if (_scheduler.isFinished()) {
            break;
        }
        _waitForEvents();
        _takeSignal();
        _collectFinished();
        _enforceLimits();
        _reportReadyMachines(false);
        _drawProgress();
    }
    if (_signal != 0) {
        _markUnfinished();
    }
    _reportReadyMachines(true);
    _eraseProgress();
    return _signal != 0 ? 128 + _signal : std::atoi(overallCode().c_str());
}

void SurveyRun::_takeSignal() {
    int const signalNumber = SignalPipe::takeSignal();
    if (signalNumber != 0 && _signal == 0) {
        _signal = signalNumber;
        _scheduler.stopStarting();
    }
}

void SurveyRun::_startUnits() {
    for (auto const& unit : _scheduler.takeStartable()) {
        _startUnit(unit);
    }
}

PartitionRecord& SurveyRun::_record(Scheduler::Unit const& unit) {
    return _machines[unit.machine].partitions[*unit.partition];
}

std::size_t SurveyRun::_takeSlot() {
    auto const free = std::find(_slotInUse.begin(), _slotInUse.end(), false);
    std::size_t const slot = static_cast<std::size_t>(free - _slotInUse.begin());
    if (free == _slotInUse.end()) {
        _slotInUse.push_back(true);
    } else {
        *free = true;
    }
    return slot;
}

std::string SurveyRun::_tracePiece(Running const& running) const {
    return RunFiles::tracePiece(_machines[running.unit.machine].identity, running.slot);
}

void SurveyRun::_startUnit(Scheduler::Unit const& unit) {
    Running running{unit, nullptr, Clock::now(), _takeSlot()};
    std::string const piece = _tracePiece(running);
    ChildProcess::Body body;
    if (unit.partition) {
        auto const partition = _record(unit).partition;
        body = [partition, piece] { return WorkUnits::surveyPartition(partition, piece); };
    } else {
        std::string const identity = _machines[unit.machine].identity;
        body = [identity, piece] { return WorkUnits::listPartitions(identity, piece); };
    }
    running.bootSecondsAtStart = ProcessTree::secondsSinceBoot();
    running.child = std::make_unique<ChildProcess>(body);
    running.started = Clock::now();
    if (!running.child->isStarted()) {
        _slotInUse[running.slot] = false;
    }
    if (!running.child->isStarted() && unit.partition) {
        settlePartition(_record(unit), notStartedOutcome());
    }
    if (!running.child->isStarted()) {
        _scheduler.finish(unit);
        if (!unit.partition) {
            _machines[unit.machine].listed = true;
        }
        return;
    }
    _running.push_back(std::move(running));
}

void SurveyRun::_waitForEvents() {
    std::vector<pollfd> descriptors;
    int timeout = gc_PollMilliseconds;
    if (SignalPipe::readDescriptor() >= 0) {
        descriptors.push_back({SignalPipe::readDescriptor(), POLLIN, 0});
    }
    for (auto const& running : _running) {
        if (running.child->resultDescriptor() >= 0) {
            descriptors.push_back({running.child->resultDescriptor(), POLLIN, 0});
        } else if (!running.child->isReaped()) {
            timeout = gc_EndingPollMilliseconds;
        }
    }
    poll(descriptors.data(), descriptors.size(), timeout);
    _readyDescriptors.clear();
    for (auto const& descriptor : descriptors) {
        if (descriptor.revents != 0) {
            _readyDescriptors.push_back(descriptor.fd);
        }
    }
}

// With many units in flight, only those whose pipe has something to say are
// read, not every one at every event.
bool SurveyRun::_mayHaveEnded(Running const& running) const {
    int const descriptor = running.child->resultDescriptor();
    return descriptor < 0 || std::find(_readyDescriptors.begin(), _readyDescriptors.end(),
                                       descriptor) != _readyDescriptors.end();
}

void SurveyRun::_collectFinished() {
    for (std::size_t i = 0; i < _running.size();) {
        Running& running = _running[i];
        if (!_mayHaveEnded(running)) {
            ++i;
            continue;
        }
        running.child->readAvailable();
        if (running.child->resultDescriptor() < 0 && running.child->reap()) {
            _finish(running);
            _running.erase(_running.begin() + static_cast<std::ptrdiff_t>(i));
        } else {
            ++i;
        }
    }
}

void SurveyRun::_finish(Running& running) {
    _slotInUse[running.slot] = false;
    if (running.unit.partition) {
        _finishSurvey(running);
    } else {
        _finishListing(running);
    }
}

void SurveyRun::_finishListing(Running& running) {
    _scheduler.finish(running.unit);
    std::optional<std::string> trace = RunFiles::takePiece(_tracePiece(running));
    if (running.listingStopped) {
        return;
    }
    MachineRecord& machine = _machines[running.unit.machine];
    machine.listingTrace = std::move(trace);
    auto const partitions = WorkUnits::decodePartitions(machine.identity, running.child->result());
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

void SurveyRun::_finishSurvey(Running& running) {
    PartitionRecord& record = _record(running.unit);
    record.seconds = _secondsSince(running.started);
    record.trace = RunFiles::takePiece(_tracePiece(running));
    settlePartition(
        record, WorkUnits::decodeOutcome(running.child->result()).value_or(notStartedOutcome()));
    _scheduler.finish(running.unit);
}

void SurveyRun::_enforceLimits() {
    for (auto& running : _running) {
        if (running.child->isReaped() || !_mayHaveActionToStop(running)) {
            continue;
        }
        for (pid_t action : ProcessTree::childrenOf(running.child->pid())) {
            if (ProcessTree::hasEnded(action) ||
                (running.unit.partition &&
                 !contains(ProcessTree::commandLineOf(action), gc_RemoteActionTool))) {
                continue;
            }
            std::optional<double> const age = ProcessTree::ageOf(action);
            bool const overLimit = _options.timeoutSeconds > 0 && age &&
                                   *age >= static_cast<double>(_options.timeoutSeconds);
            if ((_signal != 0 || overLimit) && _stopAction(running, action)) {
                break;
            }
        }
    }
}

// No action of a unit is older than the unit, so units younger than the time
// limit are not looked up in /proc: with many in flight that would cost more
// than the work itself.
bool SurveyRun::_mayHaveActionToStop(Running const& running) const {
    if (_signal != 0) {
        return true;
    }
    double const unitAge = ProcessTree::secondsSinceBoot() - running.bootSecondsAtStart;
    return _options.timeoutSeconds > 0 && unitAge >= static_cast<double>(_options.timeoutSeconds);
}

bool SurveyRun::_stopAction(Running& running, pid_t action) {
    pid_t const worker = running.child->pid();
    int status = 0;
    if (!ProcessTree::stopChild(worker, status)) {
        running.child->markReaped();
        return false;
    }
    auto const children = ProcessTree::childrenOf(worker);
    if (std::find(children.begin(), children.end(), action) == children.end() ||
        ProcessTree::hasEnded(action)) {
        // The action ended meanwhile; whatever runs now is left alone.
        kill(worker, SIGCONT);
        return false;
    }
    double const seconds = ProcessTree::ageOf(action).value_or(0);
    std::string const commandLine = ProcessTree::commandLineOf(action);
    ProcessTree::killDescendants(worker);
    if (running.unit.partition) {
        PartitionRecord& record = _record(running.unit);
        record.stop =
            ActionStop{report::remoteActionOfCommandLine(commandLine), seconds, _signal != 0};
        running.child->setStopNote(_stopNote(seconds));
    } else if (_signal != 0) {
        running.listingStopped = true;
    }
    kill(worker, SIGCONT);
    return true;
}

std::string SurveyRun::_stopNote(double seconds) const {
    char text[160];
    if (_signal != 0) {
        std::snprintf(text, sizeof text, "Stopped by %s after %.1f s.", signalName(_signal),
                      seconds);
    } else {
        std::snprintf(text, sizeof text, "Stopped by the time limit of %u s after %.1f s.",
                      _options.timeoutSeconds, seconds);
    }
    return text;
}

void SurveyRun::_markUnfinished() {
    for (auto& machine : _machines) {
        for (auto& record : machine.partitions) {
            if (!record.outcome) {
                settleUnfinished(record);
            }
        }
    }
}

void SurveyRun::_reportReadyMachines(bool runOver) {
    while (_reported < _machines.size() && (runOver || _scheduler.isMachineDone(_reported))) {
        _reportMachine(_reported);
        ++_reported;
    }
}

void SurveyRun::_reportMachine(std::size_t index) {
    MachineRecord const& machine = _machines[index];
    _removeTracePieces(machine.identity);
    if (!machine.listed) {
        // A listing stopped by an interruption leaves no files and prints nothing.
        return;
    }
    _eraseProgress();
    MachineReport::print(machine);
    // The block ends with the code digit and no line end.
    _openColumns = std::string(get_OverallCode(MachineReport::returnCodes(machine))).size();
    RunFiles::writeAtomically(RunFiles::statusFile(machine.identity),
                              MachineReport::statusText(machine));
    if (auto const trace = MachineReport::traceText(machine)) {
        RunFiles::writeAtomically(RunFiles::traceFile(machine.identity), *trace);
    }
}

void SurveyRun::_removeTracePieces(std::string const& identity) const {
    for (std::size_t slot = 0; slot < _slotInUse.size(); ++slot) {
        std::remove(RunFiles::tracePiece(identity, slot).c_str());
    }
}

double SurveyRun::_secondsSince(Clock::time_point start) const {
    return std::chrono::duration<double>(Clock::now() - start).count();
}

void SurveyRun::_drawProgress() {
    // Once every machine is reported nothing is left to show.
    if (!_showProgress || _reported == _machines.size() ||
        Clock::now() - _lastDraw < gc_ProgressInterval) {
        return;
    }
    _lastDraw = Clock::now();
    ProgressFigures figures;
    figures.machinesDone = _reported;
    figures.machines = _machines.size();
    for (auto const& machine : _machines) {
        figures.partitions += machine.partitions.size();
        for (auto const& record : machine.partitions) {
            if (record.outcome) {
                ++(record.result.returnCode == "0" ? figures.surveyed : figures.failed);
            }
        }
    }
    for (auto const& running : _running) {
        if (!running.unit.partition) {
            continue;
        }
        ++figures.running;
        double const seconds = _secondsSince(running.started);
        if (seconds >= figures.longestSeconds) {
            figures.longestSeconds = seconds;
            figures.longestName = std::string(_record(running.unit).partition);
        }
    }
    figures.elapsedSeconds = _secondsSince(_start);
    figures.leftSeconds = Progress::estimateLeft(figures);
    Progress::draw(Progress::format(figures), _openColumns);
    _progressShown = true;
}

void SurveyRun::_eraseProgress() {
    if (_progressShown) {
        Progress::erase(_openColumns);
        _progressShown = false;
    }
}

} // namespace Fleet

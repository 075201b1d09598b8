#include "fleet/Scheduler.h"

#include <algorithm>

namespace fleet {

bool Scheduler::Unit::operator==(Unit const& other) const {
    return machine == other.machine && partition == other.partition;
}

Scheduler::Scheduler(std::size_t machineCount, std::size_t jobs)
    : _machines(machineCount), _jobs(std::max<std::size_t>(jobs, 1)) {}

void Scheduler::setListed(std::size_t machine, std::vector<std::string> const& partitionIds) {
    Machine& entry = _machines.at(machine);
    entry.listing = State::Done;
    entry.ids = partitionIds;
    entry.partitions.assign(partitionIds.size(), State::Waiting);
}

std::vector<Scheduler::Unit> Scheduler::takeStartable() {
    std::vector<Unit> units;
    for (std::size_t index = 0; index < _machines.size() && _hasCapacity(); ++index) {
        _takeFromMachine(index, units);
    }
    return units;
}

void Scheduler::_takeFromMachine(std::size_t index, std::vector<Unit>& units) {
    Machine& machine = _machines[index];
    if (machine.listing == State::Waiting) {
        machine.listing = State::Running;
        ++_running;
        units.push_back({index, std::nullopt});
        return;
    }
    for (std::size_t partition = 0; partition < machine.partitions.size() && _hasCapacity();
         ++partition) {
        if (machine.partitions[partition] == State::Waiting &&
            !_hasEarlierUnfinished(machine, partition)) {
            machine.partitions[partition] = State::Running;
            ++_running;
            units.push_back({index, partition});
        }
    }
}

bool Scheduler::_hasEarlierUnfinished(Machine const& machine, std::size_t index) const {
    for (std::size_t earlier = 0; earlier < index; ++earlier) {
        if (machine.ids[earlier] == machine.ids[index] &&
            machine.partitions[earlier] != State::Done) {
            return true;
        }
    }
    return false;
}

bool Scheduler::_hasCapacity() const {
    return !_stopped && _running < _jobs;
}

void Scheduler::finish(Unit const& unit) {
    Machine& machine = _machines.at(unit.machine);
    State& state = unit.partition ? machine.partitions.at(*unit.partition) : machine.listing;
    if (state == State::Running) {
        --_running;
    }
    state = State::Done;
}

void Scheduler::stopStarting() {
    _stopped = true;
}

std::size_t Scheduler::runningCount() const {
    return _running;
}

bool Scheduler::isListed(std::size_t machine) const {
    return _machines.at(machine).listing == State::Done;
}

bool Scheduler::isMachineDone(std::size_t machine) const {
    Machine const& entry = _machines.at(machine);
    return entry.listing == State::Done &&
           std::all_of(entry.partitions.begin(), entry.partitions.end(),
                       [](State state) { return state == State::Done; });
}

bool Scheduler::isFinished() const {
    if (_running > 0) {
        return false;
    }
    if (_stopped) {
        return true;
    }
    for (std::size_t index = 0; index < _machines.size(); ++index) {
        if (!isMachineDone(index)) {
            return false;
        }
    }
    return true;
}

} // namespace fleet

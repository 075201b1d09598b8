#include "fleet/WorkerPool.h"

#include "fleet/ProcessTree.h"

#include <algorithm>

namespace fleet {

namespace {

// A worker that has closed its result pipe is about to end; its exit is
// awaited this closely, so that the next unit starts at once.
constexpr int gc_EndingPollMilliseconds = 1;

} // namespace

WorkerPool::WorkerPool(int wakeDescriptor) : _wakeDescriptor(wakeDescriptor) {}

std::optional<std::string> WorkerPool::start(std::size_t tag, UnitKind kind,
                                             ChildProcess::Body const& body) {
    Worker worker{tag, kind, nullptr, secondsSinceBoot()};
    worker.child = std::make_unique<ChildProcess>(body);
    if (std::optional<std::string> failure = worker.child->startFailure()) {
        return failure;
    }
    _workers.push_back(std::move(worker));
    return std::nullopt;
}

std::size_t WorkerPool::size() const {
    return _workers.size();
}

void WorkerPool::_poll() {
    _descriptors.clear();
    int timeout = gc_PollMilliseconds;
    if (_wakeDescriptor >= 0) {
        _descriptors.push_back({_wakeDescriptor, POLLIN, 0});
    }
    for (auto const& worker : _workers) {
        if (worker.child->resultDescriptor() >= 0) {
            _descriptors.push_back({worker.child->resultDescriptor(), POLLIN, 0});
        } else if (!worker.child->isReaped()) {
            timeout = gc_EndingPollMilliseconds;
        }
    }
    poll(_descriptors.data(), _descriptors.size(), timeout);
    _readyDescriptors.clear();
    for (auto const& descriptor : _descriptors) {
        if (descriptor.revents != 0) {
            _readyDescriptors.push_back(descriptor.fd);
        }
    }
}

// With many workers in flight, only those whose pipe has something to say
// are read, not every one at every event.
bool WorkerPool::_mayHaveEnded(Worker const& worker) const {
    int const descriptor = worker.child->resultDescriptor();
    return descriptor < 0 || std::find(_readyDescriptors.begin(), _readyDescriptors.end(),
                                       descriptor) != _readyDescriptors.end();
}

std::vector<WorkerEvent> WorkerPool::waitForEvents() {
    _poll();
    std::vector<WorkerEvent> events;
    for (std::size_t i = 0; i < _workers.size();) {
        ChildProcess& child = *_workers[i].child;
        if (!_mayHaveEnded(_workers[i])) {
            ++i;
            continue;
        }
        child.readAvailable();
        if (child.resultDescriptor() < 0 && child.reap()) {
            events.push_back({WorkerEvent::Kind::Ended, _workers[i].tag, child.takeResult(), 0,
                              child.waitStatus()});
            _workers.erase(_workers.begin() + static_cast<std::ptrdiff_t>(i));
        } else {
            ++i;
        }
    }
    return events;
}

std::vector<ActionFacts> WorkerPool::_actionsOf(Worker const& worker) const {
    std::vector<ActionFacts> actions;
    for (pid_t action : childrenOf(worker.child->pid())) {
        if (!hasEnded(action)) {
            actions.push_back({action, commandLineOf(action), ageOf(action)});
        }
    }
    return actions;
}

std::vector<WorkerEvent> WorkerPool::stopDueActions(TimeLimits const& limits) {
    std::vector<WorkerEvent> events;
    for (auto& worker : _workers) {
        double const unitSeconds = secondsSinceBoot() - worker.bootSecondsAtStart;
        if (worker.child->isReaped() || worker.child->isStopped() ||
            !limits.mayHaveActionToStop(unitSeconds)) {
            continue;
        }
        if (std::optional<WorkerEvent> stopped = _stopFirstDue(worker, limits)) {
            events.push_back(std::move(*stopped));
        }
    }
    return events;
}

// An action that ended meanwhile is passed over for the next one due.
std::optional<WorkerEvent> WorkerPool::_stopFirstDue(Worker& worker, TimeLimits const& limits) {
    std::optional<WorkerEvent> stopped;
    std::vector<pid_t> const due = limits.actionsToStop(worker.kind, _actionsOf(worker));
    for (auto action = due.begin(); !stopped && action != due.end(); ++action) {
        stopped = _stopAction(worker, *action, limits);
    }
    return stopped;
}

// The worker and the whole tree below it are frozen first, so that nothing
// starts or ends while the action is looked at again: an action that ended
// before the freeze ended on its own and is not recorded as stopped, and
// one still there when frozen cannot end before it is killed.
std::optional<WorkerEvent> WorkerPool::_stopAction(Worker& worker, pid_t action,
                                                   TimeLimits const& limits) {
    ChildProcess& child = *worker.child;
    if (!child.stop()) {
        // It ended; its pipe tells the rest.
        return std::nullopt;
    }
    freezeDescendants(child.pid());
    auto const children = childrenOf(child.pid());
    if (std::find(children.begin(), children.end(), action) == children.end() || hasEnded(action)) {
        thawDescendants(child.pid());
        child.resume();
        return std::nullopt;
    }
    WorkerEvent event{WorkerEvent::Kind::ActionStopped, worker.tag, commandLineOf(action),
                      ageOf(action).value_or(0), std::nullopt};
    killDescendants(child.pid());
    if (std::optional<std::string> const note = limits.stopNote(worker.kind, event.seconds)) {
        child.setStopNote(*note);
    }
    if (resumesAfterStop(worker.kind)) {
        child.resume();
    }
    return event;
}

void WorkerPool::endAdopted() {
    std::vector<pid_t> workers;
    for (auto const& worker : _workers) {
        if (!worker.child->isReaped()) {
            workers.push_back(worker.child->pid());
        }
    }
    endChildrenExcept(workers);
}

} // namespace fleet

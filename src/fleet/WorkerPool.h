#pragma once

#include "fleet/ChildProcess.h"
#include "fleet/TimeLimits.h"

#include <poll.h>

#include <cstddef>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace fleet {

// How long the run waits for its workers at most before it looks at the
// time limits again: the one poll interval of the program.
constexpr int gc_PollMilliseconds = 50;

// Something that happened to one of the pool's workers.
struct WorkerEvent {
    enum class Kind {
        // The worker ended; text is its result (cut short when it died).
        Ended,
        // One of its actions was stopped with everything it started after
        // running `seconds`; text is the action's command line.
        ActionStopped,
    };
    Kind kind = Kind::Ended;
    // The name its owner gave the worker.
    std::size_t tag = 0;
    std::string text;
    double seconds = 0;
    // How an ended worker ended, as waitpid tells it; nullopt when unknown.
    std::optional<int> waitStatus;
};

// The forked workers of a run and what the run does to their processes:
// starts each unit of work in a ChildProcess, waits on their result pipes and
// the signal pipe, reaps them, and stops the actions that the time limits
// find due, each with everything it started. It tells its owner what
// happened and leaves the owner's records alone.
class WorkerPool {
public:
    // Waits on wakeDescriptor too (the signal pipe; -1 for none).
    explicit WorkerPool(int wakeDescriptor);
    // Workers still there are killed with what they started and reaped.
    ~WorkerPool() = default;
    WorkerPool(WorkerPool const&) = delete;
    WorkerPool& operator=(WorkerPool const&) = delete;

    // Starts body in a worker named tag, which no other worker of the pool
    // in flight may have. What kept it from starting, nullopt once started.
    [[nodiscard]] std::optional<std::string> start(std::size_t tag, UnitKind kind,
                                                   ChildProcess::Body const& body);
    std::size_t size() const;
    // Waits up to gc_PollMilliseconds for a result pipe or the wake
    // descriptor, reads the pipes found ready and reports the workers that
    // ended, each once, after reaping it.
    std::vector<WorkerEvent> waitForEvents();
    // Stops, in each worker, the first action the limits find due that still
    // runs, with everything it started. A survey's worker is left the note
    // before it goes on; a machine listing's worker stays stopped until the
    // pool ends it.
    std::vector<WorkerEvent> stopDueActions(TimeLimits const& limits);
    // Kills and reaps what the calling process adopted when a worker died
    // (the caller is a subreaper and starts children through the pool
    // alone): every child that is not one of the pool's workers.
    void endAdopted();

private:
    struct Worker {
        std::size_t tag = 0;
        UnitKind kind = UnitKind::Survey;
        std::unique_ptr<ChildProcess> child;
        // On the clock of action ages, taken before the fork, so that no
        // action of the unit is older than the unit.
        double bootSecondsAtStart = 0;
    };

    void _poll();
    bool _mayHaveEnded(Worker const& worker) const;
    std::vector<ActionFacts> _actionsOf(Worker const& worker) const;
    std::optional<WorkerEvent> _stopFirstDue(Worker& worker, TimeLimits const& limits);
    std::optional<WorkerEvent> _stopAction(Worker& worker, pid_t action, TimeLimits const& limits);

    int _wakeDescriptor;
    std::vector<Worker> _workers;
    std::vector<pollfd> _descriptors;
    // The descriptors the last wait found readable or closed.
    std::vector<int> _readyDescriptors;
};

} // namespace fleet

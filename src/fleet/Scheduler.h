#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <vector>

namespace fleet {

// Decides which unit of work starts next. A machine's listing comes first;
// its partitions can start once it is listed. Earlier machines and earlier
// partitions go first, at most `jobs` units run at once over all machines,
// and a partition listed twice on one machine (same ID) never runs beside
// itself: each later occurrence waits until every earlier one has finished,
// so the later survey's files win as they do in a run one after the other.
class Scheduler {
public:
    struct Unit {
        std::size_t machine = 0;
        // nullopt for the machine's listing.
        std::optional<std::size_t> partition;
        bool operator==(Unit const& other) const;
    };

    Scheduler(std::size_t machineCount, std::size_t jobs);

    // The machine's listing has finished with these partition IDs.
    void setListed(std::size_t machine, std::vector<std::string> const& partitionIds);
    // Units that may start now, marked running, in the order to start them.
    std::vector<Unit> takeStartable();
    void finish(Unit const& unit);
    // Nothing new starts from now on.
    void stopStarting();

    std::size_t runningCount() const;
    bool isListed(std::size_t machine) const;
    // Listed and every partition finished.
    bool isMachineDone(std::size_t machine) const;
    // Nothing runs and nothing more will start.
    bool isFinished() const;

private:
    enum class State { Waiting, Running, Done };
    struct Machine {
        State listing = State::Waiting;
        std::vector<std::string> ids;
        std::vector<State> partitions;
    };

    bool _hasEarlierUnfinished(Machine const& machine, std::size_t index) const;
    bool _hasCapacity() const;
    void _takeFromMachine(std::size_t index, std::vector<Unit>& units);

    std::vector<Machine> _machines;
    std::size_t _jobs;
    std::size_t _running = 0;
    bool _stopped = false;
};

} // namespace fleet

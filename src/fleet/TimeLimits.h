#pragma once

#include <sys/types.h>

#include <optional>
#include <string>
#include <vector>

namespace fleet {

// What a unit of work does; each kind has its own rule for which of its
// actions the run stops.
enum class UnitKind {
    // The console's list of managed machines: the run needs all of it, so a
    // stopped listing is dropped whole and its worker never goes on.
    MachineListing,
    // One machine's partitions: any command it runs counts as an action.
    PartitionListing,
    // One partition's survey: only its remote actions are stopped, and the
    // worker, told why, records the stop and goes on.
    Survey,
};

// One action (a direct child of a unit's worker) as /proc shows it.
struct ActionFacts {
    pid_t pid = 0;
    std::string commandLine;
    // nullopt when it ended meanwhile.
    std::optional<double> seconds;
};

// When the run stops an action: once it has run as long as the time limit
// (0: no limit), and at once after SIGINT or SIGTERM; with the note a
// stopped survey keeps in its document and trace.
class TimeLimits {
public:
    explicit TimeLimits(unsigned int timeoutSeconds);

    // The run was interrupted by this signal (0: not); the first one counts.
    void interrupt(int signalNumber);
    bool isInterrupted() const;
    // The signal that interrupted the run, 0 when none did.
    int interruptingSignal() const;

    // False while no action of a unit this old can be due: no action of a
    // unit is older than the unit, so younger units need no look in /proc,
    // which with many in flight would cost more than the work itself.
    bool mayHaveActionToStop(double unitSeconds) const;
    // The actions of a unit of this kind that are due, in the given order.
    std::vector<pid_t> actionsToStop(UnitKind kind, std::vector<ActionFacts> const& actions) const;
    // The line a stopped survey keeps, for example "Stopped by the time
    // limit of 2 s after 2.0 s."; nullopt for listings, which keep none.
    std::optional<std::string> stopNote(UnitKind kind, double seconds) const;

private:
    bool _isDue(std::optional<double> seconds) const;

    unsigned int _timeoutSeconds;
    int _signal = 0;
};

// Whether a unit's worker goes on once its stopped action is killed.
bool resumesAfterStop(UnitKind kind);

} // namespace fleet

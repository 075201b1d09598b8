#pragma once

#include <sys/types.h>

#include <optional>
#include <string>
#include <vector>

namespace fleet {

// What /proc tells about the processes below one of ours, and the means to
// end a whole subtree. Processes are read afresh on every call: they come
// and go while the run goes on.

// The direct children of pid (from every thread's children list).
std::vector<pid_t> childrenOf(pid_t pid);
// Every descendant of pid, parents before their children.
std::vector<pid_t> descendantsOf(pid_t pid);
// The NUL-separated arguments joined by blanks; "" when gone.
std::string commandLineOf(pid_t pid);
// Seconds since pid started; nullopt when it is gone.
std::optional<double> ageOf(pid_t pid);
// The clock ages are measured on: it goes on while the machine sleeps.
double secondsSinceBoot();
// True for a zombie or a process that is gone.
bool hasEnded(pid_t pid);

// What became of a child that was to be stopped.
struct ChildStop {
    enum class State {
        // Stopped, and its stop has been waited for: nothing more will come
        // from waiting until it is continued or killed.
        Stopped,
        // It ended first and has been reaped; waitStatus holds its status.
        Ended,
        // It was not there to stop or to wait for (error holds errno): it
        // was reaped before, or is not a child of the caller.
        Gone,
    };
    State state = State::Gone;
    int waitStatus = 0;
    int error = 0;
};
// Stops the caller's child with SIGSTOP and waits until it is stopped. A
// child already stopped and waited for must not be stopped again: no stop
// would be reported a second time and the wait would never end.
[[nodiscard]] ChildStop stopChild(pid_t child);
// Sends signalNumber to pid only while pid is still a child of parent,
// through a process descriptor: a PID read from /proc may belong to another
// process by the time it is signalled, a descriptor cannot. True once sent.
bool signalChildOf(pid_t parent, pid_t pid, int signalNumber);
// Kills every descendant of root with SIGKILL: freezes the tree, then kills
// children before their parents, again and again until no live one is left
// (a stopped root cannot start new ones). root itself is left alone.
// Returns the number of kill signals sent.
std::size_t killDescendants(pid_t root);
// Stops every descendant of root with SIGSTOP and waits until each is
// stopped or has ended, round after round until none is left running (a
// stopped root cannot start new ones). Afterwards nothing below root can
// end on its own: what has not ended is stopped until thawed or killed.
void freezeDescendants(pid_t root);
// Lets every stopped descendant of root go on.
void thawDescendants(pid_t root);
// Kills every child of the calling process but those kept, with all they
// started, and reaps it: what a subreaper adopted when a process below it
// died. Returns the number of children ended.
std::size_t endChildrenExcept(std::vector<pid_t> const& kept);

} // namespace fleet

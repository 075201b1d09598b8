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
// Kills every descendant of root with SIGKILL, again and again until no
// live one is left (a stopped root cannot start new ones). root itself is
// left alone. Returns the number of kill signals sent.
std::size_t killDescendants(pid_t root);

} // namespace fleet

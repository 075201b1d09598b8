#pragma once

#include <sys/types.h>

#include <optional>
#include <string>
#include <vector>

namespace Fleet {

// What /proc tells about the processes below one of ours, and the means to
// end a whole subtree. Processes are read afresh on every call: they come
// and go while the run goes on.
class ProcessTree {
public:
    // The direct children of pid (from every thread's children list).
    static std::vector<pid_t> childrenOf(pid_t pid);
    // Every descendant of pid, parents before their children.
    static std::vector<pid_t> descendantsOf(pid_t pid);
    // The NUL-separated arguments joined by blanks; "" when gone.
    static std::string commandLineOf(pid_t pid);
    // Seconds since pid started; nullopt when it is gone.
    static std::optional<double> ageOf(pid_t pid);
    // The clock ages are measured on: it goes on while the machine sleeps.
    static double secondsSinceBoot();
    // True for a zombie or a process that is gone.
    static bool hasEnded(pid_t pid);
    // Stops the caller's child with SIGSTOP and waits until it is stopped.
    // False when the child ended instead; its wait status is then in
    // exitStatus.
    static bool stopChild(pid_t child, int& exitStatus);
    // Kills every descendant of root with SIGKILL, again and again until no
    // live one is left (a stopped root cannot start new ones). root itself
    // is left alone. Returns the number of kill signals sent.
    static std::size_t killDescendants(pid_t root);

private:
    static std::optional<std::string> _statFields(pid_t pid);
};

} // namespace Fleet

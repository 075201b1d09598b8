#pragma once

#include <sys/types.h>

#include <array>
#include <atomic>
#include <functional>
#include <optional>
#include <string>

namespace fleet {

// One unit of work run in a forked process of its own. The child runs in a
// process group of its own (a terminal's Ctrl-C reaches only the run's
// parent), adopts the orphans of what it starts (so a stopped action's
// processes stay findable under it), writes its result text into a pipe and
// ends with _exit. It dies with the parent: when the parent is gone it kills
// everything it started and ends. A shared slot made before the fork lets
// the parent tell the child, while it is stopped, why one of its actions
// was stopped, and lets the child record the temporary files it has on
// disk, which the parent removes once the child is reaped.
class ChildProcess {
public:
    using Body = std::function<std::string()>;

    // Forks and runs body in the child; its returned text is the result.
    // When the child cannot be made, startFailure() says why.
    explicit ChildProcess(Body const& body);
    ~ChildProcess();
    ChildProcess(ChildProcess const&) = delete;
    ChildProcess& operator=(ChildProcess const&) = delete;

    bool isStarted() const;
    // What kept the child from starting, with errno's text, for example
    // "cannot fork: Resource temporarily unavailable"; nullopt once started.
    std::optional<std::string> startFailure() const;
    pid_t pid() const;
    // The reading end of the result pipe, non-blocking; -1 once at its end.
    int resultDescriptor() const;
    // Reads what the pipe holds now; false once it is at its end.
    bool readAvailable();
    std::string const& result() const;
    // Hands the result over, leaving none behind.
    std::string takeResult();
    // Reaps the child when it has ended; true once reaped.
    bool reap();
    bool isReaped() const;
    // The wait status of the reaped child; nullopt while it is not reaped,
    // or when it was reaped before it could be waited for.
    std::optional<int> waitStatus() const;
    // Stops the child with SIGSTOP, so that it starts nothing new while what
    // it started is looked at or killed. True once it is stopped (at once
    // when it already was); false when it ended first, and is then reaped.
    [[nodiscard]] bool stop();
    // Lets a stopped child go on.
    void resume();
    bool isStopped() const;
    // Kills a child that is still there, with everything it started, and
    // reaps it; a child already stopped is not stopped again.
    void killAndReap();

    // The line the parent leaves in the slot; read by the child itself.
    static std::string stopNote();
    // Leaves the line in the slot of this child (parent side).
    void setStopNote(std::string const& note);
    // Removes the temporary files the calling child has recorded and not
    // removed: the child ends without its parent to do it.
    static void removeOwnTemporaryFiles();

    // The exit status of a child that ended because its parent was gone.
    static constexpr int ms_ParentGoneStatus = 125;

private:
    // A temporary file the child has on disk; name is valid while inUse is 1.
    struct FileEntry {
        std::atomic<int> inUse;
        char name[128];
    };
    struct Slot {
        std::atomic<int> hasNote;
        char note[240];
        // A survey has at most two temporary files at a time; a name that
        // finds no free entry is not recorded.
        std::array<FileEntry, 8> files;
    };
    static Slot* ms_ownSlot;

    [[noreturn]] void _runChild(Body const& body, int writeEnd, pid_t parent);
    void _fail(char const* operation);
    static void _recordTemporaryFile(std::string const& name, bool made);
    static void _noteTemporaryFile(std::string const& name, bool made);
    static void _removeTemporaryFiles(Slot* slot);
    void _settleReaped(std::optional<int> status);

    pid_t _pid = -1;
    std::optional<std::string> _startFailure;
    int _readEnd = -1;
    Slot* _slot = nullptr;
    std::string _result;
    bool _reaped = false;
    bool _stopped = false;
    std::optional<int> _waitStatus;
};

} // namespace fleet

#pragma once

#include <string>

namespace fleet {

// The exit status of a run that finds another run using its result folder
// (sysexits.h's EX_TEMPFAIL).
constexpr int gc_ExitTemporaryFailure = 75;

// One quorvex-survey run per result folder at a time: an exclusive flock on
// the lock file runLockPath() in the folder of the status files, taken before
// any console command runs and held until the run ends. The file says who
// holds it, in the text its holder gives ("PID 4242, started <time>").
//
// The holder removes the file when the run ends, while it still holds it, so
// that the folder is left as the single-machine tool leaves it; a run that
// finds the path gone or replaced once it holds the lock takes the path's
// new file instead. A folder where the file can be neither made nor opened
// (missing, read-only) leaves the run unlocked: no run can write there.
// Forked workers share the lock and never remove the file: they end with
// _exit, which runs no destructor.
class RunLock {
public:
    explicit RunLock(std::string path);
    // Removes the file and releases the lock when held.
    ~RunLock();
    RunLock(RunLock const&) = delete;
    RunLock& operator=(RunLock const&) = delete;

    // Takes the lock without waiting and writes holderText into the file.
    // False when another run holds it.
    [[nodiscard]] bool tryTake(std::string const& holderText);
    // Waits until the lock is taken; wakeDescriptor (the signal pipe) is
    // watched between attempts. False when a signal came first.
    [[nodiscard]] bool waitToTake(std::string const& holderText, int wakeDescriptor);
    // What the holder wrote into the file, without its line end.
    std::string holder() const;
    std::string const& path() const;

private:
    int _open() const;
    bool _isStillThePath(int descriptor) const;
    void _writeHolder(std::string const& holderText) const;

    std::string _path;
    int _descriptor = -1;
};

} // namespace fleet

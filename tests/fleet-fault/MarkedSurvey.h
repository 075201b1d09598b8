#pragma once
// quorvex-survey started for a fault run: in a session of its own (so its
// process group and session are its PID) and with a marker in its
// environment that every process it starts inherits, unless it clears it.
// After the run, any live process in that group or session or with that
// marker is a process the run left behind.

#include <string>
#include <sys/types.h>
#include <vector>

namespace FleetFaultTest {

class MarkedSurvey {
public:
    enum class Output { File, ClosedPipe };

    // Starts argv (argv[0] a path) with stdin from /dev/null, stderr to
    // stderrPath and stdout to stdoutPath, or to a pipe nobody reads.
    MarkedSurvey(std::vector<std::string> const& argv, std::string const& stdoutPath,
                 std::string const& stderrPath, Output output = Output::File);
    // Kills and reaps the run and whatever it left.
    ~MarkedSurvey();
    MarkedSurvey(MarkedSurvey const&) = delete;
    MarkedSurvey& operator=(MarkedSurvey const&) = delete;

    pid_t pid() const;
    // Sends the signal; false when the run had already ended (even if not
    // yet reaped), so the signal could not reach it.
    bool signal(int signalNumber) const;
    // The exit status (128 + signal when a signal ended it), or -1 when the
    // run did not end within the bound and was killed.
    int waitForExit(double boundSeconds);
    // The workers: the run's own children, in no particular order.
    std::vector<pid_t> children() const;

    // "<pid> <command line>" of every live process of the run other than
    // the run itself, waiting up to boundSeconds for them to go.
    std::vector<std::string> processesLeft(double boundSeconds) const;
    // Kills whatever processesLeft would find.
    void killLeftProcesses() const;
    // The live processes of the run other than the run itself, now.
    std::vector<pid_t> descendants() const;

    pid_t _pid = -1;
    bool _reaped = false;
    std::string _marker;
};

} // namespace FleetFaultTest

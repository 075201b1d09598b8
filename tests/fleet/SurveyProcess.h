#pragma once
// A command started in the background with its standard output and standard
// error going to files, so that a test can signal it while it runs and wait
// for it with a bound: a run that does not end in time is killed and
// reported, never left hanging the test.

#include <optional>
#include <string>
#include <sys/resource.h>
#include <sys/types.h>
#include <vector>

namespace FleetTest {

class SurveyProcess {
public:
    // Starts argv (argv[0] a path) with stdin from /dev/null. With a file
    // size limit, every file write of the process and of whatever it starts
    // fails past that many bytes with EFBIG (SIGXFSZ ignored), as on a full
    // disk, for root too; its standard output and error must stay below it.
    // With failingCalls, those system calls (SYS_fsync, say) fail with EIO
    // in the process and whatever it starts, as on a failing disk.
    SurveyProcess(std::vector<std::string> const& argv, std::string const& stdoutPath,
                  std::string const& stderrPath, std::optional<rlim_t> fileSizeLimit = {},
                  std::vector<long> const& failingCalls = {});
    // Kills and reaps the process if it still runs.
    ~SurveyProcess();
    SurveyProcess(SurveyProcess const&) = delete;
    SurveyProcess& operator=(SurveyProcess const&) = delete;

    void signal(int signalNumber) const;
    pid_t pid() const;
    // The exit status (128 + signal when a signal ended it), or -1 when the
    // process did not end within the bound and was killed.
    int waitForExit(double boundSeconds);
    // Seconds from the start to the end seen by waitForExit.
    double secondsTaken() const;

private:
    pid_t _pid = -1;
    double _started = 0.0;
    double _ended = 0.0;
};

// Seconds on a monotonic clock.
double monotonicSeconds();

} // namespace FleetTest

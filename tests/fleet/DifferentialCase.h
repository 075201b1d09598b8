#pragma once
// One differential case after run-cases.sh has run it: the one-machine
// survey tool's results for each machine in turn ("reference") and the
// console-wide survey's results per job count ("j<N>"). Each check reports a
// failure naming the case, the job count, the output and the first differing
// byte.
//
// The console-wide survey must leave what the reference left: the same
// stdout, the same stderr after the warnings for identities given twice, the
// same status files and VPD documents (time stamps of the run normalised),
// per machine the same trace (temporary file names normalised), the same
// multiset of console command lines (plus the machine listing for --all),
// nothing in /tmp, and the overall code of all listed partitions as exit
// status.

#include <string>
#include <vector>

namespace FleetTest {

class DifferentialCase {
public:
    // first and last: the seconds within which the runs took place.
    DifferentialCase(std::string folder, long first, long last);

    std::string name() const;
    void expectSameAsReference(int jobs) const;
    // The console-wide survey refused to start: exit status 73, standard
    // error one of the given texts, nothing else printed, no console command
    // run, nothing written, nothing left in /tmp.
    void expectRefusedUpFront(int jobs, std::vector<std::string> const& stderrTexts) const;

private:
    std::string _file(std::string const& run, std::string const& name) const;
    std::vector<std::string> _identities() const;
    bool _surveysAll() const;
    std::string _expectedStderr() const;
    int _expectedExitStatus() const;
    bool _listingFailed(std::string const& statusFileName) const;
    std::string _expectedCalls() const;
    void _expectSameFolder(std::string const& run, std::string const& folder) const;
    std::string _normalised(std::string const& folder, std::string const& text) const;
    void _expectEqual(std::string const& run, std::string const& what, std::string const& expected,
                      std::string const& actual) const;

    std::string _folder;
    long _first;
    long _last;
};

} // namespace FleetTest

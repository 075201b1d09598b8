#pragma once
// A batch of differential cases run in one sandbox: generated cases (one per
// seed, see generate-cases.py) and cases over shipped console scenarios, all
// run by run-cases.sh with the one-machine survey tool and the console-wide
// survey at each job count. One sandbox for many cases keeps the suite fast.

#include "DifferentialCase.h"
#include "QuorvexTest.h"

#include <string>
#include <vector>

namespace FleetTest {

class DifferentialBatch {
public:
    DifferentialBatch() = default;

    // Cases gen-<seed> for count seeds from firstSeed on.
    void addGenerated(int firstSeed, int count);
    // A case surveying the given identities of a scenario in sim/scenarios/;
    // with all, a run over --all whose sorted type-0 machines they are.
    void addShipped(std::string const& caseName, std::string const& scenario,
                    std::vector<std::string> const& identities, bool all);

    // Runs every case at every job count; the sandbox's exit status (77: no
    // sandbox could be made) and its output. The result folders are fresh
    // ones unless the sandbox options leave them missing ("--no-vpd-dir",
    // "--no-trace-dir") or make them read-only.
    QuorvexTest::CommandResult run(std::vector<int> const& jobCounts,
                                   std::vector<std::string> const& sandboxOptions = {});
    std::vector<DifferentialCase> cases() const;

private:
    QuorvexTest::TemporaryDirectory _folder;
    QuorvexTest::TemporaryDirectory _vpd;
    QuorvexTest::TemporaryDirectory _trace;
    std::vector<std::string> _caseFolders;
    long _first = 0;
    long _last = 0;
};

} // namespace FleetTest

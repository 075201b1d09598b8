#pragma once
// What the one-machine survey tool leaves when the client run of some
// partitions dies without printing anything: the record that a stopped
// action must get. The tool runs in a sandbox of its own against the current
// simulated console, with a stand-in remote action command that, for the
// chosen partitions, kills the action (the shell running it and itself) with
// SIGKILL before it prints anything, as a stopped action is killed.

#include "QuorvexTest.h"

#include <string>
#include <vector>

namespace FleetTest {

class KilledActionReference {
public:
    KilledActionReference(std::string const& identity,
                          std::vector<std::string> const& partitionIds);
    KilledActionReference(KilledActionReference const&) = delete;
    KilledActionReference& operator=(KilledActionReference const&) = delete;

    QuorvexTest::CommandResult const& result() const;
    // A file the run left in the VPD folder; throws when there is none.
    std::string vpdFile(std::string const& name) const;
    // The run's trace.
    std::string trace() const;

private:
    void _writeStandIn(std::vector<std::string> const& partitionIds) const;

    QuorvexTest::TemporaryDirectory _tools;
    QuorvexTest::TemporaryDirectory _vpd;
    QuorvexTest::TemporaryDirectory _trace;
    QuorvexTest::CommandResult _result;
};

} // namespace FleetTest

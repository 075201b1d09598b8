#pragma once

#include "fleet/RunRecords.h"

#include <cstddef>
#include <string>
#include <vector>

namespace fleet {

// What the records cannot tell of how the run ended.
struct RecapEnding {
    double elapsedSeconds = 0;
    // "SIGINT" or "SIGTERM" when a signal interrupted the run; else empty.
    std::string interruptedBy;
    // As given on the command line; empty when not asked for.
    std::string summaryFile;
    std::string reportFolder;
};

// The few lines a person reads at the end of a run: the partitions counted
// per outcome (every row of report::outcomeTable() that occurs, in its
// order), the failures grouped by outcome and reason with a count and the
// first host names (partitions without one by their identity), the longest-running partitions,
// where the summary and the report are, and whether a signal interrupted the run. Made from the
// run's records alone, so that an outcome added to the table shows here as
// it is.
class Recap {
public:
    explicit Recap(std::vector<MachineRecord> const& machines);

    // The recap, each line ending with a line end and fitted to columns
    // (0: unknown, taken as 80), host lists cut short with "and N more";
    // paths are kept whole, as a person copies them.
    std::string text(RecapEnding const& ending, std::size_t columns) const;

private:
    // Failures of one outcome and one reason, their partitions by name.
    struct FailureGroup {
        std::string label;
        std::string reason;
        std::vector<std::string> names;
    };
    struct Duration {
        double seconds = 0;
        std::string name;
    };

    void _count(PartitionRecord const& record);
    void _addFailure(std::string const& label, std::string const& reason, std::string const& name);
    std::string _headline(RecapEnding const& ending) const;
    std::string _totalsLine() const;
    std::string _failureLines(std::size_t columns) const;
    std::string _longestLine(std::size_t columns) const;

    std::size_t _machineCount = 0;
    std::size_t _partitionCount = 0;
    // By the outcome's place in the table.
    std::vector<std::size_t> _outcomeCounts;
    std::vector<FailureGroup> _failures;
    std::vector<Duration> _durations;
};

} // namespace fleet

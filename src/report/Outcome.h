#pragma once

#include "survey/PartitionOutcome.h"

#include <array>
#include <optional>
#include <string>

namespace report {

// How one partition of a run ended: the survey's own outcome, or the run
// stopping it. Every text the programs show for an outcome comes from the
// table in Outcome.cpp.
enum class Outcome {
    Surveyed,
    Inactive,
    ChannelFailure,
    ClientFailure,
    FetchFailure,
    TimedOut,
    Interrupted,
    WorkerDied,
};

// One row of the outcome table.
struct OutcomeText {
    Outcome outcome;
    // The summary's and the CSV's name, e.g. "channel_failure".
    char const* name;
    // What a person reads, e.g. "channel failure".
    char const* label;
    // The page's class of the outcome's rows: one letter keeps a table of
    // 50,000 rows small.
    char const* pageClass;
};

constexpr std::size_t gc_OutcomeCount = 8;

// Every outcome once, in the order summaries count them and the report
// shows them.
std::array<OutcomeText, gc_OutcomeCount> const& outcomeTable();

OutcomeText const& textOf(Outcome outcome);
char const* outcomeName(Outcome outcome);
// The outcome of a summary name; nullopt for a name the table lacks.
std::optional<Outcome> outcomeNamed(std::string const& name);
// Whether a partition that ended so failed: every outcome but surveyed and
// inactive (a partition that is not running is no failure of the run).
bool isFailure(Outcome outcome);
// The outcome of a survey that ran to its end.
Outcome outcomeOf(Quorvex::PYLON::VPD::PartitionOutcomeKind kind);

} // namespace report

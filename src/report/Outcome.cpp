#include "report/Outcome.h"

#include <algorithm>

namespace report {

namespace {

using Kind = Quorvex::PYLON::VPD::PartitionOutcomeKind;

std::array<OutcomeText, gc_OutcomeCount> const gc_OutcomeTable = {{
    {Outcome::Surveyed, "surveyed", "surveyed", "s"},
    {Outcome::Inactive, "inactive", "inactive", "i"},
    {Outcome::ChannelFailure, "channel_failure", "channel failure", "c"},
    {Outcome::ClientFailure, "client_failure", "client failure", "l"},
    {Outcome::FetchFailure, "fetch_failure", "fetch failure", "f"},
    {Outcome::TimedOut, "timed_out", "timed out", "t"},
    {Outcome::Interrupted, "interrupted", "interrupted", "x"},
    {Outcome::WorkerDied, "worker_died", "worker died", "w"},
}};

} // namespace

std::array<OutcomeText, gc_OutcomeCount> const& outcomeTable() {
    return gc_OutcomeTable;
}

OutcomeText const& textOf(Outcome outcome) {
    // The table lists the enumerators in their order.
    return gc_OutcomeTable[static_cast<std::size_t>(outcome)];
}

char const* outcomeName(Outcome outcome) {
    return textOf(outcome).name;
}

std::optional<Outcome> outcomeNamed(std::string const& name) {
    auto const found = std::find_if(gc_OutcomeTable.begin(), gc_OutcomeTable.end(),
                                    [&](OutcomeText const& row) { return name == row.name; });
    if (found == gc_OutcomeTable.end()) {
        return std::nullopt;
    }
    return found->outcome;
}

bool isFailure(Outcome outcome) {
    return outcome != Outcome::Surveyed && outcome != Outcome::Inactive;
}

Outcome outcomeOf(Kind kind) {
    switch (kind) {
    case Kind::Surveyed:
        return Outcome::Surveyed;
    case Kind::Inactive:
        return Outcome::Inactive;
    case Kind::ChannelFailure:
        return Outcome::ChannelFailure;
    case Kind::ClientFailure:
        return Outcome::ClientFailure;
    case Kind::FetchFailure:
        return Outcome::FetchFailure;
    }
    return Outcome::ChannelFailure;
}

} // namespace report

#pragma once

#include "report/Outcome.h"

#include <optional>
#include <string>

namespace report {

// The status text of a partition whose survey a signal to quorvex-survey
// stopped or kept from starting; the survey itself never writes it.
inline constexpr char gc_InterruptedStatusText[] = "Interrupted - not surveyed";
// The status text of a partition whose worker died (killed by a signal,
// crashed) before it told how the survey ended.
inline constexpr char gc_WorkerDiedStatusText[] = "Worker died - not surveyed";
// The status text of a partition whose worker could not be started.
inline constexpr char gc_NotStartedStatusText[] = "Failed - not started";
// A partition's code, as the survey prints it: surveyed, or not.
inline constexpr char gc_SurveyedCode[] = "0";
inline constexpr char gc_NotSurveyedCode[] = "8";

// The outcome a survey's status text stands for (any but TimedOut), or
// nothing for a text the survey never writes. A timed-out partition carries
// the text of the failure it ended as; only its document's reason tells the
// time limit apart (see FailureReason).
//
// The failure texts are written over a seed: "RELAY Failed, rc = <n>" and
// "Partition Failed, RcCmd = <n>" cover theirs whole, while a fetch failure
// writes only its code over the first characters of
// "get result Failed, rc = ", giving "2et result Failed, rc = ".
std::optional<Outcome> outcomeOfStatusText(std::string const& statusText);

} // namespace report

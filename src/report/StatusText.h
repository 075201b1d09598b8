#pragma once

#include <optional>
#include <string>

namespace report {

// The outcome a survey's status text stands for ("surveyed", "inactive",
// "channel_failure", "client_failure", "fetch_failure", "interrupted"), or
// nothing for a text the survey never writes. A timed-out partition carries
// the text of the failure it ended as; only its document's reason tells the
// time limit apart (see FailureReason).
//
// The failure texts are written over a seed: "RELAY Failed, rc = <n>" and
// "Partition Failed, RcCmd = <n>" cover theirs whole, while a fetch failure
// writes only its code over the first characters of
// "get result Failed, rc = ", giving "2et result Failed, rc = ".
std::optional<std::string> outcomeOfStatusText(std::string const& statusText);

} // namespace report

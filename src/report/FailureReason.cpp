#include "report/FailureReason.h"

#include "utility/TextChecks.h"

#include <regex>

namespace report {

using util::startsWith;

namespace {

constexpr char gc_ClientRunReason[] = "Partition not surveyed, reason: \n";
constexpr char gc_FetchReason[] = "Unable to get File From Partition : \n";

std::optional<long long> codeOnLine(std::string const& reason, std::regex const& line) {
    std::smatch match;
    if (!std::regex_search(reason, match, line)) {
        return std::nullopt;
    }
    try {
        return std::stoll(match[1].str());
    } catch (std::out_of_range const&) {
        return std::nullopt;
    }
}

std::optional<StopLine> parseStopLine(std::string const& reason) {
    static std::regex const timeLimit(
        R"((?:^|\n)Stopped by the time limit of [^\n]* s after ([0-9]+(?:\.[0-9]+)?) s\.)");
    static std::regex const signal(
        R"((?:^|\n)Stopped by (SIGINT|SIGTERM|SIGHUP|SIGPIPE) after ([0-9]+(?:\.[0-9]+)?) s\.)");
    std::smatch match;
    if (std::regex_search(reason, match, timeLimit)) {
        return StopLine{Stopper::TimeLimit, "", std::stod(match[1].str())};
    }
    if (std::regex_search(reason, match, signal)) {
        return StopLine{Stopper::Signal, match[1].str(), std::stod(match[2].str())};
    }
    return std::nullopt;
}

} // namespace

bool FailureReason::isStoppedByTimeLimit() const {
    return stop && stop->stopper == Stopper::TimeLimit;
}

bool FailureReason::isStoppedBySignal() const {
    return stop && stop->stopper == Stopper::Signal;
}

bool isFailureReason(std::string const& reason) {
    return startsWith(reason, gc_ClientRunReason) || startsWith(reason, gc_FetchReason);
}

FailureReason parseFailureReason(std::string const& reason) {
    static std::regex const rcLine(R"((?:^|\n)\[ *Rc\] = (-?[0-9]{1,18})\n)");
    static std::regex const rcCmdLine(R"((?:^|\n)\[ *RcCmd\] = (-?[0-9]{1,18})\n)");
    FailureReason facts;
    if (startsWith(reason, gc_ClientRunReason)) {
        facts.action = RemoteAction::RunCommand;
    } else if (startsWith(reason, gc_FetchReason)) {
        facts.action = RemoteAction::GetFile;
    }
    facts.rc = codeOnLine(reason, rcLine);
    facts.rcCmd = codeOnLine(reason, rcCmdLine);
    facts.stop = parseStopLine(reason);
    return facts;
}

} // namespace report

#include "report/FailureReason.h"

#include "utility/TextChecks.h"

#include <regex>

namespace report {

using util::startsWith;

namespace {

constexpr char clientRunReason[] = "Partition not surveyed, reason: \n";
constexpr char fetchReason[] = "Unable to get File From Partition : \n";

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

void parseStopLine(std::string const& reason, FailureReason& facts) {
    static std::regex const timeLimit(
        R"((?:^|\n)Stopped by the time limit of [^\n]* s after ([0-9]+(?:\.[0-9]+)?) s\.)");
    static std::regex const signal(
        R"((?:^|\n)Stopped by (SIGINT|SIGTERM) after ([0-9]+(?:\.[0-9]+)?) s\.)");
    std::smatch match;
    if (std::regex_search(reason, match, timeLimit)) {
        facts.stoppedBy = "time limit";
        facts.stoppedAfterSeconds = std::stod(match[1].str());
    } else if (std::regex_search(reason, match, signal)) {
        facts.stoppedBy = match[1].str();
        facts.stoppedAfterSeconds = std::stod(match[2].str());
    }
}

} // namespace

bool isFailureReason(std::string const& reason) {
    return startsWith(reason, clientRunReason) || startsWith(reason, fetchReason);
}

FailureReason parseFailureReason(std::string const& reason) {
    static std::regex const rcLine(R"((?:^|\n)\[ *Rc\] = (-?[0-9]{1,18})\n)");
    static std::regex const rcCmdLine(R"((?:^|\n)\[ *RcCmd\] = (-?[0-9]{1,18})\n)");
    FailureReason facts;
    if (startsWith(reason, clientRunReason)) {
        facts.action = "runCmdOnPartition";
    } else if (startsWith(reason, fetchReason)) {
        facts.action = "getFileFromPartition";
    }
    facts.rc = codeOnLine(reason, rcLine);
    facts.rcCmd = codeOnLine(reason, rcCmdLine);
    parseStopLine(reason, facts);
    return facts;
}

} // namespace report

#include "report/ListingFailure.h"

#include "report/JsonMember.h"

#include <cstddef>
#include <vector>

namespace report {

namespace {

// How the command runner traces one command: a header, the command line with
// the redirections to its output files, "RC = N", then "STDOUT" and "STDERR"
// each followed by the captured lines.
constexpr char gc_BlockHeader[] = "****** ShellCommand::execute ******\n";
constexpr char gc_StdoutRedirection[] = " > ";
constexpr char gc_StderrRedirection[] = " 2> ";
constexpr char gc_ExitStatusMark[] = "RC = ";
constexpr char gc_StdoutTitle[] = "STDOUT";
constexpr char gc_StderrTitle[] = "STDERR";
constexpr char gc_NotRun[] = "the command did not run: its output files in /tmp could not be made";
constexpr char gc_NoMessage[] = "the console gave no message";

std::vector<std::string> linesFrom(std::string const& text, std::size_t start) {
    std::vector<std::string> lines;
    while (start < text.size()) {
        std::size_t const end = text.find('\n', start);
        lines.push_back(text.substr(start, end == std::string::npos ? end : end - start));
        start = end == std::string::npos ? text.size() : end + 1;
    }
    return lines;
}

// The lines of the block after the header, or none when there is no block.
std::vector<std::string> blockLines(std::string const& trace) {
    std::size_t const header = trace.find(gc_BlockHeader);
    if (header == std::string::npos) {
        return {};
    }
    return linesFrom(trace, header + sizeof gc_BlockHeader - 1);
}

std::string withoutRedirections(std::string const& line) {
    std::size_t const stderrAt = line.rfind(gc_StderrRedirection);
    std::size_t const stdoutAt =
        stderrAt == std::string::npos ? stderrAt : line.rfind(gc_StdoutRedirection, stderrAt);
    return stdoutAt == std::string::npos ? line : line.substr(0, stdoutAt);
}

std::optional<int> exitStatusOf(std::vector<std::string> const& lines) {
    if (lines.size() < 2 || lines[1].rfind(gc_ExitStatusMark, 0) != 0) {
        return std::nullopt;
    }
    try {
        return std::stoi(lines[1].substr(sizeof gc_ExitStatusMark - 1));
    } catch (std::exception const&) {
        return std::nullopt;
    }
}

bool isBlank(std::string const& line) {
    return line.find_first_not_of(" \t\r") == std::string::npos;
}

// Standard error's first non-blank line, else standard output's. A captured
// line that reads exactly "STDERR" is taken for the title: the trace cannot
// tell them apart.
std::string firstErrorLine(std::vector<std::string> const& lines) {
    std::string firstOutput;
    bool inStderr = false;
    for (std::size_t i = 3; i < lines.size(); ++i) {
        if (!inStderr && lines[i] == gc_StderrTitle) {
            inStderr = true;
        } else if (inStderr && !isBlank(lines[i])) {
            return lines[i];
        } else if (!inStderr && firstOutput.empty() && !isBlank(lines[i])) {
            firstOutput = lines[i];
        }
    }
    return firstOutput.empty() ? gc_NoMessage : firstOutput;
}

} // namespace

std::optional<ListingFailure> listingFailureInTrace(std::string const& trace) {
    std::vector<std::string> const lines = blockLines(trace);
    if (lines.empty()) {
        return ListingFailure{"", std::nullopt, gc_NotRun};
    }
    std::optional<int> const exitStatus = exitStatusOf(lines);
    if (exitStatus && *exitStatus == 0) {
        return std::nullopt;
    }
    bool const hasOutput = lines.size() > 2 && lines[2] == gc_StdoutTitle;
    return ListingFailure{withoutRedirections(lines.front()), exitStatus,
                          hasOutput ? firstErrorLine(lines) : gc_NoMessage};
}

std::string listingCommandInTrace(std::string const& trace) {
    std::vector<std::string> const lines = blockLines(trace);
    return lines.empty() ? std::string() : withoutRedirections(lines.front());
}

ListingFailure stoppedListing(std::string const& trace, unsigned int timeoutSeconds) {
    return ListingFailure{listingCommandInTrace(trace), std::nullopt,
                          "stopped after the time limit of " + std::to_string(timeoutSeconds) +
                              " s"};
}

std::string listingFailureText(ListingFailure const& failure) {
    std::string text =
        failure.command.empty() ? std::string("the listing command") : failure.command;
    if (failure.exitStatus) {
        text += " exited with status " + std::to_string(*failure.exitStatus);
    }
    return text + ": " + failure.message;
}

nlohmann::ordered_json listingFailureDocument(ListingFailure const& failure) {
    return {
        {"command", failure.command},
        {"exit_status", failure.exitStatus ? nlohmann::ordered_json(*failure.exitStatus) : nullptr},
        {"message", failure.message}};
}

} // namespace report

namespace report {

std::string listingFailureText(nlohmann::ordered_json const& failure) {
    auto const text = [&failure](char const* name) {
        nlohmann::ordered_json const& value = member(failure, name);
        return value.is_string() ? value.get<std::string>() : std::string();
    };
    nlohmann::ordered_json const& exitStatus = member(failure, "exit_status");
    return listingFailureText(ListingFailure{
        text("command"),
        exitStatus.is_number_integer() ? std::optional<int>(exitStatus.get<int>()) : std::nullopt,
        text("message")});
}

} // namespace report

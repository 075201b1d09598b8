#include "fleet/RunFiles.h"

#include "survey/Survey_Files.h"
#include "utility/FileText.h"
#include "utility/SystemError.h"
#include "utility/TextChecks.h"

#include <unistd.h>

#include <cerrno>
#include <csignal>
#include <cstdio>
#include <filesystem>

namespace fleet {

namespace {

// Between a machine's trace name and the process and slot that own a piece.
constexpr char gc_PieceMark[] = ".piece-";
constexpr char gc_PieceSeparator[] = "-";
constexpr char gc_RunLockName[] = ".quorvex-survey.lock";
constexpr std::size_t gc_PidDigits = 7;

// The PID of the run that made the piece named name ("<trace>.piece-<pid>-
// <slot>"); nullopt for any other name.
std::optional<pid_t> runOfPiece(std::string const& name) {
    std::size_t const mark = name.rfind(gc_PieceMark);
    if (mark == std::string::npos) {
        return std::nullopt;
    }
    std::string const owner = name.substr(mark + sizeof gc_PieceMark - 1);
    std::size_t const separator = owner.find(gc_PieceSeparator);
    // PIDs have at most 7 digits (pid_max is at most 2^22).
    if (separator == std::string::npos || separator > gc_PidDigits ||
        !util::isDigits(owner.substr(0, separator)) ||
        !util::isDigits(owner.substr(separator + 1))) {
        return std::nullopt;
    }
    return static_cast<pid_t>(std::stol(owner.substr(0, separator)));
}

// A PID no process has; one signalled in vain for want of permission lives.
bool hasNoProcess(pid_t pid) {
    return ::kill(pid, 0) != 0 && errno == ESRCH;
}

} // namespace

std::string statusFilePath(std::string const& identity) {
    return Quorvex::PYLON::VPD::get_StatusFileName(identity);
}

std::string traceFilePath(std::string const& identity) {
    return Quorvex::PYLON::VPD::get_MachineTraceFileName(identity);
}

std::string runLockPath() {
    // The folder of any machine's status file: the name does not change it.
    return (std::filesystem::path(statusFilePath("x")).parent_path() / gc_RunLockName).string();
}

std::string tracePiecePath(std::string const& identity, std::size_t slot) {
    return traceFilePath(identity) + gc_PieceMark + std::to_string(getpid()) + gc_PieceSeparator +
           std::to_string(slot);
}

std::string traceFolder() {
    return std::filesystem::path(traceFilePath("x")).parent_path().string();
}

void removeTracePiecesOfEndedRuns(std::string const& folder) {
    // A folder that cannot be read holds no piece this run could remove.
    std::error_code unreadable;
    for (std::filesystem::directory_iterator entry(folder, unreadable), end; entry != end;
         entry.increment(unreadable)) {
        std::optional<pid_t> const run = runOfPiece(entry->path().filename().string());
        if (run && *run > 0 && hasNoProcess(*run)) {
            std::remove(entry->path().c_str());
        }
    }
}

std::optional<std::string> takeTracePiece(std::string const& piece) {
    std::string text;
    // A piece is a file a worker made: anything else under its name (a link
    // to a device, say) is not read, as it could be any file or never end.
    std::error_code missing;
    if (std::filesystem::symlink_status(piece, missing).type() !=
        std::filesystem::file_type::regular) {
        std::remove(piece.c_str());
        return std::nullopt;
    }
    try {
        text = util::readWholeFile(piece);
    } catch (util::SystemError const&) {
        // The unit wrote no trace.
        return std::nullopt;
    }
    // The slot's next unit makes its piece anew: no empty piece is left for
    // nobody to remove should the run be killed.
    std::remove(piece.c_str());
    return text;
}

} // namespace fleet

#include "fleet/RunFiles.h"

#include "survey/Survey_Files.h"
#include "utility/FileText.h"
#include "utility/SystemError.h"

#include <unistd.h>

#include <cstdio>
#include <filesystem>

namespace fleet {

namespace {

// Between a machine's trace name and the process and slot that own a piece.
constexpr char gc_PieceMark[] = ".piece-";
constexpr char gc_PieceSeparator[] = "-";
constexpr char gc_RunLockName[] = ".quorvex-survey.lock";

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

std::optional<std::string> takeTracePiece(std::string const& piece) {
    std::string text;
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

#include "fleet/RunFiles.h"

#include "survey/Survey_Files.h"

#include <unistd.h>

#include <cstdio>
#include <fstream>

namespace Fleet {

std::string RunFiles::statusFile(std::string const& identity) {
    return Quorvex::PYLON::VPD::get_StatusFileName(identity);
}

std::string RunFiles::traceFile(std::string const& identity) {
    return Quorvex::PYLON::VPD::get_MachineTraceFileName(identity);
}

std::string RunFiles::tracePiece(std::string const& identity, std::size_t piece) {
    return traceFile(identity) + ".piece-" + std::to_string(getpid()) + "-" + std::to_string(piece);
}

std::string RunFiles::_temporaryName(std::string const& path) {
    return path + ".tmp-" + std::to_string(getpid());
}

bool RunFiles::writeAtomically(std::string const& path, std::string const& text) {
    std::string const temporary = _temporaryName(path);
    {
        std::ofstream file(temporary, std::ios::binary | std::ios::trunc);
        if (!file) {
            return false;
        }
        file << text;
        file.flush();
        if (!file) {
            file.close();
            std::remove(temporary.c_str());
            return false;
        }
    }
    if (std::rename(temporary.c_str(), path.c_str()) != 0) {
        std::remove(temporary.c_str());
        return false;
    }
    return true;
}

void RunFiles::joinPieces(std::vector<std::string> const& pieces, std::string const& target) {
    std::string const temporary = _temporaryName(target);
    bool anyPiece = false;
    {
        std::ofstream joined;
        for (auto const& piece : pieces) {
            std::ifstream input(piece, std::ios::binary);
            if (!input) {
                continue;
            }
            if (!anyPiece) {
                joined.open(temporary, std::ios::binary | std::ios::trunc);
                anyPiece = true;
            }
            if (joined && input.peek() != std::ifstream::traits_type::eof()) {
                joined << input.rdbuf();
            }
        }
    }
    for (auto const& piece : pieces) {
        std::remove(piece.c_str());
    }
    if (anyPiece && std::rename(temporary.c_str(), target.c_str()) != 0) {
        std::remove(temporary.c_str());
    }
}

} // namespace Fleet

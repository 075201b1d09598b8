#include "fleet/RunFiles.h"

#include "survey/Survey_Files.h"

#include <unistd.h>

#include <cstdio>
#include <fstream>

namespace Fleet {

namespace {

constexpr char gc_TraceFolder[] = "Trace/";
constexpr char gc_StatusSuffix[] = ".status";
constexpr char gc_TraceSuffix[] = ".Trace";

std::string machineStem(char const* folder, std::string const& identity) {
    using namespace Quorvex::PYLON::VPD;
    return std::string(gc_QuorvexDirectory) + folder + gc_ProgramName + "_" + identity;
}

} // namespace

std::string RunFiles::statusFile(std::string const& identity) {
    return machineStem(Quorvex::PYLON::VPD::gc_VPD_Folder, identity) + gc_StatusSuffix;
}

std::string RunFiles::traceFile(std::string const& identity) {
    return machineStem(gc_TraceFolder, identity) + gc_TraceSuffix;
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

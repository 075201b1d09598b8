#include "fleet/MachineOutput.h"

#include "utility/AtomicFile.h"
#include "utility/SystemError.h"

#include "fleet/MachineReport.h"
#include "fleet/RunFiles.h"
#include "survey/Survey_Files.h"
#include "survey/calculate_ReturnCode.h"

#include <algorithm>
#include <cerrno>
#include <csignal>
#include <cstdio>
#include <iostream>

namespace fleet {

MachineOutput::MachineOutput(std::vector<MachineRecord> const& machines, ProgressLine& line)
    : _machines(machines), _line(line) {}

std::size_t MachineOutput::takeSlot() {
    auto const free = std::find(_slotInUse.begin(), _slotInUse.end(), false);
    std::size_t const slot = static_cast<std::size_t>(free - _slotInUse.begin());
    if (free == _slotInUse.end()) {
        _slotInUse.push_back(true);
    } else {
        *free = true;
    }
    return slot;
}

void MachineOutput::releaseSlot(std::size_t slot) {
    _slotInUse[slot] = false;
}

std::string MachineOutput::tracePiece(std::size_t machine, std::size_t slot) const {
    return tracePiecePath(_machines[machine].identity, slot);
}

void MachineOutput::writeReady(Scheduler const& scheduler) {
    while (_written < _machines.size() && scheduler.isMachineDone(_written)) {
        _write(_written);
        ++_written;
    }
}

void MachineOutput::writeRest() {
    while (_written < _machines.size()) {
        _write(_written);
        ++_written;
    }
}

bool MachineOutput::isAllWritten() const {
    return _written == _machines.size();
}

std::vector<std::string> const& MachineOutput::writeFailures() const {
    return _writeFailures;
}

void MachineOutput::_write(std::size_t index) {
    MachineRecord const& machine = _machines[index];
    _removeTracePieces(machine.identity);
    if (!machine.listed) {
        // A listing stopped by an interruption leaves no files and prints nothing.
        return;
    }
    _line.erase();
    printMachineBlock(machine);
    _noteUnwritableOutput();
    // The block ends with the code digit and no line end.
    _line.leaveOpenRow(std::string(get_OverallCode(machineReturnCodes(machine))).size());
    _writeFile(statusFilePath(machine.identity), machineStatusText(machine));
    std::optional<std::string> const trace = machineTraceText(machine);
    if (!trace || _writeFile(traceFilePath(machine.identity), *trace)) {
        _noteTracePieceFailure(machine);
    }
    _noteDocumentFailures(machine);
}

// A unit whose lines did not all reach its trace piece (a full Trace folder)
// leaves the machine's trace short of them: the trace is named, once, with
// the first such unit's reason, unless its own write failed and was named.
void MachineOutput::_noteTracePieceFailure(MachineRecord const& machine) {
    int error = machine.listingTraceError;
    for (auto record = machine.partitions.begin(); error == 0 && record != machine.partitions.end();
         ++record) {
        error = record->traceError;
    }
    if (error != 0) {
        _writeFailures.emplace_back(
            util::SystemError("write", traceFilePath(machine.identity), error).what());
    }
}

// A standard output that cannot be written (a full disk, say) stops the run
// as a reader gone does, by SIGPIPE, once its cause is said. A reader gone
// has sent SIGPIPE itself, which says it all.
void MachineOutput::_noteUnwritableOutput() {
    if (std::cout.good()) {
        return;
    }
    int const cause = errno;
    std::cout.clear();
    if (_outputFailed || cause == EPIPE) {
        return;
    }
    _outputFailed = true;
    _writeFailures.emplace_back(util::SystemError("write", "standard output", cause).what());
    std::raise(SIGPIPE);
}

// The documents are written by the survey code in the workers, which says
// nothing itself (the single-machine tool is silent there); its result
// carries the error up to here.
void MachineOutput::_noteDocumentFailures(MachineRecord const& machine) {
    for (PartitionRecord const& record : machine.partitions) {
        if (record.result.documentError != 0) {
            std::string const path =
                Quorvex::PYLON::VPD::get_LocalResultPath(record.result.fileName);
            _writeFailures.emplace_back(
                util::SystemError("write", path, record.result.documentError).what());
        }
    }
}

// A failure is kept for the end of the run, after every machine's block, so
// that the blocks stay byte for byte what the single-machine tool prints.
bool MachineOutput::_writeFile(std::string const& path, std::string const& text) {
    try {
        util::writeFileAtomically(path, text);
        return true;
    } catch (util::SystemError const& failure) {
        _writeFailures.emplace_back(failure.what());
        return false;
    }
}

void MachineOutput::_removeTracePieces(std::string const& identity) const {
    for (std::size_t slot = 0; slot < _slotInUse.size(); ++slot) {
        std::remove(tracePiecePath(identity, slot).c_str());
    }
}

} // namespace fleet

#pragma once

#include "fleet/ProgressLine.h"
#include "fleet/RunRecords.h"
#include "fleet/Scheduler.h"

#include <cstddef>
#include <string>
#include <vector>

namespace fleet {

// What the run writes for its machines, in listing order: each machine's
// block on standard output and error, its status file and its trace, as
// soon as it and every machine before it are done. It also hands out the
// trace slots: a unit writes its lines into the piece file of its slot, and
// a slot is taken by one unit in flight at a time, so that a run makes at
// most one piece file per slot and machine however many partitions it has.
class MachineOutput {
public:
    // machines and line belong to the caller and outlive this.
    MachineOutput(std::vector<MachineRecord> const& machines, ProgressLine& line);

    // The first free slot, taken until released.
    std::size_t takeSlot();
    void releaseSlot(std::size_t slot);
    // The piece file a unit of the machine running in the slot writes.
    std::string tracePiece(std::size_t machine, std::size_t slot) const;

    // Writes out every machine not yet written whose machines before it,
    // and itself, the scheduler has done.
    void writeReady(Scheduler const& scheduler);
    // Writes out every machine left, done or not: the run is over.
    void writeRest();
    bool isAllWritten() const;
    // Every file of the machines written so far that could not be written
    // (status file, trace or a piece of it, default document), as "cannot
    // write PATH: reason",
    // in the order met.
    std::vector<std::string> const& writeFailures() const;

private:
    void _write(std::size_t index);
    void _noteDocumentFailures(MachineRecord const& machine);
    void _noteTracePieceFailure(MachineRecord const& machine);
    void _noteUnwritableOutput();
    void _removeTracePieces(std::string const& identity) const;
    // False when it could not, the failure noted.
    bool _writeFile(std::string const& path, std::string const& text);

    std::vector<MachineRecord> const& _machines;
    ProgressLine& _line;
    std::vector<bool> _slotInUse;
    std::size_t _written = 0;
    std::vector<std::string> _writeFailures;
    // Standard output failed once: said once.
    bool _outputFailed = false;
};

} // namespace fleet

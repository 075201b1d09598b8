#pragma once

#include <sys/types.h>

#include <string>

namespace fleet {

// What a forked worker does to live no longer than the run and to hand its
// actions nothing but standard input, output and error.

// Ties the calling worker to the life of parent: the kernel signals the
// worker when parent ends (PR_SET_PDEATHSIG), and a thread of the worker
// then kills everything the worker started (it adopts their orphans),
// removes its temporary files and ends the worker with
// ChildProcess::ms_ParentGoneStatus. A parent already
// gone when the tie is made ends the worker at once. Throws
// util::SystemError when the tie cannot be made.
void tieToParent(pid_t parent);
// True once the worker has learned that its parent is gone: it must start
// nothing more.
bool isParentGone();
// The file the worker writes its trace into: removed when the parent is
// gone, as nobody will take it any more. One per worker; set before the
// worker writes it.
void removeWhenParentGone(std::string const& path);
// Blocks SIGPIPE in the calling thread once the worker runs no more
// commands: a write to a parent that is gone then fails with EPIPE instead
// of ending the worker before it has ended what it started.
void keepBrokenPipeFromEndingWorker();
// Kills everything the worker started and still runs (helpers an action
// left running included: the worker adopted them), reaps it and ends the
// worker with status: nothing a unit started outlives it.
[[noreturn]] void endWorker(int status);
// Marks every descriptor above standard error close-on-exec, so that the
// commands the worker runs inherit none of them (the trace piece among
// them); their output is unchanged.
void keepDescriptorsFromActions();

} // namespace fleet

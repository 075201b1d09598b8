#pragma once

#include <sys/types.h>

namespace fleet {

// What a forked worker does to live no longer than the run and to hand its
// actions nothing but standard input, output and error.

// Ties the calling worker to the life of parent: the kernel signals the
// worker when parent ends (PR_SET_PDEATHSIG), and a thread of the worker
// then kills everything the worker started (it adopts their orphans) and
// ends the worker with ChildProcess::ms_ParentGoneStatus. A parent already
// gone when the tie is made ends the worker at once. Throws
// util::SystemError when the tie cannot be made.
void tieToParent(pid_t parent);
// True once the worker has learned that its parent is gone: it must start
// nothing more.
bool isParentGone();
// Marks every descriptor above standard error close-on-exec, so that the
// commands the worker runs inherit none of them (the trace piece among
// them); their output is unchanged.
void keepDescriptorsFromActions();

} // namespace fleet

#pragma once

namespace report {

// How long every program that opens the history database waits for
// another process that holds it before it gives up: a writer (a run
// recording itself, a prune) for the writer before it, a reader (the
// report, the metrics, the history command) for the moment a writer
// holds the whole file. One value for all, so that docs/history.md can
// say how long each waits.
inline constexpr int gc_HistoryBusyTimeoutMilliseconds = 5000;

} // namespace report

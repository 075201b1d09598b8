#pragma once

#include <SQLiteCpp/Database.h>

#include <string>

namespace history {

// Computes the changes a recorded run brought against the console's
// previous run and writes them (events, and the derived columns of the
// run's partition rows), within the caller's transaction. The run's VPD
// documents are read from documentFolder: a document path of the summary is
// read as documentFolder + "/" + its base name.
class ChangeRecorder {
public:
    explicit ChangeRecorder(std::string documentFolder);

    void record(SQLite::Database& db, long long runId) const;

private:
    std::string _documentFolder;
};

} // namespace history

#include "report/ReportWriter.h"

#include "report/DocumentCopies.h"
#include "report/PartitionsCsv.h"
#include "report/ReportPage.h"
#include "report/RunSummary.h"
#include "utility/AtomicFile.h"
#include "utility/SystemError.h"

#include <filesystem>

namespace report {

using util::writeFileAtomically;

namespace fs = std::filesystem;

namespace {

void createFolder(std::string const& folder) {
    std::error_code error;
    fs::create_directories(folder, error);
    if (error) {
        throw util::SystemError("create", folder, error.value());
    }
}

} // namespace

void writeReport(nlohmann::ordered_json const& summary, std::string const& vpdFolder,
                 std::string const& folder) {
    createFolder(folder);
    std::string const base = fs::path(folder).string() + "/";
    // Made even when no document is named: every report folder has the
    // same shape.
    createFolder(base + gc_DocumentFolder);
    writeFileAtomically(base + "summary.json", summaryText(summary));
    writeFileAtomically(base + "partitions.csv", partitionsCsv(summary));
    std::set<std::string> const copied = copyDocuments(summary, vpdFolder, folder);
    writeFileAtomically(base + "index.html", reportPage(summary, copied));
}

} // namespace report

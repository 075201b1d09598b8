#include "report/ReportWriter.h"

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

// The documents' folder as seen from the report's folder, "/"-separated.
std::string documentFolderFrom(std::string const& vpdFolder, std::string const& folder) {
    std::error_code error;
    fs::path const documents = fs::weakly_canonical(fs::absolute(vpdFolder), error);
    fs::path const report = fs::weakly_canonical(fs::absolute(folder), error);
    fs::path const relative = documents.lexically_relative(report);
    return relative.empty() ? documents.generic_string() : relative.generic_string();
}

} // namespace

void writeReport(nlohmann::ordered_json const& summary, std::string const& vpdFolder,
                 std::string const& folder) {
    std::error_code error;
    fs::create_directories(folder, error);
    if (error) {
        throw util::SystemError("create", folder, error.value());
    }
    std::string const base = fs::path(folder).string() + "/";
    writeFileAtomically(base + "summary.json", summaryText(summary));
    writeFileAtomically(base + "partitions.csv", partitionsCsv(summary));
    writeFileAtomically(base + "index.html",
                        reportPage(summary, documentFolderFrom(vpdFolder, folder)));
}

} // namespace report

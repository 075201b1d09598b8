#include "report/ReportWriter.h"

#include "report/AtomicFile.h"
#include "report/PartitionsCsv.h"
#include "report/ReportPage.h"
#include "report/RunSummary.h"

#include <filesystem>
#include <stdexcept>

namespace report {

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
        throw std::runtime_error("cannot create " + folder + ": " + error.message());
    }
    std::string const base = fs::path(folder).string() + "/";
    writeFileAtomically(base + "summary.json", summaryText(summary));
    writeFileAtomically(base + "partitions.csv", partitionsCsv(summary));
    writeFileAtomically(base + "index.html",
                        reportPage(summary, documentFolderFrom(vpdFolder, folder)));
}

} // namespace report

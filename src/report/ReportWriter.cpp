#include "report/ReportWriter.h"

#include "report/DocumentCopies.h"
#include "report/JsonMember.h"
#include "report/PartitionsCsv.h"
#include "report/ReportPage.h"
#include "report/RunSummary.h"
#include "utility/AtomicFile.h"
#include "utility/FileText.h"
#include "utility/LocalTime.h"
#include "utility/SystemError.h"

#include <sys/stat.h>

#include <algorithm>
#include <cerrno>
#include <cstdio>
#include <ctime>
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

// The report's files, each kept beside the next report under the run time of
// its own report as <stem>-<time><extension>.
struct ReportFile {
    char const* stem;
    char const* extension;
};
constexpr ReportFile gc_ReportFiles[] = {
    {"index", ".html"}, {"partitions", ".csv"}, {"summary", ".json"}};

// The start of the run a report describes, as its summary says, else the
// time its page was written; ISO 8601 without the colons that some file
// systems and URLs refuse.
std::string runTimeOfReport(std::string const& base) {
    std::string started;
    try {
        nlohmann::ordered_json const summary =
            nlohmann::ordered_json::parse(util::readWholeFileOrEmpty(base + "summary.json"));
        if (member(summary, "started").is_string()) {
            started = member(summary, "started").get<std::string>();
        }
    } catch (nlohmann::json::exception const&) {
        // A summary that cannot be read leaves the page's time.
    }
    if (started.empty()) {
        struct stat page {};
        started = util::localTimeText(
            stat((base + "index.html").c_str(), &page) == 0 ? page.st_mtime : std::time(nullptr));
    }
    started.erase(std::remove(started.begin(), started.end(), ':'), started.end());
    return started;
}

std::string keptName(std::string const& base, ReportFile const& file, std::string const& runTime) {
    std::string name = base;
    name.append(file.stem).append("-").append(runTime).append(file.extension);
    return name;
}

// A time no kept report has yet: two reports of one second get "-2", "-3"...
std::string freeRunTime(std::string const& base, std::string const& runTime) {
    std::string candidate = runTime;
    for (int next = 2; fs::exists(keptName(base, {"index", ".html"}, candidate)); ++next) {
        candidate = runTime + "-" + std::to_string(next);
    }
    return candidate;
}

void keepPreviousReport(std::string const& base) {
    if (!fs::exists(base + "index.html")) {
        return;
    }
    std::string const runTime = freeRunTime(base, runTimeOfReport(base));
    for (ReportFile const& file : gc_ReportFiles) {
        std::string const current = base + file.stem + file.extension;
        std::string const kept = keptName(base, file, runTime);
        if (fs::exists(current) && std::rename(current.c_str(), kept.c_str()) != 0) {
            throw util::SystemError("rename", current, errno);
        }
    }
}

} // namespace

void writeReport(nlohmann::ordered_json const& summary, std::string const& vpdFolder,
                 std::string const& folder, std::optional<SinceLastRun> const& since,
                 DocumentPlacement placement) {
    createFolder(folder);
    std::string const base = fs::path(folder).string() + "/";
    keepPreviousReport(base);
    // Made even when no document is named: every report folder has the
    // same shape.
    createFolder(base + gc_DocumentFolder);
    writeFileAtomically(base + "summary.json", summaryText(summary));
    writeFileAtomically(base + "partitions.csv", partitionsCsv(summary, since));
    std::set<std::string> const copied = copyDocuments(summary, vpdFolder, folder, placement);
    writeFileAtomically(base + "index.html", reportPage(summary, copied, since));
}

} // namespace report

#include "fleet/OutputFolders.h"

#include "fleet/RunFiles.h"
#include "utility/SystemError.h"

#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstdlib>
#include <filesystem>

namespace fleet {

namespace {

namespace fs = std::filesystem;

// The file left for an instant in each folder to prove it writable.
constexpr char gc_ProbeName[] = "/.quorvex-survey-check.XXXXXX";

std::string folderOf(std::string const& path) {
    std::string const parent = fs::path(path).parent_path().string();
    return parent.empty() ? "." : parent;
}

void proveWritable(std::string const& folder) {
    std::string probe = folder + gc_ProbeName;
    int const descriptor = ::mkstemp(probe.data());
    if (descriptor < 0) {
        throw util::SystemError("write into", folder, errno);
    }
    ::close(descriptor);
    ::unlink(probe.c_str());
}

void createFolder(std::string const& folder) {
    std::error_code error;
    fs::create_directories(folder, error);
    if (error) {
        throw util::SystemError("create", folder, error.value());
    }
}

// The summary, metrics and JUnit files replace their file by a rename,
// which a folder in its place would refuse at the end of the run.
void proveFilePath(std::string const& path) {
    createFolder(folderOf(path));
    proveWritable(folderOf(path));
    struct stat status {};
    if (::stat(path.c_str(), &status) == 0 && S_ISDIR(status.st_mode)) {
        throw util::SystemError("write", path, EISDIR);
    }
}

void check(std::vector<std::string>& failures, void (*prove)(std::string const&),
           std::string const& path) {
    try {
        prove(path);
    } catch (util::SystemError const& failure) {
        failures.emplace_back(failure.what());
    }
}

void proveReportFolder(std::string const& folder) {
    createFolder(folder);
    proveWritable(folder);
}

} // namespace

std::vector<std::string> unwritableOutputs(Options const& options) {
    std::vector<std::string> failures;
    check(failures, &proveWritable, folderOf(statusFilePath("")));
    check(failures, &proveWritable, folderOf(traceFilePath("")));
    if (!options.summaryFile.empty()) {
        check(failures, &proveFilePath, options.summaryFile);
    }
    for (std::string const* file : {&options.metricsFile, &options.junitFile}) {
        if (!file->empty()) {
            check(failures, &proveFilePath, *file);
        }
    }
    if (!options.reportFolder.empty()) {
        check(failures, &proveReportFolder, options.reportFolder);
    }
    return failures;
}

} // namespace fleet

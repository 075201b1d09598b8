#include "report/DocumentCopies.h"

#include "report/JsonMember.h"
#include "utility/AtomicFile.h"
#include "utility/FileText.h"
#include "utility/SystemError.h"

#include <cerrno>
#include <cstdio>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace report {

namespace {

// The documents the summary's partitions name, each once: partitions of
// one machine may share a document.
std::set<std::string> namedDocuments(nlohmann::ordered_json const& summary) {
    std::set<std::string> documents;
    for (nlohmann::ordered_json const& machine : member(summary, "machines")) {
        for (nlohmann::ordered_json const& partition : member(machine, "partitions")) {
            nlohmann::ordered_json const& document = member(partition, "document");
            if (document.is_string() && documentFileName(document.get<std::string>())) {
                documents.insert(document.get<std::string>());
            }
        }
    }
    return documents;
}

// Whether the document could be copied; false when it is gone.
bool copyDocument(std::string const& from, std::string const& to) {
    std::string text;
    try {
        text = util::readWholeFile(from);
    } catch (util::SystemError const& failure) {
        if (failure.errorNumber() == ENOENT) {
            return false;
        }
        throw;
    }
    util::writeFileAtomically(to, text);
    return true;
}

std::string temporaryNameFor(std::string const& path) {
    std::string::size_type const slash = path.rfind('/');
    return path.substr(0, slash + 1) + "." + path.substr(slash + 1) + "." +
           std::to_string(::getpid());
}

// A copy for the cases where no hard link can be made: across file systems
// (EXDEV) and where the system refuses one (EPERM: a file of another owner
// under protected hard links, a file system without links). The folder is
// flushed once after the last document rather than each copy.
void copyWithoutFlush(std::string const& from, std::string const& to) {
    std::string const text = util::readWholeFile(from);
    int const descriptor = ::open(to.c_str(), O_WRONLY | O_CREAT | O_TRUNC | O_CLOEXEC, 0666);
    if (descriptor < 0) {
        throw util::SystemError("write", to, errno);
    }
    bool const written = util::writeAll(descriptor, text);
    int const error = errno;
    if (::close(descriptor) != 0 || !written) {
        int const reported = written ? errno : error;
        ::unlink(to.c_str());
        throw util::SystemError("write", to, reported);
    }
}

// Whether from is gone, rather than the link's own folder, when link()
// says ENOENT.
bool isGone(std::string const& from) {
    struct stat status {};
    return ::lstat(from.c_str(), &status) != 0 && errno == ENOENT;
}

// Whether the document could be linked (or copied) through a temporary
// name; false when it is gone.
bool linkThroughTemporary(std::string const& from, std::string const& to) {
    std::string const temporary = temporaryNameFor(to);
    ::unlink(temporary.c_str());
    if (::link(from.c_str(), temporary.c_str()) != 0) {
        int const error = errno;
        if (error == ENOENT && isGone(from)) {
            return false;
        }
        if (error != EXDEV && error != EPERM) {
            throw util::SystemError("write", to, error);
        }
        copyWithoutFlush(from, temporary);
    }
    if (std::rename(temporary.c_str(), to.c_str()) != 0) {
        int const error = errno;
        ::unlink(temporary.c_str());
        throw util::SystemError("write", to, error);
    }
    return true;
}

// Whether the document could be linked (or copied); false when it is gone.
// A new link appears whole at once, so only a document that replaces one an
// earlier report left, or is copied, goes through a temporary name.
bool linkDocument(std::string const& from, std::string const& to) {
    return ::link(from.c_str(), to.c_str()) == 0 || linkThroughTemporary(from, to);
}

} // namespace

std::optional<std::string> documentFileName(std::string const& document) {
    std::string const file = document.substr(document.rfind('/') + 1);
    if (file.empty() || file == "." || file == "..") {
        return std::nullopt;
    }
    return file;
}

std::set<std::string> copyDocuments(nlohmann::ordered_json const& summary,
                                    std::string const& vpdFolder, std::string const& reportFolder,
                                    DocumentPlacement placement) {
    std::set<std::string> copied;
    std::string const from = vpdFolder + "/";
    std::string const to = reportFolder + "/" + gc_DocumentFolder + "/";
    bool const linked = placement == DocumentPlacement::link;
    for (std::string const& document : namedDocuments(summary)) {
        std::string const file = *documentFileName(document);
        if (linked ? linkDocument(from + file, to + file) : copyDocument(from + file, to + file)) {
            copied.insert(document);
        }
    }
    if (linked) {
        util::flushFolderToDisk(to);
    }
    return copied;
}

} // namespace report

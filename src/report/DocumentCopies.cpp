#include "report/DocumentCopies.h"

#include "report/JsonMember.h"
#include "utility/AtomicFile.h"
#include "utility/FileText.h"
#include "utility/SystemError.h"

#include <cerrno>

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

} // namespace

std::optional<std::string> documentFileName(std::string const& document) {
    std::string const file = document.substr(document.rfind('/') + 1);
    if (file.empty() || file == "." || file == "..") {
        return std::nullopt;
    }
    return file;
}

std::set<std::string> copyDocuments(nlohmann::ordered_json const& summary,
                                    std::string const& vpdFolder, std::string const& reportFolder) {
    std::set<std::string> copied;
    std::string const from = vpdFolder + "/";
    std::string const to = reportFolder + "/" + gc_DocumentFolder + "/";
    for (std::string const& document : namedDocuments(summary)) {
        std::string const file = *documentFileName(document);
        if (copyDocument(from + file, to + file)) {
            copied.insert(document);
        }
    }
    return copied;
}

} // namespace report

#pragma once

#include <nlohmann/json.hpp>

#include <optional>
#include <set>
#include <string>

namespace report {

// The report folder's subfolder that holds copies of the run's VPD
// documents. The page links to them there, relative to itself, so that its
// links work wherever the report folder is copied or served from.
constexpr char const* gc_DocumentFolder = "documents";

// The file name of a document as the summary names it ("VPD/x.VPD.xml"
// gives "x.VPD.xml"); nothing for a name without a file ("", "VPD/", "..").
std::optional<std::string> documentFileName(std::string const& document);

// How the documents reach the report folder. A run's report copies each
// one, flushed to the disk: the next run rewrites its VPD folder. The estate
// links them to its collect folder's documents instead (a hard link, or a
// copy where the two folders lie on different file systems) and flushes the
// documents folder once: a copy flushed per document would cost the estate
// one disk flush for each of its partitions.
enum class DocumentPlacement { copy, link };

// Copies (or links, as placement says) every document the summary's
// partitions name from vpdFolder into reportFolder/documents, a folder that
// must exist, each through a temporary name renamed when complete. Returns the documents copied, as
// the summary names them: a document no longer in vpdFolder is left out, as the page can link only
// what is there. Throws util::SystemError when a document cannot be read for another reason or its
// copy cannot be written.
std::set<std::string> copyDocuments(nlohmann::ordered_json const& summary,
                                    std::string const& vpdFolder, std::string const& reportFolder,
                                    DocumentPlacement placement = DocumentPlacement::copy);

} // namespace report

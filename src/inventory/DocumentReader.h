#pragma once

#include "inventory/DocumentReading.h"

#include <string>
#include <string_view>

namespace inventory {

// Reads a VPD document as the survey writes or fetches it (docs/inventory.md)
// into its components. Never throws for the document's content: a document
// that is not well-formed, cut short, or not XML at all is read as far as it
// goes, and the reading says where it stopped and why.
[[nodiscard]] DocumentReading readDocument(std::string_view document);

// The same for the document in the file at path. Throws util::SystemError
// when the file cannot be read.
[[nodiscard]] DocumentReading readDocumentFile(std::string const& path);

} // namespace inventory

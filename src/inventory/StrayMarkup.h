#pragma once

#include <string>
#include <string_view>

namespace inventory {

// The survey writes VPD documents without escaping (docs/compatibility.md,
// "Nothing is escaped in the VPD documents"), so a value may hold a bare
// "&", "<", ">" or '"'. These functions give the same document with every
// such character escaped, so that an XML parser reads the value as written.
// The documents' fixed shape says what is markup: the declaration at the
// start, and the begin and end tags of the document's own elements
// (docs/inventory.md); every other "<" is text. Every "&" is text too: the
// writer never escapes, so "&amp;" in a document stands for those five
// characters. Line ends are neither added nor removed: a line of the result
// is the same line of the document.
[[nodiscard]] std::string escapeStrayMarkup(std::string_view document);

} // namespace inventory

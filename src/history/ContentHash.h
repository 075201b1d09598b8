#pragma once

#include <string>
#include <string_view>

namespace history {

// The 128-bit hash the history addresses VPD documents by (docs/history.md,
// "Inventory"), as 32 lower-case hexadecimal digits. It is no cryptographic
// hash: it tells documents that differ apart at the speed the file system
// reads them, so that a run of 200,000 partitions recognises its unchanged
// documents without reading them into components.
[[nodiscard]] std::string contentHash(std::string_view bytes);

} // namespace history

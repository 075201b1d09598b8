#pragma once

#include <string>

namespace util {

// Console texts (host names, OS texts, return strings) arrive as raw bytes.
// The files this system writes for people are UTF-8, so every byte that does not belong to a
// well-formed UTF-8 sequence becomes U+FFFD.
std::string validUtf8(std::string const& bytes);

// The text made safe for HTML content and quoted attribute values: & < > " '
// become entities, and bytes that are not UTF-8 become U+FFFD.
std::string escapeHtml(std::string const& text);

} // namespace util

#pragma once

#include <string>
#include <string_view>

namespace util {

// Console texts (host names, OS texts, return strings) arrive as raw bytes.
// The files this system writes for people are UTF-8, so every byte that does not belong to a
// well-formed UTF-8 sequence becomes U+FFFD.
std::string validUtf8(std::string const& bytes);

// The text made safe for HTML content and quoted attribute values: & < > " '
// become entities, and bytes that are not UTF-8 become U+FFFD.
std::string escapeHtml(std::string const& text);

// The entity escapeHtml writes for c (&amp; &lt; &gt; &quot; &#39;), empty
// for a character written as it is: one table for every writer of HTML or
// XML text.
std::string_view htmlEntityOf(char c);

} // namespace util

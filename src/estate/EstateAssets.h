#pragma once

#include <string_view>

namespace estate {

// The estate page's own files from src/estate/page, put into the program at
// build time (see cmake/EmbedText.cmake), as the report page's are.

// estate.html: the page without its data; estatePage() fills each
// <!--{{name}}--> placeholder.
extern std::string_view const gc_EstatePageSkeleton;
// estate.css, written inline after the report page's style sheet.
extern std::string_view const gc_EstateStyle;
// estate.js, written inline into the page's <script>.
extern std::string_view const gc_EstateScript;

} // namespace estate

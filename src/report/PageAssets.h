#pragma once

#include <string_view>

namespace report {

// The report page's own files from src/report/page, put into the program at
// build time (see cmake/EmbedText.cmake), so that the page needs nothing but
// itself, from file:// too, and the program looks up no file to write it.

// report.html: the page without its data; reportPage() fills each
// <!--{{name}}--> placeholder.
extern std::string_view const gc_PageSkeleton;
// report.css, written inline into the page's <style>.
extern std::string_view const gc_PageStyle;
// history.css, added to the page's <style> when the page shows the history.
extern std::string_view const gc_HistoryStyle;
// report.js, written inline into the page's <script>.
extern std::string_view const gc_PageScript;

} // namespace report

#pragma once

namespace report {

// The style sheet and the script of the report page, written into it inline
// so that the page needs nothing but itself, from file:// too.
extern char const* const pageStyle;
extern char const* const pageScript;

} // namespace report

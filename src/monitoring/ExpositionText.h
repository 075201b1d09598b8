#pragma once

#include <string>

namespace monitoring {

// The pieces of the Prometheus text exposition format (version 0.0.4) that
// the metrics file needs, as the node exporter's textfile collector reads
// it. Console texts arrive as raw bytes: both make them UTF-8 first (bytes
// that are not become U+FFFD), which the format requires.

// A label value as it goes between the quotes: backslash, double quote and
// line end escaped as \\, \" and \n.
std::string labelValue(std::string const& text);

// A HELP text: backslash and line end escaped as \\ and \n.
std::string helpText(std::string const& text);

} // namespace monitoring

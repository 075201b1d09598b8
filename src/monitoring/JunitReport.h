#pragma once

#include "report/RunSummary.h"

#include <string>

namespace monitoring {

// The run as JUnit XML for CI dashboards (docs/junit.md, docs/junit.xsd):
// <testsuites> holding a <testsuite> per machine, named after its identity,
// and a <testcase> per listed partition (classname the machine, name the
// host as listed, " #2" and on for a host listed again). Surveyed passes;
// failing outcomes are a <failure> with the reason as message and text;
// inactive and interrupted partitions are <skipped>: neither was surveyed
// and neither failed. A machine whose listing failed is one failing case,
// "partition listing"; a console whose machine listing failed (--all) is a
// suite "machine listing" with one failing case.
//
// Unlike the VPD documents this file is read by other programs: pugixml
// writes it and escapes it, and every text is made a valid XML 1.0
// character sequence first (bytes that are not UTF-8 and control
// characters other than tab and line ends become U+FFFD).
std::string junitText(report::RunSummary const& summary);

} // namespace monitoring

#pragma once
// Paths of the two survey programs in the build tree, and the console the
// behaviour and fault tests of quorvex-survey survey.

#include <string>

namespace FleetTest {

// quorvex-survey, the console-wide survey.
std::string consoleWideTool();
// quorvexPYLON_VPD_Survey_ClientPartition, the one-machine survey tool.
std::string oneMachineTool();

// The machine the tests survey.
inline constexpr char gc_Identity[] = "1234-ABC_10ABCDE";
// What a remote action that worked prints, as a line of a scenario.
inline constexpr char gc_Answer[] = "stdout Rc::0::RcCmd::0::RetStr1::done::RetStr2::\n";

// The scenario's listing of gc_Identity: partitions 1 to partitions, all
// active, host<id> at 10.1.1.1<id>.
std::string listing(int partitions);

} // namespace FleetTest

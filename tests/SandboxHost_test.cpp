// Runs on the host and calls tools/sandbox itself, to check what the sandbox
// leaves behind (nothing) and how it passes exit statuses through.

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace
{

using QuorvexTest::fileExists;
using QuorvexTest::runInSandbox;

// The paths the sandbox provides; none may appear on the host.
std::vector<std::string> const& _consolePaths()
{
    static std::vector<std::string> const paths{"/var/adm", "/opt/vtc", "/opt/lsvtc",
                                                "/usr/bin/runact-api"};
    return paths;
}

}  // namespace

TEST(SandboxHost, ExitStatusOfTheCommandPassesThrough)
{
    EXPECT_EQ(0, runInSandbox({}, {"true"}).exitStatus);
    EXPECT_EQ(42, runInSandbox({}, {"sh", "-c", "exit 42"}).exitStatus);
}

TEST(SandboxHost, NothingAppearsOnTheHost)
{
    std::vector<std::string> absentBefore;
    for (std::string const& path : _consolePaths())
    {
        if (!fileExists(path))
        {
            absentBefore.push_back(path);
        }
    }
    if (absentBefore.empty())
    {
        GTEST_SKIP() << "the host already has every console path";
    }
    QuorvexTest::CommandResult const run = runInSandbox(
        {}, {"sh", "-c",
             "touch /var/adm/quorvex/VPD/x /var/adm/quorvex/Trace/y /opt/vtc/bin/z && "
             "/usr/bin/runact-api -c x >/dev/null; /opt/lsvtc/bin/lsvtc -t0"});
    if (run.exitStatus == 77)
    {
        GTEST_SKIP() << run.stderrText;
    }
    ASSERT_EQ(0, run.exitStatus) << run.stderrText;
    for (std::string const& path : absentBefore)
    {
        EXPECT_FALSE(fileExists(path)) << path;
    }
}

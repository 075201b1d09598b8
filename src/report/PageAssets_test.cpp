#include "report/PageAssets.h"

#include "TestConstants.h"

#include <gtest/gtest.h>

#include <cctype>
#include <fstream>
#include <sstream>

namespace {

std::string pageFile(std::string const& name) {
    std::ifstream file(QuorvexTest::sourceRoot() + "/src/report/page/" + name, std::ios::binary);
    std::ostringstream text;
    text << file.rdbuf();
    return text.str();
}

// The build writes the files into raw string literals; quotes, backslashes
// (the style sheet's "\2013"), semicolons and line ends must come through
// unchanged.
TEST(PageAssets, EmbeddedPageFilesAreTheSourceFilesByteForByte) {
    std::string const skeleton = pageFile("report.html");
    ASSERT_FALSE(skeleton.empty());
    EXPECT_EQ(skeleton, report::gc_PageSkeleton);
    EXPECT_EQ(pageFile("report.css"), report::gc_PageStyle);
    EXPECT_EQ(pageFile("history.css"), report::gc_HistoryStyle);
    EXPECT_EQ(pageFile("report.js"), report::gc_PageScript);
}

std::string lowerCase(std::string_view text) {
    std::string lower(text);
    for (char& c : lower) {
        c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
    }
    return lower;
}

// The page writes them inline: an end tag inside would end the element
// early and show the rest as text.
TEST(PageAssets, InlineStyleAndScriptHoldNoEndTagOfTheirElement) {
    EXPECT_EQ(std::string::npos, lowerCase(report::gc_PageStyle).find("</style"));
    EXPECT_EQ(std::string::npos, lowerCase(report::gc_HistoryStyle).find("</style"));
    EXPECT_EQ(std::string::npos, lowerCase(report::gc_PageScript).find("</script"));
}

} // namespace

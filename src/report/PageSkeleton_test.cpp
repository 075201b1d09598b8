#include "report/PageSkeleton.h"

#include <gtest/gtest.h>

#include <stdexcept>

namespace {

using report::Placeholder;

Placeholder appending(std::string_view name, std::string text) {
    return {name, [text = std::move(text)](std::string& page) { page += text; }};
}

TEST(PageSkeleton, PlaceholdersAreReplacedAndTheTextAroundThemKept) {
    std::string page = "before:";
    report::fillSkeleton(page, "<p><!--{{greeting}}-->, <!--{{name}}-->!</p>\n",
                         {appending("name", "world"), appending("greeting", "Hello")});
    EXPECT_EQ("before:<p>Hello, world!</p>\n", page);
}

TEST(PageSkeleton, PlaceholderUsedTwiceIsFilledTwice) {
    std::string page;
    report::fillSkeleton(page, "<!--{{host}}-->|<!--{{host}}-->", {appending("host", "h1")});
    EXPECT_EQ("h1|h1", page);
}

TEST(PageSkeleton, OrdinaryCommentsAndSkeletonWithoutPlaceholdersStayAsTheyAre) {
    std::string page;
    report::fillSkeleton(page, "<!-- a note --><p>{{not one}}</p>", {});
    EXPECT_EQ("<!-- a note --><p>{{not one}}</p>", page);
}

TEST(PageSkeleton, PlaceholderWithoutFillerIsAnErrorNamingIt) {
    try {
        std::string page;
        report::fillSkeleton(page, "<p><!--{{missing}}--></p>", {appending("other", "")});
        FAIL() << "no error for an unfilled placeholder";
    } catch (std::invalid_argument const& error) {
        EXPECT_NE(std::string::npos, std::string(error.what()).find("'missing'"));
    }
}

TEST(PageSkeleton, UnclosedPlaceholderIsAnError) {
    std::string page;
    EXPECT_THROW(report::fillSkeleton(page, "<p><!--{{open</p>", {appending("open", "")}),
                 std::invalid_argument);
    EXPECT_THROW((void)report::placeholderNames("<!--{{open"), std::invalid_argument);
}

TEST(PageSkeleton, NamesAreListedInOrderWithRepeats) {
    std::vector<std::string_view> const names =
        report::placeholderNames("<!--{{a}}--> <!--{{b-c}}--> <!--{{a}}-->");
    EXPECT_EQ((std::vector<std::string_view>{"a", "b-c", "a"}), names);
}

} // namespace

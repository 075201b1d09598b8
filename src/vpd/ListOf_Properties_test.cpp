#include "vpd/ListOf_Properties.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <iterator>
#include <string>
#include <vector>

namespace {

using Quorvex::VPD::ListOf_Properties;
using Quorvex::VPD::Property;

std::vector<std::string> u_keywords(ListOf_Properties const& list) {
    std::vector<std::string> keywords;
    std::transform(list.begin(), list.end(), std::back_inserter(keywords),
                   [](auto const& entry) { return entry.first; });
    return keywords;
}

std::string u_text(ListOf_Properties const& list, std::string const& keyword) {
    return list.find(keyword).get_Value();
}

TEST(VPD_ListOf_Properties, SameKeywordTwiceKeepsTheFirstValue) {
    ListOf_Properties list;
    list.insert(Property("TM", "A"));
    list.insert(Property("TM", "B"));
    EXPECT_EQ(list.size(), 1u);
    EXPECT_EQ(u_text(list, "TM"), "A");
}

TEST(VPD_ListOf_Properties, IteratesInKeywordOrderNotInsertionOrder) {
    ListOf_Properties list;
    list.insert(Property("TM", "1"));
    list.insert(Property("AX", "2"));
    list.insert(Property("SE", "3"));
    EXPECT_EQ(u_keywords(list), (std::vector<std::string>{"AX", "SE", "TM"}));
}

TEST(VPD_ListOf_Properties, KeysSortByteWise) {
    ListOf_Properties list;
    list.insert(Property("a", "1"));
    list.insert(Property("\xc3\xa9", "2"));
    list.insert(Property("Z", "3"));
    list.insert(Property("U_", "4"));
    EXPECT_EQ(u_keywords(list), (std::vector<std::string>{"U_", "Z", "a", "\xc3\xa9"}));
}

TEST(VPD_ListOf_Properties, AddingListToItselfLeavesItUnchanged) {
    ListOf_Properties list;
    list.insert(Property("TM", "A"));
    list.insert(Property("SE", "B"));
    list += list;
    EXPECT_EQ(u_keywords(list), (std::vector<std::string>{"SE", "TM"}));
    EXPECT_EQ(u_text(list, "TM"), "A");
    EXPECT_EQ(u_text(list, "SE"), "B");
}

TEST(VPD_ListOf_Properties, MergeAddsNewKeywordsAndKeepsPresentOnes) {
    ListOf_Properties list;
    list.insert(Property("TM", "A"));
    ListOf_Properties other;
    other.insert(Property("TM", "B"));
    other.insert(Property("SE", "C"));
    list += other;
    EXPECT_EQ(u_keywords(list), (std::vector<std::string>{"SE", "TM"}));
    EXPECT_EQ(u_text(list, "TM"), "A");
    EXPECT_EQ(u_text(list, "SE"), "C");
}

TEST(VPD_ListOf_Properties, MergingAnEmptyListChangesNothing) {
    ListOf_Properties list;
    list.insert(Property("TM", "A"));
    list += ListOf_Properties();
    EXPECT_EQ(list.size(), 1u);
}

TEST(VPD_ListOf_Properties, ContainsAndFindByKeyword) {
    ListOf_Properties list;
    list.insert(Property("HN", "host1"));
    EXPECT_TRUE(list.contains("HN"));
    EXPECT_FALSE(list.contains("HostName"));
    EXPECT_EQ(list.find("HN").get_DisplayName(), "HostName");
}

TEST(VPD_ListOf_Properties, FindOfMissingKeyThrowsElementNotFound) {
    ListOf_Properties list;
    list.insert(Property("HN", "host1"));
    EXPECT_THROW(list.find("TM"), ListOf_Properties::Error_ElementNotFound);
}

TEST(VPD_ListOf_Properties, CopyAndAssignAreIndependent) {
    ListOf_Properties list;
    list.insert(Property("HN", "host1"));
    ListOf_Properties copy(list);
    copy.insert(Property("TM", "x"));
    ListOf_Properties assigned;
    assigned.insert(Property("OS", "y"));
    assigned = list;
    list.insert(Property("SE", "z"));
    EXPECT_EQ(u_keywords(copy), (std::vector<std::string>{"HN", "TM"}));
    EXPECT_EQ(u_keywords(assigned), (std::vector<std::string>{"HN"}));
    EXPECT_EQ(u_keywords(list), (std::vector<std::string>{"HN", "SE"}));
}

TEST(VPD_ListOf_Properties, AssignReplacesTheWholeContent) {
    ListOf_Properties list;
    list.insert(Property("HN", "host1"));
    ListOf_Properties other;
    other.insert(Property("TM", "x"));
    list.assign(other);
    EXPECT_EQ(u_keywords(list), (std::vector<std::string>{"TM"}));
}

} // namespace

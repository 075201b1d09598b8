#include "report/VpdDocument.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

namespace {

std::string e2eDocument(std::string const& scenario, std::string const& name) {
    return QuorvexTest::readFile(QuorvexTest::sourceRoot() + "/tests/e2e/scenarios/" + scenario +
                                 "/expected/VPD/quorvexPYLON_VPD_Survey_ClientPartition_" + name);
}

TEST(VpdDocument, DefaultDocumentGivesHostAndReason) {
    report::VpdDocument const document =
        report::parseVpdDocument(e2eDocument("all-failed", "1234-ABC_10ABCDE-1.VPD.xml"));
    EXPECT_EQ("host1", document.host);
    EXPECT_EQ("Partition not surveyed, reason: \nRELAY Failed.\n\n[     Rc] = 4\n[  RcCmd] = 0\n"
              "[RetStr1] = no route\n[RetStr2] = \n\n\n",
              document.reason);
}

TEST(VpdDocument, UnescapedMarkupInHostAndReasonIsReadAsWritten) {
    report::VpdDocument const document =
        report::parseVpdDocument(e2eDocument("markup-characters", "1234-ABC_10ABCDE-1.VPD.xml"));
    EXPECT_EQ("a&b<c\"d", document.host);
    ASSERT_TRUE(document.reason.has_value());
    EXPECT_NE(std::string::npos, document.reason->find("[RetStr1] = cannot <reach> \"a&b\"\n"));
    EXPECT_NE(std::string::npos, document.reason->find("[RetStr2] = &amp;\n"));
}

TEST(VpdDocument, FetchedDocumentHasHostButNoReason) {
    report::VpdDocument const document =
        report::parseVpdDocument(e2eDocument("shipped-demo", "9119-MHE_21ABCDE-1.VPD.xml"));
    EXPECT_EQ("aurora", document.host);
    EXPECT_EQ(std::nullopt, document.reason);
}

TEST(VpdDocument, ReasonHoldingTheClosingValueTagEndsAtTheLastOne) {
    std::string const text =
        "<Property displayName=\"VD\" name=\"VD\">\nVD\n<Value type=\"string\">"
        "Unable to get File From Partition : \n</Value> inside\n</Value>\n"
        "</Property>";
    EXPECT_EQ("Unable to get File From Partition : \n</Value> inside\n",
              report::parseVpdDocument(text).reason);
}

TEST(VpdDocument, ReasonPropertyOfAnotherTextIsNoReason) {
    std::string const text =
        "<Property displayName=\"VD\" name=\"VD\">\nVD\n<Value type=\"string\">"
        "client's own note</Value>";
    EXPECT_EQ(std::nullopt, report::parseVpdDocument(text).reason);
}

TEST(VpdDocument, EmptyOrTruncatedDocumentsGiveNothing) {
    EXPECT_EQ(std::nullopt, report::parseVpdDocument("").host);
    EXPECT_EQ(std::nullopt, report::parseVpdDocument("").reason);
    EXPECT_EQ(std::nullopt,
              report::parseVpdDocument("<Property name=\"HN\">HN<Value type=\"string\">ho").host);
    EXPECT_EQ(std::nullopt,
              report::parseVpdDocument("name=\"VD\">VD<Value type=\"string\">Un").reason);
}

} // namespace

#include "report/DocumentCopies.h"

#include "utility/SystemError.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cerrno>
#include <filesystem>
#include <iterator>
#include <sys/stat.h>

namespace {

namespace fs = std::filesystem;
using Json = nlohmann::ordered_json;

Json summaryNaming(Json documents) {
    Json partitions = Json::array();
    std::transform(documents.begin(), documents.end(), std::back_inserter(partitions),
                   [](Json const& document) -> Json {
                       return {{"outcome", "surveyed"}, {"document", document}};
                   });
    return {{"machines", Json::array({{{"identity", "1-A_S"}, {"partitions", partitions}}})}};
}

TEST(DocumentCopies, FileNameIsTheLastPartOfTheSummarysName) {
    EXPECT_EQ(report::documentFileName("VPD/x.VPD.xml"), "x.VPD.xml");
    EXPECT_EQ(report::documentFileName("x.VPD.xml"), "x.VPD.xml");
    EXPECT_EQ(report::documentFileName("VPD/../..VPD.xml"), "..VPD.xml");
}

TEST(DocumentCopies, NameWithoutAFileGivesNothing) {
    EXPECT_EQ(report::documentFileName(""), std::nullopt);
    EXPECT_EQ(report::documentFileName("VPD/"), std::nullopt);
    EXPECT_EQ(report::documentFileName("VPD/.."), std::nullopt);
    EXPECT_EQ(report::documentFileName("."), std::nullopt);
}

TEST(DocumentCopies, EachNamedDocumentIsCopiedByteForByteOnce) {
    QuorvexTest::TemporaryDirectory root;
    fs::create_directories(root.file("VPD"));
    fs::create_directories(root.file("report/documents"));
    QuorvexTest::writeFile(root.file("VPD/a.VPD.xml"), std::string("<a/>\0\xff\n", 7));
    QuorvexTest::writeFile(root.file("VPD/b c.VPD.xml"), "<b/>");
    QuorvexTest::writeFile(root.file("VPD/unnamed.VPD.xml"), "<u/>");
    std::set<std::string> const copied = report::copyDocuments(
        summaryNaming({"VPD/a.VPD.xml", "VPD/b c.VPD.xml", "VPD/a.VPD.xml", nullptr}),
        root.file("VPD"), root.file("report"));
    EXPECT_EQ(copied, (std::set<std::string>{"VPD/a.VPD.xml", "VPD/b c.VPD.xml"}));
    EXPECT_EQ(std::string("<a/>\0\xff\n", 7),
              QuorvexTest::readFile(root.file("report/documents/a.VPD.xml")));
    EXPECT_EQ("<b/>", QuorvexTest::readFile(root.file("report/documents/b c.VPD.xml")));
    EXPECT_EQ(2, std::distance(fs::directory_iterator(root.file("report/documents")),
                               fs::directory_iterator()));
}

TEST(DocumentCopies, DocumentGoneFromTheFolderIsLeftOutAndNotCopied) {
    QuorvexTest::TemporaryDirectory root;
    fs::create_directories(root.file("VPD"));
    fs::create_directories(root.file("report/documents"));
    QuorvexTest::writeFile(root.file("VPD/here.VPD.xml"), "<h/>");
    std::set<std::string> const copied =
        report::copyDocuments(summaryNaming({"VPD/here.VPD.xml", "VPD/gone.VPD.xml"}),
                              root.file("VPD"), root.file("report"));
    EXPECT_EQ(copied, (std::set<std::string>{"VPD/here.VPD.xml"}));
    EXPECT_FALSE(QuorvexTest::fileExists(root.file("report/documents/gone.VPD.xml")));
}

TEST(DocumentCopies, DocumentThatCannotBeReadThrowsReadWithItsPath) {
    QuorvexTest::TemporaryDirectory root;
    fs::create_directories(root.file("VPD/folder.VPD.xml"));
    fs::create_directories(root.file("report/documents"));
    auto const error = QuorvexTest::thrownBy<util::SystemError>([&] {
        report::copyDocuments(summaryNaming({"VPD/folder.VPD.xml"}), root.file("VPD"),
                              root.file("report"));
    });
    ASSERT_TRUE(error);
    EXPECT_EQ(EISDIR, error->errorNumber());
    EXPECT_EQ("cannot read " + root.file("VPD/folder.VPD.xml") + ": Is a directory",
              std::string(error->what()));
}

TEST(DocumentCopies, CopyThatCannotBeWrittenThrowsWithItsPath) {
    QuorvexTest::TemporaryDirectory root;
    fs::create_directories(root.file("VPD"));
    fs::create_directories(root.file("report"));
    QuorvexTest::writeFile(root.file("VPD/a.VPD.xml"), "<a/>");
    auto const error = QuorvexTest::thrownBy<util::SystemError>([&] {
        report::copyDocuments(summaryNaming({"VPD/a.VPD.xml"}), root.file("VPD"),
                              root.file("report"));
    });
    ASSERT_TRUE(error);
    EXPECT_EQ(ENOENT, error->errorNumber());
}

ino_t inodeOf(std::string const& path) {
    struct stat status {};
    EXPECT_EQ(0, ::stat(path.c_str(), &status)) << path;
    return status.st_ino;
}

TEST(DocumentCopies, LinkedDocumentIsTheVpdFoldersOwnFileUnderItsName) {
    QuorvexTest::TemporaryDirectory root;
    fs::create_directories(root.file("VPD"));
    fs::create_directories(root.file("report/documents"));
    QuorvexTest::writeFile(root.file("VPD/a.VPD.xml"), std::string("<a/>\0\xff\n", 7));
    std::set<std::string> const linked =
        report::copyDocuments(summaryNaming({"VPD/a.VPD.xml", "VPD/a.VPD.xml"}), root.file("VPD"),
                              root.file("report"), report::DocumentPlacement::link);
    EXPECT_EQ(linked, (std::set<std::string>{"VPD/a.VPD.xml"}));
    EXPECT_EQ(inodeOf(root.file("VPD/a.VPD.xml")),
              inodeOf(root.file("report/documents/a.VPD.xml")));
    EXPECT_EQ(1, std::distance(fs::directory_iterator(root.file("report/documents")),
                               fs::directory_iterator()));
}

TEST(DocumentCopies, LinkReplacesTheDocumentAnEarlierReportLeft) {
    QuorvexTest::TemporaryDirectory root;
    fs::create_directories(root.file("VPD"));
    fs::create_directories(root.file("report/documents"));
    QuorvexTest::writeFile(root.file("VPD/a.VPD.xml"), "<new/>");
    QuorvexTest::writeFile(root.file("report/documents/a.VPD.xml"), "<old/>");
    report::copyDocuments(summaryNaming({"VPD/a.VPD.xml"}), root.file("VPD"), root.file("report"),
                          report::DocumentPlacement::link);
    EXPECT_EQ("<new/>", QuorvexTest::readFile(root.file("report/documents/a.VPD.xml")));
}

TEST(DocumentCopies, DocumentGoneFromTheFolderIsLeftOutAndNotLinked) {
    QuorvexTest::TemporaryDirectory root;
    fs::create_directories(root.file("VPD"));
    fs::create_directories(root.file("report/documents"));
    std::set<std::string> const linked =
        report::copyDocuments(summaryNaming({"VPD/gone.VPD.xml"}), root.file("VPD"),
                              root.file("report"), report::DocumentPlacement::link);
    EXPECT_TRUE(linked.empty());
    EXPECT_EQ(0, std::distance(fs::directory_iterator(root.file("report/documents")),
                               fs::directory_iterator()));
}

// A folder cannot be hard linked (EPERM), so the copy that replaces a link
// where none can be made is tried, and cannot read it.
TEST(DocumentCopies, DocumentThatCannotBeLinkedIsCopiedAndThatCannotBeReadThrowsRead) {
    QuorvexTest::TemporaryDirectory root;
    fs::create_directories(root.file("VPD/folder.VPD.xml"));
    fs::create_directories(root.file("report/documents"));
    auto const error = QuorvexTest::thrownBy<util::SystemError>([&] {
        report::copyDocuments(summaryNaming({"VPD/folder.VPD.xml"}), root.file("VPD"),
                              root.file("report"), report::DocumentPlacement::link);
    });
    ASSERT_TRUE(error);
    EXPECT_EQ(EISDIR, error->errorNumber());
    EXPECT_EQ("cannot read " + root.file("VPD/folder.VPD.xml") + ": Is a directory",
              std::string(error->what()));
    EXPECT_EQ(0, std::distance(fs::directory_iterator(root.file("report/documents")),
                               fs::directory_iterator()));
}

TEST(DocumentCopies, LinkThatCannotBeMadeThrowsWriteWithItsPath) {
    QuorvexTest::TemporaryDirectory root;
    fs::create_directories(root.file("VPD"));
    fs::create_directories(root.file("report"));
    QuorvexTest::writeFile(root.file("VPD/a.VPD.xml"), "<a/>");
    auto const error = QuorvexTest::thrownBy<util::SystemError>([&] {
        report::copyDocuments(summaryNaming({"VPD/a.VPD.xml"}), root.file("VPD"),
                              root.file("report"), report::DocumentPlacement::link);
    });
    ASSERT_TRUE(error);
    EXPECT_EQ(ENOENT, error->errorNumber());
    EXPECT_EQ("write", error->operation());
    EXPECT_EQ(root.file("report/documents/a.VPD.xml"), error->object());
}

} // namespace

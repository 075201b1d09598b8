// The default document on disk, under the sandbox's /var/adm/quorvex.

#include "survey/Quorvex_PYLON_VPD_Survey_ClientPartition_Utility.h"

#include "system/MTMS.h"
#include "system/Partition.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <string>

#include <sys/resource.h>

#include <cerrno>
#include <csignal>

namespace {

namespace Survey_Utility = ::Quorvex_PYLON_VPD_Survey_ClientPartition_Utility;

using QuorvexTest::gc_VPD_Folder;
constexpr char gc_LocalFile[] =
    "VPD/quorvexPYLON_VPD_Survey_ClientPartition_1234-ABC_10ABCDE-2.VPD.xml";

std::string u_path(std::string const& localFile) {
    return "/var/adm/quorvex/" + localFile;
}

Quorvex::System::Partition u_make_Partition(std::string const& identity) {
    Quorvex::System::Partition partition(Quorvex::System::MTMS(identity), "2", "host2");
    partition.set_ActiveStatus("3");
    return partition;
}

class DefaultDocument : public ::testing::Test {
protected:
    void SetUp() override {
        ASSERT_TRUE(QuorvexTest::isInsideSandbox());
        QuorvexTest::clearFolder(gc_VPD_Folder);
    }
};

TEST_F(DefaultDocument, IsWrittenUnderTheConsoleFolderWithoutLineEndAfterItsLastLine) {
    EXPECT_EQ(Survey_Utility::u_create_DefaultXML_forFailedPartition(
                  u_make_Partition("1234-ABC_10ABCDE"), "why", gc_LocalFile),
              0);
    std::string const document = QuorvexTest::readFile(u_path(gc_LocalFile));
    EXPECT_EQ(document.rfind("<?xml version=\"1.0\" encoding=\"UTF-8\"?><com.zor.inventory "
                             "version=\"1.0\">\n",
                             0),
              0u);
    EXPECT_NE(document.find("<Value type=\"string\">why</Value>"), std::string::npos);
    EXPECT_EQ(document.substr(document.size() - 21), "\n</com.zor.inventory>");
}

TEST_F(DefaultDocument, WritingItForAPartitionThatLeftARealResultReplacesThatFile) {
    QuorvexTest::writeFile(u_path(gc_LocalFile), std::string(10000, '#'));
    EXPECT_EQ(Survey_Utility::u_create_DefaultXML_forFailedPartition(
                  u_make_Partition("1234-ABC_10ABCDE"), "why", gc_LocalFile),
              0);
    std::string const document = QuorvexTest::readFile(u_path(gc_LocalFile));
    EXPECT_EQ(document.find('#'), std::string::npos);
    EXPECT_EQ(document.substr(document.size() - 20), "</com.zor.inventory>");
}

TEST_F(DefaultDocument, IsNotWrittenForAMachineWithoutDashAndAnEarlierFileStays) {
    std::string const localFile =
        "VPD/quorvexPYLON_VPD_Survey_ClientPartition_1234MMAERROR_10ABCDEERROR-2.VPD.xml";
    QuorvexTest::writeFile(u_path(localFile), "earlier");
    EXPECT_EQ(Survey_Utility::u_create_DefaultXML_forFailedPartition(
                  u_make_Partition("1234MMA_10ABCDE"), "why", localFile),
              0)
        << "nothing was due";
    EXPECT_EQ(QuorvexTest::readFile(u_path(localFile)), "earlier");
}

TEST_F(DefaultDocument, FileThatCannotBeOpenedIsMissingAndItsErrorIsReturned) {
    std::string const localFile = "no-such-folder/document.VPD.xml";
    EXPECT_EQ(Survey_Utility::u_create_DefaultXML_forFailedPartition(
                  u_make_Partition("1234-ABC_10ABCDE"), "why", localFile),
              ENOENT);
    EXPECT_FALSE(QuorvexTest::fileExists(u_path(localFile)));
}

// A write cut short by the file size limit stands for a full disk: the
// document is left cut short under its name, and the error is returned.
TEST_F(DefaultDocument, WriteThatFailsReturnsItsErrorAndLeavesTheCutDocument) {
    QuorvexTest::CommandResult const child = QuorvexTest::runInChild([] {
        std::signal(SIGXFSZ, SIG_IGN);
        rlimit const limit{100, 100};
        if (setrlimit(RLIMIT_FSIZE, &limit) != 0) {
            return 2;
        }
        return Survey_Utility::u_create_DefaultXML_forFailedPartition(
                   u_make_Partition("1234-ABC_10ABCDE"), "why", gc_LocalFile) == EFBIG
                   ? 0
                   : 1;
    });
    EXPECT_EQ(child.exitStatus, 0);
    EXPECT_EQ(QuorvexTest::readFile(u_path(gc_LocalFile)).size(), 100u);
}

} // namespace

// The default document on disk, under the sandbox's /var/adm/quorvex.

#include "survey/Quorvex_PYLON_VPD_Survey_ClientPartition_Utility.h"

#include "system/MTMS.h"
#include "system/Partition.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <string>

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
    Survey_Utility::u_create_DefaultXML_forFailedPartition(u_make_Partition("1234-ABC_10ABCDE"),
                                                           "why", gc_LocalFile);
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
    Survey_Utility::u_create_DefaultXML_forFailedPartition(u_make_Partition("1234-ABC_10ABCDE"),
                                                           "why", gc_LocalFile);
    std::string const document = QuorvexTest::readFile(u_path(gc_LocalFile));
    EXPECT_EQ(document.find('#'), std::string::npos);
    EXPECT_EQ(document.substr(document.size() - 20), "</com.zor.inventory>");
}

TEST_F(DefaultDocument, IsNotWrittenForAMachineWithoutDashAndAnEarlierFileStays) {
    std::string const localFile =
        "VPD/quorvexPYLON_VPD_Survey_ClientPartition_1234MMAERROR_10ABCDEERROR-2.VPD.xml";
    QuorvexTest::writeFile(u_path(localFile), "earlier");
    Survey_Utility::u_create_DefaultXML_forFailedPartition(u_make_Partition("1234MMA_10ABCDE"),
                                                           "why", localFile);
    EXPECT_EQ(QuorvexTest::readFile(u_path(localFile)), "earlier");
}

TEST_F(DefaultDocument, FileThatCannotBeOpenedIsSilentlyMissing) {
    std::string const localFile = "no-such-folder/document.VPD.xml";
    Survey_Utility::u_create_DefaultXML_forFailedPartition(u_make_Partition("1234-ABC_10ABCDE"),
                                                           "why", localFile);
    EXPECT_FALSE(QuorvexTest::fileExists(u_path(localFile)));
}

} // namespace

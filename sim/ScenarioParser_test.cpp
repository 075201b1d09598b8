#include "Scenario.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <set>
#include <string>

using PylonSim::Response;
using PylonSim::Scenario;
using PylonSim::ScenarioError;

namespace {

class ScenarioFile : public ::testing::Test {
protected:
    Scenario load(std::string const& text) {
        QuorvexTest::writeFile(path(), text);
        return Scenario::load(path());
    }

    // The error that loading the text raises.
    ScenarioError errorOf(std::string const& text) {
        QuorvexTest::writeFile(path(), text);
        return errorLoading(path());
    }

    static ScenarioError errorLoading(std::string const& fileName) {
        try {
            Scenario::load(fileName);
        } catch (ScenarioError const& error) {
            return error;
        }
        ADD_FAILURE() << "scenario accepted: " << fileName;
        return {};
    }

    std::string path() const { return folder.file("test.scn"); }

    QuorvexTest::TemporaryDirectory folder;
};

} // namespace

TEST_F(ScenarioFile, EmptyFileAnswersNothingEverywhere) {
    Scenario const scenario = load("");
    Response const response = scenario.find("lsvtc", "");
    EXPECT_EQ("", response.stdoutText);
    EXPECT_EQ("", response.stderrText);
    EXPECT_EQ(0, response.exitCode);
    EXPECT_FALSE(response.delay);
    EXPECT_FALSE(response.document);
    EXPECT_EQ(0.0, scenario.get_DefaultDelay());
}

TEST_F(ScenarioFile, StdoutLinesAddUpWithLineFeeds) {
    Response const response =
        load("[lsvtc]\nstdout 0:A_B;\nstdout second line\n").find("lsvtc", "");
    EXPECT_EQ("0:A_B;\nsecond line\n", response.stdoutText);
}

TEST_F(ScenarioFile, ValueKeepsEveryByteAfterTheFirstBlank) {
    Response const response =
        load("[lsvtc]\nstdout  lead\ttab # not a comment  \n").find("lsvtc", "");
    EXPECT_EQ(" lead\ttab # not a comment  \n", response.stdoutText);
}

TEST_F(ScenarioFile, KeyAloneAddsAnEmptyLine) {
    EXPECT_EQ("\n", load("[lsvtc]\nstdout\n").find("lsvtc", "").stdoutText);
}

TEST_F(ScenarioFile, NoLineFeedFormEndsWithoutLineFeed) {
    Response const response =
        load("[lsvtc]\nstdout a\nstdout-nolf 0:A_B;\nstderr-nolf e\n").find("lsvtc", "");
    EXPECT_EQ("a\n0:A_B;", response.stdoutText);
    EXPECT_EQ("e", response.stderrText);
}

TEST_F(ScenarioFile, FileFormAddsExactBytesRelativeToTheScenario) {
    std::string const bytes("line\0with NUL\r\nno end", 21);
    QuorvexTest::writeFile(folder.file("out.bin"), bytes);
    Response const response =
        load("[lsvtc]\nstdout-file out.bin\nstderr-file " + folder.file("out.bin") + "\n")
            .find("lsvtc", "");
    EXPECT_EQ(bytes, response.stdoutText);
    EXPECT_EQ(bytes, response.stderrText);
}

TEST_F(ScenarioFile, BlockAddsEachLineWithItsLineFeed) {
    Response const response = load("[getFileFromPartition 3]\ndocument <<END\n<a>\n# kept\n\n   "
                                   "x\nEND\ndocument-nolf </a>\n")
                                  .find("getFileFromPartition", "3");
    ASSERT_TRUE(response.document);
    EXPECT_EQ("<a>\n# kept\n\n   x\n</a>", *response.document);
}

TEST_F(ScenarioFile, DocumentOnlyWhenGiven) {
    Scenario const scenario =
        load("[getFileFromPartition 3]\nstdout Rc::0\n[getFileFromPartition 4]\ndocument-nolf \n");
    EXPECT_FALSE(scenario.find("getFileFromPartition", "3").document);
    ASSERT_TRUE(scenario.find("getFileFromPartition", "4").document);
    EXPECT_EQ("", *scenario.find("getFileFromPartition", "4").document);
}

TEST_F(ScenarioFile, ExitAndDelayAreRead) {
    Response const response =
        load("[runCmdOnPartition 2]\nexit 255\ndelay 0.25\n").find("runCmdOnPartition", "2");
    EXPECT_EQ(255, response.exitCode);
    ASSERT_TRUE(response.delay);
    EXPECT_EQ(0.25, *response.delay);
}

TEST_F(ScenarioFile, DelayBeforeTheFirstSectionIsTheDefault) {
    Scenario const scenario = load("delay 1.5\n[lsvtc]\n");
    EXPECT_EQ(1.5, scenario.get_DefaultDelay());
    EXPECT_FALSE(scenario.find("lsvtc", "").delay);
}

TEST_F(ScenarioFile, NamedSectionWinsOverTheDefaultSection) {
    Scenario const scenario =
        load("[lspartition *]\nstdout default\nexit 1\n[lspartition A_B]\nstdout named\n");
    EXPECT_EQ("named\n", scenario.find("lspartition", "A_B").stdoutText);
    EXPECT_EQ(0, scenario.find("lspartition", "A_B").exitCode);
    EXPECT_EQ("default\n", scenario.find("lspartition", "C_D").stdoutText);
    EXPECT_EQ(1, scenario.find("lspartition", "C_D").exitCode);
}

TEST_F(ScenarioFile, SectionsOfOtherToolsDoNotAnswer) {
    Scenario const scenario = load("[runCmdOnPartition *]\nstdout run\n");
    EXPECT_EQ("", scenario.find("getFileFromPartition", "1").stdoutText);
    EXPECT_EQ("", scenario.find("lspartition", "*").stdoutText);
}

TEST_F(ScenarioFile, SectionNameMayHoldBlanksAndOddCharacters) {
    Scenario const scenario = load("[runCmdOnPartition  a b\"{}::x ]\nstdout odd\n");
    EXPECT_EQ("odd\n", scenario.find("runCmdOnPartition", "a b\"{}::x").stdoutText);
}

TEST_F(ScenarioFile, CommentsAndBlankLinesAreIgnored) {
    Scenario const scenario = load("# head\n\n  # indented\n\t\n[lsvtc]\n# inside\nstdout x\n");
    EXPECT_EQ("x\n", scenario.find("lsvtc", "").stdoutText);
}

TEST_F(ScenarioFile, MissingFileIsReportedWithoutLine) {
    ScenarioError const error = errorLoading(folder.file("missing.scn"));
    EXPECT_EQ(0u, error.line);
    EXPECT_EQ(folder.file("missing.scn") + ": cannot read the scenario file", error.describe());
}

TEST_F(ScenarioFile, FolderIsNotAScenario) {
    EXPECT_EQ(folder.path() + ": cannot read the scenario file",
              errorLoading(folder.path()).describe());
}

TEST_F(ScenarioFile, ErrorNamesFileLineAndProblem) {
    ScenarioError const error = errorOf("[lsvtc]\nstdout x\nstdot y\n");
    EXPECT_EQ(path(), error.fileName);
    EXPECT_EQ(3u, error.line);
    EXPECT_EQ(
        path() +
            ":3: unknown key \"stdot\" (expected stdout, stderr, document, their -nolf and -file "
            "forms, document-replace, exit, delay, child-delay, daemon-delay or misbehave)",
        error.describe());
}

TEST_F(ScenarioFile, UnknownTextFormIsRejected) {
    EXPECT_EQ("unknown key \"stdout-raw\" (a text key ends in nothing, -nolf or -file)",
              errorOf("[lsvtc]\nstdout-raw x\n").problem);
}

TEST_F(ScenarioFile, UnknownSectionIsRejected) {
    ScenarioError const error = errorOf("\n[lsfoo]\n");
    EXPECT_EQ(2u, error.line);
    EXPECT_EQ("unknown section \"lsfoo\" (expected lsvtc, lspartition, runCmdOnPartition, "
              "getFileFromPartition "
              "or putFileToPartition)",
              error.problem);
}

TEST_F(ScenarioFile, HeaderWithoutClosingBracketIsRejected) {
    EXPECT_EQ("section header must end with \"]\"", errorOf("[lsvtc\n").problem);
}

TEST_F(ScenarioFile, SectionNamesAreChecked) {
    EXPECT_EQ("section [lsvtc] takes no name", errorOf("[lsvtc x]\n").problem);
    EXPECT_EQ("section [lspartition] needs a name, or \"*\" for the default",
              errorOf("[lspartition]\n").problem);
    EXPECT_EQ("section [runCmdOnPartition] needs a name, or \"*\" for the default",
              errorOf("[ runCmdOnPartition  ]\n").problem);
}

TEST_F(ScenarioFile, RepeatedSectionIsRejected) {
    ScenarioError const error = errorOf("[lspartition A_B]\n[lspartition *]\n[lspartition A_B]\n");
    EXPECT_EQ(3u, error.line);
    EXPECT_EQ("section [lspartition A_B] appears twice", error.problem);
}

TEST_F(ScenarioFile, TextBeforeTheFirstSectionIsRejected) {
    EXPECT_EQ("\"stdout\" must follow a section header", errorOf("stdout x\n").problem);
    EXPECT_EQ("\"exit\" must follow a section header", errorOf("exit 1\n").problem);
}

TEST_F(ScenarioFile, RepeatedSettingIsRejected) {
    EXPECT_EQ("\"exit\" is given twice in this section",
              errorOf("[lsvtc]\nexit 1\nexit 2\n").problem);
    EXPECT_EQ("\"delay\" is given twice in this section", errorOf("delay 1\ndelay 2\n").problem);
}

TEST_F(ScenarioFile, SettingsMayRepeatInAnotherSection) {
    EXPECT_NO_THROW(load("delay 1\n[lsvtc]\nexit 1\ndelay 0\n[lspartition *]\nexit 2\ndelay 0\n"));
}

TEST_F(ScenarioFile, ExitCodeOutOfRangeOrNotANumberIsRejected) {
    for (std::string const value : {"256", "-1", "abc", "1x", "", "99999999999999999999"}) {
        EXPECT_EQ("exit code must be a whole number from 0 to 255, not \"" + value + "\"",
                  errorOf("[lsvtc]\nexit " + value + "\n").problem)
            << value;
    }
}

TEST_F(ScenarioFile, BadDelayIsRejected) {
    for (std::string const value : {"-0.5", "3601", "soon", "nan", "inf", "0x10", "1e999", ""}) {
        EXPECT_EQ("delay must be a number of seconds from 0 to 3600, not \"" + value + "\"",
                  errorOf("[lsvtc]\ndelay " + value + "\n").problem)
            << value;
    }
}

TEST_F(ScenarioFile, ChildDelayIsReadPerSection) {
    Scenario const scenario = load("[runCmdOnPartition 2]\nchild-delay 30\n[lsvtc]\n");
    std::optional<double> const childDelay = scenario.find("runCmdOnPartition", "2").childDelay;
    ASSERT_TRUE(childDelay);
    EXPECT_EQ(30.0, *childDelay);
    EXPECT_FALSE(scenario.find("lsvtc", "").childDelay);
}

TEST_F(ScenarioFile, ChildDelayBeforeTheFirstSectionIsRejected) {
    EXPECT_EQ("\"child-delay\" must follow a section header", errorOf("child-delay 1\n").problem);
}

TEST_F(ScenarioFile, BadOrRepeatedChildDelayIsRejected) {
    EXPECT_EQ("child-delay must be a number of seconds from 0 to 3600, not \"later\"",
              errorOf("[lsvtc]\nchild-delay later\n").problem);
    EXPECT_EQ("\"child-delay\" is given twice in this section",
              errorOf("[lsvtc]\nchild-delay 1\nchild-delay 2\n").problem);
}

TEST_F(ScenarioFile, DaemonDelayIsReadPerSection) {
    Scenario const scenario = load("[runCmdOnPartition 2]\ndaemon-delay 30\n[lsvtc]\n");
    std::optional<double> const daemonDelay = scenario.find("runCmdOnPartition", "2").daemonDelay;
    ASSERT_TRUE(daemonDelay);
    EXPECT_EQ(30.0, *daemonDelay);
    EXPECT_FALSE(scenario.find("lsvtc", "").daemonDelay);
}

TEST_F(ScenarioFile, DaemonDelayBeforeTheFirstSectionIsRejected) {
    EXPECT_EQ("\"daemon-delay\" must follow a section header", errorOf("daemon-delay 1\n").problem);
}

TEST_F(ScenarioFile, BadOrRepeatedDaemonDelayIsRejected) {
    EXPECT_EQ("daemon-delay must be a number of seconds from 0 to 3600, not \"later\"",
              errorOf("[lsvtc]\ndaemon-delay later\n").problem);
    EXPECT_EQ("\"daemon-delay\" is given twice in this section",
              errorOf("[lsvtc]\ndaemon-delay 1\ndaemon-delay 2\n").problem);
}

TEST_F(ScenarioFile, MisbehavioursAddUpPerSection) {
    Scenario const scenario =
        load("[runCmdOnPartition 2]\nmisbehave rename\nmisbehave stop-self\n[lsvtc]\n");
    EXPECT_EQ((std::set<std::string>{"rename", "stop-self"}),
              scenario.find("runCmdOnPartition", "2").misbehaviours);
    EXPECT_TRUE(scenario.find("lsvtc", "").misbehaviours.empty());
}

TEST_F(ScenarioFile, UnknownMisbehaviourIsRejected) {
    EXPECT_EQ("unknown misbehaviour \"explode\" (expected ignore-signals, close-stdout, rename, "
              "fork-storm or stop-self)",
              errorOf("[lsvtc]\nmisbehave explode\n").problem);
}

TEST_F(ScenarioFile, MisbehaviourBeforeTheFirstSectionIsRejected) {
    EXPECT_EQ("\"misbehave\" must follow a section header", errorOf("misbehave rename\n").problem);
}

TEST_F(ScenarioFile, DocumentOutsideGetFileSectionsIsRejected) {
    EXPECT_EQ("\"document\" belongs in a [getFileFromPartition ...] section",
              errorOf("[runCmdOnPartition 1]\ndocument x\n").problem);
}

TEST_F(ScenarioFile, UnreadableTextFileIsRejected) {
    ScenarioError const error = errorOf("[lsvtc]\nstdout-file nowhere.txt\n");
    EXPECT_EQ(2u, error.line);
    EXPECT_EQ("cannot read file \"" + folder.file("nowhere.txt") + "\"", error.problem);
    EXPECT_EQ("file name missing", errorOf("[lsvtc]\nstdout-file\n").problem);
}

TEST_F(ScenarioFile, UnclosedBlockIsReportedAtItsStart) {
    ScenarioError const error = errorOf("[lsvtc]\nstdout <<EOF\na\nEOFX\n");
    EXPECT_EQ(2u, error.line);
    EXPECT_EQ("block \"<<EOF\" is not closed by a line \"EOF\"", error.problem);
}

TEST_F(ScenarioFile, LessThanSignsWithoutAWordAreText) {
    Response const response = load("[lsvtc]\nstdout <<\nstdout <<a b\n").find("lsvtc", "");
    EXPECT_EQ("<<\n<<a b\n", response.stdoutText);
}

TEST_F(ScenarioFile, ShippedScenariosAreValid) {
    for (char const* name :
         {"demo.scn", "empty.scn", "several-machines.scn", "slow.scn", "odd-output.scn"}) {
        EXPECT_NO_THROW(Scenario::load(QuorvexTest::shippedScenario(name))) << name;
    }
}

TEST_F(ScenarioFile, DocumentReplaceChangesEveryOccurrenceInTheDocumentSoFar) {
    Response const response = load("[getFileFromPartition 3]\ndocument <SN>Y050</SN> Y050\n"
                                   "document-replace /Y050/Y0501/\ndocument Y050\n")
                                  .find("getFileFromPartition", "3");
    ASSERT_TRUE(response.document);
    EXPECT_EQ("<SN>Y0501</SN> Y0501\nY050\n", *response.document);
}

TEST_F(ScenarioFile, DocumentReplaceTakesAnyDelimiterAndAnEmptyReplacement) {
    Response const response =
        load("[getFileFromPartition 3]\ndocument a/b c\ndocument-replace |a/b| |\n"
             "document-replace #c##\n")
            .find("getFileFromPartition", "3");
    EXPECT_EQ("  \n", *response.document);
}

TEST_F(ScenarioFile, DocumentReplaceOfASimulatedConsoleDocumentGivesANewSerialNumber) {
    std::string const documents = QuorvexTest::sourceRoot() + "/sim/scenarios/documents";
    Response const response = load("[getFileFromPartition 1]\ndocument-file " + documents +
                                   "/aurora.VPD.xml\ndocument-replace /Y050BG52D018/Y050BG52D999/\n"
                                   "document-replace /FW950.80/FW950.90/\n")
                                  .find("getFileFromPartition", "1");
    std::string expected = QuorvexTest::readFile(documents + "/aurora.VPD.xml");
    expected.replace(expected.find("Y050BG52D018"), 12, "Y050BG52D999");
    expected.replace(expected.find("FW950.80"), 8, "FW950.90");
    EXPECT_EQ(expected, *response.document);
}

TEST_F(ScenarioFile, DocumentReplaceIsRefusedWhereItCannotApply) {
    EXPECT_EQ("\"document-replace\" belongs in a [getFileFromPartition ...] section",
              errorOf("[runCmdOnPartition 1]\ndocument-replace /a/b/\n").problem);
    EXPECT_EQ("\"document-replace\" must follow the document it changes",
              errorOf("[getFileFromPartition 1]\ndocument-replace /a/b/\n").problem);
    for (char const* value : {"", "/", "/a", "/a/b", "//b/", "/a/b/c", "/a/b//"}) {
        EXPECT_EQ(std::string("document-replace takes /OLD/NEW/: a delimiter, a text to find, the "
                              "delimiter, its replacement and the delimiter, not \"") +
                      value + "\"",
                  errorOf(std::string("[getFileFromPartition 1]\ndocument x\ndocument-replace ") +
                          value + "\n")
                      .problem)
            << value;
    }
}

TEST_F(ScenarioFile, DemoScenarioPlacesRealisticDocuments) {
    Scenario const scenario = Scenario::load(QuorvexTest::shippedScenario("demo.scn"));
    Response const response = scenario.find("getFileFromPartition", "1");
    ASSERT_TRUE(response.document);
    EXPECT_EQ(
        0u, response.document->find("<?xml version=\"1.0\" encoding=\"UTF-8\"?><com.zor.inventory "
                                    "version=\"1.0\">\n"));
    EXPECT_EQ("\n</com.zor.inventory>",
              response.document->substr(response.document->size() -
                                        std::string("\n</com.zor.inventory>").size()));
    EXPECT_FALSE(scenario.find("getFileFromPartition", "6").document);
}

#include "estate/EstateCsv.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

namespace {

using QuorvexTest::CollectFolder;

estate::ConsoleRun consoleRun(std::string const& name, estate::RecordKind kind,
                              std::string const& message) {
    estate::ConsoleRun run;
    run.record.console = name;
    run.record.kind = kind;
    run.record.message = message;
    run.consoleHost = kind == estate::RecordKind::Collected ? name + ".example" : "";
    return run;
}

TEST(EstateCsv, EachConsolesRowsFollowTheConsolesColumnsAndAConsoleWithoutRowsHasOne) {
    estate::EstateCsv csv;
    csv.add(consoleRun("down", estate::RecordKind::Unreachable, "Connection refused, \"port 22\""),
            std::nullopt);
    csv.add(consoleRun("up", estate::RecordKind::Collected, ""),
            nlohmann::ordered_json::parse(CollectFolder::summary(
                {CollectFolder::partition("1", "h1", "surveyed"),
                 CollectFolder::partition("2", "h,2", "channel_failure", "line 1\nline 2")})));
    EXPECT_EQ("console,record,record_message,console_host,machine,machine_return_code,partition_id,"
              "host,ip,"
              "active_status,outcome,status_text,return_code,rc,rc_cmd,seconds,document,reason\r\n"
              "down,unreachable,\"Connection refused, \"\"port 22\"\"\",,,,,,,,,,,,,,,\r\n"
              "up,collected,,up.example,9119-MHE_21ABCDE,4,1,h1,10.0.0.1,3,surveyed,Ok,0,0,0,1.5,"
              "VPD/h1.VPD.xml,\r\n"
              "up,collected,,up.example,9119-MHE_21ABCDE,4,2,\"h,2\",10.0.0.2,3,channel_failure,"
              "\"RELAY Failed, "
              "rc = 1\",8,0,0,1.5,\"VPD/h,2.VPD.xml\",\"line 1\nline 2\"\r\n",
              csv.takeText());
}

TEST(EstateCsv, TextIsTakenOncePieceByPieceWithTheHeaderFirst) {
    estate::EstateCsv csv;
    csv.add(consoleRun("down", estate::RecordKind::Unreachable, "refused"), std::nullopt);
    std::string const first = csv.takeText();
    EXPECT_EQ(0U, first.find("console,record,"));
    EXPECT_NE(std::string::npos, first.find("\r\ndown,unreachable,refused,"));
    EXPECT_EQ("", csv.takeText());
    csv.add(consoleRun("gone", estate::RecordKind::Unreachable, "refused"), std::nullopt);
    EXPECT_EQ("gone,unreachable,refused,,,,,,,,,,,,,,,\r\n", csv.takeText());
}

TEST(EstateCsv, ACollectedConsoleWithoutMachinesStillHasItsRow) {
    estate::EstateCsv csv;
    csv.add(consoleRun("empty", estate::RecordKind::Collected, ""),
            nlohmann::ordered_json::parse(CollectFolder::summary({})));
    std::string const text = csv.takeText();
    EXPECT_NE(std::string::npos, text.find("\r\nempty,collected,,empty.example,,,,,,,,,,,,,,\r\n"));
}

} // namespace

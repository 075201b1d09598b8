#include "history/FittedTable.h"

#include <gtest/gtest.h>

namespace {

history::FittedTable exampleTable() {
    history::FittedTable table({{"Run", true}, {"Machine", false, true}, {"Outcome"}});
    table.addRow({"2", "8233-E8B_10ABCDE", "timed_out"});
    table.addRow({"12", "9119-MHE_21ABCDE", "surveyed"});
    return table;
}

TEST(FittedTable, AlignsColumnsTwoSpacesApartWithoutTrailingSpaces) {
    EXPECT_EQ(exampleTable().text(0), "Run  Machine           Outcome\n"
                                      "  2  8233-E8B_10ABCDE  timed_out\n"
                                      " 12  9119-MHE_21ABCDE  surveyed\n");
}

TEST(FittedTable, NarrowsAColumnThatMayNarrowToFitTheWidth) {
    EXPECT_EQ(exampleTable().text(26), "Run  Machine     Outcome\n"
                                       "  2  8233-E8B_\u2026  timed_out\n"
                                       " 12  9119-MHE_\u2026  surveyed\n");
}

TEST(FittedTable, CutsLinesStillTooWideOnceNoColumnCanNarrow) {
    EXPECT_EQ(exampleTable().text(16), "Run  Machi\u2026  Ou\u2026\n"
                                       "  2  8233-\u2026  ti\u2026\n"
                                       " 12  9119-\u2026  su\u2026\n");
}

TEST(FittedTable, CountsTheIndentInTheWidth) {
    EXPECT_EQ(exampleTable().text(28, "  "), "  Run  Machine     Outcome\n"
                                             "    2  8233-E8B_\u2026  timed_out\n"
                                             "   12  9119-MHE_\u2026  surveyed\n");
}

TEST(FittedTable, KeepsAValueOnOneLine) {
    history::FittedTable table({{"Reason"}});
    table.addRow({"two\nlines"});
    EXPECT_EQ(table.text(0), "Reason\ntwo lines\n");
}

} // namespace

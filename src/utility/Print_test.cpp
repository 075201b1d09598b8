#include "utility/Print.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <iomanip>
#include <map>
#include <sstream>
#include <string>
#include <vector>

namespace {

std::vector<std::string> makeStrings(unsigned int count) {
    std::vector<std::string> strings;
    for (unsigned int i = 0; i < count; ++i) {
        strings.push_back("s" + std::to_string(i));
    }
    return strings;
}

TEST(DEBUG_STL_Print, VectorOfTwelveWithIndexPadsIndexToTwoColumns) {
    std::ostringstream out;
    DEBUG::STL::Print(out).print_Vector_Of_String(makeStrings(12), true);
    EXPECT_EQ(out.str(), "[ 0] = s0\n[ 1] = s1\n[ 2] = s2\n[ 3] = s3\n[ 4] = s4\n[ 5] = s5\n"
                         "[ 6] = s6\n[ 7] = s7\n[ 8] = s8\n[ 9] = s9\n[10] = s10\n[11] = s11\n");
}

TEST(DEBUG_STL_Print, VectorOfTenUsesDigitsOfSizeNotOfLastIndex) {
    std::ostringstream out;
    DEBUG::STL::Print(out).print_Vector_Of_String(makeStrings(10), true);
    std::string const text = out.str();
    EXPECT_EQ(text.substr(0, 10), "[ 0] = s0\n");
    EXPECT_EQ(text.substr(text.size() - 10), "[ 9] = s9\n");
}

TEST(DEBUG_STL_Print, VectorOfNineUsesOneColumn) {
    std::ostringstream out;
    DEBUG::STL::Print(out).print_Vector_Of_String(makeStrings(9), true);
    EXPECT_EQ(out.str(), "[0] = s0\n[1] = s1\n[2] = s2\n[3] = s3\n[4] = s4\n[5] = s5\n"
                         "[6] = s6\n[7] = s7\n[8] = s8\n");
}

TEST(DEBUG_STL_Print, VectorOfOneUsesOneColumn) {
    std::ostringstream out;
    DEBUG::STL::Print(out).print_Vector_Of_String({"only"}, true);
    EXPECT_EQ(out.str(), "[0] = only\n");
}

TEST(DEBUG_STL_Print, VectorWithoutIndexPrintsElementsOnly) {
    std::ostringstream out;
    DEBUG::STL::Print(out).print_Vector_Of_String({"a", "", "c"}, false);
    EXPECT_EQ(out.str(), "a\n\nc\n");
}

TEST(DEBUG_STL_Print, EmptyVectorPrintsNothing) {
    std::ostringstream out;
    DEBUG::STL::Print(out).print_Vector_Of_String({}, true);
    EXPECT_EQ(out.str(), "");
}

TEST(DEBUG_STL_Print, VectorOperatorForwardsToPrintVector) {
    std::ostringstream named;
    std::ostringstream called;
    DEBUG::STL::Print(named).print_Vector_Of_String(makeStrings(11), true);
    DEBUG::STL::Print callPrint(called);
    callPrint(makeStrings(11), true);
    EXPECT_EQ(called.str(), named.str());
    std::ostringstream plain;
    DEBUG::STL::Print plainPrint(plain);
    plainPrint(makeStrings(2), false);
    EXPECT_EQ(plain.str(), "s0\ns1\n");
}

TEST(DEBUG_STL_Print, MapPadsKeysToLongestKey) {
    std::ostringstream out;
    DEBUG::STL::Print(out).print_Map_Of_String_String({{"Rc", "0"}, {"RetStr1", "done"}});
    EXPECT_EQ(out.str(), "[     Rc] = 0\n[RetStr1] = done\n");
}

TEST(DEBUG_STL_Print, MapPrintsInKeyOrder) {
    std::ostringstream out;
    DEBUG::STL::Print print(out);
    print(std::map<std::string, std::string>{{"b", "2"}, {"B", "1"}, {"a", ""}});
    EXPECT_EQ(out.str(), "[B] = 1\n[a] = \n[b] = 2\n");
}

TEST(DEBUG_STL_Print, EmptyMapPrintsNothing) {
    std::ostringstream out;
    DEBUG::STL::Print(out).print_Map_Of_String_String({});
    EXPECT_EQ(out.str(), "");
}

TEST(DEBUG_STL_Print, EveryLineIsFlushed) {
    QuorvexTest::FlushCountingBuffer buffer;
    std::ostream out(&buffer);
    DEBUG::STL::Print print(out);
    print.print_Vector_Of_String(makeStrings(3), true);
    EXPECT_EQ(buffer.flushes(), 3);
    print.print_Map_Of_String_String({{"k", "v"}, {"l", "w"}});
    EXPECT_EQ(buffer.flushes(), 5);
}

TEST(DEBUG_STL_Print, StreamSettingsAreLeftUnchanged) {
    std::ostringstream out;
    out << std::hex << std::setfill('*');
    std::ios_base::fmtflags const flags = out.flags();
    DEBUG::STL::Print print(out);
    print.print_Vector_Of_String(makeStrings(11), true);
    print.print_Map_Of_String_String({{"Rc", "0"}, {"RetStr1", "x"}});
    EXPECT_EQ(out.flags(), flags);
    EXPECT_EQ(out.fill(), '*');
    EXPECT_EQ(out.width(), 0);
    // The index is written with the stream's own base and fill.
    EXPECT_NE(out.str().find("[*a] = s10\n"), std::string::npos);
    EXPECT_NE(out.str().find("[*****Rc] = 0\n"), std::string::npos);
}

// Callers may hold the printing operations as member pointers of exactly
// these types.
TEST(DEBUG_STL_Print, OperationsHaveTheirDocumentedTypes) {
    using Print = DEBUG::STL::Print;
    using Strings = std::vector<std::string>;
    using Map = std::map<std::string, std::string>;
    void (Print::*printVector)(Strings const&, bool const&) = &Print::print_Vector_Of_String;
    void (Print::*callVector)(Strings const&, bool const&) = &Print::operator();
    void (Print::*printMap)(Map const&) = &Print::print_Map_Of_String_String;
    void (Print::*callMap)(Map const&) = &Print::operator();
    std::ostringstream out;
    Print print(out);
    (print.*printVector)({"a"}, true);
    (print.*callVector)({"b"}, false);
    (print.*printMap)({{"k", "v"}});
    (print.*callMap)({{"key", "w"}});
    EXPECT_EQ(out.str(), "[0] = a\nb\n[k] = v\n[key] = w\n");
}

TEST(DEBUG_STL_Print, IndexWidthVectorIsDigitsOfSize) {
    EXPECT_EQ(DEBUG::STL::Print::get_IndexWidth_Vector(std::vector<int>()), 1u);
    EXPECT_EQ(DEBUG::STL::Print::get_IndexWidth_Vector(std::vector<int>(9)), 1u);
    EXPECT_EQ(DEBUG::STL::Print::get_IndexWidth_Vector(std::vector<int>(10)), 2u);
    EXPECT_EQ(DEBUG::STL::Print::get_IndexWidth_Vector(std::vector<int>(99)), 2u);
    EXPECT_EQ(DEBUG::STL::Print::get_IndexWidth_Vector(std::vector<int>(100)), 3u);
}

TEST(DEBUG_STL_Print, IndexWidthMapIsLongestKey) {
    EXPECT_EQ(DEBUG::STL::Print::get_IndexWidth_Map(std::map<std::string, std::string>()), 0u);
    EXPECT_EQ(DEBUG::STL::Print::get_IndexWidth_Map(
                  std::map<std::string, int>{{"Rc", 1}, {"RetStr1", 2}, {"", 3}}),
              7u);
}

} // namespace

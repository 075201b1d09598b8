// One output line of the remote action tool, as arbitrary text.

#include "Fuzz_Utility.h"

#include "relay/ReturnCode.h"

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <exception>
#include <map>
#include <string>
#include <vector>

namespace {

using Values = std::map<std::string, std::string>;

// Adds the tokens two by two as key and value; a last key alone gets "".
void u_add_Pairs(std::vector<std::string> const& tokens, std::size_t first, std::size_t last,
                 Values& values) {
    for (std::size_t i = first; i < last; i += 2) {
        values.insert({tokens[i], i + 1 < last ? tokens[i + 1] : std::string()});
    }
}

// Pairing starts again at the first "Rc" token; that part's keys win.
Values u_expect_Values(std::string const& line) {
    Values values;
    if (line.empty()) {
        return values;
    }
    std::vector<std::string> const tokens = Fuzz_Utility::u_expected_Pieces(line, "::");
    std::size_t const rc =
        static_cast<std::size_t>(std::find(tokens.begin(), tokens.end(), "Rc") - tokens.begin());
    u_add_Pairs(tokens, rc, tokens.size(), values);
    u_add_Pairs(tokens, 0, rc, values);
    return values;
}

// A missing key reads as "-1"; the number is narrowed to 32 bits.
int u_expect_Number(Values const& values, std::string const& key) {
    auto const found = values.find(key);
    bool overflow = false;
    bool hasDigits = false;
    unsigned long long const number = Fuzz_Utility::u_expected_Unsigned(
        found == values.end() ? std::string("-1") : found->second, overflow, hasDigits);
    return static_cast<int>(static_cast<std::uint32_t>(number));
}

std::string const& u_expect_Text(Values const& values, std::string const& key) {
    static std::string const blank;
    auto const found = values.find(key);
    return found == values.end() ? blank : found->second;
}

void u_check(Quorvex::RELAY::ReturnCode const& code, Values const& expected,
             std::string const& line) {
    Fuzz_Utility::u_require(code.get_Values() == expected,
                            "the pairs follow the tokens, \"Rc\" part first", line);
    Fuzz_Utility::u_require(code.get_Rc() == u_expect_Number(expected, "Rc"),
                            "Rc is its value read as a number, -1 when missing", line);
    Fuzz_Utility::u_require(code.get_RcCmd() == u_expect_Number(expected, "RcCmd"),
                            "RcCmd is its value read as a number, -1 when missing", line);
    Fuzz_Utility::u_require(code.get_RetStr1() == u_expect_Text(expected, "RetStr1") &&
                                code.get_RetStr2() == u_expect_Text(expected, "RetStr2"),
                            "RetStr1 and RetStr2 are their values, blank when missing", line);
    for (auto const& pair : expected) {
        Fuzz_Utility::u_require(code.contains(pair.first) &&
                                    code.get_ValueOf(pair.first) == pair.second,
                                "every pair can be looked up", line);
    }
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(std::uint8_t const* data, std::size_t size) {
    std::string const line(reinterpret_cast<char const*>(data), size);
    try {
        Quorvex::RELAY::ReturnCode const code(line);
        Values const expected = u_expect_Values(line);
        u_check(code, expected, line);
        Quorvex::RELAY::ReturnCode copy;
        copy = code;
        u_check(copy, expected, line);
        u_check(Quorvex::RELAY::ReturnCode(code), expected, line);
    } catch (std::exception const& error) {
        Fuzz_Utility::u_fail("reading a return code line never throws", error.what());
    }
    return 0;
}

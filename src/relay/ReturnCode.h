#pragma once

#include <map>
#include <string>
#include <string_view>
#include <vector>

namespace Quorvex::RELAY {

// The key/value pairs of one output line of the remote action tool,
// e.g. Rc::0::RcCmd::0::RetStr1::done::RetStr2::
class ReturnCode {
public:
    ReturnCode();
    // Never fails: any line, however malformed, gives some (possibly empty) map.
    // cppcheck-suppress noExplicitConstructor ; converting, as declared: an output line stands
    // wherever a return code is expected
    ReturnCode(std::string const& line);

    bool contains(std::string const& key) const;
    // The value, or an empty string when the key is missing.
    std::string const& get_ValueOf(std::string const& key) const;

    // The numbers of "Rc" and "RcCmd"; -1 when the key is missing.
    int get_Rc() const;
    int get_RcCmd() const;
    std::string const& get_RetStr1() const;
    std::string const& get_RetStr2() const;

    // All pairs, in key order.
    std::map<std::string, std::string> const& get_Values() const;

private:
    using Token_Iterator = std::vector<std::string_view>::const_iterator;

    // Pairs up the tokens of a range; a key that is the last token gets "".
    // A key already present keeps its first value.
    void _convert_Vector_2_Map(Token_Iterator first, Token_Iterator last);
    int _get_Number(std::string const& key) const;

    std::map<std::string, std::string> _Values;
    std::string _Blank;
};

// The return code of a run that printed nothing: Rc and RcCmd -1, no strings.
extern ReturnCode const cBlankReturnCode;

} // namespace Quorvex::RELAY

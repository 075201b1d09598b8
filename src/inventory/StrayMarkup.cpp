#include "inventory/StrayMarkup.h"

#include "inventory/DocumentNames.h"
#include "utility/TextSafety.h"

#include <algorithm>
#include <array>
#include <cstddef>

namespace inventory {

namespace {

std::string endTag(std::string_view element) {
    return "</" + std::string(element) + ">";
}

std::string const gc_ValueEndTag = endTag(gc_ValueElement);
std::string const gc_PropertyEndTag = endTag(gc_PropertyElement);
constexpr std::string_view gc_Declaration = "<?xml";
constexpr std::string_view gc_DeclarationEnd = "?>";
constexpr std::size_t gc_None = std::string_view::npos;

// What a byte can be, looked up once per byte: a document is scanned whole
// for every reading, and most of its bytes are names, blanks and plain text.
enum CharacterClass : unsigned char { gc_NameCharacter = 1, gc_Blank = 2, gc_Escaped = 4 };

constexpr std::array<unsigned char, 256> gc_CharacterClasses = [] {
    std::array<unsigned char, 256> classes{};
    for (int c = 0; c < 256; ++c) {
        bool const isName = (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') ||
                            (c >= '0' && c <= '9') || c == '.' || c == '-' || c == '_' || c == ':';
        bool const isBlank = c == ' ' || c == '\t' || c == '\n' || c == '\r';
        bool const isEscaped = c == '&' || c == '<' || c == '>' || c == '"';
        classes[c] =
            static_cast<unsigned char>((isName ? gc_NameCharacter : 0) | (isBlank ? gc_Blank : 0) |
                                       (isEscaped ? gc_Escaped : 0));
    }
    return classes;
}();

bool isOfClass(char c, CharacterClass wanted) {
    return (gc_CharacterClasses[static_cast<unsigned char>(c)] & wanted) != 0;
}

bool isNameCharacter(char c) {
    return isOfClass(c, gc_NameCharacter);
}

bool isBlank(char c) {
    return isOfClass(c, gc_Blank);
}

bool isElementName(std::string_view name) {
    return std::find(gc_ElementNames.begin(), gc_ElementNames.end(), name) != gc_ElementNames.end();
}

// Scans the document once, escaping the text around its markup. The result
// is the document with some characters replaced by their entities, so it is
// built from the stretches between them: markup is never copied piece by
// piece, and a document with nothing to escape is copied once.
class Scan {
public:
    explicit Scan(std::string_view document) : _in(document) {
        _out.reserve(document.size() + document.size() / 8);
    }

    std::string run();

private:
    std::string_view _in;
    std::size_t _at = 0;
    std::string _out;
    // The document up to here is in _out.
    std::size_t _copied = 0;
    // The raw display name of the begin tag copied last.
    std::string_view _displayName;

    std::size_t _nameEnd(std::size_t from) const;
    void _copyDeclaration();
    bool _copyEndTag();
    bool _copyStartTag();
    bool _copyAttribute(std::string_view element);
    std::size_t _attributeValueEnd(std::size_t from, std::string_view element) const;
    bool _isFollowedByAttribute(std::size_t from) const;
    bool _isLineTagEnd(std::size_t at) const;
    void _copyValueText();
    void _copyNameLine();
    std::size_t _valueEnd() const;
    void _escape(std::size_t end);
};

std::string Scan::run() {
    _copyDeclaration();
    while (_at < _in.size()) {
        _escape(std::min(_in.find('<', _at), _in.size()));
        if (_at < _in.size() && !_copyEndTag() && !_copyStartTag()) {
            _escape(_at + 1);
        }
    }
    _out.append(_in.substr(_copied));
    return std::move(_out);
}

std::size_t Scan::_nameEnd(std::size_t from) const {
    while (from < _in.size() && isNameCharacter(_in[from])) {
        ++from;
    }
    return from;
}

// Only at the very start, where the writer puts it.
void Scan::_copyDeclaration() {
    if (_in.substr(0, gc_Declaration.size()) != gc_Declaration) {
        return;
    }
    std::size_t const end = _in.find(gc_DeclarationEnd);
    _at = end == gc_None ? _in.size() : end + gc_DeclarationEnd.size();
}

bool Scan::_copyEndTag() {
    if (_in.substr(_at, 2) != "</") {
        return false;
    }
    std::size_t const end = _nameEnd(_at + 2);
    if (end >= _in.size() || _in[end] != '>' ||
        !isElementName(_in.substr(_at + 2, end - _at - 2))) {
        return false;
    }
    _at = end + 1;
    return true;
}

// Copies "<Name attribute="value" ...>" with each value escaped; a Value
// element's text follows. A tag cut short leaves the rest to the text scan,
// and the parser then stops there.
bool Scan::_copyStartTag() {
    std::size_t const end = _nameEnd(_at + 1);
    std::string_view const name = _in.substr(_at + 1, end - _at - 1);
    _displayName = {};
    if (!isElementName(name) ||
        (end < _in.size() && !isBlank(_in[end]) && _in[end] != '>' && _in[end] != '/')) {
        return false;
    }
    _at = end;
    while (_copyAttribute(name)) {
    }
    // The writer never writes the empty-element form; another writer may.
    if (_in.substr(_at, 2) == "/>") {
        _at += 2;
    } else if (_at < _in.size() && _in[_at] == '>') {
        ++_at;
        if (name == gc_ValueElement) {
            _copyValueText();
        } else if (name == gc_ResourceElement) {
            _copyNameLine();
        }
    }
    return true;
}

// The writer repeats a resource's display name on the line after its begin
// tag; that line is text, whatever it holds.
void Scan::_copyNameLine() {
    if (_in.substr(_at, 1) != "\n") {
        return;
    }
    std::size_t const lineEnd = std::min(_in.find('\n', _at + 1), _in.size());
    std::string_view const line = _in.substr(_at + 1, lineEnd - _at - 1);
    bool const isNameLine = line.size() >= _displayName.size() &&
                            line.substr(line.size() - _displayName.size()) == _displayName &&
                            line.find_first_not_of(' ') >= line.size() - _displayName.size();
    if (isNameLine) {
        _escape(lineEnd);
    }
}

bool Scan::_copyAttribute(std::string_view element) {
    std::size_t const nameStart =
        std::find_if_not(_in.begin() + static_cast<std::ptrdiff_t>(_at), _in.end(), isBlank) -
        _in.begin();
    std::size_t const nameEnd = _nameEnd(nameStart);
    if (nameEnd == nameStart || _in.substr(nameEnd, 2) != "=\"") {
        return false;
    }
    std::size_t const valueEnd = _attributeValueEnd(nameEnd + 2, element);
    if (valueEnd == gc_None) {
        return false;
    }
    if (_in.substr(nameStart, nameEnd - nameStart) == gc_DisplayNameAttribute) {
        _displayName = _in.substr(nameEnd + 2, valueEnd - nameEnd - 2);
    }
    _at = nameEnd + 2;
    _escape(valueEnd);
    _at = valueEnd + 1;
    return true;
}

// A value ends at the first quote that another attribute follows, else at
// the first quote before a tag end where the writer ends a begin tag (the
// line's end, or an end tag right away), else at the first quote before any
// ">": a quote inside the value is followed by neither. Attribute values
// stay on their line, which bounds the search.
std::size_t Scan::_attributeValueEnd(std::size_t from, std::string_view element) const {
    std::size_t const lineEnd = std::min(_in.find('\n', from), _in.size());
    std::size_t anyTagEnd = gc_None;
    for (std::size_t quote = _in.find('"', from); quote < lineEnd;
         quote = _in.find('"', quote + 1)) {
        if (_isFollowedByAttribute(quote + 1)) {
            return quote;
        }
        std::size_t const tagEnd = _in.substr(quote + 1, 2) == "/>" ? quote + 2 : quote + 1;
        if (tagEnd < _in.size() && _in[tagEnd] == '>') {
            if (element == gc_ValueElement || _isLineTagEnd(tagEnd)) {
                return quote;
            }
            anyTagEnd = std::min(anyTagEnd, quote);
        }
    }
    return anyTagEnd;
}

bool Scan::_isFollowedByAttribute(std::size_t from) const {
    std::size_t const nameStart =
        std::find_if_not(_in.begin() + static_cast<std::ptrdiff_t>(from), _in.end(), isBlank) -
        _in.begin();
    if (nameStart == from) {
        return false;
    }
    std::size_t const nameEnd = _nameEnd(nameStart);
    return nameEnd > nameStart && _in.substr(nameEnd, 2) == "=\"";
}

bool Scan::_isLineTagEnd(std::size_t at) const {
    std::size_t const next = at + 1;
    return next == _in.size() || _in[next] == '\n' || _in[next] == '\r' ||
           _in.substr(next, 2) == "</";
}

void Scan::_copyValueText() {
    std::size_t const end = _valueEnd();
    _escape(end);
    if (end < _in.size()) {
        _at = end + gc_ValueEndTag.size();
    }
}

// A value's text may hold "</Value>" itself (a reason may hold any text):
// it ends at the first "</Value>" that blanks and then its property's end
// tag, or the document's end, follow.
std::size_t Scan::_valueEnd() const {
    for (std::size_t end = _in.find(gc_ValueEndTag, _at); end != gc_None;
         end = _in.find(gc_ValueEndTag, end + 1)) {
        std::size_t const after = end + gc_ValueEndTag.size();
        std::size_t const next =
            std::find_if_not(_in.begin() + static_cast<std::ptrdiff_t>(after), _in.end(), isBlank) -
            _in.begin();
        if (next == _in.size() || _in.substr(next, gc_PropertyEndTag.size()) == gc_PropertyEndTag) {
            return end;
        }
    }
    return _in.size();
}

// The position is kept in a local: a member written on every byte is
// stored on every byte, as the output string may alias it.
void Scan::_escape(std::size_t end) {
    if (_at >= end) {
        return;
    }
    for (std::size_t at = _at; at < end; ++at) {
        if (isOfClass(_in[at], gc_Escaped)) {
            _out.append(_in.substr(_copied, at - _copied));
            _out.append(util::htmlEntityOf(_in[at]));
            _copied = at + 1;
        }
    }
    _at = end;
}

} // namespace

std::string escapeStrayMarkup(std::string_view document) {
    return Scan(document).run();
}

} // namespace inventory

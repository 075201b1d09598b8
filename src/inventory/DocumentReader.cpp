#include "inventory/DocumentReader.h"

#include "inventory/ComponentKeys.h"
#include "inventory/DocumentNames.h"
#include "inventory/StrayMarkup.h"
#include "utility/FileText.h"

#include <expat.h>

#include <algorithm>
#include <climits>
#include <memory>
#include <optional>
#include <vector>

namespace inventory {

namespace {

// The property a default document carries its reason in; the keyword table
// of client documents has no such keyword (docs/compatibility.md#default-document).
constexpr std::string_view gc_ReasonKeyword = "VD";
// Expat takes a length as int: a document is handed over in pieces.
constexpr std::size_t gc_PieceBytes = std::size_t{1} << 20;

std::string attribute(XML_Char const** attributes, std::string_view name) {
    for (; attributes[0] != nullptr; attributes += 2) {
        if (name == attributes[0]) {
            return attributes[1];
        }
    }
    return {};
}

enum class Element { Other, Resource, ResourceList, PropertyGroup, Property, Value };

Element elementOf(std::string_view name) {
    if (name == gc_ResourceElement) {
        return Element::Resource;
    }
    if (name == gc_ResourceListElement) {
        return Element::ResourceList;
    }
    if (name == gc_PropertyGroupElement) {
        return Element::PropertyGroup;
    }
    if (name == gc_PropertyElement) {
        return Element::Property;
    }
    return name == gc_ValueElement ? Element::Value : Element::Other;
}

// Follows expat's events and builds the reading from them.
class ExpatReading {
public:
    ExpatReading();

    DocumentReading read(std::string const& escaped);
    void start(std::string_view name, XML_Char const** attributes);
    void end();
    void text(std::string_view text);

private:
    std::unique_ptr<XML_ParserStruct, decltype(&XML_ParserFree)> _parser;
    DocumentReading _reading;
    std::vector<Element> _open;
    std::vector<std::size_t> _resources;
    std::vector<std::string> _lists;
    std::vector<std::string> _groups;
    std::optional<Keyword> _keyword;
    std::optional<DocumentReading::Stop> _refusal;

    bool _parse(std::string const& escaped);
    void _refuseRoot(std::string_view name);
    void _startResource(XML_Char const** attributes);
    void _startProperty(XML_Char const** attributes);
    void _endProperty();
    void _recordStop();
    void _finish();
};

void XMLCALL onStart(void* reading, XML_Char const* name, XML_Char const** attributes) {
    static_cast<ExpatReading*>(reading)->start(name, attributes);
}

void XMLCALL onEnd(void* reading, XML_Char const* /*name*/) {
    static_cast<ExpatReading*>(reading)->end();
}

void XMLCALL onText(void* reading, XML_Char const* text, int length) {
    static_cast<ExpatReading*>(reading)->text({text, static_cast<std::size_t>(length)});
}

ExpatReading::ExpatReading() : _parser(XML_ParserCreate(nullptr), &XML_ParserFree) {
    if (!_parser) {
        throw std::bad_alloc();
    }
    XML_SetUserData(_parser.get(), this);
    XML_SetElementHandler(_parser.get(), onStart, onEnd);
    XML_SetCharacterDataHandler(_parser.get(), onText);
}

DocumentReading ExpatReading::read(std::string const& escaped) {
    if (!_parse(escaped)) {
        _recordStop();
    }
    _finish();
    return std::move(_reading);
}

// The last piece is marked final as it is handed over: expat then reads it
// to its end at once (a fifth less work for a document of one piece than
// handing the end over separately).
bool ExpatReading::_parse(std::string const& escaped) {
    std::size_t at = 0;
    do {
        std::size_t const length = std::min(gc_PieceBytes, escaped.size() - at);
        bool const isLast = at + length == escaped.size();
        if (XML_Parse(_parser.get(), escaped.data() + at, static_cast<int>(length),
                      isLast ? XML_TRUE : XML_FALSE) != XML_STATUS_OK) {
            return false;
        }
        at += length;
    } while (at < escaped.size());
    return true;
}

void ExpatReading::start(std::string_view name, XML_Char const** attributes) {
    // Expat may still report the refused element's end: it is kept open.
    if (_open.empty() && name != gc_RootElement) {
        _refuseRoot(name);
        _open.push_back(Element::Other);
        return;
    }
    Element const element = elementOf(name);
    if (element == Element::Resource) {
        _startResource(attributes);
    } else if (element == Element::ResourceList) {
        _lists.push_back(attribute(attributes, gc_DisplayNameAttribute));
    } else if (element == Element::PropertyGroup) {
        _groups.push_back(attribute(attributes, gc_DisplayNameAttribute));
    } else if (element == Element::Property) {
        _startProperty(attributes);
    }
    _open.push_back(element);
}

// Expat reports only end tags that match their begin tag.
void ExpatReading::end() {
    Element const element = _open.back();
    _open.pop_back();
    if (element == Element::Resource) {
        _resources.pop_back();
    } else if (element == Element::ResourceList) {
        _lists.pop_back();
    } else if (element == Element::PropertyGroup) {
        _groups.pop_back();
    } else if (element == Element::Property) {
        _endProperty();
    }
}

void ExpatReading::text(std::string_view text) {
    if (_keyword && !_open.empty() && _open.back() == Element::Value) {
        _keyword->value.append(text);
    }
}

void ExpatReading::_refuseRoot(std::string_view name) {
    _refusal = DocumentReading::Stop{XML_GetCurrentLineNumber(_parser.get()),
                                     "not an inventory document: its root element is <" +
                                         std::string(name) + ">"};
    XML_StopParser(_parser.get(), XML_FALSE);
}

void ExpatReading::_startResource(XML_Char const** attributes) {
    Component component;
    component.displayName = attribute(attributes, gc_DisplayNameAttribute);
    component.uniqueId = attribute(attributes, "uniqueId");
    if (!_resources.empty()) {
        component.parent = _resources.back();
    }
    bool const isListed =
        !_open.empty() && _open.back() == Element::ResourceList && !_lists.empty();
    component.list = isListed ? _lists.back() : std::string();
    _resources.push_back(_reading.components.size());
    _reading.components.push_back(std::move(component));
}

void ExpatReading::_startProperty(XML_Char const** attributes) {
    if (_resources.empty()) {
        return;
    }
    _keyword = Keyword{attribute(attributes, "name"),
                       attribute(attributes, gc_DisplayNameAttribute),
                       {},
                       _groups.empty() ? std::string() : _groups.back()};
    if (_keyword->name == gc_ReasonKeyword) {
        _reading.kind = DocumentReading::Kind::DefaultDocument;
    }
}

void ExpatReading::_endProperty() {
    if (!_keyword || _resources.empty()) {
        return;
    }
    if (_keyword->name == gc_ReasonKeyword) {
        _reading.failureReason = _keyword->value;
    }
    _reading.components[_resources.back()].keywords.push_back(std::move(*_keyword));
    _keyword.reset();
}

void ExpatReading::_recordStop() {
    if (_refusal) {
        _reading.stop = std::move(_refusal);
        return;
    }
    _reading.stop = DocumentReading::Stop{XML_GetCurrentLineNumber(_parser.get()),
                                          XML_ErrorString(XML_GetErrorCode(_parser.get()))};
}

// A reason cut short is kept as far as it was read.
void ExpatReading::_finish() {
    if (_keyword && _keyword->name == gc_ReasonKeyword) {
        _reading.failureReason = _keyword->value;
    }
    if (_reading.isDefaultDocument()) {
        _reading.components.clear();
        return;
    }
    assignComponentKeys(_reading.components);
}

} // namespace

DocumentReading readDocument(std::string_view document) {
    return ExpatReading().read(escapeStrayMarkup(document));
}

DocumentReading readDocumentFile(std::string const& path) {
    return readDocument(util::readWholeFile(path));
}

} // namespace inventory

#include "history/StoredComponent.h"

#include <algorithm>

namespace history {

namespace {

void appendEscaped(std::string& text, std::string_view field) {
    for (char const c : field) {
        switch (c) {
        case '\\':
            text += "\\\\";
            break;
        case '\t':
            text += "\\t";
            break;
        case '\n':
            text += "\\n";
            break;
        case '\r':
            text += "\\r";
            break;
        default:
            text += c;
        }
    }
}

char kindLetter(inventory::ComponentKey::Kind kind) {
    switch (kind) {
    case inventory::ComponentKey::Kind::LocationCode:
        return 'L';
    case inventory::ComponentKey::Kind::UniqueId:
        return 'U';
    default:
        return 'D';
    }
}

char unescaped(char c) {
    switch (c) {
    case 't':
        return '\t';
    case 'n':
        return '\n';
    case 'r':
        return '\r';
    default:
        return c;
    }
}

// The fields of one line, unescaped.
std::vector<std::string> fieldsOf(std::string_view line) {
    std::vector<std::string> fields(1);
    for (std::size_t at = 0; at < line.size(); ++at) {
        if (line[at] == '\t') {
            fields.emplace_back();
        } else if (line[at] == '\\' && at + 1 < line.size()) {
            fields.back() += unescaped(line[++at]);
        } else {
            fields.back() += line[at];
        }
    }
    return fields;
}

std::string const& fieldAt(std::vector<std::string> const& fields, std::size_t index) {
    static std::string const none;
    return index < fields.size() ? fields[index] : none;
}

void decodeLine(std::string_view line, std::vector<StoredComponent>& components) {
    std::vector<std::string> fields = fieldsOf(line);
    if (!line.empty() && line.front() == '\t') {
        if (!components.empty()) {
            components.back().properties.push_back(
                {fieldAt(fields, 1), fieldAt(fields, 2), fieldAt(fields, 3)});
        }
        return;
    }
    char const kind = fieldAt(fields, 0).empty() ? 'D' : fieldAt(fields, 0).front();
    components.push_back({kind, fieldAt(fields, 1), fieldAt(fields, 2), fieldAt(fields, 3), {}});
}

} // namespace

std::string StoredComponent::valueOf(std::string_view keyword) const {
    auto const found =
        std::find_if(properties.begin(), properties.end(),
                     [keyword](Property const& property) { return property.keyword == keyword; });
    return found == properties.end() ? std::string() : found->value;
}

std::string encodeComponents(std::vector<inventory::Component> const& components) {
    std::string text;
    for (inventory::Component const& component : components) {
        text += kindLetter(component.key.kind);
        text += '\t';
        appendEscaped(text, component.key.identity());
        text += '\t';
        appendEscaped(text, component.displayName);
        text += '\t';
        appendEscaped(text, component.list);
        text += '\n';
        for (inventory::Keyword const& keyword : component.keywords) {
            text += '\t';
            appendEscaped(text, keyword.name);
            text += '\t';
            appendEscaped(text, keyword.group);
            text += '\t';
            appendEscaped(text, keyword.value);
            text += '\n';
        }
    }
    return text;
}

std::vector<StoredComponent> decodeComponents(std::string_view text) {
    std::vector<StoredComponent> components;
    std::size_t at = 0;
    while (at < text.size()) {
        std::size_t const end = std::min(text.find('\n', at), text.size());
        decodeLine(text.substr(at, end - at), components);
        at = end + 1;
    }
    return components;
}

} // namespace history

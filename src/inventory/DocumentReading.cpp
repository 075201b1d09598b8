#include "inventory/DocumentReading.h"

namespace inventory {

bool DocumentReading::isDefaultDocument() const {
    return kind == Kind::DefaultDocument;
}

bool DocumentReading::isUnreadable() const {
    return stop.has_value();
}

std::string DocumentReading::unreadableText() const {
    if (!stop) {
        return {};
    }
    return "document unreadable at line " + std::to_string(stop->line) + ": " + stop->reason;
}

} // namespace inventory

#pragma once

#include "inventory/Component.h"

#include <optional>
#include <string>
#include <vector>

namespace inventory {

// What a VPD document gave: a partition's inventory, or the default document
// the survey writes for a partition it could not survey, which is no
// inventory. A document that is not wholly readable keeps what came before
// the place where reading stopped, and says where and why.
struct DocumentReading {
    enum class Kind { Inventory, DefaultDocument };

    // Where reading stopped: the line (from 1) and the parser's reason.
    struct Stop {
        unsigned long line = 0;
        std::string reason;
    };

    Kind kind = Kind::Inventory;
    // Every resource read, in document order; none for a default document.
    std::vector<Component> components;
    // A default document's reason (its "VD" value) as far as it was read.
    std::string failureReason;
    std::optional<Stop> stop;

    bool isDefaultDocument() const;
    bool isUnreadable() const;
    // "document unreadable at line L: reason"; empty when read whole.
    std::string unreadableText() const;
};

} // namespace inventory

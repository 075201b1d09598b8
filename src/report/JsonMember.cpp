#include "report/JsonMember.h"

namespace report {

nlohmann::ordered_json const& member(nlohmann::ordered_json const& object, char const* name) {
    static nlohmann::ordered_json const none;
    if (!object.is_object()) {
        return none;
    }
    auto const found = object.find(name);
    return found == object.end() ? none : *found;
}

} // namespace report

#include "pylon/Machine.h"

#include <string>

namespace Quorvex::PYLON {

Machine::Machine() : _ObjectType(0) {}

Machine::Machine(unsigned int const& objectType, ::Quorvex::System::MTMS const& mtms)
    : _ObjectType(objectType), _MTMS(mtms) {}

::Quorvex::System::MTMS const& Machine::get_MTMS() const {
    return _MTMS;
}

unsigned int const& Machine::get_ObjectType() const {
    return _ObjectType;
}

bool operator<(Machine const& a, Machine const& b) {
    if (a.get_ObjectType() != b.get_ObjectType()) {
        return a.get_ObjectType() < b.get_ObjectType();
    }
    return std::string(a.get_MTMS()) < std::string(b.get_MTMS());
}

} // namespace Quorvex::PYLON

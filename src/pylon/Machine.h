#pragma once

#include "system/MTMS.h"

namespace Quorvex::PYLON {

// One managed object of the console: its object type and machine identity.
class Machine {
public:
    Machine();
    Machine(unsigned int const& objectType, ::Quorvex::System::MTMS const& mtms);
    Machine(Machine const& other) = default;
    Machine& operator=(Machine const& other) = default;
    ~Machine() = default;

    ::Quorvex::System::MTMS const& get_MTMS() const;
    unsigned int const& get_ObjectType() const;

private:
    unsigned int _ObjectType;
    ::Quorvex::System::MTMS _MTMS;
};

// Smaller object type first, then by machine identity text.
bool operator<(Machine const& a, Machine const& b);

} // namespace Quorvex::PYLON

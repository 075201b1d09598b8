#pragma once

#include "pylon/Machine.h"

#include <string>
#include <vector>

namespace Quorvex::PYLON {

// The console's managed machines in the order its listing tool prints them.
// Filled once by the constructor, which runs the listing tool.
class ListOf_Machines : public std::vector<::Quorvex::PYLON::Machine> {
public:
    ListOf_Machines();

private:
    void _initialize();
    void _insert_Machine(std::string const& entry);
};

} // namespace Quorvex::PYLON

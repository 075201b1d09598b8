#include "relay/Interface.h"

namespace Quorvex::RELAY {

// The shared Base is built here, by the most derived class; the Base(target)
// of each operation applies only when that operation stands alone.
Interface::Interface(TargetPartition const& target)
    : Base(target), GetFileFromPartition(target), PutFileToPartition(target),
      RunCommandOnPartition(target) {}

Interface::~Interface() = default;

} // namespace Quorvex::RELAY

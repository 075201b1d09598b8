#pragma once

#include "relay/GetFileFromPartition.h"
#include "relay/PutFileToPartition.h"
#include "relay/RunCommandOnPartition.h"

namespace Quorvex::RELAY {

// All three remote operations over one shared Base: they share the target,
// the action name and the last run's output and return codes.
class Interface : public GetFileFromPartition,
                  public PutFileToPartition,
                  public RunCommandOnPartition {
public:
    // cppcheck-suppress noExplicitConstructor ; converting, as declared: a target stands wherever
    // an interface is expected
    Interface(TargetPartition const& target);
    ~Interface();
};

} // namespace Quorvex::RELAY

#pragma once

#include "relay/GetFileFromPartition.h"
#include "relay/PutFileToPartition.h"
#include "relay/RunCommandOnPartition.h"

namespace Quorvex {
namespace RELAY {

// All three remote operations over one shared Base: they share the target,
// the action name and the last run's output and return codes.
class Interface : public GetFileFromPartition,
                  public PutFileToPartition,
                  public RunCommandOnPartition {
public:
    Interface(TargetPartition const& target);
    ~Interface();
};

} // namespace RELAY
} // namespace Quorvex

#pragma once

#include "system/Partition.h"

#include <string>

namespace Quorvex::RELAY {

// The partition a remote action addresses, and whether the action names it
// by "PartitionId" or by "PartitionArray".
class TargetPartition {
public:
    TargetPartition();
    // cppcheck-suppress noExplicitConstructor ; converting, as declared: a partition stands
    // wherever a target is expected
    TargetPartition(Quorvex::System::Partition const& partition);

    Quorvex::System::Partition const& get_Partition() const;

    void use_PartitionArray();
    void use_PartitionID();

    // CecMT::"<type-model>"::CecMS::"<serial>"::PartitionId::"<id>"
    // or, in array mode, ...::PartitionArray::{"<id>"}
    std::string createString_Target() const;

private:
    // The command line is built around the target's text without a copy of it.
    friend class Base;

    // createString_Target's text, kept until the form changes.
    std::string const& _get_TargetText() const;
    std::string _build_Target() const;

    Quorvex::System::Partition _Partition;
    bool _UsePartitionArray;
    // Every command of a survey names the same target: its text is built
    // once per form, not once per command.
    mutable std::string _TargetText;
    mutable bool _TargetTextIsArray{false};
};

} // namespace Quorvex::RELAY

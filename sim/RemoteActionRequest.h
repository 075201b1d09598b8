#pragma once
// What a call of the remote action tool asks for. The tool quotes nothing,
// so the shell may have split or joined its words anyhow: the arguments are
// joined with blanks again and searched for the few keys the console needs.

#include <string>
#include <vector>

namespace PylonSim {

class RemoteActionRequest {
public:
    explicit RemoteActionRequest(std::vector<std::string> const& arguments);

    // The text after "ZOR.ServiceEvent::::" up to the next "::"; empty when
    // the class name is missing.
    std::string const& get_Action() const;
    // "PartitionId::X", else "PartitionArray::{X}" (braces removed); "*"
    // when neither is given.
    std::string const& get_PartitionID() const;
    bool has_LocalFN() const;
    std::string const& get_LocalFN() const;

private:
    // The value after the key up to the next "::" or the end.
    bool _find(std::string const& key, std::string& value) const;
    void _findPartition();

    std::string _text;
    std::string _action;
    std::string _partitionID = "*";
    bool _hasLocalFN = false;
    std::string _localFN;
};

} // namespace PylonSim

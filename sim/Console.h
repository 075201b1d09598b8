#pragma once
// The simulated console: answers one call of lsvtc, lspartition or
// runact-api as the scenario in PYLON_SIM_SCENARIO says, and logs the call to
// PYLON_SIM_LOG.

#include <string>
#include <vector>

namespace PylonSim {

class RemoteActionRequest;

class Console {
public:
    // Exit status of a run whose scenario file cannot be used.
    static constexpr int gc_ExitBadScenario = 97;
    // Exit status of runact-api for a missing or unknown action.
    static constexpr int gc_ExitUnknownAction = 3;

    static bool isTool(std::string const& name);

    // Plays the tool; returns the exit status.
    static int answer(std::string const& tool, std::vector<std::string> const& arguments);

    // Checks the scenario file; returns 0 or gc_ExitBadScenario.
    static int check(std::string const& fileName);

private:
    static void _log(std::string const& tool, std::vector<std::string> const& arguments);
    static void _reportBadScenario(std::string const& description);
    static int _answerListing(std::string const& tool, std::vector<std::string> const& arguments);
    static int _answerRemoteAction(std::vector<std::string> const& arguments);
    // Writes the fetched document at /var/adm/quorvex/ + LocalFN; returns a
    // diagnostic line for stderr, empty when the document was placed.
    static std::string _placeDocument(RemoteActionRequest const& request,
                                      std::string const& document);
};

} // namespace PylonSim

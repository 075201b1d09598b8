#pragma once
// A collect folder as the Ansible collection leaves it for
// "quorvex-survey estate", laid down by a test in a temporary folder.

#include "TemporaryFiles.h"

#include <string>

namespace QuorvexTest {

class CollectFolder {
public:
    CollectFolder();

    std::string const& path() const;

    // Writes records.json as it is given.
    void writeRecords(std::string const& text) const;

    // Writes consoles/<console>/ with a bundle.json naming the console (its
    // host "<console>.example"), the summary text and VPD/ holding the named
    // documents, each with the text "<doc/>".
    void addBundle(std::string const& console, std::string const& summary,
                   std::vector<std::string> const& documents = {}) const;

    // A record of records.json: "bundle" names consoles/<console> when
    // withBundle, else null; message and the numbers as JSON texts.
    static std::string record(std::string const& console, std::string const& kind, bool withBundle,
                              std::string const& message = "null",
                              std::string const& exitStatus = "null",
                              std::string const& ageSeconds = "null");

    // records.json with the records, collected at 2026-11-24T18:00:00+00:00.
    static std::string records(std::vector<std::string> const& entries);

    // A summary of one machine 9119-MHE_21ABCDE with the partitions given as
    // summary partition objects (JSON texts).
    static std::string summary(std::vector<std::string> const& partitions);

    // A summary partition object: host, outcome and, for a failure, reason.
    static std::string partition(std::string const& id, std::string const& host,
                                 std::string const& outcome, std::string const& reason = "");

private:
    TemporaryDirectory _folder;
};

} // namespace QuorvexTest

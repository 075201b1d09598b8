#include "report/SummaryTotals.h"

#include <numeric>

namespace report {

using Json = nlohmann::ordered_json;

namespace {

Json zeroCounts() {
    Json counts;
    counts["partitions"] = 0;
    for (std::string const& outcome : outcomeNames()) {
        counts[outcome] = 0;
    }
    return counts;
}

} // namespace

std::vector<std::string> const& outcomeNames() {
    static std::vector<std::string> const names = {
        "surveyed",      "inactive",  "channel_failure", "client_failure",
        "fetch_failure", "timed_out", "interrupted"};
    return names;
}

Json countOutcomes(Json const& partitions) {
    Json counts = zeroCounts();
    for (Json const& partition : partitions) {
        counts["partitions"] = counts["partitions"].get<long long>() + 1;
        std::string const outcome = partition.value("outcome", "");
        if (counts.contains(outcome) && outcome != "partitions") {
            counts[outcome] = counts[outcome].get<long long>() + 1;
        }
    }
    return counts;
}

Json totalCounts(Json const& machines) {
    Json totals;
    totals["machines"] = machines.size();
    Json const zero = zeroCounts();
    for (auto const& item : zero.items()) {
        std::string const& name = item.key();
        totals[name] =
            std::accumulate(machines.begin(), machines.end(), item.value().get<long long>(),
                            [&](long long sum, Json const& machine) {
                                return sum + machine["counts"].value(name, 0LL);
                            });
    }
    return totals;
}

std::string overallCode(Json const& counts) {
    long long const surveyed = counts.value("surveyed", 0LL);
    if (surveyed == 0) {
        return "8";
    }
    return surveyed == counts.value("partitions", 0LL) ? "0" : "4";
}

} // namespace report

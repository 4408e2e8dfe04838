#pragma once

#include "benchmarks/job.h"

#include <map>
#include <optional>
#include <string>

namespace bench {

struct Row {
    std::string job;
    std::string unit;
    double ours = 0;
    std::map<std::string, double> peers;
    std::optional<double> limit;

    std::optional<double> bestPeerOverOurs() const;
    std::optional<double> oursOverLimit() const;
};

// Runs every contender once to compare their results, then all of them in turn, round after round,
// and takes each one's median. Throws when results differ.
Row measure(const std::string& name, const Job& job, int rounds);

}  // namespace bench

#include "benchmarks/measure.h"

#include <algorithm>
#include <stdexcept>
#include <vector>

namespace bench {
namespace {

// Where the results begin to differ, with some of what stands there.
std::string difference(const std::string& expected, const std::string& actual) {
    const auto [in, out] = std::ranges::mismatch(expected, actual);
    const auto at = static_cast<std::size_t>(in - expected.begin());
    return std::to_string(actual.size()) + " bytes instead of " + std::to_string(expected.size()) +
           ", different from byte " + std::to_string(at) + " on: \"" + actual.substr(at, 20) +
           "\" instead of \"" + expected.substr(at, 20) + "\"";
}

void compareResults(const Job& job) {
    Trial reference(true);
    for (const Contender& contender : job.contenders) {
        Trial own(true);
        Trial& trial = &contender == job.contenders.data() ? reference : own;
        contender.run(trial);
        if (trial.collected().empty()) throw std::runtime_error(contender.name + " has no result");
        if (trial.collected() != reference.collected()) {
            throw std::runtime_error(contender.name + " has another result: " +
                                     difference(reference.collected(), trial.collected()));
        }
    }
}

double median(std::vector<double>& values) {
    const auto middle = values.begin() + static_cast<std::ptrdiff_t>(values.size() / 2);
    std::ranges::nth_element(values, middle);
    return *middle;
}

void addPeer(Row& row, const std::string& name, double value) {
    const auto [place, isNew] = row.peers.emplace(name, value);
    if (!isNew) place->second = std::min(place->second, value);
}

}  // namespace

std::optional<double> Row::bestPeerOverOurs() const {
    if (peers.empty()) return std::nullopt;
    const auto byValue = [](const auto& left, const auto& right) {
        return left.second < right.second;
    };
    return std::ranges::min_element(peers, byValue)->second / ours;
}

std::optional<double> Row::oursOverLimit() const {
    return limit ? std::optional(ours / *limit) : std::nullopt;
}

Row measure(const std::string& name, const Job& job, int rounds) {
    compareResults(job);
    std::vector<std::vector<double>> times(job.contenders.size());
    for (int round = 0; round < rounds; ++round) {
        for (std::size_t i = 0; i < times.size(); ++i) {
            Trial trial(false);
            job.contenders[i].run(trial);
            times[i].push_back(trial.totalSeconds());
        }
    }
    Row row;
    row.job = name;
    row.unit = job.unit;
    for (std::size_t i = 0; i < times.size(); ++i) {
        const std::string& contender = job.contenders[i].name;
        const double value = median(times[i]) * job.unitsPerSecond;
        if (contender == ours) {
            row.ours = value;
        } else if (contender == limit) {
            row.limit = value;
        } else {
            addPeer(row, contender, value);
        }
    }
    return row;
}

}  // namespace bench

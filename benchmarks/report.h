#pragma once

#include "benchmarks/measure.h"

#include <string>
#include <vector>

namespace bench {

using Rows = std::vector<Row>;

// One line of the table, and the line above all of them.
std::string tableHead();
std::string tableLine(const Row& row);

// A list of objects with the keys job, unit, ours, peers, limit, best_peer_over_ours and
// ours_over_limit; null where there is no limit or no peer.
std::string asJson(const Rows& rows);
std::string asMarkdown(const Rows& rows);

}  // namespace bench

#include "benchmarks/report.h"

#include <fmt/format.h>

namespace bench {
namespace {

std::string shortNumber(double value) {
    const int decimals = value < 10 ? 2 : value < 100 ? 1 : 0;
    return fmt::format("{:.{}f}", value, decimals);
}

std::string cell(const std::optional<double>& value) {
    return value ? shortNumber(*value) : "-";
}

std::string peerList(const Row& row) {
    std::string text;
    for (const auto& [name, value] : row.peers)
        text += (text.empty() ? "" : ", ") + name + " " + shortNumber(value);
    return text;
}

std::string json(const std::optional<double>& value) {
    return value ? fmt::format("{:.6g}", *value) : "null";
}

std::string jsonPeers(const Row& row) {
    std::string text;
    for (const auto& [name, value] : row.peers)
        text += fmt::format("{}\"{}\": {:.6g}", text.empty() ? "" : ", ", name, value);
    return "{" + text + "}";
}

}  // namespace

std::string tableHead() {
    return fmt::format("{:<22} {:<10} {:>8} {:>8} {:>10} {:>10}  {}\n", "job", "unit", "ours",
                       "limit", "peer/ours", "ours/limit", "peers");
}

std::string tableLine(const Row& row) {
    return fmt::format("{:<22} {:<10} {:>8} {:>8} {:>10} {:>10}  {}\n", row.job, row.unit,
                       shortNumber(row.ours), cell(row.limit), cell(row.bestPeerOverOurs()),
                       cell(row.oursOverLimit()), peerList(row));
}

std::string asJson(const Rows& rows) {
    std::string text;
    for (const Row& row : rows) {
        text += text.empty() ? "[\n" : ",\n";
        text +=
            fmt::format(R"({{"job": "{}", "unit": "{}", "ours": {:.6g}, "peers": {}, "limit": {}, )"
                        R"("best_peer_over_ours": {}, "ours_over_limit": {}}})",
                        row.job, row.unit, row.ours, jsonPeers(row), json(row.limit),
                        json(row.bestPeerOverOurs()), json(row.oursOverLimit()));
    }
    return text.empty() ? "[]\n" : text + "\n]\n";
}

std::string asMarkdown(const Rows& rows) {
    std::string text =
        "| job | unit | ours | peers | limit | best peer / ours | ours / limit |\n"
        "|---|---|---:|---|---:|---:|---:|\n";
    for (const Row& row : rows) {
        text += fmt::format("| `{}` | {} | {} | {} | {} | {} | {} |\n", row.job, row.unit,
                            shortNumber(row.ours), peerList(row), cell(row.limit),
                            cell(row.bestPeerOverOurs()), cell(row.oursOverLimit()));
    }
    return text;
}

}  // namespace bench

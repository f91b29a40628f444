#include "host/cli/network_report.h"

#include "host/cli/text.h"

#include <fmt/format.h>
#include <nlohmann/json.hpp>

#include <algorithm>
#include <array>
#include <vector>

namespace velkhost::cli {
namespace {

using Json = nlohmann::ordered_json;

constexpr std::int64_t kMicros = 1'000'000;
constexpr std::size_t kGap = 2;

using Row = std::array<std::string, 4>;

std::int64_t age_s(const NetworkReport &report) {
    return report.now_us / kMicros - report.table->stamp_s;
}

double seconds(std::int64_t us) {
    return static_cast<double>(us) / static_cast<double>(kMicros);
}

std::vector<Row> rows_of(const rig::NetworkTable &table) {
    std::vector<Row> rows = {{"node", "device", "hypervisor", "controller"}};
    for (const rig::NetworkNode &node : table.nodes) {
        rows.push_back({std::to_string(node.number), printable(node.device, false),
                        printable(node.hypervisor, false), printable(node.controller, false)});
    }
    return rows;
}

// Columns as wide as they need, nothing behind the last one.
std::string aligned(const std::vector<Row> &rows) {
    std::array<std::size_t, std::tuple_size_v<Row>> widths{};
    for (const Row &row : rows) {
        for (std::size_t i = 0; i < row.size(); ++i) {
            widths.at(i) = std::max(widths.at(i), columns(row.at(i)));
        }
    }
    std::string text;
    for (const Row &row : rows) {
        for (std::size_t i = 0; i + 1 < row.size(); ++i) {
            text += padded(row.at(i), widths.at(i) + kGap);
        }
        text += row.back() + "\n";
    }
    return text;
}

std::string configure_line(const ConfigureReport &configure) {
    if (!configure.done) {
        return fmt::format("not configured anew: nobody did so within {:g} s\n",
                           seconds(configure.took_us));
    }
    if (configure.took_us == 0) {
        return "not configured anew: the table is young enough\n";
    }
    return fmt::format("configured anew within {:g} s\n", seconds(configure.took_us));
}

Json of_configure(const std::optional<ConfigureReport> &configure) {
    if (!configure) {
        return {};
    }
    return {{"done", configure->done},
            {"needed", !configure->done || configure->took_us > 0},
            {"seconds", seconds(configure->took_us)}};
}

Json of_table(const NetworkReport &report) {
    if (!report.table) {
        return {};
    }
    Json nodes = Json::array();
    for (const rig::NetworkNode &node : report.table->nodes) {
        nodes.push_back({{"number", node.number},
                         {"device", node.device},
                         {"hypervisor", node.hypervisor},
                         {"controller", node.controller}});
    }
    return {{"made", iso_time(report.table->stamp_s * kMicros)},
            {"age_seconds", age_s(report)},
            {"nodes", nodes}};
}

}  // namespace

int exit_code_of(const NetworkReport &report) {
    return report.table && (!report.configure || report.configure->done) ? 0 : 1;
}

std::string network_text(const NetworkReport &report) {
    std::string text =
        fmt::format("In-band network of {}, scenario {}\n", report.node, report.scenario);
    if (report.configure) {
        text += configure_line(*report.configure);
    }
    if (!report.table) {
        return text + fmt::format("no usable table: {}\n", printable(report.trouble, false));
    }
    return text +
           fmt::format("made {}, {} s ago\n\n", iso_time(report.table->stamp_s * kMicros),
                       age_s(report)) +
           aligned(rows_of(*report.table));
}

std::string network_json(const NetworkReport &report) {
    const Json document = {{"node", report.node},
                           {"scenario", report.scenario},
                           {"configure", of_configure(report.configure)},
                           {"table", of_table(report)},
                           {"trouble", report.table ? Json() : Json(report.trouble)},
                           {"exit_code", exit_code_of(report)}};
    // Whatever bytes a mapping has, the document is UTF-8.
    return document.dump(2, ' ', false, Json::error_handler_t::replace) + "\n";
}

}  // namespace velkhost::cli

#include "host/scenario/network_reader.h"

#include <variant>

namespace velkhost::scenario {
namespace {

constexpr std::uint32_t kMostSeconds = 3600;
constexpr std::uint32_t kHighestAge = 365 * 86'400;

// The mapping has blanks between its fields.
std::string read_field(TableReader &in, const char *key) {
    const auto text = in.text(key);
    if (!text) {
        in.fail(key, "is missing");
    }
    if (text->empty() || text->find_first_of(" \t\r\n") != std::string::npos) {
        in.fail(key, "must be a text without blanks");
    }
    return *text;
}

NetworkNode read_node(TableReader in) {
    NetworkNode node{read_field(in, "device"), read_field(in, "hypervisor"),
                     read_field(in, "controller")};
    in.finish();
    return node;
}

std::optional<std::uint32_t> read_configure(TableReader &in,
                                            std::optional<std::uint32_t> otherwise) {
    const Node *node = in.any("configure");
    const auto *word = node == nullptr ? nullptr : std::get_if<std::string>(&node->value);
    if (word == nullptr) {
        const auto seconds = in.number("configure", 1, kMostSeconds);
        return seconds ? seconds : otherwise;
    }
    if (*word != "never") {
        in.fail("configure", "must be a whole number of seconds or \"never\"");
    }
    return std::nullopt;
}

}  // namespace

NetworkSettings read_network(TableReader in) {
    NetworkSettings out;
    assign(out.age_seconds, in.number("age", 0, kHighestAge));
    out.configure_seconds = read_configure(in, out.configure_seconds);
    if (auto tables = in.tables("node")) {
        for (TableReader &table : *tables) {
            out.nodes.push_back(read_node(std::move(table)));
        }
    }
    in.finish();
    return out;
}

}  // namespace velkhost::scenario

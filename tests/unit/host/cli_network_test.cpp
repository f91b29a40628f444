// How the network table is shown.
#include "host/cli/network_report.h"

#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

namespace velkhost::cli {
namespace {

constexpr std::int64_t kMade = 1'772'438'400;  // 2026-03-02T08:00:00Z

NetworkReport report() {
    return {.node = "host-1",
            .scenario = "s.toml",
            .configure = std::nullopt,
            .table = rig::NetworkTable{kMade,
                                       {{0, "/dev/ipmi0", "169.254.95.120", "169.254.95.118"},
                                        {1, "/dev/ipmi10", "10.0.0.1", "10.0.0.2"}}},
            .trouble = {},
            .now_us = (kMade + 75) * 1'000'000};
}

NetworkReport without_table() {
    NetworkReport out = report();
    out.table.reset();
    out.trouble = "GetNetTable :  nodeNumber 0";
    return out;
}

TEST(CliNetwork, TableIsAligned) {
    EXPECT_EQ(network_text(report()),
              "In-band network of host-1, scenario s.toml\n"
              "made 2026-03-02T08:00:00Z, 75 s ago\n"
              "\n"
              "node  device       hypervisor      controller\n"
              "0     /dev/ipmi0   169.254.95.120  169.254.95.118\n"
              "1     /dev/ipmi10  10.0.0.1        10.0.0.2\n");
    EXPECT_EQ(exit_code_of(report()), 0);
}

TEST(CliNetwork, WithoutATableItsReasonIsShown) {
    EXPECT_EQ(network_text(without_table()),
              "In-band network of host-1, scenario s.toml\n"
              "no usable table: GetNetTable :  nodeNumber 0\n");
    EXPECT_EQ(exit_code_of(without_table()), 1);
}

TEST(CliNetwork, ConfigurationIsToldFirst) {
    const auto line = [](const ConfigureReport &configure) {
        NetworkReport out = report();
        out.configure = configure;
        const std::string text = network_text(out);
        const auto begin = text.find('\n') + 1;
        return text.substr(begin, text.find('\n', begin) - begin);
    };
    EXPECT_EQ(line({true, 15'000'000}), "configured anew within 15 s");
    EXPECT_EQ(line({true, 0}), "not configured anew: the table is young enough");
    EXPECT_EQ(line({false, 130'000'000}), "not configured anew: nobody did so within 130 s");
}

TEST(CliNetwork, ConfigurationThatFailsIsAFailureDespiteTheTable) {
    NetworkReport out = report();
    out.configure = ConfigureReport{false, 130'000'000};
    EXPECT_EQ(exit_code_of(out), 1);
    out.configure->done = true;
    EXPECT_EQ(exit_code_of(out), 0);
}

TEST(CliNetwork, DocumentHasTheSame) {
    NetworkReport out = report();
    out.configure = ConfigureReport{true, 15'000'000};
    const auto document = nlohmann::json::parse(network_json(out));
    EXPECT_EQ(document["node"], "host-1");
    EXPECT_EQ(document["configure"]["done"], true);
    EXPECT_EQ(document["configure"]["needed"], true);
    EXPECT_EQ(document["configure"]["seconds"], 15.0);
    EXPECT_EQ(document["table"]["made"], "2026-03-02T08:00:00Z");
    EXPECT_EQ(document["table"]["age_seconds"], 75);
    ASSERT_EQ(document["table"]["nodes"].size(), 2U);
    EXPECT_EQ(document["table"]["nodes"][1]["number"], 1);
    EXPECT_EQ(document["table"]["nodes"][1]["device"], "/dev/ipmi10");
    EXPECT_EQ(document["table"]["nodes"][1]["hypervisor"], "10.0.0.1");
    EXPECT_EQ(document["table"]["nodes"][1]["controller"], "10.0.0.2");
    EXPECT_TRUE(document["trouble"].is_null());
    EXPECT_EQ(document["exit_code"], 0);
}

TEST(CliNetwork, DocumentWithoutATableSaysWhy) {
    const auto document = nlohmann::json::parse(network_json(without_table()));
    EXPECT_TRUE(document["table"].is_null());
    EXPECT_TRUE(document["configure"].is_null());
    EXPECT_EQ(document["trouble"], "GetNetTable :  nodeNumber 0");
    EXPECT_EQ(document["exit_code"], 1);
}

TEST(CliNetwork, BytesOfAMappingDoNoHarm) {
    NetworkReport out = report();
    out.table->nodes[0].device = "a\x1B[2J\xFF";
    EXPECT_EQ(network_text(out).find('\x1B'), std::string::npos);
    EXPECT_FALSE(nlohmann::json::parse(network_json(out), nullptr, false).is_discarded());
}

}  // namespace
}  // namespace velkhost::cli

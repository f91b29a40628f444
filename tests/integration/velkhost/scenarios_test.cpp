// Every shipped scenario with the example packages: how each package ends, how long it takes on the
// host's clock, what the job says and what the exit code is.
#include "tests/integration/velkhost/fixture.h"

#include <algorithm>
#include <ostream>
#include <set>
#include <string_view>

namespace velkhost::testing {
namespace {

constexpr int kNone = -1;

// Codes in the order of their lists: fpga, rxc2, uefi 1.50, uefi 1.60, rxc of node 2, diag, rxc.
constexpr const char *kFirmware = "firmware";
// Emulex FC, Emulex CNA, one of type 2, QLogic NIC, QLogic FC, Brocade, Broadcom, LSI.
constexpr const char *kAdapters = "adapters";
// Seven adapters, then rxc2, uefi 1.50, uefi 1.60, rxc of node 2, diag, rxc, fpga.
constexpr const char *kDefault = "default";
// RXC, the bundle, diag, the same bundle.
constexpr const char *kHypervisor = "hypervisor";
// 20 packages of every kind.
constexpr const char *kEverything = "everything";

struct Row {
    const char *scenario;
    const char *list;  // the request
    int exit_code;
    int job_state;  // CIM_ConcreteJob.JobState, kNone without a job
    double host_seconds;
    std::vector<int> codes;
};

// clang-format off
const std::vector<Row> kRows = {
    {"adapters-payload-list-lost", kAdapters, 1, 4, 80.8, {0, 0, 80, 57, 57, 0, 57, 55}},
    {"adapters-secure-mode",   kAdapters, 1,  7, 291.4, {50, 50, 80, 50, 50, 50, 50, 50}},
    {"adapters-services-fail", kAdapters, 1, 10, 201.4, {58, 55, 80, 54, 54, 57, 57, 55}},
    {"adapters-session-refused", kAdapters, 1, 7, 152.1, {50, 50, 80, 50, 50, 50, 50, 50}},
    {"broker-null-path",       kFirmware, 1,  7, 420, {50, 50, 50, 50, 50,  0, 50}},
    {"controller-ffdc",        kFirmware, 1,  7,  70, {50, 50, 53, 53, 50, 53, 50}},
    {"controller-lock-failed", kFirmware, 1, 10, 210, {53, 53, 53, 53, 53, 53, 53}},
    {"controller-no-ipmi",     kFirmware, 1, 10, 210, {53, 53, 53, 53, 53, 53, 53}},
    {"controller-no-ping",     kFirmware, 1, 10, 210, {53, 53, 53, 53, 53, 53, 53}},
    {"controller-unknown-text", kFirmware, 1, 10, 140, {57, 57, 57, 57, 57, 57, 57}},
    {"default",                kDefault,  1,  7, 841.4, {50, 50, 50, 50, 50, 50, 50, 50, 50, 50, 53, 50, 50, 50}},
    {"everything",             kEverything, 1, 7, 921.8, {50, 50, 50, 50, 50, 55, 80, 50, 50, 50, 50, 50, 53, 57, 12, 50, 50, 50, 50, 50}},
    {"hypervisor",             kHypervisor, 0, 7, 200, {50, 59, 50, 50}},
    {"hypervisor-fails",       kHypervisor, 1, 7, 170, {50, 57, 50, 56}},
    {"job-library-lost",       kFirmware, 3, kNone, 60, {}},
    {"job-library-recovers",   kFirmware, 0,  7, 514, {50, 50, 50, 50, 50, 50, 50}},
    {"no-job-reference",       kFirmware, 1, 10, 210, {57, 57, 57, 57, 57, 57, 57}},
    {"start-refused",          kFirmware, 1,  7, 430, {50, 50, 50, 50, 50, 56, 50}},
    {"status-file-unwritable", kFirmware, 0,  2, 490, {50, 50, 50, 50, 50, 50, 50}},
    {"status-lost",            kFirmware, 1, 10, 280, {57, 57, 57, 57, 57, 57, 57}},
    {"status-recovers",        kFirmware, 0,  7, 420, {50, 50, 50, 50, 50, 50, 50}},
    {"thread-failure",         kFirmware, 3, kNone, 1, {}},
    {"uri-not-accessible",     kFirmware, 1, 10,  70, {56, 56, 56, 56, 56, 56, 56}},
};
// clang-format on

class VelkhostScenario : public VelkhostTest, public ::testing::WithParamInterface<Row> {};

TEST_P(VelkhostScenario, EndsAsItSays) {
    const Row &row = GetParam();
    if (VELKHOST_READS_ARCHIVES == 0 && row.list != std::string_view(kFirmware)) {
        GTEST_SKIP() << "a host for an ABI without libzip cannot read these packages";
    }
    std::vector<std::string> arguments = {"--scenario",
                                          std::string(kScenarios) + row.scenario + ".toml"};
    const auto uris = example_request(row.list);
    arguments.insert(arguments.end(), uris.begin(), uris.end());
    const auto document = velkhost_json(arguments);

    EXPECT_EQ(document["exit_code"], row.exit_code);
    EXPECT_EQ(document["host_seconds"], row.host_seconds);
    EXPECT_EQ(document["findings"], nlohmann::json::array());
    EXPECT_EQ(document["unfired_faults"], nlohmann::json::array());
    if (row.job_state == kNone) {
        EXPECT_TRUE(document["job"].is_null());
        EXPECT_TRUE(document["packages"].empty());
        return;
    }
    EXPECT_EQ(document["job"]["id"], "VELK-1");
    EXPECT_EQ(document["job"]["state"], row.job_state);
    ASSERT_EQ(document["packages"].size(), row.codes.size());
    for (std::size_t i = 0; i < row.codes.size(); ++i) {
        EXPECT_EQ(document["packages"][i]["code"], row.codes[i]) << document["packages"][i];
    }
}

// How messages show a row.
void PrintTo(const Row &row, std::ostream *out) {
    *out << row.scenario;
}

std::string test_name(const ::testing::TestParamInfo<Row> &row) {
    std::string name = row.param.scenario;
    std::replace(name.begin(), name.end(), '-', '_');
    return name;
}

INSTANTIATE_TEST_SUITE_P(All, VelkhostScenario, ::testing::ValuesIn(kRows), test_name);

TEST(VelkhostScenarios, EveryShippedFileHasItsRow) {
    std::set<std::string> files;
    for (const auto &entry : std::filesystem::directory_iterator(VELK_SCENARIO_DIR)) {
        if (entry.path().extension() == ".toml") {
            files.insert(entry.path().stem());
        }
    }
    std::set<std::string> rows;
    for (const Row &row : kRows) {
        rows.insert(row.scenario);
    }
    EXPECT_EQ(files, rows);
}

}  // namespace
}  // namespace velkhost::testing

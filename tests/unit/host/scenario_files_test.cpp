// The scenario files that come with the project.
#include "host/scenario/reader.h"
#include "host/scenario/scenario.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <iterator>

namespace velkhost::scenario {
namespace {

namespace fs = std::filesystem;

std::vector<std::string> shipped_files() {
    std::vector<std::string> names;
    for (const fs::directory_entry &entry : fs::directory_iterator(VELK_SCENARIO_DIR)) {
        if (entry.path().extension() == ".toml") {
            names.push_back(entry.path().stem().string());
        }
    }
    std::ranges::sort(names);
    return names;
}

std::string path_of(const std::string &name) {
    return std::string(VELK_SCENARIO_DIR) + "/" + name + ".toml";
}

std::string text_of(const std::string &path) {
    std::ifstream file(path);
    return {std::istreambuf_iterator<char>(file), {}};
}

class ScenarioFiles : public ::testing::TestWithParam<std::string> {};

TEST_P(ScenarioFiles, Reads) {
    EXPECT_NO_THROW(read_description(path_of(GetParam())));
}

TEST_P(ScenarioFiles, BeginsWithWhatItShowsAndWhatTheOperatorSees) {
    const std::string text = text_of(path_of(GetParam()));
    EXPECT_TRUE(text.starts_with("# "));
    const std::string head = text.substr(0, text.find("\n\n"));
    EXPECT_THAT(head, ::testing::HasSubstr("The operator sees"));
}

TEST_P(ScenarioFiles, IsListedInTheReadme) {
    EXPECT_THAT(text_of(std::string(VELK_SCENARIO_DIR) + "/README.md"),
                ::testing::HasSubstr("`" + GetParam() + ".toml`"));
}

INSTANTIATE_TEST_SUITE_P(Shipped, ScenarioFiles, ::testing::ValuesIn(shipped_files()),
                         [](const auto &about) {
                             std::string name = about.param;
                             std::ranges::replace(name, '-', '_');
                             return name;
                         });

TEST(ScenarioFile, DefaultFailsTheSecondNodeAlone) {
    Scenario host(read_description(path_of("default")));
    const auto last_of = [&](const char *uri) {
        const ServiceAnswer answer = host.management_controller.next(uri);
        return answer.job ? answer.job->back().job_status : std::nullopt;
    };
    EXPECT_EQ(last_of("file:///zeb_fw_rxc_node2_r1ao58-3.10_anyos.upd"),
              "0x43|Unable to ping through RXC IP address");
    EXPECT_EQ(last_of("file:///zeb_fw_uefi_d7e148-1.60_anyos.upd"), "0x04|Process Completed");
    EXPECT_EQ(last_of("file:///zeb_fw_rxc_r1ao58-3.10_anyos.upd"), std::nullopt);
}

TEST(ScenarioFile, RuleWithoutAStrikeIsReported) {
    Scenario host(read_description(path_of("thread-failure")));
    EXPECT_EQ(host.faults.unfired().size(), 1U);
    host.faults.take("thread.create");
    EXPECT_EQ(host.faults.unfired().size(), 1U);
    host.faults.take("thread.create");
    EXPECT_TRUE(host.faults.unfired().empty());
}

TEST(ScenarioCurrent, IsTheOneThatWasSet) {
    auto mine = std::make_shared<Scenario>();
    Scenario::set_current(mine);
    EXPECT_EQ(Scenario::current(), mine);
    EXPECT_EQ(Scenario::current(), mine);
    Scenario::set_current(nullptr);
}

TEST(ScenarioCurrent, WithoutAFileIsTheBuiltInDefault) {
    if (fs::exists(kScenarioPath)) {
        GTEST_SKIP() << "this machine has " << kScenarioPath;
    }
    EXPECT_EQ(Scenario::current()->source, "built-in default");
}

}  // namespace
}  // namespace velkhost::scenario

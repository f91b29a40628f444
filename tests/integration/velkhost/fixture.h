// velkhost as a process, in a place of the test's own.
#pragma once

#include "tests/integration/velkhost/process.h"

#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

#include <filesystem>
#include <string>
#include <vector>

namespace velkhost::testing {

class VelkhostTest : public ::testing::Test {
  protected:
    void SetUp() override;
    void TearDown() override;

    // A file of that name and text in the test's place.
    std::filesystem::path write_file(const std::string &name, const std::string &text);

    // The location of an example package: "rxc" stands for the one that needs nothing.
    std::string package(const std::string &name = kRxc);

    // The example request.
    std::vector<std::string> example_request(const std::string &list);

    // A scenario whose controller never comes to an end.
    std::string endless_scenario();

    [[nodiscard]] std::vector<std::string> command(const std::vector<std::string> &arguments) const;
    [[nodiscard]] Process::Environment environment() const;

    // Runs `velkhost ARGUMENTS...` to its end, on pipes.
    Finished velkhost(const std::vector<std::string> &arguments);

    // Runs `velkhost install --json ARGUMENTS...`; the document, with the exit code checked.
    nlohmann::json velkhost_json(std::vector<std::string> arguments);

    // Folders of runs that are there.
    [[nodiscard]] std::vector<std::filesystem::path> run_folders() const;

    static constexpr const char *kRxc = "zeb_fw_rxc_r1ao58-3.10_anyos";
    static constexpr const char *kScenarios = VELK_SCENARIO_DIR "/";

    std::filesystem::path place_;

  private:
    std::filesystem::path packages();
};

}  // namespace velkhost::testing

// What run.sh does with a server: it is there for the request, and gone afterwards.
#include "tests/integration/transfers/transfers_fixture.h"

#include <gmock/gmock.h>

#include <csignal>

namespace velkhost::testing {
namespace {

using ::testing::HasSubstr;

class RemoteDemo : public TransferTest, public ::testing::WithParamInterface<const char *> {
  protected:
    // A script that has the server of that kind for as long as `body` runs.
    [[nodiscard]] std::vector<std::string> script(const std::string &body) const {
        const std::string text =
            "set -euo pipefail; source '" VELK_SOURCE_DIR "/scripts/remote_demo.sh'; serve_" +
            std::string(GetParam()) + " '" + kScenarios + "default.toml' '" + served_.string() +
            "'; echo \"server $server place $place\"; " + body;
        return {"/bin/bash", "-c", text};
    }

    // What the script said of its server is not there any more.
    static void expect_gone(const std::string &output) {
        const std::size_t server = output.find("server ");
        const std::size_t place = output.find(" place ");
        ASSERT_NE(place, std::string::npos) << output;
        const std::string process = output.substr(server + 7, place - server - 7);
        const std::string folder = output.substr(place + 7, output.find('\n', place) - place - 7);
        EXPECT_NE(kill(std::stoi(process), 0), 0) << process;
        EXPECT_FALSE(std::filesystem::exists(folder)) << folder;
    }
};

TEST_P(RemoteDemo, ServesARequestAndIsEndedAfterwards) {
    const Finished finished =
        Process::on_pipes(
            script("'" VELKHOST_PROGRAM "' install --discard --scenario \"$remote_scenario\" "
                   "\"$remote_base/" +
                   std::string(kRxc) + ".xml\""),
            environment())
            .wait();
    EXPECT_EQ(finished.exit_code, 0) << finished.out << finished.err;
    EXPECT_THAT(finished.out, HasSubstr("1 of 1 package installed"));
    EXPECT_THAT(finished.out, HasSubstr("Package download completed"));
    expect_gone(finished.out);
}

TEST_P(RemoteDemo, EndsItsServerWhenItIsEndedItself) {
    // Waits for what never comes.
    Process process =
        Process::on_pipes(script("exec 9<> <(:); read -r -t 60 -u 9 nothing"), environment());
    ASSERT_TRUE(process.read_until(" place "));
    ASSERT_TRUE(process.read_until("\n"));
    process.send_signal(SIGTERM);
    const Finished finished = process.wait();
    EXPECT_EQ(finished.exit_code, 128 + SIGTERM);
    expect_gone(finished.out);
}

INSTANTIATE_TEST_SUITE_P(Both, RemoteDemo, ::testing::Values("tftp", "sftp"),
                         [](const auto &about) { return std::string(about.param); });

}  // namespace
}  // namespace velkhost::testing

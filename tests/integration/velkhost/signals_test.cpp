// Ctrl-C and its like leave nothing behind, wherever they come.
#include "tests/integration/velkhost/fixture.h"

#include <gmock/gmock.h>
#include <unistd.h>

#include <csignal>

namespace velkhost::testing {
namespace {

using ::testing::HasSubstr;

class VelkhostSignals : public VelkhostTest {
  protected:
    Process endless(const std::vector<std::string> &more = {}) {
        std::vector<std::string> arguments = {"install",    "--limit",          "10000d",
                                              "--scenario", endless_scenario(), package()};
        arguments.insert(arguments.end(), more.begin(), more.end());
        return Process::on_pipes(command(arguments), environment());
    }
};

TEST_F(VelkhostSignals, InterruptEndsARunOnTheRealClock) {
    Process process = endless({"--clock", "real"});
    ASSERT_TRUE(process.read_until("velkhost: 1 package"));
    EXPECT_EQ(run_folders().size(), 1U);
    process.send_signal(SIGINT);
    EXPECT_EQ(process.wait().exit_code, 130);
    EXPECT_TRUE(run_folders().empty());
}

TEST_F(VelkhostSignals, InterruptEndsARunOnTheVirtualClock) {
    Process process = endless();
    ASSERT_TRUE(process.read_until("  62  "));
    process.send_signal(SIGINT);
    EXPECT_EQ(process.wait().exit_code, 130);
    EXPECT_TRUE(run_folders().empty());
}

TEST_F(VelkhostSignals, TermAndHangupHaveCodesOfTheirOwn) {
    for (const int signal : {SIGTERM, SIGHUP}) {
        Process process = endless();
        ASSERT_TRUE(process.read_until("  62  "));
        process.send_signal(signal);
        EXPECT_EQ(process.wait().exit_code, 128 + signal);
        EXPECT_TRUE(run_folders().empty());
    }
}

TEST_F(VelkhostSignals, SecondInterruptChangesNothing) {
    Process process = endless();
    ASSERT_TRUE(process.read_until("  62  "));
    for (int i = 0; i < 20; ++i) {
        process.send_signal(SIGINT);
        process.send_signal(SIGTERM);
    }
    EXPECT_THAT(process.wait().exit_code, ::testing::AnyOf(130, 143));
    EXPECT_TRUE(run_folders().empty());
}

TEST_F(VelkhostSignals, InterruptAtAnyMomentOfTheSetUpLeavesNoFolder) {
    // Before the command line is read, while the folder comes to be, and shortly after.
    for (useconds_t moment = 0; moment < 60'000; moment += 4'000) {
        Process process = endless();
        usleep(moment);
        process.send_signal(SIGINT);
        EXPECT_EQ(process.wait().exit_code, 130);
        EXPECT_TRUE(run_folders().empty()) << moment;
    }
}

TEST_F(VelkhostSignals, NamedRootStays) {
    const auto root = place_ / "root";
    Process process = endless({"--root", root.string()});
    ASSERT_TRUE(process.read_until("  62  "));
    process.send_signal(SIGINT);
    EXPECT_EQ(process.wait().exit_code, 130);
    EXPECT_TRUE(std::filesystem::exists(root / "tmp/velkdebug.txt"));
}

TEST_F(VelkhostSignals, ControlCOnTheTerminalGivesTheCursorBack) {
    Process process = Process::on_terminal(
        command({"install", "--limit", "10000d", "--scenario", endless_scenario(), package()}),
        environment());
    ASSERT_TRUE(process.read_until("  62  "));
    process.type("\x03");
    const Finished finished = process.wait();
    EXPECT_EQ(finished.exit_code, 130);
    EXPECT_TRUE(finished.out.ends_with("\x1b[?25h")) << finished.out;
    EXPECT_TRUE(run_folders().empty());
}

TEST_F(VelkhostSignals, ReaderThatHasGoneIsNoEnd) {
    Process process = Process::on_pipes(command({"install", package()}), environment());
    process.stop_reading();
    EXPECT_EQ(process.wait().exit_code, 0);
    EXPECT_TRUE(run_folders().empty()) << "nobody was told where it is";
}

}  // namespace
}  // namespace velkhost::testing

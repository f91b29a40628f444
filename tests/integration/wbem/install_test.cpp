// Installations that an ordinary WBEM client starts and follows.
#include "tests/integration/wbem/wbem_fixture.h"

#include <gmock/gmock.h>

#include <chrono>
#include <csignal>

namespace velkhost::testing {
namespace {

using ::testing::AllOf;
using ::testing::HasSubstr;
using ::testing::MatchesRegex;
using ::testing::StartsWith;

class WbemInstall : public WbemTest {
  protected:
    // Reads the property until it has the value; false when that takes too long.
    bool comes_to(const std::string &name, const std::string &value) {
        const auto deadline = std::chrono::steady_clock::now() + std::chrono::seconds(90);
        while (job_property("VELK-1", name) != value) {
            if (HasFailure() || std::chrono::steady_clock::now() > deadline) {
                return false;
            }
        }
        return true;
    }
    std::string job(const std::string &name) { return job_property("VELK-1", name); }
};

TEST_F(WbemInstall, JobIsFollowedToItsEnd) {
    serve();
    EXPECT_THAT(ask(install_call(package())), HasSubstr("InstallFromURI: 4096"));
    ASSERT_TRUE(comes_to("JobState", "7"));
    EXPECT_EQ(job("PercentComplete"), "100");
    EXPECT_EQ(job("JobStatus"),
              "\"1|" + std::string(kRxc) + ": 50: Package installation successfully.|\"");
    EXPECT_THAT(job("StartTime"), MatchesRegex("20260302080[0-9]+\\.[0-9]+[+]000"));
    EXPECT_THAT(job("ElapsedTime"), MatchesRegex("000000000[0-9]+\\.[0-9]+:000"));
}

TEST_F(WbemInstall, SecondRequestAfterTheEndHasAJobOfItsOwn) {
    serve();
    ask(install_call(package()));
    ASSERT_TRUE(comes_to("JobState", "7"));
    EXPECT_THAT(ask(install_call(package())), HasSubstr("InstanceID=\"VELK-2\""));
}

TEST_F(WbemInstall, WholeRequestReportsEveryPackage) {
    serve();
    std::string locations;
    for (const std::string &location : example_request("default")) {
        locations += (locations.empty() ? "" : "|") + location;
    }
    EXPECT_THAT(ask(install_call(locations)), HasSubstr("InstallFromURI: 4096"));
    // A single package that was installed is enough for the state; the text tells the rest.
    const auto deadline = std::chrono::steady_clock::now() + std::chrono::seconds(90);
    while (!job("JobStatus").starts_with("\"1|") && !HasFailure() &&
           std::chrono::steady_clock::now() < deadline) {
    }
    EXPECT_THAT(job("JobStatus"),
                AllOf(StartsWith("\"1|"), HasSubstr(": 50: "), HasSubstr(": 53: Unable to ping")));
}

class WbemEndlessInstall : public WbemInstall {
  protected:
    void SetUp() override {
        WbemInstall::SetUp();
        serve({"--scenario", endless_scenario(), "--grace", "0"});
        ask(install_call(package()));
    }
};

TEST_F(WbemEndlessInstall, JobIsReadableWhileItRuns) {
    ASSERT_TRUE(comes_to("JobState", "4"));
    EXPECT_THAT(job("JobStatus"), StartsWith("\"0|" + std::string(kRxc) + ": "));
    EXPECT_THAT(job("PercentComplete"), MatchesRegex("[0-9]+"));
    EXPECT_THAT(ask({"ei", place() + ":ZEB_ConcreteJob"}), HasSubstr(",JobState=4,"));
    const std::string before = job("ElapsedTime");
    EXPECT_GT(job("ElapsedTime"), before);
    EXPECT_EQ(stop().exit_code, 1);
}

TEST_F(WbemEndlessInstall, SecondCallerIsRefused) {
    EXPECT_EQ(complaint(install_call(package())),
              "(1) CIM_ERR_FAILED: An installation process is running");
    EXPECT_EQ(stop().exit_code, 1);
}

TEST_F(WbemEndlessInstall, EndMeanwhileIsToldAndLeavesNothing) {
    const Finished finished = stop(SIGTERM);
    EXPECT_EQ(finished.exit_code, 1);
    EXPECT_THAT(finished.out, HasSubstr("velkhost: ended while packages were being installed\n"));
    EXPECT_EQ(finished.err, "");
    EXPECT_TRUE(run_folders().empty());
}

TEST_F(WbemInstall, EndWaitsForAnInstallationWithinTheGrace) {
    serve({"--grace", "60"});
    ask(install_call(package()));
    const Finished finished = stop(SIGINT);
    EXPECT_EQ(finished.exit_code, 0);
    EXPECT_THAT(finished.out, HasSubstr("velkhost: ended after "));
}

TEST_F(WbemInstall, RealClockServesAndEndsInTheMiddle) {
    serve({"--clock", "real", "--grace", "0"});
    EXPECT_THAT(ask(install_call(package())), HasSubstr("InstallFromURI: 4096"));
    EXPECT_EQ(complaint(install_call(package())),
              "(1) CIM_ERR_FAILED: An installation process is running");
    EXPECT_THAT(job("StartTime"), ::testing::Not(StartsWith("20260302")));
    EXPECT_EQ(stop().exit_code, 1);
}

}  // namespace
}  // namespace velkhost::testing

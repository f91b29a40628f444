// The rig in a test program: several requests, several rigs, exact times, faults, a clean process.
#include "host/rig/rig.h"

#include "host/rig/shim_session.h"
#include "host/shim/velkshim.h"

#include <gmock/gmock.h>

#include <array>
#include <fstream>
#include <thread>

namespace velkhost::rig {
namespace {

namespace fs = std::filesystem;
using ::testing::HasSubstr;
using ::testing::IsEmpty;

constexpr std::chrono::hours kDay(24);
constexpr std::int64_t kSecond = 1'000'000;

// A place for packages, beside the run folder.
class RigRequests : public ::testing::Test {
  protected:
    // Writes a descriptor and its payload; its location.
    std::string package(const std::string &name) {
        const fs::path folder = packages_.path();
        std::ofstream(folder / (name + ".upd")) << "payload";
        std::ofstream(folder / (name + ".xml"))
            << "<INSTANCE>\n  <PROPERTY NAME=\"type\" TYPE=\"uint16\">\n    <VALUE>1</VALUE>\n"
               "  <PROPERTY NAME=\"category\" TYPE=\"string\">\n    <VALUE>RXC</VALUE>\n"
               "  <PROPERTY NAME=\"payload\" TYPE=\"string\">\n    <VALUE>" +
                   name +
                   ".upd</VALUE>\n"
                   "  <PROPERTY NAME=\"identificationCode\" TYPE=\"string\">\n    <VALUE>ZEB_" +
                   name + "</VALUE>\n</INSTANCE>\n";
        return "file://" + (folder / (name + ".xml")).string();
    }

    RunFolder packages_ = RunFolder::make_temporary();
};

RigOptions with_fault(const std::string &step, int code) {
    scenario::Description description;
    scenario::FaultRule rule;
    rule.step = step;
    rule.code = code;
    description.faults.push_back(rule);
    return {.description = description};
}

TEST_F(RigRequests, RequestRunsToItsEndAtExactTimes) {
    Rig rig({});
    const std::int64_t start = host_now_us();
    const InstallAnswer answer = rig.install({.uris = {package("a"), package("b")}});
    ASSERT_TRUE(answer.status.ok()) << answer.status.message;
    EXPECT_EQ(answer.return_value, 4096U);
    EXPECT_EQ(answer.job_id, "VELK-1");
    EXPECT_EQ(host_now_us() - start, 1 * kSecond);
    EXPECT_TRUE(rig.busy());
    ASSERT_TRUE(rig.wait_until_idle(kDay));
    EXPECT_EQ(rig.last_activity_us() - start, 140 * kSecond);
    for (const PackageStatus &result : rig.results()) {
        EXPECT_EQ(result.code, 50) << result.id << ": " << result.message;
    }
    for (const StatusEntry &entry : rig.history().entries()) {
        EXPECT_EQ((entry.time_us - start) % (10 * kSecond), 0);
    }
    EXPECT_EQ(rig.job("VELK-1")->state, 7);
    EXPECT_TRUE(rig.shut_down());
    EXPECT_THAT(rig.findings(), IsEmpty());
}

TEST_F(RigRequests, SecondRequestIsRefusedWhileTheFirstRunsAndTakenAfterwards) {
    Rig rig({});
    const std::string uri = package("a");
    ASSERT_TRUE(rig.install({.uris = {uri}}).status.ok());
    const auto before = rig.history().entries().size();
    const InstallAnswer second = rig.install({.uris = {uri}});
    EXPECT_EQ(second.status.code, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(second.status.message, "An installation process is running");
    EXPECT_EQ(rig.history().entries().size(), before) << "the history is the first request's";
    ASSERT_TRUE(rig.wait_until_idle(kDay));
    const InstallAnswer third = rig.install({.uris = {uri}});
    EXPECT_TRUE(third.status.ok()) << third.status.message;
    EXPECT_EQ(third.job_id, "VELK-2");
    ASSERT_TRUE(rig.wait_until_idle(kDay));
    EXPECT_EQ(rig.results()[0].code, 50);
}

TEST_F(RigRequests, ResultsAreCompleteWhereTheStatusLineIsCut) {
    std::vector<std::string> uris;
    for (int i = 0; i < 20; ++i) {
        uris.push_back(package("package_" + std::string(60, 'x') + std::to_string(100 + i)));
    }
    Rig rig({});
    rig.install({.uris = uris});
    ASSERT_TRUE(rig.wait_until_idle(kDay));
    EXPECT_TRUE(rig.history().entries().back().line.cut);
    const auto results = rig.results();
    ASSERT_EQ(results.size(), 20U);
    for (std::size_t i = 0; i < results.size(); ++i) {
        EXPECT_EQ(results[i].id, package_id(uris[i]));
        EXPECT_EQ(results[i].code, 50);
    }
}

TEST_F(RigRequests, ArgumentsArriveAsTheyWereGiven) {
    Rig rig({});
    const InstallAnswer answer = rig.install({.uris = {package("a")},
                                              .options = std::vector<std::uint16_t>{32768},
                                              .update_args = "--backup"});
    EXPECT_TRUE(answer.status.ok());
    EXPECT_FALSE(answer.return_value);
    EXPECT_FALSE(answer.job_id);
    EXPECT_FALSE(rig.busy());
    std::ifstream log(rig.folder().inside("/tmp/velkdebug.txt"));
    const std::string text{std::istreambuf_iterator<char>(log), {}};
    EXPECT_THAT(text, HasSubstr("UpdateArgs = --backup\n"));
}

TEST_F(RigRequests, FaultsStrikeLibcAndBrokerAlike) {
    {
        Rig rig(with_fault("open:/tmp/sfcb/velk.safelock", ENOSPC));
        rig.install({.uris = {package("a")}});
        ASSERT_TRUE(rig.wait_until_idle(kDay));
        EXPECT_FALSE(fs::exists(rig.folder().inside("/tmp/sfcb/velk.safelock")));
        EXPECT_THAT(rig.unfired_faults(), IsEmpty());
    }
    Rig rig(with_fault("broker.newObjectPath", CMPI_RC_ERR_FAILED));
    EXPECT_THAT(rig.unfired_faults(), ::testing::ElementsAre(HasSubstr("broker.newObjectPath")));
    const auto names = rig.broker().enumerate_instance_names(
        {{}, "velk/cimv2", "PAKRO_VMpkgInstallationService", {}});
    EXPECT_THAT(rig.unfired_faults(), IsEmpty());
}

TEST_F(RigRequests, RigAfterARigStartsAnew) {
    for (int i = 0; i < 3; ++i) {
        Rig rig({});
        EXPECT_EQ(rig.install({.uris = {package("a")}}).return_value, 4096U);
        ASSERT_TRUE(rig.wait_until_idle(kDay));
        EXPECT_EQ(rig.results()[0].code, 50);
        EXPECT_EQ(rig.history().changes().back().status.code, 50);
    }
}

TEST(Rig, LibraryIsTheOneThatIsShipped) {
    const Rig rig({});
    EXPECT_EQ(fs::canonical(rig.library_path()),
              fs::canonical(Parts::around_this_program().libraries / "libvelkprovider.so"));
}

TEST(Rig, SecondOneInTheProcessIsRefused) {
    const Rig rig({});
    EXPECT_THROW(Rig({}), RigError);
}

TEST(Rig, FailedSetUpLeavesThePlaceFree) {
    EXPECT_THROW(Rig({.scenario_file = "/no/such.toml"}), scenario::ScenarioError);
    EXPECT_THROW(Rig({.folder = "/proc/version"}), RigError);
    EXPECT_THROW(Rig({.parts = Parts{"/nowhere", {}, {}}}), RigError);
    const Rig rig({});
}

TEST(Rig, ProcessIsItsOwnAgainAfterwards) {
    fs::path folder;
    {
        const Rig rig({});
        folder = rig.folder().path();
        std::array<char, 4096> where{};
        EXPECT_EQ(velkshim_map("/tmp/sfcb/x", where.data(), where.size()), 1);
        EXPECT_EQ(where.data(), (folder / "tmp/sfcb/x").string());
        EXPECT_EQ(host_now_us(), 1772438400 * kSecond);
    }
    EXPECT_FALSE(fs::exists(folder));
    std::array<char, 4096> where{};
    EXPECT_EQ(velkshim_map("/tmp/sfcb/x", where.data(), where.size()), 0);
    EXPECT_NE(host_now_us(), 1772438400 * kSecond);
}

TEST(Rig, RealClockIsTheMachines) {
    const std::int64_t before = host_now_us();
    const Rig rig({.virtual_clock = false});
    EXPECT_GE(host_now_us(), before);
}

TEST(Rig, TimePassesOnlyWhileItsThreadWaits) {
    const Rig rig({});
    const std::int64_t start = host_now_us();
    std::thread sleeper([] { host_pause_us(100 * kSecond); });
    EXPECT_EQ(host_now_us(), start);
    sleeper.join();
    EXPECT_EQ(host_now_us(), start + 100 * kSecond);
}

TEST(Rig, UnknownJobIsNone) {
    Rig rig({});
    EXPECT_FALSE(rig.job("VELK-99"));
    EXPECT_FALSE(rig.job(""));
}

TEST(Rig, ShutDownTwiceIsOnce) {
    Rig rig({});
    EXPECT_TRUE(rig.shut_down());
    EXPECT_TRUE(rig.shut_down());
}

}  // namespace
}  // namespace velkhost::rig

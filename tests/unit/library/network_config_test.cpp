// Asking the host to re-configure its in-band network: when, for how long, and what is left.

#include "ipmi/network_config.h"

#include <algorithm>
#include <cerrno>
#include <thread>

#include <unistd.h>

#include "host/shim/wait_guard.h"
#include "tests/unit/library/network_fixture.h"

namespace {

namespace fs = std::filesystem;
using velktest::dated;
using velktest::kFlagFile;
using velktest::kTestBegin;

class NetworkConfig : public velktest::NetworkTest {
  protected:
    [[nodiscard]] fs::path flag() const { return at(kFlagFile); }

    // The lines of a request that nobody answers.
    [[nodiscard]] static std::string timed_out() {
        return dated("cfgnetwork :  need recfg") + dated("cfgnetwork :  timeout", 130);
    }

    [[nodiscard]] static std::string time_line(int stamp) {
        return dated("gettimestamp :  enter.") +
               dated("cfgnetwork :  time is " + std::to_string(kTestBegin) + "." +
                     std::to_string(stamp) + ".");
    }

    // The test's thread is one of those for which time passes.
    const velkhost::shim::TakePart part_;
};

// The host's component: takes the flag away some seconds after it was started.
class HostComponent {
  public:
    HostComponent(const fs::path &flag, unsigned seconds)
        : thread_([flag, seconds] {
              sleep(seconds);
              fs::remove(flag);
          }) {}
    ~HostComponent() { thread_.join(); }
    HostComponent(const HostComponent &) = delete;
    HostComponent &operator=(const HostComponent &) = delete;

  private:
    std::thread thread_;
};

}  // namespace

TEST_F(NetworkConfig, StampOf899SecondsNeedsNothing) {
    write_nodes(kTestBegin - 899, "");
    EXPECT_EQ(cfgnetwork(0), 0);
    EXPECT_EQ(log(), time_line(kTestBegin - 899));
    EXPECT_FALSE(fs::exists(flag()));
    EXPECT_TRUE(pauses().empty());
}

TEST_F(NetworkConfig, StampOf900SecondsIsTooOld) {
    write_nodes(kTestBegin - 900, "");
    EXPECT_EQ(cfgnetwork(0), -1);
    EXPECT_EQ(log(), time_line(kTestBegin - 900) + timed_out());
}

TEST_F(NetworkConfig, StampOfTheFutureNeedsNothing) {
    write_nodes(kTestBegin + 100, "");
    EXPECT_EQ(cfgnetwork(2), 0);
    EXPECT_TRUE(pauses().empty());
}

TEST_F(NetworkConfig, IsAskedForWithoutAStamp) {
    EXPECT_EQ(cfgnetwork(0), -1);
    EXPECT_EQ(log(), dated("gettimestamp :  enter.") + timed_out());
}

TEST_F(NetworkConfig, ForceNeverReadsTheStamp) {
    write_nodes(kTestBegin, "");
    EXPECT_EQ(cfgnetwork(1), -1);
    EXPECT_EQ(log(), timed_out());
}

TEST_F(NetworkConfig, TimeOutComesAfter130SecondsAndLeavesNoFlag) {
    EXPECT_EQ(cfgnetwork(1), -1);
    EXPECT_EQ(pauses(), std::vector<int>(26, 5));
    EXPECT_FALSE(fs::exists(flag()));
}

TEST_F(NetworkConfig, EndsAtTheFirstLookAfterTheFlagWasTaken) {
    const HostComponent component(flag(), 12);
    EXPECT_EQ(cfgnetwork(1), 0);
    EXPECT_EQ(log(), dated("cfgnetwork :  need recfg"));
    EXPECT_EQ(std::ranges::count(pauses(), 5), 3);
}

TEST_F(NetworkConfig, FlagTakenDuringTheLastPauseIsInTime) {
    const HostComponent component(flag(), 129);
    EXPECT_EQ(cfgnetwork(1), 0);
    EXPECT_EQ(log(), dated("cfgnetwork :  need recfg"));
}

TEST_F(NetworkConfig, FlagHoldsAZeroAndReplacesAnOlderOne) {
    velktest::write_file(flag(), "of an earlier request");
    fail_step("unlink:/tmp/networkflag", EPERM);
    EXPECT_EQ(cfgnetwork(1), -1);
    EXPECT_EQ(velktest::read_file(flag()), "0");
}

TEST_F(NetworkConfig, FailsWhereTheFlagCannotBePutUp) {
    fail_step("open:/tmp/networkflag", EACCES);
    EXPECT_EQ(cfgnetwork(1), -1);
    EXPECT_EQ(log(), dated("cfgnetwork :  need recfg"));
    EXPECT_TRUE(pauses().empty());
}

// The host's network component: the mapping at the begin, and what becomes of a flag.
#include "host/rig/network_component.h"

#include "host/rig/run_folder.h"
#include "host/rig/shim_session.h"
#include "host/rig/text_file.h"
#include "host/scenario/scenario.h"
#include "host/shim/velkshim.h"

#include <gtest/gtest.h>

#include <fstream>
#include <optional>

#include <fcntl.h>
#include <unistd.h>

namespace velkhost::rig {
namespace {

namespace fs = std::filesystem;

constexpr std::int64_t kSecond = 1'000'000;
constexpr std::int64_t kStart = 1'700'000'000;

class NetworkFlag : public ::testing::Test {
  protected:
    NetworkFlag() {
        description_.host.start_us = kStart * kSecond;
        description_.network.nodes = {{"/dev/ipmi0", "10.0.0.1", "10.0.0.2"},
                                      {"/dev/ipmi1", "10.0.1.1", "10.0.1.2"}};
        folder_.furnish(folder_.path(), "");
    }

    void begin() {
        scenario_.emplace(description_);
        session_.emplace(folder_.path(), *scenario_, true, history_);
    }

    void end() { session_.reset(); }

    static void raise_flag() {
        const int file = open("/tmp/networkflag", O_WRONLY | O_CREAT | O_TRUNC, 0600);
        ASSERT_GE(file, 0);
        ASSERT_EQ(write(file, "0", 1), 1);
        ASSERT_EQ(close(file), 0);
    }

    [[nodiscard]] bool flag_is_up() const { return fs::exists(folder_.inside("/tmp/networkflag")); }

    [[nodiscard]] std::string mapping() const {
        return read_text_file(folder_.inside("/etc/cim/zeb/nodemapping")).value_or("(none)");
    }

    // With the stamp so many seconds after the begin.
    static std::string mapping_of(std::int64_t seconds) {
        return "RXC IN-Band Network Mappings: " + std::to_string(kStart + seconds) +
               "\nLabel Node Device Netmask Hypervisor Controller\n"
               "node 0 /dev/ipmi0 255.255.0.0 10.0.0.1 10.0.0.2\n"
               "node 1 /dev/ipmi1 255.255.0.0 10.0.1.1 10.0.1.2\n";
    }

    scenario::Description description_;
    RunFolder folder_ = RunFolder::make_temporary();
    StatusHistory history_;
    std::optional<scenario::Scenario> scenario_;
    std::optional<ShimSession> session_;
};

TEST_F(NetworkFlag, MappingIsAsOldAsTheScenarioSays) {
    description_.network.age_seconds = 900;
    begin();
    EXPECT_EQ(mapping(), mapping_of(-900));
}

TEST_F(NetworkFlag, WithoutNodesThereIsNoMapping) {
    description_.network.nodes.clear();
    begin();
    raise_flag();
    host_pause_us(20 * kSecond);
    EXPECT_FALSE(flag_is_up());
    EXPECT_EQ(mapping(), "(none)");
}

TEST_F(NetworkFlag, MappingOfAnEarlierRunStays) {
    std::ofstream(folder_.inside("/etc/cim/zeb/nodemapping")) << "mine";
    begin();
    EXPECT_EQ(mapping(), "mine");
}

TEST_F(NetworkFlag, IsTakenWhenTheNetworkIsConfigured) {
    description_.network.age_seconds = 77;
    begin();
    raise_flag();
    host_pause_us(12 * kSecond - 1);
    EXPECT_TRUE(flag_is_up());
    EXPECT_EQ(mapping(), mapping_of(-77));
    host_pause_us(2);
    EXPECT_FALSE(flag_is_up());
    EXPECT_EQ(mapping(), mapping_of(12));
}

TEST_F(NetworkFlag, IsTakenEveryTime) {
    begin();
    for (int i = 1; i <= 3; ++i) {
        raise_flag();
        host_pause_us(13 * kSecond);
        EXPECT_FALSE(flag_is_up());
        EXPECT_EQ(mapping(), mapping_of(13 * i - 1));
    }
}

TEST_F(NetworkFlag, MayNeverBeTaken) {
    description_.network.configure_seconds.reset();
    begin();
    raise_flag();
    host_pause_us(24 * 3600 * kSecond);
    EXPECT_TRUE(flag_is_up());
    EXPECT_EQ(mapping(), mapping_of(0));
}

TEST_F(NetworkFlag, IsLeftWhenTheHostEndsBefore) {
    begin();
    raise_flag();
    host_pause_us(kSecond);
    end();
    EXPECT_TRUE(flag_is_up());
    EXPECT_EQ(mapping(), mapping_of(0));
}

TEST_F(NetworkFlag, TakenAwayMeanwhileTheMappingIsNewAllTheSame) {
    begin();
    raise_flag();
    ASSERT_EQ(unlink("/tmp/networkflag"), 0);
    host_pause_us(13 * kSecond);
    EXPECT_EQ(mapping(), mapping_of(12));
}

}  // namespace
}  // namespace velkhost::rig

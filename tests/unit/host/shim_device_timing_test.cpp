// What the driver does with a controller that is late, silent or gone, at the moments at which the
// kernel's driver does it.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tests/unit/host/shim_device_testing.h"

namespace velkhost::shim::test {
namespace {

using enum scenario::ControllerFault;
using bmc::test::rule;
using ::testing::ElementsAre;

scenario::FaultRule times(std::uint32_t count, scenario::FaultRule rule) {
    rule.count = count;
    return rule;
}

TEST_F(ShimDevice, AnswerWithinTheLimitIsTheOnlyOne) {
    attach({times(1, rule("bmc.type", kLate, 5))});
    const int fd = open_device();
    send(fd, 1, kOem, kTypeQuery);
    EXPECT_TRUE(is_readable(fd, 60'000));
    EXPECT_EQ(velkshim_now_us(), 5 * kSecond);
    EXPECT_THAT(request_times_ms(), ElementsAre(0));
    close(fd);
}

TEST_F(ShimDevice, LateRequestIsSentAgainWhenItsAnswerComes) {
    attach({times(1, rule("bmc.type", kLate, 7))});
    const int fd = open_device();
    send(fd, 1, kOem, kTypeQuery);
    EXPECT_FALSE(is_readable(fd, 5000));
    EXPECT_TRUE(is_readable(fd, 60'000));
    EXPECT_EQ(velkshim_now_us(), 7 * kSecond);
    EXPECT_THAT(request_times_ms(), ElementsAre(0, 7000));
    EXPECT_EQ(fetch(fd), "1: 3B C1 | 00 00 01");
    EXPECT_EQ(fetch(fd), "EAGAIN") << "the first answer is lost";
    close(fd);
}

TEST_F(ShimDevice, LateRequestIsSentAgainAndAgain) {
    attach({times(3, rule("bmc.type", kLate, 7))});
    const int fd = open_device();
    send(fd, 1, kOem, kTypeQuery);
    EXPECT_TRUE(is_readable(fd, 60'000));
    EXPECT_THAT(request_times_ms(), ElementsAre(0, 7000, 14'000, 21'000));
    close(fd);
}

TEST_F(ShimDevice, RequestAfterALateOneGetsTheOldAnswerFirst) {
    attach({times(1, rule("bmc.type", kLate, 7))});
    const int fd = open_device();
    send(fd, 1, kOem, kTypeQuery);
    EXPECT_FALSE(is_readable(fd, 5000));
    send(fd, 2, kApp, kGetDeviceId);
    EXPECT_TRUE(is_readable(fd, 5000));
    EXPECT_EQ(fetch(fd), "1: 3B C1 | 00 00 01");
    EXPECT_THAT(fetch(fd), ::testing::StartsWith("2: 07 01 | 00 20"));
    close(fd);
}

TEST_F(ShimDevice, FreshDescriptorDoesNotGetTheOldAnswer) {
    attach({times(1, rule("bmc.type", kLate, 7))});
    int fd = open_device();
    send(fd, 1, kOem, kTypeQuery);
    EXPECT_FALSE(is_readable(fd, 5000));
    close(fd);
    fd = open_device();
    send(fd, 2, kApp, kGetDeviceId);
    EXPECT_TRUE(is_readable(fd, 5000));
    EXPECT_EQ(velkshim_now_us(), 7 * kSecond) << "the interface was busy until then";
    EXPECT_THAT(fetch(fd), ::testing::StartsWith("2: 07 01 | 00 20"));
    EXPECT_THAT(request_times_ms(), ElementsAre(0, 7000, 7000)) << "the closed one's went again";
    close(fd);
}

TEST_F(ShimDevice, SilentRequestIsGivenUpAfterElevenTimeOuts) {
    attach({rule("bmc.type", kNoAnswer)});
    const int fd = open_device();
    send(fd, 1, kOem, kTypeQuery);
    EXPECT_FALSE(is_readable(fd, 55'054));
    EXPECT_EQ(fetch(fd), "EAGAIN");
    EXPECT_TRUE(is_readable(fd, 1));
    EXPECT_EQ(fetch(fd), "1: 3B C1 | FF");
    EXPECT_THAT(request_times_ms(), ElementsAre(0)) << "seen once";
    close(fd);
}

TEST_F(ShimDevice, SilentInterfaceTakesNoOtherRequest) {
    attach({rule("bmc.type", kNoAnswer)});
    const int fd = open_device();
    send(fd, 1, kOem, kTypeQuery);
    send(fd, 2, kApp, kGetDeviceId);
    EXPECT_TRUE(is_readable(fd, 60'000));
    EXPECT_EQ(fetch(fd), "1: 3B C1 | FF");
    EXPECT_TRUE(is_readable(fd, 60'000));
    EXPECT_EQ(velkshim_now_us(), 2 * 55'055'000);
    EXPECT_EQ(fetch(fd), "2: 07 01 | FF");
    EXPECT_THAT(request_times_ms(), ElementsAre(0));
    close(fd);
}

TEST_F(ShimDevice, InterfaceIsFreeAgainWhenAVeryLateAnswerComes) {
    attach({times(1, rule("bmc.type", kLate, 60))});
    const int fd = open_device();
    send(fd, 1, kOem, kTypeQuery);
    send(fd, 2, kApp, kGetDeviceId);
    EXPECT_TRUE(is_readable(fd, 60'000));
    EXPECT_EQ(fetch(fd), "1: 3B C1 | FF");
    EXPECT_TRUE(is_readable(fd, 60'000));
    EXPECT_EQ(velkshim_now_us(), 60 * kSecond);
    EXPECT_THAT(fetch(fd), ::testing::StartsWith("2: 07 01 | 00 20"));
    EXPECT_THAT(request_times_ms(), ElementsAre(0, 60'000));
    close(fd);
}

TEST_F(ShimDevice, GivesUpOnOneThatIsLateTooOften) {
    attach({rule("bmc.type", kLate, 7)});
    const int fd = open_device();
    send(fd, 1, kOem, kTypeQuery);
    EXPECT_TRUE(is_readable(fd, 600'000));
    EXPECT_EQ(fetch(fd), "1: 3B C1 | FF");
    EXPECT_EQ(request_times_ms().size(), 11U);
    EXPECT_EQ(velkshim_now_us(), 10 * 7 * kSecond + 5'005'000);
    close(fd);
}

TEST_F(ShimDevice, VanishedDeviceTakesNothingAndTellsNothing) {
    attach({rule("bmc.type", kVanish)});
    const int fd = open_device();
    EXPECT_EQ(send(fd, 1, kOem, kTypeQuery), 0) << "the request that it did not survive";
    EXPECT_EQ(send(fd, 2, kApp, kGetDeviceId), ENODEV);
    EXPECT_FALSE(is_readable(fd, 60'000));
    EXPECT_EQ(velkshim_now_us(), 60 * kSecond);
    EXPECT_EQ(fetch(fd), "EAGAIN");
    close(fd);
    EXPECT_EQ(open_device(), -1);
    EXPECT_EQ(errno, ENOENT);
}

TEST_F(ShimDevice, AnswersThatWereThereBeforeAVanishingCanBeFetched) {
    attach({rule("bmc.type", kVanish)});
    const int fd = open_device();
    send(fd, 1, kApp, kGetDeviceId);
    send(fd, 2, kOem, kTypeQuery);
    EXPECT_TRUE(is_readable(fd));
    EXPECT_THAT(fetch(fd), ::testing::StartsWith("1: 07 01 | 00"));
    EXPECT_EQ(fetch(fd), "EAGAIN");
    close(fd);
}

TEST_F(ShimDevice, AnotherControllerStartsOver) {
    attach({rule("bmc.type", kNoAnswer)});
    int fd = open_device();
    send(fd, 1, kOem, kTypeQuery);
    close(fd);
    attach();
    fd = open_device();
    send(fd, 2, kOem, kTypeQuery);
    EXPECT_EQ(fetch(fd), "2: 3B C1 | 00 00 01");
    close(fd);
}

}  // namespace
}  // namespace velkhost::shim::test

// Waiting for the IPMI device: poll in virtual time, alone and beside other descriptors.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <thread>

#include "host/shim/wait_guard.h"
#include "tests/unit/host/shim_device_testing.h"

namespace velkhost::shim::test {
namespace {

using enum scenario::ControllerFault;
using bmc::test::rule;

TEST_F(ShimDevice, PollSeesAQueuedAnswerAtOnce) {
    attach();
    const int fd = open_device();
    EXPECT_FALSE(is_readable(fd));
    send(fd, 1, kOem, kTypeQuery);
    pollfd set = {fd, POLLIN | POLLOUT, 0};
    EXPECT_EQ(poll(&set, 1, 5000), 1);
    EXPECT_EQ(set.revents, POLLIN) << "the device is never writable";
    EXPECT_EQ(velkshim_now_us(), 0);
    close(fd);
}

TEST_F(ShimDevice, PollTimesOutToTheMoment) {
    attach();
    const int fd = open_device();
    pollfd set = {fd, POLLIN, 0x7F};
    EXPECT_EQ(poll(&set, 1, 5000), 0);
    EXPECT_EQ(set.revents, 0);
    EXPECT_EQ(velkshim_now_us(), 5 * kSecond);
    close(fd);
}

TEST_F(ShimDevice, PollEndsWhenTheAnswerComes) {
    attach({rule("bmc.type", kLate, 3)});
    const int fd = open_device();
    send(fd, 1, kOem, kTypeQuery);
    EXPECT_TRUE(is_readable(fd, 5000));
    EXPECT_EQ(velkshim_now_us(), 3 * kSecond);
    close(fd);
}

TEST_F(ShimDevice, PollWithoutALimitWaitsAsLongAsItTakes) {
    attach({rule("bmc.type", kNoAnswer)});
    const int fd = open_device();
    send(fd, 1, kOem, kTypeQuery);
    EXPECT_TRUE(is_readable(fd, -1));
    EXPECT_EQ(velkshim_now_us(), 55'055'000);
    close(fd);
}

TEST_F(ShimDevice, PollIsNoPauseToObservers) {
    attach();
    int pauses = 0;
    velkshim_observe_pauses(
        [](void *count, std::int64_t, std::int64_t) { ++*static_cast<int *>(count); }, &pauses);
    const int fd = open_device();
    EXPECT_FALSE(is_readable(fd, 5000));
    velkshim_observe_pauses(nullptr, nullptr);
    EXPECT_EQ(pauses, 0);
    close(fd);
}

TEST_F(ShimDevice, PollServesOtherDescriptorsBesideIt) {
    attach();
    const int fd = open_device();
    std::array<int, 2> ends{};
    ASSERT_EQ(pipe(ends.data()), 0);
    std::array<pollfd, 3> set{pollfd{fd, POLLIN, 0}, pollfd{ends[0], POLLIN, 0},
                              pollfd{-1, POLLIN, 0x7F}};
    EXPECT_EQ(poll(set.data(), set.size(), 100), 0);
    EXPECT_EQ(velkshim_now_us(), 100'000);
    ASSERT_EQ(write(ends[1], "x", 1), 1);
    send(fd, 1, kOem, kTypeQuery);
    EXPECT_EQ(poll(set.data(), set.size(), 100), 2);
    EXPECT_NE(set[0].revents & POLLIN, 0);
    EXPECT_NE(set[1].revents & POLLIN, 0);
    for (const int number : {fd, ends[0], ends[1]}) {
        close(number);
    }
}

TEST_F(ShimDevice, PollTellsClosedDescriptorsBesideIt) {
    attach();
    const int fd = open_device();
    std::array<pollfd, 2> set{pollfd{fd, POLLIN, 0}, pollfd{999, POLLIN, 0}};
    EXPECT_EQ(poll(set.data(), set.size(), 5000), 1);
    EXPECT_EQ(set[1].revents, POLLNVAL);
    close(fd);
}

TEST_F(ShimDevice, PollSeesWhatAnotherThreadSends) {
    attach();
    const int fd = open_device();
    const TakePart waiting_in_time;
    std::thread sender([fd] {
        usleep(1'000'000);
        send(fd, 1, kOem, kTypeQuery);
    });
    EXPECT_TRUE(is_readable(fd, 5000));
    EXPECT_GE(velkshim_now_us(), kSecond);
    EXPECT_LE(velkshim_now_us(), kSecond + 10'000);
    sender.join();
    close(fd);
}

TEST_F(ShimDevice, PollWaitsInRealTimeUnderTheRealClock) {
    velkshim_use_real_clock();
    attach();
    const int fd = open_device();
    const std::int64_t start = velkshim_now_us();
    EXPECT_FALSE(is_readable(fd, 20));
    EXPECT_GE(velkshim_now_us() - start, 20'000);
    send(fd, 1, kOem, kTypeQuery);
    EXPECT_TRUE(is_readable(fd, 20));
    close(fd);
}

// Each with a descriptor of its own, as much at once as there is.
TEST_F(ShimDevice, ThreadsWithDescriptorsOfTheirOwnGetTheirOwnAnswers) {
    attach();
    const auto ask_often = [](unsigned char netfn, unsigned char cmd, const std::string &answer) {
        const int fd = open_device();
        for (int i = 0; i < 200; ++i) {
            ASSERT_EQ(send(fd, i, netfn, cmd), 0);
            ASSERT_TRUE(is_readable(fd, 5000));
            ASSERT_EQ(fetch(fd).substr(0, answer.size() + 2 + std::to_string(i).size()),
                      std::to_string(i) + ": " + answer);
        }
        close(fd);
    };
    std::thread other(ask_often, kApp, kGetDeviceId, "07 01");
    ask_often(kOem, kTypeQuery, "3B C1 | 00 00 01");
    const WaitGuard waiting;
    other.join();
}

}  // namespace
}  // namespace velkhost::shim::test

// The IPMI device of the shim, call by call: open and close, the control calls, copies.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tests/unit/host/shim_device_testing.h"

namespace velkhost::shim::test {
namespace {

using enum scenario::ControllerFault;
using bmc::test::rule;

const std::string kDeviceId = "07 01 | 00 20 01 05 01 02 00 00 00 00 00 00 00 00 00 00";
const std::string kType = "3B C1 | 00 00 01";

TEST_F(ShimDevice, IsNotThereWithoutAController) {
    EXPECT_EQ(open_device(), -1);
    EXPECT_EQ(errno, ENOENT);
}

TEST_F(ShimDevice, IsNotThereAnyMoreWhenTheControllerIsTaken) {
    attach();
    device_.reset();
    EXPECT_EQ(open_device(), -1);
    EXPECT_EQ(errno, ENOENT);
}

TEST_F(ShimDevice, FaultsOfTheStepComeFirst) {
    attach();
    velkshim_set_fault_hook([](void *, const char *) { return EACCES; }, nullptr);
    EXPECT_EQ(open_device(), -1);
    EXPECT_EQ(errno, EACCES);
    velkshim_set_fault_hook(nullptr, nullptr);
}

TEST_F(ShimDevice, OpensAsDescriptorsOfTheKernel) {
    attach();
    const int first = open_device();
    const int second = open("//dev/./ipmi0", O_RDWR | O_CLOEXEC);
    ASSERT_GE(first, 0);
    ASSERT_GT(second, first);
    EXPECT_EQ(fcntl(first, F_GETFD), 0);
    EXPECT_EQ(fcntl(second, F_GETFD), FD_CLOEXEC);
    EXPECT_EQ(close(first), 0);
    EXPECT_EQ(close(second), 0);
    EXPECT_EQ(close(second), -1);
    EXPECT_EQ(errno, EBADF);
}

TEST_F(ShimDevice, AnswersWithTheRequestsId) {
    attach();
    const int fd = open_device();
    EXPECT_EQ(send(fd, 22444, kOem, kTypeQuery), 0);
    EXPECT_EQ(send(fd, -1, kApp, kGetDeviceId), 0);
    EXPECT_EQ(fetch(fd), "22444: " + kType);
    EXPECT_EQ(fetch(fd), "-1: " + kDeviceId);
    close(fd);
}

TEST_F(ShimDevice, EmptyQueueIsTriedAgain) {
    attach();
    const int fd = open_device();
    EXPECT_EQ(fetch(fd), "EAGAIN");
    EXPECT_EQ(fetch(fd, 272, IPMICTL_RECEIVE_MSG), "EAGAIN");
    close(fd);
}

TEST_F(ShimDevice, HandsRequestsOnAsTheyAre) {
    attach();
    const int fd = open_device();
    send(fd, 1, kOem, 0xF0, {0x08, 0, 0, 5, 0x44, 0, 0, 0, 5});
    close(fd);
    const auto trace = controller_->trace();
    ASSERT_EQ(trace.size(), 1U);
    EXPECT_EQ(bmc::hex(trace[0].request.data), "08 00 00 05 44 00 00 00 05");
    EXPECT_EQ(trace[0].words, "begin 5 -> refused");
}

TEST_F(ShimDevice, CompletionCodeIsTheWholeAnswer) {
    attach();
    const int fd = open_device();
    send(fd, 1, kApp, 0x42);
    EXPECT_EQ(fetch(fd), "1: 07 42 | C1");
    close(fd);
}

TEST_F(ShimDevice, AnswersOfAnotherFunctionOrCommandAreReplaced) {
    attach({rule("bmc.type", kWrongFunction), rule("bmc.standard", kWrongCommand)});
    const int fd = open_device();
    send(fd, 1, kOem, kTypeQuery);
    send(fd, 2, kApp, kGetDeviceId);
    EXPECT_EQ(fetch(fd), "1: 3B C1 | FF");
    EXPECT_EQ(fetch(fd), "2: 07 01 | FF");
    close(fd);
}

TEST_F(ShimDevice, CutsAnswersOnlyWhereTheCallSaysSo) {
    attach();
    const int fd = open_device();
    send(fd, 1, kOem, kTypeQuery);
    EXPECT_EQ(fetch(fd, 2, IPMICTL_RECEIVE_MSG), "EMSGSIZE");
    EXPECT_EQ(fetch(fd, 2), "EMSGSIZE 1: 3B C1 | 00 00") << "it had stayed";
    EXPECT_EQ(fetch(fd), "EAGAIN") << "and is gone now";
    close(fd);
}

struct Length {
    int bytes;
    std::size_t received;
    unsigned char first;
};

class ShimDeviceLength : public ShimDevice, public ::testing::WithParamInterface<Length> {};

TEST_P(ShimDeviceLength, IsLimitedByTheInterface) {
    attach({rule("bmc.type", kLonger, GetParam().bytes)});
    const int fd = open_device();
    send(fd, 1, kOem, kTypeQuery);
    std::array<unsigned char, 40> address = {};
    std::array<unsigned char, 512> data = {};
    ipmi_recv answer = {};
    answer.addr = address.data();
    answer.addr_len = address.size();
    answer.msg.data = data.data();
    answer.msg.data_len = data.size();
    EXPECT_EQ(ioctl(fd, IPMICTL_RECEIVE_MSG_TRUNC, &answer), 0);
    EXPECT_EQ(answer.msg.data_len, GetParam().received);
    EXPECT_EQ(data[0], GetParam().first);
    close(fd);
}

INSTANTIATE_TEST_SUITE_P(Answers, ShimDeviceLength,
                         ::testing::Values(Length{269, 269, 0x00}, Length{270, 270, 0x00},
                                           Length{271, 270, 0xC6}, Length{272, 270, 0xC6},
                                           Length{4096, 270, 0xC6}));

// A request, well-formed but for what a test spoils.
struct Request {
    ipmi_system_interface_addr address = {IPMI_SYSTEM_INTERFACE_ADDR_TYPE, IPMI_BMC_CHANNEL, 0};
    ipmi_req request = {reinterpret_cast<unsigned char *>(&address),
                        sizeof address,
                        1,
                        {kApp, kGetDeviceId, 0, nullptr}};
};

int result_of(int fd, void *request) {
    return ioctl(fd, IPMICTL_SEND_COMMAND, request) == 0 ? 0 : errno;
}

TEST_F(ShimDevice, MalformedRequestsAreRefused) {
    attach();
    const int fd = open_device();
    const auto refused = [fd](auto spoil) {
        Request request;
        spoil(request);
        return result_of(fd, &request.request);
    };
    EXPECT_EQ(refused([](Request &) {}), 0);
    EXPECT_EQ(refused([](Request &r) { r.request.msg.netfn = 0x07; }), EINVAL);
    EXPECT_EQ(refused([](Request &r) { r.request.msg.netfn = 0x40; }), EINVAL);
    EXPECT_EQ(refused([](Request &r) { r.address.channel = 0x20; }), EINVAL);
    EXPECT_EQ(refused([](Request &r) { r.address.addr_type = IPMI_IPMB_ADDR_TYPE; }), EINVAL);
    EXPECT_EQ(refused([](Request &r) { r.address.lun = 4; }), EINVAL);
    EXPECT_EQ(refused([](Request &r) { r.request.addr_len = 4; }), EINVAL);
    EXPECT_EQ(refused([](Request &r) { r.request.addr_len = 400; }), EINVAL);
    EXPECT_EQ(refused([](Request &r) { r.request.addr = nullptr; }), EFAULT);
    EXPECT_EQ(result_of(fd, nullptr), EFAULT);
    EXPECT_EQ(controller_->trace().size(), 1U) << "the controller saw the first alone";
    close(fd);
}

TEST_F(ShimDevice, TooLongRequestsAreRefused) {
    attach();
    const int fd = open_device();
    EXPECT_EQ(send(fd, 1, kOem, 0xF0, std::vector<unsigned char>(270)), 0);
    EXPECT_EQ(send(fd, 1, kOem, 0xF0, std::vector<unsigned char>(271)), EMSGSIZE);
    close(fd);
}

TEST_F(ShimDevice, UnfitReceiversLoseNothing) {
    attach();
    const int fd = open_device();
    send(fd, 1, kOem, kTypeQuery);
    std::array<unsigned char, 40> address = {};
    ipmi_recv answer = {};
    answer.addr = address.data();
    answer.addr_len = 4;
    answer.msg.data_len = 272;
    EXPECT_EQ(ioctl(fd, IPMICTL_RECEIVE_MSG_TRUNC, &answer), -1);
    EXPECT_EQ(errno, EINVAL);
    answer.addr_len = address.size();
    EXPECT_EQ(ioctl(fd, IPMICTL_RECEIVE_MSG_TRUNC, &answer), -1) << "no buffer";
    EXPECT_EQ(errno, EFAULT);
    EXPECT_EQ(fetch(fd), "1: " + kType);
    close(fd);
}

TEST_F(ShimDevice, OtherControlCallsAreUnknown) {
    attach();
    const int fd = open_device();
    int value = 0;
    EXPECT_EQ(ioctl(fd, FIONREAD, &value), -1);
    EXPECT_EQ(errno, ENOTTY);
    close(fd);
}

TEST_F(ShimDevice, EachOpenHasAQueueOfItsOwn) {
    attach();
    const int first = open_device();
    const int second = open_device();
    send(first, 1, kOem, kTypeQuery);
    send(second, 2, kApp, kGetDeviceId);
    EXPECT_EQ(fetch(second), "2: " + kDeviceId);
    EXPECT_EQ(fetch(first), "1: " + kType);
    close(first);
    close(second);
}

TEST_F(ShimDevice, SharedDescriptorHandsAnswersToWhoeverComesFirst) {
    attach();
    const int fd = open_device();
    send(fd, 1, kOem, kTypeQuery);
    send(fd, 2, kApp, kGetDeviceId);
    EXPECT_EQ(fetch(fd), "1: " + kType) << "whoever sent 2 gets this";
    EXPECT_EQ(fetch(fd), "2: " + kDeviceId);
    close(fd);
}

TEST_F(ShimDevice, ClosingDropsTheQueue) {
    attach();
    int fd = open_device();
    send(fd, 1, kOem, kTypeQuery);
    close(fd);
    EXPECT_EQ(fetch(fd), "EBADF");
    fd = open_device();
    EXPECT_EQ(fetch(fd), "EAGAIN");
    close(fd);
}

TEST_F(ShimDevice, CopiesShareTheQueueUntilTheLastIsClosed) {
    attach();
    const int fd = open_device();
    const std::array<int, 5> copies = {dup(fd), dup2(fd, 100), dup3(fd, 101, O_CLOEXEC),
                                       fcntl(fd, F_DUPFD, 110), fcntl(fd, F_DUPFD_CLOEXEC, 120)};
    close(fd);
    for (const int copy : copies) {
        ASSERT_GE(copy, 0);
        send(copies.front(), copy, kOem, kTypeQuery);
        EXPECT_EQ(fetch(copy), std::to_string(copy) + ": " + kType);
    }
    for (const int copy : copies) {
        EXPECT_EQ(close(copy), 0);
        EXPECT_EQ(fetch(copy), "EBADF");
    }
}

TEST_F(ShimDevice, NumberTakenForAnotherFileIsNoDeviceAnyMore) {
    attach();
    const int fd = open_device();
    const int file = open("/dev/null", O_RDWR);
    ASSERT_EQ(dup2(file, fd), fd);
    EXPECT_EQ(fetch(fd), "ENOTTY") << "from the machine's own /dev/null";
    close(fd);
    close(file);
}

TEST_F(ShimDevice, OtherDescriptorsAreTheMachines) {
    attach();
    const int fd = open_device();
    std::array<int, 2> pipe_ends{};
    ASSERT_EQ(pipe(pipe_ends.data()), 0);
    ASSERT_EQ(write(pipe_ends[1], "abc", 3), 3);
    int waiting = 0;
    EXPECT_EQ(ioctl(pipe_ends[0], FIONREAD, &waiting), 0);
    EXPECT_EQ(waiting, 3);
    EXPECT_TRUE(is_readable(pipe_ends[0]));
    for (const int end : {pipe_ends[0], pipe_ends[1], fd}) {
        close(end);
    }
}

TEST_F(ShimDevice, ControlCallsLeaveErrnoAlone) {
    attach();
    const int fd = open_device();
    errno = EXDEV;
    send(fd, 1, kOem, kTypeQuery);
    EXPECT_EQ(errno, EXDEV);
    close(fd);
}

}  // namespace
}  // namespace velkhost::shim::test

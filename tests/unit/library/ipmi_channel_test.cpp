// The one channel of the process: its descriptor before, while and after it is open.
#include "ipmi/kcs_channel.h"

#include <array>

#include <fcntl.h>
#include <unistd.h>

#include "tests/unit/library/ipmi_calls.h"
#include "tests/unit/library/ipmi_fixture.h"

namespace velktest {
namespace {

// Taken before main, when nothing of the library has run.
const int kDescriptorAtLoad = kcs_fd;

class IpmiChannel : public IpmiTest {
  protected:
    static int ask(unsigned short *length) {
        static std::array<unsigned char, 128> answer;
        return send_IPMI_command(0xC1, nullptr, 0, answer.data(), length, 0x3A);
    }
};

TEST_F(IpmiChannel, IsClosedAtLoad) {
    EXPECT_EQ(kDescriptorAtLoad, -1);
}

TEST_F(IpmiChannel, EarlyDisconnectClosesNothing) {
    const std::size_t before = open_descriptors();
    disconnect_kcs();
    disconnect_kcs();
    EXPECT_EQ(open_descriptors(), before);
    EXPECT_GE(fcntl(STDIN_FILENO, F_GETFD), 0);
    EXPECT_EQ(kcs_fd, -1);
}

TEST_F(IpmiChannel, ConnectKeepsTheDescriptor) {
    attach();
    EXPECT_EQ(connect_kcs("/dev/ipmi0"), 0);
    EXPECT_GE(kcs_fd, 0);
    EXPECT_GE(fcntl(kcs_fd, F_GETFD), 0);
}

TEST_F(IpmiChannel, FailedConnectKeepsTheNegativeDescriptor) {
    kcs_fd = 1000;
    EXPECT_EQ(connect_kcs("/dev/ipmi0"), -2);
    EXPECT_EQ(kcs_fd, -1);
}

TEST_F(IpmiChannel, ConnectOpensWhatItIsTold) {
    attach();
    EXPECT_EQ(connect_kcs("/dev/ipmi1"), -2);
}

TEST_F(IpmiChannel, DisconnectClosesAndForgets) {
    attach();
    const std::size_t before = open_descriptors();
    ASSERT_EQ(connect_kcs("/dev/ipmi0"), 0);
    disconnect_kcs();
    EXPECT_EQ(kcs_fd, -1);
    EXPECT_EQ(open_descriptors(), before);
}

TEST_F(IpmiChannel, SecondConnectLeavesTheFirstDescriptorOpen) {
    attach();
    ASSERT_EQ(connect_kcs("/dev/ipmi0"), 0);
    const int first = kcs_fd;
    ASSERT_EQ(connect_kcs("/dev/ipmi0"), 0);
    EXPECT_NE(kcs_fd, first);
    EXPECT_EQ(close(first), 0);
}

TEST_F(IpmiChannel, SendOnAClosedChannelTouchesNoDevice) {
    attach();
    const IpmiCalls calls;
    unsigned short length = 128;
    EXPECT_EQ(ask(&length), -2);
    EXPECT_EQ(length, 128);
    EXPECT_TRUE(calls.sent.empty());
    EXPECT_EQ(elapsed_ms(), 0);
}

TEST_F(IpmiChannel, SendMapsSuccessAndFailure) {
    attach({fault("bmc.type", ControllerFault::kLate, 7, 1)});
    ASSERT_EQ(connect_kcs("/dev/ipmi0"), 0);
    unsigned short length = 128;
    EXPECT_EQ(ask(&length), -2);
    EXPECT_EQ(ask(&length), 0);
    EXPECT_EQ(length, 3);
}

TEST_F(IpmiChannel, NothingIsLogged) {
    attach();
    unsigned short length = 128;
    connect_kcs("/dev/ipmi0");
    ask(&length);
    disconnect_kcs();
    connect_kcs("/dev/none");
    EXPECT_EQ(log(), "");
}

}  // namespace
}  // namespace velktest

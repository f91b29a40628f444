// One request over the device, and its answer: the request that the driver gets, the wait, what is
// taken for an answer and what is not, and how much of it is copied.
#include "ipmi/ipmi.h"

#include <array>

#include "tests/unit/library/ipmi_calls.h"
#include "tests/unit/library/ipmi_fixture.h"

namespace velktest {
namespace {

using enum ControllerFault;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

constexpr unsigned char kOem = 0x3A;
constexpr unsigned char kTypeQuery = 0xC1;
constexpr unsigned char kUntouched = 0xEE;

class IpmiDeviceLayer : public IpmiTest {
  protected:
    ~IpmiDeviceLayer() override { disconnect_ipmi(fd_); }

    void open() { fd_ = connect_ipmi("/dev/ipmi0"); }

    // Asks for the controller's type, with room for `capacity` bytes.
    int ask(unsigned short capacity = 128) {
        answer_.fill(kUntouched);
        length_ = capacity;
        return send_kcs_IPMI_command(fd_, kTypeQuery, nullptr, 0, answer_.data(), &length_, kOem);
    }

    int fd_ = -1;
    std::array<unsigned char, 600> answer_{};
    unsigned short length_ = 0;
};

TEST_F(IpmiDeviceLayer, ConnectIsNegativeWithoutADevice) {
    EXPECT_LT(connect_ipmi("/dev/ipmi0"), 0);
}

TEST_F(IpmiDeviceLayer, DisconnectClosesTheDescriptor) {
    attach();
    const std::size_t before = open_descriptors();
    const int fd = connect_ipmi("/dev/ipmi0");
    ASSERT_GE(fd, 0);
    EXPECT_EQ(open_descriptors(), before + 1);
    disconnect_ipmi(fd);
    EXPECT_EQ(open_descriptors(), before);
}

TEST_F(IpmiDeviceLayer, DisconnectLeavesNegativeDescriptorsAlone) {
    const std::size_t before = open_descriptors();
    disconnect_ipmi(-1);
    disconnect_ipmi(-2);
    EXPECT_EQ(open_descriptors(), before);
}

TEST_F(IpmiDeviceLayer, NegativeDescriptorTouchesNoDevice) {
    attach();
    const IpmiCalls calls;
    fd_ = -1;
    EXPECT_EQ(ask(), -1);
    EXPECT_THAT(calls.sent, IsEmpty());
    EXPECT_EQ(elapsed_ms(), 0);
    EXPECT_EQ(length_, 128);
}

TEST_F(IpmiDeviceLayer, RequestIsAddressedToTheControllersInterface) {
    attach();
    open();
    const IpmiCalls calls;
    std::array<unsigned char, 3> data{1, 2, 3};
    length_ = 128;
    EXPECT_EQ(send_kcs_IPMI_command(fd_, 0x42, data.data(), 3, answer_.data(), &length_, 0x06), 0);
    ASSERT_EQ(calls.sent.size(), 1U);
    const SentRequest &sent = calls.sent[0];
    EXPECT_EQ(sent.address.addr_type, 12);
    EXPECT_EQ(sent.address.channel, 15);
    EXPECT_EQ(sent.address.lun, 0);
    EXPECT_EQ(sent.address_length, sizeof(ipmi_system_interface_addr));
    EXPECT_EQ(sent.id, 22444);
    EXPECT_EQ(sent.netfn, 0x06);
    EXPECT_EQ(sent.cmd, 0x42);
    EXPECT_THAT(sent.data, ElementsAre(1, 2, 3));
    EXPECT_EQ(calls.offered_address, 40U);
    EXPECT_EQ(calls.offered_data, 272U);
}

TEST_F(IpmiDeviceLayer, AnswerIsCopiedWithItsCompletionCode) {
    attach();
    open();
    EXPECT_EQ(ask(), 0);
    EXPECT_EQ(length_, 3);
    EXPECT_THAT(std::vector(answer_.begin(), answer_.begin() + 4),
                ElementsAre(0, 0, 1, kUntouched));
    EXPECT_EQ(elapsed_ms(), 0);
}

TEST_F(IpmiDeviceLayer, CompletionCodeIsAnAnswer) {
    attach({fault("bmc.type", kCompletionCode, 0xD4)});
    open();
    EXPECT_EQ(ask(), 0);
    EXPECT_EQ(length_, 1);
    EXPECT_EQ(answer_[0], 0xD4);
}

TEST_F(IpmiDeviceLayer, SilenceTakesFiveSeconds) {
    attach({fault("bmc.type", kNoAnswer)});
    open();
    EXPECT_EQ(ask(), -1);
    EXPECT_EQ(elapsed_ms(), 5000);
    EXPECT_EQ(length_, 128);
    EXPECT_EQ(answer_[0], kUntouched);
}

TEST_F(IpmiDeviceLayer, AnswerAfterFourSecondsIsInTime) {
    attach({fault("bmc.type", kLate, 4)});
    open();
    EXPECT_EQ(ask(), 0);
    EXPECT_EQ(elapsed_ms(), 4000);
}

TEST_F(IpmiDeviceLayer, AnswerAfterSixSecondsIsNot) {
    attach({fault("bmc.type", kLate, 6, 1)});
    open();
    EXPECT_EQ(ask(), -1);
    EXPECT_EQ(elapsed_ms(), 5000);
}

TEST_F(IpmiDeviceLayer, LateAnswerIsTakenForThatOfTheNextRequest) {
    attach({fault("bmc.type", kLate, 6, 1)});
    open();
    EXPECT_EQ(ask(), -1);
    EXPECT_EQ(ask(), 0) << "the message id is not compared";
    EXPECT_EQ(elapsed_ms(), 6000);
    EXPECT_EQ(exchanges().size(), 3U) << "the driver sent the first one again";
}

TEST_F(IpmiDeviceLayer, LateAnswerOfAnotherCommandFailsTheNextRequest) {
    attach({fault("bmc.type", kLate, 6, 1)});
    open();
    EXPECT_EQ(ask(), -1);
    length_ = 128;
    EXPECT_EQ(send_kcs_IPMI_command(fd_, 0x01, nullptr, 0, answer_.data(), &length_, 0x06), -1);
}

TEST_F(IpmiDeviceLayer, RefusedSubmitShowsAsATimeOut) {
    attach({fault("bmc.type", kVanish)});
    open();
    EXPECT_EQ(ask(), -1);
    EXPECT_EQ(elapsed_ms(), 5000);
    EXPECT_EQ(ask(), -1) << "the driver refuses this one";
    EXPECT_EQ(elapsed_ms(), 10'000);
}

TEST_F(IpmiDeviceLayer, ReceiveIsRepeatedUntilItWorks) {
    attach();
    open();
    IpmiCalls calls;
    calls.failing_receives = 1000;
    EXPECT_EQ(ask(), 0);
    EXPECT_EQ(length_, 3);
}

struct Oddity {
    const char *name;
    void (*change)(ipmi_recv &);
};

class IpmiOddAnswer : public IpmiDeviceLayer, public ::testing::WithParamInterface<Oddity> {};

TEST_P(IpmiOddAnswer, IsLikeNone) {
    attach();
    open();
    IpmiCalls calls;
    calls.change = GetParam().change;
    EXPECT_EQ(ask(), -1);
    EXPECT_EQ(answer_[0], kUntouched);
    EXPECT_EQ(length_, 128);
    EXPECT_EQ(elapsed_ms(), 0);
}

INSTANTIATE_TEST_SUITE_P(
    Each, IpmiOddAnswer,
    ::testing::Values(Oddity{"EventType", [](ipmi_recv &a) { a.recv_type = 2; }},
                      Oddity{"CommandType", [](ipmi_recv &a) { a.recv_type = 3; }},
                      Oddity{"RequestsFunction", [](ipmi_recv &a) { a.msg.netfn = 0x3A; }},
                      Oddity{"OtherFunction", [](ipmi_recv &a) { a.msg.netfn = 0x39; }},
                      Oddity{"OtherCommand", [](ipmi_recv &a) { a.msg.cmd = 0xC0; }}),
    [](const auto &about) { return std::string(about.param.name); });

TEST_F(IpmiDeviceLayer, OtherIdIsNoReasonToReject) {
    attach();
    open();
    IpmiCalls calls;
    calls.change = [](ipmi_recv &answer) { answer.msgid = 1; };
    EXPECT_EQ(ask(), 0);
}

TEST_F(IpmiDeviceLayer, AnswerIsCutToTheCallersRoom) {
    attach({fault("bmc.type", kLonger, 200)});
    open();
    EXPECT_EQ(ask(128), 0);
    EXPECT_EQ(length_, 128);
    EXPECT_EQ(answer_[127], 0);
    EXPECT_EQ(answer_[128], kUntouched);
}

TEST_F(IpmiDeviceLayer, CallersWithoutRoomGetNothing) {
    attach();
    open();
    EXPECT_EQ(ask(0), 0);
    EXPECT_EQ(length_, 0);
    EXPECT_EQ(answer_[0], kUntouched);
}

TEST_F(IpmiDeviceLayer, LongestAnswerFits) {
    attach({fault("bmc.type", kLonger, 270)});
    open();
    EXPECT_EQ(ask(600), 0);
    EXPECT_EQ(length_, 270);
    EXPECT_EQ(answer_[270], kUntouched);
}

TEST_F(IpmiDeviceLayer, LongerAnswersComeCutFromTheDriver) {
    attach({fault("bmc.type", kLonger, 300)});
    open();
    EXPECT_EQ(ask(600), 0);
    EXPECT_EQ(length_, 270);
    EXPECT_EQ(answer_[0], 0xC6);
}

TEST_F(IpmiDeviceLayer, LengthBeyondTheBufferIsNotBelieved) {
    attach();
    open();
    IpmiCalls calls;
    calls.change = [](ipmi_recv &answer) { answer.msg.data_len = 0xFFFF; };
    EXPECT_EQ(ask(600), 0);
    EXPECT_EQ(length_, 272);
    EXPECT_EQ(answer_[272], kUntouched);
}

TEST_F(IpmiDeviceLayer, WrongFunctionFromTheControllerIsTheDriversOwnAnswer) {
    attach({fault("bmc.type", kWrongFunction)});
    open();
    EXPECT_EQ(ask(), 0);
    EXPECT_EQ(length_, 1);
    EXPECT_EQ(answer_[0], 0xFF);
}

}  // namespace
}  // namespace velktest

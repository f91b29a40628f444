// The byte protocol with QEMU: frames, checksums, and what is sent when.
#include "host/bmc/qemu_link.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tests/unit/host/bmc_testing.h"

namespace velkhost::bmc::test {
namespace {

// The frames of a stream, as "message ..." or "hardware ...".
std::vector<std::string> frames_of(const Bytes &stream) {
    FrameReader reader;
    std::vector<std::string> out;
    for (const std::uint8_t byte : stream) {
        if (const auto frame = reader.take(byte)) {
            out.push_back((frame->kind == FrameKind::kMessage ? "message " : "hardware ") +
                          hex(frame->bytes));
        }
    }
    return out;
}

TEST(BmcFrames, EndBytesTellTheKind) {
    EXPECT_THAT(frames_of({1, 2, 0xA0, 3, 0xA1, 0xA1}),
                ::testing::ElementsAre("message 01 02", "hardware 03", "hardware "));
}

TEST(BmcFrames, EscapesAreUndone) {
    EXPECT_THAT(frames_of({0xAA, 0xB0, 0xAA, 0xB1, 0xAA, 0xBA, 0xA0}),
                ::testing::ElementsAre("message A0 A1 AA"));
}

TEST(BmcFrames, EscapesAreMade) {
    EXPECT_EQ(hex(hardware_frame({0xA0, 0xA1, 0xAA, 0x10})), "AA B0 AA B1 AA BA 10 A1");
}

TEST(BmcFrames, EndlessFramesAreDropped) {
    Bytes stream(5000, 1);
    stream.push_back(0xA0);
    stream.insert(stream.end(), {7, 0xA0});
    EXPECT_THAT(frames_of(stream), ::testing::ElementsAre("message 07"));
}

TEST(BmcFrames, MessagesSumUpToZero) {
    EXPECT_EQ(hex(message_frame(9, 2, {0x3B, 0xC1, {0, 0, 1}})), "09 EE C1 00 00 01 47 A0");
}

TEST(BmcFrames, RequestsAreRead) {
    const auto read = read_message({9, 0xEA, 0xF0, 1, 2, 0x1A});
    ASSERT_TRUE(read);
    EXPECT_EQ(read->sequence, 9);
    EXPECT_EQ(read->lun, 2);
    EXPECT_EQ(read->request.netfn, 0x3A);
    EXPECT_EQ(read->request.cmd, 0xF0);
    EXPECT_EQ(read->request.data, (Bytes{1, 2}));
}

TEST(BmcFrames, ShortAndDamagedMessagesAreNot) {
    EXPECT_FALSE(read_message({}));
    EXPECT_FALSE(read_message({0, 0, 0}));
    EXPECT_FALSE(read_message({9, 0xEA, 0xF0, 1, 2, 0x1B}));
}

// A link, with the type query as QEMU sends it.
class BmcLink : public ::testing::Test {
  protected:
    void use(std::vector<scenario::FaultRule> faults) {
        rules_.emplace(std::move(faults));
        controller_.emplace(Settings{}, rules_->source());
        link_.emplace(*controller_);
    }

    void query(std::int64_t now_us) {
        // A request is framed as a response is.
        link_->receive(message_frame(9, 0, {kOem, 0xC1, {}}), now_us);
    }

    std::vector<std::string> sent(std::int64_t now_us) {
        return frames_of(link_->take_due(now_us));
    }

    std::optional<Rules> rules_;
    std::optional<Controller> controller_;
    std::optional<QemuLink> link_;
};

TEST_F(BmcLink, AnswersTheGreeting) {
    use({});
    link_->receive(Bytes{0xFF, 0x01, 0xA1, 0x08, 0x3F, 0xA1, 0x07, 0xA1}, 0);
    EXPECT_THAT(sent(0), ::testing::ElementsAre("hardware FF 01", "hardware 05"));
}

TEST_F(BmcLink, AnswersARequest) {
    use({});
    query(0);
    EXPECT_EQ(link_->next_us(), 0);
    EXPECT_THAT(sent(0), ::testing::ElementsAre("message 09 EC C1 00 00 01 49"));
    EXPECT_FALSE(link_->next_us());
}

TEST_F(BmcLink, DropsDamagedRequests) {
    use({});
    link_->receive(Bytes{9, 0xE8, 0xC1, 0x00, 0xA0}, 0);
    EXPECT_THAT(sent(0), ::testing::IsEmpty());
    EXPECT_THAT(controller_->trace(), ::testing::IsEmpty());
}

TEST_F(BmcLink, SendsALateAnswerInItsTime) {
    use({rule("bmc.type", scenario::ControllerFault::kLate, 2)});
    query(1'000'000);
    EXPECT_THAT(sent(2'999'999), ::testing::IsEmpty());
    EXPECT_EQ(link_->next_us(), 3'000'000);
    EXPECT_THAT(sent(3'000'000), ::testing::SizeIs(1));
}

TEST_F(BmcLink, EndsQemusOwnWaitBeforeALongOne) {
    use({rule("bmc.type", scenario::ControllerFault::kLate, 7)});
    query(0);
    EXPECT_THAT(sent(0), ::testing::ElementsAre("message 08 00 00 00 F8")) << "of no request";
    EXPECT_THAT(sent(7'000'000), ::testing::ElementsAre("message 09 EC C1 00 00 01 49"));
}

TEST_F(BmcLink, IsSilentBeyondThat) {
    use({rule("bmc.type", scenario::ControllerFault::kNoAnswer)});
    query(0);
    EXPECT_THAT(sent(0), ::testing::ElementsAre("message 08 00 00 00 F8"));
    EXPECT_FALSE(link_->next_us());
}

}  // namespace
}  // namespace velkhost::bmc::test

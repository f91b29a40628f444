// The status query and the end of a session.
#include "ipmi/update_session.h"

#include "ipmi/ipmi.h"

#include "tests/unit/library/ipmi_fixture.h"

namespace velktest {
namespace {

using enum ControllerFault;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

constexpr std::string_view kStatusEnter = "SMM : get_flash_status enter .";
constexpr std::string_view kStatusDone = "Query smm status successfully!";
constexpr std::string_view kConnectFailed = "smm : get_flash_status , connect_kcs failed";
constexpr std::string_view kEndEnter = "SMM : smm_disconnect enter .";
constexpr std::string_view kEndDone = "smm : smm_disconnect successfully.";
constexpr std::string_view kCancelled = "cancel_ipmi_transaction successfully.";
constexpr std::string_view kClosed = "close_ipmi_transaction successfully.";
constexpr std::string_view kDestroyed = "destroy_ipmi_transaction successfully.";

// A session under way, with the log and the pauses of its start left out.
class IpmiStatus : public IpmiTest {
  protected:
    void begin(std::vector<FaultRule> faults = {}, velkhost::bmc::Settings settings = {}) {
        attach(std::move(faults), std::move(settings));
        start_update_option_firmware(&handle_);
        disconnect_kcs();
        clear_log();
        start_ms_ = elapsed_ms();
        asked_before_ = exchanges().size();
        paused_before_ = pauses_ms().size();
    }

    // Since the session was begun.
    [[nodiscard]] std::vector<std::string> asked() const {
        auto all = exchanges();
        all.erase(all.begin(), all.begin() + static_cast<std::ptrdiff_t>(asked_before_));
        return all;
    }
    [[nodiscard]] std::vector<int> paused() const {
        auto all = pauses_ms();
        all.erase(all.begin(), all.begin() + static_cast<std::ptrdiff_t>(paused_before_));
        return all;
    }
    [[nodiscard]] int taken_ms() const { return elapsed_ms() - start_ms_; }

    int handle_ = -1;

  private:
    int start_ms_ = 0;
    std::size_t asked_before_ = 0;
    std::size_t paused_before_ = 0;
};

// ---- Status ----

TEST_F(IpmiStatus, AsksForTypeAndStatus) {
    begin();
    EXPECT_EQ(get_flash_status(handle_), 0);
    EXPECT_THAT(asked(), ElementsAre("type query -> second generation", "status 1 -> done"));
    EXPECT_EQ(requests().back(), "3A F0 | 09 00 00 05 44 00 00 00 01");
    EXPECT_FALSE(channel_is_open());
    EXPECT_EQ(log(), dated({kStatusEnter, kStatusDone}));
    EXPECT_THAT(paused(), IsEmpty());
}

TEST_F(IpmiStatus, FailsWithoutADevice) {
    EXPECT_EQ(get_flash_status(1), -2);
    EXPECT_EQ(log(), dated({kStatusEnter, kConnectFailed}));
    EXPECT_FALSE(channel_is_open());
}

TEST_F(IpmiStatus, AsksNothingWithoutAHandle) {
    begin();
    EXPECT_EQ(get_flash_status(-1), 0);
    EXPECT_THAT(asked(), ElementsAre("type query -> second generation"));
    EXPECT_FALSE(channel_is_open());
    EXPECT_EQ(log(), dated(kStatusEnter));
}

TEST_F(IpmiStatus, AsksNothingOfOtherControllers) {
    for (const Generation generation : {Generation::kNone, Generation::kFirst}) {
        begin({}, {.generation = generation});
        EXPECT_EQ(get_flash_status(5), 0);
        EXPECT_THAT(asked(), ::testing::SizeIs(1));
        EXPECT_FALSE(channel_is_open());
    }
}

TEST_F(IpmiStatus, ReturnsTheTypeQuerysFailure) {
    begin();
    attach({fault("bmc.type", kCompletionCode, 0xC1)});
    EXPECT_EQ(get_flash_status(1), -1);
    EXPECT_FALSE(channel_is_open());
    EXPECT_EQ(log(), dated(kStatusEnter));
}

TEST_F(IpmiStatus, SilenceClosesTheChannel) {
    begin({fault("bmc.status", kNoAnswer)});
    EXPECT_EQ(get_flash_status(handle_), -2);
    EXPECT_FALSE(channel_is_open());
    EXPECT_EQ(taken_ms(), 5000);
    EXPECT_EQ(log(), dated(kStatusEnter));
}

TEST_F(IpmiStatus, CompletionCodeClosesTheChannelAndCountsAsDone) {
    begin({fault("bmc.status", kCompletionCode, 0xC0)});
    EXPECT_EQ(get_flash_status(handle_), 0);
    EXPECT_FALSE(channel_is_open());
    EXPECT_EQ(log(), dated(kStatusEnter));
}

TEST_F(IpmiStatus, RefusalLeavesTheChannelOpen) {
    begin({fault("bmc.status", kRefuse)});
    EXPECT_EQ(get_flash_status(handle_), -2);
    EXPECT_TRUE(channel_is_open());
    EXPECT_EQ(log(), dated(kStatusEnter));
}

TEST_F(IpmiStatus, EachRefusalLeavesADescriptorBehind) {
    begin({fault("bmc.status", kRefuse)});
    const std::size_t before = open_descriptors();
    std::vector<int> left;
    for (int i = 0; i < 3; ++i) {
        get_flash_status(handle_);
        left.push_back(kcs_fd);
    }
    EXPECT_EQ(open_descriptors(), before + 3);
    disconnect_ipmi(left[0]);
    disconnect_ipmi(left[1]);
}

// ---- End ----

TEST_F(IpmiStatus, EndCancelsClosesAndDestroys) {
    begin();
    smm_disconnect(&handle_);
    EXPECT_EQ(handle_, -1);
    EXPECT_THAT(asked(), ElementsAre("cancel 1 -> done", "close 1 -> done", "destroy 1 -> done"));
    EXPECT_THAT(paused(), ElementsAre(10'000, 10'000));
    EXPECT_FALSE(channel_is_open());
    EXPECT_EQ(log(), dated({kEndEnter, kCancelled}) + dated(kClosed, 10) +
                         dated({kDestroyed, kEndDone}, 20));
}

TEST_F(IpmiStatus, EndPausesLongerAfterAFailedStep) {
    begin({fault("bmc.cancel", kRefuse)});
    smm_disconnect(&handle_);
    EXPECT_EQ(handle_, -1);
    EXPECT_THAT(paused(), ElementsAre(10'000, 60'000, 10'000, 60'000))
        << "the controller closes nothing that was not cancelled";
    EXPECT_EQ(log(), dated(kEndEnter) + dated({kDestroyed, kEndDone}, 140));
}

TEST_F(IpmiStatus, EndPausesLongerAfterAFailedCloseAlone) {
    begin({fault("bmc.close", kRefuse)});
    smm_disconnect(&handle_);
    EXPECT_THAT(paused(), ElementsAre(10'000, 10'000, 60'000));
    EXPECT_EQ(log(), dated({kEndEnter, kCancelled}) + dated({kDestroyed, kEndDone}, 80));
}

TEST_F(IpmiStatus, EndTakesCompletionCodesForSuccess) {
    begin({fault("bmc.*", kCompletionCode, 0xC0)});
    handle_ = 1;
    smm_disconnect(&handle_);
    EXPECT_THAT(paused(), ElementsAre(10'000, 10'000));
    EXPECT_EQ(handle_, 1) << "and destroys nothing";
    EXPECT_EQ(log(), dated(kEndEnter) + dated(kEndDone, 20));
}

TEST_F(IpmiStatus, EndWithoutAHandleSendsNothingButPauses) {
    begin();
    int none = -1;
    smm_disconnect(&none);
    EXPECT_THAT(asked(), IsEmpty());
    EXPECT_THAT(paused(), ElementsAre(10'000, 60'000, 10'000, 60'000));
    EXPECT_EQ(log(), dated(kEndEnter) + dated(kEndDone, 140));
}

TEST_F(IpmiStatus, EndStopsWithoutADevice) {
    handle_ = 1;
    smm_disconnect(&handle_);
    EXPECT_EQ(handle_, 1);
    EXPECT_THAT(paused(), IsEmpty());
    EXPECT_EQ(log(), dated({kEndEnter, kConnectFailed}));
}

TEST_F(IpmiStatus, EndKeepsTheHandleWhenTheDestroyIsRefused) {
    begin({fault("bmc.destroy", kRefuse)});
    smm_disconnect(&handle_);
    EXPECT_EQ(handle_, 1);
    EXPECT_FALSE(channel_is_open());
    EXPECT_EQ(log(), dated({kEndEnter, kCancelled}) + dated(kClosed, 10) + dated(kEndDone, 20));
}

TEST_F(IpmiStatus, LateCancelAnswersTheClose) {
    begin({fault("bmc.cancel", kLate, 12, 1)});
    smm_disconnect(&handle_);
    // The driver sends the late cancel again, and that is refused; the close takes this for its own
    // answer, and the destroy the close's.
    EXPECT_THAT(asked(), ElementsAre("cancel 1 -> done, 12 s late", "cancel 1 -> refused",
                                     "close 1 -> done", "destroy 1 -> done"));
    EXPECT_EQ(handle_, -1);
    EXPECT_EQ(log(), dated(kEndEnter) + dated({kDestroyed, kEndDone}, 145));
}

}  // namespace
}  // namespace velktest

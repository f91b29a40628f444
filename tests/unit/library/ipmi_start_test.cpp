// The start of an update session: whole, and failing at each of its steps, with every line of the
// log, every pause and what is left of the channel.
#include <memory>

#include "ipmi/update_session.h"
#include "tests/unit/library/ipmi_fixture.h"

namespace velktest {
namespace {

using enum ControllerFault;
using ::testing::ElementsAre;
using ::testing::IsEmpty;
using Lines = std::vector<std::string_view>;

constexpr std::string_view kEnter = "SMM : start_update_option_firmware enter .";
constexpr std::string_view kConnectFailed =
    "smm : start_update_option_firmware , connect_kcs failed";
constexpr std::string_view kTypeFailed = "smm : start_update_option_firmware , get_bmc_type failed";
constexpr std::string_view kNotSupported =
    "smm : start_update_option_firmware , not support BMC type";
constexpr std::string_view kFirst = "smm : start_update_option_firmware , BMC  type is RXCv1";
constexpr std::string_view kFirstRefused = "rxc v1 is not supported to smm";
constexpr std::string_view kSecond = "smm : start_update_option_firmware , BMC  type is RXCv2";
constexpr std::string_view kModeRead = "smm : rxc_flash secure mode.\n";
constexpr std::string_view kModeFailed =
    "smm : start_update_option_firmware , get_secure_mode failed";
constexpr std::string_view kSecure =
    "smm : start_update_option_firmware get_secure_mode  SecureMode ";
constexpr std::string_view kNotSecure =
    "smm : start_update_option_firmware get_secure_mode  No SecureMode ";
constexpr std::string_view kLoop = "smm : start_update_option_firmware , loop 0 ";
constexpr std::string_view kLoopIp = "smm : start_update_option_firmware , loop1  ip optfw ";
constexpr std::string_view kCreateRefused = "smm : create_ipmi_transaction failed";
constexpr std::string_view kCreateFailed =
    "smm : start_update_option_firmware , create_ipmi_transaction failed";
constexpr std::string_view kOpenFailed =
    "smm : start_update_option_firmware , open_ipmi_transaction failed";
constexpr std::string_view kDestroyed = "destroy_ipmi_transaction successfully.";
constexpr std::string_view kBegun =
    "smm : start_update_option_firmware , begin_opt_update successfully.";

// What is logged up to the creation of the transaction.
const Lines kWayToCreate = {kEnter, kSecond, kModeRead, kNotSecure, kLoop, kLoopIp};

Lines with(Lines lines, const Lines &more) {
    lines.insert(lines.end(), more.begin(), more.end());
    return lines;
}

class IpmiStart : public IpmiTest {
  protected:
    int start() { return start_update_option_firmware(&handle_); }

    int handle_ = -1;
};

TEST_F(IpmiStart, BeginsAnUpdate) {
    attach();
    EXPECT_EQ(start(), 0);
    EXPECT_EQ(handle_, 1);
    EXPECT_TRUE(channel_is_open());
    EXPECT_THAT(
        exchanges(),
        ElementsAre("type query -> second generation", "variable secure_mode -> \"no\"",
                    "create XFLASH -> handle 1", "open 1 optfw 128 -> done", "begin 1 -> done"));
    EXPECT_THAT(pauses_ms(), ElementsAre(100, 100));
    EXPECT_EQ(log(), dated(with(kWayToCreate, {kBegun})));
}

TEST_F(IpmiStart, OpensNothingInSecureMode) {
    attach({}, {.secure_mode = "It says YES."});
    EXPECT_EQ(start(), 0);
    EXPECT_THAT(exchanges(), ElementsAre("type query -> second generation",
                                         "variable secure_mode -> \"It says YES.\"",
                                         "create XFLASH -> handle 1", "begin 1 -> done"));
    EXPECT_THAT(pauses_ms(), ElementsAre(100, 100));
    EXPECT_TRUE(channel_is_open());
    EXPECT_EQ(log(), dated({kEnter, kSecond, kModeRead, kSecure, kLoop, kLoopIp, kBegun}));
}

TEST_F(IpmiStart, FailsWithoutADevice) {
    EXPECT_EQ(start(), -2);
    EXPECT_FALSE(channel_is_open());
    EXPECT_EQ(log(), dated({kEnter, kConnectFailed}));
    EXPECT_THAT(pauses_ms(), IsEmpty());
}

TEST_F(IpmiStart, FailsWithoutAType) {
    attach({fault("bmc.type", kCompletionCode, 0xC1)});
    EXPECT_EQ(start(), -1);
    EXPECT_FALSE(channel_is_open());
    EXPECT_EQ(log(), dated({kEnter, kTypeFailed}));
    EXPECT_THAT(pauses_ms(), IsEmpty());
}

TEST_F(IpmiStart, FailsAtASilentController) {
    attach({fault("bmc.type", kNoAnswer)});
    EXPECT_EQ(start(), -1);
    EXPECT_FALSE(channel_is_open());
    EXPECT_EQ(log(), dated(kEnter) + dated(kTypeFailed, 5));
}

TEST_F(IpmiStart, NeedsNoSessionWithAControllerThatKnowsNone) {
    attach({}, {.generation = Generation::kNone});
    EXPECT_EQ(start(), 0);
    EXPECT_EQ(handle_, -1);
    EXPECT_FALSE(channel_is_open());
    EXPECT_EQ(log(), dated({kEnter, kNotSupported}));
    EXPECT_THAT(exchanges(), ElementsAre("type query -> no sessions"));
}

TEST_F(IpmiStart, FailsAtTheFirstGeneration) {
    attach({}, {.generation = Generation::kFirst});
    EXPECT_EQ(start(), -1);
    EXPECT_EQ(handle_, -1);
    EXPECT_FALSE(channel_is_open());
    EXPECT_EQ(log(), dated({kEnter, kFirst, kFirstRefused}));
    EXPECT_THAT(exchanges(), ElementsAre("type query -> first generation"));
}

TEST_F(IpmiStart, FailsWhenTheSecureModeIsRefused) {
    attach({fault("bmc.variable", kRefuse)});
    EXPECT_EQ(start(), -12);
    EXPECT_FALSE(channel_is_open());
    EXPECT_EQ(log(), dated({kEnter, kSecond, "SMM :smm_ipmi_error", kModeFailed}));
    EXPECT_THAT(pauses_ms(), IsEmpty());
}

TEST_F(IpmiStart, FailsWhenTheSecureModeIsNotAnswered) {
    attach({fault("bmc.variable", kNoAnswer)});
    EXPECT_EQ(start(), -12);
    EXPECT_FALSE(channel_is_open());
    EXPECT_EQ(log(), dated({kEnter, kSecond}) + dated(kModeFailed, 5));
}

TEST_F(IpmiStart, CompletionCodeOfTheSecureModeMeansNone) {
    attach({fault("bmc.variable", kCompletionCode, 0xCC)});
    EXPECT_EQ(start(), 0);
    EXPECT_EQ(log(), dated({kEnter, kSecond, kNotSecure, kLoop, kLoopIp, kBegun}));
}

TEST_F(IpmiStart, FailsWhenTheCreateIsRefused) {
    attach({fault("bmc.create", kRefuse)});
    EXPECT_EQ(start(), -2);
    EXPECT_EQ(handle_, -1);
    EXPECT_FALSE(channel_is_open());
    EXPECT_EQ(log(), dated(with(kWayToCreate, {kCreateRefused, kCreateFailed})));
    EXPECT_THAT(pauses_ms(), ElementsAre(100, 200));
    EXPECT_EQ(exchanges().back(), "create XFLASH -> refused") << "nothing is destroyed";
}

TEST_F(IpmiStart, FailsWhenTheCreateIsNotAnswered) {
    attach({fault("bmc.create", kNoAnswer)});
    EXPECT_EQ(start(), -2);
    EXPECT_FALSE(channel_is_open());
    EXPECT_EQ(log(), dated(kWayToCreate) + dated(kCreateFailed, 5));
    EXPECT_EQ(elapsed_ms(), 5300);
}

TEST_F(IpmiStart, CompletionCodeOfTheCreateFailsTheOpen) {
    attach({fault("bmc.create", kCompletionCode, 0xC1)});
    EXPECT_EQ(start(), -2);
    EXPECT_EQ(handle_, -1);
    EXPECT_FALSE(channel_is_open());
    EXPECT_EQ(log(), dated(with(kWayToCreate, {kOpenFailed})));
    EXPECT_THAT(pauses_ms(), ElementsAre(100, 100, 200));
    EXPECT_EQ(exchanges().size(), 3U) << "neither open nor destroy is sent";
}

TEST_F(IpmiStart, CompletionCodeOfTheCreateFailsTheBeginInSecureMode) {
    attach({fault("bmc.create", kCompletionCode, 0xC1)}, {.secure_mode = "yes"});
    EXPECT_EQ(start(), -2);
    EXPECT_EQ(log(), dated({kEnter, kSecond, kModeRead, kSecure, kLoop, kLoopIp, kOpenFailed}));
}

TEST_F(IpmiStart, FailsWhenTheOpenIsRefused) {
    attach({fault("bmc.open", kRefuse)});
    EXPECT_EQ(start(), -2);
    EXPECT_EQ(handle_, -1);
    EXPECT_FALSE(channel_is_open());
    EXPECT_EQ(log(), dated(with(kWayToCreate, {kDestroyed, kOpenFailed})));
    EXPECT_THAT(pauses_ms(), ElementsAre(100, 100, 200));
    EXPECT_EQ(exchanges().back(), "destroy 1 -> done");
}

TEST_F(IpmiStart, KeepsTheHandleWhenTheDestroyFails) {
    attach({fault("bmc.open", kRefuse), fault("bmc.destroy", kRefuse)});
    EXPECT_EQ(start(), -2);
    EXPECT_EQ(handle_, 1);
    EXPECT_FALSE(channel_is_open());
    EXPECT_EQ(log(), dated(with(kWayToCreate, {kOpenFailed})));
}

TEST_F(IpmiStart, OpenThatIsNotAnsweredStopsTheDestroyAsWell) {
    attach({fault("bmc.open", kNoAnswer)});
    EXPECT_EQ(start(), -2);
    EXPECT_EQ(handle_, 1);
    EXPECT_EQ(elapsed_ms(), 10'400) << "two time-outs: the interface is stuck";
    EXPECT_EQ(log(), dated(kWayToCreate) + dated(kOpenFailed, 10));
}

TEST_F(IpmiStart, CompletionCodeOfTheOpenLeavesTheRefusalToTheBegin) {
    attach({fault("bmc.open", kCompletionCode, 0xC0)});
    EXPECT_EQ(start(), -2);
    EXPECT_EQ(handle_, -1);
    EXPECT_EQ(log(), dated(with(kWayToCreate, {kDestroyed, kOpenFailed})));
    EXPECT_THAT(exchanges(), ::testing::IsSupersetOf({"begin 1 -> refused", "destroy 1 -> done"}));
}

TEST_F(IpmiStart, FailsWhenTheBeginIsRefused) {
    attach({fault("bmc.begin", kRefuse)});
    EXPECT_EQ(start(), -2);
    EXPECT_EQ(handle_, -1);
    EXPECT_FALSE(channel_is_open());
    EXPECT_EQ(log(), dated(with(kWayToCreate, {kDestroyed, kOpenFailed})));
    EXPECT_THAT(pauses_ms(), ElementsAre(100, 100, 200));
}

TEST_F(IpmiStart, CompletionCodeOfTheBeginCountsAsBegun) {
    attach({fault("bmc.begin", kCompletionCode, 0xC0)});
    EXPECT_EQ(start(), 0);
    EXPECT_TRUE(channel_is_open());
    EXPECT_EQ(log(), dated(with(kWayToCreate, {kBegun})));
}

TEST_F(IpmiStart, LateCreateLeavesATransactionThatNobodyKnows) {
    attach({fault("bmc.create", kLate, 6, 1)});
    EXPECT_EQ(start(), -2);
    EXPECT_EQ(handle_, -1);
    EXPECT_EQ(start(), -2) << "the controller has one already";
    EXPECT_THAT(exchanges(), ::testing::IsSupersetOf({"create XFLASH -> handle 1, 6 s late",
                                                      "create XFLASH -> refused"}));
}

TEST_F(IpmiStart, HandleInUseIsLeftAlone) {
    attach();
    handle_ = 9;
    EXPECT_EQ(start(), -2);
    EXPECT_EQ(handle_, 9);
    EXPECT_EQ(log(), dated(with(kWayToCreate, {kCreateFailed})));
}

TEST_F(IpmiStart, SecondSessionFollowsAnEndedOne) {
    attach();
    EXPECT_EQ(start(), 0);
    smm_disconnect(&handle_);
    EXPECT_EQ(handle_, -1);
    EXPECT_EQ(start(), 0);
    EXPECT_EQ(handle_, 2);
}

}  // namespace
}  // namespace velktest

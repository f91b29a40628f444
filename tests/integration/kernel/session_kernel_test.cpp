// The library's update session on the kernel's own driver.
#include "tests/integration/kernel/kernel_fixture.h"

#include <algorithm>

namespace velkkernel {
namespace {

using enum ControllerFault;
using ::testing::AllOf;
using ::testing::Contains;
using ::testing::ElementsAre;
using ::testing::Ge;
using ::testing::HasSubstr;
using ::testing::IsSupersetOf;
using ::testing::Le;
using ::testing::Not;

class SessionOnKernel : public KernelTest {
  protected:
    // The last exchanges, in words.
    [[nodiscard]] std::vector<std::string> last(std::size_t count) const {
        const std::vector<std::string> all = outcome_.words();
        const auto first = all.end() - static_cast<std::ptrdiff_t>(std::min(count, all.size()));
        return {first, all.end()};
    }
};

TEST_P(SessionOnKernel, GoesThroughFromStartToEnd) {
    boot("start,status,end,log");
    EXPECT_EQ(untimed(result_of("start")), "0 handle=1 open paused=0");
    EXPECT_EQ(untimed(result_of("status")), "0 handle=1 closed paused=0");
    EXPECT_EQ(result_of("end"), "handle=-1 closed paused=20");
    EXPECT_THAT(
        outcome_.words(),
        ElementsAre("type query -> second generation", "variable secure_mode -> \"no\"",
                    "create XFLASH -> handle 1", "open 1 optfw 128 -> done", "begin 1 -> done",
                    "type query -> second generation", "status 1 -> done", "cancel 1 -> done",
                    "close 1 -> done", "destroy 1 -> done"));
    EXPECT_THAT(outcome_.log(),
                ElementsAre("SMM : start_update_option_firmware enter .",
                            "smm : start_update_option_firmware , BMC  type is RXCv2",
                            "smm : rxc_flash secure mode.",
                            "smm : start_update_option_firmware get_secure_mode  No SecureMode ",
                            "smm : start_update_option_firmware , loop 0 ",
                            "smm : start_update_option_firmware , loop1  ip optfw ",
                            "smm : start_update_option_firmware , begin_opt_update successfully.",
                            "SMM : get_flash_status enter .", "Query smm status successfully!",
                            "SMM : smm_disconnect enter .", "cancel_ipmi_transaction successfully.",
                            "close_ipmi_transaction successfully.",
                            "destroy_ipmi_transaction successfully.",
                            "smm : smm_disconnect successfully."));
    EXPECT_THAT(ms_of(result_of("start")), AllOf(Ge(200), Le(4900))) << "two pauses of 100 ms";
}

TEST_P(SessionOnKernel, OpensNothingInSecureMode) {
    boot("start,status,end", {}, {.secure_mode = "Yes", .first_handle = 0x01020304});
    EXPECT_EQ(untimed(result_of("start")), "0 handle=16909060 open paused=0");
    EXPECT_EQ(untimed(result_of("status")), "0 handle=16909060 closed paused=0");
    EXPECT_EQ(result_of("end"), "handle=-1 closed paused=20");
    EXPECT_THAT(outcome_.words(),
                ElementsAre("type query -> second generation", "variable secure_mode -> \"Yes\"",
                            "create XFLASH -> handle 16909060", "begin 16909060 -> done",
                            "type query -> second generation", "status 16909060 -> done",
                            "cancel 16909060 -> done", "close 16909060 -> done",
                            "destroy 16909060 -> done"));
}

TEST_P(SessionOnKernel, IsRefusedByTheFirstGeneration) {
    boot("start,status,log", {}, {.generation = Generation::kFirst});
    EXPECT_EQ(untimed(result_of("start")), "-1 handle=-1 closed paused=0");
    EXPECT_EQ(untimed(result_of("status")), "0 handle=-1 closed paused=0");
    EXPECT_THAT(outcome_.log(), Contains("rxc v1 is not supported to smm"));
}

TEST_P(SessionOnKernel, IsNotNeededByAControllerThatKnowsNone) {
    boot("start,log", {}, {.generation = Generation::kNone});
    EXPECT_EQ(untimed(result_of("start")), "0 handle=-1 closed paused=0");
    EXPECT_THAT(outcome_.log(),
                Contains("smm : start_update_option_firmware , not support BMC type"));
}

TEST_P(SessionOnKernel, TakesCompletionCodesForSuccess) {
    boot("start,log", {fault("bmc.create", kCompletionCode, 0xC0)});
    EXPECT_EQ(untimed(result_of("start")), "-2 handle=-1 closed paused=0");
    EXPECT_THAT(outcome_.words(),
                ElementsAre("type query -> second generation", "variable secure_mode -> \"no\"",
                            "create XFLASH -> completion code 0xC0"))
        << "the create counts as done, so the open fails without a request";
}

TEST_P(SessionOnKernel, GoesThroughCompletionCodesOfEveryOperation) {
    std::vector<FaultRule> faults;
    for (const char *step : {"variable", "open", "begin", "status", "cancel", "close", "destroy"}) {
        faults.push_back(fault(std::string("bmc.") + step, kCompletionCode, 0xD5));
    }
    boot("start,status,end,log", faults);
    EXPECT_EQ(untimed(result_of("start")), "0 handle=1 open paused=0");
    EXPECT_EQ(untimed(result_of("status")), "0 handle=1 closed paused=0");
    EXPECT_EQ(result_of("end"), "handle=1 closed paused=20") << "but nothing was destroyed";
    EXPECT_THAT(
        outcome_.words(),
        ElementsAre("type query -> second generation",
                    "variable secure_mode -> completion code 0xD5", "create XFLASH -> handle 1",
                    "open 1 optfw 128 -> completion code 0xD5", "begin 1 -> completion code 0xD5",
                    "type query -> second generation", "status 1 -> completion code 0xD5",
                    "cancel 1 -> completion code 0xD5", "close 1 -> completion code 0xD5",
                    "destroy 1 -> completion code 0xD5"));
    EXPECT_THAT(outcome_.log(), Not(Contains(HasSubstr("transaction successfully"))));
}

TEST_P(SessionOnKernel, FailsAtACompletionCodeOfTheTypeQuery) {
    boot("start,log", {fault("bmc.type", kCompletionCode, 0xC1)});
    EXPECT_EQ(untimed(result_of("start")), "-1 handle=-1 closed paused=0");
    EXPECT_THAT(outcome_.log(),
                Contains("smm : start_update_option_firmware , get_bmc_type failed"));
}

TEST_P(SessionOnKernel, LeavesTheChannelOpenAfterARefusedStatus) {
    boot("start,channels,status,status,channels", {fault("bmc.status", kRefuse, 0, 1)});
    EXPECT_EQ(untimed(result_of("status")), "-2 handle=1 open paused=0");
    EXPECT_EQ(untimed(result_of("status", 1)), "0 handle=1 closed paused=0");
    EXPECT_EQ(result_of("channels"), "1") << "that of the start";
    EXPECT_EQ(result_of("channels", 1), "2") << "and that of the refused status, for good";
}

TEST_P(SessionOnKernel, WaitsFiveSecondsForASilentController) {
    boot("start,log", {fault("bmc.type", kNoAnswer)});
    EXPECT_EQ(untimed(result_of("start")), "-1 handle=-1 closed paused=0");
    EXPECT_THAT(ms_of(result_of("start")), AllOf(Ge(5000), Le(8000)));
    EXPECT_THAT(outcome_.log(),
                Contains("smm : start_update_option_firmware , get_bmc_type failed"));
}

// The begin and then the destroy wait in vain. The driver still waits for the answer to the begin,
// so that the destroy never leaves the machine.
TEST_P(SessionOnKernel, KeepsTheHandleOfAControllerThatVanishes) {
    boot("start,log", {fault("bmc.begin", kVanish)});
    EXPECT_EQ(untimed(result_of("start")), "-2 handle=1 closed paused=0");
    EXPECT_THAT(ms_of(result_of("start")), AllOf(Ge(10'000), Le(15'000)));
    EXPECT_EQ(outcome_.words().back(), "begin 1 -> the device is gone");
    EXPECT_THAT(outcome_.log(),
                Contains("smm : start_update_option_firmware , open_ipmi_transaction failed"));
}

TEST_P(SessionOnKernel, CannotGoOnWithoutItsDevice) {
    boot("start,unbind,status,end,start,log");
    EXPECT_EQ(untimed(result_of("status")), "-2 handle=1 closed paused=0");
    EXPECT_EQ(result_of("end"), "handle=1 closed paused=0");
    EXPECT_EQ(untimed(result_of("start", 1)), "-2 handle=1 closed paused=0");
    EXPECT_EQ(outcome_.words().back(), "begin 1 -> done") << "of the first start";
    EXPECT_THAT(outcome_.log(),
                IsSupersetOf({"smm : get_flash_status , connect_kcs failed",
                              "smm : start_update_option_firmware , connect_kcs failed"}));
}

TEST_P(SessionOnKernel, TimesOutOnADeviceThatVanishesWhileItIsOpen) {
    boot("open,type,unbind,type");
    EXPECT_EQ(untimed(result_of("type")), "0 type=2");
    EXPECT_EQ(untimed(result_of("type", 1)), "-1 type=-1");
    EXPECT_THAT(ms_of(result_of("type", 1)), AllOf(Ge(5000), Le(8000)));
}

// The driver sends the late create again, and the controller has a transaction already: it refuses
// that one, and every other until somebody destroys what nobody knows.
TEST_P(SessionOnKernel, LosesATransactionWhoseCreateIsLate) {
    boot("start,start", {fault("bmc.create", kLate, 6, 1)});
    EXPECT_EQ(untimed(result_of("start")), "-2 handle=-1 closed paused=0");
    EXPECT_EQ(untimed(result_of("start", 1)), "-2 handle=-1 closed paused=0");
    EXPECT_THAT(outcome_.words(),
                ElementsAre("type query -> second generation", "variable secure_mode -> \"no\"",
                            "create XFLASH -> handle 1, 6 s late", "create XFLASH -> refused",
                            "type query -> second generation", "variable secure_mode -> \"no\"",
                            "create XFLASH -> refused"));
}

// The late cancel's second answer comes when the close waits, and that takes it for its own.
TEST_P(SessionOnKernel, ReadsAnswersOneStepLateAfterALateCancel) {
    boot("start,end,log", {fault("bmc.cancel", kLate, 6, 1)});
    EXPECT_EQ(result_of("end"), "handle=-1 closed paused=140");
    EXPECT_THAT(last(4), ElementsAre("cancel 1 -> done, 6 s late", "cancel 1 -> refused",
                                     "close 1 -> done", "destroy 1 -> done"));
    EXPECT_THAT(outcome_.log(), AllOf(Contains("destroy_ipmi_transaction successfully."),
                                      Not(Contains("cancel_ipmi_transaction successfully.")),
                                      Not(Contains("close_ipmi_transaction successfully."))));
}

TEST_P(SessionOnKernel, IsWatchedWhileTheMainThreadWorks) {
    boot("install:5,channels,log");
    const auto words = outcome_.words();
    const auto queries = std::count(words.begin(), words.end(), "status 1 -> done");
    EXPECT_GE(queries, 5);
    EXPECT_EQ(result_of("install:5"), "watched=" + std::to_string(30 * queries) + " closing=20");
    EXPECT_THAT(last(3), ElementsAre("cancel 1 -> done", "close 1 -> done", "destroy 1 -> done"));
    EXPECT_EQ(result_of("channels"), "0");
    EXPECT_THAT(outcome_.log(), Contains("SMM :  query_fw_update, query_fw_update thread start"));
}

// A status query is under way when the main thread connects, which puts its descriptor in the place
// of the watcher's. The watcher then closes that one, under the cancel that waits at it.
TEST_P(SessionOnKernel, HangsWhenTheWatcherClosesTheSharedChannel) {
    boot("hurry:8,channels,log",
         {fault("bmc.status", kLate, 3, 1), fault("bmc.cancel", kLate, 1, 1)});
    EXPECT_EQ(result_of("hurry:8"), "closing hangs") << "it fetches from what is closed, for ever";
    EXPECT_THAT(last(2), ElementsAre("status 1 -> done, 3 s late", "cancel 1 -> done, 1 s late"));
    EXPECT_EQ(result_of("channels"), "1") << "the watcher's own, which nobody closes";
    EXPECT_THAT(outcome_.log(), AllOf(Contains("Query smm status successfully!"),
                                      Not(Contains("smm : smm_disconnect successfully."))));
}

INSTANTIATE_TEST_SUITE_P(Abi, SessionOnKernel, each_abi(), abi_of);

}  // namespace
}  // namespace velkkernel

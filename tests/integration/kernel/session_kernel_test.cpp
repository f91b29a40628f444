// The library's update session on the kernel's own driver.
#include "tests/integration/kernel/kernel_fixture.h"

namespace velkkernel {
namespace {

using enum ControllerFault;
using ::testing::AllOf;
using ::testing::Contains;
using ::testing::ElementsAre;
using ::testing::Ge;
using ::testing::Le;

class SessionOnKernel : public KernelTest {};

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
    EXPECT_THAT(ms_of(result_of("start")), AllOf(Ge(200), Le(3000))) << "two pauses of 100 ms";
}

TEST_P(SessionOnKernel, OpensNothingInSecureMode) {
    boot("start,end", {}, {.secure_mode = "Yes", .first_handle = 0x01020304});
    EXPECT_EQ(untimed(result_of("start")), "0 handle=16909060 open paused=0");
    EXPECT_THAT(outcome_.words(),
                ElementsAre("type query -> second generation", "variable secure_mode -> \"Yes\"",
                            "create XFLASH -> handle 16909060", "begin 16909060 -> done",
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

TEST_P(SessionOnKernel, LeavesTheChannelOpenAfterARefusedStatus) {
    boot("start,status,status", {fault("bmc.status", kRefuse, 0, 1)});
    EXPECT_EQ(untimed(result_of("status")), "-2 handle=1 open paused=0");
    EXPECT_EQ(untimed(result_of("status", 1)), "0 handle=1 closed paused=0");
}

TEST_P(SessionOnKernel, WaitsFiveSecondsForASilentController) {
    boot("start,log", {fault("bmc.type", kNoAnswer)});
    EXPECT_EQ(untimed(result_of("start")), "-1 handle=-1 closed paused=0");
    EXPECT_THAT(ms_of(result_of("start")), AllOf(Ge(5000), Le(8000)));
    EXPECT_THAT(outcome_.log(),
                Contains("smm : start_update_option_firmware , get_bmc_type failed"));
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

TEST_P(SessionOnKernel, IsWatchedWhileTheMainThreadWorks) {
    boot("install:3,log");
    int queries = 0;
    for (const std::string &words : outcome_.words()) {
        queries += words == "status 1 -> done" ? 1 : 0;
    }
    // A pause of 30 seconds takes 0.3 seconds there, so that 3 seconds have room for ten.
    EXPECT_THAT(queries, AllOf(Ge(4), Le(11)));
    EXPECT_EQ(result_of("install:3"), "watched=" + std::to_string(30 * queries) + " closing=20");
    EXPECT_EQ(outcome_.words().back(), "destroy 1 -> done");
    EXPECT_THAT(outcome_.log(), Contains("SMM :  query_fw_update, query_fw_update thread start"));
}

INSTANTIATE_TEST_SUITE_P(Abi, SessionOnKernel, each_abi(), abi_of);

}  // namespace
}  // namespace velkkernel

// The session around an install and its watcher thread: what both do, in hours of virtual time.
#include "installers/adapter_session.h"

#include <array>

#include <pthread.h>
#include <unistd.h>

#include "host/shim/wait_guard.h"
#include "installers/Emulex_update.h"
#include "installers/Qlogic_update.h"
#include "installers/brocade_update.h"
#include "installers/facade_update.h"
#include "ipmi/update_session.h"
#include "tests/unit/library/ipmi_fixture.h"
#include "velk/request_state.h"

namespace velktest {
namespace {

using enum ControllerFault;
using velk::adapter::UpdateSession;
using velkhost::shim::TakePart;
using Lines = std::vector<std::string_view>;

constexpr std::string_view kThreadStart = "SMM :  query_fw_update, query_fw_update thread start";
constexpr std::string_view kPollStart = "SMM :  QuerySMM, QuerySMM start";
constexpr std::string_view kBrocadeStart = "SMM :  querysmm_brocade, querysmm_brocade start";
constexpr std::string_view kStatusEnter = "SMM : get_flash_status enter .";

struct Watcher {
    const char *vendor;
    void *(*thread)(void *);
    int (*poll)(int);
    std::string_view start_line;
};

constexpr std::array kWatchers = {
    Watcher{"emulex", query_fw_update_emulex, querysmm_emulex, kPollStart},
    Watcher{"qlogic", query_fw_update_qlogic, querysmm_qlogic, kPollStart},
    Watcher{"brocade", query_fw_update_brocade, querysmm_brocade, kBrocadeStart},
    Watcher{"facade", query_fw_update_facade, querysmm_facade, kPollStart},
};

class IpmiWatcher : public IpmiTest {
  protected:
    ~IpmiWatcher() override {
        velk::store(ga_is_thread_running, 0);
        sleep(61);  // the last watcher ends
    }

    [[nodiscard]] int logged(std::string_view message) const {
        return occurrences(log(), " " + std::string(message) + "\n");
    }

    // The test's thread is one of those for which time passes.
    const TakePart part_;
};

class IpmiVendorWatcher : public IpmiWatcher, public ::testing::WithParamInterface<Watcher> {};

TEST_P(IpmiVendorWatcher, PollEndsAtOnceWhenNoneIsToRun) {
    attach();
    EXPECT_EQ(GetParam().poll(1), 0);
    EXPECT_EQ(log(), dated(GetParam().start_line));
    EXPECT_TRUE(exchanges().empty());
    EXPECT_EQ(elapsed_ms(), 0);
}

TEST_P(IpmiVendorWatcher, ThreadTakesTheSessionsFirstWord) {
    attach({}, {.first_handle = 77});
    std::array<int, 4> block{-1, -1, -1, -1};
    ASSERT_EQ(start_update_option_firmware(block.data()), 0);
    disconnect_kcs();
    clear_log();
    velk::store(ga_is_thread_running, 1);
    pthread_t thread{};
    ASSERT_EQ(pthread_create(&thread, nullptr, GetParam().thread, block.data()), 0);
    usleep(1000);
#if !defined(__SANITIZE_THREAD__)  // which does not take a pause for an order
    block[0] = 0;                  // the watcher has its own copy
#endif
    sleep(45);
    velk::store(ga_is_thread_running, 0);
    void *result = block.data();
    ASSERT_EQ(pthread_join(thread, &result), 0);
    EXPECT_EQ(result, nullptr);
    EXPECT_EQ(status_queries(), 2);
    EXPECT_EQ(exchanges().back(), "status 77 -> done");
    EXPECT_EQ(log().substr(0, 200).find(std::string(kThreadStart)), 25U);
    EXPECT_EQ(logged(kThreadStart), 1);
    EXPECT_EQ(logged(GetParam().start_line), 1);
}

INSTANTIATE_TEST_SUITE_P(Each, IpmiVendorWatcher, ::testing::ValuesIn(kWatchers),
                         [](const auto &about) { return std::string(about.param.vendor); });

TEST_F(IpmiWatcher, PollReturnsTheLastAnswer) {
    attach({fault("bmc.type", kCompletionCode, 0xC1)});
    velk::store(ga_is_thread_running, 1);
    pthread_t thread{};
    const auto poll = [](void *result) -> void * {
        *static_cast<int *>(result) = querysmm_emulex(1);
        return nullptr;
    };
    int result = 7;
    ASSERT_EQ(pthread_create(&thread, nullptr, poll, &result), 0);
    sleep(70);
    velk::store(ga_is_thread_running, 0);
    pthread_join(thread, nullptr);
    EXPECT_EQ(result, -1);
    EXPECT_EQ(elapsed_ms(), 90'000) << "it ends after its pause";
    EXPECT_EQ(logged(kStatusEnter), 3);
}

// ---- The session around an install ----

TEST_F(IpmiWatcher, InstallOfEightHoursIsWatchedEveryThirtySeconds) {
    attach();
    const UpdateSession session(query_fw_update_emulex);
    EXPECT_EQ(ga_is_thread_running, 1);
    constexpr int kHours = 8;
    sleep(kHours * 3600 + 15);
    EXPECT_EQ(status_queries(), kHours * 120 + 1);
    session.close();
    EXPECT_EQ(ga_is_thread_running, 0);
    const int at_close = status_queries();
    sleep(3600);
    EXPECT_EQ(status_queries(), at_close) << "the watcher is gone";
    EXPECT_EQ(logged("Start SMM successfully."), 1);
    EXPECT_EQ(logged("Query smm status successfully!"), at_close);
    EXPECT_EQ(exchanges().back(), "destroy 1 -> done");
    EXPECT_FALSE(channel_is_open());
}

TEST_F(IpmiWatcher, LinesOfAShortInstallAreInOrder) {
    attach();
    {
        const UpdateSession session(query_fw_update_facade);
        sleep(40);
        session.close();
    }
    EXPECT_TRUE(log().ends_with(
        dated({kThreadStart, kPollStart, kStatusEnter, "Query smm status successfully!"}) +
        dated({kStatusEnter, "Query smm status successfully!"}, 30) +
        dated(Lines{"SMM : smm_disconnect enter .", "cancel_ipmi_transaction successfully."}, 40) +
        dated("close_ipmi_transaction successfully.", 50) +
        dated(Lines{"destroy_ipmi_transaction successfully.", "smm : smm_disconnect successfully."},
              60)))
        << log();
}

TEST_F(IpmiWatcher, ChannelIsClosedForTheWatcher) {
    attach();
    const UpdateSession session(query_fw_update_emulex);
    EXPECT_FALSE(channel_is_open());
    session.close();
}

TEST_F(IpmiWatcher, FailedStartIsNeitherWatchedNorClosed) {
    attach({}, {.generation = Generation::kFirst});
    const UpdateSession session(query_fw_update_emulex);
    EXPECT_EQ(ga_is_thread_running, 1) << "whether or not the session opened";
    sleep(3600);
    session.close();
    EXPECT_EQ(ga_is_thread_running, 0);
    EXPECT_EQ(exchanges().size(), 1U);
    EXPECT_EQ(logged("Start SMM successfully."), 0);
    EXPECT_EQ(logged("SMM : smm_disconnect enter ."), 0);
}

TEST_F(IpmiWatcher, ControllerWithoutSessionsIsWatchedAndClosedLikeAnyOther) {
    attach({}, {.generation = Generation::kNone});
    const UpdateSession session(query_fw_update_emulex);
    sleep(45);
    session.close();
    EXPECT_EQ(logged(kStatusEnter), 2);
    EXPECT_EQ(status_queries(), 0);
    EXPECT_EQ(logged("smm : smm_disconnect successfully."), 1);
}

TEST_F(IpmiWatcher, WatcherThatCannotBeCreatedLeavesTheSessionOpen) {
    attach();
    fail_step("thread.create", EAGAIN);
    const UpdateSession session(query_fw_update_emulex);
    sleep(60);
    session.close();
    EXPECT_EQ(logged("Start SMM successfully."), 1);
    EXPECT_EQ(logged("Fail to create smm thread."), 1);
    EXPECT_EQ(logged("SMM : smm_disconnect enter ."), 0);
    EXPECT_EQ(status_queries(), 0);
    EXPECT_EQ(exchanges().back(), "begin 1 -> done");
}

TEST_F(IpmiWatcher, WatcherGoesOnWhenTheControllerIsGone) {
    FaultRule vanish = fault("bmc.status", kVanish);
    vanish.after = 2;
    attach({vanish});
    const UpdateSession session(query_fw_update_emulex);
    sleep(600);
    session.close();
    EXPECT_EQ(status_queries(), 3);
    EXPECT_GT(logged("smm : get_flash_status , connect_kcs failed"), 15);
}

TEST_F(IpmiWatcher, SecondInstallHasASessionOfItsOwn) {
    attach();
    for (const char *last : {"destroy 1 -> done", "destroy 2 -> done"}) {
        const UpdateSession session(query_fw_update_brocade);
        sleep(100);
        session.close();
        EXPECT_EQ(exchanges().back(), last);
    }
    EXPECT_EQ(status_queries(), 8);
}

}  // namespace
}  // namespace velktest

// When a job's provider is asked, and when the job goes.
#include <signal.h>

#include <atomic>
#include <filesystem>
#include <thread>

#include <gmock/gmock.h>

#include "tests/unit/host/jobs_fixture.h"

namespace velkhost::jobs::test {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

class JobPolling : public Jobs {};

// Test times lie between the polls, so that what happens at one moment needs no order.

TEST_F(JobPolling, StatusIsAskedForEveryTenSecondsUntilAStateThatEnds) {
    create();
    sleep(35);
    tell(7, "1|a: 50: done|");
    sleep(200);
    EXPECT_THAT(asked(), ElementsAre(10, 20, 30, 40));
}

TEST_F(JobPolling, LibraryGoesOnAfterItsCallerHasClosedIt) {
    create();  // opens and closes it; no broker has loaded it yet
    sleep(25);
    EXPECT_THAT(asked(), ElementsAre(10, 20));
}

TEST_F(JobPolling, EveryEndStopsThePolling) {
    for (const int state : {7, 8, 9, 10}) {
        tell(state, "1|");
        const std::string id = create();
        sleep(35);
        EXPECT_EQ(asked().size(), 1U) << state;
        EXPECT_TRUE(broker_.delete_instance(path_of(id)).ok());
        forget_calls();
    }
}

TEST_F(JobPolling, StatesThatDoNotEndArePolledOn) {
    create();
    for (const int state : {2, 3, 4, 5, 6, 11, 12}) {
        tell(state, "");
        sleep(10);
    }
    sleep(5);
    EXPECT_EQ(asked().size(), 7U);
}

TEST_F(JobPolling, IntervalIsTheScenarios) {
    play("[jobs]\npoll_seconds = 60\n");
    create();
    sleep(130);
    EXPECT_THAT(asked(), ElementsAre(60, 120));
}

TEST_F(JobPolling, HoursOfPollsAreCountedAndTakeNoTime) {
    create();
    sleep(4 * 3600 + 5);
    EXPECT_EQ(asked().size(), 1440U);
    EXPECT_EQ(asked().back(), 4 * 3600);
}

TEST_F(JobPolling, JobsArePolledEachInItsOwnTime) {
    create();
    sleep(3);
    create();
    sleep(22);
    EXPECT_THAT(asked(), ElementsAre(10, 13, 20, 23));
}

TEST_F(JobPolling, ReadsBeforeTheEndShowTheLastPollAndAskNobody) {
    const std::string id = create();
    sleep(15);
    tell(4, "0|a: 10: newer|");
    EXPECT_EQ(text(id, "JobStatus"), "0|a: 10: on its way|");
    EXPECT_THAT(asked(), ElementsAre(10));
}

// One good package is enough for the state "completed", while the request goes on.
TEST_F(JobPolling, ReadsAfterTheEndAskAgain) {
    tell(7, "0|a: 50: done|b: 10: on its way|");
    const std::string id = create();
    sleep(15);
    tell(7, "1|a: 50: done|b: 57: failed|");
    EXPECT_EQ(text(id, "JobStatus"), "1|a: 50: done|b: 57: failed|");
    sleep(15);
    EXPECT_EQ(broker_.enumerate_instances(class_path()).instances.size(), 1U);
    EXPECT_THAT(asked(), ElementsAre(10, 15, 30));
}

TEST_F(JobPolling, FunctionThatKnowsNothingChangesNothing) {
    const std::string id = create();
    sleep(15);
    tell(Answer{7, "not to be seen", true, 1});
    sleep(10);
    EXPECT_EQ(number(id, "JobState"), 4U);
    EXPECT_EQ(text(id, "JobStatus"), "0|a: 10: on its way|");
}

TEST_F(JobPolling, FunctionThatLeavesStateAndTextKeepsThem) {
    const std::string id = create();
    sleep(15);
    tell(Answer{7, "not to be seen", false, 0});
    sleep(10);
    EXPECT_EQ(number(id, "JobState"), 4U);
    EXPECT_EQ(text(id, "JobStatus"), "0|a: 10: on its way|");
    EXPECT_THAT(asked(), ElementsAre(10, 20));
}

TEST_F(JobPolling, StateBeyondItsTypeIsNotTaken) {
    const std::string id = create();
    tell(-1, "x");
    sleep(15);
    tell(0x10007, "x");
    sleep(10);
    EXPECT_EQ(number(id, "JobState"), 2U);
}

TEST_F(JobPolling, LongTextIsCutToTheBuffer) {
    tell(4, std::string(10'000, 'x'));
    const std::string id = create();
    sleep(15);
    EXPECT_EQ(text(id, "JobStatus"), std::string(4095, 'x'));
}

TEST_F(JobPolling, EndedJobGoesFiveMinutesAfterItsEnd) {
    tell(7, "1|a: 50: done|");
    create();
    sleep(305);  // ended at 10
    EXPECT_THAT(cleaned_up(), IsEmpty());
    sleep(10);
    EXPECT_THAT(cleaned_up(), ElementsAre("VELK-1"));
    EXPECT_EQ(job_count(), 0U);
    EXPECT_THAT(asked(), ElementsAre(10, 310));
}

TEST_F(JobPolling, ChangeAfterTheEndPutsTheRemovalOff) {
    tell(7, "0|a: 50: done|b: 0: waits|");
    const std::string id = create();
    sleep(105);
    tell(7, "0|a: 50: done|b: 10: on its way|");
    EXPECT_EQ(number(id, "JobState"), 7U);  // the read at 105 s sees the change
    sleep(220);
    EXPECT_THAT(cleaned_up(), IsEmpty());
    tell(7, "1|a: 50: done|b: 50: done|");  // seen when the job is due, at 405 s
    sleep(300);
    EXPECT_THAT(cleaned_up(), IsEmpty());
    sleep(100);
    EXPECT_THAT(cleaned_up(), ElementsAre("VELK-1"));
    EXPECT_THAT(asked(), ElementsAre(10, 105, 310, 405, 705));
}

TEST_F(JobPolling, NothingTurnsWhileNothingHappens) {
    tell(7, "1|a: 50: done|");
    create();
    sleep(15);
    std::atomic<int> pauses = 0;
    velkshim_observe_pauses(
        [](void *count, std::int64_t, std::int64_t) { ++*static_cast<std::atomic<int> *>(count); },
        &pauses);
    sleep(100'000);
    velkshim_observe_pauses(nullptr, nullptr);
    EXPECT_EQ(pauses, 1);  // this test's own; the job's thread was in its last one before
}

TEST_F(JobPolling, DeletionCleansUpOnceAndEndsThePolling) {
    const std::string id = create();
    sleep(15);
    EXPECT_TRUE(broker_.delete_instance(path_of(id)).ok());
    EXPECT_EQ(broker_.delete_instance(path_of(id)).code, CMPI_RC_ERR_NOT_FOUND);
    sleep(1000);
    EXPECT_THAT(asked(), ElementsAre(10));
    EXPECT_THAT(cleaned_up(), ElementsAre("VELK-1"));
}

TEST_F(JobPolling, DeletionBeforeTheFirstPollCleansUp) {
    const std::string id = create();
    EXPECT_TRUE(broker_.delete_instance(path_of(id)).ok());
    EXPECT_THAT(cleaned_up(), ElementsAre("VELK-1"));
    sleep(100);
    EXPECT_THAT(asked(), IsEmpty());
}

TEST_F(JobPolling, ThreadsEndWithTheClockThatTheySleepBy) {
    const auto threads = [] {
        const std::filesystem::directory_iterator tasks("/proc/self/task");
        return std::distance(begin(tasks), end(tasks));
    };
    std::thread([] {}).join();  // has a sanitizer's own thread started
    const auto before = threads();
    create();
    create();
    sleep(15);
    EXPECT_EQ(threads(), before + 2);
    velkshim_use_real_clock();
    while (threads() > before) {
        std::this_thread::yield();
    }
    EXPECT_THAT(asked(), ElementsAre(10, 10));
}

std::size_t threads_that_block(int signal) {
    std::size_t count = 0;
    for (const auto &task : std::filesystem::directory_iterator("/proc/self/task")) {
        std::ifstream status(task.path() / "status");
        for (std::string line; std::getline(status, line);) {
            if (line.starts_with("SigBlk:")) {
                const auto mask = std::stoull(line.substr(line.find('\t') + 1), nullptr, 16);
                count += mask >> (signal - 1) & 1U;
            }
        }
    }
    return count;
}

TEST_F(JobPolling, ThreadsTakeNoSignals) {
    std::thread([] {}).join();  // has a sanitizer's own thread started
    const auto before = threads_that_block(SIGINT);
    create();
    EXPECT_EQ(threads_that_block(SIGINT), before + 1);
    create();
    EXPECT_EQ(threads_that_block(SIGINT), before + 2);
}

}  // namespace
}  // namespace velkhost::jobs::test

// Fault rules: which pass of a step they strike, and which of them never did.
#include "host/scenario/fault_rules.h"
#include "host/scenario/fault_steps.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <atomic>
#include <cerrno>
#include <thread>

namespace velkhost::scenario {
namespace {

FaultRule rule(std::string step, int code) {
    FaultRule out;
    out.step = std::move(step);
    out.code = code;
    return out;
}

// How each of `passes` passes of the step ended; 0 for one that went through.
std::vector<int> codes_of(FaultRules &rules, int passes, std::string_view step) {
    std::vector<int> codes;
    for (int pass = 0; pass < passes; ++pass) {
        const auto fault = rules.take(step);
        codes.push_back(fault ? fault->code : 0);
    }
    return codes;
}

using ::testing::ElementsAre;
using ::testing::IsEmpty;

TEST(FaultRules, WithoutRulesNothingStrikes) {
    FaultRules rules({});
    EXPECT_FALSE(rules.take("thread.create").has_value());
    EXPECT_THAT(rules.unfired(), IsEmpty());
}

TEST(FaultRules, StrikesOnceWithCodeAndMessage) {
    FaultRule once = rule("zeb.job", 6);
    once.message = "gone";
    FaultRules rules({once});
    const auto fault = rules.take("zeb.job", "x");
    ASSERT_TRUE(fault.has_value());
    EXPECT_EQ(fault->code, 6);
    EXPECT_EQ(fault->message, "gone");
    EXPECT_FALSE(rules.take("zeb.job", "x").has_value());
}

TEST(FaultRules, LetsPassesGoByAndThenStrikesAsOftenAsItSays) {
    FaultRule late = rule("thread.create", 11);
    late.after = 2;
    late.count = 2;
    FaultRules rules({late});
    EXPECT_THAT(codes_of(rules, 6, "thread.create"), ElementsAre(0, 0, 11, 11, 0, 0));
}

TEST(FaultRules, AlwaysNeverEnds) {
    FaultRule always = rule("thread.create", 11);
    always.after = 1;
    always.count = FaultRule::kAlways;
    FaultRules rules({always});
    EXPECT_THAT(codes_of(rules, 5, "thread.create"), ElementsAre(0, 11, 11, 11, 11));
}

TEST(FaultRules, OtherStepsAreLeftAlone) {
    FaultRules rules({rule("open:/tmp/a", ENOENT)});
    EXPECT_FALSE(rules.take("open:/tmp/ab").has_value());
    EXPECT_FALSE(rules.take("unlink:/tmp/a").has_value());
    EXPECT_TRUE(rules.take("open:/tmp/a").has_value());
}

TEST(FaultRules, StarStandsForAnyRest) {
    FaultRule any = rule("open:/tmp/sfcb/velkstat*", ENOSPC);
    any.count = FaultRule::kAlways;
    FaultRules rules({any});
    EXPECT_TRUE(rules.take("open:/tmp/sfcb/velkstatVELK-1.txt").has_value());
    EXPECT_TRUE(rules.take("open:/tmp/sfcb/velkstat").has_value());
    EXPECT_FALSE(rules.take("open:/tmp/sfcb/getVELKStatus.txt").has_value());
}

TEST(FaultRules, MatchLooksIntoTheSubject) {
    FaultRule narrow = rule("zeb.install", 1);
    narrow.match = "_uefi_";
    FaultRules rules({narrow});
    EXPECT_FALSE(rules.take("zeb.install", "file:///fw_rxc_1").has_value());
    EXPECT_FALSE(rules.take("zeb.install").has_value());
    EXPECT_TRUE(rules.take("zeb.install", "file:///fw_uefi_1").has_value());
}

TEST(FaultRules, LaterRulesSeeWhatEarlierOnesLetBy) {
    FaultRule second = rule("dlopen:/a", EACCES);
    second.after = 1;
    FaultRules rules({rule("dlopen:/a", ENOENT), second});
    EXPECT_THAT(codes_of(rules, 4, "dlopen:/a"), ElementsAre(ENOENT, 0, EACCES, 0));
}

TEST(FaultRules, UnfiredListsTheRulesThatNeverStruck) {
    FaultRule late = rule("zeb.job", 1);
    late.after = 5;
    late.line = 12;
    FaultRules rules({rule("zeb.install", 1), late});
    rules.take("zeb.install");
    rules.take("zeb.job");
    const std::vector<FaultRule> unfired = rules.unfired();
    ASSERT_EQ(unfired.size(), 1U);
    EXPECT_EQ(unfired[0].step, "zeb.job");
    EXPECT_EQ(unfired[0].line, 12);
}

TEST(FaultRules, ManyThreadsShareOneCount) {
    FaultRule some = rule("thread.create", 11);
    some.count = 500;
    FaultRules rules({some});
    std::atomic<int> struck = 0;
    constexpr int kWorkers = 4;
    std::vector<std::thread> threads;
    threads.reserve(kWorkers);
    for (int worker = 0; worker < kWorkers; ++worker) {
        threads.emplace_back([&] {
            for (int pass = 0; pass < 250; ++pass) {
                struck += rules.take("thread.create") ? 1 : 0;
            }
        });
    }
    for (std::thread &thread : threads) {
        thread.join();
    }
    EXPECT_EQ(struck, 500);
}

TEST(FaultSteps, LibcStepsFailWithErrnoAndOthersWithACimStatus) {
    EXPECT_EQ(step_code_kind("open:/x"), CodeKind::kErrno);
    EXPECT_EQ(step_code_kind("thread.create"), CodeKind::kErrno);
    EXPECT_EQ(step_code_kind("broker.newArgs"), CodeKind::kCimStatus);
    EXPECT_FALSE(step_code_kind("").has_value());
}

TEST(FaultSteps, EveryErrnoNameOfTheSystemIsKnown) {
    EXPECT_EQ(errno_by_name("EAGAIN"), EAGAIN);
    EXPECT_EQ(errno_by_name("EHWPOISON"), EHWPOISON);
    EXPECT_FALSE(errno_by_name("").has_value());
    EXPECT_FALSE(errno_by_name("eagain").has_value());
}

}  // namespace
}  // namespace velkhost::scenario

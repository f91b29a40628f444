// The states of a flash transaction: every step from every state, in both modes.
#include "host/bmc/transaction.h"

#include <gtest/gtest.h>

#include <map>
#include <vector>

namespace velkhost::bmc {
namespace {

using enum TransactionState;

constexpr std::uint32_t kHandle = 0x01020304;

const std::vector<Step> kSteps = {Step::kOpen,   Step::kBegin, Step::kStatus,
                                  Step::kCancel, Step::kClose, Step::kDestroy};

// Steps that lead from a fresh transaction to each state.
using Path = std::vector<Step>;
const std::map<TransactionState, Path> kPlainPaths = {
    {kCreated, {}},
    {kOpened, {Step::kOpen}},
    {kBegun, {Step::kOpen, Step::kBegin}},
    {kCancelled, {Step::kCancel}},
    {kClosed, {Step::kCancel, Step::kClose}},
};
const std::map<TransactionState, Path> kSecurePaths = {
    {kCreated, {}},
    {kBegun, {Step::kBegin}},
    {kCancelled, {Step::kCancel}},
    {kClosed, {Step::kCancel, Step::kClose}},
};

using Moves = std::map<std::pair<TransactionState, Step>, TransactionState>;
const Moves kCommonMoves = {
    {{kBegun, Step::kStatus}, kBegun},     {{kCreated, Step::kCancel}, kCancelled},
    {{kBegun, Step::kCancel}, kCancelled}, {{kCancelled, Step::kClose}, kClosed},
    {{kCreated, Step::kDestroy}, kNone},   {{kBegun, Step::kDestroy}, kNone},
    {{kCancelled, Step::kDestroy}, kNone}, {{kClosed, Step::kDestroy}, kNone},
};

void check_every_step(bool secure, const std::map<TransactionState, Path> &paths,
                      const Moves &moves) {
    for (const auto &[from, path] : paths) {
        for (const Step step : kSteps) {
            Transaction transaction(secure, kHandle);
            ASSERT_EQ(transaction.create(), kHandle);
            for (const Step way : path) {
                ASSERT_TRUE(transaction.take(way, kHandle));
            }
            ASSERT_EQ(transaction.state(), from);
            const auto move = moves.find({from, step});
            EXPECT_EQ(transaction.take(step, kHandle), move != moves.end())
                << static_cast<int>(from) << " " << static_cast<int>(step);
            EXPECT_EQ(transaction.state(), move == moves.end() ? from : move->second);
        }
    }
}

TEST(BmcTransaction, TakesTheStepsOfItsState) {
    Moves moves = kCommonMoves;
    moves[{kCreated, Step::kOpen}] = kOpened;
    moves[{kOpened, Step::kBegin}] = kBegun;
    moves[{kOpened, Step::kCancel}] = kCancelled;
    moves[{kOpened, Step::kClose}] = kClosed;
    moves[{kOpened, Step::kDestroy}] = kNone;
    check_every_step(false, kPlainPaths, moves);
}

TEST(BmcTransaction, IsBegunWithoutAnOpenInSecureMode) {
    Moves moves = kCommonMoves;
    moves[{kCreated, Step::kBegin}] = kBegun;
    check_every_step(true, kSecurePaths, moves);
}

TEST(BmcTransaction, TakesNoStepWhileThereIsNone) {
    Transaction transaction(false, kHandle);
    for (const Step step : kSteps) {
        EXPECT_FALSE(transaction.take(step, kHandle));
        EXPECT_FALSE(transaction.take(step, 0));
    }
    EXPECT_EQ(transaction.state(), kNone);
}

TEST(BmcTransaction, IsTheOnlyOneUntilItIsDestroyed) {
    Transaction transaction(false, kHandle);
    EXPECT_EQ(transaction.create(), kHandle);
    EXPECT_FALSE(transaction.create());
    EXPECT_TRUE(transaction.take(Step::kDestroy, kHandle));
    EXPECT_EQ(transaction.create(), kHandle + 1) << "handles are not given twice";
}

TEST(BmcTransaction, IsKnownByItsHandleAlone) {
    Transaction transaction(false, kHandle);
    transaction.create();
    EXPECT_FALSE(transaction.take(Step::kOpen, kHandle + 1));
    EXPECT_EQ(transaction.state(), kCreated);
}

}  // namespace
}  // namespace velkhost::bmc

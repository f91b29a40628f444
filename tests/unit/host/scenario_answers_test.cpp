// Answers in turn, and the looks of a job.
#include "host/scenario/answer_book.h"

#include <gtest/gtest.h>

namespace velkhost::scenario {
namespace {

ServiceAnswer answer(std::string match, std::uint32_t return_value) {
    ServiceAnswer out;
    out.match = std::move(match);
    out.return_value = return_value;
    return out;
}

TEST(AnswerBook, WithoutAnswersGivesAStartedUsualJob) {
    AnswerBook book({});
    const ServiceAnswer given = book.next("file:///a");
    EXPECT_EQ(given.return_value, kJobStarted);
    EXPECT_EQ(given.status, 0);
    EXPECT_FALSE(given.job.has_value());
}

TEST(AnswerBook, AnswersComeInTurnAndTheLastRepeats) {
    AnswerBook book({answer("", 1), answer("", 2)});
    EXPECT_EQ(book.next("a").return_value, 1U);
    EXPECT_EQ(book.next("b").return_value, 2U);
    EXPECT_EQ(book.next("c").return_value, 2U);
}

TEST(AnswerBook, EachMatchHasATurnOfItsOwn) {
    AnswerBook book({answer("rxc", 1), answer("", 7), answer("uefi", 3), answer("rxc", 2)});
    EXPECT_EQ(book.next("/rxc").return_value, 1U);
    EXPECT_EQ(book.next("/uefi").return_value, 3U);
    EXPECT_EQ(book.next("/rxc").return_value, 2U);
    EXPECT_EQ(book.next("/fpga").return_value, 7U);
    EXPECT_EQ(book.next("/rxc").return_value, 2U);
}

TEST(AnswerBook, FirstMatchingTurnWinsWhateverTheRestSays) {
    AnswerBook book({answer("", 9), answer("fw", 1), answer("rxc", 2)});
    EXPECT_EQ(book.next("/fw_rxc").return_value, 1U);
    EXPECT_EQ(book.next("/rxc").return_value, 2U);
}

TEST(AnswerBook, UnmatchedCallUsesNoTurnUp) {
    AnswerBook book({answer("rxc", 1), answer("rxc", 2)});
    EXPECT_EQ(book.next("/uefi").return_value, kJobStarted);
    EXPECT_EQ(book.next("/rxc").return_value, 1U);
}

TEST(AnswerBook, MatchCountsLetterCase) {
    AnswerBook book({answer("RXC", 1)});
    EXPECT_EQ(book.next("/rxc").return_value, kJobStarted);
}

TEST(JobLooks, EachLookIsSeenAsOftenAsItSays) {
    JobLooks looks(
        {JobLook{"a", 4, 1, false}, JobLook{"b", 4, 2, false}, JobLook{"c", 7, 1, false}});
    EXPECT_EQ(looks.take().job_status, "a");
    EXPECT_EQ(looks.take().job_status, "b");
    EXPECT_EQ(looks.take().job_status, "b");
    EXPECT_EQ(looks.take().job_status, "c");
}

TEST(JobLooks, LastLookHoldsForEver) {
    JobLooks looks({JobLook{"a", 4, 1, false}, JobLook{"b", 7, 1, false}});
    looks.take();
    for (int read = 0; read < 100; ++read) {
        EXPECT_EQ(looks.take().job_status, "b");
    }
}

TEST(JobLooks, PeekShowsTheNextReadAndUsesNothingUp) {
    JobLooks looks({JobLook{"a", 4, 1, false}, JobLook{"b", 7, 1, false}});
    EXPECT_EQ(looks.peek().job_status, "a");
    EXPECT_EQ(looks.peek().job_status, "a");
    EXPECT_EQ(looks.take().job_status, "a");
    EXPECT_EQ(looks.peek().job_status, "b");
}

}  // namespace
}  // namespace velkhost::scenario

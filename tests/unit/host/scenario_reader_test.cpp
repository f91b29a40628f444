// Every key of a scenario file: what it takes and what it comes to when absent.
#include "host/scenario/reader.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cerrno>

namespace velkhost::scenario {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

Description parse(std::string_view text) {
    return parse_description(text, "s.toml");
}

TEST(ScenarioReader, EmptyFileGivesTheDefaults) {
    const Description read = parse("");
    EXPECT_EQ(read.source, "s.toml");
    EXPECT_EQ(read.host.node, "esxi-01.example.com");
    EXPECT_EQ(read.host.start_us, 1772438400'000'000);  // 2026-03-02T08:00:00Z
    EXPECT_EQ(read.jobs.poll_seconds, 10U);
    EXPECT_EQ(read.jobs.first_number, 1U);
    EXPECT_THAT(read.management_controller, IsEmpty());
    EXPECT_THAT(read.file_transfer.transferred, IsEmpty());
    EXPECT_THAT(read.faults, IsEmpty());
}

TEST(ScenarioReader, HostTakesNodeAndStart) {
    const Description read = parse("[host]\nnode = 'n1'\nstart = 1970-01-01T01:00:00.25+00:30");
    EXPECT_EQ(read.host.node, "n1");
    EXPECT_EQ(read.host.start_us, 1'800'250'000);
}

TEST(ScenarioReader, NodeTakesUpTo64Bytes) {
    const std::string longest(64, 'n');
    EXPECT_EQ(parse("[host]\nnode = '" + longest + "'").host.node, longest);
}

TEST(ScenarioReader, JobsTakePollAndFirstNumber) {
    const Description read = parse("[jobs]\npoll_seconds = 3600\nfirst_number = 7");
    EXPECT_EQ(read.jobs.poll_seconds, 3600U);
    EXPECT_EQ(read.jobs.first_number, 7U);
}

TEST(ScenarioReader, FileTransferTakesAbsolutePaths) {
    const Description read = parse("[file_transfer]\ntransferred = ['/a/b', '/c']");
    EXPECT_THAT(read.file_transfer.transferred, ElementsAre("/a/b", "/c"));
}

TEST(ScenarioReader, AnswerWithoutKeysIsAStartedUsualJob) {
    const Description read = parse("[[management_controller.answer]]");
    ASSERT_EQ(read.management_controller.size(), 1U);
    const ServiceAnswer &answer = read.management_controller.front();
    EXPECT_EQ(answer.match, "");
    EXPECT_EQ(answer.return_value, 4096U);
    EXPECT_EQ(answer.status, 0);
    EXPECT_EQ(answer.message, "");
    EXPECT_FALSE(answer.job.has_value());
}

TEST(ScenarioReader, AnswersKeepTheirOrderAndKeys) {
    const Description read = parse(
        "[[management_controller.answer]]\nmatch = 'a'\nreturn_value = 4294967295\n"
        "[[management_controller.answer]]\nstatus = 200\nmessage = 'no'\n");
    ASSERT_EQ(read.management_controller.size(), 2U);
    EXPECT_EQ(read.management_controller[0].match, "a");
    EXPECT_EQ(read.management_controller[0].return_value, 4294967295U);
    EXPECT_EQ(read.management_controller[1].status, 200);
    EXPECT_EQ(read.management_controller[1].message, "no");
}

TEST(ScenarioReader, LooksTakeStatusStateLooksAndAbsent) {
    const Description read = parse(
        "[[management_controller.answer]]\n"
        "job = [{}, { status = '0x00|x', state = 65535, looks = 3 }, { absent = true }]");
    const auto &job = read.management_controller.at(0).job;
    ASSERT_TRUE(job.has_value());
    ASSERT_EQ(job->size(), 3U);
    EXPECT_FALSE((*job)[0].job_status.has_value());
    EXPECT_EQ((*job)[0].job_state, 4);
    EXPECT_EQ((*job)[0].looks, 1U);
    EXPECT_FALSE((*job)[0].absent);
    EXPECT_EQ((*job)[1].job_status, "0x00|x");
    EXPECT_EQ((*job)[1].job_state, 65535);
    EXPECT_EQ((*job)[1].looks, 3U);
    EXPECT_TRUE((*job)[2].absent);
}

TEST(ScenarioReader, EmptyStatusTextIsNotANullStatus) {
    const Description read = parse("[[management_controller.answer]]\njob = [{ status = '' }]");
    EXPECT_EQ(read.management_controller.at(0).job->at(0).job_status, "");
}

TEST(ScenarioReader, EmptyJobIsNotTheUsualJob) {
    const Description read = parse("[[management_controller.answer]]\njob = []");
    ASSERT_TRUE(read.management_controller.at(0).job.has_value());
    EXPECT_THAT(*read.management_controller.at(0).job, IsEmpty());
}

TEST(ScenarioReader, FaultTakesEveryKeyAndKnowsItsLine) {
    const Description read = parse(
        "\n[[fault]]\nstep = 'broker.newObjectPath'\nmatch = 'ZEB'\nafter = 2\ncount = 3\n"
        "code = 6\nmessage = 'gone'");
    ASSERT_EQ(read.faults.size(), 1U);
    const FaultRule &rule = read.faults.front();
    EXPECT_EQ(rule.step, "broker.newObjectPath");
    EXPECT_EQ(rule.match, "ZEB");
    EXPECT_EQ(rule.after, 2U);
    EXPECT_EQ(rule.count, 3U);
    EXPECT_EQ(rule.code, 6);
    EXPECT_EQ(rule.message, "gone");
    EXPECT_EQ(rule.line, 2);
}

TEST(ScenarioReader, FaultStrikesOnceAtOnceByDefault) {
    const Description read = parse("[[fault]]\nstep = 'thread.create'\ncode = 11");
    EXPECT_EQ(read.faults.at(0).after, 0U);
    EXPECT_EQ(read.faults.at(0).count, 1U);
    EXPECT_EQ(read.faults.at(0).match, "");
}

TEST(ScenarioReader, FaultCountTakesAlways) {
    const Description read =
        parse("[[fault]]\nstep = 'thread.create'\ncode = 11\ncount = 'always'");
    EXPECT_EQ(read.faults.at(0).count, FaultRule::kAlways);
}

TEST(ScenarioReader, LibcFaultTakesErrnoNames) {
    const auto code_of = [](const std::string &name) {
        return parse("[[fault]]\nstep = 'open:/tmp/x'\ncode = '" + name + "'").faults.at(0).code;
    };
    EXPECT_EQ(code_of("ENOSPC"), ENOSPC);
    EXPECT_EQ(code_of("EPERM"), EPERM);
    EXPECT_EQ(code_of("EHWPOISON"), EHWPOISON);
}

class ScenarioReaderStep : public ::testing::TestWithParam<const char *> {};

TEST_P(ScenarioReaderStep, IsKnown) {
    const std::string text = std::string("[[fault]]\ncode = 1\nstep = '") + GetParam() + "'";
    EXPECT_EQ(parse(text).faults.at(0).step, GetParam());
}

INSTANTIATE_TEST_SUITE_P(Every, ScenarioReaderStep,
                         ::testing::Values("open:/tmp/sfcb/velkstat*", "unlink:/tmp/x",
                                           "rmdir:/tmp/x", "opendir:/tmp/x", "dlopen:/usr/lib/x.so",
                                           "thread.create", "broker.invokeMethod", "job.create",
                                           "zeb.install", "zeb.job", "filetransfer.delete"));

}  // namespace
}  // namespace velkhost::scenario

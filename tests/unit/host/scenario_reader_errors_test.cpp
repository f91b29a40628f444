// Every way in which a scenario file can be wrong: the message, letter for letter, with its line.
#include "tests/unit/host/scenario_testing.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>

namespace velkhost::scenario {
namespace {

struct Mistake {
    const char *name;
    const char *text;
    const char *message;
};

std::string name_of(const ::testing::TestParamInfo<Mistake> &about) {
    return about.param.name;
}

class ScenarioReaderErrors : public ::testing::TestWithParam<Mistake> {};

TEST_P(ScenarioReaderErrors, NameFileLineAndReason) {
    EXPECT_EQ(error_of(GetParam().text), std::string("s.toml:") + GetParam().message);
}

constexpr const char *kSteps =
    "open:/path, unlink:/path, rmdir:/path, opendir:/path, dlopen:/path, thread.create, "
    "broker.name, job.name, zeb.name, filetransfer.fetch, filetransfer.name, emulex_fc.name, "
    "emulex_cna.name, qlogic.name, brocade.name, broadcom.name, lsi.name, hypervisor.name, "
    "bmc.name";

const std::string kNoStep =
    std::string("2: [fault] \"step\" is none that is served; served are ") + kSteps;
const std::string kMissingStep =
    std::string("1: [fault] \"step\" is missing; served are ") + kSteps;

// clang-format off
INSTANTIATE_TEST_SUITE_P(Root, ScenarioReaderErrors, ::testing::Values(
    Mistake{"UnknownTable", "[hosts]",
            "1: unknown key \"hosts\"; known are host, jobs, controller, management_controller, hypervisor, network, adapter, "
            "emulex_fc, emulex_cna, qlogic, brocade, broadcom, lsi, file_transfer, fault"},
    Mistake{"NoTable", "host = 1", "1: [host] must be a table, not a whole number"},
    Mistake{"NoArrayOfTables", "fault = 1", "1: \"fault\" must be an array of tables, not a whole number"},
    Mistake{"TableForArray", "\n[fault]", "2: \"fault\" must be an array of tables, not a table"},
    Mistake{"ArrayOfNumbers", "fault = [1]", "1: [fault] must be a table, not a whole number"}), name_of);

INSTANTIATE_TEST_SUITE_P(Host, ScenarioReaderErrors, ::testing::Values(
    Mistake{"UnknownKey", "[host]\nnode = 'n'\nnodes = 'n'", "3: [host] unknown key \"nodes\"; known are node, start"},
    Mistake{"NodeNoString", "[host]\nnode = true", "2: [host] \"node\" must be a string, not a boolean"},
    Mistake{"NodeEmpty", "[host]\nnode = ''", "2: [host] \"node\" must be 1 to 64 bytes long"},
    Mistake{"NodeTooLong", "[host]\nnode = '12345678901234567890123456789012345678901234567890123456789012345'",
            "2: [host] \"node\" must be 1 to 64 bytes long"},
    Mistake{"NodeWithNul", "[host]\nnode = \"a\\u0000b\"", "2: [host] \"node\" must not hold a NUL character"},
    Mistake{"StartNoMoment", "[host]\nstart = 'now'",
            "2: [host] \"start\" must be a date-time with an offset (2026-03-02T08:00:00Z), not a string"},
    Mistake{"StartWithoutOffset", "[host]\nstart = 2026-03-02T08:00:00",
            "2: [host] \"start\" must be a date-time with an offset (2026-03-02T08:00:00Z), "
            "not a date or time without an offset"},
    Mistake{"StartNoTime", "[host]\nstart = 2026-03-02",
            "2: [host] \"start\" must be a date-time with an offset (2026-03-02T08:00:00Z), "
            "not a date or time without an offset"},
    Mistake{"StartBefore1970", "[host]\nstart = 1969-12-31T23:59:59Z", "2: [host] \"start\" must not lie before 1970"}), name_of);

INSTANTIATE_TEST_SUITE_P(Jobs, ScenarioReaderErrors, ::testing::Values(
    Mistake{"UnknownKey", "[jobs]\npoll = 1", "2: [jobs] unknown key \"poll\"; known are poll_seconds, first_number"},
    Mistake{"PollZero", "[jobs]\npoll_seconds = 0", "2: [jobs] \"poll_seconds\" must be from 1 to 3600, not 0"},
    Mistake{"PollNegative", "[jobs]\npoll_seconds = -1", "2: [jobs] \"poll_seconds\" must be from 1 to 3600, not -1"},
    Mistake{"PollTooMuch", "[jobs]\npoll_seconds = 3601", "2: [jobs] \"poll_seconds\" must be from 1 to 3600, not 3601"},
    Mistake{"PollFraction", "[jobs]\npoll_seconds = 1.5",
            "2: [jobs] \"poll_seconds\" must be a whole number, not a number with a fraction"},
    Mistake{"FirstZero", "[jobs]\nfirst_number = 0", "2: [jobs] \"first_number\" must be from 1 to 1000000000, not 0"}), name_of);

INSTANTIATE_TEST_SUITE_P(FileTransfer, ScenarioReaderErrors, ::testing::Values(
    Mistake{"UnknownKey", "[file_transfer]\nx = 1", "2: [file_transfer] unknown key \"x\"; known are transferred, user, password, private_key, known_hosts, "
            "connect_seconds, stall_seconds, bytes_per_second, capacity, at_once"},
    Mistake{"NoArray", "[file_transfer]\ntransferred = '/a'",
            "2: [file_transfer] \"transferred\" must be an array of strings, not a string"},
    Mistake{"NoStrings", "[file_transfer]\ntransferred = [\n'/a',\n2]",
            "4: [file_transfer] \"transferred\" must hold strings, not a whole number"},
    Mistake{"RelativePath", "[file_transfer]\ntransferred = ['a']",
            "2: [file_transfer] \"transferred\" must hold absolute paths, not \"a\""}), name_of);

INSTANTIATE_TEST_SUITE_P(Answer, ScenarioReaderErrors, ::testing::Values(
    Mistake{"UnknownServiceKey", "[management_controller]\nanswers = []",
            "2: [management_controller] unknown key \"answers\"; known are answer"},
    Mistake{"UnknownKey", "[[management_controller.answer]]\nretrun_value = 1",
            "2: [management_controller.answer] unknown key \"retrun_value\"; known are match, return_value, "
            "status, message, job"},
    Mistake{"MatchNoString", "[[management_controller.answer]]\nmatch = 1",
            "2: [management_controller.answer] \"match\" must be a string, not a whole number"},
    Mistake{"ReturnValueTooMuch", "[[management_controller.answer]]\nreturn_value = 4294967296",
            "2: [management_controller.answer] \"return_value\" must be from 0 to 4294967295, not 4294967296"},
    Mistake{"StatusTooMuch", "[[management_controller.answer]]\nstatus = 201",
            "2: [management_controller.answer] \"status\" must be from 0 to 200, not 201"},
    Mistake{"MessageWithoutStatus", "[[management_controller.answer]]\nmessage = 'x'",
            "2: [management_controller.answer] \"message\" needs a status other than 0 to go with"},
    Mistake{"JobOfAFailure", "[[management_controller.answer]]\nstatus = 1\njob = []",
            "3: [management_controller.answer] \"job\" needs status 0 and return_value 4096: otherwise no job starts"},
    Mistake{"JobOfAnotherValue", "[[management_controller.answer]]\njob = []\nreturn_value = 0",
            "2: [management_controller.answer] \"job\" needs status 0 and return_value 4096: otherwise no job starts"},
    Mistake{"JobNoArray", "[[management_controller.answer]]\njob = 'x'",
            "2: [management_controller.answer] \"job\" must be an array of tables, not a string"}), name_of);

INSTANTIATE_TEST_SUITE_P(Look, ScenarioReaderErrors, ::testing::Values(
    Mistake{"NoTable", "[[management_controller.answer]]\njob = ['x']",
            "2: [management_controller.answer.job] must be a table, not a string"},
    Mistake{"UnknownKey", "[[management_controller.answer]]\njob = [\n{},\n{ text = 'x' }]",
            "4: [management_controller.answer.job] unknown key \"text\"; known are status, state, looks, absent, "
            "percent"},
    Mistake{"StateTooMuch", "[[management_controller.answer]]\njob = [{ state = 65536 }]",
            "2: [management_controller.answer.job] \"state\" must be from 0 to 65535, not 65536"},
    Mistake{"LooksZero", "[[management_controller.answer]]\njob = [{ looks = 0 }]",
            "2: [management_controller.answer.job] \"looks\" must be from 1 to 1000000, not 0"},
    Mistake{"AbsentNoFlag", "[[management_controller.answer]]\njob = [{ absent = 1 }]",
            "2: [management_controller.answer.job] \"absent\" must be true or false, not a whole number"},
    Mistake{"AbsentWithStatus", "[[management_controller.answer]]\njob = [{ absent = true, status = 'x' }]",
            "2: [management_controller.answer.job] \"status\" cannot be seen while the job is absent"}), name_of);

INSTANTIATE_TEST_SUITE_P(Fault, ScenarioReaderErrors, ::testing::Values(
    Mistake{"UnknownKey", "[[fault]]\nstep = 'zeb.job'\ncode = 1\nwhen = 1",
            "4: [fault] unknown key \"when\"; known are step, match, after, count, code, message"},
    Mistake{"NoStep", "[[fault]]\ncode = 1", kMissingStep.c_str()},
    Mistake{"UnknownStep", "[[fault]]\nstep = 'close:/tmp/x'\ncode = 1", kNoStep.c_str()},
    Mistake{"StepWithoutPath", "[[fault]]\nstep = 'open:'\ncode = 1", kNoStep.c_str()},
    Mistake{"StepWithRelativePath", "[[fault]]\nstep = 'open:tmp'\ncode = 1", kNoStep.c_str()},
    Mistake{"StepWithRest", "[[fault]]\nstep = 'thread.created'\ncode = 1", kNoStep.c_str()},
    Mistake{"StepWithoutName", "[[fault]]\nstep = 'zeb.'\ncode = 1", kNoStep.c_str()},
    Mistake{"AfterNegative", "[[fault]]\nstep = 'zeb.job'\ncode = 1\nafter = -1",
            "4: [fault] \"after\" must be from 0 to 1000000, not -1"},
    Mistake{"CountZero", "[[fault]]\nstep = 'zeb.job'\ncode = 1\ncount = 0",
            "4: [fault] \"count\" must be from 1 to 1000000, not 0"},
    Mistake{"CountOtherWord", "[[fault]]\nstep = 'zeb.job'\ncode = 1\ncount = 'twice'",
            "4: [fault] \"count\" must be a whole number or \"always\""},
    Mistake{"NoErrno", "[[fault]]\nstep = 'thread.create'", "1: [fault] \"code\" is missing: the errno, by number or name"},
    Mistake{"UnknownErrno", "[[fault]]\nstep = 'thread.create'\ncode = 'ENOTHING'",
            "3: [fault] \"code\" is no errno name: \"ENOTHING\""},
    Mistake{"ErrnoTooMuch", "[[fault]]\nstep = 'thread.create'\ncode = 4096",
            "3: [fault] \"code\" must be from 1 to 4095, not 4096"},
    Mistake{"NoCimStatus", "[[fault]]\nstep = 'zeb.job'", "1: [fault] \"code\" is missing: the CIM status, 1 to 200"},
    Mistake{"CimStatusByErrnoName", "[[fault]]\nstep = 'zeb.job'\ncode = 'EIO'",
            "3: [fault] \"code\" must be a whole number, not a string"},
    Mistake{"MessageOfLibc", "[[fault]]\nstep = 'thread.create'\ncode = 1\nmessage = 'x'",
            "4: [fault] \"message\" means nothing to a step of libc; its name says all"},
    Mistake{"MatchOfLibc", "[[fault]]\nstep = 'thread.create'\ncode = 1\nmatch = 'x'",
            "4: [fault] \"match\" means nothing to a step of libc; its name says all"}), name_of);
// clang-format on

TEST(ScenarioReaderErrors, TextsOf1023BytesAreTheLongest) {
    const auto with_match = [](std::size_t length) {
        return error_of("[[management_controller.answer]]\nmatch = '" + std::string(length, 'x') +
                        "'");
    };
    EXPECT_EQ(with_match(1023), "no error");
    EXPECT_EQ(with_match(1024),
              "s.toml:2: [management_controller.answer] \"match\" must be at most 1023 bytes long");
}

TEST(ScenarioReaderErrors, BrokenTomlNamesItsLine) {
    EXPECT_THAT(error_of("[host]\nnode = 'a"), ::testing::StartsWith("s.toml:2: "));
    EXPECT_THAT(error_of("[host]\n[host]\n"), ::testing::StartsWith("s.toml:2: "));
    EXPECT_THAT(error_of(std::string_view("a\0b", 3)), ::testing::StartsWith("s.toml:1: "));
}

TEST(ScenarioReaderErrors, MissingFileNamesItselfAndTheReason) {
    try {
        read_description("/nonexistent/s.toml");
        FAIL() << "read a file that is not there";
    } catch (const ScenarioError &error) {
        EXPECT_STREQ(error.what(), "/nonexistent/s.toml: No such file or directory");
    }
}

TEST(ScenarioReaderErrors, FolderIsNoFile) {
    EXPECT_THROW(read_description("/"), ScenarioError);
    EXPECT_THROW(read_description_if_there("/"), ScenarioError);
}

TEST(ScenarioReaderErrors, FileThatMayBeAbsentGivesTheDefaults) {
    EXPECT_EQ(read_description_if_there("/nonexistent/s.toml").source, "built-in default");
}

}  // namespace
}  // namespace velkhost::scenario

// What a scenario says of the file transfer service: its settings, and the faults of a transfer.
#include "tests/unit/host/scenario_testing.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>

#include "host/scenario/scenario.h"

namespace velkhost::scenario {
namespace {

FileTransferSettings settings(const std::string &keys) {
    return parse("[file_transfer]\n" + keys).file_transfer;
}

FaultRule fault(const std::string &keys) {
    return parse("[[fault]]\nstep = 'filetransfer.fetch'\n" + keys).faults.at(0);
}

TEST(ScenarioTransfers, TrustNobodyAndHaveNoBoundsByDefault) {
    const FileTransferSettings out = settings("");
    EXPECT_FALSE(out.user || out.password || out.private_key || out.known_hosts || out.capacity);
    EXPECT_EQ(out.connect_seconds, 30U);
    EXPECT_EQ(out.stall_seconds, 60U);
    EXPECT_EQ(out.bytes_per_second, 0U);
    EXPECT_EQ(out.at_once, 4U);
}

TEST(ScenarioTransfers, EveryKeyIsRead) {
    const FileTransferSettings out = settings(
        "user = 'u'\npassword = 'p'\nprivate_key = '/k'\nknown_hosts = '/h'\n"
        "connect_seconds = 1\nstall_seconds = 2\nbytes_per_second = 3\ncapacity = 0\nat_once = 5");
    EXPECT_EQ(out.user, "u");
    EXPECT_EQ(out.password, "p");
    EXPECT_EQ(out.private_key, "/k");
    EXPECT_EQ(out.known_hosts, "/h");
    EXPECT_EQ(out.connect_seconds, 1U);
    EXPECT_EQ(out.stall_seconds, 2U);
    EXPECT_EQ(out.bytes_per_second, 3U);
    EXPECT_EQ(out.capacity, 0U);
    EXPECT_EQ(out.at_once, 5U);
}

TEST(ScenarioTransfers, FilesNeedAbsolutePathsAndNumbersTheirRange) {
    EXPECT_EQ(error_of("[file_transfer]\nprivate_key = 'id'"),
              "s.toml:2: [file_transfer] \"private_key\" must be an absolute path, not \"id\"");
    EXPECT_EQ(error_of("[file_transfer]\nknown_hosts = ''"),
              "s.toml:2: [file_transfer] \"known_hosts\" must be an absolute path, not \"\"");
    EXPECT_EQ(error_of("[file_transfer]\nat_once = 0"),
              "s.toml:2: [file_transfer] \"at_once\" must be from 1 to 64, not 0");
    EXPECT_EQ(error_of("[file_transfer]\nstall_seconds = 0"),
              "s.toml:2: [file_transfer] \"stall_seconds\" must be from 1 to 3600, not 0");
}

TEST(ScenarioTransfers, FaultsOfATransferHaveActions) {
    EXPECT_EQ(fault("action = 'refuse'").transfer, TransferFault::kRefuse);
    EXPECT_EQ(fault("action = 'stall'").transfer, TransferFault::kStall);
    EXPECT_EQ(fault("action = 'cut'").transfer, TransferFault::kCut);
    EXPECT_EQ(fault("action = 'full'\nmatch = 'rxc'").transfer, TransferFault::kFull);
    EXPECT_EQ(error_of("[[fault]]\nstep = 'filetransfer.fetch'"),
              "s.toml:1: [fault] \"action\" is missing; known are refuse, stall, cut, full");
    EXPECT_EQ(error_of("[[fault]]\nstep = 'filetransfer.fetch'\naction = 'x'"),
              "s.toml:3: [fault] \"action\" is unknown; known are refuse, stall, cut, full");
    EXPECT_EQ(
        error_of("[[fault]]\nstep = 'filetransfer.fetch'\naction = 'cut'\ncode = 1"),
        "s.toml:4: [fault] unknown key \"code\"; known are step, match, after, count, action");
}

TEST(ScenarioTransfers, FaultStrikesTheTransferThatItMatches) {
    FaultRule rule = fault("action = 'cut'\nmatch = 'rxc'");
    FaultRules rules({rule});
    EXPECT_FALSE(rules.take("filetransfer.fetch", "tftp://h/uefi.xml"));
    EXPECT_FALSE(rules.take("filetransfer.url", "sftp://h/rxc.xml"));
    const auto struck = rules.take("filetransfer.fetch", "sftp://h/rxc.xml");
    ASSERT_TRUE(struck);
    EXPECT_EQ(struck->transfer, TransferFault::kCut);
}

}  // namespace
}  // namespace velkhost::scenario

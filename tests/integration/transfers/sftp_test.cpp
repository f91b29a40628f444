// `velkhost install` with packages on a real SSH server.
#include "tests/integration/transfers/transfers_fixture.h"

#include <gmock/gmock.h>
#include <sys/socket.h>

#include <atomic>

namespace velkhost::testing {
namespace {

using ::testing::Contains;
using ::testing::Each;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::Not;

class SftpTransfer : public TransferTest {
  protected:
    void SetUp() override {
        TransferTest::SetUp();
        server_ = std::make_unique<SftpServer>(server_place_);
    }

    [[nodiscard]] std::string at(std::uint16_t port, const std::string &package) const {
        return "sftp://127.0.0.1:" + std::to_string(port) + (served_ / (package + ".xml")).string();
    }
    [[nodiscard]] std::string at_server(const std::string &package) const {
        return at(server_->port(), package);
    }

    // Scenarios: who the service is, and whom it trusts.
    [[nodiscard]] std::string trusting(std::uint16_t port) const {
        return "[file_transfer]\nuser = '" + std::string(SftpServer::kUser) + "'\nknown_hosts = '" +
               server_->known_hosts(port).string() + "'\n";
    }
    [[nodiscard]] std::string with_key(std::uint16_t port) const {
        return trusting(port) + "private_key = '" + server_->user_key().string() + "'\n";
    }
    [[nodiscard]] std::string with_key() const { return with_key(server_->port()); }
    [[nodiscard]] std::string with_password(const std::string &password) const {
        return trusting(server_->port()) + "password = '" + password + "'\n";
    }

    // A package that cannot be fetched: its descriptor's transfer fails, and so does, in the second
    // pass, that of the payload that it never named.
    void expect_failed(const nlohmann::json &document, const std::string &reason) const {
        EXPECT_THAT(final_codes(document), ElementsAre(17));
        EXPECT_THAT(codes(document, kRxc), ElementsAre(11, 17));
        EXPECT_THAT(log(document), HasSubstr("jobstatus is " + reason));
        expect_clean(document);
        EXPECT_FALSE(has_store());
        EXPECT_FALSE(has_lock());
    }

    std::unique_ptr<SftpServer> server_;
};

TEST_F(SftpTransfer, RequestOfSeveralPackagesIsInstalledAndCleanedUp) {
    const auto document =
        install({at_server(kRxc), at_server(kUefi), at_server(kDiagnostics)}, with_key());
    EXPECT_EQ(document["exit_code"], 0) << document;
    EXPECT_THAT(final_codes(document), ElementsAre(50, 50, 50));
    EXPECT_THAT(codes(document, kRxc), Contains(10));
    EXPECT_THAT(log(document), HasSubstr("retCode: 6"));
    expect_clean(document);
    EXPECT_FALSE(has_store());
    EXPECT_FALSE(has_lock());
}

TEST_F(SftpTransfer, PasswordOpensAsWell) {
    const auto document = install({at_server(kRxc)}, with_password(SftpServer::kPassword));
    EXPECT_THAT(final_codes(document), ElementsAre(50));
}

TEST_F(SftpTransfer, LocationsOwnUserComesBeforeTheScenarios) {
    std::string uri = at_server(kRxc);
    uri.insert(sizeof("sftp://") - 1, std::string(SftpServer::kUser) + ":correct%20horse@");
    const auto document = install({uri}, trusting(server_->port()) + "password = 'wrong'\n");
    EXPECT_THAT(final_codes(document), ElementsAre(50));
}

TEST_F(SftpTransfer, WrongPasswordIsRefused) {
    expect_failed(install({at_server(kRxc)}, with_password("wrong horse")),
                  "Authentication failure");
}

TEST_F(SftpTransfer, WithoutKeyAndPasswordNothingIsTried) {
    expect_failed(install({at_server(kRxc)}, trusting(server_->port())), "Authentication failure");
}

TEST_F(SftpTransfer, StrangersKeyIsRefused) {
    expect_failed(install({at_server(kRxc)}, trusting(server_->port()) + "private_key = '" +
                                                 (server_place_ / "stranger").string() + "'\n"),
                  "Authentication failure");
}

TEST_F(SftpTransfer, UnknownHostKeyIsRefused) {
    expect_failed(install({at_server(kRxc)}, "[file_transfer]\nuser = 'velk'\npassword = '" +
                                                 std::string(SftpServer::kPassword) + "'\n"),
                  "The server's host key is not known");
    expect_failed(install({at_server(kRxc)}, with_key(1)), "The server's host key is not known");
}

TEST_F(SftpTransfer, ChangedHostKeyIsRefused) {
    expect_failed(install({at_server(kRxc)}, "[file_transfer]\nuser = 'velk'\nknown_hosts = '" +
                                                 server_->wrong_known_hosts().string() +
                                                 "'\npassword = '" + SftpServer::kPassword + "'\n"),
                  "The server's host key is not the known one");
}

TEST_F(SftpTransfer, PasswordIsNotSeenInTheJob) {
    std::string uri = at_server(kRxc);
    uri.insert(sizeof("sftp://") - 1, "velk:secret@");
    const auto document = install({uri}, "");
    EXPECT_THAT(codes(document, kRxc), Contains(11));
    for (const auto &line : document["log"]) {
        const auto text = line.get<std::string>();
        EXPECT_FALSE(text.find("jobstatus") != std::string::npos &&
                     text.find("secret") != std::string::npos)
            << text;
    }
}

TEST_F(SftpTransfer, PackageThatIsNotThereFailsAlone) {
    const auto document = install({at_server("missing"), at_server(kRxc)}, with_key());
    EXPECT_THAT(final_codes(document), ElementsAre(17, 50));
    EXPECT_THAT(log(document), HasSubstr("No such file or directory"));
    EXPECT_FALSE(has_store());
}

TEST_F(SftpTransfer, FileThatMayNotBeReadFails) {
    const auto file = served_ / (std::string(kRxc) + ".xml");
    std::filesystem::permissions(file, std::filesystem::perms::none);
    expect_failed(install({at_server(kRxc)}, with_key()),
                  "Could not open remote file for reading: Permission denied");
}

TEST_F(SftpTransfer, ServerThatIsNotThereIsRefused) {
    const std::uint16_t port = free_tcp_port();
    expect_failed(install({at(port, kRxc)}, with_key(port)), "Failed to connect to 127.0.0.1");
}

TEST_F(SftpTransfer, LineThatFallsSilentInTheMiddleIsATimeOut) {
    const Relay relay(SOCK_STREAM, server_->port(), {.good_bytes = 60'000});
    const auto document =
        install({at(relay.port(), kRxc)}, with_key(relay.port()) + "stall_seconds = 1\n");
    EXPECT_THAT(final_codes(document), ElementsAre(11));
    EXPECT_THAT(log(document), HasSubstr("jobstatus is Operation too slow"));
    EXPECT_FALSE(has_store());
}

TEST_F(SftpTransfer, LineThatIsCutInTheMiddleFailsAtOnce) {
    const Relay relay(SOCK_STREAM, server_->port(), {.good_bytes = 60'000, .hangs_up = true});
    const auto document = install({at(relay.port(), kRxc)}, with_key(relay.port()));
    EXPECT_THAT(final_codes(document), ElementsAre(11));
    EXPECT_FALSE(has_store());
}

TEST_F(SftpTransfer, ServerThatIsKilledInTheMiddleFails) {
    std::atomic<bool> killed{false};
    const Relay relay(SOCK_STREAM, server_->port(),
                      {.good_bytes = 60'000,
                       .then =
                           [&] {
                               server_->kill();
                               killed = true;
                           },
                       .hangs_up = true});
    const auto document = install({at(relay.port(), kRxc)}, with_key(relay.port()));
    EXPECT_THAT(final_codes(document), ElementsAre(11));
    EXPECT_TRUE(killed);
    expect_clean(document);
}

// The payload of 131072 bytes takes 64 seconds, of which the client sees six times ten.
TEST_F(SftpTransfer, SlowLinkShowsARunningJobAtEveryPoll) {
    const auto document = install({at_server(kRxc)}, with_key() + "bytes_per_second = 2048\n");
    EXPECT_EQ(document["exit_code"], 0);
    EXPECT_THAT(codes(document, kRxc), Contains(15));
    EXPECT_THAT(log(document), HasSubstr("Transfer file var sftp time elapses 60"));
    EXPECT_THAT(log(document), HasSubstr("jobstatus is Transferring, 32768 of 131072 bytes"));
    EXPECT_THAT(log(document), Not(HasSubstr("sftp time elapses 70")));
}

TEST_F(SftpTransfer, RunsOverTheNetworkAreTheSame) {
    const auto first = install({at_server(kRxc)}, with_key() + "bytes_per_second = 3000\n");
    const auto second = install({at_server(kRxc)}, with_key() + "bytes_per_second = 3000\n");
    EXPECT_EQ(first["history"], second["history"]);
    EXPECT_EQ(first["host_seconds"], second["host_seconds"]);
}

TEST_F(SftpTransfer, FullStoreFailsWhatDoesNotFit) {
    const auto document = install({at_server(kRxc)}, with_key() + "capacity = 100000\n");
    EXPECT_THAT(codes(document, kRxc), ElementsAre(10, 11));
    EXPECT_THAT(log(document), HasSubstr("jobstatus is Not enough space in the file store"));
    EXPECT_FALSE(has_store());
}

TEST_F(SftpTransfer, MixedRequestIsFetchedAsItsFirst) {
    const TftpServer tftp(served_, server_place_);
    const std::string by_tftp =
        "tftp://127.0.0.1:" + std::to_string(tftp.port()) + "/" + kUefi + ".xml";
    const auto document = install({at_server(kRxc), by_tftp, package(kDiagnostics)}, with_key());
    // The service fetches from any server; a local file is none of its affair.
    EXPECT_THAT(final_codes(document), ElementsAre(50, 50, 17));
    EXPECT_THAT(log(document), Not(HasSubstr("downloadFileViaTFTP")));
}

TEST_F(SftpTransfer, UnreadableJobIsGivenUpAfterThreeLooks) {
    const auto document =
        install({at_server(kRxc)},
                with_key() + "[[fault]]\nstep = 'filetransfer.job'\ncode = 1\ncount = 3\n");
    EXPECT_THAT(codes(document, kRxc), Contains(11));
    expect_clean(document);
}

struct FaultCase {
    const char *action;
    const char *reason;
};

class SftpFault : public SftpTransfer, public ::testing::WithParamInterface<FaultCase> {};

TEST_P(SftpFault, FailsTheTransferThatItStrikes) {
    const auto document =
        install({at_server(kRxc)},
                with_key() + "[[fault]]\nstep = 'filetransfer.fetch'\nmatch = '.xml'\naction = '" +
                    GetParam().action + "'\n");
    const bool stalls = std::string(GetParam().action) == "stall";
    if (!stalls) {
        expect_failed(document, GetParam().reason);
        return;
    }
    EXPECT_THAT(codes(document, kRxc), ElementsAre(15, 11, 17));
    EXPECT_THAT(log(document), HasSubstr("Transfer file var sftp time elapses 50"));
    EXPECT_THAT(log(document), HasSubstr(GetParam().reason));
}

INSTANTIATE_TEST_SUITE_P(Every, SftpFault,
                         ::testing::Values(FaultCase{"refuse", "The server cannot be reached"},
                                           FaultCase{"stall", "Nothing came any more"},
                                           FaultCase{"cut", "Wrong size: "},
                                           FaultCase{"full", "Not enough space"}),
                         [](const auto &about) { return std::string(about.param.action); });

}  // namespace
}  // namespace velkhost::testing

// `velkhost install` with packages on a real TFTP server.
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

// Short time-outs, for those who wait for nothing.
constexpr const char *kImpatient = "[file_transfer]\nconnect_seconds = 1\nstall_seconds = 1\n";

class TftpTransfer : public TransferTest {
  protected:
    void SetUp() override {
        TransferTest::SetUp();
        server_ = std::make_unique<TftpServer>(served_, server_place_);
    }

    static std::string at(std::uint16_t port, const std::string &package) {
        return "tftp://127.0.0.1:" + std::to_string(port) + "/" + package + ".xml";
    }
    [[nodiscard]] std::string at_server(const std::string &package) const {
        return at(server_->port(), package);
    }

    std::unique_ptr<TftpServer> server_;
};

TEST_F(TftpTransfer, RequestOfSeveralPackagesIsInstalledAndCleanedUp) {
    const auto document = install({at_server(kRxc), at_server(kUefi), at_server(kDiagnostics)}, "");
    EXPECT_EQ(document["exit_code"], 0) << document;
    EXPECT_THAT(final_codes(document), ElementsAre(50, 50, 50));
    // The descriptor and the payload; then the installation.
    EXPECT_THAT(codes(document, kRxc), Contains(10));
    EXPECT_EQ(document["packages"].size(), 3U);
    expect_clean(document);
    EXPECT_FALSE(has_store());
    EXPECT_FALSE(has_lock());
    EXPECT_THAT(log(document), HasSubstr("Complete deleteTransferedFile."));
}

TEST_F(TftpTransfer, LocalRequestKeepsStoreAndLock) {
    const auto document = install({package()}, "");
    EXPECT_EQ(document["exit_code"], 0);
    EXPECT_TRUE(has_store());
    EXPECT_TRUE(has_lock());
    EXPECT_THAT(log(document), HasSubstr("did not transfer it: " + package()));
}

TEST_F(TftpTransfer, PackageThatIsNotThereFailsAlone) {
    const auto document = install({at_server("missing"), at_server(kRxc)}, "");
    EXPECT_EQ(document["exit_code"], 1);
    EXPECT_THAT(final_codes(document), ElementsAre(11, 50));
    EXPECT_THAT(codes(document, "missing"), ElementsAre(11));
    expect_clean(document);
    EXPECT_FALSE(has_store());
}

TEST_F(TftpTransfer, PayloadThatIsNotThereFailsItsPackage) {
    std::filesystem::remove(served_ / (std::string(kRxc) + ".upd"));
    const auto document = install({at_server(kRxc), at_server(kDiagnostics)}, "");
    EXPECT_THAT(final_codes(document), ElementsAre(11, 50));
    EXPECT_FALSE(has_store());
}

TEST_F(TftpTransfer, ServerThatDoesNotAnswerIsATimeOut) {
    const auto document = install({at(free_udp_port(), kRxc)}, kImpatient);
    EXPECT_THAT(final_codes(document), ElementsAre(12));
    EXPECT_EQ(document["packages"][0]["message"], "TFTP file transfer timeout.");
    // That of the call itself: the network's time is none of the host's.
    EXPECT_EQ(document["host_seconds"], 1.0);
}

TEST_F(TftpTransfer, LineThatFallsSilentInTheMiddleIsATimeOut) {
    const Relay relay(SOCK_DGRAM, server_->port(), {.good_bytes = 60'000});
    const auto document = install({at(relay.port(), kRxc)}, kImpatient);
    EXPECT_THAT(final_codes(document), ElementsAre(12));
    expect_clean(document);
    EXPECT_FALSE(has_store());
}

TEST_F(TftpTransfer, ServerThatIsKilledInTheMiddleIsATimeOut) {
    std::atomic<bool> killed{false};
    const Relay relay(SOCK_DGRAM, server_->port(), {.good_bytes = 60'000, .then = [&] {
                                                        server_->kill();
                                                        killed = true;
                                                    }});
    const auto document = install({at(relay.port(), kRxc)}, kImpatient);
    EXPECT_THAT(final_codes(document), ElementsAre(12));
    EXPECT_TRUE(killed);
}

TEST_F(TftpTransfer, SlowLinkTakesItsTimeOnTheHostsClock) {
    const auto slow = install({at_server(kRxc)}, "[file_transfer]\nbytes_per_second = 4096\n");
    const auto fast = install({at_server(kRxc)}, "");
    EXPECT_EQ(slow["exit_code"], 0);
    const auto bytes = std::filesystem::file_size(served_ / (std::string(kRxc) + ".xml")) +
                       std::filesystem::file_size(served_ / (std::string(kRxc) + ".upd"));
    EXPECT_NEAR(slow["host_seconds"].get<double>() - fast["host_seconds"].get<double>(),
                static_cast<double>(bytes) / 4096, 0.001);
}

TEST_F(TftpTransfer, FullStoreFailsWhatDoesNotFit) {
    const auto document = install({at_server(kRxc)}, "[file_transfer]\ncapacity = 100000\n");
    EXPECT_THAT(final_codes(document), ElementsAre(14));
    EXPECT_EQ(document["packages"][0]["message"], "Not enough space on VMWare ESXi storage.");
    EXPECT_THAT(codes(document, kRxc), ElementsAre(10, 14));  // the descriptor did
    EXPECT_FALSE(has_store());
}

TEST_F(TftpTransfer, RoomIsThereAgainForTheNextPackage) {
    // Each of the two payloads fits, both together would not.
    const auto document =
        install({at_server(kRxc), at_server(kDiagnostics)}, "[file_transfer]\ncapacity = 140000\n");
    EXPECT_THAT(final_codes(document), Each(50));
}

TEST_F(TftpTransfer, MixedRequestIsFetchedAsItsFirst) {
    const auto document = install(
        {at_server(kRxc), "sftp://127.0.0.1/" + std::string(kUefi) + ".xml", package()}, "");
    EXPECT_THAT(final_codes(document), ElementsAre(50, 13, 13));
}

TEST_F(TftpTransfer, RemoteLocationBehindALocalOneIsNotFetched) {
    const auto document = install({package(), at_server(kUefi)}, "");
    EXPECT_EQ(document["packages"][0]["code"], 50);
    EXPECT_THAT(codes(document, kUefi), Contains(12));  // no such local descriptor
    EXPECT_THAT(codes(document, kUefi), ::testing::Not(Contains(10)));
    EXPECT_TRUE(has_lock());
}

struct FaultCase {
    const char *action;
    int code;
    double seconds;  // of the host
};

class TftpFault : public TftpTransfer, public ::testing::WithParamInterface<FaultCase> {};

TEST_P(TftpFault, FailsTheTransferThatItStrikes) {
    const auto document = install({at_server(kRxc), at_server(kDiagnostics)},
                                  "[[fault]]\nstep = 'filetransfer.fetch'\nmatch = '_rxc_'\n"
                                  "action = '" +
                                      std::string(GetParam().action) + "'\n");
    EXPECT_THAT(final_codes(document), ElementsAre(GetParam().code, 50));
    const auto alone = install({at_server(kDiagnostics)}, "");
    EXPECT_EQ(document["host_seconds"].get<double>() - alone["host_seconds"].get<double>(),
              GetParam().seconds);
    expect_clean(document);
    EXPECT_FALSE(has_store());
}

INSTANTIATE_TEST_SUITE_P(Every, TftpFault,
                         ::testing::Values(FaultCase{"refuse", 11, 0}, FaultCase{"stall", 12, 60},
                                           FaultCase{"cut", 11, 0}, FaultCase{"full", 14, 0}),
                         [](const auto &about) { return std::string(about.param.action); });

}  // namespace
}  // namespace velkhost::testing

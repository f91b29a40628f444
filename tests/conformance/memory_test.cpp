// What a request takes from the broker and gives back, and what it does when the broker has nothing
// to give.

#include "tests/conformance/request_test.h"

namespace {

using Texts = std::vector<std::string>;
namespace cim = velktest::cim;

constexpr const char *kService = "PAKRO_VMpkgInstallationService";
constexpr const char *kTransfer = "ZEB_FileTransferService";
constexpr const char *kController = "ZEB_SoftwareInstallationService";

class Memory : public velktest::RequestTest {
  protected:
    // A request for one firmware package whose update takes two looks.
    void run_one() {
        show({"0x00|Initialization", velktest::kJobDone});
        run({add({.file = "uefi"})});
    }

    // Nothing is left but what the broker frees itself.
    void expect_clean() {
        EXPECT_EQ(broker().ledger().live_clones(), 0U);
        EXPECT_EQ(broker().ledger().report(), "");
        EXPECT_EQ(host().value("Velkchild_thread_num"), 0);
    }
};

}  // namespace

// -- Given back --

TEST_F(Memory, RequestLeavesNoCloneAndNoFinding) {
    run_one();
    expect_clean();
    EXPECT_EQ(results(), Texts{installed("uefi")});
}

TEST_F(Memory, ManyRequestsLeaveNoMoreThanOne) {
    for (int i = 0; i < 5; ++i) {
        run_one();
        expect_clean();
    }
}

TEST_F(Memory, ContextIsClonedOncePerRequest) {
    run_one();
    EXPECT_EQ(host().uses("broker.cloneContext"), 1);
    run_one();
    EXPECT_EQ(host().uses("broker.cloneContext"), 2);
    expect_clean();
}

TEST_F(Memory, InstallRunsOnWhenTheCallThatStartedItIsOver) {
    show({"0x00|Initialization", velktest::kJobDone});
    const std::string uefi = add({.file = "uefi"});
    velkhost::broker::RequestOptions fresh;
    fresh.thread = velkhost::broker::RequestThread::kFresh;
    const auto reply =
        broker().invoke_method(host().service_path(), "InstallFromURI", {uri(uefi)}, fresh);
    EXPECT_EQ(reply.return_value, cim::Value::uint32(4096));
    EXPECT_TRUE(host().wait_until_idle());
    EXPECT_EQ(results(), Texts{installed("uefi")});
    expect_clean();
}

TEST_F(Memory, FailingPackagesLeaveNothingEither) {
    show({"0x00|no such text", "0x10|Process Completed"});
    run({add({.file = "uefi"}), add({.file = "rxc", .category = "RXC"}), "file:///no/such.xml",
         add({.file = "tape", .type = "2"})});
    expect_clean();
    host().controller().end = {CMPI_RC_ERR_FAILED, "refused", 0, {}};
    run({add({.file = "uefi"})});
    EXPECT_EQ(results(), Texts{"uefi: 56: Package installation error message: refused"});
    expect_clean();
}

TEST_F(Memory, TransferredPackagesLeaveNothingEither) {
    host().transfer().answers["TransferViaTFTP"].outputs = {
        {"DestinationURI", velktest::kit::Text(add({.file = "uefi"}))}};
    show_done(1);
    run({"tftp://server/pkgs/uefi.xml"});
    EXPECT_EQ(results(), Texts{installed("uefi")});
    expect_clean();
}

TEST_F(Memory, RefusalsLeaveNothing) {
    host().remove_job_library();
    install({});
    install({uri()});
    host().call("NoSuchMethod");
    expect_clean();
}

// -- Not to be had --

struct Shortage {
    const char *name;
    const char *step;
    const char *subject;
    const char *result;  // of the package
    int orders;          // that reach the controller
};

void PrintTo(const Shortage &row, std::ostream *out) {
    *out << row.name;
}

class MemoryShortage : public Memory, public testing::WithParamInterface<Shortage> {};

TEST_P(MemoryShortage, EndsTheRequestWithItsResult) {
    const std::string uefi = add({.file = "uefi"});
    if (GetParam().orders > 0) {
        show_done(1);
    }
    host().fail_service(GetParam().step, GetParam().subject, CMPI_RC_ERR_FAILED, "none left");
    run({uefi});
    EXPECT_EQ(results(), Texts{GetParam().result});
    EXPECT_EQ(orders().size(), static_cast<std::size_t>(GetParam().orders));
    EXPECT_GT(host().uses(GetParam().step), 0);
    expect_clean();
}

constexpr const char *kInstalled = "uefi: 50: Package installation successfully.";
constexpr const char *kInitialized = "uefi: 0: Package Initialization finished";
constexpr const char *kNotStarted = "uefi: 56: Package installation error message: ";

const Shortage kShortages[] = {
    {"PathOfTheTransferService", "broker.newObjectPath", kTransfer, kInstalled, 1},
    {"PathOfTheController", "broker.newObjectPath", kController, kInitialized, 0},
    {"PathOfTheJob", "broker.newObjectPath", "ZEB_ConcreteJob", kInstalled, 1},
    {"CloneOfTheContext", "broker.cloneContext", "", kInitialized, 0},
};

INSTANTIATE_TEST_SUITE_P(Broker, MemoryShortage, testing::ValuesIn(kShortages),
                         [](const auto &row) { return std::string(row.param.name); });

TEST_F(Memory, ControllerGetsNoOrderWithoutArguments) {
    host().fail_service("broker.newArgs", "", CMPI_RC_ERR_FAILED);
    run({add({.file = "uefi"})});
    ASSERT_EQ(results().size(), 1U);
    EXPECT_TRUE(results()[0].starts_with(kNotStarted)) << results()[0];
    EXPECT_EQ(record(0).OrderFlag, 1000);
    expect_clean();
}

TEST_F(Memory, DeletionWithoutAPathIsLoggedAndGoesOn) {
    host().fail_service("broker.newObjectPath", kTransfer, CMPI_RC_ERR_FAILED);
    show_done(1);
    run({add({.file = "uefi"})});
    EXPECT_EQ(velktest::occurrences(host().log(), "Can't create deleteTransferedFile object.\n"),
              2);
    EXPECT_EQ(velktest::occurrences(host().log(), "deleteTransferedFile failed.\n"), 2);
}

TEST_F(Memory, TransferWithoutAPathIsReported) {
    host().fail_service("broker.newObjectPath", kTransfer, CMPI_RC_ERR_FAILED);
    run({"tftp://server/pkgs/a.xml"});
    const std::string report =
        "a: 16: Package download error message: Create CMPIObjectPath failed.";
    EXPECT_THAT(history(), testing::Contains("0 velkstatVELK-1.txt 1|" + report + "|"));
    EXPECT_EQ(results(), Texts{"a: 18: Invalid Destination URI from TFTP file transfer"});
    EXPECT_EQ(record(0).OrderFlag, 1000);
    expect_clean();
}

TEST_F(Memory, ServiceInstanceIsAnsweredWithSuccessThoughNothingCanBeMade) {
    for (const char *step : {"broker.newObjectPath", "broker.newInstance"}) {
        host().fail_service(step, kService, CMPI_RC_ERR_FAILED);
        EXPECT_TRUE(broker().enumerate_instances(host().service_path()).status.ok()) << step;
        EXPECT_TRUE(broker().enumerate_instance_names(host().service_path()).status.ok()) << step;
    }
    expect_clean();
}

TEST_F(Memory, RefusalWithoutItsMessageKeepsItsCode) {
    host().fail_service("broker.newString", "InValid Method Name", CMPI_RC_ERR_FAILED);
    const auto reply = host().call("NoSuchMethod");
    EXPECT_EQ(reply.status.code, 17);
    EXPECT_EQ(reply.status.message, "");
    EXPECT_TRUE(reply.return_done);
}

TEST_F(Memory, AcceptedRequestWithoutAPathForItsJobStillCounts) {
    host().fail_service("broker.newObjectPath", "ZEB_ConcreteJob", CMPI_RC_ERR_FAILED);
    const auto reply = install({uri()});
    EXPECT_EQ(reply.return_value, cim::Value::uint32(4096));
    EXPECT_EQ(reply.out.find("Job"), nullptr);
    EXPECT_TRUE(host().wait_until_idle());
}

// A whole request: what the other services are asked and when, and how its status goes on.

#include "tests/conformance/request_test.h"

namespace {

using velktest::entry;
using velktest::Pause;
using velktest::RequestTest;
namespace cim = velktest::cim;
namespace fs = std::filesystem;

using Texts = std::vector<std::string>;

using GetStatus = int(const char *instance_id, int *job_state, char *message, int size);
using CleanUp = int(const char *instance_id);

const std::string kLookAtJob = "getInstance zeb/cimv2:ZEB_UpdateJob()";

std::string order(const std::string &payload, int operation = 0, int reboot = 1) {
    return "invokeMethod zeb/cimv2:ZEB_SoftwareInstallationService.InstallFromURI(URI=\"" +
           payload + "\", Update_Operation=" + std::to_string(operation) +
           ", reboot_option=" + std::to_string(reboot) + ")";
}

class RequestFlow : public RequestTest {
  protected:
    struct Query {
        int result;
        int state;
        std::string message;
        bool operator==(const Query &) const = default;
    };

    Query query(const std::string &id = "VELK-1") {
        int state = -1;
        char message[2048] = "(untouched)";
        const int result = host().function<GetStatus>("getVELKStatus")(id.c_str(), &state, message,
                                                                       sizeof message);
        return {result, state, message};
    }

    int clean_up(const std::string &id = "VELK-1") {
        return host().function<CleanUp>("VELKStatusCleanup")(id.c_str());
    }
};

}  // namespace

// -- What other services are asked --

TEST_F(RequestFlow, ServicesAreAskedInOrderWithTheDocumentedArguments) {
    const std::string rxc = add({.file = "rxc", .category = "RXC"});
    const std::string uefi = add({.file = "uefi"});
    show({"0x00|Initialization", velktest::kJobDone, velktest::kJobDone});
    run({rxc, uefi});
    EXPECT_EQ(host().up_calls(),
              (Texts{deletion(rxc), deletion(uefi), order(payload("uefi")), kLookAtJob, kLookAtJob,
                     deletion(payload("uefi")), order(payload("rxc")), kLookAtJob,
                     deletion(payload("rxc"))}));
    EXPECT_TRUE(host().job().is_over());
}

TEST_F(RequestFlow, ControllersServiceIsNamedByItsFourKeys) {
    const std::vector<std::pair<std::string, std::string>> keys = {
        {"SystemCreationClassName", "ZEB_ManagementController"},
        {"SystemName", "ManagementController"},
        {"CreationClassName", "ZEB_SoftwareInstallationService"},
        {"Name", "RXCSoftwareInstallatiIonService"}};
    show_done(1);
    run({add({.file = "uefi"})});
    ASSERT_EQ(host().controller().orders.size(), 1U);
    EXPECT_EQ(host().controller().orders[0].keys, keys);
}

TEST_F(RequestFlow, UpdateArgsReachTheController) {
    struct {
        const char *text;
        int operation, reboot;
    } const cases[] = {
        {"--backup --no-reboot", 1, 0}, {"--backup", 1, 1}, {"--no-reboot", 0, 0}, {"none", 0, 1}};
    const std::string uefi = add({.file = "uefi"});
    for (const auto &row : cases) {
        forget_so_far();
        show_done(1);
        install({uri(uefi), update_args(row.text)});
        ASSERT_TRUE(host().wait_until_idle());
        EXPECT_THAT(host().up_calls(),
                    testing::Contains(order(payload("uefi"), row.operation, row.reboot)))
            << row.text;
    }
}

TEST_F(RequestFlow, PackagesAreInstalledInTheOrderOfTheirFlags) {
    const struct {
        const char *file, *category;
    } kinds[] = {{"fpga", "FPGA"}, {"rxc", "RXC"},   {"diag", "Diagnostics"},
                 {"uefi", "UEFI"}, {"rxc2", "RXC2"}, {"uefi2", "UEFI"}};
    Texts locations;
    for (const auto &kind : kinds) {
        locations.push_back(add({.file = kind.file, .category = kind.category}));
    }
    show_done(6);
    run(locations);
    EXPECT_EQ(orders(), (Texts{payload("uefi2"), payload("uefi"), payload("diag"), payload("rxc2"),
                               payload("rxc"), payload("fpga")}))
        << "ties go to the later package";
    const auto &sequence = host().data<int[20]>("PkgSeq");
    EXPECT_EQ(std::vector<int>(sequence, sequence + 6), (std::vector<int>{5, 3, 2, 4, 1, 0}));
}

TEST_F(RequestFlow, PrerequisiteIsInstalledBeforeItsDependant) {
    const std::string uefi = add({.file = "uefi", .prerequisites = {"fpga"}});
    const std::string fpga = add({.file = "fpga", .category = "FPGA"});
    show_done(2);
    run({uefi, fpga});
    EXPECT_EQ(orders(), (Texts{payload("fpga"), payload("uefi")}));
    EXPECT_EQ(record(1).OrderFlag, 249);
}

TEST_F(RequestFlow, PrerequisiteLoweredToRejectedIsPassedBySilently) {
    const std::string needs = add({.file = "needs", .type = "2", .prerequisites = {"other"}});
    const std::string other = add({.file = "other", .type = "2"});
    run({needs, other});
    EXPECT_EQ(record(1).OrderFlag, 1000);
    EXPECT_EQ(results(), (Texts{unsupported("needs"), initialized("other")}));
    EXPECT_EQ(host().up_calls(), (Texts{deletion(needs), deletion(other)}));
}

TEST_F(RequestFlow, PackageOfAnotherTypeIsNotSupported) {
    const std::string tape = add({.file = "tape", .category = "Tape", .type = "2"});
    run({tape});
    EXPECT_EQ(results(), Texts{unsupported("tape")});
    EXPECT_EQ(host().up_calls(), Texts{deletion(tape)}) << "no payload is fetched or deleted";
    EXPECT_EQ(history().back(), "0 velkstatVELK-1.txt 1|" + unsupported("tape") + "|");
}

TEST_F(RequestFlow, HypervisorBundleIsNeitherFetchedNorDeleted) {
    const std::string bundle = add({.file = "esxi", .category = "Embedded Hypervisor"});
    run({bundle});
    EXPECT_EQ(host().up_calls(), Texts{deletion(bundle)});
    EXPECT_EQ(velktest::occurrences(host().log(), "Begin to Deploy.\n"), 1);
    EXPECT_EQ(std::string(record(0).LocalPkgURI), bundle);
}

// -- Time and status --

TEST_F(RequestFlow, TimelineIsExact) {
    const std::string rxc = add({.file = "rxc", .category = "RXC"});
    const std::string uefi = add({.file = "uefi"});
    show({"0x00|Initialization", "0x00|updating firmware", velktest::kJobDone, velktest::kJobDone});
    ASSERT_NO_FATAL_FAILURE(start({rxc, uefi}));
    EXPECT_EQ(host().own_pauses(), (std::vector<Pause>{{0, 1}}));
    EXPECT_TRUE(host().wait_until_idle());
    EXPECT_EQ(host().other_pauses(), (std::vector<Pause>{{0, 10}, {10, 10}, {20, 10}, {30, 10}}));
    EXPECT_THAT(host().log(), testing::HasSubstr(entry("asyncInstallAllPkgs finish.\n", 40)));
}

TEST_F(RequestFlow, StatusFileTellsEveryStage) {
    const std::string rxc = add({.file = "rxc", .category = "RXC"});
    const std::string uefi = add({.file = "uefi"});
    show({"0x00|Initialization", "0x00|updating firmware", velktest::kJobDone, velktest::kJobDone});
    run({rxc, uefi});
    const std::string waiting = initialized("rxc");
    EXPECT_EQ(history(),
              (Texts{
                  "0 velkstat.txt 0|",
                  "0 velkstat.txt 0|",
                  "10 velkstatVELK-1.txt 0|" + waiting +
                      "|uefi: 62: Initialization and Package installation is running.|",
                  "20 velkstatVELK-1.txt 0|" + waiting +
                      "|uefi: 62: Updating and Package installation is running.|",
                  "30 velkstatVELK-1.txt 1|" + waiting + "|" + installed("uefi") + "|",
                  "40 velkstatVELK-1.txt 0|" + installed("rxc") + "|" + installed("uefi") + "|",
              }));
    EXPECT_EQ(host().value("totalstatus"), 0) << "the last package was not the last to report";
}

TEST_F(RequestFlow, JobStateFollowsTheStatusLine) {
    const std::string uefi = add({.file = "uefi"});
    show({"0x00|RXC rebooting", velktest::kJobDone});
    ASSERT_NO_FATAL_FAILURE(start({uefi}));
    EXPECT_EQ(query(), (Query{0, -1, "(untouched)"})) << "nothing has been reported for this job";
    host().pause(10);
    const std::string running = "0|uefi: 62: RXC rebooting and Package installation is running.|";
    EXPECT_EQ(query(), (Query{0, 4, running}));
    EXPECT_EQ(velktest::read_file(host().at("/tmp/sfcb/getVELKStatus.txt")),
              "begin to record VELK-1-" + running + "\n");
    host().pause(10);
    EXPECT_EQ(query(), (Query{0, 7, "1|" + installed("uefi") + "|"}));
    EXPECT_TRUE(host().wait_until_idle());
    EXPECT_EQ(clean_up(), 1);
    EXPECT_EQ(clean_up(), 0);
    EXPECT_EQ(query(), (Query{0, -1, "(untouched)"}));
    EXPECT_EQ(query("VELK"), (Query{0, -1, "(untouched)"}));
}

TEST_F(RequestFlow, FailedPackageMakesTheJobAnException) {
    const std::string uefi = add({.file = "uefi"});
    show({"0x10|Process Completed"});
    run({uefi});
    EXPECT_EQ(query(), (Query{0, 10, "1|uefi: 53: Need download FFDC File from ESXi.|"}));
}

TEST_F(RequestFlow, OneSuccessAmongFailuresMakesTheJobComplete) {
    show({"0x10|Process Completed", velktest::kJobDone});
    run({add({.file = "uefi"}), add({.file = "uefi2"})});
    EXPECT_EQ(query().state, 7);
}

TEST_F(RequestFlow, HostsOwnJobLibraryPollsTheStatus) {
    host().install_job_library(VELK_JOB_LIBRARY);
    show({"0x00|Initialization", velktest::kJobDone});
    run({add({.file = "uefi"})});
    host().pause(15);
    EXPECT_EQ(velktest::read_file(host().at("/tmp/sfcb/getVELKStatus.txt")),
              "begin to record VELK-1-1|" + installed("uefi") + "|\n");
}

// -- After the request --

TEST_F(RequestFlow, LocalClientKeepsTheLockAndTheFileStore) {
    velktest::write_file(host().at("/var/tmp/filestore/kept.bin"), "x");
    show_done(1);
    run({add({.file = "uefi"})});
    EXPECT_TRUE(fs::exists(host().at("/tmp/sfcb/velk.safelock")));
    EXPECT_TRUE(fs::exists(host().at("/var/tmp/filestore/kept.bin")));
    EXPECT_EQ(velktest::occurrences(host().log(), "Delete the files that left"), 0);
}

TEST_F(RequestFlow, UpdateManagerGetsBothRemoved) {
    velktest::write_file(host().at("/var/tmp/filestore/uefi.xml"), "x");
    const std::string fetched = add({.file = "uefi"});
    host().transfer().answers["TransferViaTFTP"].outputs = {
        {"DestinationURI", velktest::kit::Text(fetched)}};
    show_done(1);
    run({"tftp://server/pkgs/uefi.xml"});
    EXPECT_EQ(results(), Texts{installed("uefi")});
    EXPECT_FALSE(fs::exists(host().at("/tmp/sfcb/velk.safelock")));
    EXPECT_FALSE(fs::exists(host().at("/var/tmp/filestore")));
    EXPECT_EQ(velktest::occurrences(host().log(), "Successfully create safe lock file !\n"), 1);
}

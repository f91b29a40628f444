// Files at sftp:// locations: the service starts a job, which is followed to its end.
#include <array>

#include "tests/unit/library/transfer_fixture.h"

namespace velktest {
namespace {

using ::testing::ElementsAre;
using ::testing::ElementsAreArray;
using ::testing::IsEmpty;
using ::testing::StartsWith;

constexpr const char *kSource = "sftp://server/pkgs/rxc.bin";
constexpr const char *kRunning =
    "15: Package download is running and the update process is running.";
constexpr const char *kDone = "10: Package download completed and the update process is running.";
constexpr const char *kFailed = "11: Package download failed.";
constexpr const char *kUnknown = "17: Unknown Error when package downloading";
constexpr const char *kInvalid = "18: Invalid Destination URI from SFTP file transfer";

constexpr std::uint16_t kStateRunning = 4;
constexpr std::uint16_t kStateCompleted = 7;

using Pauses = std::vector<int>;

class SftpTransfer : public TransferTest {
  protected:
    SftpTransfer() { start_job(); }

    // The service starts its job and names this place; no value: none.
    void start_job(const std::optional<kit::Value> &place = kit::Text(kFetched)) {
        answer(6, place);
        MethodEnd end = transfer().on_transfer(kSource);
        end.outputs.push_back({"Job", kit::Reference{"ZEB_TransferJob", {}}});
        set_end(end);
    }

    void show(std::uint16_t state, const char *status = "under way") {
        transfer_job().show(kit::Text(status), state);
    }

    int fetch(int index = 0) { return run(downloadFileViaSFTP, kSource, index); }
};

std::string begin_log(const std::string &return_value) {
    return entry("Enter downloadFileViaSFTP.\n") + entry("Downloading... \n") + kSource + "\n" +
           entry("retCode: " + return_value + "\n");
}

std::string look_log(const char *status, int state, int elapsed) {
    return entry("Enter GetSFTPJob Status.\n", elapsed) +
           entry("jobstatus is " + std::string(status) + "\n", elapsed) +
           entry("JobState is " + std::to_string(state) + "\n", elapsed);
}

TEST_F(SftpTransfer, IsLoggedStepByStep) {
    show(kStateRunning, "fetching");
    show(kStateCompleted, "fetched");
    EXPECT_EQ(fetch(), 1);
    const char *running = "Package download is running and the update process is running.";
    const char *done = "Package download completed and the update process is running.";
    EXPECT_EQ(log(), begin_log("6") + look_log("fetching", 4, 10) +
                         report_log({TransferTest::kLocation, "rxc", 15, running, 10}) +
                         entry("Transfer file var sftp time elapses ", 20) + "10\n" +
                         look_log("fetched", 7, 20) +
                         report_log({TransferTest::kLocation, "rxc", 10, done, 20}) +
                         entry("DestinationPath is  ", 20) + kFetched + "\n" +
                         entry("Complete downloadFileViaSFTP.\n", 20));
}

TEST_F(SftpTransfer, ServiceAndThenItsJobAreAsked) {
    show(kStateRunning);
    show(kStateCompleted);
    fetch();
    EXPECT_THAT(up_calls(), ElementsAre("invokeMethod zeb/cimv2:ZEB_FileTransferService."
                                        "TransferViaURL(SourceURI=\"sftp://server/pkgs/rxc.bin\", "
                                        "TransferOptions={1}, BlockSize=2048)",
                                        "getInstance zeb/cimv2:ZEB_TransferJob()",
                                        "getInstance zeb/cimv2:ZEB_TransferJob()"));
}

TEST_F(SftpTransfer, RunningJobIsReportedAtEachLookForAsLongAsItRuns) {
    constexpr int kLooks = 400;
    for (int i = 0; i < kLooks; ++i) {
        show(kStateRunning);
    }
    show(kStateCompleted);
    EXPECT_EQ(fetch(), 1);
    std::vector<std::string> expected(kLooks, kRunning);
    expected.emplace_back(kDone);
    EXPECT_THAT(reports(), ElementsAreArray(expected));
    EXPECT_EQ(pauses(), Pauses(kLooks + 1, 10));
    EXPECT_EQ(occurrences(log(), "time elapses 4000\n"), 1);
}

TEST_F(SftpTransfer, JobsStateDecides) {
    constexpr std::array<std::uint16_t, 12> kStates = {0, 2, 3, 5, 6, 7, 8, 9, 10, 11, 13, 65535};
    for (const std::uint16_t state : kStates) {
        SCOPED_TRACE(state);
        clear_log();
        show(state);
        const bool is_fetched = state == kStateCompleted;
        EXPECT_EQ(fetch(), is_fetched ? 1 : 0);
        EXPECT_THAT(reports(), ElementsAre(is_fetched ? kDone : kFailed));
        EXPECT_EQ(package().OrderFlag, 450) << "a transfer that ends badly rejects no package";
        EXPECT_STREQ(package().LocalPkgURI, kFetched);
    }
}

TEST_F(SftpTransfer, JobWithoutAStateHasFailed) {
    transfer_job().show(kit::Text("under way"), kit::Text());
    EXPECT_EQ(fetch(), 0);
    EXPECT_THAT(reports(), ElementsAre(kFailed));
    EXPECT_EQ(occurrences(log(), "JobState is 0\n"), 1);
}

TEST_F(SftpTransfer, EveryOtherReturnValueFailsAfterOnePause) {
    for (const std::uint32_t value : {0U, 1U, 5U, 7U, 4096U}) {
        SCOPED_TRACE(value);
        clear_log();
        package().OrderFlag = 450;
        const std::size_t paused = pauses().size();
        answer(value, kit::Text("file:///store/part"));
        EXPECT_EQ(fetch(), 0);
        EXPECT_THAT(reports(), ElementsAre(kUnknown));
        EXPECT_EQ(package().OrderFlag, 1000);
        EXPECT_EQ(pauses().size(), paused + 1);
        EXPECT_STREQ(package().LocalPkgURI, "file:///store/part");
        EXPECT_EQ(occurrences(log(), "Enter GetSFTPJob Status."), 0);
    }
    EXPECT_EQ(pauses(), Pauses(5, 10));
}

TEST_F(SftpTransfer, FailedCallIsAnUnknownError) {
    set_end({CMPI_RC_ERR_FAILED, "no server", 0, {}});
    EXPECT_EQ(fetch(), 0);
    EXPECT_THAT(reports(), ElementsAre(kUnknown, kInvalid));
    EXPECT_THAT(log(), StartsWith(begin_log("-1")));
    EXPECT_EQ(package().OrderFlag, 1000);
}

TEST_F(SftpTransfer, ServiceThatCannotBeNamedFailsAfterTheCall) {
    fail_service("broker.newObjectPath", "ZEB_FileTransferService", CMPI_RC_ERR_FAILED);
    EXPECT_EQ(fetch(), 0);
    EXPECT_THAT(reports(), ElementsAre(kUnknown, kInvalid));
    EXPECT_EQ(occurrences(log(), "retCode: "), 1);
    EXPECT_EQ(pauses(), Pauses{10});
    EXPECT_EQ(package().OrderFlag, 1000);
    EXPECT_THAT(log(), StartsWith(entry("Enter downloadFileViaSFTP.\n") +
                                  entry("fail to get object path from zeb/cimv2:"
                                        "ZEB_FileTransferService .\n")))
        << "with a blank before the point";
}

TEST_F(SftpTransfer, ThreeLooksInARowWithoutAStatusFailAfterHalfAMinute) {
    transfer_job().show_nothing();
    transfer_job().show(kit::Text(), kStateCompleted);
    transfer_job().hide();
    EXPECT_EQ(fetch(), 0);
    EXPECT_THAT(reports(), ElementsAre(kFailed));
    EXPECT_EQ(pauses(), Pauses(3, 10)) << "one before the first look, none after the third";
    EXPECT_EQ(package().OrderFlag, 450);
    EXPECT_STREQ(package().LocalPkgURI, kFetched);
    EXPECT_EQ(occurrences(log(), "time elapses"), 0);
}

TEST_F(SftpTransfer, EveryKindOfMissingStatusTakesAnAttempt) {
    const auto kinds = {
        +[](UpdateJob &job) { job.show_nothing(); },
        +[](UpdateJob &job) { job.show(kit::Text(), kStateCompleted); },
        +[](UpdateJob &job) { job.show(std::uint16_t{1}, kStateCompleted); },
        +[](UpdateJob &job) { job.hide(); },
    };
    for (const auto &miss : kinds) {
        clear_log();
        miss(transfer_job());
        miss(transfer_job());
        show(kStateCompleted);
        EXPECT_EQ(fetch(), 1);
        EXPECT_THAT(reports(), ElementsAre(kDone));
    }
}

TEST_F(SftpTransfer, ReadableStatusRefillsNoAttempts) {
    transfer_job().hide();
    show(kStateRunning);
    transfer_job().hide();
    show(kStateRunning);
    transfer_job().hide();
    EXPECT_EQ(fetch(), 0);
    EXPECT_THAT(reports(), ElementsAre(kRunning, kRunning, kFailed));
    EXPECT_TRUE(transfer_job().is_over());
    EXPECT_EQ(occurrences(log(), "time elapses 20\n"), 1) << "only what the job ran";
}

TEST_F(SftpTransfer, EachTransferHasItsOwnAttempts) {
    for (int i = 0; i < 2; ++i) {
        transfer_job().hide();
        transfer_job().hide();
        show(kStateCompleted);
        EXPECT_EQ(fetch(), 1);
    }
}

TEST_F(SftpTransfer, EmptyStatusIsAStatus) {
    show(kStateCompleted, "");
    EXPECT_EQ(fetch(), 1);
}

TEST_F(SftpTransfer, JobThatIsNotNamedCannotBeRead) {
    for (const kit::Value &job :
         {kit::Value(kit::Text("ZEB_TransferJob")), kit::Value(kit::Text())}) {
        clear_log();
        set_end({CMPI_RC_OK, "", 6, {{"DestinationURI", kit::Text(kFetched)}, {"Job", job}}});
        EXPECT_EQ(fetch(), 0);
        EXPECT_THAT(reports(), ElementsAre(kFailed));
        EXPECT_EQ(occurrences(log(), "Enter GetSFTPJob Status."), 3);
    }
}

TEST_F(SftpTransfer, PlaceThatIsNoTextIsReportedLastAndStoredAsEmpty) {
    for (const auto &place : no_texts()) {
        clear_log();
        set_field(package().LocalPkgURI, "file:///store/before");
        start_job(place);
        show(kStateCompleted);
        EXPECT_EQ(fetch(), 0);
        EXPECT_THAT(reports(), ElementsAre(kDone, kInvalid));
        EXPECT_STREQ(package().LocalPkgURI, "");
        EXPECT_EQ(package().OrderFlag, 450);
    }
}

TEST_F(SftpTransfer, FailedJobWithoutAPlaceIsReportedTwice) {
    start_job(std::nullopt);
    show(10);
    EXPECT_EQ(fetch(), 0);
    EXPECT_THAT(reports(), ElementsAre(kFailed, kInvalid));
    EXPECT_EQ(package().OrderFlag, 450);
}

TEST_F(SftpTransfer, LongPlaceIsCutAt199Characters) {
    start_job(kit::Text(std::string(5000, 'a')));
    show(kStateCompleted);
    EXPECT_EQ(fetch(), 1);
    EXPECT_EQ(package().LocalPkgURI, std::string(199, 'a'));
}

TEST_F(SftpTransfer, LongStatusDoesNoHarm) {
    show(kStateCompleted, std::string(5000, 's').c_str());
    EXPECT_EQ(fetch(), 1);
    EXPECT_THAT(reports(), ElementsAre(kDone));
}

TEST_F(SftpTransfer, IndexOutsideOfTheTableAsksNobody) {
    const std::string before = session_image();
    for (const int index : {-1, 20}) {
        EXPECT_EQ(fetch(index), 0);
    }
    EXPECT_EQ(session_image(), before);
    EXPECT_THAT(up_calls(), IsEmpty());
    EXPECT_THAT(pauses(), IsEmpty());
}

}  // namespace
}  // namespace velktest

// Files at tftp:// locations: the service answers when the transfer is over.
#include "tests/unit/library/transfer_fixture.h"

namespace velktest {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::StartsWith;

constexpr const char *kSource = "tftp://server/pkgs/rxc.bin";
constexpr const char *kDone = "10: Package download completed and the update process is running.";
constexpr const char *kFailed = "11: Package download failed.";
constexpr const char *kUnknown = "17: Unknown Error when package downloading";
constexpr const char *kInvalid = "18: Invalid Destination URI from TFTP file transfer";

class TftpTransfer : public TransferTest {
  protected:
    int fetch(int index = 0) { return run(downloadFileViaTFTP, kSource, index); }
};

TEST_F(TftpTransfer, IsLoggedStepByStep) {
    answer(0);
    EXPECT_EQ(fetch(), 1);
    EXPECT_EQ(log(),
              entry("Enter downloadFileViaTFTP.\n") + entry("Downloading... \n") + kSource + "\n" +
                  entry("retCode: ") + "0\n" +
                  report_log({kLocation, "rxc", 10,
                              "Package download completed and the update process is running."}) +
                  entry("DestinationPath is  ") + kFetched + "\n" +
                  entry("Complete downloadFileViaTFTP."));
    EXPECT_THAT(pauses(), IsEmpty());
}

TEST_F(TftpTransfer, ServiceIsAskedOnceWithLocationOptionsAndBlockSize) {
    answer(0);
    fetch();
    EXPECT_THAT(up_calls(), ElementsAre("invokeMethod zeb/cimv2:ZEB_FileTransferService."
                                        "TransferViaTFTP(SourceURI=\"tftp://server/pkgs/rxc.bin\", "
                                        "TransferOptions={0}, BlockSize=2048)"));
}

TEST_F(TftpTransfer, ReturnValueSaysWhatBecameOfTheFile) {
    struct {
        std::uint32_t value;
        const char *report;
        bool fetched;
    } const cases[] = {
        {0, kDone, true},
        {1, kFailed, false},
        {2, "12: TFTP file transfer timeout.", false},
        {3, "13: Invalid input parameter in TFTP file transfer.", false},
        {4, "14: Not enough space on VMWare ESXi storage.", false},
        {5, "15: Asynchronous TFTP transfer", true},
        {6, kUnknown, false},
        {7, kUnknown, false},
        {4096, kUnknown, false},
        {0xFFFFFFFF, kUnknown, false},
    };
    for (const auto &row : cases) {
        SCOPED_TRACE(row.value);
        clear_log();
        package().OrderFlag = 450;
        answer(row.value);
        EXPECT_EQ(fetch(), row.fetched ? 1 : 0);
        EXPECT_THAT(reports(), ElementsAre(row.report));
        EXPECT_EQ(package().installResult, std::string("rxc: ") + row.report);
        EXPECT_EQ(package().OrderFlag, row.fetched ? 450 : 1000);
    }
}

TEST_F(TftpTransfer, PlaceIsStoredAlsoAfterAFailure) {
    for (const std::uint32_t value : {0U, 1U, 5U, 6U}) {
        answer(value, kit::Text("file:///store/part-" + std::to_string(value)));
        fetch();
        EXPECT_EQ(package().LocalPkgURI, "file:///store/part-" + std::to_string(value));
    }
}

TEST_F(TftpTransfer, LongPlaceIsCutAt199Characters) {
    for (const std::size_t length : {199U, 200U, 1023U, 5000U}) {
        answer(0, kit::Text(std::string(length, 'a')));
        EXPECT_EQ(fetch(), 1);
        EXPECT_EQ(package().LocalPkgURI, std::string(199, 'a'));
        EXPECT_THAT(package().installResult, StartsWith("rxc: 10: "));
    }
}

TEST_F(TftpTransfer, PlaceThatIsNoTextIsReportedLastAndStoredAsEmpty) {
    for (const auto &place : no_texts()) {
        clear_log();
        set_field(package().LocalPkgURI, "file:///store/before");
        answer(0, place);
        EXPECT_EQ(fetch(), 0);
        EXPECT_THAT(reports(), ElementsAre(kDone, kInvalid));
        EXPECT_STREQ(package().LocalPkgURI, "");
        EXPECT_TRUE(log().ends_with(entry("DestinationPath is  ") + "\n" +
                                    entry("Complete downloadFileViaTFTP.")));
        EXPECT_EQ(package().OrderFlag, 450) << "the place alone rejects no package";
    }
}

TEST_F(TftpTransfer, EmptyPlaceIsAPlace) {
    answer(0, kit::Text(""));
    EXPECT_EQ(fetch(), 1);
    EXPECT_THAT(reports(), ElementsAre(kDone));
    EXPECT_STREQ(package().LocalPkgURI, "");
}

TEST_F(TftpTransfer, FailedTransferWithoutAPlaceIsReportedTwice) {
    answer(2, std::nullopt);
    EXPECT_EQ(fetch(), 0);
    EXPECT_THAT(reports(), ElementsAre("12: TFTP file transfer timeout.", kInvalid));
    EXPECT_EQ(package().OrderFlag, 1000);
}

TEST_F(TftpTransfer, FailedCallIsAnUnknownError) {
    set_end({CMPI_RC_ERR_FAILED, "no server", 0, {}});
    EXPECT_EQ(fetch(), 0);
    EXPECT_THAT(reports(), ElementsAre(kUnknown, kInvalid));
    EXPECT_EQ(package().OrderFlag, 1000);
}

TEST_F(TftpTransfer, ServiceThatCannotBeNamedIsCalledAllTheSame) {
    answer(0);
    fail_service("broker.newObjectPath", "ZEB_FileTransferService", CMPI_RC_ERR_FAILED);
    run(downloadFileViaTFTP, kSource);
    EXPECT_EQ(occurrences(log(), "retCode: "), 1);
    EXPECT_THAT(reports(), ElementsAre("16: Package download error message: "
                                       "Create CMPIObjectPath failed.",
                                       kInvalid));
    EXPECT_EQ(package().OrderFlag, 1000);
    EXPECT_THAT(log(), StartsWith(entry("Enter downloadFileViaTFTP.\n") +
                                  entry("fail to get object path from zeb/cimv2:"
                                        "ZEB_FileTransferService.\n") +
                                  entry("Downloading... \n")));
}

TEST_F(TftpTransfer, WithoutArgumentListsThePlaceIsEmptyAndUnreported) {
    answer(0);
    fail_service("broker.newArgs", "", CMPI_RC_ERR_FAILED);
    EXPECT_EQ(fetch(), 0) << "the service misses the location";
    EXPECT_THAT(reports(), ElementsAre(kUnknown));
    EXPECT_STREQ(package().LocalPkgURI, "");
}

TEST_F(TftpTransfer, OtherPackagesAreLeftAlone) {
    answer(1);
    const std::string before = record_image(0);
    EXPECT_EQ(fetch(1), 0);
    EXPECT_EQ(record_image(0), before);
    EXPECT_EQ(pkgInstance[1].OrderFlag, 1000);
}

TEST_F(TftpTransfer, IndexOutsideOfTheTableAsksNobody) {
    const std::string before = session_image();
    for (const int index : {-1, 20}) {
        EXPECT_EQ(fetch(index), 0);
    }
    EXPECT_EQ(session_image(), before);
    EXPECT_THAT(up_calls(), IsEmpty());
}

}  // namespace
}  // namespace velktest

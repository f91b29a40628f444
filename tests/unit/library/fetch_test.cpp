// Making a package's files readable, and having transferred ones removed.

#include "provider/fetch.h"

#include "tests/support/broker_test.h"
#include "velk/request_state.h"

namespace {

using velktest::entries;
using velktest::entry;
using velktest::record_image;
using velktest::set_field;
using Texts = std::vector<std::string>;

class Fetch : public velktest::BrokerTest {
  protected:
    static int fetch(int index, const char *location = "file:///pkgs/x.xml") {
        return GetFileFromLocalOrTFTP(location, index, nullptr);
    }

    void remove(const char *location) {
        in_request([=](const CMPIContext *context) { deleteTransferedFile(location, context); });
    }
};

const std::string kFetchLog = entries({"Enter GetFileFromLocalOrTFTP.\n", "file:///pkgs/x.xml\n"});

}  // namespace

TEST_F(Fetch, LocalFileIsUsedWhereItIs) {
    filelocation = 1;
    set_field(pkgInstance[4].LocalPkgURI, "a longer location of the file fetched before this one");
    EXPECT_EQ(fetch(4), 1);
    EXPECT_STREQ(pkgInstance[4].LocalPkgURI, "file:///pkgs/x.xml");
    EXPECT_EQ(log(), kFetchLog);
    EXPECT_TRUE(up_calls().empty()) << "nothing is transferred";
}

TEST_F(Fetch, RequestsKindDecidesNotTheLocation) {
    filelocation = 1;
    EXPECT_EQ(fetch(0, "tftp://server/x.xml"), 1);
    EXPECT_STREQ(pkgInstance[0].LocalPkgURI, "tftp://server/x.xml");
}

TEST_F(Fetch, LongLocationIsCutAt199Characters) {
    filelocation = 1;
    for (const std::size_t length : {199U, 200U, 1023U, 5000U}) {
        const std::string location(length, 'a');
        EXPECT_EQ(fetch(1, location.c_str()), 1);
        EXPECT_EQ(pkgInstance[1].LocalPkgURI, location.substr(0, 199));
        EXPECT_STREQ(pkgInstance[1].installResult, "");
    }
}

TEST_F(Fetch, FtpMarksTheFirstPackageAsAHypervisorBundleAndFails) {
    filelocation = 3;
    const std::string before = record_image(4);
    EXPECT_EQ(fetch(4), 0);
    EXPECT_STREQ(pkgInstance[0].category, "Embedded Hypervisor");
    EXPECT_STREQ(pkgInstance[0].Name, "VMware");
    EXPECT_EQ(record_image(4), before);
    EXPECT_EQ(log(), kFetchLog);
}

TEST_F(Fetch, UnknownKindIsItsOwnResultAndChangesNothing) {
    for (const int kind : {5, 0, 6, -1}) {
        filelocation = kind;
        const std::string before = velktest::session_image();
        EXPECT_EQ(fetch(2), kind);
        EXPECT_EQ(velktest::session_image(), before);
    }
}

TEST_F(Fetch, IndexOutsideOfTheTableFails) {
    filelocation = 1;
    const std::string before = velktest::session_image();
    EXPECT_EQ(fetch(-1), 0);
    EXPECT_EQ(fetch(20), 0);
    EXPECT_EQ(velktest::session_image(), before);
}

TEST_F(Fetch, NullLocationCountsAsEmpty) {
    filelocation = 1;
    EXPECT_EQ(fetch(0, nullptr), 1);
    EXPECT_STREQ(pkgInstance[0].LocalPkgURI, "");
}

TEST_F(Fetch, RemovalIsAskedOfTheTransferServiceAlsoForLocalFiles) {
    remove("file:///pkgs/x.xml");
    EXPECT_EQ(up_calls(), (Texts{"invokeMethod zeb/cimv2:ZEB_FileTransferService."
                                 R"(DeleteTransferredFile(FileURI="file:///pkgs/x.xml"))"}));
    EXPECT_EQ(transfer().deleted, Texts{"file:///pkgs/x.xml"});
    EXPECT_EQ(log(), entry("Delete file ") + "file:///pkgs/x.xml\n" +
                         entry("Complete deleteTransferedFile.\n"));
}

TEST_F(Fetch, MethodsValueDoesNotMatter) {
    transfer().end.value = 1;
    remove("file:///a");
    EXPECT_TRUE(log().ends_with(entry("Complete deleteTransferedFile.\n")));
}

TEST_F(Fetch, FailedRemovalIsOnlyLogged) {
    transfer().end = {CMPI_RC_ERR_FAILED, "file in use", 0, {}};
    const std::string before = velktest::session_image();
    remove("file:///a");
    EXPECT_EQ(velktest::session_image(), before);
    EXPECT_EQ(log(), entry("Delete file ") + "file:///a\n" +
                         entry("deleteTransferedFile failed.\n") + entry("Error message:") +
                         "file in use\n");
}

TEST_F(Fetch, FailureWithoutAMessageLogsAnEmptyOne) {
    fail_service("broker.invokeMethod", "ZEB_FileTransferService.DeleteTransferredFile",
                 CMPI_RC_ERR_NOT_FOUND);
    remove("file:///a");
    EXPECT_TRUE(log().ends_with(entry("Error message:") + "\n"));
}

TEST_F(Fetch, ServiceThatCannotBeNamedIsLoggedAndTheCallGoesOn) {
    fail_service("broker.newObjectPath", "ZEB_FileTransferService", CMPI_RC_ERR_FAILED);
    remove("file:///a");
    const std::string begin = entry("Can't create deleteTransferedFile object.\n") +
                              entry("Delete file ") + "file:///a\n" +
                              entry("deleteTransferedFile failed.\n") + entry("Error message:");
    EXPECT_TRUE(log().starts_with(begin));
}

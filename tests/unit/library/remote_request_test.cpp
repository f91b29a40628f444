// Whole requests whose packages lie on a server: what is fetched when, what is passed by, and what
// is left on the host. The double of the file transfer service brings the server's files to the
// host's file store; the controller refuses each package at once.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "provider/fetch.h"
#include "provider/install_driver.h"
#include "provider/package_list.h"
#include "provider/work_area.h"
#include "tests/support/broker_test.h"
#include "tests/support/report_log.h"
#include "tests/unit/library/descriptor_fixture.h"
#include "velk/request_state.h"

namespace velktest {
namespace {

namespace fs = std::filesystem;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

class RemoteRequest : public BrokerTest {
  protected:
    RemoteRequest() {
        controller().end = {CMPI_RC_OK, "", 0, {}};
        transfer().on_transfer = [this](const std::string &source) { return bring(source); };
    }

    // The server has a package NAME.xml with its payload NAME.bin.
    void serve(const std::string &name, const std::string &category, const std::string &more = "") {
        files_[name + ".xml"] = property("Name", "name of " + name) + property("type", "1") +
                                property("category", category) +
                                property("payload", name + ".bin") +
                                property("identificationCode", name) + more;
        files_[name + ".bin"] = "image of " + name;
    }

    void lose(const std::string &file) { files_.erase(file); }

    // Every file transferred from now on is fetched by a job.
    void use_jobs() { jobs_ = true; }

    int run(const std::string &locations) {
        initPkgInstall(locations.c_str());
        int result = -99;
        in_request([&](const CMPIContext *context) { result = syncInstallAllPkgs(context); });
        return result;
    }

    // What was asked of other providers, in order: "fetch a.xml", "delete a.xml", "install a.bin".
    std::vector<std::string> course() {
        std::vector<std::string> out;
        for (const std::string &call : up_calls()) {
            const auto end = call.find('"', call.find("=\"") + 2);
            const auto begin = call.rfind('/', end) + 1;
            const std::string file = call.substr(begin, end - begin);
            if (call.find(".TransferVia") != std::string::npos) {
                out.push_back("fetch " + file);
            } else if (call.find(".DeleteTransferredFile") != std::string::npos) {
                out.push_back("delete " + file);
            } else if (call.find(".InstallFromURI") != std::string::npos) {
                out.push_back("install " + file);
            }
        }
        return out;
    }

    [[nodiscard]] std::string stored(const std::string &file) const {
        return "file://" + (at(velk::kFileStore) / file).string();
    }

    void TearDown() override { EXPECT_TRUE(transfer_job().is_over()); }

  private:
    MethodEnd bring(const std::string &source) {
        const std::string file = source.substr(source.rfind('/') + 1);
        const auto known = files_.find(file);
        if (known != files_.end()) {
            write_file(at(velk::kFileStore) / file, known->second);
        }
        MethodEnd end = {CMPI_RC_OK,
                         "",
                         known == files_.end() ? 1U : 0U,
                         {{"DestinationURI", kit::Text(stored(file))}}};
        if (jobs_) {
            end.value = 6;
            end.outputs.push_back({"Job", kit::Reference{"ZEB_TransferJob", {}}});
            transfer_job().show(
                kit::Text("over"),
                std::uint16_t{known == files_.end() ? std::uint16_t{10} : std::uint16_t{7}});
        }
        return end;
    }

    std::map<std::string, std::string> files_;
    bool jobs_ = false;
};

TEST_F(RemoteRequest, DescriptorsAreFetchedFirstThenEachPayloadBeforeItsInstall) {
    serve("fpga", "FPGA");
    serve("uefi", "UEFI");
    run("tftp://server/pkgs/fpga.xml|tftp://server/pkgs/uefi.xml");
    EXPECT_THAT(course(), ElementsAre("fetch fpga.xml", "delete fpga.xml", "fetch uefi.xml",
                                      "delete uefi.xml", "fetch uefi.bin", "install uefi.bin",
                                      "delete uefi.bin", "fetch fpga.bin", "install fpga.bin",
                                      "delete fpga.bin"));
}

TEST_F(RemoteRequest, InstallerIsGivenTheFileOnTheHost) {
    serve("rxc", "RXC");
    run("tftp://server/pkgs/rxc.xml");
    ASSERT_EQ(controller().orders.size(), 1U);
    EXPECT_EQ(controller().orders[0].uri, stored("rxc.bin"));
    EXPECT_THAT(transfer().deleted, ElementsAre(stored("rxc.xml"), stored("rxc.bin")));
    EXPECT_STREQ(pkgInstance[0].TFTPPayloadPkgURIs, "tftp://server/pkgs/rxc.bin");
}

TEST_F(RemoteRequest, SftpTakesTheSameCourse) {
    serve("rxc", "RXC");
    use_jobs();
    run("sftp://server/pkgs/rxc.xml");
    EXPECT_THAT(course(), ElementsAre("fetch rxc.xml", "delete rxc.xml", "fetch rxc.bin",
                                      "install rxc.bin", "delete rxc.bin"));
    EXPECT_EQ(occurrences(log(), entry("Enter FileLocationSFTP\n")), 1) << "for the descriptor";
    EXPECT_EQ(occurrences(log(), entry("Enter FileLocationSFTP\n", 10)), 1) << "for the payload";
}

TEST_F(RemoteRequest, PackageWithoutADescriptorOnTheServerIsPassedBy) {
    serve("uefi", "UEFI");
    run("tftp://server/pkgs/lost.xml|tftp://server/pkgs/uefi.xml");
    EXPECT_THAT(course(), ElementsAre("fetch lost.xml", "fetch uefi.xml", "delete uefi.xml",
                                      "fetch uefi.bin", "install uefi.bin", "delete uefi.bin"));
    EXPECT_STREQ(pkgInstance[0].installResult, "lost: 11: Package download failed.");
    EXPECT_EQ(pkgInstance[0].OrderFlag, 1000);
}

TEST_F(RemoteRequest, PackageWithoutItsPayloadIsNeitherInstalledNorRemoved) {
    serve("rxc", "RXC");
    lose("rxc.bin");
    EXPECT_EQ(run("tftp://server/pkgs/rxc.xml"), 1);
    EXPECT_THAT(course(), ElementsAre("fetch rxc.xml", "delete rxc.xml", "fetch rxc.bin"));
    EXPECT_STREQ(pkgInstance[0].installResult, "rxc: 11: Package download failed.");
}

// A job that ends badly marks no package, so that the second pass asks once more.
TEST_F(RemoteRequest, DescriptorThatAJobCouldNotFetchLeavesThePackageInTheCourse) {
    use_jobs();
    EXPECT_EQ(run("sftp://server/pkgs/lost.xml"), 1);
    EXPECT_THAT(reports_in(log(), "lost"),
                ElementsAre("0: Package Initialization finished", "11: Package download failed.",
                            "11: Package download failed."));
    EXPECT_EQ(pkgInstance[0].OrderFlag, 450);
    EXPECT_THAT(controller().orders, IsEmpty());
}

TEST_F(RemoteRequest, PayloadsPlaceReplacesItsDescriptors) {
    serve("rxc", "RXC");
    run("tftp://server/pkgs/rxc.xml");
    EXPECT_EQ(pkgInstance[0].LocalPkgURI, stored("rxc.bin"));
}

TEST_F(RemoteRequest, MixedKindsAreAllFetchedAsTheFirst) {
    struct {
        const char *locations;
        const char *method;
    } const cases[] = {
        {"tftp://s/a.xml|sftp://s/b.xml|file:///s/c.xml", "TransferViaTFTP"},
        {"sftp://s/a.xml|tftp://s/b.xml|ftp://s/c.xml", "TransferViaURL"},
    };
    for (const auto &row : cases) {
        SCOPED_TRACE(row.locations);
        broker().trace().clear();
        transfer().on_transfer = [](const std::string &) {
            return MethodEnd{CMPI_RC_OK, "", 1, {}};
        };
        run(row.locations);
        std::vector<std::string> methods;
        for (const std::string &call : up_calls()) {
            if (const auto from = call.find("Transfer", call.find('.'));
                from != std::string::npos) {
                methods.push_back(call.substr(from, call.find('(') - from));
            }
        }
        EXPECT_THAT(methods, ElementsAre(row.method, row.method, row.method));
    }
}

TEST_F(RemoteRequest, LocalFirstPackageFetchesNothing) {
    run("file:///s/a.xml|tftp://s/b.xml|sftp://s/c.xml");
    for (const std::string &step : course()) {
        EXPECT_EQ(step.find("fetch"), std::string::npos) << step;
    }
    EXPECT_STREQ(pkgInstance[1].LocalPkgURI, "tftp://s/");
}

TEST_F(RemoteRequest, FileStoreAndMarkerAreGoneAfterIt) {
    serve("rxc", "RXC");
    write_file(at(velk::kFileStore) / "sub/of-an-earlier-request", "x");
    for (const char *location : {"tftp://server/pkgs/rxc.xml", "tftp://server/pkgs/lost.xml"}) {
        run(location);  // the update manager is taken for the client unless said otherwise
        EXPECT_FALSE(fs::exists(at(velk::kLockMarker)));
        EXPECT_FALSE(fs::exists(at(velk::kFileStore)));
    }
}

TEST_F(RemoteRequest, ClientDecidesWhatIsCleanedUpNotTheKindOfLocation) {
    serve("rxc", "RXC");
    invoke_client = 1;
    run("tftp://server/pkgs/rxc.xml");
    EXPECT_TRUE(fs::exists(at(velk::kLockMarker)));
    EXPECT_TRUE(fs::exists(at(velk::kFileStore)));
}

TEST_F(RemoteRequest, FileThatCannotBeRemovedHoldsNothingUp) {
    serve("rxc", "RXC");
    transfer().end = {CMPI_RC_ERR_FAILED, "file in use", 0, {}};
    run("tftp://server/pkgs/rxc.xml");
    EXPECT_THAT(course(), ElementsAre("fetch rxc.xml", "delete rxc.xml", "fetch rxc.bin",
                                      "install rxc.bin", "delete rxc.bin"));
    EXPECT_FALSE(fs::exists(at(velk::kFileStore)));
}

TEST_F(RemoteRequest, EveryOneOfTwentyPackagesIsFetchedTwice) {
    std::string locations;
    for (int i = 0; i < 20; ++i) {
        const std::string name = "p" + std::to_string(i);
        serve(name, "RXC");
        locations += (i == 0 ? "" : "|") + ("tftp://server/" + name + ".xml");
    }
    const std::size_t before = open_descriptors();
    run(locations);
    EXPECT_EQ(open_descriptors(), before);
    EXPECT_EQ(course().size(), 20U * 5);
    EXPECT_EQ(controller().orders.size(), 20U);
}

}  // namespace
}  // namespace velktest

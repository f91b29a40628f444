// Bundles of the hypervisor's updates through the shipped library and the hypervisor's provider.
#include "host/rig/rig.h"
#include "host/scenario/reader.h"
#include "tests/support/depot_files.h"

#include <gmock/gmock.h>

#include <algorithm>
#include <fstream>

namespace velkhost::rig::testing {
namespace {

using ::testing::AllOf;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;

constexpr std::chrono::hours kDay(24);

std::string property(const std::string &name, const std::string &value) {
    return "  <PROPERTY NAME=\"" + name + "\" TYPE=\"" + (name == "type" ? "uint16" : "string") +
           "\">\n    <VALUE>" + value + "</VALUE>\n  </PROPERTY>\n";
}

class HypervisorRequests : public ::testing::Test {
  protected:
    void play(const std::string &scenario) {
        rig_.emplace(RigOptions{.description = scenario::parse_description(scenario, "test")});
    }

    // A bundle with its descriptor; the descriptor's location.
    std::string add_bundle(const std::string &name) {
        velktest::DepotFiles(packages_.path() / name, "2.0").write();
        std::ofstream(packages_.path() / (name + ".xml"))
            << property("Name", "VMware bundle") << property("type", "1")
            << property("category", "Embedded Hypervisor") << property("payload", name + "/")
            << property("identificationCode", "VMware_" + name);
        return "file://" + (packages_.path() / (name + ".xml")).string();
    }

    // Installs the packages in one request; the codes that they went through, but for the first.
    std::vector<std::string> install(const std::vector<std::string> &uris) {
        EXPECT_EQ(rig_->install({.uris = uris}).return_value, 4096U);
        EXPECT_TRUE(rig_->wait_until_idle(kDay));
        std::vector<std::string> out;
        for (const StatusChange &change : rig_->history().changes()) {
            const int code = change.status.code.value_or(-1);
            if (code != 0) {
                out.push_back(std::to_string(change.package) + ": " + std::to_string(code));
            }
        }
        return out;
    }

    // The calls of the hypervisor's provider that reached it, as text.
    std::vector<std::string> calls() {
        std::vector<std::string> out;
        for (const broker::TraceEntry &entry : rig_->broker().trace().entries()) {
            if (entry.name_space == "root/cimv2" &&
                entry.side == broker::TraceEntry::Side::kUpCall) {
                out.push_back(entry.operation + " " + entry.class_name + "(" + entry.arguments +
                              ")");
            }
        }
        return out;
    }

    void expect_clean_end() {
        EXPECT_THAT(rig_->unfired_faults(), IsEmpty());
        EXPECT_TRUE(rig_->shut_down());
        EXPECT_THAT(rig_->findings(), IsEmpty());
    }

    RunFolder packages_ = RunFolder::make_temporary();
    std::optional<Rig> rig_;
};

TEST_F(HypervisorRequests, BundleIsInstalledFromWhereItLies) {
    play("[host]\nnode = 'host-1'\n");
    const std::string bundle = add_bundle("b");
    EXPECT_THAT(install({bundle}), ElementsAre("0: 60", "0: 61", "0: 50"));
    const auto made = calls();
    ASSERT_EQ(made.size(), 8U) << "the services, the call, six looks at the jobs";
    EXPECT_EQ(made[0], "enumerateInstances VMware_SoftwareInstallationService()");
    EXPECT_THAT(made[1], AllOf(HasSubstr("URI=\"file://" +
                                         (packages_.path() / "b/metadata.zip").string() + "\""),
                               HasSubstr("Name=\"host-1\"")));
    EXPECT_EQ(std::count(made.begin() + 2, made.end(), "enumerateInstances VMware_ConcreteJob()"),
              6);
    expect_clean_end();
}

TEST_F(HypervisorRequests, LastOfSeveralServicesIsAsked) {
    play("[hypervisor]\nsystems = ['a', 'b', 'c']\n");
    install({add_bundle("b")});
    EXPECT_THAT(calls().at(1), HasSubstr("Name=\"c\""));
    EXPECT_EQ(rig_->results().at(0).code, 50);
    expect_clean_end();
}

TEST_F(HypervisorRequests, HostWithoutAServiceRefusesTheCall) {
    play("[hypervisor]\nsystems = []\n");
    install({add_bundle("b")});
    EXPECT_EQ(rig_->results().at(0).code, 56);
    EXPECT_THAT(rig_->results().at(0).message, HasSubstr("Package installation error message: "));
    expect_clean_end();
}

TEST_F(HypervisorRequests, DamagedBundleFails) {
    play("");
    const std::string bundle = add_bundle("b");
    std::filesystem::resize_file(packages_.path() / "b/metadata.zip", 30);
    EXPECT_THAT(install({bundle}), ElementsAre("0: 60", "0: 57"));
    expect_clean_end();
}

// No job is matched to the call: where none is started, that of an earlier update decides.
TEST_F(HypervisorRequests, EarlierJobIsTakenForOneThatWasNotStarted) {
    play(
        "[hypervisor]\nearlier_jobs = ['Updates at supplied URI are obsolete or already "
        "installed']\n[[hypervisor.answer]]\nreturn_value = 4107\n");
    EXPECT_THAT(install({add_bundle("b")}), ElementsAre("0: 59"));
    expect_clean_end();
}

TEST_F(HypervisorRequests, FtpLocationComesToTheHypervisorUnread) {
    play(
        "[[hypervisor.answer]]\nmatch = 'ftp://server/pkgs/metadata.zip'\njob = [{ status = 'The "
        "update completed successfully, but the system needs to be rebooted for the changes to be "
        "effective.' }]\n");
    EXPECT_THAT(install({"ftp://server/pkgs/x.xml", "ftp://server/other/y.xml"}),
                ElementsAre("0: 50"));
    expect_clean_end();
}

TEST_F(HypervisorRequests, FaultsOfTheProviderFailTheBundle) {
    play(
        "[[fault]]\nstep = 'hypervisor.install'\ncode = 1\nmessage = 'out of order'\n"
        "[[fault]]\nstep = 'hypervisor.jobs'\nafter = 1\ncode = 1\n");
    const std::string bundle = add_bundle("b");
    install({bundle, bundle});
    // Of packages of one order the last one goes first.
    EXPECT_EQ(rig_->results().at(1).message, "Package installation error message: out of order");
    EXPECT_EQ(rig_->results().at(0).code, 57);
    expect_clean_end();
}

}  // namespace
}  // namespace velkhost::rig::testing

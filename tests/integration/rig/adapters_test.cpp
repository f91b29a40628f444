// Adapter packages through the shipped library and the vendors' providers: which calls arrive
// there, and how each package ends.
#include "adapter_packages.h"

#include "host/rig/rig.h"
#include "host/scenario/reader.h"

#include <gmock/gmock.h>

#include <algorithm>

namespace velkhost::rig::testing {
namespace {

using ::testing::AllOf;
using ::testing::Each;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using ::testing::SizeIs;

constexpr std::chrono::hours kDay(24);

// A package of each family, and the adapter that it is for.
struct Family {
    const char *name;  // in scenarios
    const char *product;
    const char *category;
    const char *service;
    const char *ports;  // the adapter's key; null: none
    std::size_t calls;  // of InstallFromURI, for two ports
    int absent_code;    // where the host has no such adapter
    const char *absent_message;
};

constexpr const char *kNone = "No driver file name that need to be update.";

// clang-format off
constexpr Family kEmulexFc{"emulex_fc", "Emulex LPe", "Fibre", "ELXHBA_SoftwareInstallationService", "fc_ports", 2, 57, kNone};
constexpr Family kEmulexCna{"emulex_cna", "Emulex OCe", "Network", "ELXUCNA_SoftwareInstallationService", "nic_ports", 1, 57, kNone};
constexpr Family kQlogicNic{"qlogic", "QLogic QLE", "Network", "QLogic_NIC_SoftwareInstallationService", "nic_ports", 2, 57, kNone};
constexpr Family kQlogicFc{"qlogic", "FC5172", "Fibre", "QLogic_FCHBA_SoftwareInstallationService", "fc_ports", 2, 57, kNone};
constexpr Family kBrocade{"brocade", "Brocade HBA", "Fibre", "BROCADE_HBASoftwareInstallationService", "fc_ports", 2, 57, kNone};
constexpr Family kBroadcom{"broadcom", "Broadcom NIC", "Network", "BRCMFWUP_SoftwareInstallationService", "nic_ports", 1, 57,
                           "Package installation error happened."};
constexpr Family kLsi{"lsi", "RAID", "SAS", "TAVU_SoftwareInstallationService", nullptr, 1, 55,
                      "Package is not applicable for the selected LSI Controllers."};
// clang-format on

// Two ports, where the family has any.
std::string adapter(const Family &family, const std::string &dfn = "D1") {
    std::string text = "[[adapter]]\nfamily = '" + std::string(family.name) + "'\ndfn = '" + dfn +
                       "'\nserial = 'S1'\n";
    return family.ports == nullptr ? text : text + family.ports + " = ['a', 'b']\n";
}

class AdapterRequests : public ::testing::Test {
  protected:
    void play(const std::string &scenario) {
        rig_.emplace(RigOptions{.description = scenario::parse_description(scenario, "test")});
    }

    std::string package(const Family &family, const std::string &dfn = "D1") {
        return packages_.add(std::string("fw_") + family.name, family.product, family.category,
                             dfn);
    }

    // Installs the packages in one request; their ends.
    std::vector<PackageStatus> install(const std::vector<std::string> &uris) {
        const InstallAnswer answer = rig_->install({.uris = uris});
        EXPECT_TRUE(answer.status.ok()) << answer.status.message;
        EXPECT_TRUE(rig_->wait_until_idle(kDay));
        return rig_->results();
    }
    PackageStatus install(const Family &family) { return install({package(family)}).at(0); }

    // The method calls that reached a class, as text.
    std::vector<std::string> calls(const std::string &class_name) {
        std::vector<std::string> out;
        for (const broker::TraceEntry &entry : rig_->broker().trace().entries()) {
            if (entry.operation == "invokeMethod" && entry.class_name == class_name) {
                out.push_back(broker::to_text(entry));
            }
        }
        return out;
    }

    void expect_clean_end() {
        EXPECT_THAT(rig_->unfired_faults(), IsEmpty());
        EXPECT_TRUE(rig_->shut_down());
        EXPECT_THAT(rig_->findings(), IsEmpty());
    }

    AdapterPackages packages_;
    std::optional<Rig> rig_;
};

class AdapterFamilies : public AdapterRequests, public ::testing::WithParamInterface<Family> {};

TEST_P(AdapterFamilies, PackageIsInstalledOnItsAdapters) {
    play(adapter(GetParam()));
    const PackageStatus result = install(GetParam());
    EXPECT_EQ(result.code, 50) << result.message;
    auto made = calls(GetParam().service);
    std::erase_if(made,
                  [](const std::string &call) { return call.find("CheckStatus") != call.npos; });
    EXPECT_THAT(made,
                AllOf(SizeIs(GetParam().calls), Each(HasSubstr("/var/tmp/ZEB/Pakro/Package/"))));
    EXPECT_FALSE(std::filesystem::exists(rig_->folder().inside("/var/tmp/ZEB/Pakro/Package")));
    EXPECT_FALSE(rig_->controller_trace().empty()) << "no session was opened";
    expect_clean_end();
}

TEST_P(AdapterFamilies, PackageOfAnAbsentAdapterIsToldSo) {
    play("");
    const PackageStatus result = install(GetParam());
    EXPECT_EQ(result.code, GetParam().absent_code);
    EXPECT_THAT(result.message, HasSubstr(GetParam().absent_message));
    expect_clean_end();
}

TEST_P(AdapterFamilies, RefusalOfTheServiceFailsThePackage) {
    play(adapter(GetParam()) + "[[" + GetParam().name +
         ".answer]]\nmatch = 'fw_'\nstatus = 1\nmessage = 'flash is locked'\n");
    EXPECT_EQ(install(GetParam()).code, std::string(GetParam().name) == "qlogic" ? 54 : 57);
    expect_clean_end();
}

INSTANTIATE_TEST_SUITE_P(Every, AdapterFamilies,
                         ::testing::Values(kEmulexFc, kEmulexCna, kQlogicNic, kQlogicFc, kBrocade,
                                           kBroadcom, kLsi),
                         [](const auto &about) { return std::string(about.param.service); });

TEST_F(AdapterRequests, ModelsAreTakenWithoutTheBlanksAroundThem) {
    for (const Family &family : {kEmulexCna, kQlogicNic, kQlogicFc, kBrocade}) {
        rig_.reset();
        play(adapter(family, " D1  "));
        EXPECT_EQ(install(family).code, 50) << family.service;
        EXPECT_THAT(calls(family.service), SizeIs(family.calls));
    }
}

TEST_F(AdapterRequests, HostWithAllFamiliesTakesAPackageOfEach) {
    std::string scenario;
    std::vector<std::string> uris;
    for (const Family &family : {kEmulexFc, kEmulexCna, kQlogicFc, kBrocade, kBroadcom, kLsi}) {
        scenario += adapter(family);
        uris.push_back(package(family));
    }
    play(scenario);
    for (const PackageStatus &result : install(uris)) {
        EXPECT_EQ(result.code, 50) << result.id << ": " << result.message;
    }
    expect_clean_end();
}

TEST_F(AdapterRequests, QlogicJobIsFollowedToItsEnd) {
    play(adapter(kQlogicNic) + "[[qlogic.answer]]\njob = [{ looks = 360 }, { state = 7 }]\n");
    const auto begin = rig_->last_activity_us();
    EXPECT_EQ(install(kQlogicNic).code, 50);
    EXPECT_GE(rig_->last_activity_us() - begin, 2 * 3600 * std::int64_t{1'000'000});
    expect_clean_end();
}

TEST_F(AdapterRequests, QlogicJobThatIsNotRunningHasFailed) {
    for (const char *state : {"3", "10"}) {
        play(adapter(kQlogicNic) + "[[qlogic.answer]]\njob = [{ state = " + state + " }]\n");
        EXPECT_EQ(install(kQlogicNic).code, 54) << state;
        expect_clean_end();
        rig_.reset();
    }
}

TEST_F(AdapterRequests, BroadcomUpdateIsFollowedToItsEnd) {
    play(adapter(kBroadcom) + "[[broadcom.answer]]\njob = [{ looks = 2 }, { state = 0 }]\n");
    EXPECT_EQ(install(kBroadcom).code, 50);
    EXPECT_THAT(calls(kBroadcom.service), SizeIs(4)) << "the install, and three looks";
    expect_clean_end();
}

TEST_F(AdapterRequests, BroadcomUpdateCanFail) {
    play(adapter(kBroadcom) + "[[broadcom.answer]]\njob = [{}, { state = 7 }]\n");
    EXPECT_EQ(install(kBroadcom).code, 57);
    expect_clean_end();
}

TEST_F(AdapterRequests, LsiLevelThatIsCurrentIsToldSo) {
    play(adapter(kLsi) + "[[lsi.answer]]\nreturn_value = 12\n");
    const PackageStatus result = install(kLsi);
    EXPECT_EQ(result.code, 55);
    EXPECT_THAT(result.message, HasSubstr("Current firmware level is equal or better"));
}

TEST_F(AdapterRequests, ReturnValuesOfPortServicesDecideTheStatus) {
    const auto code = [this](const Family &family, int value) {
        rig_.reset();
        play(adapter(family) + "[[" + family.name +
             ".answer]]\nreturn_value = " + std::to_string(value) + "\n");
        return install(family).code;
    };
    for (const Family &family : {kEmulexFc, kEmulexCna, kBrocade}) {
        EXPECT_EQ(code(family, 4097), 58) << family.name;
        EXPECT_EQ(code(family, 4107), 55) << family.name;
        EXPECT_EQ(code(family, 4096), 57) << family.name;
        EXPECT_EQ(code(family, 1), 54) << family.name;
    }
}

TEST_F(AdapterRequests, OnlyTheFirstBrocadeAdaptersPortsAreFound) {
    play(adapter(kBrocade) +
         "[[adapter]]\nfamily = 'brocade'\ndfn = 'D1'\nserial = 'S2'\nfc_ports = ['c']\n");
    EXPECT_EQ(install(kBrocade).code, 50);
    EXPECT_THAT(calls(kBrocade.service),
                ElementsAre(HasSubstr("DeviceID=\"a\""), HasSubstr("DeviceID=\"b\"")));
}

TEST_F(AdapterRequests, AdaptersThatCannotBeEnumeratedAreNone) {
    play(adapter(kEmulexCna) +
         "[[fault]]\nstep = 'emulex_cna.adapters'\nmatch = 'EthernetPort'\ncode = 1\n");
    EXPECT_EQ(install(kEmulexCna).code, 57);
    expect_clean_end();
}

TEST_F(AdapterRequests, CardThatIsNotShownAddsNoAdapter) {
    play(adapter(kEmulexCna) + "card = false\n");
    EXPECT_EQ(install(kEmulexCna).code, 57);
    expect_clean_end();
}

}  // namespace
}  // namespace velkhost::rig::testing

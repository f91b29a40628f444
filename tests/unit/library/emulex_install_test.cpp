// An install on an Emulex adapter, line by line.
#include "installers/Emulex_update.h"
#include "tests/unit/library/adapter_families.h"

namespace velktest {
namespace {

using ::testing::ElementsAre;
using Texts = std::vector<std::string>;

// What distinguishes the two kinds of adapter.
struct Kind {
    const char *name;
    velk::Installer install;
    void (*furnish)(AdapterTest &);
    int (*install_one)(const CMPIContext *, const char *, const char *);
    const char *letters;  // in the functions' names
    const char *stop;     // "." where their entry and exit lines have one
    const char *service;
    const char *service_name;  // its key "Name"
    const char *target;
    const char *no_adapter_end;  // what follows the status text
    const char *package;
};

void PrintTo(const Kind &kind, std::ostream *out) {
    *out << kind.name;
}

constexpr Kind kKinds[] = {
    {"Fc", installElxFCPkg, furnish_emulex_fc, install_one_elxfc_payload, "elxfc", ".",
     "ELXHBA_SoftwareInstallationService", "ELXHBA_FCSoftwareInstallationService", "ELXHBA_FCPort",
     "\n", "installElxFCPkg"},
    {"Cna", installElxCNAPkg, furnish_emulex_cna, install_one_elxcna_payload, "elxcna", "",
     "ELXUCNA_SoftwareInstallationService", "ELXUCNA_SoftwareInstallationService",
     "ELXUCNA_EthernetPort", "", "installElxCNAPkg"},
};

class EmulexInstall : public AdapterTest, public ::testing::WithParamInterface<Kind> {
  protected:
    static const Kind &kind() { return GetParam(); }

    static std::string enter(const std::string &function) {
        return entry("--> " + function + kind().stop + "\n");
    }
    static std::string leave(const std::string &function) {
        return entry("<-- " + function + kind().stop + "\n");
    }
    static std::string one() { return std::string("install_one_") + kind().letters + "_payload"; }

    // The way of one payload to the call of the service.
    static std::string way_to_call_log() {
        const std::string service = kind().service;
        return enter(one()) + entry(service + ".SystemName = host-1\n") +
               entry("Succeed in creating " + service + kind().stop + "\n") +
               entry(std::string("Succeed in creating ") + kind().target +
                     ": SystemName = host-1, DeviceID = DEV-1\n") +
               entry("To install package: file:///var/tmp/ZEB/Pakro/Package/fw.bin\n");
    }

    int install_payload() {
        int result = -1;
        in_request([&](const CMPIContext *context) {
            result = kind().install_one(context, "fw.bin", "DEV-1");
        });
        return result;
    }
};

TEST_P(EmulexInstall, IsLoggedStepByStep) {
    kind().furnish(*this);
    EXPECT_EQ(install(kind().install), 0);
    const std::string all = log_without_matching();
    const std::string discovery = enter(std::string("get_") + kind().letters + "_dfn_devid");
    const std::string found = leave(std::string("get_") + kind().letters + "_dfn_devid");
    EXPECT_TRUE(all.starts_with(enter(kind().package) + discovery)) << all;
    EXPECT_EQ(
        all.substr(all.find(found)),
        found + entry("tmpDestinationPath = file:///pkgs/adapter.zip\n") +
            entry("Effective path: //pkgs/adapter.zip\n") + entry("Minizip() successfully.\n") +
            no_session_log() + enter(std::string("install_") + kind().letters + "_payload") +
            entry("Install Emulex 0 package. Payload path: fw.bin, Device ID: DEV-1\n") +
            way_to_call_log() + entry("CBInvokeMethod() return code: 0\n") + leave(one()) +
            entry("util_remove_file() successfully.\n") +
            final_report_log(50, "Package installation successfully.") + leave(kind().package));
}

TEST_P(EmulexInstall, WithoutAdaptersTheStatusKeepsItsLineEnd) {
    EXPECT_EQ(install(kind().install), 4098);
    EXPECT_TRUE(log().ends_with(final_report_log(
        57, "No driver file name that need to be update." + std::string(kind().no_adapter_end))))
        << log();
    EXPECT_EQ(package().installResult, "adapter: 57: No driver file name that need to be update." +
                                           std::string(kind().no_adapter_end));
}

TEST_P(EmulexInstall, FailedUnpackingIsToldWithItsResult) {
    kind().furnish(*this);
    unzip().result = 12;
    EXPECT_EQ(install(kind().install), 0);
    EXPECT_TRUE(log().ends_with(entry("Effective path: //pkgs/adapter.zip\n") +
                                entry("Minizip() failed: 12\n")));
}

TEST_P(EmulexInstall, FailedMatchingIsTold) {
    kind().furnish(*this);
    unzip().files.erase("image/payload.xml");
    EXPECT_EQ(install(kind().install), 0);
    EXPECT_TRUE(log().ends_with(entry("open file failed, return 0\n") +
                                entry("parsePayloadDeviceIDArray() failed.\n")));
}

TEST_P(EmulexInstall, SecondOfThreePayloadsThatFailsIsTheLast) {
    kind().furnish(*this);
    offer({{"a.bin", {kDfn}, 1}, {"b.bin", {kDfn}, 2}, {"c.bin", {kDfn}, 3}});
    vendor(kind().service).answers["InstallFromURI"] = {
        {}, {.value = 4107, .outputs = {}, .message = {}}};
    EXPECT_EQ(install(kind().install), 0) << "the folder was removed";
    EXPECT_EQ(vendor(kind().service).targets.size(), 2U);
    EXPECT_THAT(reports(), ElementsAre("55: The path or file does not exist."));
    EXPECT_FALSE(is_unpacked());
}

TEST_P(EmulexInstall, ServiceIsNamedByItsFourKeys) {
    kind().furnish(*this);
    EXPECT_EQ(install_payload(), 0);
    EXPECT_THAT(
        vendor(kind().service).targets,
        ElementsAre(std::string("root/emulex:") + kind().service +
                    ".SystemCreationClassName=\"OMC_UnitaryComputerSystem\",SystemName=\"host-1\","
                    "CreationClassName=\"" +
                    kind().service + "\",Name=\"" + kind().service_name + "\""));
}

TEST_P(EmulexInstall, ServiceIsGivenATargetAndAUri) {
    kind().furnish(*this);
    EXPECT_EQ(install_payload(), 0);
    const std::string service = std::string("root/emulex:") + kind().service;
    EXPECT_THAT(up_calls(),
                ElementsAre("enumerateInstances " + service + "()",
                            "invokeMethod " + service +
                                ".InstallFromURI(Target=root/emulex:" + kind().target +
                                ".SystemCreationClassName=\"OMC_UnitaryComputerSystem\","
                                "SystemName=\"host-1\",CreationClassName=\"" +
                                kind().target +
                                "\",DeviceID=\"DEV-1\", "
                                "URI=\"file:///var/tmp/ZEB/Pakro/Package/fw.bin\")"));
}

TEST_P(EmulexInstall, FailedCallIsLoggedWithItsMessage) {
    kind().furnish(*this);
    vendor(kind().service).answers["InstallFromURI"] = {
        {.value = 0, .outputs = {}, .code = CMPI_RC_ERR_FAILED, .message = "busy"}};
    EXPECT_EQ(install_payload(), 4098);
    EXPECT_EQ(log(), way_to_call_log() + entry("Package installation error message: busy\n") +
                         leave(one()));
}

TEST_P(EmulexInstall, PathsThatCannotBeBuiltLeaveNoExitLine) {
    kind().furnish(*this);
    fail_service("broker.newObjectPath", kind().service, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(install_payload(), 1);
    EXPECT_EQ(log(), enter(one()));
    clear_log();
    fail_service("broker.newObjectPath", kind().target, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(install_payload(), 1);
    EXPECT_TRUE(log().ends_with(
        entry(std::string("Succeed in creating ") + kind().service + kind().stop + "\n")));
}

INSTANTIATE_TEST_SUITE_P(Each, EmulexInstall, ::testing::ValuesIn(kKinds),
                         [](const auto &about) { return std::string(about.param.name); });

}  // namespace
}  // namespace velktest

// What the families' calls of their vendors' services have in common.
#include "installers/adapter_service.h"

#include "installers/Emulex_update.h"
#include "installers/Qlogic_update.h"
#include "installers/adapter_frame.h"
#include "installers/brocade_update.h"
#include "tests/unit/library/adapter_families.h"

namespace velktest {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using Texts = std::vector<std::string>;

// ---- Without a service ----

class AdapterTexts : public AdapterTest {};

TEST_F(AdapterTexts, PayloadsUriIsCutAt255) {
    const std::string prefix = "file:///var/tmp/ZEB/Pakro/Package/";
    for (const std::size_t length : {0U, 1U, 199U, 220U, 221U, 222U, 1023U}) {
        const std::string path(length, 'p');
        EXPECT_EQ(velk::adapter::payload_uri(path.c_str()).c_str(), (prefix + path).substr(0, 255));
    }
}

TEST_F(AdapterTexts, DeviceTableTakesFifty) {
    for (int i = 0; i < velk::kMaxDevices; ++i) {
        EXPECT_TRUE(velk::adapter::add_device(package(), "dfn", "dev")) << i;
    }
    const std::string before = record_image(0);
    EXPECT_FALSE(velk::adapter::add_device(package(), "dfn", "dev"));
    EXPECT_EQ(record_image(0), before);
    EXPECT_EQ(package().dfnnumber, velk::kMaxDevices);
}

TEST_F(AdapterTexts, DeviceTableTakesNothingUnderANegativeCount) {
    package().dfnnumber = -1;
    EXPECT_FALSE(velk::adapter::add_device(package(), "dfn", "dev"));
}

TEST_F(AdapterTexts, LongDeviceTextsAreCutToTheirFields) {
    for (const std::size_t length : {199U, 200U, 1023U}) {
        package().dfnnumber = 0;
        const std::string dfn(length, 'f');
        const std::string device(length, 'd');
        EXPECT_TRUE(velk::adapter::add_device(package(), dfn, device));
        EXPECT_THAT(devices(), ElementsAre(dfn.substr(0, 199) + " on " + device.substr(0, 199)));
        EXPECT_STREQ(package().DFNDeviceIDArray[1].DFN, "");
    }
}

TEST_F(AdapterTexts, DfnIsTrimmedBeforeItIsCut) {
    const std::string raw = std::string(500, ' ') + "DFN-A" + std::string(500, '\t');
    EXPECT_EQ(velk::adapter::TrimmedDfn("elx", raw.c_str()).view(), "DFN-A");
    EXPECT_EQ(velk::adapter::TrimmedDfn("elx", nullptr).view(), "");
    EXPECT_EQ(velk::adapter::TrimmedDfn("elx", " \t ").view(), "");
}

TEST_F(AdapterTexts, DfnIsLoggedBeforeAndAfterItIsTrimmed) {
    const velk::adapter::TrimmedDfn dfn("qlogic", " A B\t");
    EXPECT_EQ(log(), entry("DFN raw data from qlogic provider is \" A B\t\", to trim it.\n") +
                         entry("DFN after trim is \"A B\"\n"));
}

// ---- The loop over a package's payloads, and one payload's call ----

struct LoopCase {
    const char *name;
    const char *family;
    int (*install_all)(int, const CMPIContext *);
    int (*install_one)(const CMPIContext *, const char *, const char *);
    const char *payload_line;  // up to the payload's number
    const char *failure_line;  // up to the result; null: none
    const char *target;        // the target's path up to the system's name
    const char *target_class;
};

void PrintTo(const LoopCase &row, std::ostream *out) {
    *out << row.name;
}

constexpr LoopCase kLoops[] = {
    {"EmulexFc", "EmulexFc", install_elxfc_payload, install_one_elxfc_payload, "Install Emulex ",
     "Error return from install_one_elxfc_payload(): ",
     "root/emulex:ELXHBA_FCPort.SystemCreationClassName=\"OMC_UnitaryComputerSystem\"",
     "ELXHBA_FCPort"},
    {"EmulexCna", "EmulexCna", install_elxcna_payload, install_one_elxcna_payload,
     "Install Emulex ", "install_one_elxcna_payload() failed: ",
     "root/emulex:ELXUCNA_EthernetPort.SystemCreationClassName=\"OMC_UnitaryComputerSystem\"",
     "ELXUCNA_EthernetPort"},
    {"Brocade", "Brocade", installBrcdFCpayload, installSingleBrcdFCpayload, "Install Brocade ",
     nullptr,
     "root/brocade:BROCADE_PortController.SystemCreationClassName=\"BROCADE_ComputerSystem\"",
     "BROCADE_PortController"},
};

class AdapterPayloads : public AdapterTest, public ::testing::WithParamInterface<LoopCase> {
  protected:
    AdapterPayloads() {
        adapter_family(GetParam().family).furnish(*this);
        unzip().files.clear();
    }

    VendorClass &service() { return vendor(adapter_family(GetParam().family).service); }

    void answer(std::initializer_list<std::uint32_t> values) {
        auto &answers = service().answers["InstallFromURI"];
        answers.clear();
        for (const std::uint32_t value : values) {
            answers.push_back({.value = value, .outputs = {}, .message = {}});
        }
    }

    int install_all() { return install(GetParam().install_all); }

    int install_one(const char *path, const char *device) {
        int result = -1;
        in_request([&](const CMPIContext *context) {
            result = GetParam().install_one(context, path, device);
        });
        return result;
    }

    // The URIs that the service was given.
    Texts uris() {
        Texts out;
        for (const std::string &call : up_calls()) {
            if (const auto at = call.find("URI=\""); at != std::string::npos) {
                out.push_back(call.substr(at + 5, call.find('"', at + 5) - at - 5));
            }
        }
        return out;
    }
};

TEST_P(AdapterPayloads, AreInstalledInTheirOrder) {
    for (const char *file : {"a.bin", "b.bin", "sub/c.bin"}) {
        put_payload(file, "DEV-1");
    }
    EXPECT_EQ(install_all(), 0);
    EXPECT_THAT(uris(), ElementsAre("file:///var/tmp/ZEB/Pakro/Package/a.bin",
                                    "file:///var/tmp/ZEB/Pakro/Package/b.bin",
                                    "file:///var/tmp/ZEB/Pakro/Package/sub/c.bin"));
    const std::string line = GetParam().payload_line;
    EXPECT_EQ(logged(line + "0 package. Payload path: a.bin, Device ID: DEV-1\n"), 1);
    EXPECT_EQ(logged(line + "2 package. Payload path: sub/c.bin, Device ID: DEV-1\n"), 1);
}

TEST_P(AdapterPayloads, EndWithTheFirstFailure) {
    for (const char *file : {"a.bin", "b.bin", "c.bin"}) {
        put_payload(file, "DEV-1");
    }
    answer({0, 4107});
    EXPECT_EQ(install_all(), 4107);
    EXPECT_EQ(uris().size(), 2U) << "the third is not tried";
    if (GetParam().failure_line != nullptr) {
        EXPECT_EQ(logged(std::string(GetParam().failure_line) + "4107\n"), 1);
    }
}

TEST_P(AdapterPayloads, NoneIsNoFailure) {
    for (const int count : {0, -1}) {
        package().payloadnum = count;
        EXPECT_EQ(install_all(), 0);
    }
    EXPECT_THAT(up_calls(), IsEmpty());
}

TEST_P(AdapterPayloads, BeyondTheTableAreNotThere) {
    for (int i = 0; i < velk::kMaxPayloads; ++i) {
        put_payload("fw.bin", "DEV-1");
    }
    package().payloadnum = velk::kMaxPayloads + 1;
    EXPECT_EQ(install_all(), 0);
    EXPECT_EQ(uris().size(), 100U);
}

TEST_P(AdapterPayloads, NameThatRunsOnIsReadOn) {
    put_payload(std::string(199, 'n'), "DEV-1");
    put_payload(std::string(199, 'n'), "DEV-2");
    package().PayloadDeviceIDArray[1].PayloadPath[199] = 'n';
    EXPECT_EQ(install_all(), 0);
    const std::string prefix = "file:///var/tmp/ZEB/Pakro/Package/";
    EXPECT_THAT(uris(), ElementsAre(prefix + std::string(199, 'n'),
                                    prefix + std::string(200, 'n') + "DEV-2"));
}

TEST_P(AdapterPayloads, TargetIsNamedByItsFourKeys) {
    EXPECT_EQ(install_one("fw.bin", "DEV-7"), 0);
    const std::string target = std::string(GetParam().target) +
                               ",SystemName=\"host-1\",CreationClassName=\"" +
                               GetParam().target_class + "\",DeviceID=\"DEV-7\"";
    EXPECT_NE(up_calls().back().find("Target=" + target), std::string::npos) << up_calls().back();
}

TEST_P(AdapterPayloads, LastServiceNamesTheSystem) {
    service().instances = {service_on("host-1"), service_on("host-2")};
    EXPECT_EQ(install_one("fw.bin", "DEV-1"), 0);
    EXPECT_EQ(logged("host-1\n"), 1) << "each that is found is logged";
    EXPECT_EQ(logged("host-2\n"), 1);
    EXPECT_NE(service().targets.back().find("SystemName=\"host-2\""), std::string::npos);
    EXPECT_NE(up_calls().back().find("SystemName=\"host-2\""), std::string::npos);
}

TEST_P(AdapterPayloads, WithoutAServiceInstanceTheSystemIsNull) {
    service().instances.clear();
    EXPECT_EQ(install_one("fw.bin", "DEV-1"), 0);
    EXPECT_NE(service().targets.back().find("SystemName=NULL"), std::string::npos)
        << service().targets.back();
    EXPECT_NE(up_calls().back().find("SystemName=NULL"), std::string::npos);
}

TEST_P(AdapterPayloads, ServiceInstanceWithoutASystemNamesNone) {
    service().instances = {service_on("host-1"), {}};
    EXPECT_EQ(install_one("fw.bin", "DEV-1"), 0);
    EXPECT_NE(service().targets.back().find("SystemName=NULL"), std::string::npos);
}

TEST_P(AdapterPayloads, WithoutAPathOfTheServiceNothingIsCalled) {
    fail_service("broker.newObjectPath", service().name(), CMPI_RC_ERR_FAILED);
    EXPECT_EQ(install_one("fw.bin", "DEV-1"), 1);
    EXPECT_THAT(up_calls(), IsEmpty());
}

TEST_P(AdapterPayloads, WithoutAPathOfTheTargetNothingIsCalled) {
    fail_service("broker.newObjectPath", GetParam().target_class, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(install_one("fw.bin", "DEV-1"), 1);
    EXPECT_THAT(service().targets, IsEmpty());
}

TEST_P(AdapterPayloads, WithoutArgumentListsTheCallIsMadeAndItsResultTaken) {
    fail_service("broker.newArgs", "", CMPI_RC_ERR_FAILED);
    EXPECT_EQ(install_one("fw.bin", "DEV-1"), 0);
}

TEST_P(AdapterPayloads, FailedCallOutweighsAnyValue) {
    service().answers["InstallFromURI"] = {
        {.value = 0, .outputs = {}, .code = CMPI_RC_ERR_ACCESS_DENIED, .message = "not you"}};
    EXPECT_EQ(install_one("fw.bin", "DEV-1"), 4098);
    EXPECT_EQ(logged("Package installation error message:"), 1);
    EXPECT_EQ(logged("not you\n"), 1);
}

TEST_P(AdapterPayloads, FailedCallNeedsNoMessage) {
    fail_service("broker.invokeMethod", service().name() + ".InstallFromURI", CMPI_RC_ERR_FAILED);
    EXPECT_EQ(install_one("fw.bin", "DEV-1"), 4098);
}

TEST_P(AdapterPayloads, IndexOutsideOfTheTableInstallsNothing) {
    for (const int index : {-1, velk::kMaxPackages}) {
        EXPECT_EQ(install(GetParam().install_all, index), 0);
    }
    EXPECT_THAT(up_calls(), IsEmpty());
}

INSTANTIATE_TEST_SUITE_P(Each, AdapterPayloads, ::testing::ValuesIn(kLoops),
                         [](const auto &about) { return std::string(about.param.name); });

}  // namespace
}  // namespace velktest

// The example packages for adapters, as the library reads, classifies, unpacks and matches them,
// on a host with the adapters of the default scenario.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <fstream>
#include <set>

#include "catalog/applicability.h"
#include "catalog/classification.h"
#include "catalog/descriptor.h"
#include "installers/Emulex_update.h"
#include "installers/Qlogic_update.h"
#include "installers/adapter_frame.h"
#include "installers/brocade_update.h"
#include "installers/facade_update.h"
#include "installers/unpack.h"
#include "tests/support/library_test.h"
#include "tests/unit/host/examples_testing.h"
#include "velk/package_table.h"

namespace {

namespace fs = std::filesystem;
using velktest::examples::make_packages;
using velktest::examples::quoted;

struct Adapter {
    std::string dfn;
    std::string device;
};

// What its vendor's provider tells of each family's adapters.
const std::vector<Adapter> kEmulexFc = {{"LPE12002-M8", "10:00:00:00:C9:A1:B2:C0"},
                                        {"LPE12002-M8", "10:00:00:00:C9:A1:B2:C1"}};
const std::vector<Adapter> kEmulexCna = {{"49Y7952", "00:00:C9:F4:E2:10"}};
const std::vector<Adapter> kQlogic = {{"QLE8242", "RFE1203K04512"}, {"QLE2562", "RFD1150M77120"}};
const std::vector<Adapter> kBrocade = {{"1860-2P", "10:00:8C:7C:FF:12:34:50"},
                                       {"1860-2P", "10:00:8C:7C:FF:12:34:51"}};
const std::vector<Adapter> kBroadcom = {{"BCM5719", "nic"}};
const std::vector<Adapter> kLsi = {{"9240-8I", "raid"}};

struct Row {
    std::string package;
    velk::Installer installer;
    std::vector<Adapter> adapters;
    std::vector<std::string> matches;  // "payload for device"
    std::size_t images = 1;            // in the archive
    int order = velk::order_flag::kDiagnostics;
};

const std::vector<Row> kRows = {
    {"elx_fw_fc_lpe12002-2.01a12_anyos",
     installElxFCPkg,
     kEmulexFc,
     {"image/elx_fc_lpe12002_201a12.grp for 10:00:00:00:C9:A1:B2:C0",
      "image/elx_fc_lpe12002_201a12.grp for 10:00:00:00:C9:A1:B2:C1"},
     2},
    {"elx_fw_cna_oce11102-4.2.433.0_anyos",
     installElxCNAPkg,
     kEmulexCna,
     {"image/elx_cna_oce11102_42433.ufi for 00:00:C9:F4:E2:10",
      "image/elx_cna_oce11102_boot_501a8.ufi for 00:00:C9:F4:E2:10"},
     2},
    {"elx_dd_fc_lpe12002-8.2.3.108_anyos",
     installElxFCPkg,
     {kEmulexFc.front()},
     {"image/lpfc820-8.2.3.108.vib for 10:00:00:00:C9:A1:B2:C0"},
     1,
     velk::order_flag::kUnsupportedType},
    {"qlgc_fw_nic_qle8242-4.10.05_anyos",
     installQlgPkg,
     kQlogic,
     {"image/qlgc_nic_qle8242_41005.bin for RFE1203K04512"},
     2},
    {"qlgc_fw_fc_qle2562-5.08.00_anyos",
     installQlgPkg,
     kQlogic,
     {"image/qlgc_fc_qle2562_50800.bin for RFD1150M77120"}},
    {"qlgc_fw_fc_qle8362-6.04.01_anyos", installQlgPkg, kQlogic, {}},
    {"brcd_fw_fc_1860-3.2.1.0_anyos",
     installBrocadePkg,
     kBrocade,
     {"image/brcd_fc_1860_3210.img for 10:00:8C:7C:FF:12:34:50",
      "image/brcd_fc_1860_3210.img for 10:00:8C:7C:FF:12:34:51"}},
    {"brcm_fw_nic_bcm5719-1.38_anyos",
     installBroadcomPkg,
     kBroadcom,
     {"image/brcm_nic_bcm5719_138.bin for nic"},
     2},
    {"lsi_fw_sas_9240-20.12.0-0004_anyos",
     installLSIPkg,
     kLsi,
     {"image/lsi_sas_9240_20120.rom for raid"}},
    {"lsi_fw_sas_9280-12.14.0-0167_anyos", installLSIPkg, kLsi, {}},
};

class ExampleAdapterPackage : public velktest::LibraryTest,
                              public ::testing::WithParamInterface<Row> {
  protected:
    ExampleAdapterPackage() {
        use_packages(1);
        EXPECT_EQ(make_packages(quoted(folder_.path().string()) + ' ' + GetParam().package), 0);
    }

    static velk::PackageRecord &record() { return pkgInstance[0]; }

    [[nodiscard]] std::string location(const char *extension) const {
        return "file://" + (folder_.path() / GetParam().package).string() + extension;
    }

    void parse_descriptor() const {
        velktest::set_field(record().TFTPPayloadPkgURIs, "file://" + folder_.path().string() + '/');
        velktest::set_field(record().LocalPkgURI, location(".xml"));
        getPkgAssociation(0);
    }

    static void add(const Adapter &adapter) {
        velk::DfnDevice &entry = record().DFNDeviceIDArray[record().dfnnumber++];
        velktest::set_field(entry.DFN, adapter.dfn);
        velktest::set_field(entry.DeviceID, adapter.device);
    }

    [[nodiscard]] fs::path unpacked(const std::string &path) const {
        return at(velk::adapter::kUnpackDirectory) / path;
    }

  private:
    velktest::TempFolder folder_;
};

TEST_P(ExampleAdapterPackage, ParsesAndGoesToItsFamily) {
    parse_descriptor();
    EXPECT_EQ(record().OrderFlag, GetParam().order);
    EXPECT_EQ(record().TFTPPayloadPkgURIs, location(".zip"));
    getPkgProviderName(0);
    EXPECT_EQ(record().installer, GetParam().installer);
}

TEST_P(ExampleAdapterPackage, UnpacksToImagesAndTheirConfiguration) {
    ASSERT_EQ(velk::adapter::unpack_package(location(".zip").c_str()), 0);
    EXPECT_EQ(velktest::read_file(unpacked("image/payload.xml")),
              velktest::read_file(std::string(VELK_EXAMPLES_DIR) + "/packages/" +
                                  GetParam().package + "/payload.xml"));
    std::set<std::string> images;
    for (const auto &file : fs::directory_iterator(unpacked("image"))) {
        if (file.path().filename() != "payload.xml") {
            images.insert(velktest::read_file(file.path()));
        }
    }
    EXPECT_EQ(images.size(), GetParam().images);
    EXPECT_THAT(images, ::testing::Each(::testing::StartsWith("ZEBFWIMG")));
    EXPECT_THAT(images, ::testing::Each(::testing::SizeIs(16384)));
}

TEST_P(ExampleAdapterPackage, MatchesTheAdaptersThatItIsFor) {
    ASSERT_EQ(velk::adapter::unpack_package(location(".zip").c_str()), 0);
    for (const Adapter &adapter : GetParam().adapters) {
        add(adapter);
    }
    ASSERT_EQ(parsePayloadDeviceIDArray(0), 1);
    std::vector<std::string> matches;
    for (int i = 0; i < record().payloadnum; ++i) {
        const velk::PayloadDevice &entry = record().PayloadDeviceIDArray[i];
        matches.push_back(std::string(entry.PayloadPath) + " for " + entry.DeviceID);
        EXPECT_TRUE(fs::exists(unpacked(entry.PayloadPath))) << entry.PayloadPath;
    }
    EXPECT_EQ(matches, GetParam().matches);
}

INSTANTIATE_TEST_SUITE_P(Shipped, ExampleAdapterPackage, ::testing::ValuesIn(kRows),
                         [](const auto &about) {
                             return velktest::examples::test_name(about.param.package);
                         });

TEST(ExampleAdapters, EveryArchiveHasItsRow) {
    std::set<std::string> rows;
    for (const Row &row : kRows) {
        rows.insert(row.package);
    }
    std::set<std::string> archives;
    for (const fs::path &descriptor : velktest::examples::descriptors()) {
        if (fs::exists(fs::path(descriptor).replace_extension() / "payload.xml")) {
            archives.insert(descriptor.stem().string());
        }
    }
    EXPECT_EQ(archives, rows);
}

TEST(ExampleAdapters, ListHasAPackageForEveryFamilyAndOneThatIsRefused) {
    std::ifstream list(std::string(VELK_EXAMPLES_DIR) + "/adapters.list");
    std::set<velk::Installer> families;
    int refused = 0;
    for (std::string line; std::getline(list, line);) {
        const auto row = std::ranges::find(kRows, fs::path(line).stem().string(), &Row::package);
        if (line.starts_with('#')) {
            continue;
        }
        ASSERT_NE(row, kRows.end()) << line;
        families.insert(row->installer);
        refused += row->order == velk::order_flag::kUnsupportedType ? 1 : 0;
    }
    EXPECT_EQ(families.size(), 6U);  // QLogic's two are one
    EXPECT_EQ(refused, 1);
}

}  // namespace

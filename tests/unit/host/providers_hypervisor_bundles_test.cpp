// The bundles that the hypervisor's provider looks into: what is new in them, and what is wrong
// with them.
#include "providers_hypervisor_fixture.h"

#include <functional>

namespace velkhost::providers::testing {
namespace {

using ::testing::HasSubstr;

class HypervisorBundles : public HypervisorProvider {
  protected:
    // The last text of the job of an installation of the bundle, which is written anew.
    std::string end() { return end_of(depot_.write()); }

    std::string end_of(const std::string &uri) {
        EXPECT_EQ(install(uri).return_value, cim::Value::uint32(4096)) << "a job tells";
        const std::vector<std::string> course = looks(6);
        EXPECT_EQ(course.front(), kScanning);
        return course.back();
    }

    static std::string failure(const std::string &reason) { return "The update failed: " + reason; }
};

TEST_F(HypervisorBundles, NewPackagesAreInstalled) {
    depot_.add_vib("driver", "2.0");
    EXPECT_EQ(end(), kCompleted);
    EXPECT_EQ(end(), kObsolete) << "by now they are there";
    depot_.add_vib("driver", "2.1");
    EXPECT_EQ(end(), kCompleted);
}

TEST_F(HypervisorBundles, VersionsAreComparedByTheirNumbers) {
    play("[host]\nnode = 'host-1'\n[hypervisor]\ninstalled = ['base 1.9-1', 'other 9']\n");
    struct {
        const char *version;
        const char *end;
    } const cases[] = {
        {"0.10", kObsolete},    {"1.9-1", kObsolete}, {"1.9", kObsolete}, {"1.9-2", kCompleted},
        {"1.10-1", kCompleted}, {"1.9-3", kObsolete}, {"2", kCompleted},  {"1.99", kObsolete},
    };
    for (const auto &row : cases) {
        depot_.add_vib("base", row.version);
        EXPECT_EQ(end(), row.end) << row.version;
    }
}

TEST_F(HypervisorBundles, BundleWithoutPackagesIsObsolete) {
    depot_.metadata.erase("vibs/base.xml");
    EXPECT_EQ(end(), kObsolete);
}

TEST_F(HypervisorBundles, FilesOfTheBundleMustLeadToEachOther) {
    struct {
        const char *file;
        const char *text;  // null: the file is missing
        const char *reason;
    } const cases[] = {
        {"index.xml", nullptr, "index.xml cannot be read"},
        {"index.xml", "", "index.xml does not name vendor-index.xml"},
        {"index.xml", "<indexfile>vendor-index.xml", "index.xml does not name vendor-index.xml"},
        {"vendor-index.xml", nullptr, "vendor-index.xml cannot be read"},
        {"vendor-index.xml", "<url>other.zip</url>", "vendor-index.xml does not name metadata.zip"},
    };
    const auto sound = depot_.files;
    for (const auto &row : cases) {
        depot_.files = sound;
        depot_.files.erase(row.file);
        if (row.text != nullptr) {
            depot_.files[row.file] = row.text;
        }
        EXPECT_EQ(end(), failure(row.reason)) << row.file;
    }
}

TEST_F(HypervisorBundles, SeveralVendorsMayBeNamed) {
    depot_.files["index.xml"] =
        "<indexfile>other.xml</indexfile>\n<indexfile>\n  vendor-index.xml\n</indexfile>";
    EXPECT_EQ(end(), kCompleted);
}

TEST_F(HypervisorBundles, PackagesMustBeThereWithTheirSize) {
    const std::string place = "vib20/base/base.vib";
    const auto sound = depot_.files;
    depot_.files.erase(place);
    EXPECT_EQ(end(), failure(place + " is missing or no package"));
    depot_.files[place] = std::string(100, 'x');
    EXPECT_EQ(end(), failure(place + " is missing or no package"));
    depot_.files[place] = "!<ar";
    EXPECT_EQ(end(), failure(place + " is missing or no package"));
    depot_.files[place] = sound.at(place) + "x";
    EXPECT_EQ(end(), failure(place + " has not the size that its metadata state"));
    depot_.files = sound;
    EXPECT_EQ(end(), kCompleted) << "what failed left nothing behind";
}

TEST_F(HypervisorBundles, MetadataOfAPackageMustBeWhole) {
    using velktest::vib_text;
    const std::string place = "vib20/base/base.vib";
    struct {
        std::string text;
        const char *reason;
    } const cases[] = {
        {"", "vibs/base.xml must have one name"},
        {"<name></name>", "vibs/base.xml must have one name"},
        {"<name>a</name><name>b</name>", "vibs/base.xml must have one name"},
        {"<name>a</name>", "vibs/base.xml must have one version"},
        {vib_text("base", "1", place, "x"), "vibs/base.xml has a packed-size that is no number"},
        {vib_text("base", "1", place, "100x"), "vibs/base.xml has a packed-size that is no number"},
        {vib_text("base", "1", place, "-1"), "vibs/base.xml has a packed-size that is no number"},
        {vib_text("base", "1", place, "99999999999999999999"),
         "vibs/base.xml has a packed-size that is no number"},
    };
    for (const auto &row : cases) {
        depot_.metadata["vibs/base.xml"] = row.text;
        EXPECT_EQ(end(), failure(row.reason)) << row.text;
    }
}

TEST_F(HypervisorBundles, PackagesOutsideOfTheBundleAreNotLookedAt) {
    for (const char *place : {"/etc/passwd", "../other/base.vib", "vib20/../../x"}) {
        depot_.metadata["vibs/base.xml"] = velktest::vib_text("base", "1", place, "1");
        EXPECT_THAT(end(), HasSubstr("The update failed: ")) << place;
        EXPECT_THAT(end(), HasSubstr("metadata.zip is no undamaged archive")) << place;
    }
}

TEST_F(HypervisorBundles, DamagedArchiveIsRefused) {
    const std::string uri = depot_.write();
    const auto size = std::filesystem::file_size(depot_.archive());
    const auto with = [&](const std::function<void()> &damage) {
        depot_.write();
        damage();
        return end_of(uri);
    };
    const std::string damaged = failure("metadata.zip is no undamaged archive");
    EXPECT_EQ(with([&] { std::filesystem::remove(depot_.archive()); }), damaged);
    EXPECT_EQ(with([&] { std::filesystem::resize_file(depot_.archive(), size - 1); }), damaged);
    EXPECT_EQ(with([&] { std::filesystem::resize_file(depot_.archive(), 0); }), damaged);
    EXPECT_EQ(with([&] {
                  std::fstream archive(depot_.archive(),
                                       std::ios::binary | std::ios::in | std::ios::out);
                  archive.seekp(50);  // inside the first entry's data
                  archive.put('\x7F');
              }),
              damaged);
    EXPECT_EQ(end(), kCompleted);
}

TEST_F(HypervisorBundles, TextsWithoutEndAreRefused) {
    depot_.metadata["readme.txt"] = std::string((std::size_t{1} << 20) + 1, 'x');
    EXPECT_EQ(end(), failure("readme.txt is too long"));
}

TEST_F(HypervisorBundles, LocationsOfOtherHostsHaveNoClient) {
    for (const char *uri :
         {"ftp://server/metadata.zip", "tftp://server/metadata.zip", "metadata.zip", ""}) {
        EXPECT_EQ(end_of(uri), failure(std::string("this host has no client for ") + uri));
    }
}

}  // namespace
}  // namespace velkhost::providers::testing

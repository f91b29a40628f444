// Run folders, and where the parts of a host are found.
#include "host/rig/parts.h"
#include "host/rig/rig_error.h"
#include "host/rig/run_folder.h"
#include "host/rig/text_file.h"

#include <gtest/gtest.h>

#include <fstream>

namespace velkhost::rig {
namespace {

namespace fs = std::filesystem;

void make_file(const fs::path &path) {
    fs::create_directories(path.parent_path());
    std::ofstream(path) << "x";
}

// A place of the test's own that goes with it.
class Place {
  public:
    Place() : folder_(RunFolder::make_temporary()) {}
    [[nodiscard]] fs::path operator/(const char *name) const { return folder_.path() / name; }

  private:
    RunFolder folder_;
};

TEST(RigRunFolder, TemporaryOneGoesWithItsObject) {
    fs::path path;
    {
        const RunFolder folder = RunFolder::make_temporary();
        path = folder.path();
        EXPECT_TRUE(folder.is_temporary());
        EXPECT_TRUE(path.is_absolute());
        make_file(path / "a/b/c");
    }
    EXPECT_FALSE(fs::exists(path));
}

TEST(RigRunFolder, KeptOneStays) {
    fs::path path;
    {
        RunFolder folder = RunFolder::make_temporary();
        path = folder.path();
        folder.keep();
    }
    EXPECT_TRUE(fs::exists(path));
    EXPECT_TRUE(remove_folder(path));
}

TEST(RigRunFolder, MovedFromOneRemovesNothing) {
    RunFolder first = RunFolder::make_temporary();
    const fs::path path = first.path();
    {
        const RunFolder second = std::move(first);
        EXPECT_TRUE(fs::exists(path));
    }
    EXPECT_FALSE(fs::exists(path));
}

TEST(RigRunFolder, NamedOneIsMadeAndStaysWithWhatItHad) {
    const Place place;
    make_file(place / "root/tmp/velkdebug.txt");
    { const RunFolder folder = RunFolder::at(place / "root"); }
    { const RunFolder folder = RunFolder::at(place / "new/root"); }
    EXPECT_TRUE(fs::exists(place / "root/tmp/velkdebug.txt"));
    EXPECT_TRUE(fs::is_directory(place / "new/root"));
}

TEST(RigRunFolder, PlaceThatIsAFileIsRefusedByName) {
    const Place place;
    make_file(place / "file");
    try {
        RunFolder::at(place / "file");
        FAIL() << "a file was taken for a folder";
    } catch (const RigError &error) {
        EXPECT_NE(std::string(error.what()).find((place / "file").string()), std::string::npos);
    }
}

TEST(RigRunFolder, FurnishedOneHasFoldersScenarioAndLinksToTheHostsLibraries) {
    const Place place;
    for (const char *name :
         {"libvelkprovider.so", "libconcretejob.so", "libunzipfile.so", "libzebfiletransfer.so",
          "libadapterlsi.so", "libvelkbroker.so", "libzeb.txt"}) {
        make_file(place / "lib" / name);
    }
    const RunFolder folder = RunFolder::at(place / "root");
    folder.furnish(place / "lib", "[host]\n");
    folder.furnish(place / "lib", "[jobs]\n");  // again, as for a folder that was used before
    EXPECT_TRUE(fs::is_directory(folder.inside("/tmp/sfcb")));
    EXPECT_TRUE(fs::is_directory(folder.inside("/var/tmp/filestore")));
    EXPECT_EQ(read_text_file(folder.inside("/etc/velkhost/scenario.toml")), "[jobs]\n");
    EXPECT_EQ(fs::read_symlink(folder.inside("/usr/lib/cim/libconcretejob.so")),
              place / "lib/libconcretejob.so");
    EXPECT_TRUE(fs::exists(folder.inside("/usr/lib/cim/libzebfiletransfer.so")));
    EXPECT_TRUE(fs::exists(folder.inside("/usr/lib/cim/libunzipfile.so")));
    EXPECT_TRUE(fs::exists(folder.inside("/usr/lib/cim/libadapterlsi.so")));
    EXPECT_FALSE(fs::exists(folder.inside("/usr/lib/cim/libvelkbroker.so")));
    EXPECT_FALSE(fs::exists(folder.inside("/usr/lib/cim/libzeb.txt")));
}

TEST(RigRunFolder, RemovalOfWhatIsNotThereSucceeds) {
    EXPECT_TRUE(remove_folder("/nowhere/at/all"));
}

TEST(RigParts, AreFoundAroundAnInstalledProgram) {
    const Place place;
    make_file(place / "bin/velkhost");
    make_file(place / "lib/velkhost/parts/libvelkprovider.so");
    make_file(place / "share/velkhost/mof/zeb_cimv2.mof");
    make_file(place / "share/velkhost/mof/cim_base.mof");
    make_file(place / "share/velkhost/registration/b.reg");
    make_file(place / "share/velkhost/registration/a.reg");
    const Parts parts = Parts::around(place / "bin");
    EXPECT_EQ(parts.libraries, place / "lib/velkhost/parts");
    EXPECT_EQ(parts.mof_files, std::vector<fs::path>{place / "share/velkhost/mof/zeb_cimv2.mof"});
    EXPECT_EQ(parts.registrations,
              (std::vector<fs::path>{place / "share/velkhost/registration/a.reg",
                                     place / "share/velkhost/registration/b.reg"}));
}

TEST(RigParts, MissingOnesAreNamed) {
    const Place place;
    const auto message = [&place] {
        try {
            Parts::around(place / "bin");
            return std::string();
        } catch (const RigError &error) {
            return std::string(error.what());
        }
    };
    EXPECT_NE(message().find("libvelkprovider.so"), std::string::npos);
    make_file(place / "lib/libvelkprovider.so");
    EXPECT_NE(message().find(".mof"), std::string::npos);
    make_file(place / "share/velkhost/mof/x.mof");
    EXPECT_NE(message().find(".reg"), std::string::npos);
}

}  // namespace
}  // namespace velkhost::rig

// What velkhost says to arguments and surroundings that it cannot use.
#include "tests/integration/velkhost/fixture.h"

#include <gmock/gmock.h>

namespace velkhost::testing {
namespace {

namespace fs = std::filesystem;
using ::testing::HasSubstr;

class VelkhostUsage : public VelkhostTest {
  protected:
    // The exit code, with nothing on stdout, something on stderr and no folder left.
    int refused(const std::vector<std::string> &arguments, const std::string &said) {
        const Finished finished = velkhost(arguments);
        EXPECT_EQ(finished.out, "");
        EXPECT_THAT(finished.err, HasSubstr(said));
        EXPECT_TRUE(run_folders().empty());
        return finished.exit_code;
    }
};

TEST_F(VelkhostUsage, VersionAndHelpAreNoErrors) {
    EXPECT_EQ(velkhost({"--version"}).out, "velkhost " VELKHOST_VERSION "\n");
    for (const std::vector<std::string> &arguments :
         {std::vector<std::string>{"help"}, {"--help"}, {"install", "--help"}}) {
        const Finished finished = velkhost(arguments);
        EXPECT_EQ(finished.exit_code, 0);
        EXPECT_THAT(finished.out, HasSubstr("install"));
    }
    EXPECT_THAT(velkhost({"install", "--help"}).out, HasSubstr("Exit codes:"));
    EXPECT_EQ(velkhost({"help"}).out, velkhost({"--help"}).out);
}

TEST_F(VelkhostUsage, WrongCommandLinesAreTwo) {
    const std::string uri = package();
    EXPECT_EQ(refused({}, "subcommand"), 2);
    EXPECT_EQ(refused({"remove"}, "subcommand"), 2);
    EXPECT_EQ(refused({"install"}, "URI"), 2);
    EXPECT_EQ(refused({"install", "--speed", uri}, "--speed"), 2);
    EXPECT_EQ(refused({"install", "--clock", "fast", uri}, "fast"), 2);
    EXPECT_EQ(refused({"install", "--options", "x", uri}, "--options"), 2);
    EXPECT_EQ(refused({"install", "--limit", "soon", uri}, "soon"), 2);
    EXPECT_EQ(refused({"install", "--pace", "-1", uri}, "--pace"), 2);
    EXPECT_EQ(refused({"install", (place_ / "missing.xml").string()}, "missing.xml"), 2);
}

TEST_F(VelkhostUsage, ScenarioThatCannotBeUsedIsNamedWithItsLine) {
    const auto broken = write_file("broken.toml", "[host]\nnodes = \"x\"\n");
    EXPECT_EQ(refused({"install", "--scenario", broken.string(), package()}, "broken.toml:2: "), 4);
    EXPECT_EQ(refused({"install", "--scenario", "/no/such.toml", package()}, "/no/such.toml"), 4);
}

TEST_F(VelkhostUsage, RootThatCannotBeUsedIsNamed) {
    const auto file = write_file("file", "x");
    EXPECT_EQ(refused({"install", "--root", file.string(), package()}, file.string()), 4);
}

TEST_F(VelkhostUsage, PlaceForTemporaryFoldersThatIsGoneIsNamed) {
    auto surroundings = environment();
    surroundings["TMPDIR"] = "/no/such/place";
    const Finished finished =
        Process::on_pipes(command({"install", package()}), surroundings).wait();
    EXPECT_EQ(finished.exit_code, 4);
    EXPECT_THAT(finished.err, HasSubstr("/no/such/place"));
}

TEST_F(VelkhostUsage, InstalledProgramFindsItsPartsAroundItself) {
    const fs::path prefix = place_ / "usr";
    const fs::path build = fs::path(VELKHOST_PROGRAM).parent_path().parent_path();
    fs::create_directories(prefix / "bin");
    fs::create_directories(prefix / "lib");
    fs::copy_file(VELKHOST_PROGRAM, prefix / "bin/velkhost");
    const std::vector<std::string> installed = {(prefix / "bin/velkhost").string(), "install",
                                                "--discard", package()};
    const Finished alone = Process::on_pipes(installed, environment()).wait();
    EXPECT_EQ(alone.exit_code, 4);
    EXPECT_THAT(alone.err, HasSubstr("libvelkprovider.so"));
    fs::create_directories(prefix / "lib/velkhost");
    fs::create_directory_symlink(build / "lib", prefix / "lib/velkhost/parts");
    fs::create_directory_symlink(build / "share", prefix / "share");
    EXPECT_EQ(Process::on_pipes(installed, environment()).wait().exit_code, 0);
    EXPECT_TRUE(run_folders().empty());
}

}  // namespace
}  // namespace velkhost::testing

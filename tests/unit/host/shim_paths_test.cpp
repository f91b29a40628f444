// Which paths are re-rooted, and what becomes of their text.
#include <climits>
#include <cstring>
#include <vector>

#include "host/shim/fixed_paths.h"
#include "tests/unit/host/shim_fixture.h"

namespace velkhost::shim::test {
namespace {

std::string ordered(std::string_view path) {
    std::vector<char> room(path.size() + 1);
    const auto result = put_in_order(path, room);
    return result ? std::string(room.data(), result->length) : "not absolute";
}

TEST(ShimOrder, RunsOfSlashesCountAsOne) {
    EXPECT_EQ(ordered("//tmp///sfcb//x"), "/tmp/sfcb/x");
}

TEST(ShimOrder, DotsAreResolvedInTheText) {
    EXPECT_EQ(ordered("/tmp/./sfcb/a/../b"), "/tmp/sfcb/b");
    EXPECT_EQ(ordered("/tmp/sfcb/../../etc/x"), "/etc/x");
}

TEST(ShimOrder, DotDotAtTheTopStaysAtTheTop) {
    EXPECT_EQ(ordered("/../../../etc/cim"), "/etc/cim");
    EXPECT_EQ(ordered("/.."), "");
}

TEST(ShimOrder, NamesThatBeginWithDotsAreNames) {
    EXPECT_EQ(ordered("/tmp/..x/.y/..."), "/tmp/..x/.y/...");
}

TEST(ShimOrder, RelativePathHasNoOrder) {
    EXPECT_EQ(ordered("tmp/sfcb"), "not absolute");
    EXPECT_EQ(ordered(""), "not absolute");
}

TEST(ShimOrder, EndThatAsksForAFolderIsReported) {
    std::array<char, 64> room{};
    EXPECT_TRUE(put_in_order("/tmp/sfcb/", room)->names_a_folder);
    EXPECT_TRUE(put_in_order("/tmp/sfcb/.", room)->names_a_folder);
    EXPECT_TRUE(put_in_order("/tmp/sfcb/a/..", room)->names_a_folder);
    EXPECT_FALSE(put_in_order("/tmp/sfcb", room)->names_a_folder);
}

TEST(ShimOrder, RoomIsFilledToItsLastByteAndNotBeyond) {
    std::array<char, 9> exact{};
    EXPECT_EQ(put_in_order("/tmp/sfcb", exact)->length, exact.size());
    std::array<char, 8> short_of_one{};
    EXPECT_FALSE(put_in_order("/tmp/sfcb", short_of_one).has_value());
    EXPECT_FALSE(put_in_order("/tmp", std::span<char>()).has_value());
}

TEST(ShimFixedPaths, EveryFixedPathAndWhatLiesUnderItIsMet) {
    for (const std::string fixed :
         {"/tmp/velkdebug.txt", "/tmp/sfcb", "/tmp/networkflag", "/var/tmp/filestore",
          "/var/tmp/ZEB", "/etc/cim", "/etc/velkhost", "/usr/lib/cim", "/dev/ipmi0"}) {
        EXPECT_TRUE(is_fixed_path(fixed)) << fixed;
        EXPECT_TRUE(is_fixed_path(fixed + "/x")) << fixed;
        EXPECT_FALSE(is_fixed_path(fixed + "x")) << fixed;
        EXPECT_FALSE(is_fixed_path(fixed.substr(0, fixed.rfind('/')))) << fixed;
    }
}

class ShimMap : public ShimRoot {
  protected:
    std::string map(const char *path, int expected = 1) {
        std::array<char, PATH_MAX> out{};
        EXPECT_EQ(velkshim_map(path, out.data(), out.size()), expected) << path;
        return out.data();
    }
};

TEST_F(ShimMap, FixedPathLiesUnderTheRoot) {
    EXPECT_EQ(map("/tmp/sfcb/velkstat.txt"), root_ / "tmp/sfcb/velkstat.txt");
    EXPECT_EQ(map("/tmp/velkdebug.txt"), root_ / "tmp/velkdebug.txt");
}

TEST_F(ShimMap, RunsOfSlashesAreCollapsed) {
    EXPECT_EQ(map("//tmp///sfcb//x"), root_ / "tmp/sfcb/x");
}

TEST_F(ShimMap, SlashAtTheEndIsKept) {
    EXPECT_EQ(map("/tmp/sfcb/"), root_ / "tmp/sfcb/");
}

TEST_F(ShimMap, PrefixThatEndsInsideAComponentStaysAsItIs) {
    EXPECT_EQ(map("/tmp/sfcbx/y", 0), "/tmp/sfcbx/y");
    EXPECT_EQ(map("/tmp/velkdebug.txt.old", 0), "/tmp/velkdebug.txt.old");
}

TEST_F(ShimMap, PathThatIsNotReRootedKeepsItsText) {
    EXPECT_EQ(map("//home/./x/../y", 0), "//home/./x/../y");
    EXPECT_EQ(map("tmp/sfcb/x", 0), "tmp/sfcb/x");
    EXPECT_EQ(map("", 0), "");
}

TEST_F(ShimMap, DotDotThatLeavesTheFixedPathStaysTheMachines) {
    EXPECT_EQ(map("/tmp/sfcb/../../etc/x", 0), "/tmp/sfcb/../../etc/x");
}

TEST_F(ShimMap, DotDotNeverLeadsOutOfTheRoot) {
    EXPECT_EQ(map("/tmp/sfcb/../../../../../../tmp/sfcb/x"), root_ / "tmp/sfcb/x");
    EXPECT_EQ(map("/home/../tmp/sfcb/a/../b"), root_ / "tmp/sfcb/b");
}

TEST_F(ShimMap, AnswerThatDoesNotFitIsRefused) {
    std::array<char, 8> out{};
    EXPECT_EQ(velkshim_map("/tmp/sfcb/x", out.data(), out.size()), -1);
    EXPECT_EQ(errno, ENAMETOOLONG);
    EXPECT_EQ(velkshim_map("/home/xyz", out.data(), out.size()), -1);
    EXPECT_EQ(velkshim_map("/home/x", out.data(), out.size()), 0);
}

TEST_F(ShimMap, PathTooLongUnderTheRootIsRefused) {
    const std::string fits(PATH_MAX - 1 - root_.native().size() - std::strlen("/tmp/sfcb/"), 'x');
    std::array<char, PATH_MAX> out{};
    EXPECT_EQ(velkshim_map(("/tmp/sfcb/" + fits).c_str(), out.data(), out.size()), 1);
    EXPECT_EQ(velkshim_map(("/tmp/sfcb/" + fits + "x").c_str(), out.data(), out.size()), -1);
    EXPECT_EQ(errno, ENAMETOOLONG);
    EXPECT_EQ(access(("/tmp/sfcb/" + fits + "x").c_str(), F_OK), -1);
    EXPECT_EQ(errno, ENAMETOOLONG);
}

TEST_F(ShimMap, PathLongerThanThePlatformsLimitIsLeftToTheKernel) {
    const std::string path = std::string(PATH_MAX, '/') + "tmp/sfcb";
    EXPECT_EQ(access(path.c_str(), F_OK), -1);
    EXPECT_EQ(errno, ENAMETOOLONG);
}

TEST_F(ShimMap, NullPathIsAnError) {
    std::array<char, 8> out{};
    EXPECT_EQ(velkshim_map(nullptr, out.data(), out.size()), -1);
    EXPECT_EQ(errno, EFAULT);
}

TEST_F(ShimMap, NullRootEndsTheReRooting) {
    EXPECT_EQ(velkshim_set_root(nullptr), 0);
    EXPECT_EQ(map("/tmp/sfcb/x", 0), "/tmp/sfcb/x");
}

TEST_F(ShimMap, RootIsTakenAsItLiesWhenItIsSet) {
    const auto before = std::filesystem::current_path();
    std::filesystem::current_path(root_);
    EXPECT_EQ(velkshim_set_root("tmp/../."), 0);
    std::filesystem::current_path(before);
    EXPECT_EQ(map("/tmp/sfcb/x"), root_ / "tmp/sfcb/x");
}

TEST_F(ShimMap, RootThatCannotBeUsedIsRefusedAndTheOldOneStays) {
    put("/etc/file", "");
    EXPECT_EQ(velkshim_set_root((root_ / "absent").c_str()), ENOENT);
    EXPECT_EQ(velkshim_set_root((root_ / "etc/file").c_str()), ENOTDIR);
    EXPECT_EQ(map("/tmp/sfcb/x"), root_ / "tmp/sfcb/x");
}

TEST_F(ShimMap, TopOfTheFileSystemIsARoot) {
    EXPECT_EQ(velkshim_set_root("/"), 0);
    EXPECT_EQ(map("//tmp/sfcb/x"), "/tmp/sfcb/x");
}

}  // namespace
}  // namespace velkhost::shim::test

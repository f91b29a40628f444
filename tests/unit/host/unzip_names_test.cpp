// Archives that would write elsewhere than they may, or other things than files.
#include <sys/stat.h>

#include "host/unzip/limits.h"
#include "tests/unit/host/unzip_fixture.h"

namespace velkhost::unzip::test {
namespace {

namespace fs = std::filesystem;
using testing::ElementsAre;
using std::string_literals::operator""s;

struct Named {
    const char *what;
    std::string name;
};

class UnzipUnsafeName : public UnzipTest, public testing::WithParamInterface<Named> {};

TEST_P(UnzipUnsafeName, RefusesTheArchiveWhole) {
    expect_refused({{.name = "before", .content = "x"},
                    {.name = GetParam().name, .content = "x"},
                    {.name = "after", .content = "x"}},
                   kMinizipUnsafeName);
}

const std::string kDeepName = [] {
    std::string name;
    for (std::size_t i = 0; i <= kMaxDepth; ++i) {
        name += "f/";
    }
    return name;
}();

INSTANTIATE_TEST_SUITE_P(
    All, UnzipUnsafeName,
    testing::Values(Named{"Parent", "../evil"}, Named{"ParentOfAFolder", "image/../../evil"},
                    Named{"ParentThatStaysInside", "image/../fw.bin"}, Named{"ParentAlone", ".."},
                    Named{"ParentAtTheEnd", "image/.."}, Named{"ParentFolder", "image/../"},
                    Named{"Absolute", "/etc/passwd"}, Named{"TwoSlashes", "//host/share"},
                    Named{"Drive", "C:/evil"}, Named{"DriveRelative", "c:evil"},
                    Named{"Backslash", "image\\fw.bin"}, Named{"BackslashParent", "..\\evil"},
                    Named{"LineEnd", "a\nb"}, Named{"Escape", "a\x1B[31m"},
                    Named{"Delete", "a\x7F"}, Named{"Nul", "fw.bin\0.txt"s},
                    Named{"NulFirst", "\0"s}, Named{"NulBeforeParent", "a\0/../../evil"s},
                    Named{"Empty", ""}, Named{"CurrentFolderAsAFile", "."},
                    Named{"LongPart", std::string(kMaxPartLength + 1, 'n')},
                    Named{"LongWhole", std::string(200, 'n') + '/' + std::string(200, 'n') + '/' +
                                           std::string(200, 'n') + '/' + std::string(200, 'n') +
                                           '/' + std::string(219, 'n')},
                    Named{"Deep", kDeepName}),
    [](const auto &about) { return about.param.what; });

class UnzipNames : public UnzipTest {};

TEST_F(UnzipNames, LongestAndDeepestOnesAreTaken) {
    const std::string part(kMaxPartLength, 'p');
    const std::string longest = part + '/' + part + '/' + part + '/' + std::string(254, 'p');
    ASSERT_EQ(longest.size(), kMaxNameLength);
    const std::string deepest = kDeepName.substr(std::string("f/").size());
    EXPECT_EQ(unpack({{.name = longest, .content = "x"}, {.name = deepest}}), kMinizipDone);
    EXPECT_EQ(text_of(longest), "x");
    EXPECT_TRUE(fs::is_directory(directory() / deepest));
}

// The field that replaces the name with one in UTF-8 (APPNOTE 4.6.9).
std::string unicode_name_field(std::uint32_t checksum_of_name, const std::string &name) {
    return little_endian(0x7075, 2) + little_endian(5 + name.size(), 2) + "\1" +
           little_endian(checksum_of_name, 4) + name;
}

constexpr std::uint32_t kChecksumOfA = 0xE8B7BE43;

TEST_F(UnzipNames, NameThatReplacesTheOtherIsLookedAtToo) {
    expect_refused({{.name = "a", .extra = unicode_name_field(kChecksumOfA, "../evil")}},
                   kMinizipUnsafeName);
}

TEST_F(UnzipNames, NameWithANulReplacesNoOther) {
    EXPECT_EQ(unpack({{.name = "a", .extra = unicode_name_field(kChecksumOfA, "b\0c"s)}}),
              kMinizipDone);
    EXPECT_THAT(unpacked(), ElementsAre("a"));
}

class UnzipKinds : public UnzipTest, public testing::WithParamInterface<mode_t> {};

TEST_P(UnzipKinds, SpecialFileRefusesTheArchiveWhole) {
    expect_refused({{.name = "before", .content = "x"},
                    {.name = "special", .content = "/etc/passwd", .mode = GetParam() | 0777}},
                   kMinizipNotAFile);
}

INSTANTIATE_TEST_SUITE_P(All, UnzipKinds,
                         testing::Values(S_IFLNK, S_IFCHR, S_IFBLK, S_IFIFO, S_IFSOCK));

class UnzipPlaces : public UnzipTest {};

TEST_F(UnzipPlaces, NameThatOccursTwiceIsRefused) {
    expect_refused({{.name = "a", .content = "1"}, {.name = "a", .content = "2"}},
                   kMinizipNameTwice);
    expect_refused({{.name = "f/"}, {.name = "f/"}}, kMinizipNameTwice);
    expect_refused({{.name = "f/a", .content = "1"}, {.name = "f/.//a", .content = "2"}},
                   kMinizipNameTwice);
}

TEST_F(UnzipPlaces, FileAndFolderOfOneNameAreRefused) {
    expect_refused({{.name = "a", .content = "1"}, {.name = "a/b", .content = "2"}},
                   kMinizipNameTwice);
    expect_refused({{.name = "a/b", .content = "1"}, {.name = "a", .content = "2"}},
                   kMinizipNameTwice);
    expect_refused({{.name = "a/"}, {.name = "a", .content = "2"}}, kMinizipNameTwice);
}

TEST_F(UnzipPlaces, FileOverALinkOfTheSameArchiveIsRefused) {
    expect_refused({{.name = "a", .content = "/etc", .mode = S_IFLNK | 0777},
                    {.name = "a/passwd", .content = "x"}},
                   kMinizipNotAFile);
}

TEST_F(UnzipPlaces, LinkInTheWayIsNotFollowed) {
    const fs::path elsewhere = directory().parent_path() / "elsewhere";
    fs::create_directories(elsewhere);
    fs::create_directories(directory());
    fs::create_symlink(elsewhere, directory() / "image");
    EXPECT_EQ(unpack({{.name = "image/a", .content = "x"}}), kMinizipCannotWrite);
    EXPECT_EQ(unpack({{.name = "image/"}}), kMinizipCannotWrite);
    EXPECT_TRUE(fs::is_empty(elsewhere));
}

TEST_F(UnzipPlaces, LinkWithTheNameOfAFileIsReplacedNotWrittenThrough) {
    const fs::path victim = directory().parent_path() / "victim";
    velktest::write_file(victim, "untouched");
    fs::create_directories(directory());
    fs::create_symlink(victim, directory() / "a");
    EXPECT_EQ(unpack({{.name = "a", .content = "x"}}), kMinizipDone);
    EXPECT_FALSE(fs::is_symlink(directory() / "a"));
    EXPECT_EQ(velktest::read_file(victim), "untouched");
}

TEST_F(UnzipPlaces, FolderWithTheNameOfAFileAndTheReverseFail) {
    fs::create_directories(directory() / "a");
    velktest::write_file(directory() / "b", "file");
    EXPECT_EQ(unpack({{.name = "a", .content = "x"}}), kMinizipCannotWrite);
    EXPECT_EQ(unpack({{.name = "b/c", .content = "x"}}), kMinizipCannotWrite);
    EXPECT_THAT(unpacked(), ElementsAre("a/", "b"));
}

}  // namespace
}  // namespace velkhost::unzip::test

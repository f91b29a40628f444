// Joining a folder and a name.

#include <gtest/gtest.h>

#include <array>
#include <string>

#include "catalog/remove_tree.h"

namespace {

struct Joined {
    int length;
    std::string text;
};

Joined join(const char *folder, const char *name, int size = 64) {
    std::array<char, 64> out;
    out.fill('x');
    const int length = util_full_name(folder, name, out.data(), size);
    return {length, out.data()};
}

}  // namespace

TEST(FullName, FolderAndNameAreJoinedWithOneSlash) {
    struct {
        const char *folder, *name, *expected;
    } const cases[] = {
        {"/a/", "//b", "/a/b"},  // slashes before the name are passed over
        {"/a", "b", "/a/b"},    {"/a", "/b", "/a/b"},    {"/a/", "b", "/a/b"},
        {"/a//", "b", "/a//b"},  // only one at the folder's end is looked at
        {"/", "b", "/b"},       {"", "b", "/b"},         {"/a", "", "/a/"},
        {"/a/", "///", "/a/"},  {"a", "b/c/", "a/b/c/"},
    };
    for (const auto &row : cases) {
        const Joined joined = join(row.folder, row.name);
        EXPECT_EQ(joined.text, row.expected) << row.folder << " + " << row.name;
        EXPECT_EQ(joined.length, static_cast<int>(joined.text.size()));
    }
}

TEST(FullName, ResultIsCutToTheBufferAndTheLengthNeededIsReturned) {
    struct {
        int size;
        const char *expected;
    } const cases[] = {
        {1, ""}, {2, "/"}, {5, "/dir"}, {6, "/dir/"}, {9, "/dir/nam"}, {10, "/dir/name"},
    };
    for (const auto &row : cases) {
        const Joined joined = join("/dir", "name", row.size);
        EXPECT_EQ(joined.text, row.expected) << row.size;
        EXPECT_EQ(joined.length, 9) << row.size;
    }
}

TEST(FullName, NothingIsWrittenBehindTheBuffer) {
    std::array<char, 8> out;
    out.fill('x');
    EXPECT_EQ(util_full_name("/a", "long name", out.data(), 4), 12);
    EXPECT_EQ(std::string(out.data(), out.size()), std::string("/a/\0xxxx", 8));
}

TEST(FullName, BufferOfNoSizeIsLeftAlone) {
    char out = 'x';
    EXPECT_EQ(util_full_name("/a", "b", &out, 0), 4);
    EXPECT_EQ(util_full_name("/a", "b", &out, -1), 4);
    EXPECT_EQ(util_full_name("/a", "b", nullptr, 64), 4);
    EXPECT_EQ(out, 'x');
}

// Recursive removal of files and folders.

#include "catalog/remove_tree.h"

#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>

#include "tests/support/directory_faults.h"
#include "tests/support/library_test.h"

namespace {

namespace fs = std::filesystem;
using velktest::DirectoryFaults;
using velktest::entry;
using velktest::write_file;

// What is removed lies under a fixed path, so that single steps can be made to fail.
constexpr const char *kStore = "/var/tmp/filestore";

class RemoveTree : public velktest::LibraryTest {
  protected:
    [[nodiscard]] fs::path store() const { return at(kStore); }
    [[nodiscard]] bool store_exists() const {
        return fs::symlink_status(store()).type() != fs::file_type::not_found;
    }
    static int remove() { return util_remove_file(kStore); }

    void let_anyone_write_but_in(const char *subfolder) const {
        fs::permissions(store(), fs::perms::all);
        fs::permissions(store() / subfolder, static_cast<fs::perms>(0555));
    }
};

const std::string kAbsentText =
    "In Function util_remove_file::The directory doesn't exist and the error code [1].\n";
const std::string kUnlinkText =
    "In Function util_remove_file::unlink failed and the error code is [-1].\n";
const std::string kOpenText =
    "In Function util_remove_file::opendir error and the error code is [-1].\n";
const std::string kCloseText =
    "In Function util_remove_file::closedir error and the error code is [-1].\n";
const std::string kRmdirText =
    "In Function util_remove_file::rmdir error and the error code is [-1].\n";

}  // namespace

TEST_F(RemoveTree, FileIsRemovedWithoutAnEntry) {
    write_file(store(), "x");
    EXPECT_EQ(remove(), 0);
    EXPECT_FALSE(store_exists());
    EXPECT_EQ(log(), "");
}

TEST_F(RemoveTree, EmptyFolderIsRemoved) {
    fs::create_directory(store());
    EXPECT_EQ(remove(), 0);
    EXPECT_FALSE(store_exists());
}

TEST_F(RemoveTree, TreeIsRemovedWithItself) {
    write_file(store() / "a", "1");
    write_file(store() / ".hidden", "2");
    write_file(store() / "sub" / "deeper" / "b", "3");
    fs::create_directories(store() / "empty" / "emptier");
    EXPECT_EQ(util_remove_file("/var/tmp/filestore/"), 0);
    EXPECT_FALSE(store_exists());
    EXPECT_EQ(log(), "");
}

TEST_F(RemoveTree, AbsentPathGivesOne) {
    EXPECT_EQ(remove(), 1);
    EXPECT_EQ(log(), entry(kAbsentText));
}

TEST_F(RemoveTree, NullPathCountsAsAbsent) {
    EXPECT_EQ(util_remove_file(nullptr), 1);
}

TEST_F(RemoveTree, SymbolicLinkToAFolderIsRemovedAlone) {
    write_file(at("/var/tmp/target") / "kept", "x");
    fs::create_directory_symlink(at("/var/tmp/target"), store());
    EXPECT_EQ(remove(), 0);
    EXPECT_FALSE(store_exists());
    EXPECT_TRUE(fs::exists(at("/var/tmp/target") / "kept"));
}

TEST_F(RemoveTree, SymbolicLinksInsideATreeAreNotFollowed) {
    write_file(at("/var/tmp/target") / "kept", "x");
    fs::create_directory(store());
    fs::create_directory_symlink(at("/var/tmp/target"), store() / "link");
    fs::create_symlink("nowhere", store() / "dangling");
    EXPECT_EQ(remove(), 0);
    EXPECT_FALSE(store_exists());
    EXPECT_TRUE(fs::exists(at("/var/tmp/target") / "kept"));
}

TEST_F(RemoveTree, SpecialFileIsUnlinked) {
    ASSERT_EQ(mkfifo(store().c_str(), 0600), 0);
    EXPECT_EQ(remove(), 0);
    EXPECT_FALSE(store_exists());
}

TEST_F(RemoveTree, FileThatCannotBeUnlinkedGivesMinusTwo) {
    write_file(store(), "x");
    fail_step("unlink:/var/tmp/filestore", EPERM);
    EXPECT_EQ(remove(), -2);
    EXPECT_EQ(log(), entry(kUnlinkText));
}

TEST_F(RemoveTree, FolderThatCannotBeOpenedGivesMinusOne) {
    fs::create_directory(store());
    fail_step("opendir:/var/tmp/filestore", EACCES);
    EXPECT_EQ(remove(), -1);
    EXPECT_EQ(log(), entry(kOpenText));
}

TEST_F(RemoveTree, FolderThatCannotBeRemovedGivesMinusOne) {
    write_file(store() / "a", "x");
    fail_step("rmdir:/var/tmp/filestore", EBUSY);
    EXPECT_EQ(remove(), -1);
    EXPECT_EQ(log(), entry(kRmdirText));
    EXPECT_TRUE(fs::is_empty(store()));
}

TEST_F(RemoveTree, FolderThatCannotBeClosedGivesMinusOneAndStays) {
    write_file(store() / "a", "x");
    DirectoryFaults faults;
    faults.next_close_fails = true;
    EXPECT_EQ(remove(), -1);
    EXPECT_EQ(log(), entry(kCloseText));
    EXPECT_TRUE(fs::is_empty(store()));
}

TEST_F(RemoveTree, NegativeResultEndsTheWalkAndIsReturned) {
    write_file(store() / "sub" / "stuck", "x");
    fail_step("unlink:/var/tmp/filestore/sub/stuck", EPERM);
    EXPECT_EQ(remove(), -2);
    EXPECT_EQ(log(), entry(kUnlinkText)) << "the folders above are not tried";
    EXPECT_TRUE(fs::exists(store() / "sub" / "stuck"));
}

TEST_F(RemoveTree, FirstEntryThatStaysEndsTheReading) {
    int seen = 0;
    for (const char *name : {"a", "b", "c", "d"}) {
        write_file(store() / name, "x");
        fail_step(std::string("unlink:/var/tmp/filestore/") + name, EPERM);
    }
    DirectoryFaults faults;
    faults.on_entry = [&](const std::string &name) { seen += name.starts_with('.') ? 0 : 1; };
    EXPECT_EQ(remove(), -2);
    EXPECT_EQ(seen, 1);
}

TEST_F(RemoveTree, EntryThatVanishesLastGivesOneAndTheFolderIsRemoved) {
    write_file(store() / "fleeting", "x");
    DirectoryFaults faults;
    faults.on_entry = [&](const std::string &name) {
        if (name == "fleeting") {
            fs::remove(store() / name);
        }
    };
    EXPECT_EQ(remove(), 1);
    EXPECT_EQ(log(), entry(kAbsentText));
    EXPECT_FALSE(store_exists());
}

TEST_F(RemoveTree, FullNameOfMoreThan255CharactersIsCutAndCountsAsAbsent) {
    // In the way that the library names it, the file's path is one character too long.
    const std::string folder = kStore + ("/" + std::string(100, 'a'));
    const std::string name(256 - folder.size() - 1, 'b');
    write_file(at(folder) / name, "x");
    EXPECT_EQ(util_remove_file(folder.c_str()), -1);
    EXPECT_EQ(log(), entry(kAbsentText) + entry(kRmdirText));
    EXPECT_TRUE(fs::exists(at(folder) / name));
}

TEST_F(RemoveTree, FullNameOf255CharactersIsRemoved) {
    const std::string folder = kStore + ("/" + std::string(100, 'a'));
    write_file(at(folder) / std::string(255 - folder.size() - 1, 'b'), "x");
    EXPECT_EQ(remove(), 0);
    EXPECT_FALSE(store_exists());
}

TEST_F(RemoveTree, DeepTreeEndsAtTheLongestNameAndClosesEveryFolder) {
    fs::path deep = store();
    for (int i = 0; i < 300; ++i) {
        deep /= "d";
    }
    fs::create_directories(deep);
    const std::size_t before = velktest::open_descriptors();
    EXPECT_EQ(remove(), -1);
    EXPECT_EQ(velktest::open_descriptors(), before);
    EXPECT_TRUE(fs::exists(deep));
}

// Without a fault made: the system itself refuses.
TEST_F(RemoveTree, ReadOnlySubfolderWithAFileGivesMinusTwo) {
    write_file(store() / "locked" / "file", "x");
    let_anyone_write_but_in("locked");
    const velktest::Unprivileged rights;
    EXPECT_EQ(remove(), -2);
    EXPECT_TRUE(fs::exists(store() / "locked" / "file"));
}

TEST_F(RemoveTree, ReadOnlySubfolderWithAFolderGivesMinusOne) {
    fs::create_directories(store() / "locked" / "folder");
    let_anyone_write_but_in("locked");
    const velktest::Unprivileged rights;
    EXPECT_EQ(remove(), -1);
    EXPECT_TRUE(fs::exists(store() / "locked" / "folder"));
}

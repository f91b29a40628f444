// Every family of calls that names a path meets the run folder.
#include <dirent.h>
#include <dlfcn.h>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cstring>

#include "tests/unit/host/shim_fixture.h"

namespace velkhost::shim::test {
namespace {

constexpr const char *kLog = "/tmp/velkdebug.txt";
constexpr const char *kStatus = "/tmp/sfcb/velkstatVELK-1.txt";

// By name, since headers may stand the 64-bit form of a call for its narrow one.
template <typename Function>
Function *named(const char *name) {
    return reinterpret_cast<Function *>(dlsym(RTLD_DEFAULT, name));
}

class ShimFiles : public ShimRoot {
  protected:
    void expect_writes(int descriptor, const char *what) {
        ASSERT_GE(descriptor, 0) << what << ": " << std::strerror(errno);
        EXPECT_EQ(write(descriptor, what, std::strlen(what)),
                  static_cast<ssize_t>(std::strlen(what)));
        EXPECT_EQ(close(descriptor), 0);
        EXPECT_EQ(text_of(kLog), what);
        std::filesystem::remove(under_root(kLog));
    }
};

TEST_F(ShimFiles, OpenAndItsRelativesCreateUnderTheRoot) {
    using Open = int(const char *, int, ...);
    using OpenAt = int(int, const char *, int, ...);
    using Creat = int(const char *, mode_t);
    constexpr int kFlags = O_WRONLY | O_CREAT | O_TRUNC;
    for (const char *name : {"open", "open64"}) {
        expect_writes(named<Open>(name)(kLog, kFlags, 0644), name);
    }
    for (const char *name : {"openat", "openat64"}) {
        expect_writes(named<OpenAt>(name)(AT_FDCWD, kLog, kFlags, 0644), name);
    }
    for (const char *name : {"creat", "creat64"}) {
        expect_writes(named<Creat>(name)(kLog, 0644), name);
    }
}

TEST_F(ShimFiles, FortifiedOpensFindFilesUnderTheRoot) {
    using Open2 = int(const char *, int);
    using OpenAt2 = int(int, const char *, int);
    for (const char *name : {"__open_2", "__open64_2"}) {
        put(kLog, "");
        expect_writes(named<Open2>(name)(kLog, O_WRONLY), name);
    }
    for (const char *name : {"__openat_2", "__openat64_2"}) {
        put(kLog, "");
        expect_writes(named<OpenAt2>(name)(AT_FDCWD, kLog, O_WRONLY), name);
    }
}

TEST_F(ShimFiles, OpenHandsTheModeOn) {
    umask(0);
    close(open(kLog, O_WRONLY | O_CREAT, 0640));
    const auto permissions = std::filesystem::status(under_root(kLog)).permissions();
    EXPECT_EQ(static_cast<unsigned>(permissions), 0640U);
}

TEST_F(ShimFiles, RelativePathOfOpenatIsRelative) {
    const int folder = open("/tmp/sfcb", O_RDONLY | O_DIRECTORY);
    ASSERT_GE(folder, 0);
    const int file = openat(folder, "x", O_WRONLY | O_CREAT, 0644);
    EXPECT_GE(file, 0);
    EXPECT_TRUE(std::filesystem::exists(root_ / "tmp/sfcb/x"));
    close(file);
    close(folder);
}

TEST_F(ShimFiles, StdioOpensUnderTheRoot) {
    using FOpen = FILE *(const char *, const char *);
    for (const char *name : {"fopen", "fopen64"}) {
        FILE *const file = named<FOpen>(name)(kLog, "w");
        ASSERT_NE(file, nullptr) << name;
        std::fputs(name, file);
        EXPECT_EQ(std::fclose(file), 0);
        EXPECT_EQ(text_of(kLog), name);
    }
}

TEST_F(ShimFiles, FreopenMovesToAFileUnderTheRoot) {
    FILE *file = std::fopen("/dev/null", "w");
    file = std::freopen(kLog, "w", file);
    ASSERT_NE(file, nullptr);
    std::fputs("x", file);
    std::fclose(file);
    EXPECT_EQ(text_of(kLog), "x");
}

TEST_F(ShimFiles, StandardStreamsOpenUnderTheRoot) {
    std::ofstream(kLog) << "stream";
    EXPECT_EQ(text_of(kLog), "stream");
}

TEST_F(ShimFiles, UnlinkRemovesUnderTheRoot) {
    put(kLog, "");
    EXPECT_EQ(unlink(kLog), 0);
    EXPECT_FALSE(std::filesystem::exists(under_root(kLog)));
    EXPECT_EQ(unlink(kLog), -1);
    EXPECT_EQ(errno, ENOENT);
    put(kLog, "");
    EXPECT_EQ(unlinkat(AT_FDCWD, kLog, 0), 0);
    EXPECT_FALSE(std::filesystem::exists(under_root(kLog)));
}

TEST_F(ShimFiles, RemoveTakesFilesAndEmptyFolders) {
    put(kLog, "");
    std::filesystem::create_directories(root_ / "var/tmp/filestore/full");
    EXPECT_EQ(std::remove(kLog), 0);
    EXPECT_EQ(std::remove("/var/tmp/filestore"), -1);
    EXPECT_EQ(errno, ENOTEMPTY);
    EXPECT_EQ(std::remove("/var/tmp/filestore/full"), 0);
    EXPECT_EQ(std::remove("/var/tmp/filestore"), 0);
    EXPECT_FALSE(std::filesystem::exists(root_ / "var/tmp/filestore"));
}

TEST_F(ShimFiles, FoldersAreMadeAndRemovedUnderTheRoot) {
    EXPECT_EQ(mkdir("/var/tmp/ZEB", 0755), 0);
    EXPECT_EQ(mkdirat(AT_FDCWD, "/var/tmp/ZEB/x", 0755), 0);
    EXPECT_TRUE(std::filesystem::is_directory(root_ / "var/tmp/ZEB/x"));
    EXPECT_EQ(rmdir("/var/tmp/ZEB/x"), 0);
    EXPECT_EQ(unlinkat(AT_FDCWD, "/var/tmp/ZEB", AT_REMOVEDIR), 0);
    EXPECT_FALSE(std::filesystem::exists(root_ / "var/tmp/ZEB"));
}

TEST_F(ShimFiles, RenameMovesBetweenTheMachineAndTheRoot) {
    put(kLog, "x");
    EXPECT_EQ(rename(kLog, kStatus), 0);
    EXPECT_EQ(text_of(kStatus), "x");
    const std::string outside = root_ / "outside";
    EXPECT_EQ(renameat(AT_FDCWD, kStatus, AT_FDCWD, outside.c_str()), 0);
    EXPECT_TRUE(std::filesystem::exists(outside));
}

TEST_F(ShimFiles, LinksLieUnderTheRootAndKeepTheirText) {
    put(kLog, "x");
    EXPECT_EQ(link(kLog, "/tmp/sfcb/hard"), 0);
    EXPECT_EQ(text_of("/tmp/sfcb/hard"), "x");
    EXPECT_EQ(symlink("/tmp/sfcb/elsewhere", "/tmp/sfcb/soft"), 0);
    EXPECT_EQ(std::filesystem::read_symlink(root_ / "tmp/sfcb/soft"), "/tmp/sfcb/elsewhere");
    std::array<char, 64> text{};
    EXPECT_EQ(readlink("/tmp/sfcb/soft", text.data(), text.size()), 19);
    EXPECT_STREQ(text.data(), "/tmp/sfcb/elsewhere");
    EXPECT_EQ(readlinkat(AT_FDCWD, "/tmp/sfcb/soft", text.data(), text.size()), 19);
}

TEST_F(ShimFiles, ModeAndLengthChangeUnderTheRoot) {
    put(kLog, "four");
    EXPECT_EQ(chmod(kLog, 0600), 0);
    EXPECT_EQ(named<int(const char *, off64_t)>("truncate64")(kLog, 3), 0);
    EXPECT_EQ(text_of(kLog), "fou");
    EXPECT_EQ(named<int(const char *, long)>("truncate")(kLog, 2), 0);
    EXPECT_EQ(text_of(kLog), "fo");
}

TEST_F(ShimFiles, AccessAsksUnderTheRoot) {
    EXPECT_EQ(access(kLog, F_OK), -1);
    put(kLog, "");
    EXPECT_EQ(access(kLog, F_OK), 0);
    EXPECT_EQ(faccessat(AT_FDCWD, kLog, R_OK, 0), 0);
}

// The forms differ in the layout of their result; here it matters alone which file they find.
TEST_F(ShimFiles, WholeStatFamilyAsksUnderTheRoot) {
    put(kLog, "");
    std::array<char, 512> status{};
    for (const char *name : {"stat", "stat64", "lstat", "lstat64"}) {
        EXPECT_EQ(named<int(const char *, void *)>(name)(kLog, status.data()), 0) << name;
        EXPECT_EQ(named<int(const char *, void *)>(name)(kStatus, status.data()), -1) << name;
    }
    for (const char *name : {"__xstat", "__xstat64", "__lxstat", "__lxstat64"}) {
        EXPECT_EQ(named<int(int, const char *, void *)>(name)(1, kLog, status.data()), 0) << name;
    }
    for (const char *name : {"fstatat", "fstatat64"}) {
        using FStatAt = int(int, const char *, void *, int);
        EXPECT_EQ(named<FStatAt>(name)(AT_FDCWD, kLog, status.data(), 0), 0) << name;
    }
    for (const char *name : {"__fxstatat", "__fxstatat64"}) {
        using FxStatAt = int(int, int, const char *, void *, int);
        EXPECT_EQ(named<FxStatAt>(name)(1, AT_FDCWD, kLog, status.data(), 0), 0) << name;
    }
    struct statx wide {};
    EXPECT_EQ(statx(AT_FDCWD, kLog, 0, STATX_SIZE, &wide), 0);
}

TEST_F(ShimFiles, StatTellsTheSizeAndLstatTheLink) {
    put(kLog, "four");
    std::filesystem::create_symlink("velkdebug.txt", root_ / "tmp/networkflag");
    struct stat status {};
    ASSERT_EQ(stat("/tmp/networkflag", &status), 0);
    EXPECT_EQ(status.st_size, 4);
    ASSERT_EQ(lstat("/tmp/networkflag", &status), 0);
    EXPECT_TRUE(S_ISLNK(status.st_mode));
}

TEST_F(ShimFiles, OpendirListsUnderTheRoot) {
    put(kStatus, "");
    DIR *const folder = opendir("/tmp/sfcb");
    ASSERT_NE(folder, nullptr);
    std::string names;
    while (const dirent *const entry = readdir(folder)) {
        names += entry->d_name[0] == '.' ? "" : entry->d_name;
    }
    EXPECT_EQ(names, "velkstatVELK-1.txt");
    EXPECT_EQ(closedir(folder), 0);
    EXPECT_EQ(opendir("/var/tmp/ZEB"), nullptr);
}

TEST_F(ShimFiles, NullPathReachesTheKernel) {
    const char *volatile nothing = nullptr;
    EXPECT_EQ(named<int(const char *, int, ...)>("open")(nothing, O_RDONLY), -1);
    EXPECT_EQ(errno, EFAULT);
    EXPECT_EQ(named<int(const char *)>("rmdir")(nothing), -1);
    EXPECT_EQ(errno, EFAULT);
}

TEST_F(ShimFiles, PathsOutsideAreServedByTheMachine) {
    const std::string outside = root_ / "outside";
    std::ofstream(outside) << "x";
    EXPECT_EQ(access(outside.c_str(), F_OK), 0);
    EXPECT_EQ(unlink(outside.c_str()), 0);
    EXPECT_FALSE(std::filesystem::exists(outside));
}

}  // namespace
}  // namespace velkhost::shim::test

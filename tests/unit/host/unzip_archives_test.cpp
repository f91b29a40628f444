// Archives that are as they should be, and what lies in the directory afterwards.
#include <dlfcn.h>
#include <sys/stat.h>

#include <cstdlib>
#include <ctime>
#include <thread>

#include "tests/unit/host/unzip_fixture.h"

namespace velkhost::unzip::test {
namespace {

namespace fs = std::filesystem;
using testing::ElementsAre;
using testing::IsEmpty;

class UnzipArchives : public UnzipTest {};

std::string noise(std::size_t size) {
    std::string out;
    for (std::uint32_t state = 1; out.size() < size;) {
        state = state * 1664525 + 1013904223;
        out += static_cast<char>(state >> 24);
    }
    return out;
}

mode_t mode_of(const fs::path &path) {
    struct stat status {};
    EXPECT_EQ(stat(path.c_str(), &status), 0) << path;
    return status.st_mode & 07777;
}

TEST_F(UnzipArchives, StoredFilesAreUnpackedAndTheirFoldersMade) {
    EXPECT_EQ(unpack({{.name = "readme.txt", .content = "text"},
                      {.name = "image/a/fw.bin", .content = "firmware"}}),
              kMinizipDone);
    EXPECT_THAT(unpacked(), ElementsAre("image/", "image/a/", "image/a/fw.bin", "readme.txt"));
    EXPECT_EQ(text_of("readme.txt"), "text");
    EXPECT_EQ(text_of("image/a/fw.bin"), "firmware");
}

TEST_F(UnzipArchives, DeflatedFilesOfManyPiecesAreUnpacked) {
    const std::string random = noise(300'000);
    const std::string regular(1'000'000, 'x');
    EXPECT_EQ(unpack({deflated("random", random), deflated("regular", regular)}), kMinizipDone);
    EXPECT_EQ(text_of("random"), random);
    EXPECT_EQ(text_of("regular"), regular);
}

TEST_F(UnzipArchives, Zip64RecordsAreRead) {
    const std::string content = noise(100'000);
    EXPECT_EQ(unpack(zip({deflated("image/fw.bin", content), {.name = "b", .content = "x"}},
                         {.zip64 = true})),
              kMinizipDone);
    EXPECT_EQ(text_of("image/fw.bin"), content);
    EXPECT_EQ(text_of("b"), "x");
}

TEST_F(UnzipArchives, EmptyFilesAndFoldersAreMade) {
    EXPECT_EQ(unpack({{.name = "image/empty/"}, {.name = "image/nothing"}, {.name = "./"}}),
              kMinizipDone);
    EXPECT_THAT(unpacked(), ElementsAre("image/", "image/empty/", "image/nothing"));
}

TEST_F(UnzipArchives, FolderMayHaveAnEntryOfItsOwnBeforeOrBehindItsFiles) {
    EXPECT_EQ(unpack({{.name = "f/"}, {.name = "f/a"}, {.name = "image/a"}, {.name = "image/"}}),
              kMinizipDone);
    EXPECT_THAT(unpacked(), ElementsAre("f/", "f/a", "image/", "image/a"));
}

TEST_F(UnzipArchives, ArchiveWithoutEntriesMakesTheDirectoryAlone) {
    EXPECT_EQ(unpack(std::vector<ZipEntry>()), kMinizipDone);
    EXPECT_TRUE(fs::is_directory(directory()));
    EXPECT_THAT(unpacked(), IsEmpty());
}

TEST_F(UnzipArchives, CommentsDoNotMatter) {
    const ZipForm longest{.comment = std::string(65535, 'c')};
    EXPECT_EQ(unpack(zip({{.name = "a", .content = "x"}}, longest)), kMinizipDone);
    EXPECT_EQ(text_of("a"), "x");
}

TEST_F(UnzipArchives, DirectoryIsMadeWithItsParentsAndMayEndInASlash) {
    velktest::write_file(archive(), zip({{.name = "a", .content = "x"}}));
    const fs::path deep = directory() / "ZEB/Pakro/Package/";
    EXPECT_EQ(Minizip(archive().c_str(), deep.c_str()), kMinizipDone);
    EXPECT_EQ(velktest::read_file(deep / "a"), "x");
}

TEST_F(UnzipArchives, FilesThatAreThereAreReplacedAndOthersStay) {
    velktest::write_file(directory() / "a", "a former and longer text");
    velktest::write_file(directory() / "b", "other");
    EXPECT_EQ(unpack({{.name = "a", .content = "new"}}), kMinizipDone);
    EXPECT_EQ(text_of("a"), "new");
    EXPECT_EQ(text_of("b"), "other");
}

TEST_F(UnzipArchives, ModesOfTheArchiveAreIgnored) {
    const mode_t before = umask(022);
    EXPECT_EQ(unpack({{.name = "a", .content = "x", .mode = S_IFREG | 06777},
                      {.name = "f/", .mode = S_IFDIR | 0},
                      {.name = "b", .content = "x", .mode = S_IFREG | 0}}),
              kMinizipDone);
    umask(before);
    EXPECT_EQ(mode_of(directory() / "a"), 0644U);
    EXPECT_EQ(mode_of(directory() / "b"), 0644U);
    EXPECT_EQ(mode_of(directory() / "f"), 0755U);
}

TEST_F(UnzipArchives, EmptyAndCurrentPartsOfNamesCountForNothing) {
    EXPECT_EQ(unpack({{.name = "./image//./a", .content = "x"}}), kMinizipDone);
    EXPECT_THAT(unpacked(), ElementsAre("image/", "image/a"));
}

TEST_F(UnzipArchives, NamesAreBytesAndDotsAreLetters) {
    EXPECT_EQ(unpack({{.name = "g\xC3\xBC .bin"}, {.name = "\xFF"}, {.name = "..a/b..c/...\x21"}}),
              kMinizipDone);
    EXPECT_THAT(unpacked(),
                ElementsAre("..a/", "..a/b..c/", "..a/b..c/...!", "g\xC3\xBC .bin", "\xFF"));
}

TEST_F(UnzipArchives, NothingStaysOpen) {
    const std::size_t before = velktest::open_descriptors();
    EXPECT_EQ(unpack({{.name = "f/a", .content = "x"}, {.name = "g/"}}), kMinizipDone);
    EXPECT_EQ(unpack({{.name = "a", .content = "x", .checksum = 1}}), kMinizipDamaged);
    EXPECT_EQ(unpack("no archive"), kMinizipDamaged);
    EXPECT_EQ(velktest::open_descriptors(), before);
}

TEST_F(UnzipArchives, ThreadsUnpackTheSameArchiveIntoOneDirectory) {
    const std::string content = noise(200'000);
    velktest::write_file(archive(), zip({deflated("f/a", content), deflated("f/b", content)}));
    // libzip asks for local times. Without TZ, libc reads its time zone anew at each call, under a
    // lock that the thread sanitizer does not see.
    setenv("TZ", "UTC", 1);
    tzset();
    std::vector<std::thread> threads(4);
    for (std::thread &thread : threads) {
        thread = std::thread([this] {
            for (int round = 0; round < 5; ++round) {
                EXPECT_EQ(Minizip(archive().c_str(), directory().c_str()), kMinizipDone);
            }
        });
    }
    for (std::thread &thread : threads) {
        thread.join();
    }
    EXPECT_THAT(unpacked(), ElementsAre("f/", "f/a", "f/b"));
    EXPECT_EQ(text_of("f/a"), content);
}

TEST_F(UnzipArchives, SharedObjectExportsTheOneFunction) {
    void *const library = dlopen(VELK_UNZIP_LIBRARY, RTLD_NOW | RTLD_LOCAL);
    ASSERT_NE(library, nullptr) << dlerror();
    const auto minizip = reinterpret_cast<decltype(&Minizip)>(dlsym(library, "Minizip"));
    ASSERT_NE(minizip, nullptr);
    velktest::write_file(archive(), zip({{.name = "a", .content = "x"}}));
    EXPECT_EQ(minizip(archive().c_str(), directory().c_str()), kMinizipDone);
    EXPECT_EQ(text_of("a"), "x");
    EXPECT_EQ(dlsym(library, "_ZN8velkhost5unzip7ArchiveC1EPKc"), nullptr);
    dlclose(library);
}

}  // namespace
}  // namespace velkhost::unzip::test

// Files that are no archives, archives that are not whole, and places that cannot be written to.
#include <fcntl.h>
#include <sys/resource.h>
#include <sys/stat.h>

#include <array>
#include <csignal>

#include "tests/unit/host/unzip_fixture.h"

namespace velkhost::unzip::test {
namespace {

namespace fs = std::filesystem;
using testing::ElementsAre;
using testing::IsEmpty;

class UnzipDamage : public UnzipTest {
  protected:
    // Nothing of the archive may be there afterwards.
    void expect_damaged(const std::string &bytes, int result = kMinizipDamaged) const {
        EXPECT_EQ(unpack(bytes), result);
        EXPECT_THAT(unpacked(), IsEmpty());
    }
};

const std::vector<ZipEntry> kTwoFiles = {{.name = "image/a", .content = "first"},
                                         {.name = "image/b", .content = "second"}};

// The archive with one byte changed.
std::string with_byte(std::string bytes, std::size_t at, char value) {
    bytes.at(at) = value;
    return bytes;
}

TEST_F(UnzipDamage, FilesThatAreNoArchivesAreRefused) {
    for (const std::string &bytes : {std::string(), std::string("PK"), std::string("PK\5\6"),
                                     std::string(21, 'P'), std::string(100'000, '\0')}) {
        expect_damaged(bytes);
    }
}

TEST_F(UnzipDamage, ArchiveCutAnywhereIsRefused) {
    const std::string whole = zip(kTwoFiles);
    for (std::size_t size = 0; size < whole.size(); ++size) {
        expect_damaged(whole.substr(0, size));
    }
    EXPECT_EQ(unpack(whole), kMinizipDone);
}

TEST_F(UnzipDamage, Zip64ArchiveCutAnywhereIsRefused) {
    const std::string whole = zip(kTwoFiles, {.zip64 = true});
    for (std::size_t size = 0; size < whole.size(); ++size) {
        expect_damaged(whole.substr(0, size));
    }
    EXPECT_EQ(unpack(whole), kMinizipDone);
}

TEST_F(UnzipDamage, ArchiveWithoutADirectoryIsRefused) {
    const std::string whole = zip(kTwoFiles);
    expect_damaged(whole.substr(0, whole.find("PK\1\2")));
}

TEST_F(UnzipDamage, MoreBytesBehindTheEndAreRefused) {
    expect_damaged(zip(kTwoFiles) + "x");
}

TEST_F(UnzipDamage, EndThatCountsOtherwiseIsRefused) {
    expect_damaged(zip(kTwoFiles, {.entries = 3}));
    expect_damaged(zip(kTwoFiles, {.zip64 = true, .entries = 3}));
    expect_damaged(zip(kTwoFiles, {.entries = 1}));
}

TEST_F(UnzipDamage, DirectoryThatLiesBehindTheFileIsRefused) {
    const std::string whole = zip(kTwoFiles);
    expect_damaged(with_byte(whole, whole.size() - 4, '\x7F'));  // its offset's highest byte
    const std::string zip64 = zip(kTwoFiles, {.zip64 = true});
    const std::size_t end64 = zip64.find("PK\6\6");
    expect_damaged(with_byte(zip64, end64 + 55, '\x7F'));
    const std::size_t locator = zip64.find("PK\6\7");
    expect_damaged(with_byte(zip64, locator + 15, '\x7F'));
    expect_damaged(with_byte(zip64, end64, 'X'));
}

TEST_F(UnzipDamage, EntryThatLiesElsewhereIsRefused) {
    const std::string whole = zip(kTwoFiles);
    const std::size_t record = whole.find("PK\1\2");
    expect_damaged(with_byte(whole, record + 42, '\3'));
    expect_damaged(with_byte(whole, record + 28, '\x60'));  // and one whose name is too long for it
}

TEST_F(UnzipDamage, RecordsThatContradictEachOtherAreRefused) {
    const std::string whole = zip(kTwoFiles);
    expect_damaged(with_byte(whole, 30, 'I'));  // the first name, in its own record
}

TEST_F(UnzipDamage, WrongChecksumLeavesTheFilesBeforeIt) {
    EXPECT_EQ(unpack({{.name = "a", .content = "good"},
                      {.name = "b", .content = "damaged", .checksum = 12345},
                      {.name = "c", .content = "never reached"}}),
              kMinizipDamaged);
    EXPECT_THAT(unpacked(), ElementsAre("a"));
    EXPECT_EQ(text_of("a"), "good");
}

TEST_F(UnzipDamage, WrongChecksumKeepsTheFileThatWasThere) {
    velktest::write_file(directory() / "a", "former");
    EXPECT_EQ(unpack({{.name = "a", .content = "damaged", .checksum = 12345}}), kMinizipDamaged);
    EXPECT_THAT(unpacked(), ElementsAre("a"));
    EXPECT_EQ(text_of("a"), "former");
}

TEST_F(UnzipDamage, DamagedDeflateDataLeavesNothing) {
    std::string content(200'000, 'x');
    content += "and more";
    ZipEntry entry = deflated("a", content);
    entry.content[entry.content.size() / 2] = '\x7F';
    EXPECT_EQ(unpack({entry}), kMinizipDamaged);
    EXPECT_THAT(unpacked(), IsEmpty());
}

TEST_F(UnzipDamage, DeflateDataThatEndsEarlyLeavesNothing) {
    ZipEntry entry = deflated("a", "some text that is long enough to be cut");
    entry.content.resize(entry.content.size() - 4);
    EXPECT_EQ(unpack({entry}), kMinizipDamaged);
    EXPECT_THAT(unpacked(), IsEmpty());
}

TEST_F(UnzipDamage, ContentOfAnotherSizeThanStatedLeavesNothing) {
    ZipEntry entry = deflated("a", std::string(1000, 'x'));
    for (const std::uint64_t size : {0U, 1U, 999U, 1001U, 100'000U}) {
        entry.size = size;
        EXPECT_EQ(unpack({entry}), kMinizipDamaged) << size;
        EXPECT_THAT(unpacked(), IsEmpty()) << size;
    }
}

TEST_F(UnzipDamage, FolderWithContentIsRefused) {
    expect_refused({{.name = "image/", .content = "x"}}, kMinizipDamaged);
}

TEST_F(UnzipDamage, EncryptedEntryRefusesTheArchiveWhole) {
    expect_refused(
        {{.name = "a", .content = "x"}, {.name = "b", .content = std::string(20, 'e'), .flags = 1}},
        kMinizipEncrypted);
}

TEST_F(UnzipDamage, OtherMethodsRefuseTheArchiveWhole) {
    for (const std::uint16_t method : std::to_array<std::uint16_t>({1, 6, 9, 12, 14, 93, 95, 98})) {
        expect_refused(
            {{.name = "a", .content = "x"}, {.name = "b", .content = "x", .method = method}},
            kMinizipUnknownMethod);
    }
}

// ---- Arguments and places ----

TEST_F(UnzipDamage, MissingArgumentsAreRefused) {
    velktest::write_file(archive(), zip(kTwoFiles));
    EXPECT_EQ(Minizip(nullptr, directory().c_str()), kMinizipBadArgument);
    EXPECT_EQ(Minizip("", directory().c_str()), kMinizipBadArgument);
    EXPECT_EQ(Minizip(archive().c_str(), nullptr), kMinizipBadArgument);
    EXPECT_EQ(Minizip(archive().c_str(), ""), kMinizipBadArgument);
}

TEST_F(UnzipDamage, ArchiveThatIsNotThereOrNoFileIsRefused) {
    EXPECT_EQ(Minizip("/nowhere/package.zip", directory().c_str()), kMinizipNoArchive);
    EXPECT_EQ(Minizip("/", directory().c_str()), kMinizipNoArchive);
    EXPECT_EQ(Minizip("/dev/zero", directory().c_str()), kMinizipNoArchive);
    ASSERT_EQ(mkfifo(archive().c_str(), 0600), 0);
    EXPECT_EQ(Minizip(archive().c_str(), directory().c_str()), kMinizipNoArchive);
    EXPECT_FALSE(fs::exists(directory()));
}

TEST_F(UnzipDamage, DirectoryThatIsAFileFails) {
    velktest::write_file(directory(), "file");
    EXPECT_EQ(unpack(zip(kTwoFiles)), kMinizipCannotWrite);
    velktest::write_file(archive(), zip(kTwoFiles));
    EXPECT_EQ(Minizip(archive().c_str(), (directory() / "below").c_str()), kMinizipCannotWrite);
}

TEST_F(UnzipDamage, DirectoryThatMustNotBeWrittenToFails) {
    fs::create_directories(directory());
    fs::permissions(directory(), fs::perms::owner_read | fs::perms::others_exec);
    velktest::write_file(archive(), zip(kTwoFiles));
    const velktest::Unprivileged nobody;
    EXPECT_EQ(Minizip(archive().c_str(), directory().c_str()), kMinizipCannotWrite);
}

// Has writes beyond so many bytes of a file fail, as on a full file system.
class FileSizeLimit {
  public:
    explicit FileSizeLimit(rlim_t size) : handler_(std::signal(SIGXFSZ, SIG_IGN)) {
        getrlimit(RLIMIT_FSIZE, &before_);
        const rlimit limit{size, before_.rlim_max};
        setrlimit(RLIMIT_FSIZE, &limit);
    }
    ~FileSizeLimit() {
        setrlimit(RLIMIT_FSIZE, &before_);
        std::signal(SIGXFSZ, handler_);
    }
    FileSizeLimit(const FileSizeLimit &) = delete;
    FileSizeLimit &operator=(const FileSizeLimit &) = delete;

  private:
    rlimit before_{};
    void (*handler_)(int);
};

TEST_F(UnzipDamage, WriteThatFailsLeavesTheFilesBeforeIt) {
    velktest::write_file(archive(), zip({{.name = "a", .content = "small"},
                                         deflated("b", std::string(500'000, 'x'))}));
    {
        const FileSizeLimit limit(100'000);
        EXPECT_EQ(Minizip(archive().c_str(), directory().c_str()), kMinizipCannotWrite);
    }
    EXPECT_THAT(unpacked(), ElementsAre("a"));
}

}  // namespace
}  // namespace velkhost::unzip::test

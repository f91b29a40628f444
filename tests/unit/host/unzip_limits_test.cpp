// Archives that ask for too much.
#include "host/unzip/limits.h"

#include "tests/unit/host/unzip_fixture.h"

namespace velkhost::unzip::test {
namespace {

class UnzipLimits : public UnzipTest {};

std::vector<ZipEntry> empty_files(std::size_t count) {
    std::vector<ZipEntry> entries(count);
    for (std::size_t i = 0; i < count; ++i) {
        entries[i].name = std::to_string(i);
    }
    return entries;
}

TEST_F(UnzipLimits, AsManyEntriesAsAllowedAreUnpacked) {
    EXPECT_EQ(unpack(empty_files(kMaxEntries)), kMinizipDone);
    EXPECT_EQ(unpacked().size(), kMaxEntries);
}

TEST_F(UnzipLimits, OneEntryMoreIsRefused) {
    expect_refused(empty_files(kMaxEntries + 1), kMinizipTooMuch);
}

TEST_F(UnzipLimits, ClaimOfManyEntriesIsRefusedBeforeAnythingIsAllocated) {
    const ZipForm claim{.zip64 = true, .entries = std::uint64_t{1} << 60};
    EXPECT_EQ(unpack(zip({{.name = "a"}}, claim)), kMinizipTooMuch);
    EXPECT_FALSE(std::filesystem::exists(directory()));
}

TEST_F(UnzipLimits, HugeDirectoryIsRefused) {
    std::vector<ZipEntry> entries = empty_files(300);
    for (ZipEntry &entry : entries) {
        entry.extra =
            little_endian(0xCAFE, 2) + little_endian(60'000, 2) + std::string(60'000, 'e');
    }
    expect_refused(entries, kMinizipTooMuch);
}

// Zeros: deflate makes about a thousandth of them.
TEST_F(UnzipLimits, HighRatioIsTakenUpToTheSizeThatIsHarmless) {
    EXPECT_EQ(unpack({deflated("flash.img", std::string(kSizeBelowRatio, '\0'))}), kMinizipDone);
    EXPECT_EQ(std::filesystem::file_size(directory() / "flash.img"), kSizeBelowRatio);
}

TEST_F(UnzipLimits, HighRatioBeyondThatIsRefused) {
    expect_refused({deflated("bomb", std::string(kSizeBelowRatio + 1, '\0'))}, kMinizipTooMuch);
}

TEST_F(UnzipLimits, RatioIsThatOfAllEntriesTogether) {
    const std::string half(kSizeBelowRatio / 2 + 1, '\0');
    expect_refused({deflated("a", half), deflated("b", half)}, kMinizipTooMuch);
}

// Entries that share one piece of data have a ratio that deflate alone does not reach.
TEST_F(UnzipLimits, EntriesThatShareTheirDataAreRefused) {
    const ZipEntry entry = deflated("a", std::string(kMebibyte, '\0'));
    std::string bytes = zip({entry});
    const std::size_t begin = bytes.find("PK\1\2");
    const std::size_t end = bytes.find("PK\5\6");
    std::string directory_bytes;
    for (int i = 0; i < 64; ++i) {
        directory_bytes += bytes.substr(begin, end - begin);
    }
    bytes = bytes.substr(0, begin) + directory_bytes + "PK\5\6" + std::string(4, '\0') +
            little_endian(64, 2) + little_endian(64, 2) + little_endian(directory_bytes.size(), 4) +
            little_endian(begin, 4) + std::string(2, '\0');
    EXPECT_NE(unpack(bytes), kMinizipDone);
    EXPECT_FALSE(std::filesystem::exists(directory()));
}

TEST_F(UnzipLimits, StatedSizeBeyondAllMeansIsRefused) {
    for (const std::uint64_t size : {kMaxTotalSize + 1, ~std::uint64_t{0}}) {
        ZipEntry entry = deflated("bomb", "x");
        entry.size = size;
        EXPECT_EQ(unpack(zip({entry}, {.zip64 = true})), kMinizipTooMuch);
        EXPECT_FALSE(std::filesystem::exists(directory()));
    }
}

TEST_F(UnzipLimits, StatedSizesThatOverflowTheirSumAreRefused) {
    ZipEntry first = deflated("a", "x");
    ZipEntry second = deflated("b", "x");
    first.size = 1;
    second.size = ~std::uint64_t{0};
    EXPECT_EQ(unpack(zip({first, second}, {.zip64 = true})), kMinizipTooMuch);
    EXPECT_FALSE(std::filesystem::exists(directory()));
}

TEST_F(UnzipLimits, ArchiveLargerThanItMayUnpackToIsRefused) {
    velktest::write_file(archive(), "");
    std::filesystem::resize_file(archive(), kMaxTotalSize + 1);  // a hole
    EXPECT_EQ(Minizip(archive().c_str(), directory().c_str()), kMinizipTooMuch);
}

}  // namespace
}  // namespace velkhost::unzip::test

#include "tests/unit/host/unzip_fixture.h"

#include <zlib.h>

#include <algorithm>
#include <stdexcept>
#include <string_view>

namespace velkhost::unzip::test {
namespace fs = std::filesystem;
using std::string_literals::operator""s;

namespace {

constexpr std::uint32_t kSaturated = 0xFFFFFFFF;

std::uint32_t checksum_of(const std::string &content) {
    return static_cast<std::uint32_t>(crc32(0, reinterpret_cast<const Bytef *>(content.data()),
                                            static_cast<uInt>(content.size())));
}

// What both records of an entry have: from the flags to the stated size.
std::string common_fields(const ZipEntry &entry, bool zip64) {
    const std::uint64_t size = entry.size.value_or(entry.content.size());
    return little_endian(entry.flags, 2) + little_endian(entry.method, 2) +
           little_endian(0x21, 4) +  // 1980-01-01
           little_endian(entry.checksum.value_or(checksum_of(entry.content)), 4) +
           little_endian(zip64 ? kSaturated : entry.content.size(), 4) +
           little_endian(zip64 ? kSaturated : size, 4) + little_endian(entry.name.size(), 2);
}

std::string sizes64(const ZipEntry &entry) {
    return little_endian(entry.size.value_or(entry.content.size()), 8) +
           little_endian(entry.content.size(), 8);
}

std::string local_record(const ZipEntry &entry, bool zip64) {
    std::string extra = entry.extra;
    if (zip64) {
        extra += little_endian(1, 2) + little_endian(16, 2) + sizes64(entry);
    }
    return "PK\3\4"s + little_endian(45, 2) + common_fields(entry, zip64) +
           little_endian(extra.size(), 2) + entry.name + extra + entry.content;
}

std::string directory_record(const ZipEntry &entry, std::uint64_t offset, bool zip64) {
    std::string extra = entry.extra;
    if (zip64) {
        extra +=
            little_endian(1, 2) + little_endian(24, 2) + sizes64(entry) + little_endian(offset, 8);
    }
    return "PK\1\2"s + little_endian(0x032D, 2) + little_endian(45, 2) +
           common_fields(entry, zip64) + little_endian(extra.size(), 2) + little_endian(0, 6) +
           little_endian(static_cast<std::uint64_t>(entry.mode) << 16, 4) +
           little_endian(zip64 ? kSaturated : offset, 4) + entry.name + extra;
}

std::string end_records(std::uint64_t entries, std::uint64_t offset, std::uint64_t size,
                        const ZipForm &form) {
    std::string out;
    if (form.zip64) {
        out = "PK\6\6"s + little_endian(44, 8) + little_endian(45, 2) + little_endian(45, 2) +
              little_endian(0, 8) + little_endian(entries, 8) + little_endian(entries, 8) +
              little_endian(size, 8) + little_endian(offset, 8) + "PK\6\7"s + little_endian(0, 4) +
              little_endian(offset + size, 8) + little_endian(1, 4);
    }
    return out + "PK\5\6"s + little_endian(0, 4) + little_endian(form.zip64 ? 0xFFFF : entries, 2) +
           little_endian(form.zip64 ? 0xFFFF : entries, 2) +
           little_endian(form.zip64 ? kSaturated : size, 4) +
           little_endian(form.zip64 ? kSaturated : offset, 4) +
           little_endian(form.comment.size(), 2) + form.comment;
}

}  // namespace

std::string little_endian(std::uint64_t value, int width) {
    std::string out;
    for (int i = 0; i < width; ++i) {
        out += static_cast<char>(value >> 8 * i & 0xFF);
    }
    return out;
}

ZipEntry deflated(const std::string &name, const std::string &content) {
    constexpr int kNoHeader = -MAX_WBITS;
    z_stream stream{};
    std::string packed(compressBound(static_cast<uLong>(content.size())) + 64, '\0');
    if (deflateInit2(&stream, Z_BEST_COMPRESSION, Z_DEFLATED, kNoHeader, 8, Z_DEFAULT_STRATEGY) !=
        Z_OK) {
        throw std::runtime_error("deflateInit2");
    }
    stream.next_in = reinterpret_cast<Bytef *>(const_cast<char *>(content.data()));
    stream.avail_in = static_cast<uInt>(content.size());
    stream.next_out = reinterpret_cast<Bytef *>(packed.data());
    stream.avail_out = static_cast<uInt>(packed.size());
    const int result = deflate(&stream, Z_FINISH);
    packed.resize(stream.total_out);
    deflateEnd(&stream);
    if (result != Z_STREAM_END) {
        throw std::runtime_error("deflate");
    }
    return {.name = name,
            .content = packed,
            .method = 8,
            .checksum = checksum_of(content),
            .size = content.size()};
}

std::string zip(const std::vector<ZipEntry> &entries, const ZipForm &form) {
    std::string bytes;
    std::string directory;
    for (const ZipEntry &entry : entries) {
        directory += directory_record(entry, bytes.size(), form.zip64);
        bytes += local_record(entry, form.zip64);
    }
    const std::size_t offset = bytes.size();
    return bytes + directory +
           end_records(form.entries.value_or(entries.size()), offset, directory.size(), form);
}

int UnzipTest::unpack(const std::string &bytes) const {
    velktest::write_file(archive(), bytes);
    return Minizip(archive().c_str(), directory().c_str());
}

std::vector<std::string> UnzipTest::unpacked() const {
    std::vector<std::string> names;
    if (!fs::exists(directory())) {
        return names;
    }
    for (const auto &entry : fs::recursive_directory_iterator(directory())) {
        const bool is_folder = entry.is_directory() && !entry.is_symlink();
        names.push_back(entry.path().lexically_relative(directory()).string() +
                        (is_folder ? "/" : ""));
    }
    std::ranges::sort(names);
    return names;
}

void UnzipTest::expect_refused(const std::vector<ZipEntry> &entries, int result) const {
    EXPECT_EQ(unpack(entries), result);
    EXPECT_FALSE(fs::exists(directory()));
}

}  // namespace velkhost::unzip::test

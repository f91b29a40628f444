// The records are those of PKWARE's APPNOTE 6.3: 4.3.12 (directory), 4.3.14 to 4.3.16 (its end).
#include "host/unzip/directory_scan.h"

#include <unistd.h>

#include <algorithm>
#include <optional>
#include <span>
#include <string_view>
#include <vector>

#include "host/unzip/failure.h"
#include "host/unzip/limits.h"

namespace velkhost::unzip {
namespace {

using std::string_view_literals::operator""sv;

using Bytes = std::span<const unsigned char>;

constexpr std::size_t kEntrySize = 46;
constexpr std::size_t kEndSize = 22;
constexpr std::size_t kLocatorSize = 20;
constexpr std::size_t kEnd64Size = 56;
constexpr std::size_t kMaxCommentLength = 65535;

struct Directory {
    std::uint64_t entries;
    std::uint64_t offset;
    std::uint64_t size;
};

// The little-endian number of `width` bytes at `at`.
std::uint64_t number(Bytes bytes, std::size_t at, std::size_t width) {
    std::uint64_t value = 0;
    for (std::size_t i = width; i-- > 0;) {
        value = value << 8 | bytes[at + i];
    }
    return value;
}

bool begins_with(Bytes bytes, std::string_view signature) {
    return bytes.size() >= signature.size() &&
           std::ranges::equal(bytes.first(signature.size()), signature, {}, {},
                              [](char c) { return static_cast<unsigned char>(c); });
}

std::vector<unsigned char> read_at(int descriptor, std::uint64_t offset, std::size_t length) {
    std::vector<unsigned char> bytes(length);
    std::size_t done = 0;
    while (done < length) {
        const ssize_t count = pread(descriptor, bytes.data() + done, length - done,
                                    static_cast<off_t>(offset + done));
        if (count <= 0) {
            throw Failure(count < 0 ? kMinizipNoArchive : kMinizipDamaged);
        }
        done += static_cast<std::size_t>(count);
    }
    return bytes;
}

// Where the end record stands in the archive's last bytes: its comment ends where the file does.
std::size_t find_end(Bytes tail) {
    for (std::size_t at = tail.size() + 1 - std::min(tail.size() + 1, kEndSize); at-- > 0;) {
        const Bytes rest = tail.subspan(at);
        if (begins_with(rest, "PK\5\6"sv) && number(rest, 20, 2) == rest.size() - kEndSize) {
            return at;
        }
    }
    throw Failure(kMinizipDamaged);
}

Directory read_end64(int descriptor, std::uint64_t offset, std::uint64_t size) {
    if (size < kEnd64Size || offset > size - kEnd64Size) {
        throw Failure(kMinizipDamaged);
    }
    const auto end = read_at(descriptor, offset, kEnd64Size);
    if (!begins_with(end, "PK\6\6"sv)) {
        throw Failure(kMinizipDamaged);
    }
    return {number(end, 32, 8), number(end, 48, 8), number(end, 40, 8)};
}

Directory find_directory(int descriptor, std::uint64_t size) {
    constexpr std::size_t kMaxTail = kLocatorSize + kEndSize + kMaxCommentLength;
    const auto length = static_cast<std::size_t>(std::min<std::uint64_t>(size, kMaxTail));
    const auto tail = read_at(descriptor, size - length, length);
    const std::size_t at = find_end(tail);
    if (at >= kLocatorSize) {
        const Bytes locator = Bytes(tail).subspan(at - kLocatorSize, kLocatorSize);
        if (begins_with(locator, "PK\6\7"sv)) {
            return read_end64(descriptor, number(locator, 8, 8), size);
        }
    }
    return {number(tail, at + 10, 2), number(tail, at + 16, 4), number(tail, at + 12, 4)};
}

// What follows the record at the begin of `rest`.
Bytes pass_entry(Bytes rest) {
    if (rest.size() < kEntrySize || !begins_with(rest, "PK\1\2"sv)) {
        throw Failure(kMinizipDamaged);
    }
    const auto name_length = static_cast<std::size_t>(number(rest, 28, 2));
    const auto length = static_cast<std::size_t>(kEntrySize + name_length + number(rest, 30, 2) +
                                                 number(rest, 32, 2));
    if (rest.size() < length) {
        throw Failure(kMinizipDamaged);
    }
    if (std::ranges::count(rest.subspan(kEntrySize, name_length), 0) > 0) {
        throw Failure(kMinizipUnsafeName);
    }
    return rest.subspan(length);
}

}  // namespace

std::uint64_t scan_directory(int descriptor, std::uint64_t size) {
    const Directory directory = find_directory(descriptor, size);
    if (directory.entries > kMaxEntries || directory.size > kMaxDirectorySize) {
        throw Failure(kMinizipTooMuch);
    }
    if (directory.size > size || directory.offset > size - directory.size) {
        throw Failure(kMinizipDamaged);
    }
    const auto bytes =
        read_at(descriptor, directory.offset, static_cast<std::size_t>(directory.size));
    Bytes rest = bytes;
    for (std::uint64_t i = 0; i < directory.entries; ++i) {
        rest = pass_entry(rest);
    }
    return directory.entries;
}

}  // namespace velkhost::unzip

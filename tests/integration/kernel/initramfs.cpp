#include "tests/integration/kernel/initramfs.h"

#include <array>
#include <cstdio>
#include <utility>

#include <sys/stat.h>

namespace velkkernel {
namespace {

constexpr std::size_t kAlignment = 4;

std::string hex8(std::uint32_t value) {
    std::array<char, 9> text{};
    std::snprintf(text.data(), text.size(), "%08X", value);
    return text.data();
}

}  // namespace

void Initramfs::add_folder(std::string_view path) {
    add({path, S_IFDIR | 0755U});
}

void Initramfs::add_file(std::string_view path, std::string_view contents, bool executable) {
    add({path, S_IFREG | (executable ? 0755U : 0644U), contents});
}

void Initramfs::add_character_device(std::string_view path, unsigned major, unsigned minor) {
    add({path, S_IFCHR | 0600U, {}, major, minor});
}

std::string Initramfs::finish() {
    next_inode_ = 0;
    add({"TRAILER!!!", 0});
    return std::move(archive_);
}

void Initramfs::add(const Entry &entry) {
    constexpr std::uint32_t kLinks = 1;
    const auto size = static_cast<std::uint32_t>(entry.contents.size());
    const auto name_size = static_cast<std::uint32_t>(entry.path.size() + 1);
    archive_ += "070701";
    for (const std::uint32_t field : {next_inode_++, entry.mode, 0U, 0U, kLinks, 0U, size, 0U, 0U,
                                      entry.major, entry.minor, name_size, 0U}) {
        archive_ += hex8(field);
    }
    archive_ += entry.path;
    archive_ += '\0';
    pad();
    archive_ += entry.contents;
    pad();
}

void Initramfs::pad() {
    archive_.resize((archive_.size() + kAlignment - 1) / kAlignment * kAlignment);
}

}  // namespace velkkernel

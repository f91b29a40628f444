// A root file system for the kernel, as a "newc" archive (Linux,
// Documentation/driver-api/early-userspace/buffer-format.rst).
#pragma once

#include <cstdint>
#include <string>
#include <string_view>

namespace velkkernel {

class Initramfs {
  public:
    void add_folder(std::string_view path);
    void add_file(std::string_view path, std::string_view contents, bool executable = false);
    void add_character_device(std::string_view path, unsigned major, unsigned minor);

    // The whole archive. Nothing can be added afterwards.
    [[nodiscard]] std::string finish();

  private:
    struct Entry {
        std::string_view path;  // without a leading '/'
        std::uint32_t mode = 0;
        std::string_view contents = {};
        std::uint32_t major = 0;
        std::uint32_t minor = 0;
    };

    void add(const Entry &entry);
    void pad();

    std::string archive_;
    std::uint32_t next_inode_ = 1;
};

}  // namespace velkkernel

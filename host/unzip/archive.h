// A zip archive that is being read.
#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <span>
#include <string>

#include <zip.h>

namespace velkhost::unzip {

struct Entry {
    std::string name;
    std::uint64_t size;    // unpacked, as the archive states it
    bool regular;          // a file or a folder, by the mode that the archive states
    std::uint16_t method;  // ZIP_CM_...
    bool encrypted;
};

class Archive {
  public:
    // Opens the archive and looks through its directory. Throws Failure.
    explicit Archive(const char *path);

    [[nodiscard]] std::uint64_t file_size() const { return file_size_; }
    [[nodiscard]] std::uint64_t count() const { return count_; }

    // What the directory says of an entry, `index` below count(). Throws Failure.
    [[nodiscard]] Entry entry(std::uint64_t index) const;

    // Hands an entry's contents to `take`, piece by piece. Returns when they had the stated size
    // and checksum, else throws Failure; never hands over more than the stated size.
    void read(std::uint64_t index, const std::function<void(std::span<const char>)> &take) const;

  private:
    struct Discard {
        void operator()(zip_t *archive) const { zip_discard(archive); }
    };

    std::uint64_t file_size_ = 0;
    std::uint64_t count_ = 0;
    std::unique_ptr<zip_t, Discard> zip_;
};

}  // namespace velkhost::unzip

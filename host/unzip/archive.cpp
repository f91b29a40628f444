#include "host/unzip/archive.h"

#include <fcntl.h>
#include <sys/stat.h>

#include <array>

#include "host/unzip/descriptor.h"
#include "host/unzip/directory_scan.h"
#include "host/unzip/failure.h"
#include "host/unzip/limits.h"

namespace velkhost::unzip {
namespace {

struct CloseEntry {
    void operator()(zip_file_t *file) const { zip_fclose(file); }
};

Failure failure_of(int libzip_error) {
    switch (libzip_error) {
        case ZIP_ER_MEMORY:
            return Failure(kMinizipNoMemory);
        case ZIP_ER_OPEN:
        case ZIP_ER_READ:
        case ZIP_ER_SEEK:
            return Failure(kMinizipNoArchive);
        case ZIP_ER_EXISTS:
            return Failure(kMinizipNameTwice);
        default:
            return Failure(kMinizipDamaged);
    }
}

// Does not wait for a writer where the path is a pipe.
Descriptor open_file(const char *path, std::uint64_t &size) {
    Descriptor file(open(path, O_RDONLY | O_CLOEXEC | O_NONBLOCK));
    struct stat status {};
    if (!file.is_open() || fstat(file.get(), &status) != 0 || !S_ISREG(status.st_mode)) {
        throw Failure(kMinizipNoArchive);
    }
    size = static_cast<std::uint64_t>(status.st_size);
    return file;
}

// A writer that knows no modes leaves the whole field 0.
bool is_regular(zip_t *archive, std::uint64_t index) {
    zip_uint8_t system = 0;
    zip_uint32_t attributes = 0;
    zip_file_get_external_attributes(archive, index, 0, &system, &attributes);
    const mode_t type = attributes >> 16 & S_IFMT;
    return type == 0 || type == S_IFREG || type == S_IFDIR;
}

}  // namespace

Archive::Archive(const char *path) {
    Descriptor file = open_file(path, file_size_);
    if (file_size_ > kMaxTotalSize) {
        throw Failure(kMinizipTooMuch);
    }
    count_ = scan_directory(file.get(), file_size_);
    int error = 0;
    zip_.reset(zip_fdopen(file.get(), ZIP_CHECKCONS, &error));
    if (zip_ == nullptr) {
        throw failure_of(error);
    }
    file.release();
    if (static_cast<std::uint64_t>(zip_get_num_entries(zip_.get(), 0)) != count_) {
        throw Failure(kMinizipDamaged);  // an archive with two directories
    }
}

Entry Archive::entry(std::uint64_t index) const {
    constexpr zip_uint64_t kNeeded =
        ZIP_STAT_NAME | ZIP_STAT_SIZE | ZIP_STAT_COMP_METHOD | ZIP_STAT_ENCRYPTION_METHOD;
    zip_stat_t status{};
    if (zip_stat_index(zip_.get(), index, ZIP_FL_ENC_RAW, &status) != 0 ||
        (status.valid & kNeeded) != kNeeded) {
        throw Failure(kMinizipDamaged);
    }
    return {status.name, status.size, is_regular(zip_.get(), index), status.comp_method,
            status.encryption_method != ZIP_EM_NONE};
}

void Archive::read(std::uint64_t index,
                   const std::function<void(std::span<const char>)> &take) const {
    std::uint64_t left = entry(index).size;
    const std::unique_ptr<zip_file_t, CloseEntry> file(zip_fopen_index(zip_.get(), index, 0));
    if (file == nullptr) {
        throw failure_of(zip_error_code_zip(zip_get_error(zip_.get())));
    }
    std::array<char, 65536> piece;  // NOLINT(cppcoreguidelines-pro-type-member-init): zip_fread's
    while (true) {
        // The checksum is compared when a read meets the end.
        const zip_int64_t count = zip_fread(file.get(), piece.data(), piece.size());
        if (count < 0) {
            throw failure_of(zip_error_code_zip(zip_file_get_error(file.get())));
        }
        if (static_cast<std::uint64_t>(count) > left || (count == 0 && left > 0)) {
            throw Failure(kMinizipDamaged);
        }
        if (count == 0) {
            return;
        }
        left -= static_cast<std::uint64_t>(count);
        take({piece.data(), static_cast<std::size_t>(count)});
    }
}

}  // namespace velkhost::unzip

#include "catalog/remove_tree.h"

#include <dirent.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <span>
#include <string_view>

#include "velk/bounded_text.h"
#include "velk/debug_log.h"

namespace {

constexpr std::size_t kPathSize = 256;

constexpr int kRemoved = 0;
constexpr int kAbsent = 1;
constexpr int kDirectoryFailed = -1;
constexpr int kUnlinkFailed = -2;

int fail(int result, const char *message) {
    velk::log_entry(message);
    return result;
}

bool is_dot_entry(std::string_view name) {
    return name == "." || name == "..";
}

// Removes what the open directory `path` holds; the result of the last entry, or the first
// negative one.
int remove_entries(DIR *directory, const char *path) {
    int result = kRemoved;
    while (result >= 0) {
        const dirent *entry = readdir(directory);
        if (entry == nullptr) {
            break;
        }
        if (is_dot_entry(entry->d_name)) {
            continue;
        }
        char name[kPathSize] = {};
        const int needed = util_full_name(path, entry->d_name, name, sizeof name);
        // A name that was cut is taken for absent: it can be that of the folder itself.
        result = util_remove_file(needed < static_cast<int>(sizeof name) ? name : nullptr);
    }
    return result;
}

int remove_directory(const char *path) {
    DIR *directory = opendir(path);
    if (directory == nullptr) {
        return fail(kDirectoryFailed,
                    "In Function util_remove_file::opendir error and the error code is [-1].\n");
    }
    const int result = remove_entries(directory, path);
    if (closedir(directory) != 0) {
        return fail(kDirectoryFailed,
                    "In Function util_remove_file::closedir error and the error code is [-1].\n");
    }
    if (result < 0) {
        return result;
    }
    if (rmdir(path) != 0) {
        return fail(kDirectoryFailed,
                    "In Function util_remove_file::rmdir error and the error code is [-1].\n");
    }
    return result;
}

}  // namespace

int util_remove_file(const char *path) {
    struct stat status = {};
    if (path == nullptr || lstat(path, &status) != 0) {
        return fail(kAbsent,
                    "In Function util_remove_file::The directory doesn't exist and the error code "
                    "[1].\n");
    }
    if (S_ISDIR(status.st_mode)) {
        return remove_directory(path);
    }
    if (unlink(path) != 0) {
        // The message says -1 where the value is -2.
        return fail(kUnlinkFailed,
                    "In Function util_remove_file::unlink failed and the error code is [-1].\n");
    }
    return kRemoved;
}

int util_full_name(const char *dir, const char *name, char *out, int size) {
    const std::string_view directory = velk::view(dir);
    std::string_view entry = velk::view(name);
    entry.remove_prefix(std::min(entry.find_first_not_of('/'), entry.size()));
    const std::string_view separator = directory.ends_with('/') ? "" : "/";

    if (out != nullptr && size > 0) {
        const std::span<char> buffer(out, static_cast<std::size_t>(size));
        std::size_t length = velk::copy(buffer, directory);
        length = velk::put(buffer, length, separator);
        velk::put(buffer, length, entry);
    }
    return static_cast<int>(directory.size() + separator.size() + entry.size());
}

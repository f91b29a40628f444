#include "host/rig/run_folder.h"

#include "host/rig/rig_error.h"

#include <stdlib.h>

#include <array>
#include <cerrno>
#include <cstring>
#include <fstream>
#include <utility>

namespace velkhost::rig {
namespace {

namespace fs = std::filesystem;

constexpr std::array kFolders = {
    "tmp/sfcb", "var/tmp/filestore", "usr/lib/cim", "etc/velkhost", "etc/cim/zeb", "dev",
};

// What the host's broker finds in /usr/lib/cim: the library, what it loads, the other providers.
bool is_host_library(const fs::path &file) {
    const std::string name = file.filename().string();
    const bool is_provider = name.starts_with("libzeb") || name.starts_with("libadapter") ||
                             name.starts_with("libhypervisor");
    return name == "libvelkprovider.so" || name == "libconcretejob.so" ||
           name == "libunzipfile.so" || (is_provider && name.ends_with(".so"));
}

[[noreturn]] void fail(const std::string &attempt, const fs::path &path,
                       const std::error_code &error) {
    throw RigError("cannot " + attempt + " " + path.string() + ": " + error.message());
}

void make_folder(const fs::path &path) {
    std::error_code error;
    fs::create_directories(path, error);
    if (error) {
        fail("make the folder", path, error);
    }
}

void link_into(const fs::path &folder, const fs::path &library) {
    std::error_code error;
    const fs::path link = folder / library.filename();
    fs::remove(link, error);
    fs::create_symlink(fs::absolute(library), link, error);
    if (error) {
        fail("link", link, error);
    }
}

void write_file(const fs::path &path, const std::string &text) {
    std::ofstream file(path, std::ios::binary | std::ios::trunc);
    file << text;
    file.close();
    if (!file) {
        fail("write", path, {errno, std::generic_category()});
    }
}

fs::path temporary_place() {
    const char *const place = secure_getenv("TMPDIR");
    return place == nullptr || *place == '\0' ? "/tmp" : place;
}

}  // namespace

RunFolder RunFolder::make_temporary() {
    std::string pattern = fs::absolute(temporary_place() / "velkhost-XXXXXX").string();
    if (mkdtemp(pattern.data()) == nullptr) {
        fail("make a folder in", temporary_place(), {errno, std::generic_category()});
    }
    return {pattern, true};
}

RunFolder RunFolder::at(const fs::path &path) {
    make_folder(path);
    std::error_code error;
    fs::path absolute = fs::canonical(path, error);
    if (error) {
        fail("use the folder", path, error);
    }
    return {std::move(absolute), false};
}

RunFolder::~RunFolder() {
    if (temporary_ && !kept_) {
        remove_folder(path_);
    }
}

RunFolder::RunFolder(RunFolder &&other) noexcept
    : path_(std::move(other.path_)),
      temporary_(std::exchange(other.temporary_, false)),
      kept_(other.kept_) {}

fs::path RunFolder::inside(const std::string &fixed_path) const {
    return path_ / fs::path(fixed_path).relative_path();
}

void RunFolder::furnish(const fs::path &libraries, const std::string &scenario_text) const {
    for (const char *folder : kFolders) {
        make_folder(path_ / folder);
    }
    std::error_code error;
    for (const auto &entry : fs::directory_iterator(libraries, error)) {
        if (is_host_library(entry.path())) {
            link_into(path_ / "usr/lib/cim", entry.path());
        }
    }
    if (error) {
        fail("read the folder", libraries, error);
    }
    if (!scenario_text.empty()) {
        write_file(path_ / "etc/velkhost/scenario.toml", scenario_text);
    }
}

bool remove_folder(const fs::path &path) noexcept {
    // A thread that is still at work may put a file back into a folder that was just emptied.
    constexpr int kTries = 100;
    for (int i = 0; i < kTries; ++i) {
        std::error_code error;
        fs::remove_all(path, error);
        if (!fs::exists(fs::symlink_status(path, error))) {
            return true;
        }
    }
    return false;
}

}  // namespace velkhost::rig

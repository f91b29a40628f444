#include "host/rig/parts.h"

#include "host/rig/rig_error.h"

#include <algorithm>

namespace velkhost::rig {
namespace {

namespace fs = std::filesystem;

constexpr const char *kProviderLibrary = "libvelkprovider.so";

fs::path library_folder(const fs::path &prefix) {
    for (const fs::path &folder : {prefix / "lib/velkhost/parts", prefix / "lib"}) {
        if (fs::exists(folder / kProviderLibrary)) {
            return folder;
        }
    }
    throw RigError(std::string("no ") + kProviderLibrary + " in " + (prefix / "lib").string() +
                   " or its folder velkhost/parts");
}

// The files of that extension, by name.
std::vector<fs::path> files_in(const fs::path &folder, const char *extension) {
    std::vector<fs::path> files;
    std::error_code error;
    for (const auto &entry : fs::directory_iterator(folder, error)) {
        if (entry.path().extension() == extension) {
            files.push_back(entry.path());
        }
    }
    std::sort(files.begin(), files.end());
    if (files.empty()) {
        throw RigError("no *" + std::string(extension) + " file in " + folder.string());
    }
    return files;
}

// The files that declare a namespace's classes; the others are included by them.
std::vector<fs::path> mof_files_in(const fs::path &folder) {
    std::vector<fs::path> files = files_in(folder, ".mof");
    std::erase_if(
        files, [](const fs::path &file) { return file.filename().string().starts_with("cim_"); });
    return files;
}

}  // namespace

Parts Parts::around(const fs::path &bin) {
    const fs::path prefix = bin.parent_path();
    const fs::path share = prefix / "share/velkhost";
    return {library_folder(prefix), mof_files_in(share / "mof"),
            files_in(share / "registration", ".reg")};
}

Parts Parts::around_this_program() {
    std::error_code error;
    const fs::path program = fs::read_symlink("/proc/self/exe", error);
    if (error) {
        throw RigError("cannot find the running program: " + error.message());
    }
    return around(program.parent_path());
}

}  // namespace velkhost::rig

#include "host/rig/library_state.h"

#include <dlfcn.h>

#include <algorithm>
#include <atomic>
#include <cstring>

namespace velkhost::rig {
namespace {

// The package table, as tools that read it know it: 20 records, whose result lines are 200 bytes.
constexpr int kMostPackages = 20;
constexpr std::size_t kRecordSize = sizeof(void *) == 8 ? 63032 : 63020;
constexpr std::size_t kResultOffset = 600;
constexpr std::size_t kResultSize = 200;
constexpr std::size_t kJobIdSize = 40;

std::string bounded_text(const char *text, std::size_t size) {
    return {text, strnlen(text, size)};
}

int load(const int *value) {
    // atomic_ref takes no const; nothing is written.
    return std::atomic_ref(*const_cast<int *>(value)).load();
}

}  // namespace

void LibraryState::Close::operator()(void *library) const {
    dlclose(library);
}

std::optional<LibraryState> LibraryState::look(const std::string &path) {
    LibraryState state;
    state.library_.reset(dlopen(path.c_str(), RTLD_NOW | RTLD_NOLOAD));
    if (!state.library_) {
        return std::nullopt;
    }
    const auto find = [&state](const char *name) { return dlsym(state.library_.get(), name); };
    state.running_ = static_cast<const int *>(find("Velkchild_thread_num"));
    state.package_count_ = static_cast<const int *>(find("pkgnum"));
    state.packages_ = static_cast<const char *>(find("pkgInstance"));
    state.job_id_ = static_cast<const char *>(find("instanceID"));
    if (state.running_ == nullptr || state.package_count_ == nullptr ||
        state.packages_ == nullptr || state.job_id_ == nullptr) {
        return std::nullopt;
    }
    return state;
}

int LibraryState::running_installs() const {
    return load(running_);
}

std::vector<PackageStatus> LibraryState::results() const {
    std::vector<PackageStatus> results;
    const int count = std::clamp(load(package_count_), 0, kMostPackages);
    for (int i = 0; i < count; ++i) {
        const char *const record = packages_ + static_cast<std::size_t>(i) * kRecordSize;
        std::string text = bounded_text(record + kResultOffset, kResultSize);
        auto status = parse_package_status(text);
        results.push_back(status ? *std::move(status)
                                 : PackageStatus{std::move(text), std::nullopt, {}});
    }
    return results;
}

std::string LibraryState::job_id() const {
    return bounded_text(job_id_, kJobIdSize);
}

}  // namespace velkhost::rig

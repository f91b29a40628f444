// What the provider library says of itself: the session globals that it exports for tools.
#pragma once

#include "host/rig/status_line.h"

#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace velkhost::rig {

// A look into a loaded library; keeps it from being unloaded meanwhile.
class LibraryState {
  public:
    // No value when the file at `path` is not loaded, or is no such library.
    static std::optional<LibraryState> look(const std::string &path);

    // How many install threads run.
    [[nodiscard]] int running_installs() const;

    // The result line of each package of the latest request. Only between requests: an install
    // thread writes them without a lock.
    [[nodiscard]] std::vector<PackageStatus> results() const;

    // The id of the latest request's job; empty when there was none.
    [[nodiscard]] std::string job_id() const;

  private:
    struct Close {
        void operator()(void *library) const;
    };

    LibraryState() = default;

    std::unique_ptr<void, Close> library_;
    const int *running_ = nullptr;
    const int *package_count_ = nullptr;
    const char *packages_ = nullptr;
    const char *job_id_ = nullptr;
};

}  // namespace velkhost::rig

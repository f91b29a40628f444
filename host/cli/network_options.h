// What `velkhost network` is asked to do.
#pragma once

#include <filesystem>
#include <optional>

namespace velkhost::cli {

// Whether the network is to be configured anew before the table is shown.
enum class Configure { kNo, kIfOld, kAlways };

struct NetworkOptions {
    std::optional<std::filesystem::path> scenario;
    std::optional<std::filesystem::path> root;
    Configure configure = Configure::kNo;
    bool virtual_clock = true;
    bool json = false;
};

}  // namespace velkhost::cli

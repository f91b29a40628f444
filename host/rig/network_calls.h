// The library's own operations on the in-band network's table, by the names that it exports.
#pragma once

#include <cstdint>
#include <filesystem>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace velkhost::rig {

struct NetworkNode {
    int number;
    std::string device;      // the node's IPMI device
    std::string hypervisor;  // addresses
    std::string controller;
};

struct NetworkTable {
    std::int64_t stamp_s;  // when the mapping was made, seconds since 1970-01-01 UTC
    std::vector<NetworkNode> nodes;
};

// Keeps the library loaded.
class NetworkCalls {
  public:
    // Loads the library at this path. Throws RigError.
    explicit NetworkCalls(const std::filesystem::path &library);

    // Has the network configured anew: with `force` always, else when the mapping is 15 minutes
    // old. Waits for it, at most 130 seconds of the host's; false: nobody did so in time.
    [[nodiscard]] bool configure(bool force) const;

    // No value when there is no mapping that can be used; the library has then deleted it.
    [[nodiscard]] std::optional<NetworkTable> read_table() const;

  private:
    struct Close {
        void operator()(void *library) const;
    };

    template <class Function>
    Function *find(const char *name) const;

    std::unique_ptr<void, Close> library_;
};

}  // namespace velkhost::rig

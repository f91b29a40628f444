#include "host/rig/network_calls.h"

#include "host/rig/rig_error.h"

#include <dlfcn.h>

#include <algorithm>
#include <cstdlib>

namespace velkhost::rig {
namespace {

// The table as the library and its callers share it. The texts are buffers of 20 bytes that belong
// to the caller once InitializeTable has allocated them.
struct RawNode {
    int id;
    int index;
    char *device;
    char *spare;
    char *hypervisor;
    char *controller;
};

constexpr int kMostNodes = 4;

struct RawTable {
    int stamp = 0;
    RawNode nodes[kMostNodes] = {};
    int count = 0;

    RawTable() = default;
    RawTable(const RawTable &) = delete;
    RawTable &operator=(const RawTable &) = delete;
    ~RawTable() {
        for (const RawNode &node : nodes) {
            for (char *text : {node.device, node.spare, node.hypervisor, node.controller}) {
                std::free(text);  // NOLINT: made with malloc
            }
        }
    }
};

NetworkTable readable(const RawTable &raw) {
    NetworkTable table{raw.stamp, {}};
    for (int i = 0; i < std::clamp(raw.count, 0, kMostNodes); ++i) {
        const RawNode &node = raw.nodes[i];
        table.nodes.push_back({i, node.device, node.hypervisor, node.controller});
    }
    return table;
}

}  // namespace

void NetworkCalls::Close::operator()(void *library) const {
    dlclose(library);
}

NetworkCalls::NetworkCalls(const std::filesystem::path &library)
    : library_(dlopen(library.c_str(), RTLD_NOW | RTLD_LOCAL)) {
    if (!library_) {
        throw RigError("cannot load " + library.string() + ": " + dlerror());
    }
}

template <class Function>
Function *NetworkCalls::find(const char *name) const {
    void *const found = dlsym(library_.get(), name);
    if (found == nullptr) {
        throw RigError(std::string("the library has no ") + name);
    }
    return reinterpret_cast<Function *>(found);
}

bool NetworkCalls::configure(bool force) const {
    return find<int(int)>("cfgnetwork")(force ? 1 : 0) == 0;
}

std::optional<NetworkTable> NetworkCalls::read_table() const {
    RawTable raw;
    if (find<int(RawTable *)>("InitializeTable")(&raw) != 0) {
        throw RigError("no memory for the table");
    }
    if (find<int(RawTable *)>("GetNetTable")(&raw) != 0) {
        return std::nullopt;
    }
    return readable(raw);
}

}  // namespace velkhost::rig

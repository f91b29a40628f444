#include "host/scenario/transfer_reader.h"

#include <algorithm>
#include <array>
#include <limits>
#include <string>

namespace velkhost::scenario {
namespace {

constexpr std::uint32_t kMostSeconds = 3600;
constexpr std::uint32_t kMostBytes = std::numeric_limits<std::uint32_t>::max();
constexpr std::uint32_t kMostAtOnce = 64;

struct Action {
    const char *name;
    TransferFault fault;
};

constexpr std::array kActions{
    Action{"refuse", TransferFault::kRefuse},
    Action{"stall", TransferFault::kStall},
    Action{"cut", TransferFault::kCut},
    Action{"full", TransferFault::kFull},
};

std::optional<std::string> read_path(TableReader &in, const char *key) {
    auto path = in.text(key);
    if (path && !path->starts_with('/')) {
        in.fail(key, "must be an absolute path, not \"" + *path + '"');
    }
    return path;
}

std::vector<std::string> read_transferred(TableReader &in) {
    std::vector<std::string> paths;
    assign(paths, in.texts("transferred"));
    for (const std::string &path : paths) {
        if (!path.starts_with('/')) {
            in.fail("transferred", "must hold absolute paths, not \"" + path + '"');
        }
    }
    return paths;
}

}  // namespace

FileTransferSettings read_file_transfer(TableReader in) {
    FileTransferSettings out;
    out.transferred = read_transferred(in);
    out.user = in.text("user");
    out.password = in.text("password");
    out.private_key = read_path(in, "private_key");
    out.known_hosts = read_path(in, "known_hosts");
    assign(out.connect_seconds, in.number("connect_seconds", 1, kMostSeconds));
    assign(out.stall_seconds, in.number("stall_seconds", 1, kMostSeconds));
    assign(out.bytes_per_second, in.number("bytes_per_second", 0, kMostBytes));
    out.capacity = in.number("capacity", 0, kMostBytes);
    assign(out.at_once, in.number("at_once", 1, kMostAtOnce));
    in.finish();
    return out;
}

TransferFault read_transfer_action(TableReader &in) {
    std::string known;
    for (const Action &action : kActions) {
        known += (known.empty() ? "" : ", ") + std::string(action.name);
    }
    const auto name = in.text("action");
    if (!name) {
        in.fail("action", "is missing; known are " + known);
    }
    const auto *const found = std::ranges::find(kActions, *name, &Action::name);
    if (found == kActions.end()) {
        in.fail("action", "is unknown; known are " + known);
    }
    return found->fault;
}

}  // namespace velkhost::scenario

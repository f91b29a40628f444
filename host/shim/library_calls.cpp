// dlopen. Compiled with sibling calls in every build: libc finds the run path, and what $ORIGIN
// stands for, by the address that its dlopen returns to. A name that is not re-rooted is therefore
// handed on with a jump, so that this address stays the caller's.
//
// A host's broker finds the libraries of /usr/lib/cim by their bare names as well. So does the
// shim, where the root has that library; else libc searches as usual.
#include <unistd.h>

#include <array>
#include <climits>
#include <cstdio>
#include <cstring>
#include <optional>

#include "host/shim/libc_calls.h"
#include "host/shim/root.h"
#include "host/shim/velkshim.h"

namespace velkhost::shim {
namespace {

bool is_rerooted(const char *path) {
    return !Rerooted(path).fixed().empty();
}

// Has libc itself fail, so that dlerror() has a text: no file has this name.
void *fail_to_open(const char *path, int error) {
    std::array<char, PATH_MAX + 128> absent{};
    std::snprintf(absent.data(), absent.size(), "%s: %s", path, strerrordesc_np(error));
    return libc().dlopen(absent.data(), RTLD_NOW);
}

[[gnu::noinline]] void *open_rerooted(const char *path, int mode) {
    const Rerooted target(path);
    const int error = target.refusal("dlopen");
    return error != 0 ? fail_to_open(path, error) : libc().dlopen(target.path(), mode);
}

// Opens the library of /usr/lib/cim that has this bare name; no value where there is none.
[[gnu::noinline]] std::optional<void *> open_host_library(const char *name, int mode) {
    if (name == nullptr || *name == '\0' || std::strchr(name, '/') != nullptr) {
        return std::nullopt;
    }
    std::array<char, NAME_MAX + 16> path{};
    std::snprintf(path.data(), path.size(), "/usr/lib/cim/%.*s", NAME_MAX, name);
    const Rerooted target(path.data());
    if (const int error = target.refusal("dlopen"); error != 0) {
        return fail_to_open(path.data(), error);
    }
    if (target.fixed().empty() || libc().access(target.path(), F_OK) != 0) {
        return std::nullopt;
    }
    return libc().dlopen(target.path(), mode);
}

}  // namespace
}  // namespace velkhost::shim

namespace shim = velkhost::shim;

extern "C" VELKSHIM_API void *dlopen(const char *path, int mode) noexcept {
    if (shim::is_rerooted(path)) {
        return shim::open_rerooted(path, mode);
    }
    if (const auto library = shim::open_host_library(path, mode)) {
        return *library;
    }
    return shim::libc().dlopen(path, mode);
}

// dlopen. Compiled with sibling calls in every build: libc finds the run path, and what $ORIGIN
// stands for, by the address that its dlopen returns to. A name that is not re-rooted is therefore
// handed on with a jump, so that this address stays the caller's.
#include <array>
#include <climits>
#include <cstdio>
#include <cstring>

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

}  // namespace
}  // namespace velkhost::shim

namespace shim = velkhost::shim;

extern "C" VELKSHIM_API void *dlopen(const char *path, int mode) noexcept {
    if (shim::is_rerooted(path)) {
        return shim::open_rerooted(path, mode);
    }
    return shim::libc().dlopen(path, mode);
}

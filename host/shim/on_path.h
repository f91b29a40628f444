// The one way in which the shim serves a libc call that names a path.
#pragma once

#include <cerrno>
#include <string_view>
#include <type_traits>

#include "host/shim/root.h"

namespace velkhost::shim {

// Sets errno and returns what libc returns then: a null pointer or -1.
template <typename Result>
Result fail_with(int error) {
    errno = error;
    if constexpr (std::is_pointer_v<Result>) {
        return nullptr;
    } else {
        return -1;
    }
}

// Calls `call` with the place where `path` really lies, unless the step "verb:path" is refused.
template <typename Call>
auto on_path(std::string_view verb, const char *path, Call call) {
    using Result = decltype(call(path));
    const Rerooted target(path);
    if (const int error = target.refusal(verb); error != 0) {
        return fail_with<Result>(error);
    }
    return call(target.path());
}

// The same for a call that names two.
template <typename Call>
auto on_paths(std::string_view verb, const char *from, const char *to, Call call) {
    return on_path(verb, from, [&](const char *real_from) {
        return on_path(verb, to, [&](const char *real_to) { return call(real_from, real_to); });
    });
}

}  // namespace velkhost::shim

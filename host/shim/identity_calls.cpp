// The calls that tell the host's name.
#include <algorithm>
#include <cerrno>
#include <cstring>

#include "host/shim/libc_calls.h"
#include "host/shim/published_text.h"
#include "host/shim/velkshim.h"

namespace velkhost::shim {
namespace {

constinit PublishedText node_name;

constexpr std::size_t kLongestName = sizeof(utsname::nodename) - 1;

}  // namespace
}  // namespace velkhost::shim

namespace shim = velkhost::shim;

extern "C" {

VELKSHIM_API int uname(utsname *out) noexcept {
    const int result = shim::libc().uname(out);
    const char *const name = shim::node_name.get();
    if (result == 0 && name != nullptr) {
        std::memcpy(out->nodename, name, std::strlen(name) + 1);  // cut to the field when set
    }
    return result;
}

// A name that does not fit is cut and reported, as glibc does it.
VELKSHIM_API int gethostname(char *out, size_t size) noexcept {
    const char *const name = shim::node_name.get();
    if (name == nullptr) {
        return shim::libc().gethostname(out, size);
    }
    const std::size_t length = std::strlen(name) + 1;
    std::memcpy(out, name, std::min(length, size));
    if (length <= size) {
        return 0;
    }
    errno = ENAMETOOLONG;
    return -1;
}

}  // extern "C"

void velkshim_set_node_name(const char *name) {
    if (name == nullptr) {
        shim::node_name.withdraw();
        return;
    }
    const std::size_t length = strnlen(name, shim::kLongestName);
    [[maybe_unused]] const bool published = shim::node_name.publish({name, length});
}

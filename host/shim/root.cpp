#include "host/shim/root.h"

#include <sys/stat.h>

#include <algorithm>
#include <cerrno>
#include <cstdlib>
#include <cstring>

#include "host/shim/faults.h"
#include "host/shim/fixed_paths.h"
#include "host/shim/libc_calls.h"
#include "host/shim/published_text.h"
#include "host/shim/velkshim.h"

namespace velkhost::shim {
namespace {

constinit PublishedText root_folder;

}  // namespace

// NOLINTNEXTLINE(cppcoreguidelines-pro-type-member-init): room_ is filled only where it is used
Rerooted::Rerooted(const char *path) : path_(path) {
    const char *const root = root_folder.get();
    if (root == nullptr || path == nullptr || *path != '/') {
        return;
    }
    const std::size_t length = strnlen(path, PATH_MAX);
    if (length < PATH_MAX) {  // the kernel refuses longer ones itself
        reroot({path, length}, root);
    }
}

// The path is put in order where it will stand behind the root, so that nothing moves afterwards.
void Rerooted::reroot(std::string_view given, std::string_view root) {
    const auto behind_root = std::span(room_).subspan(root.size());
    const auto ordered = put_in_order(given, behind_root.first(PATH_MAX));
    if (!ordered || !is_fixed_path({behind_root.data(), ordered->length})) {
        return;
    }
    fixed_ = {behind_root.data(), ordered->length};
    std::size_t length = root.size() + ordered->length;
    std::ranges::copy(root, room_.begin());
    if (ordered->names_a_folder) {
        room_[length++] = '/';
    }
    room_[length] = '\0';
    too_long_ = length >= PATH_MAX;
    path_ = room_.data();
}

int Rerooted::refusal(std::string_view verb) const {
    if (fixed_.empty()) {
        return 0;
    }
    return too_long_ ? ENAMETOOLONG : fault_at(verb, fixed_);
}

namespace {

int check_is_folder(const char *path) {
    struct stat status {};
    if (libc().stat(path, &status) != 0) {
        return errno;
    }
    return S_ISDIR(status.st_mode) ? 0 : ENOTDIR;
}

int set_root(const char *folder) {
    std::array<char, PATH_MAX> absolute{};
    if (realpath(folder, absolute.data()) == nullptr) {
        return errno;
    }
    if (const int error = check_is_folder(absolute.data()); error != 0) {
        return error;
    }
    std::string_view text(absolute.data());
    if (text == "/") {
        text = {};  // what is put behind it begins with the '/'
    }
    if (is_fixed_path(text)) {
        return EINVAL;  // a path given with its root would be put under the root once more
    }
    return root_folder.publish(text) ? 0 : ENOMEM;
}

}  // namespace
}  // namespace velkhost::shim

int velkshim_set_root(const char *folder) {
    if (folder == nullptr) {
        velkhost::shim::root_folder.withdraw();
        return 0;
    }
    return velkhost::shim::set_root(folder);
}

int velkshim_map(const char *path, char *out, size_t size) {
    const velkhost::shim::Rerooted target(path);
    const size_t length = target.path() == nullptr ? 0 : std::strlen(target.path());
    if (target.path() == nullptr || length >= size || length >= PATH_MAX) {
        errno = target.path() == nullptr ? EFAULT : ENAMETOOLONG;
        return -1;
    }
    std::memcpy(out, target.path(), length + 1);
    return target.fixed().empty() ? 0 : 1;
}

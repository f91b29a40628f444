#include "tests/support/directory_faults.h"

#include <dirent.h>

#include <cerrno>
#include <utility>

namespace velktest {
namespace {

thread_local DirectoryFaults *faults = nullptr;

}  // namespace

DirectoryFaults::DirectoryFaults() {
    faults = this;
}

DirectoryFaults::~DirectoryFaults() {
    faults = nullptr;
}

}  // namespace velktest

// The linker sends the calls here and the __real_ ones on (--wrap). Visible, because sanitizers'
// libraries refer to the same names.
// NOLINTBEGIN(bugprone-reserved-identifier,readability-identifier-naming)
extern "C" {

int __real_closedir(DIR *directory);
dirent64 *__real_readdir64(DIR *directory);

[[gnu::visibility("default")]] int __wrap_closedir(DIR *directory) {
    const int result = __real_closedir(directory);
    auto *faults = velktest::faults;
    if (faults == nullptr || !std::exchange(faults->next_close_fails, false)) {
        return result;
    }
    errno = EIO;
    return -1;
}

[[gnu::visibility("default")]] dirent64 *__wrap_readdir64(DIR *directory) {
    dirent64 *entry = __real_readdir64(directory);
    const auto *faults = velktest::faults;
    if (entry != nullptr && faults != nullptr && faults->on_entry) {
        faults->on_entry(entry->d_name);
    }
    return entry;
}
}
// NOLINTEND(bugprone-reserved-identifier,readability-identifier-naming)

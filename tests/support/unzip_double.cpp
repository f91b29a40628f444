#include "tests/support/unzip_double.h"

#include <dlfcn.h>

#include <string_view>
#include <utility>

#include "tests/support/files.h"

namespace velktest {
namespace {

UnzipDouble *active = nullptr;

constexpr std::string_view kFunction = "Minizip";
constexpr std::string_view kLibrary = "libunzipfile.so";

}  // namespace

UnzipDouble::UnzipDouble(std::filesystem::path folder) : folder_(std::move(folder)) {
    active = this;
}

UnzipDouble::~UnzipDouble() {
    active = nullptr;
}

int UnzipDouble::unzip(const std::string &archive, const std::string &directory) {
    calls.push_back(archive + " to " + directory);
    for (const auto &[name, content] : files) {
        write_file(folder_ / name, content);
    }
    return result;
}

}  // namespace velktest

using velktest::UnzipDouble;

// Found by the library that stands in for the host's.
extern "C" [[gnu::visibility("default")]] int velktest_minizip(const char *archive,
                                                               const char *directory) {
    return velktest::active == nullptr ? -1 : velktest::active->unzip(archive, directory);
}

// The linker has the code under test call these, and them the real ones.
// NOLINTBEGIN(bugprone-reserved-identifier,cert-dcl37-c,cert-dcl51-cpp,readability-identifier-naming)
extern "C" void *__real_dlopen(const char *name, int mode);
extern "C" void *__real_dlsym(void *library, const char *name);

// Visible, because sanitizers' libraries refer to the same names.
extern "C" [[gnu::visibility("default")]] void *__wrap_dlopen(const char *name, int mode) {
    if (velktest::active == nullptr || name == nullptr || velktest::kLibrary != name) {
        return __real_dlopen(name, mode);
    }
    velktest::active->opened.emplace_back(name);
    switch (velktest::active->place) {
        case UnzipDouble::Place::kLibrary:
            return __real_dlopen(VELK_FAKE_UNZIP_LIBRARY, mode);
        case UnzipDouble::Place::kOtherLibrary:
            return __real_dlopen(VELK_OTHER_LIBRARY, mode);
        default:
            return nullptr;
    }
}

extern "C" [[gnu::visibility("default")]] void *__wrap_dlsym(void *library, const char *name) {
    if (velktest::active == nullptr || library != RTLD_DEFAULT || velktest::kFunction != name) {
        return __real_dlsym(library, name);
    }
    const bool is_here = velktest::active->place == UnzipDouble::Place::kProcess;
    return is_here ? reinterpret_cast<void *>(&velktest_minizip) : nullptr;
}
// NOLINTEND(bugprone-reserved-identifier,cert-dcl37-c,cert-dcl51-cpp,readability-identifier-naming)

#include "installers/unpack.h"

#include <dlfcn.h>

#include <cstring>

#include "installers/adapter_frame.h"
#include "velk/debug_log.h"

namespace velk::adapter {
namespace {

constexpr const char *kUnzipLibrary = "libunzipfile.so";
constexpr int kUnpackFailed = -1;

using Minizip = int (*)(const char *archive, const char *directory);

// A definition that the process already has comes first; else the library stays loaded from the
// first use on.
Minizip find_minizip() {
    void *symbol = dlsym(RTLD_DEFAULT, "Minizip");
    if (symbol == nullptr) {
        void *library = dlopen(kUnzipLibrary, RTLD_LAZY | RTLD_GLOBAL);
        symbol = library == nullptr ? nullptr : dlsym(library, "Minizip");
    }
    return reinterpret_cast<Minizip>(symbol);
}

}  // namespace

int unpack_package(const char *local_uri) {
    log_format("tmpDestinationPath = %s\n", local_uri);
    const char *slash = std::strchr(local_uri, '/');
    if (slash == nullptr) {
        return kUnpackFailed;
    }
    const char *path = slash + 1;
    log_format("Effective path: %s\n", path);
    const Minizip unzip = *path == '\0' ? nullptr : find_minizip();
    return unzip == nullptr ? kUnpackFailed : unzip(path, kUnpackDirectory);
}

}  // namespace velk::adapter

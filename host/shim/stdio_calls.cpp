// The calls that open and close stdio streams. libc's stdio opens and closes its descriptors
// inside libc, where the shim's open and close are not met.
#include "host/shim/libc_calls.h"
#include "host/shim/on_path.h"
#include "host/shim/open_files.h"
#include "host/shim/velkshim.h"

namespace velkhost::shim {
namespace {

template <typename OpenCall>
FILE *open_stream(const char *path, const char *mode, OpenCall open_call) {
    const Rerooted target(path);
    if (const int error = target.refusal("open"); error != 0) {
        return fail_with<FILE *>(error);
    }
    FILE *const stream = open_call(target.path());
    remember_open(stream == nullptr ? -1 : fileno(stream), target, purpose_of(mode));
    return stream;
}

// Ends what `stream` stood for, then has it stand for another path. A null path only changes the
// mode: the file under it stays the same.
template <typename ReopenCall>
FILE *reopen_stream(const char *path, const char *mode, FILE *stream, ReopenCall reopen_call) {
    if (path == nullptr) {
        return reopen_call(nullptr);
    }
    const Closing closing(fileno(stream));
    return open_stream(path, mode, reopen_call);
}

}  // namespace
}  // namespace velkhost::shim

namespace shim = velkhost::shim;

extern "C" {

VELKSHIM_API FILE *fopen(const char *path, const char *mode) {
    return shim::open_stream(path, mode,
                             [mode](const char *real) { return shim::libc().fopen(real, mode); });
}

VELKSHIM_API FILE *fopen64(const char *path, const char *mode) {
    return shim::open_stream(path, mode,
                             [mode](const char *real) { return shim::libc().fopen64(real, mode); });
}

VELKSHIM_API FILE *freopen(const char *path, const char *mode, FILE *stream) {
    return shim::reopen_stream(path, mode, stream, [mode, stream](const char *real) {
        return shim::libc().freopen(real, mode, stream);
    });
}

VELKSHIM_API FILE *freopen64(const char *path, const char *mode, FILE *stream) {
    return shim::reopen_stream(path, mode, stream, [mode, stream](const char *real) {
        return shim::libc().freopen64(real, mode, stream);
    });
}

VELKSHIM_API int fclose(FILE *stream) {
    const shim::Closing closing(fileno(stream));
    const int result = shim::libc().fclose(stream);
    const int error = result == 0 ? closing.fault("close") : 0;
    return error == 0 ? result : shim::fail_with<int>(error);  // EOF is -1
}

}  // extern "C"

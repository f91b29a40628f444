#include "catalog/file_location.h"

#include <span>

#include "velk/bounded_text.h"
#include "velk/request_state.h"

namespace {

constexpr std::size_t kMaxLocation = 1024;
constexpr std::size_t kEndMark = 4096;

}  // namespace

int SetFileLocation(const char *text) {
    const std::span<char> buffer(update_file_location);
    velk::copy(buffer.first(kMaxLocation + 1), velk::view(text));
    velk::copy(buffer.subspan(kEndMark), {"\0\0\0", 3});
    return 0;
}

char *GetFileLocation(void) {
    return update_file_location;
}

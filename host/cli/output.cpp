#include "host/cli/output.h"

#include <unistd.h>

#include <cerrno>

namespace velkhost::cli {

void Output::write(std::string_view text) {
    while (!text.empty() && !broken_) {
        const ssize_t written = ::write(fd_, text.data(), text.size());
        if (written > 0) {
            text.remove_prefix(static_cast<std::size_t>(written));
        } else if (errno != EINTR) {
            broken_ = true;
        }
    }
}

}  // namespace velkhost::cli

#include "host/providers/kit/local_file.h"

#include <string_view>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace velkhost::providers {

std::optional<std::string> path_of_file_uri(const std::string &uri) {
    constexpr std::string_view kScheme = "file://";
    if (!uri.starts_with(kScheme) || uri.size() == kScheme.size() || uri[kScheme.size()] != '/') {
        return std::nullopt;
    }
    std::string path;
    for (const char c : std::string_view(uri).substr(kScheme.size())) {
        if (c != '/' || path.empty() || path.back() != '/') {
            path += c;
        }
    }
    return path;
}

bool is_readable_file(const std::string &path) {
    // Opened rather than asked about by name: an open reaches the file wherever the path really
    // lies. Without O_NONBLOCK a pipe without a writer would hold the call up.
    const int fd = ::open(path.c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK);
    if (fd < 0) {
        return false;
    }
    struct stat about {};
    const bool regular = ::fstat(fd, &about) == 0 && S_ISREG(about.st_mode);
    ::close(fd);
    return regular;
}

}  // namespace velkhost::providers

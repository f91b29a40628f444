#include "host/cli/stdout_capture.h"

#include <fcntl.h>
#include <unistd.h>

#include <cerrno>
#include <cstdio>
#include <system_error>

namespace velkhost::cli {

OwnStdout::OwnStdout() : fd_(fcntl(STDOUT_FILENO, F_DUPFD_CLOEXEC, STDERR_FILENO + 1)) {}

OwnStdout::~OwnStdout() {
    if (fd_ >= 0) {
        close(fd_);
    }
}

StdoutCapture::StdoutCapture(const std::filesystem::path &file) {
    std::filesystem::create_directories(file.parent_path());
    const int to = open(file.c_str(), O_WRONLY | O_CREAT | O_APPEND | O_CLOEXEC, 0644);
    if (to < 0) {
        throw std::system_error(errno, std::generic_category(), file.string());
    }
    std::fflush(stdout);
    dup2(to, STDOUT_FILENO);
    close(to);
}

StdoutCapture::~StdoutCapture() {
    std::fflush(stdout);
    if (before_.fd() >= 0) {
        dup2(before_.fd(), STDOUT_FILENO);
    } else {
        close(STDOUT_FILENO);
    }
}

}  // namespace velkhost::cli

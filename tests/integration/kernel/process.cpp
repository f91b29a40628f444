#include "tests/integration/kernel/process.h"

#include <algorithm>
#include <array>
#include <cerrno>
#include <csignal>
#include <cstdlib>
#include <filesystem>
#include <sstream>
#include <stdexcept>
#include <system_error>

#include <fcntl.h>
#include <poll.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

namespace velkkernel {
namespace {

using Clock = std::chrono::steady_clock;

// A child with a pipe to its output; killed and reaped at the latest by the destructor.
class Child {
  public:
    explicit Child(const std::vector<std::string> &command) {
        std::array<int, 2> ends{};
        if (pipe2(ends.data(), O_CLOEXEC) != 0) {
            throw std::system_error(errno, std::generic_category(), "pipe");
        }
        output_ = ends[0];
        const int error = start(command, ends[1]);
        close(ends[1]);
        if (error != 0) {
            close(output_);
            throw std::system_error(error, std::generic_category(), command.front());
        }
    }
    ~Child() {
        kill(pid_, SIGKILL);
        waitpid(pid_, nullptr, 0);
        close(output_);
    }
    Child(const Child &) = delete;
    Child &operator=(const Child &) = delete;

    [[nodiscard]] int output() const { return output_; }

  private:
    int start(const std::vector<std::string> &command, int out) {
        std::vector<char *> arguments;
        arguments.reserve(command.size() + 1);
        for (const std::string &word : command) {
            arguments.push_back(const_cast<char *>(word.c_str()));
        }
        arguments.push_back(nullptr);
        posix_spawn_file_actions_t actions;
        posix_spawn_file_actions_init(&actions);
        posix_spawn_file_actions_addopen(&actions, STDIN_FILENO, "/dev/null", O_RDONLY, 0);
        posix_spawn_file_actions_adddup2(&actions, out, STDOUT_FILENO);
        posix_spawn_file_actions_adddup2(&actions, out, STDERR_FILENO);
        const int error =
            posix_spawnp(&pid_, arguments[0], &actions, nullptr, arguments.data(), environ);
        posix_spawn_file_actions_destroy(&actions);
        return error;
    }

    pid_t pid_ = -1;
    int output_ = -1;
};

int left_ms(Clock::time_point deadline) {
    using std::chrono::milliseconds;
    const auto left = std::chrono::duration_cast<milliseconds>(deadline - Clock::now());
    return static_cast<int>(std::max<milliseconds::rep>(left.count(), 0));
}

}  // namespace

bool is_program(const std::string &name) {
    const char *const path = std::getenv("PATH");
    std::istringstream folders(path == nullptr ? "" : path);
    for (std::string folder; std::getline(folders, folder, ':');) {
        if (access((std::filesystem::path(folder) / name).c_str(), X_OK) == 0) {
            return true;
        }
    }
    return false;
}

std::string output_of(const std::vector<std::string> &command, std::chrono::seconds limit) {
    const auto deadline = Clock::now() + limit;
    const Child child(command);
    std::string text;
    std::array<char, 4096> buffer{};
    for (;;) {
        pollfd set = {child.output(), POLLIN, 0};
        if (poll(&set, 1, left_ms(deadline)) == 0) {
            throw std::runtime_error(command.front() + " did not end; it printed:\n" + text);
        }
        const ssize_t count = read(child.output(), buffer.data(), buffer.size());
        if (count <= 0) {
            return text;
        }
        text.append(buffer.data(), static_cast<std::size_t>(count));
    }
}

}  // namespace velkkernel

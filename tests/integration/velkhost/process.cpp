#include "tests/integration/velkhost/process.h"

#include <poll.h>
#include <pty.h>
#include <sys/wait.h>
#include <unistd.h>

#include <array>
#include <chrono>
#include <csignal>
#include <cstdlib>
#include <stdexcept>
#include <utility>

namespace velkhost::testing {
namespace {

// Sanitizer builds on a busy machine are slow.
constexpr auto kDeadline = std::chrono::seconds(100);

void apply(const Process::Environment &environment) {
    for (const auto &[name, value] : environment) {
        if (value.empty()) {
            unsetenv(name.c_str());
        } else {
            setenv(name.c_str(), value.c_str(), 1);
        }
    }
}

[[noreturn]] void become(const std::vector<std::string> &command,
                         const Process::Environment &environment) {
    apply(environment);
    std::vector<char *> arguments;
    for (const std::string &argument : command) {
        arguments.push_back(const_cast<char *>(argument.c_str()));
    }
    arguments.push_back(nullptr);
    execv(arguments[0], arguments.data());
    _exit(127);
}

void close_if_open(int &fd) {
    if (fd >= 0) {
        close(fd);
        fd = -1;
    }
}

// Appends what is there; false, and closed, when there will be no more.
bool take(int &fd, std::string &text) {
    std::array<char, 65536> buffer{};
    const ssize_t count = read(fd, buffer.data(), buffer.size());
    if (count <= 0) {  // a terminal ends with EIO
        close_if_open(fd);
        return false;
    }
    text.append(buffer.data(), static_cast<std::size_t>(count));
    return true;
}

}  // namespace

Process Process::on_pipes(const std::vector<std::string> &command, const Environment &environment) {
    std::array<int, 2> out{};
    std::array<int, 2> err{};
    if (pipe(out.data()) != 0 || pipe(err.data()) != 0) {
        throw std::runtime_error("no pipe");
    }
    const pid_t pid = fork();
    if (pid == 0) {
        dup2(out[1], STDOUT_FILENO);
        dup2(err[1], STDERR_FILENO);
        for (const int fd : {STDIN_FILENO, out[0], out[1], err[0], err[1]}) {
            close(fd);
        }
        become(command, environment);
    }
    close(out[1]);
    close(err[1]);
    return {pid, out[0], err[0]};
}

Process Process::on_terminal(const std::vector<std::string> &command,
                             const Environment &environment, WindowSize size) {
    const winsize window = {size.rows, size.columns, 0, 0};
    int terminal = -1;
    const pid_t pid = forkpty(&terminal, nullptr, nullptr, &window);
    if (pid == 0) {
        become(command, environment);
    }
    if (pid < 0) {
        throw std::runtime_error("no terminal");
    }
    return {pid, terminal, -1};
}

Process::~Process() {
    if (pid_ > 0) {
        kill(pid_, SIGKILL);
        waitpid(pid_, nullptr, 0);
    }
    stop_reading();
}

Process::Process(Process &&other) noexcept
    : pid_(std::exchange(other.pid_, -1)),
      out_(std::exchange(other.out_, -1)),
      err_(std::exchange(other.err_, -1)),
      finished_(std::move(other.finished_)) {}

bool Process::read_some() {
    std::array<pollfd, 2> ends = {{{out_, POLLIN, 0}, {err_, POLLIN, 0}}};
    if (poll(ends.data(), ends.size(), 100) > 0) {
        if (ends[0].revents != 0) {
            take(out_, finished_.out);
        }
        if (ends[1].revents != 0) {
            take(err_, finished_.err);
        }
    }
    return out_ >= 0 || err_ >= 0;
}

bool Process::read_until(const std::string &text) {
    const auto deadline = std::chrono::steady_clock::now() + kDeadline;
    while (finished_.out.find(text) == std::string::npos) {
        if (!read_some() || std::chrono::steady_clock::now() > deadline) {
            return false;
        }
    }
    return true;
}

void Process::send_signal(int signal) const {
    if (pid_ <= 0) {  // which kill takes for everybody
        throw std::logic_error("the program has ended already");
    }
    kill(pid_, signal);
}

void Process::type(const std::string &keys) const {
    if (write(out_, keys.data(), keys.size()) < 0) {
        throw std::runtime_error("the terminal is gone");
    }
}

void Process::stop_reading() {
    close_if_open(out_);
    close_if_open(err_);
}

Finished Process::wait() {
    const auto deadline = std::chrono::steady_clock::now() + kDeadline;
    int status = 0;
    bool ended = false;
    while (!ended) {
        const bool open = read_some();
        ended = !open && waitpid(pid_, &status, WNOHANG) == pid_;
        if (!ended && std::chrono::steady_clock::now() > deadline) {
            kill(pid_, SIGKILL);
            waitpid(pid_, &status, 0);
            throw std::runtime_error("the program did not end in time; its output:\n" +
                                     finished_.out + finished_.err);
        }
    }
    pid_ = -1;
    finished_.exit_code = WIFSIGNALED(status) ? 128 + WTERMSIG(status) : WEXITSTATUS(status);
    return finished_;
}

}  // namespace velkhost::testing

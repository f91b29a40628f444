#include "tests/integration/transfers/daemon.h"

#include "tests/integration/transfers/loopback.h"

#include <fcntl.h>
#include <grp.h>
#include <sys/prctl.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cerrno>
#include <chrono>
#include <csignal>
#include <cstdlib>
#include <fstream>
#include <functional>
#include <iterator>
#include <stdexcept>
#include <thread>

namespace velkhost::testing {
namespace {

constexpr id_t kNobody = 65534;

bool drop_root() {
    return geteuid() != 0 ||
           (setgroups(0, nullptr) == 0 && setresgid(kNobody, kNobody, kNobody) == 0 &&
            setresuid(kNobody, kNobody, kNobody) == 0);
}

[[noreturn]] void become(const std::vector<std::string> &command, const std::string &log,
                         const std::map<std::string, std::string> &environment) {
    setpgid(0, 0);
    const int out = open(log.c_str(), O_WRONLY | O_CREAT | O_APPEND, 0644);
    dup2(open("/dev/null", O_RDONLY), STDIN_FILENO);
    dup2(out, STDOUT_FILENO);
    dup2(out, STDERR_FILENO);
    if (!drop_root()) {
        _exit(126);
    }
    prctl(PR_SET_PDEATHSIG, SIGKILL);  // a change of users would undo it
    for (const auto &[name, value] : environment) {
        setenv(name.c_str(), value.c_str(), 1);
    }
    std::vector<char *> arguments;
    for (const std::string &argument : command) {
        arguments.push_back(const_cast<char *>(argument.c_str()));
    }
    arguments.push_back(nullptr);
    execv(arguments[0], arguments.data());
    _exit(127);
}

std::string text_of(const std::filesystem::path &file) {
    std::ifstream in(file);
    return {std::istreambuf_iterator<char>(in), {}};
}

void wait_for(const std::function<bool()> &is_there, const std::filesystem::path &log) {
    using namespace std::chrono_literals;
    const auto deadline = std::chrono::steady_clock::now() + 20s;
    while (!is_there()) {
        if (std::chrono::steady_clock::now() > deadline) {
            throw std::runtime_error("the server did not begin to listen; its output:\n" +
                                     text_of(log));
        }
        std::this_thread::sleep_for(5ms);
    }
}

std::uint16_t free_port(int type) {
    const Socket socket = bound_socket(type, 0);
    return port_of(socket);
}

}  // namespace

Daemon::Daemon(const std::vector<std::string> &command, const std::filesystem::path &log,
               const std::map<std::string, std::string> &environment) {
    if (command.at(0).empty() || access(command[0].c_str(), X_OK) != 0) {
        throw std::runtime_error("the server \"" + command[0] +
                                 "\" is not there; scripts/servers.sh gets it");
    }
    process_ = fork();
    if (process_ == 0) {
        become(command, log.string(), environment);
    }
    setpgid(process_, process_);  // whichever of the two comes first
}

Daemon::~Daemon() {
    kill();
}

void Daemon::kill() {
    if (process_ > 0) {
        ::kill(-process_, SIGKILL);
        waitpid(process_, nullptr, 0);
        process_ = -1;
    }
}

uid_t Daemon::user() {
    return geteuid() == 0 ? kNobody : geteuid();
}

gid_t Daemon::group() {
    return geteuid() == 0 ? kNobody : getegid();
}

std::uint16_t free_tcp_port() {
    return free_port(SOCK_STREAM);
}

std::uint16_t free_udp_port() {
    return free_port(SOCK_DGRAM);
}

void wait_for_tcp(std::uint16_t port, const std::filesystem::path &log) {
    wait_for([port] { return connected_socket(SOCK_STREAM, port).fd() >= 0; }, log);
}

void wait_for_udp(std::uint16_t port, const std::filesystem::path &log) {
    wait_for([port] { return bound_socket(SOCK_DGRAM, port).fd() < 0; }, log);
}

}  // namespace velkhost::testing

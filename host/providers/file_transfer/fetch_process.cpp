#include "host/providers/file_transfer/fetch_process.h"

#include <algorithm>
#include <cerrno>
#include <charconv>
#include <csignal>
#include <cstring>
#include <string_view>
#include <utility>

#include <dlfcn.h>
#include <poll.h>
#include <spawn.h>
#include <sys/socket.h>
#include <sys/wait.h>
#include <unistd.h>

namespace velkhost::providers {
namespace {

// Beyond its own limits the fetcher has this long before it counts as stuck.
constexpr std::uint32_t kGraceSeconds = 30;

// How a spawned process begins: the socket as its input and output, no blocked signals.
class SpawnPlan {
  public:
    explicit SpawnPlan(int socket) {
        posix_spawn_file_actions_init(&actions_);
        posix_spawn_file_actions_adddup2(&actions_, socket, STDIN_FILENO);
        posix_spawn_file_actions_adddup2(&actions_, socket, STDOUT_FILENO);
        posix_spawnattr_init(&attributes_);
        sigset_t none;
        sigemptyset(&none);
        posix_spawnattr_setsigmask(&attributes_, &none);
        sigset_t usual = none;
        sigaddset(&usual, SIGPIPE);
        posix_spawnattr_setsigdefault(&attributes_, &usual);
        posix_spawnattr_setflags(&attributes_, POSIX_SPAWN_SETSIGMASK | POSIX_SPAWN_SETSIGDEF);
    }
    ~SpawnPlan() {
        posix_spawn_file_actions_destroy(&actions_);
        posix_spawnattr_destroy(&attributes_);
    }
    SpawnPlan(const SpawnPlan &) = delete;
    SpawnPlan &operator=(const SpawnPlan &) = delete;

    [[nodiscard]] int spawn(pid_t &process, const std::string &program,
                            std::vector<char *> environment) const {
        std::string name = program;
        std::array<char *, 2> arguments{name.data(), nullptr};
        environment.push_back(nullptr);
        return posix_spawn(&process, program.c_str(), &actions_, &attributes_, arguments.data(),
                           environment.data());
    }

  private:
    posix_spawn_file_actions_t actions_{};
    posix_spawnattr_t attributes_{};
};

// This process's own, without what would put another clock under the fetcher.
std::vector<char *> machine_environment() {
    std::vector<char *> out;
    for (char **entry = environ; entry != nullptr && *entry != nullptr; ++entry) {
        const std::string_view text(*entry);
        if (!text.starts_with("LD_PRELOAD=") && !text.starts_with("VELKSHIM_")) {
            out.push_back(*entry);
        }
    }
    return out;
}

// Whether the process ended, and was waited for, as soon as nobody listened to it any more. One
// that waits for its server does not notice.
bool ends_by_itself(pid_t process) {
    constexpr int kLooks = 20;
    constexpr int kMillisBetween = 5;
    for (int i = 0; i < kLooks; ++i) {
        if (::waitpid(process, nullptr, WNOHANG) == process) {
            return true;
        }
        ::poll(nullptr, 0, kMillisBetween);
    }
    return false;
}

FetchOutcome failure(const std::string &text) {
    return {FetchResult::kFailed, text};
}

std::optional<Piece> outcome_in(std::string_view content) {
    if (content.empty()) {
        return std::nullopt;
    }
    const auto result = static_cast<FetchResult>(content.front());
    return FetchOutcome{result, std::string(content.substr(1))};
}

std::optional<Piece> size_in(std::string_view content) {
    AnnouncedSize size;
    const char *const end = content.data() + content.size();
    const auto [rest, error] = std::from_chars(content.data(), end, size.bytes);
    return error == std::errc() && rest == end ? std::optional<Piece>(size) : std::nullopt;
}

}  // namespace

FetchProcess::FetchProcess(const std::filesystem::path &program, const FetchRequest &request)
    : silent_seconds_(request.connect_seconds + request.stall_seconds + kGraceSeconds) {
    std::array<int, 2> ends{};
    if (::socketpair(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0, ends.data()) != 0) {
        start_failed_ = errno;
        return;
    }
    socket_ = ends[0];
    start(program, ends[1]);
    ::close(ends[1]);
    if (!start_failed_) {
        send(encode(request));
    }
    ::shutdown(socket_, SHUT_WR);
}

FetchProcess::~FetchProcess() {
    finish();
}

void FetchProcess::start(const std::filesystem::path &program, int socket) {
    const SpawnPlan plan(socket);
    const int error = plan.spawn(process_, program.string(), machine_environment());
    if (error != 0) {
        process_ = -1;
        start_failed_ = error;
    }
}

// A fetcher that does not take it has ended, which the next read finds out.
void FetchProcess::send(const std::string &text) const {
    std::string_view rest = text;
    while (!rest.empty()) {
        const ssize_t sent = ::send(socket_, rest.data(), rest.size(), MSG_NOSIGNAL);
        if (sent < 0 && errno != EINTR) {
            return;
        }
        rest.remove_prefix(sent < 0 ? 0 : static_cast<std::size_t>(sent));
    }
}

Piece FetchProcess::next(const std::stop_token &stop) {
    if (start_failed_) {
        return failure(std::string("The fetcher cannot be started: ") +
                       std::strerror(*start_failed_));
    }
    Read how = Read::kEnded;
    if (auto piece = read_frame(how, stop)) {
        return *std::move(piece);
    }
    finish();
    switch (how) {
        case Read::kStopped:
            return failure("The transfer was ended");
        case Read::kSilent:
            return FetchOutcome{FetchResult::kTimedOut, "The fetcher does not answer"};
        default:
            return failure("The fetcher ended before the file did");
    }
}

std::optional<Piece> FetchProcess::read_frame(Read &how, const std::stop_token &stop) {
    std::array<char, kFrameHeader> header{};
    how = read(header.data(), header.size(), stop);
    const std::size_t length = frame_length(header);
    if (how != Read::kDone || length > kLongestFrame) {
        return std::nullopt;
    }
    content_.resize(length);
    how = read(content_.data(), length, stop);
    return how == Read::kDone ? piece_of(header[0]) : std::nullopt;
}

std::optional<Piece> FetchProcess::piece_of(char kind) const {
    const std::string_view content(content_.data(), content_.size());
    switch (static_cast<FrameKind>(kind)) {
        case FrameKind::kSize:
            return size_in(content);
        case FrameKind::kData:
            return FileBytes(content_);
        case FrameKind::kEnd:
            return outcome_in(content);
    }
    return std::nullopt;
}

FetchProcess::Read FetchProcess::read(char *into, std::size_t length,
                                      const std::stop_token &stop) const {
    while (length > 0) {
        if (const Read how = wait_for_bytes(stop); how != Read::kDone) {
            return how;
        }
        const ssize_t got = ::read(socket_, into, length);
        if (got == 0 || (got < 0 && errno != EINTR)) {
            return Read::kEnded;
        }
        const std::size_t count = got < 0 ? 0 : static_cast<std::size_t>(got);
        into += count;
        length -= count;
    }
    return Read::kDone;
}

// The silence is counted in waits, which last as long as they say on the machine's clock.
FetchProcess::Read FetchProcess::wait_for_bytes(const std::stop_token &stop) const {
    constexpr int kWaitMillis = 100;
    constexpr std::uint32_t kWaitsPerSecond = 10;
    for (std::uint32_t waits = 0; waits < silent_seconds_ * kWaitsPerSecond; ++waits) {
        if (stop.stop_requested()) {
            return Read::kStopped;
        }
        pollfd end{socket_, POLLIN, 0};
        if (::poll(&end, 1, kWaitMillis) > 0) {
            return Read::kDone;
        }
    }
    return Read::kSilent;
}

void FetchProcess::finish() {
    if (socket_ >= 0) {
        ::close(std::exchange(socket_, -1));
    }
    if (process_ > 0 && !ends_by_itself(process_)) {
        ::kill(process_, SIGKILL);
        while (::waitpid(process_, nullptr, 0) < 0 && errno == EINTR) {
        }
    }
    process_ = -1;
}

std::filesystem::path fetcher_beside_this_library() {
    // Brokers find libraries through links, which may be gone when another broker of the process
    // asks again.
    static const std::filesystem::path known = [] {
        Dl_info about{};
        std::error_code error;
        const auto *here = reinterpret_cast<const void *>(&fetcher_beside_this_library);
        const bool found = ::dladdr(here, &about) != 0;
        return std::filesystem::canonical(found ? about.dli_fname : "", error).parent_path() /
               "velkfetch";
    }();
    return known;
}

}  // namespace velkhost::providers

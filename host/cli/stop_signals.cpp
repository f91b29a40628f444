#include "host/cli/stop_signals.h"

#include <pthread.h>

#include <array>
#include <atomic>

namespace velkhost::cli {
namespace {

constexpr std::array kSignals = {SIGINT, SIGTERM, SIGHUP};

std::atomic<int> signal_count{0};
std::atomic<int> first_signal{0};
static_assert(std::atomic<int>::is_always_lock_free);  // a handler writes them

void note(int signal) {
    int none = 0;
    first_signal.compare_exchange_strong(none, signal);
    ++signal_count;
}

void handle_with(void (*handler)(int)) {
    struct sigaction action {};
    action.sa_handler = handler;
    for (const int signal : kSignals) {
        sigaction(signal, &action, nullptr);
    }
}

}  // namespace

StopSignals::StopSignals() {
    signal_count = 0;
    first_signal = 0;
    sigemptyset(&signals_);
    for (const int signal : kSignals) {
        sigaddset(&signals_, signal);
    }
    pthread_sigmask(SIG_BLOCK, &signals_, &mask_before_);
    handle_with(&note);
}

StopSignals::~StopSignals() {
    handle_with(SIG_DFL);
    pthread_sigmask(SIG_SETMASK, &mask_before_, nullptr);
}

void StopSignals::unblock() const {
    pthread_sigmask(SIG_UNBLOCK, &signals_, nullptr);
}

int StopSignals::count() {
    return signal_count;
}

int StopSignals::first() {
    return first_signal;
}

}  // namespace velkhost::cli

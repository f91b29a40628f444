#include "host/cli/interrupt.h"

#include "host/cli/locks.h"
#include "host/shim/velkshim.h"

#include <pthread.h>
#include <unistd.h>

#include <csignal>
#include <utility>

namespace velkhost::cli {
namespace {

// Tells the signal thread to look whether it shall stop.
constexpr int kStopSignal = SIGUSR2;

sigset_t taken_signals() {
    sigset_t signals;
    sigemptyset(&signals);
    for (const int signal : {SIGINT, SIGTERM, SIGHUP, kStopSignal}) {
        sigaddset(&signals, signal);
    }
    return signals;
}

}  // namespace

Interrupt::Interrupt() {
    const sigset_t signals = taken_signals();
    pthread_sigmask(SIG_BLOCK, &signals, nullptr);
    thread_ = std::thread([this] { serve(); });
}

Interrupt::~Interrupt() {
    {
        const std::lock_guard lock(mutex_);
        stopping_ = true;
    }
    pthread_kill(thread_.native_handle(), kStopSignal);
    thread_.join();
}

void Interrupt::add(std::function<void()> undo) {
    const std::lock_guard lock(mutex_);
    undos_.push_back(std::move(undo));
}

void Interrupt::drop() {
    const std::lock_guard lock(mutex_);
    undos_.pop_back();
}

std::unique_lock<std::recursive_mutex> Interrupt::hold() {
    return std::unique_lock(mutex_);
}

void Interrupt::serve() {
    const sigset_t signals = taken_signals();
    while (true) {
        int signal = 0;
        sigwait(&signals, &signal);
        if (signal != kStopSignal) {
            end_process(signal);
        }
        const std::lock_guard lock(mutex_);
        if (stopping_) {
            return;
        }
    }
}

void Interrupt::end_process(int signal) {
    take_for_good(mutex_);
    velkshim_thread_enter();  // a virtual clock stands still from here on
    while (!undos_.empty()) {
        undos_.back()();
        undos_.pop_back();
    }
    _exit(128 + signal);
}

}  // namespace velkhost::cli

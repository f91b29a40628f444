// Signals that end the command: Ctrl-C and its like leave nothing behind.
#pragma once

#include <functional>
#include <mutex>
#include <thread>
#include <vector>

namespace velkhost::cli {

// From its making on, SIGINT, SIGTERM and SIGHUP are taken by a thread of its own, which undoes
// what was registered, newest first, and ends the process with 128 + the signal's number, without
// unwinding or waiting for any thread. Threads that the caller makes meanwhile must come after it.
class Interrupt {
  public:
    Interrupt();
    ~Interrupt();
    Interrupt(const Interrupt &) = delete;
    Interrupt &operator=(const Interrupt &) = delete;

    // `undo` runs on the signal thread while all others may still be at work.
    void add(std::function<void()> undo);

    // Takes the newest entry back.
    void drop();

    // While the lock lives, no signal is acted on: for a step and its registration in one.
    [[nodiscard]] std::unique_lock<std::recursive_mutex> hold();

  private:
    void serve();
    [[noreturn]] void end_process(int signal);

    std::recursive_mutex mutex_;
    std::vector<std::function<void()>> undos_;
    bool stopping_ = false;
    std::thread thread_;
};

}  // namespace velkhost::cli

// A program as a child process: its output through pipes or a terminal, its input from a terminal,
// and a deadline on everything, so that no test hangs.
#pragma once

#include <sys/types.h>

#include <map>
#include <string>
#include <vector>

namespace velkhost::testing {

struct Finished {
    int exit_code = -1;  // 128 + the signal's number where one ended the process
    std::string out;     // of a terminal: everything
    std::string err;
};

struct WindowSize {
    unsigned short columns = 100;
    unsigned short rows = 40;
};

class Process {
  public:
    using Environment = std::map<std::string, std::string>;  // empty values: not set

    // The program with its output on two pipes and no input. `environment` is what differs from
    // this process's own.
    static Process on_pipes(const std::vector<std::string> &command,
                            const Environment &environment);

    // The program on a terminal of its own.
    static Process on_terminal(const std::vector<std::string> &command,
                               const Environment &environment, WindowSize size = {});

    // Ends the program if it still runs.
    ~Process();
    Process(Process &&other) noexcept;
    Process &operator=(Process &&) = delete;
    Process(const Process &) = delete;
    Process &operator=(const Process &) = delete;

    // Reads until the output has `text`; false when the program closed it or time was up before.
    bool read_until(const std::string &text);

    // What came on stdout so far.
    [[nodiscard]] const std::string &out() const { return finished_.out; }

    void send_signal(int signal) const;

    // Types on the terminal.
    void type(const std::string &keys) const;

    // Closes this side of the program's output.
    void stop_reading();

    // Reads the rest and waits for the end.
    Finished wait();

  private:
    Process(pid_t pid, int out, int err) : pid_(pid), out_(out), err_(err) {}

    bool read_some();

    pid_t pid_;
    int out_;
    int err_;
    Finished finished_;
};

}  // namespace velkhost::testing

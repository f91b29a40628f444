// The open, write and close calls of the library, in the order in which it makes them.
#pragma once

#include <string>
#include <vector>

namespace velktest {

// Records the calling thread's calls as long as it lives; one at a time.
class FileCalls {
  public:
    FileCalls();
    ~FileCalls();
    FileCalls(const FileCalls &) = delete;
    FileCalls &operator=(const FileCalls &) = delete;

    // "open /tmp/velkdebug.txt", "write [ 8: 5: 3] ", "close".
    [[nodiscard]] const std::vector<std::string> &taken() const { return taken_; }

    void note(std::string call) { taken_.push_back(std::move(call)); }

  private:
    std::vector<std::string> taken_;
};

}  // namespace velktest

// What the shim remembers of open descriptors: which fixed path each one stands for, so that a
// close can be told to the file observer and can be made to fail.
#pragma once

#include <memory>

#include "host/shim/root.h"

namespace velkhost::shim {

struct OpenFile;

// After an open call: remembers `descriptor` where it stands for a fixed path and was opened for
// writing or as a folder, and forgets what an earlier one of that number stood for. A negative
// number is let pass.
enum class OpenedFor { kReading, kWriting, kListing };
void remember_open(int descriptor, const Rerooted &target, OpenedFor purpose);

OpenedFor purpose_of(int open_flags);
OpenedFor purpose_of(const char *stdio_mode);

// Around the closing of `descriptor`. Takes the record before the number is free for others, and
// tells the observer when it goes out of scope. Leaves errno alone.
class Closing {
  public:
    explicit Closing(int descriptor);
    ~Closing();
    Closing(const Closing &) = delete;
    Closing &operator=(const Closing &) = delete;

    // The errno with which the call shall fail after all is closed, or 0.
    [[nodiscard]] int fault(std::string_view verb) const;

  private:
    OpenFile *file_;
};

}  // namespace velkhost::shim

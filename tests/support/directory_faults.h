// What goes wrong with a folder while the library walks it, for once.
#pragma once

#include <functional>
#include <string>

namespace velktest {

// In force on the calling thread as long as it lives; one at a time.
class DirectoryFaults {
  public:
    DirectoryFaults();
    ~DirectoryFaults();
    DirectoryFaults(const DirectoryFaults &) = delete;
    DirectoryFaults &operator=(const DirectoryFaults &) = delete;

    // The next folder is closed, but the call says that it was not.
    bool next_close_fails = false;

    // Called with the name of every entry before the library learns of it.
    std::function<void(const std::string &name)> on_entry;
};

}  // namespace velktest

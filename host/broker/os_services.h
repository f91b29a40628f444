// Threads, mutexes and conditions for providers.
#pragma once

#include <filesystem>
#include <vector>

namespace velkhost::broker {

// Where resolveFileName looks, as long as this object lives. The slot knows no broker, so it looks
// in the folders of all brokers of the process.
class LibraryFolders {
  public:
    explicit LibraryFolders(const std::vector<std::filesystem::path> &folders);
    ~LibraryFolders();
    LibraryFolders(const LibraryFolders &) = delete;
    LibraryFolders &operator=(const LibraryFolders &) = delete;

  private:
    const std::vector<std::filesystem::path> &folders_;
};

}  // namespace velkhost::broker

// The folder into which files are transferred, and a file of it while it grows.
#pragma once

#include <cstdint>
#include <optional>
#include <span>
#include <string>

namespace velkhost::providers {

// A file under construction, which is removed with its object unless it is kept. Not safe to share
// between threads.
class StoredFile {
  public:
    StoredFile(StoredFile &&other) noexcept;
    StoredFile &operator=(StoredFile &&) = delete;
    StoredFile(const StoredFile &) = delete;
    StoredFile &operator=(const StoredFile &) = delete;
    ~StoredFile();

    [[nodiscard]] const std::string &path() const { return path_; }
    [[nodiscard]] std::string uri() const { return "file://" + path_; }

    // How many more bytes the store can take.
    [[nodiscard]] std::uint64_t room() const;

    // Appends all of it; 0, or the errno value that says why not: ENOSPC beyond the room.
    int append(std::span<const char> bytes);

    // From here on there is no room.
    void fill_up() { filled_up_ = true; }

    // Ends the file, which stays from here on; 0 or an errno value.
    int keep();

  private:
    friend class FileStore;
    StoredFile(std::string folder, std::string path, int fd, std::optional<std::uint64_t> capacity);

    std::string folder_;
    std::string path_;
    int fd_;
    std::optional<std::uint64_t> capacity_;
    bool filled_up_ = false;
    bool kept_ = false;
};

class FileStore {
  public:
    // `folder` is absolute; it is made when the first file is. `capacity`: the bytes that its files
    // may have in all; no value: what the disk can take.
    FileStore(std::string folder, std::optional<std::uint64_t> capacity);

    // An empty file of that name or, when there is one, of that name with a number before it.
    // Throws std::system_error.
    [[nodiscard]] StoredFile create(const std::string &name) const;

  private:
    std::string folder_;
    std::optional<std::uint64_t> capacity_;
};

}  // namespace velkhost::providers

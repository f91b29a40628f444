// Files of a test.
#pragma once

#include <filesystem>
#include <string>
#include <string_view>

namespace velktest {

// A folder of its own, which any user may write to; it goes with this object.
class TempFolder {
  public:
    TempFolder();
    ~TempFolder();
    TempFolder(const TempFolder &) = delete;
    TempFolder &operator=(const TempFolder &) = delete;

    [[nodiscard]] const std::filesystem::path &path() const { return path_; }

  private:
    std::filesystem::path path_;
};

// The contents of a file; empty when it cannot be read.
std::string read_file(const std::filesystem::path &file);

// Rewrites the file whole and makes the folders that lead to it.
void write_file(const std::filesystem::path &file, std::string_view text);

// How many descriptors the process has open.
std::size_t open_descriptors();

// Gives up the rights of the superuser, if the process has them, as long as this object lives.
class Unprivileged {
  public:
    Unprivileged();
    ~Unprivileged();
    Unprivileged(const Unprivileged &) = delete;
    Unprivileged &operator=(const Unprivileged &) = delete;
};

}  // namespace velktest

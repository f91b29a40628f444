// The folder of one run: the root under which the host's fixed paths lie.
#pragma once

#include <filesystem>
#include <functional>
#include <string>

namespace velkhost::rig {

class RunFolder {
  public:
    // A fresh folder in TMPDIR, or /tmp where that is not set. Throws RigError.
    static RunFolder make_temporary();

    // `path` and what is missing of it. What is there already stays. Throws RigError.
    static RunFolder at(const std::filesystem::path &path);

    // A temporary folder goes with its object unless it is kept.
    ~RunFolder();
    RunFolder(RunFolder &&other) noexcept;
    RunFolder &operator=(RunFolder &&) = delete;
    RunFolder(const RunFolder &) = delete;
    RunFolder &operator=(const RunFolder &) = delete;

    [[nodiscard]] const std::filesystem::path &path() const { return path_; }  // absolute
    [[nodiscard]] bool is_temporary() const { return temporary_; }
    void keep() { kept_ = true; }

    // Where a fixed path lies: "/tmp/sfcb" -> PATH/tmp/sfcb.
    [[nodiscard]] std::filesystem::path inside(const std::string &fixed_path) const;

    // The folders and files that a host has before the first request. Throws RigError.
    void furnish(const std::filesystem::path &libraries, const std::string &scenario_text) const;

  private:
    RunFolder(std::filesystem::path path, bool temporary)
        : path_(std::move(path)), temporary_(temporary) {}

    std::filesystem::path path_;
    bool temporary_;
    bool kept_ = false;
};

// Removes a folder with all that is in it, even while others still write there. Never throws;
// whether it is gone.
bool remove_folder(const std::filesystem::path &path) noexcept;

}  // namespace velkhost::rig

// The run folder, and what becomes of one path under it.
#pragma once

#include <array>
#include <climits>
#include <string_view>

namespace velkhost::shim {

// A path as a libc call received it. Where it is one of the host's fixed paths, or lies under one,
// and a root is set, it stands for that place under the root; else for itself.
class Rerooted {
  public:
    explicit Rerooted(const char *path);

    // What to hand on to libc.
    [[nodiscard]] const char *path() const { return path_; }

    // The fixed path in order, empty for every other path. Valid as long as this object.
    [[nodiscard]] std::string_view fixed() const { return fixed_; }

    // The errno with which a call shall fail instead of reaching libc: the path is too long under
    // the root, or a fault was set for "verb:fixed path". 0: go on.
    [[nodiscard]] int refusal(std::string_view verb) const;

  private:
    void reroot(std::string_view given, std::string_view root);

    const char *path_;
    std::string_view fixed_;
    bool too_long_ = false;
    std::array<char, 2 * PATH_MAX> room_;  // left as it is unless re-rooted: a call costs no memset
};

}  // namespace velkhost::shim

#include "host/shim/fixed_paths.h"

#include <algorithm>
#include <array>

namespace velkhost::shim {
namespace {

constexpr std::array<std::string_view, 9> kFixedPaths = {
    "/tmp/velkdebug.txt", "/tmp/sfcb",     "/tmp/networkflag", "/var/tmp/filestore", "/var/tmp/ZEB",
    "/etc/cim",           "/etc/velkhost", "/usr/lib/cim",     "/dev/ipmi0",
};

// The text under construction: components are pushed and popped at its end.
class Stack {
  public:
    explicit Stack(std::span<char> room) : room_(room) {}

    [[nodiscard]] bool push(std::string_view component) {
        if (room_.size() - length_ < component.size() + 1) {
            return false;
        }
        room_[length_++] = '/';
        std::ranges::copy(component, room_.subspan(length_).begin());
        length_ += component.size();
        return true;
    }

    void pop() {
        const std::size_t cut = std::string_view(room_.data(), length_).rfind('/');
        length_ = cut == std::string_view::npos ? 0 : cut;
    }

    [[nodiscard]] std::size_t length() const { return length_; }

  private:
    std::span<char> room_;
    std::size_t length_ = 0;
};

bool lies_at_or_under(std::string_view path, std::string_view fixed) {
    return path.starts_with(fixed) && (path.size() == fixed.size() || path[fixed.size()] == '/');
}

}  // namespace

std::optional<OrderedPath> put_in_order(std::string_view path, std::span<char> out) {
    if (!path.starts_with('/')) {
        return std::nullopt;
    }
    Stack stack(out);
    bool names_a_folder = false;
    while (!path.empty()) {
        path.remove_prefix(1);  // the '/' in front of the component
        const std::string_view component = path.substr(0, path.find('/'));
        path.remove_prefix(component.size());
        names_a_folder = component.empty() || component == "." || component == "..";
        if (component == "..") {
            stack.pop();
        } else if (!names_a_folder && !stack.push(component)) {
            return std::nullopt;
        }
    }
    return OrderedPath{stack.length(), names_a_folder};
}

bool is_fixed_path(std::string_view ordered) {
    return std::ranges::any_of(kFixedPaths, [ordered](std::string_view fixed) {
        return lies_at_or_under(ordered, fixed);
    });
}

}  // namespace velkhost::shim

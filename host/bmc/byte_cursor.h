// Reading bytes from front to back; what is not there is never read.
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>

namespace velkhost::bmc {

class ByteCursor {
  public:
    explicit ByteCursor(std::span<const std::uint8_t> bytes) : rest_(bytes) {}

    [[nodiscard]] std::size_t left() const { return rest_.size(); }
    [[nodiscard]] bool at_end() const { return rest_.empty(); }

    std::optional<std::uint8_t> byte() {
        const auto one = take(1);
        return one ? std::optional(one->front()) : std::nullopt;
    }

    // The next `count` bytes, or no value, and nothing is read, when there are fewer.
    std::optional<std::span<const std::uint8_t>> take(std::size_t count) {
        if (rest_.size() < count) {
            return std::nullopt;
        }
        const auto taken = rest_.first(count);
        rest_ = rest_.subspan(count);
        return taken;
    }

  private:
    std::span<const std::uint8_t> rest_;
};

}  // namespace velkhost::bmc

// A position that moves over a source, byte by byte, and knows its line and column.
#pragma once

#include "host/mof/diagnostics.h"
#include "host/mof/utf8.h"

#include <string_view>

namespace velkhost::mof {

// Sees the source through a view; the source must outlive it.
class Cursor {
  public:
    Cursor(std::string_view source, std::string_view file) : source_(source), position_{file} {}

    [[nodiscard]] bool at_end() const { return offset_ >= source_.size(); }

    // The byte `ahead` bytes further on, or NUL beyond the end.
    [[nodiscard]] char peek(std::size_t ahead = 0) const {
        return ahead < source_.size() - offset_ ? source_[offset_ + ahead] : '\0';
    }

    [[nodiscard]] bool starts_with(std::string_view text) const {
        return source_.substr(offset_).starts_with(text);
    }

    // Moves by up to `count` bytes.
    void advance(std::size_t count = 1) {
        for (; count > 0 && !at_end(); --count) {
            step();
        }
    }

    [[nodiscard]] const Position &position() const { return position_; }
    [[nodiscard]] std::size_t offset() const { return offset_; }

    // What was passed since the cursor stood at `begin`.
    [[nodiscard]] std::string_view text_since(std::size_t begin) const {
        return source_.substr(begin, offset_ - begin);
    }

  private:
    void step() {
        const char passed = source_[offset_++];
        if (passed == '\n') {
            ++position_.line;
            position_.column = 1;
        } else if (at_end() || !is_utf8_continuation(source_[offset_])) {
            ++position_.column;
        }
    }

    std::string_view source_;
    std::size_t offset_ = 0;
    Position position_;
};

}  // namespace velkhost::mof

// Text in fixed buffers. `put` is the only function that writes text into one; the others are its
// common uses. What does not fit is cut, and a buffer always ends in a terminator.
#pragma once

#include <cstdarg>
#include <cstddef>
#include <cstdio>
#include <cstring>
#include <span>
#include <string_view>

namespace velk {

// Writes `text` into `buffer` from `offset` on and terminates it. Returns the length of the text
// that the buffer then holds. Writes nothing when not even the terminator fits.
inline std::size_t put(std::span<char> buffer, std::size_t offset, std::string_view text) {
    if (offset >= buffer.size()) {
        return offset;
    }
    const std::string_view fitting = text.substr(0, buffer.size() - 1 - offset);
    if (!fitting.empty()) {  // an empty text may have no address
        std::memmove(buffer.data() + offset, fitting.data(), fitting.size());
    }
    buffer[offset + fitting.size()] = '\0';
    return offset + fitting.size();
}

// The text in `buffer`: up to its terminator, or the whole buffer where it has none.
inline std::string_view view(std::span<const char> buffer) {
    return {buffer.data(), strnlen(buffer.data(), buffer.size())};
}

// The text behind a pointer that may be null.
inline std::string_view view(const char *text) {
    return text == nullptr ? std::string_view{} : std::string_view{text};
}

inline std::size_t copy(std::span<char> buffer, std::string_view text) {
    return put(buffer, 0, text);
}

inline std::size_t append(std::span<char> buffer, std::string_view text) {
    return put(buffer, view(buffer).size(), text);
}

// Copies without a terminator, so that a longer former text keeps its tail. The last byte of the
// buffer is never written and stays the terminator that it was at load.
inline void overlay(std::span<char> buffer, std::string_view text) {
    const std::string_view fitting = text.substr(0, buffer.size() - 1);
    if (!fitting.empty()) {
        std::memcpy(buffer.data(), fitting.data(), fitting.size());
    }
}

// Formats at `offset` as snprintf does; returns the length of the text that the buffer then holds.
[[gnu::format(printf, 3, 4)]] inline std::size_t print(std::span<char> buffer, std::size_t offset,
                                                       const char *format, ...) {
    if (offset >= buffer.size()) {
        return offset;
    }
    // NOLINTBEGIN(cppcoreguidelines-init-variables,clang-analyzer-valist.*): va_start sets it
    std::va_list arguments;
    va_start(arguments, format);
    std::vsnprintf(buffer.data() + offset, buffer.size() - offset, format, arguments);
    va_end(arguments);
    // NOLINTEND(cppcoreguidelines-init-variables,clang-analyzer-valist.*)
    return offset + view(buffer.subspan(offset)).size();
}

// For buffers that start empty each time: the finished text can be used in place.
template <std::size_t Size>
class Text {
  public:
    Text() = default;
    explicit Text(std::string_view text) { copy(buffer_, text); }

    Text &add(std::string_view text) {
        append(buffer_, text);
        return *this;
    }
    [[nodiscard]] const char *c_str() const { return buffer_; }
    [[nodiscard]] std::span<char> buffer() { return buffer_; }

  private:
    char buffer_[Size] = {};
};

}  // namespace velk

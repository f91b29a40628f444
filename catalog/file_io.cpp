#include "velk/file_io.h"

#include <algorithm>
#include <cerrno>
#include <cstring>

#include "velk/bounded_text.h"

namespace velk {

bool LineReader::next(std::span<char> line) {
    std::size_t length = 0;
    while (length + 1 < line.size() && (begin_ < end_ || fill())) {
        const std::size_t room = std::min(end_ - begin_, line.size() - 1 - length);
        const auto *start = block_ + begin_;
        const auto *line_end = static_cast<const char *>(std::memchr(start, '\n', room));
        const std::size_t taken =
            line_end == nullptr ? room : static_cast<std::size_t>(line_end - start) + 1;
        length = put(line, length, {start, taken});
        begin_ += taken;
        if (line_end != nullptr) {
            break;
        }
    }
    return length > 0;
}

// Takes the next block of the file; false at its end or on an error.
bool LineReader::fill() {
    if (!is_open()) {
        return false;
    }
    ssize_t count = 0;
    do {
        count = ::read(file_.get(), block_, sizeof block_);
    } while (count < 0 && errno == EINTR);
    begin_ = 0;
    end_ = count > 0 ? static_cast<std::size_t>(count) : 0;
    return end_ > 0;
}

}  // namespace velk

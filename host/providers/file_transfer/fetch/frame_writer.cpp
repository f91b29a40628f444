#include "host/providers/file_transfer/fetch/frame_writer.h"

#include <algorithm>
#include <cerrno>
#include <string>

#include <unistd.h>

namespace velkhost::fetch {

using providers::FrameKind;
using providers::kLongestFrame;

bool FrameWriter::size(std::uint64_t bytes) {
    return frame(FrameKind::kSize, std::to_string(bytes));
}

bool FrameWriter::data(std::span<const char> bytes) {
    while (!bytes.empty()) {
        const std::size_t taken = std::min(bytes.size(), kLongestFrame - kept_.size());
        kept_.insert(kept_.end(), bytes.begin(),
                     bytes.begin() + static_cast<std::ptrdiff_t>(taken));
        bytes = bytes.subspan(taken);
        if (kept_.size() == kLongestFrame && !flush()) {
            return false;
        }
    }
    return true;
}

bool FrameWriter::end(const providers::FetchOutcome &outcome) {
    if (!kept_.empty() && !flush()) {
        return false;
    }
    return frame(FrameKind::kEnd, static_cast<char>(outcome.result) + outcome.text);
}

bool FrameWriter::flush() {
    const bool sent = frame(FrameKind::kData, {kept_.data(), kept_.size()});
    kept_.clear();
    return sent;
}

bool FrameWriter::frame(FrameKind kind, std::string_view content) {
    content = content.substr(0, kLongestFrame);
    const auto header = providers::frame_header(kind, content.size());
    return write_all({header.data(), header.size()}) && write_all(content);
}

bool FrameWriter::write_all(std::string_view bytes) const {
    while (!bytes.empty()) {
        const ssize_t written = ::write(fd_, bytes.data(), bytes.size());
        if (written < 0 && errno != EINTR) {
            return false;
        }
        bytes.remove_prefix(written < 0 ? 0 : static_cast<std::size_t>(written));
    }
    return true;
}

}  // namespace velkhost::fetch

#include "host/mof/diagnostics.h"

#include "host/mof/utf8.h"

#include <utility>

namespace velkhost::mof {
namespace {

std::string located(std::string_view file, std::uint32_t line, std::uint32_t column) {
    return std::string{file} + ":" + std::to_string(line) + ":" + std::to_string(column);
}

void append_visible(std::string &out, char byte) {
    constexpr std::string_view kDigits = "0123456789ABCDEF";
    const auto code = static_cast<unsigned char>(byte);
    if (code >= 0x20 && code != 0x7F) {
        out += byte;
        return;
    }
    out += "\\x";
    out += kDigits[code >> 4U];
    out += kDigits[code & 0xFU];
}

}  // namespace

std::string to_string(const Position &position) {
    return located(position.file, position.line, position.column);
}

std::string Diagnostic::to_string() const {
    return located(file, line, column) + ": " + text;
}

void ErrorList::add(const Position &position, std::string text) {
    if (closed_) {
        return;
    }
    errors_.push_back(
        {std::string{position.file}, position.line, position.column, std::move(text)});
    if (errors_.size() < kMaxErrors) {
        return;
    }
    errors_.back().text += " (too many errors, the rest is not read)";
    close();
}

std::string shown(std::string_view text, std::size_t max_bytes) {
    std::size_t end = text.size();
    if (end > max_bytes) {
        end = max_bytes;
        while (end > 0 && is_utf8_continuation(text[end])) {
            --end;
        }
    }
    std::string out = "'";
    for (const char byte : text.substr(0, end)) {
        append_visible(out, byte);
    }
    out += end < text.size() ? "...'" : "'";
    return out;
}

}  // namespace velkhost::mof

#include "host/mof/source.h"

#include "host/mof/cursor.h"
#include "host/mof/utf8.h"

#include <fstream>
#include <system_error>

namespace velkhost::mof {

std::optional<std::string> load_source(const std::filesystem::path &path, std::string &problem) {
    std::error_code error;
    const auto status = std::filesystem::status(path, error);
    if (!std::filesystem::is_regular_file(status)) {
        problem = std::filesystem::exists(status) ? "no regular file" : "no such file";
        return std::nullopt;
    }
    const std::uintmax_t size = std::filesystem::file_size(path, error);
    if (error || size > kMaxSourceBytes) {
        problem = error ? error.message() : "one of " + std::to_string(size) + " bytes";
        return std::nullopt;
    }
    std::ifstream file{path, std::ios::binary};
    std::string text(static_cast<std::size_t>(size), '\0');
    if (!file.read(text.data(), static_cast<std::streamsize>(size))) {
        problem = "one that cannot be read";
        return std::nullopt;
    }
    return text;
}

std::optional<std::string_view> checked_text(std::string_view text, std::string_view file,
                                             ErrorList &errors) {
    constexpr std::string_view kByteOrderMark = "\xEF\xBB\xBF";
    if (text.starts_with(kByteOrderMark)) {
        text.remove_prefix(kByteOrderMark.size());
    }
    const std::size_t invalid = find_invalid_utf8(text);
    if (invalid == text.size()) {
        return text;
    }
    Cursor cursor{text, file};
    cursor.advance(invalid);
    errors.add(cursor.position(),
               "expected a text in UTF-8, found the byte " + shown(text.substr(invalid, 1)));
    return std::nullopt;
}

}  // namespace velkhost::mof

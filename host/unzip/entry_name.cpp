#include "host/unzip/entry_name.h"

#include <algorithm>

#include "host/unzip/failure.h"
#include "host/unzip/limits.h"

namespace velkhost::unzip {
namespace {

// A backslash separates folders elsewhere, so a name with one means two things.
bool is_unusable(char c) {
    const auto byte = static_cast<unsigned char>(c);
    return byte < 0x20 || byte == 0x7F || c == '\\';
}

bool begins_with_a_drive(std::string_view name) {
    const auto is_letter = [](char c) { return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z'); };
    return name.size() >= 2 && is_letter(name[0]) && name[1] == ':';
}

void check_whole(std::string_view name) {
    const bool safe = !name.empty() && name.size() <= kMaxNameLength && !name.starts_with('/') &&
                      !begins_with_a_drive(name) && std::ranges::none_of(name, is_unusable);
    if (!safe) {
        throw Failure(kMinizipUnsafeName);
    }
}

void add_part(std::vector<std::string> &parts, std::string_view part) {
    if (part.empty() || part == ".") {
        return;
    }
    if (part == ".." || part.size() > kMaxPartLength || parts.size() == kMaxDepth) {
        throw Failure(kMinizipUnsafeName);
    }
    parts.emplace_back(part);
}

}  // namespace

EntryName read_entry_name(std::string_view name) {
    check_whole(name);
    EntryName out;
    out.folder = name.ends_with('/');
    for (std::size_t begin = 0; begin <= name.size();) {
        const std::size_t end = std::min(name.find('/', begin), name.size());
        add_part(out.parts, name.substr(begin, end - begin));
        begin = end + 1;
    }
    if (out.parts.empty() && !out.folder) {
        throw Failure(kMinizipUnsafeName);  // a file called "."
    }
    return out;
}

}  // namespace velkhost::unzip

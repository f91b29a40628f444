#include "host/rig/text_file.h"

#include <fstream>
#include <iterator>

namespace velkhost::rig {

std::optional<std::string> read_text_file(const std::filesystem::path &path) {
    std::ifstream file(path, std::ios::binary);
    std::string text{std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
    if (!file) {
        return std::nullopt;
    }
    return text;
}

}  // namespace velkhost::rig

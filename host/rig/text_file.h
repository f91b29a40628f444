// A whole file as text.
#pragma once

#include <filesystem>
#include <optional>
#include <string>

namespace velkhost::rig {

// No value when the file cannot be read.
std::optional<std::string> read_text_file(const std::filesystem::path &path);

}  // namespace velkhost::rig

// Threads, mutexes and conditions for providers.
#pragma once

#include <filesystem>
#include <vector>

namespace velkhost::broker {

// Where resolveFileName looks; its slot knows no broker, so the folders are those of all brokers of
// the process.
void add_library_folders(const std::vector<std::filesystem::path> &folders);

}  // namespace velkhost::broker

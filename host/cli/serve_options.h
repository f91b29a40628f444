// What `velkhost serve` is asked to do.
#pragma once

#include <cstdint>
#include <filesystem>
#include <optional>
#include <string>

namespace velkhost::cli {

struct ServeOptions {
    std::string listen = "127.0.0.1:5988";
    std::optional<std::filesystem::path> scenario;
    std::optional<std::filesystem::path> root;
    std::optional<std::string> user;
    std::optional<std::filesystem::path> password_file;
    bool virtual_clock = true;
    std::int64_t speed = 3600;  // seconds of a virtual clock in one of the machine's, at most
    int grace_s = 5;            // for what is under way when the command is told to end
};

}  // namespace velkhost::cli

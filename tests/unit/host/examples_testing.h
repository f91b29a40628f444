// Runs the script that makes the example packages.
#pragma once

#include <sys/wait.h>

#include <algorithm>
#include <array>
#include <cstdio>
#include <filesystem>
#include <string>
#include <vector>

namespace velktest::examples {

inline std::string quoted(const std::string &text) {
    return '\'' + text + '\'';
}

// Runs the script quietly; its exit code.
inline int make_packages(const std::string &arguments) {
    const std::string command =
        quoted(std::string(VELK_EXAMPLES_DIR) + "/make_packages.sh") + ' ' + arguments + " 2>&1";
    // The command is made of the test's own paths.
    FILE *output = ::popen(command.c_str(), "r");  // NOLINT(cert-env33-c)
    std::array<char, 256> line{};
    while (::fgets(line.data(), static_cast<int>(line.size()), output) != nullptr) {
    }
    return WEXITSTATUS(::pclose(output));
}

// The packages' descriptors, by name.
inline std::vector<std::filesystem::path> descriptors() {
    std::vector<std::filesystem::path> out;
    const std::filesystem::path folder = std::string(VELK_EXAMPLES_DIR) + "/packages";
    for (const auto &entry : std::filesystem::directory_iterator(folder)) {
        if (entry.path().extension() == ".xml") {
            out.push_back(entry.path());
        }
    }
    std::ranges::sort(out);
    return out;
}

// A package's name as a part of a test's.
inline std::string test_name(std::string package) {
    std::ranges::replace_if(
        package, [](unsigned char c) { return std::isalnum(c) == 0; }, '_');
    return package;
}

}  // namespace velktest::examples

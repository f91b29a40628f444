// Package descriptors as the tests need them.
#pragma once

#include <filesystem>
#include <string>
#include <vector>

namespace velktest {

struct Package {
    std::string file;  // of the descriptor, without ".xml"
    std::string category = "UEFI";
    std::string type = "1";
    std::string name = "Firmware";
    std::vector<std::string> prerequisites = {};
    std::string supersedes = "";  // empty: the property is left out
};

// Writes the descriptor into `folder` and returns its location. The package's identification code
// is the file's name, its payload "<file>.bin".
std::string write_package(const std::filesystem::path &folder, const Package &package);

// Where the payload of the package lies, as a client gives locations.
std::string payload_location(const std::filesystem::path &folder, const Package &package);

}  // namespace velktest

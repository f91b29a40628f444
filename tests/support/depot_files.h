// A bundle of the hypervisor's updates, unpacked in a folder: one package to begin with, and all as
// it should be.
#pragma once

#include <cstddef>
#include <filesystem>
#include <map>
#include <string>

namespace velktest {

class DepotFiles {
  public:
    explicit DepotFiles(std::filesystem::path folder, const std::string &version = "1.0");

    // The files of the folder, by their places in it; what is taken out is not written.
    std::map<std::string, std::string> files;

    // The entries of metadata.zip.
    std::map<std::string, std::string> metadata;

    // Adds a package to both.
    void add_vib(const std::string &name, const std::string &version, std::size_t size = 100);

    // Writes everything anew; the URI of metadata.zip.
    std::string write() const;

    [[nodiscard]] std::filesystem::path archive() const { return folder_ / "metadata.zip"; }

  private:
    std::filesystem::path folder_;
};

// What metadata say of a package.
std::string vib_text(const std::string &name, const std::string &version, const std::string &place,
                     const std::string &size);

}  // namespace velktest

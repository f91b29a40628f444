// Archives written byte by byte, so that each record can be wrong in its own way, and a directory
// to unpack them into.
#pragma once

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cstdint>
#include <filesystem>
#include <optional>
#include <string>
#include <vector>

#include "host/unzip/unzipfile.h"
#include "tests/support/files.h"

namespace velkhost::unzip::test {

struct ZipEntry {
    std::string name;
    std::string content = {};  // as it stands in the archive
    std::uint16_t method = 0;
    std::uint16_t flags = 0;
    std::uint32_t mode = 0;  // of Unix, with the kind of file
    std::string extra = {};
    // What the records state, where that is not what `content` has.
    std::optional<std::uint32_t> checksum = {};
    std::optional<std::uint64_t> size = {};
};

// A file whose content is deflated.
ZipEntry deflated(const std::string &name, const std::string &content);

struct ZipForm {
    bool zip64 = false;
    std::string comment = {};
    std::optional<std::uint64_t> entries = {};  // the number that the end record states
};

std::string zip(const std::vector<ZipEntry> &entries, const ZipForm &form = {});

// `value` in little-endian order.
std::string little_endian(std::uint64_t value, int width);

class UnzipTest : public testing::Test {
  protected:
    [[nodiscard]] std::filesystem::path archive() const { return folder_.path() / "package.zip"; }
    [[nodiscard]] std::filesystem::path directory() const { return folder_.path() / "out"; }

    // Writes the archive and unpacks it.
    [[nodiscard]] int unpack(const std::string &bytes) const;
    [[nodiscard]] int unpack(const std::vector<ZipEntry> &entries) const {
        return unpack(zip(entries));
    }

    // What lies under the directory, in order, each with its path from there; folders end in '/'.
    [[nodiscard]] std::vector<std::string> unpacked() const;

    [[nodiscard]] std::string text_of(const std::string &name) const {
        return velktest::read_file(directory() / name);
    }

    // A refused archive is refused whole: not even the directory is made.
    void expect_refused(const std::vector<ZipEntry> &entries, int result) const;

  private:
    velktest::TempFolder folder_;
};

}  // namespace velkhost::unzip::test

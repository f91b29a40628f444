// A run folder for the tests of the shim: empty but for the parents of the fixed paths.
#pragma once

#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <sstream>
#include <string>

#include "host/shim/velkshim.h"

namespace velkhost::shim::test {

class ShimRoot : public testing::Test {
  protected:
    ShimRoot() {
        std::string pattern = testing::TempDir() + "velkshim-XXXXXX";
        root_ = mkdtemp(pattern.data());
        for (const char *folder : {"tmp/sfcb", "var/tmp", "etc", "usr/lib/cim", "dev"}) {
            std::filesystem::create_directories(root_ / folder);
        }
        EXPECT_EQ(velkshim_set_root(root_.c_str()), 0);
    }

    ~ShimRoot() override {
        velkshim_set_root(nullptr);
        std::filesystem::remove_all(root_);
    }

    // Where a fixed path lies in the run folder.
    [[nodiscard]] std::filesystem::path under_root(const std::string &fixed_path) const {
        return root_ / fixed_path.substr(1);
    }

    [[nodiscard]] std::string text_of(const std::string &fixed_path) const {
        std::ifstream file(under_root(fixed_path));
        std::ostringstream text;
        text << file.rdbuf();
        return text.str();
    }

    void put(const std::string &fixed_path, const std::string &text) const {
        std::ofstream(under_root(fixed_path)) << text;
    }

    std::filesystem::path root_;
};

}  // namespace velkhost::shim::test

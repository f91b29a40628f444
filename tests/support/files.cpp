#include "tests/support/files.h"

#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cstdlib>
#include <fstream>
#include <iterator>
#include <system_error>

namespace velktest {
namespace fs = std::filesystem;

namespace {

constexpr uid_t kNobody = 65534;
constexpr uid_t kSuperuser = 0;

}  // namespace

TempFolder::TempFolder() {
    std::string name = fs::temp_directory_path() / "velk-test-XXXXXX";
    if (mkdtemp(name.data()) == nullptr || chmod(name.c_str(), 0777) != 0) {
        throw std::system_error(errno, std::generic_category(), name);
    }
    path_ = name;
}

TempFolder::~TempFolder() {
    std::error_code ignored;
    fs::remove_all(path_, ignored);
}

std::string read_file(const fs::path &file) {
    std::ifstream stream(file, std::ios::binary);
    return {std::istreambuf_iterator<char>(stream), {}};
}

void write_file(const fs::path &file, std::string_view text) {
    fs::create_directories(file.parent_path());
    std::ofstream stream(file, std::ios::binary | std::ios::trunc);
    stream << text;
    if (!stream.flush()) {
        throw std::system_error(errno, std::generic_category(), file);
    }
}

std::size_t open_descriptors() {
    const auto entries = fs::directory_iterator("/proc/self/fd");
    return static_cast<std::size_t>(std::distance(begin(entries), end(entries)));
}

Unprivileged::Unprivileged() {
    if (geteuid() == kSuperuser && seteuid(kNobody) != 0) {
        throw std::system_error(errno, std::generic_category(), "seteuid");
    }
}

Unprivileged::~Unprivileged() {
    if (getuid() == kSuperuser) {
        EXPECT_EQ(seteuid(kSuperuser), 0);
    }
}

}  // namespace velktest

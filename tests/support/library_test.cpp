#include "tests/support/library_test.h"

#include <cstdint>
#include <cstdlib>
#include <ctime>

#include "host/shim/velkshim.h"
#include "velk/debug_log.h"

namespace velktest {
namespace fs = std::filesystem;

namespace {

constexpr std::int64_t kMicroseconds = 1'000'000;
constexpr std::int64_t kDay = 86'400;

// 2024-10-04, 08:05:03 UTC.
constexpr std::int64_t kStart = (20'000 * kDay + kStartSecond) * kMicroseconds;

void note_pause(void *log, std::int64_t at_us, std::int64_t length_us) {
    static_cast<PauseLog *>(log)->add(at_us, length_us);
}

int failing_step(void *steps, const char *step) {
    const auto &failing = *static_cast<const std::map<std::string, int> *>(steps);
    const auto found = failing.find(step);
    return found == failing.end() ? 0 : found->second;
}

}  // namespace

LibraryTest::LibraryTest() {
    reset_session();
    setenv("TZ", "UTC", 1);
    tzset();
    const fs::path root = folder_.path() / "root";
    fs::create_directories(root / "tmp" / "sfcb");
    fs::create_directories(root / "var" / "tmp");
    EXPECT_EQ(velkshim_set_root(root.c_str()), 0);
    velkshim_use_virtual_clock(kStart);
    velkshim_observe_pauses(note_pause, &pause_log_);
    velkshim_set_fault_hook(failing_step, &failing_steps_);
}

LibraryTest::~LibraryTest() {
    velkshim_set_fault_hook(nullptr, nullptr);
    velkshim_observe_pauses(nullptr, nullptr);
    velkshim_use_real_clock();
    velkshim_set_root(nullptr);
    reset_session();
}

fs::path LibraryTest::at(std::string_view fixed_path) const {
    return folder_.path() / "root" / fixed_path.substr(1);
}

std::string LibraryTest::log() const {
    return read_file(at(velk::kDebugLog));
}

void LibraryTest::clear_log() const {
    fs::remove(at(velk::kDebugLog));
}

std::vector<int> LibraryTest::pauses() const {
    return pause_log_.lengths(kMicroseconds);
}

void LibraryTest::fail_step(const std::string &step, int error) {
    failing_steps_[step] = error;
}

std::string LibraryTest::write_descriptor(std::string_view text) const {
    const fs::path file = folder_.path() / "descriptor.xml";
    write_file(file, text);
    return "file://" + file.string();
}

void LibraryTest::use_packages(int count) {
    pkgnum = count;
}

}  // namespace velktest

// The fixture of the library's own tests: the session as at load, the fixed paths under a folder
// of the test's own, the clock standing at 08:05:03 UTC but for pauses.
#pragma once

#include <gtest/gtest.h>

#include <filesystem>
#include <map>
#include <string>
#include <string_view>
#include <vector>

#include "tests/support/files.h"
#include "tests/support/log_text.h"
#include "tests/support/pause_log.h"
#include "tests/support/session.h"
#include "velk/package_table.h"

namespace velktest {

class LibraryTest : public ::testing::Test {
  public:
    LibraryTest();
    ~LibraryTest() override;
    LibraryTest(const LibraryTest &) = delete;
    LibraryTest &operator=(const LibraryTest &) = delete;

  protected:
    // Where one of the fixed paths lies in this test.
    [[nodiscard]] std::filesystem::path at(std::string_view fixed_path) const;

    // The whole debug log so far.
    [[nodiscard]] std::string log() const;

    // Begins the debug log anew.
    void clear_log() const;

    // Lengths in seconds of the pauses so far.
    [[nodiscard]] std::vector<int> pauses() const;

    [[nodiscard]] const PauseLog &pause_log() const { return pause_log_; }

    // From now on the step, such as "unlink:/tmp/velkdebug.txt", fails with this errno value.
    void fail_step(const std::string &step, int error);

    // A descriptor outside the fixed paths, and its location as a client gives it.
    std::string write_descriptor(std::string_view text) const;

    // Records 0 to `count` - 1 in use, everything else as at load.
    static void use_packages(int count);

  private:
    TempFolder folder_;
    PauseLog pause_log_;
    std::map<std::string, int> failing_steps_;
};

}  // namespace velktest

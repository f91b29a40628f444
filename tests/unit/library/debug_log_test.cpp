// The debug log: its two forms of writing, and what each of them costs.

#include "velk/debug_log.h"

#include <cerrno>
#include <cstdlib>
#include <ctime>

#include "host/shim/velkshim.h"
#include "tests/support/file_calls.h"
#include "tests/support/library_test.h"

namespace {

using ::testing::Test;
using velktest::entry;
using velktest::FileCalls;
using Calls = std::vector<std::string>;

class DebugLog : public velktest::LibraryTest {
  protected:
    static void set_clock(int hour, int minute, int second) {
        velkshim_use_virtual_clock(((hour * 60 + minute) * 60 + second) * INT64_C(1'000'000));
    }
};

}  // namespace

TEST_F(DebugLog, UntimedWriteAppendsExactlyItsText) {
    EXPECT_EQ(debug("x"), 0);
    EXPECT_EQ(log(), "x");
    EXPECT_EQ(debug("\n"), 0);
    EXPECT_EQ(debug("yz"), 0);
    EXPECT_EQ(log(), "x\nyz");
}

TEST_F(DebugLog, EntryBeginsWithTheTimePaddedWithBlanks) {
    EXPECT_EQ(velk::log_entry("Enter.\n"), 0);
    EXPECT_EQ(log(), "[ 8: 5: 3] Enter.\n");
}

TEST_F(DebugLog, TimeIsShownWithTwoPlacesEach) {
    struct {
        int hour, minute, second;
        const char *prefix;
    } const times[] = {
        {0, 0, 0, "[ 0: 0: 0] "},
        {9, 59, 9, "[ 9:59: 9] "},
        {10, 10, 10, "[10:10:10] "},
        {23, 59, 59, "[23:59:59] "},
    };
    for (const auto &time : times) {
        clear_log();
        set_clock(time.hour, time.minute, time.second);
        velk::log_entry("");
        EXPECT_EQ(log(), time.prefix);
    }
}

TEST_F(DebugLog, TimeIsLocalTime) {
    setenv("TZ", "EST+5:30", 1);
    tzset();
    velk::log_entry("x");
    EXPECT_EQ(log(), "[ 2:35: 3] x");
}

TEST_F(DebugLog, EntriesWithoutLineEndRunOnIntoTheNextWrite) {
    velk::log_entry("methodName:");
    debug("InstallFromURI");
    debug("\n");
    velk::log_entry("next");
    EXPECT_EQ(log(), entry("methodName:") + "InstallFromURI\n" + entry("next"));
}

TEST_F(DebugLog, EntryIsOneOpenTwoWritesAndOneClose) {
    const FileCalls calls;
    velk::log_entry("Enter.\n");
    EXPECT_EQ(calls.taken(),
              (Calls{"open /tmp/velkdebug.txt", "write [ 8: 5: 3] ", "write Enter.\n", "close"}));
}

TEST_F(DebugLog, UntimedWriteIsOneOpenOneWriteAndOneClose) {
    const FileCalls calls;
    debug("text");
    EXPECT_EQ(calls.taken(), (Calls{"open /tmp/velkdebug.txt", "write text", "close"}));
}

TEST_F(DebugLog, FormattedEntryIsTwoWritesAsWell) {
    const FileCalls calls;
    velk::log_format("retry %d of %s\n", 2, "five");
    EXPECT_EQ(calls.taken(), (Calls{"open /tmp/velkdebug.txt", "write [ 8: 5: 3] ",
                                    "write retry 2 of five\n", "close"}));
}

TEST_F(DebugLog, ValueAndLineEndAreUntimedWritesOfTheirOwn) {
    const FileCalls calls;
    velk::log_value("retCode: ", 4096);
    EXPECT_EQ(calls.taken(),
              (Calls{"open /tmp/velkdebug.txt", "write [ 8: 5: 3] ", "write retCode: ", "close",
                     "open /tmp/velkdebug.txt", "write 4096", "close",  //
                     "open /tmp/velkdebug.txt", "write \n", "close"}));
}

TEST_F(DebugLog, NothingStaysOpen) {
    const std::size_t before = velktest::open_descriptors();
    for (int i = 0; i < 100; ++i) {
        velk::log_entry("entry\n");
        velk::log_value("label ", "value");
        debug("text\n");
    }
    EXPECT_EQ(velktest::open_descriptors(), before);
}

TEST_F(DebugLog, RemovedFileIsCreatedAnewByTheNextWrite) {
    velk::log_entry("first\n");
    std::filesystem::remove(at(velk::kDebugLog));
    velk::log_entry("second\n");
    EXPECT_EQ(log(), entry("second\n"));
}

TEST_F(DebugLog, OlderContentsAreKept) {
    velktest::write_file(at(velk::kDebugLog), "from before\n");
    velk::log_entry("now\n");
    EXPECT_EQ(log(), "from before\n" + entry("now\n"));
}

TEST_F(DebugLog, LogThatCannotBeOpenedGivesMinusOneAndNoFailure) {
    fail_step("open:/tmp/velkdebug.txt", EACCES);
    const std::size_t before = velktest::open_descriptors();
    EXPECT_EQ(debug("x"), -1);
    EXPECT_EQ(velk::log_entry("x"), -1);
    EXPECT_EQ(velk::log_format("%d", 1), -1);
    velk::log_value("label ", "value");
    EXPECT_EQ(log(), "");
    EXPECT_EQ(velktest::open_descriptors(), before);
}

TEST_F(DebugLog, FolderInItsPlaceGivesMinusOne) {
    std::filesystem::create_directory(at(velk::kDebugLog));
    EXPECT_EQ(debug("x"), -1);
}

TEST_F(DebugLog, NullTextWritesNothing) {
    EXPECT_EQ(debug(nullptr), 0);
    EXPECT_EQ(log(), "");
}

TEST_F(DebugLog, FormattedEntryIsCutAt2047Characters) {
    const std::string text(5000, 'a');
    EXPECT_EQ(velk::log_format("%s", text.c_str()), 0);
    EXPECT_EQ(log(), entry(text.substr(0, 2047)));
}

TEST_F(DebugLog, LongTextsAreWrittenWholeByTheOtherForms) {
    const std::string text(5000, 'a');
    debug(text.c_str());
    velk::log_entry(text);
    EXPECT_EQ(log(), text + entry(text));
}

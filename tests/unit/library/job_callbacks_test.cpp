// What the job library calls: the status of a job, and its removal.

#include <array>
#include <cerrno>
#include <thread>

#include "tests/support/library_test.h"
#include "velk/request_state.h"
#include "velk/status_report.h"

namespace {

constexpr int kUntouched = -77;

class JobCallbacks : public velktest::LibraryTest {
  protected:
    void write_line(const std::string &text, const std::string &number = "7") const {
        velktest::write_file(job_file(number), text);
    }

    [[nodiscard]] std::filesystem::path job_file(const std::string &number = "7") const {
        return at("/tmp/sfcb/velkstatVELK-" + number + ".txt");
    }

    [[nodiscard]] std::string record() const {
        return velktest::read_file(at("/tmp/sfcb/getVELKStatus.txt"));
    }

    // Asks with room for the longest line.
    void ask(const char *instance_id) {
        state_ = kUntouched;
        message_.fill('x');
        EXPECT_EQ(
            getVELKStatus(instance_id, &state_, message_.data(), static_cast<int>(message_.size())),
            0);
    }

    [[nodiscard]] int state() const { return state_; }
    [[nodiscard]] std::string message() const { return message_.data(); }
    [[nodiscard]] bool is_untouched() const {
        return state_ == kUntouched && message_.front() == 'x' && message_.back() == 'x';
    }

  private:
    int state_ = kUntouched;
    std::array<char, 1024> message_{};
};

}  // namespace

TEST_F(JobCallbacks, StateIsReadFromTheWholeLine) {
    struct {
        const char *line;
        int state;
    } const cases[] = {
        {"1|x: 57: Package installation error happened.|", 10},
        {"0|x: 10: Package download completed and the update process is running.|", 4},
        {"0|x: 0: Package Initialization finished|", 4},
        {"1|x: 50: Package installation successfully.|", 7},
        {"1|x: 59: The level is already current.|", 7},
        // One package's success decides, wherever it stands.
        {"0|a: 50: Package installation successfully.|b: 57: error|c: 62: running|", 7},
        {"0|a: 57: error|b: 62: running|", 4},
        // The rest of the line counts, too.
        {"1|running: 57: error|", 4},
        {"1|already: 57: error|", 7},
        // Letter for letter.
        {"1|x: 50: Successfully|", 10},
        {"0|x: 0: initialization|", 10},
        {"0|", 10},
        {"\n", 10},
    };
    for (const auto &row : cases) {
        write_line(row.line);
        ask("VELK-7");
        EXPECT_EQ(state(), row.state) << row.line;
        EXPECT_EQ(message(), row.line);
        EXPECT_EQ(record(), "begin to record VELK-7-" + message() + "\n");
    }
}

TEST_F(JobCallbacks, OnlyTheFirstLineIsRead) {
    write_line("0|x: 57: error|\nsuccessfully\n");
    ask("VELK-7");
    EXPECT_EQ(state(), 10);
    EXPECT_EQ(message(), "0|x: 57: error|\n");
}

TEST_F(JobCallbacks, LineIsReadUpTo1023Bytes) {
    const std::string filler(1011, 'a');
    write_line(filler + "successfully");
    ask("VELK-7");
    EXPECT_EQ(state(), 7) << "the word just fits";
    EXPECT_EQ(message(), filler + "successfully");
    write_line("a" + filler + "successfully");
    ask("VELK-7");
    EXPECT_EQ(state(), 10) << "its last letter is cut";
    EXPECT_EQ(message(), "a" + filler + "successfull");
}

TEST_F(JobCallbacks, MessageIsCutToTheCallersBufferAndTerminated) {
    const std::string line = "1|x: 50: Package installation successfully.|";
    write_line(line);
    for (const std::size_t size :
         {std::size_t{1}, std::size_t{2}, line.size(), line.size() + 1, line.size() + 2}) {
        SCOPED_TRACE(size);
        std::string buffer(size + 8, 'x');
        int job_state = kUntouched;
        getVELKStatus("VELK-7", &job_state, buffer.data(), static_cast<int>(size));
        EXPECT_EQ(buffer.substr(0, buffer.find('\0')), line.substr(0, size - 1));
        EXPECT_EQ(buffer[size - 1], '\0') << "the last byte is always the terminator";
        EXPECT_EQ(buffer.substr(size), std::string(8, 'x'));
        EXPECT_EQ(job_state, 7) << "the state comes from the line, not from what fits";
        EXPECT_EQ(record(), "begin to record VELK-7-" + line.substr(0, size - 1) + "\n");
    }
}

TEST_F(JobCallbacks, CallerWithoutRoomStillGetsTheState) {
    write_line("1|x: 57: error|");
    char byte = 'x';
    for (const int size : {0, -1}) {
        int job_state = kUntouched;
        EXPECT_EQ(getVELKStatus("VELK-7", &job_state, &byte, size), 0);
        EXPECT_EQ(job_state, 10);
        EXPECT_EQ(byte, 'x');
    }
}

TEST_F(JobCallbacks, NullResultsAreLeftOut) {
    write_line("1|x: 57: error|");
    std::array<char, 64> message{};
    int job_state = kUntouched;
    EXPECT_EQ(getVELKStatus("VELK-7", nullptr, message.data(), 64), 0);
    EXPECT_STREQ(message.data(), "1|x: 57: error|");
    EXPECT_EQ(getVELKStatus("VELK-7", &job_state, nullptr, 64), 0);
    EXPECT_EQ(job_state, 10);
}

TEST_F(JobCallbacks, FileIsFoundByTheNumberAfterTheFirstDash) {
    struct {
        const char *id, *number;
    } const cases[] = {
        {"VELK-7", "7"},     {"OTHER-7", "7"}, {"-7", "7"},     {"VELK-007", "7"},
        {"VELK-12-3", "12"}, {"VELK-", "0"},   {"VELK-x", "0"}, {"a-9z", "9"},
    };
    for (const auto &row : cases) {
        SCOPED_TRACE(row.id);
        write_line(std::string("running ") + row.id, row.number);
        ask(row.id);
        EXPECT_EQ(message(), std::string("running ") + row.id);
    }
}

TEST_F(JobCallbacks, IdWithoutADashChangesNothing) {
    write_line("running");
    for (const char *id : {"VELK7", "", static_cast<const char *>(nullptr)}) {
        ask(id);
        EXPECT_TRUE(is_untouched());
    }
    EXPECT_FALSE(std::filesystem::exists(at("/tmp/sfcb/getVELKStatus.txt")));
}

TEST_F(JobCallbacks, FileThatIsAbsentOrEmptyChangesNothing) {
    ask("VELK-7");
    EXPECT_TRUE(is_untouched());
    write_line("");
    ask("VELK-7");
    EXPECT_TRUE(is_untouched());
    EXPECT_FALSE(std::filesystem::exists(at("/tmp/sfcb/getVELKStatus.txt")));
}

TEST_F(JobCallbacks, UnwritableRecordDoesNotMatter) {
    write_line("running");
    fail_step("open:/tmp/sfcb/getVELKStatus.txt", EACCES);
    ask("VELK-7");
    EXPECT_EQ(state(), 4);
}

TEST_F(JobCallbacks, QueriesLogNothingAndLeaveNothingOpen) {
    write_line("running");
    const std::size_t before = velktest::open_descriptors();
    ask("VELK-7");
    ask("VELK-8");
    EXPECT_EQ(velktest::open_descriptors(), before);
    EXPECT_EQ(log(), "");
}

TEST_F(JobCallbacks, CleanupRemovesTheFileOnce) {
    write_line("running");
    write_line("running", "8");
    EXPECT_EQ(VELKStatusCleanup("VELK-7"), 1);
    EXPECT_FALSE(std::filesystem::exists(job_file()));
    EXPECT_EQ(VELKStatusCleanup("VELK-7"), 0);
    EXPECT_TRUE(std::filesystem::exists(job_file("8")));
}

TEST_F(JobCallbacks, CleanupWithoutADashRemovesNothing) {
    write_line("running", "0");
    EXPECT_EQ(VELKStatusCleanup("VELK7"), 0);
    EXPECT_EQ(VELKStatusCleanup(""), 0);
    EXPECT_EQ(VELKStatusCleanup(nullptr), 0);
    EXPECT_TRUE(std::filesystem::exists(job_file("0")));
}

TEST_F(JobCallbacks, ReportsAreReadWhileTheyAreWritten) {
    use_packages(1);
    is_async_install = 1;
    velktest::set_field(instanceID, "VELK-7");
    velktest::set_field(pkgInstance[0].TFTPXMLPkgURIs, "a/pkg.xml");
    std::thread writer([] {
        for (int i = 0; i < 100; ++i) {
            update_Pkg_Install_status(0, 62, "running");
        }
    });
    for (int i = 0; i < 100; ++i) {
        ask("VELK-7");
        // Between truncation and writing the file holds no line.
        EXPECT_TRUE(is_untouched() || (state() == 4 && message() == "0|pkg: 62: running|"));
    }
    writer.join();
}

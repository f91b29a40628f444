// What the views write, read back from a pipe.
#include "host/cli/live_view.h"
#include "host/cli/output.h"
#include "host/cli/plain_view.h"
#include "host/cli/terminal.h"

#include <gmock/gmock.h>
#include <unistd.h>

#include <array>
#include <csignal>
#include <cstdlib>

namespace velkhost::cli {
namespace {

using testing::HasSubstr;
using testing::Not;

class Pipe {
  public:
    Pipe() { EXPECT_EQ(pipe(ends_.data()), 0); }
    ~Pipe() {
        close(ends_[0]);
        close_writing();
    }
    Pipe(const Pipe &) = delete;
    Pipe &operator=(const Pipe &) = delete;

    [[nodiscard]] int writing() const { return ends_[1]; }

    void close_writing() {
        if (ends_[1] >= 0) {
            close(ends_[1]);
            ends_[1] = -1;
        }
    }

    void close_reading() { close(ends_[0]); }

    std::string text() {
        close_writing();
        std::string result;
        std::array<char, 4096> buffer{};
        for (ssize_t n = 0; (n = read(ends_[0], buffer.data(), buffer.size())) > 0;) {
            result.append(buffer.data(), static_cast<std::size_t>(n));
        }
        return result;
    }

  private:
    std::array<int, 2> ends_{};
};

const RequestReport kRequest = {{}, {}, std::nullopt, "s.toml", "node-1", true, 0};
const Terminal kColour = {true, true, true};
const Terminal kPlainTerminal = {true, false, false};

TEST(CliPlainView, OneLinePerChangeAndPerJobState) {
    Pipe pipe;
    Output output(pipe.writing());
    PlainView view(output, {});
    view.begin(kRequest, {"a", "bb"});
    view.tick(1'000'000, {"VELK-1", std::uint16_t{4}, ""});
    view.tick(2'000'000, {"VELK-1", std::uint16_t{4}, ""});
    view.change(10'000'000, 0, {"a", 0, "Package Initialization finished"});
    view.change(10'000'000, 1, {"bb", 62, "busy"});
    view.tick(20'000'000, {"VELK-1", std::uint16_t{7}, ""});
    view.end();
    EXPECT_EQ(pipe.text(),
              "velkhost: 2 packages for node-1, virtual clock, scenario s.toml\n"
              "[+00:00:01] job VELK-1: 4 Running\n"
              "[+00:00:10] bb  62  busy\n"
              "[+00:00:20] job VELK-1: 7 Completed\n");
}

TEST(CliLiveView, RedrawsItsLinesInPlaceAndLeavesNothing) {
    Pipe pipe;
    Output output(pipe.writing());
    LiveView view(output, kColour, {false, true, 0});
    view.begin(kRequest, {"a", "b"});
    view.change(31'000'000, 1, {"b", 50, "done"});
    view.end();
    const std::string text = pipe.text();
    EXPECT_TRUE(text.starts_with("\x1b[?25l")) << "the cursor is hidden";
    EXPECT_THAT(text, HasSubstr("\r\x1b[5A\x1b[J"));
    EXPECT_THAT(text, HasSubstr("✓ b  50  done"));
    EXPECT_THAT(text, HasSubstr("+00:00:31"));
    EXPECT_TRUE(text.ends_with("\r\x1b[5A\x1b[J\x1b[?25h")) << "erased, and the cursor is back";
}

TEST(CliLiveView, TimelineKeepsEachChangeAbove) {
    Pipe pipe;
    Output output(pipe.writing());
    LiveView view(output, kPlainTerminal, {true, false, 0});
    view.begin(kRequest, {"a"});
    view.change(5'000'000, 0, {"a", 62, "busy"});
    view.end();
    EXPECT_THAT(pipe.text(), HasSubstr("\x1b[J[+00:00:05] a  62  busy\n\n"));
}

TEST(CliLiveView, WithoutRunningClockOnlyNewsIsDrawn) {
    Pipe pipe;
    Output output(pipe.writing());
    LiveView view(output, kPlainTerminal, {true, false, 0});
    view.begin(kRequest, {"a"});
    for (int i = 0; i < 100; ++i) {
        view.tick(i * 1'000'000, {"VELK-1", std::uint16_t{4}, ""});
    }
    view.end();
    const std::string text = pipe.text();
    EXPECT_LT(text.size(), 600U);
    EXPECT_THAT(text, HasSubstr("[+00:00:00] job VELK-1: 4 Running\n"));
}

TEST(CliLiveView, MorePackagesThanTheWindowHasRowsAreNotDrawnInPlace) {
    Pipe pipe;
    Output output(pipe.writing());
    LiveView view(output, kPlainTerminal, {true, false, 0});
    view.begin(kRequest, std::vector<std::string>(40, "a"));
    view.change(0, 39, {"a", 62, "busy"});
    view.end();
    const std::string text = pipe.text();
    EXPECT_THAT(text, HasSubstr("[+00:00:00] a  62  busy\n"));
    EXPECT_THAT(text, Not(HasSubstr("waiting")));
}

TEST(CliLiveView, NothingIsShownAfterTheEnd) {
    Pipe pipe;
    Output output(pipe.writing());
    LiveView view(output, kPlainTerminal, {true, true, 0});
    view.begin(kRequest, {"a"});
    view.end();
    view.change(0, 0, {"a", 62, "late"});
    view.tick(0, {});
    view.change(0, 7, {"z", 62, "no such row"});
    EXPECT_THAT(pipe.text(), Not(HasSubstr("late")));
}

TEST(CliOutput, ReaderThatHasGoneMakesItSilent) {
    std::signal(SIGPIPE, SIG_IGN);
    Pipe pipe;
    Output output(pipe.writing());
    pipe.close_reading();
    output.write("lost");
    EXPECT_TRUE(output.is_broken());
    output.write("lost as well");
}

TEST(CliTerminal, PipeIsNoTerminal) {
    setenv("TERM", "xterm", 1);
    const Pipe pipe;
    const Terminal terminal = Terminal::of(pipe.writing());
    EXPECT_FALSE(terminal.interactive);
    EXPECT_FALSE(terminal.colour);
    EXPECT_EQ(window_size(pipe.writing()).columns, 80U);
}

TEST(CliTerminal, PaintWithoutColourIsTheText) {
    EXPECT_EQ(paint(kPlainTerminal, Ink::kBad, "x"), "x");
    EXPECT_EQ(paint(kColour, Ink::kBad, "x"), "\x1b[31mx\x1b[0m");
    EXPECT_EQ(paint(kColour, Ink::kBad, ""), "");
}

}  // namespace
}  // namespace velkhost::cli

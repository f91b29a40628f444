// velkhost on a terminal: drawn in place, in colour, within the window, and tidy afterwards.
#include "tests/integration/velkhost/fixture.h"

#include <gmock/gmock.h>

#include <algorithm>
#include <regex>
#include <sstream>

namespace velkhost::testing {
namespace {

using ::testing::HasSubstr;
using ::testing::Not;

class VelkhostTerminal : public VelkhostTest {
  protected:
    Finished on_terminal(std::vector<std::string> arguments, Process::Environment changes = {},
                         WindowSize size = {}) {
        arguments.insert(arguments.begin(), "install");
        arguments.push_back(package());
        changes.merge(environment());
        return Process::on_terminal(command(arguments), changes, size).wait();
    }
};

std::string without_escapes(const std::string &text) {
    return std::regex_replace(text, std::regex("\x1b\\[[?0-9;]*[A-Za-z]|\r"), "");
}

std::size_t characters(const std::string &line) {
    return static_cast<std::size_t>(std::count_if(line.begin(), line.end(), [](char c) {
        return (static_cast<unsigned char>(c) & 0xC0U) != 0x80U;
    }));
}

TEST_F(VelkhostTerminal, DrawsInPlaceAndInColourAndGivesTheCursorBack) {
    const Finished finished = on_terminal({});
    EXPECT_EQ(finished.exit_code, 0);
    EXPECT_THAT(finished.out, HasSubstr("\x1b[?25l"));
    EXPECT_THAT(finished.out, HasSubstr("\x1b[4A\x1b[J"));
    EXPECT_THAT(finished.out, HasSubstr("\x1b[32m✓ zeb_fw_rxc_r1ao58-3.10_anyos"));
    EXPECT_GT(finished.out.rfind("\x1b[?25h"), finished.out.rfind("\x1b[?25l"));
    EXPECT_THAT(without_escapes(finished.out),
                HasSubstr("[+00:01:10] zeb_fw_rxc_r1ao58-3.10_anyos  50  Package installation "
                          "successfully.\n"));
}

TEST_F(VelkhostTerminal, NoColorLeavesTheColourOutAndNothingElse) {
    const Finished finished = on_terminal({}, {{"NO_COLOR", "1"}});
    EXPECT_FALSE(std::regex_search(finished.out, std::regex("\x1b\\[[0-9;]*m")));
    EXPECT_THAT(finished.out, HasSubstr("\x1b[4A\x1b[J"));
}

TEST_F(VelkhostTerminal, DumbTerminalGetsPlainLines) {
    for (const char *kind : {"dumb", ""}) {
        const Finished finished = on_terminal({}, {{"TERM", kind}});
        EXPECT_EQ(finished.exit_code, 0);
        EXPECT_THAT(finished.out, Not(HasSubstr("\x1b")));
        EXPECT_TRUE(finished.out.starts_with("velkhost: 1 package for"));
    }
}

TEST_F(VelkhostTerminal, LocaleWithoutUtf8GetsAscii) {
    const Finished finished = on_terminal({}, {{"LC_ALL", "C"}}, {60, 40});
    EXPECT_TRUE(std::all_of(finished.out.begin(), finished.out.end(),
                            [](char c) { return static_cast<unsigned char>(c) < 0x80; }));
    EXPECT_THAT(finished.out, HasSubstr("..."));
}

TEST_F(VelkhostTerminal, LinesOfPackagesStayWithinTheWindow) {
    const Finished finished = on_terminal({}, {}, {50, 40});
    std::istringstream lines(without_escapes(finished.out));
    int seen = 0;
    for (std::string line; std::getline(lines, line);) {
        if (line.find("zeb_fw_rxc") != std::string::npos) {
            EXPECT_LE(characters(line), 50U) << line;
            ++seen;
        }
    }
    EXPECT_GT(seen, 5);
    EXPECT_THAT(finished.out, HasSubstr("…"));
}

TEST_F(VelkhostTerminal, PacedRunShowsEachChangeInPlaceAlone) {
    const Finished finished = on_terminal({"--pace", "1"});
    EXPECT_EQ(finished.exit_code, 0);
    EXPECT_THAT(finished.out, Not(HasSubstr("[+00:00:10]")));
    EXPECT_THAT(without_escapes(finished.out), HasSubstr("RXC rebooting and Package installation"));
}

TEST_F(VelkhostTerminal, JsonIsJsonThereToo) {
    const Finished finished = on_terminal({"--json"});
    EXPECT_EQ(nlohmann::json::parse(finished.out)["exit_code"], 0);
}

}  // namespace
}  // namespace velkhost::testing

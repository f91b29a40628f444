// Reading a file by lines into a buffer of fixed size.

#include <array>
#include <vector>

#include "tests/support/library_test.h"
#include "velk/file_io.h"
#include "velk/job_id.h"

namespace {

using Texts = std::vector<std::string>;

class LineReader : public velktest::LibraryTest {
  protected:
    // All lines of such a file, read into a buffer of `size`.
    [[nodiscard]] Texts lines(const std::string &text, std::size_t size) const {
        velktest::write_file(at("/var/tmp/lines"), text);
        velk::LineReader reader(at("/var/tmp/lines").c_str());
        EXPECT_TRUE(reader.is_open());
        std::vector<char> line(size, 'x');
        Texts found;
        while (reader.next(line)) {
            found.emplace_back(line.data());
        }
        EXPECT_FALSE(reader.next(line)) << "the end stays the end";
        return found;
    }
};

}  // namespace

TEST_F(LineReader, LinesKeepTheirEnds) {
    EXPECT_EQ(lines("a\nbc\r\n\nd", 16), (Texts{"a\n", "bc\r\n", "\n", "d"}));
    EXPECT_EQ(lines("a\n", 16), (Texts{"a\n"}));
    EXPECT_EQ(lines("", 16), Texts{});
}

TEST_F(LineReader, LineThatDoesNotFitGoesOnInTheNext) {
    EXPECT_EQ(lines("abcdef\ng", 4), (Texts{"abc", "def", "\n", "g"}));
    EXPECT_EQ(lines("abc\nd", 5), (Texts{"abc\n", "d"}));
    EXPECT_EQ(lines("ab", 2), (Texts{"a", "b"}));
}

TEST_F(LineReader, LinesAcrossBlocksOfTheFileAreWhole) {
    std::string text;
    Texts expected;
    for (int i = 0; i < 3000; ++i) {
        expected.push_back(std::string(static_cast<std::size_t>(i % 97), 'a') + "\n");
        text += expected.back();
    }
    EXPECT_EQ(lines(text, 128), expected);
    EXPECT_EQ(lines(std::string(10'000, 'b'), 20'000), Texts{std::string(10'000, 'b')});
}

TEST_F(LineReader, BufferWithoutRoomGivesNoLine) {
    EXPECT_EQ(lines("abc", 1), Texts{});
}

TEST_F(LineReader, FileThatCannotBeOpenedHasNoLines) {
    velk::LineReader reader(at("/var/tmp/absent").c_str());
    std::array<char, 8> line{'x'};
    EXPECT_FALSE(reader.is_open());
    EXPECT_FALSE(reader.next(line));
    EXPECT_EQ(line[0], 'x');
}

TEST(JobNumber, IsTheNumberAfterTheFirstDash) {
    EXPECT_EQ(velk::job_number("VELK-7"), 7);
    EXPECT_EQ(velk::job_number("a-12-3"), 12);
    EXPECT_EQ(velk::job_number("-0012x"), 12);
    EXPECT_EQ(velk::job_number("a-"), 0);
    EXPECT_EQ(velk::job_number("a-x"), 0);
    EXPECT_EQ(velk::job_number("VELK7"), std::nullopt);
    EXPECT_EQ(velk::job_number(""), std::nullopt);
}

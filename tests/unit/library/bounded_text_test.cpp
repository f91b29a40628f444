// Text in fixed buffers: cut, terminated, and nothing beside them touched.

#include "velk/bounded_text.h"

#include <gtest/gtest.h>

#include <array>
#include <string>

namespace {

// A buffer of eight between two guards.
class BoundedText : public ::testing::Test {
  protected:
    BoundedText() { room_.fill('x'); }

    void TearDown() override {
        EXPECT_EQ(guard(0), "xxxx");
        EXPECT_EQ(guard(12), "xxxx");
    }

    [[nodiscard]] std::span<char> buffer() { return std::span(room_).subspan(4, 8); }
    [[nodiscard]] std::string text() {
        return std::string(velk::view(std::span<const char>(buffer())));
    }

  private:
    [[nodiscard]] std::string guard(std::size_t at) const { return {room_.data() + at, 4}; }

    std::array<char, 16> room_;
};

}  // namespace

TEST_F(BoundedText, CopyIsCutAndTerminated) {
    struct {
        const char *given, *kept;
    } const cases[] = {
        {"", ""},
        {"a", "a"},
        {"abcdefg", "abcdefg"},
        {"abcdefgh", "abcdefg"},
        {"abcdefghijkl", "abcdefg"},
    };
    for (const auto &row : cases) {
        EXPECT_EQ(velk::copy(buffer(), row.given), std::string(row.kept).size());
        EXPECT_EQ(text(), row.kept);
    }
}

TEST_F(BoundedText, AppendedTextIsCut) {
    velk::copy(buffer(), "abcd");
    EXPECT_EQ(velk::append(buffer(), "ef"), 6U);
    EXPECT_EQ(velk::append(buffer(), "ghij"), 7U);
    EXPECT_EQ(text(), "abcdefg");
    EXPECT_EQ(velk::append(buffer(), "k"), 7U);
    EXPECT_EQ(text(), "abcdefg");
}

TEST_F(BoundedText, NothingIsWrittenAtOrBehindTheEnd) {
    velk::copy(buffer(), "abcdefg");
    EXPECT_EQ(velk::put(buffer(), 8, "z"), 8U);
    EXPECT_EQ(velk::put(buffer(), 100, "z"), 100U);
    EXPECT_EQ(velk::print(buffer(), 8, "%d", 1), 8U);
    EXPECT_EQ(text(), "abcdefg");
    EXPECT_EQ(velk::put({}, 0, "z"), 0U);
}

TEST_F(BoundedText, TextMayComeFromTheBufferItself) {
    velk::copy(buffer(), "abcdefg");
    velk::copy(buffer(), velk::view(std::span<const char>(buffer())).substr(3));
    EXPECT_EQ(text(), "defg");
}

TEST_F(BoundedText, OverlayKeepsTheTailAndTheLastByte) {
    velk::copy(buffer(), "abcdefg");
    velk::overlay(buffer(), "XY");
    EXPECT_EQ(text(), "XYcdefg");
    velk::overlay(buffer(), "123456789");
    EXPECT_EQ(text(), "1234567");
    velk::overlay(buffer(), "");
    EXPECT_EQ(text(), "1234567");
}

TEST_F(BoundedText, FormattedTextIsCut) {
    EXPECT_EQ(velk::print(buffer(), 0, "%d|%s", 42, "ab"), 5U);
    EXPECT_EQ(text(), "42|ab");
    EXPECT_EQ(velk::print(buffer(), 5, "%d", 123456), 7U);
    EXPECT_EQ(text(), "42|ab12");
}

TEST_F(BoundedText, BufferWithoutATerminatorIsReadToItsEnd) {
    EXPECT_EQ(text(), "xxxxxxxx");
}

TEST(Text, StartsEmptyAndIsCut) {
    velk::Text<6> text;
    EXPECT_STREQ(text.c_str(), "");
    EXPECT_STREQ(text.add("abc").add("defg").c_str(), "abcde");
    EXPECT_STREQ(velk::Text<6>("abcdefg").c_str(), "abcde");
}

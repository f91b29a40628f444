// Widths, cuts and what a terminal must not obey.
#include "host/cli/text.h"

#include <gtest/gtest.h>

namespace velkhost::cli {
namespace {

TEST(CliText, PrintableReplacesControlCharactersAndWhatIsNoUtf8) {
    EXPECT_EQ(printable("plain text", false), "plain text");
    EXPECT_EQ(printable("a\x1b[31mb\tc\n", false), "a?[31mb?c?");
    EXPECT_EQ(printable("\x7f\xc2\x9b", false), "??");  // DEL, and CSI as one character
    EXPECT_EQ(printable("\xe2\x80\xae"
                        "evil",
                        false),
              "?evil");  // right-to-left override
    EXPECT_EQ(printable("ü…", false), "ü…");
    EXPECT_EQ(printable("\xff\xc3", false), "??");
    EXPECT_EQ(printable("\xc0\xaf", false), "??");            // '/' in two bytes
    EXPECT_EQ(printable("\xed\xa0\x80", false), "???");       // a surrogate
    EXPECT_EQ(printable("\xf4\x90\x80\x80", false), "????");  // beyond Unicode
}

TEST(CliText, PrintableAsciiHasOneMarkPerCharacter) {
    EXPECT_EQ(printable("ü…x", true), "??x");
}

TEST(CliText, ColumnsCountCharactersAsTerminalsShowThem) {
    EXPECT_EQ(columns(""), 0U);
    EXPECT_EQ(columns("abc"), 3U);
    EXPECT_EQ(columns("…ü"), 2U);
    EXPECT_EQ(columns("漢字"), 4U);
    EXPECT_EQ(columns("e\u0301"), 1U);  // a combining accent
}

TEST(CliText, CutKeepsWhatFitsAndMarksTheRest) {
    EXPECT_EQ(cut("abcdef", 6, "…"), "abcdef");
    EXPECT_EQ(cut("abcdef", 5, "…"), "abcd…");
    EXPECT_EQ(cut("abcdef", 5, "..."), "ab...");
    EXPECT_EQ(cut("abcdef", 2, "..."), "..");
    EXPECT_EQ(cut("abcdef", 0, "…"), "");
    EXPECT_EQ(cut("漢字漢字", 4, "…"), "漢…");  // a wide character never in half
}

TEST(CliText, PaddedFillsUpToColumns) {
    EXPECT_EQ(padded("ab", 4), "ab  ");
    EXPECT_EQ(padded("…", 3), "…  ");
    EXPECT_EQ(padded("abcd", 2), "abcd");
}

TEST(CliText, ElapsedTimes) {
    EXPECT_EQ(elapsed(0), "00:00:00");
    EXPECT_EQ(elapsed(31'999'999), "00:00:31");
    EXPECT_EQ(elapsed(3'661'000'000), "01:01:01");
    EXPECT_EQ(elapsed(360'000'000'000), "100:00:00");
    EXPECT_EQ(elapsed(-5), "00:00:00");
}

TEST(CliText, IsoTimes) {
    EXPECT_EQ(iso_time(0), "1970-01-01T00:00:00Z");
    EXPECT_EQ(iso_time(1772438400'000'000), "2026-03-02T08:00:00Z");
}

}  // namespace
}  // namespace velkhost::cli

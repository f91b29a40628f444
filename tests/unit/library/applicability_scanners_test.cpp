// The scanners of one line of the payload configuration file.
#include <gtest/gtest.h>

#include <optional>
#include <string>

#include "catalog/applicability.h"

namespace {

using Scanner = char *(*)(char *line, int *length);

// What the scanner finds in the line; no value for none.
std::optional<std::string> found(Scanner scan, std::string line) {
    int length = 77;
    const char *begin = scan(line.data(), &length);
    if (begin == nullptr) {
        EXPECT_EQ(length, 0) << line;
        return std::nullopt;
    }
    EXPECT_GE(begin, line.data());
    EXPECT_LE(begin + length, line.data() + line.size());
    return std::string(begin, static_cast<std::size_t>(length));
}

struct Case {
    const char *line;
    std::optional<std::string> expected;
};

TEST(ApplicabilityScanners, TagNameIsTheWordAfterTheFirstBracket) {
    const Case cases[] = {
        {"<payload>", "payload"},
        {"<payload order=\"2\">fw.bin</payload>", "payload"},
        {"</payload>", "/payload"},
        {"  text <tag> <other>", "tag"},
        {"<   tag>", "tag"},
        {"<a\tb c>", "a\tb"},
        {"<tag", "tag"},
        {"<tag\n", "tag\n"},
        {"<<tag>", "<tag"},
        {"<p=1>", "p=1"},
        {"", std::nullopt},
        {"no bracket>", std::nullopt},
        {"<", std::nullopt},
        {"<   ", std::nullopt},
        {"<>", std::nullopt},
        {"<   >x", std::nullopt},
    };
    for (const Case &row : cases) {
        EXPECT_EQ(found(getProp, row.line), row.expected) << row.line;
    }
}

TEST(ApplicabilityScanners, BracketIsSearchedForInTheFirst1024Bytes) {
    EXPECT_EQ(found(getProp, std::string(1023, 'x') + "<tag>"), "tag");
    EXPECT_EQ(found(getProp, std::string(1024, 'x') + "<tag>"), std::nullopt);
}

TEST(ApplicabilityScanners, AttributeIsTheWordAfterTheTagName) {
    const Case cases[] = {
        {"<payload order=\"2\">fw.bin</payload>", "order"},
        {"<payload    order=\"2\">", "order"},
        {"<payload order =\"2\">", "order"},
        {"<payload order>", "order"},
        {"<payload order", "order"},
        {"<payload order type=\"x\">", "order"},
        {"<payload\torder=\"2\">", std::nullopt},
        {"<payload>", std::nullopt},
        {"<payload>order=\"2\"", std::nullopt},
        {"<payload =\"2\">", std::nullopt},
        {"<payload ", std::nullopt},
        {"<payload", std::nullopt},
        {"< >", std::nullopt},
        {"order=\"2\"", std::nullopt},
    };
    for (const Case &row : cases) {
        EXPECT_EQ(found(getSubProp, row.line), row.expected) << row.line;
    }
}

TEST(ApplicabilityScanners, ValueLiesBetweenTheFirstBracketThatClosesAndTheNextThatOpens) {
    const Case cases[] = {
        {"<payload>fw.bin</payload>", "fw.bin"},
        {"<payload> fw a.bin </payload>", " fw a.bin "},
        {"<payload>fw.bin", "fw.bin"},
        {"<payload>fw.bin\r\n", "fw.bin"},
        {"<payload>fw.bin\n", "fw.bin"},
        {"<payload>fw.bin\bx", "fw.bin"},
        {"a>b>c", "b>c"},
        {"<a>\tx", "\tx"},
        {"<payload></payload>", std::nullopt},
        {"<payload>\n", std::nullopt},
        {"<payload>", std::nullopt},
        {"<payload", std::nullopt},
        {"", std::nullopt},
    };
    for (const Case &row : cases) {
        EXPECT_EQ(found(getPropValue, row.line), row.expected) << row.line;
    }
}

TEST(ApplicabilityScanners, OnlySpacesAreBlanks) {
    struct {
        const char *text, *rest;
    } const cases[] = {{"  a b", "a b"}, {"a", "a"}, {"   ", ""}, {"", ""}, {" \ta", "\ta"}};
    for (const auto &row : cases) {
        std::string text = row.text;
        EXPECT_STREQ(removeBlanks(text.data()), row.rest) << row.text;
    }
}

TEST(ApplicabilityScanners, TrimmingTakesSpacesAndTabsFromBothEnds) {
    struct {
        const char *text, *trimmed;
    } const cases[] = {
        {" \t  1234 ABCD\t  ", "1234 ABCD"},
        {"1234ABCD", "1234ABCD"},
        {"  x", "x"},
        {"x\t", "x"},
        {" \t \t", ""},
        {"", ""},
        {" x\n", "x\n"},
        {"\r x ", "\r x"},
    };
    for (const auto &row : cases) {
        std::string text = row.text;
        EXPECT_EQ(trimString(text.data()), text.data());
        EXPECT_STREQ(text.data(), row.trimmed) << row.text;
    }
}

TEST(ApplicabilityScanners, TrimmingTracesToStandardOutput) {
    std::string text = " x ";
    testing::internal::CaptureStdout();
    trimString(text.data());
    const std::string trace = testing::internal::GetCapturedStdout();
    EXPECT_NE(trace.find("\" x \""), std::string::npos);
    EXPECT_NE(trace.find("\"x\""), std::string::npos);
}

TEST(ApplicabilityScanners, ConfigurationHasAFixedPath) {
    std::string buffer(1024, 'z');
    EXPECT_EQ(findCfgFileName(buffer.data()), 1);
    EXPECT_STREQ(buffer.data(), "/var/tmp/ZEB/Pakro/Package/image/payload.xml");
}

}  // namespace

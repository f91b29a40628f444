// The small text functions behind the descriptor parser.

#include <gtest/gtest.h>

#include <string>

#include "catalog/descriptor.h"

namespace {

struct Case {
    std::string text, expected;
};

template <class Function>
std::string applied(Function function, const std::string &text) {
    std::string copy = text;
    function(copy.data());
    return copy.substr(0, copy.find('\0'));
}

}  // namespace

TEST(DescriptorText, WhatStandsAroundTheTagsIsTrimmed) {
    const Case cases[] = {
        {"  <A>x</A>\n", "<A>x</A>"},
        {"\t<A>x</A>\r\n", "<A>x</A>"},
        {" <A>x</A> trailing", "<A>x</A>"},
        {"leading <A>", "<A>"},
        {" <A> > more", "<A> >"},
        {"x<>", "<>"},
        // A text that is empty or begins with "<" is left as it is.
        {"", ""},
        {"<A>x</A>\n", "<A>x</A>\n"},
        {"<A", "<A"},
        {"<A> trailing\n", "<A> trailing\n"},
    };
    for (const Case &row : cases) {
        EXPECT_EQ(applied(trimXMLString, row.text), row.expected) << row.text;
    }
}

TEST(DescriptorText, TextWithoutATagBecomesEmpty) {
    for (const char *text : {"plain text\n", " \n", "\r\n", " >", " <", " > <", " x> y<z"}) {
        EXPECT_EQ(applied(trimXMLString, text), "") << text;
    }
}

TEST(DescriptorText, ValueIsWhatIsLeftOfSevenAndEightCharacters) {
    const Case cases[] = {
        {"<VALUE>x</VALUE>", "x"},
        {"<VALUE>two words</VALUE>", "two words"},
        {"<VALUE></VALUE>", ""},
        {"<VALUE>a<b>c</VALUE>", "a<b>c"},
        // Only the lengths count, not what the characters are.
        {"1234567value12345678", "value"},
        {"<VALUE>x</VALUE>\n", "x<"},  // the line break of a line in the first column
    };
    for (const Case &row : cases) {
        EXPECT_EQ(applied(getXmlTagData, row.text), row.expected) << row.text;
    }
}

TEST(DescriptorText, ValueLineShorterThanItsTagsBecomesEmpty) {
    for (std::size_t length = 0; length <= 15; ++length) {
        EXPECT_EQ(applied(getXmlTagData, std::string(length, 'x')), "") << length;
    }
    EXPECT_EQ(applied(getXmlTagData, std::string(16, 'x')), "x");
}

TEST(DescriptorText, NullIsLeftAlone) {
    trimXMLString(nullptr);
    getXmlTagData(nullptr);
}

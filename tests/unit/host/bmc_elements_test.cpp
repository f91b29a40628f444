// The typed fields of the controller's commands: what can be read, and what cannot.
#include "host/bmc/elements.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace velkhost::bmc {
namespace {

using ::testing::ElementsAre;
using ::testing::SizeIs;

auto read(const Bytes &bytes) {
    return read_elements(ByteCursor(bytes));
}

TEST(BmcElements, NothingIsNoElements) {
    EXPECT_THAT(read({}), ::testing::Optional(SizeIs(0)));
}

TEST(BmcElements, ReadsNumbersMostSignificantByteFirst) {
    const auto elements = read({0x44, 0x12, 0x34, 0x56, 0x78});
    ASSERT_THAT(elements, ::testing::Optional(SizeIs(1)));
    EXPECT_EQ(number_of(elements->front()), 0x12345678U);
}

TEST(BmcElements, ReadsSeveralNumbersInOneElement) {
    const auto elements = read({0x48, 0, 0, 0, 1, 0, 0, 0, 2});
    ASSERT_TRUE(elements);
    EXPECT_THAT(std::get<Numbers>(elements->front()), ElementsAre(1U, 2U));
    EXPECT_FALSE(number_of(elements->front())) << "they are two";
    EXPECT_EQ(in_words(elements->front()), "1,2");
}

TEST(BmcElements, ReadsTextsUpToTheirLength) {
    const auto elements = read({0x83, 'a', 'b', 'c', 0x80});
    ASSERT_THAT(elements, ::testing::Optional(SizeIs(2)));
    EXPECT_EQ(text_of((*elements)[0]), "abc");
    EXPECT_EQ(text_of((*elements)[1]), "");
}

TEST(BmcElements, ReadsBytes) {
    const auto elements = read({0x13, 1, 2, 3});
    ASSERT_TRUE(elements);
    EXPECT_EQ(std::get<Bytes>(elements->front()), (Bytes{1, 2, 3}));
    EXPECT_EQ(in_words(elements->front()), "[01 02 03]");
    EXPECT_FALSE(number_of(elements->front()));
    EXPECT_FALSE(text_of(elements->front()));
}

TEST(BmcElements, RefusesWhatIsCutOff) {
    EXPECT_FALSE(read({0x44, 1, 2, 3}));
    EXPECT_FALSE(read({0x86, 'X'}));
    EXPECT_FALSE(read({0x12, 1}));
    EXPECT_FALSE(read({0x44, 0, 0, 0, 5, 0x44}));
}

TEST(BmcElements, RefusesNumbersOfOtherSizesAndUnknownTypes) {
    EXPECT_FALSE(read({0x43, 1, 2, 3}));
    EXPECT_FALSE(read({0x40}));
    for (const std::uint8_t header : Bytes{0x00, 0x20, 0x30, 0x50, 0x60, 0x70}) {
        EXPECT_FALSE(read({header})) << int{header};
    }
}

TEST(BmcElements, WritesWhatItReads) {
    Bytes out;
    append_number(out, 0x80);
    append_text(out, "optfw");
    EXPECT_EQ(out, (Bytes{0x44, 0, 0, 0, 0x80, 0x85, 'o', 'p', 't', 'f', 'w'}));
}

TEST(BmcElements, CutsTextsAtTheLongestThatAHeaderCanTell) {
    Bytes out;
    append_text(out, std::string(200, 'x'));
    EXPECT_THAT(out, SizeIs(128));
    EXPECT_EQ(out.front(), 0xFF);
}

TEST(BmcElements, WordsKeepControlCharactersOut) {
    EXPECT_EQ(in_words(Element(std::string("a\nb c\x7F"))), "a?b?c?");
}

}  // namespace
}  // namespace velkhost::bmc

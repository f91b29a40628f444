// The typed fields of the controller's commands, byte for byte.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <array>
#include <string>
#include <vector>

#include "ipmi/payload_builders.h"

namespace {

using Bytes = std::vector<unsigned char>;

constexpr unsigned char kUntouched = 0xEE;

// What a builder wrote into a buffer of kUntouched, the bytes it must leave alone cut off, and what
// it returned.
struct Built {
    Bytes bytes;
    int length;
};

template <class Builder, class... Arguments>
Built build(Builder builder, Arguments... arguments) {
    std::array<unsigned char, 300> out{};
    out.fill(kUntouched);
    const int length = builder(out.data(), arguments...);
    std::size_t end = out.size();
    while (end > 0 && out[end - 1] == kUntouched) {
        --end;
    }
    return {Bytes(out.begin(), out.begin() + static_cast<std::ptrdiff_t>(end)), length};
}

}  // namespace

TEST(IpmiBuilders, DwordIsWrittenMostSignificantByteFirst) {
    const std::array<unsigned, 1> values{0x12345678};
    const Built built = build(build_dword_payload, values.data(), 1);
    EXPECT_EQ(built.bytes, (Bytes{0x44, 0x12, 0x34, 0x56, 0x78}));
    EXPECT_EQ(built.length, 5);
}

TEST(IpmiBuilders, DwordsFollowEachOther) {
    const std::array<unsigned, 3> values{1, 0xFFFFFFFF, 0x80000000};
    const Built built = build(build_dword_payload, values.data(), 3);
    EXPECT_EQ(built.bytes, (Bytes{0x4C, 0, 0, 0, 1, 0xFF, 0xFF, 0xFF, 0xFF, 0x80, 0, 0, 0}));
    EXPECT_EQ(built.length, 13);
}

TEST(IpmiBuilders, LengthOfFourDwordsIsLostInTheHeader) {
    const std::array<unsigned, 5> values{1, 2, 3, 4, 5};
    const Built four = build(build_dword_payload, values.data(), 4);
    EXPECT_EQ(four.bytes.front(), 0x40);
    EXPECT_EQ(four.length, 17);
    EXPECT_EQ(four.bytes.size(), 17U);
    const Built five = build(build_dword_payload, values.data(), 5);
    EXPECT_EQ(five.bytes.front(), 0x44);
    EXPECT_EQ(five.length, 21);
}

TEST(IpmiBuilders, NoDwordsAreAHeader) {
    const Built built = build(build_dword_payload, static_cast<const unsigned *>(nullptr), 0);
    EXPECT_EQ(built.bytes, (Bytes{0x40}));
    EXPECT_EQ(built.length, 1);
}

TEST(IpmiBuilders, BytesAreWrittenAsTheyAre) {
    const Bytes bytes{1, 2, 3};
    const Built built = build(build_byte_payload, bytes.data(), 3);
    EXPECT_EQ(built.bytes, (Bytes{0x13, 1, 2, 3}));
    EXPECT_EQ(built.length, 4);
}

TEST(IpmiBuilders, LengthOfSixteenBytesIsLostInTheHeader) {
    const Bytes bytes(17, 7);
    EXPECT_EQ(build(build_byte_payload, bytes.data(), 15).bytes.front(), 0x1F);
    const Built sixteen = build(build_byte_payload, bytes.data(), 16);
    EXPECT_EQ(sixteen.bytes.front(), 0x10);
    EXPECT_EQ(sixteen.length, 17);
    EXPECT_EQ(build(build_byte_payload, bytes.data(), 17).bytes.front(), 0x11);
}

TEST(IpmiBuilders, NoBytesAreAHeader) {
    const Bytes bytes{9};
    const Built built = build(build_byte_payload, bytes.data(), 0);
    EXPECT_EQ(built.bytes, (Bytes{0x10}));
    EXPECT_EQ(built.length, 1);
}

TEST(IpmiBuilders, TextHasATerminatorThatIsNotCounted) {
    const Built built = build(build_string_payload, "XFLASH");
    EXPECT_EQ(built.bytes, (Bytes{0x86, 'X', 'F', 'L', 'A', 'S', 'H', 0}));
    EXPECT_EQ(built.length, 7);
}

TEST(IpmiBuilders, EmptyTextIsAHeaderAndATerminator) {
    const Built built = build(build_string_payload, "");
    EXPECT_EQ(built.bytes, (Bytes{0x80, 0}));
    EXPECT_EQ(built.length, 1);
}

TEST(IpmiBuilders, TextLengthFillsTheLowSevenBits) {
    const std::string text(127, 'x');
    const Built built = build(build_string_payload, text.c_str());
    EXPECT_EQ(built.bytes.front(), 0xFF);
    EXPECT_EQ(built.length, 128);
    EXPECT_EQ(built.bytes.size(), 129U);
}

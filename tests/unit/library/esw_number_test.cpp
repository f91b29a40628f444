// The number in a job's primary status.

#include <gtest/gtest.h>

#include "installers/ESW_update.h"

TEST(HexadecimalNumber, DigitsFromTheThirdCharacterOnCount) {
    struct {
        const char *text;
        int number;
    } const cases[] = {
        {"0x1F", 31},
        {"0x1f", 31},
        {"0x0", 0},
        {"0x00", 0},
        {"0x10", 16},
        {"0x42", 66},
        {"0xabcdef", 0xABCDEF},
        {"0XABCDEF", 0xABCDEF},
        {"0x7fffffff", 0x7FFFFFFF},
        // Texts of up to two characters.
        {"", 0},
        {"0", 0},
        {"0x", 0},
        {"12", 0},
        // The first two are passed over whatever they are.
        {"ab12", 18},
        {"  12", 18},
        {"123", 3},
        // What is no digit counts as its distance from '0'.
        {"0xG", 23},
        {"0x/", -1},
        {"0x1 ", 0},
        {"0xg", 55},
        {"0x|", 76},
    };
    for (const auto &row : cases) {
        EXPECT_EQ(strHexToDec(row.text), row.number) << row.text;
    }
}

TEST(HexadecimalNumber, WhatDoesNotFitIsLost) {
    EXPECT_EQ(strHexToDec("0xffffffff"), -1);
    EXPECT_EQ(strHexToDec("0x123456789"), 0x23456789);
}

TEST(HexadecimalNumber, NullCountsAsAnEmptyText) {
    EXPECT_EQ(strHexToDec(nullptr), 0);
}

// Literals: strings with their escapes, characters, numbers in every base, lists, null; and what
// types take which.
#include "mof_testing.h"

namespace velkhost::mof::testing {
namespace {

using Texts = std::vector<std::string>;

Texts value_of(const std::string &member) {
    return property_of(member).default_value.value_or(Texts{"(null)"});
}

TEST(MofValues, EveryIntrinsicTypeHasItsCode) {
    EXPECT_EQ(property_of("uint8 P;").type.type, CMPI_uint8);
    EXPECT_EQ(property_of("uint16 P;").type.type, CMPI_uint16);
    EXPECT_EQ(property_of("uint32 P;").type.type, CMPI_uint32);
    EXPECT_EQ(property_of("uint64 P;").type.type, CMPI_uint64);
    EXPECT_EQ(property_of("sint8 P;").type.type, CMPI_sint8);
    EXPECT_EQ(property_of("sint16 P;").type.type, CMPI_sint16);
    EXPECT_EQ(property_of("sint32 P;").type.type, CMPI_sint32);
    EXPECT_EQ(property_of("sint64 P;").type.type, CMPI_sint64);
    EXPECT_EQ(property_of("real32 P;").type.type, CMPI_real32);
    EXPECT_EQ(property_of("real64 P;").type.type, CMPI_real64);
    EXPECT_EQ(property_of("boolean P;").type.type, CMPI_boolean);
    EXPECT_EQ(property_of("char16 P;").type.type, CMPI_char16);
    EXPECT_EQ(property_of("string P;").type.type, CMPI_string);
    EXPECT_EQ(property_of("DateTime P;").type.type, CMPI_dateTime);
}

TEST(MofValues, ArraysAreMarkedInTheType) {
    EXPECT_EQ(property_of("uint8 P[];").type.type, CMPI_uint8A);
    EXPECT_EQ(property_of("string P[10];").type.type, CMPI_stringA);
}

TEST(MofValues, IntegersOfEveryBaseComeOutDecimal) {
    EXPECT_EQ(value_of("uint32 P = 0;"), Texts{"0"});
    EXPECT_EQ(value_of("uint32 P = 4096;"), Texts{"4096"});
    EXPECT_EQ(value_of("uint32 P = +7;"), Texts{"7"});
    EXPECT_EQ(value_of("sint32 P = -7;"), Texts{"-7"});
    EXPECT_EQ(value_of("sint32 P = -0;"), Texts{"0"});
    EXPECT_EQ(value_of("uint32 P = 017;"), Texts{"15"});
    EXPECT_EQ(value_of("uint32 P = 0x1aF;"), Texts{"431"});
    EXPECT_EQ(value_of("sint32 P = -0X10;"), Texts{"-16"});
    EXPECT_EQ(value_of("uint32 P = 101b;"), Texts{"5"});
    EXPECT_EQ(value_of("uint32 P = 0101B;"), Texts{"5"});
    EXPECT_EQ(value_of("uint32 P = 0x1b;"), Texts{"27"});
}

TEST(MofValues, IntegersReachTheLimitsOfTheirTypes) {
    EXPECT_EQ(value_of("uint64 P = 18446744073709551615;"), Texts{"18446744073709551615"});
    EXPECT_EQ(value_of("sint64 P = -9223372036854775808;"), Texts{"-9223372036854775808"});
    EXPECT_EQ(value_of("sint8 P[] = {-128, 127};"), (Texts{"-128", "127"}));
}

TEST(MofValues, RealsKeepTheirSpelling) {
    EXPECT_EQ(value_of("real32 P = 1.5;"), Texts{"1.5"});
    EXPECT_EQ(value_of("real64 P = -.25e+3;"), Texts{"-.25e+3"});
    EXPECT_EQ(value_of("real64 P = +6.0E-7;"), Texts{"6.0E-7"});
    EXPECT_EQ(value_of("real64 P = 12;"), Texts{"12"});
}

TEST(MofValues, BooleansComeOutInLowerCase) {
    EXPECT_EQ(value_of("boolean P[] = {TRUE, False, true};"), (Texts{"true", "false", "true"}));
}

TEST(MofValues, NullAndNoInitialiserLeaveThePropertyNull) {
    EXPECT_FALSE(property_of("string P;").default_value.has_value());
    EXPECT_FALSE(property_of("string P = NULL;").default_value.has_value());
    EXPECT_FALSE(property_of("string P[] = null;").default_value.has_value());
}

TEST(MofValues, EmptyListIsNotNull) {
    EXPECT_EQ(value_of("uint16 P[] = {};"), Texts{});
}

TEST(MofValues, EscapesAreDecoded) {
    EXPECT_EQ(value_of(R"(string P = "a\tb\nc\r\f\b\"\'\\";)"), Texts{"a\tb\nc\r\f\b\"'\\"});
    EXPECT_EQ(value_of(R"(string P = "\x41\X042\x0043D";)"), Texts{"ABCD"});
    EXPECT_EQ(value_of(R"(string P = "\xe9\x20AC";)"), Texts{"\u00e9\u20ac"});
    EXPECT_EQ(value_of(R"(string P = "\xD83D\xDE00";)"), Texts{"\U0001F600"});
}

TEST(MofValues, AdjacentStringsAreOneValue) {
    EXPECT_EQ(value_of("string P = \"one \" /* and */ \"two \"\n // and\n \"three\";"),
              Texts{"one two three"});
    EXPECT_EQ(value_of(R"(string P[] = {"a" "b", "c"};)"), (Texts{"ab", "c"}));
}

TEST(MofValues, CommentMarksInStringsAreText) {
    EXPECT_EQ(value_of(R"(string P = "tftp://h/p /* no */";)"), Texts{"tftp://h/p /* no */"});
}

TEST(MofValues, CharactersAreDecoded) {
    EXPECT_EQ(value_of("char16 P[] = {'a', '\\n', '\\'', '\"', '\\x41', '\u20ac'};"),
              (Texts{"a", "\n", "'", "\"", "A", "\u20ac"}));
}

TEST(MofValues, DateTimesAreTimestampsOrIntervals) {
    EXPECT_EQ(value_of("datetime P = \"20240229123456.654321+060\";"),
              Texts{"20240229123456.654321+060"});
    EXPECT_EQ(value_of("datetime P = \"00000001020304.******:000\";"),
              Texts{"00000001020304.******:000"});
}

TEST(MofValues, ReferencesTakeAnObjectPathAsText) {
    const cim::PropertyDecl property = property_of(R"(CIM_X REF P = "CIM_X.Name=\"a\"";)");
    EXPECT_EQ(property.type.type, CMPI_ref);
    EXPECT_EQ(property.type.reference_class, "CIM_X");
    EXPECT_EQ(property.default_value, (Texts{"CIM_X.Name=\"a\""}));
}

TEST(MofValues, TextBeyondAsciiPassesUnchanged) {
    EXPECT_EQ(value_of("string P = \"\u00fcbung \U0001F600\";"), Texts{"\u00fcbung \U0001F600"});
}

}  // namespace
}  // namespace velkhost::mof::testing

// Neutral values, names, paths and instances.
#include "host/cim/instance.h"
#include "host/cim/names.h"

#include <gtest/gtest.h>

#include <limits>
#include <map>

namespace velkhost::cim {
namespace {

TEST(CimNames, IgnoreTheCaseOfAsciiLettersOnly) {
    EXPECT_TRUE(same_name("InstallFromURI", "installfromuri"));
    EXPECT_FALSE(same_name("a", "ab"));
    EXPECT_FALSE(same_name("\xC4", "\xE4"));
    const std::map<std::string, int, NameLess> map{{"Name", 1}};
    EXPECT_TRUE(map.contains(std::string_view("NAME")));
}

TEST(CimValue, TextsOfNumbersKeepTheBitsOfTheType) {
    EXPECT_EQ(value_from_text(CMPI_uint16, "70000"), Value::uint16(4464));
    EXPECT_EQ(value_from_text(CMPI_uint8, "0xff"), Value::uint8(255));
    EXPECT_EQ(value_from_text(CMPI_uint32, "-1"), Value::uint32(4294967295U));
    EXPECT_EQ(value_from_text(CMPI_sint32, "-7"), Value::sint32(-7));
    EXPECT_EQ(value_from_text(CMPI_sint8, "200"), (Value{CMPI_sint8, std::int64_t{-56}}));
    EXPECT_EQ(value_from_text(CMPI_sint64, "-9223372036854775808"),
              Value::sint64(std::numeric_limits<std::int64_t>::min()));
    EXPECT_EQ(value_from_text(CMPI_uint64, "+5"), Value::uint64(5));
}

TEST(CimValue, TextsOfOtherScalars) {
    EXPECT_EQ(value_from_text(CMPI_boolean, "TRUE"), Value::boolean(true));
    EXPECT_EQ(value_from_text(CMPI_boolean, "false"), Value::boolean(false));
    EXPECT_EQ(value_from_text(CMPI_real64, "2.5"), Value::real64(2.5));
    EXPECT_EQ(value_from_text(CMPI_string, ""), Value::string(""));
    EXPECT_EQ(value_from_text(CMPI_char16, "65"), (Value{CMPI_char16, std::uint64_t{65}}));
}

TEST(CimValue, MalformedTextsGiveNoValue) {
    for (const char *text : {"", "x", "1x", "0x", "--1", "1 ", "99999999999999999999"}) {
        EXPECT_EQ(value_from_text(CMPI_uint16, text), std::nullopt) << text;
    }
    EXPECT_EQ(value_from_text(CMPI_boolean, "1"), std::nullopt);
    EXPECT_EQ(value_from_text(CMPI_real32, "1,5"), std::nullopt);
    EXPECT_EQ(value_from_text(CMPI_ref, "x"), std::nullopt);
    EXPECT_EQ(value_from_text(CMPI_uint16A, "1"), std::nullopt);
    EXPECT_EQ(value_from_text(CMPIType{5}, "1"), std::nullopt);
}

TEST(CimValue, TypeNamesGoBothWays) {
    for (const char *name :
         {"boolean", "char16", "real32", "real64", "uint8", "uint16", "uint32", "uint64", "sint8",
          "sint16", "sint32", "sint64", "string", "datetime", "reference"}) {
        EXPECT_EQ(type_name(type_from_name(name)), name);
    }
    EXPECT_EQ(type_name(CMPI_uint16A), "uint16[]");
    EXPECT_EQ(type_name(CMPI_chars), "string");
    EXPECT_EQ(type_name(CMPIType{5}), "unknown");
    EXPECT_EQ(type_from_name("UINT16"), CMPI_uint16);
    EXPECT_EQ(type_from_name("nope"), CMPI_null);
}

TEST(CimValue, AccessorsGiveWhatTheValueIs) {
    EXPECT_EQ(Value::uint32(5).as_signed(), 5);
    EXPECT_EQ(Value::sint32(-5).as_unsigned(), std::nullopt);
    EXPECT_EQ(Value::sint32(5).as_unsigned(), 5U);
    EXPECT_EQ(Value::uint64(~0ULL).as_signed(), std::nullopt);
    EXPECT_EQ(Value::string("x").as_text(), "x");
    EXPECT_EQ(Value::string("x").as_unsigned(), std::nullopt);
    EXPECT_EQ(Value::boolean(true).as_bool(), true);
    EXPECT_EQ(Value::uint8(1).as_text(), std::nullopt);
    EXPECT_EQ(Value::reference({}).as_instance(), nullptr);
    EXPECT_NE(Value::reference({}).as_path(), nullptr);
    EXPECT_EQ(Value::array(CMPI_uint8, {}).as_array()->size(), 0U);
    EXPECT_TRUE(Value::array(CMPI_uint8, {}).is_array());
    EXPECT_TRUE(Value{}.is_null());
    EXPECT_TRUE((Value{CMPI_string, NullText{}}.is_null()));
    EXPECT_EQ(Value::null(CMPI_uint8).type(), CMPI_uint8);
}

TEST(CimValue, EqualityIsDeepAndTyped) {
    const ObjectPath path{"", "a", "B", {{"K", Value::string("v")}}};
    EXPECT_EQ(Value::reference(path),
              Value::reference({"", "A", "b", {{"k", Value::string("v")}}}));
    EXPECT_NE(Value::uint8(1), Value::uint16(1));
    EXPECT_NE(Value::null(CMPI_string), (Value{CMPI_string, NullText{}}));
    EXPECT_EQ(Value::instance({path, {}}), Value::instance({path, {}}));
    EXPECT_NE(Value::instance({path, {}}), Value::instance({path, {{"P", Value::uint8(1)}}}));
    const Value block{CMPI_ptr, CMPIValuePtr{nullptr, 3}};
    EXPECT_EQ(block, block);
}

TEST(CimValue, TextsForPeople) {
    EXPECT_EQ(to_text(Value::string("say \"hi\\\"")), R"("say \"hi\\\"")");
    EXPECT_EQ(to_text(Value::array(CMPI_sint32, {Value::sint32(-1), Value::null(CMPI_sint32)})),
              "{-1, NULL}");
    EXPECT_EQ(to_text(Value::boolean(false)), "false");
    EXPECT_EQ(to_text(Value::real64(0.5)), "0.5");
    EXPECT_EQ(to_text(Value{CMPI_string, NullText{}}), "NULL");
    EXPECT_EQ(to_text(Value{CMPI_ptr, CMPIValuePtr{nullptr, 3}}), "pointer to 3 bytes");
    const ObjectPath path{"h", "n", "C", {{"A", Value::uint8(1)}, {"B", Value::string("x")}}};
    EXPECT_EQ(to_text(Value::reference(path)), "//h/n:C.A=1,B=\"x\"");
    EXPECT_EQ(to_text(Value::instance({path, {{"P", Value::boolean(true)}}})),
              "instance of C { P=true }");
}

TEST(CimNamedValues, SetReplacesByNameAndKeepsThePlace) {
    NamedValues values{{"A", Value::uint8(1)}, {"B", Value::uint8(2)}, {"a", Value::uint8(3)}};
    EXPECT_EQ(values.size(), 2U);
    EXPECT_EQ(values[0].name, "A");
    EXPECT_EQ(values[0].value, Value::uint8(3));
    EXPECT_EQ(values.find("C"), nullptr);
    values.erase_if([](const NamedValue &item) { return item.name == "A"; });
    EXPECT_EQ(to_text(values), "B=2");
}

TEST(CimNamedValues, EqualityIgnoresTheOrder) {
    EXPECT_EQ((NamedValues{{"A", Value::uint8(1)}, {"B", Value::uint8(2)}}),
              (NamedValues{{"b", Value::uint8(2)}, {"a", Value::uint8(1)}}));
    EXPECT_NE((NamedValues{{"A", Value::uint8(1)}}), (NamedValues{{"A", Value::uint8(2)}}));
    EXPECT_NE((NamedValues{{"A", Value::uint8(1)}}), NamedValues{});
}

}  // namespace
}  // namespace velkhost::cim

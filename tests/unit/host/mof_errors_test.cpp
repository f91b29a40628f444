// Every message, letter for letter, with its place; and how much one mistake spoils.
#include "mof_testing.h"

#include <gmock/gmock.h>

namespace velkhost::mof::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::SizeIs;
using ::testing::StartsWith;

struct Mistake {
    const char *name;
    const char *text;
    const char *message;
};

std::string name_of(const ::testing::TestParamInfo<Mistake> &info) {
    return info.param.name;
}

class MofErrors : public ::testing::TestWithParam<Mistake> {};

TEST_P(MofErrors, OneMistakeGivesOneExactMessage) {
    EXPECT_THAT(errors_of(GetParam().text),
                ElementsAre(std::string{"t.mof:"} + GetParam().message));
}

// clang-format off
INSTANTIATE_TEST_SUITE_P(Words, MofErrors, ::testing::Values(
    Mistake{"StrayCharacter", "class T {\n  string A; @@@ \n};",
            "2:13: expected a declaration, a name or a value, found '@'"},
    Mistake{"ControlCharacter", "\x01 class T {};",
            "1:1: expected a declaration, a name or a value, found '\\x01'"},
    Mistake{"NotUtf8", "class T {};\n/* \xC3\x28 */",
            "2:4: expected a text in UTF-8, found the byte '\xC3'"},
    Mistake{"BadEscape", "class T { string A = \"x\\qy\"; };",
            "1:24: expected \\b \\t \\n \\f \\r \\\" \\' \\\\ or \\x with 1 to 4 hexadecimal digits, found '\\q'"},
    Mistake{"EscapeWithoutDigits", "class T { string A = \"\\xg\"; };",
            "1:23: expected \\b \\t \\n \\f \\r \\\" \\' \\\\ or \\x with 1 to 4 hexadecimal digits, found '\\x'"},
    Mistake{"EscapedNul", "class T { string A = \"\\x0000\"; };",
            "1:23: expected \\b \\t \\n \\f \\r \\\" \\' \\\\ or \\x with 1 to 4 hexadecimal digits, found '\\x0000'"},
    Mistake{"LoneSurrogate", "class T { string A = \"\\xD83Dz\"; };",
            "1:23: expected \\b \\t \\n \\f \\r \\\" \\' \\\\ or \\x with 1 to 4 hexadecimal digits, found '\\xD83D'"},
    Mistake{"StringOpenAtLineEnd", "class T {\n string A = \"abc;\n string B;\n};",
            "2:13: expected a closing \" on the same line, found end of line"},
    Mistake{"BackslashAtLineEnd", "class T {\n string A = \"abc\\\n; };",
            "2:13: expected a closing \" on the same line, found end of line"},
    Mistake{"BadEscapeBeyondAscii", "class T { string A = \"\\\u20ac\"; };",
            "1:23: expected \\b \\t \\n \\f \\r \\\" \\' \\\\ or \\x with 1 to 4 hexadecimal digits, found '\\\u20ac'"},
    Mistake{"StringOpenAtFileEnd", "class T {}; \"abc\\",
            "1:13: expected a closing \" on the same line, found end of file"},
    Mistake{"CommentOpenAtFileEnd", "class T {\n /* string A; };",
            "2:2: expected */ to end this comment, found end of file"},
    Mistake{"EmptyCharacter", "class T { char16 A = ''; };",
            "1:22: expected one 16-bit character in quotes, found ''''"},
    Mistake{"TwoCharacters", "class T { char16 A = 'ab'; };",
            "1:22: expected one 16-bit character in quotes, found ''ab''"},
    Mistake{"CharacterBeyond16Bits", "class T { char16 A = '\xF0\x9F\x98\x80'; };",
            "1:22: expected one 16-bit character in quotes, found ''\xF0\x9F\x98\x80''"},
    Mistake{"BadOctal", "class T { uint8 A = 08; };",
            "1:21: expected a number that 64 bits can hold, found '08'"},
    Mistake{"BadHexadecimal", "class T { uint8 A = 0x; };",
            "1:21: expected a number that 64 bits can hold, found '0x'"},
    Mistake{"BadBinary", "class T { uint8 A = 121b; };",
            "1:21: expected a number that 64 bits can hold, found '121b'"},
    Mistake{"BadReal", "class T { real32 A = 1.; };",
            "1:22: expected a number that 64 bits can hold, found '1.'"},
    Mistake{"HugeInteger", "class T { uint64 A = 18446744073709551616; };",
            "1:22: expected a number that 64 bits can hold, found '18446744073709551616'"},
    Mistake{"HugeReal", "class T { real64 A = 1.0e999; };",
            "1:22: expected a number that 64 bits can hold, found '1.0e999'"}),
    name_of);

INSTANTIATE_TEST_SUITE_P(Declarations, MofErrors, ::testing::Values(
    Mistake{"Garbage", "hello world;",
            "1:1: expected a class, a qualifier declaration or a pragma, found 'hello'"},
    Mistake{"QualifiersOnNothing", "[Key];",
            "1:6: expected a class, a qualifier declaration or a pragma, found ';'"},
    Mistake{"Instance", "instance of CIM_X as $x { A = {1}; B = \"}\"; };\nclass T {};",
            "1:1: expected a class or qualifier declaration (instances come from providers, not from MOF), found 'instance'"},
    Mistake{"NoClassName", "class {};", "1:7: expected a class name, found '{'"},
    Mistake{"NoBrace", "class T string A; ", "1:9: expected '{' to begin the members of class 'T', found 'string'"},
    Mistake{"NoSuperclassName", "class T : {};", "1:11: expected the name of the superclass, found '{'"},
    Mistake{"UnknownSuperclass", "class T : Q { string A; };",
            "1:11: expected a superclass that is declared before, found 'Q'"},
    Mistake{"OwnSuperclass", "class T : t {};",
            "1:11: expected a superclass that is declared before, found 't'"},
    Mistake{"ClassTwice", "class T {};\n\n  class t {};",
            "3:9: expected a new class, found 't' (declared at t.mof:1:7)"},
    Mistake{"NoClosingBrace", "class T {\n string A;\n",
            "3:1: expected '}' at the end of class 'T', found end of file"},
    Mistake{"NextClassInside", "class T {\n string A;\n[Key] class U : T {};",
            "3:7: expected '}' at the end of class 'T', found 'class'"},
    Mistake{"NoSemicolonAfterClass", "class T {}\nclass U : T {};",
            "2:1: expected ';' after class 'T', found 'class'"},
    Mistake{"Alias", "class T as $A {};", "1:9: expected '{' to begin the members of class 'T', found 'as'"},
    Mistake{"LongNameBeyondAscii", "classsssssssssssssssssssssssssssssssss\u20ac\u20ac T;",
            "1:1: expected a class, a qualifier declaration or a pragma, found 'classsssssssssssssssssssssssssssssssss...'"},
    Mistake{"LongName", "classssssssssssssssssssssssssssssssssssssssssssss T;",
            "1:1: expected a class, a qualifier declaration or a pragma, found 'classsssssssssssssssssssssssssssssssssss...'"}),
    name_of);

INSTANTIATE_TEST_SUITE_P(Members, MofErrors, ::testing::Values(
    Mistake{"UnknownType", "class T { strin A; };",
            "1:11: expected an intrinsic type or a class name with REF, found 'strin'"},
    Mistake{"NoType", "class T { = 1; };", "1:11: expected a type, found '='"},
    Mistake{"NoName", "class T { string ; };", "1:18: expected a name behind the type, found ';'"},
    Mistake{"ReferenceToIntrinsic", "class T { string REF A; };",
            "1:11: expected a class name before REF, found 'string'"},
    Mistake{"PropertyTwice", "class T { string A;\n uint8 a; };",
            "2:8: expected a new property of this class, found 'a' (declared at t.mof:1:18)"},
    Mistake{"MethodTwice", "class T { uint8 M();\n uint8 M(string A); };",
            "2:8: expected a new method of this class, found 'M' (declared at t.mof:1:17)"},
    Mistake{"ParameterTwice", "class T { uint8 M(string A, uint8 a); };",
            "1:35: expected a new parameter of this method, found 'a' (declared at t.mof:1:26)"},
    Mistake{"NoSemicolon", "class T { string A string B; };",
            "1:20: expected ';' after property 'A', found 'string'"},
    Mistake{"NoSemicolonAtEnd", "class T { string A };",
            "1:20: expected ';' after property 'A', found '}'"},
    Mistake{"NoSemicolonAfterMethod", "class T { uint8 M() };",
            "1:21: expected ';' after method 'M', found '}'"},
    Mistake{"ParametersNotSeparated", "class T { uint8 M(string A uint8 B); };",
            "1:28: expected ')' or ',' in the parameters of method 'M', found 'uint8'"},
    Mistake{"ParameterMissing", "class T { uint8 M(string A, ); };",
            "1:29: expected a type, found ')'"},
    Mistake{"MethodReturnsReference", "class T { CIM_X REF M(); };",
            "1:21: expected a method with an intrinsic return type, found a reference"},
    Mistake{"MethodReturnsNothing", "class T { void M(); };",
            "1:11: expected an intrinsic type or a class name with REF, found 'void'"},
    Mistake{"ArrayOfReferences", "class T { CIM_X REF A[]; };",
            "1:21: expected a single reference, found the array 'A'"},
    Mistake{"ArraySize", "class T { uint8 A[0]; };",
            "1:19: expected the size of an array or ']', found '0'"},
    Mistake{"ArrayBracket", "class T { uint8 A[4; };",
            "1:20: expected ']' after the size of an array, found ';'"}),
    name_of);

INSTANTIATE_TEST_SUITE_P(Values, MofErrors, ::testing::Values(
    Mistake{"NoValue", "class T { string A = ; };", "1:22: expected a value, found ';'"},
    Mistake{"Word", "class T { string A = abc; };", "1:22: expected a value, found 'abc'"},
    Mistake{"NullInList", "class T { uint8 A[] = {1, null}; };", "1:27: expected a value, found 'null'"},
    Mistake{"ListNotClosed", "class T { uint8 A[] = {1, 2; uint8 B; };",
            "1:28: expected '}' or ',' in a list of values, found ';'"},
    Mistake{"ListForOne", "class T { uint8 A = {1}; };",
            "1:21: expected one value, found a list of values"},
    Mistake{"OneForList", "class T { uint8 A[] = 1; };",
            "1:23: expected a list of values in braces, found one value"},
    Mistake{"TooManyForSize", "class T { uint8 A[2] = {1, 2, 3}; };",
            "1:24: expected at most 2 values, found 3"},
    Mistake{"TooLarge", "class T { uint8 A = 256; };",
            "1:21: expected a uint8 value (0 to 255), found '256'"},
    Mistake{"Negative", "class T { uint16 A = -1; };",
            "1:22: expected a uint16 value (0 to 65535), found '-1'"},
    Mistake{"TooSmall", "class T { sint8 A = -129; };",
            "1:21: expected a sint8 value (-128 to 127), found '-129'"},
    Mistake{"StringForInteger", "class T { uint32 A = \"1\"; };",
            "1:22: expected a uint32 value (0 to 4294967295), found string '1'"},
    Mistake{"IntegerForString", "class T { string A = 1; };",
            "1:22: expected a string value, found '1'"},
    Mistake{"RealForInteger", "class T { sint64 A = 1.5; };",
            "1:22: expected a sint64 value (-9223372036854775808 to 9223372036854775807), found '1.5'"},
    Mistake{"StringForBoolean", "class T { boolean A = \"true\"; };",
            "1:23: expected a boolean value, found string 'true'"},
    Mistake{"StringForCharacter", "class T { char16 A = \"a\"; };",
            "1:22: expected a char16 value, found string 'a'"},
    Mistake{"BooleanForReal", "class T { real32 A = true; };",
            "1:22: expected a real32 value, found 'true'"},
    Mistake{"DoubleForFloat", "class T { real32 A = 1.0e99; };",
            "1:22: expected a real32 value, found '1.0e99'"},
    Mistake{"ShortDateTime", "class T { datetime A = \"2024\"; };",
            "1:24: expected a datetime value, found string '2024'"},
    Mistake{"WrongDateTime", "class T { datetime A = \"20240101000000.000000:060\"; };",
            "1:24: expected a datetime value, found string '20240101000000.000000:060'"},
    Mistake{"NumberForReference", "class T { CIM_X REF A = 1; };",
            "1:25: expected a reference value, found '1'"}),
    name_of);

INSTANTIATE_TEST_SUITE_P(Qualifiers, MofErrors, ::testing::Values(
    Mistake{"NoName", "[,] class T {};", "1:2: expected a qualifier name, found ','"},
    Mistake{"ListNotClosed", "[Key class T {};", "1:6: expected ']' or ',' in a list of qualifiers, found 'class'"},
    Mistake{"ValueNotClosed", "[Key(true] class T {};", "1:10: expected ')' after the value of a qualifier, found ']'"},
    Mistake{"Twice", "[A, a] class T {};",
            "1:5: expected a new qualifier of this list, found 'a' (declared at t.mof:1:2)"},
    Mistake{"UnknownFlavor", "[A : Sweet] class T {};", "1:6: expected a qualifier flavor, found 'Sweet'"},
    Mistake{"NotOfItsType", "Qualifier Key : boolean, Scope(any);\n[Key(1)] class T {};",
            "2:6: expected a boolean value, found '1'"},
    Mistake{"ListForOne", "Qualifier Key : boolean, Scope(any);\n[Key{true}] class T {};",
            "2:5: expected one value, found a list of values"},
    Mistake{"NotOnAClass", "Qualifier Key : boolean, Scope(property);\n[Key] class T {};",
            "2:2: expected a qualifier for a class or association or indication, found 'Key'"},
    Mistake{"NotOnAReference", "Qualifier Q : boolean, Scope(property);\nclass T { [Q] T REF A; };",
            "2:12: expected a qualifier for a reference, found 'Q'"},
    Mistake{"NotOnAParameter", "Qualifier Q : boolean, Scope(method);\nclass T { [Q] uint8 M([q] string A); };",
            "2:24: expected a qualifier for a parameter, found 'q'"},
    Mistake{"DeclaredTwice", "Qualifier A : string, Scope(any);\nQualifier a : string, Scope(any);",
            "2:11: expected a new qualifier, found 'a' (declared at t.mof:1:11)"},
    Mistake{"NoColon", "Qualifier A string;", "1:13: expected ':' before the type of the qualifier, found 'string'"},
    Mistake{"UnknownType", "Qualifier A : text, Scope(any);", "1:15: expected an intrinsic type, found 'text'"},
    Mistake{"NoScope", "Qualifier A : string;", "1:21: expected ',' before the scope of the qualifier, found ';'"},
    Mistake{"NoScopeWord", "Qualifier A : string, Flavor(ToSubclass);", "1:23: expected 'scope' of the qualifier, found 'Flavor'"},
    Mistake{"UnknownScope", "Qualifier A : string, Scope(world);", "1:29: expected a kind of CIM element, found 'world'"},
    Mistake{"UnknownDeclaredFlavor", "Qualifier A : string, Scope(any), Flavor(Sour);", "1:42: expected a qualifier flavor, found 'Sour'"},
    Mistake{"BadDefault", "Qualifier A : uint8 = 300, Scope(any);", "1:23: expected a uint8 value (0 to 255), found '300'"},
    Mistake{"DeclarationNotClosed", "Qualifier A : string, Scope(any) class T {};", "1:34: expected ';' after a qualifier declaration, found 'class'"}),
    name_of);

INSTANTIATE_TEST_SUITE_P(Pragmas, MofErrors, ::testing::Values(
    Mistake{"NotPragma", "#include \"x\";", "1:2: expected 'pragma' after '#', found 'include'"},
    Mistake{"NoArgument", "#pragma include ();", "1:18: expected a string, found ')'"},
    Mistake{"NotClosed", "#pragma namespace (\"a\";", "1:23: expected ')' after the argument of a pragma, found ';'"},
    Mistake{"EmptyNamespace", "#pragma namespace (\"\")", "1:20: expected the name of a namespace without a host, found string ''"},
    Mistake{"NamespaceWithHost", "#pragma namespace (\"//host/root/cimv2\")",
            "1:20: expected the name of a namespace without a host, found string '//host/root/cimv2'"},
    Mistake{"IncludeNothing", "#pragma include (\"no-such.mof\")",
            "1:18: expected a file to include, found no such file at 'no-such.mof'"}),
    name_of);
// clang-format on

TEST(MofRecovery, EachBadMemberIsToldOnce) {
    EXPECT_THAT(errors_of("class T {\n"
                          "  strin A = {1, {2}}; string B = 5;\n"
                          "  [Key string C;\n"
                          "  uint8 D[] = {1, 2 3};\n"
                          "  uint32 M(string, [In] x Y);\n"
                          "  string Good;\n"
                          "};\n"
                          "class U : T { sint8 E = 200; };"),
                ElementsAre(StartsWith("t.mof:2:3: expected an intrinsic type"),
                            "t.mof:2:34: expected a string value, found '5'",
                            StartsWith("t.mof:3:8: expected ']'"),
                            StartsWith("t.mof:4:21: expected '}' or ','"),
                            "t.mof:5:18: expected a name behind the type, found ','",
                            StartsWith("t.mof:8:25: expected a sint8 value")));
}

TEST(MofRecovery, ClassBehindABadDeclarationIsRead) {
    EXPECT_THAT(errors_of("class { string A; uint8 M(); };\nclass T { string 5; };"),
                ElementsAre("t.mof:1:7: expected a class name, found '{'",
                            "t.mof:2:18: expected a name behind the type, found '5'"));
}

TEST(MofRecovery, StrayClosingBracesDoNotEndTheReading) {
    EXPECT_THAT(errors_of("}};\nclass T { uint8 A = x; };"), SizeIs(2));
}

TEST(MofRecovery, ClassWithAnErrorStillCountsAsSuperclass) {
    EXPECT_THAT(errors_of("class T { int A; };\nclass U : T {};"), SizeIs(1));
}

TEST(MofRecovery, NothingIsDeclaredWhenAnythingIsWrong) {
    const CompileResult result = compile_text("class T {}; class U { int A; };", "t.mof");
    EXPECT_FALSE(result.ok());
    EXPECT_TRUE(result.units.empty());
}

TEST(MofRecovery, ErrorsEndAtTheLimitAndSaySo) {
    std::string text = "class T {\n";
    for (int line = 0; line < 1000; ++line) {
        text += "int A;\n";
    }
    const std::vector<std::string> errors = errors_of(text + "};");
    ASSERT_THAT(errors, SizeIs(ErrorList::kMaxErrors));
    EXPECT_THAT(errors.back(), ::testing::EndsWith("(too many errors, the rest is not read)"));
    EXPECT_THAT(errors.back(), StartsWith("t.mof:21:1: "));
}

TEST(MofErrorPlace, ColumnsCountCharactersNotBytes) {
    EXPECT_THAT(errors_of("/* \u00e4\u20ac\U0001F600 */ x"),
                ElementsAre(StartsWith("t.mof:1:11: ")));
}

TEST(MofErrorPlace, KnownClassOfTheRepositoryHasNoPlace) {
    const CompileResult result = compile_text("class Cim_Base {};", "t.mof", {"a", {"CIM_Base"}});
    EXPECT_EQ(result.error_text(),
              "t.mof:1:7: expected a new class, found 'Cim_Base' (declared before)\n");
}

}  // namespace
}  // namespace velkhost::mof::testing

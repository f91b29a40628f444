// Files that include files.
#include "mof_testing.h"

namespace velkhost::mof::testing {
namespace {

class MofInclude : public SourceFolder {};

TEST_F(MofInclude, IsRelativeToTheIncludingFile) {
    write("base/types.mof", "class Base {};");
    write("base/all.mof", "#pragma include (\"types.mof\")\nclass Middle : Base {};");
    const auto main =
        write("main.mof", "#pragma include (\"base/all.mof\")\nclass Top : Middle {};");
    const CompileResult result = compile_file(main);
    ASSERT_TRUE(result.ok()) << result.error_text();
    ASSERT_EQ(result.units.size(), 1U);
    ASSERT_EQ(result.units[0].classes.size(), 3U);
    EXPECT_EQ(result.units[0].classes[0].name, "Base");
    EXPECT_EQ(result.units[0].classes[1].name, "Middle");
    EXPECT_EQ(result.units[0].classes[2].name, "Top");
}

TEST_F(MofInclude, GoesIntoTheNamespaceOfTheIncludingFile) {
    write("base.mof", "class Base {};\n#pragma namespace (\"other\")\nclass Else {};");
    const auto main = write("main.mof",
                            "#pragma namespace (\"velk/cimv2\")\n"
                            "#pragma include (\"base.mof\")\nclass Top : Base {};");
    const CompileResult result = compile_file(main);
    ASSERT_TRUE(result.ok()) << result.error_text();
    ASSERT_EQ(result.units.size(), 2U);
    EXPECT_EQ(result.units[0].name_space, "velk/cimv2");
    EXPECT_EQ(result.units[0].classes.size(), 2U);
    EXPECT_EQ(result.units[1].name_space, "other");
    EXPECT_EQ(result.units[1].classes.size(), 1U);
}

TEST_F(MofInclude, CountsOncePerNamespace) {
    write("base.mof", "class Base {};");
    write("a.mof", "#pragma include (\"base.mof\")\nclass A : Base {};");
    write("b.mof", "#pragma include (\"./x/../base.mof\")\nclass B : Base {};");
    const auto main = write("main.mof",
                            "#pragma include (\"a.mof\")\n#pragma include (\"b.mof\")\n"
                            "#pragma namespace (\"second\")\n#pragma include (\"b.mof\")");
    const CompileResult result = compile_file(main);
    ASSERT_TRUE(result.ok()) << result.error_text();
    ASSERT_EQ(result.units.size(), 2U);
    EXPECT_EQ(result.units[0].classes.size(), 3U);
    EXPECT_EQ(result.units[1].classes.size(), 2U);
}

TEST_F(MofInclude, CycleIsRefusedWhereItCloses) {
    write("b.mof", "// back\n  #pragma include (\"a.mof\")");
    const auto main = write("a.mof", "#pragma include (\"b.mof\")");
    EXPECT_EQ(compile_file(main).error_text(),
              at("b.mof",
                 "2:20: expected a file to include, found a file that is still being "
                 "read at " +
                     quoted("a.mof")));
}

TEST_F(MofInclude, FileThatIncludesItselfIsRefused) {
    const auto main = write("a.mof", "#pragma include (\"a.mof\")");
    EXPECT_EQ(compile_file(main).errors.size(), 1U);
}

TEST_F(MofInclude, FolderIsNoFile) {
    write("sub/x.mof", "");
    const auto main = write("a.mof", "#pragma include (\"sub\")");
    EXPECT_EQ(
        compile_file(main).error_text(),
        at("a.mof", "1:18: expected a file to include, found no regular file at " + quoted("sub")));
}

TEST_F(MofInclude, NestingHasALimit) {
    for (int depth = 0; depth < 40; ++depth) {
        write("f" + std::to_string(depth) + ".mof",
              "#pragma include (\"f" + std::to_string(depth + 1) + ".mof\")");
    }
    EXPECT_EQ(compile_file(path("f0.mof")).error_text(),
              at("f15.mof",
                 "1:18: expected a file to include, found includes nested deeper than "
                 "16 at " +
                     quoted("f16.mof")));
}

TEST_F(MofInclude, ErrorsNameTheIncludedFileAndReadingGoesOn) {
    write("b.mof", "class B {\n  int X;\n};");
    const auto main = write("a.mof", "#pragma include (\"b.mof\")\nclass A : B { int Y; };");
    const std::string expected = "expected an intrinsic type or a class name with REF, found 'int'";
    EXPECT_EQ(compile_file(main).error_text(),
              at("b.mof", "2:3: " + expected) + at("a.mof", "2:15: " + expected));
}

TEST_F(MofInclude, RedefinitionNamesTheFileOfTheFirst) {
    write("b.mof", "class B {};");
    const auto main = write("a.mof", "#pragma include (\"b.mof\")\nclass b {};");
    EXPECT_EQ(compile_file(main).error_text(),
              at("a.mof", "2:7: expected a new class, found 'b' (declared at " +
                              path("b.mof").string() + ":1:7)"));
}

TEST_F(MofInclude, OpenBraceOfAnIncludedFileStaysInIt) {
    write("b.mof", "class B { string X;");
    const auto main = write("a.mof", "#pragma include (\"b.mof\")\n};");
    EXPECT_EQ(compile_file(main).errors.size(), 2U);
}

TEST_F(MofInclude, MissingMainFileIsAnError) {
    EXPECT_EQ(compile_file(path("none.mof")).error_text(),
              at("none.mof", "1:1: expected a readable file, found no such file"));
}

}  // namespace
}  // namespace velkhost::mof::testing

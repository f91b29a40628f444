// The lines of a descriptor: where they begin and end, how long they are, and files that stop in
// the middle.

#include "tests/unit/library/descriptor_fixture.h"

namespace {

using velktest::property;
using velktest::set_field;
using velktest::value_line;

class DescriptorLines : public velktest::DescriptorTest {
  protected:
    static constexpr const char *kNameHeader = "  <PROPERTY NAME=\"Name\" TYPE=\"string\">\n";
};

}  // namespace

TEST_F(DescriptorLines, IndentedLinesAreRecognisedHoweverTheyEnd) {
    struct {
        const char *before, *after;
    } const cases[] = {
        {" ", "\n"}, {"\t", "\n"}, {"  \t ", "\r\n"}, {" ", "\r\n"}, {" ", "  \n"}, {"x ", " y\n"},
    };
    for (const auto &row : cases) {
        set_field(package().Name, "");
        parse(std::string(row.before) + R"(<PROPERTY NAME="Name" TYPE="string">)" + row.after +
              row.before + "<VALUE>N</VALUE>" + row.after);
        EXPECT_STREQ(package().Name, "N") << row.before << row.after;
    }
}

TEST_F(DescriptorLines, HeaderInTheFirstColumnIsNeverRecognised) {
    set_field(package().Name, "left");
    parse("<PROPERTY NAME=\"Name\" TYPE=\"string\">\n" + value_line("N"));
    EXPECT_STREQ(package().Name, "left");
    parse("<PROPERTY NAME=\"Name\" TYPE=\"string\">\r\n" + value_line("N"));
    EXPECT_STREQ(package().Name, "left");
}

TEST_F(DescriptorLines, HeaderInTheFirstColumnOfALastLineWithoutABreakIsRecognised) {
    set_field(package().Name, "left");
    parse(R"(<PROPERTY NAME="Name" TYPE="string">)");
    EXPECT_STREQ(package().Name, "") << "but no value follows it";
}

TEST_F(DescriptorLines, ValueInTheFirstColumnKeepsAStrayCharacter) {
    parse(std::string(kNameHeader) + "<VALUE>N</VALUE>\n");
    EXPECT_STREQ(package().Name, "N<");
    parse(std::string(kNameHeader) + "<VALUE>N</VALUE>\r\n");
    EXPECT_STREQ(package().Name, "N</");
}

TEST_F(DescriptorLines, HeaderMustFitLetterForLetter) {
    set_field(package().Name, "left");
    for (const char *header : {
             "  <PROPERTY NAME=\"name\" TYPE=\"string\">\n",
             "  <property NAME=\"Name\" TYPE=\"string\">\n",
             "  <PROPERTY NAME='Name' TYPE='string'>\n",
             "  <PROPERTY TYPE=\"string\" NAME=\"Name\">\n",
             "  <PROPERTY  NAME=\"Name\" TYPE=\"string\">\n",
             "  <PROPERTY NAME=\"Name\" TYPE=\"uint16\">\n",
             "  <PROPERTY NAME=\"Name\" TYPE=\"string\"><VALUE>N</VALUE>\n",
             "  <PROPERTY.ARRAY NAME=\"Name\" TYPE=\"string\">\n",
         }) {
        parse(header + value_line("N"));
        EXPECT_STREQ(package().Name, "left") << header;
    }
    set_field(package().type, "left");
    parse("  <PROPERTY NAME=\"type\" TYPE=\"string\">\n" + value_line("1"));
    EXPECT_STREQ(package().type, "left");
}

TEST_F(DescriptorLines, WhateverFollowsAHeaderIsItsValueLine) {
    struct {
        const char *line, *value;
    } const cases[] = {
        {"    <VALUE>12345678</VALUE>\n", "12345678"},
        {"    <VALUE></VALUE>\n", ""},
        {"    <VALUE/>\n", ""},  // shorter than the two tags
        {"\n", ""},
        {"    plain text without tags\n", ""},
        {"    <VALUE>N</VALUE></PROPERTY>\n", "N</VALUE></P"},   // 8 characters of whatever
        {"    <VALUE TYPE=\"x\">N</VALUE>\n", R"(TYPE="x">N)"},  // and the 7 before it
    };
    for (const auto &row : cases) {
        set_field(package().Name, "left");
        parse(kNameHeader + std::string(row.line));
        EXPECT_STREQ(package().Name, row.value) << row.line;
    }
}

TEST_F(DescriptorLines, HeaderThatStandsInPlaceOfAValueIsNotTakenForAHeader) {
    parse(std::string(kNameHeader) + "  <PROPERTY NAME=\"category\" TYPE=\"string\">\n" +
          value_line("UEFI"));
    EXPECT_STREQ(package().category, "");
    EXPECT_STREQ(package().Name, R"(TY NAME="category" TYPE=")");
}

TEST_F(DescriptorLines, FileThatEndsBehindAHeaderGivesAnEmptyValue) {
    set_field(package().Name, "left");
    parse(kNameHeader);
    EXPECT_STREQ(package().Name, "");
    parse("  <PROPERTY NAME=\"payload\" TYPE=\"string\">\n");
    EXPECT_STREQ(package().TFTPPayloadPkgURIs, "tftp://server/pkgs/");
}

TEST_F(DescriptorLines, ValueOfALastLineWithoutABreakIsTaken) {
    parse(kNameHeader + std::string("  <VALUE>N</VALUE>"));
    EXPECT_STREQ(package().Name, "N");
}

TEST_F(DescriptorLines, LongValuesAreCutAt199Characters) {
    for (const std::size_t length : {198U, 199U, 200U, 1000U}) {
        SCOPED_TRACE(length);
        const std::string value(length, 'v');
        const std::string cut = value.substr(0, 199);
        package().OrderFlag = 0;
        set_field(package().TFTPPayloadPkgURIs, "a/");
        parse(property("Name", value) + property("type", value) + property("category", value) +
              property("identificationCode", value) + property("supersedes", value) +
              property("payload", value) + velktest::array("preReq", {value, value}));
        EXPECT_EQ(package().Name, cut);
        EXPECT_EQ(package().type, cut);
        EXPECT_EQ(package().category, cut);
        EXPECT_EQ(package().identificationCode, cut);
        EXPECT_EQ(package().supersedes, cut);
        EXPECT_EQ(package().manufacturer, cut);
        EXPECT_EQ(package().preReq[0], cut);
        EXPECT_EQ(package().preReq[1], cut);
        EXPECT_EQ(package().TFTPPayloadPkgURIs, ("a/" + value).substr(0, 199));
        EXPECT_EQ(package().dfnnumber, 0) << "nothing runs on behind the category";
        EXPECT_STREQ(package().preReq[2], "");
    }
}

TEST_F(DescriptorLines, LinesInsideAPropertyAreReadUpTo1023Characters) {
    // A value line of exactly 1023 characters with its break, and one of 1024, whose break is then
    // a line of its own.
    for (const std::size_t length : {1023U, 1024U}) {
        SCOPED_TRACE(length);
        set_field(package().category, "");
        const std::string frame = " <VALUE></VALUE>\n";
        const std::string line =
            " <VALUE>" + std::string(length - frame.size(), 'v') + "</VALUE>\n";
        ASSERT_EQ(line.size(), length);
        parse(kNameHeader + line + property("category", "FPGA"));
        EXPECT_EQ(package().Name, std::string(199, 'v'));
        EXPECT_STREQ(package().category, "FPGA");
    }
}

TEST_F(DescriptorLines, RestOfALongerValueLineIsALineOfItsOwn) {
    // What is behind the 1023rd character of the value line is looked at as the next line.
    const std::string filler = "    <VALUE>" + std::string(1023 - 11, 'v');
    parse(kNameHeader + filler + "  <PROPERTY NAME=\"category\" TYPE=\"string\">\n" +
          value_line("FPGA"));
    EXPECT_STREQ(package().category, "FPGA");
}

TEST_F(DescriptorLines, LinesOfTheFileAreReadUpTo20479Characters) {
    const std::string header = "  <PROPERTY NAME=\"Name\" TYPE=\"string\">\n";
    for (const std::size_t before : {20479U, 20480U}) {
        SCOPED_TRACE(before);
        set_field(package().Name, "left");
        parse(std::string(before, ' ') + header + value_line("N"));
        // After 20479 blanks the header begins a line; after one more it is indented by that one.
        EXPECT_STREQ(package().Name, "N");
    }
    set_field(package().Name, "left");
    parse(std::string(20479 - 20, ' ') + header + value_line("N"));
    EXPECT_STREQ(package().Name, "left") << "the header is torn in two";
}

TEST_F(DescriptorLines, LineOf20479CharactersIsRecognisedWhole) {
    const std::string header = "<PROPERTY NAME=\"Name\" TYPE=\"string\">\n";
    parse(std::string(20479 - header.size(), ' ') + header + value_line("N"));
    EXPECT_STREQ(package().Name, "N");
}

TEST_F(DescriptorLines, BinaryFileIsReadToItsEnd) {
    std::string noise;
    for (int i = 0; i < 100'000; ++i) {
        noise += static_cast<char>(i * 7919 % 256);
    }
    parse(noise + "\n" + property("Name", "N"));
    EXPECT_STREQ(package().Name, "N");
}

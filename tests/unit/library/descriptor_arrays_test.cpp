// Prerequisites and co-requisites of a descriptor.

#include "tests/unit/library/descriptor_fixture.h"

namespace {

using velktest::array;
using velktest::property;
using velktest::set_field;
using velktest::value_line;
using Texts = std::vector<std::string>;

class DescriptorArrays : public velktest::DescriptorTest {
  protected:
    static Texts prerequisites() {
        return {std::begin(package().preReq), std::end(package().preReq)};
    }
};

constexpr const char *kHeader = "  <PROPERTY.ARRAY NAME=\"preReq\" TYPE=\"string\">\n";

}  // namespace

TEST_F(DescriptorArrays, ValuesAreStoredInOrder) {
    parse(array("preReq", {"a", "b", "c"}));
    EXPECT_EQ(prerequisites(), (Texts{"a", "b", "c", "", ""}));
    EXPECT_EQ(package().prereqnum, 3);
}

TEST_F(DescriptorArrays, CoRequisitesGoToTheSameList) {
    parse(array("coReq", {"a", "b"}));
    EXPECT_EQ(prerequisites(), (Texts{"a", "b", "", "", ""}));
    EXPECT_EQ(package().prereqnum, 2);
}

TEST_F(DescriptorArrays, SecondArrayStartsAtTheFirstEntryAndBothCount) {
    set_field(package().preReq[2], "earlier contents");
    parse(array("preReq", {"A", "B"}) + array("coReq", {"C"}));
    EXPECT_EQ(prerequisites(), (Texts{"C", "B", "earlier contents", "", ""}));
    EXPECT_EQ(package().prereqnum, 3);
}

TEST_F(DescriptorArrays, FiveAndFiveCountAsTen) {
    set_field(package().supersedes, "No supersedes");
    parse(array("preReq", {"a", "b", "c", "d", "e"}) + array("coReq", {"v", "w", "x", "y", "z"}));
    EXPECT_EQ(prerequisites(), (Texts{"v", "w", "x", "y", "z"}));
    EXPECT_EQ(package().prereqnum, 10);
    EXPECT_STREQ(package().supersedes, "No supersedes") << "what lies behind the list";
    EXPECT_EQ(velktest::occurrences(log(), "preReq package:v w x y z \n"), 1);
}

TEST_F(DescriptorArrays, SixthValueIsNotRead) {
    parse(array("preReq", {"a", "b", "c", "d", "e", "f"}) + property("category", "FPGA"));
    EXPECT_EQ(prerequisites(), (Texts{"a", "b", "c", "d", "e"}));
    EXPECT_EQ(package().prereqnum, 5);
    EXPECT_STREQ(package().category, "FPGA") << "reading goes on behind it";
    EXPECT_EQ(velktest::occurrences(log(), "<VALUE>f</VALUE>"), 0);
}

TEST_F(DescriptorArrays, EmptyArrayAndEmptyValue) {
    parse(array("preReq", {}));
    EXPECT_EQ(package().prereqnum, 0);
    parse(array("preReq", {""}));
    EXPECT_EQ(package().prereqnum, 1);
    EXPECT_STREQ(package().preReq[0], "");
}

TEST_F(DescriptorArrays, ArrayWithoutItsOpeningLineIsSkipped) {
    parse(kHeader + value_line("a") + "    </VALUE.ARRAY>\n" + property("Name", "N"));
    EXPECT_EQ(package().prereqnum, 0);
    EXPECT_STREQ(package().Name, "N");
}

TEST_F(DescriptorArrays, OpeningLineInTheFirstColumnSkipsTheArray) {
    parse(kHeader + std::string("<VALUE.ARRAY>\n") + value_line("a"));
    EXPECT_EQ(package().prereqnum, 0);
}

TEST_F(DescriptorArrays, MissingClosingLineMakesTheFollowingLinesValues) {
    parse(kHeader + std::string("    <VALUE.ARRAY>\n") + value_line("a") + "  </PROPERTY.ARRAY>\n" +
          property("Name", "N"));
    // "</PROPERTY.ARRAY>", the header, the value and the end tag of Name: five lines are read.
    EXPECT_EQ(package().prereqnum, 5);
    EXPECT_STREQ(package().preReq[0], "a");
    EXPECT_STREQ(package().preReq[1], "RT");
    EXPECT_STREQ(package().preReq[3], "N");
    EXPECT_STREQ(package().Name, "");
}

TEST_F(DescriptorArrays, FileThatEndsInsideAnArrayKeepsWhatWasRead) {
    parse(kHeader + std::string("    <VALUE.ARRAY>\n") + value_line("a") + value_line("b"));
    EXPECT_EQ(prerequisites(), (Texts{"a", "b", "", "", ""}));
    EXPECT_EQ(package().prereqnum, 2);
    parse(kHeader);
    EXPECT_EQ(package().prereqnum, 2);
    parse(kHeader + std::string("    <VALUE.ARRAY>\n"));
    EXPECT_EQ(package().prereqnum, 2);
}

TEST_F(DescriptorArrays, ShortValueLinesCountWithAnEmptyText) {
    parse(kHeader + std::string("    <VALUE.ARRAY>\n    <VALUE/>\n    text\n    </VALUE.ARRAY>\n"));
    EXPECT_EQ(package().prereqnum, 2);
    EXPECT_EQ(prerequisites(), (Texts{"", "", "", "", ""}));
}

TEST_F(DescriptorArrays, CountGoesOnAcrossDescriptorsUntilTheListIsReadAnew) {
    parse(array("preReq", {"a"}));
    parse(array("preReq", {"b"}));
    EXPECT_EQ(package().prereqnum, 2);
    EXPECT_EQ(prerequisites(), (Texts{"b", "", "", "", ""}));
}

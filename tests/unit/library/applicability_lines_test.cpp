// Which lines of the payload configuration file count, and as what.
#include "tests/unit/library/applicability_fixture.h"

namespace velktest {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

constexpr std::string_view kApplies = "<applicability type=\"DFN\">ABCD</applicability>\n";

class ApplicabilityLines : public ApplicabilityTest {
  protected:
    ApplicabilityLines() { add_adapter("ABCD", "dev"); }

    // How many payloads apply.
    int matches(const std::string &config) {
        write_config(config);
        EXPECT_EQ(parse(), 1) << config;
        return package().payloadnum;
    }
};

struct TagCase {
    const char *tag;
    bool counts;
};

// A tag counts when all but its last character begin the word.
TEST_F(ApplicabilityLines, PayloadTagsAreToldByAllButTheirLastCharacter) {
    constexpr TagCase kCases[] = {
        {"payload", true},  {"payloaX", true},    {"payloadX", true},  {"pay", true},
        {"paX", true},      {"p", true},          {"X", true},         {"/", true},
        {" payload", true}, {"payloadXY", false}, {"paXX", false},     {"Payload", false},
        {"pXX", false},     {"PAY", false},       {"/payload", false}, {"qayload", false},
    };
    for (const auto &[tag, counts] : kCases) {
        const std::string config = "<" + std::string(tag) + ">fw</x>\n";
        EXPECT_EQ(matches(config + std::string(kApplies)), counts ? 1 : 0) << tag;
    }
}

TEST_F(ApplicabilityLines, OrderIsTheNumberOfTheFirstAttribute) {
    struct {
        const char *attribute;
        int order;
        bool is_given;
    } const cases[] = {
        {" order=\"7\"", 7, true},
        {" order=\"12\"", 12, true},
        {" order = \"7\"", 7, true},
        {" order  \"7\"", 7, true},
        {" order=7\"", 7, true},
        {" order=7", 7, true},
        {" order=\"07\"", 7, true},
        {" order=\"7x\"", 7, true},
        {" order=\"x\"", 0, true},
        {" order=\"\"", 0, true},
        {" order", 0, true},
        {" ord=\"7\"", 7, true},
        {" o=\"7\"", 7, true},
        {" orders=\"7\"", 0, false},
        {" Order=\"7\"", 0, false},
        {" rank=\"7\"", 0, false},
        {" rank=\"3\" order=\"7\"", 0, false},
        {"", 0, false},
    };
    for (const auto &row : cases) {
        clear_log();
        const std::string config = "<payload" + std::string(row.attribute) + ">fw</payload>\n";
        EXPECT_EQ(matches(config + std::string(kApplies)), 1) << row.attribute;
        EXPECT_EQ(payload_result[0].order, row.order) << row.attribute;
        EXPECT_TRUE(logged(row.is_given ? "set order to " + std::to_string(row.order) + "\n"
                                        : "hardcode order to 0\n"))
            << row.attribute;
    }
}

TEST_F(ApplicabilityLines, OrderBeyondAnyNumberDoesNoHarm) {
    EXPECT_EQ(
        matches("<payload order=\"99999999999999999999\">fw</payload>\n" + std::string(kApplies)),
        1);
}

TEST_F(ApplicabilityLines, ApplicabilityTakesItsTagAndAnAttribute) {
    struct {
        const char *line;
        bool counts;
    } const cases[] = {
        {"<applicability type=\"DFN\">ABCD</applicability>", true},
        {"<applicability type=\"other\">ABCD", true},
        {"<applicability type>ABCD", true},
        {"<applicability typX=\"\">ABCD", true},
        {"<applicability typeX=\"\">ABCD", true},
        {"<applicability t=\"\">ABCD", true},
        {"<applicability X=\"\">ABCD", true},
        {"<applicabilitX type=\"\">ABCD", true},
        {"<appX type=\"\">ABCD", true},
        {"<applicability>ABCD", false},
        {"<applicability kind=\"\">ABCD", false},
        {"<applicability typeXY=\"\">ABCD", false},
        {"<applicabilityXY type=\"\">ABCD", false},
        {"<Applicability type=\"\">ABCD", false},
        {"<other type=\"\">ABCD", false},
    };
    for (const auto &row : cases) {
        EXPECT_EQ(matches("<payload>fw</payload>\n" + std::string(row.line) + "\n</payload>\n"),
                  row.counts ? 1 : 0)
            << row.line;
    }
}

TEST_F(ApplicabilityLines, ValueMustBeTheWholeDfn) {
    for (const char *value : {"ABC", "ABCDE", "abcd", " ABCD", "ABCD ", "ABCX", "", "DCBA"}) {
        const std::string line = "<applicability type=\"DFN\">" + std::string(value);
        EXPECT_EQ(matches("<payload>fw</payload>\n" + line + "</applicability>\n"), 0) << value;
        EXPECT_EQ(matches("<payload>fw</payload>\n" + line + "\n"), 0) << value;
    }
}

TEST_F(ApplicabilityLines, ApplicabilityWithoutAValueSuitsNoAdapter) {
    set_field(package().DFNDeviceIDArray[0].DFN, "");
    EXPECT_EQ(matches("<payload>fw</payload>\n<applicability type=\"DFN\"></applicability>\n"), 0);
}

TEST_F(ApplicabilityLines, PayloadEndsAtItsEndLine) {
    constexpr TagCase kCases[] = {
        {"/payload", true},    {"/payloaX", true},   {"/payload order", true}, {"/pay", true},
        {"/", true},           {"X", true},          {"/payloadX", true},      {"/other", false},
        {"/payloadXY", false}, {"/Payload", false},  {"payload", false},       {"other", false},
        {"/payXX", false},     {"//payload", false},
    };
    for (const auto &[tag, ends] : kCases) {
        const std::string config = "<payload>fw</payload>\n<" + std::string(tag) + ">\n";
        EXPECT_EQ(matches(config + std::string(kApplies)), ends ? 0 : 1) << tag;
    }
}

TEST_F(ApplicabilityLines, PayloadEndsAtALineWithoutATag) {
    for (const char *line : {"\n", "text\n", "<>\n", "<  >x\n"}) {
        EXPECT_EQ(matches("<payload>fw</payload>\n" + std::string(line) + std::string(kApplies)), 0)
            << line;
    }
}

TEST_F(ApplicabilityLines, EmptyLineEndsThePayloadButNotTheFile) {
    const std::string payload = "<payload>fw</payload>\n";
    EXPECT_EQ(matches(payload + std::string("\0\n", 2) + payload + std::string(kApplies)), 1);
    EXPECT_TRUE(logged("break in format refinement\n"));
}

TEST_F(ApplicabilityLines, EmptyLineBetweenPayloadsEndsTheFile) {
    const std::string rest = "<payload>fw</payload>\n" + std::string(kApplies);
    EXPECT_EQ(matches(std::string("\0\n", 2) + rest), 0);
    EXPECT_TRUE(logged("*buf==0,break;\n"));
    EXPECT_EQ(matches("\n" + rest), 1) << "a line end is no empty line";
}

// A file that was cut: does its last line read as a payload without a name?
bool is_nameless(std::string_view line) {
    const bool lacks_name = line.find('>') >= line.size() - 1;
    return line == "<u" || line == "</" || (line.starts_with("<p") && lacks_name);
}

TEST_F(ApplicabilityLines, FileMayEndAnywhere) {
    const std::string whole = payload_config({{"fw", {"ABCD"}, 3}});
    const std::size_t match = whole.find("ABCD") + 4;
    for (std::size_t size = 0; size <= whole.size(); ++size) {
        const std::string config = whole.substr(0, size);
        const bool fails = is_nameless(std::string_view(config).substr(config.rfind('\n') + 1));
        write_config(config);
        package().payloadnum = 0;
        EXPECT_EQ(parse(), fails ? 0 : 1) << config;
        EXPECT_EQ(package().payloadnum, !fails && size >= match ? 1 : 0) << config;
    }
}

TEST_F(ApplicabilityLines, LastPayloadMayMissItsLines) {
    EXPECT_EQ(matches("<payload>fw</payload>\n"), 0);
    EXPECT_TRUE(logged("next line failed\n"));
}

TEST_F(ApplicabilityLines, FileEndsAtItsEndLine) {
    constexpr TagCase kCases[] = {
        {"/updateConfiguration", true},   {"/update", true},   {"/u", true},
        {"/updateConfigurationX", false}, {"/Update", false},  {"updateConfiguration", false},
        {"/configuration", false},        {"/updateX", false},
    };
    for (const auto &[tag, ends] : kCases) {
        clear_log();
        const std::string config = "<" + std::string(tag) + ">\n<payload>fw</payload>\n";
        EXPECT_EQ(matches(config + std::string(kApplies)), ends ? 0 : 1) << tag;
        EXPECT_EQ(logged("end of config file\n"), ends) << tag;
    }
}

TEST_F(ApplicabilityLines, PayloadWithoutAnEndReadsOnPastTheEndLineOfTheFile) {
    EXPECT_EQ(matches("<payload>fw</payload>\n</updateConfiguration>\n" + std::string(kApplies)),
              1);
}

TEST_F(ApplicabilityLines, OneMatchTakesAPayloadOnce) {
    const std::string twice = std::string(kApplies) + std::string(kApplies);
    EXPECT_EQ(matches("<payload>fw</payload>\n" + twice + "</payload>\n"), 1);
}

TEST_F(ApplicabilityLines, PayloadWithoutANameFails) {
    package().payloadnum = 5;
    const auto before = open_descriptors();
    for (const char *line : {"<payload></payload>\n", "<payload>\n", "<payload", "<X>\r\n"}) {
        clear_log();
        write_config("<payload>fw</payload>\n" + std::string(kApplies) + line);
        EXPECT_EQ(parse(), 0) << line;
        EXPECT_TRUE(log().ends_with(entry("payload value handle error, return FALSE\n"))) << line;
    }
    EXPECT_EQ(package().payloadnum, 5);
    EXPECT_STREQ(package().PayloadDeviceIDArray[0].PayloadPath, "");
    EXPECT_EQ(open_descriptors(), before);
}

TEST_F(ApplicabilityLines, LongLinesGoOnInLinesOfTheirOwn) {
    constexpr std::size_t kLongest = 1023 - 4;  // with "<p>" and the line end
    EXPECT_EQ(matches("<p>" + std::string(kLongest, 'x') + "\n" + std::string(kApplies)), 1);
    EXPECT_EQ(matches("<p>" + std::string(kLongest + 1, 'x') + "\n" + std::string(kApplies)), 0)
        << "the line end is a line without a tag";
    EXPECT_EQ(matches("<p>fw" + std::string(2000, ' ') + "\n" + std::string(kApplies)), 0);
    EXPECT_EQ(matches(std::string(1023, ' ') + "<payload>fw\n" + std::string(kApplies)), 1);
}

TEST_F(ApplicabilityLines, CarriageReturnsBelongToNoName) {
    EXPECT_EQ(matches("<payload>fw.bin\r\n<applicability type=\"DFN\">ABCD\r\n"), 1);
    EXPECT_THAT(to_install(), ElementsAre("fw.bin for dev"));
}

TEST_F(ApplicabilityLines, OtherMarkupIsPassed) {
    EXPECT_EQ(matches("<?xml version=\"1.0\"?>\n\n<updateConfiguration>\n<description>d\n"), 0);
    EXPECT_EQ(occurrences(log(), "nothing done for 1st getProp\n"), 4);
    EXPECT_THAT(to_install(), IsEmpty());
}

}  // namespace
}  // namespace velktest

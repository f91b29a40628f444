// What the parser takes from a descriptor.

#include "tests/unit/library/descriptor_fixture.h"

#include "tests/support/report_log.h"
#include "velk/request_state.h"

namespace {

using velktest::array;
using velktest::entry;
using velktest::property;
using velktest::record_image;
using velktest::set_field;

class Descriptor : public velktest::DescriptorTest {};

constexpr const char *kUnopened = "Pakcage XML can't be opened.";

}  // namespace

TEST_F(Descriptor, EveryPropertyGoesToItsField) {
    parse("<INSTANCE CLASSNAME=\"ZEB_Package\">\n" + property("Name", "ZEB RXC firmware") +
          property("version", "ignored") + property("type", "1") + property("category", "RXC") +
          array("preReq", {"zeb_a"}) + property("payload", "fw.bin") +
          property("identificationCode", "zeb_fw_rxc") + property("supersedes", "zeb_fw_old") +
          "</INSTANCE>\n");
    EXPECT_STREQ(package().Name, "ZEB RXC firmware");
    EXPECT_STREQ(package().type, "1");
    EXPECT_STREQ(package().category, "RXC");
    EXPECT_STREQ(package().preReq[0], "zeb_a");
    EXPECT_EQ(package().prereqnum, 1);
    EXPECT_STREQ(package().TFTPPayloadPkgURIs, "tftp://server/pkgs/fw.bin");
    EXPECT_STREQ(package().identificationCode, "zeb_fw_rxc");
    EXPECT_STREQ(package().supersedes, "zeb_fw_old");
    EXPECT_STREQ(package().manufacturer, "zeb");
    EXPECT_EQ(package().OrderFlag, 350);
}

TEST_F(Descriptor, OrderOfThePropertiesDoesNotMatter) {
    parse(property("supersedes", "old") + property("category", "UEFI") + property("payload", "p") +
          property("type", "1") + property("identificationCode", "c_1"));
    EXPECT_STREQ(package().supersedes, "old");
    EXPECT_STREQ(package().manufacturer, "c");
    EXPECT_EQ(package().OrderFlag, 250);
}

TEST_F(Descriptor, OtherRecordsStayAsTheyWere) {
    const std::string before = record_image(0);
    const std::string after = record_image(2);
    parse(property("Name", "x") + array("preReq", {"a", "b"}));
    EXPECT_EQ(record_image(0), before);
    EXPECT_EQ(record_image(2), after);
}

TEST_F(Descriptor, TypeAndCategoryGiveTheOrderFlag) {
    struct {
        const char *type, *category;
        int flag;
    } const cases[] = {
        {"1", "UEFI", 250},  {"1", "Diagnostics", 300}, {"1", "RXC", 350},
        {"1", "RXC2", 350},  {"1", "FPGA", 400},        {"1", "rxc", 300},  // letter for letter
        {"1", "RXC3", 300},  {"1", "UEFI ", 300},       {"1", "Fibre", 300},
        {"1", "", 300},      {"2", "UEFI", 1001},       {"", "UEFI", 1001},
        {"01", "RXC", 1001}, {"1 ", "RXC", 1001},       {"11", "FPGA", 1001},
    };
    for (const auto &row : cases) {
        parse(property("type", row.type) + property("category", row.category));
        EXPECT_EQ(package().OrderFlag, row.flag) << row.type << " " << row.category;
    }
}

TEST_F(Descriptor, ManufacturerIsTheCodeUpToItsFirstUnderscore) {
    struct {
        const char *code, *manufacturer;
    } const cases[] = {
        {"abc_def_1", "abc"}, {"abc_", "abc"}, {"_abc", ""}, {"abc", "abc"}, {"", ""},
    };
    for (const auto &row : cases) {
        parse(property("identificationCode", row.code));
        EXPECT_STREQ(package().manufacturer, row.manufacturer) << row.code;
    }
}

TEST_F(Descriptor, AbsentPropertiesLeaveTheirFields) {
    set_field(package().Name, "left");
    set_field(package().category, "FPGA");
    set_field(package().type, "1");
    set_field(package().identificationCode, "left_1");
    parse("<INSTANCE>\n</INSTANCE>\n");
    EXPECT_STREQ(package().Name, "left");
    EXPECT_STREQ(package().supersedes, "No supersedes");
    EXPECT_STREQ(package().TFTPPayloadPkgURIs, "tftp://server/pkgs/");
    EXPECT_STREQ(package().manufacturer, "left");
    EXPECT_EQ(package().OrderFlag, 400);
    EXPECT_EQ(package().prereqnum, 0);
}

TEST_F(Descriptor, EmptyFileHasNoType) {
    parse("");
    EXPECT_EQ(package().OrderFlag, 1001);
    EXPECT_TRUE(log().ends_with(entry("Complete getPkgAssociation.\n")));
}

TEST_F(Descriptor, LastOfTwoEqualPropertiesCounts) {
    parse(property("Name", "first, the longer one") + property("Name", "second"));
    EXPECT_STREQ(package().Name, "second");
}

TEST_F(Descriptor, SecondPayloadIsAppendedLikeTheFirst) {
    parse(property("payload", "a.bin") + property("payload", "b.bin"));
    EXPECT_STREQ(package().TFTPPayloadPkgURIs, "tftp://server/pkgs/a.binb.bin");
}

TEST_F(Descriptor, ReadingIsLoggedWithTheResult) {
    set_field(package().preReq[1], "kept");
    parse(property("Name", "N") + property("type", "1") + property("category", "UEFI") +
          array("preReq", {"a", "b"}) + property("payload", "p.bin") +
          property("identificationCode", "m_c") + property("supersedes", "s"));
    EXPECT_EQ(log(),
              entry("Enter getPkgAssociation.\n") + entry("Open file ") +
                  (package().LocalPkgURI + 6) + "\n" + entry("<VALUE>a</VALUE>\n") +
                  entry("<VALUE>b</VALUE>\n") + entry("</VALUE.ARRAY>\n") + entry("Package Name:") +
                  "N\n" + entry("Package Type:") + "1\n" + entry("Package payload URI:") +
                  "tftp://server/pkgs/p.bin\n" + entry("Package identificationCode:") + "m_c\n" +
                  entry("Package supersedes:") + "s\n" + entry("Package OrderFlag:") + "250\n" +
                  entry("preReq package:") + "a b \n" + entry("Package manufacturer:") + "m\n" +
                  entry("Package category:") + "UEFI\n" + entry("Complete getPkgAssociation.\n"));
}

TEST_F(Descriptor, PathIsTheLocationWithoutItsFirstSixCharacters) {
    const std::string path =
        write_descriptor(property("Name", "N")).substr(std::string("file://").size());
    for (const char *scheme : {"file:/", "file://", "file:///"}) {
        set_field(package().Name, "");
        set_field(package().LocalPkgURI, scheme + path);
        clear_log();
        getPkgAssociation(1);
        EXPECT_STREQ(package().Name, "N") << scheme;
        EXPECT_TRUE(log().starts_with(entry("Enter getPkgAssociation.\n") + entry("Open file ") +
                                      (scheme + path).substr(6) + "\n"));
    }
}

TEST_F(Descriptor, FileThatCannotBeOpenedIsReported) {
    set_field(package().Name, "left");
    set_field(package().identificationCode, "left_1");
    set_field(package().LocalPkgURI, "file:///nowhere/x.xml");
    const std::string before = record_image(1);
    getPkgAssociation(1);
    EXPECT_EQ(log(), entry("Enter getPkgAssociation.\n") + entry("Open file ") +
                         "//nowhere/x.xml\n" +
                         velktest::report_log({"tftp://server/pkgs/x.xml", "x", 12, kUnopened}));
    EXPECT_EQ(package().OrderFlag, 1002);
    EXPECT_STREQ(package().installResult, "x: 12: Pakcage XML can't be opened.");
    package().OrderFlag = 450;
    set_field(package().installResult, "");
    EXPECT_EQ(record_image(1), before) << "nothing else changes";
}

TEST_F(Descriptor, LocationThatIsNoLocalOneCountsAsUnopened) {
    for (const char *location :
         {"", "tftp://server/x.xml", "/tmp/x.xml", "file:", "FILE:///x.xml", " file:///x.xml"}) {
        package().OrderFlag = 450;
        set_field(package().LocalPkgURI, location);
        clear_log();
        getPkgAssociation(1);
        EXPECT_EQ(package().OrderFlag, 1002) << location;
        EXPECT_STREQ(package().installResult, "x: 12: Pakcage XML can't be opened.");
        EXPECT_EQ(velktest::occurrences(log(), "Open file "), 0);
    }
}

TEST_F(Descriptor, FolderReadsAsAnEmptyFile) {
    set_field(package().LocalPkgURI, "file:///proc");
    getPkgAssociation(1);
    EXPECT_EQ(package().OrderFlag, 1001);
}

TEST_F(Descriptor, UnreadableDescriptorOfTheLastPackageCompletesTheRequest) {
    use_packages(2);
    set_field(package().LocalPkgURI, "file:///nowhere/x.xml");
    getPkgAssociation(1);
    EXPECT_EQ(totalstatus, 1);
}

TEST_F(Descriptor, IndexOutsideOfTheTableIsLoggedAndNothingMore) {
    for (const int index : {-1, 20}) {
        clear_log();
        const std::string before = velktest::session_image();
        getPkgAssociation(index);
        EXPECT_EQ(velktest::session_image(), before);
        EXPECT_EQ(log(), entry("Enter getPkgAssociation.\n"));
    }
}

TEST_F(Descriptor, NothingStaysOpen) {
    const std::size_t before = velktest::open_descriptors();
    parse(property("Name", "x"));
    parse("");
    EXPECT_EQ(velktest::open_descriptors(), before);
}

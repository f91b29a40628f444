// From the list of locations to package records.

#include "provider/package_list.h"

#include "tests/support/library_test.h"
#include "tests/support/report_log.h"
#include "velk/request_state.h"
#include "velk/status_report.h"

namespace {

using velktest::entry;
using velktest::record_image;
using velktest::report_log;
using velktest::set_field;

class PackageList : public velktest::LibraryTest {
  protected:
    static std::string join(int count, const std::string &element) {
        std::string list = element + "0.xml";
        for (int i = 1; i < count; ++i) {
            list += "|" + element + std::to_string(i) + ".xml";
        }
        return list;
    }

    static void init(const std::string &list) { initPkgInstall(list.c_str()); }
    static std::string location(int index) { return pkgInstance[index].TFTPXMLPkgURIs; }
    static std::string folder(int index) { return pkgInstance[index].TFTPPayloadPkgURIs; }
};

}  // namespace

TEST_F(PackageList, CountIsThatOfTheElementsUpToTwenty) {
    struct {
        int elements, packages;
    } const cases[] = {{1, 1}, {2, 2}, {3, 3}, {19, 19}, {20, 20}, {21, 20}, {25, 20}};
    for (const auto &row : cases) {
        init(join(row.elements, "file:///pkgs/p"));
        EXPECT_EQ(pkgnum, row.packages);
    }
    EXPECT_EQ(location(0), "file:///pkgs/p0.xml");
    EXPECT_EQ(location(19), "file:///pkgs/p19.xml");
    EXPECT_EQ(velktest::occurrences(log(), " Package XML path:file:///pkgs/p20.xml"), 0);
}

TEST_F(PackageList, EveryUsedRecordStartsWithItsDefaults) {
    for (int i = 0; i < 3; ++i) {
        pkgInstance[i].OrderFlag = 1000;
        pkgInstance[i].prereqnum = 4;
        set_field(pkgInstance[i].supersedes, "left by a former request, and longer than it");
    }
    init("tftp://server/pkgs/x.xml|tftp://server/other/y.xml|z/z.xml");
    for (int i = 0; i < 3; ++i) {
        EXPECT_EQ(pkgInstance[i].OrderFlag, 450);
        EXPECT_EQ(pkgInstance[i].prereqnum, 0);
        EXPECT_STREQ(pkgInstance[i].supersedes, "No supersedes");
    }
    EXPECT_STREQ(pkgInstance[0].installResult, "x: 0: Package Initialization finished");
    EXPECT_STREQ(pkgInstance[2].installResult, "z: 0: Package Initialization finished");
    EXPECT_EQ(folder(0), "tftp://server/pkgs/");
    EXPECT_EQ(folder(1), "tftp://server/other/");
    EXPECT_EQ(folder(2), "z/");
}

TEST_F(PackageList, PayloadFolderIsCutAfterTheLastSlash) {
    struct {
        const char *location, *folder;
    } const cases[] = {
        {"tftp://10.0.0.1/pkgs/x.xml", "tftp://10.0.0.1/pkgs/"},
        {"file:///x.xml", "file:///"},
        {"/a/b/", "/a/b/"},  // one that ends in a slash is kept whole
        {"/", "/"},
        {"x.xml", ""},  // nothing to go back to
        {"", ""},
    };
    for (const auto &row : cases) {
        init(row.location);
        EXPECT_EQ(folder(0), row.folder) << row.location;
        EXPECT_EQ(pkgnum, 1);
    }
}

TEST_F(PackageList, FirstLocationDecidesTheKindForAll) {
    struct {
        const char *list;
        int kind;
    } const cases[] = {
        {"file:///a.xml", 1},
        {"tftp://s/a.xml", 2},
        {"ftp://s/a.xml", 3},
        {"sftp://s/a.xml", 4},
        {"http://s/a.xml", 5},
        {"/a.xml", 5},
        {"", 5},
        {"FILE:///a.xml", 5},  // letter for letter
        {"file:/a.xml", 5},
        {"file:///a.xml|tftp://s/b.xml", 1},
        {"tftp://s/a.xml|file:///b.xml", 2},
        {"|file:///b.xml", 5},
        // Anywhere in the text, and in this order.
        {"x-file://a.xml", 1},
        {"tftp://s/file://a.xml", 1},
        {"sftp://s/tftp://a.xml", 2},
        {"ftp://s/sftp://a.xml", 4},
    };
    for (const auto &row : cases) {
        clear_log();
        init(row.list);
        EXPECT_EQ(filelocation, row.kind) << row.list;
        EXPECT_EQ(log().ends_with(velktest::entries(
                      {"Unknown file location .\n", "Complete initPkgInstall.\n"})),
                  row.kind == 5)
            << row.list;
    }
}

TEST_F(PackageList, RequestIsLoggedStepByStep) {
    const std::string list = "file:///pkgs/a.xml|/b.xml";
    init(list);
    EXPECT_EQ(log(),
              entry("Enter initPkgInstall.\n") + entry("Package URI list:") + list + "\n" +
                  report_log({"file:///pkgs/a.xml", "a", 0, "Package Initialization finished"}) +
                  entry("0") + " Package XML path:file:///pkgs/a.xml\n" +
                  " Package URI address:file:///pkgs/\n" +
                  report_log({"/b.xml", "/b", 0, "Package Initialization finished"}) + entry("1") +
                  " Package XML path:/b.xml\n Package URI address:/\n" +
                  entry("Total Package number is ") + "2\n" + entry("Complete initPkgInstall.\n"));
}

TEST_F(PackageList, OverallStatusStartsAtZero) {
    set_totalstatus(1);
    init("file:///a.xml");
    EXPECT_EQ(totalstatus, 0);
}

TEST_F(PackageList, FirstRecordIsClearedWhole) {
    std::fill_n(reinterpret_cast<char *>(&pkgInstance[0]), sizeof pkgInstance[0], 'x');
    init("a/b.xml");
    EXPECT_STREQ(pkgInstance[0].category, "");
    EXPECT_EQ(pkgInstance[0].dfnnumber, 0);
    EXPECT_EQ(pkgInstance[0].installer, nullptr);
    EXPECT_EQ(location(0), "a/b.xml");
}

TEST_F(PackageList, OtherRecordsKeepWhatIsNotWritten) {
    set_field(pkgInstance[1].category, "UEFI");
    set_field(pkgInstance[1].identificationCode, "zeb_fw");
    pkgInstance[1].dfnnumber = 3;
    const std::string third = record_image(2);
    init("a/b.xml|a/c.xml");
    EXPECT_STREQ(pkgInstance[1].category, "UEFI");
    EXPECT_STREQ(pkgInstance[1].identificationCode, "zeb_fw");
    EXPECT_EQ(pkgInstance[1].dfnnumber, 3);
    EXPECT_EQ(record_image(2), third);
}

TEST_F(PackageList, ShorterLocationKeepsTheTailOfTheFormerOneBeyondTheFirstRecord) {
    init("file:///long/name.xml|file:///long/name.xml|file:///long/name.xml");
    init("file:///a.xml|file:///b.xml");
    EXPECT_EQ(location(0), "file:///a.xml");
    EXPECT_EQ(location(1), "file:///b.xmlname.xml");
    EXPECT_EQ(folder(1), "file:///");
    EXPECT_EQ(location(2), "file:///long/name.xml") << "not in use any more";
    EXPECT_STREQ(pkgInstance[1].installResult, "b.xmlname: 0: Package Initialization finished");
}

TEST_F(PackageList, EmptyElementsGiveRecordsOfTheirOwn) {
    init("a/x.xml||a/z.xml|");
    EXPECT_EQ(pkgnum, 4);
    EXPECT_EQ(location(1), "");
    EXPECT_EQ(folder(1), "");
    EXPECT_EQ(location(2), "a/z.xml");
    EXPECT_EQ(location(3), "");
    init("|");
    EXPECT_EQ(pkgnum, 2);
    init("||");
    EXPECT_EQ(location(2), "a/z.xml") << "an empty element leaves the former text";
}

TEST_F(PackageList, LocationsAreCutAt199Characters) {
    for (const std::size_t length : {198U, 199U, 200U, 1023U, 5000U}) {
        SCOPED_TRACE(length);
        velktest::reset_session();
        const std::string long_one = "file:///" + std::string(length - 8, 'a');
        const std::string untouched = record_image(3);
        std::string list = long_one;
        for (int i = 1; i < 3; ++i) {
            list.append("|").append(long_one);
        }
        init(list);
        for (int i = 0; i < 3; ++i) {
            EXPECT_EQ(location(i), long_one.substr(0, 199));
            EXPECT_EQ(folder(i), "file:///");
            EXPECT_STREQ(pkgInstance[i].LocalPkgURI, "");
        }
        EXPECT_EQ(record_image(3), untouched);
    }
}

TEST_F(PackageList, LocationOfSlashesFillsTheFolderAsWell) {
    init("x/y.xml|" + std::string(1023, '/'));
    EXPECT_EQ(folder(1), std::string(199, '/'));
    EXPECT_STREQ(pkgInstance[1].LocalPkgURI, "");
}

TEST_F(PackageList, NullListCountsAsAnEmptyOne) {
    EXPECT_EQ(initPkgInstall(nullptr), 0);
    EXPECT_EQ(pkgnum, 1);
    EXPECT_EQ(location(0), "");
}

TEST_F(PackageList, CountIsSetWhenAllRecordsHaveReported) {
    is_async_install = 1;
    pkgnum = 3;
    set_field(pkgInstance[2].installResult, "left");
    set_field(instanceID, "VELK-6");
    init("a/x.xml|a/y.xml");
    EXPECT_EQ(pkgnum, 2);
    // The reports were made under the former request's count and job.
    EXPECT_EQ(
        velktest::read_file(at("/tmp/sfcb/velkstatVELK-6.txt")),
        "0|x: 0: Package Initialization finished|y: 0: Package Initialization finished|left|");
}

// Requests at the limits of the package table, and lists whose elements do not fit together.

#include "tests/conformance/request_test.h"

namespace {

using Texts = std::vector<std::string>;
namespace cim = velktest::cim;

class RequestLimits : public velktest::RequestTest {
  protected:
    // Locations of descriptors that are not there; `length` characters of name each.
    static Texts absent(int count, std::size_t length) {
        Texts locations;
        for (int i = 0; i < count; ++i) {
            std::string name = "p" + std::to_string(100 + i);
            name.resize(length, 'x');
            locations.push_back("file:///no/" + name + ".xml");
        }
        return locations;
    }

    static std::string status_line(int overall, const Texts &results) {
        std::string line = std::to_string(overall) + "|";
        for (const std::string &result : results) {
            line += result + "|";
        }
        return line;
    }

    std::string status_file() {
        return velktest::read_file(host().at("/tmp/sfcb/velkstatVELK-1.txt"));
    }
};

}  // namespace

TEST_F(RequestLimits, StatusLineOfTwentyLongNamesIsCutAt1023) {
    run(absent(20, 150));
    ASSERT_EQ(host().value("pkgnum"), 20);
    const std::string whole = status_line(1, results());
    ASSERT_GT(whole.size(), 1023U);
    EXPECT_EQ(status_file(), whole.substr(0, 1023));
    EXPECT_EQ(results().back(), unreadable("p119" + std::string(146, 'x')));
    for (const velktest::FileWrite &write : host().status_writes()) {
        EXPECT_LE(write.text.size(), 1023U);
    }
    EXPECT_EQ(host().value("totalstatus"), 1);
}

TEST_F(RequestLimits, StatusLineIsCutOnlyWhereItOutgrowsItsBuffer) {
    // "1|" and six of "<id>: 12: Pakcage XML can't be opened.|" make 1022 characters.
    Texts locations = absent(6, 135);
    for (const std::size_t length : {1022U, 1023U, 1024U}) {
        run(locations);
        const std::string whole = status_line(1, results());
        EXPECT_EQ(whole.size(), length);
        EXPECT_EQ(host().status_writes().back().text, whole.substr(0, 1023));
        locations[5].insert(locations[5].size() - 4, "y");
    }
}

TEST_F(RequestLimits, LongStatusLineIsStillJudgedByTheJobLibrary) {
    run(absent(20, 150));
    using GetStatus = int(const char *, int *, char *, int);
    int state = -1;
    char message[2048] = "";
    host().function<GetStatus>("getVELKStatus")("VELK-1", &state, message, sizeof message);
    EXPECT_EQ(state, 10);
    EXPECT_EQ(message, status_file());
}

TEST_F(RequestLimits, ResultOfOnePackageIsCutToItsField) {
    run(absent(1, 180));
    const std::string name = "p100" + std::string(176, 'x');
    EXPECT_EQ(results(), Texts{unreadable(name).substr(0, 199)});
}

TEST_F(RequestLimits, LocationLongerThanItsFieldIsCut) {
    const std::string location = absent(1, 4000)[0];
    run({location});
    EXPECT_EQ(std::string(record(0).TFTPXMLPkgURIs), location.substr(0, 199));
    EXPECT_EQ(host().value("pkgnum"), 1);
}

TEST_F(RequestLimits, ElementsBeyondTheTwentiethAreDropped) {
    const Texts locations = absent(25, 8);
    run(locations);
    EXPECT_EQ(host().value("pkgnum"), 20);
    for (int i = 0; i < 20; ++i) {
        EXPECT_EQ(std::string(record(i).TFTPXMLPkgURIs), locations[static_cast<std::size_t>(i)]);
    }
    EXPECT_THAT(host().up_calls(), testing::Not(testing::Contains(deletion(locations[20]))));
    EXPECT_THAT(host().log(),
                testing::Not(testing::HasSubstr("Package XML path:" + locations[20])));
}

TEST_F(RequestLimits, TwentyPackagesAreAllInstalled) {
    Texts locations;
    Texts expected;
    for (int i = 0; i < 20; ++i) {
        const std::string file = "uefi" + std::to_string(i);
        locations.push_back(add({.file = file}));
        expected.push_back(installed(file));
    }
    show_done(20);
    run(locations);
    EXPECT_EQ(results(), expected);
    EXPECT_EQ(orders().front(), payload("uefi19")) << "ties go to the later package";
    EXPECT_DOUBLE_EQ(host().other_pauses().back().at, 190);
}

// -- Mixed lists --

TEST_F(RequestLimits, FirstLocationDecidesThatNothingIsTransferred) {
    const std::string uefi = add({.file = "uefi"});
    show_done(1);
    run({uefi, "tftp://server/pkgs/b.xml"});
    EXPECT_EQ(host().value("filelocation"), 1);
    EXPECT_EQ(host().value("invoke_client"), 1);
    EXPECT_EQ(results(), (Texts{installed("uefi"), unreadable("b")}));
    for (const std::string &call : host().up_calls()) {
        EXPECT_THAT(call, testing::Not(testing::HasSubstr("TransferVia")));
    }
}

TEST_F(RequestLimits, FirstLocationDecidesThatAllIsTransferred) {
    const std::string uefi = add({.file = "uefi"});
    host().transfer().answers["TransferViaTFTP"].outputs = {
        {"DestinationURI", velktest::kit::Text(uefi)}};
    show_done(2);
    run({"tftp://server/pkgs/a.xml", uefi});
    EXPECT_EQ(host().value("filelocation"), 2);
    EXPECT_EQ(results(), (Texts{installed("a"), installed("uefi")}));
    EXPECT_THAT(host().up_calls(),
                testing::Contains(
                    "invokeMethod zeb/cimv2:ZEB_FileTransferService.TransferViaTFTP(SourceURI=\"" +
                    uefi + "\", TransferOptions={0}, BlockSize=2048)"));
}

TEST_F(RequestLimits, PackageThatCannotBeTransferredIsPassedBy) {
    host().transfer().answers["TransferViaTFTP"] = {
        CMPI_RC_OK, "", 1, {{"DestinationURI", velktest::kit::Text("")}}};
    run({"tftp://server/pkgs/a.xml"});
    EXPECT_EQ(record(0).OrderFlag, 1000);
    EXPECT_EQ(results(), Texts{"a: 11: Package download failed."});
    EXPECT_EQ(velktest::occurrences(host().log(), "Begin to Deploy.\n"), 0);
}

TEST_F(RequestLimits, LocationsOfNoKnownKindAreNotFetched) {
    run({"a.xml"});
    EXPECT_EQ(host().value("filelocation"), 5);
    EXPECT_EQ(velktest::occurrences(host().log(), "Unknown file location .\n"), 1);
    EXPECT_EQ(results(), Texts{unreadable("a")});
}

TEST_F(RequestLimits, EmptyElementsArePackagesWithoutALocation) {
    run({"", "", ""});
    EXPECT_EQ(host().value("pkgnum"), 3);
    EXPECT_EQ(results().back(), unreadable(""));
}

// Unpacking a package with the host's unzip library, wherever that is to be found.
#include "installers/unpack.h"

#include "tests/unit/library/adapter_fixture.h"

namespace velktest {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using Place = UnzipDouble::Place;
using velk::adapter::unpack_package;

class Unpack : public AdapterTest {};

TEST_F(Unpack, PathBeginsBehindTheFirstSlash) {
    struct {
        const char *location, *archive;
    } const cases[] = {
        {"file:///pkgs/a.zip", "//pkgs/a.zip"},
        {"file:/pkgs/a.zip", "pkgs/a.zip"},
        {"/pkgs/a.zip", "pkgs/a.zip"},
        {"pkgs/a.zip", "a.zip"},
        {"file://host/pkgs/a.zip", "/host/pkgs/a.zip"},
        {"//", "/"},
    };
    for (const auto &row : cases) {
        unzip().calls.clear();
        clear_log();
        EXPECT_EQ(unpack_package(row.location), 0) << row.location;
        EXPECT_THAT(unzip().calls, ElementsAre(std::string(row.archive) + " to " + kUnpackFolder));
        EXPECT_EQ(log(), entries({"tmpDestinationPath = " + std::string(row.location) + "\n",
                                  "Effective path: " + std::string(row.archive) + "\n"}));
    }
}

TEST_F(Unpack, LocationWithoutASlashFails) {
    for (const char *location : {"a.zip", ""}) {
        clear_log();
        EXPECT_NE(unpack_package(location), 0);
        EXPECT_EQ(log(), entry("tmpDestinationPath = " + std::string(location) + "\n"));
    }
    EXPECT_THAT(unzip().calls, IsEmpty());
}

TEST_F(Unpack, EmptyPathFails) {
    for (const char *location : {"/", "file:/"}) {
        clear_log();
        EXPECT_NE(unpack_package(location), 0);
        EXPECT_TRUE(log().ends_with(entry("Effective path: \n")));
    }
    EXPECT_THAT(unzip().calls, IsEmpty());
}

TEST_F(Unpack, ResultIsThatOfTheLibrary) {
    for (const int result : {0, 1, -1, 77}) {
        unzip().result = result;
        EXPECT_EQ(unpack_package("/a.zip"), result);
    }
}

TEST_F(Unpack, FunctionOfTheProcessComesFirst) {
    EXPECT_EQ(unpack_package("/a.zip"), 0);
    EXPECT_THAT(unzip().opened, IsEmpty());
}

TEST_F(Unpack, LibraryIsOpenedByItsName) {
    unzip().place = Place::kLibrary;
    EXPECT_EQ(unpack_package("/a.zip"), 0);
    EXPECT_THAT(unzip().opened, ElementsAre("libunzipfile.so"));
    EXPECT_THAT(unzip().calls, ElementsAre(std::string("a.zip to ") + kUnpackFolder));
    EXPECT_TRUE(is_unpacked());
}

TEST_F(Unpack, FailureOfTheLibraryIsPassedOn) {
    unzip().place = Place::kLibrary;
    unzip().result = -3;
    EXPECT_EQ(unpack_package("/a.zip"), -3);
}

TEST_F(Unpack, FailsWithoutALibrary) {
    unzip().place = Place::kNowhere;
    EXPECT_NE(unpack_package("/a.zip"), 0);
    EXPECT_THAT(unzip().opened, ElementsAre("libunzipfile.so"));
    EXPECT_FALSE(is_unpacked());
}

TEST_F(Unpack, FailsWithALibraryThatHasNoSuchFunction) {
    unzip().place = Place::kOtherLibrary;
    EXPECT_NE(unpack_package("/a.zip"), 0);
    EXPECT_FALSE(is_unpacked());
}

}  // namespace
}  // namespace velktest

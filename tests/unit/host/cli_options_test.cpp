// What arguments are taken, and what is said of those that are not.
#include "host/cli/install_options.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <fstream>

namespace velkhost::cli {
namespace {

namespace fs = std::filesystem;

TEST(CliOptions, NumbersWithCommas) {
    EXPECT_EQ(parse_option_numbers("32769"), std::vector<std::uint16_t>{32769});
    EXPECT_EQ(parse_option_numbers("1,0,65535"), (std::vector<std::uint16_t>{1, 0, 65535}));
}

TEST(CliOptions, AnythingElseIsNoListOfNumbers) {
    for (const char *text : {"", "a", "1,", ",1", "1;2", "65536", "-1", "1 ", "0x8000", "1e3",
                             "99999999999999999999"}) {
        EXPECT_THROW(parse_option_numbers(text), UsageError) << text;
    }
}

TEST(CliOptions, Durations) {
    using std::chrono::seconds;
    EXPECT_EQ(parse_duration("90s"), seconds(90));
    EXPECT_EQ(parse_duration("15m"), seconds(900));
    EXPECT_EQ(parse_duration("1h30m"), seconds(5400));
    EXPECT_EQ(parse_duration("2d"), seconds(172'800));
    EXPECT_EQ(parse_duration("10000d"), seconds(864'000'000));
}

TEST(CliOptions, AnythingElseIsNoDuration) {
    for (const char *text : {"", "0s", "10", "h", "1x", "-1h", "1h-", "1.5h", "10001d", "10000d1s",
                             "4294967295d", "99999999999h", " 1h"}) {
        EXPECT_THROW(parse_duration(text), UsageError) << text;
    }
}

TEST(CliOptions, LocationsStayAsTheyAre) {
    EXPECT_EQ(location_of("tftp://10.0.0.1/a.xml"), "tftp://10.0.0.1/a.xml");
    EXPECT_EQ(location_of("file:///nowhere/a.xml|file:///b"), "file:///nowhere/a.xml|file:///b");
}

class CliOptionsPaths : public testing::Test {
  protected:
    void SetUp() override {
        std::string pattern = (fs::temp_directory_path() / "velkcli-XXXXXX").string();
        ASSERT_NE(mkdtemp(pattern.data()), nullptr);
        folder_ = pattern;
        former_ = fs::current_path();
        fs::current_path(folder_);
        std::ofstream("a b.xml") << "x";
        std::ofstream("c|d.xml") << "x";
    }
    void TearDown() override {
        fs::current_path(former_);
        fs::remove_all(folder_);
    }

    fs::path folder_;
    fs::path former_;
};

TEST_F(CliOptionsPaths, BecomeAbsoluteLocations) {
    const std::string expected = "file://" + (fs::current_path() / "a b.xml").string();
    EXPECT_EQ(location_of("a b.xml"), expected);
    EXPECT_EQ(location_of("./x/../a b.xml"), expected);
}

TEST_F(CliOptionsPaths, ThatAreNoFilesOrCannotBeListedAreRefused) {
    for (const char *path : {"missing.xml", ".", "", "c|d.xml"}) {
        EXPECT_THROW(location_of(path), UsageError) << path;
    }
}

TEST(CliOptions, LocationsAreSplitAtBars) {
    EXPECT_EQ(split_locations({"a|b", "c", "d|"}),
              (std::vector<std::string>{"a", "b", "c", "d", ""}));
}

TEST(CliOptions, WhatTheLibraryDropsWithoutAWordIsSaid) {
    EXPECT_TRUE(location_warnings(std::vector<std::string>(20, std::string(199, 'x'))).empty());
    const auto long_one = location_warnings({std::string(200, 'x')});
    ASSERT_EQ(long_one.size(), 1U);
    EXPECT_NE(long_one[0].find("199"), std::string::npos);
    const auto many = location_warnings(std::vector<std::string>(23, "x"));
    ASSERT_EQ(many.size(), 1U);
    EXPECT_NE(many[0].find("last 3"), std::string::npos);
}

}  // namespace
}  // namespace velkhost::cli

// The status line and package ids, as the library writes them and as they can go wrong.
#include "host/rig/status_line.h"

#include <gtest/gtest.h>

namespace velkhost::rig {
namespace {

TEST(RigStatusLine, TwoPackagesAreReadInOrder) {
    const auto line = parse_status_line(
        "0|pkgA: 50: Package installation successfully.|pkgB: 10: Package download completed and "
        "the update process is running.|");
    ASSERT_TRUE(line);
    EXPECT_EQ(line->overall, 0);
    EXPECT_FALSE(line->cut);
    const std::vector<PackageStatus> expected = {
        {"pkgA", 50, "Package installation successfully."},
        {"pkgB", 10, "Package download completed and the update process is running."}};
    EXPECT_EQ(line->packages, expected);
}

TEST(RigStatusLine, OverallValueAloneIsALineWithoutPackages) {
    EXPECT_EQ(parse_status_line("1|"), (StatusLine{1, {}, false}));
}

TEST(RigStatusLine, TextWithoutOverallValueIsRefused) {
    EXPECT_FALSE(parse_status_line(""));
    EXPECT_FALSE(parse_status_line("1"));
    EXPECT_FALSE(parse_status_line("|"));
    EXPECT_FALSE(parse_status_line("x|pkgA: 50: ok|"));
    EXPECT_FALSE(parse_status_line("begin to record VELK-1-0|a: 1: b|"));
}

TEST(RigStatusLine, NegativeAndHugeCodes) {
    EXPECT_EQ(parse_package_status("a: -1: m"), (PackageStatus{"a", -1, "m"}));
    EXPECT_FALSE(parse_package_status("a: 99999999999: m"));
}

TEST(RigStatusLine, EmptyIdAndEmptyMessageAreKept) {
    EXPECT_EQ(parse_package_status(": 0: "), (PackageStatus{"", 0, ""}));
}

TEST(RigStatusLine, IdWithColonsEndsAtTheFirstNumberBetweenMarks) {
    EXPECT_EQ(parse_package_status("odd: name: 7a: 53: Get: 5: lock."),
              (PackageStatus{"odd: name: 7a", 53, "Get: 5: lock."}));
    EXPECT_EQ(parse_package_status("C:x: 50: y"), (PackageStatus{"C:x", 50, "y"}));
}

TEST(RigStatusLine, TextWithoutCodeIsNoPackageStatus) {
    EXPECT_FALSE(parse_package_status(""));
    EXPECT_FALSE(parse_package_status("pkgA"));
    EXPECT_FALSE(parse_package_status("pkgA: 50"));
    EXPECT_FALSE(parse_package_status("pkgA: fifty: x"));
    EXPECT_FALSE(parse_package_status("pkgA: 5 : x"));
}

TEST(RigStatusLine, MessageWithBarIsPutTogetherAgain) {
    const auto line = parse_status_line("0|a: 56: error: x|y|z|b: 50: ok|");
    ASSERT_TRUE(line);
    ASSERT_EQ(line->packages.size(), 2U);
    EXPECT_EQ(line->packages[0], (PackageStatus{"a", 56, "error: x|y|z"}));
    EXPECT_EQ(line->packages[1], (PackageStatus{"b", 50, "ok"}));
}

TEST(RigStatusLine, LeadingPieceWithoutCodeIsAPackageOfWhichNothingIsKnown) {
    const auto line = parse_status_line("0|strange|b: 50: ok|");
    ASSERT_TRUE(line);
    EXPECT_EQ(line->packages[0], (PackageStatus{"strange", std::nullopt, ""}));
}

TEST(RigStatusLine, CutInMessageKeepsCodeAndSaysSo) {
    const auto line = parse_status_line("0|a: 50: ok|b: 62: Updating and Pack");
    ASSERT_TRUE(line);
    EXPECT_TRUE(line->cut);
    EXPECT_EQ(line->packages.back(), (PackageStatus{"b", 62, "Updating and Pack"}));
}

TEST(RigStatusLine, CutInIdOrCodeLeavesTheCodeUnknown) {
    EXPECT_EQ(parse_status_line("0|a: 50: ok|b_lo")->packages.back(),
              (PackageStatus{"b_lo", std::nullopt, ""}));
    EXPECT_EQ(parse_status_line("0|a: 50: ok|b: 6")->packages.back(),
              (PackageStatus{"b: 6", std::nullopt, ""}));
}

TEST(RigPackageId, IsTheFileNameWithoutItsLastExtension) {
    EXPECT_EQ(package_id("tftp://server/dir/pkg_1.2.xml"), "pkg_1.2");
    EXPECT_EQ(package_id("file:///a.b/plain"), "plain");
    EXPECT_EQ(package_id("name.xml"), "name");
    EXPECT_EQ(package_id("dir/"), "");
    EXPECT_EQ(package_id(""), "");
}

}  // namespace
}  // namespace velkhost::rig

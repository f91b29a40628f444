// Locations of files to be fetched.
#include "host/providers/file_transfer/location.h"

#include <gtest/gtest.h>

namespace velkhost::providers {
namespace {

TEST(TransferLocation, IsTakenApart) {
    const auto out = parse_location("SFTP://h.example.com:2222/pkgs/a%20b.xml");
    ASSERT_TRUE(out);
    EXPECT_EQ(out->url, "sftp://h.example.com:2222/pkgs/a%20b.xml");
    EXPECT_EQ(out->scheme, "sftp");
    EXPECT_EQ(out->file_name, "a%20b.xml");
    EXPECT_FALSE(out->user);
    EXPECT_FALSE(out->password);
}

TEST(TransferLocation, UserInformationIsDecodedAndLeftOutOfTheUrl) {
    const auto out = parse_location("sftp://me%40site:p%3Aw@d@[::1]:22/a.xml");
    ASSERT_TRUE(out);
    EXPECT_EQ(out->user, "me@site");
    EXPECT_EQ(out->password, "p:w@d");
    EXPECT_EQ(out->url, "sftp://[::1]:22/a.xml");
}

TEST(TransferLocation, UserWithoutAPasswordHasNone) {
    const auto out = parse_location("sftp://me@h/a.xml");
    ASSERT_TRUE(out);
    EXPECT_EQ(out->user, "me");
    EXPECT_FALSE(out->password);
}

TEST(TransferLocation, AtSignInThePathIsNoUser) {
    const auto out = parse_location("tftp://h/a@b/c.xml");
    ASSERT_TRUE(out);
    EXPECT_FALSE(out->user);
    EXPECT_EQ(out->url, "tftp://h/a@b/c.xml");
}

class TransferNoLocation : public ::testing::TestWithParam<const char *> {};

TEST_P(TransferNoLocation, HasNoValue) {
    EXPECT_FALSE(parse_location(GetParam()));
}

INSTANTIATE_TEST_SUITE_P(Every, TransferNoLocation,
                         ::testing::Values("", "a.xml", "/a.xml", "://h/a", "tftp:/h/a", "tftp://",
                                           "tftp://h", "tftp://h/", "tftp://h/pkgs/",
                                           "tftp:///a.xml", "tftp://:69/a.xml", "tftp://h/..",
                                           "tftp://h/.", "tftp://h/a b", "tftp://h/a\nb",
                                           "tftp://h/a?b", "tftp://h/a#b", "tftp://h/a\\b",
                                           "sftp://%zz@h/a", "sftp://%00@h/a", "sftp://%4@h/a",
                                           "sftp://u:%@h/a", "sftp://u@/a"));

TEST(TransferLocation, NameThatNoFileCanHaveIsRefused) {
    EXPECT_TRUE(parse_location("tftp://h/" + std::string(200, 'x')));
    EXPECT_FALSE(parse_location("tftp://h/" + std::string(201, 'x')));
}

}  // namespace
}  // namespace velkhost::providers

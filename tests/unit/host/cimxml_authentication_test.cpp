// Who may ask.
#include "host/cimxml/authentication.h"

#include <gmock/gmock.h>
#include <sys/stat.h>

#include <filesystem>
#include <fstream>

namespace velkhost::cimxml {
namespace {

using ::testing::HasSubstr;

const Credentials kWanted = {"root", "se:cret"};

bool lets_in(const std::string &authorization) {
    return is_authorized(kWanted, &authorization);
}

TEST(CimxmlAuthentication, Base64IsReadStrictly) {
    EXPECT_EQ(from_base64("YQ=="), "a");
    EXPECT_EQ(from_base64("YWI="), "ab");
    EXPECT_EQ(from_base64("YWJj"), "abc");
    EXPECT_EQ(from_base64(""), "");
    for (const char *bad : {"Y", "YQ", "YQ=", "YQ=a", "Y===", "Y-==", "YQ==YQ=="}) {
        EXPECT_EQ(from_base64(bad), std::nullopt) << bad;
    }
}

TEST(CimxmlAuthentication, OnlyTheUserWithThePasswordComesIn) {
    EXPECT_TRUE(lets_in("Basic cm9vdDpzZTpjcmV0"));
    EXPECT_TRUE(lets_in("basic  cm9vdDpzZTpjcmV0"));
    EXPECT_FALSE(lets_in("Basic cm9vdDpzZTpjcmV1")) << "another password";
    EXPECT_FALSE(lets_in("Basic Um9vdDpzZTpjcmV0")) << "another user";
    EXPECT_FALSE(lets_in("Basic cm9vdDpzZTpjcmV0cm9vdDpzZTpjcmV0")) << "twice the same";
    EXPECT_FALSE(lets_in("Basic cm9vdA==")) << "no password";
    EXPECT_FALSE(lets_in("Basic ")) << "nothing";
    EXPECT_FALSE(lets_in("Digest cm9vdDpzZTpjcmV0"));
    EXPECT_FALSE(lets_in(""));
    EXPECT_FALSE(is_authorized(kWanted, nullptr));
}

class CimxmlPasswordFile : public ::testing::Test {
  protected:
    void SetUp() override {
        std::string pattern = (std::filesystem::temp_directory_path() / "pw-XXXXXX").string();
        ASSERT_NE(mkdtemp(pattern.data()), nullptr);
        folder_ = pattern;
    }
    void TearDown() override { std::filesystem::remove_all(folder_); }

    std::filesystem::path file(const std::string &text, mode_t mode) {
        auto path = folder_ / "password";
        std::ofstream(path) << text;
        chmod(path.c_str(), mode);
        return path;
    }
    std::string refusal(const std::filesystem::path &path) {
        try {
            return "took " + read_password(path);
        } catch (const PasswordError &error) {
            return error.what();
        }
    }

    std::filesystem::path folder_;
};

TEST_F(CimxmlPasswordFile, FirstLineIsThePassword) {
    EXPECT_EQ(read_password(file("se cret\r\nmore\n", 0600)), "se cret");
    EXPECT_EQ(read_password(file("no line end", 0400)), "no line end");
}

TEST_F(CimxmlPasswordFile, FileOpenToOthersOrEmptyOrMissingIsRefused) {
    EXPECT_THAT(refusal(file("secret\n", 0640)), HasSubstr("chmod 600"));
    EXPECT_THAT(refusal(file("\nsecret\n", 0600)), HasSubstr("no password"));
    EXPECT_THAT(refusal(folder_ / "none"), HasSubstr("No such file"));
}

}  // namespace
}  // namespace velkhost::cimxml

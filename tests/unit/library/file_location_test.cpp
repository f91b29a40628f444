// The location text that is kept for other modules.

#include "catalog/file_location.h"

#include <algorithm>
#include <string>
#include <string_view>

#include "tests/support/library_test.h"
#include "velk/request_state.h"

namespace {

class FileLocation : public velktest::LibraryTest {
  protected:
    FileLocation() { std::ranges::fill(update_file_location, 'x'); }

    static std::string_view stored() { return {update_file_location, sizeof update_file_location}; }
};

}  // namespace

TEST_F(FileLocation, TextIsKeptAndGivenBack) {
    EXPECT_EQ(SetFileLocation("tftp://server/pkgs/"), 0);
    EXPECT_STREQ(GetFileLocation(), "tftp://server/pkgs/");
    EXPECT_EQ(GetFileLocation(), update_file_location);
}

TEST_F(FileLocation, ZeroOfFourBytesIsWrittenAtTheEndOfTheBuffer) {
    SetFileLocation("a");
    EXPECT_EQ(stored().substr(4096), std::string_view("\0\0\0\0", 4));
    EXPECT_EQ(stored()[4095], 'x') << "what lies between stays as it was";
}

TEST_F(FileLocation, AtMost1024CharactersAreStored) {
    for (const std::size_t length : {1023U, 1024U, 1025U, 5000U}) {
        SCOPED_TRACE(length);
        std::ranges::fill(update_file_location, 'x');
        const std::string text(length, 'a');
        EXPECT_EQ(SetFileLocation(text.c_str()), 0);
        EXPECT_EQ(std::string(GetFileLocation()), text.substr(0, 1024));
        EXPECT_EQ(stored()[1025], 'x');
    }
}

TEST_F(FileLocation, NullCountsAsAnEmptyText) {
    EXPECT_EQ(SetFileLocation(nullptr), 0);
    EXPECT_STREQ(GetFileLocation(), "");
}

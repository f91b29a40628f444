// From a location to a package id.

#include <gtest/gtest.h>

#include <array>
#include <cstring>
#include <string>

#include "catalog/descriptor.h"
#include "tests/support/session.h"

namespace {

std::string trimmed(const std::string &location) {
    std::string text = location;
    trimPackageID(text.data());
    return text.substr(0, text.find('\0'));
}

}  // namespace

TEST(PackageId, IsTheFileNameWithoutItsExtension) {
    struct {
        const char *location, *id;
    } const cases[] = {
        {"tftp://server/dir/pkg_1.2.xml", "pkg_1.2"},
        {"file:///pkgs/zeb_fw_rxc.xml", "zeb_fw_rxc"},
        {"dir/", ""},
        {"a/b/c/", ""},
        {"name.xml", "name"},
        {"name", "name"},
        {"dir/name", "name"},
        {"dir.d/name", "name"},  // a point before the last slash is not met
        {"dir/.xml", ""},
        {"dir/name.", "name"},
        {"dir/a..xml", "a."},
        {"", ""},
        // The first character is never examined.
        {"x", "x"},
        {".", "."},
        {"/", "/"},
        {"/a", "/a"},
        {"/a.xml", "/a"},
        {".xml", ".xml"},
        {"//a.xml", "a"},
    };
    for (const auto &row : cases) {
        EXPECT_EQ(trimmed(row.location), row.id) << row.location;
    }
}

TEST(PackageId, TextThatFillsItsFieldIsTrimmedInPlace) {
    std::array<char, velk::kFieldSize> field;
    velktest::set_field(field, "file:///" + std::string(300, 'n'));
    trimPackageID(field.data());
    EXPECT_EQ(std::string(field.data()), std::string(199 - 8, 'n'));
}

TEST(PackageId, NullIsLeftAlone) {
    trimPackageID(nullptr);
}

// Status reports whose texts do not fit: they are cut, and nothing beside them changes.

#include <algorithm>
#include <limits>

#include "tests/support/library_test.h"
#include "velk/request_state.h"
#include "velk/status_report.h"

namespace {

using velktest::record_image;
using velktest::set_field;

class StatusBounds : public velktest::LibraryTest {
  protected:
    StatusBounds() {
        for (velk::PackageRecord &package : pkgInstance) {
            set_field(package.manufacturer, std::string(199, 'm'));  // lies behind the result
            set_field(package.LocalPkgURI, std::string(199, 'l'));   // and before it
        }
    }

    static void expect_neighbours_kept(const velk::PackageRecord &package) {
        EXPECT_EQ(package.manufacturer, std::string(199, 'm'));
        EXPECT_EQ(package.LocalPkgURI, std::string(199, 'l'));
    }

    [[nodiscard]] std::string line() const {
        return velktest::read_file(at("/tmp/sfcb/velkstat.txt"));
    }
};

}  // namespace

TEST_F(StatusBounds, ResultIsCutAt199Characters) {
    use_packages(3);
    set_field(pkgInstance[1].TFTPXMLPkgURIs, "a/pkg.xml");
    const std::string prefix = "pkg: 57: ";
    for (const std::size_t length : {189U, 190U, 191U, 199U, 200U, 1023U, 1024U, 5000U}) {
        SCOPED_TRACE(length);
        const std::string message(length, 'x');
        const std::string before = record_image(0);
        const std::string after = record_image(2);
        update_Pkg_Install_status(1, 57, message.c_str());
        EXPECT_EQ(pkgInstance[1].installResult, (prefix + message).substr(0, 199));
        expect_neighbours_kept(pkgInstance[1]);
        EXPECT_EQ(record_image(0), before);
        EXPECT_EQ(record_image(2), after);
    }
}

TEST_F(StatusBounds, PackageIdThatFillsTheFieldLeavesNoRoomForMore) {
    use_packages(1);
    const std::string id(199, 'n');
    set_field(pkgInstance[0].TFTPXMLPkgURIs, id);
    update_Pkg_Install_status(0, 57, "message");
    EXPECT_EQ(pkgInstance[0].installResult, id);
    expect_neighbours_kept(pkgInstance[0]);
}

TEST_F(StatusBounds, CodeIsCutWhereTheIdLeavesLittleRoom) {
    use_packages(1);
    const std::string id(195, 'n');
    set_field(pkgInstance[0].TFTPXMLPkgURIs, id);
    update_Pkg_Install_status(0, std::numeric_limits<int>::min(), "message");
    EXPECT_EQ(pkgInstance[0].installResult, id + ": -2");
    expect_neighbours_kept(pkgInstance[0]);
}

TEST_F(StatusBounds, LineOfTwentyLongNamesIsCutAt1023Characters) {
    use_packages(20);
    is_async_install = 1;
    std::string whole = "1|";
    for (int i = 0; i < 20; ++i) {
        const std::string id(199, static_cast<char>('a' + i));
        set_field(pkgInstance[i].TFTPXMLPkgURIs, id);
        update_Pkg_Install_status(i, 57, "message");
        whole += id + "|";
    }
    EXPECT_EQ(line(), whole.substr(0, 1023));
    EXPECT_EQ(totalstatus, 1);
    std::ranges::for_each(pkgInstance, expect_neighbours_kept);
}

TEST_F(StatusBounds, LineThatJustFitsIsWhole) {
    use_packages(6);
    is_async_install = 1;
    std::string whole = "0|";
    for (int i = 0; i < 6; ++i) {
        // "0|", five of 200 with their bars and one of 21 make 1023.
        const std::string id(i < 5 ? 199 : 20, 'a');
        set_field(pkgInstance[i].installResult, id);
        whole += id + "|";
    }
    set_field(pkgInstance[0].TFTPXMLPkgURIs, std::string(199, 'a'));
    update_Pkg_Install_status(0, 57, "");
    EXPECT_EQ(whole.size(), 1023U);
    EXPECT_EQ(line(), whole);
}

TEST_F(StatusBounds, IndexOutsideOfTheTableChangesNothing) {
    use_packages(1);
    set_totalstatus(1);
    is_async_install = 1;
    for (const int index :
         {-1, 20, std::numeric_limits<int>::max(), std::numeric_limits<int>::min()}) {
        const std::string before = velktest::session_image();
        EXPECT_EQ(update_Pkg_Install_status(index, 10, "x"), 0);
        EXPECT_EQ(velktest::session_image(), before) << index;
    }
    EXPECT_EQ(line(), "");
}

TEST_F(StatusBounds, PackageCountOutsideOfTheTableDoesNotLeaveIt) {
    is_async_install = 1;
    set_field(pkgInstance[0].TFTPXMLPkgURIs, "a/pkg.xml");
    pkgnum = -3;
    update_Pkg_Install_status(0, 10, "x");
    EXPECT_EQ(line(), "0|");
    pkgnum = 1000;
    update_Pkg_Install_status(0, 10, "x");
    EXPECT_EQ(line(), "0|pkg: 10: x" + std::string(20, '|'));
}

TEST_F(StatusBounds, NullMessageCountsAsEmpty) {
    use_packages(1);
    set_field(pkgInstance[0].TFTPXMLPkgURIs, "a/pkg.xml");
    update_Pkg_Install_status(0, 10, nullptr);
    EXPECT_STREQ(pkgInstance[0].installResult, "pkg: 10: ");
}

// What the history makes of one status line after another.
#include "host/rig/status_history.h"

#include <gtest/gtest.h>

namespace velkhost::rig {
namespace {

constexpr const char *kFile = "/tmp/sfcb/velkstatVELK-1.txt";

TEST(RigStatusHistory, OnlyWhatChangedIsAChange) {
    StatusHistory history;
    history.add(10, kFile, "0|a: 0: init|b: 0: init|");
    history.add(20, kFile, "0|a: 62: busy|b: 0: init|");
    history.add(30, kFile, "0|a: 62: busy|b: 0: init|");
    const auto changes = history.changes();
    ASSERT_EQ(changes.size(), 3U);
    EXPECT_EQ(changes[2].time_us, 20);
    EXPECT_EQ(changes[2].package, 0U);
    EXPECT_EQ(changes[2].status, (PackageStatus{"a", 62, "busy"}));
    EXPECT_EQ(history.entries().size(), 3U);
    EXPECT_EQ(history.entries()[2].path, kFile);
}

TEST(RigStatusHistory, PackageThatALineNoLongerShowsHasNotChanged) {
    StatusHistory history;
    history.add(1, kFile, "0|a: 0: x|b: 0: x|");
    history.add(2, kFile, "0|a: 0: x|");
    EXPECT_EQ(history.changes().size(), 2U);
}

TEST(RigStatusHistory, CutOfTheLastPackageIsNoChange) {
    StatusHistory history;
    history.add(1, kFile, "0|a: 0: x|b: 50: installed|");
    for (const char *cut :
         {"0|a: 0: x|b: 50: inst", "0|a: 0: x|b: 5", "0|a: 0: x|b", "0|a: 0: x|"}) {
        history.add(2, kFile, cut);
        EXPECT_EQ(history.changes().size(), 2U) << cut;
    }
    history.add(3, kFile, "0|a: 0: x|b: 50: installed|");
    EXPECT_EQ(history.changes().size(), 2U);
    EXPECT_EQ(history.entries().size(), 6U);
}

TEST(RigStatusHistory, CutPackageThatSaysSomethingElseHasChanged) {
    StatusHistory history;
    history.add(1, kFile, "0|a: 0: x|b: 0: waiting|");
    history.add(2, kFile, "0|a: 0: x|b: 62: bu");
    history.add(3, kFile, "0|a: 0: x|b: 62: busy|");
    const auto changes = history.changes();
    ASSERT_EQ(changes.size(), 4U);
    EXPECT_EQ(changes[2].status, (PackageStatus{"b", 62, "bu"}));
    EXPECT_EQ(changes[3].status, (PackageStatus{"b", 62, "busy"}));
}

TEST(RigStatusHistory, TextThatIsNoStatusLineIsLeftOut) {
    StatusHistory history;
    history.add(1, kFile, "");
    history.add(2, kFile, "no line");
    EXPECT_TRUE(history.entries().empty());
}

TEST(RigStatusHistory, ListenerHearsEveryChangeInOrderAndMayAskForAll) {
    StatusHistory history;
    std::vector<std::string> heard;
    history.set_listener([&](const StatusChange &change) {
        heard.push_back(change.status.id + "@" + std::to_string(change.time_us) + "/" +
                        std::to_string(history.changes().size()));
    });
    history.add(5, kFile, "0|a: 0: x|b: 0: x|");
    history.add(6, kFile, "1|a: 0: x|b: 50: y|");
    EXPECT_EQ(heard, (std::vector<std::string>{"a@5/1", "b@5/2", "b@6/3"}));
}

TEST(RigStatusHistory, ClearBeginsAnew) {
    StatusHistory history;
    history.add(1, kFile, "0|a: 0: x|");
    history.clear();
    EXPECT_TRUE(history.entries().empty());
    history.add(2, kFile, "0|a: 0: x|");
    EXPECT_EQ(history.changes().size(), 1U);
}

}  // namespace
}  // namespace velkhost::rig

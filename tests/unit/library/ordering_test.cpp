// The sequence in which packages are installed.

#include "provider/ordering.h"

#include "tests/support/library_test.h"

namespace {

using velktest::entry;
using velktest::set_field;
using Sequence = std::vector<int>;
using Texts = std::vector<std::string>;

class Ordering : public velktest::LibraryTest {
  protected:
    // Adds a package with the next index.
    velk::PackageRecord &add(const std::string &code, int flag, const Texts &prerequisites = {}) {
        velk::PackageRecord &package = pkgInstance[pkgnum++];
        set_field(package.identificationCode, code);
        set_field(package.Name, "name of " + code);
        set_field(package.supersedes, "No supersedes");
        package.OrderFlag = flag;
        for (const std::string &prerequisite : prerequisites) {
            set_field(package.preReq[package.prereqnum++], prerequisite);
        }
        return package;
    }

    static Sequence order() {
        OrderPkgInstallation();
        return {PkgSeq, PkgSeq + pkgnum};
    }

    static Sequence flags() {
        Sequence result;
        for (int i = 0; i < pkgnum; ++i) {
            result.push_back(pkgInstance[i].OrderFlag);
        }
        return result;
    }
};

}  // namespace

TEST_F(Ordering, LowestFlagComesFirst) {
    add("a", 350);
    add("b", 250);
    add("c", 400);
    EXPECT_EQ(order(), (Sequence{1, 0, 2}));
}

TEST_F(Ordering, TiesGoToTheHighestIndex) {
    add("a", 300);
    add("b", 400);
    add("c", 350);
    add("d", 300);
    EXPECT_EQ(order(), (Sequence{3, 0, 2, 1}));
}

TEST_F(Ordering, EqualFlagsReverseTheTable) {
    for (int i = 0; i < 20; ++i) {
        add("p" + std::to_string(i), 450);
    }
    Sequence expected;
    for (int i = 19; i >= 0; --i) {
        expected.push_back(i);
    }
    EXPECT_EQ(order(), expected);
}

TEST_F(Ordering, RejectedPackagesAreOrderedLikeAnyOther) {
    add("a", 1002);
    add("b", 1001);
    add("c", 1000);
    add("d", 999);
    add("e", 350);
    EXPECT_EQ(order(), (Sequence{4, 3, 2, 1, 0}));
}

TEST_F(Ordering, NoPackageGivesNoSequence) {
    PkgSeq[0] = 7;
    EXPECT_EQ(order(), Sequence{});
    EXPECT_EQ(PkgSeq[0], 7);
}

TEST_F(Ordering, PrerequisiteIsPutOneBelowItsDependant) {
    add("a", 1001, {"b"});
    add("b", 1001);
    EXPECT_EQ(order(), (Sequence{1, 0}));
    EXPECT_EQ(flags(), (Sequence{1001, 1000}));
}

TEST_F(Ordering, PrerequisiteThatIsEarlierAnywayIsMovedAsWell) {
    add("a", 400, {"b"});
    add("b", 250);
    EXPECT_EQ(order(), (Sequence{1, 0}));
    EXPECT_EQ(flags(), (Sequence{400, 399}));
}

TEST_F(Ordering, ChainIsFollowedInTableOrder) {
    add("a", 400, {"b"});
    add("b", 350, {"c"});
    add("c", 350);
    EXPECT_EQ(order(), (Sequence{2, 1, 0}));
    EXPECT_EQ(flags(), (Sequence{400, 399, 398}));
}

TEST_F(Ordering, PrerequisiteSeenBeforeItsDependantIsLoweredByTheFlagOfThatMoment) {
    add("c", 350);
    add("b", 350, {"c"});
    add("a", 300, {"b"});
    EXPECT_EQ(flags(), (Sequence{350, 350, 300}));
    EXPECT_EQ(order(), (Sequence{1, 2, 0}));
    EXPECT_EQ(flags(), (Sequence{349, 299, 300}));
}

TEST_F(Ordering, EveryPackageOfThatCodeIsAPrerequisite) {
    add("b", 450);
    add("a", 400, {"b"});
    add("b", 350);
    EXPECT_EQ(order(), (Sequence{2, 0, 1}));
    EXPECT_EQ(flags(), (Sequence{399, 400, 399}));
}

TEST_F(Ordering, CodesAreComparedLetterForLetter) {
    add("a", 400, {"B"});
    add("b", 350);
    add("Bb", 350);
    order();
    EXPECT_EQ(flags(), (Sequence{999, 350, 350}));
}

TEST_F(Ordering, MissingPrerequisiteMarksThePackage) {
    add("a", 350, {"x"});
    add("b", 400);
    EXPECT_EQ(order(), (Sequence{1, 0}));
    EXPECT_EQ(flags(), (Sequence{999, 400}));
}

TEST_F(Ordering, OnePrerequisiteFoundSilencesTheMarkForAllLaterOnes) {
    add("a", 350, {"b", "x"});
    add("b", 400);
    add("c", 300, {"y"});
    order();
    EXPECT_EQ(flags(), (Sequence{350, 349, 300}));
}

TEST_F(Ordering, MarkMadeBeforeTheFirstFindStays) {
    add("a", 350, {"x", "b"});
    add("b", 400);
    order();
    // The mark is the dependant's flag when its second prerequisite is placed.
    EXPECT_EQ(flags(), (Sequence{999, 998}));
}

TEST_F(Ordering, PackageThatNeedsItselfIsLoweredByOne) {
    add("a", 350, {"a"});
    order();
    EXPECT_EQ(flags(), (Sequence{349}));
}

TEST_F(Ordering, PackagesThatNeedEachOtherEnd) {
    add("a", 350, {"b"});
    add("b", 350, {"a"});
    EXPECT_EQ(order(), (Sequence{0, 1}));
    EXPECT_EQ(flags(), (Sequence{348, 349}));
}

TEST_F(Ordering, SupersededPackageBecomesAPrerequisiteToo) {
    add("a", 400, {"b"});
    set_field(add("b", 300).supersedes, "c");
    add("c", 450);
    EXPECT_EQ(order(), (Sequence{2, 1, 0}));
    EXPECT_EQ(flags(), (Sequence{400, 399, 399}));
    EXPECT_EQ(pkgInstance[0].prereqnum, 2);
    EXPECT_STREQ(pkgInstance[0].preReq[1], "c");
    EXPECT_EQ(pkgInstance[1].prereqnum, 0);
}

TEST_F(Ordering, SupersededTextsArePutDownWhateverTheyAre) {
    add("a", 400, {"b", "c"});
    set_field(add("b", 300).supersedes, "no supersedes");
    set_field(add("c", 300).supersedes, "");
    order();
    EXPECT_EQ(pkgInstance[0].prereqnum, 4);
    EXPECT_STREQ(pkgInstance[0].preReq[2], "no supersedes");
    EXPECT_STREQ(pkgInstance[0].preReq[3], "");
}

TEST_F(Ordering, SupersededTextsStopAtTheFifthEntry) {
    velk::PackageRecord &a = add("a", 400, {"b", "b", "b"});
    set_field(a.supersedes, "behind the list");
    set_field(add("b", 300).supersedes, "x");
    order();
    EXPECT_EQ(a.prereqnum, 5);
    EXPECT_STREQ(a.preReq[3], "x");
    EXPECT_STREQ(a.preReq[4], "x");
    EXPECT_STREQ(a.supersedes, "behind the list");
}

TEST_F(Ordering, CircleOfSupersededTextsEnds) {
    add("a", 400, {"b"});
    set_field(add("b", 300).supersedes, "b");
    EXPECT_EQ(order(), (Sequence{1, 0}));
    EXPECT_EQ(pkgInstance[0].prereqnum, 5);
}

TEST_F(Ordering, CountOfPrerequisitesBeyondTheListIsReadUpToItsEnd) {
    // As a descriptor with two arrays of five leaves it.
    velk::PackageRecord &a = add("a", 400, {"v", "w", "x", "y", "b"});
    a.prereqnum = 10;
    set_field(a.supersedes, "c");
    set_field(add("b", 300).supersedes, "d");
    add("c", 300);
    order();
    EXPECT_EQ(flags(), (Sequence{999, 998, 300}));
    EXPECT_EQ(a.prereqnum, 10);
    EXPECT_STREQ(a.supersedes, "c");
}

TEST_F(Ordering, EmptyPrerequisiteFitsPackagesWithoutACode) {
    add("a", 400, {""});
    add("", 450);
    order();
    EXPECT_EQ(flags(), (Sequence{400, 399}));
}

TEST_F(Ordering, CountOutsideOfTheTableDoesNotLeaveIt) {
    pkgnum = 1000;
    OrderPkgInstallation();
    EXPECT_EQ(PkgSeq[0], 19);
    pkgnum = -1;
    OrderPkgInstallation();
    EXPECT_EQ(PkgSeq[0], 19);
}

// What the ordering writes into the debug log.

#include "provider/ordering.h"
#include "tests/support/library_test.h"

namespace {

using velktest::entries;
using velktest::entry;
using velktest::set_field;

class OrderingLog : public velktest::LibraryTest {
  protected:
    OrderingLog() {
        use_packages(2);
        set_package(0, "zeb_a", "First", 400);
        set_package(1, "zeb_b", "Second", 350);
    }

    static void set_package(int index, const char *code, const char *name, int flag) {
        set_field(pkgInstance[index].identificationCode, code);
        set_field(pkgInstance[index].Name, name);
        set_field(pkgInstance[index].supersedes, "No supersedes");
        pkgInstance[index].OrderFlag = flag;
    }

    static void set_prerequisite(int index, const char *code) {
        set_field(pkgInstance[index].preReq[0], code);
        pkgInstance[index].prereqnum = 1;
    }
};

// Of two packages, the second of which comes first.
const std::string kSelection = entries({"ee0:", "mm0:", "xx1:", "ee0:", "mm0:", "xx0:"}) +
                               entry("Pakage installation sequence:") + "\n" +
                               entries({"--1:Second\n", "--0:First\n"});

}  // namespace

TEST_F(OrderingLog, SelectionIsLoggedStepByStep) {
    OrderPkgInstallation();
    EXPECT_EQ(log(), entries({"Enter OrderPkgInstallation.\n", "zeb_a: Order Flag is 400\n",
                              "zeb_b: Order Flag is 350\n"}) +
                         kSelection);
}

TEST_F(OrderingLog, EntriesOfPackagesThatWereChosenAreOne) {
    pkgInstance[1].OrderFlag = 450;
    OrderPkgInstallation();
    EXPECT_TRUE(log().ends_with(entries({"ee0:", "mm0:", "xx0:", "ee1:", "ee0:", "mm1:", "xx1:"}) +
                                entry("Pakage installation sequence:") + "\n" +
                                entries({"--0:First\n", "--1:Second\n"})));
}

TEST_F(OrderingLog, PrerequisiteThatIsFoundIsLogged) {
    set_prerequisite(0, "zeb_b");
    OrderPkgInstallation();
    EXPECT_EQ(log(), entries({"Enter OrderPkgInstallation.\n", "zeb_a"}) +
                         " require to install Prereq Package zeb_b\n" +
                         entries({"Prereq Package is found in xml list.\n",
                                  "zeb_a: Order Flag is 400\n", "zeb_b: Order Flag is 399\n"}) +
                         kSelection);
}

TEST_F(OrderingLog, PrerequisiteThatIsMissingIsLogged) {
    set_prerequisite(0, "zeb_x");
    OrderPkgInstallation();
    EXPECT_EQ(log(), entries({"Enter OrderPkgInstallation.\n", "zeb_a"}) +
                         " require to install Prereq Package zeb_x\n" +
                         entries({"Prereq is not found in xml list.\n",
                                  "zeb_a: Order Flag is 999\n", "zeb_b: Order Flag is 350\n"}) +
                         kSelection);
}

TEST_F(OrderingLog, SupersededTextIsLoggedAndLookedUpInItsTurn) {
    set_prerequisite(0, "zeb_b");
    set_field(pkgInstance[1].supersedes, "zeb_old");
    OrderPkgInstallation();
    EXPECT_EQ(log(), entries({"Enter OrderPkgInstallation.\n", "zeb_a"}) +
                         " require to install Prereq Package zeb_b\n" +
                         entries({"Prereq Package is found in xml list.\n",
                                  "There is supersedes info for the prereq Package.\n", "zeb_a"}) +
                         " require to install Prereq Package zeb_old\n" +
                         entries({"zeb_a: Order Flag is 400\n", "zeb_b: Order Flag is 399\n"}) +
                         kSelection);
}

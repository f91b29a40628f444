// The course of a session in time: what lies inside of it, how often the controller is asked while
// an install takes hours, and one session after the other.
#include <unistd.h>

#include <algorithm>

#include "installers/Emulex_update.h"
#include "tests/unit/library/adapter_families.h"

namespace velktest {
namespace {

using ::testing::ElementsAre;
using Texts = std::vector<std::string>;

constexpr const char *kSuccess = "50: Package installation successfully.";
constexpr unsigned kWatchersEnd = 61;

class AdapterWatching : public AdapterTest, public ::testing::WithParamInterface<AdapterFamily> {
  protected:
    static const AdapterFamily &family() { return GetParam(); }

    // The vendor takes so long, a multiple of ten seconds, each with a job of its own kind.
    void take(unsigned seconds) {
        const std::string name = family().name;
        const auto polls = seconds / 10;
        if (name.starts_with("Qlogic")) {
            vendor("QLogic_UpdateJob").looks = std::deque(polls, job_state(4));
            vendor("QLogic_UpdateJob").looks.push_back(job_state(7));
        } else if (name == "Broadcom") {
            auto &answers = vendor(family().service).answers["CheckStatus"];
            answers = std::deque(polls, update_status(1));
            answers.push_back(update_status(0));
        } else {
            vendor(family().service).seconds = seconds;
        }
    }

    // Where in the log a text stands for the first time.
    [[nodiscard]] std::size_t place_of(std::string_view text) const {
        const std::size_t place = log().find(text);
        EXPECT_NE(place, std::string::npos) << text;
        return place;
    }

    // The controller was asked this so often.
    [[nodiscard]] int asked(const std::string &words) const {
        return static_cast<int>(std::ranges::count(exchanges(), words));
    }
};

TEST_P(AdapterWatching, ControllerIsAskedEveryThirtySecondsForHours) {
    attach();
    family().furnish(*this);
    constexpr unsigned kThreeHoursAndTenSeconds = 3 * 3600 + 10;
    take(kThreeHoursAndTenSeconds);
    EXPECT_EQ(install(family().install), 0);
    EXPECT_THAT(reports(), ElementsAre(kSuccess));
    EXPECT_EQ(status_queries(), 3 * 120 + 1);
    EXPECT_EQ(asked("status 1 -> done"), 3 * 120 + 1);
    sleep(3600);
    EXPECT_EQ(status_queries(), 3 * 120 + 1) << "the watcher has ended";
}

TEST_P(AdapterWatching, SessionLiesAroundThePayloadsAndBeforeTheReport) {
    attach();
    family().furnish(*this);
    vendor(family().service).seconds = 5;
    install(family().install);
    const auto begin = place_of("Start SMM successfully.");
    const auto end = place_of("SMM : smm_disconnect enter .");
    EXPECT_LT(place_of(family().unpacked_line), begin);
    EXPECT_LT(begin, place_of("To install package"));
    EXPECT_LT(place_of("To install package"), end);
    EXPECT_LT(place_of("smm : smm_disconnect successfully."), place_of("enter update velk status"));
    if (family().removed_line != nullptr) {
        EXPECT_LT(place_of(family().removed_line), end);
    }
}

TEST_P(AdapterWatching, SecondPackageHasASessionOfItsOwn) {
    attach();
    family().furnish(*this);
    vendor(family().service).seconds = 5;
    for (const int index : {0, 1}) {
        EXPECT_EQ(install(family().install, index), 0);
        sleep(kWatchersEnd);
        const std::string handle = std::to_string(index + 1);
        EXPECT_EQ(exchanges().back(), "destroy " + handle + " -> done");
        EXPECT_EQ(asked("status " + handle + " -> done"), 1);
    }
    EXPECT_STREQ(package(0).installResult, "adapter: 50: Package installation successfully.");
    EXPECT_STREQ(package(1).installResult, "second: 50: Package installation successfully.");
}

TEST_P(AdapterWatching, SecondPackageIsNotHarmedByAFailedSessionOfTheFirst) {
    attach({fault("bmc.begin", ControllerFault::kRefuse, 0, 1)});
    family().furnish(*this);
    vendor(family().service).seconds = 5;
    EXPECT_EQ(install(family().install, 0), 0);
    EXPECT_EQ(install(family().install, 1), 0);
    EXPECT_EQ(logged("Start SMM successfully.\n"), 1);
    EXPECT_EQ(exchanges().back(), "destroy 2 -> done");
}

INSTANTIATE_TEST_SUITE_P(Each, AdapterWatching,
                         ::testing::ValuesIn(adapter_families().begin(), adapter_families().end()),
                         family_name);

class AdapterWatcher : public AdapterTest {};

// The flag is set anew before it has looked at it.
TEST_F(AdapterWatcher, OneThatHasNotEndedGoesOnWithItsOwnSession) {
    attach();
    furnish_emulex_fc(*this);
    vendor("ELXHBA_SoftwareInstallationService").seconds = 5;
    install(installElxFCPkg, 0);
    install(installElxFCPkg, 1);
    Texts queries = exchanges();
    std::erase_if(queries, [](const std::string &words) { return !words.starts_with("status"); });
    EXPECT_THAT(queries,
                ElementsAre("status 1 -> done", "status 2 -> done", "status 1 -> refused"));
    sleep(3600);
    EXPECT_EQ(status_queries(), 3) << "both have ended";
    EXPECT_EQ(exchanges().back(), "destroy 2 -> done");
}

TEST_F(AdapterWatcher, PackagesOfAllFamiliesFollowEachOther) {
    attach();
    Texts expected;
    int handle = 0;
    for (const AdapterFamily &family : adapter_families()) {
        family.furnish(*this);
        vendor(family.service).seconds = 5;
        EXPECT_EQ(install(family.install), 0) << family.name;
        sleep(kWatchersEnd);
        EXPECT_EQ(exchanges().back(), "destroy " + std::to_string(++handle) + " -> done");
        expected.emplace_back(kSuccess);
        // Where both functions are there, the network function is taken.
        vendor("QLogic_NIC_PhysicalPackagePortController").linked.clear();
    }
    EXPECT_EQ(reports(), expected);
}

}  // namespace
}  // namespace velktest

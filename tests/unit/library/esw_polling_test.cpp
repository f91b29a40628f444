// Following the controller's job to its end.

#include "tests/unit/library/esw_fixture.h"

#include "tests/support/report_log.h"

namespace {

using velktest::entries;
using velktest::entry;
using velktest::report_log;
using Texts = std::vector<std::string>;
using Pauses = std::vector<int>;

constexpr const char *kError = "57: Package installation error happened.";
constexpr const char *kFailureData = "53: Need download FFDC File from ESXi.";
constexpr const char *kSuccess = "50: Package installation successfully.";
constexpr const char *kInitializing = "62: Initialization and Package installation is running.";

class SystemFirmwareJob : public velktest::SystemFirmwareTest {
  protected:
    void show(const std::string &status) { job().show(velktest::kit::Text(status)); }

    // One look at the job, no other; the final report.
    std::string end_of(const std::string &status, int expected_result) {
        show(status);
        EXPECT_EQ(install(), expected_result);
        EXPECT_TRUE(job().is_over());
        EXPECT_EQ(package().OrderFlag, 350);
        return std::string(package().installResult).substr(std::string("rxc: ").size());
    }
};

}  // namespace

TEST_F(SystemFirmwareJob, FinalTextsEndTheInstall) {
    struct {
        const char *text;
        const char *report;
        int result;
    } const cases[] = {
        {"Process Completed", kSuccess, 0},
        {"Completed, need restart system to active FPGA.",
         "50: Package installation successfully and need restart system to active FPGA.", 0},
        {"Unable to ping through RXC IP address", "53: Unable to ping through RXC IP address.", 1},
        {"Unable to connect RXC through IPMI over KCS",
         "53: Unable to connect RXC through IPMI over KCS.", 1},
        {"Get active lock failed", "53: Get active lock failed.", 1},
        {"Completed", kError, 1},
        {"process completed", kError, 1},
        {"Process Completed.", kError, 1},
        {" Process Completed", kError, 1},
        {"Process Completed|", kError, 1},
        {"Get active lock failed.", kError, 1},
        {"", kError, 1},
    };
    for (const auto &row : cases) {
        EXPECT_EQ(end_of(std::string("0x00|") + row.text, row.result), row.report) << row.text;
    }
}

TEST_F(SystemFirmwareJob, RunningTextsAreReportedAndWaitedFor) {
    struct {
        const char *text, *report;
    } const cases[] = {
        {"Initialization", kInitializing},
        {"Transfering file to RXC",
         "62: Transfering file to RXC and Package installation is running."},
        {"updating firmware", "62: Updating and Package installation is running."},
        {"RXC rebooting", "62: RXC rebooting and Package installation is running."},
    };
    Texts expected;
    for (const auto &row : cases) {
        show(std::string("0x00|") + row.text);
        expected.emplace_back(row.report);
    }
    show("0x00|Process Completed");
    expected.emplace_back(kSuccess);
    EXPECT_EQ(install(), 0);
    EXPECT_EQ(reports(), expected);
    EXPECT_EQ(pauses(), Pauses(5, 10));
}

TEST_F(SystemFirmwareJob, RunningTextsMustFitWhole) {
    for (const char *text :
         {"initialization", "Transferring file to RXC", "Updating firmware", "RXC rebooting."}) {
        EXPECT_EQ(end_of(std::string("0x00|") + text, 1), kError) << text;
    }
}

TEST_F(SystemFirmwareJob, DetailCodeInTheFailureRangeOutweighsTheText) {
    struct {
        const char *primary, *report;
        int result;
    } const cases[] = {
        {"0x0F", kSuccess, 0},     {"0x10", kFailureData, 1}, {"0x11", kFailureData, 1},
        {"0x2a", kFailureData, 1}, {"0x42", kFailureData, 1}, {"0x43", kSuccess, 0},
        {"0x00", kSuccess, 0},     {"", kSuccess, 0},         {"10", kSuccess, 0},
        {"zz10", kFailureData, 1}, {"0x110", kSuccess, 0},
    };
    for (const auto &row : cases) {
        EXPECT_EQ(end_of(std::string(row.primary) + "|Process Completed", row.result), row.report)
            << row.primary;
    }
}

TEST_F(SystemFirmwareJob, DetailCodeEndsARunningJobAsWell) {
    EXPECT_EQ(end_of("0x20|Initialization", 1), kFailureData);
    EXPECT_EQ(pauses(), Pauses{10});
}

TEST_F(SystemFirmwareJob, StatusWithoutABarIsAllText) {
    EXPECT_EQ(end_of("Process Completed", 0), kSuccess);
    EXPECT_EQ(end_of("0x20", 1), kError);
    EXPECT_EQ(end_of("", 1), kError);
}

TEST_F(SystemFirmwareJob, LongStatusIsCutAndUnknown) {
    for (const std::size_t length : {1022U, 1023U, 1024U, 5000U}) {
        EXPECT_EQ(end_of("0x00|" + std::string(length, 'x'), 1), kError) << length;
        EXPECT_EQ(end_of(std::string(length, '1') + "|Process Completed", 1), kError) << length;
    }
    EXPECT_EQ(end_of("0x00|Process Completed" + std::string(2000, ' '), 1), kError);
}

TEST_F(SystemFirmwareJob, ThreeLooksInARowWithoutAStatusFail) {
    job().show_nothing();
    job().show(velktest::kit::Text());  // null
    job().hide();
    EXPECT_EQ(install(), 1);
    EXPECT_EQ(reports(), Texts{kError});
    EXPECT_EQ(pauses(), Pauses(3, 10)) << "one before the first look, none after the third";
    EXPECT_EQ(package().OrderFlag, 350);
}

TEST_F(SystemFirmwareJob, EveryKindOfMissingStatusTakesFromTheBudget) {
    const auto kinds = {
        +[](velktest::UpdateJob &job) { job.show_nothing(); },
        +[](velktest::UpdateJob &job) { job.show(velktest::kit::Text()); },
        +[](velktest::UpdateJob &job) { job.hide(); },
        +[](velktest::UpdateJob &job) { job.show(std::uint16_t{7}); },  // no text
    };
    for (const auto kind : kinds) {
        for (int i = 0; i < 3; ++i) {
            kind(job());
        }
        EXPECT_EQ(install(), 1);
        EXPECT_TRUE(job().is_over());
        EXPECT_STREQ(package().installResult, (std::string("rxc: ") + kError).c_str());
    }
    EXPECT_EQ(pauses(), Pauses(12, 10));
}

TEST_F(SystemFirmwareJob, RunningTextFillsTheBudgetUpAgain) {
    job().hide();
    job().hide();
    show("0x00|Initialization");
    job().hide();
    job().hide();
    show("0x00|Process Completed");
    EXPECT_EQ(install(), 0);
    EXPECT_EQ(reports(), (Texts{kInitializing, kSuccess}));
    EXPECT_EQ(pauses(), Pauses(6, 10));
    EXPECT_EQ(velktest::occurrences(log(), "Update time elapses 10\n"), 1)
        << "waits without a status do not count";
    EXPECT_EQ(velktest::occurrences(log(), "Update time elapses "), 1);
}

TEST_F(SystemFirmwareJob, ServiceThatNamesNoJobIsOneWithoutAStatus) {
    controller().end.outputs.clear();
    EXPECT_EQ(install(), 1);
    EXPECT_EQ(reports(), Texts{kError});
    EXPECT_EQ(pauses(), Pauses(3, 10));
    EXPECT_EQ(up_calls().size(), 1U) << "there is nothing to look at";
}

TEST_F(SystemFirmwareJob, JobOfAnotherTypeIsNone) {
    controller().end.outputs = {{"Job", velktest::kit::Text("ZEB_UpdateJob")}};
    EXPECT_EQ(install(), 1);
    EXPECT_EQ(up_calls().size(), 1U);
}

TEST_F(SystemFirmwareJob, ReferenceToTheJobIsReleasedWhenTheStartFails) {
    controller().end.value = 0;
    EXPECT_EQ(install(), 1);
    EXPECT_EQ(broker().ledger().live_clones(), 0U);
}

TEST_F(SystemFirmwareJob, ThereIsNoLimitOfTime) {
    constexpr int kLooks = 1000;
    for (int i = 0; i < kLooks; ++i) {
        show("0x00|updating firmware");
    }
    show("0x00|Process Completed");
    EXPECT_EQ(install(), 0);
    EXPECT_EQ(pauses(), Pauses(kLooks + 1, 10));
    EXPECT_EQ(velktest::occurrences(log(), "Update time elapses 10000\n"), 1);
    EXPECT_EQ(broker().ledger().live_clones(), 0U);
}

TEST_F(SystemFirmwareJob, RunIsLoggedStepByStep) {
    show("0x01|Initialization");
    show("0x02|Process Completed");
    EXPECT_EQ(install(), 0);
    EXPECT_EQ(log(),
              entries({"Enter installESWPkg.\n", "This update is for primary bank.\n",
                       "This update with rxc reboot", "To install package..."}) +
                  "file:///pkgs/fw.bin\n" + entry("retCode: ") + "4096\n" +
                  entries({"Enter GetESWJob Status.\n", "jobstatus is 0x01|Initialization\n",
                           "JobState is 4\n", "primarystatus is 0x01\n",
                           "jobstatus is Initialization\n", "l_DetailStatus is 1\n"},
                          10) +
                  report_log({kLocation, "rxc", 62,
                              "Initialization and Package installation is running.", 10}) +
                  entry("Update time elapses ", 20) + "10\n" +
                  entries({"Enter GetESWJob Status.\n", "jobstatus is 0x02|Process Completed\n",
                           "JobState is 4\n", "primarystatus is 0x02\n",
                           "jobstatus is Process Completed\n", "l_DetailStatus is 2\n"},
                          20) +
                  report_log({kLocation, "rxc", 50, "Package installation successfully.", 20}) +
                  entry("Complete installZEBPackage\n", 20));
}

// Status reports: the record, the overall status and the job's status file.

#include <pthread.h>

#include <cerrno>
#include <set>

#include "host/shim/velkshim.h"
#include "tests/support/library_test.h"
#include "tests/support/report_log.h"
#include "velk/request_state.h"
#include "velk/status_report.h"

namespace {

using velktest::entry;
using velktest::job_file_log;
using velktest::report_log;
using velktest::set_field;

class Status : public velktest::LibraryTest {
  protected:
    static void use_packages(int count) {
        LibraryTest::use_packages(count);
        for (int i = 0; i < count; ++i) {
            set_field(pkgInstance[i].TFTPXMLPkgURIs, location(i));
        }
    }

    static std::string id(int index) { return std::string("pkg") + static_cast<char>('A' + index); }
    static std::string location(int index) { return "file:///pkgs/" + id(index) + ".xml"; }

    [[nodiscard]] std::string job_file(const std::string &job) const {
        return velktest::read_file(at("/tmp/sfcb/velkstat" + job + ".txt"));
    }
};

}  // namespace

TEST_F(Status, ResultIsPackageIdCodeAndMessage) {
    use_packages(2);
    set_field(pkgInstance[1].installResult, "what an earlier report left behind here");
    EXPECT_EQ(update_Pkg_Install_status(1, 50, "Package installation successfully."), 0);
    EXPECT_STREQ(pkgInstance[1].installResult, "pkgB: 50: Package installation successfully.");
    EXPECT_STREQ(pkgInstance[0].installResult, "");
    EXPECT_EQ(pkgInstance[1].TFTPXMLPkgURIs, location(1));
}

TEST_F(Status, MessageIsTakenUnchanged) {
    use_packages(1);
    update_Pkg_Install_status(0, -3, "50% of %s|%n, \"quoted\"\n");
    EXPECT_STREQ(pkgInstance[0].installResult, "pkgA: -3: 50% of %s|%n, \"quoted\"\n");
}

TEST_F(Status, ReportIsLoggedStepByStep) {
    use_packages(1);
    update_Pkg_Install_status(0, 57, "Package installation error happened.");
    EXPECT_EQ(log(), report_log({"file:///pkgs/pkgA.xml", "pkgA", 57,
                                 "Package installation error happened."}));
    EXPECT_EQ(log(), R"([ 8: 5: 3] enter update velk status.
[ 8: 5: 3] pkgInstance[pkgIndex].TFTPXMLPkgURIs:file:///pkgs/pkgA.xml
installResult:file:///pkgs/pkgA.xml
installResult after trim:pkgA
[ 8: 5: 3] pkgA: 57: Package installation error happened.
)");
}

TEST_F(Status, AsynchronousReportLogsTheFileAndTheLineAsWell) {
    use_packages(1);
    is_async_install = 1;
    set_field(instanceID, "VELK-7");
    update_Pkg_Install_status(0, 10, "running");
    EXPECT_EQ(log(), report_log({"file:///pkgs/pkgA.xml", "pkgA", 10, "running"}) +
                         job_file_log("/tmp/sfcb/velkstatVELK-7.txt", "0|pkgA: 10: running|"));
}

TEST_F(Status, OnlyFinalCodesOfTheLastPackageComplete) {
    use_packages(3);
    const std::set<int> progress = {0, 10, 15, 60, 61, 62};
    for (int code = -1; code <= 100; ++code) {
        SCOPED_TRACE(code);
        set_totalstatus(5);
        update_Pkg_Install_status(2, code, "");
        EXPECT_EQ(totalstatus, progress.contains(code) ? 0 : 1);
        set_totalstatus(5);
        update_Pkg_Install_status(1, code, "");
        EXPECT_EQ(totalstatus, 0) << "not the last package of the table";
    }
}

TEST_F(Status, LastInInstallOrderIsNotTheLastOfTheTable) {
    use_packages(2);
    PkgSeq[0] = 1;
    PkgSeq[1] = 0;
    update_Pkg_Install_status(1, 50, "");
    EXPECT_EQ(totalstatus, 1);
    update_Pkg_Install_status(0, 50, "");
    EXPECT_EQ(totalstatus, 0);
}

TEST_F(Status, ProgressOfTheLastPackageTakesCompletionBack) {
    use_packages(1);
    update_Pkg_Install_status(0, 56, "");
    EXPECT_EQ(totalstatus, 1);
    update_Pkg_Install_status(0, 62, "");
    EXPECT_EQ(totalstatus, 0);
}

TEST_F(Status, LineHoldsAllPackagesInTableOrderAndEndsInABar) {
    use_packages(2);
    is_async_install = 1;
    set_field(instanceID, "VELK-7");
    update_Pkg_Install_status(0, 50, "Package installation successfully.");
    EXPECT_EQ(job_file("VELK-7"), "0|pkgA: 50: Package installation successfully.||");
    update_Pkg_Install_status(1, 10,
                              "Package download completed and the update process is running.");
    EXPECT_EQ(job_file("VELK-7"),
              "0|pkgA: 50: Package installation successfully.|"
              "pkgB: 10: Package download completed and the update process is running.|");
    update_Pkg_Install_status(1, 50, "x");
    EXPECT_EQ(job_file("VELK-7"), "1|pkgA: 50: Package installation successfully.|pkgB: 50: x|");
}

TEST_F(Status, ReportOutsideOfAnAsynchronousRequestWritesNoFile) {
    use_packages(1);
    for (const int flag : {0, 2, -1}) {
        is_async_install = flag;
        is_sync_install = 1;
        update_Pkg_Install_status(0, 50, "x");
        EXPECT_TRUE(std::filesystem::is_empty(at("/tmp/sfcb")));
        EXPECT_STREQ(pkgInstance[0].installResult, "pkgA: 50: x");
        EXPECT_EQ(totalstatus, 1);
    }
}

TEST_F(Status, FileIsNamedAfterTheJobAsItStandsAtTheReport) {
    use_packages(1);
    is_async_install = 1;
    update_Pkg_Install_status(0, 0, "before any job");
    EXPECT_EQ(job_file(""), "0|pkgA: 0: before any job|");
    set_field(instanceID, "VELK-7");
    update_Pkg_Install_status(0, 62, "first job");
    set_field(instanceID, "VELK-8");
    update_Pkg_Install_status(0, 50, "second job");
    EXPECT_EQ(job_file(""), "0|pkgA: 0: before any job|");
    EXPECT_EQ(job_file("VELK-7"), "0|pkgA: 62: first job|");
    EXPECT_EQ(job_file("VELK-8"), "1|pkgA: 50: second job|");
}

TEST_F(Status, LongestJobIdGivesItsFileName) {
    use_packages(1);
    is_async_install = 1;
    const std::string job(velk::kInstanceIdSize - 1, 'j');
    set_field(instanceID, job);
    update_Pkg_Install_status(0, 50, "x");
    EXPECT_EQ(job_file(job), "1|pkgA: 50: x|");
}

TEST_F(Status, UnwritableFileIsLoggedAndOtherwiseIgnored) {
    use_packages(1);
    is_async_install = 1;
    set_field(instanceID, "VELK-7");
    fail_step("open:/tmp/sfcb/velkstatVELK-7.txt", EACCES);
    EXPECT_EQ(update_Pkg_Install_status(0, 50, "x"), 0);
    EXPECT_TRUE(log().ends_with(
        velktest::entries({"mutex lock.\n", "update velk status fail.\n", "mutex unlock.\n"})));
    EXPECT_STREQ(pkgInstance[0].installResult, "pkgA: 50: x");
    EXPECT_EQ(totalstatus, 1);
    EXPECT_EQ(pthread_mutex_trylock(&mutex), 0);
    pthread_mutex_unlock(&mutex);
}

TEST_F(Status, MutexIsHeldWhileTheFileIsWrittenAndOnlyThen) {
    use_packages(1);
    is_async_install = 1;
    bool held = false;
    velkshim_observe_files(
        [](void *seen, const char *path, int64_t) {
            const bool is_job_file = std::string_view(path) == "/tmp/sfcb/velkstat.txt";
            if (is_job_file && pthread_mutex_trylock(&mutex) == EBUSY) {
                *static_cast<bool *>(seen) = true;
            }
        },
        &held);
    update_Pkg_Install_status(0, 50, "x");
    velkshim_observe_files(nullptr, nullptr);
    EXPECT_TRUE(held);
    EXPECT_EQ(pthread_mutex_trylock(&mutex), 0);
    pthread_mutex_unlock(&mutex);
}

TEST_F(Status, NothingStaysOpen) {
    use_packages(1);
    is_async_install = 1;
    const std::size_t before = velktest::open_descriptors();
    update_Pkg_Install_status(0, 50, "x");
    fail_step("open:/tmp/sfcb/velkstat.txt", EACCES);
    update_Pkg_Install_status(0, 50, "x");
    EXPECT_EQ(velktest::open_descriptors(), before);
}

// Deleting the debug log, and clearing what an install left.

#include "provider/maintenance.h"

#include <cerrno>

#include "provider/work_area.h"
#include "tests/support/library_test.h"
#include "velk/debug_log.h"

namespace {

namespace fs = std::filesystem;
using velktest::entry;
using velktest::write_file;

class Maintenance : public velktest::LibraryTest {};

const std::string kBegin = entry("Delete the files that left after update.\n");
const std::string kStoreGone = entry("Successfully to delete files under filestore.\n");
const std::string kStoreKept = entry("Fail to delete files under filestore.\n");
const std::string kLockGone = entry("Successfully to delete ") + "/tmp/sfcb/velk.safelock\n";
const std::string kLockKept = entry("Fail to delete VELK_LOCK_FILE.\n");

}  // namespace

TEST_F(Maintenance, DeletedLogLeavesANewOneHoldingOnlyTheSuccessLine) {
    debug("older text\n");
    EXPECT_EQ(DeleteVelkDebugLog(), 1);
    EXPECT_EQ(log(), "[ 8: 5: 3] Successfully to delete /tmp/velkdebug.txt\n");
}

TEST_F(Maintenance, AbsentLogIsCreatedByTheFirstEntryAndThenDeleted) {
    EXPECT_EQ(DeleteVelkDebugLog(), 1);
    EXPECT_EQ(log(), entry("Successfully to delete ") + "/tmp/velkdebug.txt\n");
}

TEST_F(Maintenance, LogThatCannotBeDeletedSaysSo) {
    debug("older text\n");
    fail_step("unlink:/tmp/velkdebug.txt", EPERM);
    EXPECT_EQ(DeleteVelkDebugLog(), 0);
    EXPECT_EQ(log(), "older text\n" + entry("Delete the velk debug log file.\n") +
                         entry("Fail to delete velk debug log file.\n"));
}

TEST_F(Maintenance, LogThatCannotBeMadeGivesZero) {
    fail_step("open:/tmp/velkdebug.txt", EACCES);
    EXPECT_EQ(DeleteVelkDebugLog(), 0);
    EXPECT_EQ(log(), "");
}

TEST_F(Maintenance, ResetRemovesFileStoreAndLockMarker) {
    write_file(at(velk::kFileStore) / "pkg" / "fw.bin", "x");
    write_file(at(velk::kLockMarker), "");
    EXPECT_EQ(reset_cimmon(), 1);
    EXPECT_FALSE(fs::exists(at(velk::kFileStore)));
    EXPECT_FALSE(fs::exists(at(velk::kLockMarker)));
    EXPECT_EQ(log(), kBegin + kStoreGone + kLockGone);
}

TEST_F(Maintenance, ResetWithNeitherPresentFailsTwice) {
    EXPECT_EQ(reset_cimmon(), 0);
    EXPECT_EQ(log(), kBegin +
                         entry("In Function util_remove_file::The directory doesn't exist and the "
                               "error code [1].\n") +
                         kStoreKept + kLockKept);
}

TEST_F(Maintenance, FileStoreThatStaysDoesNotKeepTheMarker) {
    write_file(at(velk::kFileStore) / "fw.bin", "x");
    write_file(at(velk::kLockMarker), "");
    fail_step("unlink:/var/tmp/filestore/fw.bin", EPERM);
    EXPECT_EQ(reset_cimmon(), 1);
    EXPECT_TRUE(fs::exists(at(velk::kFileStore) / "fw.bin"));
    EXPECT_EQ(
        log(),
        kBegin +
            entry("In Function util_remove_file::unlink failed and the error code is [-1].\n") +
            kStoreKept + kLockGone);
}

TEST_F(Maintenance, MarkerThatStaysGivesZero) {
    fs::create_directory(at(velk::kFileStore));
    write_file(at(velk::kLockMarker), "");
    fail_step("unlink:/tmp/sfcb/velk.safelock", EPERM);
    EXPECT_EQ(reset_cimmon(), 0);
    EXPECT_FALSE(fs::exists(at(velk::kFileStore)));
    EXPECT_EQ(log(), kBegin + kStoreGone + kLockKept);
}

// What a look at a transfer shows.
#include "host/providers/file_transfer/transfer_jobs.h"

#include <gtest/gtest.h>

namespace velkhost::providers {
namespace {

class TransferJobTable : public ::testing::Test {
  protected:
    TransferView look() { return jobs_.find(id_).value_or(TransferView{}); }

    TransferJobs jobs_;
    std::string id_ = jobs_.add("sftp://h/a.xml", "file:///store/a.xml");
};

TEST_F(TransferJobTable, WaitingTransferCountsAsRunning) {
    EXPECT_EQ(id_, "ZEB:FileTransferJob:1");
    EXPECT_EQ(job_state_of(look()), 4);
    EXPECT_EQ(job_status_of(look()), "Waiting for other transfers");
    EXPECT_FALSE(percent_of(look()));
    EXPECT_EQ(look().source, "sftp://h/a.xml");
    EXPECT_EQ(look().destination, "file:///store/a.xml");
}

TEST_F(TransferJobTable, RunningTransferTellsWhatHasCome) {
    jobs_.report(id_, {10, std::nullopt});
    EXPECT_EQ(job_state_of(look()), 4);
    EXPECT_EQ(job_status_of(look()), "Transferring, 10 bytes received");
    EXPECT_FALSE(percent_of(look()));
    jobs_.report(id_, {10, 40});
    EXPECT_EQ(job_status_of(look()), "Transferring, 10 of 40 bytes received");
    EXPECT_EQ(percent_of(look()), 25);
    jobs_.report(id_, {41, 40});
    EXPECT_EQ(percent_of(look()), 100);
    jobs_.report(id_, {0, 0});
    EXPECT_FALSE(percent_of(look()));
}

TEST_F(TransferJobTable, EndIsCompletedOrAnExceptionWithItsReason) {
    jobs_.end(id_, {FetchResult::kFetched, {}});
    EXPECT_EQ(job_state_of(look()), 7);
    EXPECT_EQ(job_status_of(look()), "Transfer completed");
    EXPECT_EQ(percent_of(look()), 100);
    jobs_.end(id_, {FetchResult::kTimedOut, "too slow"});
    EXPECT_EQ(job_state_of(look()), 10);
    EXPECT_EQ(job_status_of(look()), "too slow");
}

TEST_F(TransferJobTable, UnknownAndRemovedJobsAreNotFound) {
    EXPECT_FALSE(jobs_.find(""));
    jobs_.report("", {1, 2});
    jobs_.remove(id_);
    EXPECT_FALSE(jobs_.find(id_));
}

TEST_F(TransferJobTable, OldestJobIsForgottenBeyondTheBound) {
    for (std::size_t i = 0; i < TransferJobs::kMostJobs; ++i) {
        jobs_.add("s", "d");
    }
    EXPECT_FALSE(jobs_.find(id_));
    EXPECT_EQ(jobs_.all().size(), TransferJobs::kMostJobs);
}

}  // namespace
}  // namespace velkhost::providers

// One transfer from a source that the test plays.
#include "host/providers/file_transfer/fault_source.h"
#include "host/providers/file_transfer/transfer.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <stdlib.h>

#include <deque>
#include <filesystem>

namespace velkhost::providers {
namespace {

namespace fs = std::filesystem;
using scenario::TransferFault;
using ::testing::ElementsAre;

// Gives its pieces in turn, and the outcome "fetched" when they are used up.
class PlayedSource : public Source {
  public:
    explicit PlayedSource(std::deque<Piece> pieces) : pieces_(std::move(pieces)) {}

    Piece next(const std::stop_token & /*stop*/) override {
        if (pieces_.empty()) {
            return FetchOutcome{FetchResult::kFetched, {}};
        }
        Piece piece = pieces_.front();
        pieces_.pop_front();
        return piece;
    }

  private:
    std::deque<Piece> pieces_;
};

FileBytes bytes(std::string_view text) {
    return {text.data(), text.size()};
}

class TransferRuns : public ::testing::Test {
  public:
    ~TransferRuns() override { fs::remove_all(place_); }

  protected:
    TransferRuns() {
        std::string name = (fs::temp_directory_path() / "velk-run-XXXXXX").string();
        place_ = ::mkdtemp(name.data());
    }

    FetchOutcome run(Source &source, std::optional<std::uint64_t> capacity = std::nullopt) {
        return run_transfer(
            {source, FileStore(place_.string(), capacity).create("file"), 0,
             [this](const TransferProgress &progress) { received_.push_back(progress.received); }},
            stop_.get_token());
    }
    FetchOutcome run(std::deque<Piece> pieces,
                     std::optional<std::uint64_t> capacity = std::nullopt) {
        PlayedSource source(std::move(pieces));
        return run(source, capacity);
    }
    FetchOutcome run_with(TransferFault fault, std::deque<Piece> pieces) {
        FaultSource source(std::make_unique<PlayedSource>(std::move(pieces)), fault, 0);
        return run(source);
    }
    [[nodiscard]] bool has_file() const { return fs::exists(place_ / "file"); }

    fs::path place_;
    std::stop_source stop_;
    std::vector<std::uint64_t> received_;
};

TEST_F(TransferRuns, WholeFileStays) {
    const FetchOutcome outcome = run({AnnouncedSize{5}, bytes("abc"), bytes("de")});
    EXPECT_EQ(outcome.result, FetchResult::kFetched);
    EXPECT_EQ(fs::file_size(place_ / "file"), 5U);
    EXPECT_THAT(received_, ElementsAre(0, 3, 5));
}

TEST_F(TransferRuns, SizeNeedNotBeAnnounced) {
    EXPECT_EQ(run({bytes("abc")}).result, FetchResult::kFetched);
    EXPECT_EQ(run(std::deque<Piece>{}).result, FetchResult::kFetched);
}

TEST_F(TransferRuns, AnotherSizeThanAnnouncedFailsAndLeavesNothing) {
    const FetchOutcome cut = run({AnnouncedSize{5}, bytes("abc")});
    EXPECT_EQ(cut.result, FetchResult::kFailed);
    EXPECT_EQ(cut.text, "Wrong size: 3 bytes, not 5");
    EXPECT_EQ(run({AnnouncedSize{2}, bytes("abc")}).result, FetchResult::kFailed);
    EXPECT_FALSE(has_file());
}

TEST_F(TransferRuns, SourcesFailureIsTheOutcomeAndLeavesNothing) {
    const FetchOutcome outcome =
        run({bytes("abc"), FetchOutcome{FetchResult::kTimedOut, "too slow"}});
    EXPECT_EQ(outcome.result, FetchResult::kTimedOut);
    EXPECT_EQ(outcome.text, "too slow");
    EXPECT_FALSE(has_file());
}

TEST_F(TransferRuns, FileThatCannotFitIsNotBegun) {
    const FetchOutcome outcome = run({AnnouncedSize{11}, bytes("abc")}, 10);
    EXPECT_EQ(outcome.result, FetchResult::kNoSpace);
    EXPECT_THAT(received_, ElementsAre(0));
    EXPECT_FALSE(has_file());
}

TEST_F(TransferRuns, FileThatTurnsOutTooLongEndsThere) {
    const FetchOutcome outcome = run({bytes("abc"), bytes("def")}, 5);
    EXPECT_EQ(outcome.result, FetchResult::kNoSpace);
    EXPECT_THAT(received_, ElementsAre(3));
    EXPECT_FALSE(has_file());
}

TEST_F(TransferRuns, TransferThatWasEndedKeepsNothing) {
    stop_.request_stop();
    EXPECT_EQ(run({bytes("abc")}).result, FetchResult::kFailed);
    EXPECT_FALSE(has_file());
}

TEST_F(TransferRuns, FaultsStrikeTheirWay) {
    const std::deque<Piece> pieces{AnnouncedSize{6}, bytes("abcd"), bytes("ef")};
    EXPECT_EQ(run_with(TransferFault::kRefuse, pieces).text, "The server cannot be reached");
    EXPECT_EQ(run_with(TransferFault::kStall, pieces).result, FetchResult::kTimedOut);
    EXPECT_EQ(run_with(TransferFault::kCut, pieces).text, "Wrong size: 2 bytes, not 6");
    EXPECT_FALSE(has_file());
}

}  // namespace
}  // namespace velkhost::providers

// How an installation service answers in turn, and what a job shows from one read to the next.
#pragma once

#include "host/scenario/model.h"

#include <cstddef>
#include <mutex>
#include <string>
#include <string_view>
#include <vector>

namespace velkhost::scenario {

// The answers of one service, dealt out in turn. Answers with the same `match` form one turn, in
// their order; the last of a turn repeats. Safe to use from any thread.
class VELKSCENARIO_API AnswerBook {
  public:
    explicit AnswerBook(std::vector<ServiceAnswer> answers, ServiceKind kind = ServiceKind::kJob);

    // The answer to a call that concerns `uri`: from the first turn whose match the URI contains,
    // else from the turn without a match, else the service's usual success.
    ServiceAnswer next(std::string_view uri);

  private:
    struct Turn {
        std::string match;
        std::vector<ServiceAnswer> answers;
        std::size_t position = 0;

        ServiceAnswer deal();
    };

    Turn *turn_of(std::string_view uri);

    std::mutex mutex_;
    std::vector<Turn> turns_;
    ServiceAnswer usual_;
};

// The looks of one job, used up one read at a time. Not safe to share between threads.
class VELKSCENARIO_API JobLooks {
  public:
    // `looks` is not empty.
    explicit JobLooks(std::vector<JobLook> looks);

    // What the next read sees, without being that read.
    [[nodiscard]] const JobLook &peek() const;
    // One read.
    JobLook take();

  private:
    std::vector<JobLook> looks_;
    std::size_t position_ = 0;
    std::uint32_t seen_ = 0;  // reads that have seen the look at position_
};

}  // namespace velkhost::scenario

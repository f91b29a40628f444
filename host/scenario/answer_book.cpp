#include "host/scenario/answer_book.h"

#include <algorithm>
#include <utility>

namespace velkhost::scenario {

AnswerBook::AnswerBook(std::vector<ServiceAnswer> answers, ServiceKind kind) {
    usual_.return_value = usual_return_value(kind);
    for (ServiceAnswer &answer : answers) {
        auto turn = std::ranges::find(turns_, answer.match, &Turn::match);
        if (turn == turns_.end()) {
            turn = turns_.insert(turn, Turn{answer.match, {}, 0});
        }
        turn->answers.push_back(std::move(answer));
    }
}

ServiceAnswer AnswerBook::Turn::deal() {
    const ServiceAnswer &answer = answers[position];
    position += position + 1 < answers.size() ? 1 : 0;
    return answer;
}

AnswerBook::Turn *AnswerBook::turn_of(std::string_view uri) {
    Turn *rest = nullptr;
    for (Turn &turn : turns_) {
        if (turn.match.empty()) {
            rest = &turn;
        } else if (uri.find(turn.match) != std::string_view::npos) {
            return &turn;
        }
    }
    return rest;
}

ServiceAnswer AnswerBook::next(std::string_view uri) {
    const std::lock_guard lock(mutex_);
    Turn *turn = turn_of(uri);
    return turn == nullptr ? usual_ : turn->deal();
}

JobLooks::JobLooks(std::vector<JobLook> looks) : looks_(std::move(looks)) {}

const JobLook &JobLooks::peek() const {
    return looks_[position_];
}

JobLook JobLooks::take() {
    const JobLook &look = looks_[position_];
    const bool last = position_ + 1 == looks_.size();
    if (!last && ++seen_ >= look.looks) {
        ++position_;
        seen_ = 0;
    }
    return look;
}

}  // namespace velkhost::scenario

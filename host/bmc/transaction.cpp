#include "host/bmc/transaction.h"

#include <algorithm>
#include <array>

namespace velkhost::bmc {
namespace {

using enum TransactionState;

enum class Mode { kAny, kPlain, kSecure };

struct Transition {
    Step step;
    TransactionState from;
    TransactionState to;
    Mode mode = Mode::kAny;
};

constexpr std::array kTransitions{
    Transition{Step::kOpen, kCreated, kOpened, Mode::kPlain},
    Transition{Step::kBegin, kOpened, kBegun, Mode::kPlain},
    Transition{Step::kBegin, kCreated, kBegun, Mode::kSecure},
    Transition{Step::kStatus, kBegun, kBegun},
    Transition{Step::kCancel, kCreated, kCancelled},
    Transition{Step::kCancel, kOpened, kCancelled},
    Transition{Step::kCancel, kBegun, kCancelled},
    Transition{Step::kClose, kOpened, kClosed},
    Transition{Step::kClose, kCancelled, kClosed},
    Transition{Step::kDestroy, kCreated, kNone},
    Transition{Step::kDestroy, kOpened, kNone},
    Transition{Step::kDestroy, kBegun, kNone},
    Transition{Step::kDestroy, kCancelled, kNone},
    Transition{Step::kDestroy, kClosed, kNone},
};

}  // namespace

std::optional<std::uint32_t> Transaction::create() {
    if (state_ != kNone) {
        return std::nullopt;
    }
    state_ = kCreated;
    handle_ = next_handle_++;
    return handle_;
}

bool Transaction::take(Step step, std::uint32_t handle) {
    if (state_ == kNone || handle != handle_) {
        return false;
    }
    const Mode mode = secure_ ? Mode::kSecure : Mode::kPlain;
    const auto *const found = std::ranges::find_if(kTransitions, [&](const Transition &row) {
        return row.step == step && row.from == state_ &&
               (row.mode == Mode::kAny || row.mode == mode);
    });
    if (found == kTransitions.end()) {
        return false;
    }
    state_ = found->to;
    return true;
}

}  // namespace velkhost::bmc

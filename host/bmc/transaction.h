// The controller's flash transaction: there is at most one, it goes through fixed states, and an
// operation that does not fit its state changes nothing.
//
//   none ----create---> created ----open----> opened ----begin----> begun   (status while begun)
//                          |  in secure mode: begin                   |
//                          +------------- cancel (also opened) -------+----> cancelled
//   opened, cancelled ----close----> closed
//   every state but none ----destroy----> none
#pragma once

#include <cstdint>
#include <optional>

namespace velkhost::bmc {

enum class TransactionState { kNone, kCreated, kOpened, kBegun, kCancelled, kClosed };

// What can be done to a transaction once it has a handle.
enum class Step { kOpen, kBegin, kStatus, kCancel, kClose, kDestroy };

class Transaction {
  public:
    // In secure mode a transaction is begun without being opened, and cannot be opened. Handles
    // count up from `first_handle`.
    Transaction(bool secure, std::uint32_t first_handle)
        : secure_(secure), next_handle_(first_handle) {}

    // The handle of the new transaction; no value while there is another one.
    std::optional<std::uint32_t> create();

    // Whether the step was taken.
    bool take(Step step, std::uint32_t handle);

    [[nodiscard]] TransactionState state() const { return state_; }

  private:
    const bool secure_;
    std::uint32_t next_handle_;
    std::uint32_t handle_ = 0;
    TransactionState state_ = TransactionState::kNone;
};

}  // namespace velkhost::bmc

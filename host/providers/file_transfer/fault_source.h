// A source that a fault of the scenario has struck.
#pragma once

#include "host/providers/file_transfer/source.h"
#include "host/scenario/model.h"

#include <memory>

namespace velkhost::providers {

class FaultSource final : public Source {
  public:
    // `source` is what would have been read; kFull is none of a source's faults.
    FaultSource(std::unique_ptr<Source> source, scenario::TransferFault fault,
                std::uint32_t stall_seconds);

    Piece next(const std::stop_token &stop) override;

  private:
    Piece stall(const std::stop_token &stop) const;

    std::unique_ptr<Source> source_;
    scenario::TransferFault fault_;
    std::uint32_t stall_seconds_;
    bool has_begun_ = false;  // the first bytes have gone by
};

}  // namespace velkhost::providers

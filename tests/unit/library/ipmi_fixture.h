// The library's IPMI functions against the host's device with a controller behind it.
#pragma once

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cstdint>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "host/bmc/hex.h"
#include "host/shim/velkshim.h"
#include "ipmi/kcs_channel.h"
#include "tests/support/library_test.h"
#include "tests/unit/library/controller_stand.h"
#include "velk/request_state.h"

namespace velktest {

class IpmiTest : public LibraryTest, protected ControllerStand {
  public:
    IpmiTest();
    ~IpmiTest() override;

  protected:
    // Lengths of the pauses so far, in milliseconds.
    [[nodiscard]] std::vector<int> pauses_ms() const;

    // Virtual time since the test began.
    [[nodiscard]] int elapsed_ms() const;

    [[nodiscard]] static bool channel_is_open() { return velk::load(kcs_fd) >= 0; }

  private:
    std::int64_t start_us_;
};

}  // namespace velktest

// Tests that run once for each ABI of the library, on the kernel's own IPMI driver.
#pragma once

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <charconv>
#include <cstdio>
#include <cstdlib>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "tests/integration/kernel/machine.h"

namespace velkkernel {

using velkhost::bmc::Generation;
using velkhost::bmc::Settings;
using velkhost::scenario::ControllerFault;
using velkhost::scenario::FaultRule;

inline FaultRule fault(std::string step, ControllerFault kind, int code = 0,
                       std::uint32_t count = FaultRule::kAlways) {
    FaultRule out;
    out.step = std::move(step);
    out.controller = kind;
    out.code = code;
    out.count = count;
    return out;
}

class KernelTest : public ::testing::TestWithParam<Abi> {
  protected:
    void SetUp() override {
        if (const std::string reason = why_not(); !reason.empty()) {
            GTEST_SKIP() << "No machine can be run here: " << reason;
        }
    }

    // Runs the machine. What it said is shown when the test fails, and always when
    // VELK_KERNEL_TRACE is set.
    void boot(const std::string &actions, std::vector<FaultRule> faults = {},
              Settings controller = {}) {
        outcome_ = run({GetParam(), actions, std::move(controller), std::move(faults)});
        EXPECT_THAT(outcome_.lines, ::testing::Contains("end of run"));
    }

    void TearDown() override {
        if (HasFailure() || std::getenv("VELK_KERNEL_TRACE") != nullptr) {
            std::printf("%s", outcome_.report().c_str());
        }
    }

    [[nodiscard]] std::string result_of(const std::string &action, int occurrence = 0) const {
        return outcome_.result_of(action, occurrence);
    }

    Outcome outcome_;
};

// The milliseconds of a result that ends in "after N ms"; -1 for any other.
inline int ms_of(std::string_view result) {
    constexpr std::string_view kMark = "after ";
    const std::size_t at = result.rfind(kMark);
    int ms = -1;
    if (at != std::string_view::npos) {
        const std::string_view number = result.substr(at + kMark.size());
        std::from_chars(number.data(), number.data() + number.size(), ms);
    }
    return ms;
}

// A result without the time that it took.
inline std::string untimed(const std::string &result) {
    return result.substr(0, result.rfind(" after "));
}

// For INSTANTIATE_TEST_SUITE_P.
inline auto each_abi() {
    return ::testing::Values(Abi::k64, Abi::k32);
}
inline std::string abi_of(const ::testing::TestParamInfo<Abi> &about) {
    return name_of(about.param);
}

}  // namespace velkkernel

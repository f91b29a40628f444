#include "tests/unit/library/ipmi_fixture.h"

namespace velktest {
namespace {

constexpr int kMicrosPerMilli = 1000;

}  // namespace

IpmiTest::IpmiTest() : start_us_(velkshim_now_us()) {}

IpmiTest::~IpmiTest() {
    disconnect_kcs();
}

std::vector<int> IpmiTest::pauses_ms() const {
    return pause_log().lengths(kMicrosPerMilli);
}

int IpmiTest::elapsed_ms() const {
    return static_cast<int>((velkshim_now_us() - start_us_) / kMicrosPerMilli);
}

}  // namespace velktest

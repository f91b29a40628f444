#include "tests/unit/library/ipmi_fixture.h"

namespace velktest {
namespace {

constexpr int kMicrosPerMilli = 1000;

void note_pause(void *pauses, std::int64_t, std::int64_t length_us) {
    static_cast<std::vector<int> *>(pauses)->push_back(
        static_cast<int>(length_us / kMicrosPerMilli));
}

}  // namespace

IpmiTest::IpmiTest() : start_us_(velkshim_now_us()) {
    velkshim_observe_pauses(note_pause, &pauses_ms_);
}

IpmiTest::~IpmiTest() {
    disconnect_kcs();
    velkshim_observe_pauses(nullptr, nullptr);
}

int IpmiTest::elapsed_ms() const {
    return static_cast<int>((velkshim_now_us() - start_us_) / kMicrosPerMilli);
}

}  // namespace velktest

// One request on a host whose broker none of the process's other libraries can look up.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>

namespace velktest {

struct RequestReport {
    std::uint64_t return_value = 0;
    std::string result;      // of the one package
    int contexts = 0;        // that the broker made for other threads
    std::size_t clones = 0;  // alive after the install
    std::string findings;    // of the broker's ledger, at its end
};

// `refuse`: the broker makes no context for another thread. What goes wrong is thrown.
using RunRequest = void(bool refuse, RequestReport &report);
inline constexpr const char *kRunRequest = "velktest_run_request";

}  // namespace velktest

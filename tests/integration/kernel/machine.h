// A virtual machine with the kernel's own IPMI driver and a controller of the test's behind it.
#pragma once

#include "host/bmc/controller.h"
#include "host/scenario/fault_rules.h"

#include <iosfwd>
#include <string>
#include <vector>

namespace velkkernel {

// Which build of the library the machine runs; the kernel is the 64-bit one.
enum class Abi { k64, k32 };

// Its name in the tests' own: "lp64", "ilp32".
const char *name_of(Abi abi);
void PrintTo(Abi abi, std::ostream *out);

struct Setup {
    Abi abi = Abi::k64;
    std::string actions;  // what guest/actions.h lists, joined with ','
    velkhost::bmc::Settings controller = {};
    std::vector<velkhost::scenario::FaultRule> faults = {};
};

struct Outcome {
    std::vector<std::string> console;                // every line of the serial line
    std::vector<std::string> lines;                  // what the guest said, without "velk: "
    std::vector<velkhost::bmc::Exchange> exchanges;  // without the driver's own

    // What the action, which may have arguments, printed; "(nothing)" if it did not run.
    [[nodiscard]] std::string result_of(const std::string &action, int occurrence = 0) const;

    // The exchanges in words.
    [[nodiscard]] std::vector<std::string> words() const;

    // The lines of the debug log, which the action "log" prints, without their dates.
    [[nodiscard]] std::vector<std::string> log() const;

    // All of it, for a test that failed.
    [[nodiscard]] std::string report() const;
};

// Why no machine can be run here; empty where one can.
std::string why_not();

// Boots, does the actions, powers off. Throws std::runtime_error when the machine does not end by
// itself within 200 seconds.
Outcome run(const Setup &setup);

}  // namespace velkkernel

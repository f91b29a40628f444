// A whole stand-in host in a run folder: root, clock, node name, classes, registrations, broker,
// scenario. It loads the provider library exactly as it is shipped, through the broker and the
// registration that goes with it.
//
//     Rig rig({.scenario_file = "scenarios/default.toml"});
//     const InstallAnswer answer = rig.install({.uris = {"file:///packages/uefi.xml"}});
//     rig.wait_until_idle(std::chrono::hours(24));
//     for (const PackageStatus &result : rig.results()) ...
//
// There is one rig per process at a time, since root and clock belong to the process. The library
// and the other providers stay loaded when a rig goes, with what they hold in their globals.
//
// Under the virtual clock, time passes only while the thread that made the rig is in `install` or
// `wait_until_idle`, pauses, or is in a velkhost::shim::WaitGuard; that makes runs repeatable.
#pragma once

#include "host/bmc/trace.h"
#include "host/broker/broker.h"
#include "host/rig/parts.h"
#include "host/rig/rig_error.h"
#include "host/rig/run_folder.h"
#include "host/rig/status_history.h"
#include "host/scenario/scenario.h"

#include <chrono>
#include <cstdint>
#include <filesystem>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace velkhost::rig {

struct RigOptions {
    // The run folder, which stays; no value: a fresh temporary one, which goes with the rig.
    std::optional<std::filesystem::path> folder = std::nullopt;
    // At most one of the two; neither: the built-in default.
    std::optional<std::filesystem::path> scenario_file = std::nullopt;
    std::optional<scenario::Description> description = std::nullopt;
    bool virtual_clock = true;
    // No value: those around the running program.
    std::optional<Parts> parts = std::nullopt;
};

struct InstallRequest {
    std::vector<std::string> uris = {};  // joined with "|"
    // No value: the argument is left out.
    std::optional<std::vector<std::uint16_t>> options = std::nullopt;
    std::optional<std::string> update_args = std::nullopt;
};

struct InstallAnswer {
    broker::Status status;
    std::optional<std::uint32_t> return_value;
    std::optional<std::string> job_id;
};

struct JobView {
    std::optional<std::uint16_t> state;  // JobState
    std::string status;                  // JobStatus
};

class Rig {
  public:
    // Sets everything up. Throws RigError or scenario::ScenarioError.
    explicit Rig(RigOptions options);

    // Shuts down. While an install thread is still at work nothing can be taken from under it: the
    // host is left as it stands, its clock with it, and the process should end with _exit.
    ~Rig();
    Rig(const Rig &) = delete;
    Rig &operator=(const Rig &) = delete;

    // -- Requests --

    // Finds the installation service as a client would, and calls InstallFromURI. Throws RigError
    // when there is no service to call.
    InstallAnswer install(const InstallRequest &request);

    // Whether an install thread is at work.
    [[nodiscard]] bool busy() const;

    // Waits for the end of all install threads, at most for `limit` of the host's time; whether
    // they ended. `on_tick` is called every ten seconds of the virtual clock, every tenth of one of
    // the real.
    bool wait_until_idle(std::chrono::microseconds limit,
                         const std::function<void()> &on_tick = {});

    // When the library last did anything, by its debug log: the exact end of a request that is
    // over, whenever that was noticed. Microseconds since 1970-01-01 UTC.
    [[nodiscard]] std::int64_t last_activity_us() const;

    // The packages of the latest request as the library left them, in its order; while an install
    // thread is at work, as its last status line has them.
    [[nodiscard]] std::vector<PackageStatus> results() const;

    // No value when the broker knows no such job.
    [[nodiscard]] std::optional<JobView> job(const std::string &id);

    // -- Parts --

    [[nodiscard]] broker::Broker &broker();
    [[nodiscard]] scenario::Scenario &scenario();
    [[nodiscard]] StatusHistory &history();
    // What host and management controller said to each other so far, with the host's time.
    [[nodiscard]] std::vector<bmc::Exchange> controller_trace() const;
    [[nodiscard]] RunFolder &folder();
    [[nodiscard]] const RunFolder &folder() const;
    [[nodiscard]] std::filesystem::path library_path() const;  // as the broker loads it

    // -- End --

    // Tells the providers that the broker ends, closes its books and gives the process its own root
    // and clock back. Does nothing while an install thread is at work, or the second time; returns
    // whether the host is down.
    bool shut_down();

    // Misuses of the broker's objects so far; after `shut_down` with what was never released.
    [[nodiscard]] std::vector<std::string> findings() const;

    // Fault rules of the scenario that have never struck, "file:line: step".
    [[nodiscard]] std::vector<std::string> unfired_faults() const;

  private:
    struct State;
    std::unique_ptr<State> state_;
};

}  // namespace velkhost::rig

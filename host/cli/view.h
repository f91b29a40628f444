// What a user sees while a request runs.
#pragma once

#include "host/cli/report.h"

#include <cstdint>
#include <string>
#include <vector>

namespace velkhost::cli {

// All times in microseconds of the host's clock since the request began. Every member may be called
// from any thread.
class View {
  public:
    View() = default;
    virtual ~View() = default;
    View(const View &) = delete;
    View &operator=(const View &) = delete;

    // Before the request; `packages` are the ids in its order.
    virtual void begin(const RequestReport &request, const std::vector<std::string> &packages) = 0;

    // A package's new status.
    virtual void change(std::int64_t at_us, std::size_t package,
                        const rig::PackageStatus &status) = 0;

    // A look at the clock and the job.
    virtual void tick(std::int64_t now_us, const JobReport &job) = 0;

    // The request is over: what was only for the meantime goes.
    virtual void end() = 0;

    // The process is about to end: leaves the terminal in order and shows nothing from here on.
    virtual void abandon() = 0;
};

// For --json: shows nothing.
class SilentView final : public View {
  public:
    void begin(const RequestReport & /*request*/,
               const std::vector<std::string> & /*packages*/) override {}
    void change(std::int64_t /*at_us*/, std::size_t /*package*/,
                const rig::PackageStatus & /*status*/) override {}
    void tick(std::int64_t /*now_us*/, const JobReport & /*job*/) override {}
    void end() override {}
    void abandon() override {}
};

}  // namespace velkhost::cli

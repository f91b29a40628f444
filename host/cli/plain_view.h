// A line per change, for logs and pipes.
#pragma once

#include "host/cli/output.h"
#include "host/cli/terminal.h"
#include "host/cli/view.h"

#include <mutex>
#include <optional>

namespace velkhost::cli {

class PlainView final : public View {
  public:
    PlainView(Output &output, const Terminal &terminal) : output_(output), terminal_(terminal) {}

    void begin(const RequestReport &request, const std::vector<std::string> &packages) override;
    void change(std::int64_t at_us, std::size_t package, const rig::PackageStatus &status) override;
    void tick(std::int64_t now_us, const JobReport &job) override;
    void end() override {}
    void abandon() override;

  private:
    Output &output_;
    const Terminal terminal_;
    std::mutex mutex_;
    std::size_t id_width_ = 0;
    std::optional<std::string> job_;  // the job's line that was shown last
};

}  // namespace velkhost::cli

// One line per package, redrawn in place; for terminals that can move the cursor.
#pragma once

#include "host/cli/output.h"
#include "host/cli/terminal.h"
#include "host/cli/view.h"

#include <mutex>
#include <string>
#include <vector>

namespace velkhost::cli {

struct LiveViewOptions {
    bool timeline = false;      // every change also stays as a line of its own, above
    bool running_clock = true;  // redrawn at every tick, not only at changes
    int pace_ms = 0;            // how long each change is to be seen at least
};

class LiveView final : public View {
  public:
    LiveView(Output &output, const Terminal &terminal, LiveViewOptions options)
        : output_(output), terminal_(terminal), options_(options) {}

    void begin(const RequestReport &request, const std::vector<std::string> &packages) override;
    void change(std::int64_t at_us, std::size_t package, const rig::PackageStatus &status) override;
    void tick(std::int64_t now_us, const JobReport &job) override;
    void end() override;
    void abandon() override;

  private:
    struct Row {
        rig::PackageStatus status;
        std::int64_t changed_us = 0;
    };

    void draw(const std::string &above);
    [[nodiscard]] std::string frame(std::size_t width) const;
    [[nodiscard]] std::string title() const;
    [[nodiscard]] std::string header(std::size_t width) const;
    [[nodiscard]] std::string row_line(const Row &row, std::size_t width) const;
    [[nodiscard]] std::string spinner() const;
    [[nodiscard]] std::string erase() const;

    Output &output_;
    const Terminal terminal_;
    const LiveViewOptions options_;
    std::mutex mutex_;
    std::string title_;
    std::vector<Row> rows_;
    std::size_t id_width_ = 0;
    JobReport job_;
    std::int64_t now_us_ = 0;
    std::size_t turns_ = 0;        // of the spinner
    std::size_t lines_shown_ = 0;  // above the cursor that belong to the view
    bool showing_ = false;
};

}  // namespace velkhost::cli

#include "host/cli/live_view.h"

#include "host/cli/lines.h"
#include "host/cli/locks.h"
#include "host/cli/text.h"

#include <fmt/format.h>
#include <poll.h>

#include <algorithm>
#include <array>

namespace velkhost::cli {
namespace {

constexpr std::string_view kHideCursor = "\x1b[?25l";
constexpr std::string_view kShowCursor = "\x1b[?25h";
constexpr std::size_t kHeaderLines = 3;

constexpr std::array<std::string_view, 10> kBrailleTurns = {"⠋", "⠙", "⠹", "⠸", "⠼",
                                                            "⠴", "⠦", "⠧", "⠇", "⠏"};
constexpr std::array<std::string_view, 4> kAsciiTurns = {"|", "/", "-", "\\"};

// Real time, whatever the host's clock does: poll is no pause of the host.
void linger(int milliseconds) {
    if (milliseconds > 0) {
        poll(nullptr, 0, milliseconds);
    }
}

}  // namespace

void LiveView::begin(const RequestReport &request, const std::vector<std::string> &packages) {
    const std::lock_guard lock(mutex_);
    title_ = title_line(request, packages.size());
    id_width_ = widest(packages);
    for (const std::string &id : packages) {
        rows_.push_back({{id, std::nullopt, "waiting"}, 0});
    }
    showing_ = true;
    output_.write(kHideCursor);
    draw(options_.timeline ? title() + "\n" : std::string());
}

void LiveView::change(std::int64_t at_us, std::size_t package, const rig::PackageStatus &status) {
    const std::lock_guard lock(mutex_);
    if (!showing_ || package >= rows_.size()) {
        return;
    }
    now_us_ = std::max(now_us_, at_us);
    rows_[package] = {status, at_us};
    const std::size_t width = window_size(output_.fd()).columns;
    const bool is_news = options_.timeline && status.code != 0;
    draw(is_news ? change_line(terminal_, at_us, id_width_, status, width) + "\n" : std::string());
    linger(options_.pace_ms);
}

void LiveView::tick(std::int64_t now_us, const JobReport &job) {
    const std::lock_guard lock(mutex_);
    if (!showing_) {
        return;
    }
    const bool is_news = job_line(job) != job_line(job_);
    now_us_ = std::max(now_us_, now_us);
    job_ = job;
    ++turns_;
    if (is_news && options_.timeline && !job.id.empty()) {
        draw(paint(terminal_, Ink::kDim, "[+" + elapsed(now_us_) + "] ") + job_line(job) + "\n");
    } else if (is_news || options_.running_clock) {
        draw({});
    }
}

void LiveView::end() {
    const std::lock_guard lock(mutex_);
    if (showing_) {
        output_.write(erase().append(kShowCursor));
        showing_ = false;
        lines_shown_ = 0;
    }
}

void LiveView::abandon() {
    take_for_good(mutex_);
    if (showing_) {
        output_.write(kShowCursor);
    }
}

// Everything in one write, so that no half frame is ever seen.
void LiveView::draw(const std::string &above) {
    const WindowSize window = window_size(output_.fd());
    std::string text = erase() + above;
    const bool fits = rows_.size() + kHeaderLines < window.rows;
    if (fits) {
        text += frame(window.columns);
    }
    lines_shown_ = fits ? rows_.size() + kHeaderLines : 0;
    output_.write(text);
}

// Back to the first line of the view, and all from there on cleared.
std::string LiveView::erase() const {
    return lines_shown_ == 0 ? std::string("\r\x1b[J")
                             : fmt::format("\r\x1b[{}A\x1b[J", lines_shown_);
}

std::string LiveView::frame(std::size_t width) const {
    std::string text = header(width);
    for (const Row &row : rows_) {
        text += row_line(row, width) + "\n";
    }
    return text;
}

std::string LiveView::title() const {
    const std::size_t width = window_size(output_.fd()).columns;
    return paint(terminal_, Ink::kBold,
                 cut(printable(title_, !terminal_.utf8), width, cut_mark(terminal_)));
}

// The title already stands above the timeline.
std::string LiveView::header(std::size_t width) const {
    const std::string job = job_.id.empty() ? "request under way" : job_line(job_);
    const std::string state = fmt::format("{} +{}  {}", spinner(), elapsed(now_us_), job);
    return (options_.timeline ? "" : title()) + "\n" +
           paint(terminal_, Ink::kBusy, cut(state, width, cut_mark(terminal_))) + "\n\n";
}

// The time stands at the right edge.
std::string LiveView::row_line(const Row &row, std::size_t width) const {
    const std::string_view mark = cut_mark(terminal_);
    const std::string id = padded(printable(row.status.id, !terminal_.utf8), id_width_);
    const std::string message = printable(row.status.message, !terminal_.utf8);
    if (!row.status.code) {
        return paint(terminal_, Ink::kDim,
                     cut(fmt::format("- {}      {}", id, message), width, mark));
    }
    const std::string time = " +" + elapsed(row.changed_us);
    const std::size_t room = width > time.size() ? width - time.size() : 0;
    const std::string text =
        fmt::format("{} {}  {:>2}  {}", symbol_of(terminal_, outcome_of(row.status)), id,
                    *row.status.code, message);
    return paint(terminal_, ink_of(row.status), padded(cut(text, room, mark), room)) +
           paint(terminal_, Ink::kDim, cut(time, width - room, mark));
}

std::string LiveView::spinner() const {
    return std::string(terminal_.utf8 ? kBrailleTurns[turns_ % kBrailleTurns.size()]
                                      : kAsciiTurns[turns_ % kAsciiTurns.size()]);
}

}  // namespace velkhost::cli

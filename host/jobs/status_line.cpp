#include "host/jobs/status_line.h"

#include <algorithm>
#include <array>
#include <charconv>

namespace velkhost::jobs {
namespace {

constexpr std::string_view kSeparator = ": ";

// Initialised, downloaded, transfer running, and the installers' own progress.
constexpr std::array kProgressCodes = {0, 10, 15, 60, 61, 62};

// The number between the first two separators that have one between them: a package's name may
// hold a separator as well.
std::optional<int> code_of(std::string_view package) {
    for (auto at = package.find(kSeparator); at != std::string_view::npos;
         at = package.find(kSeparator)) {
        package.remove_prefix(at + kSeparator.size());
        int code = 0;
        const char *const end = package.data() + package.size();
        const auto [rest, error] = std::from_chars(package.data(), end, code);
        if (error == std::errc() && std::string_view(rest, end).starts_with(kSeparator)) {
            return code;
        }
    }
    return std::nullopt;
}

bool is_final(int code) {
    return std::ranges::find(kProgressCodes, code) == kProgressCodes.end();
}

}  // namespace

std::optional<std::uint16_t> percent_complete(std::string_view line) {
    std::size_t packages = 0;
    std::size_t ended = 0;
    line.remove_prefix(std::min(line.find('|'), line.size() - 1) + 1);
    for (auto end = line.find('|'); end != std::string_view::npos; end = line.find('|')) {
        if (const auto code = code_of(line.substr(0, end))) {
            ++packages;
            ended += is_final(*code) ? 1 : 0;
        }
        line.remove_prefix(end + 1);
    }
    if (packages == 0) {
        return std::nullopt;
    }
    return static_cast<std::uint16_t>(100 * ended / packages);
}

}  // namespace velkhost::jobs

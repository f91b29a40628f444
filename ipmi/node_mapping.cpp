#include "ipmi/node_mapping.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <cstddef>
#include <ctime>
#include <limits>
#include <optional>
#include <string_view>

#include "ipmi/network_table.h"
#include "velk/bounded_text.h"
#include "velk/debug_log.h"
#include "velk/file_io.h"

namespace velk {
namespace {

constexpr std::string_view kStampMarker = "RXC IN-Band Network Mappings: ";
constexpr std::size_t kStampPosition = 29;
constexpr std::size_t kMaxStampDigits = 12;
constexpr std::size_t kLineSize = 256;
constexpr std::size_t kMinLine = 2;
constexpr int kFirstNodeLine = 2;
constexpr std::size_t kKeptLines = 7;
constexpr std::string_view kWhitespace = " \n\t\r";

using Line = std::array<char, kLineSize>;

enum StampMode : int { kStampNow = 0, kStampZero = 1 };

std::string_view without_newline(std::string_view line) {
    return line.ends_with('\n') ? line.substr(0, line.size() - 1) : line;
}

// The next token behind `separators`, taken off `text`; empty at the end.
std::string_view take_token(std::string_view &text, std::string_view separators) {
    const std::size_t begin = text.find_first_not_of(separators);
    if (begin == std::string_view::npos) {
        text = {};
        return {};
    }
    text.remove_prefix(begin);
    const std::string_view token = text.substr(0, text.find_first_of(separators));
    text.remove_prefix(token.size());
    return token;
}

int parse_stamp(std::string_view line) {
    std::string_view rest = line.substr(std::min(kStampPosition, line.size()));
    const std::string_view digits = take_token(rest, kWhitespace).substr(0, kMaxStampDigits);
    long long value = 0;
    std::from_chars(digits.data(), digits.data() + digits.size(), value);
    constexpr long long kMax = std::numeric_limits<int>::max();
    constexpr long long kMin = std::numeric_limits<int>::min();
    return static_cast<int>(value > kMax ? kMax : value < kMin ? kMin : value);
}

// What a line says at `position` if it is about `node`: tokens are counted from 1 behind the label.
std::optional<std::string_view> node_token(std::string_view line, std::string_view node,
                                           int position) {
    take_token(line, " ");
    bool is_node = false;
    for (int at = 1; !line.empty(); ++at) {
        const std::string_view token = take_token(line, " ");
        if (token.empty()) {
            break;
        }
        is_node = is_node || (at == 1 && token == node);
        if (is_node && at == position) {
            return token;
        }
    }
    return std::nullopt;
}

int find_token(char *dest, int node, int position) {
    LineReader file(kNodeMapping);
    char number[16];
    const std::string_view wanted(number, print(number, 0, "%d", node));
    Line line;
    for (int at = 0; file.next(line); ++at) {
        const std::string_view text = without_newline(view(line));
        if (text.size() < kMinLine || at < kFirstNodeLine) {
            continue;
        }
        if (const auto token = node_token(text, wanted, position)) {
            copy({dest, kTokenSize}, *token);
            return 0;
        }
    }
    return 1;
}

// The first lines of the file, as many as are kept.
struct KeptLines {
    std::array<Line, kKeptLines> lines = {};
    std::size_t count = 0;

    bool read() {
        LineReader file(kNodeMapping);
        while (count < lines.size() && file.next(lines[count])) {
            count += view(lines[count]).size() >= kMinLine ? 1 : 0;
        }
        return file.is_open();
    }

    [[nodiscard]] bool write() const {
        const FileDescriptor file(kNodeMapping, O_WRONLY | O_CREAT | O_TRUNC);
        for (std::size_t i = 0; i < count; ++i) {
            file.write(view(lines[i]));
        }
        return file.is_open();
    }
};

}  // namespace
}  // namespace velk

int getNodeNumber(int *count) {
    using namespace velk;
    if (count == nullptr) {
        return -1;
    }
    *count = 0;
    LineReader file(kNodeMapping);
    if (!file.is_open()) {
        return 1;
    }
    *count = -kFirstNodeLine;
    Line line;
    while (file.next(line)) {
        *count += view(line).size() >= kMinLine ? 1 : 0;
    }
    return 0;
}

int gettimestamp(int *stamp) {
    using namespace velk;
    log_dated("gettimestamp :  enter.");
    LineReader file(kNodeMapping);
    Line line;
    while (stamp != nullptr && file.next(line)) {
        if (view(line).find(kStampMarker) != std::string_view::npos) {
            *stamp = parse_stamp(without_newline(view(line)));
            return 0;
        }
    }
    return -1;
}

int updatetimestamp(int mode) {
    using namespace velk;
    KeptLines kept;
    if (!kept.read()) {
        return 1;
    }
    if (mode == kStampNow || mode == kStampZero) {
        const auto stamp = static_cast<long>(mode == kStampNow ? std::time(nullptr) : 0);
        print(kept.lines[0], 0, "RXC IN-Band Network Mappings: %ld\n", stamp);
        kept.count = kept.count == 0 ? 1 : kept.count;
    }
    return kept.write() ? 0 : 1;
}

int getIPMI(char *dest, int node) {
    return velk::find_token(dest, node, 2);
}

int getESXiIP(char *dest, int node) {
    return velk::find_token(dest, node, 4);
}

int getRXCIP(char *dest, int node) {
    return velk::find_token(dest, node, 5);
}

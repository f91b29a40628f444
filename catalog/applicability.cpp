#include "catalog/applicability.h"

#include <algorithm>
#include <charconv>
#include <cstddef>
#include <cstring>
#include <optional>
#include <span>
#include <string_view>
#include <utility>

#include "velk/bounded_text.h"
#include "velk/debug_log.h"
#include "velk/file_io.h"
#include "velk/package_table.h"

namespace velk {
namespace {

constexpr std::size_t kLineSize = 1024;
constexpr std::size_t kMaxName = 1022;
constexpr std::size_t kMaxText = 1023;
constexpr int kMaxMatches = 10;

// Whether `word` up to its last character begins `keyword`: that is how tags are told apart, so
// that any tag of one character passes for any keyword.
bool resembles(std::string_view word, std::string_view keyword) {
    return !word.empty() && keyword.starts_with(word.substr(0, word.size() - 1));
}

std::string_view text_at(const char *begin, int length) {
    return {begin, begin == nullptr ? 0 : static_cast<std::size_t>(length)};
}

// One line of the file with its parts.
class Line {
  public:
    // False at the end of the file.
    bool read(LineReader &file) {
        text_[0] = '\0';
        return file.next(text_);
    }

    [[nodiscard]] bool is_empty() const { return text_[0] == '\0'; }
    [[nodiscard]] std::string_view tag() { return part(getProp); }
    [[nodiscard]] std::string_view attribute() { return part(getSubProp); }
    [[nodiscard]] std::string_view value() { return part(getPropValue); }

    [[nodiscard]] bool is_payload() { return resembles(tag(), "payload"); }
    [[nodiscard]] bool is_payload_end() { return resembles(tag(), "/payload order"); }
    [[nodiscard]] bool is_end_of_file() {
        return std::string_view{"/updateConfiguration"}.starts_with(tag());
    }
    [[nodiscard]] bool is_applicability() {
        return resembles(tag(), "applicability") && resembles(attribute(), "type");
    }

    // The number in the quotes after an "order" attribute; no value without such an attribute.
    [[nodiscard]] std::optional<int> order() {
        const std::string_view name = attribute();
        if (name.empty() || !std::string_view{"order"}.starts_with(name)) {
            return std::nullopt;
        }
        const char *digits = name.data() + name.size();
        digits += std::strspn(digits, " ");
        digits += *digits == '=' ? 1 : 0;
        digits += std::strspn(digits, " ");
        digits += *digits == '"' ? 1 : 0;
        return decimal({digits, std::strcspn(digits, "\"")});
    }

  private:
    using Scanner = char *(*)(char *line, int *length);

    std::string_view part(Scanner scan) {
        int length = 0;
        const char *begin = scan(text_, &length);
        return text_at(begin, length);
    }

    static int decimal(std::string_view digits) {
        int value = 0;
        std::from_chars(digits.data(), digits.data() + digits.size(), value);
        return value;
    }

    char text_[kLineSize] = {};
};

enum class Scan { kGoOn, kEnd, kFailed };

// Collects the payloads of the file that apply to one adapter into `payload_result`.
class PayloadScan {
  public:
    PayloadScan(LineReader &file, std::string_view dfn) : file_(file), dfn_(dfn) {}

    // False when a payload had no usable name.
    bool run() {
        Scan state = Scan::kGoOn;
        while (state == Scan::kGoOn && line_.read(file_)) {
            state = line_.is_empty() ? stop_at_empty_line() : read_line();
        }
        return state != Scan::kFailed;
    }

    [[nodiscard]] int matches() const { return matches_; }

  private:
    static Scan stop_at_empty_line() {
        log_entry("*buf==0,break;\n");
        return Scan::kEnd;
    }

    Scan read_line() {
        if (line_.tag().empty()) {
            return pass();
        }
        if (line_.is_payload()) {
            return read_payload();
        }
        if (line_.is_end_of_file()) {
            log_entry("end of config file\n");
            return Scan::kEnd;
        }
        return pass();
    }

    static Scan pass() {
        log_entry("nothing done for 1st getProp\n");
        return Scan::kGoOn;
    }

    Scan read_payload() {
        const std::optional<int> order = line_.order();
        if (order) {
            log_format("set order to %d\n", *order);
        } else {
            log_entry("hardcode order to 0\n");
        }
        const Text<kLineSize> name(line_.value());
        const std::size_t length = line_.value().size();
        if (length == 0 || length > kMaxName) {
            log_entry("payload value handle error, return FALSE\n");
            return Scan::kFailed;
        }
        log_format("%s\n", name.c_str());
        if (applies()) {
            payload_result[matches_].order = order.value_or(0);
            copy(payload_result[matches_].payload, view(name.c_str()));
            ++matches_;
        }
        return matches_ < kMaxMatches ? Scan::kGoOn : Scan::kEnd;
    }

    // Reads the applicability lines after a payload line up to a match or the payload's end.
    bool applies() {
        while (true) {
            if (!line_.read(file_)) {
                log_entry("next line failed\n");
                return false;
            }
            if (line_.is_empty()) {
                log_entry("break in format refinement\n");
                return false;
            }
            if (line_.tag().empty() || line_.is_payload_end()) {
                return false;
            }
            if (line_.is_applicability() && suits(line_.value())) {
                log_entry("found DFN\n");
                log_entry("found dfn match\n");
                return true;
            }
        }
    }

    // A line without a value names no adapter, not even one that has no identifier.
    [[nodiscard]] bool suits(std::string_view value) const {
        return !value.empty() && value == dfn_;
    }

    LineReader &file_;
    std::string_view dfn_;
    Line line_;
    int matches_ = 0;
};

// Entries change places only with the last later one that stands before a smaller or equal one. It
// sorts the usual files, and others are expected to come out as they always have.
void sort_matches(std::span<PayloadResult> matches) {
    if (matches.size() < 2 || matches[0].order == 0) {
        return;
    }
    for (std::size_t at = 0; at + 1 < matches.size(); ++at) {
        std::size_t last = at;
        for (std::size_t next = at + 1; next < matches.size(); ++next) {
            if (matches[next - 1].order >= matches[next].order) {
                last = next;
            }
        }
        std::swap(matches[at], matches[last]);
    }
}

// Copies up to 1023 characters and fills the rest of them with zeros, beyond the field into the
// entries behind it, which are written later. What would leave the table is dropped.
void run_on(std::span<PayloadDevice> table, std::size_t entry, std::size_t field,
            std::string_view text) {
    const std::span bytes(reinterpret_cast<char *>(table.data()), table.size_bytes());
    const std::span target = bytes.subspan(entry * sizeof(PayloadDevice) + field);
    const std::span field_and_on = target.first(std::min(target.size(), kMaxText + 1));
    std::fill(field_and_on.begin(), field_and_on.end(), '\0');
    copy(field_and_on, text);
}

void append_matches(PackageRecord &package, int last_size, std::span<const PayloadResult> matches,
                    std::string_view device_id) {
    auto entry = static_cast<std::size_t>(last_size);
    for (const PayloadResult &match : matches) {
        if (entry >= kMaxPayloads) {
            return;
        }
        const std::span table(package.PayloadDeviceIDArray);
        run_on(table, entry, offsetof(PayloadDevice, PayloadPath), view(match.payload));
        run_on(table, entry, offsetof(PayloadDevice, DeviceID), device_id);
        log_format("%s\n", match.payload);
        ++entry;
    }
}

void clear_results(int count) {
    for (PayloadResult &result :
         std::span(payload_result).first(static_cast<std::size_t>(std::min(count, kMaxMatches)))) {
        result.order = 0;
        copy(result.payload, {});
    }
}

// Collects the payloads of one adapter after another.
class Matching {
  public:
    Matching(PackageRecord &package, const char *path) : package_(package), path_(path) {}

    // False when the file is missing or malformed.
    bool add_adapter(int index) {
        log_format("current index: %d, last_size=%d\n", index, last_size_);
        log_value("filename is ", path_);
        LineReader file(path_);
        if (!file.is_open()) {
            log_entry("open file failed, return 0\n");
            return false;
        }
        clear_results(last_size_);
        const DfnDevice &device = package_.DFNDeviceIDArray[index];
        log_format("current DFN=\"%.*s\"\n", static_cast<int>(view(device.DFN).size()), device.DFN);
        PayloadScan scan(file, view(device.DFN));
        if (!scan.run()) {
            return false;
        }
        has_payload_ = has_payload_ || scan.matches() > 0;
        if (!has_payload_) {
            log_entry("!has_payload\n");
            return true;
        }
        take(scan.matches(), view(device.DeviceID));
        return true;
    }

    [[nodiscard]] int size() const { return last_size_; }

  private:
    void take(int count, std::string_view device_id) {
        const auto matches = std::span(payload_result).first(static_cast<std::size_t>(count));
        sort_matches(matches);
        append_matches(package_, last_size_, matches, device_id);
        last_size_ = std::min(last_size_ + count, kMaxPayloads);
        log_format("now last_size is:%d\n", last_size_);
    }

    PackageRecord &package_;
    const char *path_;
    int last_size_ = 0;
    bool has_payload_ = false;
};

}  // namespace

int match_payloads(int index, int first, int count) {
    char path[kLineSize];
    findCfgFileName(path);
    log_entry("Enter parsePayloadDeviceIDArray.\n");
    if (!is_package_index(index)) {
        return 0;
    }
    PackageRecord &package = pkgInstance[index];
    log_format("pkgInstance[pkgIdx].dfnnumber=%d\n", package.dfnnumber);
    Matching matching(package, path);
    for (int i = first; i < std::min(first + count, kMaxDevices); ++i) {
        if (!matching.add_adapter(i)) {
            return 0;
        }
    }
    log_format("before end of parse, last_size is:%d\n", matching.size());
    package.payloadnum = matching.size();
    log_format("pkgInstance[pkgIdx].payloadnum set to last_size, value is %d\n", matching.size());
    log_entry("parsePayloadDeviceIDArray finished.\n");
    return 1;
}

}  // namespace velk

int parsePayloadDeviceIDArray(int idx) {
    const int count = velk::is_package_index(idx) ? pkgInstance[idx].dfnnumber : 0;
    return velk::match_payloads(idx, 0, count);
}

int findCfgFileName(char *buffer) {
    velk::copy({buffer, velk::kLineSize}, "/var/tmp/ZEB/Pakro/Package/image/payload.xml");
    return 1;
}

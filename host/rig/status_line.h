// The status line: how a request stands, as the provider library writes it to the job's status
// file: "1|pkgA: 50: Package installation successfully.|pkgB: 57: ...|".
#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace velkhost::rig {

struct PackageStatus {
    std::string id;           // descriptor's file name without its extension
    std::optional<int> code;  // no value: nothing is known of the package
    std::string message;

    bool operator==(const PackageStatus &) const = default;
};

struct StatusLine {
    int overall = 0;  // 1 once the last package of the request has its final result
    std::vector<PackageStatus> packages;  // in the order of the request
    bool cut = false;  // the line outgrew the library's buffer: the last package may lack its end

    bool operator==(const StatusLine &) const = default;
};

// The parts of "<id>: <code>: <message>". The code is the first number between ": " and ": ", as an
// id may hold anything but '|'; no value when there is none.
std::optional<PackageStatus> parse_package_status(std::string_view text);

// A message may hold a '|' of its own: a piece without a code continues the one before it. No value
// for a text that does not begin with a number and '|'.
std::optional<StatusLine> parse_status_line(std::string_view text);

// The id under which the library reports the package of a location: the part after the last '/',
// without what follows its last '.'.
std::string package_id(std::string_view location);

}  // namespace velkhost::rig

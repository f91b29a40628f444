#include "host/providers/kit/package_folder.h"

#include "host/providers/kit/local_file.h"
#include "host/scenario/read_file.h"
#include "host/scenario/scenario.h"

#include <algorithm>
#include <sstream>
#include <string_view>
#include <utility>

namespace velkhost::providers {
namespace {

// A line's first tag and the text behind it.
struct TaggedText {
    std::string_view tag;
    std::string_view text;
};

TaggedText split(std::string_view line) {
    const auto begin = line.find('<');
    const auto end = line.find('>', begin == line.npos ? 0 : begin);
    if (begin == line.npos || end == line.npos) {
        return {};
    }
    const std::string_view inside = line.substr(begin + 1, end - begin - 1);
    const std::string_view behind = line.substr(end + 1);
    return {inside.substr(0, inside.find(' ')), behind.substr(0, behind.find('<'))};
}

// No value for a text that names no place of this host.
std::optional<std::string> path_of(const std::string &place) {
    return place.starts_with('/') ? path_of_file_uri("file://" + place) : path_of_file_uri(place);
}

std::vector<std::string> dfns_of(scenario::AdapterFamily family) {
    std::vector<std::string> dfns;
    for (const scenario::Adapter &adapter : scenario::Scenario::current()->adapters) {
        if (adapter.family == family && adapter.dfn) {
            dfns.push_back(*adapter.dfn);
        }
    }
    return dfns;
}

}  // namespace

std::optional<PackageFolder> PackageFolder::open(const std::string &place) {
    const auto path = path_of(place);
    const std::string file = path.value_or("") + "/image/payload.xml";
    if (!path || !is_readable_file(file)) {
        return std::nullopt;
    }
    const auto configuration = scenario::read_file(file);
    return configuration ? std::optional(PackageFolder(*path, *configuration)) : std::nullopt;
}

PackageFolder::PackageFolder(std::string path, const std::string &configuration)
    : path_(std::move(path)) {
    std::istringstream lines(configuration);
    for (std::string line; std::getline(lines, line);) {
        read_line(line);
    }
}

void PackageFolder::read_line(const std::string &line) {
    const TaggedText content = split(line);
    if (content.tag == "payload" && !content.text.empty()) {
        payloads_.push_back({std::string(content.text), {}});
    } else if (content.tag == "applicability" && !payloads_.empty()) {
        payloads_.back().dfns.emplace_back(content.text);
    }
}

std::vector<std::string> PackageFolder::payloads_for(scenario::AdapterFamily family) const {
    const std::vector<std::string> dfns = dfns_of(family);
    std::vector<std::string> files;
    for (const Payload &payload : payloads_) {
        if (std::ranges::find_first_of(payload.dfns, dfns) != payload.dfns.end()) {
            files.push_back(path_ + '/' + payload.file);
        }
    }
    return files;
}

}  // namespace velkhost::providers

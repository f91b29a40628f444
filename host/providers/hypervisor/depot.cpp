#include "host/providers/hypervisor/depot.h"

#include "host/providers/hypervisor/element_text.h"
#include "host/scenario/read_file.h"
#include "host/unzip/archive.h"
#include "host/unzip/entry_name.h"
#include "host/unzip/failure.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <optional>
#include <string_view>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace velkhost::providers {
namespace {

// Longer than any text of a bundle, short enough to be held in memory.
constexpr std::uint64_t kLongestText = std::uint64_t{1} << 20;

// What stands in a metadata archive about one package.
struct VibEntry {
    Vib vib;
    std::string path;  // relative to the bundle's folder
    std::uint64_t size = 0;
};

std::string text_of_file(const std::string &folder, const std::string &name) {
    const auto text = scenario::read_file(folder + name);
    if (!text) {
        throw DepotError(name + " cannot be read");
    }
    return *text;
}

bool leads_to(const std::string &xml, std::string_view element, const std::string &name) {
    const std::vector<std::string> texts = texts_of(xml, element);
    return std::ranges::find(texts, name) != texts.end();
}

// From the bundle's index through its vendors' to the metadata.
void check_index(const std::string &folder, const std::string &metadata) {
    constexpr const char *kIndex = "index.xml";
    constexpr const char *kVendorIndex = "vendor-index.xml";
    if (!leads_to(text_of_file(folder, kIndex), "indexfile", kVendorIndex)) {
        throw DepotError(std::string(kIndex) + " does not name " + kVendorIndex);
    }
    if (!leads_to(text_of_file(folder, kVendorIndex), "url", metadata)) {
        throw DepotError(std::string(kVendorIndex) + " does not name " + metadata);
    }
}

std::string the_text(const std::string &xml, std::string_view element, const std::string &where) {
    const std::vector<std::string> texts = texts_of(xml, element);
    if (texts.size() != 1 || texts.front().empty()) {
        throw DepotError(where + " must have one " + std::string(element));
    }
    return texts.front();
}

std::uint64_t the_number(const std::string &xml, std::string_view element,
                         const std::string &where) {
    const std::string text = the_text(xml, element, where);
    std::uint64_t number = 0;
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), number);
    if (error != std::errc() || end != text.data() + text.size()) {
        throw DepotError(where + " has a " + std::string(element) + " that is no number");
    }
    return number;
}

VibEntry read_vib(const std::string &xml, const std::string &where) {
    VibEntry out{{the_text(xml, "name", where), the_text(xml, "version", where)},
                 the_text(xml, "relative-path", where),
                 the_number(xml, "packed-size", where)};
    unzip::read_entry_name(out.path);  // which must stay inside of the bundle's folder
    return out;
}

// Reads every entry, since damage shows only there.
std::string contents(const unzip::Archive &archive, std::uint64_t index,
                     const unzip::Entry &entry) {
    if (entry.size > kLongestText) {
        throw DepotError(entry.name + " is too long");
    }
    std::string text;
    archive.read(index,
                 [&](std::span<const char> piece) { text.append(piece.data(), piece.size()); });
    return text;
}

std::vector<VibEntry> read_metadata(const std::string &path) {
    const unzip::Archive archive(path.c_str());
    std::vector<VibEntry> vibs;
    for (std::uint64_t i = 0; i < archive.count(); ++i) {
        const unzip::Entry entry = archive.entry(i);
        const std::string text = contents(archive, i, entry);
        if (entry.name.starts_with("vibs/") && entry.name.ends_with(".xml")) {
            vibs.push_back(read_vib(text, entry.name));
        }
    }
    return vibs;
}

// The size of the package's file; no value when it cannot be read or is no package.
std::optional<std::uint64_t> size_of_vib(const std::string &path) {
    constexpr std::string_view kMagic = "!<arch>\n";
    const int file = ::open(path.c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK);
    if (file < 0) {
        return std::nullopt;
    }
    struct stat about {};
    std::array<char, kMagic.size()> begin{};
    const bool is_vib =
        ::fstat(file, &about) == 0 && S_ISREG(about.st_mode) &&
        ::read(file, begin.data(), begin.size()) == static_cast<ssize_t>(begin.size()) &&
        std::string_view(begin.data(), begin.size()) == kMagic;
    ::close(file);
    return is_vib ? std::optional(static_cast<std::uint64_t>(about.st_size)) : std::nullopt;
}

void check_vib(const std::string &folder, const VibEntry &entry) {
    const auto size = size_of_vib(folder + entry.path);
    if (!size) {
        throw DepotError(entry.path + " is missing or no package");
    }
    if (*size != entry.size) {
        throw DepotError(entry.path + " has not the size that its metadata state");
    }
}

}  // namespace

std::vector<Vib> read_depot(const std::string &metadata) {
    const auto end_of_folder = metadata.rfind('/') + 1;
    const std::string folder = metadata.substr(0, end_of_folder);
    const std::string name = metadata.substr(end_of_folder);
    check_index(folder, name);
    try {
        std::vector<Vib> vibs;
        for (const VibEntry &entry : read_metadata(metadata)) {
            check_vib(folder, entry);
            vibs.push_back(entry.vib);
        }
        return vibs;
    } catch (const unzip::Failure &) {
        throw DepotError(name + " is no undamaged archive");
    }
}

}  // namespace velkhost::providers

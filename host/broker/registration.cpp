#include "host/broker/registration.h"

#include "host/cim/names.h"

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <fstream>
#include <iterator>
#include <set>
#include <utility>

namespace velkhost::broker {
namespace {

std::string_view trimmed(std::string_view text) {
    constexpr std::string_view kBlanks = " \t\r";
    const auto begin = text.find_first_not_of(kBlanks);
    if (begin == std::string_view::npos) {
        return {};
    }
    return text.substr(begin, text.find_last_not_of(kBlanks) - begin + 1);
}

std::vector<std::string> words(std::string_view text) {
    std::vector<std::string> list;
    for (text = trimmed(text); !text.empty(); text = trimmed(text)) {
        const auto end = std::min(text.find_first_of(" \t"), text.size());
        list.emplace_back(text.substr(0, end));
        text.remove_prefix(end);
    }
    return list;
}

class Parser {
  public:
    explicit Parser(std::string name) : name_(std::move(name)) {}

    RegistrationFile run(std::string_view text) {
        while (!text.empty() && error_.empty()) {
            const auto end = std::min(text.find('\n'), text.size());
            ++line_;
            read_line(trimmed(text.substr(0, end)));
            text.remove_prefix(std::min(end + 1, text.size()));
        }
        close_section();
        if (!error_.empty()) {
            return {{}, error_};
        }
        return {std::move(entries_), ""};
    }

  private:
    void fail(const std::string &what, std::size_t line) {
        if (error_.empty()) {
            error_ = name_ + ':' + std::to_string(line) + ": " + what;
        }
    }
    void fail(const std::string &what) { fail(what, line_); }

    void read_line(std::string_view line) {
        if (line.empty() || line.front() == '#') {
            return;
        }
        if (line.front() == '[') {
            close_section();
            open_section(line);
            return;
        }
        const auto colon = line.find(':');
        if (colon == std::string_view::npos) {
            return fail(R"(expected [Class] or "key: value", found ")" + std::string(line) + '"');
        }
        if (!open_) {
            return fail("an entry stands in front of the first [Class]");
        }
        read_entry(trimmed(line.substr(0, colon)), trimmed(line.substr(colon + 1)));
    }

    void open_section(std::string_view line) {
        const std::string_view name = trimmed(line.substr(1, line.size() - 2));
        if (line.size() < 2 || line.back() != ']' || name.empty()) {
            return fail("a class name stands in brackets: [Class]");
        }
        current_ = {};
        current_.class_name = name;
        seen_.clear();
        section_line_ = line_;
        open_ = true;
    }

    void read_entry(std::string_view key, std::string_view value) {
        if (!seen_.emplace(key).second) {
            return fail("\"" + std::string(key) + "\" stands twice in this section");
        }
        if (value.empty()) {
            return fail("\"" + std::string(key) + "\" has no value");
        }
        if (key == "type") {
            return read_types(value);
        }
        if (key == "namespace") {
            current_.namespaces = words(value);
        } else if (key == "unload") {
            current_.never_unload = value == "never";
            if (!current_.never_unload) {
                fail("unload can only be \"never\"");
            }
        } else if (std::string *field = text_field(key)) {
            *field = value;
        } else {
            fail("unknown key \"" + std::string(key) + '"');
        }
    }

    std::string *text_field(std::string_view key) {
        const std::pair<std::string_view, std::string *> fields[] = {
            {"provider", &current_.provider},
            {"location", &current_.location},
            {"group", &current_.group},
            {"user", &current_.user},
            {"parameters", &current_.parameters}};
        const auto *field = std::find_if(std::begin(fields), std::end(fields),
                                         [key](const auto &entry) { return entry.first == key; });
        return field == std::end(fields) ? nullptr : field->second;
    }

    void read_types(std::string_view value) {
        for (const std::string &word : words(value)) {
            const auto *kind =
                std::find_if(kKindNames.begin(), kKindNames.end(),
                             [&word](std::string_view name) { return cim::same_name(name, word); });
            if (kind == kKindNames.end()) {
                return fail("unknown provider type \"" + word + '"');
            }
            current_.kinds.add(static_cast<ProviderKind>(kind - kKindNames.begin()));
        }
    }

    void close_section() {
        if (!open_) {
            return;
        }
        open_ = false;
        for (const char *key : {"provider", "location", "type", "namespace"}) {
            if (!seen_.contains(key)) {
                fail("[" + current_.class_name + "] has no \"" + key + '"', section_line_);
            }
        }
        entries_.push_back(std::move(current_));
    }

    const std::string name_;
    std::size_t line_ = 0;
    std::size_t section_line_ = 0;
    bool open_ = false;
    Registration current_;
    std::set<std::string, std::less<>> seen_;
    std::vector<Registration> entries_;
    std::string error_;
};

}  // namespace

RegistrationFile parse_registration(std::string_view text, const std::string &name) {
    return Parser(name).run(text);
}

RegistrationFile read_registration(const std::filesystem::path &file) {
    std::ifstream stream(file, std::ios::binary);
    if (!stream) {
        return {{}, file.string() + ": cannot be read: " + std::strerror(errno)};
    }
    const std::string text{std::istreambuf_iterator<char>(stream), {}};
    return parse_registration(text, file.string());
}

}  // namespace velkhost::broker

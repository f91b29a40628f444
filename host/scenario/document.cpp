#include "host/scenario/document.h"

#include "host/scenario/model.h"

#include <algorithm>
#include <array>
#include <chrono>
#include <utility>

#define TOML_EXCEPTIONS 0
#define TOML_ENABLE_FORMATTERS 0
#include <toml++/toml.h>

namespace velkhost::scenario {
namespace {

int line_of(const toml::source_region &region) {
    return static_cast<int>(region.begin.line);
}

// The moment of a date-time that has an offset.
Instant to_instant(const toml::date_time &when) {
    using namespace std::chrono;
    const sys_days day = year{when.date.year} / when.date.month / when.date.day;
    const auto time = hours{when.time.hour} + minutes{when.time.minute} +
                      seconds{when.time.second} + nanoseconds{when.time.nanosecond};
    const auto offset = minutes{when.offset->minutes};
    return {duration_cast<microseconds>(day.time_since_epoch() + time - offset).count()};
}

Node convert(const toml::node &node);

Array convert(const toml::array &array) {
    Array out;
    for (const toml::node &element : array) {
        out.push_back(convert(element));
    }
    return out;
}

Table convert(const toml::table &table) {
    Table out;
    for (const auto &[key, node] : table) {
        out.entries.push_back({std::string(key.str()), line_of(key.source()), convert(node)});
    }
    return out;
}

Node convert(const toml::node &node) {
    Node out;
    out.line = line_of(node.source());
    if (const auto *table = node.as_table()) {
        out.value = convert(*table);
    } else if (const auto *array = node.as_array()) {
        out.value = convert(*array);
    } else if (const auto *text = node.as_string()) {
        out.value = text->get();
    } else if (const auto *number = node.as_integer()) {
        out.value = number->get();
    } else if (const auto *flag = node.as_boolean()) {
        out.value = flag->get();
    } else if (const auto *when = node.as_date_time(); when && when->get().offset) {
        out.value = to_instant(when->get());
    } else if (node.is_floating_point()) {
        out.value = Unusable{"a number with a fraction"};
    } else {
        out.value = Unusable{"a date or time without an offset"};
    }
    return out;
}

}  // namespace

const Node *Table::find(std::string_view key) const {
    const auto found = std::ranges::find(entries, key, &Entry::key);
    return found == entries.end() ? nullptr : &found->node;
}

std::string Node::kind() const {
    static constexpr std::array kNames{"a table",        "an array",  "a string",
                                       "a whole number", "a boolean", "a date-time"};
    if (const auto *unusable = std::get_if<Unusable>(&value)) {
        return unusable->what;
    }
    return kNames.at(value.index());
}

Node parse_document(std::string_view text, const std::string &source) {
    const toml::parse_result result = toml::parse(text, source);
    if (!result) {
        const toml::parse_error &error = result.error();
        throw ScenarioError(source + ":" + std::to_string(line_of(error.source())) + ": " +
                            std::string(error.description()));
    }
    return convert(static_cast<const toml::node &>(result.table()));
}

}  // namespace velkhost::scenario

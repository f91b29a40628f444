// A TOML document as a tree that remembers lines. Keeps the TOML parser in one translation unit and
// lets the reader say where in the file something is wrong.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <variant>
#include <vector>

namespace velkhost::scenario {

// A moment with an offset, as microseconds since 1970-01-01 UTC.
struct Instant {
    std::int64_t us = 0;
};

// A TOML value of a kind that no key takes: a float, or a date or time without an offset.
struct Unusable {
    std::string what;
};

struct Node;
struct Entry;
using Array = std::vector<Node>;

struct Table {
    std::vector<Entry> entries;  // sorted by key

    // The value under `key`, or nullptr.
    [[nodiscard]] const Node *find(std::string_view key) const;
};

struct Node {
    int line = 0;  // 1-based
    std::variant<Table, Array, std::string, std::int64_t, bool, Instant, Unusable> value;

    // What the value is, as a message puts it: "a string", "a table", ...
    [[nodiscard]] std::string kind() const;
};

struct Entry {
    std::string key;
    int line = 0;  // of the key
    Node node;
};

// The root table of `text`. Throws ScenarioError with "source:line: message".
Node parse_document(std::string_view text, const std::string &source);

}  // namespace velkhost::scenario

// Strict reading of one TOML table: each key is asked for with its type and range, and a key that
// nobody asked for is an error. Every error is a ScenarioError with file and line.
#pragma once

#include "host/scenario/document.h"

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace velkhost::scenario {

// Longest text that a key takes, in bytes.
inline constexpr std::size_t kLongestText = 1023;

// How often something can be asked to happen.
inline constexpr std::uint32_t kMostTurns = 1'000'000;

// Keeps what `target` holds by default when the key was absent.
template <typename T, typename U>
void assign(T &target, std::optional<U> value) {
    if (value) {
        target = static_cast<T>(*std::move(value));
    }
}

class TableReader {
  public:
    // `name` is how messages call the table; `source` the file. Both and the node must outlive it.
    TableReader(const Node &node, std::string name, const std::string &source);

    // Each answers no value when the key is absent.
    std::optional<std::string> text(std::string_view key);
    std::optional<std::uint32_t> number(std::string_view key, std::uint32_t lowest,
                                        std::uint32_t highest);
    std::optional<bool> flag(std::string_view key);
    std::optional<std::int64_t> instant_us(std::string_view key);
    std::optional<std::vector<std::string>> texts(std::string_view key);

    // A table, or every table of an array of tables; nothing when absent.
    std::optional<TableReader> table(std::string_view key);
    std::optional<std::vector<TableReader>> tables(std::string_view key);

    // The value as it is, for keys that take more than one type; nullptr when absent.
    const Node *any(std::string_view key);

    // Fails for the first key that was not asked for.
    void finish() const;

    [[nodiscard]] int line() const { return node_.line; }

    // Fails with "file:line: table: message", at the key's line when the key is there.
    [[noreturn]] void fail(std::string_view key, const std::string &message) const;
    // The same for a value that is no `wanted`, naming what it is.
    [[noreturn]] void fail_type(std::string_view key, const std::string &wanted) const;

  private:
    template <typename T>
    const T *typed(std::string_view key, const char *wanted);
    [[noreturn]] void fail_at(int line, const std::string &message) const;
    [[nodiscard]] std::string checked_text(std::string_view key, const std::string &text) const;

    const Node &node_;
    const Table &table_;
    std::string name_;
    const std::string &source_;
    std::vector<std::string> asked_;
};

}  // namespace velkhost::scenario

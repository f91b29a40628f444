#include "host/scenario/table_reader.h"

#include "host/scenario/model.h"

#include <algorithm>
#include <utility>

namespace velkhost::scenario {
namespace {

const Table kNoTable;

std::string quoted(std::string_view text) {
    return '"' + std::string(text) + '"';
}

std::string joined(const std::vector<std::string> &words) {
    std::string out;
    for (const std::string &word : words) {
        out += (out.empty() ? "" : ", ") + word;
    }
    return out;
}

}  // namespace

TableReader::TableReader(const Node &node, std::string name, const std::string &source)
    : node_(node),
      table_(std::holds_alternative<Table>(node.value) ? std::get<Table>(node.value) : kNoTable),
      name_(std::move(name)),
      source_(source) {
    if (!std::holds_alternative<Table>(node.value)) {
        fail_at(node.line, "must be a table, not " + node.kind());
    }
}

const Node *TableReader::any(std::string_view key) {
    if (std::ranges::find(asked_, key) == asked_.end()) {
        asked_.emplace_back(key);
    }
    return table_.find(key);
}

template <typename T>
const T *TableReader::typed(std::string_view key, const char *wanted) {
    const Node *node = any(key);
    if (node == nullptr) {
        return nullptr;
    }
    const T *value = std::get_if<T>(&node->value);
    if (value == nullptr) {
        fail_type(key, wanted);
    }
    return value;
}

std::optional<std::string> TableReader::text(std::string_view key) {
    const auto *value = typed<std::string>(key, "a string");
    return value == nullptr ? std::nullopt : std::optional(checked_text(key, *value));
}

std::optional<std::uint32_t> TableReader::number(std::string_view key, std::uint32_t lowest,
                                                 std::uint32_t highest) {
    const auto *value = typed<std::int64_t>(key, "a whole number");
    if (value == nullptr) {
        return std::nullopt;
    }
    if (*value < lowest || *value > highest) {
        fail(key, "must be from " + std::to_string(lowest) + " to " + std::to_string(highest) +
                      ", not " + std::to_string(*value));
    }
    return static_cast<std::uint32_t>(*value);
}

std::optional<bool> TableReader::flag(std::string_view key) {
    const auto *value = typed<bool>(key, "true or false");
    return value == nullptr ? std::nullopt : std::optional(*value);
}

std::optional<std::int64_t> TableReader::instant_us(std::string_view key) {
    const auto *value = typed<Instant>(key, "a date-time with an offset (2026-03-02T08:00:00Z)");
    return value == nullptr ? std::nullopt : std::optional(value->us);
}

std::optional<std::vector<std::string>> TableReader::texts(std::string_view key) {
    const auto *array = typed<Array>(key, "an array of strings");
    if (array == nullptr) {
        return std::nullopt;
    }
    std::vector<std::string> out;
    for (const Node &element : *array) {
        const auto *value = std::get_if<std::string>(&element.value);
        if (value == nullptr) {
            fail_at(element.line, quoted(key) + " must hold strings, not " + element.kind());
        }
        out.push_back(checked_text(key, *value));
    }
    return out;
}

std::optional<TableReader> TableReader::table(std::string_view key) {
    const Node *node = any(key);
    if (node == nullptr) {
        return std::nullopt;
    }
    const std::string prefix = name_.empty() ? "" : name_ + ".";
    return TableReader(*node, prefix + std::string(key), source_);
}

std::optional<std::vector<TableReader>> TableReader::tables(std::string_view key) {
    const auto *array = typed<Array>(key, "an array of tables");
    if (array == nullptr) {
        return std::nullopt;
    }
    const std::string prefix = name_.empty() ? "" : name_ + ".";
    std::vector<TableReader> out;
    for (const Node &element : *array) {
        out.emplace_back(element, prefix + std::string(key), source_);
    }
    return out;
}

void TableReader::finish() const {
    for (const Entry &entry : table_.entries) {
        if (std::ranges::find(asked_, entry.key) == asked_.end()) {
            fail_at(entry.line,
                    "unknown key " + quoted(entry.key) + "; known are " + joined(asked_));
        }
    }
}

std::string TableReader::checked_text(std::string_view key, const std::string &text) const {
    if (text.find('\0') != std::string::npos) {
        fail(key, "must not hold a NUL character");
    }
    if (text.size() > kLongestText) {
        fail(key, "must be at most " + std::to_string(kLongestText) + " bytes long");
    }
    return text;
}

void TableReader::fail(std::string_view key, const std::string &message) const {
    const Node *node = table_.find(key);
    fail_at(node == nullptr ? node_.line : node->line, quoted(key) + " " + message);
}

void TableReader::fail_type(std::string_view key, const std::string &wanted) const {
    const Node *node = table_.find(key);
    fail(key, "must be " + wanted + (node == nullptr ? "" : ", not " + node->kind()));
}

void TableReader::fail_at(int line, const std::string &message) const {
    const std::string where = name_.empty() ? "" : "[" + name_ + "] ";
    throw ScenarioError(source_ + ":" + std::to_string(line) + ": " + where + message);
}

}  // namespace velkhost::scenario

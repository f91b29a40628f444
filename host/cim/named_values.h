// Values by name, in the order in which they were given: keys, properties, arguments.
#pragma once

#include "host/cim/value.h"

#include <cstddef>
#include <initializer_list>
#include <string>
#include <string_view>
#include <vector>

namespace velkhost::cim {

struct NamedValue {
    std::string name;
    Value value;
};

class NamedValues {
  public:
    NamedValues() = default;
    NamedValues(std::initializer_list<NamedValue> items);

    // Adds the value, or replaces the one of that name, which keeps its place and spelling.
    void set(std::string_view name, Value value);

    // Null when there is none of that name. The pointer holds until the next change.
    [[nodiscard]] const Value *find(std::string_view name) const;

    template <class Predicate>
    void erase_if(Predicate predicate) {
        std::erase_if(items_, predicate);
    }

    [[nodiscard]] std::size_t size() const { return items_.size(); }
    [[nodiscard]] bool empty() const { return items_.empty(); }
    [[nodiscard]] const NamedValue &operator[](std::size_t index) const { return items_[index]; }
    [[nodiscard]] auto begin() const { return items_.begin(); }
    [[nodiscard]] auto end() const { return items_.end(); }

    // Same names with equal values, in any order.
    bool operator==(const NamedValues &other) const;

  private:
    std::vector<NamedValue> items_;
};

// For people: `Name=value` after each other with `separator` between.
std::string to_text(const NamedValues &values, std::string_view separator = ", ");

}  // namespace velkhost::cim

#include "host/cim/named_values.h"

#include "host/cim/names.h"

#include <algorithm>
#include <utility>

namespace velkhost::cim {
namespace {

template <class Items>
auto locate(Items &items, std::string_view name) {
    return std::find_if(items.begin(), items.end(),
                        [name](const NamedValue &item) { return same_name(item.name, name); });
}

}  // namespace

NamedValues::NamedValues(std::initializer_list<NamedValue> items) {
    for (const NamedValue &item : items) {
        set(item.name, item.value);
    }
}

void NamedValues::set(std::string_view name, Value value) {
    const auto place = locate(items_, name);
    if (place == items_.end()) {
        items_.push_back({std::string(name), std::move(value)});
    } else {
        place->value = std::move(value);
    }
}

const Value *NamedValues::find(std::string_view name) const {
    const auto place = locate(items_, name);
    return place == items_.end() ? nullptr : &place->value;
}

bool NamedValues::operator==(const NamedValues &other) const {
    return size() == other.size() && std::all_of(begin(), end(), [&other](const NamedValue &item) {
               const Value *twin = other.find(item.name);
               return twin != nullptr && *twin == item.value;
           });
}

std::string to_text(const NamedValues &values, std::string_view separator) {
    std::string text;
    for (const NamedValue &item : values) {
        text += text.empty() ? "" : separator;
        text += item.name + '=' + to_text(item.value);
    }
    return text;
}

}  // namespace velkhost::cim

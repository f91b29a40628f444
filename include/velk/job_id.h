// Job instance ids: a text, a "-" and a decimal number, such as "VELK-7".
#pragma once

#include <charconv>
#include <optional>
#include <string_view>

namespace velk {

// The number after the first "-" (0 where no number follows); no value for an id without a "-".
inline std::optional<int> job_number(std::string_view instance_id) {
    const std::size_t dash = instance_id.find('-');
    if (dash == std::string_view::npos) {
        return std::nullopt;
    }
    int number = 0;
    std::from_chars(instance_id.data() + dash + 1, instance_id.data() + instance_id.size(), number);
    return number;
}

}  // namespace velk

// Scenarios out of texts, for tests of their reading.
#pragma once

#include "host/scenario/reader.h"

#include <string>
#include <string_view>

namespace velkhost::scenario {

inline Description parse(std::string_view text) {
    return parse_description(text, "s.toml");
}

// What is wrong with the text; "no error" where nothing is.
inline std::string error_of(std::string_view text) {
    try {
        parse(text);
    } catch (const ScenarioError &error) {
        return error.what();
    }
    return "no error";
}

}  // namespace velkhost::scenario

// The values that a MOF states: in initialisers, in qualifiers.
#pragma once

#include "host/cim/class_decl.h"
#include "host/mof/token_stream.h"

#include <cstddef>
#include <optional>
#include <string>
#include <vector>

namespace velkhost::mof {

// What stands behind '=' or in a qualifier: one value or a list in braces. Adjacent strings are
// one value. `null` is its own case, and is no element of a list: an element has a text here.
struct Initialiser {
    Position position;
    bool list = false;
    std::vector<Token> values;  // empty: null, or an empty list

    [[nodiscard]] bool is_null() const { return !list && values.empty(); }
};

Initialiser read_value(TokenStream &in);
Initialiser read_list(TokenStream &in);
Initialiser read_initialiser(TokenStream &in);  // either

// The texts of the initialiser's values: strings decoded, integers in decimal, booleans in lower
// case, reals as they stand.
std::vector<std::string> texts_of(const Initialiser &initialiser);

// The same for a property or qualifier of that type, no value for null. What is no value of the
// type is reported to `in`.
std::optional<std::vector<std::string>> texts_of(const Initialiser &initialiser, CMPIType type,
                                                 TokenStream &in);

}  // namespace velkhost::mof

// Entering a name that must be new.
#pragma once

#include "host/mof/token_stream.h"
#include "host/mof/unit.h"

#include <string_view>

namespace velkhost::mof {

// Enters the name; if it is taken, reports "expected a new `what`, found 'name' (declared at ...)"
// and returns false.
bool declare_new(NameTable &table, const Token &name, std::string_view what, TokenStream &in);

}  // namespace velkhost::mof

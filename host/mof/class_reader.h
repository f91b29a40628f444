// Class declarations.
#pragma once

#include "host/mof/qualifiers.h"
#include "host/mof/token_stream.h"
#include "host/mof/unit.h"

#include <vector>

namespace velkhost::mof {

// Reads a class from its keyword on and adds it to the unit. Errors inside a member do not end the
// reading; one in the head does (SyntaxError).
void read_class(TokenStream &in, Unit &unit, std::vector<QualifierUse> qualifiers);

}  // namespace velkhost::mof

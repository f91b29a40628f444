// Qualifier declarations, and qualifier lists in front of what they qualify.
#pragma once

#include "host/mof/token_stream.h"
#include "host/mof/unit.h"

#include <vector>

namespace velkhost::mof {

// A qualifier that was read before it is known what it stands on.
struct QualifierUse {
    cim::Qualifier qualifier;
    Position position;
};

// Reads "Qualifier Name : type = default, Scope(...), Flavor(...);" into the unit.
void read_qualifier_declaration(TokenStream &in, Unit &unit);

// Reads a list in brackets, if there is one. The values of a declared qualifier are checked
// against its type; one without a declaration is taken as it stands. A bare qualifier is "true",
// or null where its declared type is not boolean.
std::vector<QualifierUse> read_qualifiers(TokenStream &in, const Unit &unit);

// The qualifiers of an element of that scope; those that must not stand there are reported.
// `scopes` has several bits for a class, which may be more than one kind of class.
std::vector<cim::Qualifier> attach_qualifiers(std::vector<QualifierUse> uses, unsigned scopes,
                                              TokenStream &in, const Unit &unit);

}  // namespace velkhost::mof

// The members of a class: properties, references and methods with their parameters.
#pragma once

#include "host/mof/qualifiers.h"
#include "host/mof/token_stream.h"
#include "host/mof/unit.h"

#include <vector>

namespace velkhost::mof {

// Reads members into a class, one per call. Lives while that class is read.
class MemberReader {
  public:
    MemberReader(TokenStream &in, const Unit &unit, cim::ClassDecl &owner)
        : in_(in), unit_(unit), owner_(owner) {}

    // Reads one member from its type on to behind its ';'.
    void read(std::vector<QualifierUse> qualifiers);

  private:
    // What a property, a method and a parameter begin with.
    struct Head {
        cim::TypeDecl type;
        Token name;
    };

    Head read_head();
    void read_property(Head head, std::vector<QualifierUse> qualifiers);
    void read_method(Head head, std::vector<QualifierUse> qualifiers);
    void read_parameter(cim::MethodDecl &method, NameTable &names);

    TokenStream &in_;
    const Unit &unit_;
    cim::ClassDecl &owner_;
    NameTable properties_;
    NameTable methods_;
};

}  // namespace velkhost::mof

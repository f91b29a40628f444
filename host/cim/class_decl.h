// A CIM class as its MOF declares it: what the compiler in host/mof produces and what the broker's
// class repository holds. Inherited members are not repeated here; the repository merges them.
#pragma once

#include <cmpi/cmpidt.h>

#include <optional>
#include <string>
#include <vector>

namespace velkhost::cim {

// One qualifier (DSP0004, 5.6.1), its value as text: strings without quotes and escapes, integers
// in decimal, booleans as "true" or "false". A bare qualifier such as [Key] has the single value
// "true"; an array initialiser has one entry per element; null has none.
struct Qualifier {
    std::string name;
    std::vector<std::string> values;
    // As the qualifier is declared, with CMPI_ARRAY for arrays; CMPI_null: it is not declared.
    CMPIType type = CMPI_null;
};

// A declared type: `type` is a CMPI type code with CMPI_ARRAY set for arrays; `reference_class`
// is filled for CMPI_ref alone.
struct TypeDecl {
    CMPIType type = CMPI_null;
    std::string reference_class;
};

struct PropertyDecl {
    std::string name;
    TypeDecl type;
    std::vector<Qualifier> qualifiers;
    // The initialiser as text (see Qualifier), one entry per element; no value means the property
    // starts null.
    std::optional<std::vector<std::string>> default_value;

    [[nodiscard]] bool is_key() const;
};

struct ParameterDecl {
    std::string name;
    TypeDecl type;
    std::vector<Qualifier> qualifiers;

    // [In] is the default (DSP0004, 5.6.3.22); [Out] is false unless stated.
    [[nodiscard]] bool is_in() const;
    [[nodiscard]] bool is_out() const;
};

struct MethodDecl {
    std::string name;
    TypeDecl return_type;
    std::vector<ParameterDecl> parameters;
    std::vector<Qualifier> qualifiers;
};

struct ClassDecl {
    std::string name;
    std::string superclass;  // empty for a root class
    std::vector<Qualifier> qualifiers;
    std::vector<PropertyDecl> properties;
    std::vector<MethodDecl> methods;

    [[nodiscard]] bool is_association() const;
    [[nodiscard]] bool is_abstract() const;
};

// The qualifier of that name (names ignore case, DSP0004 5.2.1), or nullptr.
const Qualifier *find_qualifier(const std::vector<Qualifier> &qualifiers, const std::string &name);

}  // namespace velkhost::cim

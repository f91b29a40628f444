#include "host/mof/qualifiers.h"

#include "host/mof/declare.h"
#include "host/mof/intrinsic_types.h"
#include "host/mof/values.h"

#include <algorithm>
#include <array>
#include <string>
#include <utility>

namespace velkhost::mof {
namespace {

struct ScopeName {
    std::string_view name;
    Scope scope;
};

constexpr std::array<ScopeName, 9> kScopeNames = {{
    {"class", kScopeClass},
    {"association", kScopeAssociation},
    {"indication", kScopeIndication},
    {"property", kScopeProperty},
    {"reference", kScopeReference},
    {"method", kScopeMethod},
    {"parameter", kScopeParameter},
    {"qualifier", kScopeQualifier},
    {"any", kScopeAny},
}};

// A flavor that sets nothing is known and without effect.
struct FlavorName {
    std::string_view name;
    bool Flavors::*flag;
    bool value;
};

constexpr std::array<FlavorName, 6> kFlavorNames = {{
    {"EnableOverride", &Flavors::overridable, true},
    {"DisableOverride", &Flavors::overridable, false},
    {"ToSubclass", &Flavors::to_subclass, true},
    {"Restricted", &Flavors::to_subclass, false},
    {"Translatable", &Flavors::translatable, true},
    {"ToInstance", nullptr, true},
}};

// The row of the table that the next token names, which is then taken.
template <typename Table>
const typename Table::value_type &read_row(TokenStream &in, const Table &table,
                                           std::string_view what) {
    const auto *const row = std::find_if(table.begin(), table.end(),
                                         [&in](const auto &each) { return in.at_word(each.name); });
    if (row == table.end()) {
        in.fail(what);
    }
    in.take();
    return *row;
}

void read_flavor(TokenStream &in, Flavors &flavors) {
    const FlavorName &flavor = read_row(in, kFlavorNames, "a qualifier flavor");
    if (flavor.flag != nullptr) {
        flavors.*flavor.flag = flavor.value;
    }
}

CMPIType read_declared_type(TokenStream &in) {
    in.expect(':', "before the type of the qualifier");
    const IntrinsicType *type =
        in.peek().kind == TokenKind::kIdentifier ? find_intrinsic(in.peek().spelling) : nullptr;
    if (type == nullptr) {
        in.fail("an intrinsic type");
    }
    in.take();
    if (!in.accept('[')) {
        return type->type;
    }
    in.expect(']', "after '[' in the type of a qualifier");
    return array_of(type->type);
}

unsigned read_scopes(TokenStream &in) {
    in.expect(',', "before the scope of the qualifier");
    in.expect_word("scope", "of the qualifier");
    in.expect('(', "after 'scope'");
    unsigned scopes = 0;
    do {
        scopes |= read_row(in, kScopeNames, "a kind of CIM element").scope;
    } while (in.accept(','));
    in.expect(')', "or ',' in a scope");
    return scopes;
}

Flavors read_declared_flavors(TokenStream &in) {
    Flavors flavors;
    if (!in.accept(',')) {
        return flavors;
    }
    in.expect_word("flavor", "of the qualifier");
    in.expect('(', "after 'flavor'");
    do {
        read_flavor(in, flavors);
    } while (in.accept(','));
    in.expect(')', "or ',' in a flavor");
    return flavors;
}

// The value in parentheses or braces, if any.
std::optional<Initialiser> read_parameter(TokenStream &in) {
    if (in.at('{')) {
        return read_list(in);
    }
    if (!in.accept('(')) {
        return std::nullopt;
    }
    Initialiser value = read_value(in);
    in.expect(')', "after the value of a qualifier");
    return value;
}

std::vector<std::string> values_of(const std::optional<Initialiser> &parameter,
                                   const QualifierDecl *declared, TokenStream &in) {
    if (!parameter) {
        const bool boolean = declared == nullptr || declared->type == CMPI_boolean;
        return boolean ? std::vector<std::string>{"true"} : std::vector<std::string>{};
    }
    if (declared == nullptr) {
        return texts_of(*parameter);
    }
    return texts_of(*parameter, declared->type, in).value_or(std::vector<std::string>{});
}

// The flavors of a single use are checked and dropped: the declaration's are what holds.
void skip_flavors(TokenStream &in) {
    if (!in.accept(':')) {
        return;
    }
    Flavors ignored;
    do {
        read_flavor(in, ignored);
    } while (in.peek().kind == TokenKind::kIdentifier);
}

QualifierUse read_qualifier(TokenStream &in, const Unit &unit, NameTable &seen) {
    const Token name = in.expect(TokenKind::kIdentifier, "a qualifier name");
    declare_new(seen, name, "qualifier of this list", in);
    const auto parameter = read_parameter(in);
    QualifierUse use{{std::string{name.spelling}, {}}, name.position};
    const QualifierDecl *const declared = unit.find_qualifier(name.spelling);
    use.qualifier.values = values_of(parameter, declared, in);
    use.qualifier.type = declared != nullptr ? declared->type : CMPI_null;
    skip_flavors(in);
    return use;
}

std::string names_of(unsigned scopes) {
    std::string names;
    for (const ScopeName &each : kScopeNames) {
        const bool named = (scopes & each.scope) == each.scope;
        if (named && each.scope != kScopeAny) {
            names += (names.empty() ? "" : " or ") + std::string{each.name};
        }
    }
    return names;
}

}  // namespace

void read_qualifier_declaration(TokenStream &in, Unit &unit) {
    in.expect_word("qualifier", "to declare one");
    const Token name = in.expect(TokenKind::kIdentifier, "a qualifier name");
    QualifierDecl declared;
    declared.name = name.spelling;
    declared.type = read_declared_type(in);
    if (in.accept('=')) {
        declared.default_value = texts_of(read_initialiser(in), declared.type, in);
    }
    declared.scopes = read_scopes(in);
    declared.flavors = read_declared_flavors(in);
    in.expect(';', "after a qualifier declaration");
    if (declare_new(unit.qualifiers, name, "qualifier", in)) {
        unit.result.qualifiers.push_back(std::move(declared));
    }
}

std::vector<QualifierUse> read_qualifiers(TokenStream &in, const Unit &unit) {
    std::vector<QualifierUse> uses;
    if (!in.accept('[')) {
        return uses;
    }
    NameTable seen;
    do {
        uses.push_back(read_qualifier(in, unit, seen));
    } while (in.accept(','));
    in.expect(']', "or ',' in a list of qualifiers");
    return uses;
}

std::vector<cim::Qualifier> attach_qualifiers(std::vector<QualifierUse> uses, unsigned scopes,
                                              TokenStream &in, const Unit &unit) {
    std::vector<cim::Qualifier> attached;
    for (QualifierUse &use : uses) {
        const QualifierDecl *declared = unit.find_qualifier(use.qualifier.name);
        if (declared != nullptr && (declared->scopes & scopes) == 0) {
            in.report(use.position, "expected a qualifier for a " + names_of(scopes) + ", found " +
                                        shown(use.qualifier.name));
        }
        attached.push_back(std::move(use.qualifier));
    }
    return attached;
}

}  // namespace velkhost::mof

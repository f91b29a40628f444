#include "host/mof/class_reader.h"

#include "host/mof/declare.h"
#include "host/mof/member_reader.h"

#include <string>
#include <utility>

namespace velkhost::mof {
namespace {

constexpr unsigned kClassScopes = kScopeClass | kScopeAssociation | kScopeIndication;

// The keyword of a class inside a class: a closing brace was forgotten.
bool at_next_class(const TokenStream &in) {
    return in.at_word("class");
}

std::string read_superclass(TokenStream &in, const Unit &unit) {
    if (!in.accept(':')) {
        return {};
    }
    const Token name = in.expect(TokenKind::kIdentifier, "the name of the superclass");
    if (unit.classes.find(name.spelling) == nullptr) {
        in.report(name.position,
                  "expected a superclass that is declared before, found " + describe(name));
    }
    return std::string{name.spelling};
}

void read_members(TokenStream &in, const Unit &unit, cim::ClassDecl &declared) {
    MemberReader reader{in, unit, declared};
    while (!in.at('}') && !in.at_end()) {
        try {
            auto qualifiers = read_qualifiers(in, unit);
            if (at_next_class(in)) {
                return;
            }
            reader.read(std::move(qualifiers));
        } catch (const SyntaxError &) {
            in.skip_member();
        }
    }
}

void read_end(TokenStream &in, const std::string &name) {
    if (!in.at('}')) {
        in.complain("'}' at the end of class " + shown(name));
        in.leave_braces();
        return;
    }
    in.take();
    if (!in.accept(';')) {
        in.complain("';' after class " + shown(name));
    }
}

}  // namespace

void read_class(TokenStream &in, Unit &unit, std::vector<QualifierUse> qualifiers) {
    in.expect_word("class", "to declare one");
    const Token name = in.expect(TokenKind::kIdentifier, "a class name");
    cim::ClassDecl declared;
    declared.name = name.spelling;
    declared.qualifiers = attach_qualifiers(std::move(qualifiers), kClassScopes, in, unit);
    declared.superclass = read_superclass(in, unit);
    // Entered before its members are read, so that an error in one of them does not make the
    // subclasses of this class look wrong, too.
    const bool is_new = declare_new(unit.classes, name, "class", in);
    in.expect('{', "to begin the members of class " + shown(declared.name));
    read_members(in, unit, declared);
    read_end(in, declared.name);
    if (is_new) {
        unit.result.classes.push_back(std::move(declared));
    }
}

}  // namespace velkhost::mof

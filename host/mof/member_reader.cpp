#include "host/mof/member_reader.h"

#include "host/mof/declare.h"
#include "host/mof/intrinsic_types.h"
#include "host/mof/values.h"

#include <optional>
#include <string>
#include <utility>

namespace velkhost::mof {
namespace {

bool is_reference(const cim::TypeDecl &type) {
    return element_of(type.type) == CMPI_ref;
}

// "uint8" or "CIM_Thing REF"
cim::TypeDecl read_type(TokenStream &in) {
    const Token name = in.expect(TokenKind::kIdentifier, "a type");
    const IntrinsicType *intrinsic = find_intrinsic(name.spelling);
    if (in.accept_word("ref")) {
        if (intrinsic != nullptr) {
            in.report(name.position, "expected a class name before REF, found " + describe(name));
        }
        return {CMPI_ref, std::string{name.spelling}};
    }
    if (intrinsic == nullptr) {
        in.report(name.position,
                  "expected an intrinsic type or a class name with REF, found " + describe(name));
        throw SyntaxError{};
    }
    return {intrinsic->type, {}};
}

// "[]" or "[n]" behind a name makes the type an array; the result is n.
std::optional<std::uint64_t> read_array_suffix(TokenStream &in, cim::TypeDecl &type) {
    if (!in.accept('[')) {
        return std::nullopt;
    }
    type.type = array_of(type.type);
    std::optional<std::uint64_t> size;
    const Token &next = in.peek();
    if (next.kind == TokenKind::kInteger && !next.negative && next.magnitude > 0) {
        size = in.take().magnitude;
    } else if (!in.at(']')) {
        in.fail("the size of an array or ']'");
    }
    in.expect(']', "after the size of an array");
    return size;
}

}  // namespace

void MemberReader::read(std::vector<QualifierUse> qualifiers) {
    Head head = read_head();
    if (in_.at('(')) {
        read_method(std::move(head), std::move(qualifiers));
    } else {
        read_property(std::move(head), std::move(qualifiers));
    }
}

MemberReader::Head MemberReader::read_head() {
    cim::TypeDecl type = read_type(in_);
    return {std::move(type), in_.expect(TokenKind::kIdentifier, "a name behind the type")};
}

void MemberReader::read_property(Head head, std::vector<QualifierUse> qualifiers) {
    cim::PropertyDecl property;
    property.name = head.name.spelling;
    property.type = std::move(head.type);
    const Scope scope = is_reference(property.type) ? kScopeReference : kScopeProperty;
    property.qualifiers = attach_qualifiers(std::move(qualifiers), scope, in_, unit_);
    const auto size = read_array_suffix(in_, property.type);
    if (property.type.type == CMPI_refA) {
        in_.report(head.name.position,
                   "expected a single reference, found the array " + describe(head.name));
    }
    if (in_.accept('=')) {
        const Initialiser value = read_initialiser(in_);
        property.default_value = texts_of(value, property.type.type, in_);
        if (size && value.values.size() > *size) {
            in_.report(value.position, "expected at most " + std::to_string(*size) +
                                           " values, found " + std::to_string(value.values.size()));
        }
    }
    in_.expect(';', "after property " + shown(property.name));
    if (declare_new(properties_, head.name, "property of this class", in_)) {
        owner_.properties.push_back(std::move(property));
    }
}

void MemberReader::read_method(Head head, std::vector<QualifierUse> qualifiers) {
    cim::MethodDecl method;
    method.name = head.name.spelling;
    if (is_reference(head.type)) {
        in_.report(head.name.position,
                   "expected a method with an intrinsic return type, found a reference");
    }
    method.return_type = std::move(head.type);
    method.qualifiers = attach_qualifiers(std::move(qualifiers), kScopeMethod, in_, unit_);
    in_.expect('(', "before the parameters of a method");
    NameTable names;
    if (!in_.at(')')) {
        do {
            read_parameter(method, names);
        } while (in_.accept(','));
    }
    in_.expect(')', "or ',' in the parameters of method " + shown(method.name));
    in_.expect(';', "after method " + shown(method.name));
    if (declare_new(methods_, head.name, "method of this class", in_)) {
        owner_.methods.push_back(std::move(method));
    }
}

void MemberReader::read_parameter(cim::MethodDecl &method, NameTable &names) {
    auto qualifiers = read_qualifiers(in_, unit_);
    Head head = read_head();
    cim::ParameterDecl parameter;
    parameter.name = head.name.spelling;
    parameter.type = std::move(head.type);
    read_array_suffix(in_, parameter.type);
    parameter.qualifiers = attach_qualifiers(std::move(qualifiers), kScopeParameter, in_, unit_);
    if (declare_new(names, head.name, "parameter of this method", in_)) {
        method.parameters.push_back(std::move(parameter));
    }
}

}  // namespace velkhost::mof

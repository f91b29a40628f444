#include "host/mof/values.h"

#include "host/cim/names.h"
#include "host/mof/intrinsic_types.h"

#include <algorithm>
#include <charconv>
#include <utility>

namespace velkhost::mof {
namespace {

bool is_boolean(const Token &token) {
    return token.kind == TokenKind::kIdentifier &&
           (cim::same_name(token.spelling, "true") || cim::same_name(token.spelling, "false"));
}

bool is_literal(const Token &token) {
    switch (token.kind) {
        case TokenKind::kInteger:
        case TokenKind::kReal:
        case TokenKind::kString:
        case TokenKind::kCharacter:
            return true;
        default:
            return is_boolean(token);
    }
}

Token read_literal(TokenStream &in) {
    if (!is_literal(in.peek())) {
        in.fail("a value");
    }
    Token literal = in.take();
    while (literal.kind == TokenKind::kString && in.peek().kind == TokenKind::kString) {
        const Token more = in.take();
        literal.text += more.text;
        literal.damaged = literal.damaged || more.damaged;
    }
    return literal;
}

std::string text_of(const Token &literal) {
    switch (literal.kind) {
        case TokenKind::kInteger:
            return (literal.negative && literal.magnitude != 0 ? "-" : "") +
                   std::to_string(literal.magnitude);
        case TokenKind::kReal:
            return literal.text.substr(literal.text.front() == '+' ? 1 : 0);
        case TokenKind::kIdentifier:
            return cim::same_name(literal.spelling, "true") ? "true" : "false";
        default:
            return literal.text;
    }
}

bool fits_integer(const Token &literal, const IntrinsicType &type) {
    return literal.kind == TokenKind::kInteger &&
           literal.magnitude <= (literal.negative ? type.max_negative : type.max_magnitude);
}

bool fits_real(const Token &literal, const IntrinsicType &type) {
    if (literal.kind != TokenKind::kReal) {
        return literal.kind == TokenKind::kInteger;
    }
    if (type.type == CMPI_real64) {
        return true;  // as every real literal
    }
    const std::string text = text_of(literal);
    float value = 0;
    return std::from_chars(text.data(), text.data() + text.size(), value).ec == std::errc{};
}

bool fits(const Token &literal, const IntrinsicType &type) {
    switch (type.takes) {
        case ValueClass::kBoolean:
            return is_boolean(literal);
        case ValueClass::kInteger:
            return fits_integer(literal, type);
        case ValueClass::kReal:
            return fits_real(literal, type);
        case ValueClass::kCharacter:
            return literal.kind == TokenKind::kCharacter;
        case ValueClass::kDateTime:
            return literal.kind == TokenKind::kString && is_date_time(literal.text);
        case ValueClass::kText:
            break;
    }
    return literal.kind == TokenKind::kString;
}

}  // namespace

Initialiser read_value(TokenStream &in) {
    Initialiser result{in.peek().position, false, {}};
    if (!in.accept_word("null")) {
        result.values.push_back(read_literal(in));
    }
    return result;
}

Initialiser read_list(TokenStream &in) {
    Initialiser result{in.peek().position, true, {}};
    in.expect('{', "to begin a list of values");
    if (in.accept('}')) {
        return result;
    }
    do {
        result.values.push_back(read_literal(in));
    } while (in.accept(','));
    in.expect('}', "or ',' in a list of values");
    return result;
}

Initialiser read_initialiser(TokenStream &in) {
    return in.at('{') ? read_list(in) : read_value(in);
}

std::vector<std::string> texts_of(const Initialiser &initialiser) {
    std::vector<std::string> texts(initialiser.values.size());
    std::transform(initialiser.values.begin(), initialiser.values.end(), texts.begin(), text_of);
    return texts;
}

std::optional<std::vector<std::string>> texts_of(const Initialiser &initialiser, CMPIType type,
                                                 TokenStream &in) {
    if (initialiser.is_null()) {
        return std::nullopt;
    }
    if (initialiser.list != is_array(type)) {
        in.report(initialiser.position, is_array(type)
                                            ? "expected a list of values in braces, found one value"
                                            : "expected one value, found a list of values");
        return std::nullopt;
    }
    const IntrinsicType &element = intrinsic_of(type);
    for (const Token &literal : initialiser.values) {
        if (!literal.damaged && !fits(literal, element)) {
            in.report(literal.position,
                      "expected " + expectation(element) + ", found " + describe(literal));
        }
    }
    return texts_of(initialiser);
}

}  // namespace velkhost::mof

#include "host/mof/token_stream.h"

#include "host/cim/names.h"

#include <utility>

namespace velkhost::mof {
namespace {

std::string quoted_with(std::string_view token, std::string_view where) {
    return "'" + std::string{token} + "' " + std::string{where};
}

}  // namespace

bool TokenStream::at(char punctuation) const {
    return next_.kind == TokenKind::kPunctuation && next_.spelling.front() == punctuation;
}

bool TokenStream::at_word(std::string_view keyword) const {
    return next_.kind == TokenKind::kIdentifier && cim::same_name(next_.spelling, keyword);
}

Token TokenStream::take() {
    if (at('{')) {
        ++depth_;
    } else if (at('}') && depth_ > 0) {
        --depth_;
    }
    after_damage_ = next_.damaged;
    return std::exchange(next_, lexer_.next());
}

bool TokenStream::accept(char punctuation) {
    const bool found = at(punctuation);
    if (found) {
        take();
    }
    return found;
}

bool TokenStream::accept_word(std::string_view keyword) {
    const bool found = at_word(keyword);
    if (found) {
        take();
    }
    return found;
}

Token TokenStream::expect(TokenKind kind, std::string_view what) {
    if (next_.kind != kind) {
        fail(what);
    }
    return take();
}

void TokenStream::expect(char punctuation, std::string_view where) {
    if (!accept(punctuation)) {
        fail(quoted_with({&punctuation, 1}, where));
    }
}

void TokenStream::expect_word(std::string_view keyword, std::string_view where) {
    if (!accept_word(keyword)) {
        fail(quoted_with(keyword, where));
    }
}

void TokenStream::complain(std::string_view expected) {
    // A token that is none, or the one behind it, is only the echo of an error already told.
    if (after_damage_ || next_.damaged) {
        return;
    }
    errors_.add(next_.position, "expected " + std::string{expected} + ", found " + describe(next_));
}

void TokenStream::fail(std::string_view expected) {
    complain(expected);
    throw SyntaxError{};
}

void TokenStream::skip_member() {
    // No ';' ever stands inside an initialiser, so it ends the member whatever braces are open.
    while (!at_end() && !at(';') && !(at('}') && depth_ <= 1)) {
        take();
    }
    if (accept(';')) {
        depth_ = 1;
    }
}

void TokenStream::skip_declaration() {
    while (!at_end() && !(at(';') && depth_ == 0)) {
        take();
    }
    accept(';');
}

}  // namespace velkhost::mof

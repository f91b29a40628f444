// The parser's hold on the tokens of one source: one token of look-ahead, expectations, and the
// way back to solid ground after an error.
#pragma once

#include "host/mof/lexer.h"

#include <string>
#include <string_view>

namespace velkhost::mof {

class TokenStream {
  public:
    // The lifetimes are those of Lexer.
    TokenStream(std::string_view source, std::string_view file, ErrorList &errors)
        : lexer_(source, file, errors), errors_(errors), next_(lexer_.next()) {}

    [[nodiscard]] const Token &peek() const { return next_; }
    [[nodiscard]] bool at(char punctuation) const;
    [[nodiscard]] bool at_word(std::string_view keyword) const;
    [[nodiscard]] bool at_end() const { return next_.kind == TokenKind::kEnd; }

    Token take();

    // Takes the token if it is the one asked for; false leaves it.
    bool accept(char punctuation);
    bool accept_word(std::string_view keyword);

    // Take what must come next. Otherwise SyntaxError, reported as "expected `what`, found ...".
    Token expect(TokenKind kind, std::string_view what);
    void expect(char punctuation, std::string_view where);
    void expect_word(std::string_view keyword, std::string_view where);

    // Reports that the next token is not what was expected.
    void complain(std::string_view expected);
    [[noreturn]] void fail(std::string_view expected);

    // Reports an error of meaning at a place already passed.
    void report(const Position &position, std::string text) {
        errors_.add(position, std::move(text));
    }

    // After an error inside a class: to behind the next ';', or to the brace that ends the class.
    void skip_member();

    // After an error outside: to behind the ';' that ends the declaration with its braces.
    void skip_declaration();

    // Declares that the open class is given up, so that what follows counts as outside of it.
    void leave_braces() { depth_ = 0; }

  private:
    Lexer lexer_;
    ErrorList &errors_;
    Token next_;
    bool after_damage_ = false;
    int depth_ = 0;  // open braces
};

}  // namespace velkhost::mof

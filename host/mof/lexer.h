// Cuts a MOF source into tokens, one at a time. Comments and blanks go unseen.
#pragma once

#include "host/mof/cursor.h"
#include "host/mof/diagnostics.h"
#include "host/mof/token.h"

#include <string_view>

namespace velkhost::mof {

// The source, the file's name and the error list must outlive the lexer; the source and the name
// its tokens, too.
class Lexer {
  public:
    Lexer(std::string_view source, std::string_view file, ErrorList &errors)
        : cursor_(source, file), errors_(errors) {}

    // The next token; kEnd at the end of the source, for ever, and once the error list is closed.
    // Whatever cannot be a token is reported; damaged literals are still returned as literals.
    Token next();

  private:
    void skip_unseen();
    void skip_block_comment();
    void report_stray_character();
    [[nodiscard]] Token begin(TokenKind kind) const;
    Token identifier();
    Token number();
    Token string();
    Token character();
    Token punctuation();

    Cursor cursor_;
    ErrorList &errors_;
};

}  // namespace velkhost::mof

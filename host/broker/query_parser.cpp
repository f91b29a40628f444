// From query text to expression tree.
#include "host/broker/query.h"
#include "host/cim/names.h"

#include <algorithm>
#include <array>
#include <cctype>
#include <utility>

namespace velkhost::broker::query {
namespace {

// Deeper nesting is refused, so that no query can exhaust the stack.
constexpr int kMaxDepth = 100;

struct Token {
    enum class Kind { kEnd, kName, kNumber, kText, kSign, kBad };
    Kind kind = Kind::kEnd;
    std::string text;
};

bool is_name_letter(char letter) {
    return std::isalnum(static_cast<unsigned char>(letter)) != 0 || letter == '_' || letter == '.';
}

class Lexer {
  public:
    explicit Lexer(std::string_view text) : rest_(text) {}

    Token next() {
        while (!rest_.empty() && std::isspace(static_cast<unsigned char>(rest_.front())) != 0) {
            rest_.remove_prefix(1);
        }
        if (rest_.empty()) {
            return {};
        }
        const char first = rest_.front();
        if (first == '\'' || first == '"') {
            return text(first);
        }
        if (std::isdigit(static_cast<unsigned char>(first)) != 0 || first == '-' || first == '+') {
            std::string number = take(1);
            number += take_while(is_name_letter);
            return {Token::Kind::kNumber, std::move(number)};
        }
        if (is_name_letter(first)) {
            return {Token::Kind::kName, take_while(is_name_letter)};
        }
        const bool two = rest_.starts_with("<>") || rest_.starts_with("!=") ||
                         rest_.starts_with("<=") || rest_.starts_with(">=");
        return {Token::Kind::kSign, take(two ? 2 : 1)};
    }

  private:
    std::string take(std::size_t count) {
        std::string taken(rest_.substr(0, count));
        rest_.remove_prefix(taken.size());
        return taken;
    }

    template <class Predicate>
    std::string take_while(Predicate predicate) {
        const auto *end = std::find_if_not(rest_.begin(), rest_.end(), predicate);
        return take(static_cast<std::size_t>(end - rest_.begin()));
    }

    // Without its quotes; a backslash takes the next character as it is.
    Token text(char quote) {
        take(1);
        std::string content;
        while (!rest_.empty() && rest_.front() != quote) {
            if (rest_.front() == '\\' && rest_.size() > 1) {
                take(1);
            }
            content += take(1);
        }
        const bool closed = !rest_.empty();
        take(1);
        return {closed ? Token::Kind::kText : Token::Kind::kBad, content};
    }

    std::string_view rest_;
};

struct OperatorRow {
    std::string_view spelling;
    CMPIPredOp op;
};
constexpr std::array kOperators{
    OperatorRow{"=", CMPI_PredOp_Equals},
    OperatorRow{"<>", CMPI_PredOp_NotEquals},
    OperatorRow{"!=", CMPI_PredOp_NotEquals},
    OperatorRow{"<", CMPI_PredOp_LessThan},
    OperatorRow{">=", CMPI_PredOp_GreaterThanOrEquals},
    OperatorRow{">", CMPI_PredOp_GreaterThan},
    OperatorRow{"<=", CMPI_PredOp_LessThanOrEquals},
    OperatorRow{"isa", CMPI_PredOp_Isa},
    OperatorRow{"like", CMPI_PredOp_Like},
};

class Parser {
  public:
    explicit Parser(std::string_view text) : text_(text), lexer_(text) { advance(); }

    Parsed run() {
        auto query = std::make_shared<Query>();
        query->text = text_;
        expect_word("SELECT");
        read_selected(*query);
        expect_word("FROM");
        query->class_name = expect_name();
        if (accept_word("WHERE")) {
            query->where = disjunction(0);
        }
        if (current_.kind != Token::Kind::kEnd) {
            fail("the end");
        }
        if (!error_.empty()) {
            return {nullptr, CMPI_RC_ERR_INVALID_QUERY, error_};
        }
        return {std::move(query), CMPI_RC_OK, ""};
    }

  private:
    void advance() { current_ = lexer_.next(); }

    void fail(std::string_view expected) {
        if (error_.empty()) {
            error_ = "expected " + std::string(expected) +
                     (current_.text.empty() ? "" : " instead of \"" + current_.text + '"');
        }
        current_ = {};  // nothing more is read
    }

    bool accept(Token::Kind kind, std::string_view text) {
        const bool here = current_.kind == kind && cim::same_name(current_.text, text);
        if (here) {
            advance();
        }
        return here;
    }
    bool accept_word(std::string_view word) { return accept(Token::Kind::kName, word); }
    bool accept_sign(std::string_view sign) { return accept(Token::Kind::kSign, sign); }

    void expect_word(std::string_view word) {
        if (!accept_word(word)) {
            fail(word);
        }
    }

    std::string expect_name() {
        if (current_.kind != Token::Kind::kName) {
            fail("a name");
            return {};
        }
        std::string name = std::move(current_.text);
        advance();
        return name;
    }

    void read_selected(Query &query) {
        if (accept_sign("*")) {
            return;
        }
        do {
            query.selected.push_back(expect_name());
        } while (accept_sign(","));
    }

    static ExpressionPointer join(Expression::Kind kind, ExpressionPointer left,
                                  ExpressionPointer right) {
        return std::make_unique<const Expression>(
            Expression{kind, {}, std::move(left), std::move(right)});
    }

    ExpressionPointer disjunction(int depth) {
        ExpressionPointer left = conjunction(depth);
        while (accept_word("OR")) {
            left = join(Expression::Kind::kOr, std::move(left), conjunction(depth));
        }
        return left;
    }

    ExpressionPointer conjunction(int depth) {
        ExpressionPointer left = term(depth);
        while (accept_word("AND")) {
            left = join(Expression::Kind::kAnd, std::move(left), term(depth));
        }
        return left;
    }

    ExpressionPointer term(int depth) {
        if (depth > kMaxDepth) {
            fail("less nesting");
            return nullptr;
        }
        if (accept_word("NOT")) {
            return join(Expression::Kind::kNot, term(depth + 1), nullptr);
        }
        if (accept_sign("(")) {
            ExpressionPointer inner = disjunction(depth + 1);
            if (!accept_sign(")")) {
                fail(")");
            }
            return inner;
        }
        return std::make_unique<const Expression>(
            Expression{Expression::Kind::kComparison, comparison(), nullptr, nullptr});
    }

    Comparison comparison() {
        Comparison result;
        result.property = expect_name();
        if (accept_word("IS")) {
            result.op = accept_word("NOT") ? CMPI_PredOp_Not_Null : CMPI_PredOp_Null;
            expect_word("NULL");
            return result;
        }
        const auto *row =
            std::find_if(kOperators.begin(), kOperators.end(), [this](const OperatorRow &entry) {
                return cim::same_name(entry.spelling, current_.text);
            });
        if (row == kOperators.end() || current_.kind == Token::Kind::kText) {
            fail("an operator");
            return result;
        }
        result.op = row->op;
        advance();
        read_literal(result);
        return result;
    }

    void read_literal(Comparison &result) {
        const bool name = current_.kind == Token::Kind::kName;
        if (current_.kind == Token::Kind::kText) {
            result.literal_type = CMPI_charString;
        } else if (current_.kind == Token::Kind::kNumber) {
            const bool real = current_.text.find('.') != std::string::npos;
            result.literal_type = real ? CMPI_realString : CMPI_integerString;
        } else if (name && result.op == CMPI_PredOp_Isa) {
            result.literal_type = CMPI_classNameString;
        } else if (name && (cim::same_name(current_.text, "true") ||
                            cim::same_name(current_.text, "false"))) {
            result.literal_type = CMPI_booleanString;
        } else {
            return fail("a literal");
        }
        result.literal = std::move(current_.text);
        advance();
    }

    const std::string_view text_;
    Lexer lexer_;
    Token current_;
    std::string error_;
};

}  // namespace

Parsed parse(std::string_view text, std::string_view language) {
    constexpr std::array<std::string_view, 4> kLanguages{"WQL", "CIM:WQL", "CQL", "DMTF:CQL"};
    const bool known =
        std::any_of(kLanguages.begin(), kLanguages.end(),
                    [language](std::string_view entry) { return cim::same_name(entry, language); });
    if (!known) {
        return {nullptr, CMPI_RC_ERR_QUERY_LANGUAGE_NOT_SUPPORTED,
                "query language \"" + std::string(language) + "\" is not supported"};
    }
    if (text.size() > kMaxLength) {
        return {nullptr, CMPI_RC_ERR_INVALID_QUERY, "the query is too long"};
    }
    return Parser(text).run();
}

}  // namespace velkhost::broker::query

// What a parsed query means: its truth for an instance, and its normal forms.
#include "host/broker/query.h"

#include "host/cim/names.h"

#include <algorithm>
#include <compare>
#include <utility>

namespace velkhost::broker::query {
namespace {

// -- Truth --

// How the property's value stands to the literal; no value without a common order.
std::optional<std::partial_ordering> compared(const cim::Value &value,
                                              const Comparison &comparison) {
    const bool text_literal = comparison.literal_type == CMPI_charString;
    if (const auto text = value.as_text()) {
        return text_literal ? std::optional<std::partial_ordering>(*text <=> comparison.literal)
                            : std::nullopt;
    }
    if (text_literal) {
        return std::nullopt;
    }
    const bool boolean_literal = comparison.literal_type == CMPI_booleanString;
    if (const auto boolean = value.as_bool()) {
        const bool literal = cim::same_name(comparison.literal, "true");
        return boolean_literal
                   ? std::optional<std::partial_ordering>(int{*boolean} <=> int{literal})
                   : std::nullopt;
    }
    const auto literal = cim::value_from_text(CMPI_real64, comparison.literal);
    if (boolean_literal || !literal) {
        return std::nullopt;
    }
    const auto integer = cim::value_from_text(CMPI_sint64, comparison.literal);
    if (integer && value.as_signed()) {
        return *value.as_signed() <=> *integer->as_signed();
    }
    if (const auto *real = std::get_if<double>(&value.content())) {
        return *real <=> std::get<double>(literal->content());
    }
    // Unsigned numbers above the signed range.
    return value.as_unsigned() ? std::optional(std::partial_ordering::greater) : std::nullopt;
}

// SQL's LIKE: '%' stands for any run of characters, '_' for one.
bool is_like(std::string_view text, std::string_view pattern) {
    std::size_t at = 0;
    std::size_t in_pattern = 0;
    std::size_t last_percent = std::string_view::npos;
    std::size_t retry = 0;
    while (at < text.size()) {
        if (in_pattern < pattern.size() && pattern[in_pattern] == '%') {
            last_percent = in_pattern++;
            retry = at;
        } else if (in_pattern < pattern.size() &&
                   (pattern[in_pattern] == '_' || pattern[in_pattern] == text[at])) {
            ++at;
            ++in_pattern;
        } else if (last_percent != std::string_view::npos) {
            in_pattern = last_percent + 1;
            at = ++retry;
        } else {
            return false;
        }
    }
    return pattern.substr(in_pattern).find_first_not_of('%') == std::string_view::npos;
}

bool is_class_of(const cim::Instance &instance, const Comparison &comparison, const IsA &is_a) {
    const cim::Value *value = instance.properties.find(comparison.property);
    const cim::Instance *inner = value != nullptr ? value->as_instance() : nullptr;
    const cim::Instance &subject = inner != nullptr ? *inner : instance;
    return is_a(subject.path.class_name, comparison.literal);
}

bool holds(const Comparison &comparison, const cim::Instance &instance, const IsA &is_a) {
    if (comparison.op == CMPI_PredOp_Isa || comparison.op == CMPI_PredOp_NotIsa) {
        return is_class_of(instance, comparison, is_a) == (comparison.op == CMPI_PredOp_Isa);
    }
    const cim::Value *value = instance.properties.find(comparison.property);
    const bool null = value == nullptr || value->is_null();
    if (comparison.op == CMPI_PredOp_Null || comparison.op == CMPI_PredOp_Not_Null) {
        return null == (comparison.op == CMPI_PredOp_Null);
    }
    if (null) {
        return false;
    }
    if (comparison.op == CMPI_PredOp_Like || comparison.op == CMPI_PredOp_NotLike) {
        const auto text = value->as_text();
        return text && is_like(*text, comparison.literal) == (comparison.op == CMPI_PredOp_Like);
    }
    const auto order = compared(*value, comparison);
    if (!order) {
        return false;
    }
    switch (comparison.op) {
        case CMPI_PredOp_Equals:
            return std::is_eq(*order);
        case CMPI_PredOp_NotEquals:
            return std::is_neq(*order);
        case CMPI_PredOp_LessThan:
            return std::is_lt(*order);
        case CMPI_PredOp_GreaterThanOrEquals:
            return std::is_gteq(*order);
        case CMPI_PredOp_GreaterThan:
            return std::is_gt(*order);
        default:
            return std::is_lteq(*order);
    }
}

bool truth(const Expression &expression, const cim::Instance &instance, const IsA &is_a) {
    switch (expression.kind) {
        case Expression::Kind::kAnd:
            return truth(*expression.left, instance, is_a) &&
                   truth(*expression.right, instance, is_a);
        case Expression::Kind::kOr:
            return truth(*expression.left, instance, is_a) ||
                   truth(*expression.right, instance, is_a);
        case Expression::Kind::kNot:
            return !truth(*expression.left, instance, is_a);
        default:
            return holds(expression.comparison, instance, is_a);
    }
}

// -- Normal forms --

CMPIPredOp opposite(CMPIPredOp op) {
    constexpr std::pair<CMPIPredOp, CMPIPredOp> kPairs[] = {
        {CMPI_PredOp_Equals, CMPI_PredOp_NotEquals},
        {CMPI_PredOp_LessThan, CMPI_PredOp_GreaterThanOrEquals},
        {CMPI_PredOp_GreaterThan, CMPI_PredOp_LessThanOrEquals},
        {CMPI_PredOp_Isa, CMPI_PredOp_NotIsa},
        {CMPI_PredOp_Like, CMPI_PredOp_NotLike},
        {CMPI_PredOp_Not_Null, CMPI_PredOp_Null},
    };
    for (const auto &[one, other] : kPairs) {
        if (op == one || op == other) {
            return op == one ? other : one;
        }
    }
    return op;
}

// Turns an expression into rows; gives up when they get too many.
class Normaliser {
  public:
    explicit Normaliser(bool disjunctive) : disjunctive_(disjunctive) {}

    // `negated` is pushed down to the comparisons.
    NormalForm rows_of(const Expression &expression, bool negated) {
        if (expression.kind == Expression::Kind::kComparison) {
            Comparison comparison = expression.comparison;
            comparison.op = negated ? opposite(comparison.op) : comparison.op;
            return {{std::move(comparison)}};
        }
        if (expression.kind == Expression::Kind::kNot) {
            return rows_of(*expression.left, !negated);
        }
        NormalForm left = rows_of(*expression.left, negated);
        const NormalForm right = rows_of(*expression.right, negated);
        const bool is_or = (expression.kind == Expression::Kind::kOr) != negated;
        if (is_or != disjunctive_) {
            return product(left, right);
        }
        left.insert(left.end(), right.begin(), right.end());
        return left;
    }

    [[nodiscard]] bool gave_up() const { return gave_up_; }

  private:
    // Every row of one form with every row of the other.
    NormalForm product(const NormalForm &left, const NormalForm &right) {
        gave_up_ = gave_up_ || left.size() * right.size() > kMaxRows;
        NormalForm rows;
        for (const Row &first : gave_up_ ? NormalForm{} : left) {
            for (const Row &second : right) {
                Row &row = rows.emplace_back(first);
                row.insert(row.end(), second.begin(), second.end());
            }
        }
        return rows;
    }

    const bool disjunctive_;
    bool gave_up_ = false;
};

}  // namespace

bool matches(const Query &query, const cim::Instance &instance, const IsA &is_a) {
    return is_a(instance.path.class_name, query.class_name) &&
           (query.where == nullptr || truth(*query.where, instance, is_a));
}

std::optional<NormalForm> normal_form(const Query &query, bool disjunctive) {
    if (query.where == nullptr) {
        return NormalForm{};
    }
    Normaliser normaliser(disjunctive);
    NormalForm rows = normaliser.rows_of(*query.where, false);
    return normaliser.gave_up() ? std::nullopt : std::optional(std::move(rows));
}

}  // namespace velkhost::broker::query

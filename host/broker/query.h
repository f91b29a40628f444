// Queries in WQL, as newSelectExp takes them:
//   SELECT * | name, ... FROM class [WHERE condition]
// with comparisons (= <> != < <= > >= LIKE ISA, IS [NOT] NULL) under AND, OR, NOT and parentheses.
#pragma once

#include "host/cim/instance.h"

#include <cmpi/cmpidt.h>

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace velkhost::broker::query {

// `literal_type` is one of the ...String codes; `property` and `literal` are texts without quotes.
struct Comparison {
    std::string property;
    CMPIPredOp op = CMPI_PredOp_Equals;
    std::string literal;
    CMPIType literal_type = CMPI_charString;
};

struct Expression;
using ExpressionPointer = std::unique_ptr<const Expression>;

struct Expression {
    enum class Kind { kComparison, kAnd, kOr, kNot };
    Kind kind = Kind::kComparison;
    Comparison comparison;
    ExpressionPointer left;
    ExpressionPointer right;  // of kAnd and kOr
};

struct Query {
    std::string text;
    std::vector<std::string> selected;  // empty: all properties
    std::string class_name;
    ExpressionPointer where;  // null: every instance
};

// Longer texts are refused as no valid query.
inline constexpr std::size_t kMaxLength = 16384;

// The query, or the CIM status that says why not (14 unknown language, 15 no valid query).
struct Parsed {
    std::shared_ptr<const Query> query;
    CMPIrc code = CMPI_RC_OK;
    std::string message;
};
Parsed parse(std::string_view text, std::string_view language);

// Whether the class of that name is, or derives from, the other.
using IsA = std::function<bool(std::string_view class_name, std::string_view ancestor)>;

// Whether the instance satisfies the condition. A comparison with a null or an absent property, or
// between types that have no common order, is false.
bool matches(const Query &query, const cim::Instance &instance, const IsA &is_a);

// Comparisons that are joined by one operator, and rows that are joined by the other.
using Row = std::vector<Comparison>;
using NormalForm = std::vector<Row>;

// A normal form can be much longer than its query; longer ones are not made.
inline constexpr std::size_t kMaxRows = 4096;

// Rows of ANDs joined by OR, or with `disjunctive` false rows of ORs joined by AND. No value when
// there would be more than kMaxRows.
std::optional<NormalForm> normal_form(const Query &query, bool disjunctive);

}  // namespace velkhost::broker::query

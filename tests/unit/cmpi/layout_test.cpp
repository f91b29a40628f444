// Offsets, sizes, alignments and constants against the table of this build's ABI. The .inc files
// are made from the table, a line per row.

#include <cmpi/cmpift.h>
#include <gtest/gtest.h>

#include <cstddef>
#include <fstream>
#include <string>
#include <vector>

namespace {

struct Row {
    const char *what;
    unsigned long long expected;
    unsigned long long declared;
};

template <class Type>
constexpr std::size_t kSizeOf = sizeof(Type);

// NOLINTBEGIN(cppcoreguidelines-macro-usage,bugprone-macro-parentheses): names become texts
#define SIZE(type, size) Row{"size of " #type, size, sizeof(type)},
#define ALIGNMENT(type, alignment) Row{"alignment of " #type, alignment, alignof(type)},
#define CONSTANT(name, value) Row{#name, value, name},
#define MEMBER(type, member, offset, size)
const std::vector<Row> kRows = {
#include "present.inc"
};

#undef SIZE
#undef ALIGNMENT
#undef CONSTANT
#undef MEMBER
#define SIZE(type, size)
#define ALIGNMENT(type, alignment)
#define CONSTANT(name, value)
#define MEMBER(type, member, offset, size) Row{#type "." #member, offset, offsetof(type, member)},
const std::vector<Row> kOffsets = {
#include "present.inc"
};

#undef MEMBER
#define MEMBER(type, member, offset, size) \
    Row{"size of " #type "." #member, size, kSizeOf<decltype(type::member)>},
const std::vector<Row> kMemberSizes = {
#include "present.inc"
};

#define ADDED_SIZE(type, size) #type,
#define ADDED_ALIGNMENT(type, alignment) #type,
#define ADDED_CONSTANT(name, value) #name,
#define ADDED_MEMBER(type, member, offset, size) std::string(#type ".") + #member,
#define CHANGED_SIZE(type, size) #type,
#define CHANGED_CONSTANT(name, value) #name,
#define CHANGED_MEMBER(type, member, offset, size) std::string(#type ".") + #member,
const std::vector<std::string> kLater = {
#include "later.inc"
};

#define UNKNOWN(row) row,
const std::vector<std::string> kUnknown = {
#include "unknown.inc"
};
// NOLINTEND(cppcoreguidelines-macro-usage,bugprone-macro-parentheses)

void expect_agreement(const std::vector<Row> &rows) {
    ASSERT_FALSE(rows.empty());
    for (const Row &row : rows) {
        EXPECT_EQ(row.declared, row.expected) << row.what;
    }
}

std::size_t rows_in_table() {
    std::ifstream table(VELK_LAYOUT_TABLE);
    std::size_t rows = 0;
    for (std::string line; std::getline(table, line);) {
        rows += line.empty() || line.front() == '#' ? 0U : 1U;
    }
    return rows;
}

}  // namespace

TEST(CmpiLayout, SizesAlignmentsAndConstantsEqualTheTable) {
    expect_agreement(kRows);
}

TEST(CmpiLayout, OffsetsOfMembersEqualTheTable) {
    expect_agreement(kOffsets);
}

TEST(CmpiLayout, SizesOfMembersEqualTheTable) {
    expect_agreement(kMemberSizes);
}

TEST(CmpiLayout, NoRowOfTheTableIsSkipped) {
    ASSERT_GT(rows_in_table(), 800U);
    EXPECT_EQ(kRows.size() + kOffsets.size() + kLater.size(), rows_in_table());
}

TEST(CmpiLayout, NoRowOfTheTableIsUnknown) {
    for (const std::string &row : kUnknown) {
        ADD_FAILURE() << row;
    }
}

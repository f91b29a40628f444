// What the 2.1 edition added lies past the end of a 2.0 broker's tables, so it has no name here.
// later.inc is made from the table of this build's ABI, a line per row.

#include <cmpi/cmpimacs.h>
#include <gtest/gtest.h>

// NOLINTBEGIN(cppcoreguidelines-macro-usage,bugprone-macro-parentheses): names become declarations

// Added types and constants are declared once more, which does not compile where they exist.
struct AbsentType;
#define ADDED_SIZE(type, size) using type = AbsentType;
#define ADDED_ALIGNMENT(type, alignment)
#define ADDED_CONSTANT(name, value) enum : unsigned { name };
#define ADDED_MEMBER(type, member, offset, size)
#define CHANGED_SIZE(type, size)
#define CHANGED_CONSTANT(name, value)
#define CHANGED_MEMBER(type, member, offset, size)
#include "later.inc"

#undef ADDED_SIZE
#undef ADDED_CONSTANT
#undef CHANGED_SIZE
#undef CHANGED_CONSTANT
#undef CHANGED_MEMBER
#define ADDED_SIZE(type, size)
#define ADDED_CONSTANT(name, value)
#define CHANGED_SIZE(type, size) EXPECT_LT(sizeof(type), size) << #type;
#define CHANGED_CONSTANT(name, value) EXPECT_LT(name, value) << #name;
#define CHANGED_MEMBER(type, member, offset, size) \
    EXPECT_FALSE([](auto *table) {                 \
        return requires {                          \
            table->member;                         \
        };                                         \
    }(static_cast<type *>(nullptr)))               \
        << #type "." #member;

TEST(CmpiLayout, MembersOfTheLaterEditionAreAbsent) {
    // An assertion of the same form that must hold, lest the ones below hold for all names.
    EXPECT_TRUE([](auto *table) {
        return requires {
            table->release;
        };
    }(static_cast<CMPIStringFT *>(nullptr)));
#include "later.inc"
}

// NOLINTEND(cppcoreguidelines-macro-usage,bugprone-macro-parentheses)
